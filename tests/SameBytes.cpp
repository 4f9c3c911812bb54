#include <FwZel/RowExpansion.h>
#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <cstdint>
#include <cstdio>
#include <numeric>
#include <vector>

// Prints a digest for each pattern, the colour fills and each expansion of file rows, for scripts/same-bytes
// to compare between compilers and their options.

namespace {

using Bytes = std::vector<unsigned char>;

/// FNV-1a, 64 bits.
class Digest {
public:
    void add(const void* data, size_t size) {
        const auto* const bytes = static_cast<const unsigned char*>(data);
        for (size_t i = 0; i < size; ++i)
            mValue = (mValue ^ bytes[i]) * 0x100000001B3;
    }
    void print(const char* subject, uint32_t number) const {
        std::printf("%s %u: %016llx\n", subject, number, static_cast<unsigned long long>(mValue));
    }

private:
    uint64_t mValue = 0xCBF29CE484222325;
};

struct Size {
    uint32_t width, height;
};

constexpr Size SIZES[] = {{97, 61}, {8, 1}, {1921, 3}, {43, 243}};

void addFills(Digest& digest, uint32_t pattern, const Size& size, uint32_t field) {
    const auto& [width, height] = size;
    const uint32_t pitch = width + 3;
    const uint32_t posX = field; // regions at odd places
    const uint32_t sizeX = width - 2 * field;
    for (const uint32_t order : {0U, 1U, 2U, 3U}) {
        Bytes bytes(size_t{4} * pitch * height);
        VideoTestImage::fillTestPattern(bytes.data(), order, width, height, pitch, pattern, field, posX, 0,
                                        sizeX, height, false);
        digest.add(bytes.data(), bytes.size());
        Bytes halves(size_t{8} * pitch * height);
        VideoTestImage::fillTestPattern(halves.data(), order, width, height, pitch, pattern, field, posX, 0,
                                        sizeX, height, true);
        digest.add(halves.data(), halves.size());
        for (const uint32_t depth : {1U, 2U, 4U}) {
            Bytes plane(size_t{depth} * pitch * height);
            VideoTestImage::fillTestPatternPlanar(plane.data(), width, height, pitch, pattern, field, order,
                                                  depth, posX, 0, sizeX, height);
            digest.add(plane.data(), plane.size());
        }
    }
}

/// Without the fillers, and with bars in studio range.
void addPixels(Digest& digest, uint32_t pattern, const Size& size, uint32_t field) {
    float bars[24];
    VideoTestImage::generateColorBarData(bars, bars + 8, bars + 16, pattern, 0);
    digest.add(bars, sizeof bars);
    for (const uint32_t depth : {1U, 2U, 4U})
        for (uint32_t y = 0; y < size.height; ++y)
            for (uint32_t x = 0; x < size.width; ++x) {
                uint32_t pixel[4] = {};
                VideoTestImage::generatePatternData(pattern, size.width, size.height, x, y, depth, field,
                                                    pixel, bars);
                digest.add(pixel, sizeof pixel);
            }
}

void printColourFills() {
    Digest digest;
    uint32_t colour[] = {0x11223344, 0x5566, 0x77, 0xFFFFFFFF};
    for (uint32_t width = 0; width < 200; width += 7) {
        Bytes bytes(size_t{4} * 210 * 3);
        VideoTestImage::fillColour(bytes.data() + width % 16, width, 3, 205, colour);
        digest.add(bytes.data(), bytes.size());
        for (const uint32_t depth : {1U, 2U, 4U}) {
            VideoTestImage::fillColourPlanar(bytes.data() + width % 16, width, 3, 205, depth, colour[0]);
            digest.add(bytes.data(), bytes.size());
        }
    }
    digest.print("colour fills", 0);
}

void printExpansion(const RowExpansion& expansion) {
    Bytes samples(3 * 1021);
    std::iota(samples.begin(), samples.end(), static_cast<unsigned char>(0));
    Digest digest;
    for (size_t pixels = 0; pixels <= 1021; pixels += pixels < 40 ? 1 : 109) {
        Bytes out(8 * 1021);
        expansion.rgbToRgba(samples.data(), out.data(), pixels);
        digest.add(out.data(), out.size());
        expansion.rgbToHalfRgba(samples.data(), out.data(), pixels);
        digest.add(out.data(), out.size());
        expansion.samplesToHalf(samples.data(), out.data(), 3 * pixels);
        digest.add(out.data(), out.size());
    }
    digest.print("row expansion", 0);
}

} // namespace

int main() {
    for (uint32_t pattern = 0; pattern <= NUM_TEST_PATTERNS; ++pattern) { // and one that is none
        Digest digest;
        for (const Size& size : SIZES)
            for (const uint32_t field : {0U, 1U, 2U}) {
                addFills(digest, pattern, size, field);
                addPixels(digest, pattern, size, field);
            }
        digest.print("pattern", pattern);
    }
    printColourFills();
    printExpansion(plainRowExpansion());
    printExpansion(bestRowExpansion());
}
