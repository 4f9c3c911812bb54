#ifndef CG_COMPILER_GLSL_FUNCTIONS_H
#define CG_COMPILER_GLSL_FUNCTIONS_H

#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <vector>

namespace cg {

class GlslExpressions;
class GlslSymbols;

/// Writes functions in GLSL: their heads and statements, one a line.
class GlslFunctions {
public:
    GlslFunctions(GlslSymbols& symbols, GlslExpressions& expressions)
        : mSymbols(symbols), mExpressions(expressions) {}

    /// Adds one to the text.
    void add(const Function& function);

    const std::string& text() const { return mText; }

private:
    void statement(const TypedStmt* stmt);
    void block(const std::vector<TypedStmt*>& body);
    void enclosed(const std::string& head, const std::vector<TypedStmt*>& body);
    void branch(const TypedStmt* stmt);
    void declaration(const TypedStmt* stmt);
    void doLoop(const TypedStmt* stmt);
    void forLoop(const TypedStmt* stmt);
    std::string forInitializer(const TypedStmt* stmt);
    std::string jump(const TypedStmt* stmt);
    std::string initialValue(const TypedStmt* stmt);
    void effect(const TypedExpr* expression);
    void line(const std::string& text);

    GlslSymbols& mSymbols;
    GlslExpressions& mExpressions;
    std::string mText;
    int mIndent = 0;
};

} // namespace cg

#endif
