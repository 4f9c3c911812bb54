#ifndef FWZEL_PIXELROWS_H
#define FWZEL_PIXELROWS_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

// Private to the library: writing runs of pixels into the rows of a buffer at the speed of memory.

/// Stores a 64-bit word over and over, the last time its first bytes only. The destination may lie anywhere.
inline void storeRepeatedly(unsigned char* to, uint64_t word, size_t bytes) {
    size_t words = bytes / sizeof word;
#if defined(__x86_64__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    // Whole cache lines are claimed without being read first, which no loop of ordinary stores achieves.
    asm volatile("rep stosq" : "+D"(to), "+c"(words) : "a"(word) : "memory");
#else
    for (; words > 0; --words, to += sizeof word)
        std::memcpy(to, &word, sizeof word);
#endif
    std::memcpy(to, &word, bytes % sizeof word);
}

/// The pixels of a buffer in rows, pitch pixels apart. Writes only: the buffer may be a write-only mapping.
///
/// Indices are counted in components and wrap at 2^32, as they are when they are computed in unsigned 32
/// bits.
template <class Pixel>
class PixelRows {
public:
    PixelRows(unsigned char* mem, uint32_t pitch, uint32_t componentsPerPixel)
        : mMem(mem), mPitch(pitch), mLastIndex(0xFFFFFFFF / componentsPerPixel) {}

    void copy(uint32_t x, uint32_t y, const Pixel* from, uint32_t count) const {
        inPieces(x, y, count, [&](unsigned char* to, size_t done, size_t piece) {
            std::memcpy(to, from + done, piece * sizeof(Pixel));
        });
    }

    void repeat(uint32_t x, uint32_t y, Pixel pixel, uint32_t count) const {
        uint64_t word = 0;
        for (size_t offset = 0; offset < sizeof word; offset += sizeof pixel)
            std::memcpy(reinterpret_cast<unsigned char*>(&word) + offset, &pixel, sizeof pixel);
        const bool isOneByte = word == (word & 0xFF) * 0x0101010101010101;
        inPieces(x, y, count, [&](unsigned char* to, size_t, size_t piece) {
            if (isOneByte)
                std::memset(to, static_cast<int>(word & 0xFF), piece * sizeof(Pixel));
            else
                storeRepeatedly(to, word, piece * sizeof(Pixel));
        });
    }

private:
    /// One piece, or two where the index wraps within the run.
    template <class Write>
    void inPieces(uint32_t x, uint32_t y, size_t count, Write write) const {
        const size_t index = (y * mPitch + x) & mLastIndex;
        const size_t first = std::min(count, mLastIndex - index + 1);
        write(mMem + index * sizeof(Pixel), 0, first);
        if (first < count)
            write(mMem, first, count - first);
    }

    unsigned char* mMem;
    uint32_t mPitch;
    size_t mLastIndex; ///< in pixels; a power of two less 1
};

#endif
