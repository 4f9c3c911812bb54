#include <Cg/Compiler/NameScopes.h>

#include <string>
#include <unordered_set>

namespace cg {

namespace {

std::unordered_set<std::string> makeBuiltInTypes() {
    std::unordered_set<std::string> names{
        "void",        "string",      "sampler",       "sampler1D",   "sampler2D",       "sampler3D",
        "samplerRECT", "samplerCUBE", "sampler2DRect", "samplerCube", "sampler1DShadow", "sampler2DShadow"};
    for (const std::string scalar : {"float", "half", "fixed", "int", "bool", "double", "uint", "unsigned",
                                     "short", "char", "long", "ushort", "uchar", "ulong", "cfloat", "cint"}) {
        names.insert(scalar);
        for (const char rows : {'1', '2', '3', '4'}) {
            names.insert(scalar + rows);
            for (const char columns : {'1', '2', '3', '4'})
                names.insert(scalar + rows + 'x' + columns);
        }
    }
    for (const std::string vector : {"vec", "ivec", "bvec", "uvec", "mat"})
        for (const char size : {'2', '3', '4'})
            names.insert(vector + size);
    return names;
}

bool isBuiltInType(std::string_view name) {
    static const std::unordered_set<std::string> TEXTS = makeBuiltInTypes();
    static const std::unordered_set<std::string_view> NAMES(TEXTS.begin(), TEXTS.end());
    return NAMES.count(name) != 0;
}

} // namespace

bool NameScopes::isType(std::string_view name) const {
    const auto found = mMeanings.find(name);
    if (found == mMeanings.end() || found->second.empty())
        return isBuiltInType(name);
    return found->second.back();
}

bool NameScopes::isVariableOrFunction(std::string_view name) const {
    const auto found = mMeanings.find(name);
    return found != mMeanings.end() && !found->second.empty() && !found->second.back();
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
