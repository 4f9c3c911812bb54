#ifndef CG_COMPILER_RESOLVER_SWIZZLES_H
#define CG_COMPILER_RESOLVER_SWIZZLES_H

#include <Cg/Compiler/SyntaxTree.h>

#include <vector>

/// Names of components of vectors and matrices.
namespace cg {

/// @return positions of a swizzle's letters, all of one set: `xyzw`, `rgba` or `stpq`; nothing for other
/// names
std::vector<int> swizzleComponents(Name name);

struct MatrixElement {
    int row;
    int column;
};

/// `_m00_m11` counts from 0, `_11_22` from 1.
/// @return nothing where the name is neither
std::vector<MatrixElement> matrixElements(Name name);

} // namespace cg

#endif
