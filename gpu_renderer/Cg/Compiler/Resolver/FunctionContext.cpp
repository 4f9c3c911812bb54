#include <Cg/Compiler/Resolver/FunctionContext.h>

#include <algorithm>
#include <utility>

namespace cg {

Variable* FunctionContext::findVariable(Name name) const {
    for (auto it = scope.rbegin(); it != scope.rend(); ++it)
        if (it->variable && it->name == name)
            return it->variable;
    return nullptr;
}

const Type* FunctionContext::findType(Name name) const {
    for (auto it = scope.rbegin(); it != scope.rend(); ++it)
        if (it->type && it->name == name)
            return it->type;
    return nullptr;
}

bool FunctionContext::isInScope(const Variable* variable) const {
    return std::any_of(scope.begin(), scope.end(),
                       [variable](const ScopeEntry& entry) { return entry.variable == variable; });
}

ContextChange::ContextChange(FunctionContext& current, FunctionContext inner)
    : mCurrent(current), mOuter(std::move(inner)) {
    std::swap(mCurrent, mOuter);
}

ContextChange::~ContextChange() {
    std::swap(mCurrent, mOuter);
}

} // namespace cg
