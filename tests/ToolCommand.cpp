#include "ToolRun.h"

#include <fixture/FileText.h>
#include <fixture/ReadPng.h>
#include <fixture/TemporaryFile.h>

#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <functional>
#include <sstream>

namespace {

/// So many bytes of zero, with what a filler writes into them.
std::string filled(size_t numBytes, const std::function<void(unsigned char*)>& fill) {
    std::vector<unsigned char> bytes(numBytes);
    fill(bytes.data());
    return {bytes.begin(), bytes.end()};
}

std::string filledPattern(uint32_t pattern, uint32_t width, uint32_t height) {
    return filled(size_t{width} * height * 4, [&](unsigned char* mem) {
        VideoTestImage::fillTestPattern(mem, VideoTestImage::COL_RGBA, width, height, width, pattern, 2, 0, 0,
                                        width, height, false);
    });
}

TEST(ToolList, HasALineForEachPatternThatLeadsToIt) {
    const ToolRun list = runTool("list");
    EXPECT_EQ(list.exitCode, 0);
    EXPECT_EQ(list.remarks, "");
    std::istringstream lines(list.output);
    for (const TestPatternEntry& pattern : testPatternCatalogue()) {
        std::string line;
        ASSERT_TRUE(std::getline(lines, line));
        std::istringstream words(line);
        std::string number;
        std::string name;
        words >> number >> name;
        EXPECT_EQ(number, std::to_string(pattern.number));
        EXPECT_EQ(name, pattern.name);
        EXPECT_NE(line.find(pattern.shows), std::string::npos);
        EXPECT_NE(line.find(pattern.components), std::string::npos);
    }
    std::string surplus;
    EXPECT_FALSE(std::getline(lines, surplus)) << surplus;
}

struct RawPicture {
    const char* arguments;
    size_t numBytes;
    std::function<void(unsigned char*)> fill;
};

TEST(ToolPattern, RawBytesAreThoseOfTheLibrarysFillers) {
    using Image = VideoTestImage;
    const RawPicture pictures[] = {
        {"combi --size 37x19", 37 * 19 * 4,
         [](unsigned char* mem) {
             Image::fillTestPattern(mem, Image::COL_RGBA, 37, 19, 37, Image::COMBI, 2, 0, 0, 37, 19, false);
         }},
        {"14 --size 64x41 --field odd --order barg --half", 64 * 20 * 8,
         [](unsigned char* mem) {
             Image::fillTestPattern(mem, Image::COL_BARG, 64, 20, 64, Image::CIRCLE, 1, 0, 0, 64, 20, true);
         }},
        {"colour-mats --size 50x40 --field even --pitch 53 --region 20x10+15+3 --order argb", 53 * 20 * 4,
         [](unsigned char* mem) {
             Image::fillTestPattern(mem, Image::COL_ARGB, 50, 20, 53, Image::COLOUR_MATS, 0, 15, 3, 20, 10,
                                    false);
         }},
        {"h-sweep --size 33x5 --component cr", 33 * 5,
         [](unsigned char* mem) {
             Image::fillTestPatternPlanar(mem, 33, 5, 33, Image::H_SWEEP, 2, 0, 1, 0, 0, 33, 5);
         }},
        {"h-ramp-10bit-2 --size 33x5 --component g --bytes 2 --pitch 40 --region 2x3+4+1", 40 * 5 * 2,
         [](unsigned char* mem) {
             Image::fillTestPatternPlanar(mem, 33, 5, 40, Image::H_RAMP_10BIT_2, 2, 1, 2, 4, 1, 2, 3);
         }},
        {"hv-ramp --size 16x9 --component k --bytes 4", 16 * 9 * 4,
         [](unsigned char* mem) {
             Image::fillTestPatternPlanar(mem, 16, 9, 16, Image::HV_RAMP, 2, 3, 4, 0, 0, 16, 9);
         }},
    };
    for (const RawPicture& picture : pictures) {
        SCOPED_TRACE(picture.arguments);
        const std::string frame = filled(picture.numBytes, picture.fill);
        const ToolRun run = runTool("pattern " + std::string(picture.arguments) + " --frames 2 -o -");
        EXPECT_EQ(run.exitCode, 0);
        EXPECT_EQ(run.remarks, "");
        EXPECT_TRUE(run.output == frame + frame);
    }
}

TEST(ToolPattern, PngAndPpmShowTheFill) {
    const TemporaryFile png("bars.png");
    ASSERT_EQ(runTool("pattern colour-bar-75 --size 21x6 -o " + png.path()).exitCode, 0);
    const std::string pixels = filledPattern(VideoTestImage::COLOUR_BAR_75, 21, 6);
    const DecodedPng picture = readPng(png.path());
    EXPECT_EQ(picture.width, 21U);
    EXPECT_EQ(picture.height, 6U);
    const Bytes bytes = bytesOf(pixels);
    EXPECT_TRUE(picture.samples == std::vector<uint16_t>(bytes.begin(), bytes.end()));

    const TemporaryFile ppm("bars.ppm");
    ASSERT_EQ(runTool("pattern colour-bar-75 --size 21x6 -o " + ppm.path()).exitCode, 0);
    std::string expected = "P6\n21 6\n255\n";
    for (size_t i = 0; i < pixels.size(); i += 4)
        expected += pixels.substr(i, 3);
    EXPECT_TRUE(fileText(ppm.path()) == expected);
}

TEST(ToolPattern, PlanesOfOneAndTwoBytesAreGreyPng) {
    for (const int bytes : {1, 2}) {
        SCOPED_TRACE(bytes);
        const TemporaryFile png("plane");
        ASSERT_EQ(runTool("pattern h-sweep --size 70x3 --component y --format png --bytes " +
                          std::to_string(bytes) + " -o " + png.path())
                      .exitCode,
                  0);
        std::vector<uint16_t> samples(70 * 3);
        auto* const mem = reinterpret_cast<unsigned char*>(samples.data());
        VideoTestImage::fillTestPatternPlanar(mem, 70, 3, 70, VideoTestImage::H_SWEEP, 2, 1,
                                              static_cast<uint32_t>(bytes), 0, 0, 70, 3);
        if (bytes == 1) {
            const Bytes narrow(mem, mem + samples.size());
            samples.assign(narrow.begin(), narrow.end());
        }
        EXPECT_TRUE(readPng(png.path()).samples == samples);
    }
}

TEST(Tool, WrongCallsAreRefusedWithTheReason) {
    const struct {
        const char* arguments;
        const char* reason;
    } calls[] = {
        {"", "a verb is missing"},
        {"paint", "paint"},
        {"list now", "now"},
        {"info", "FILE is required"},
        {"pattern combi", "--output is required"},
        {"pattern bars -o OUT.png", "\"bars\" is no pattern"},
        {"pattern 99 -o OUT.png", "\"99\" is no pattern"},
        {"pattern combi -o OUT.tif", "the extension tells no format"},
        {"pattern combi -o OUT.png --format tiff", "--format: tiff not in {png,ppm,raw}"},
        {"pattern combi -o OUT.png --size 1920", "--size: \"1920\" is no size"},
        {"pattern combi -o OUT.png --size 0x5", "--size: \"0x5\" is no size"},
        {"pattern combi -o OUT.png --size 4294967297x5", "--size: \"4294967297x5\" is no size"},
        {"pattern combi -o OUT.png --size 65536x65536", "--size: the picture takes 2 GiB or more"},
        {"pattern combi -o OUT.png --size 1000001x1", "--size: PNG takes 1000000 pixels a side at most"},
        {"pattern combi -o OUT.png --size 5x1 --field odd", "--size: a field of one line has no rows"},
        {"pattern colour-bar-100 -o OUT.png --size 7x9", "eight colour bars need a width of 8"},
        {"pattern combi -o OUT.png --size 9x9 --region 5x5+5+0",
         "--region: reaches beyond the picture of 9x9"},
        {"pattern combi -o OUT.png --region 5x5+4294967295+0", "--region: reaches beyond"},
        {"pattern combi -o OUT.png --region 5x5", "--region: \"5x5\" is no region"},
        {"pattern combi -o OUT.raw --pitch 1919", "--pitch: 1919 pixels are less than the width, 1920"},
        {"pattern combi -o OUT.png --half", "--half: PNG holds no half floats"},
        {"pattern combi -o OUT.ppm --half", "--half: PPM holds no half floats"},
        {"pattern combi -o OUT.png --order argb", "--order: PNG fixes the order"},
        {"pattern combi -o OUT.png --pitch 2000", "--pitch: rows in PNG have no gaps"},
        {"pattern combi -o OUT.ppm --frames 2", "--frames: PPM holds one picture"},
        {"pattern combi -o OUT.raw --frames 0", "--frames: 0 frames"},
        {"pattern combi -o OUT.ppm --component y", "--component: PPM always has three components"},
        {"pattern combi -o OUT.png --component y --bytes 4", "--bytes 4: PNG samples have one or two bytes"},
        {"pattern combi -o OUT.raw --component y --bytes 3", "--bytes: 3 not in {1,2,4}"},
        {"pattern combi -o OUT.raw --component y --half", "--half: a single component is an integer"},
        {"pattern combi -o OUT.raw --component y --order argb", "--order: a single component has no order"},
        {"pattern combi -o OUT.raw --bytes 2", "--bytes: only a single component has a choice"},
        {"roundtrip --size 9", "--size: \"9\" is no size"},
    };
    const TemporaryFile output("OUT");
    for (const auto& call : calls) {
        SCOPED_TRACE(call.arguments);
        std::string arguments = call.arguments;
        const size_t name = arguments.find("OUT");
        if (name != std::string::npos)
            arguments.replace(name, 3, output.path());
        const ToolRun run = runTool(arguments);
        EXPECT_EQ(run.exitCode, 2);
        EXPECT_EQ(run.output, "");
        EXPECT_EQ(run.remarks.rfind("fwzel: ", 0), 0U) << run.remarks;
        EXPECT_NE(run.remarks.find(call.reason), std::string::npos) << run.remarks;
    }
    EXPECT_TRUE(std::filesystem::is_empty(std::filesystem::path(output.path()).parent_path()));
}

TEST(Tool, OutputThatCannotBeWrittenIsAFailureWithTheReason) {
    const struct {
        const char* arguments;
        const char* redirection;
        const char* reason;
    } calls[] = {
        {"list", ">/dev/full", "standard output: No space left on device"},
        {"list", ">&-", "standard output: Bad file descriptor"},
        {"--version", ">/dev/full", "standard output: No space left on device"},
        {"info '" FWZEL_PICTURES "/mountains.png'", ">/dev/full", "standard output: No space left on device"},
        {"pattern combi --frames 20 -o -", "| :", "standard output: Broken pipe"},
        {"pattern combi --size 9x9 --format raw -o /dev/full", "", "/dev/full: No space left on device"},
        {"pattern combi --size 9x9 --format ppm -o /dev/full", "", "/dev/full: No space left on device"},
        {"pattern combi --format png -o /dev/full", "", "/dev/full: No space left on device"},
        {"pattern combi -o /no/folder.png", "", "/no/folder.png: No such file or directory"},
    };
    for (const auto& call : calls) {
        SCOPED_TRACE(std::string(call.arguments) + ' ' + call.redirection);
        const ToolRun run = runTool(call.arguments, call.redirection);
        EXPECT_EQ(run.exitCode, 1);
        EXPECT_EQ(run.remarks, "fwzel: " + std::string(call.reason) + '\n');
    }
}

TEST(ToolInfo, TellsOfGoodFilesAndOfBadOnesInOneCall) {
    const TemporaryFile text("text.png", bytesOf("no picture"));
    const ToolRun run = runTool("info '" FWZEL_PICTURES "/mountains.png' " + text.path() + " /no/such.ppm");
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(run.output, FWZEL_PICTURES "/mountains.png: PNG, 160 x 90, 1 byte a component\n");
    EXPECT_NE(run.remarks.find("fwzel: " + text.path() + ": "), std::string::npos) << run.remarks;
    EXPECT_NE(run.remarks.find("fwzel: /no/such.ppm: "), std::string::npos) << run.remarks;
    EXPECT_NE(run.remarks.find("fwzel: 2 of 3 files refused\n"), std::string::npos) << run.remarks;
    EXPECT_EQ(runTool("info '" FWZEL_PICTURES "/mountains.png'").exitCode, 0);
}

} // namespace
