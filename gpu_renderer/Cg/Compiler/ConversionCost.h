#ifndef CG_COMPILER_CONVERSION_COST_H
#define CG_COMPILER_CONVERSION_COST_H

#include <Cg/Compiler/TypedTree.h>

namespace cg {

constexpr int IMPOSSIBLE_CONVERSION = -1;

/// What it costs Cg to pass an expression where a type is wanted, by which it chooses among overloads: 0 for
/// the same type, IMPOSSIBLE_CONVERSION where there is no silent conversion.
int conversionCost(const TypedExpr* from, const Type* to);

} // namespace cg

#endif
