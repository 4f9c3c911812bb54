#include <FwZel/VideoTestImage.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>

namespace {

using Image = VideoTestImage;
using Triple = std::array<float, 3>;

float floatOfBits(uint32_t bits) {
    float value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

uint32_t bitsOfFloat(float value) {
    uint32_t bits;
    std::memcpy(&bits, &value, sizeof bits);
    return bits;
}

Triple converted(Triple rgb) {
    Image::RGBToCrYCb(rgb.data(), rgb.data());
    return rgb;
}

TEST(ColourConversion, PrimariesLandOnTheStudioRange) {
    EXPECT_EQ(converted({0, 0, 0}), (Triple{0.500488281f, 0.0629882812f, 0.500488281f}));
    EXPECT_EQ(converted({1, 1, 1}), (Triple{0.500488281f, 0.918457031f, 0.500488281f}));
    EXPECT_EQ(converted({1, 0, 0}), (Triple{0.937988281f, 0.244860932f, 0.400237679f}));
    EXPECT_EQ(converted({0, 0, 1}), (Triple{0.46037209f, 0.124753125f, 0.937988281f}));
}

TEST(ColourConversion, EveryStepIsSinglePrecisionFromLeftToRight) {
    for (uint32_t i = 0; i < 4096; ++i) {
        const auto level = [&](uint32_t bit) { return static_cast<float>(i >> bit & 15) / 11.0f - 0.25f; };
        const Triple rgb = {level(0), level(4), level(8)};
        constexpr std::array<std::array<float, 5>, 3> ROWS = {{
            {0x1.fffffep-1f, -0.908305764f, -0.0916941762f, 0.4375f, 0.50048828125f},
            {0.2126f, 0.7152f, 0.0722f, 0.85546875f, 0.06298828125f},
            {-0.229144201f, -0.770855784f, 1.0f, 0.4375f, 0.50048828125f},
        }};
        Triple expected;
        for (size_t row = 0; row < 3; ++row) {
            volatile float sum = rgb[0] * ROWS[row][0];
            for (size_t c = 1; c < 3; ++c) {
                const volatile float product = rgb[c] * ROWS[row][c];
                sum = sum + product;
            }
            sum = sum * ROWS[row][3];
            expected[row] = sum + ROWS[row][4];
        }
        ASSERT_EQ(converted(rgb), expected) << i;
    }
}

struct Bars {
    std::array<float, 8> Cr, Y, Cb;
};

Bars barsOf(uint32_t type, uint32_t isRGB) {
    Bars bars;
    Image::generateColorBarData(bars.Cr.data(), bars.Y.data(), bars.Cb.data(), type, isRGB);
    return bars;
}

TEST(ColourBars, InRgbAreWhiteToBlackAtTheirLevel) {
    for (const uint32_t type : {17U, 18U, 0U, 0xFFFFFFFFU}) {
        const float g = type == 18 ? 0.75f : 1.0f;
        const Bars bars = barsOf(type, 2);
        EXPECT_EQ(bars.Cr, (std::array<float, 8>{1, g, 0, 0, g, g, 0, 0})) << type;
        EXPECT_EQ(bars.Y, (std::array<float, 8>{1, g, g, g, 0, 0, 0, 0})) << type;
        EXPECT_EQ(bars.Cb, (std::array<float, 8>{1, 0, g, 0, g, 0, g, 0})) << type;
    }
}

TEST(ColourBars, InYCbCrAreStudioCodesAt75AndConvertedAt100) {
    const auto codes = [](std::array<float, 8> values) {
        for (float& value : values)
            value /= 255.0f;
        return values;
    };
    const Bars at75 = barsOf(Image::COLOUR_BAR_75, 0);
    EXPECT_EQ(at75.Y, codes({235, 168, 145, 133, 63, 51, 28, 16}));
    EXPECT_EQ(at75.Cb, codes({128, 44, 147, 63, 193, 109, 212, 128}));
    EXPECT_EQ(at75.Cr, codes({128, 136, 44, 52, 204, 212, 120, 128}));

    const Bars rgb = barsOf(Image::COLOUR_BAR_100, 1);
    const Bars at100 = barsOf(Image::COLOUR_BAR_100, 0);
    for (size_t k = 0; k < 8; ++k)
        EXPECT_EQ((Triple{at100.Cr[k], at100.Y[k], at100.Cb[k]}), converted({rgb.Cr[k], rgb.Y[k], rgb.Cb[k]}))
            << k;
}

/// The exponent field from the C library's view of the number; the mantissa is cut off in any case.
uint16_t plainHalf(uint32_t bits) {
    const float value = floatOfBits(bits);
    const int field = std::isnormal(value)   ? std::clamp(std::ilogb(value) + 15, 0, 31)
                      : std::isfinite(value) ? 0
                                             : 31;
    return static_cast<uint16_t>((std::signbit(value) ? 0x8000 : 0) + field * 1024 +
                                 static_cast<int>(bits % (1U << 23) / (1U << 13)));
}

TEST(HalfFloats, EveryExponentAndKeptMantissaIsTruncated) {
    for (uint32_t top = 0; top < 1U << 19; ++top)
        for (const uint32_t dropped : {0U, 0x1FFFU}) {
            const uint32_t bits = top << 13 | dropped;
            ASSERT_EQ(Image::fp32Tofp16(floatOfBits(bits)), plainHalf(bits)) << std::hex << bits;
        }
}

TEST(HalfFloats, Landmarks) {
    const struct {
        float value;
        uint16_t half;
    } landmarks[] = {{1.0f, 0x3C00},
                     {0.5f, 0x3800},
                     {-1.0f, 0xBC00},
                     {65504.0f, 0x7BFF},
                     {65535.0f, 0x7BFF},
                     {65536.0f, 0x7C00},
                     {98304.0f, 0x7E00},
                     {0.0f, 0x0000},
                     {-0.0f, 0x8000},
                     {0x1p-14f, 0x0400},
                     {0x1p-15f, 0x0000},
                     {0x1.8p-15f, 0x0200},
                     {1.0e-5f, 0x013E},
                     {std::numeric_limits<float>::infinity(), 0x7C00},
                     {floatOfBits(0x7FC00000), 0x7E00}};
    for (const auto& [value, half] : landmarks)
        EXPECT_EQ(Image::fp32Tofp16(value), half) << value;
}

TEST(HalfFloats, OfEightBitCodesDifferFromRoundingIn123Codes) {
    int different = 0;
    for (uint32_t code = 0; code < 256; ++code) {
        const uint32_t bits = bitsOfFloat(static_cast<float>(code) / 255.0f);
        const uint16_t half = Image::uint8ToFp16(static_cast<uint8_t>(code));
        EXPECT_EQ(half, plainHalf(bits)) << code;
        const uint16_t rounded = plainHalf(bits + 0xFFF + (bits >> 13 & 1));
        different += half != rounded;
    }
    EXPECT_EQ(different, 123);
}

} // namespace
