#ifndef CG_COMPILER_EXPRESSION_PARSER_H
#define CG_COMPILER_EXPRESSION_PARSER_H

#include <Cg/Compiler/NameScopes.h>
#include <Cg/Compiler/SyntaxTree.h>
#include <Cg/Compiler/Token.h>
#include <Cg/Compiler/TokenCursor.h>
#include <Cg/Compiler/Types.h>

#include <cstddef>
#include <vector>

namespace cg {

/// The parser's lower half: names of types, expressions.
///
/// A fault is reported and thrown as a SyntaxError; the upper half goes on behind it.
class ExpressionParser : protected TokenCursor {
protected:
    ExpressionParser(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics);

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

    template <class Node, class... Arguments>
    Node* make(Arguments... arguments) {
        return mArena.make<Node>(arguments...);
    }

    Arena& mArena;
    TypeTable mTypes;
    NameScopes mScopes;

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

    int mHeight = 0; ///< of the expression that was parsed last
};

} // namespace cg

#endif
