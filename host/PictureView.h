#ifndef HOST_PICTUREVIEW_H
#define HOST_PICTUREVIEW_H

#include <cstddef>
#include <cstdint>

namespace host {

/// Pixels that lie elsewhere, rows top to bottom.
struct PictureView {
    const unsigned char* pixels;
    uint32_t width;  ///< pixels
    uint32_t height; ///< rows
    size_t rowBytes; ///< bytes from one row to the next

    const unsigned char* row(uint32_t y) const { return pixels + y * rowBytes; }
};

} // namespace host

#endif
