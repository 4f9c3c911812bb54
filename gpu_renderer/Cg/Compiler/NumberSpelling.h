#ifndef CG_COMPILER_NUMBER_SPELLING_H
#define CG_COMPILER_NUMBER_SPELLING_H

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace cg {

/// What the text of a NUMBER token says.
///
/// Whole numbers are decimal, hexadecimal (`0x1F`) or octal (`017`), and take `u` and a length, `l`, `i`, `s`
/// or `t`; numbers with a point or an exponent may lack the digits before or after the point. Each takes one
/// of `f` (float), `d` (double), `h` (half) and `x` (fixed), which make a float of a whole number as well.
/// Capitals are the same.
struct NumberSpelling {
    enum class Kind { INTEGER, UNSIGNED, FLOAT, HALF, FIXED, INVALID };

    Kind kind = Kind::INVALID;
    double value = 0;
    std::uint64_t integer = 0; ///< INTEGER, UNSIGNED: the same, exact; the largest where it does not fit
    std::size_t length = 0;    ///< bytes read: less than the text where a swizzle follows, as in `1.0.xxx`
};

/// Reads the number at the start of the text. INVALID where what follows is no swizzle: `2E`, `1.2.3`, `09`.
NumberSpelling readNumber(std::string_view text);

} // namespace cg

#endif
