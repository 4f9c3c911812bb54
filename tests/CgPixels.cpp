#include <fixture/CgTest.h>
#include <fixture/FloatCanvas.h>
#include <fixture/GlslJudge.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <functional>
#include <initializer_list>
#include <map>
#include <sstream>
#include <string>
#include <vector>

// Each file of tests/cg/ is a case: Cg programs, and in comments that begin with "//!" how they are drawn and
// what comes out. A quad covers the canvas; its texture coordinates 0 run from (0, 0) at the lower left to
// (1, 1).
//
//   //! fragment NAME, //! vertex NAME   the entries; a stage without one is fixed function
//   //! size W H                         of the canvas in pixels, 4 4 where it is not said
//   //! set NAME v...                    a uniform; matrices row by row, arrays element by element
//   //! texture NAME W H D identity      (texels (x + 0.5) / W, (y + 0.5) / H, (z + 0.5) / D, 1), nearest
//   texel
//   //! texture NAME W H D v...          texels of four values each, row by row
//   //! depth NAME W H D v...            a depth texture that compares: 1 where the coordinate is at most v
//   //! linear NAME                      the texture's filter
//   //! coordinate N v v v v             the current texture coordinates N
//   //! colour v v v v, //! normal v v v the current ones
//   //! matrix modelview|projection|texture v...   sixteen values, row by row
//   //! tolerance v                      0.00001 where it is not said
//   //! expect X Y v v v v               one pixel, from the lower left
//   //! expect all v v v v               all of them
//
// A number may be a fraction: 1/3. Where the expectation is a formula it stands below, in FORMULAS.

namespace {

namespace fs = std::filesystem;

struct Expectation {
    bool isAll;
    int x;
    int y;
    Pixel pixel;
};

struct Setting {
    std::string name;
    std::vector<float> values;
};

struct TextureSetting {
    std::string name;
    std::array<int, 3> size;
    std::vector<float> texels;
    bool isDepth = false; ///< one value to a texel
};

struct Case {
    fs::path file;
    std::string vertex;
    std::string fragment;
    int width = 4;
    int height = 4;
    float tolerance = 1e-5F;
    std::vector<Setting> parameters;
    std::vector<TextureSetting> textures;
    std::vector<std::string> linear;
    std::vector<Setting> state; ///< by directive: colour, normal, coordinate, matrix
    std::vector<Expectation> expectations;
};

float number(const std::string& word) {
    const size_t slash = word.find('/');
    const float value = std::stof(word);
    return slash == std::string::npos ? value : value / std::stof(word.substr(slash + 1));
}

std::vector<float> numbers(std::istream& words) {
    std::vector<float> values;
    for (std::string word; words >> word;)
        values.push_back(number(word));
    return values;
}

std::vector<float> identityTexels(const std::array<int, 3>& size) {
    std::vector<float> texels;
    const auto middle = [](int i, int count) {
        return (static_cast<float>(i) + 0.5F) / static_cast<float>(count);
    };
    for (int z = 0; z < size[2]; ++z)
        for (int y = 0; y < size[1]; ++y)
            for (int x = 0; x < size[0]; ++x)
                texels.insert(texels.end(), {middle(x, size[0]), middle(y, size[1]), middle(z, size[2]), 1});
    return texels;
}

void readTexture(std::istream& words, Case& one) {
    TextureSetting texture;
    words >> texture.name >> texture.size[0] >> texture.size[1] >> texture.size[2];
    const std::streampos start = words.tellg();
    std::string word;
    words >> word;
    if (word == "identity") {
        texture.texels = identityTexels(texture.size);
    } else {
        words.seekg(start);
        texture.texels = numbers(words);
    }
    one.textures.push_back(texture);
}

void readExpectation(std::istream& words, Case& one) {
    Expectation expectation{};
    std::string x;
    words >> x;
    expectation.isAll = x == "all";
    if (!expectation.isAll) {
        expectation.x = std::stoi(x);
        words >> expectation.y;
    }
    const std::vector<float> values = numbers(words);
    std::copy_n(values.begin(), std::min<size_t>(values.size(), 4), expectation.pixel.begin());
    one.expectations.push_back(expectation);
}

/// @throw std::runtime_error  the file has a directive that is none
void readDirective(std::istream& words, Case& one) {
    std::string directive;
    words >> directive;
    if (directive == "fragment") {
        words >> one.fragment;
    } else if (directive == "vertex") {
        words >> one.vertex;
    } else if (directive == "size") {
        words >> one.width >> one.height;
    } else if (directive == "tolerance") {
        words >> one.tolerance;
    } else if (directive == "texture" || directive == "depth") {
        readTexture(words, one);
        one.textures.back().isDepth = directive == "depth";
    } else if (directive == "expect") {
        readExpectation(words, one);
    } else if (directive == "linear") {
        one.linear.emplace_back();
        words >> one.linear.back();
    } else if (directive == "set" || directive == "matrix") {
        std::string name;
        words >> name;
        (directive == "set" ? one.parameters : one.state).push_back({name, numbers(words)});
    } else if (directive == "colour" || directive == "normal" || directive == "coordinate") {
        one.state.push_back({directive, numbers(words)});
    } else {
        throw std::runtime_error(one.file.string() + ": no directive \"" + directive + '"');
    }
}

Case readCase(const fs::path& file) {
    Case one;
    one.file = file;
    std::ifstream in(file);
    for (std::string line; std::getline(in, line);) {
        if (line.rfind("//! ", 0) != 0)
            continue;
        std::istringstream words(line.substr(4));
        readDirective(words, one);
    }
    return one;
}

std::vector<std::string> caseNames() {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(FWZEL_CG_PROGRAMS))
        if (entry.path().extension() == ".cg")
            names.push_back(entry.path().stem().string());
    std::sort(names.begin(), names.end());
    return names;
}

/// A pixel of the picture, from the coordinates of its middle, 0 to 1.
using Formula = Pixel (*)(float s, float t);

Pixel rgbOfYcc(float s, float t) {
    const float y = (s - 16.0F / 255) * 255 / 219;
    const float cb = (t - 128.0F / 255) * 255 / 224;
    const float cr = (0.5F - 128.0F / 255) * 255 / 224;
    return {y + 1.5748F * cr, y - 0.187324F * cb - 0.468124F * cr, y + 1.8556F * cb, 1};
}

/// The even lines of six, and the means of their neighbours, edges repeated.
Pixel oddFieldOfSixLines(float s, float t) {
    const int line = static_cast<int>(t * 6);
    const auto height = [](int y) { return (static_cast<float>(std::clamp(y, 0, 5)) + 0.5F) / 6; };
    return {s, line % 2 == 1 ? t : (height(line - 1) + height(line + 1)) / 2, 0.5F, 1};
}

/// Two layers over the identity picture on the right half.
Pixel mixed(float s, float t) {
    const Pixel backdrop = {s, t, 0.5F, 1};
    if (s < 0.5F)
        return backdrop;
    const std::array<Pixel, 2> layers = {{{0.1F, 0.2F, 0.3F, 0.25F}, {0.1F, 0.1F, 0.1F, 0.25F}}};
    Pixel result = backdrop;
    for (const Pixel& layer : layers)
        for (size_t i = 0; i < 4; ++i)
            result[i] = layer[i] + (1 - layer[3]) * result[i];
    return result;
}

const std::map<std::string, Formula> FORMULAS = {
    {"ycbcr_to_rgb", &rgbOfYcc},
    {"rgb_to_ycbcr_and_back",
     [](float s, float t) {
         return Pixel{s, t, 0.5F, 1};
     }},
    {"field_interpolation", &oddFieldOfSixLines},
    {"gamma",
     [](float s, float t) {
         return Pixel{std::pow(s, 2.2F), std::pow(t, 1.8F), 0.5F, 1};
     }},
    {"lut_3d",
     [](float s, float t) {
         return Pixel{0.5F, 0.875F * t + 0.0625F, 0.875F * s + 0.0625F, 1};
     }},
    {"blend_textures", &mixed},
    {"colour_corrector",
     [](float s, float t) {
         return Pixel{s, t, 0.5F, 1};
     }},
};

/// Puts what a case changes in OpenGL's fixed function back.
class FixedFunctionState {
public:
    FixedFunctionState() {
        glPushAttrib(GL_CURRENT_BIT | GL_TRANSFORM_BIT | GL_TEXTURE_BIT);
        glColor4f(1, 1, 1, 1);
    }
    ~FixedFunctionState() {
        for (const GLenum mode : std::initializer_list<GLenum>{GL_MODELVIEW, GL_PROJECTION, GL_TEXTURE}) {
            glMatrixMode(mode);
            glLoadIdentity();
        }
        glPopAttrib();
    }

    FixedFunctionState(const FixedFunctionState&) = delete;
    FixedFunctionState& operator=(const FixedFunctionState&) = delete;

    static void set(const Setting& setting) {
        const float* const v = setting.values.data();
        static const std::map<std::string, GLenum> modes = {
            {"modelview", GL_MODELVIEW}, {"projection", GL_PROJECTION}, {"texture", GL_TEXTURE}};
        const auto mode = modes.find(setting.name);
        if (mode != modes.end()) {
            glMatrixMode(mode->second);
            glLoadTransposeMatrixf(v);
        } else if (setting.name == "colour") {
            glColor4fv(v);
        } else if (setting.name == "normal") {
            glNormal3fv(v);
        } else {
            glMultiTexCoord4fv(GL_TEXTURE0 + static_cast<GLenum>(v[0]), v + 1);
        }
    }
};

GLenum targetOf(CGtype sampler) {
    switch (sampler) {
    case CG_SAMPLER1D:
        return GL_TEXTURE_1D;
    case CG_SAMPLER3D:
        return GL_TEXTURE_3D;
    case CG_SAMPLERRECT:
        return GL_TEXTURE_RECTANGLE;
    case CG_SAMPLERCUBE:
        return GL_TEXTURE_CUBE_MAP;
    case CG_SAMPLER1DARRAY:
        return GL_TEXTURE_1D_ARRAY;
    case CG_SAMPLER2DARRAY:
        return GL_TEXTURE_2D_ARRAY;
    default:
        return GL_TEXTURE_2D;
    }
}

/// A texture of single-precision texels; a cube's depth counts its faces, an array's its layers.
GLuint makeTexture(GLenum target, const TextureSetting& from, bool isLinear) {
    const auto [width, height, depth] = from.size;
    const GLint internal = from.isDepth ? GL_DEPTH_COMPONENT32F : GL_RGBA32F;
    const GLenum format = from.isDepth ? GL_DEPTH_COMPONENT : GL_RGBA;
    const float* const texels = from.texels.data();
    GLuint texture = 0;
    glGenTextures(1, &texture);
    glBindTexture(target, texture);
    const GLint filter = isLinear ? GL_LINEAR : GL_NEAREST;
    glTexParameteri(target, GL_TEXTURE_MIN_FILTER, filter);
    glTexParameteri(target, GL_TEXTURE_MAG_FILTER, filter);
    for (const GLenum wrap :
         std::initializer_list<GLenum>{GL_TEXTURE_WRAP_S, GL_TEXTURE_WRAP_T, GL_TEXTURE_WRAP_R})
        glTexParameteri(target, wrap, GL_CLAMP_TO_EDGE);
    if (from.isDepth)
        glTexParameteri(target, GL_TEXTURE_COMPARE_MODE, GL_COMPARE_REF_TO_TEXTURE);
    if (target == GL_TEXTURE_1D)
        glTexImage1D(target, 0, internal, width, 0, format, GL_FLOAT, texels);
    else if (target == GL_TEXTURE_3D || target == GL_TEXTURE_2D_ARRAY)
        glTexImage3D(target, 0, internal, width, height, depth, 0, format, GL_FLOAT, texels);
    else if (target == GL_TEXTURE_CUBE_MAP)
        for (int face = 0; face < 6; ++face)
            glTexImage2D(GL_TEXTURE_CUBE_MAP_POSITIVE_X + static_cast<GLenum>(face), 0, internal, width,
                         height, 0, format, GL_FLOAT,
                         texels + static_cast<ptrdiff_t>(face) * width * height * (from.isDepth ? 1 : 4));
    else
        glTexImage2D(target, 0, internal, width, target == GL_TEXTURE_1D_ARRAY ? depth : height, 0, format,
                     GL_FLOAT, texels);
    glBindTexture(target, 0);
    return texture;
}

class CgPixels : public CgTest, public ::testing::WithParamInterface<std::string> {
protected:
    void SetUp() override {
        CgTest::SetUp();
        mCase = readCase(fs::path(FWZEL_CG_PROGRAMS) / (GetParam() + ".cg"));
    }

    void TearDown() override {
        if (!mTextures.empty())
            glDeleteTextures(static_cast<GLsizei>(mTextures.size()), mTextures.data());
        CgTest::TearDown();
    }

    /// Makes the program that draws a stage; none where the stage has no entry.
    void start(const std::string& entry, CGprofile profile) {
        if (entry.empty())
            return;
        CGprogram program =
            cgCreateProgramFromFile(mContext, CG_SOURCE, mCase.file.c_str(), profile, entry.c_str(), nullptr);
        ASSERT_TRUE(program) << cgGetLastListing(mContext);
        const std::string glsl = cgGetProgramString(program, CG_COMPILED_PROGRAM);
        mGlsl += glsl;
        EXPECT_EQ(objectionsTo(glsl, profile == CG_PROFILE_GLSLV ? "vert" : "frag"), "") << glsl;
        cgGLLoadProgram(program);
        cgGLBindProgram(program);
        cgGLEnableProfile(profile);
        mPrograms.push_back(program);
    }

    /// Sets the parameters of the name, in both programs.
    void setParameter(const Setting& setting) {
        bool isFound = false;
        for (CGprogram program : mPrograms)
            if (CGparameter parameter = cgGetNamedParameter(program, setting.name.c_str())) {
                setValues(parameter, setting.values);
                isFound = true;
            }
        EXPECT_TRUE(isFound) << "no parameter " << setting.name;
    }

    static void setValues(CGparameter parameter, const std::vector<float>& values) {
        const bool isMatrix = cgGetParameterRows(parameter) > 1;
        if (cgGetParameterType(parameter) == CG_ARRAY) {
            if (isMatrix)
                return cgGLSetMatrixParameterArrayfr(parameter, 0, 0, values.data());
            using SetArray = void (*)(CGparameter, long, long, const float*);
            const std::array<SetArray, 4> setters = {&cgGLSetParameterArray1f, &cgGLSetParameterArray2f,
                                                     &cgGLSetParameterArray3f, &cgGLSetParameterArray4f};
            return setters.at(static_cast<size_t>(cgGetParameterColumns(parameter) - 1))(parameter, 0, 0,
                                                                                         values.data());
        }
        if (isMatrix)
            return cgGLSetMatrixParameterfr(parameter, values.data());
        std::array<float, 4> four{};
        std::copy_n(values.begin(), std::min<size_t>(values.size(), 4), four.begin());
        cgGLSetParameter4fv(parameter, four.data());
    }

    /// Gives the samplers of the name a texture, in both programs.
    void setTexture(const TextureSetting& setting) {
        const bool isLinear =
            std::find(mCase.linear.begin(), mCase.linear.end(), setting.name) != mCase.linear.end();
        const size_t texels = static_cast<size_t>(setting.size[0]) * static_cast<size_t>(setting.size[1]) *
                              static_cast<size_t>(setting.size[2]);
        ASSERT_EQ(setting.texels.size(), (setting.isDepth ? 1 : 4) * texels) << setting.name;
        bool isFound = false;
        for (CGprogram program : mPrograms)
            if (CGparameter sampler = cgGetNamedParameter(program, setting.name.c_str())) {
                mTextures.push_back(makeTexture(targetOf(cgGetParameterType(sampler)), setting, isLinear));
                cgGLSetTextureParameter(sampler, mTextures.back());
                mSamplers.push_back(sampler);
                isFound = true;
            }
        EXPECT_TRUE(isFound) << "no sampler " << setting.name;
    }

    void expectPixel(const FloatCanvas& canvas, const std::vector<Pixel>& pixels, int x, int y,
                     const Pixel& expected) {
        const Pixel& drawn =
            pixels.at(static_cast<size_t>(y) * static_cast<size_t>(canvas.width()) + static_cast<size_t>(x));
        for (size_t i = 0; i < 4; ++i)
            ASSERT_NEAR(drawn[i], expected[i], mCase.tolerance)
                << "component " << i << " of pixel (" << x << ", " << y << ") = (" << drawn[0] << ", "
                << drawn[1] << ", " << drawn[2] << ", " << drawn[3] << ")\n"
                << mGlsl;
    }

    void expectAll(const FloatCanvas& canvas, const std::vector<Pixel>& pixels, const Formula& formula,
                   const Pixel& constant) {
        for (int y = 0; y < canvas.height() && !HasFatalFailure(); ++y)
            for (int x = 0; x < canvas.width() && !HasFatalFailure(); ++x)
                expectPixel(
                    canvas, pixels, x, y,
                    formula ? formula((static_cast<float>(x) + 0.5F) / static_cast<float>(canvas.width()),
                                      (static_cast<float>(y) + 0.5F) / static_cast<float>(canvas.height()))
                            : constant);
    }

    Case mCase;
    std::vector<CGprogram> mPrograms;
    std::vector<GLuint> mTextures;
    std::vector<CGparameter> mSamplers;
    std::string mGlsl;
};

TEST_P(CgPixels, AreThoseOfTheProgram) {
    ASSERT_TRUE(!mCase.vertex.empty() || !mCase.fragment.empty());
    ASSERT_NO_FATAL_FAILURE(start(mCase.vertex, CG_PROFILE_GLSLV));
    ASSERT_NO_FATAL_FAILURE(start(mCase.fragment, CG_PROFILE_GLSLF));
    for (const Setting& setting : mCase.parameters)
        setParameter(setting);
    FloatCanvas canvas(mCase.width, mCase.height);
    for (const TextureSetting& setting : mCase.textures)
        ASSERT_NO_FATAL_FAILURE(setTexture(setting));
    for (CGparameter sampler : mSamplers)
        cgGLEnableTextureParameter(sampler);
    const FixedFunctionState fixedFunction;
    for (const Setting& setting : mCase.state)
        FixedFunctionState::set(setting);

    canvas.drawQuad();
    const std::vector<Pixel> pixels = canvas.pixels();
    const auto formula = FORMULAS.find(GetParam());
    ASSERT_TRUE(formula != FORMULAS.end() || !mCase.expectations.empty()) << "nothing is expected";
    if (formula != FORMULAS.end())
        expectAll(canvas, pixels, formula->second, {});
    for (const Expectation& expectation : mCase.expectations) {
        if (expectation.isAll)
            expectAll(canvas, pixels, nullptr, expectation.pixel);
        else
            expectPixel(canvas, pixels, expectation.x, expectation.y, expectation.pixel);
    }
}

INSTANTIATE_TEST_SUITE_P(Programs, CgPixels, ::testing::ValuesIn(caseNames()),
                         [](const auto& test) { return test.param; });

} // namespace
