#include "PngWriter.h"

#include "OutputFile.h"

#include <png.h>

#include <csetjmp>
#include <exception>
#include <stdexcept>
#include <string>

namespace host {

namespace {

/// What the error path must release or report. It is made before setjmp, so a jump passes no destructor.
struct Encoder {
    explicit Encoder(OutputFile& output) : file(output) {}
    ~Encoder() { png_destroy_write_struct(&png, &info); }
    Encoder(const Encoder&) = delete;
    Encoder& operator=(const Encoder&) = delete;

    bool writeToFile(const void* data, size_t size) noexcept {
        try {
            file.write(data, size);
            return true;
        } catch (...) {
            writeFailure = std::current_exception();
            return false;
        }
    }

    OutputFile& file;
    png_structp png = nullptr;
    png_infop info = nullptr;
    std::exception_ptr writeFailure;
    std::string refusal;
};

void onData(png_structp png, png_bytep data, size_t size) {
    if (!static_cast<Encoder*>(png_get_io_ptr(png))->writeToFile(data, size))
        png_error(png, "write error");
}

void onFlush(png_structp /*png*/) {}

[[noreturn]] void onError(png_structp png, png_const_charp reason) {
    static_cast<Encoder*>(png_get_error_ptr(png))->refusal = reason;
    png_longjmp(png, 1);
}

void onWarning(png_structp /*png*/, png_const_charp /*reason*/) {}

bool encode(Encoder& encoder, const PictureView& picture, PngPixel pixel) {
    // Lines of video test patterns mostly repeat the line above: this takes half the time of libpng's
    // default, which tries every filter, for a tenth more bytes.
    constexpr int COMPRESSION_LEVEL = 4;
    constexpr int FILTER = PNG_FILTER_UP;
    png_structp png = encoder.png;
    if (setjmp(png_jmpbuf(png)))
        return false;
    png_set_write_fn(png, &encoder, onData, onFlush);
    png_set_compression_level(png, COMPRESSION_LEVEL);
    png_set_filter(png, PNG_FILTER_TYPE_BASE, FILTER);
    png_set_IHDR(png, encoder.info, picture.width, picture.height, pixel == PngPixel::GREY16 ? 16 : 8,
                 pixel == PngPixel::RGBA8 ? PNG_COLOR_TYPE_RGB_ALPHA : PNG_COLOR_TYPE_GRAY,
                 PNG_INTERLACE_NONE, PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
    png_write_info(png, encoder.info);
    if (pixel == PngPixel::GREY16 && __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__)
        png_set_swap(png);
    for (uint32_t y = 0; y < picture.height; ++y)
        png_write_row(png, picture.row(y));
    png_write_end(png, encoder.info);
    return true;
}

} // namespace

void writePng(OutputFile& file, const PictureView& picture, PngPixel pixel) {
    Encoder encoder(file);
    encoder.png = png_create_write_struct(PNG_LIBPNG_VER_STRING, &encoder, onError, onWarning);
    if (encoder.png)
        encoder.info = png_create_info_struct(encoder.png);
    if (!encoder.info)
        throw std::runtime_error(file.name() + ": libpng has no memory");
    if (encode(encoder, picture, pixel))
        return;
    if (encoder.writeFailure)
        std::rethrow_exception(encoder.writeFailure);
    throw std::runtime_error(file.name() + ": " + encoder.refusal);
}

} // namespace host
