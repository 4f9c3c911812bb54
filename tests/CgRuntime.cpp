#include <fixture/CgTest.h>
#include <fixture/FloatCanvas.h>
#include <fixture/SwappedEntryPoint.h>
#include <fixture/TemporaryFile.h>

#include <sys/stat.h>

#include <filesystem>
#include <functional>
#include <random>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace {

const char* const SOURCE = R"(struct Level { float gain; float3 lift; };
struct Tap { float2 at; float weight; };
float3 tint = { 0.25, 0.5, 0.75 };
uniform float4 plain;

float4 everything(float2 at : TEXCOORD0,
                  uniform Level levels,
                  uniform Tap taps[3],
                  uniform float4x4 colours,
                  uniform float3x4 affine,
                  uniform int count,
                  uniform bool isOn,
                  uniform half3 soft = half3(1, 2, 3),
                  uniform float curve[4],
                  uniform float4 unused,
                  uniform sampler2D picture : TEXUNIT2,
                  uniform sampler3D table) : COLOR
{
    float4 sum = tex2D(picture, at) + tex3D(table, float3(at, 0)) + plain;
    sum += mul(colours, float4(at, 0, 1));
    sum.rgb += mul(affine, sum) + soft + tint + levels.gain * levels.lift;
    for (int i = 0; i < 3; i++)
        sum.r += taps[i].weight * taps[i].at.x + curve[i];
    return isOn ? sum : sum * count;
}

float4 showFour(uniform float4 value) : COLOR { return value; }
float4 showTwo(uniform float2 value) : COLOR { return float4(value, 0.5, 1); }
float4 showInts(uniform int3 value) : COLOR { return float4(value / 2, 1); }
float4 showBool(uniform bool value) : COLOR { return value ? float4(1, 0, 0, 1) : float4(0, 1, 0, 1); }
float4 showTint() : COLOR { return float4(tint, 1); }
float4 showRow(uniform float4x4 value) : COLOR { return value[1]; }
float4 showWide(uniform float2x3 value) : COLOR { return float4(mul(value, float3(1, 2, 3)), 0, 1); }
float4 showArray(uniform float2 value[3]) : COLOR { return float4(value[1], value[2]); }
float4 showMatrices(uniform float2x2 value[2]) : COLOR { return float4(value[1][0], value[1][1]); }
float4 showTap(uniform Tap taps[2]) : COLOR { return float4(taps[0].at, taps[1].weight, 1); }
float4 showTexture(uniform sampler2D picture) : COLOR { return tex2D(picture, float2(0.5, 0.5)); }
float4 showTextures(uniform sampler2D first, uniform sampler2D second : TEXUNIT0) : COLOR
{
    return tex2D(first, float2(0.5, 0.5)) + 10 * tex2D(second, float2(0.5, 0.5));
}

struct Vertex { float4 position : POSITION; float4 colour : COLOR; };

Vertex colourIt(float4 position : POSITION, uniform float4 value)
{
    Vertex vertex = { position, value };
    return vertex;
}

Vertex fetchIt(float4 position : POSITION, uniform sampler2D picture)
{
    Vertex vertex = { position, tex2Dlod(picture, float4(0.5, 0.5, 0, 0)) };
    return vertex;
}
)";

GLuint solidTexture(const Pixel& colour) {
    GLuint texture = 0;
    glGenTextures(1, &texture);
    glBindTexture(GL_TEXTURE_2D, texture);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, 1, 1, 0, GL_RGBA, GL_FLOAT, colour.data());
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
    glBindTexture(GL_TEXTURE_2D, 0);
    return texture;
}

GLint stateOf(GLenum name) {
    GLint value = -1;
    glGetIntegerv(name, &value);
    return value;
}

class CgRuntime : public CgTest {
protected:
    CGprogram make(const char* entry, CGprofile profile = CG_PROFILE_GLSLF) {
        CGprogram program = cgCreateProgram(mContext, CG_SOURCE, SOURCE, profile, entry, nullptr);
        EXPECT_TRUE(program) << cgGetLastListing(mContext);
        cgGLLoadProgram(program);
        return program;
    }

    /// The program as the one that draws.
    CGprogram use(const char* entry, CGprofile profile = CG_PROFILE_GLSLF) {
        CGprogram program = make(entry, profile);
        cgGLEnableProfile(profile);
        cgGLBindProgram(program);
        return program;
    }
};

TEST(CgErrors, EachHasATextOfItsOwn) {
    std::set<std::string> texts;
    for (int error = CG_NO_ERROR; error <= CG_OUT_OF_ARRAY_BOUNDS_ERROR; ++error)
        texts.insert(cgGetErrorString(static_cast<CGerror>(error)));
    EXPECT_EQ(texts.size(), size_t{CG_OUT_OF_ARRAY_BOUNDS_ERROR} + 1);
    EXPECT_EQ(texts.count("unknown error"), 0U);
    EXPECT_STREQ(cgGetErrorString(static_cast<CGerror>(CG_OUT_OF_ARRAY_BOUNDS_ERROR + 1)), "unknown error");
}

TEST_F(CgRuntime, ReadingTheErrorClearsItAndNothingElseDoes) {
    cgGLEnableProfile(CG_PROFILE_ARBVP1);
    cgDestroyProgram(nullptr);
    CGcontext other = cgCreateContext();
    EXPECT_EQ(cgGetNamedParameter(make("showFour"), "nothing"), nullptr);
    CGerror error = CG_NO_ERROR;
    EXPECT_STREQ(cgGetLastErrorString(&error), cgGetErrorString(CG_INVALID_PROGRAM_HANDLE_ERROR));
    EXPECT_EQ(error, CG_INVALID_PROGRAM_HANDLE_ERROR);
    EXPECT_EQ(cgGetLastErrorString(&error), nullptr);
    EXPECT_EQ(error, CG_NO_ERROR);
    cgDestroyContext(other);
}

constexpr float SIXTEEN[16] = {};

bool isEmpty(const char* text) {
    return *text == '\0';
}

// What does nothing on an invalid handle: each tells whether it gave what it gives then.
const std::vector<std::function<bool(CGcontext)>> ON_CONTEXT = {
    [](CGcontext c) { return cgDestroyContext(c), true; },
    [](CGcontext c) { return cgGetLastListing(c) != nullptr; },
    [](CGcontext c) { return cgGLSetManageTextureParameters(c, CG_TRUE), true; },
    [](CGcontext c) { return !cgCreateProgram(c, CG_SOURCE, SOURCE, CG_PROFILE_GLSLF, "showFour", nullptr); },
    [](CGcontext c) {
        return !cgCreateProgramFromFile(c, CG_SOURCE, "x.cg", CG_PROFILE_GLSLF, "showFour", nullptr);
    },
};
const std::vector<std::function<bool(CGprogram)>> ON_PROGRAM = {
    [](CGprogram p) { return cgDestroyProgram(p), true; },
    [](CGprogram p) { return !cgIsProgramCompiled(p); },
    [](CGprogram p) { return isEmpty(cgGetProgramString(p, CG_COMPILED_PROGRAM)); },
    [](CGprogram p) { return cgGetProgramProfile(p) == CG_PROFILE_UNKNOWN; },
    [](CGprogram p) { return !cgGetNamedParameter(p, "value"); },
    [](CGprogram p) { return !cgGetFirstParameter(p, CG_PROGRAM); },
    [](CGprogram p) { return cgGLLoadProgram(p), true; },
    [](CGprogram p) { return !cgGLIsProgramLoaded(p); },
    [](CGprogram p) { return cgGLBindProgram(p), true; },
};
const std::vector<std::function<bool(CGparameter)>> ON_PARAMETER = {
    [](CGparameter p) { return !cgGetNextParameter(p); },
    [](CGparameter p) { return !cgGetFirstStructParameter(p); },
    [](CGparameter p) { return !cgGetArrayParameter(p, 0); },
    [](CGparameter p) { return isEmpty(cgGetParameterName(p)); },
    [](CGparameter p) { return cgGetParameterType(p) == CG_UNKNOWN_TYPE; },
    [](CGparameter p) { return cgGetParameterRows(p) == 0 && cgGetParameterColumns(p) == 0; },
    [](CGparameter p) { return cgGetArrayDimension(p) == 0; },
    [](CGparameter p) { return cgGetArraySize(p, 0) == -1; },
    [](CGparameter p) { return isEmpty(cgGetParameterSemantic(p)); },
    [](CGparameter p) { return cgGetParameterVariability(p) == CG_ERROR; },
    [](CGparameter p) { return cgGetParameterDirection(p) == CG_ERROR; },
    [](CGparameter p) { return !cgIsParameterReferenced(p); },
    [](CGparameter p) {
        float received = 7;
        return cgGetParameterDefaultValuefr(p, 1, &received) == 0 && received == 7;
    },
    [](CGparameter p) { return cgGLSetParameter1f(p, 1), true; },
    [](CGparameter p) { return cgGLSetParameter4fv(p, SIXTEEN), true; },
    [](CGparameter p) { return cgGLSetMatrixParameterfr(p, SIXTEEN), true; },
    [](CGparameter p) { return cgGLSetParameterArray1f(p, 0, 1, SIXTEEN), true; },
    [](CGparameter p) { return cgGLSetMatrixParameterArrayfc(p, 0, 1, SIXTEEN), true; },
    [](CGparameter p) { return cgGLSetTextureParameter(p, 1), true; },
    [](CGparameter p) { return cgGLEnableTextureParameter(p), true; },
    [](CGparameter p) { return cgGLDisableTextureParameter(p), true; },
    [](CGparameter p) { return cgGLGetTextureEnum(p) == 0; },
};

TEST_F(CgRuntime, AnInvalidHandleSetsTheErrorAndDoesNothing) {
    CGcontext goneContext = cgCreateContext();
    CGprogram goneProgram =
        cgCreateProgram(goneContext, CG_SOURCE, SOURCE, CG_PROFILE_GLSLF, "showFour", nullptr);
    CGparameter goneParameter = cgGetNamedParameter(goneProgram, "value");
    ASSERT_TRUE(goneParameter);
    cgDestroyContext(goneContext);
    int anything = 0;
    void* const foreign = &anything;

    const auto check = [](const auto& operations, auto handles, CGerror error) {
        for (size_t operation = 0; operation < operations.size(); ++operation)
            for (size_t handle = 0; handle < handles.size(); ++handle) {
                EXPECT_TRUE(operations[operation](handles[handle])) << operation << ' ' << handle;
                EXPECT_EQ(cgGetError(), error) << operation << ' ' << handle;
            }
    };
    check(ON_CONTEXT, std::vector<CGcontext>{nullptr, goneContext, static_cast<CGcontext>(foreign)},
          CG_INVALID_CONTEXT_HANDLE_ERROR);
    check(ON_PROGRAM,
          std::vector<CGprogram>{nullptr, goneProgram, static_cast<CGprogram>(foreign),
                                 reinterpret_cast<CGprogram>(mContext)},
          CG_INVALID_PROGRAM_HANDLE_ERROR);
    check(ON_PARAMETER,
          std::vector<CGparameter>{nullptr, goneParameter, static_cast<CGparameter>(foreign),
                                   reinterpret_cast<CGparameter>(make("showFour"))},
          CG_INVALID_PARAM_HANDLE_ERROR);
    EXPECT_FALSE(cgIsContext(goneContext));
    EXPECT_FALSE(cgIsProgram(goneProgram));
    EXPECT_FALSE(cgIsParameter(goneParameter));
}

TEST_F(CgRuntime, WhatDoesNotCompileIsNullWithAListing) {
    const TemporaryFile broken("broken.cg", bytesOf("float4 main() : COLOR\n{\n    return missing;\n}\n"));
    const std::string place = broken.path() + "(3) : error: ";
    const TemporaryFile endless("endless.cg", bytesOf("#include \"/dev/zero\"\n"));
    const TemporaryFile blocking("blocking.cg", bytesOf("#include \"pipe\"\n"));
    const std::string pipe = std::filesystem::path(blocking.path()).replace_filename("pipe");
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0); // that nobody writes to
    const TemporaryFile large("large.cg", bytesOf("//"));
    std::filesystem::resize_file(large.path(), (16 << 20) + 1);
    struct Case {
        const char* file;
        const char* entry;
        CGprofile profile;
        CGerror error;
        const char* listing;
    };
    const std::vector<Case> cases = {
        {broken.path().c_str(), nullptr, CG_PROFILE_GLSLF, CG_COMPILER_ERROR, place.c_str()},
        {broken.path().c_str(), "other", CG_PROFILE_GLSLF, CG_COMPILER_ERROR, "other"},
        {endless.path().c_str(), nullptr, CG_PROFILE_GLSLF, CG_COMPILER_ERROR,
         "cannot open the included file"},
        {blocking.path().c_str(), nullptr, CG_PROFILE_GLSLF, CG_COMPILER_ERROR,
         "cannot open the included file"},
        {large.path().c_str(), nullptr, CG_PROFILE_GLSLF, CG_FILE_READ_ERROR, "File too large"},
        {"not/there.cg", "main", CG_PROFILE_GLSLF, CG_FILE_READ_ERROR, "not/there.cg"},
        {".", "main", CG_PROFILE_GLSLF, CG_FILE_READ_ERROR, "."},
    };
    for (const Case& one : cases) {
        EXPECT_FALSE(cgCreateProgramFromFile(mContext, CG_SOURCE, one.file, one.profile, one.entry, nullptr));
        EXPECT_EQ(cgGetError(), one.error) << one.file;
        EXPECT_NE(std::string(cgGetLastListing(mContext)).find(one.listing), std::string::npos)
            << cgGetLastListing(mContext);
    }
    const std::string last = cgGetLastListing(mContext);
    CGcontext fresh = cgCreateContext();
    EXPECT_EQ(cgGetLastListing(fresh), last);
    cgDestroyContext(fresh);

    EXPECT_FALSE(cgCreateProgram(mContext, CG_SOURCE, SOURCE, CG_PROFILE_ARBFP1, "showFour", nullptr));
    EXPECT_EQ(cgGetError(), CG_UNKNOWN_PROFILE_ERROR);
    EXPECT_FALSE(cgCreateProgram(mContext, CG_PROGRAM, SOURCE, CG_PROFILE_GLSLF, "showFour", nullptr));
    EXPECT_EQ(cgGetError(), CG_INVALID_ENUMERANT_ERROR);
    make("showFour");
    EXPECT_STREQ(cgGetLastListing(mContext), "");
}

TEST_F(CgRuntime, TheDriversRefusalIsACompilerErrorWithItsLog) {
    const SwappedEntryPoint refused(
        "glCreateShaderProgramv", epoxy_glCreateShaderProgramv, +[](GLenum, GLsizei, const GLchar* const*) {
            const char* const text = "#version 330 compatibility\nvoid main() { nonsense; }\n";
            const GLuint shader = glCreateShader(GL_FRAGMENT_SHADER);
            glShaderSource(shader, 1, &text, nullptr);
            glCompileShader(shader);
            const GLuint program = glCreateProgram();
            glAttachShader(program, shader);
            glLinkProgram(program);
            glDeleteShader(shader);
            return program;
        });
    EXPECT_FALSE(cgCreateProgram(mContext, CG_SOURCE, SOURCE, CG_PROFILE_GLSLF, "showFour", nullptr));
    EXPECT_EQ(cgGetError(), CG_COMPILER_ERROR);
    EXPECT_NE(
        std::string(cgGetLastListing(mContext)).find("error: OpenGL does not take the GLSL of \"showFour\""),
        std::string::npos)
        << cgGetLastListing(mContext);
}

TEST_F(CgRuntime, ArgumentsDefineMacrosAndIncludeFolders) {
    const char* args[] = {"-DGAIN=float4(1, 2, 3, 4)", "-DHAS_GAIN", "-O3", nullptr};
    CGprogram program =
        cgCreateProgram(mContext, CG_SOURCE, "#if HAS_GAIN\nfloat4 main() : COLOR { return GAIN; }\n#endif\n",
                        CG_PROFILE_GLSLF, nullptr, args);
    ASSERT_TRUE(program) << cgGetLastListing(mContext);
    EXPECT_STREQ(cgGetProgramString(program, CG_PROGRAM_ENTRY), "main");
    EXPECT_STREQ(cgGetProgramString(program, CG_PROGRAM_PROFILE), "glslf");
    EXPECT_EQ(std::string(cgGetProgramString(program, CG_COMPILED_PROGRAM)).rfind("#version", 0), 0U);
    cgGLLoadProgram(program);
    cgGLBindProgram(program);
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(FloatCanvas(1, 1).drawnPixel(), (Pixel{1, 2, 3, 4}));
}

TEST_F(CgRuntime, ParametersAreDescribedAsTheSourceHasThem) {
    CGprogram program = make("everything");
    struct Case {
        const char* name;
        CGtype type;
        int rows;
        int columns;
        int arraySize;
        const char* semantic;
        CGenum variability;
        bool isReferenced;
    };
    const std::vector<Case> cases = {
        {"at", CG_FLOAT2, 1, 2, -1, "TEXCOORD0", CG_VARYING, true},
        {"levels", CG_STRUCT, 0, 0, -1, "", CG_UNIFORM, true},
        {"levels.gain", CG_FLOAT, 1, 1, -1, "", CG_UNIFORM, true},
        {"levels.lift", CG_FLOAT3, 1, 3, -1, "", CG_UNIFORM, true},
        {"taps", CG_ARRAY, 0, 0, 3, "", CG_UNIFORM, true},
        {"taps[2]", CG_STRUCT, 0, 0, -1, "", CG_UNIFORM, true},
        {"taps[2].weight", CG_FLOAT, 1, 1, -1, "", CG_UNIFORM, true},
        {"colours", CG_FLOAT4x4, 4, 4, -1, "", CG_UNIFORM, true},
        {"affine", CG_FLOAT3x4, 3, 4, -1, "", CG_UNIFORM, true},
        {"count", CG_INT, 1, 1, -1, "", CG_UNIFORM, true},
        {"isOn", CG_BOOL, 1, 1, -1, "", CG_UNIFORM, true},
        {"soft", CG_HALF3, 1, 3, -1, "", CG_UNIFORM, true},
        {"curve", CG_ARRAY, 1, 1, 4, "", CG_UNIFORM, true},
        {"curve[3]", CG_FLOAT, 1, 1, -1, "", CG_UNIFORM, true},
        {"unused", CG_FLOAT4, 1, 4, -1, "", CG_UNIFORM, false},
        {"picture", CG_SAMPLER2D, 0, 0, -1, "TEXUNIT2", CG_UNIFORM, true},
        {"table", CG_SAMPLER3D, 0, 0, -1, "", CG_UNIFORM, true},
        {"tint", CG_FLOAT3, 1, 3, -1, "", CG_UNIFORM, true},
    };
    for (const Case& one : cases) {
        CGparameter parameter = cgGetNamedParameter(program, one.name);
        ASSERT_TRUE(parameter) << one.name;
        EXPECT_EQ(cgGetNamedParameter(program, one.name), parameter) << one.name;
        EXPECT_STREQ(cgGetParameterName(parameter), one.name);
        EXPECT_STREQ(cgGetTypeString(cgGetParameterType(parameter)), cgGetTypeString(one.type)) << one.name;
        EXPECT_EQ(cgGetParameterRows(parameter), one.rows) << one.name;
        EXPECT_EQ(cgGetParameterColumns(parameter), one.columns) << one.name;
        if (one.arraySize >= 0) {
            EXPECT_EQ(cgGetArraySize(parameter, 0), one.arraySize) << one.name;
        }
        EXPECT_STREQ(cgGetParameterSemantic(parameter), one.semantic) << one.name;
        EXPECT_EQ(cgGetParameterVariability(parameter), one.variability) << one.name;
        EXPECT_EQ(cgGetParameterDirection(parameter), CG_IN) << one.name;
        EXPECT_EQ(cgIsParameterReferenced(parameter) != CG_FALSE, one.isReferenced) << one.name;
    }
    for (const char* name : {"nothing", "", "taps[3]", "levels.", "Levels", "curve[0"})
        EXPECT_FALSE(cgGetNamedParameter(program, name)) << name;
    EXPECT_FALSE(cgGetNamedParameter(program, nullptr));
}

TEST_F(CgRuntime, ParametersAreWalkedInTheOrderOfTheSource) {
    CGprogram program = make("everything");
    const auto namesFrom = [](CGparameter parameter) {
        std::string names;
        for (; parameter; parameter = cgGetNextParameter(parameter))
            names += std::string(names.empty() ? "" : " ") + cgGetParameterName(parameter);
        return names;
    };
    const std::string own = "at levels taps colours affine count isOn soft curve unused picture table";
    EXPECT_EQ(namesFrom(cgGetFirstParameter(program, CG_PROGRAM)).compare(0, own.size(), own), 0)
        << namesFrom(cgGetFirstParameter(program, CG_PROGRAM));
    EXPECT_EQ(namesFrom(cgGetFirstParameter(program, CG_GLOBAL)), "tint plain");
    CGparameter taps = cgGetNamedParameter(program, "taps");
    EXPECT_EQ(namesFrom(cgGetFirstStructParameter(cgGetArrayParameter(taps, 1))),
              "taps[1].at taps[1].weight");
    EXPECT_EQ(cgGetArrayDimension(taps), 1);
    EXPECT_FALSE(cgGetFirstStructParameter(taps));

    EXPECT_FALSE(cgGetArrayParameter(taps, 3));
    EXPECT_EQ(cgGetError(), CG_OUT_OF_ARRAY_BOUNDS_ERROR);
    EXPECT_EQ(cgGetArraySize(taps, 1), -1);
    EXPECT_EQ(cgGetError(), CG_INVALID_DIMENSION_ERROR);
    EXPECT_EQ(cgGetArraySize(cgGetNamedParameter(program, "count"), 0), -1);
    EXPECT_EQ(cgGetError(), CG_ARRAY_PARAM_ERROR);
    EXPECT_FALSE(cgGetFirstParameter(program, CG_SOURCE));
    EXPECT_EQ(cgGetError(), CG_INVALID_ENUMERANT_ERROR);
}

TEST_F(CgRuntime, DefaultsAreReadAndDrawn) {
    CGprogram program = make("everything");
    float values[4] = {7, 7, 7, 7};
    EXPECT_EQ(cgGetParameterDefaultValuefr(cgGetNamedParameter(program, "soft"), 2, values), 2);
    EXPECT_EQ(Pixel({values[0], values[1], values[2], values[3]}), (Pixel{1, 2, 7, 7}));
    EXPECT_EQ(cgGetParameterDefaultValuefr(cgGetNamedParameter(program, "plain"), 4, values), 0);
    use("showTint");
    EXPECT_EQ(FloatCanvas(1, 1).drawnPixel(), (Pixel{0.25F, 0.5F, 0.75F, 1}));
}

using Values = std::vector<float>;
using Set = std::function<void(CGparameter)>;

Set numbers(Values v) {
    return [v = std::move(v)](CGparameter p) {
        switch (v.size()) {
        case 1:
            return cgGLSetParameter1f(p, v[0]);
        case 2:
            return cgGLSetParameter2f(p, v[0], v[1]);
        case 3:
            return cgGLSetParameter3f(p, v[0], v[1], v[2]);
        default:
            return cgGLSetParameter4f(p, v.at(0), v.at(1), v.at(2), v.at(3));
        }
    };
}

Set matrix(void (*set)(CGparameter, const float*), Values v) {
    return [set, v = std::move(v)](CGparameter p) { set(p, v.data()); };
}

Set elements(void (*set)(CGparameter, long, long, const float*), long offset, long count, Values v) {
    return [=](CGparameter p) { set(p, offset, count, v.data()); };
}

TEST_F(CgRuntime, SettersFitTheirValuesToTheParameter) {
    const Values rows = {0, 0, 0, 0, 1, 2, 3, 4, 0, 0, 0, 0, 0, 0, 0, 0};
    const Values columns = {0, 1, 0, 0, 0, 2, 0, 0, 0, 3, 0, 0, 0, 4, 0, 0};
    struct Case {
        const char* entry;
        const char* parameter;
        Set set;
        Pixel pixel;
    };
    const std::vector<Case> cases = {
        {"showFour", "value", numbers({1, 2, 3, 4}), {1, 2, 3, 4}},
        {"showFour", "value", numbers({1, 2, 3}), {1, 2, 3, 0}},
        {"showFour", "value", numbers({1}), {1, 0, 0, 0}},
        {"showTwo", "value", numbers({1, 2, 3, 4}), {1, 2, 0.5F, 1}},
        {"showTwo", "value", numbers({1, 2}), {1, 2, 0.5F, 1}},
        {"showInts", "value", numbers({5, -4.9F, 1e30F}), {2, -2, 1073741824, 1}},
        {"showBool", "value", numbers({0.25F}), {1, 0, 0, 1}},
        {"showBool", "value", numbers({0}), {0, 1, 0, 1}},
        {"showRow", "value", matrix(cgGLSetMatrixParameterfr, rows), {1, 2, 3, 4}},
        {"showRow", "value", matrix(cgGLSetMatrixParameterfc, columns), {1, 2, 3, 4}},
        {"showWide", "value", matrix(cgGLSetMatrixParameterfr, {1, 0, 0, 0, 1, 1}), {1, 5, 0, 1}},
        {"showWide", "value", matrix(cgGLSetMatrixParameterfc, {1, 0, 0, 1, 0, 1}), {1, 5, 0, 1}},
        {"showArray", "value", elements(cgGLSetParameterArray2f, 0, 0, {9, 9, 1, 2, 3, 4}), {1, 2, 3, 4}},
        {"showArray", "value", elements(cgGLSetParameterArray4f, 2, 1, {3, 4, 9, 9}), {0, 0, 3, 4}},
        {"showArray", "value[2]", numbers({3, 4}), {0, 0, 3, 4}},
        {"showMatrices", "value", elements(cgGLSetMatrixParameterArrayfc, 1, 1, {1, 3, 2, 4}), {1, 2, 3, 4}},
        {"showTap", "taps[1].weight", numbers({5}), {0, 0, 5, 1}},
    };
    FloatCanvas canvas(1, 1);
    for (const Case& one : cases) {
        SCOPED_TRACE(std::string(one.entry) + ' ' + one.parameter);
        // Set before it is bound and before its profile is enabled.
        CGprogram program = make(one.entry);
        one.set(cgGetNamedParameter(program, one.parameter));
        cgGLBindProgram(program);
        cgGLEnableProfile(CG_PROFILE_GLSLF);
        EXPECT_EQ(canvas.drawnPixel(), one.pixel);
        EXPECT_EQ(cgGetError(), CG_NO_ERROR);
        cgDestroyProgram(program);
    }
    cgGLSetParameter1f(cgGetNamedParameter(make("everything"), "unused"), 5);
    EXPECT_EQ(cgGetError(), CG_NO_ERROR) << "a parameter without a uniform";
}

TEST_F(CgRuntime, SettersThatDoNotApplySetTheError) {
    CGprogram program = make("everything");
    const float values[16] = {};
    const auto named = [&](const char* name) { return cgGetNamedParameter(program, name); };
    const std::vector<std::pair<CGerror, std::function<void()>>> cases = {
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameter1f(named("levels"), 1); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameter1f(named("curve"), 1); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameter1f(named("picture"), 1); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameter1f(named("at"), 1); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameter4fv(named("unused"), nullptr); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetMatrixParameterfr(named("colours"), nullptr); }},
        {CG_NOT_MATRIX_PARAM_ERROR, [&] { cgGLSetMatrixParameterfr(named("unused"), values); }},
        {CG_NOT_MATRIX_PARAM_ERROR, [&] { cgGLSetMatrixParameterArrayfr(named("curve"), 0, 0, values); }},
        {CG_ARRAY_PARAM_ERROR, [&] { cgGLSetParameterArray1f(named("unused"), 0, 1, values); }},
        {CG_OUT_OF_ARRAY_BOUNDS_ERROR, [&] { cgGLSetParameterArray1f(named("curve"), 1, 4, values); }},
        {CG_OUT_OF_ARRAY_BOUNDS_ERROR, [&] { cgGLSetParameterArray1f(named("curve"), -1, 1, values); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetParameterArray1f(named("taps"), 0, 1, values); }},
        {CG_INVALID_PARAMETER_ERROR, [&] { cgGLSetTextureParameter(named("unused"), 1); }},
        {CG_INVALID_PROFILE_ERROR, [&] { cgGLDisableProfile(CG_PROFILE_VP40); }},
        {CG_INVALID_PROFILE_ERROR, [&] { cgGLSetOptimalOptions(CG_PROFILE_UNKNOWN); }},
        {CG_INVALID_ENUMERANT_ERROR, [&] { cgGLGetLatestProfile(static_cast<CGGLenum>(10)); }},
        {CG_INVALID_ENUMERANT_ERROR, [&] { cgGetProgramString(program, CG_GLOBAL); }},
    };
    for (size_t i = 0; i < cases.size(); ++i) {
        cases[i].second();
        EXPECT_EQ(cgGetError(), cases[i].first) << i;
    }
    CGprogram notLoaded = cgCreateProgram(mContext, CG_SOURCE, SOURCE, CG_PROFILE_GLSLF, "showFour", nullptr);
    cgGLBindProgram(notLoaded);
    EXPECT_EQ(cgGetError(), CG_PROGRAM_NOT_LOADED_ERROR);
}

TEST_F(CgRuntime, EachProgramKeepsItsValuesAndEqualNamesAreSeparate) {
    CGprogram fragment = use("showFour");
    CGprogram other = make("showFour");
    CGprogram vertex = use("colourIt", CG_PROFILE_GLSLV);
    cgGLSetParameter4f(cgGetNamedParameter(fragment, "value"), 1, 2, 3, 4);
    cgGLSetParameter4f(cgGetNamedParameter(other, "value"), 5, 6, 7, 8);
    cgGLSetParameter4f(cgGetNamedParameter(vertex, "value"), 0.25F, 0.5F, 0.75F, 1);
    FloatCanvas canvas(1, 1);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{1, 2, 3, 4}));
    cgGLBindProgram(other);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{5, 6, 7, 8}));
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{0.25F, 0.5F, 0.75F, 1}));
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    cgGLBindProgram(fragment);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{1, 2, 3, 4}));
}

TEST_F(CgRuntime, AStageWithoutAProgramIsFixedFunction) {
    const Pixel fixed = {0.5F, 0.25F, 1, 1};
    const Pixel programs = {1, 2, 3, 4};
    glColor4fv(fixed.data());
    FloatCanvas canvas(1, 1);
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    cgGLEnableProfile(CG_PROFILE_GLSLV);
    EXPECT_EQ(canvas.drawnPixel(), fixed) << "enabled, nothing bound";
    CGprogram program = use("showFour");
    cgGLSetParameter4fv(cgGetNamedParameter(program, "value"), programs.data());
    EXPECT_EQ(canvas.drawnPixel(), programs) << "enabled and bound";
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(canvas.drawnPixel(), fixed) << "bound, not enabled";
    EXPECT_EQ(stateOf(GL_PROGRAM_PIPELINE_BINDING), 0);
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(canvas.drawnPixel(), programs) << "enabled again";
    cgGLUnbindProgram(CG_PROFILE_GLSLF);
    EXPECT_EQ(canvas.drawnPixel(), fixed) << "unbound";
    cgGLBindProgram(program);
    EXPECT_EQ(canvas.drawnPixel(), programs) << "bound again";
    cgDestroyProgram(program);
    EXPECT_EQ(canvas.drawnPixel(), fixed) << "destroyed";
    EXPECT_EQ(stateOf(GL_PROGRAM_PIPELINE_BINDING), 0);
    glColor4f(1, 1, 1, 1);
}

TEST_F(CgRuntime, ThePairsOfAProcessMayHaveAnyNumberOfVaryingNames) {
    constexpr unsigned POOL = 60; // three times as many as OpenGL has locations for
    std::mt19937 random(1);
    FloatCanvas canvas(1, 1);
    for (int pair = 0; pair < 30 && !HasFailure(); ++pair) {
        std::set<unsigned> names;
        for (const size_t count = 3 + random() % 5; names.size() < count;)
            names.insert(static_cast<unsigned>(random() % POOL));
        // Each stage has names that the other lacks; what both have comes through.
        std::ostringstream outputs, writes, inputs, sum;
        Pixel expected{};
        for (const unsigned name : names) {
            const bool isRead = name == *names.begin() || random() % 4 != 0;
            const auto weight = 1 + random() % 8;
            outputs << ", out float4 v" << name << " : OWN_" << name << '_';
            writes << "    v" << name << " = float4(" << name << ", 1, 0, " << pair << ");\n";
            if (!isRead)
                continue;
            inputs << "float4 v" << name << " : OWN_" << name << "_, ";
            sum << " + " << weight << ".0 * v" << name;
            const Pixel written = {static_cast<float>(name), 1, 0, static_cast<float>(pair)};
            for (size_t i = 0; i < 4; ++i)
                expected[i] += static_cast<float>(weight) * written[i];
        }
        std::ostringstream text;
        text << "void vertex(inout float4 position : POSITION" << outputs.str() << ")\n{\n"
             << writes.str() << "}\n"
             << "float4 fragment(" << inputs.str() << "float4 lacking : OWN_" << random() % POOL + POOL
             << "_, uniform bool isShown = false) : COLOR\n{\n"
             << "    return isShown ? lacking : float4(0)" << sum.str() << ";\n}\n";
        const std::string source = text.str();
        const bool isFragmentFirst = random() % 2 != 0;
        for (const bool isFragment : {isFragmentFirst, !isFragmentFirst}) {
            const CGprofile profile = isFragment ? CG_PROFILE_GLSLF : CG_PROFILE_GLSLV;
            CGprogram program = cgCreateProgram(mContext, CG_SOURCE, source.c_str(), profile,
                                                isFragment ? "fragment" : "vertex", nullptr);
            ASSERT_TRUE(program) << "pair " << pair << ":\n" << cgGetLastListing(mContext) << source;
            cgGLLoadProgram(program);
            cgGLBindProgram(program);
            cgGLEnableProfile(profile);
        }
        EXPECT_EQ(canvas.drawnPixel(), expected) << "pair " << pair << ":\n" << source;
    }
}

TEST_F(CgRuntime, TheHostsProgramAndActiveUnitStay) {
    const char* const text = "#version 330 compatibility\nvoid main() { gl_FragColor = vec4(9); }\n";
    const GLuint shader = glCreateShader(GL_FRAGMENT_SHADER);
    glShaderSource(shader, 1, &text, nullptr);
    glCompileShader(shader);
    const GLuint hosts = glCreateProgram();
    glAttachShader(hosts, shader);
    glLinkProgram(hosts);
    glDeleteShader(shader);
    glUseProgram(hosts);
    glActiveTexture(GL_TEXTURE5);

    CGprogram program = use("showTextures");
    CGparameter picture = cgGetNamedParameter(program, "first");
    cgGLSetTextureParameter(picture, 0);
    cgGLEnableTextureParameter(picture);
    cgGLDisableTextureParameter(picture);
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    cgDestroyProgram(program);
    EXPECT_EQ(stateOf(GL_CURRENT_PROGRAM), static_cast<GLint>(hosts));
    EXPECT_EQ(stateOf(GL_ACTIVE_TEXTURE), GL_TEXTURE5);
    glUseProgram(0);
    glDeleteProgram(hosts);
    glActiveTexture(GL_TEXTURE0);
}

TEST_F(CgRuntime, TexturesAreBoundWhenEnabledAtUnitsOfTheirOwn) {
    const GLuint one = solidTexture({1, 2, 3, 4});
    const GLuint two = solidTexture({0.1F, 0.2F, 0.3F, 0.4F});
    const GLuint three = solidTexture({0.5F, 0.25F, 0.75F, 1});
    FloatCanvas canvas(1, 1);

    CGprogram vertex = use("fetchIt", CG_PROFILE_GLSLV);
    CGparameter fetched = cgGetNamedParameter(vertex, "picture");
    cgGLSetTextureParameter(fetched, three);
    cgGLEnableTextureParameter(fetched);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{0.5F, 0.25F, 0.75F, 1}));

    CGprogram program = use("showTextures");
    CGparameter first = cgGetNamedParameter(program, "first");
    CGparameter second = cgGetNamedParameter(program, "second");
    EXPECT_EQ(cgGLGetTextureEnum(second), static_cast<GLenum>(GL_TEXTURE0));
    EXPECT_EQ(cgGLGetTextureEnum(first), static_cast<GLenum>(GL_TEXTURE1));
    cgGLSetTextureParameter(first, one);
    cgGLSetTextureParameter(second, two);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{0, 0, 0, 11})) << "nothing is bound before it is enabled";
    cgGLEnableTextureParameter(first);
    cgGLEnableTextureParameter(second);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{2, 4, 6, 8}));
    cgGLDisableTextureParameter(first);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{1, 2, 3, 5}));
    cgGLDisableTextureParameter(second);
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{0.5F, 0.25F, 0.75F, 1})) << "the other stage keeps its texture";

    cgGLDisableProfile(CG_PROFILE_GLSLV);
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    cgGLSetManageTextureParameters(mContext, CG_TRUE);
    cgGLBindProgram(program);
    EXPECT_EQ(canvas.drawnPixel(), (Pixel{2, 4, 6, 8})) << "bound with the program";
    cgGLUnbindProgram(CG_PROFILE_GLSLF);
    EXPECT_EQ(stateOf(GL_TEXTURE_BINDING_2D), 0);
    for (const GLuint texture : {one, two, three})
        glDeleteTextures(1, &texture);
}

int calls = 0;

TEST_F(CgRuntime, SettingAParameterIsOneCallAndSwitchingRelinksNothing) {
    CGprogram first = use("showFour");
    CGprogram second = make("showFour");
    CGparameter value = cgGetNamedParameter(second, "value");
    FloatCanvas canvas(1, 1);

    const SwappedEntryPoint sets(
        "glProgramUniform4fv", epoxy_glProgramUniform4fv,
        +[](GLuint, GLint, GLsizei, const GLfloat*) { ++calls; });
    const SwappedEntryPoint lookups(
        "glGetUniformLocation", epoxy_glGetUniformLocation, +[](GLuint, const GLchar*) { return ++calls; });
    const SwappedEntryPoint uses(
        "glUseProgram", epoxy_glUseProgram, +[](GLuint) { ++calls; });
    const SwappedEntryPoint states(
        "glGetIntegerv", epoxy_glGetIntegerv, +[](GLenum, GLint*) { ++calls; });
    const SwappedEntryPoint links(
        "glLinkProgram", epoxy_glLinkProgram, +[](GLuint) { ++calls; });
    const SwappedEntryPoint relinks(
        "glCreateShaderProgramv", epoxy_glCreateShaderProgramv,
        +[](GLenum, GLsizei, const GLchar* const*) { return static_cast<GLuint>(++calls); });
    const SwappedEntryPoint stages(
        "glUseProgramStages", epoxy_glUseProgramStages, +[](GLuint, GLbitfield, GLuint) { ++calls; });
    const SwappedEntryPoint pipelines(
        "glBindProgramPipeline", epoxy_glBindProgramPipeline, +[](GLuint) { ++calls; });
    struct Case {
        const char* what;
        int calls;
        std::function<void()> act;
    };
    const std::vector<Case> cases = {
        {"set", 1, [&] { cgGLSetParameter4f(value, 1, 2, 3, 4); }},
        {"switch", 1, [&] { cgGLBindProgram(second); }},
        {"bind again", 0, [&] { cgGLBindProgram(second); }},
        {"enable again", 0, [&] { cgGLEnableProfile(CG_PROFILE_GLSLF); }},
        {"disable", 1, [&] { cgGLDisableProfile(CG_PROFILE_GLSLF); }},
        {"enable", 1, [&] { cgGLEnableProfile(CG_PROFILE_GLSLF); }},
        {"disable for a switch", 1, [&] { cgGLDisableProfile(CG_PROFILE_GLSLF); }},
        {"switch while disabled", 0, [&] { cgGLBindProgram(first); }},
        {"enable after a switch", 2, [&] { cgGLEnableProfile(CG_PROFILE_GLSLF); }},
        {"disable at the end", 1, [&] { cgGLDisableProfile(CG_PROFILE_GLSLF); }},
    };
    for (const Case& one : cases) {
        calls = 0;
        one.act();
        EXPECT_EQ(calls, one.calls) << one.what;
    }
}

TEST_F(CgRuntime, EachOpenGlContextHasItsOwnStages) {
    CGprogram program = use("showFour");
    cgGLSetParameter4f(cgGetNamedParameter(program, "value"), 1, 2, 3, 4);
    EXPECT_NE(stateOf(GL_PROGRAM_PIPELINE_BINDING), 0);

    EGLDisplay display = eglGetCurrentDisplay();
    EGLContext hosts = eglGetCurrentContext();
    EGLint id = 0;
    eglQueryContext(display, hosts, EGL_CONFIG_ID, &id);
    const EGLint attributes[] = {EGL_CONFIG_ID, id, EGL_NONE};
    EGLConfig config = nullptr;
    EGLint count = 0;
    eglChooseConfig(display, attributes, &config, 1, &count);
    EGLContext other = eglCreateContext(display, config, hosts, nullptr);
    ASSERT_NE(other, EGL_NO_CONTEXT);
    eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, other);
    {
        FloatCanvas canvas(1, 1);
        EXPECT_EQ(canvas.drawnPixel(), (Pixel{1, 1, 1, 1})) << "nothing is enabled here";
        cgGLBindProgram(program);
        cgGLEnableProfile(CG_PROFILE_GLSLF);
        EXPECT_EQ(canvas.drawnPixel(), (Pixel{1, 2, 3, 4}));
        cgGLDisableProfile(CG_PROFILE_GLSLF);
    }
    eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, hosts);
    EXPECT_EQ(FloatCanvas(1, 1).drawnPixel(), (Pixel{1, 2, 3, 4}));
    cgDestroyProgram(program); // which is bound in the other context
    eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, other);
    cgGLEnableProfile(CG_PROFILE_GLSLF);
    EXPECT_EQ(FloatCanvas(1, 1).drawnPixel(), (Pixel{1, 1, 1, 1}));
    EXPECT_EQ(takeGlErrors(), std::vector<std::string>{});
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, hosts);
    eglDestroyContext(display, other);
}

} // namespace
