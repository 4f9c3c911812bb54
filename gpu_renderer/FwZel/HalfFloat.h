#ifndef FWZEL_HALFFLOAT_H
#define FWZEL_HALFFLOAT_H

#include <array>
#include <cstdint>

// Private to the library: the one encoder of half floats (IEEE 754 binary16), and its table of 8-bit codes.

/// A binary16: bit 15 sign, bits 14 to 10 exponent biased by 15, bits 9 to 0 mantissa.
///
/// Truncates: the low 13 mantissa bits are dropped, nothing is rounded. Magnitudes from 65536 up keep their
/// top mantissa bits under exponent field 31, so they become infinity or a NaN. Below 2^-14 the exponent
/// field is 0 and the mantissa keeps its place, which is not how binary16 encodes a subnormal.
/// @param bits  the bits of an IEEE 754 binary32
constexpr uint16_t halfFloatOfBits(uint32_t bits) {
    constexpr int BIAS = 15;
    constexpr int MAX_EXPONENT = 16;
    const int exponent = static_cast<int>(bits >> 23 & 0xFF) - 127;
    const uint32_t mantissa = (bits & 0x7FFFFF) >> 13;
    const int clipped = exponent > MAX_EXPONENT ? MAX_EXPONENT : exponent < -BIAS ? -BIAS : exponent;
    return static_cast<uint16_t>((bits >> 31 << 15) + mantissa +
                                 (static_cast<uint32_t>(clipped + BIAS) << 10));
}

constexpr std::array<uint16_t, 256> makeHalfFloatCodes() {
    std::array<uint16_t, 256> codes{};
    for (uint32_t code = 0; code < codes.size(); ++code)
        codes[code] = halfFloatOfBits(__builtin_bit_cast(uint32_t, static_cast<float>(code) / 255.0f));
    return codes;
}

/// The half float of every 8-bit code n, as n / 255: 0 gives 0.0, 255 gives 1.0.
inline constexpr std::array<uint16_t, 256> HALF_FLOAT_CODES = makeHalfFloatCodes();

#endif
