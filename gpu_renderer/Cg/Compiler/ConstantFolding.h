#ifndef CG_COMPILER_CONSTANT_FOLDING_H
#define CG_COMPILER_CONSTANT_FOLDING_H

#include <Cg/Compiler/TypedTree.h>

#include <optional>
#include <vector>

namespace cg {

/// The value of an expression that is known at compile time: array sizes, default values.
///
/// Computes in single precision and in 32-bit integers, as the program would.
/// @return all components, row by row, elements and members one after another; nothing where the value
///         depends on more than literals, constants and the arithmetic functions of the library
std::optional<std::vector<double>> constantValue(const TypedExpr* expression);

/// A number as a scalar of the type holds it: integers are truncated and wrap at 32 bits, and are 0 for what
/// does not fit them; floats are rounded to single precision.
double valueAs(double value, Scalar scalar);

/// GLSL takes the expression as a constant expression, as the initializer of a const global must be.
bool isGlslConstant(const TypedExpr* expression);

} // namespace cg

#endif
