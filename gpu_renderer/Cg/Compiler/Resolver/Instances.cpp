#include <Cg/Compiler/Resolver/Instances.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Overloads.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerPieces.h>

#include <cstddef>

namespace cg {

namespace {

/// One function, for arrays of this many sizes or samplers of this many kinds.
constexpr std::size_t MAX_INSTANCES = 64;

} // namespace

Function* Instances::find(const FunctionDecl* declaration, const std::vector<const Type*>& types,
                          const MethodObject& object) {
    Diagnostics& diagnostics = mResolution.diagnostics;
    const FunctionDecl* definition = mOverloads.definitionOf(declaration);
    if (!definition) {
        diagnostics.error(declaration->location,
                          inQuotes(declaration->name) + " is declared but not defined");
        return nullptr;
    }
    if (!mOverloads.signatureOf(definition).result)
        return nullptr; // its own error has been said
    const std::vector<Instance>& instances = mInstances[definition];
    for (const Instance& known : instances) {
        if (known.function->isBeingResolved) {
            diagnostics.error(definition->location,
                              "function " + inQuotes(definition->name) + " calls itself");
            return nullptr;
        }
        if (known.types == types && known.hasWritableObject == object.isWritable)
            return known.function;
    }
    if (mResolution.callDepth >= MAX_CALL_DEPTH || instances.size() >= MAX_INSTANCES) {
        diagnostics.error(definition->location,
                          "the calls of " + inQuotes(definition->name) + " are nested too deep");
        return nullptr;
    }
    return make(definition, types, object);
}

Function* Instances::make(const FunctionDecl* definition, const std::vector<const Type*>& types,
                          const MethodObject& object) {
    auto* function = mResolution.arena.make<Function>();
    function->name = definition->name;
    function->declaration = definition;
    function->result = mOverloads.signatureOf(definition).result;
    function->isBeingResolved = true;
    mInstances[definition].push_back({types, object.isWritable, function});
    {
        const CallChange change(mResolution, {});
        mResolution.context.function = function;
        mResolution.context.ordinal = mDeclarations.ordinal(definition);
        if (object.type)
            addObject(function, object);
        addParameters(function, types);
        addSamplers(function);
        mRecursion.body(function, definition);
    }
    function->isBeingResolved = false;
    mResolution.program.functions.push_back(function);
    return function;
}

void Instances::addObject(Function* function, const MethodObject& object) {
    Variable* self = mResolution.makeVariable(Variable::Storage::PARAMETER, "self", object.type, nullptr);
    self->direction = object.isWritable ? Direction::INOUT : Direction::IN;
    function->parameters.push_back(self);
    mResolution.context.self = self;
}

void Instances::addParameters(Function* function, const std::vector<const Type*>& types) {
    for (std::size_t i = 0; i < types.size(); ++i) {
        const VariableDecl* parameter = function->declaration->parameters[i];
        Variable* variable =
            mResolution.makeVariable(Variable::Storage::PARAMETER, parameter->name, types[i], parameter);
        variable->direction = directionOf(parameter);
        variable->isConst = parameter->qualifiers.isConst && variable->direction == Direction::IN;
        function->parameters.push_back(variable);
        mResolution.context.variables.declare(parameter->name, variable);
    }
}

/// The samplers within structs are parameters of their own.
void Instances::addSamplers(Function* function) {
    const std::vector<Variable*> declared = function->parameters;
    for (Variable* parameter : declared)
        if (containsSampler(parameter->type) && !isOpaque(parameter->type))
            mPieces.addParameters(function, parameter);
}

void Instances::addEntry(Function* function) {
    mInstances[function->declaration].push_back({{}, false, function});
}

} // namespace cg
