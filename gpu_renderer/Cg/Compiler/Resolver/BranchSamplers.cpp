#include <Cg/Compiler/Resolver/BranchSamplers.h>

#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerLists.h>

#include <algorithm>

namespace cg {

namespace {

/// @return what the variable was assigned, or null
TypedExpr* samplerOf(const Variable* variable, const std::vector<SamplerAliases::Assigned>& assigned) {
    const auto found = std::find_if(assigned.begin(), assigned.end(),
                                    [variable](const auto& one) { return one.variable == variable; });
    return found == assigned.end() ? nullptr : found->sampler;
}

} // namespace

TypedStmt* BranchSamplers::resolve(SourceLocation at, TypedExpr* condition,
                                   const std::function<TypedStmt*()>& thenBranch,
                                   const std::function<TypedStmt*()>& elseBranch) {
    TypedBuilder& build = mResolution.build;
    const SamplerAliases::Mark start = mAliases.mark();
    TypedStmt* result = mResolution.makeStatement(TypedStmt::Kind::IF, condition);
    result->body.push_back(thenBranch());
    const Assigned whenTrue = mAliases.takeBack(start);
    result->body.push_back(elseBranch());
    const Assigned whenFalse = mAliases.takeBack(start);
    if (!condition)
        return nullptr;
    if (whenTrue.empty() && whenFalse.empty())
        return result;
    Variable* taken = mResolution.programTemporary("taken", condition->type);
    result->expression = build.assign(at, build.variable(at, taken), condition);
    for (const auto& [variable, sampler] : whenTrue)
        choose(at, build.variable(at, taken), variable, sampler, samplerOf(variable, whenFalse));
    for (const auto& [variable, sampler] : whenFalse)
        if (!samplerOf(variable, whenTrue))
            choose(at, build.variable(at, taken), variable, nullptr, sampler);
    return result;
}

/// @param whenTrue   what the first branch assigns, or null
/// @param whenFalse  what the other one does
void BranchSamplers::choose(SourceLocation at, TypedExpr* condition, Variable* variable, TypedExpr* whenTrue,
                            TypedExpr* whenFalse) {
    // Where it stood for nothing before, it stands for whatever the other branch gives.
    TypedExpr* before = standsForSampler(variable) ? mAliases.use(at, variable) : nullptr;
    const auto first = [](TypedExpr* one, TypedExpr* other) { return one ? one : other; };
    TypedExpr* choice = mLists.choose(at, condition, first(whenTrue, first(before, whenFalse)),
                                      first(whenFalse, first(before, whenTrue)));
    if (choice)
        mAliases.set(variable, choice);
}

} // namespace cg
