#include <Cg/Compiler/Resolver/Declarations.h>

namespace cg {

namespace {

template <class Map>
typename Map::mapped_type valueOf(const Map& map, const typename Map::key_type& key) {
    const auto found = map.find(key);
    return found == map.end() ? typename Map::mapped_type() : found->second;
}

template <class Map>
void appendNames(const Map& map, std::vector<Name>& names) {
    for (const auto& entry : map)
        names.push_back(entry.first);
}

const std::vector<const FunctionDecl*> NO_FUNCTIONS;
const Declarations::Functions NO_METHODS;

} // namespace

Declarations::Declarations(const TranslationUnit& unit) : mUnit(unit) {
    std::size_t ordinal = 0;
    for (const Decl* declaration : unit.declarations) {
        ++ordinal;
        switch (declaration->kind) {
        case Decl::Kind::VARIABLE:
            add(static_cast<const VariableDecl*>(declaration));
            break;
        case Decl::Kind::FUNCTION:
            add(static_cast<const FunctionDecl*>(declaration), ordinal);
            break;
        case Decl::Kind::STRUCT:
            add(static_cast<const StructDecl*>(declaration), ordinal);
            break;
        case Decl::Kind::TYPEDEF:
            add(static_cast<const TypedefDecl*>(declaration));
            break;
        }
    }
}

void Declarations::add(const VariableDecl* variable) {
    addDefinition(variable->type);
    const VariableDecl*& slot = mGlobals[variable->name];
    if (!slot || (!slot->initializer && variable->initializer))
        slot = variable;
}

void Declarations::add(const FunctionDecl* function, std::size_t ordinal) {
    addDefinition(function->returnType);
    mOrdinals[function] = ordinal;
    if (function->ownerName.empty())
        mFunctions[function->name].push_back(function);
    else
        mOutsideMethods[function->ownerName][function->name].push_back(function);
}

void Declarations::add(const StructDecl* structure, std::size_t ordinal) {
    const StructDecl*& slot = mStructs[structure->name];
    if (!slot || (slot->members.empty() && slot->methods.empty()))
        slot = structure;
    for (const FunctionDecl* method : structure->methods)
        mOrdinals[method] = ordinal;
}

void Declarations::add(const TypedefDecl* alias) {
    addDefinition(alias->type);
    mTypedefs.emplace(alias->name, alias);
}

/// `struct Light { ... } a;` declares the struct as well.
void Declarations::addDefinition(const TypeSyntax* type) {
    if (type && type->definition && !type->definition->name.empty())
        mStructs.emplace(type->definition->name, type->definition);
}

const StructDecl* Declarations::findStruct(Name name) const {
    return valueOf(mStructs, name);
}

const TypedefDecl* Declarations::findTypedef(Name name) const {
    return valueOf(mTypedefs, name);
}

const VariableDecl* Declarations::findGlobal(Name name) const {
    return valueOf(mGlobals, name);
}

const std::vector<const FunctionDecl*>& Declarations::functions(Name name) const {
    const auto found = mFunctions.find(name);
    return found == mFunctions.end() ? NO_FUNCTIONS : found->second;
}

const Declarations::Functions& Declarations::outsideMethods(Name owner) const {
    const auto found = mOutsideMethods.find(owner);
    return found == mOutsideMethods.end() ? NO_METHODS : found->second;
}

std::size_t Declarations::ordinal(const FunctionDecl* function) const {
    return valueOf(mOrdinals, function);
}

std::vector<const VariableDecl*> Declarations::globals() const {
    std::vector<const VariableDecl*> globals;
    for (const Decl* declaration : mUnit.declarations)
        if (declaration->kind == Decl::Kind::VARIABLE && findGlobal(declaration->name) == declaration)
            globals.push_back(static_cast<const VariableDecl*>(declaration));
    return globals;
}

std::vector<Name> Declarations::typeNames() const {
    std::vector<Name> names;
    appendNames(mStructs, names);
    appendNames(mTypedefs, names);
    return names;
}

std::vector<Name> Declarations::functionNames() const {
    std::vector<Name> names;
    appendNames(mFunctions, names);
    return names;
}

std::vector<Name> Declarations::globalNames() const {
    std::vector<Name> names;
    appendNames(mGlobals, names);
    return names;
}

} // namespace cg
