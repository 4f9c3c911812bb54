#ifndef FWZEL_PICTURESIZE_H
#define FWZEL_PICTURESIZE_H

#include <cstdint>

/// @file
/// The sizes of pictures that a texture holds.

/// The first size in bytes that a host buffer cannot have: sizes are kept in 32 bits, signed in places.
constexpr uint64_t HOST_BUFFER_LIMIT = uint64_t{1} << 31;

/// Whether a picture fits a host buffer, computed in 64 bits.
///
/// Sizes declared by a file are arbitrary numbers: they pass here before they are multiplied in 32 bits,
/// stored or allocated. 65536 x 65536 pixels of four bytes would otherwise wrap to an empty buffer.
///
/// @param width          pixels from one row to the next
/// @param height         rows
/// @param bytesPerPixel  any number; 0 fits always
/// @return whether width x height x bytesPerPixel stays below HOST_BUFFER_LIMIT
constexpr bool pictureFits(uint32_t width, uint32_t height, uint32_t bytesPerPixel) {
    // The product of three could pass 64 bits, so the third divides the limit instead.
    return bytesPerPixel == 0 || uint64_t{width} * height <= (HOST_BUFFER_LIMIT - 1) / bytesPerPixel;
}

#endif
