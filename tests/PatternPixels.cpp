#include <FwZel/SineEstimate.h>
#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <string>
#include <tuple>
#include <vector>

namespace {

using Image = VideoTestImage;
using Data = std::array<uint32_t, 4>;

constexpr uint32_t UNTOUCHED = 0xA5A5A5A5;

std::vector<float> barTable(uint32_t pattern) {
    std::vector<float> bars(24);
    Image::generateColorBarData(&bars[0], &bars[8], &bars[16], pattern, 1);
    return bars;
}

struct Case {
    uint32_t pattern, width, height, bytes, field;
};

Data generated(const Case& c, uint32_t x, uint32_t y, std::vector<float>& bars) {
    Data data = {UNTOUCHED, UNTOUCHED, UNTOUCHED, UNTOUCHED};
    Image::generatePatternData(c.pattern, c.width, c.height, x, y, c.bytes, c.field, data.data(),
                               bars.data());
    return data;
}

/// The pixel, straight from the description of its pattern: slow and plain.
Data plainPixel(const Case& c, uint32_t x, uint32_t y, const std::vector<float>& bars) {
    const bool is2 = c.bytes == 2;
    const bool is4 = c.bytes == 4;
    const uint64_t unit = is4 ? 1ULL << 24 : is2 ? 1ULL << 8 : 1; // one 8-bit code
    const uint64_t scale = unit * 256;
    const uint64_t max = scale - 1;
    const uint64_t line = max - 1;
    const uint64_t half = scale / 2;
    const float maxF = is4 ? 4294967296.0f : static_cast<float>(max);
    const float fx = static_cast<float>(x);
    const float fy = static_cast<float>(y);
    const float fw = static_cast<float>(c.width);
    const float fh = static_cast<float>(c.height);
    const uint32_t midX = c.width / 2;
    const uint32_t midY = c.height / 2;
    const auto pixel = [](uint64_t r, uint64_t g, uint64_t b, uint64_t a) {
        return Data{static_cast<uint32_t>(r), static_cast<uint32_t>(g), static_cast<uint32_t>(b),
                    static_cast<uint32_t>(a)};
    };
    const auto grey = [&](uint64_t v) { return pixel(v, v, v, max); };
    const auto luma = [&](uint64_t v) { return pixel(half, v, half, max); };
    const auto ramp = [&](uint64_t v) { return v % 256 * unit; };
    const auto trunc = [](float v) { return static_cast<uint64_t>(v); };

    switch (c.pattern) {
    case 0:
        if (y > 3)
            return grey(ramp(y < 256 ? y : x));
        return pixel(y == 2 ? ramp(x) : 0, y == 1 ? ramp(x) : 0, y == 0 ? ramp(x) : 0, y == 3 ? ramp(x) : 0);
    case 1:
        return grey(ramp(x));
    case 2:
        return grey(ramp(y));
    case 3:
        return pixel(trunc(fx * maxF / fw), half, trunc(fy * maxF / fh), max);
    case 4:
        return grey(trunc(fx * maxF / fw));
    case 5:
        return luma(trunc(fx * maxF / fw));
    case 6:
        return grey(is4 ? x % 1024 << 22 : is2 ? x % 1024 << 6 : x % 256);
    case 7:
        return grey(is4 ? (x % 1024 << 22) + x % 4194304 : is2 ? (x % 1024 << 6) + x % 64 : x % 256);
    case 8: {
        const uint64_t v = is4 ? max - x : max - x % scale;
        return pixel(v, v, v, v);
    }
    case 9: {
        const bool isLine = (c.field == 0 && y == midY) || (c.field == 1 && y + 1 == midY) ||
                            (c.field == 2 && (y == midY || y + 1 == midY));
        return grey(x == midX || x + 1 == midX || isLine ? line : 0);
    }
    case 10:
        return luma(y == 0 || y + 1 == c.height || x == 0 || x + 1 == c.width ? line : 0);
    case 11:
        return luma(x % 3 == 2 ? line : 0);
    case 12:
        return luma(y % 100 <= 1 ? line : 0);
    case 13:
        return x == midX ? grey(line) : luma(16 * unit);
    case 14: {
        const int radius = static_cast<int>(c.width / 16);
        const int yy = c.field == 2
                           ? static_cast<int>(y) - static_cast<int>(midY)
                           : 2 * static_cast<int>(y) - static_cast<int>(c.height) + static_cast<int>(c.field);
        const int xx = static_cast<int>(x) - static_cast<int>(midX);
        if (std::abs(yy) >= radius)
            return grey(0);
        const int xw = static_cast<int>(sqrtf(static_cast<float>(radius * radius - yy * yy)));
        return grey(std::abs(xx) < xw ? max : 0);
    }
    case 15:
        return luma(x % 50 == y % 50 ? 0 : line);
    case 16: {
        const uint32_t q = c.width / 4;
        if (x >= q && x >= midX && x >= 3 * q)
            return grey(half);
        const uint64_t rest = y < midY ? 0 : half;
        return x < q      ? pixel(line, 0, rest, max)
               : x < midX ? pixel(rest, line, rest, max)
                          : pixel(0, rest, line, max);
    }
    case 17:
    case 18: {
        const uint32_t bar = x / (c.width / 8) % 8;
        const auto code = [&](uint32_t entry) { return trunc(bars[entry] * maxF) % scale; };
        return pixel(code(bar), code(bar + 8), code(bar + 16), max);
    }
    case 19: {
        const float pi = 3.14159274f;
        const float kY = fx * 0.5f / fw;
        const float kC = kY * 0.5f;
        const uint64_t c0 = trunc((sinf(kC * fx * pi) * 0.400000006f + 0.5f) * maxF);
        const uint64_t c1 = trunc((sinf(fx * kY * pi) * 0.400000006f + 0.5f) * maxF);
        return pixel(c0, c1, c0, max);
    }
    case 20:
        return grey(0);
    case 21:
        return grey(max);
    default:
        return pixel(0, 0, 0, 0);
    }
}

using Parameters = std::tuple<uint32_t, uint32_t, uint32_t>; // pattern, bytes per component, field

class PatternPixels : public testing::TestWithParam<Parameters> {};

TEST_P(PatternPixels, EqualThePlainFormula) {
    const auto [pattern, bytes, field] = GetParam();
    auto bars = barTable(pattern);
    for (const auto& [width, height] :
         {std::pair{333U, 301U}, {1030U, 40U}, {1920U, 12U}, {50U, 7U}, {8U, 1U}}) {
        const Case c = {pattern, width, height, bytes, field};
        for (uint32_t y = 0; y < height; ++y)
            for (uint32_t x = 0; x < width; ++x)
                ASSERT_EQ(generated(c, x, y, bars), plainPixel(c, x, y, bars))
                    << width << 'x' << height << " at " << x << ", " << y;
    }
}

std::string nameOf(const testing::TestParamInfo<Parameters>& info) {
    const auto [pattern, bytes, field] = info.param;
    const TestPatternEntry* const entry = findTestPattern(pattern);
    std::string name = entry != nullptr ? entry->name : "pattern_" + std::to_string(pattern);
    for (char& letter : name)
        letter = letter == '-' ? '_' : letter;
    return name + '_' + std::to_string(bytes) + "byte_field" + std::to_string(field);
}

INSTANTIATE_TEST_SUITE_P(EveryPattern, PatternPixels,
                         testing::Combine(testing::Range(0U, NUM_TEST_PATTERNS),
                                          testing::Values(1U, 2U, 4U, 3U), testing::Values(0U, 1U, 2U, 3U)),
                         nameOf);

struct Sample {
    Case c;
    uint32_t x, y;
    Data data;
};

TEST(PatternSamples, LandmarksOfEachPattern) {
    constexpr uint32_t W = 1920;
    constexpr uint32_t H = 1080;
    constexpr uint32_t M4 = 0xFFFFFFFF;
    const Sample samples[] = {
        {{Image::COMBI, W, H, 1, 2}, 300, 0, {0, 0, 44, 0}},
        {{Image::COMBI, W, H, 1, 2}, 7, 3, {0, 0, 0, 7}},
        {{Image::COMBI, W, H, 1, 2}, 5, 100, {100, 100, 100, 255}},
        {{Image::COMBI, W, H, 1, 2}, 5, 300, {5, 5, 5, 255}},
        {{Image::H_RAMP, W, H, 2, 2}, 1, 0, {256, 256, 256, 65535}},
        {{Image::H_RAMP, W, H, 2, 2}, 256, 0, {0, 0, 0, 65535}},
        {{Image::H_RAMP_10BIT, W, H, 2, 2}, 1023, 0, {0xFFC0, 0xFFC0, 0xFFC0, 65535}},
        {{Image::H_RAMP_10BIT_2, W, H, 2, 2}, 1023, 0, {0xFFFF, 0xFFFF, 0xFFFF, 65535}},
        {{Image::H_RAMP_MAXVAL, W, H, 1, 2}, 256, 0, {255, 255, 255, 255}},
        {{Image::HV_RAMP, W, H, 1, 2}, 1919, 1079, {254, 128, 254, 255}},
        {{Image::HV_RAMP, 4, 2, 4, 2}, 3, 1, {0xC0000000, 0x80000000, 0x80000000, M4}},
        {{Image::H_RAMP_SHAROW, W, H, 1, 2}, 1919, 0, {254, 254, 254, 255}},
        {{Image::CENTRE, W, H, 1, 2}, 0, 539, {254, 254, 254, 255}},
        {{Image::CENTRE, W, H / 2, 1, 0}, 0, 270, {254, 254, 254, 255}},
        {{Image::CENTRE, W, H / 2, 1, 1}, 0, 269, {254, 254, 254, 255}},
        {{Image::CENTRE, W, H / 2, 1, 1}, 0, 270, {0, 0, 0, 255}},
        {{Image::CIRCLE, W, H, 1, 2}, 1079, 540, {255, 255, 255, 255}},
        {{Image::CIRCLE, W, H, 1, 2}, 1080, 540, {0, 0, 0, 255}},
        {{Image::CIRCLE, W, H, 1, 2}, 840, 540, {0, 0, 0, 255}},
        {{Image::CIRCLE, W, H, 1, 2}, 960, 421, {255, 255, 255, 255}},
        {{Image::CIRCLE, W, H, 1, 2}, 960, 420, {0, 0, 0, 255}},
        {{Image::COLOUR_BAR_75, W, H, 1, 2}, 239, 0, {255, 255, 255, 255}},
        {{Image::COLOUR_BAR_75, W, H, 1, 2}, 240, 0, {191, 191, 0, 255}},
        {{Image::COLOUR_BAR_75, 1366, H, 1, 2}, 1360, 0, {255, 255, 255, 255}},
        {{Image::COLOUR_BAR_100, W, H, 4, 2}, 0, 0, {0, 0, 0, M4}},
        {{Image::COLOUR_BAR_75, W, H, 4, 2}, 240, 0, {0xC0000000, 0xC0000000, 0, M4}},
        {{Image::COLOUR_BAR_75, 7, H, 1, 2}, 6, 0, {255, 255, 255, 255}},
        {{Image::H_SWEEP, W, H, 1, 2}, 0, 0, {127, 127, 127, 255}},
        {{Image::COLOUR_MAT_BLACK, W, H, 1, 2}, 0, 0, {0, 0, 0, 255}},
        {{NUM_TEST_PATTERNS, W, H, 4, 2}, 0, 0, {0, 0, 0, 0}},
        {{Image::NO_TEST_PATTERN, W, H, 1, 2}, 9, 9, {0, 0, 0, 0}},
    };
    for (const Sample& sample : samples) {
        auto bars = barTable(sample.c.pattern);
        EXPECT_EQ(generated(sample.c, sample.x, sample.y, bars), sample.data)
            << "pattern " << sample.c.pattern << " at " << sample.x << ", " << sample.y;
    }
}

TEST(PatternSamples, NegativeBarLevelsKeepTheirLow32Bits) {
    std::vector<float> bars(24, -0.5f);
    EXPECT_EQ(generated({Image::COLOUR_BAR_100, 80, 1, 1, 2}, 0, 0, bars), (Data{129, 129, 129, 255}));
    EXPECT_EQ(generated({Image::COLOUR_BAR_100, 80, 1, 4, 2}, 0, 0, bars),
              (Data{0x80000000, 0x80000000, 0x80000000, 0xFFFFFFFF}));
}

// The share of its bound that is the estimate's own.
constexpr double ESTIMATE_ALONE = 3.2 / 16777216.0;

TEST(SineEstimate, KeepsItsBound) {
    double worst = 0.0;
    float worstPhase = 0.0f;
    const auto look = [&](float phase) {
        const double difference = std::abs(estimatedSine(phase) - std::sin(static_cast<double>(phase)));
        if (difference > worst) {
            worst = difference;
            worstPhase = phase;
        }
    };
    for (float phase = 0.0f; phase <= LAST_ESTIMATED_PHASE;) {
        look(phase);
        uint32_t bits;
        std::memcpy(&bits, &phase, sizeof bits);
        bits += 307;
        std::memcpy(&phase, &bits, sizeof phase);
    }
    // Where the distance from the nearest zero is smallest, and where it is largest and the sign changes.
    for (int quarterTurns = 1; quarterTurns < 32766; ++quarterTurns) {
        auto phase = static_cast<float>(quarterTurns * 1.57079632679489662);
        for (int i = 0; i < 4; ++i)
            phase = std::nextafter(phase, 0.0f);
        for (int i = 0; i < 8; ++i, phase = std::nextafter(phase, 1e6f))
            look(phase);
    }
    EXPECT_LT(worst, ESTIMATE_ALONE) << "at " << worstPhase;
}

} // namespace
