#include <Cg/Compiler/Resolver/Globals.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>
#include <Cg/Compiler/StateBindings.h>

namespace cg {

namespace {

bool isUniform(const Variable* variable) {
    const Qualifiers& qualifiers = variable->declaration->qualifiers;
    const TypedExpr* value = variable->initializer;
    if (containsSampler(variable->type) || qualifiers.isUniform)
        return true;
    const bool isConstant = qualifiers.isConst && value;
    return !qualifiers.isStatic && !isConstant && (!value || constantValue(value));
}

} // namespace

Globals::Globals(Resolution& resolution, const Declarations& declarations, TypeResolver& types,
                 Initializers& initializers)
    : mResolution(resolution), mDeclarations(declarations), mTypes(types), mInitializers(initializers) {}

Variable* Globals::find(Name name) {
    const VariableDecl* declaration = mDeclarations.findGlobal(name);
    return declaration ? variable(declaration) : nullptr;
}

Variable* Globals::variable(const VariableDecl* declaration) {
    const auto found = mVariables.find(declaration);
    if (found != mVariables.end()) {
        Variable* known = found->second;
        if (known && !known->type)
            mResolution.diagnostics.error(declaration->location,
                                          inQuotes(declaration->name) + " depends on itself");
        return known && known->type ? known : nullptr;
    }
    const DeclarationLevel level(mResolution);
    if (!level.fits(declaration->location, declaration->name))
        return nullptr;
    Variable* variable =
        mResolution.makeVariable(Variable::Storage::GLOBAL, declaration->name, nullptr, declaration);
    mVariables[declaration] = variable;
    {
        const ContextChange outside(mResolution.context, {}); // as if no function were being resolved
        resolve(variable);
    }
    if (variable->type)
        return variable;
    mVariables[declaration] = nullptr;
    return nullptr;
}

Variable* Globals::parameter(const VariableDecl* declaration, const Type* type) {
    Variable* variable =
        mResolution.makeVariable(Variable::Storage::UNIFORM, declaration->name, nullptr, declaration);
    if (!initialize(variable)) {
        variable->type = type;
        return variable;
    }
    if (isUniform(variable)) // one with a const and a value is no piece of OpenGL's state
        bindState(variable);
    mResolution.program.uniforms.push_back(variable);
    return variable;
}

bool Globals::has(const Variable* variable) const {
    const auto found = mVariables.find(variable->declaration);
    return found != mVariables.end() && found->second == variable;
}

/// Decides what a global is. Leaves the type null after an error.
void Globals::resolve(Variable* variable) {
    if (!initialize(variable))
        return;
    const VariableDecl* declaration = variable->declaration;
    if (declaration->qualifiers.isStatic && declaration->initializer && isOpaque(variable->type))
        nameAnother(variable);
    else
        decide(variable);
}

/// Gives a variable its type and its initial value.
/// @return false after an error: it has no type
bool Globals::initialize(Variable* variable) {
    const VariableDecl* declaration = variable->declaration;
    const Qualifiers& qualifiers = declaration->qualifiers;
    const Type* type = mTypes.typeOf(declaration->type, declaration->dimensions);
    if (!type)
        return false;
    TypedExpr* value = nullptr;
    if (declaration->initializer && !containsSampler(type)) {
        value = mInitializers.value(type, declaration->initializer);
        if (!value)
            return false;
    }
    if (type->isVoid() || (type->isUnsizedArray() && (qualifiers.isStatic || qualifiers.isConst))) {
        mResolution.diagnostics.error(declaration->location,
                                      inQuotes(declaration->name) + " cannot be '" + nameOf(type) + "'");
        return false;
    }
    variable->type = type;
    variable->isUnsized = type->isUnsizedArray();
    variable->initializer = value;
    return true;
}

/// A static sampler is a name for another one.
void Globals::nameAnother(Variable* sampler) {
    sampler->storage = Variable::Storage::LOCAL;
    sampler->alias = mInitializers.sampler(sampler->type, sampler->declaration->initializer);
    if (!sampler->alias)
        sampler->type = nullptr;
}

/// A uniform with or without a default value, a constant, or a variable of the program.
void Globals::decide(Variable* variable) {
    if (isUniform(variable)) {
        variable->storage = Variable::Storage::UNIFORM;
        bindState(variable);
        mResolution.program.uniforms.push_back(variable);
        return;
    }
    const TypedExpr* value = variable->initializer;
    variable->isConst = variable->declaration->qualifiers.isConst;
    variable->isConstantExpression = variable->isConst && value && isGlslConstant(value);
    mResolution.program.globals.push_back(variable);
}

/// A uniform whose semantic names a piece of OpenGL's own state stands for that.
void Globals::bindState(Variable* variable) {
    const auto path = stateSemantic(variable->declaration->semantic.name);
    const StateBinding state = path ? findState(*path, mResolution.types) : StateBinding();
    if (!state.type)
        return;
    TypedBuilder& build = mResolution.build;
    TypedExpr* value =
        build.builtin(variable->declaration->location, state.type, mResolution.arena.keep(state.form), {});
    value->variable = variable;
    if (conversionCost(value, variable->type) != IMPOSSIBLE_CONVERSION)
        variable->state = build.convert(value, variable->type);
}

} // namespace cg
