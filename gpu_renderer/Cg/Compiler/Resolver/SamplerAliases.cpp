#include <Cg/Compiler/Resolver/SamplerAliases.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <unordered_set>

namespace cg {

TypedExpr* SamplerAliases::use(SourceLocation at, Variable* variable) {
    const Function* function = mResolution.context.function;
    if (isOpaque(variable->type) && function && function != mResolution.program.entry)
        mUsers[variable].insert(function);
    if (variable->alias) {
        const Variable* original = rootVariable(variable->alias);
        return original == variable ? mResolution.build.variable(at, variable) : variable->alias;
    }
    return variable->state ? variable->state : mResolution.build.variable(at, variable);
}

void SamplerAliases::set(Variable* variable, TypedExpr* sampler) {
    const Function* function = mResolution.context.function;
    const std::set<const Function*>& users = mUsers[variable];
    if (users.size() > users.count(function))
        mResolution.diagnostics.error(sampler->location,
                                      inQuotes(variable->name) +
                                          " is assigned after a function that looks it up was called");
    mAssigned.push_back({variable, variable->alias});
    mGifts.push_back({variable, sampler, function});
    variable->alias = sampler;
}

std::vector<SamplerAliases::Gift> SamplerAliases::giftsSince(Mark mark) const {
    return {mGifts.begin() + static_cast<std::ptrdiff_t>(mark.gifts), mGifts.end()};
}

std::vector<SamplerAliases::Assigned> SamplerAliases::takeBack(Mark mark) {
    std::vector<Assigned> last;
    std::unordered_set<const Variable*> known;
    for (std::size_t i = mark.assignments; i < mAssigned.size(); ++i) {
        Variable* variable = mAssigned[i].variable;
        if (known.insert(variable).second)
            last.push_back({variable, variable->alias});
    }
    for (; mAssigned.size() > mark.assignments; mAssigned.pop_back())
        mAssigned.back().variable->alias = mAssigned.back().sampler;
    return last;
}

void SamplerAliases::forget(Mark mark) {
    takeBack(mark);
    mGifts.resize(mark.gifts);
}

bool standsForSampler(const Variable* variable) {
    return variable->alias || variable->storage != Variable::Storage::LOCAL;
}

bool isUnset(const TypedExpr* sampler) {
    const Variable* root = rootVariable(sampler);
    return root && root->storage == Variable::Storage::LOCAL;
}

} // namespace cg
