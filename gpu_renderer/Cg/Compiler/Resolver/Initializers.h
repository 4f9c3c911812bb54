#ifndef CG_COMPILER_RESOLVER_INITIALIZERS_H
#define CG_COMPILER_RESOLVER_INITIALIZERS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class InitializerLists;
class Recursion;
struct Resolution;

/// Initial values, and constructors that read as lists of them.
///
/// Operations return null after an error.
class Initializers {
public:
    Initializers(Resolution& resolution, Recursion& recursion, InitializerLists& lists)
        : mResolution(resolution), mRecursion(recursion), mLists(lists) {}

    /// @param type  an unsized array gets its length here
    TypedExpr* value(const Type*& type, const Expr* expr);

    /// Of a sampler or of an array of them.
    TypedExpr* sampler(const Type* type, const Expr* expr);

    /// `float[](1, 2)`
    TypedExpr* array(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);

    /// `Light(position, colour)`
    TypedExpr* structure(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);

private:
    Resolution& mResolution;
    Recursion& mRecursion;
    InitializerLists& mLists;
};

} // namespace cg

#endif
