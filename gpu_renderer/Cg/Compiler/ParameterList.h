#ifndef CG_COMPILER_PARAMETER_LIST_H
#define CG_COMPILER_PARAMETER_LIST_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class GlslEmitter;
class References;

/// The program's parameters as the runtime shows them.
/// @param emitter  after emit(): knows the GLSL names
std::vector<Parameter> listParameters(const TypedProgram& program, const References& references,
                                      GlslEmitter& emitter);

} // namespace cg

#endif
