#ifndef CG_COMPILER_RESOLVER_LOOP_SAMPLERS_H
#define CG_COMPILER_RESOLVER_LOOP_SAMPLERS_H

#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <functional>
#include <vector>

namespace cg {

class Globals;
class SamplerAssignments;
struct Resolution;

/// Loops and switches that assign samplers.
class LoopSamplers {
public:
    LoopSamplers(Resolution& resolution, const Globals& globals, SamplerAliases& aliases,
                 SamplerAssignments& assignments)
        : mResolution(resolution), mGlobals(globals), mAliases(aliases), mAssignments(assignments) {}

    /// Resolves a loop or a `switch`. What a sampler stands for depends on the way through it where the body
    /// assigns one: then it is resolved once more, with numbers that say at run time what such samplers stand
    /// for.
    /// @param statement  resolves it
    /// @return null after an error
    TypedStmt* resolve(SourceLocation at, const std::function<TypedStmt*()>& statement);

private:
    /// What a body assigns to samplers that it does not declare itself.
    struct Changes {
        std::vector<Variable*> variables;
        std::vector<TypedExpr*> given; ///< which the variables may exchange among each other
    };

    bool isOfBlocksAround(const Variable* sampler) const;
    bool findChanges(SourceLocation at, SamplerAliases::Mark start, Changes& changes);
    TypedStmt* withSelectors(SourceLocation at, Changes changes,
                             const std::function<TypedStmt*()>& statement);
    TypedStmt* addSelector(SourceLocation at, Variable* variable, const std::vector<TypedExpr*>& given);

    Resolution& mResolution;
    const Globals& mGlobals;
    SamplerAliases& mAliases;
    SamplerAssignments& mAssignments;
    int mSelections = 0;
};

} // namespace cg

#endif
