#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace {

TEST(TestPatternCatalogue, FindsEachPatternByNameAndNumber) {
    std::set<std::string> names;
    for (uint32_t number = 0; number < NUM_TEST_PATTERNS; ++number) {
        const TestPatternEntry& entry = testPatternCatalogue()[number];
        EXPECT_EQ(entry.number, number);
        EXPECT_EQ(findTestPattern(number), &entry);
        EXPECT_EQ(findTestPattern(std::to_string(number)), &entry);
        EXPECT_EQ(findTestPattern(entry.name), &entry);
        EXPECT_TRUE(names.insert(entry.name).second) << entry.name;
    }
    EXPECT_EQ(findTestPattern("colour-bar-75")->number, VideoTestImage::COLOUR_BAR_75);
    EXPECT_EQ(findTestPattern("digonal-line")->number, VideoTestImage::DIGONAL_LINE);
    EXPECT_EQ(findTestPattern("h-ramp-10bit-2")->number, VideoTestImage::H_RAMP_10BIT_2);
}

TEST(TestPatternCatalogue, KnowsNothingElse) {
    EXPECT_EQ(findTestPattern(std::to_string(NUM_TEST_PATTERNS)), nullptr);
    for (const char* const text : {"", "-1", "+1", "01", " 1", "1 ", "4294967296", "4294967295", "COMBI",
                                   "no-test-pattern", "colour_bar_75"})
        EXPECT_EQ(findTestPattern(text), nullptr) << '"' << text << '"';
    EXPECT_EQ(findTestPattern(VideoTestImage::NO_TEST_PATTERN), nullptr);
}

} // namespace
