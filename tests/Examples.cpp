#include <fixture/FileText.h>
#include <fixture/GlTest.h>
#include <fixture/ReadPng.h>
#include <fixture/ShellCommand.h>
#include <fixture/TemporaryFile.h>

#include <FwZel/VideoTestImage.h>

#include <regex>
#include <vector>

namespace {

/// Runs an example as it was built; standard error is part of the output. The driver's own memory seems to
/// leak when a program lets go of it.
ShellRun runExample(const std::string& exampleAndArguments, const std::string& environment = "") {
    return runShell(environment +
                    " ASAN_OPTIONS=\"$ASAN_OPTIONS:detect_leaks=0\" '" FWZEL_EXAMPLES_BUILT "/'" +
                    exampleAndArguments + " 2>&1");
}

/// Skipped where there is no context, as the examples would fail.
class Examples : public GlTest {};

TEST_F(Examples, SmallestHostDrawsThreeFramesOfMagenta) {
    const ShellRun example = runExample("smallest_host");
    EXPECT_EQ(example.exitCode, 0);
    EXPECT_EQ(example.output, "frame 0: 191 0 191 in the middle\n"
                              "frame 1: 191 0 191 in the middle\n"
                              "frame 2: 191 0 191 in the middle\n");
}

TEST_F(Examples, ProducerThreadsFramesAreAllDrawnInOrder) {
    std::string expected;
    for (int frame = 0; frame < 20; ++frame)
        expected += "frame " + std::to_string(frame) + ": bar at " + std::to_string(32 * frame) + '\n';
    const ShellRun example = runExample("producer_thread");
    EXPECT_EQ(example.exitCode, 0);
    EXPECT_EQ(example.output, expected);
}

TEST_F(Examples, ReadbackFileShowsThePatternToTheByte) {
    constexpr uint32_t WIDTH = 640;
    constexpr uint32_t HEIGHT = 360;
    Bytes pattern(size_t{WIDTH} * HEIGHT * 4);
    VideoTestImage::fillTestPattern(pattern.data(), VideoTestImage::COL_RGBA, WIDTH, HEIGHT, WIDTH,
                                    VideoTestImage::COMBI, 2, 0, 0, WIDTH, HEIGHT, false);
    const TemporaryFile picture("combi.png");
    const ShellRun example = runExample("readback_to_file " + picture.path());
    EXPECT_EQ(example.exitCode, 0);
    EXPECT_EQ(example.output, "");
    const DecodedPng decoded = readPng(picture.path());
    EXPECT_EQ(decoded.width, WIDTH);
    EXPECT_EQ(decoded.height, HEIGHT);
    EXPECT_TRUE(std::equal(decoded.samples.begin(), decoded.samples.end(), pattern.begin(), pattern.end()));
}

TEST_F(Examples, CgProgramsDrawWithTheirParameters) {
    const ShellRun example = runExample("cg_parameters '" FWZEL_EXAMPLES "/cg_parameters.cg'");
    EXPECT_EQ(example.exitCode, 0);
    EXPECT_EQ(example.output, "plane: 217 82 115\nbox: 255 204 0\n");
}

TEST_F(Examples, WhatTheContextLacksIsNamed) {
    for (const char* const call : {"smallest_host", "producer_thread", "readback_to_file /dev/null",
                                   "cg_parameters '" FWZEL_EXAMPLES "/cg_parameters.cg'"}) {
        const ShellRun example = runExample(call, "MESA_EXTENSION_OVERRIDE=-GL_EXT_framebuffer_object");
        EXPECT_EQ(example.exitCode, 1) << call;
        EXPECT_NE(example.output.find(" lacks framebuffers and mip maps ("), std::string::npos)
            << example.output;
    }
}

TEST_F(Examples, WhatCannotBeDoneIsNamed) {
    const struct {
        const char* call;
        const char* reason;
    } failures[] = {
        {"readback_to_file /dev/full", "/dev/full"},
        {"readback_to_file", "usage: readback_to_file FILE.png"},
        {"cg_parameters /nowhere.cg", "cg_parameters: /nowhere.cg: "},
        {"cg_parameters", "usage: cg_parameters PROGRAM.cg"},
    };
    for (const auto& failure : failures) {
        const ShellRun example = runExample(failure.call);
        EXPECT_EQ(example.exitCode, 1) << failure.call;
        EXPECT_NE(example.output.find(failure.reason), std::string::npos) << example.output;
    }
}

/// The README's blocks of C++.
std::vector<std::string> quotedCode() {
    const std::string begin = "```cpp\n";
    const std::string end = "```\n";
    const std::string text = fileText(FWZEL_EXAMPLES "/../README.md");
    std::vector<std::string> blocks;
    for (size_t at = text.find(begin); at != std::string::npos; at = text.find(begin, at)) {
        at += begin.size();
        blocks.push_back(text.substr(at, text.find(end, at) - at));
    }
    return blocks;
}

TEST(ExamplesInReadme, AreThoseThatAreBuilt) {
    const std::vector<std::string> quoted = quotedCode();
    ASSERT_EQ(quoted.size(), 2U);
    EXPECT_EQ(quoted[0], fileText(FWZEL_EXAMPLES "/smallest_host.cpp"));
    const std::string indented = std::regex_replace("\n" + quoted[1], std::regex("\n(?=.)"), "\n    ");
    EXPECT_NE(fileText(FWZEL_EXAMPLES "/cg_parameters.cpp").find(indented), std::string::npos) << indented;
}

} // namespace
