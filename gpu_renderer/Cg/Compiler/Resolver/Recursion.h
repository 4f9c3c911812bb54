#ifndef CG_COMPILER_RESOLVER_RECURSION_H
#define CG_COMPILER_RESOLVER_RECURSION_H

#include <Cg/Compiler/TypedTree.h>

namespace cg {

/// The way back from a part of the resolver to all of it: types and initial values hold expressions, these
/// hold calls, and calls lead to the statements of functions.
class Recursion {
public:
    /// @return null after an error
    virtual TypedExpr* expression(const Expr* expr) = 0;

    /// Gives the function that is being resolved its body.
    virtual void body(Function* function, const FunctionDecl* definition) = 0;

protected:
    ~Recursion() = default;
};

} // namespace cg

#endif
