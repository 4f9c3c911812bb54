#include <Cg/Compiler/Resolver/LoopSamplers.h>

#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Globals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAssignments.h>
#include <Cg/Compiler/Resolver/SamplerSelector.h>

#include <algorithm>
#include <cstddef>
#include <string>
#include <utility>

namespace cg {

namespace {

/// Loops and switches that assign samplers, in a whole program: each is resolved twice.
constexpr int MAX_SELECTIONS = 256;

/// Samplers that one of them assigns: each may stand for whatever any of them is given.
constexpr std::size_t MAX_CHANGED = 64;

} // namespace

TypedStmt* LoopSamplers::resolve(SourceLocation at, const std::function<TypedStmt*()>& statement) {
    FunctionContext& context = mResolution.context;
    const SamplerAliases::Mark start = mAliases.mark();
    const std::size_t temporaries = context.function->temporaries.size();
    const std::size_t pastLoops = context.pastLoops.size();
    TypedStmt* result = statement();
    Changes changes;
    if (!findChanges(at, start, changes))
        return nullptr;
    if (changes.variables.empty() || mResolution.diagnostics.hasErrors())
        return result;
    if (++mSelections > MAX_SELECTIONS) {
        mResolution.diagnostics.error(at, "too many loops and switches that assign samplers");
        return nullptr;
    }
    mAliases.forget(start);
    context.function->temporaries.resize(temporaries);
    context.pastLoops.endScope(pastLoops);
    return withSelectors(at, std::move(changes), statement);
}

bool LoopSamplers::isOfBlocksAround(const Variable* sampler) const {
    if (sampler->storage == Variable::Storage::UNIFORM)
        return true;
    const Variable* owner = sampler->samplerOwner ? sampler->samplerOwner : sampler;
    const FunctionContext& context = mResolution.context;
    return owner == context.self || context.isInScope(owner) || mGlobals.has(owner);
}

/// @return false after an error
bool LoopSamplers::findChanges(SourceLocation at, SamplerAliases::Mark start, Changes& changes) {
    for (const SamplerAliases::Gift& gift : mAliases.giftsSince(start)) {
        if (!isOfBlocksAround(gift.variable))
            continue;
        const bool isArray = gift.variable->type->isArray();
        if (isArray || gift.giver != mResolution.context.function) {
            mResolution.diagnostics.error(
                at, inQuotes(gift.variable->name) +
                        (isArray ? ": elements cannot be assigned in a loop or a switch"
                                 : " is assigned in a function that is called in a loop or a switch"));
            return false;
        }
        changes.given.push_back(gift.sampler);
        if (std::find(changes.variables.begin(), changes.variables.end(), gift.variable) !=
            changes.variables.end())
            continue;
        if (changes.variables.size() == MAX_CHANGED) {
            mResolution.diagnostics.error(at, "more than " + std::to_string(MAX_CHANGED) +
                                                  " samplers are assigned in a loop or a switch");
            return false;
        }
        changes.variables.push_back(gift.variable);
    }
    return true;
}

TypedStmt* LoopSamplers::withSelectors(SourceLocation at, Changes changes,
                                       const std::function<TypedStmt*()>& statement) {
    for (Variable* variable : changes.variables)
        if (standsForSampler(variable))
            changes.given.push_back(mAliases.use(at, variable));
    TypedStmt* sequence = mResolution.makeStatement(TypedStmt::Kind::SEQUENCE);
    bool areAllAdded = true;
    for (Variable* variable : changes.variables) {
        TypedStmt* start = areAllAdded ? addSelector(at, variable, changes.given) : nullptr;
        areAllAdded = start != nullptr;
        sequence->body.push_back(start);
    }
    TypedStmt* result = areAllAdded ? statement() : nullptr;
    for (const Variable* variable : changes.variables)
        mAssignments.endSelection(variable);
    if (result)
        sequence->body.push_back(result);
    return areAllAdded ? sequence : nullptr;
}

/// Lets a number say what the variable stands for.
/// @param given  what the body gives to such variables, and what they are before
/// @return what sets the number at the start; null after an error
TypedStmt* LoopSamplers::addSelector(SourceLocation at, Variable* variable,
                                     const std::vector<TypedExpr*>& given) {
    TypedExpr* initial = standsForSampler(variable) ? mAliases.use(at, variable) : nullptr;
    SamplerSelector selector(mResolution);
    for (TypedExpr* gift : given)
        for (TypedExpr* sampler : samplersIn(gift))
            if (conversionCost(sampler, variable->type) != IMPOSSIBLE_CONVERSION)
                selector.add(at, sampler);
    if (!selector.fits()) {
        mResolution.diagnostics.error(at, "a choice among more than " + std::to_string(MAX_SAMPLER_CHOICES) +
                                              " samplers");
        return nullptr;
    }
    selector.makeNumber();
    TypedExpr* selected = initial ? selector.select(at, initial) : selector.selectNothing(at);
    if (!selected)
        return nullptr;
    mAliases.set(variable, selector.choice(at, variable->type));
    mAssignments.beginSelection(variable, selector);
    return mResolution.makeStatement(TypedStmt::Kind::EXPR, selected);
}

} // namespace cg
