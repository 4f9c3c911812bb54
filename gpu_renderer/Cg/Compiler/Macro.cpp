#include <Cg/Compiler/Macro.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Lexer.h>
#include <Cg/Compiler/SourceFiles.h>

#include <algorithm>
#include <cstddef>
#include <string>
#include <utility>

namespace cg {

namespace {

/// What the parameter that takes all further arguments is called unless `args...` names it.
constexpr std::string_view VARIADIC_NAME = "__VA_ARGS__";

/// Each token of a macro's body is looked for among them.
constexpr std::size_t MAX_PARAMETERS = 256;

bool addParameter(Macro& macro, const Token& name, Diagnostics& diagnostics) {
    if (std::find(macro.parameters.begin(), macro.parameters.end(), name.text) != macro.parameters.end()) {
        diagnostics.error(name.location, "macro " + inQuotes(macro.name) + " has two parameters named " +
                                             inQuotes(name.text));
        return false;
    }
    if (macro.parameters.size() == MAX_PARAMETERS) {
        diagnostics.error(name.location, "macro " + inQuotes(macro.name) + " has more than " +
                                             std::to_string(MAX_PARAMETERS) + " parameters");
        return false;
    }
    macro.parameters.push_back(name.text);
    return true;
}

/// From behind the `(` to the `)`.
bool readParameters(Macro& macro, Lexer& lexer, Diagnostics& diagnostics) {
    Token token = lexer.nextInLine();
    if (token.kind == TokenKind::RIGHT_PAREN)
        return true;
    for (;; token = lexer.nextInLine()) {
        if (token.kind == TokenKind::NAME) {
            if (!addParameter(macro, token, diagnostics))
                return false;
            token = lexer.nextInLine();
            macro.isVariadic = token.kind == TokenKind::ELLIPSIS;
        } else if (token.kind == TokenKind::ELLIPSIS) {
            macro.parameters.push_back(VARIADIC_NAME);
            macro.isVariadic = true;
        }
        if (macro.isVariadic)
            token = lexer.nextInLine();
        if (token.kind == TokenKind::RIGHT_PAREN && !macro.parameters.empty())
            return true;
        if (token.kind != TokenKind::COMMA || macro.isVariadic || macro.parameters.empty())
            break;
    }
    diagnostics.error(token.location,
                      "expected the parameters of macro " + inQuotes(macro.name) + " as in '(a, b)', found " +
                          (token.text.empty() ? "the end of the line" : inQuotes(token.text)));
    return false;
}

Macro::Piece pieceOf(const Macro& macro, const Token& token) {
    Macro::Piece piece{token};
    const auto parameter = std::find(macro.parameters.begin(), macro.parameters.end(), token.text);
    if (token.kind == TokenKind::NAME && parameter != macro.parameters.end())
        piece.parameter = static_cast<std::size_t>(parameter - macro.parameters.begin());
    return piece;
}

/// Turns the operators `#` and `##` into marks of the pieces behind them.
bool readBody(Macro& macro, Lexer& lexer, Diagnostics& diagnostics) {
    bool isPasted = false;
    Token token = lexer.nextInLine();
    for (; token.kind != TokenKind::END; token = lexer.nextInLine()) {
        if (token.kind == TokenKind::HASH_HASH) {
            if (macro.body.empty())
                break;
            isPasted = true;
            continue;
        }
        Macro::Piece piece = pieceOf(macro, token);
        piece.isPasted = std::exchange(isPasted, false);
        Macro::Piece* const before = macro.body.empty() ? nullptr : &macro.body.back();
        if (macro.isFunction && piece.parameter != Macro::NO_PARAMETER && before != nullptr &&
            before->token.kind == TokenKind::HASH && !piece.isPasted) {
            before->parameter = piece.parameter;
            before->isStringized = true;
            before->token.kind = TokenKind::TEXT;
        } else {
            macro.body.push_back(piece);
        }
    }
    if (token.kind == TokenKind::END && !isPasted)
        return true;
    diagnostics.error(token.location,
                      "'##' needs a word on either side in the body of macro " + inQuotes(macro.name));
    return false;
}

} // namespace

bool isSameMacro(const Macro& left, const Macro& right) {
    const auto isSamePiece = [](const Macro::Piece& one, const Macro::Piece& other) {
        return one.token.text == other.token.text && one.parameter == other.parameter &&
               one.isStringized == other.isStringized && one.isPasted == other.isPasted;
    };
    return left.special == right.special && left.isFunction == right.isFunction &&
           left.isVariadic == right.isVariadic && left.parameters == right.parameters &&
           std::equal(left.body.begin(), left.body.end(), right.body.begin(), right.body.end(), isSamePiece);
}

std::optional<Macro> readMacro(Lexer& lexer, const Token& name, Diagnostics& diagnostics) {
    Macro macro;
    macro.name = name.text;
    macro.location = name.location;
    Lexer behindParen = lexer;
    const Token first = behindParen.nextInLine();
    if (first.kind == TokenKind::LEFT_PAREN && !first.spaceBefore) {
        macro.isFunction = true;
        lexer.nextInLine();
        if (!readParameters(macro, lexer, diagnostics))
            return std::nullopt;
    }
    if (!readBody(macro, lexer, diagnostics))
        return std::nullopt;
    return macro;
}

std::string joined(const std::vector<Token>& tokens) {
    std::string text;
    for (const Token& token : tokens) {
        if (token.spaceBefore && !text.empty())
            text += ' ';
        text += token.text;
    }
    return text;
}

Token stringized(const std::vector<Token>& argument, SourceFiles& files) {
    std::string text = "\"";
    for (const Token& token : argument) {
        if (token.spaceBefore && text.size() > 1)
            text += ' ';
        for (const char c : token.text) {
            if (token.kind == TokenKind::TEXT && (c == '"' || c == '\\'))
                text += '\\';
            text += c;
        }
    }
    Token result;
    result.kind = TokenKind::TEXT;
    result.text = files.keep(text + '"');
    return result;
}

std::optional<Token> pasted(const Token& left, const Token& right, SourceFiles& files) {
    const std::string_view text = files.keep(std::string(left.text).append(right.text));
    Diagnostics ignored;
    Lexer lexer(files, text, left.location, ignored);
    Token result = lexer.next();
    if (result.text.size() != text.size() || result.kind == TokenKind::BAD)
        return std::nullopt;
    result.location = left.location;
    result.spaceBefore = left.spaceBefore;
    result.startsLine = left.startsLine;
    return result;
}

} // namespace cg
