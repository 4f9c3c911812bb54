#include <Cg/Compiler/TokenCursor.h>

#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <cstdint>
#include <unordered_set>

namespace cg {

namespace {

/// Levels of statements, parentheses, operands on the right and lists within each other.
constexpr int MAX_LEVELS = 250;

/// Words that name nothing, wherever they stand.
bool isKeyword(Name word) {
    static const std::unordered_set<Name> KEYWORDS{"break",  "const",  "continue", "discard", "do",
                                                   "else",   "false",  "for",      "if",      "return",
                                                   "static", "struct", "true",     "typedef", "while"};
    return KEYWORDS.count(word) != 0;
}

const char* spellingOf(TokenKind kind) {
    switch (kind) {
    case TokenKind::LEFT_PAREN:
        return "'('";
    case TokenKind::RIGHT_PAREN:
        return "')'";
    case TokenKind::LEFT_BRACKET:
        return "'['";
    case TokenKind::RIGHT_BRACKET:
        return "']'";
    case TokenKind::LEFT_BRACE:
        return "'{'";
    case TokenKind::RIGHT_BRACE:
        return "'}'";
    case TokenKind::SEMICOLON:
        return "';'";
    case TokenKind::COLON:
        return "':'";
    case TokenKind::ASSIGN:
        return "'='";
    default:
        return "another word";
    }
}

bool isOpening(TokenKind kind) {
    return kind == TokenKind::LEFT_PAREN || kind == TokenKind::LEFT_BRACKET || kind == TokenKind::LEFT_BRACE;
}

bool isClosing(TokenKind kind) {
    return kind == TokenKind::RIGHT_PAREN || kind == TokenKind::RIGHT_BRACKET ||
           kind == TokenKind::RIGHT_BRACE;
}

} // namespace

TokenCursor::Level::Level(TokenCursor& cursor) : mCursor(cursor) {
    if (cursor.mLevels == MAX_LEVELS) {
        mCursor.mDiagnostics.error(cursor.token().location,
                                   "this is nested more than " + std::to_string(MAX_LEVELS) + " levels deep");
        throw SyntaxError();
    }
    ++cursor.mLevels;
}

const Token& TokenCursor::token(std::size_t ahead) const {
    return mTokens[std::min(mAt + ahead, mTokens.size() - 1)];
}

void TokenCursor::pass() {
    if (mAt + 1 < mTokens.size())
        ++mAt;
}

bool TokenCursor::isAtWord(Name word, std::size_t ahead) const {
    return token(ahead).kind == TokenKind::NAME && token(ahead).text == word;
}

bool TokenCursor::take(TokenKind kind) {
    if (!isAt(kind))
        return false;
    pass();
    return true;
}

bool TokenCursor::takeWord(Name word) {
    if (!isAtWord(word))
        return false;
    pass();
    return true;
}

void TokenCursor::expect(TokenKind kind, const char* where) {
    if (!take(kind))
        fail(std::string(spellingOf(kind)) + " " + where);
}

Token TokenCursor::expectName(const std::string& what) {
    const Token name = token();
    if (name.kind != TokenKind::NAME || isKeyword(name.text))
        fail(what);
    pass();
    return name;
}

/// What is missing at the end of a line is missing there, not where the next word stands.
void TokenCursor::fail(const std::string& expected) {
    const Token& found = token();
    SourceLocation location = found.location;
    if (mAt > 0) {
        const Token& before = mTokens[mAt - 1];
        const SourceLocation behind{before.location.file, before.location.line,
                                    before.location.column + static_cast<std::uint32_t>(before.text.size())};
        if (behind.file != location.file || behind.line < location.line)
            location = behind;
    }
    const bool isEnd = found.kind == TokenKind::END;
    mDiagnostics.error(location, "expected " + expected + ", found " +
                                     (isEnd ? "the end of the program" : inQuotes(found.text)));
    throw SyntaxError();
}

void TokenCursor::skipBracketed() {
    const Token opening = token();
    std::size_t depth = 0;
    do {
        if (isOpening(token().kind))
            ++depth;
        else if (isClosing(token().kind))
            --depth;
        else if (isAt(TokenKind::END)) {
            mDiagnostics.error(opening.location, inQuotes(opening.text) + " is never closed");
            throw SyntaxError();
        }
        pass();
    } while (depth > 0);
}

std::size_t TokenCursor::behindBrackets(std::size_t ahead) const {
    std::size_t depth = 0;
    for (std::size_t at = ahead;; ++at) {
        const TokenKind kind = token(at).kind;
        if (kind == TokenKind::LEFT_BRACKET)
            ++depth;
        else if (depth == 0)
            return at;
        else if (kind == TokenKind::RIGHT_BRACKET)
            --depth;
        else if (kind == TokenKind::END || kind == TokenKind::SEMICOLON || kind == TokenKind::LEFT_BRACE)
            return ahead;
    }
}

} // namespace cg
