#ifndef CG_COMPILER_FLAT_BRANCHES_H
#define CG_COMPILER_FLAT_BRANCHES_H

#include <Cg/Compiler/Arena.h>
#include <Cg/Compiler/TypedTree.h>

namespace cg {

/// Rewrites what drivers would nest too deeply.
///
/// Drivers take an `else if`, a `switch`'s section and whatever comes behind an early `return` as one level
/// of nesting more. Software renderers draw wrongly, without an error, behind 80 of them or even 32. Long
/// ones become rows that stand one after another, each behind a flag that nothing before was taken.
void flattenBranches(TypedProgram& program, const TypeTable& types, Arena& arena);

} // namespace cg

#endif
