#ifndef CG_COMPILER_RESOLVER_NAMES_H
#define CG_COMPILER_RESOLVER_NAMES_H

#include <Cg/Compiler/TypedTree.h>

namespace cg {

class Declarations;
class Globals;
class Parts;
class SamplerAliases;
struct Resolution;

/// What the names in expressions mean.
class Names {
public:
    Names(Resolution& resolution, const Declarations& declarations, Globals& globals, SamplerAliases& aliases,
          Parts& parts)
        : mResolution(resolution), mDeclarations(declarations), mGlobals(globals), mAliases(aliases),
          mParts(parts) {}

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
    Parts& mParts;
};

} // namespace cg

#endif
