#include <Cg/Compiler/HelperFunctions.h>

#include <cctype>

namespace cg {

namespace {

struct Helper {
    const char* name;
    const char* text;
    const char* needs = "";
};

/// Helper functions. One that names T exists once for each type T that it is called with: B is the same of
/// bools, N its number of components. A name with a 1 behind it is the one for scalars. Of a matrix B and N
/// are those of a row, R is the number of its rows.
constexpr Helper HELPERS[] = {
    {"cg_fmod", "T cg_fmod(T x, T y) { return x - y * trunc(x / y); }"},
    {"cg_remainder", "T cg_remainder(T x, T y) { return x - y * (x / y); }"},
    {"cg_ldexp", "T cg_ldexp(T x, T exponent) { return x * exp2(exponent); }"},
    {"cg_log10", "T cg_log10(T x) { return log2(x) * 0.301029996; }"},
    {"cg_lattice", "float cg_lattice(ivec3 p) {\n"
                   "    uint h = uint(p.x) * 1664525u ^ uint(p.y) * 22695477u ^ uint(p.z) * 747796405u;\n"
                   "    h = (h ^ (h >> 16)) * 2246822519u;\n"
                   "    h = (h ^ (h >> 13)) * 3266489917u;\n"
                   "    return float((h ^ (h >> 16)) >> 8) / 16777215.0;\n"
                   "}"},
    {"cg_noise",
     "float cg_noise(vec3 p) {\n"
     "    vec3 cell = floor(p);\n"
     "    vec3 t = p - cell;\n"
     "    t = t * t * (3.0 - 2.0 * t);\n"
     "    ivec3 i = ivec3(cell);\n"
     "    vec4 near = vec4(cg_lattice(i), cg_lattice(i + ivec3(1, 0, 0)), cg_lattice(i + ivec3(0, 1, 0)),\n"
     "                     cg_lattice(i + ivec3(1, 1, 0)));\n"
     "    vec4 far = vec4(cg_lattice(i + ivec3(0, 0, 1)), cg_lattice(i + ivec3(1, 0, 1)),\n"
     "                    cg_lattice(i + ivec3(0, 1, 1)), cg_lattice(i + ivec3(1, 1, 1)));\n"
     "    vec4 faces = mix(near, far, t.z);\n"
     "    vec2 edges = mix(faces.xy, faces.zw, t.y);\n"
     "    return mix(edges.x, edges.y, t.x);\n"
     "}",
     "cg_lattice"},
    {"cg_mad", "T cg_mad(T a, T b, T c) { return a * b + c; }"},
    {"cg_rcp", "T cg_rcp(T x) { return 1.0 / x; }"},
    {"cg_sincos", "void cg_sincos(T x, out T s, out T c) {\n    s = sin(x);\n    c = cos(x);\n}"},
    {"cg_isfinite", "B cg_isfinite(T x) { return lessThan(abs(x), T(3.4028235e38)); }"},
    {"cg_isfinite1", "bool cg_isfinite(float x) { return abs(x) <= 3.4028235e38; }"},
    {"cg_frexp1", "float cg_frexp(float x, out float exponent) {\n"
                  "    exponent = 0.0;\n"
                  "    if (x == 0.0)\n"
                  "        return 0.0;\n"
                  "    int bits = floatBitsToInt(x);\n"
                  "    exponent = float(((bits >> 23) & 255) - 126);\n"
                  "    return intBitsToFloat((bits & ~0x7F800000) | 0x3F000000);\n"
                  "}"},
    {"cg_frexp",
     "T cg_frexp(T x, out T exponent) {\n"
     "    for (int i = 0; i < N; ++i) {\n"
     "        float e;\n"
     "        x[i] = cg_frexp(x[i], e);\n"
     "        exponent[i] = e;\n"
     "    }\n"
     "    return x;\n"
     "}",
     "cg_frexp1"},
    {"cg_dst", "vec4 cg_dst(vec4 a, vec4 b) { return vec4(1.0, a.y * b.y, a.z, b.w); }"},
    {"cg_lit", "vec4 cg_lit(float diffuse, float specular, float shininess) {\n"
               "    float highlight = diffuse > 0.0 ? pow(max(0.0, specular), shininess) : 0.0;\n"
               "    return vec4(1.0, max(0.0, diffuse), highlight, 1.0);\n"
               "}"},
    {"cg_clip1", "void cg_clip(float x) {\n    if (x < 0.0)\n        discard;\n}"},
    {"cg_clip", "void cg_clip(T x) {\n    if (any(lessThan(x, T(0.0))))\n        discard;\n}"},
    {"cg_debug", "void cg_debug(vec4 colour) {}"},
    {"cg_depth", "vec4 cg_depth(float lit) { return vec4(lit, lit, lit, 1.0); }"},
    {"cg_select", "T cg_select(B condition, T a, T b) {\n"
                  "    for (int i = 0; i < N; ++i)\n"
                  "        if (condition[i])\n"
                  "            b[i] = a[i];\n"
                  "    return b;\n"
                  "}"},
    {"cg_all", "bool cg_all(T m) {\n"
               "    bool result = true;\n"
               "    for (int i = 0; i < R; ++i)\n"
               "        result = result && all(B(m[i]));\n"
               "    return result;\n"
               "}"},
    {"cg_any", "bool cg_any(T m) {\n"
               "    bool result = false;\n"
               "    for (int i = 0; i < R; ++i)\n"
               "        result = result || any(B(m[i]));\n"
               "    return result;\n"
               "}"},
    {"cg_and",
     "T cg_and(T a, T b) {\n    for (int i = 0; i < N; ++i)\n        a[i] = a[i] && b[i];\n    return a;\n}"},
    {"cg_or",
     "T cg_or(T a, T b) {\n    for (int i = 0; i < N; ++i)\n        a[i] = a[i] || b[i];\n    return a;\n}"},
    {"cg_bitCount", "T cg_bitCount(T x) {\n"
                    "    T count = T(0);\n"
                    "    for (int bit = 0; bit < 32; ++bit)\n"
                    "        count += (x >> bit) & 1;\n"
                    "    return count;\n"
                    "}"},
    {"cg_bitfieldExtract", "T cg_bitfieldExtract(T x, int offset, int bits) {\n"
                           "    return (x >> offset) & (bits == 32 ? ~0 : (1 << bits) - 1);\n"
                           "}"},
    {"cg_bitfieldInsert", "T cg_bitfieldInsert(T base, T insert, int offset, int bits) {\n"
                          "    int mask = (bits == 32 ? ~0 : (1 << bits) - 1) << offset;\n"
                          "    return (base & ~mask) | ((insert << offset) & mask);\n"
                          "}"},
    {"cg_bitfieldReverse", "T cg_bitfieldReverse(T x) {\n"
                           "    T r = T(0);\n"
                           "    for (int bit = 0; bit < 32; ++bit)\n"
                           "        r |= ((x >> bit) & 1) << (31 - bit);\n"
                           "    return r;\n"
                           "}"},
    {"cg_findLSB1", "int cg_findLSB(int x) {\n"
                    "    for (int bit = 0; bit < 32; ++bit)\n"
                    "        if (((x >> bit) & 1) != 0)\n"
                    "            return bit;\n"
                    "    return -1;\n"
                    "}"},
    {"cg_findMSB1", "int cg_findMSB(int x) {\n"
                    "    int y = x < 0 ? ~x : x;\n"
                    "    for (int bit = 30; bit >= 0; --bit)\n"
                    "        if (((y >> bit) & 1) != 0)\n"
                    "            return bit;\n"
                    "    return -1;\n"
                    "}"},
    {"cg_findLSB",
     "T cg_findLSB(T x) {\n    for (int i = 0; i < N; ++i)\n        x[i] = cg_findLSB(x[i]);\n    return "
     "x;\n}",
     "cg_findLSB1"},
    {"cg_findMSB",
     "T cg_findMSB(T x) {\n    for (int i = 0; i < N; ++i)\n        x[i] = cg_findMSB(x[i]);\n    return "
     "x;\n}",
     "cg_findMSB1"},
    {"cg_half_bits", "uint cg_half_bits(float x) {\n"
                     "    uint bits = floatBitsToUint(x);\n"
                     "    uint sign = (bits >> 16) & 0x8000u;\n"
                     "    uint magnitude = bits & 0x7FFFFFFFu;\n"
                     "    if (magnitude >= 0x47800000u)\n"
                     "        return sign | (magnitude > 0x7F800000u ? 0x7E00u : 0x7C00u);\n"
                     "    if (magnitude < 0x38800000u)\n"
                     "        return sign | uint(roundEven(abs(x) * 16777216.0));\n"
                     "    uint rounded = magnitude + 0xFFFu + ((magnitude >> 13) & 1u);\n"
                     "    return sign | ((rounded - 0x38000000u) >> 13);\n"
                     "}"},
    {"cg_half_value", "float cg_half_value(uint bits) {\n"
                      "    uint exponent = (bits >> 10) & 31u;\n"
                      "    float sign = (bits & 0x8000u) != 0u ? -1.0 : 1.0;\n"
                      "    if (exponent == 0u)\n"
                      "        return sign * float(bits & 0x3FFu) / 16777216.0;\n"
                      "    uint magnitude = exponent == 31u ? 0x7F800000u : (exponent + 112u) << 23;\n"
                      "    return sign * uintBitsToFloat(magnitude | ((bits & 0x3FFu) << 13));\n"
                      "}"},
    {"cg_pack_2half",
     "float cg_pack_2half(vec2 a) { return uintBitsToFloat(cg_half_bits(a.x) | (cg_half_bits(a.y) << 16)); }",
     "cg_half_bits"},
    {"cg_unpack_2half",
     "vec2 cg_unpack_2half(float a) {\n"
     "    uint bits = floatBitsToUint(a);\n"
     "    return vec2(cg_half_value(bits & 0xFFFFu), cg_half_value(bits >> 16));\n"
     "}",
     "cg_half_value"},
    {"cg_pack_2ushort", "float cg_pack_2ushort(vec2 a) {\n"
                        "    uvec2 u = uvec2(roundEven(clamp(a, 0.0, 1.0) * 65535.0));\n"
                        "    return uintBitsToFloat(u.x | (u.y << 16));\n"
                        "}"},
    {"cg_unpack_2ushort", "vec2 cg_unpack_2ushort(float a) {\n"
                          "    uint bits = floatBitsToUint(a);\n"
                          "    return vec2(float(bits & 0xFFFFu), float(bits >> 16)) / 65535.0;\n"
                          "}"},
    {"cg_pack_4byte", "float cg_pack_4byte(vec4 a) {\n"
                      "    uvec4 u = uvec4(roundEven(clamp(a, -128.0 / 127.0, 1.0) * 127.0 + 128.0));\n"
                      "    return uintBitsToFloat(u.x | (u.y << 8) | (u.z << 16) | (u.w << 24));\n"
                      "}"},
    {"cg_unpack_4byte", "vec4 cg_unpack_4byte(float a) {\n"
                        "    uvec4 u = (uvec4(floatBitsToUint(a)) >> uvec4(0, 8, 16, 24)) & 0xFFu;\n"
                        "    return (vec4(u) - 128.0) / 127.0;\n"
                        "}"},
    {"cg_pack_4ubyte", "float cg_pack_4ubyte(vec4 a) {\n"
                       "    uvec4 u = uvec4(roundEven(clamp(a, 0.0, 1.0) * 255.0));\n"
                       "    return uintBitsToFloat(u.x | (u.y << 8) | (u.z << 16) | (u.w << 24));\n"
                       "}"},
    {"cg_unpack_4ubyte", "vec4 cg_unpack_4ubyte(float a) {\n"
                         "    uvec4 u = (uvec4(floatBitsToUint(a)) >> uvec4(0, 8, 16, 24)) & 0xFFu;\n"
                         "    return vec4(u) / 255.0;\n"
                         "}"},
};

const Helper* findRow(Name name) {
    for (const Helper& helper : HELPERS)
        if (name == helper.name)
            return &helper;
    return nullptr;
}

} // namespace

HelperFunction findHelper(Name name, const std::string& type) {
    HelperFunction result;
    const bool isMatrix = type.rfind("mat", 0) == 0;
    const int size = isMatrix || type.find("vec") != std::string::npos ? type.back() - '0' : 1;
    const Helper* helper = size == 1 ? findRow(std::string(name) + "1") : nullptr;
    if (!helper)
        helper = findRow(name);
    if (!helper)
        return result;
    result.needs = helper->needs;
    const std::string bools = size == 1 ? "bool" : "bvec" + std::to_string(size);
    const Name text = helper->text;
    const auto isWord = [&](std::size_t at) {
        const auto continues = [&](std::size_t i) {
            return i < text.size() &&
                   (std::isalnum(static_cast<unsigned char>(text[i])) != 0 || text[i] == '_');
        };
        return !continues(at + 1) && (at == 0 || !continues(at - 1));
    };
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool isPlaceholder = Name("TBNR").find(text[i]) != Name::npos && isWord(i);
        if (!isPlaceholder)
            result.text += text[i];
        else if (text[i] == 'N')
            result.text += std::to_string(size);
        else if (text[i] == 'R')
            result.text += isMatrix ? type[3] : '1';
        else
            result.text += text[i] == 'T' ? type : bools;
    }
    return result;
}

} // namespace cg
