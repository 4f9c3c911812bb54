#ifndef FWZEL_PIXELROWS_H
#define FWZEL_PIXELROWS_H

#include <FwZel/WordLoops.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

// Private to the library: writing runs of pixels into the rows of a buffer at the speed of memory.

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
        const uint64_t word = repeatedInWord(pixel);
        inPieces(x, y, count, [&](unsigned char* to, size_t, size_t piece) {
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
