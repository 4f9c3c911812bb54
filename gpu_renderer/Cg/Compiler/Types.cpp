#include <Cg/Compiler/Types.h>

#include <algorithm>
#include <cstdint>
#include <limits>

namespace cg {

namespace {

constexpr Scalar ALL_SCALARS[] = {Scalar::BOOL,  Scalar::INT,  Scalar::UINT,
                                  Scalar::FIXED, Scalar::HALF, Scalar::FLOAT};

struct NamedScalar {
    Name name;
    Scalar scalar;
};

constexpr NamedScalar SCALAR_NAMES[] = {
    {"float", Scalar::FLOAT}, {"half", Scalar::HALF},     {"fixed", Scalar::FIXED},
    {"int", Scalar::INT},     {"bool", Scalar::BOOL},     {"double", Scalar::FLOAT},
    {"uint", Scalar::UINT},   {"unsigned", Scalar::UINT}, {"short", Scalar::INT},
    {"char", Scalar::INT},    {"long", Scalar::INT},      {"ushort", Scalar::UINT},
    {"uchar", Scalar::UINT},  {"ulong", Scalar::UINT},    {"cfloat", Scalar::FLOAT},
    {"cint", Scalar::INT}};

struct NamedSampler {
    Name name;
    Sampler sampler;
};

constexpr NamedSampler SAMPLER_NAMES[] = {{"sampler", Sampler::ANY},
                                          {"sampler1D", Sampler::D1},
                                          {"sampler2D", Sampler::D2},
                                          {"sampler3D", Sampler::D3},
                                          {"samplerRECT", Sampler::RECT},
                                          {"samplerCUBE", Sampler::CUBE},
                                          {"sampler1DARRAY", Sampler::D1_ARRAY},
                                          {"sampler2DARRAY", Sampler::D2_ARRAY},
                                          {"sampler2DRect", Sampler::RECT},
                                          {"texobj1D", Sampler::D1},
                                          {"texobj2D", Sampler::D2},
                                          {"texobj3D", Sampler::D3},
                                          {"texobjRECT", Sampler::RECT},
                                          {"texobjCUBE", Sampler::CUBE},
                                          {"samplerCube", Sampler::CUBE},
                                          {"sampler1DShadow", Sampler::D1_SHADOW},
                                          {"sampler2DShadow", Sampler::D2_SHADOW},
                                          {"samplerCubeShadow", Sampler::CUBE_SHADOW},
                                          {"sampler1DArray", Sampler::D1_ARRAY},
                                          {"sampler2DArray", Sampler::D2_ARRAY}};

/// GLSL's own words for what Cg calls float2 and so on.
struct GlslVector {
    Name prefix;
    Scalar scalar;
};

constexpr GlslVector GLSL_VECTORS[] = {
    {"vec", Scalar::FLOAT}, {"ivec", Scalar::INT}, {"bvec", Scalar::BOOL}, {"uvec", Scalar::UINT}};

bool startsWith(Name text, Name prefix) {
    return text.substr(0, prefix.size()) == prefix;
}

bool isSize(char c) {
    return c >= '1' && c <= '4';
}

/// The sampler that compares no depth.
Sampler withoutDepth(Sampler sampler) {
    switch (sampler) {
    case Sampler::D1_SHADOW:
        return Sampler::D1;
    case Sampler::D2_SHADOW:
        return Sampler::D2;
    case Sampler::RECT_SHADOW:
        return Sampler::RECT;
    case Sampler::CUBE_SHADOW:
        return Sampler::CUBE;
    case Sampler::D2_ARRAY_SHADOW:
        return Sampler::D2_ARRAY;
    default:
        return sampler;
    }
}

} // namespace

int StructType::find(Name field) const {
    const auto found = positions.find(field);
    return found == positions.end() ? -1 : found->second;
}

void StructType::add(const Field& field) {
    constexpr int MOST = std::numeric_limits<int>::max();
    leaves =
        static_cast<int>(std::min<std::int64_t>(MOST, std::int64_t{leaves} + countLeaves(field.type, MOST)));
    positions.emplace(field.name, static_cast<int>(fields.size()));
    fields.push_back(field);
}

TypeTable::TypeTable(Arena& arena) : mArena(arena) {
    const auto make = [&arena](Type::Kind kind) {
        auto* type = arena.make<Type>();
        type->kind = kind;
        return type;
    };
    mVoid = make(Type::Kind::VOID);
    mText = make(Type::Kind::TEXT);
    for (const Scalar scalar : ALL_SCALARS)
        for (int size = 1; size <= MAX_SIZE; ++size) {
            auto* type = make(size == 1 ? Type::Kind::SCALAR : Type::Kind::VECTOR);
            type->scalar = scalar;
            type->columns = size;
            mVectors[static_cast<std::size_t>(scalar)][static_cast<std::size_t>(size - 1)] = type;
        }
    for (const Scalar scalar : ALL_SCALARS)
        for (int rows = 1; rows <= MAX_SIZE; ++rows)
            for (int columns = 1; columns <= MAX_SIZE; ++columns) {
                auto* type = make(Type::Kind::MATRIX);
                type->scalar = scalar;
                type->rows = rows;
                type->columns = columns;
                mNumeric[static_cast<std::size_t>(scalar)][static_cast<std::size_t>(rows - 1)]
                        [static_cast<std::size_t>(columns - 1)] = type;
            }
    int sampler = 0;
    for (const Type*& slot : mSamplers) {
        auto* type = make(Type::Kind::SAMPLER);
        type->sampler = static_cast<Sampler>(sampler++);
        slot = type;
    }
}

const Type* TypeTable::vector(Scalar scalar, int size) const {
    return mVectors[static_cast<std::size_t>(scalar)][static_cast<std::size_t>(size - 1)];
}

const Type* TypeTable::matrix(Scalar scalar, int rows, int columns) const {
    if (!isFloating(scalar))
        scalar = Scalar::FLOAT;
    if (rows == 1 && columns == 1)
        return vector(scalar, 1);
    return mNumeric[static_cast<std::size_t>(scalar)][static_cast<std::size_t>(rows - 1)]
                   [static_cast<std::size_t>(columns - 1)];
}

const Type* TypeTable::sampler(Sampler sampler) const {
    return mSamplers[static_cast<std::size_t>(sampler)];
}

const Type* TypeTable::array(const Type* element, int length) {
    const Type*& slot = mArrays[{element, length}];
    if (!slot) {
        auto* type = mArena.make<Type>();
        type->kind = Type::Kind::ARRAY;
        type->element = element;
        type->length = length;
        slot = type;
    }
    return slot;
}

const Type* TypeTable::makeStruct(const StructDecl* declaration) {
    auto* structure = mArena.make<StructType>();
    structure->name = declaration->name;
    structure->declaration = declaration;
    auto* type = mArena.make<Type>();
    type->kind = Type::Kind::STRUCT;
    type->structure = structure;
    return type;
}

const Type* TypeTable::withScalar(const Type* type, Scalar scalar) const {
    if (type->isMatrix())
        return matrix(scalar, type->rows, type->columns);
    return type->isScalarOrVector() ? vector(scalar, type->columns) : type;
}

const Type* TypeTable::find(Name name) const {
    if (name == "void")
        return mVoid;
    // Texts and the textures of effect files are named by programs and used by none.
    if (name == "string" || name == "texture" || name == "textureCUBE" || name == "textureRECT")
        return mText;
    for (const auto& [prefix, scalar] : SCALAR_NAMES) {
        if (!startsWith(name, prefix))
            continue;
        const Name size = name.substr(prefix.size());
        if (size.empty())
            return this->scalar(scalar);
        if (size.size() == 1 && isSize(size[0]))
            return vector(scalar, size[0] - '0');
        if (size.size() == 3 && isSize(size[0]) && size[1] == 'x' && isSize(size[2]))
            return matrix(scalar, size[0] - '0', size[2] - '0');
    }
    for (const auto& [word, sampler] : SAMPLER_NAMES)
        if (name == word)
            return this->sampler(sampler);
    for (const auto& [prefix, scalar] : GLSL_VECTORS)
        if (startsWith(name, prefix) && name.size() == prefix.size() + 1 && isSize(name.back()))
            return vector(scalar, name.back() - '0');
    if (name == "vector")
        return vector(Scalar::FLOAT, MAX_SIZE);
    if (name == "matrix")
        return matrix(Scalar::FLOAT, MAX_SIZE, MAX_SIZE);
    if (startsWith(name, "mat") && name.size() == 4 && isSize(name[3]))
        return matrix(Scalar::FLOAT, name[3] - '0', name[3] - '0');
    return nullptr;
}

std::vector<Name> builtinTypeNames() {
    std::vector<Name> names = {"float2",   "float3",  "float4", "float2x2", "float3x3", "float3x4",
                               "float4x4", "half2",   "half3",  "half4",    "fixed2",   "fixed3",
                               "fixed4",   "int2",    "int3",   "int4",     "bool2",    "bool3",
                               "bool4",    "half4x4", "void",   "string"};
    for (const NamedScalar& known : SCALAR_NAMES)
        names.push_back(known.name);
    for (const NamedSampler& known : SAMPLER_NAMES)
        names.push_back(known.name);
    return names;
}

const char* nameOf(Scalar scalar) {
    constexpr const char* NAMES[] = {"bool", "int", "uint", "fixed", "half", "float"};
    return NAMES[static_cast<std::size_t>(scalar)];
}

std::string nameOf(const Type* type) {
    switch (type->kind) {
    case Type::Kind::VOID:
        return "void";
    case Type::Kind::TEXT:
        return "string";
    case Type::Kind::SCALAR:
        return nameOf(type->scalar);
    case Type::Kind::VECTOR:
        return nameOf(type->scalar) + std::to_string(type->columns);
    case Type::Kind::MATRIX:
        return nameOf(type->scalar) + std::to_string(type->rows) + "x" + std::to_string(type->columns);
    case Type::Kind::SAMPLER: {
        constexpr const char* NAMES[] = {"sampler",       "sampler1D",   "sampler2D",      "sampler3D",
                                         "samplerRECT",   "samplerCUBE", "sampler1DARRAY", "sampler2DARRAY",
                                         "sampler1D",     "sampler2D",   "samplerRECT",    "samplerCUBE",
                                         "sampler2DARRAY"};
        return NAMES[static_cast<std::size_t>(type->sampler)];
    }
    case Type::Kind::STRUCT:
        return type->structure->name.empty() ? "struct" : std::string(type->structure->name);
    case Type::Kind::ARRAY:
        break;
    }
    std::string dimensions;
    for (; type->isArray(); type = type->element)
        dimensions += type->length == Type::UNSIZED ? "[]" : "[" + std::to_string(type->length) + "]";
    return nameOf(type) + dimensions;
}

bool isDepthSampler(Sampler sampler) {
    return sampler >= Sampler::D1_SHADOW;
}

bool areSameTexture(Sampler a, Sampler b) {
    return a == Sampler::ANY || b == Sampler::ANY || withoutDepth(a) == withoutDepth(b);
}

const Type* innermost(const Type* type) {
    while (type->isArray())
        type = type->element;
    return type;
}

int flatLength(const Type* type) {
    int length = 1;
    for (; type->isArray(); type = type->element)
        length *= type->length;
    return length;
}

bool containsSampler(const Type* type) {
    type = innermost(type);
    return type->isSampler() || (type->isStruct() && type->structure->hasSamplers);
}

bool isOpaque(const Type* type) {
    return innermost(type)->isSampler();
}

bool implements(const Type* type, const Type* interface) {
    return type->isStruct() && interface->isStruct() && type->structure->interface &&
           type->structure->interface == interface->structure->declaration;
}

int countLeaves(const Type* type, int limit) {
    if (type->isArray()) {
        const std::int64_t each = countLeaves(type->element, limit);
        return static_cast<int>(std::min<std::int64_t>(limit, each * std::max(type->length, 0)));
    }
    return std::min(limit, type->isStruct() ? type->structure->leaves : type->components());
}

} // namespace cg
