#ifndef CG_COMPILER_HELPER_FUNCTIONS_H
#define CG_COMPILER_HELPER_FUNCTIONS_H

#include <Cg/Compiler/SyntaxTree.h>

#include <string>

/// Functions of our own in GLSL, for what Cg has and GLSL lacks.
namespace cg {

struct HelperFunction {
    std::string text; ///< its GLSL definition; equal texts are one function
    Name needs;       ///< name of the helper that it calls (for scalars), or empty
};

/// The helper function that a GLSL form calls.
/// @param type  GLSL type of its first operand: `float` to `vec4`, the same of ints or bools, or `mat2x3`
HelperFunction findHelper(Name name, const std::string& type);

} // namespace cg

#endif
