#include <Cg/Compiler/Resolver/LocalDeclarations.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAssignments.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

namespace cg {

TypedStmt* LocalDeclarations::declare(const DeclStmt* stmt) {
    TypedStmt* result = mResolution.makeStatement(TypedStmt::Kind::SEQUENCE);
    for (const Decl* declaration : stmt->declarations)
        switch (declaration->kind) {
        case Decl::Kind::VARIABLE:
            declareVariable(static_cast<const VariableDecl*>(declaration), result->body);
            break;
        case Decl::Kind::STRUCT:
            declareStruct(static_cast<const StructDecl*>(declaration));
            break;
        case Decl::Kind::TYPEDEF:
            declareAlias(static_cast<const TypedefDecl*>(declaration));
            break;
        case Decl::Kind::FUNCTION: // a prototype within a function says nothing new
            break;
        }
    return result;
}

void LocalDeclarations::declareStruct(const StructDecl* structure) {
    if (const Type* type = mTypes.structType(structure))
        mResolution.context.types.declare(structure->name, type);
}

void LocalDeclarations::declareAlias(const TypedefDecl* alias) {
    if (const Type* type = mTypes.typeOf(alias->type, alias->dimensions))
        mResolution.context.types.declare(alias->name, type);
}

void LocalDeclarations::declareVariable(const VariableDecl* declaration, Statements& out) {
    FunctionContext& context = mResolution.context;
    const Type* type = mTypes.typeOf(declaration->type, declaration->dimensions);
    const StructDecl* definition = declaration->type->definition;
    if (definition && !definition->name.empty())
        declareStruct(definition);
    Variable* variable =
        mResolution.makeVariable(Variable::Storage::LOCAL, declaration->name, type, declaration);
    context.isDeclaredUsed = false;
    TypedExpr* value = nullptr;
    bool isKnown = type != nullptr;
    if (type && declaration->initializer && isOpaque(type)) {
        giveSampler(variable, out);
    } else if (type && declaration->initializer) {
        value = initialValue(variable);
        isKnown = value != nullptr;
    }
    const bool isSized = isKnown && checkSize(declaration, variable->type);
    if (!variable->type)
        variable->type = mResolution.types.scalar(Scalar::FLOAT); // the name is known at least
    variable->isConst = declaration->qualifiers.isConst;
    if (variable->isConst && !context.isDeclaredUsed)
        variable->initializer = value;
    context.variables.declare(declaration->name, variable);
    if (isSized && !isOpaque(variable->type))
        addStatements(variable, value, out);
}

/// @return null after an error
TypedExpr* LocalDeclarations::initialValue(Variable* variable) {
    const Type* type = variable->type;
    mResolution.context.declared = variable;
    TypedExpr* value = mInitializers.value(type, variable->declaration->initializer);
    mResolution.context.declared = nullptr;
    variable->type = type; // an array may have its size from its values
    return value;
}

/// A sampler, or an array of them, is a name for what it is initialized with.
void LocalDeclarations::giveSampler(Variable* variable, Statements& out) {
    TypedExpr* sampler = mInitializers.sampler(variable->type, variable->declaration->initializer);
    TypedExpr* preparation = nullptr;
    variable->alias = sampler ? mSamplers.frozen(sampler, preparation) : nullptr;
    if (preparation)
        out.push_back(mResolution.makeStatement(TypedStmt::Kind::EXPR, preparation));
}

/// @return false after an error
bool LocalDeclarations::checkSize(const VariableDecl* declaration, const Type* type) {
    if (!type->isVoid() && !type->isUnsizedArray())
        return true;
    mResolution.diagnostics.error(declaration->location,
                                  inQuotes(declaration->name) + " cannot be '" + nameOf(type) + "'");
    return false;
}

void LocalDeclarations::addStatements(Variable* variable, TypedExpr* value, Statements& out) {
    TypedBuilder& build = mResolution.build;
    const SourceLocation at = variable->declaration->location;
    if (value && containsSampler(variable->type))
        if (TypedExpr* preparation = mSamplers.copy(at, build.variable(at, variable), value))
            out.push_back(mResolution.makeStatement(TypedStmt::Kind::EXPR, preparation));
    // GLSL knows the name only behind the initial value.
    const bool isAssigned = value && mResolution.context.isDeclaredUsed;
    TypedStmt* stmt = mResolution.makeStatement(TypedStmt::Kind::DECLARE, isAssigned ? nullptr : value);
    stmt->variable = variable;
    out.push_back(stmt);
    if (isAssigned)
        out.push_back(mResolution.makeStatement(TypedStmt::Kind::EXPR,
                                                build.assign(at, build.variable(at, variable), value)));
}

} // namespace cg
