#ifndef CG_COMPILER_EXPRESSION_PARSER_H
#define CG_COMPILER_EXPRESSION_PARSER_H

#include <Cg/Compiler/NameScopes.h>
#include <Cg/Compiler/SyntaxTree.h>
#include <Cg/Compiler/Token.h>
#include <Cg/Compiler/Types.h>

#include <cstddef>
#include <string>
#include <vector>

namespace cg {

class Diagnostics;

/// The parser's lower half: the place in the token stream, names of types, expressions.
///
/// A fault is reported and thrown as a SyntaxError; the upper half goes on behind it.
class ExpressionParser {
protected:
    struct SyntaxError {};

    ExpressionParser(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics);

    /// Counts as one level of nesting for as long as it lives; the bound is a syntax error.
    class Level {
    public:
        explicit Level(ExpressionParser& parser);
        ~Level() { --mParser.mLevels; }
        Level(const Level&) = delete;
        Level& operator=(const Level&) = delete;

    private:
        ExpressionParser& mParser;
    };

    // ---- tokens
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

    // ---- types
    bool isTypeName(std::size_t ahead = 0) const;

    /// `float3`, `unsigned int`, `struct Light`: without dimensions and definitions.
    TypeSyntax* parseTypeName();
    std::size_t behindTemplate(std::size_t ahead) const;
    TypeSyntax* parseTemplate(std::size_t behind);

    /// `[3]`, `[]`, none.
    std::vector<Expr*> parseDimensions();

    // ---- expressions
    Expr* parseExpression();  ///< with commas
    Expr* parseAssignment();  ///< without
    Expr* parseInitializer(); ///< also `{ ... }`; null for `sampler_state { ... }`

    /// Passes over what stands between two brackets of any kind, from the opening one.
    void skipBracketed();

    /// Where the token is that follows brackets `[...]`, counted like `ahead`; `ahead` itself where they have
    /// no end in the statement.
    std::size_t behindBrackets(std::size_t ahead) const;

    template <class Node, class... Arguments>
    Node* make(Arguments... arguments) {
        return mArena.make<Node>(arguments...);
    }

    const std::vector<Token>& mTokens;
    Arena& mArena;
    Diagnostics& mDiagnostics;
    TypeTable mTypes;
    NameScopes mScopes;
    std::size_t mAt = 0;

private:
    Expr* parseConditional();
    Expr* parseBinary(int lowest);
    Expr* parseUnary();
    Expr* parseCast();
    Expr* parsePostfix();
    Expr* parseCall(Expr* callee);
    Expr* parseIndex(Expr* object);
    Expr* parsePrimary();
    Expr* parseNumber();
    Expr* parseGluedSwizzles(const Token& number, std::size_t at, Expr* value);
    Expr* parseName();
    Expr* parseInitList();
    std::vector<Expr*> parseArguments();
    bool isAtCast() const;
    bool isAtConstructor() const;
    void setHeight(int height);

    int mLevels = 0;
    int mHeight = 0; ///< of the expression that was parsed last
};

} // namespace cg

#endif
