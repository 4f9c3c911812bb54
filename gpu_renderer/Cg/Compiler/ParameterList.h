#ifndef CG_COMPILER_PARAMETER_LIST_H
#define CG_COMPILER_PARAMETER_LIST_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class GlslSymbols;
class References;

/// The program's parameters as the runtime shows them.
/// @param symbols  after the shader was written: knows the GLSL names
std::vector<Parameter> listParameters(const TypedProgram& program, const References& references,
                                      GlslSymbols& symbols);

} // namespace cg

#endif
