#ifndef CG_COMPILER_RESOLVER_FUNCTION_CALLS_H
#define CG_COMPILER_RESOLVER_FUNCTION_CALLS_H

#include <Cg/Compiler/Resolver/Instances.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <vector>

namespace cg {

class ChosenCalls;
class Initializers;
class Overloads;
class PassedArguments;
class Places;
class SamplerAssignments;
class SamplerFunctions;
class SamplerKinds;
struct Resolution;

/// Calls of the program's own functions, once it is known which.
class FunctionCalls {
public:
    FunctionCalls(Resolution& resolution, Initializers& initializers, Overloads& overloads,
                  Instances& instances, Places& places, SamplerKinds& kinds, SamplerAssignments& assignments,
                  SamplerFunctions& samplerFunctions, ChosenCalls& chosen);

    /// @param arguments  fewer than there are parameters where these have default values
    /// @param self       a method's object; else null
    /// @return null after an error
    TypedExpr* call(SourceLocation at, const FunctionDecl* declaration, std::vector<TypedExpr*> arguments,
                    TypedExpr* self);

private:
    bool addDefaults(SourceLocation at, const FunctionDecl* declaration, std::vector<TypedExpr*>& arguments);
    TypedExpr* defaultArgument(SourceLocation at, const FunctionDecl* declaration, std::size_t position,
                               const Type* type);
    MethodObject objectOf(const TypedExpr* self) const;
    TypedExpr* pass(TypedExpr* argument, const Variable* parameter, PassedArguments& passed);
    TypedExpr* passSampler(SourceLocation at, const Variable* piece, const TypedExpr* argument,
                           PassedArguments& passed);
    bool passSamplers(TypedExpr* call, const std::vector<TypedExpr*>& arguments, PassedArguments& passed);

    Resolution& mResolution;
    Initializers& mInitializers;
    Overloads& mOverloads;
    Instances& mInstances;
    Places& mPlaces;
    SamplerKinds& mKinds;
    SamplerAssignments& mAssignments;
    SamplerFunctions& mSamplerFunctions;
    ChosenCalls& mChosen;
    int mDefaultArguments = 0;
};

} // namespace cg

#endif
