#include "ToolRun.h"

#include <RoundTrip.h>

#include <fixture/FileText.h>
#include <fixture/GlTest.h>
#include <fixture/ReadPng.h>
#include <fixture/TemporaryFile.h>

#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <filesystem>

namespace {

class ToolRoundTrip : public GlTest {};

std::vector<uint16_t> pixelsOf(uint32_t pattern, uint32_t width, uint32_t height) {
    std::vector<unsigned char> bytes(size_t{width} * height * 4);
    VideoTestImage::fillTestPattern(bytes.data(), VideoTestImage::COL_RGBA, width, height, width, pattern, 2,
                                    0, 0, width, height, false);
    return {bytes.begin(), bytes.end()};
}

/// The pixels of a PPM file as a texture holds them, with an opaque alpha.
std::vector<uint16_t> pixelsOfPpm(const std::string& path) {
    const std::string bytes = fileText(path);
    const std::string header = "P6\n160 90\n255\n";
    std::vector<uint16_t> pixels;
    for (size_t i = header.size(); i + 2 < bytes.size(); i += 3) {
        for (size_t c = 0; c < 3; ++c)
            pixels.push_back(static_cast<unsigned char>(bytes[i + c]));
        pixels.push_back(0xFF);
    }
    return pixels;
}

size_t count(const std::string& text, const std::string& part) {
    size_t number = 0;
    for (size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++number;
    return number;
}

TEST_F(ToolRoundTrip, EveryPatternAndPictureComesBackAndIsWritten) {
    const TemporaryFile out("out");
    // The driver's own memory seems to leak when the tool lets go of it. RoundTrip is checked for leaks
    // below.
    const ToolRun run = runTool("roundtrip '" FWZEL_PICTURES "/mountains.png' --interlaced '" FWZEL_PICTURES
                                "/mountains.ppm' --size 72x50 --out '" +
                                    out.path() + "'",
                                "", "ASAN_OPTIONS=\"$ASAN_OPTIONS:detect_leaks=0\"");
    EXPECT_EQ(run.exitCode, 0) << run.remarks;
    EXPECT_EQ(count(run.output, "  yes\n"), 2 * (NUM_TEST_PATTERNS + 2)) << run.output;
    for (const char* const depth : {"-8bit.png", "-half.png"}) {
        SCOPED_TRACE(depth);
        EXPECT_TRUE(readPng(out.path() + "/17-colour-bar-100" + depth).samples ==
                    pixelsOf(VideoTestImage::COLOUR_BAR_100, 72, 50));
        EXPECT_TRUE(readPng(out.path() + "/01-h-ramp" + depth).samples ==
                    pixelsOf(VideoTestImage::H_RAMP, 72, 50));
        EXPECT_TRUE(readPng(out.path() + "/mountains.ppm-fields" + depth).samples ==
                    pixelsOfPpm(FWZEL_PICTURES "/mountains.ppm"));
        EXPECT_TRUE(readPng(out.path() + "/mountains.png" + depth).samples ==
                    readPng(FWZEL_PICTURES "/mountains.png").samples);
    }
    EXPECT_GT(readPng(out.path() + "/contact-sheet.png").width, 0U);
}

TEST_F(ToolRoundTrip, APictureThatDidNotGoUpIsNotEqual) {
    RoundTrip::Source source;
    source.pattern = VideoTestImage::H_RAMP;
    source.width = 20;
    source.height = 12;
    source.isInterlaced = true;
    for (const bool isFp16 : {false, true}) {
        source.isFp16 = isFp16;
        RoundTrip trip(source);
        trip.uploadFromProducerThread();
        trip.copyOnGpu();
        trip.readBack();
        EXPECT_EQ(trip.difference(), "");
        trip.wipe();
        trip.copyOnGpu();
        trip.readBack();
        EXPECT_EQ(trip.difference().rfind("buffer 0, pixel 0, row 0: ", 0), 0U) << trip.difference();
    }
}

TEST_F(ToolRoundTrip, WhatTheContextLacksIsNamedBeforeAnythingIsBuilt) {
    const TemporaryFile out("out");
    const ToolRun run = runTool("roundtrip --out '" + out.path() + "'", "",
                                "MESA_GL_VERSION_OVERRIDE=2.1 MESA_EXTENSION_OVERRIDE=-GL_ARB_texture_float");
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(run.output, "");
    EXPECT_NE(run.remarks.find("lacks half-float textures (GL_ARB_texture_float or OpenGL 3.0)\n"),
              std::string::npos)
        << run.remarks;
    EXPECT_FALSE(std::filesystem::exists(out.path()));
}

TEST_F(ToolRoundTrip, ARefusedFileIsNamedWithTheReason) {
    const TemporaryFile out("out");
    const ToolRun run = runTool("roundtrip /no/such.png --out '" + out.path() + "'");
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_NE(run.remarks.find("fwzel: /no/such.png: "), std::string::npos) << run.remarks;
}

} // namespace
