#include <FwZel/RowExpansion.h>

#include <FwZel/HalfFloat.h>

#include <cstring>

#if defined(__x86_64__)
#include <cpuid.h>
#include <immintrin.h>
#endif

namespace {

void rgbToRgbaPlain(const uint8_t* rgb, unsigned char* rgba, size_t pixels) {
    // All bits of alpha are set, so a pixel is four bytes read at its red with alpha or-ed in: one load and
    // one store a pixel, in either byte order. Only the last pixel has no fourth byte to read.
    constexpr uint8_t OPAQUE_BYTES[4] = {0, 0, 0, 0xFF};
    uint32_t opaque = 0;
    std::memcpy(&opaque, OPAQUE_BYTES, sizeof opaque);
    for (size_t i = 0; i + 1 < pixels; ++i) {
        uint32_t pixel = 0;
        std::memcpy(&pixel, rgb + 3 * i, sizeof pixel);
        pixel |= opaque;
        std::memcpy(rgba + 4 * i, &pixel, sizeof pixel);
    }
    if (pixels > 0) {
        std::memcpy(rgba + 4 * (pixels - 1), rgb + 3 * (pixels - 1), 3);
        rgba[4 * (pixels - 1) + 3] = 0xFF;
    }
}

void rgbToHalfRgbaPlain(const uint8_t* rgb, unsigned char* rgba, size_t pixels) {
    for (size_t i = 0; i < pixels; ++i, rgb += 3) {
        const uint16_t pixel[4] = {HALF_FLOAT_CODES[rgb[0]], HALF_FLOAT_CODES[rgb[1]],
                                   HALF_FLOAT_CODES[rgb[2]], HALF_FLOAT_CODES[0xFF]};
        std::memcpy(rgba + sizeof pixel * i, pixel, sizeof pixel);
    }
}

void samplesToHalfPlain(const uint8_t* samples, unsigned char* out, size_t count) {
    for (size_t i = 0; i < count; ++i) {
        const uint16_t half = HALF_FLOAT_CODES[samples[i]];
        std::memcpy(out + sizeof half * i, &half, sizeof half);
    }
}

#if defined(__x86_64__)

#define FWZEL_AVX2 __attribute__((target("avx2,f16c")))

constexpr size_t VECTOR_PIXELS = 8;

// Eight pixels to 32 bytes. The two loads cover the 24 bytes of the pixels and nothing else.
FWZEL_AVX2 inline __m256i eightRgbaPixels(const uint8_t* rgb) {
    constexpr char Z = -1; // gives a zero byte
    const __m256i spread = _mm256_setr_epi8(0, 1, 2, Z, 3, 4, 5, Z, 6, 7, 8, Z, 9, 10, 11, Z, 4, 5, 6, Z, 7,
                                            8, 9, Z, 10, 11, 12, Z, 13, 14, 15, Z);
    const __m128i low = _mm_loadu_si128(reinterpret_cast<const __m128i*>(rgb));
    const __m128i high = _mm_loadu_si128(reinterpret_cast<const __m128i*>(rgb + 8));
    const __m256i both = _mm256_inserti128_si256(_mm256_castsi128_si256(low), high, 1);
    return _mm256_or_si256(_mm256_shuffle_epi8(both, spread),
                           _mm256_set1_epi32(static_cast<int>(0xFF000000U)));
}

// Eight samples to eight half floats. The product differs from the quotient sample / 255 by less than 2^-22
// of its value, and no quotient but 0 and 1 comes nearer than 2^-19 to a half float: truncation gives the
// same.
FWZEL_AVX2 inline __m128i eightHalves(__m128i samples) {
    const __m256 codes = _mm256_cvtepi32_ps(_mm256_cvtepu8_epi32(samples));
    return _mm256_cvtps_ph(_mm256_mul_ps(codes, _mm256_set1_ps(1.0F / 255.0F)),
                           _MM_FROUND_TO_ZERO | _MM_FROUND_NO_EXC);
}

FWZEL_AVX2 void rgbToRgbaAvx2(const uint8_t* rgb, unsigned char* rgba, size_t pixels) {
    if (pixels < VECTOR_PIXELS) {
        rgbToRgbaPlain(rgb, rgba, pixels);
        return;
    }
    const auto expand = [rgb, rgba](size_t i) FWZEL_AVX2 {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(rgba + 4 * i), eightRgbaPixels(rgb + 3 * i));
    };
    for (size_t i = 0; i + VECTOR_PIXELS <= pixels; i += VECTOR_PIXELS)
        expand(i);
    expand(pixels - VECTOR_PIXELS);
}

FWZEL_AVX2 void samplesToHalfF16c(const uint8_t* samples, unsigned char* out, size_t count) {
    if (count < 8) {
        samplesToHalfPlain(samples, out, count);
        return;
    }
    const auto convert = [samples, out](size_t i) FWZEL_AVX2 {
        const __m128i eight = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(samples + i));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(out + 2 * i), eightHalves(eight));
    };
    for (size_t i = 0; i + 8 <= count; i += 8)
        convert(i);
    convert(count - 8);
}

FWZEL_AVX2 void rgbToHalfRgbaF16c(const uint8_t* rgb, unsigned char* rgba, size_t pixels) {
    if (pixels < VECTOR_PIXELS) {
        rgbToHalfRgbaPlain(rgb, rgba, pixels);
        return;
    }
    const auto expand = [rgb, rgba](size_t i) FWZEL_AVX2 {
        const __m256i pixel = eightRgbaPixels(rgb + 3 * i);
        const __m128i low = _mm256_castsi256_si128(pixel);
        const __m128i high = _mm256_extracti128_si256(pixel, 1);
        auto* const out = reinterpret_cast<__m128i*>(rgba + 8 * i);
        _mm_storeu_si128(out, eightHalves(low));
        _mm_storeu_si128(out + 1, eightHalves(_mm_unpackhi_epi64(low, low)));
        _mm_storeu_si128(out + 2, eightHalves(high));
        _mm_storeu_si128(out + 3, eightHalves(_mm_unpackhi_epi64(high, high)));
    };
    for (size_t i = 0; i + VECTOR_PIXELS <= pixels; i += VECTOR_PIXELS)
        expand(i);
    expand(pixels - VECTOR_PIXELS);
}

// Not every compiler's __builtin_cpu_supports() knows it.
bool hasF16c() {
    unsigned int eax = 0;
    unsigned int ebx = 0;
    unsigned int ecx = 0;
    unsigned int edx = 0;
    return __get_cpuid(1, &eax, &ebx, &ecx, &edx) != 0 && (ecx & bit_F16C) != 0;
}

#endif

} // namespace

const RowExpansion& plainRowExpansion() {
    static constexpr RowExpansion PLAIN = {"plain", rgbToRgbaPlain, rgbToHalfRgbaPlain, samplesToHalfPlain};
    return PLAIN;
}

const RowExpansion& bestRowExpansion() {
#if defined(__x86_64__)
    static constexpr RowExpansion AVX2 = {"avx2 f16c", rgbToRgbaAvx2, rgbToHalfRgbaF16c, samplesToHalfF16c};
    if (__builtin_cpu_supports("avx2") && hasF16c())
        return AVX2;
#endif
    return plainRowExpansion();
}
