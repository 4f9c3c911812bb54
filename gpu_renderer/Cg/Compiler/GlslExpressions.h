#ifndef CG_COMPILER_GLSL_EXPRESSIONS_H
#define CG_COMPILER_GLSL_EXPRESSIONS_H

#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace cg {

class GlslSymbols;

/// Writes expressions in GLSL, with parentheses where they are needed, and gathers the helper functions that
/// they call.
class GlslExpressions {
public:
    GlslExpressions(const TypeTable& types, GlslSymbols& symbols) : mTypes(types), mSymbols(symbols) {}

    /// Where it stands alone: in a statement or in parentheses.
    std::string whole(const TypedExpr* expression);

    /// Where a comma ends it: an argument or an initial value.
    std::string value(const TypedExpr* expression);

    /// Where a `.` or `[` may follow.
    std::string object(const TypedExpr* expression);

    /// Definitions of the helper functions that what was written so far calls; what one calls is before it.
    const std::vector<std::string>& helpers() const { return mHelpers; }

private:
    std::string print(const TypedExpr* expression, int minimum);
    std::string printed(const TypedExpr* expression, int& precedence);
    std::string swizzle(const TypedExpr* expression);
    std::string element(const TypedExpr* expression);
    std::string unary(const TypedExpr* expression, int& precedence);
    std::string binary(const TypedExpr* expression, int& precedence);
    std::string assign(const TypedExpr* expression);
    std::string conditional(const TypedExpr* expression);
    std::string construct(const TypedExpr* expression);
    std::string convert(const TypedExpr* expression, int& precedence);
    std::string arguments(const TypedExpr* expression);
    std::string builtin(const TypedExpr* expression);
    std::string byRows(const TypedExpr* expression);
    std::string rowsBody(const TypedExpr* expression);
    void addHelper(Name helper, const std::string& typeName);

    const TypeTable& mTypes;
    GlslSymbols& mSymbols;
    std::vector<std::string> mHelpers;
    std::unordered_set<std::string> mKnownHelpers;
    std::unordered_map<std::string, std::string> mRowFunctions; ///< names, by what else there is of them
};

} // namespace cg

#endif
