#ifndef FWZEL_ROWEXPANSION_H
#define FWZEL_ROWEXPANSION_H

#include <cstddef>
#include <cstdint>

// Private to the library.

/// The row loops of the picture readers, in one of the forms that this machine can run. All forms write the
/// same bytes: the form decides the speed only.
///
/// Sources and destinations may lie at any address and must not overlap. Nothing is read or written past the
/// given number of pixels or samples.
struct RowExpansion {
    const char* name; ///< the processor features that the form needs, "plain" for none

    /// R, G, B to R, G, B, 0xFF.
    void (*rgbToRgba)(const uint8_t* rgb, unsigned char* rgba, size_t pixels);

    /// R, G, B to four half floats (HALF_FLOAT_CODES), the last 1.0.
    void (*rgbToHalfRgba)(const uint8_t* rgb, unsigned char* rgba, size_t pixels);

    /// Each sample to its half float.
    void (*samplesToHalf)(const uint8_t* samples, unsigned char* out, size_t count);
};

/// The form that every machine can run.
const RowExpansion& plainRowExpansion();

/// The fastest form that this machine can run.
const RowExpansion& bestRowExpansion();

#endif
