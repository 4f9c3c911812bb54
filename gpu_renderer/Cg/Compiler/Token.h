#ifndef CG_COMPILER_TOKEN_H
#define CG_COMPILER_TOKEN_H

#include <Cg/Compiler/SourceLocation.h>

#include <cstdint>
#include <string_view>

namespace cg {

enum class TokenKind : std::uint8_t {
    END,    ///< end of the program, or of a directive's line; its text is empty
    NAME,   ///< identifiers and keywords alike: which is which depends on the place
    NUMBER, ///< starts with a digit or with a point and a digit; not checked yet: `1.0f`, `0x1F`, but also
            ///< `2D`
    TEXT,   ///< in double quotes, which belong to its text
    BAD,    ///< bytes that begin no token, or a text without its end

    LEFT_PAREN,
    RIGHT_PAREN,
    LEFT_BRACKET,
    RIGHT_BRACKET,
    LEFT_BRACE,
    RIGHT_BRACE,
    COMMA,
    SEMICOLON,
    COLON,
    COLON_COLON,
    QUESTION,
    DOT,
    ELLIPSIS,
    HASH,
    HASH_HASH,
    BACKSLASH, ///< one that does not stand at the end of a line

    PLUS,
    MINUS,
    STAR,
    SLASH,
    PERCENT,
    PLUS_PLUS,
    MINUS_MINUS,
    SHIFT_LEFT,
    SHIFT_RIGHT,
    LESS,
    GREATER,
    LESS_EQUAL,
    GREATER_EQUAL,
    EQUAL_EQUAL,
    NOT_EQUAL,
    AMPERSAND,
    CARET,
    BAR,
    TILDE,
    NOT,
    AND_AND,
    OR_OR,

    ASSIGN,
    PLUS_ASSIGN,
    MINUS_ASSIGN,
    STAR_ASSIGN,
    SLASH_ASSIGN,
    PERCENT_ASSIGN,
    SHIFT_LEFT_ASSIGN,
    SHIFT_RIGHT_ASSIGN,
    AND_ASSIGN,
    XOR_ASSIGN,
    OR_ASSIGN
};

/// A word of the program. Its text is a view into SourceFiles.
struct Token {
    TokenKind kind = TokenKind::END;
    bool startsLine = false;  ///< the first one of its line
    bool spaceBefore = false; ///< blanks or a comment before it
    bool isFinal = false;     ///< a macro's name that its own expansion gave: it is expanded no more
    SourceLocation location;
    std::string_view text;
};

} // namespace cg

#endif
