#include "ToolRun.h"

#include <fixture/GlTest.h>
#include <fixture/PictureFiles.h>
#include <fixture/ReadPng.h>

#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <regex>
#include <stdexcept>
#include <vector>

namespace {

constexpr uint32_t WIDTH = 72;
constexpr uint32_t HEIGHT = 50;
constexpr size_t ROW_BYTES = size_t{WIDTH} * 4;
constexpr size_t FRAME_BYTES = ROW_BYTES * HEIGHT;

/// Without a context there is nothing to play on: the fixture skips.
class ToolPlay : public GlTest {};

/// The driver's own memory seems to leak when the tool lets go of it.
ToolRun play(const std::string& arguments, const std::string& environment = "") {
    return runTool("play --surface headless " + arguments, "",
                   environment + " ASAN_OPTIONS=\"$ASAN_OPTIONS:detect_leaks=0\"");
}

ToolRun playRaw(const std::string& arguments) {
    return play("--size 72x50 --out - " + arguments);
}

std::string host(const std::string& program) {
    return "--program '" FWZEL_HOST_CG "/" + program + "' ";
}

/// The bytes of a pattern: a field (0 even, 1 odd) or the whole frame (2).
std::string pattern(const std::string& name, uint32_t field = 2) {
    const uint32_t height = field == 2 ? HEIGHT : HEIGHT / 2;
    std::string bytes(ROW_BYTES * height, '\0');
    VideoTestImage::fillTestPattern(reinterpret_cast<unsigned char*>(bytes.data()), VideoTestImage::COL_RGBA,
                                    WIDTH, height, WIDTH, findTestPattern(name)->number, field, 0, 0, WIDTH,
                                    height, false);
    return bytes;
}

std::string row(const std::string& picture, uint32_t y) {
    return picture.substr(y * ROW_BYTES, ROW_BYTES);
}

/// Every other line of a frame: those of a field.
std::string linesOf(const std::string& picture, uint32_t field) {
    std::string lines;
    for (uint32_t y = field; y < HEIGHT; y += 2)
        lines += row(picture, y);
    return lines;
}

TEST_F(ToolPlay, PlaneOfTheSurfacesShapeShowsThePicturesBytes) {
    for (const char* const name : {"combi", "hv-ramp", "colour-mats", "circle"})
        for (const char* const how :
             {"", "--upload pbo --buffers 4", "--upload producer --buffers 2", "--tessellation 7x5"}) {
            SCOPED_TRACE(std::string(name) + ' ' + how);
            const ToolRun run = playRaw(std::string(name) + " --frames 3 " + how);
            EXPECT_EQ(run.exitCode, 0) << run.remarks;
            EXPECT_TRUE(run.output == pattern(name) + pattern(name) + pattern(name));
        }
}

TEST_F(ToolPlay, FieldLiesOnItsFrameLines) {
    for (const char* const how :
         {"", "--upload producer", "--program '" FWZEL_HOST_CG "/field_interpolate.cg'"}) {
        SCOPED_TRACE(how);
        const ToolRun run = playRaw(std::string("combi --fields --frames 2 ") + how);
        ASSERT_EQ(run.output.size(), 2 * FRAME_BYTES) << run.remarks;
        for (const uint32_t field : {0U, 1U})
            EXPECT_TRUE(linesOf(run.output.substr(field * FRAME_BYTES), field) == pattern("combi", field))
                << "field " << field;
    }
}

TEST_F(ToolPlay, FieldsWovenAreTheFrame) {
    const ToolRun run = playRaw("combi --fields --upload producer --frames 2 " + host("field_weave.cg"));
    ASSERT_EQ(run.output.size(), 2 * FRAME_BYTES) << run.remarks;
    EXPECT_TRUE(run.output.substr(0, FRAME_BYTES) == run.output.substr(FRAME_BYTES));
    for (const uint32_t field : {0U, 1U})
        EXPECT_TRUE(linesOf(run.output, field) == pattern("combi", field)) << "field " << field;
}

TEST_F(ToolPlay, FilesAreWrittenAndNumberedTheRightWayUp) {
    const TemporaryFile out("out");
    const ToolRun run = play("'" FWZEL_PICTURES "/mountains.png' hv-ramp --out '" + out.path() + "%03d.png'");
    EXPECT_EQ(run.exitCode, 0) << run.remarks;
    EXPECT_TRUE(readPng(out.path() + "000.png").samples == readPng(FWZEL_PICTURES "/mountains.png").samples);
    EXPECT_EQ(readPng(out.path() + "001.png").width, readPng(FWZEL_PICTURES "/mountains.png").width);
}

TEST_F(ToolPlay, YCbCrIsConvertedByBt709) {
    const std::string converted = playRaw("colour-bar-75 " + host("ycbcr_to_rgb.cg")).output;
    ASSERT_EQ(converted.size(), FRAME_BYTES);
    const std::string source = pattern("colour-bar-75"); // its bytes taken for Cr, Y', Cb
    const auto code = [](const std::string& picture, size_t at) {
        return static_cast<float>(static_cast<unsigned char>(picture[at]));
    };
    for (uint32_t bar = 0; bar < 8; ++bar) {
        const size_t at = (bar * 9 + 4) * size_t{4};
        const float luma = (code(source, at + 1) - 16) / 219;
        const float cr = (code(source, at) - 128) / 224;
        const float cb = (code(source, at + 2) - 128) / 224;
        const float rgb[] = {luma + 1.5748F * cr, luma - 0.468124F * cr - 0.187324F * cb,
                             luma + 1.8556F * cb};
        for (size_t c = 0; c < 3; ++c)
            EXPECT_NEAR(code(converted, at + c), 255 * std::fmin(std::fmax(rgb[c], 0), 1), 0.6F)
                << "bar " << bar << ", component " << c;
    }
}

TEST_F(ToolPlay, ParametersReachTheProgram) {
    const TemporaryFile source("mix.cg",
                               bytesOf("float4 mixed(uniform float4x4 m, uniform float3 lift, uniform float "
                                       "gain, uniform float frame) : COLOR"
                                       "{ return gain * (mul(m, float4(lift, 1)) + frame); }"));
    const ToolRun run =
        playRaw("combi --frames 2 --program '" + source.path() +
                "' --entry mixed --param m=0,0,1,0,0,1,0,0,1,0,0,0,0,0,0,1 --param lift=0.4,0.8,1.2 "
                "--param gain=0.5 --param frame=0");
    ASSERT_EQ(run.output.size(), 2 * FRAME_BYTES) << run.remarks;
    EXPECT_EQ(run.output.substr(FRAME_BYTES, 4), "\x99\x66\x33\x80");
}

TEST_F(ToolPlay, KeyLetsTheBoardThrough) {
    const TemporaryFile clear("clear.png", PngPicture().encode());
    const ToolRun board = play("'" + clear.path() +
                               "' --out - --program '" FWZEL_HOST_CG
                               "/key_over_checkerboard.cg' --param cell=4 --param board=0,1");
    EXPECT_EQ(board.exitCode, 0) << board.remarks;
    const PngPicture picture;
    for (const uint32_t x : {0U, 4U, 9U}) {
        const std::vector<uint8_t> pixel = picture.rgba(x, 0);
        const float key = static_cast<float>(pixel[3]) / 255;
        const float below = x / 4 % 2 == 0 ? 0 : 255;
        EXPECT_NEAR(static_cast<unsigned char>(board.output[size_t{x} * 4]),
                    static_cast<float>(pixel[0]) * key + below * (1 - key), 1);
    }
}

TEST_F(ToolPlay, BoxesAndPolylinesLieOverThePlaneAndMove) {
    const std::string box = "circle --frames 9 --box -0.5,-0.25,0.5,0.25 --colour 1,0,0";
    const ToolRun still = playRaw(box);
    const ToolRun moving = playRaw(box + " --move");
    const ToolRun line = playRaw("white-frame --polyline -1,0.01,1,0.01 --colour 0,1,0 --line-width 2");
    const std::string red("\xFF\0\0\xFF", 4);
    EXPECT_NE(still.output.find(red), std::string::npos) << still.remarks;
    const size_t last = 8 * FRAME_BYTES;
    EXPECT_TRUE(still.output.substr(0, FRAME_BYTES) == still.output.substr(last));
    EXPECT_TRUE(still.output.substr(0, FRAME_BYTES) == moving.output.substr(0, FRAME_BYTES));
    EXPECT_NE(moving.output.substr(last).find(red), std::string::npos) << moving.remarks;
    EXPECT_FALSE(still.output.substr(last) == moving.output.substr(last));
    EXPECT_EQ(line.output.substr(HEIGHT / 2 * ROW_BYTES - ROW_BYTES + ROW_BYTES / 2, 4),
              std::string("\0\xFF\0\xFF", 4))
        << line.remarks;
}

TEST_F(ToolPlay, StatisticsHaveALineAStageAndWindow) {
    const ToolRun run = play("combi --size 16x8 --frames 6 --stats --stats-window 3 --overlay");
    const std::string stage = R"(  (upload  |drawing |readback)( +\d+\.\d\d){3}\n)";
    EXPECT_TRUE(std::regex_match(
        run.output, std::regex("frames 0 to 2: milliseconds, mean, least and most\n(" + stage + "){3}" +
                               "frames 3 to 5: milliseconds, mean, least and most\n(" + stage + "){3}")))
        << run.output << run.remarks;
}

/// Kibibytes of memory that a process has in use.
long residentMemory(int pid) {
    std::ifstream status("/proc/" + std::to_string(pid) + "/status");
    for (std::string word; status >> word;)
        if (word == "VmRSS:") {
            long kibibytes = 0;
            status >> kibibytes;
            return kibibytes;
        }
    throw std::runtime_error("the process is gone");
}

// A frame that leaves an OpenGL error behind ends the tool with exit status 1.
TEST_F(ToolPlay, ThousandFramesTakeNoMoreMemoryThanAFew) {
    constexpr int FEW = 200;
    constexpr int MANY = 1100;
    constexpr int ALL = 1200;
    constexpr long TOLERANCE = 4096; // KiB: a third of what 900 leaked textures take
    const TemporaryFile process("pid");
    const std::string command =
        "echo $$ >'" + process.path() +
        "'; ASAN_OPTIONS=\"$ASAN_OPTIONS:detect_leaks=0:quarantine_size_mb=0\" exec '" FWZEL_TOOL
        "' play combi circle --size 64x64 --fields --buffers 4 --upload producer --frames 600 --overlay "
        "--box "
        "-0.5,-0.5,0.5,0.5 --polyline 0,0,0.5,0.5,-0.5,0.5 --move --surface headless --out - 2>/dev/null";
    std::FILE* const pipe = popen(command.c_str(), "r");
    ASSERT_NE(pipe, nullptr);
    std::vector<char> frame(size_t{64} * 64 * 4);
    std::vector<long> memory;
    // The pipe holds the tool to a few frames ahead of what is read.
    for (int count = 1; count <= ALL && std::fread(frame.data(), frame.size(), 1, pipe) == 1; ++count)
        if (count == FEW || count == MANY) {
            int pid = 0;
            std::ifstream(process.path()) >> pid;
            memory.push_back(residentMemory(pid));
        }
    EXPECT_EQ(pclose(pipe), 0);
    ASSERT_EQ(memory.size(), 2U);
    EXPECT_LT(memory[1] - memory[0], TOLERANCE) << "KiB, from " << memory[0];
}

TEST_F(ToolPlay, ProgramsOfTheHostAreFoundByNameWhereTheFolderHasNone) {
    const std::string own = playRaw("colour-bar-75 " + host("ycbcr_to_rgb.cg")).output;
    ASSERT_EQ(own.size(), FRAME_BYTES);
    const TemporaryFile folder("folder");
    std::filesystem::create_directory(folder.path());
    const auto playThere = [&] {
        return play("--size 72x50 --out - colour-bar-75 --program ycbcr_to_rgb.cg",
                    "cd '" + folder.path() + "';");
    };
    EXPECT_TRUE(playThere().output == own);
    std::ofstream(folder.path() + "/ycbcr_to_rgb.cg") << "float4 Cg_Main() : COLOR { return 1; }";
    EXPECT_TRUE(playThere().output == std::string(FRAME_BYTES, '\xFF'));
}

struct Failure {
    const char* arguments;
    int exitCode;
    const char* message; ///< a line of standard error
};

TEST_F(ToolPlay, WhatFailsIsNamedWithTheReason) {
    const TemporaryFile broken("broken.cg", bytesOf("float4 Cg_Main() : COLOR { return nothing; }"));
    const std::string brokenProgram = "combi --program '" + broken.path() + "'";
    const std::string listing = broken.path() + "(1) : error";
    const Failure failures[] = {
        {"nosuch", 2, "fwzel: \"nosuch\" is no pattern and no picture file"},
        {"/no/such.png", 1, "fwzel: /no/such.png: it cannot be opened: No such file or directory"},
        {"combi --program /no/such.cg", 1, "fwzel: /no/such.cg: No such file or directory"},
        {"combi --program /no/texture.cg", 1, "fwzel: /no/texture.cg: No such file or directory"},
        {"combi --program such.cg", 1, "fwzel: such.cg: No such file or directory"},
        {brokenProgram.c_str(), 1, listing.c_str()},
        {"combi --program '" FWZEL_HOST_CG "/texture.cg' --param gain=1", 2, "has no parameter gain\n"},
        {"combi --program '" FWZEL_HOST_CG "/colour.cg' --param colour=1", 2, "colour has 4 values, not 1\n"},
        {"combi --buffers 3", 2, "fwzel: --buffers: 3 is none of"},
        {"combi --fields --buffers 1", 2, "fwzel: --buffers: two fields"},
        {"combi --out x.png", 2, "fwzel: --out: \"x.png\" has no place"},
        {"combi --size 8x8 --out /no/such/%d.png", 1, "fwzel: /no/such/0.png: No such file"},
        {"combi --box 1,2,3", 2, "fwzel: --box: \"1,2,3\" is no box"},
        {"combi --size 100000x8", 1, " has no textures of 100000 x 8"},
    };
    for (const Failure& failure : failures) {
        SCOPED_TRACE(failure.arguments);
        const ToolRun run = play(failure.arguments);
        EXPECT_EQ(run.exitCode, failure.exitCode);
        EXPECT_EQ(run.output, "");
        EXPECT_NE(run.remarks.find(failure.message), std::string::npos) << run.remarks;
    }
}

TEST_F(ToolPlay, WhatTheContextLacksIsNamedBeforeAnythingIsBuilt) {
    const struct {
        const char* environment;
        const char* missing;
    } cases[] = {
        {"MESA_GL_VERSION_OVERRIDE=2.1", "shaders of GLSL 3.30 (OpenGL 3.3)\n"},
        {"MESA_EXTENSION_OVERRIDE=-GL_ARB_texture_non_power_of_two", " lacks textures of any size ("},
        {"MESA_EXTENSION_OVERRIDE=-GL_EXT_framebuffer_object", " lacks framebuffers and mip maps ("},
        {"MESA_EXTENSION_OVERRIDE=-GL_ARB_pixel_buffer_object", " lacks readback through pixel buffers ("},
        {"MESA_GL_VERSION_OVERRIDE=1.4 MESA_EXTENSION_OVERRIDE=-GL_ARB_copy_buffer",
         "copies between buffers ("},
        {"MESA_GL_VERSION_OVERRIDE=1.4 MESA_EXTENSION_OVERRIDE=-GL_ARB_vertex_buffer_object", " lacks "},
        {"MESA_GL_VERSION_OVERRIDE=3.3COMPAT MESA_EXTENSION_OVERRIDE=-GL_ARB_separate_shader_objects",
         " lacks "},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.environment);
        const ToolRun run = play("combi --size 8x8", c.environment);
        EXPECT_EQ(run.exitCode, 1);
        EXPECT_NE(run.remarks.find(c.missing), std::string::npos) << run.remarks;
    }
}

} // namespace
