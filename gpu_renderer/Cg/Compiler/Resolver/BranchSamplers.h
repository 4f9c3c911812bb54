#ifndef CG_COMPILER_RESOLVER_BRANCH_SAMPLERS_H
#define CG_COMPILER_RESOLVER_BRANCH_SAMPLERS_H

#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <functional>
#include <vector>

namespace cg {

class SamplerLists;
struct Resolution;

/// Branches that assign samplers: behind the `if` these stand for a choice by its condition.
class BranchSamplers {
public:
    BranchSamplers(Resolution& resolution, SamplerAliases& aliases, SamplerLists& lists)
        : mResolution(resolution), mAliases(aliases), mLists(lists) {}

    /// Resolves an `if`.
    /// @param condition   null after an error
    /// @param thenBranch  resolves that branch
    /// @param elseBranch  resolves that branch, or gives null
    /// @return null after an error
    TypedStmt* resolve(SourceLocation at, TypedExpr* condition, const std::function<TypedStmt*()>& thenBranch,
                       const std::function<TypedStmt*()>& elseBranch);

private:
    using Assigned = std::vector<SamplerAliases::Assigned>;

    void choose(SourceLocation at, TypedExpr* condition, Variable* variable, TypedExpr* whenTrue,
                TypedExpr* whenFalse);

    Resolution& mResolution;
    SamplerAliases& mAliases;
    SamplerLists& mLists;
};

} // namespace cg

#endif
