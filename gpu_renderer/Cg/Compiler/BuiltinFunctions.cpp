#include <Cg/Compiler/BuiltinFunctions.h>

#include <unordered_map>

namespace cg {

namespace {

/// A row as it is written: "result(parameters)". Shared by all operands of a row are one size (1 to 4) and
/// one scalar kind, the highest of the arguments':
///   N number, F floating, I integer, B boolean, each of the shared size; n, f, i, b the same as one scalar;
///   V the same as F, but never a matrix; N and F may be matrices of one shape, taken row by row;
///   F2, I3, ... of a fixed size; 2, 3, 4 and 1: float vectors, whatever the other operands are;
///   M a matrix, T its transposed, Q a square one; s1 s2 s3 sR sC sA sB samplers, z those of depths;
///   t a text, v nothing; o before a parameter: out.
struct Row {
    const char* name;
    const char* signature;
    const char* form;
    const char* helper = "";
};

constexpr Row CG_ROWS[] = {
    // Arithmetic, component by component.
    {"abs", "N(N)", "abs($0)"},
    {"ceil", "F(F)", "ceil($0)"},
    {"clamp", "N(N,N,N)", "clamp($0, $1, $2)"},
    {"exp", "F(F)", "exp($0)"},
    {"exp2", "F(F)", "exp2($0)"},
    {"floor", "F(F)", "floor($0)"},
    {"fmod", "F(F,F)", "cg_fmod($0, $1)", "cg_fmod"},
    {"frac", "F(F)", "fract($0)"},
    {"frexp", "F(F,oF)", "cg_frexp($0, $1)", "cg_frexp"},
    {"ldexp", "F(F,F)", "cg_ldexp($0, $1)", "cg_ldexp"},
    {"lerp", "F(F,F,f)", "mix($0, $1, $2)"},
    {"lerp", "F(F,F,F)", "mix($0, $1, $2)"},
    {"log", "F(F)", "log($0)"},
    {"log10", "F(F)", "cg_log10($0)", "cg_log10"},
    {"log2", "F(F)", "log2($0)"},
    {"mad", "F(F,F,F)", "cg_mad($0, $1, $2)", "cg_mad"},
    {"max", "N(N,N)", "max($0, $1)"},
    {"min", "N(N,N)", "min($0, $1)"},
    {"noise", "1(1)", "cg_noise(vec3($0, 0.0, 0.0))", "cg_noise"},
    {"noise", "1(2)", "cg_noise(vec3($0, 0.0))", "cg_noise"},
    {"noise", "1(3)", "cg_noise($0)", "cg_noise"},
    {"modf", "F(F,oF)", "modf($0, $1)"},
    {"pow", "F(F,F)", "pow($0, $1)"},
    {"rcp", "F(F)", "cg_rcp($0)", "cg_rcp"},
    {"round", "F(F)", "roundEven($0)"},
    {"rsqrt", "F(F)", "inversesqrt($0)"},
    {"saturate", "F(F)", "clamp($0, 0.0, 1.0)"},
    {"sign", "N(N)", "sign($0)"},
    {"smoothstep", "F(F,F,F)", "smoothstep($0, $1, $2)"},
    {"sqrt", "F(F)", "sqrt($0)"},
    {"step", "F(F,F)", "step($0, $1)"},
    {"trunc", "F(F)", "trunc($0)"},

    // Angles.
    {"acos", "F(F)", "acos($0)"},
    {"asin", "F(F)", "asin($0)"},
    {"atan", "F(F)", "atan($0)"},
    {"atan2", "F(F,F)", "atan($0, $1)"},
    {"cos", "F(F)", "cos($0)"},
    {"cosh", "F(F)", "cosh($0)"},
    {"degrees", "F(F)", "degrees($0)"},
    {"radians", "F(F)", "radians($0)"},
    {"sin", "F(F)", "sin($0)"},
    {"sincos", "v(F,oF,oF)", "cg_sincos($0, $1, $2)", "cg_sincos"},
    {"sinh", "F(F)", "sinh($0)"},
    {"tan", "F(F)", "tan($0)"},
    {"tanh", "F(F)", "tanh($0)"},

    // Vectors and matrices; mul() has rules of its own.
    {"cross", "F3(F3,F3)", "cross($0, $1)"},
    {"determinant", "f(Q)", "determinant($0)"},
    {"determinant", "f(f)", "$0"},
    {"distance", "f(V,V)", "distance($0, $1)"},
    {"dot", "f(V,V)", "dot($0, $1)"},
    {"dst", "F4(F4,F4)", "cg_dst($0, $1)", "cg_dst"},
    {"faceforward", "V(V,V,V)", "faceforward($0, $1, $2)"},
    {"inverse", "Q(Q)", "inverse($0)"},
    {"length", "f(V)", "length($0)"},
    {"lit", "F4(f,f,f)", "cg_lit($0, $1, $2)", "cg_lit"},
    {"normalize", "V(V)", "normalize($0)"},
    {"reflect", "V(V,V)", "reflect($0, $1)"},
    {"refract", "V(V,V,f)", "refract($0, $1, $2)"},
    {"transpose", "T(M)", "transpose($0)"},

    // Questions.
    {"all", "b(b)", "$0"},
    {"all", "b(B)", "all($0)"},
    {"all", "b(M)", "cg_all($0)", "cg_all"},
    {"any", "b(b)", "$0"},
    {"any", "b(B)", "any($0)"},
    {"any", "b(M)", "cg_any($0)", "cg_any"},
    {"isfinite", "B(F)", "cg_isfinite($0)", "cg_isfinite"},
    {"isinf", "B(F)", "isinf($0)"},
    {"isnan", "B(F)", "isnan($0)"},

    // Bits.
    {"asfloat", "F(I)", "intBitsToFloat($0)"},
    {"asint", "I(F)", "floatBitsToInt($0)"},
    {"bitCount", "I(I)", "cg_bitCount($0)", "cg_bitCount"},
    {"bitfieldExtract", "I(I,i,i)", "cg_bitfieldExtract($0, $1, $2)", "cg_bitfieldExtract"},
    {"bitfieldInsert", "I(I,I,i,i)", "cg_bitfieldInsert($0, $1, $2, $3)", "cg_bitfieldInsert"},
    {"bitfieldReverse", "I(I)", "cg_bitfieldReverse($0)", "cg_bitfieldReverse"},
    {"findLSB", "I(I)", "cg_findLSB($0)", "cg_findLSB"},
    {"findMSB", "I(I)", "cg_findMSB($0)", "cg_findMSB"},
    {"floatToIntBits", "I(F)", "floatBitsToInt($0)"},
    {"floatToRawIntBits", "I(F)", "floatBitsToInt($0)"},
    {"intBitsToFloat", "F(I)", "intBitsToFloat($0)"},
    {"pack_2half", "1(2)", "cg_pack_2half($0)", "cg_pack_2half"},
    {"pack_2ushort", "1(2)", "cg_pack_2ushort($0)", "cg_pack_2ushort"},
    {"pack_4byte", "1(4)", "cg_pack_4byte($0)", "cg_pack_4byte"},
    {"pack_4ubyte", "1(4)", "cg_pack_4ubyte($0)", "cg_pack_4ubyte"},
    {"unpack_2half", "2(1)", "cg_unpack_2half($0)", "cg_unpack_2half"},
    {"unpack_2ushort", "2(1)", "cg_unpack_2ushort($0)", "cg_unpack_2ushort"},
    {"unpack_4byte", "4(1)", "cg_unpack_4byte($0)", "cg_unpack_4byte"},
    {"unpack_4ubyte", "4(1)", "cg_unpack_4ubyte($0)", "cg_unpack_4ubyte"},

    // Fragments.
    {"clip", "v(F)", "cg_clip($0)", "cg_clip"},
    {"ddx", "F(F)", "dFdx($0)"},
    {"ddy", "F(F)", "dFdy($0)"},
    {"fwidth", "F(F)", "fwidth($0)"},
    {"debug", "v(4)", "cg_debug($0)", "cg_debug"},

    // Look-ups, 1D. The unused third coordinate of a depth look-up stands between the others in GLSL. Where
    // it has a look-up of the old kind, that is taken: it gives the texels of a texture that compares no
    // depth.
    {"tex1D", "4(s1,1)", "texture($0, $1)"},
    {"tex1D", "4(s1,1,i)", "textureOffset($0, $1, $2)"},
    {"tex1D", "4(s1,1,1,1)", "textureGrad($0, $1, $2, $3)"},
    {"tex1D", "4(s1,1,1,1,i)", "textureGradOffset($0, $1, $2, $3, $4)"},
    {"tex1D", "4(z1,2)", "shadow1D($0, vec3($1.x, 0.0, $1.y))"},
    {"tex1D", "4(z1,2,1,1)", "cg_depth(textureGrad($0, vec3($1.x, 0.0, $1.y), $2, $3))", "cg_depth"},
    {"tex1Dbias", "4(s1,4)", "texture($0, $1.x, $1.w)"},
    {"tex1Dbias", "4(s1,4,i)", "textureOffset($0, $1.x, $2, $1.w)"},
    {"tex1Dlod", "4(s1,4)", "textureLod($0, $1.x, $1.w)"},
    {"tex1Dlod", "4(s1,4,i)", "textureLodOffset($0, $1.x, $1.w, $2)"},
    {"tex1Dproj", "4(s1,1)", "texture($0, $1)"},
    {"tex1Dproj", "4(s1,2)", "textureProj($0, $1)"},
    {"tex1Dproj", "4(s1,2,i)", "textureProjOffset($0, $1, $2)"},
    {"tex1Dproj", "4(z1,3)", "shadow1DProj($0, vec4($1.x, 0.0, $1.yz))"},
    {"tex1Dproj", "4(s1,4)", "textureProj($0, $1)"},
    {"tex1Dcmpbias", "4(z1,4)", "cg_depth(texture($0, vec3($1.x, 0.0, $1.y), $1.w))", "cg_depth"},
    {"tex1Dcmplod", "4(z1,4)", "cg_depth(textureLod($0, vec3($1.x, 0.0, $1.y), $1.w))", "cg_depth"},
    {"tex1Dfetch", "4(s1,I4)", "texelFetch($0, $1.x, $1.w)"},
    {"tex1Dfetch", "4(s1,I4,i)", "texelFetchOffset($0, $1.x, $1.w, $2)"},
    {"tex1Dsize", "I3(s1,i)", "ivec3(textureSize($0, $1), 0, 0)"},

    // 2D.
    {"tex2D", "4(s2,2)", "texture($0, $1)"},
    {"tex2D", "4(z2,3)", "shadow2D($0, $1)"},
    {"tex2D", "4(s2,2,I2)", "textureOffset($0, $1, $2)"},
    {"tex2D", "4(z2,3,I2)", "cg_depth(textureOffset($0, $1, $2))", "cg_depth"},
    {"tex2D", "4(s2,2,2,2)", "textureGrad($0, $1, $2, $3)"},
    {"tex2D", "4(z2,3,2,2)", "cg_depth(textureGrad($0, $1, $2, $3))", "cg_depth"},
    {"tex2D", "4(s2,2,2,2,I2)", "textureGradOffset($0, $1, $2, $3, $4)"},
    {"tex2D", "4(z2,3,2,2,I2)", "cg_depth(textureGradOffset($0, $1, $2, $3, $4))", "cg_depth"},
    {"tex2Dbias", "4(s2,4)", "texture($0, $1.xy, $1.w)"},
    {"tex2Dbias", "4(s2,4,I2)", "textureOffset($0, $1.xy, $2, $1.w)"},
    {"tex2Dlod", "4(s2,4)", "textureLod($0, $1.xy, $1.w)"},
    {"tex2Dlod", "4(s2,4,I2)", "textureLodOffset($0, $1.xy, $1.w, $2)"},
    {"tex2Dgrad", "4(s2,2,2,2)", "textureGrad($0, $1, $2, $3)"},
    {"tex2Dproj", "4(s2,2)", "texture($0, $1)"},
    {"tex2Dproj", "4(s2,3)", "textureProj($0, $1)"},
    {"tex2Dproj", "4(s2,3,I2)", "textureProjOffset($0, $1, $2)"},
    {"tex2Dproj", "4(z2,4)", "shadow2DProj($0, $1)"},
    {"tex2Dproj", "4(s2,4)", "textureProj($0, $1)"},
    {"tex2Dproj", "4(s2,4,I2)", "textureProjOffset($0, $1, $2)"},
    {"tex2Dcmpbias", "4(z2,4)", "cg_depth(texture($0, $1.xyz, $1.w))", "cg_depth"},
    {"tex2Dcmplod", "4(z2,4)", "cg_depth(textureLod($0, $1.xyz, $1.w))", "cg_depth"},
    {"tex2Dfetch", "4(s2,I4)", "texelFetch($0, $1.xy, $1.w)"},
    {"tex2Dfetch", "4(s2,I4,I2)", "texelFetchOffset($0, $1.xy, $1.w, $2)"},
    {"tex2Dsize", "I3(s2,i)", "ivec3(textureSize($0, $1), 0)"},

    // RECT: pixel coordinates, no mip levels.
    {"texRECT", "4(sR,2)", "texture($0, $1)"},
    {"texRECT", "4(zR,3)", "shadow2DRect($0, $1)"},
    {"texRECT", "4(sR,2,I2)", "textureOffset($0, $1, $2)"},
    {"texRECT", "4(sR,2,2,2)", "textureGrad($0, $1, $2, $3)"},
    {"texRECT", "4(zR,3,2,2)", "cg_depth(textureGrad($0, $1, $2, $3))", "cg_depth"},
    {"texRECT", "4(sR,2,2,2,I2)", "textureGradOffset($0, $1, $2, $3, $4)"},
    {"texRECTbias", "4(sR,4)", "texture($0, $1.xy)"},
    {"texRECTbias", "4(sR,4,I2)", "textureOffset($0, $1.xy, $2)"},
    {"texRECTlod", "4(sR,4)", "texture($0, $1.xy)"},
    {"texRECTlod", "4(sR,4,I2)", "textureOffset($0, $1.xy, $2)"},
    {"texRECTproj", "4(sR,2)", "texture($0, $1)"},
    {"texRECTproj", "4(sR,3)", "textureProj($0, $1)"},
    {"texRECTproj", "4(sR,3,I2)", "textureProjOffset($0, $1, $2)"},
    {"texRECTproj", "4(zR,4)", "shadow2DRectProj($0, $1)"},
    {"texRECTproj", "4(sR,4)", "textureProj($0, $1)"},
    {"texRECTproj", "4(sR,4,I2)", "textureProjOffset($0, $1, $2)"},
    {"texRECTfetch", "4(sR,I4)", "texelFetch($0, $1.xy)"},
    {"texRECTfetch", "4(sR,I4,I2)", "texelFetchOffset($0, $1.xy, $2)"},
    {"texRECTsize", "I3(sR,i)", "ivec3(textureSize($0), 0)"},
    {"texRECTsize", "I3(sR)", "ivec3(textureSize($0), 0)"},

    // 3D.
    {"tex3D", "4(s3,3)", "texture($0, $1)"},
    {"tex3D", "4(s3,3,I3)", "textureOffset($0, $1, $2)"},
    {"tex3D", "4(s3,3,3,3)", "textureGrad($0, $1, $2, $3)"},
    {"tex3D", "4(s3,3,3,3,I3)", "textureGradOffset($0, $1, $2, $3, $4)"},
    {"tex3Dbias", "4(s3,4)", "texture($0, $1.xyz, $1.w)"},
    {"tex3Dbias", "4(s3,4,I3)", "textureOffset($0, $1.xyz, $2, $1.w)"},
    {"tex3Dlod", "4(s3,4)", "textureLod($0, $1.xyz, $1.w)"},
    {"tex3Dlod", "4(s3,4,I3)", "textureLodOffset($0, $1.xyz, $1.w, $2)"},
    {"tex3Dproj", "4(s3,3)", "texture($0, $1)"},
    {"tex3Dproj", "4(s3,4)", "textureProj($0, $1)"},
    {"tex3Dproj", "4(s3,4,I3)", "textureProjOffset($0, $1, $2)"},
    {"tex3Dfetch", "4(s3,I4)", "texelFetch($0, $1.xyz, $1.w)"},
    {"tex3Dfetch", "4(s3,I4,I3)", "texelFetchOffset($0, $1.xyz, $1.w, $2)"},
    {"tex3Dsize", "I3(s3,i)", "textureSize($0, $1)"},

    // CUBE: a direction, so a projection changes nothing.
    {"texCUBE", "4(sC,3)", "texture($0, $1)"},
    {"texCUBE", "4(zC,4)", "cg_depth(texture($0, $1))", "cg_depth"},
    {"texCUBE", "4(sC,3,3,3)", "textureGrad($0, $1, $2, $3)"},
    {"texCUBEbias", "4(sC,4)", "texture($0, $1.xyz, $1.w)"},
    {"texCUBElod", "4(sC,4)", "textureLod($0, $1.xyz, $1.w)"},
    {"texCUBEproj", "4(sC,3)", "texture($0, $1)"},
    {"texCUBEproj", "4(sC,4)", "texture($0, $1.xyz)"},
    {"texCUBEsize", "I3(sC,i)", "ivec3(textureSize($0, $1), 0)"},

    // Layers of 1D and of 2D textures: the layer is the coordinate behind the last one.
    {"tex1DARRAY", "4(sA,2)", "texture($0, $1)"},
    {"tex1DARRAY", "4(sA,2,i)", "textureOffset($0, $1, $2)"},
    {"tex1DARRAY", "4(sA,2,1,1)", "textureGrad($0, $1, $2, $3)"},
    {"tex1DARRAYbias", "4(sA,4)", "texture($0, $1.xy, $1.w)"},
    {"tex1DARRAYlod", "4(sA,4)", "textureLod($0, $1.xy, $1.w)"},
    {"tex1DARRAYproj", "4(sA,3)", "texture($0, vec2(($1.x) / ($1.z), $1.y))"},
    {"tex1DARRAYfetch", "4(sA,I4)", "texelFetch($0, $1.xy, $1.w)"},
    {"tex1DARRAYsize", "I3(sA,i)", "ivec3(textureSize($0, $1), 0)"},
    {"tex2DARRAY", "4(sB,3)", "texture($0, $1)"},
    {"tex2DARRAY", "4(zB,4)", "cg_depth(texture($0, $1))", "cg_depth"},
    {"tex2DARRAY", "4(sB,3,I2)", "textureOffset($0, $1, $2)"},
    {"tex2DARRAY", "4(sB,3,2,2)", "textureGrad($0, $1, $2, $3)"},
    {"tex2DARRAYbias", "4(sB,4)", "texture($0, $1.xyz, $1.w)"},
    {"tex2DARRAYlod", "4(sB,4)", "textureLod($0, $1.xyz, $1.w)"},
    {"tex2DARRAYproj", "4(sB,4)", "texture($0, vec3(($1.xy) / ($1.w), $1.z))"},
    {"tex2DARRAYfetch", "4(sB,I4)", "texelFetch($0, $1.xyz, $1.w)"},
    {"tex2DARRAYsize", "I3(sB,i)", "textureSize($0, $1)"},
};

/// GLSL's names, which many programs use in Cg.
constexpr Row GLSL_ROWS[] = {
    {"dFdx", "F(F)", "dFdx($0)"},
    {"dFdy", "F(F)", "dFdy($0)"},
    {"fract", "F(F)", "fract($0)"},
    {"inversesqrt", "F(F)", "inversesqrt($0)"},
    {"mix", "F(F,F,f)", "mix($0, $1, $2)"},
    {"mix", "F(F,F,F)", "mix($0, $1, $2)"},
    {"mod", "F(F,f)", "mod($0, $1)"},
    {"mod", "F(F,F)", "mod($0, $1)"},
    {"atan", "F(F,F)", "atan($0, $1)"},
    {"roundEven", "F(F)", "roundEven($0)"},
    {"equal", "B(N,N)", "equal($0, $1)"},
    {"notEqual", "B(N,N)", "notEqual($0, $1)"},
    {"lessThan", "B(N,N)", "lessThan($0, $1)"},
    {"lessThanEqual", "B(N,N)", "lessThanEqual($0, $1)"},
    {"greaterThan", "B(N,N)", "greaterThan($0, $1)"},
    {"greaterThanEqual", "B(N,N)", "greaterThanEqual($0, $1)"},
    {"texture1D", "4(s1,1)", "texture($0, $1)"},
    {"texture2D", "4(s2,2)", "texture($0, $1)"},
    {"texture2D", "4(s2,2,1)", "texture($0, $1, $2)"},
    {"texture2DLod", "4(s2,2,1)", "textureLod($0, $1, $2)"},
    {"texture2DProj", "4(s2,3)", "textureProj($0, $1)"},
    {"texture2DProj", "4(s2,4)", "textureProj($0, $1)"},
    {"texture2DRect", "4(sR,2)", "texture($0, $1)"},
    {"texture3D", "4(s3,3)", "texture($0, $1)"},
    {"textureCube", "4(sC,3)", "texture($0, $1)"},
};

BuiltinOperand samplerOperand(char dimension, bool isDepth) {
    BuiltinOperand operand;
    operand.kind = BuiltinOperand::Kind::SAMPLER;
    switch (dimension) {
    case '1':
        operand.sampler = isDepth ? Sampler::D1_SHADOW : Sampler::D1;
        break;
    case '2':
        operand.sampler = isDepth ? Sampler::D2_SHADOW : Sampler::D2;
        break;
    case '3':
        operand.sampler = Sampler::D3;
        break;
    case 'R':
        operand.sampler = isDepth ? Sampler::RECT_SHADOW : Sampler::RECT;
        break;
    case 'A':
        operand.sampler = Sampler::D1_ARRAY;
        break;
    case 'B':
        operand.sampler = isDepth ? Sampler::D2_ARRAY_SHADOW : Sampler::D2_ARRAY;
        break;
    default:
        operand.sampler = isDepth ? Sampler::CUBE_SHADOW : Sampler::CUBE;
        break;
    }
    return operand;
}

BuiltinOperand::Kind kindOf(char letter) {
    using Kind = BuiltinOperand::Kind;
    switch (letter) {
    case 'v':
        return Kind::VOID;
    case 't':
        return Kind::TEXT;
    case 'M':
        return Kind::MATRIX;
    case 'T':
        return Kind::TRANSPOSED;
    case 'Q':
        return Kind::SQUARE;
    case 'N':
    case 'n':
        return Kind::NUMBER;
    case 'I':
    case 'i':
        return Kind::INTEGER;
    case 'B':
    case 'b':
        return Kind::BOOLEAN;
    default:
        return Kind::FLOATING;
    }
}

/// Reads one operand of a signature and moves on behind it.
BuiltinOperand readOperand(const char*& at) {
    const auto isDigit = [](char c) { return c >= '1' && c <= '4'; };
    BuiltinOperand operand;
    operand.isOut = *at == 'o';
    if (operand.isOut)
        ++at;
    const char letter = *at++;
    if (letter == 's' || letter == 'z')
        return samplerOperand(*at++, letter == 'z');
    operand.kind = kindOf(letter);
    operand.isFloat = isDigit(letter);
    operand.isVector = letter == 'V';
    if (operand.isFloat)
        operand.size = letter - '0';
    else if (letter == 'n' || letter == 'f' || letter == 'i' || letter == 'b')
        operand.size = 1;
    else if (isDigit(*at))
        operand.size = *at++ - '0';
    return operand;
}

BuiltinFunction read(const Row& row, bool isGlslName) {
    BuiltinFunction function;
    function.name = row.name;
    function.form = row.form;
    function.helper = row.helper;
    function.isGlslName = isGlslName;
    const char* at = row.signature;
    function.result = readOperand(at);
    while (*at == '(' || *at == ',') {
        ++at;
        function.parameters.push_back(readOperand(at));
    }
    const bool comparesDepth = !function.parameters.empty() && isDepthSampler(function.parameters[0].sampler);
    // A projected look-up with four coordinates, one into a 1D texture with two and one with a fourth are
    // mostly meant as plain ones.
    const bool isAmbiguous = function.name.find("proj") != Name::npos || function.name == "tex1D" ||
                             function.name == "texCUBE" || function.name == "tex2DARRAY";
    function.needsShadowName = comparesDepth && isAmbiguous;
    return function;
}

using FunctionMap = std::unordered_map<Name, std::vector<BuiltinFunction>>;

const FunctionMap& functionMap() {
    static const FunctionMap MAP = [] {
        FunctionMap map;
        for (const Row& row : CG_ROWS)
            map[row.name].push_back(read(row, false));
        for (const Row& row : GLSL_ROWS)
            map[row.name].push_back(read(row, true));
        return map;
    }();
    return MAP;
}

/// @return the letter of the scalar kind in front of a typed look-up's name, or 0: `h4tex2D`
char typedLookup(Name name) {
    const bool hasType = name.size() > 5 && (name[0] == 'f' || name[0] == 'h' || name[0] == 'x') &&
                         name[1] >= '1' && name[1] <= '4' && name.substr(2, 3) == "tex";
    return hasType ? name[0] : '\0';
}

} // namespace

BuiltinLookup findBuiltin(Name name) {
    BuiltinLookup lookup;
    if (const char kind = typedLookup(name)) {
        lookup.resultKind = kind;
        lookup.resultSize = name[1] - '0';
        name = name.substr(2);
    }
    const auto found = functionMap().find(name);
    if (found != functionMap().end())
        lookup.functions = &found->second;
    return lookup;
}

std::vector<Name> builtinNames() {
    std::vector<Name> names;
    for (const auto& entry : functionMap())
        names.push_back(entry.first);
    return names;
}

} // namespace cg
