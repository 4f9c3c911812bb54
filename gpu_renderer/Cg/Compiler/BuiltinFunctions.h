#ifndef CG_COMPILER_BUILTIN_FUNCTIONS_H
#define CG_COMPILER_BUILTIN_FUNCTIONS_H

#include <Cg/Compiler/Types.h>

#include <vector>

/// Cg's standard library as a table: what each function takes, and what it is in GLSL.
namespace cg {

/// One parameter or result of a built-in function.
struct BuiltinOperand {
    enum class Kind {
        VOID,
        NUMBER,     ///< vector of the row's shared size and scalar kind; integers stay integers
        FLOATING,   ///< the same; integers become floats
        INTEGER,    ///< the same, always an integer
        BOOLEAN,    ///< the same size, always bool
        MATRIX,     ///< any matrix
        TRANSPOSED, ///< the matrix argument's transposed type
        SQUARE,     ///< a matrix with as many rows as columns
        SAMPLER,
        TEXT
    };

    static constexpr int SHARED = 0;

    Kind kind = Kind::VOID;
    int size = SHARED;     ///< number of components, or the size that the generic operands share
    bool isFloat = false;  ///< FLOATING: always `float`, whatever the other operands are
    bool isVector = false; ///< FLOATING: takes no matrix row by row
    bool isOut = false;
    Sampler sampler = Sampler::ANY;
};

struct BuiltinFunction {
    Name name;
    BuiltinOperand result;
    std::vector<BuiltinOperand> parameters;

    /// GLSL text: $0, $1, ... are the arguments, `$1.xyw` components of one.
    Name form;
    Name helper;                  ///< name of the helper function that the form calls, or empty
    bool isGlslName = false;      ///< not Cg's: only where the program has no function of that name
    bool needsShadowName = false; ///< only for samplers whose name says that they hold a shadow map
};

/// All functions of that name; a typed look-up such as `h3tex2D` is found under its plain name.
/// @param result  receives the type's scalar kind and size that a typed name asks for: 'h' and 3; 0 else
struct BuiltinLookup {
    const std::vector<BuiltinFunction>* functions = nullptr; ///< null where there is none
    char resultKind = 0;                                     ///< 'f', 'h' or 'x'
    int resultSize = 0;
};
BuiltinLookup findBuiltin(Name name);

/// Names of all built-in functions, for "did you mean".
std::vector<Name> builtinNames();

} // namespace cg

#endif
