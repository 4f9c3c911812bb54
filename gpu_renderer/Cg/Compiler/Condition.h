#ifndef CG_COMPILER_CONDITION_H
#define CG_COMPILER_CONDITION_H

#include <Cg/Compiler/Token.h>

#include <cstdint>
#include <optional>
#include <vector>

namespace cg {

class Diagnostics;

/// Evaluates the expression of an `#if` in 64-bit integers that wrap around. Every operator of C but
/// assignments and the comma; a name is 0, but `true` is 1; a fraction is cut off, with a warning; what a
/// short circuit leaves out may divide by 0.
/// @param tokens  the expression, macros expanded and `defined` replaced by 0 or 1; ends in END
/// @return nothing after an error
std::optional<std::int64_t> evaluateCondition(const std::vector<Token>& tokens, Diagnostics& diagnostics);

} // namespace cg

#endif
