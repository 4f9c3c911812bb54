#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <optional>
#include <string>

namespace cg {

const Type* TypeResolver::find(Name name) {
    if (const Type* local = mResolution.context.findType(name))
        return local;
    if (const StructDecl* structure = mDeclarations.findStruct(name))
        return structType(structure);
    const TypedefDecl* alias = mDeclarations.findTypedef(name);
    return alias ? aliasType(alias) : mResolution.types.find(name);
}

const Type* TypeResolver::aliasType(const TypedefDecl* alias) {
    const auto [slot, isNew] = mAliasTypes.emplace(alias, nullptr);
    if (!isNew)
        return slot->second;
    const DeclarationLevel level(mResolution);
    if (!level.fits(alias->location, alias->name))
        return nullptr;
    // The null in the table ends a typedef of itself.
    const Type* type = typeOf(alias->type, alias->dimensions);
    mAliasTypes[alias] = type;
    return type;
}

const Type* TypeResolver::typeOf(const TypeSyntax* syntax) {
    const Type* type = nullptr;
    if (syntax->definition) {
        type = structType(syntax->definition);
    } else if (syntax->isUnsigned) {
        type = mResolution.types.find(syntax->name);
        if (type && type->isNumeric())
            type = mResolution.types.withScalar(type, Scalar::UINT);
    } else {
        type = find(syntax->name);
    }
    if (!type && (syntax->definition || mDeclarations.findStruct(syntax->name)))
        return nullptr; // its own error has been said
    if (!type) {
        std::vector<Name> known = builtinTypeNames();
        const std::vector<Name> declared = mDeclarations.typeNames();
        known.insert(known.end(), declared.begin(), declared.end());
        mResolution.diagnostics.error(syntax->location, "unknown type " + inQuotes(syntax->name) +
                                                            suggestion(syntax->name, known));
        return nullptr;
    }
    return withDimensions(syntax->location, type, syntax->dimensions);
}

const Type* TypeResolver::typeOf(const TypeSyntax* syntax, const std::vector<Expr*>& dimensions) {
    const Type* type = typeOf(syntax);
    type = type ? withDimensions(syntax->location, type, dimensions) : nullptr;
    return type ? checkSize(syntax->location, type) : nullptr;
}

const Type* TypeResolver::withDimensions(SourceLocation at, const Type* type,
                                         const std::vector<Expr*>& dimensions) {
    for (auto it = dimensions.rbegin(); it != dimensions.rend(); ++it) {
        const int length = *it ? arrayLength(*it) : Type::UNSIZED;
        if (length == 0)
            return nullptr;
        if (type->isUnsizedArray()) {
            mResolution.diagnostics.error(at, "only the first size of an array can be left open");
            return nullptr;
        }
        type = mResolution.types.array(type, length);
    }
    return type;
}

/// @return the length, or 0 after an error
int TypeResolver::arrayLength(const Expr* dimension) {
    const TypedExpr* length = mRecursion.expression(dimension);
    if (!length)
        return 0;
    const auto value = length->type->isScalar() ? constantValue(length) : std::nullopt;
    if (!value || (*value)[0] < 1 || (*value)[0] > MAX_ARRAY_LENGTH) {
        mResolution.diagnostics.error(
            dimension->location, !value
                                     ? "the size of an array must be a constant"
                                     : "an array has 1 to " + std::to_string(MAX_ARRAY_LENGTH) + " elements");
        return 0;
    }
    return static_cast<int>((*value)[0]);
}

const Type* TypeResolver::checkSize(SourceLocation at, const Type* type) {
    if (countLeaves(type, MAX_LEAVES) < MAX_LEAVES)
        return type;
    mResolution.diagnostics.error(at, "'" + nameOf(type) + "' is too large");
    return nullptr;
}

const Type* TypeResolver::structType(const StructDecl* declaration) {
    const auto found = mStructTypes.find(declaration);
    if (found != mStructTypes.end()) {
        if (!found->second)
            mResolution.diagnostics.error(declaration->location,
                                          "struct " + inQuotes(declaration->name) + " contains itself");
        return found->second;
    }
    const DeclarationLevel level(mResolution);
    if (!level.fits(declaration->location, declaration->name))
        return nullptr;
    mStructTypes[declaration] = nullptr;
    const Type* type = mResolution.types.makeStruct(declaration);
    setBase(type->structure);
    addMembers(type->structure);
    mStructTypes[declaration] = type;
    mResolution.types.noteStruct(type);
    return type;
}

void TypeResolver::setBase(StructType* structure) {
    const StructDecl* declaration = structure->declaration;
    if (declaration->baseName.empty())
        return;
    const Type* base = find(declaration->baseName);
    if (!base || !base->isStruct())
        mResolution.diagnostics.error(declaration->location,
                                      "unknown base " + inQuotes(declaration->baseName));
    else if (base->structure->declaration->isInterface)
        structure->interface = base->structure->declaration;
    else
        inherit(structure, base->structure);
}

/// A few words give a struct all members of a large one, so that they count.
void TypeResolver::inherit(StructType* structure, const StructType* base) {
    mResolution.arena.charge(base->fields.size() *
                             (sizeof(Field) + sizeof(StructType::Positions::value_type)));
    for (const Field& field : base->fields)
        structure->add(field);
}

void TypeResolver::addMembers(StructType* structure) {
    for (const VariableDecl* member : structure->declaration->members) {
        const Type* type = typeOf(member->type, member->dimensions);
        if (!type)
            continue;
        if (type->isVoid()) {
            mResolution.diagnostics.error(member->location, "a member cannot be void");
            continue;
        }
        structure->add({member->name, type, member});
    }
    for (const Field& field : structure->fields)
        structure->hasSamplers = structure->hasSamplers || containsSampler(field.type);
}

} // namespace cg
