#include <Cg/Compiler/Lexer.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/SourceFiles.h>

#include <algorithm>
#include <array>
#include <string>

namespace cg {

namespace {

struct Punctuator {
    std::string_view text;
    TokenKind kind;
};

/// Longest first.
constexpr std::array PUNCTUATORS{
    Punctuator{"<<=", TokenKind::SHIFT_LEFT_ASSIGN},
    Punctuator{">>=", TokenKind::SHIFT_RIGHT_ASSIGN},
    Punctuator{"...", TokenKind::ELLIPSIS},
    Punctuator{"::", TokenKind::COLON_COLON},
    Punctuator{"##", TokenKind::HASH_HASH},
    Punctuator{"++", TokenKind::PLUS_PLUS},
    Punctuator{"--", TokenKind::MINUS_MINUS},
    Punctuator{"<<", TokenKind::SHIFT_LEFT},
    Punctuator{">>", TokenKind::SHIFT_RIGHT},
    Punctuator{"<=", TokenKind::LESS_EQUAL},
    Punctuator{">=", TokenKind::GREATER_EQUAL},
    Punctuator{"==", TokenKind::EQUAL_EQUAL},
    Punctuator{"!=", TokenKind::NOT_EQUAL},
    Punctuator{"&&", TokenKind::AND_AND},
    Punctuator{"||", TokenKind::OR_OR},
    Punctuator{"+=", TokenKind::PLUS_ASSIGN},
    Punctuator{"-=", TokenKind::MINUS_ASSIGN},
    Punctuator{"*=", TokenKind::STAR_ASSIGN},
    Punctuator{"/=", TokenKind::SLASH_ASSIGN},
    Punctuator{"%=", TokenKind::PERCENT_ASSIGN},
    Punctuator{"&=", TokenKind::AND_ASSIGN},
    Punctuator{"^=", TokenKind::XOR_ASSIGN},
    Punctuator{"|=", TokenKind::OR_ASSIGN},
    Punctuator{"(", TokenKind::LEFT_PAREN},
    Punctuator{")", TokenKind::RIGHT_PAREN},
    Punctuator{"[", TokenKind::LEFT_BRACKET},
    Punctuator{"]", TokenKind::RIGHT_BRACKET},
    Punctuator{"{", TokenKind::LEFT_BRACE},
    Punctuator{"}", TokenKind::RIGHT_BRACE},
    Punctuator{",", TokenKind::COMMA},
    Punctuator{";", TokenKind::SEMICOLON},
    Punctuator{":", TokenKind::COLON},
    Punctuator{"?", TokenKind::QUESTION},
    Punctuator{".", TokenKind::DOT},
    Punctuator{"#", TokenKind::HASH},
    Punctuator{"\\", TokenKind::BACKSLASH},
    Punctuator{"+", TokenKind::PLUS},
    Punctuator{"-", TokenKind::MINUS},
    Punctuator{"*", TokenKind::STAR},
    Punctuator{"/", TokenKind::SLASH},
    Punctuator{"%", TokenKind::PERCENT},
    Punctuator{"<", TokenKind::LESS},
    Punctuator{">", TokenKind::GREATER},
    Punctuator{"&", TokenKind::AMPERSAND},
    Punctuator{"^", TokenKind::CARET},
    Punctuator{"|", TokenKind::BAR},
    Punctuator{"~", TokenKind::TILDE},
    Punctuator{"!", TokenKind::NOT},
    Punctuator{"=", TokenKind::ASSIGN},
};

bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

bool isHexDigit(char c) {
    return isDigit(c) || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F');
}

bool startsName(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

bool isNameByte(char c) {
    return startsName(c) || isDigit(c);
}

bool isBlank(char c) {
    return c == ' ' || c == '\t' || c == '\v' || c == '\f';
}

bool isLineEnd(char c) {
    return c == '\n' || c == '\r';
}

} // namespace

Lexer::Lexer(SourceFiles& files, std::uint32_t file, Diagnostics& diagnostics)
    : Lexer(files, files.text(file), {file, 1, 1}, diagnostics) {}

Lexer::Lexer(SourceFiles& files, std::string_view text, SourceLocation start, Diagnostics& diagnostics)
    : mFiles(files), mDiagnostics(diagnostics), mText(text), mStart(start) {
    passContinuations();
}

Token Lexer::next() {
    passBlanks(false);
    return scan();
}

Token Lexer::nextInLine() {
    passBlanks(true);
    if (isAtEnd() || isLineEnd(mText[mAt])) {
        Token end;
        end.location = location();
        return end;
    }
    return scan();
}

/// The byte that many bytes ahead, `\` line ends not counted; 0 beyond the end.
char Lexer::peek(std::size_t ahead) const {
    std::size_t at = mAt;
    for (; ahead > 0 && at < mText.size(); --ahead) {
        ++at;
        while (const std::size_t length = continuationLength(at))
            at += length;
    }
    return at < mText.size() ? mText[at] : '\0';
}

/// Bytes of a `\` with the line end after it, blanks between them included; 0 where there is none.
std::size_t Lexer::continuationLength(std::size_t at) const {
    if (at >= mText.size() || mText[at] != '\\')
        return 0;
    std::size_t end = at + 1;
    while (end < mText.size() && isBlank(mText[end]))
        ++end;
    if (end == mText.size())
        return end - at;
    if (!isLineEnd(mText[end]))
        return 0;
    return end - at + (mText.compare(end, 2, "\r\n") == 0 ? 2 : 1);
}

void Lexer::advance() {
    ++mAt;
    passContinuations();
}

void Lexer::passContinuations() {
    while (const std::size_t length = continuationLength(mAt)) {
        mAt += length;
        mLineStart = mAt;
        ++mLine;
        mPassedContinuation = true;
    }
}

bool Lexer::passLineEnd() {
    if (isAtEnd() || !isLineEnd(mText[mAt]))
        return false;
    mAt += mText.compare(mAt, 2, "\r\n") == 0 ? 2 : 1;
    mLineStart = mAt;
    ++mLine;
    passContinuations();
    return true;
}

bool Lexer::passComment() {
    if (peek() != '/')
        return false;
    const char second = peek(1);
    if (second == '/')
        passLineComment();
    else if (second == '*')
        passBlockComment();
    else
        return false;
    return true;
}

void Lexer::passLineComment() {
    while (!isAtEnd() && !isLineEnd(mText[mAt]))
        advance();
}

void Lexer::passBlockComment() {
    const SourceLocation start = location();
    advance();
    advance();
    while (!isAtEnd()) {
        if (mText[mAt] == '*' && peek(1) == '/') {
            advance();
            advance();
            return;
        }
        if (!passLineEnd())
            advance();
    }
    mDiagnostics.error(start, "this comment has no end: expected '*/'");
}

void Lexer::passBlanks(bool stopAtLineEnd) {
    mSpaceBefore = false;
    while (!isAtEnd()) {
        if (isBlank(mText[mAt]))
            advance();
        else if (!stopAtLineEnd && passLineEnd())
            mStartsLine = true;
        else if (!passComment())
            return;
        mSpaceBefore = true;
    }
}

SourceLocation Lexer::location() const {
    const auto column = static_cast<std::uint32_t>(mAt - mLineStart);
    if (mLine == 1)
        return {mStart.file, mStart.line, mStart.column + column};
    return {mStart.file, mStart.line + mLine - 1, column + 1};
}

Token Lexer::scan() {
    Token token;
    token.startsLine = mStartsLine;
    token.spaceBefore = mSpaceBefore;
    token.location = location();
    if (isAtEnd())
        return token;
    mStartsLine = false;
    mPassedContinuation = false;
    const std::size_t start = mAt;
    const char first = mText[mAt];
    if (startsName(first)) {
        token.kind = TokenKind::NAME;
        scanName();
    } else if (isDigit(first) || (first == '.' && isDigit(peek(1)))) {
        token.kind = TokenKind::NUMBER;
        scanNumber();
    } else if (first == '"') {
        token.kind = scanText();
    } else {
        token.kind = scanPunctuator();
    }
    token.text = spelling(start);
    return token;
}

void Lexer::scanName() {
    while (isNameByte(peek()))
        advance();
}

/// Everything that a number may be glued to belongs to it, so that `##` can make `tex2D` of `tex` and `2D`.
void Lexer::scanNumber() {
    const bool isHex = peek() == '0' && (peek(1) == 'x' || peek(1) == 'X') && isHexDigit(peek(2));
    bool isDecimal = !isHex;
    while (isNameByte(peek()) || peek() == '.') {
        const char c = peek();
        const bool isExponent = isDecimal && (c == 'e' || c == 'E');
        isDecimal = isDecimal && (isDigit(c) || c == '.');
        advance();
        if (isExponent && (peek() == '+' || peek() == '-') && isDigit(peek(1)))
            advance();
    }
}

TokenKind Lexer::scanText() {
    advance();
    while (!isAtEnd() && !isLineEnd(mText[mAt])) {
        const char c = mText[mAt];
        advance();
        if (c == '"')
            return TokenKind::TEXT;
        if (c == '\\' && !isAtEnd() && !isLineEnd(mText[mAt]))
            advance();
    }
    return TokenKind::BAD;
}

TokenKind Lexer::scanBad() {
    const auto isForeign = [](char c) { return static_cast<unsigned char>(c) >= 0x80; };
    const bool wasForeign = isForeign(mText[mAt]);
    advance();
    while (wasForeign && !isAtEnd() && isForeign(mText[mAt]))
        advance();
    return TokenKind::BAD;
}

TokenKind Lexer::scanPunctuator() {
    const std::array<char, 3> bytes{peek(), peek(1), peek(2)};
    const std::string_view ahead(bytes.data(), bytes.size());
    const auto* const found =
        std::find_if(PUNCTUATORS.begin(), PUNCTUATORS.end(), [&](const Punctuator& punctuator) {
            return punctuator.text[0] == ahead[0] &&
                   ahead.substr(0, punctuator.text.size()) == punctuator.text;
        });
    if (found == PUNCTUATORS.end())
        return scanBad();
    for (std::size_t passed = 0; passed < found->text.size(); ++passed)
        advance();
    return found->kind;
}

/// The text from `start` to here, without `\` line ends.
std::string_view Lexer::spelling(std::size_t start) const {
    const std::string_view raw = mText.substr(start, mAt - start);
    if (!mPassedContinuation)
        return raw;
    std::string joined;
    for (std::size_t at = start; at < mAt;) {
        if (const std::size_t length = continuationLength(at)) {
            at += length;
        } else {
            joined += mText[at];
            ++at;
        }
    }
    return mFiles.keep(joined);
}

} // namespace cg
