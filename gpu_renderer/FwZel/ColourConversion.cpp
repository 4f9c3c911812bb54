#include <FwZel/VideoTestImage.h>

#include <FwZel/HalfFloat.h>

namespace {

// ITU-R BT.709 luma coefficients, and the colour differences R - Y' and B - Y' scaled to [-1, 1]. The
// coefficient of R is one unit in the last place below 1.
constexpr float CR_OF_R = 0.99999994f;
constexpr float CR_OF_G = -0.908305764f;
constexpr float CR_OF_B = -0.0916941762f;
constexpr float Y_OF_R = 0.2126f;
constexpr float Y_OF_G = 0.7152f;
constexpr float Y_OF_B = 0.0722f;
constexpr float CB_OF_R = -0.229144201f;
constexpr float CB_OF_G = -0.770855784f;

// Studio range on a scale of 256 steps: luma 16 to 235, colour difference 16 to 240, each raised by half a
// step at 10 bits so that a later truncation to 10 bits rounds.
constexpr float ROUNDING_OFFSET = 1.0f / 2048.0f;
constexpr float GAIN_Y = 219.0f / 256.0f;
constexpr float GAIN_C = 224.0f / 512.0f;
constexpr float OFFSET_Y = 16.0f / 256.0f + ROUNDING_OFFSET;
constexpr float OFFSET_C = 128.0f / 256.0f + ROUNDING_OFFSET;

constexpr uint32_t NUM_BARS = 8;

struct BarCode {
    float Y, Cb, Cr;
};

/// ITU-R BT.709 bars at 75 % with a 100 % white, as 8-bit studio range codes.
constexpr BarCode BARS_75[NUM_BARS] = {{235, 128, 128}, {168, 44, 136}, {145, 147, 44}, {133, 63, 52},
                                       {63, 193, 204},  {51, 109, 212}, {28, 212, 120}, {16, 128, 128}};

struct RGB {
    float R, G, B;
};

/// Bar k from the left: its complement counts down from white through green, red and blue as bits 2, 1, 0.
RGB barOf(uint32_t k, float gain) {
    const uint32_t bits = NUM_BARS - 1 - k;
    const float level = k == 0 ? 1.0f : gain;
    const auto component = [&](uint32_t bit) { return (bits >> bit & 1) != 0 ? level : 0.0f; };
    return {component(1), component(2), component(0)};
}

} // namespace

void VideoTestImage::RGBToCrYCb(float* src, float* dst) {
    const float R = src[0];
    const float G = src[1];
    const float B = src[2];
    dst[0] = (R * CR_OF_R + G * CR_OF_G + B * CR_OF_B) * GAIN_C + OFFSET_C;
    dst[1] = (R * Y_OF_R + G * Y_OF_G + B * Y_OF_B) * GAIN_Y + OFFSET_Y;
    dst[2] = (R * CB_OF_R + G * CB_OF_G + B) * GAIN_C + OFFSET_C;
}

void VideoTestImage::generateColorBarData(float* Cr, float* Y, float* Cb, uint32_t type, uint32_t isRGB) {
    for (uint32_t k = 0; k < NUM_BARS; ++k) {
        if (isRGB != 0) {
            const RGB bar = barOf(k, type == COLOUR_BAR_75 ? 0.75f : 1.0f);
            Cr[k] = bar.R;
            Y[k] = bar.G;
            Cb[k] = bar.B;
        } else if (type == COLOUR_BAR_75) {
            Cr[k] = BARS_75[k].Cr / 255.0f;
            Y[k] = BARS_75[k].Y / 255.0f;
            Cb[k] = BARS_75[k].Cb / 255.0f;
        } else {
            const RGB bar = barOf(k, 1.0f);
            float rgb[3] = {bar.R, bar.G, bar.B};
            float converted[3];
            RGBToCrYCb(rgb, converted);
            Cr[k] = converted[0];
            Y[k] = converted[1];
            Cb[k] = converted[2];
        }
    }
}

uint16_t VideoTestImage::uint8ToFp16(uint8_t in) {
    return HALF_FLOAT_CODES[in];
}

uint16_t VideoTestImage::fp32Tofp16(float fp32) {
    fp32Union bits;
    bits.f = fp32;
    return halfFloatOfBits(static_cast<uint32_t>(bits.i));
}
