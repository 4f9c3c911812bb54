#include <Cg/Compiler/GlslNames.h>

#include <algorithm>
#include <charconv>
#include <cstddef>

namespace cg {

namespace {

/// Keywords and reserved words of GLSL 1.10 to 4.60 that are plain names in Cg, and GLSL's built-in
/// functions.
constexpr const char* WORDS =
    " active asm atomic_uint attribute bool break buffer bvec2 bvec3 bvec4 case cast centroid class coherent "
    "common const continue default discard dmat2 dmat3 dmat4 do double dvec2 dvec3 dvec4 else enum extern "
    "external false filter fixed flat float for fvec2 fvec3 fvec4 goto half highp hvec2 hvec3 hvec4 if "
    "image1D "
    "image1DArray image2D image2DArray image2DMS image2DRect image3D imageBuffer imageCube in inline inout "
    "input int interface invariant isampler1D isampler2D isampler2DRect isampler3D isamplerBuffer "
    "isamplerCube "
    "ivec2 ivec3 ivec4 layout long lowp main mat2 mat2x2 mat2x3 mat2x4 mat3 mat3x2 mat3x3 mat3x4 mat4 mat4x2 "
    "mat4x3 mat4x4 mediump namespace noinline noperspective out output partition patch precise precision "
    "public "
    "readonly resource restrict return row_major sample sampler1D sampler1DArray sampler1DShadow sampler2D "
    "sampler2DArray sampler2DMS sampler2DRect sampler2DRectShadow sampler2DShadow sampler3D sampler3DRect "
    "samplerBuffer samplerCube samplerCubeArray samplerCubeShadow shared short sizeof smooth static struct "
    "subroutine superp switch template texture this true typedef uimage2D uint uniform union unsigned "
    "usampler1D "
    "usampler2D usampler3D using uvec2 uvec3 uvec4 varying vec2 vec3 vec4 void volatile while writeonly "
    "packed std140 std430 column_major dmat2x2 dmat2x3 dmat2x4 dmat3x2 dmat3x3 dmat3x4 dmat4x2 dmat4x3 "
    "dmat4x4 "
    "sampler1DArrayShadow sampler2DArrayShadow samplerCubeArrayShadow sampler2DMSArray isampler1DArray "
    "isampler2DArray isamplerCubeArray isampler2DMS isampler2DMSArray usampler1DArray usampler2DArray "
    "usampler2DMS usampler2DMSArray usampler2DRect usamplerBuffer usamplerCube usamplerCubeArray "
    "image2DMSArray imageCubeArray iimage1D iimage1DArray iimage2D iimage2DArray iimage2DMS iimage2DMSArray "
    "iimage2DRect iimage3D iimageBuffer iimageCube iimageCubeArray uimage1D uimage1DArray uimage2DArray "
    "uimage2DMS uimage2DMSArray uimage2DRect uimage3D uimageBuffer uimageCube uimageCubeArray "
    "abs acos acosh all any asin asinh atan atanh barrier bitCount bitfieldExtract bitfieldInsert "
    "bitfieldReverse ceil clamp cos cosh cross dFdx dFdxCoarse dFdxFine dFdy dFdyCoarse dFdyFine degrees "
    "determinant distance dot equal exp exp2 faceforward findLSB findMSB floatBitsToInt floatBitsToUint "
    "floor "
    "fma fract frexp ftransform fwidth greaterThan greaterThanEqual imulExtended intBitsToFloat "
    "interpolateAtCentroid "
    "inverse inversesqrt isinf isnan ldexp length lessThan lessThanEqual log log2 matrixCompMult max min mix "
    "mod "
    "modf noise1 noise2 noise3 noise4 normalize not notEqual outerProduct packHalf2x16 packSnorm4x8 "
    "packUnorm2x16 "
    "packUnorm4x8 pow radians reflect refract round roundEven shadow1D shadow1DProj shadow2D shadow2DProj "
    "shadow2DRect shadow2DRectProj sign sin sinh smoothstep "
    "sqrt "
    "step tan tanh texelFetch texelFetchOffset texture1D texture1DLod texture1DProj texture2D texture2DLod "
    "texture2DProj texture2DRect texture2DRectProj texture3D textureCube textureGather textureGrad "
    "textureGradOffset textureLod textureLodOffset textureOffset textureProj textureProjGrad textureProjLod "
    "textureProjOffset textureQueryLod textureQueryLevels textureSamples textureSize transpose trunc "
    "uaddCarry uintBitsToFloat umulExtended unpackHalf2x16 unpackUnorm2x16 usubBorrow ";

std::unordered_set<std::string_view> makeWords() {
    std::unordered_set<std::string_view> words;
    std::string_view rest = WORDS;
    while (!rest.empty()) {
        const std::size_t end = rest.find(' ');
        if (end > 0)
            words.insert(rest.substr(0, end));
        rest.remove_prefix(end + 1);
    }
    return words;
}

} // namespace

bool isGlslWord(std::string_view name) {
    static const std::unordered_set<std::string_view> GLSL_WORDS = makeWords();
    return GLSL_WORDS.count(name) != 0;
}

std::string legalName(std::string_view name) {
    std::string legal;
    for (const char c : name)
        if (c != '_' || legal.empty() || legal.back() != '_')
            legal += c;
    if (legal.rfind("gl_", 0) == 0)
        legal.replace(0, 3, "gl");
    if (legal.rfind("cg_", 0) == 0) // our helper functions
        legal.replace(0, 3, "cg");
    if (legal.empty() || legal == "_")
        legal = "unnamed";
    if (isGlslWord(legal))
        legal += '_';
    return legal;
}

std::string GlslNames::distinct(std::string_view wanted) {
    std::string name = legalName(wanted);
    if (!isTaken(name))
        return name;
    if (name.back() != '_')
        name += '_';
    for (int& number = mNextNumbers.try_emplace(name, 2).first->second;; ++number)
        if (std::string candidate = name + std::to_string(number); !isTaken(candidate))
            return candidate;
}

std::string GlslNames::global(std::string_view wanted) {
    std::string name = distinct(wanted);
    mTaken.insert(name);
    return name;
}

std::string GlslNames::local(std::string_view wanted) {
    std::string name = distinct(wanted);
    mTaken.insert(name);
    mLocals.push_back(name);
    return name;
}

void GlslNames::closeScope() {
    for (; mLocals.size() > mScopes.back(); mLocals.pop_back())
        giveBack(mLocals.back());
    mScopes.pop_back();
}

/// The next of its kind takes the name again, with the number that it has.
void GlslNames::giveBack(const std::string& name) {
    mTaken.erase(name);
    const std::size_t digits = name.find_last_not_of("0123456789") + 1;
    const auto next = mNextNumbers.find(name.substr(0, digits));
    int number = 0;
    std::from_chars(name.data() + digits, name.data() + name.size(), number); // 0 where it has none
    if (next != mNextNumbers.end() && number >= 2)
        next->second = std::min(next->second, number);
}

} // namespace cg
