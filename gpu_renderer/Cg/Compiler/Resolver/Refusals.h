#ifndef CG_COMPILER_RESOLVER_REFUSALS_H
#define CG_COMPILER_RESOLVER_REFUSALS_H

#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <vector>

/// What is said of a name that nobody knows, and of a call that no function takes.
namespace cg {

/// @return "; did you mean 'length'?", or nothing
std::string suggestion(Name name, const std::vector<Name>& known);

/// @return "no matching function 'clamp' for (float3, sampler2D)"
std::string noMatchingFunction(Name name, const std::vector<TypedExpr*>& arguments);

} // namespace cg

#endif
