#include <Cg/Compiler/NameScopes.h>

#include <Cg/Compiler/Types.h>

namespace cg {

bool NameScopes::isType(std::string_view name) const {
    if (const bool* known = mIsType.find(name))
        return *known;
    const auto [answer, isNew] = mBuiltIn.emplace(name, false);
    if (isNew)
        answer->second = mTypes.find(name) != nullptr;
    return answer->second;
}

bool NameScopes::isDeclared(std::string_view name) const {
    return mIsType.find(name) != nullptr;
}

bool NameScopes::isVariableOrFunction(std::string_view name) const {
    return isDeclared(name) && !isType(name);
}

void NameScopes::declare(std::string_view name, bool isType) {
    if (!name.empty())
        mIsType.declare(name, isType);
}

} // namespace cg
