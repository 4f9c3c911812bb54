#include <fixture/FileText.h>
#include <fixture/GlslJudge.h>

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/ConversionCost.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>
#include <string>
#include <string_view>
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

/// What the compiler knows of a constant's value: a global whose initial value it does not know is no
/// uniform.
struct Constant {
    const char* type;
    const char* expression;
    const char* values; ///< null where it is left to the program
};

constexpr Constant CONSTANTS[] = {
    {"int", "7 / 1", "7"},
    {"int", "7 / 0", nullptr},
    {"int", "7 % 1", "0"},
    {"int", "7 % 0", nullptr},
    {"int4", "int4(6, 6, 6, 6) | int4(0, 1, 2, 8)", "6 7 6 14"},
    {"int", "5 & 0", "0"},
    {"int3", "int3(1 << 33, -8 >> 33, 5 ^ 0)", "2 -4 5"},
    {"int3", "int3(-2147483648.0, -2147483649.0, 4294967295.0)", "-2.14748e+09 0 -1"},
    {"float", "float((uint)4294967295.0)", "4.29497e+09"},
    {"float2", "float2((uint)-1, (uint)4294967295.5)", "4.29497e+09 0"},
    {"int2", "int2((int)4294967295.5, (int)(bool)0.5)", "0 1"},
    {"float4", "float4(2 > 1 && 0, 2 > 1 && 3, 0 || 0, 0 || 2)", "0 1 0 1"},
    {"float4", "float4(!2, !1, !0.0, +true)", "0 0 1 1"},
    {"float4", "true ? float4(1, 2, 3, 4) - 1 : 0", "0 1 2 3"},
    {"float3", "2 > 3 ? float3(1, 1, 1) : 2 * float3(1, 2, 3).zxy", "6 2 4"},
    {"float", "float3(1, 2, 3)[1]", "2"},
    {"float", "TABLE[1][2]", "6"},
    {"float3", "TABLE[1]", "4 5 6"},
    {"float", "TABLE[LAST].x", "4"},
    {"float2x2", "float3x3(1, 2, 3, 4, 5, 6, 7, 8, 9)", "1 2 4 5"},
    {"float2", "(float2)float2x2(1, 2, 3, 4)", "1 2"},
    {"float2x2", "SCALED * 2", "2 4 6 8"},
    {"float2", "mul(SCALED, float2(1, 2))", nullptr},
    {"float2x2", "mul(SCALED, SCALED)", nullptr},
    {"float2x2", "SCALED * SCALED", nullptr},
    {"Nest", "(Nest)0", "0 0 0 0"},
    {"float4", "float4(sign(-0.5), sign(0), sign(0.5), abs(-2.5))", "-1 0 1 2.5"},
    {"float4", "float4(step(1, 1), step(1, 0.5), saturate(-1), saturate(0.25))", "1 0 0 0.25"},
    {"float4", "float4(min(3, 2), round(2.5), rcp(4.0), exp(0))", "2 2 0.25 1"},
    {"float2", "lerp(float2(0, 2), float2(1, 4), 0.5)", "0.5 3"},
    {"float", "dot(float3(1, 2, 3), float3(4, 5, 6))", "32"},
    {"float", "length(float3(2, 3, 6))", "7"},
    {"float3", "normalize(float3(0, 0, 2))", "0 0 1"},
    {"float", "sqrt(ddx(2.0))", nullptr},
    {"float", "1e-50", "0"},
};

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

TEST(CgParameters, AreTheGlobalsWhoseInitialValuesAreKnown) {
    std::string program = "struct Nest { float2x2 m; };\n"
                          "static const float3 TABLE[2] = { { 1, 2, 3 }, { 4, 5, 6 } };\n"
                          "static const int LAST = 1; static const float2x2 SCALED = { 1, 2, 3, 4 };\n";
    std::vector<std::string> wanted = {"return ->  : COLOR"};
    for (const Constant& constant : CONSTANTS) {
        const bool isStruct = std::string_view(constant.type) == "Nest";
        program += std::string(constant.type) + " c" + std::to_string(&constant - CONSTANTS) + " = " +
                   constant.expression + ";\n";
        if (constant.values)
            wanted.push_back("c" + std::to_string(&constant - CONSTANTS) + (isStruct ? ".m" : "") +
                             " ->  unused " + constant.values);
    }
    EXPECT_EQ(wanted, parametersOf(program + "float4 main() : COLOR { return 1; }\n"));
}

/// A constant of the program that is one in GLSL costs nothing at run time; what else GLSL takes as such a
/// value fails to compile.
TEST(CgGlobals, AreConstantsWhereGlslTakesTheirValuesAsSuch) {
    struct Global {
        const char* value;
        bool isConstant;
    };
    constexpr Global GLOBALS[] = {{"-2.0", true},
                                  {"abs(-2.0) + OTHER", true},
                                  {"(1, 2)", false},
                                  {"rcp(4.0)", false},
                                  {"tex2D(s, 0.5).x", false},
                                  {"tex2Dfetch(s, int4(0)).x", false},
                                  {"ddx(2.0)", false},
                                  {"fwidth(2.0)", false},
                                  {"mvp[0].x", false},
                                  {"given", false},
                                  {"made", false},
                                  {"abs(float2x2(1, 2, 3, 4))[0].x", false},
                                  {"made++", false},
                                  {"(made = 2)", false},
                                  {"two()", false},
                                  {"TABLE[1]", true},
                                  {"7.0 * (1 + 2)", true},
                                  {"OTHER > 1 ? 2.0 : 3.0", true},
                                  {"float2(1, 2).y", true}};
    std::string program = "uniform sampler2D s; uniform float4x4 mvp : state.matrix.mvp;\n"
                          "uniform float given; static float made = given; static const float OTHER = 2;\n"
                          "static const float TABLE[2] = { 1, 2 }; float two() { return 2; }\n";
    std::string sum = "0";
    for (const Global& global : GLOBALS) {
        const std::string name = "c" + std::to_string(&global - GLOBALS);
        program += "static const float " + name + " = " + global.value + ";\n";
        sum += " + " + name;
    }
    const cg::CompileResult result =
        compileFragment(program + "float4 main() : COLOR { return " + sum + "; }\n");
    ASSERT_TRUE(result.ok) << result.listing;
    for (const Global& global : GLOBALS)
        EXPECT_EQ(global.isConstant, result.glsl.find("const float c" + std::to_string(&global - GLOBALS) +
                                                      " = ") != std::string::npos)
            << global.value;
}

/// Each constant is made of the one before.
/// @param number  what stands for `#`; `@` is the one before
std::string numbered(const std::string& pattern, int number) {
    std::string text;
    for (const char c : pattern)
        text += c == '#' ? std::to_string(number) : c == '@' ? std::to_string(number - 1) : std::string(1, c);
    return text;
}

TEST(CgDeclarations, ThatLeadToOthersAreBounded) {
    struct Chain {
        const char* first;
        const char* next;
        const char* use;
    };
    const Chain chains[] = {{"float c0;", "static const float c# = c@ + 1;", "return c#;"},
                            {"struct c0 { float a; };", "struct c# { c@ s; };", "c# v; return 1;"},
                            {"typedef float c0;", "typedef c@ c#;", "c# v = 1; return v;"}};
    for (const Chain& chain : chains)
        for (const int length : {200, 30000}) {
            std::string source = chain.first;
            for (int i = 1; i <= length; ++i)
                source += numbered(chain.next, i) + '\n';
            source += "float4 main() : COLOR { " + numbered(chain.use, length) + " }";
            const cg::CompileResult result = compileFragment(source);
            const bool isRefused = result.listing.find(" is nested too deep") != std::string::npos;
            EXPECT_EQ(isRefused, length > 500) << chain.next << '\n' << result.listing.substr(0, 500);
            EXPECT_EQ(result.ok, !isRefused);
        }
}

/// A name means what its innermost scope says, and what it meant before where that ends.
TEST(CgScopes, EndWithWhatTheirNamesMeantBefore) {
    const cg::CompileResult result =
        compileFragment("typedef float T;\n"
                        "float4 main(float4 a : TEXCOORD0) : COLOR {\n"
                        "    float v = a.x;\n"
                        "    { typedef float2 T; T v = a.xy; { float3 v = a.xyz; v.z = 1; a.xyz += v; }\n"
                        "      v.y = 2; a.xy += v; }\n"
                        "    { float4 v = a; v.w = 3; a += v; }\n"
                        "    T w = v;\n"
                        "    for (int i = 0; i < 2; ++i) { }\n"
                        "    { for (int i = 5; i < 7; ++i) { } a.x += i; }\n"
                        "    return a + v + w + i;\n"
                        "}\n");
    EXPECT_TRUE(result.ok) << result.listing;
    EXPECT_NE(result.glsl.find("float w = v;"), std::string::npos) << result.glsl;
    EXPECT_NE(result.glsl.find("vec3 v_3 = a.xyz;"), std::string::npos) << result.glsl;
    EXPECT_NE(result.glsl.find("vec4 v_2 = a;"), std::string::npos) << result.glsl;
}

/// The program is refused for the reason where it has one piece more than it may have.
TEST(CgPrograms, ThatAskForTooMuchAreRefused) {
    struct Growth {
        const char* head;
        const char* piece;
        const char* tail;
        int limit;
        const char* reason;
    };
    const Growth growths[] = {
        {"float f(float a[1]) { return 1; }", "float f(float a[#]);",
         "float4 main() : COLOR { float a[1]; return f(a); }", 256, "more than 256 functions are called 'f'"},
        {"struct S { float a;", "float f(float a[#]) { return 1; }",
         "}; float4 main() : COLOR { S s; s.a = 1; float a[2]; a[0] = 1; return s.f(a); }", 257,
         "more than 256 functions are called 'f'"},
        {"sampler2D t; sampler2D u; float4 main(float2 p : TEXCOORD0) : COLOR { for (int i = 0; i < 2; ++i) "
         "{ }",
         "sampler2D s# = t;", "for (int i = 0; i < 2; ++i) {#} return 1; }", 65,
         "more than 64 samplers are assigned in a loop or a switch"},
    };
    for (const Growth& growth : growths)
        for (const bool isOver : {false, true}) {
            std::string source = growth.head;
            std::string assignments;
            for (int i = 2; i <= growth.limit + (isOver ? 1 : 0); ++i) {
                source += numbered(growth.piece, i) + '\n';
                assignments += numbered("s# = u;", i);
            }
            std::string tail = growth.tail;
            if (const std::size_t place = tail.find('#'); place != std::string::npos)
                tail.replace(place, 1, assignments);
            const cg::CompileResult result = compileFragment(source + tail);
            EXPECT_EQ(result.ok, !isOver) << growth.piece << '\n' << result.listing.substr(0, 500);
            EXPECT_EQ(result.listing.find(growth.reason) != std::string::npos, isOver)
                << result.listing.substr(0, 500);
        }
}

/// A few words ask for more than any driver would take.
TEST(CgPrograms, ThatAreTooLargeWhenWrittenOutAreRefused) {
    std::string zeros = "float4 main() : COLOR { ";
    for (int i = 0; i < 100; ++i)
        zeros += numbered("float z#[60000] = {};\n", i);
    zeros += "return z0[0]; }";
    std::string members = "struct S { ";
    std::string derived = " }; float4 main() : COLOR { ";
    for (int i = 0; i < 3000; ++i) {
        members += numbered("float m#;", i);
        derived += numbered("struct D# : S { float x; }; D# d#;\n", i);
    }
    derived += "return 1; }";
    for (const std::string& source : {zeros, members + derived}) {
        const cg::CompileResult result = compileFragment(source);
        EXPECT_FALSE(result.ok);
        EXPECT_NE(result.listing.find("the program is too large"), std::string::npos)
            << source.substr(0, 100) << '\n'
            << result.listing.substr(0, 500);
    }
}

TEST(CgParameters, OfTheEntryThatAreStaticSamplersAreUniforms) {
    EXPECT_EQ(parametersOf("uniform sampler2D t;\n"
                           "float4 main(static sampler2D s = t, float2 uv : TEXCOORD0) : COLOR {\n"
                           "    return tex2D(s, uv);\n"
                           "}\n")
                  .size(),
              4U);
}

TEST(CgParameters, EndWithChainsOfTooManyConstants) {
    const auto chain = [](int length) {
        std::string program = "static const float a0 = 3;\n";
        for (int i = 1; i < length; ++i)
            program += "static const float a" + std::to_string(i) + " = a" + std::to_string(i - 1) + ";\n";
        program += "float end = a" + std::to_string(length - 1) + ";\n";
        return parametersOf(program + "float4 main() : COLOR { return 1; }\n").size();
    };
    EXPECT_EQ(2U, chain(65));
    EXPECT_EQ(1U, chain(66));
}

/// What it costs to pass a type on as others: which overload a call takes hangs on the sums. `untyped` is a
/// number without a suffix, `-` stands where there is no silent conversion.
struct Costs {
    const char* from;
    const char* to;
};

constexpr Costs COSTS[] = {
    {"bool", "bool 0 int 5 uint 5 fixed 9 half 8 float 7 bool4 20 float4 27"},
    {"int", "bool 12 int 0 uint 2 fixed 5 half 4 float 3"},
    {"uint", "bool 12 int 2 uint 0 fixed 5 half 4 float 3"},
    {"fixed", "bool 12 int 9 uint 10 fixed 0 half 1 float 2"},
    {"half", "bool 12 int 9 uint 10 fixed 6 half 0 float 1"},
    {"float", "bool 12 int 9 uint 10 fixed 7 half 6 float 0 float2 20 float1x2 50 float2x2 50 sampler2D -"},
    {"untyped", "fixed 2 half 1 float 0"},
    {"float4", "float 45 float2 42 float3 41 half3 47 float4 0 float4x1 30 float1x3 71 float2x2 -"},
    {"float3", "float4 - float4x1 -"},
    {"float1x3", "float 45 float2 71 float3 30 float1x2 40 float2x1 - half1x3 6"},
    {"float2x3", "float - float3 - float2x2 40 float1x3 40 float2x3 0 float3x3 - float2x4 - half2x3 6"},
    {"sampler", "sampler2D 1 samplerCUBE 1"},
    {"sampler2D", "sampler 1 sampler2DShadow 1 sampler1D - float -"},
    {"float4[2]",
     "float4[2] 0 float4[] 0 float4[3] - half4[2] 6 int4[2] - float3[2] - float1x4[2] 30 float4 -"},
    {"sampler2D[2]", "sampler[2] 1 sampler3D[2] -"},
    {"float[2][3]", "float[2][3] 0 half[2][3] 6 float[2][4] -"},
};

/// The type of a name with dimensions behind it.
const cg::Type* typeNamed(cg::TypeTable& types, const std::string& name) {
    const size_t bracket = name.rfind('[');
    if (bracket == std::string::npos)
        return types.find(name);
    const std::string length = name.substr(bracket + 1, name.size() - bracket - 2);
    return types.array(typeNamed(types, name.substr(0, bracket)),
                       length.empty() ? cg::Type::UNSIZED : std::stoi(length));
}

TEST(CgConversions, CostWhatChoosesAmongOverloads) {
    cg::Arena arena;
    cg::TypeTable types(arena);
    for (const Costs& costs : COSTS) {
        const bool isUntyped = std::string_view(costs.from) == "untyped";
        cg::TypedExpr from(cg::TypedExpr::Kind::LITERAL, {},
                           typeNamed(types, isUntyped ? "float" : costs.from));
        from.isUntyped = isUntyped;
        std::istringstream wanted(costs.to);
        for (std::string to, cost; wanted >> to >> cost;) {
            const int found = cg::conversionCost(&from, typeNamed(types, to));
            EXPECT_EQ(cost, found == cg::IMPOSSIBLE_CONVERSION ? "-" : std::to_string(found))
                << costs.from << " to " << to;
        }
    }
}

struct Passed {
    const char* parameter;
    const char* argument;
    bool isDirect; ///< GLSL writes to the argument itself
};

const Passed PASSED[] = {
    {"float4", "float4", true},    {"float4", "half4", true},  {"fixed", "float", true},
    {"half3x3", "float3x3", true}, {"int4", "float4", false},  {"float", "int", false},
    {"float3", "float1x3", false}, {"float", "float3", false}, {"float2x2", "int2x2", true},
};

std::string programThatPasses(const std::string& argument, const std::string& parameter) {
    return "void f(inout " + parameter + " v) { v = v; } float4 main() : COLOR { " + argument + " a = (" +
           argument + ")1; f(a); return 1; }";
}

TEST(CgOutArguments, AreWrittenByWayOfAnotherVariableOnlyWhereGlslAsksForIt) {
    for (const Passed& passed : PASSED) {
        const cg::CompileResult result =
            compileFragment(programThatPasses(passed.argument, passed.parameter));
        ASSERT_TRUE(result.ok) << passed.argument << '\n' << result.listing;
        EXPECT_EQ(passed.isDirect, result.glsl.find("f(a)") != std::string::npos) << passed.argument << '\n'
                                                                                  << result.glsl;
    }
}

struct LookUp {
    const char* sampler;
    const char* call;
    const char* glsl;
};

const LookUp LOOK_UPS[] = {
    {"picture", "tex2D(picture, c)", "texture(picture, c.xy)"},
    {"picture", "tex2Dproj(picture, c)", "textureProj(picture, c)"},
    {"shadowMap", "tex2Dproj(shadowMap, c)", "shadow2DProj(shadowMap, c)"},
    {"picture", "tex2Dlod(picture, float4(c.xy * 2, 0, 3))", "textureLod(picture, c.xy * 2.0, 3.0)"},
};

TEST(CgLookUps, TakeAFourthCoordinateForWhatTheFunctionDoesWithIt) {
    for (const LookUp& lookUp : LOOK_UPS) {
        const cg::CompileResult result =
            compileFragment("sampler2D " + std::string(lookUp.sampler) +
                            "; float4 main(float4 c : COLOR) : COLOR { return " + lookUp.call + "; }");
        EXPECT_NE(result.glsl.find(lookUp.glsl), std::string::npos) << result.listing << result.glsl;
    }
}

} // namespace
