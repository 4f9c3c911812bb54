#ifndef CG_COMPILER_LEXER_H
#define CG_COMPILER_LEXER_H

#include <Cg/Compiler/Token.h>

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace cg {

class Diagnostics;
class SourceFiles;

/// Cuts a text into tokens. Comments and `\` before a line end vanish; LF, CR LF and CR end a line. Only a
/// comment without its end is reported here: what else is wrong becomes a BAD token, which is no error in a
/// place that is skipped.
class Lexer {
public:
    /// Reads a file from its start.
    Lexer(SourceFiles& files, std::uint32_t file, Diagnostics& diagnostics);

    /// Reads a text that `files` keeps; its tokens are located from `start` on.
    Lexer(SourceFiles& files, std::string_view text, SourceLocation start, Diagnostics& diagnostics);

    /// The next token; END again and again once the text has ended.
    Token next();

    /// The next token of the current line, or END again and again at its end, which next() passes.
    Token nextInLine();

private:
    bool isAtEnd() const { return mAt >= mText.size(); }
    char peek(std::size_t ahead = 0) const;
    std::size_t continuationLength(std::size_t at) const;
    void advance();
    void passContinuations();
    bool passLineEnd();
    bool passComment();
    void passLineComment();
    void passBlockComment();
    void passBlanks(bool stopAtLineEnd);
    SourceLocation location() const;

    Token scan();
    void scanName();
    void scanNumber();
    TokenKind scanText();
    TokenKind scanBad();
    TokenKind scanPunctuator();
    std::string_view spelling(std::size_t start) const;

    SourceFiles& mFiles;
    Diagnostics& mDiagnostics;
    std::string_view mText;
    SourceLocation mStart;
    std::size_t mAt = 0;
    std::size_t mLineStart = 0;
    std::uint32_t mLine = 1;
    bool mStartsLine = true;
    bool mSpaceBefore = false;
    bool mPassedContinuation = false; ///< since the current token began
};

} // namespace cg

#endif
