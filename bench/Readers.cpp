// The picture readers beside what they cannot beat. PPM: a complete reader that takes a file in pieces of
// 128 KiB with read() and expands them by the vector instructions of this processor. PNG: the bare row loop
// of libpng; for half floats with the conversion of each row.

#include "BenchmarkRow.h"
#include "CameraPictures.h"

#include <FwZel/PngFile.h>
#include <FwZel/PpmFile.h>
#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <HeadlessContext.h>

#include <fcntl.h>
#include <png.h>
#include <unistd.h>

#if defined(__x86_64__)
#include <immintrin.h>
#define BENCH_VECTOR __attribute__((target("avx2,f16c")))
#else
#define BENCH_VECTOR
#endif

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace {

constexpr size_t PIECE_BYTES = size_t{128} * 1024;

/// Where a limit writes.
struct Rows {
    unsigned char* start;
    uint32_t width, height;
    size_t pitch;
};

// --- Expansions of the limits: one run of pixels, or of samples.

bool hasVectors() {
#if defined(__x86_64__)
    return __builtin_cpu_supports("avx2") != 0;
#else
    return false;
#endif
}

const std::array<uint16_t, 256>& halfCodes() {
    static const std::array<uint16_t, 256> codes = [] {
        std::array<uint16_t, 256> made{};
        for (size_t i = 0; i < made.size(); ++i)
            made[i] = VideoTestImage::uint8ToFp16(static_cast<uint8_t>(i));
        return made;
    }();
    return codes;
}

BENCH_VECTOR void rgbToRgba(const uint8_t* rgb, unsigned char* out, size_t pixels) {
    size_t i = 0;
#if defined(__x86_64__)
    if (hasVectors()) {
        const __m256i split = _mm256_setr_epi32(0, 1, 2, 0, 3, 4, 5, 0);
        const __m256i spread =
            _mm256_broadcastsi128_si256(_mm_setr_epi8(0, 1, 2, -1, 3, 4, 5, -1, 6, 7, 8, -1, 9, 10, 11, -1));
        const __m256i alpha = _mm256_set1_epi32(static_cast<int>(0xFF000000U));
        for (; i + 11 <= pixels; i += 8) {
            const __m256i bytes = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(rgb + 3 * i));
            const __m256i lanes = _mm256_permutevar8x32_epi32(bytes, split);
            const __m256i rgba = _mm256_or_si256(_mm256_shuffle_epi8(lanes, spread), alpha);
            _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + 4 * i), rgba);
        }
    }
#endif
    for (; i < pixels; ++i) {
        std::memcpy(out + 4 * i, rgb + 3 * i, 3);
        out[4 * i + 3] = 0xFF;
    }
}

BENCH_VECTOR void samplesToHalf(const uint8_t* samples, unsigned char* out, size_t count) {
    size_t i = 0;
#if defined(__x86_64__)
    if (hasVectors()) {
        const __m256 scale = _mm256_set1_ps(1.0F / 255.0F);
        for (; i + 8 <= count; i += 8) {
            const __m128i eight = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(samples + i));
            const __m256 codes = _mm256_cvtepi32_ps(_mm256_cvtepu8_epi32(eight));
            const __m128i halves = _mm256_cvtps_ph(_mm256_mul_ps(codes, scale), _MM_FROUND_TO_ZERO);
            _mm_storeu_si128(reinterpret_cast<__m128i*>(out + 2 * i), halves);
        }
    }
#endif
    for (; i < count; ++i)
        std::memcpy(out + 2 * i, &halfCodes()[samples[i]], 2);
}

void rgbToHalfRgba(const uint8_t* rgb, unsigned char* out, size_t pixels) {
    // In steps that stay in the nearest cache.
    constexpr size_t STEP = 256;
    unsigned char rgba[4 * STEP];
    for (size_t i = 0; i < pixels; i += STEP) {
        const size_t count = std::min(STEP, pixels - i);
        rgbToRgba(rgb + 3 * i, rgba, count);
        samplesToHalf(rgba, out + 8 * i, 4 * count);
    }
}

using ExpandPixels = void (*)(const uint8_t* rgb, unsigned char* out, size_t pixels);

// --- The limits

void readPpmBare(const std::string& path, const Rows& to, ExpandPixels expand, size_t pixelBytes) {
    static uint8_t piece[2 + PIECE_BYTES + 32];
    const int file = open(path.c_str(), O_RDONLY);
    ssize_t got = read(file, piece, PIECE_BYTES);
    size_t begin = 0;
    for (int lines = 0; lines < 3 && begin < static_cast<size_t>(got); ++begin)
        lines += piece[begin] == '\n' ? 1 : 0;
    size_t end = static_cast<size_t>(got);
    uint32_t x = 0;
    for (uint32_t y = 0; y < to.height && got > 0;) {
        while (end - begin >= 3 && y < to.height) {
            const size_t pixels = std::min<size_t>((end - begin) / 3, to.width - x);
            expand(piece + begin, to.start + y * to.pitch + x * pixelBytes, pixels);
            begin += 3 * pixels;
            x += static_cast<uint32_t>(pixels);
            if (x == to.width) {
                x = 0;
                ++y;
            }
        }
        const size_t carried = end - begin;
        std::memmove(piece, piece + begin, carried);
        got = read(file, piece + carried, PIECE_BYTES);
        begin = 0;
        end = carried + static_cast<size_t>(got > 0 ? got : 0);
    }
    close(file);
}

// What is read is known to be whole: an error of libpng ends the process.
void readPngBare(const std::string& path, const Rows& to, bool isHalf) {
    std::FILE* const file = std::fopen(path.c_str(), "rb");
    png_structp png = png_create_read_struct(PNG_LIBPNG_VER_STRING, nullptr, nullptr, nullptr);
    png_infop info = png_create_info_struct(png);
    png_init_io(png, file);
    png_read_info(png, info);
    if (png_get_color_type(png, info) == PNG_COLOR_TYPE_RGB)
        png_set_add_alpha(png, 0xFF, PNG_FILLER_AFTER);
    png_read_update_info(png, info);
    std::vector<uint8_t> row(isHalf ? png_get_rowbytes(png, info) : 0);
    for (uint32_t y = 0; y < to.height; ++y) {
        unsigned char* const out = to.start + y * to.pitch;
        png_read_row(png, isHalf ? row.data() : out, nullptr);
        if (isHalf)
            samplesToHalf(row.data(), out, row.size());
    }
    png_destroy_read_struct(&png, &info, nullptr);
    std::fclose(file);
}

// --- The pictures and the textures that take them

/// The pictures of one size and a texture that takes them.
struct Subject {
    Subject(uint32_t width, uint32_t height, bool isHalf)
        : pictures(width, height), texture(VideoTestImage::NO_TEST_PATTERN, argsOf(width, height, isHalf)) {}

    static Texture::TexArgs argsOf(uint32_t width, uint32_t height, bool isHalf) {
        Texture::TexArgs args;
        Texture::setDefaultValue(args);
        args.width = args.pitchInPix = width;
        args.height = height;
        args.isFp16 = isHalf;
        return args;
    }

    Rows rows() {
        return {texture.getAddress(0), texture.getWidth(), texture.getHeight(), texture.getPitch()};
    }

    CameraPictures pictures;
    Texture texture;
};

using Reading = std::function<void(Subject&)>;

/// A limit that writes other bytes than the reader is none.
void requireSameBytes(const std::string& group, Subject& subject, const Reading& limit,
                      const Reading& reader) {
    const size_t bytes = size_t{subject.texture.getPitch()} * subject.texture.getHeight();
    unsigned char* const buffer = subject.texture.getAddress(0);
    std::memset(buffer, 1, bytes);
    limit(subject);
    const std::vector<unsigned char> expected(buffer, buffer + bytes);
    std::memset(buffer, 2, bytes);
    reader(subject);
    if (std::memcmp(buffer, expected.data(), bytes) != 0)
        throw std::runtime_error(group + ": the reader and its limit differ");
}

/// The reader beside its limit.
void addReader(const std::string& format, uint32_t width, uint32_t height, bool isHalf, const Reading& limit,
               const Reading& reader) {
    const std::string group =
        format + (isHalf ? "-half/" : "-8bit/") + std::to_string(width) + 'x' + std::to_string(height);
    const size_t bytes = size_t{width} * height * (isHalf ? 8 : 4);
    const Shared<Subject> subject([=] {
        auto made = std::make_unique<Subject>(width, height, isHalf);
        requireSameBytes(group, *made, limit, reader);
        return made;
    });
    addLimit(group, bytes, [=] { limit(*subject); });
    addRow(group + "/reader", bytes, [=] { reader(*subject); });
}

} // namespace

void addRows() {
    static const host::HeadlessContext context;
    for (const auto& [width, height] : {std::pair(1920U, 1080U), std::pair(3840U, 2160U)})
        for (const bool isHalf : {false, true}) {
            addReader(
                "ppm", width, height, isHalf,
                [=](Subject& to) {
                    readPpmBare(to.pictures.ppm(), to.rows(), isHalf ? rgbToHalfRgba : rgbToRgba,
                                isHalf ? 8 : 4);
                },
                [=](Subject& to) {
                    fillTextureFromPpmFile(to.pictures.ppm(), &to.texture, 0, 2, 0, isHalf);
                });
            addReader(
                "png", width, height, isHalf,
                [=](Subject& to) { readPngBare(to.pictures.png(), to.rows(), isHalf); },
                [=](Subject& to) {
                    fillTextureFromPngFile(to.pictures.png(), &to.texture, 0, 2, 0, isHalf);
                });
        }
}
