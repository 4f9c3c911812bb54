#ifndef CG_COMPILER_TYPES_H
#define CG_COMPILER_TYPES_H

#include <Cg/Compiler/SyntaxTree.h>

#include <array>
#include <map>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

/// The types of a program. Each type exists once per compilation, so types are compared by pointer.
namespace cg {

/// In the order in which the arithmetic of two kinds yields the later one. `double` is FLOAT, `char`, `short`
/// and `long` are INT.
enum class Scalar { BOOL, INT, UINT, FIXED, HALF, FLOAT };

constexpr bool isFloating(Scalar scalar) {
    return scalar >= Scalar::FIXED;
}

/// ANY is the bare word `sampler`, until a look-up says which; a sampler becomes a SHADOW one when a look-up
/// compares depths.
enum class Sampler {
    ANY,
    D1,
    D2,
    D3,
    RECT,
    CUBE,
    D1_ARRAY,
    D2_ARRAY,
    D1_SHADOW,
    D2_SHADOW,
    RECT_SHADOW,
    CUBE_SHADOW,
    D2_ARRAY_SHADOW
};

struct StructType;

struct Type {
    enum class Kind { VOID, SCALAR, VECTOR, MATRIX, SAMPLER, STRUCT, ARRAY, TEXT };

    static constexpr int UNSIZED = -1;

    Kind kind = Kind::VOID;
    Scalar scalar = Scalar::FLOAT;   ///< SCALAR, VECTOR, MATRIX
    int rows = 1;                    ///< MATRIX
    int columns = 1;                 ///< VECTOR (2 to 4), MATRIX
    Sampler sampler = Sampler::ANY;  ///< SAMPLER
    StructType* structure = nullptr; ///< STRUCT
    const Type* element = nullptr;   ///< ARRAY
    int length = UNSIZED;            ///< ARRAY

    bool isVoid() const { return kind == Kind::VOID; }
    bool isScalar() const { return kind == Kind::SCALAR; }
    bool isVector() const { return kind == Kind::VECTOR; }
    bool isMatrix() const { return kind == Kind::MATRIX; }
    bool isScalarOrVector() const { return isScalar() || isVector(); }
    bool isNumeric() const { return isScalarOrVector() || isMatrix(); }
    bool isSampler() const { return kind == Kind::SAMPLER; }
    bool isStruct() const { return kind == Kind::STRUCT; }
    bool isArray() const { return kind == Kind::ARRAY; }
    bool isUnsizedArray() const { return isArray() && length == UNSIZED; }
    int components() const { return rows * columns; }

    /// A matrix with one row or one column is a vector in GLSL, which has no such matrices.
    bool isThinMatrix() const { return isMatrix() && (rows == 1 || columns == 1); }
    bool isFullMatrix() const { return isMatrix() && !isThinMatrix(); }
};

struct Field {
    Name name;
    const Type* type;
    const VariableDecl* declaration;
};

struct StructType {
    using Positions = std::unordered_map<Name, int>;

    Name name; ///< empty for a nameless one
    const StructDecl* declaration;
    std::vector<Field> fields;             ///< grows by add()
    Positions positions;                   ///< of the first field of each name
    int leaves = 0;                        ///< of all fields, as countLeaves() counts
    const StructDecl* interface = nullptr; ///< what it implements
    bool hasSamplers = false;              ///< at any depth

    void add(const Field& field);

    /// @return position in `fields`, or -1
    int find(Name field) const;
};

/// Maker and owner of the types of one compilation.
class TypeTable {
public:
    explicit TypeTable(Arena& arena);

    const Type* voidType() const { return mVoid; }
    const Type* text() const { return mText; }
    const Type* scalar(Scalar scalar) const { return vector(scalar, 1); }

    /// @param size  1 to 4; 1 gives the scalar
    const Type* vector(Scalar scalar, int size) const;

    /// Matrices hold floating kinds only; other kinds become FLOAT. 1 by 1 gives the scalar.
    const Type* matrix(Scalar scalar, int rows, int columns) const;

    const Type* sampler(Sampler sampler) const;
    const Type* array(const Type* element, int length);

    /// @return a new type for a declared struct, with no fields yet
    const Type* makeStruct(const StructDecl* declaration);

    /// Same shape, another scalar kind.
    const Type* withScalar(const Type* type, Scalar scalar) const;

    /// All structs in the order in which they were first used; a struct comes after those that it contains.
    const std::vector<const Type*>& structs() const { return mStructs; }
    void noteStruct(const Type* type) { mStructs.push_back(type); }

    /// @return the built-in type of that name (`half3x4`, `samplerCUBE`, `unsigned`, `vec2`, ...), or null
    const Type* find(Name name) const;

private:
    static constexpr int SCALARS = 6;
    static constexpr int SAMPLERS = 13;
    static constexpr int MAX_SIZE = 4;

    Arena& mArena;
    const Type* mVoid;
    const Type* mText;
    std::array<std::array<std::array<const Type*, MAX_SIZE>, MAX_SIZE>, SCALARS> mNumeric{};
    std::array<std::array<const Type*, MAX_SIZE>, SCALARS> mVectors{};
    std::array<const Type*, SAMPLERS> mSamplers{};
    std::map<std::pair<const Type*, int>, const Type*> mArrays;
    std::vector<const Type*> mStructs;
};

/// The most common names of built-in types, for "did you mean".
std::vector<Name> builtinTypeNames();

/// @return the type as a programmer writes it: `float3x4`, `Light[2]`
std::string nameOf(const Type* type);

/// @return the scalar kind's name: `half`
const char* nameOf(Scalar scalar);

/// What an array holds at last, within arrays of arrays; another type itself.
const Type* innermost(const Type* type);

/// Elements of an array, those of arrays within it counted singly: GLSL's arrays are flat. 1 for other types.
int flatLength(const Type* type);

bool containsSampler(const Type* type);

bool isDepthSampler(Sampler sampler); ///< one whose look-ups compare a depth

/// Samplers of one texture's kind, whether they compare a depth or not; ANY is like all of them.
bool areSameTexture(Sampler a, Sampler b);

/// A sampler or an array of samplers: nothing that a GLSL struct of ours holds.
bool isOpaque(const Type* type);

/// The type is a struct that implements the interface.
bool implements(const Type* type, const Type* interface);

/// Number of scalars, samplers and elements in all; counts no further than `limit`.
int countLeaves(const Type* type, int limit);

} // namespace cg

#endif
