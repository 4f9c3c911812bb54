#ifndef CG_COMPILER_RESOLVER_NAME_RESOLVER_H
#define CG_COMPILER_RESOLVER_NAME_RESOLVER_H

#include <Cg/Compiler/TypedTree.h>

namespace cg {

class Declarations;
class Globals;
class MemberAccess;
class SamplerAliases;
struct Resolution;

/// What the names in expressions mean.
class NameResolver {
public:
    NameResolver(Resolution& resolution, const Declarations& declarations, Globals& globals,
                 SamplerAliases& aliases, MemberAccess& members)
        : mResolution(resolution), mDeclarations(declarations), mGlobals(globals), mAliases(aliases),
          mMembers(members) {}

    /// @param isIndexed  brackets follow, so what has no size can be named
    /// @return null after an error
    TypedExpr* name(const NameExpr* expr, bool isIndexed);

    /// @return the piece of OpenGL's state that `state.light[0].position` names; null where it is no such
    /// name
    TypedExpr* state(const Expr* expr);

private:
    TypedExpr* use(const NameExpr* expr, Variable* variable, bool isIndexed);
    bool isOfSelf(Name name) const;
    TypedExpr* ofSelf(const NameExpr* expr);
    Variable* pastLoopVariable(const NameExpr* expr);
    Variable* ownValue(const NameExpr* expr);
    void refuse(const NameExpr* expr);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Globals& mGlobals;
    SamplerAliases& mAliases;
    MemberAccess& mMembers;
};

} // namespace cg

#endif
