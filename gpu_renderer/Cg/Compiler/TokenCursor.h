#ifndef CG_COMPILER_TOKEN_CURSOR_H
#define CG_COMPILER_TOKEN_CURSOR_H

#include <Cg/Compiler/SyntaxTree.h>
#include <Cg/Compiler/Token.h>

#include <cstddef>
#include <string>
#include <vector>

namespace cg {

class Diagnostics;

/// The parser's place among the tokens: what stands there, and on to the next.
///
/// A fault is reported and thrown as a SyntaxError.
class TokenCursor {
protected:
    struct SyntaxError {};

    TokenCursor(const std::vector<Token>& tokens, Diagnostics& diagnostics)
        : mTokens(tokens), mDiagnostics(diagnostics) {}

    /// Counts as one level of nesting for as long as it lives; the bound is a syntax error.
    class Level {
    public:
        explicit Level(TokenCursor& cursor);
        ~Level() { --mCursor.mLevels; }
        Level(const Level&) = delete;
        Level& operator=(const Level&) = delete;

    private:
        TokenCursor& mCursor;
    };

    const Token& token(std::size_t ahead = 0) const;
    void pass(); ///< never beyond the END
    bool isAt(TokenKind kind, std::size_t ahead = 0) const { return token(ahead).kind == kind; }
    bool isAtWord(Name word, std::size_t ahead = 0) const;
    bool take(TokenKind kind);
    bool takeWord(Name word);

    /// @param where  "after the condition", to follow what was expected
    void expect(TokenKind kind, const char* where);

    /// Any name but a keyword.
    Token expectName(const std::string& what);

    /// "expected `expected`, found ..."
    [[noreturn]] void fail(const std::string& expected);

    /// Passes over what stands between two brackets of any kind, from the opening one.
    void skipBracketed();

    /// Where the token is that follows brackets `[...]`, counted like `ahead`; `ahead` itself where they have
    /// no end in the statement.
    std::size_t behindBrackets(std::size_t ahead) const;

    const std::vector<Token>& mTokens;
    Diagnostics& mDiagnostics;
    std::size_t mAt = 0;

private:
    int mLevels = 0;
};

} // namespace cg

#endif
