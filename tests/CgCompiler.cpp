#include <fixture/FileText.h>
#include <fixture/GlslJudge.h>

#include <Cg/Compiler/Compiler.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

// Programs are data: every file under tests/cg/ names its entries in lines `//! vertex NAME` and
// `//! fragment NAME`. What is to be said about those in tests/cg/errors/ stands beside them in a .listing.

namespace {

namespace fs = std::filesystem;

struct Entry {
    cg::Stage stage;
    std::string name;
};

std::vector<Entry> entriesOf(const std::string& program) {
    std::vector<Entry> entries;
    std::istringstream lines(program);
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string mark;
        std::string stage;
        std::string name;
        words >> mark >> stage >> name;
        if (mark == "//!" && (stage == "vertex" || stage == "fragment"))
            entries.push_back({stage == "vertex" ? cg::Stage::VERTEX : cg::Stage::FRAGMENT, name});
    }
    return entries;
}

cg::CompileResult compile(const std::string& source, const std::string& fileName, const Entry& entry) {
    cg::CompileRequest request;
    request.source = source;
    request.fileName = fileName;
    request.entry = entry.name;
    request.stage = entry.stage;
    request.reader = [](const std::string& path, std::string& text) {
        if (!fs::is_regular_file(path))
            return false;
        text = fileText(path);
        return true;
    };
    return cg::compile(request);
}

cg::CompileResult compileFragment(const std::string& source) {
    return compile(source, "test.cg", {cg::Stage::FRAGMENT, "main"});
}

std::vector<std::string> programsIn(const char* folder) {
    std::vector<std::string> names;
    for (const auto& file : fs::directory_iterator(fs::path(FWZEL_CG_PROGRAMS) / folder))
        if (file.path().extension() == ".cg")
            names.push_back((fs::path(folder) / file.path().stem()).string());
    return names;
}

std::string testName(const testing::TestParamInfo<std::string>& info) {
    return fs::path(info.param).stem().string();
}

class CgPrograms : public testing::TestWithParam<std::string> {};

TEST_P(CgPrograms, BecomeGlslThatASecondJudgeTakes) {
    const fs::path path = fs::path(FWZEL_CG_PROGRAMS) / (GetParam() + ".cg");
    const std::string source = fileText(path);
    const std::vector<Entry> entries = entriesOf(source);
    ASSERT_FALSE(entries.empty());
    for (const Entry& entry : entries) {
        const cg::CompileResult result = compile(source, path.string(), entry);
        ASSERT_TRUE(result.ok) << result.listing;
        EXPECT_EQ("", objectionsTo(result.glsl, entry.stage == cg::Stage::VERTEX ? "vert" : "frag"))
            << result.glsl;
    }
}

INSTANTIATE_TEST_SUITE_P(All, CgPrograms, testing::ValuesIn(programsIn("programs")), testName);

class CgErrors : public testing::TestWithParam<std::string> {};

TEST_P(CgErrors, AreListedWithTheirPlaces) {
    const fs::path program = fs::path(FWZEL_CG_PROGRAMS) / (GetParam() + ".cg");
    const std::string source = fileText(program);
    const cg::CompileResult result = compile(source, program.filename().string(), entriesOf(source).at(0));
    EXPECT_EQ(fileText(fs::path(program).replace_extension(".listing").string()), result.listing);
    const bool isWrong = result.listing.find(" : error: ") != std::string::npos;
    EXPECT_EQ(!isWrong, result.ok);
    EXPECT_EQ(isWrong, result.glsl.empty());
}

INSTANTIATE_TEST_SUITE_P(All, CgErrors, testing::ValuesIn(programsIn("errors")), testName);

/// "name glslName unit state [defaults]" of all leaves and arrays.
void describe(const cg::Parameter& parameter, std::vector<std::string>& out) {
    std::ostringstream text;
    text << parameter.name << " -> " << parameter.glslName;
    if (parameter.textureUnit >= 0)
        text << " unit " << parameter.textureUnit;
    if (!parameter.stateBinding.empty())
        text << " is " << parameter.stateBinding;
    if (!parameter.isReferenced)
        text << " unused";
    for (const float value : parameter.defaults)
        text << ' ' << value;
    if (parameter.variability == cg::ParameterVariability::VARYING)
        text << " : " << parameter.semantic;
    if (parameter.parameterClass != cg::ParameterClass::STRUCT)
        out.push_back(text.str());
    for (const cg::Parameter& child : parameter.children)
        describe(child, out);
}

std::vector<std::string> parametersOf(const std::string& source) {
    const cg::CompileResult result = compileFragment(source);
    EXPECT_TRUE(result.ok) << result.listing;
    std::vector<std::string> lines;
    for (const cg::Parameter& parameter : result.parameters)
        describe(parameter, lines);
    return lines;
}

TEST(CgParameters, HaveTheNamesOfTheSourceAndOfTheUniforms) {
    const std::vector<std::string> wanted = {
        "uv ->  : TEXCOORD0",
        "levels.gain -> levels.gain",
        "levels.map -> levels_map unit 3",
        "levels.taps -> levels.taps",
        "levels.taps[0] -> levels.taps[0]",
        "levels.taps[1] -> levels.taps[1]",
        "sample -> sample_",
        "layers -> ",
        "layers[0].map -> layers_map[0]",
        "layers[1].map -> layers_map[1]",
        "grid -> ",
        "grid[0] -> grid",
        "grid[0][0] -> grid[0]",
        "grid[0][1] -> grid[1]",
        "grid[1] -> ",
        "grid[1][0] -> grid[2]",
        "grid[1][1] -> grid[3]",
        "mvp ->  is state.matrix.mvp",
        "return ->  : COLOR",
        "unused ->  unused",
    };
    EXPECT_EQ(wanted,
              parametersOf("struct Levels { float gain; sampler2D map : TEXUNIT3; float2 taps[2]; };\n"
                           "struct Layer { sampler2D map; };\n"
                           "float unused;\n"
                           "float4 main(float2 uv : TEXCOORD0, uniform Levels levels, uniform float sample,\n"
                           "            Layer layers[2], uniform float grid[2][2],\n"
                           "            uniform float4x4 mvp : state.matrix.mvp) : COLOR {\n"
                           "  return tex2D(levels.map, uv * levels.taps[1]) * levels.gain * sample\n"
                           "    + tex2D(layers[1].map, uv) + grid[1][0] + mvp[0]; }\n"));
}

TEST(CgParameters, HaveTheirDefaultValuesRowByRow) {
    const std::vector<std::string> wanted = {
        "return ->  : COLOR", "gain ->  unused 0.5",    "lift ->  unused 1 2 3",  "m ->  unused 1 2 3 4 5 6",
        "taps ->  unused",    "taps[0] ->  unused 1 2", "taps[1] ->  unused 3 4", "p.a ->  unused 2",
        "p.b ->  unused 4 4", "on ->  unused 1",        "gamma ->  unused 0.25",
    };
    EXPECT_EQ(wanted, parametersOf("struct P { float a; float2 b; };\n"
                                   "float gain = 1.0 / 2; uniform half3 lift = half3(1, 2, 3);\n"
                                   "float2x3 m = { {1, 2, 3}, {4, 5, 6} }; float2 taps[2] = { 1, 2, 3, 4 };\n"
                                   "P p = { 2, float2(4) }; bool on = true; const float two = sqrt(4);\n"
                                   "uniform float gamma = pow(two, -2);\n"
                                   "float4 main() : COLOR { return 1; }\n"));
}

} // namespace
