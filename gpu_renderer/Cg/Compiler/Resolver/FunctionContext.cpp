#include <Cg/Compiler/Resolver/FunctionContext.h>

#include <utility>

namespace cg {

Variable* FunctionContext::findVariable(Name name) const {
    Variable* const* found = variables.find(name);
    return found ? *found : nullptr;
}

const Type* FunctionContext::findType(Name name) const {
    const Type* const* found = types.find(name);
    return found ? *found : nullptr;
}

void FunctionContext::endScope(ScopeStart start) {
    variables.endScope(start.variables);
    types.endScope(start.types);
}

ContextChange::ContextChange(FunctionContext& current, FunctionContext inner)
    : mCurrent(current), mOuter(std::move(inner)) {
    std::swap(mCurrent, mOuter);
}

ContextChange::~ContextChange() {
    std::swap(mCurrent, mOuter);
}

} // namespace cg
