#ifndef FWZEL_SINEESTIMATE_H
#define FWZEL_SINEESTIMATE_H

#include <cstdint>
#include <cstring>

// Private to the library: a sine that loops can take several at a time, and how far it may be wrong.
//
// It stands in for std::sin(float) where a bound on the sine is enough, as for a result that is cut to few
// bits: where the bound leaves one result only, that is the result. Elsewhere std::sin() has the word.

/// The phases from 0 to this have an estimate: more than any line of 32768 columns asks for.
inline constexpr float LAST_ESTIMATED_PHASE = 51470.0F;

/// For such a phase, std::sin(phase) lies between estimatedSine(phase) - SINE_BOUND and
/// estimatedSine(phase) + SINE_BOUND, both computed in single precision.
///
/// In units of 2^-24, the rounding of a number from 1 to 2, the estimate is off by less than 3.2:
///  - By r, the distance from the nearest zero of the sine: 1, the rounding of its last subtraction, of which
///    the sine takes over cos(r). |r| stays below 1.576, as half turns are off by less than 0.0015 before
///    they are cut. The subtractions before the last are exact: half turns have 14 bits and the first parts
///    of pi 8 and 10, so no product has more than 24, and each difference is no larger than the phase or 1.6
///    and a multiple of the phase's last bit or of 2^-20. The third product is below 2^-7, its error nothing.
///  - By the polynomial with these coefficients, up to 1.576: 0.1.
///  - By its term beyond r, which is sin(r) - r and at most 0.58: once the term for the square, for each of
///    the two products outside the brackets and for the last sum inside; 0.4 for that sum's smaller addend.
///  - By the last sum: 0.5, as it stays below 1.
/// Where the third is largest, 2.6, the first is nothing. The bound leaves 1 to std::sin(), a unit in its
/// last place, and 1 to the rounding when the bound is added or subtracted.
inline constexpr float SINE_BOUND = 6.0F / 16777216.0F;

/// An estimate of the sine of a phase in radians, from 0 to LAST_ESTIMATED_PHASE.
inline float estimatedSine(float phase) {
    constexpr float HALF_TURNS_PER_RADIAN = 0.318309886F;
    constexpr float TO_NEAREST = 0.5F; // a cast cuts
    // The first bits of pi, the next ones, and the rest.
    constexpr float PI_1 = 201.0F / 64.0F;
    constexpr float PI_2 = 1015.0F / 1048576.0F;
    constexpr float PI_3 = -3.25841359e-7F;
    constexpr float C3 = -0.166666567F;
    constexpr float C5 = 0.0083330106F;
    constexpr float C7 = -0.000198061622F;
    constexpr float C9 = 2.59904982e-6F;

    const auto halfTurns = static_cast<int32_t>(phase * HALF_TURNS_PER_RADIAN + TO_NEAREST);
    const auto turned = static_cast<float>(halfTurns);
    const float r = phase - turned * PI_1 - turned * PI_2 - turned * PI_3;
    const float square = r * r;
    const float sine = r + r * square * (C3 + square * (C5 + square * (C7 + square * C9)));

    // Every other half turn is upside down. As bits, because a choice would stay out of the vector registers.
    uint32_t bits;
    std::memcpy(&bits, &sine, sizeof bits);
    bits ^= static_cast<uint32_t>(halfTurns) << 31;
    float result;
    std::memcpy(&result, &bits, sizeof result);
    return result;
}

#endif
