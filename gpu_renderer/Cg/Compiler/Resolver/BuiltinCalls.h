#ifndef CG_COMPILER_RESOLVER_BUILTIN_CALLS_H
#define CG_COMPILER_RESOLVER_BUILTIN_CALLS_H

#include <Cg/Compiler/Resolver/BuiltinChoice.h>
#include <Cg/Compiler/Resolver/BuiltinForms.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <vector>

namespace cg {

class ChosenCalls;
class PassedArguments;
class Places;
class SamplerKinds;
struct Resolution;

/// Calls of built-in functions.
class BuiltinCalls {
public:
    BuiltinCalls(Resolution& resolution, SamplerKinds& kinds, Places& places, ChosenCalls& chosen);

    /// There is a built-in function of that name, whatever its arguments are.
    bool has(Name name, std::size_t argumentCount) const;

    /// @param isAlone  the program has no function of that name: GLSL's own names count as well, and it is an
    ///                 error where no function takes the arguments
    /// @return null where there is none that does, and after an error
    TypedExpr* call(SourceLocation at, Name name, const std::vector<TypedExpr*>& arguments, bool isAlone);

private:
    TypedExpr* call(SourceLocation at, const ChosenBuiltin& builtin,
                    const std::vector<TypedExpr*>& arguments);
    bool pass(const ChosenBuiltin& builtin, std::vector<TypedExpr*>& arguments, PassedArguments& passed);
    TypedExpr* make(SourceLocation at, const ChosenBuiltin& builtin, const BuiltinForm& form,
                    const std::vector<TypedExpr*>& arguments);

    Resolution& mResolution;
    SamplerKinds& mKinds;
    Places& mPlaces;
    ChosenCalls& mChosen;
    BuiltinChoice mChoice;
    BuiltinForms mForms;
};

} // namespace cg

#endif
