// The fillers beside the limit of the memory: ROWCOPY, memcpy of one prepared row to every line of the same
// buffer.

#include "BenchmarkRow.h"

#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <benchmark/benchmark.h>

#include <sys/mman.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

namespace {

struct Size {
    const char* name;
    uint32_t width, height;
};

constexpr Size HD = {"1920x1080", 1920, 1080};
constexpr Size UHD = {"3840x2160", 3840, 2160};
constexpr Size UHD_8K = {"7680x4320", 7680, 4320};

/// Memory for the largest picture of the run, in huge pages where the system gives them.
class Buffer {
public:
    explicit Buffer(size_t bytes) : mBytes(bytes) {
        void* const mapping =
            mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        mStart = mapping == MAP_FAILED ? nullptr : static_cast<unsigned char*>(mapping);
        if (mStart == nullptr)
            std::abort();
        madvise(mStart, mBytes, MADV_HUGEPAGE);
    }
    Buffer(const Buffer&) = delete;
    Buffer& operator=(const Buffer&) = delete;
    ~Buffer() { munmap(mStart, mBytes); }
    unsigned char* start() const { return mStart; }

private:
    size_t mBytes;
    unsigned char* mStart;
};

constexpr size_t LARGEST = size_t{UHD_8K.width} * UHD_8K.height * 8;

unsigned char* target() {
    static const Buffer buffer(LARGEST);
    return buffer.start();
}

unsigned char* copyOfTarget() {
    static const Buffer buffer(size_t{UHD.width} * UHD.height * 8);
    return buffer.start();
}

/// Lines of a buffer that a filler writes.
struct Lines {
    size_t offset, count, bytes, step;
};

Work rowCopy(const Lines& lines) {
    return [lines, row = std::vector<unsigned char>(lines.bytes, 0x55)] {
        unsigned char* const start = target() + lines.offset;
        for (size_t y = 0; y < lines.count; ++y)
            std::memcpy(start + y * lines.step, row.data(), lines.bytes);
    };
}

/// After each fill, the copy of the result that an upload makes.
Work thenCopy(const Lines& lines, const Work& fill) {
    return [=] {
        fill();
        std::memcpy(copyOfTarget(), target() + lines.offset, lines.count * lines.step);
    };
}

/// One row for each pattern.
template <class Fill>
void addPatterns(const std::string& group, const Lines& lines, Fill fill, bool isCopied = false) {
    const auto finished = [&](const Work& work) { return isCopied ? thenCopy(lines, work) : work; };
    addLimit(group, lines.count * lines.bytes, finished(rowCopy(lines)));
    for (const TestPatternEntry& entry : testPatternCatalogue())
        addRow(group + '/' + entry.name, lines.count * lines.bytes,
               finished([fill, pattern = entry.number] { fill(pattern); }));
}

std::string groupName(const char* group, const Size& size) {
    return std::string(group) + '/' + size.name;
}

void addPackedFrames(const char* group, const Size& size, bool isHalf, bool isCopied = false) {
    const size_t pitch = size_t{size.width} * (isHalf ? 8 : 4);
    addPatterns(
        groupName(group, size), {0, size.height, pitch, pitch},
        [=](uint32_t pattern) {
            VideoTestImage::fillTestPattern(target(), VideoTestImage::COL_RGBA, size.width, size.height,
                                            size.width, pattern, 2, 0, 0, size.width, size.height, isHalf);
        },
        isCopied);
}

void addPackedFields(const char* group, const Size& size, bool isHalf) {
    const size_t pitch = size_t{size.width} * (isHalf ? 8 : 4);
    const uint32_t height = size.height / 2;
    addPatterns(groupName(group, size), {0, height, pitch, pitch}, [=](uint32_t pattern) {
        VideoTestImage::fillTestPattern(target(), VideoTestImage::COL_RGBA, size.width, height, size.width,
                                        pattern, 1, 0, 0, size.width, height, isHalf);
    });
}

void addPackedRegions(const char* group, const Size& size, bool isHalf) {
    constexpr uint32_t SIDE = 256;
    const uint32_t posX = size.width / 2 - SIDE / 2;
    const uint32_t posY = size.height / 2 - SIDE / 2;
    const size_t pixel = isHalf ? 8 : 4;
    const size_t corner = (size_t{posY} * size.width + posX) * pixel;
    addPatterns(
        groupName(group, size), {corner, SIDE, SIDE * pixel, size.width * pixel}, [=](uint32_t pattern) {
            VideoTestImage::fillTestPattern(target(), VideoTestImage::COL_RGBA, size.width, size.height,
                                            size.width, pattern, 2, posX, posY, SIDE, SIDE, isHalf);
        });
}

void addPlanes(const char* group, const Size& size, uint32_t bytesPerColour) {
    const size_t pitch = size_t{size.width} * bytesPerColour;
    addPatterns(groupName(group, size), {0, size.height, pitch, pitch}, [=](uint32_t pattern) {
        constexpr uint32_t G = 1;
        VideoTestImage::fillTestPatternPlanar(target(), size.width, size.height, size.width, pattern, 2, G,
                                              bytesPerColour, 0, 0, size.width, size.height);
    });
}

void addFlatColours(const Size& size) {
    const std::string packed = groupName("colour-packed", size);
    const size_t pitch = size_t{size.width} * 4;
    addLimit(packed, pitch * size.height, rowCopy({0, size.height, pitch, pitch}));
    addRow(packed + "/grey", pitch * size.height, [=] {
        uint32_t colour[] = {16, 128, 235, 255};
        VideoTestImage::fillColour(target(), size.width, size.height, size.width, colour);
    });
    for (const uint32_t bytes : {1U, 2U, 4U}) {
        const std::string planar = groupName(("colour-planar-" + std::to_string(bytes)).c_str(), size);
        const size_t planePitch = size_t{size.width} * bytes;
        const Lines lines = {0, size.height, planePitch, planePitch};
        addLimit(planar, planePitch * size.height, rowCopy(lines));
        addRow(planar + "/grey", planePitch * size.height, [=] {
            VideoTestImage::fillColourPlanar(target(), size.width, size.height, size.width, bytes,
                                             0x12345678);
        });
    }
}

} // namespace

void addRows() {
    for (const Size& size : {HD, UHD}) {
        addPackedFrames("packed-8bit", size, false);
        addPackedFrames("packed-half", size, true);
        addPackedFields("field-8bit", size, false);
        addPackedFields("field-half", size, true);
        addPlanes("planar-4", size, 4);
        addPlanes("planar-2", size, 2);
        addPlanes("planar-1", size, 1);
        addPackedFrames("filled-and-copied", size, false, true);
        addFlatColours(size);
    }
    addPackedRegions("region-8bit", UHD, false);
    addPackedRegions("region-half", UHD, true);
    addPackedFrames("packed-8bit", UHD_8K, false);
    addPackedFrames("packed-half", UHD_8K, true);
}
