#include <Cg/Compiler/Resolver/FunctionCalls.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/ChosenCalls.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Overloads.h>
#include <Cg/Compiler/Resolver/PassedArguments.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/Resolver/SamplerAssignments.h>
#include <Cg/Compiler/Resolver/SamplerFunctions.h>
#include <Cg/Compiler/Resolver/SamplerKinds.h>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

constexpr int MAX_DEFAULT_ARGUMENTS = 4096; ///< in a whole program

/// The type that a parameter has for an argument: what it leaves open is as the argument has it.
const Type* instanceType(const Type* parameter, const Type* argument) {
    const bool isUndecided =
        parameter->isSampler() && argument->isSampler() && argument->sampler != Sampler::ANY;
    return parameter->isUnsizedArray() || implements(argument, parameter) || isUndecided ? argument
                                                                                         : parameter;
}

const Type* samplerType(const Type* type) {
    return type->isArray() ? type->element : type;
}

} // namespace

FunctionCalls::FunctionCalls(Resolution& resolution, Initializers& initializers, Overloads& overloads,
                             Instances& instances, Places& places, SamplerKinds& kinds,
                             SamplerAssignments& assignments, SamplerFunctions& samplerFunctions,
                             ChosenCalls& chosen)
    : mResolution(resolution), mInitializers(initializers), mOverloads(overloads), mInstances(instances),
      mPlaces(places), mKinds(kinds), mAssignments(assignments), mSamplerFunctions(samplerFunctions),
      mChosen(chosen) {}

TypedExpr* FunctionCalls::call(SourceLocation at, const FunctionDecl* declaration,
                               std::vector<TypedExpr*> arguments, TypedExpr* self) {
    if (!addDefaults(at, declaration, arguments))
        return nullptr;
    const Signature& signature = mOverloads.signatureOf(declaration);
    if (isOpaque(signature.result)) {
        if (!self)
            return mSamplerFunctions.call(at, declaration, arguments);
        mResolution.diagnostics.error(at, "a method cannot give a sampler");
        return nullptr;
    }
    std::vector<const Type*> types;
    for (std::size_t i = 0; i < arguments.size(); ++i)
        types.push_back(instanceType(signature.parameters[i], arguments[i]->type));
    Function* function = mInstances.find(declaration, types, self ? objectOf(self) : MethodObject());
    if (!function)
        return nullptr;
    if (self)
        arguments.insert(arguments.begin(), self);
    PassedArguments passed(mResolution, mPlaces);
    TypedExpr* result = mResolution.build.make(Kind::CALL, at, function->result);
    result->function = function;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        TypedExpr* operand = pass(arguments[i], function->parameters[i], passed);
        if (!operand)
            return nullptr;
        result->operands.push_back(operand);
    }
    if (!passSamplers(result, arguments, passed))
        return nullptr;
    result = mChosen.withKnownSamplers(result);
    return result ? passed.around(result) : nullptr;
}

/// Appends what a call leaves out.
/// @return false after an error
bool FunctionCalls::addDefaults(SourceLocation at, const FunctionDecl* declaration,
                                std::vector<TypedExpr*>& arguments) {
    const std::vector<const Type*>& parameters = mOverloads.signatureOf(declaration).parameters;
    while (arguments.size() < parameters.size()) {
        TypedExpr* value = defaultArgument(at, declaration, arguments.size(), parameters[arguments.size()]);
        if (!value)
            return false;
        arguments.push_back(value);
    }
    return true;
}

/// It may call functions with default arguments of their own: those are bounded, in depth and in all, as each
/// call has its own copy.
TypedExpr* FunctionCalls::defaultArgument(SourceLocation at, const FunctionDecl* declaration,
                                          std::size_t position, const Type* type) {
    if (mResolution.callDepth >= MAX_CALL_DEPTH || mDefaultArguments >= MAX_DEFAULT_ARGUMENTS) {
        mResolution.diagnostics.error(at, "too many default arguments in the calls of " +
                                              inQuotes(declaration->name));
        return nullptr;
    }
    ++mDefaultArguments;
    FunctionContext outside; // it means what it means where it is written
    outside.function = mResolution.context.function;
    const CallChange change(mResolution, outside);
    return mInitializers.value(type, declaration->parameters[position]->initializer);
}

/// A method may write to its object where the call could.
MethodObject FunctionCalls::objectOf(const TypedExpr* self) const {
    const Variable* root = rootVariable(self);
    const bool isReadOnlySelf = root && root->storage == Variable::Storage::PARAMETER &&
                                root == mResolution.context.self && root->direction == Direction::IN;
    const bool isWritable =
        root && !root->isConst && root->storage != Variable::Storage::UNIFORM && !isReadOnlySelf;
    return {self->type, isWritable};
}

TypedExpr* FunctionCalls::pass(TypedExpr* argument, const Variable* parameter, PassedArguments& passed) {
    if (isOpaque(parameter->type)) {
        mKinds.decide(argument, samplerType(parameter->type), mResolution.types);
        if (parameter->comparesDepth && mKinds.isPlain(argument))
            mKinds.notePlain(parameter->name);
    }
    return passed.pass(argument, parameter->type, parameter->direction);
}

/// The samplers within structs, behind the arguments.
/// @return false after an error
bool FunctionCalls::passSamplers(TypedExpr* call, const std::vector<TypedExpr*>& arguments,
                                 PassedArguments& passed) {
    const std::vector<Variable*>& parameters = call->function->parameters;
    for (std::size_t i = arguments.size(); i < parameters.size(); ++i)
        for (std::size_t owner = 0; owner < arguments.size(); ++owner) {
            if (parameters[owner] != parameters[i]->samplerOwner)
                continue;
            TypedExpr* sampler = passSampler(call->location, parameters[i], arguments[owner], passed);
            if (!sampler)
                return false;
            call->operands.push_back(sampler);
        }
    return true;
}

/// @param piece  the parameter for a sampler of the argument
TypedExpr* FunctionCalls::passSampler(SourceLocation at, const Variable* piece, const TypedExpr* argument,
                                      PassedArguments& passed) {
    // The samplers of a copy of the argument stand for those that are passed.
    Variable* copy = mResolution.makeVariable(Variable::Storage::LOCAL, "argument", argument->type, nullptr);
    passed.prepare(mAssignments.copy(at, mResolution.build.variable(at, copy), argument));
    const auto found = copy->samplers.find(piece->samplerPath);
    TypedExpr* sampler = found == copy->samplers.end() ? nullptr : found->second->alias;
    if (!sampler || isUnset(sampler)) {
        mResolution.diagnostics.error(at, inQuotes(piece->samplerPath.substr(1)) +
                                              " of an argument has been given no sampler");
        return nullptr;
    }
    mKinds.decide(sampler, samplerType(piece->type), mResolution.types);
    return sampler;
}

} // namespace cg
