#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <fixture/PatternWalk.h>

#include <array>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

// The pattern fillers against the walk over pixels: a region of any picture, in any layout. An input is a row
// of numbers, two bytes each; where it ends they go on as 0.

namespace {

class Numbers {
public:
    Numbers(const std::uint8_t* data, std::size_t size) : mNext(data), mEnd(data + size) {}

    std::uint32_t word() {
        const std::uint32_t low = byte();
        return low | byte() << 8;
    }
    std::uint32_t upTo(std::uint32_t most) { return word() % (most + 1); }
    /// Mostly a number as they are used, else any.
    std::uint32_t sizeUpTo(std::uint32_t most) {
        const std::uint32_t kind = byte();
        const std::uint32_t size = upTo(most);
        return kind < 192 ? size : size | word() << 16;
    }

private:
    std::uint32_t byte() { return mNext == mEnd ? 0 : *mNext++; }

    const std::uint8_t* mNext;
    const std::uint8_t* mEnd;
};

void require(const std::string& fault) {
    if (fault.empty())
        return;
    std::fprintf(stderr, "%s\n", fault.c_str());
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Numbers numbers(data, size);
    PatternRegion region = {};
    region.pattern = numbers.upTo(NUM_TEST_PATTERNS); // one that is none too
    region.width = numbers.sizeUpTo(600);
    region.height = numbers.sizeUpTo(200);
    region.field = numbers.upTo(3);
    region.pitch = numbers.upTo(300);
    region.posX = numbers.upTo(region.pitch);
    region.posY = numbers.upTo(100);
    region.sizeX = numbers.upTo(region.pitch - region.posX);
    region.sizeY = numbers.upTo(30);
    const std::size_t misalignment = numbers.upTo(15);
    const std::uint32_t choice = numbers.upTo(3);
    require(packedFillFault(region, choice, numbers.upTo(1) != 0, misalignment));
    require(planarFillFault(region, choice, std::array{1U, 2U, 4U, 3U}[numbers.upTo(3)], misalignment));
    return 0;
}
