#ifndef CG_COMPILER_COMPILER_H
#define CG_COMPILER_COMPILER_H

#include <functional>
#include <string>
#include <utility>
#include <vector>

/// The compiler's face: Cg source in; GLSL text, listing and parameters out.
///
/// Thread: any; compilations share no state but what a request names. No OpenGL is called.
namespace cg {

class VaryingPlaces;

enum class Stage { VERTEX, FRAGMENT };

/// What the OpenGL context takes. The defaults are the least that is supported: a 3.3 compatibility context
/// whose driver has ARB_separate_shader_objects. More is used only where a program needs it.
struct GlslTarget {
    int version = 330;          ///< highest GLSL version of the context: 330, 400, ..., 460
    bool hasGpuShader5 = false; ///< ARB_gpu_shader5: sampler arrays indexed by a variable, texture gathers
};

/// Reads a file that `#include` asks for.
/// @param path  the path as the preprocessor built it, relative to the including file's folder
/// @param text  receives the file's bytes
/// @return false when there is no such file
using FileReader = std::function<bool(const std::string& path, std::string& text)>;

struct CompileRequest {
    std::string source;   ///< the text to compile
    std::string fileName; ///< its name in the listing, and the folder that its includes start from
    std::string entry;    ///< the entry function's name
    Stage stage = Stage::VERTEX;
    GlslTarget target;
    FileReader reader;                                       ///< empty: no include is found
    std::vector<std::pair<std::string, std::string>> macros; ///< name and text, as if defined in line 0
    std::vector<std::string> includeFolders;                 ///< searched after the including file's folder
    VaryingPlaces* varyingPlaces = nullptr; ///< shared by programs that are to be drawn together; null: none
};

enum class ScalarKind { FLOAT, HALF, FIXED, INT, BOOL };
enum class SamplerKind {
    SAMPLER_1D,
    SAMPLER_2D,
    SAMPLER_3D,
    SAMPLER_RECT,
    SAMPLER_CUBE,
    SAMPLER_1D_ARRAY,
    SAMPLER_2D_ARRAY
};
enum class ParameterClass { SCALAR, VECTOR, MATRIX, SAMPLER, STRUCT, ARRAY };
enum class ParameterDirection { IN, OUT, INOUT };
enum class ParameterVariability { UNIFORM, VARYING, CONSTANT };

/// One parameter of a program, or one member or element of one; the tree has the shape of the Cg types.
///
/// Order in CompileResult::parameters: the entry's parameters as they are declared, its result as "return"
/// where that has a semantic, then the program's global uniforms.
struct Parameter {
    std::string name;     ///< whole, as in the source: `levels`, `levels.gain`, `taps[2].weight`
    std::string semantic; ///< as written, empty where there is none; an inherited one at members: `TEXCOORD1`

    ParameterClass parameterClass = ParameterClass::SCALAR;
    ScalarKind scalarKind = ScalarKind::FLOAT; ///< scalars, vectors, matrices
    SamplerKind samplerKind = SamplerKind::SAMPLER_2D;
    int rows = 1;           ///< as written: 1 for scalars and vectors, 3 for float3x4
    int columns = 1;        ///< as written: 3 for float3, 4 for float3x4
    std::string structName; ///< STRUCT: its type's name, may be empty

    ParameterDirection direction = ParameterDirection::IN;
    ParameterVariability variability = ParameterVariability::UNIFORM;
    bool isGlobal = false;     ///< a global of the program rather than a parameter of the entry
    bool isReferenced = false; ///< the program reads (or, for outputs, writes) it; a STRUCT's: any member

    /// SCALAR, VECTOR, MATRIX: the source's default value, rows * columns floats row by row; empty where the
    /// source gives none (the value is 0 then). The GLSL uniform starts with 0: the runtime sends this.
    std::vector<float> defaults;

    /// The uniform's name in the GLSL text, for glGetUniformLocation. Empty for what is no uniform of the
    /// GLSL program: varyings, structs, what is bound to OpenGL's own state, what was not emitted because
    /// nothing reads it. The driver may still drop a uniform that is named here.
    ///
    /// Matrices go up without a transpose: the rows of the Cg matrix are the columns of the GLSL matrix, so
    /// rows * columns floats row by row are what glUniformMatrix wants with transpose GL_FALSE. A float3x4 is
    /// a mat3x4. A matrix with one row or one column is a GLSL vector (or scalar). An ARRAY of scalars,
    /// vectors, matrices or samplers (one dimension) has the name of its first element, its elements have
    /// theirs: `gains`, `gains[1]`.
    std::string glslName;

    int textureUnit = -1;     ///< SAMPLER: n of a semantic TEXUNITn, else -1
    std::string stateBinding; ///< `state.matrix.mvp` or what else the semantic names of OpenGL's own state

    std::vector<Parameter> children; ///< STRUCT: members in order; ARRAY: elements in order
};

struct CompileResult {
    bool ok = false;
    std::string glsl; ///< the whole shader, from #version on; empty unless ok
    /// Errors and warnings, one a line: `file(line) : error: what and why`, in the order of the source.
    std::string listing;
    std::vector<Parameter> parameters; ///< empty unless ok
};

/// Compiles one entry of a program. Never throws but for memory exhaustion; any bytes are taken as source.
CompileResult compile(const CompileRequest& request);

} // namespace cg

#endif
