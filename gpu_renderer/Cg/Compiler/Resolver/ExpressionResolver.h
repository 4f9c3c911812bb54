#ifndef CG_COMPILER_RESOLVER_EXPRESSION_RESOLVER_H
#define CG_COMPILER_RESOLVER_EXPRESSION_RESOLVER_H

#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class Assignments;
class Calls;
class Initializers;
class NameResolver;
class MemberAccess;
class Places;
class SamplerLists;
class TypeResolver;
struct Resolution;

/// Expressions of all kinds.
///
/// Operations return null after an error.
class ExpressionResolver {
public:
    ExpressionResolver(Resolution& resolution, TypeResolver& types, Initializers& initializers,
                       NameResolver& names, MemberAccess& members, Places& places, SamplerLists& lists,
                       Calls& calls, Assignments& assignments);

    TypedExpr* expression(const Expr* expr);

private:
    TypedExpr* literal(const LiteralExpr* expr);
    TypedExpr* member(const MemberExpr* expr);
    TypedExpr* index(const IndexExpr* expr);
    TypedExpr* constructor(const ConstructExpr* expr);
    TypedExpr* castExpression(const CastExpr* expr);
    TypedExpr* unary(const UnaryExpr* expr);
    TypedExpr* increment(const UnaryExpr* expr, TypedExpr* operand);
    TypedExpr* binary(const BinaryExpr* expr);
    TypedExpr* conditional(const ConditionalExpr* expr);

    Resolution& mResolution;
    TypeResolver& mTypes;
    Initializers& mInitializers;
    NameResolver& mNames;
    MemberAccess& mMembers;
    Places& mPlaces;
    SamplerLists& mLists;
    Calls& mCalls;
    Assignments& mAssignments;
};

} // namespace cg

#endif
