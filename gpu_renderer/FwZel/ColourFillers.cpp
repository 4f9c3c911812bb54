#include <FwZel/VideoTestImage.h>

#include <FwZel/PixelRows.h>

#include <cstddef>

namespace {

template <class Pixel>
void fillRows(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
              uint32_t componentsPerPixel, Pixel pixel) {
    const PixelRows<Pixel> rows(mem, pitch, componentsPerPixel);
    for (uint32_t y = 0; y < height; ++y)
        rows.repeat(0, y, pixel, width);
}

} // namespace

void VideoTestImage::fillColour(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                uint32_t* fill) {
    constexpr uint32_t COMPONENTS = 4;
    unsigned char bytes[COMPONENTS];
    for (size_t c = 0; c < COMPONENTS; ++c)
        bytes[c] = static_cast<unsigned char>(fill[c]);
    uint32_t pixel;
    std::memcpy(&pixel, bytes, sizeof pixel);
    fillRows(mem, width, height, pitch, COMPONENTS, pixel);
}

void VideoTestImage::fillColourPlanar(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                      uint32_t byte_per_col, uint32_t fill) {
    switch (byte_per_col) {
    case 1:
        return fillRows(mem, width, height, pitch, 1, static_cast<uint8_t>(fill));
    case 2:
        return fillRows(mem, width, height, pitch, 1, static_cast<uint16_t>(fill));
    case 4:
        return fillRows(mem, width, height, pitch, 1, fill);
    default:
        return;
    }
}
