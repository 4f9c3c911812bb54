#include <Cg/Compiler/NameScopes.h>

#include <Cg/Compiler/Types.h>

namespace cg {

bool NameScopes::isType(std::string_view name) const {
    const auto found = mMeanings.find(name);
    if (found != mMeanings.end() && !found->second.empty())
        return found->second.back();
    const auto [answer, isNew] = mBuiltIn.emplace(name, false);
    if (isNew)
        answer->second = mTypes.find(name) != nullptr;
    return answer->second;
}

bool NameScopes::isDeclared(std::string_view name) const {
    const auto found = mMeanings.find(name);
    return found != mMeanings.end() && !found->second.empty();
}

bool NameScopes::isVariableOrFunction(std::string_view name) const {
    return isDeclared(name) && !isType(name);
}

void NameScopes::declare(std::string_view name, bool isType) {
    if (name.empty())
        return;
    mMeanings[name].push_back(isType);
    mDeclared.push_back(name);
}

void NameScopes::forgetFrom(std::size_t start) {
    for (; mDeclared.size() > start; mDeclared.pop_back())
        mMeanings[mDeclared.back()].pop_back();
}

} // namespace cg
