#ifndef CG_COMPILER_MACRO_H
#define CG_COMPILER_MACRO_H

#include <Cg/Compiler/Token.h>

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cg {

class Diagnostics;
class Lexer;
class SourceFiles;

/// A macro as `#define` gives it.
struct Macro {
    enum class Special { NONE, LINE, FILE }; ///< `__LINE__` and `__FILE__` have no body

    static constexpr std::size_t NO_PARAMETER = static_cast<std::size_t>(-1);

    struct Piece {
        Token token;
        std::size_t parameter = NO_PARAMETER; ///< the one that it names
        bool isStringized = false;            ///< `#` before it
        bool isPasted = false;                ///< `##` before it
    };

    std::string_view name;
    SourceLocation location;
    Special special = Special::NONE;
    bool isFunction = false; ///< a `(` follows the name without a blank
    bool isVariadic = false; ///< the last parameter takes all that is left
    std::vector<std::string_view> parameters;
    std::vector<Piece> body;

    bool isBeingExpanded = false; ///< its name stands for itself then
};

/// Whether two macros would do the same.
bool isSameMacro(const Macro& left, const Macro& right);

/// Reads what follows a macro's name in its `#define`, up to the end of the line.
/// @return nothing after an error
std::optional<Macro> readMacro(Lexer& lexer, const Token& name, Diagnostics& diagnostics);

/// The tokens as text, a blank wherever there were blanks.
std::string joined(const std::vector<Token>& tokens);

/// What `#` makes of an argument.
Token stringized(const std::vector<Token>& argument, SourceFiles& files);

/// What `##` makes of two tokens; nothing where they make no single one together.
std::optional<Token> pasted(const Token& left, const Token& right, SourceFiles& files);

} // namespace cg

#endif
