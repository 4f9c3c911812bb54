#ifndef HOST_PNGWRITER_H
#define HOST_PNGWRITER_H

#include "PictureView.h"

#include <cstdint>

namespace host {

class OutputFile;

/// The width and height, in pixels, above which libpng refuses to write.
constexpr uint32_t MAX_PNG_SIDE = 1000000;

/// What a pixel of the picture is made of.
enum class PngPixel {
    RGBA8,  ///< four bytes r, g, b, a
    GREY8,  ///< one byte
    GREY16, ///< one uint16_t in the machine's byte order
};

/// Writes a picture as PNG. The file is the caller's to close.
/// @throw std::runtime_error  the file cannot be written, or libpng refuses the size; what() names the file
void writePng(OutputFile& file, const PictureView& picture, PngPixel pixel);

} // namespace host

#endif
