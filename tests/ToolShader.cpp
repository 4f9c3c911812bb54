#include "ToolRun.h"

#include <fixture/TemporaryFile.h>

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <vector>

namespace {

const char* const PROGRAM = R"(struct Levels { float gain; float3 lift; };
uniform Levels levels;
uniform float taps[3] = { 0.25, 0.5, 0.25 };
float4 Cg_Main(float2 uv : TEXCOORD0, uniform sampler2D picture : TEXUNIT3, uniform sampler2D other,
               uniform float4x4 matrix = { 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 2 }) : COLOR
{
    float4 colour = mul(matrix, tex2D(picture, uv) * taps[1] + tex2D(other, uv));
    return float4(colour.rgb * levels.gain + levels.lift, GAMMA);
}
)";

class ToolShader : public ::testing::Test {
protected:
    ToolRun compile(const std::string& source, const std::string& options) const {
        std::ofstream(mFile.path()) << source;
        return runTool("shader " + mFile.path() + " --entry Cg_Main --stage fragment " + options);
    }
    std::string path() const { return mFile.path(); }

private:
    TemporaryFile mFile{"program.cg"};
};

TEST(ToolShaderFiles, TheProgramsOfTheHostAreFoundByName) {
    const ToolRun run = runTool("shader key_over_checkerboard.cg --entry Cg_Main --stage fragment");
    EXPECT_EQ(run.exitCode, 0) << run.remarks;
    EXPECT_NE(run.output.find("cell"), std::string::npos) << run.output;
    EXPECT_EQ(runTool("shader nowhere.cg --entry Cg_Main --stage fragment").exitCode, 1);
}

TEST_F(ToolShader, ListsWhatAHostSets) {
    const ToolRun run = compile(PROGRAM, "-D GAMMA=2.2");
    ASSERT_EQ(run.exitCode, 0) << run.remarks;
    EXPECT_EQ(run.remarks, "");
    std::istringstream lines(run.output);
    std::vector<std::string> rows;
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string row;
        for (std::string word; words >> word;)
            row += (row.empty() ? "" : " ") + word;
        rows.push_back(row);
    }
    EXPECT_EQ(rows, (std::vector<std::string>{
                        "name type size kind semantic unit default",
                        "uv float2 1 in TEXCOORD0 - -",
                        "picture sampler2D 1 uniform TEXUNIT3 3 -",
                        "other sampler2D 1 uniform - any -",
                        "matrix float4x4 1 uniform - - 1 0 0 0 0 1 0 0 0 0 1 0 0 0 0 2",
                        "return float4 1 out COLOR - -",
                        "levels.gain float 1 uniform - - -",
                        "levels.lift float3 1 uniform - - -",
                        "taps float 3 uniform - - 0.25 0.5 0.25",
                    }));
}

TEST_F(ToolShader, PrintsTheGlslAlone) {
    const ToolRun run = compile(PROGRAM, "-D GAMMA=2.2 --glsl");
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(run.output.rfind("#version", 0), 0U);
    EXPECT_NE(run.output.find("void main()"), std::string::npos);
}

TEST_F(ToolShader, PrintsErrorsAsCompilersDo) {
    const ToolRun run = compile(PROGRAM, "");
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(run.output, "");
    EXPECT_EQ(run.remarks.rfind(path() + "(8) : error: ", 0), 0U) << run.remarks;
    EXPECT_NE(run.remarks.find("GAMMA"), std::string::npos);
}

TEST_F(ToolShader, KeepsWarningsForThoseWhoAsk) {
    const std::string source = "float4 Cg_Main(float4 c : COLOR) : COLOR { float2 t = c; return t.xyxy; }\n";
    const ToolRun silent = compile(source, "");
    EXPECT_EQ(silent.exitCode, 0);
    EXPECT_EQ(silent.remarks, "");
    const ToolRun told = compile(source, "--warnings");
    EXPECT_EQ(told.exitCode, 0);
    EXPECT_EQ(told.output, silent.output);
    EXPECT_EQ(told.remarks.rfind(path() + "(1) : warning: ", 0), 0U) << told.remarks;
}

TEST_F(ToolShader, RefusesWhatItCannotDo) {
    EXPECT_EQ(runTool("shader nowhere.cg --entry main --stage vertex").exitCode, 1);
    EXPECT_EQ(runTool("shader . --entry main --stage vertex").exitCode, 1);
    EXPECT_EQ(runTool("shader nowhere.cg --entry main --stage geometry").exitCode, 2);
    EXPECT_EQ(runTool("shader nowhere.cg").exitCode, 2);
}

} // namespace
