#include <FwZel/RowExpansion.h>

#include <FwZel/HalfFloat.h>

#include <gtest/gtest.h>

#include <cstring>
#include <fstream>
#include <iterator>
#include <ostream>
#include <set>
#include <string>
#include <vector>

namespace {

constexpr size_t GUARD_BYTES = 40;
constexpr uint8_t UNTOUCHED = 0xA5;

using Bytes = std::vector<uint8_t>;

class RowExpansions : public ::testing::TestWithParam<const RowExpansion*> {
protected:
    /// Every sample value comes, in an order that no group of eight repeats; source and destination
    /// unaligned.
    RowExpansions() {
        for (size_t i = 0; i < mSamples.size(); ++i)
            mSamples[i] = static_cast<uint8_t>(i * 37 + i / 256);
    }

    const uint8_t* samples() const { return mSamples.data() + 1; }

    template <class Expand>
    static Bytes written(size_t bytes, Expand expand) {
        Bytes memory(bytes + 2 * GUARD_BYTES, UNTOUCHED);
        expand(memory.data() + GUARD_BYTES - 1);
        return memory;
    }

    static void store(Bytes& memory, size_t index, uint16_t value, size_t bytes) {
        std::memcpy(&memory[GUARD_BYTES - 1 + index * bytes], &value, bytes);
    }

private:
    std::vector<uint8_t> mSamples = std::vector<uint8_t>(2000);
};

TEST_P(RowExpansions, WriteTheDefinedBytesAndNoOthers) {
    const RowExpansion& form = *GetParam();
    for (size_t pixels = 0; pixels < 660; pixels += pixels < 40 ? 1 : 31) {
        SCOPED_TRACE(pixels);
        // In memory of their own, so that reading past the last sample is seen.
        const std::vector<uint8_t> rgb(samples(), samples() + 3 * pixels);
        Bytes rgba(4 * pixels + 2 * GUARD_BYTES, UNTOUCHED);
        Bytes halves(8 * pixels + 2 * GUARD_BYTES, UNTOUCHED);
        Bytes plainHalves(6 * pixels + 2 * GUARD_BYTES, UNTOUCHED);
        for (size_t i = 0; i < 4 * pixels; ++i) {
            const uint8_t sample = i % 4 == 3 ? uint8_t{0xFF} : rgb[i / 4 * 3 + i % 4];
            store(rgba, i, sample, 1);
            store(halves, i, HALF_FLOAT_CODES[sample], 2);
        }
        for (size_t i = 0; i < 3 * pixels; ++i)
            store(plainHalves, i, HALF_FLOAT_CODES[rgb[i]], 2);

        ASSERT_EQ(written(4 * pixels, [&](unsigned char* to) { form.rgbToRgba(rgb.data(), to, pixels); }),
                  rgba);
        ASSERT_EQ(written(8 * pixels, [&](unsigned char* to) { form.rgbToHalfRgba(rgb.data(), to, pixels); }),
                  halves);
        ASSERT_EQ(
            written(6 * pixels, [&](unsigned char* to) { form.samplesToHalf(rgb.data(), to, 3 * pixels); }),
            plainHalves);
    }
}

INSTANTIATE_TEST_SUITE_P(PlainAndBest, RowExpansions,
                         ::testing::Values(&plainRowExpansion(), &bestRowExpansion()),
                         [](const auto& form) { return form.index == 0 ? "Plain" : "Best"; });

#if defined(__x86_64__) && defined(__linux__)
TEST(RowExpansion, IsTheFastestThatTheKernelSaysTheProcessorHas) {
    std::ifstream cpuInfo("/proc/cpuinfo");
    const std::set<std::string> words{std::istream_iterator<std::string>(cpuInfo), {}};
    const bool hasBoth = words.count("avx2") != 0 && words.count("f16c") != 0;
    EXPECT_STREQ(bestRowExpansion().name, hasBoth ? "avx2 f16c" : "plain");
}
#endif

} // namespace
