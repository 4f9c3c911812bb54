#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <fixture/PatternWalk.h>

#include <gtest/gtest.h>

#include <sys/mman.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <random>
#include <string>
#include <vector>

namespace {

using Image = VideoTestImage;

/// Pictures and regions of any small size, the region at any place in the rows of the buffer.
class RandomPictures {
public:
    explicit RandomPictures(uint32_t pattern) : mPattern(pattern), mNumbers(pattern) {}

    uint32_t upTo(uint32_t most) { return static_cast<uint32_t>(mNumbers()) % (most + 1); }

    PatternRegion next() {
        PatternRegion p = {};
        p.pattern = mPattern;
        p.width = 8 + upTo(upTo(9) == 0 ? 1200 : 150);
        p.height = 1 + upTo(upTo(9) == 0 ? 300 : 60);
        p.pitch = p.width + upTo(40);
        p.field = upTo(3);
        p.posX = upTo(p.pitch);
        p.posY = upTo(p.height);
        p.sizeX = upTo(p.pitch - p.posX);
        p.sizeY = upTo(p.height + 5 - p.posY); // below the picture too
        return p;
    }

private:
    uint32_t mPattern;
    std::mt19937 mNumbers;
};

class PatternFillers : public testing::TestWithParam<uint32_t> {};

TEST_P(PatternFillers, RegionsAtOddPlacesEqualTheWalkOverPixels) {
    RandomPictures random(GetParam());
    for (int i = 0; i < 60; ++i) {
        const PatternRegion p = random.next();
        ASSERT_EQ(packedFillFault(p, random.upTo(4), random.upTo(1) != 0, random.upTo(15)), "");
        ASSERT_EQ(
            planarFillFault(p, random.upTo(3), std::array{1U, 2U, 4U, 3U}[random.upTo(3)], random.upTo(15)),
            "");
    }
}

TEST_P(PatternFillers, WholePicturesOfEveryLayoutEqualTheWalkOverPixels) {
    for (const uint32_t field : {0U, 1U, 2U}) {
        const PatternRegion p = {GetParam(), 643, 301, 643, field, 0, 0, 643, 301};
        for (const uint32_t order : {0U, 1U, 2U, 3U}) {
            ASSERT_EQ(packedFillFault(p, order, order % 2 == 0, 0), "");
            ASSERT_EQ(planarFillFault(p, order, std::array{1U, 2U, 4U}[field], 0), "");
        }
    }
}

TEST_P(PatternFillers, RowsLongerThanAPieceEqualTheWalkOverPixels) {
    constexpr uint32_t LONG = 70003;
    const PatternRegion p = {GetParam(), LONG, 4, LONG, 2, 7, 1, LONG - 8, 3};
    ASSERT_EQ(packedFillFault(p, Image::COL_RGBA, false, 4), "");
    ASSERT_EQ(packedFillFault(p, Image::COL_ARGB, true, 0), "");
    for (const uint32_t bytes : {1U, 2U, 4U})
        ASSERT_EQ(planarFillFault(p, bytes / 2, bytes, 0), "");
}

/// Address space for a picture whose indices wrap, with memory at both ends only.
class WrappedBuffer {
public:
    explicit WrappedBuffer(size_t bytes)
        : mBytes(bytes),
          mStart(static_cast<unsigned char*>(
              mmap(nullptr, bytes, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0))) {
        EXPECT_NE(mStart, MAP_FAILED);
        EXPECT_EQ(mprotect(mStart, END, PROT_READ | PROT_WRITE), 0);
        EXPECT_EQ(mprotect(mStart + mBytes - END, END, PROT_READ | PROT_WRITE), 0);
    }
    WrappedBuffer(const WrappedBuffer&) = delete;
    WrappedBuffer& operator=(const WrappedBuffer&) = delete;
    ~WrappedBuffer() { munmap(mStart, mBytes); }
    unsigned char* start() const { return mStart; }
    bool operator==(const WrappedBuffer& other) const {
        return std::memcmp(mStart, other.mStart, END) == 0 &&
               std::memcmp(mStart + mBytes - END, other.mStart + mBytes - END, END) == 0;
    }

private:
    static constexpr size_t END = 65536;
    size_t mBytes;
    unsigned char* mStart;
};

TEST(Fillers, IndicesWrapAt32Bits) {
    constexpr size_t INDICES = size_t{1} << 32;
    for (const uint32_t pattern : {Image::H_RAMP, Image::V_RAMP}) {
        const uint32_t pitch = (1U << 30) - 10; // line 1 starts ten pixels before the last index
        const PatternRegion packed = {pattern, 40, 2, pitch, 2, 0, 0, 40, 2};
        for (const bool isHalf : {false, true}) {
            const WrappedBuffer expected(INDICES * (isHalf ? 2 : 1));
            const WrappedBuffer filled(INDICES * (isHalf ? 2 : 1));
            fillSlowly(expected.start(), packed, Image::COL_RGBA, isHalf);
            Image::fillTestPattern(filled.start(), Image::COL_RGBA, 40, 2, pitch, pattern, 2, 0, 0, 40, 2,
                                   isHalf);
            EXPECT_TRUE(filled == expected) << pattern << ' ' << isHalf;
        }
        const PatternRegion plane = {pattern, 40, 2, 0U - 10, 2, 0, 0, 40, 2};
        const WrappedBuffer expected(INDICES);
        const WrappedBuffer filled(INDICES);
        fillPlaneSlowly(expected.start(), plane, 0, 1);
        Image::fillTestPatternPlanar(filled.start(), 40, 2, 0U - 10, pattern, 2, 0, 1, 0, 0, 40, 2);
        EXPECT_TRUE(filled == expected) << pattern;
    }
}

TEST(Fillers, IndicesOfFlatColoursWrapAt32Bits) {
    constexpr size_t INDICES = size_t{1} << 32;
    for (const uint32_t bytes : {1U, 2U, 4U}) {
        const WrappedBuffer plane(INDICES * bytes);
        Image::fillColourPlanar(plane.start(), 40, 2, 0U - 10, bytes, 0x01010101);
        EXPECT_EQ(plane.start()[INDICES * bytes - 1], 1) << "the tenth pixel of line 1, of " << bytes;
        EXPECT_EQ(plane.start()[40 * bytes - 1], 1);
    }
    const WrappedBuffer packed(INDICES);
    uint32_t colour[] = {1, 1, 1, 1};
    Image::fillColour(packed.start(), 40, 2, (1U << 30) - 10, colour);
    EXPECT_EQ(packed.start()[INDICES - 1], 1);
}

TEST(Fillers, RegionsThatPassTheLastIndexAreEmpty) {
    unsigned char byte = 7;
    Image::fillTestPattern(&byte, Image::COL_RGBA, 8, 8, 8, Image::H_RAMP, 2, 8, 0, 0xFFFFFFFF, 1, false);
    Image::fillTestPatternPlanar(&byte, 8, 8, 8, Image::V_RAMP, 2, 0, 1, 0, 8, 1, 0xFFFFFFFF);
    EXPECT_EQ(byte, 7);
}

TEST(Fillers, FlatColoursFillTheirRowsAndNothingElse) {
    RandomPictures random(0);
    for (int i = 0; i < 200; ++i) {
        const uint32_t width = random.upTo(i % 10 == 0 ? 3000 : 90);
        const uint32_t height = random.upTo(7);
        const uint32_t pitch = width + random.upTo(9);
        const uint32_t bytes = std::array{1U, 2U, 3U, 4U}[random.upTo(3)];
        const size_t misalignment = random.upTo(15);
        uint32_t colour[] = {0x11223344, 0x5566, 0x77, 0xFFFFFFFF};
        GuardedBuffer packed(size_t{pitch} * height * 4, misalignment);
        GuardedBuffer plane = packed;
        GuardedBuffer expectedPacked = packed;
        GuardedBuffer expectedPlane = packed;
        for (uint32_t x = 0; x < width; ++x)
            for (uint32_t y = 0; y < height; ++y) {
                for (uint32_t c = 0; c < 4; ++c)
                    storeElement<uint8_t>(expectedPacked.start(), (y * pitch + x) * 4 + c, colour[c]);
                if (bytes == 1)
                    storeElement<uint8_t>(expectedPlane.start(), x + y * pitch, colour[0]);
                else if (bytes == 2)
                    storeElement<uint16_t>(expectedPlane.start(), x + y * pitch, colour[0]);
                else if (bytes == 4)
                    storeElement<uint32_t>(expectedPlane.start(), x + y * pitch, colour[0]);
            }
        Image::fillColour(packed.start(), width, height, pitch, colour);
        Image::fillColourPlanar(plane.start(), width, height, pitch, bytes, colour[0]);
        ASSERT_EQ(packed.differenceFrom(expectedPacked), "") << width << 'x' << height;
        ASSERT_EQ(plane.differenceFrom(expectedPlane), "")
            << width << 'x' << height << " of " << bytes << " bytes";
    }
}

/// FNV-1a, 64 bits.
uint64_t digestOf(const std::vector<unsigned char>& bytes, uint64_t digest = 0xCBF29CE484222325) {
    for (const unsigned char byte : bytes)
        digest = (digest ^ byte) * 0x100000001B3;
    return digest;
}

TEST(Fillers, WholePicturesAreWhatTheyWereWhenFirstLookedAt) {
    constexpr uint64_t DIGESTS[] = {
        0xD5E38AF81C48D481, 0xB904A26DFF3A2639, 0xB2EE56A457DAB9A5, 0x7724280579012275, 0x36CDCA23D9E76CE5,
        0x07BD298DBB9BDCF5, 0xCC12319193ADD039, 0xFCB11AB840CD3139, 0x2EA0A95B577880C5, 0x4625B490382C8AA1,
        0xD7CD887D24001975, 0x969E1A6793FC8A25, 0xCADDDB47CFB99425, 0x4904E86421159979, 0x61D75498A93C837A,
        0xA6925E037D175031, 0xA24E730CB0E839E5, 0x39AF3F3798004525, 0x6BE07E97DAAC8B85, 0x3A6231D4F85749E1,
        0xBC832EA48B536B25, 0xD8D518572089DD25};
    static_assert(std::size(DIGESTS) == NUM_TEST_PATTERNS);
    for (uint32_t pattern = 0; pattern < NUM_TEST_PATTERNS; ++pattern) {
        std::vector<unsigned char> frame(1920 * 1080 * 4);
        std::vector<unsigned char> field(960 * 270 * 8);
        std::vector<unsigned char> plane(960 * 270 * 4);
        Image::fillTestPattern(frame.data(), Image::COL_ARGB, 1920, 1080, 1920, pattern, 2, 0, 0, 1920, 1080,
                               false);
        Image::fillTestPattern(field.data(), Image::COL_RGBA, 960, 270, 960, pattern, 1, 0, 0, 960, 270,
                               true);
        Image::fillTestPatternPlanar(plane.data(), 960, 270, 960, pattern, 0, 0, 4, 0, 0, 960, 270);
        const uint64_t digest = digestOf(plane, digestOf(field, digestOf(frame)));
        EXPECT_EQ(digest, DIGESTS[pattern]) << "pattern " << pattern << ": 0x" << std::hex << digest;
    }
}

/// One line of the sweep, each depth and phase, past the picture's right edge too.
void expectSweep(uint32_t width, uint32_t columns) {
    const PatternRegion p = {Image::H_SWEEP, width, 1, columns, 2, 0, 0, columns, 1};
    for (const uint32_t component : {0U, 1U})
        for (const uint32_t bytes : {1U, 2U, 4U})
            ASSERT_EQ(planarFillFault(p, component, bytes, 0), "");
}

TEST(Fillers, SweepsOfEveryWidthEqualTheWalkOverPixels) {
    for (uint32_t width = 0; width < 600 && !HasFatalFailure(); ++width)
        expectSweep(width, width + 40);
    for (const uint32_t width : {720U, 1280U, 1440U, 1920U, 2048U, 3840U, 4096U, 7680U, 32768U, 40000U})
        expectSweep(width, width);
    expectSweep(16, 3000); // the phases leave the estimated ones in the middle of a run
}

INSTANTIATE_TEST_SUITE_P(EveryPattern, PatternFillers, testing::Range(0U, NUM_TEST_PATTERNS + 1));

} // namespace
