#ifndef CG_COMPILER_RESOLVER_BUILTIN_FORMS_H
#define CG_COMPILER_RESOLVER_BUILTIN_FORMS_H

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <string>
#include <vector>

namespace cg {

class PassedArguments;
struct Resolution;

/// A built-in function's GLSL text for one call, in which $0, $1, ... are the operands.
struct BuiltinForm {
    std::string text;
    std::vector<TypedExpr*> operands;
};

/// Turns the forms of built-in functions, with their arguments, into GLSL text with operands.
class BuiltinForms {
public:
    explicit BuiltinForms(Resolution& resolution) : mResolution(resolution) {}

    /// Components that the form takes of an argument become operands of their own: `texture($0, $1.xy)` for
    /// (s, c) is `texture($0, $1)` for (s, c.xy).
    /// @param arguments  converted; one that is taken apart comes to be one that can be written twice
    /// @param passed     receives what that needs
    BuiltinForm expand(const BuiltinFunction& function, std::vector<TypedExpr*>& arguments,
                       PassedArguments& passed);

private:
    std::string withKnownOffset(const BuiltinFunction& function, std::vector<TypedExpr*>& arguments);
    TypedExpr* partOf(TypedExpr*& argument, const std::vector<int>& components, PassedArguments& passed);

    Resolution& mResolution;
};

} // namespace cg

#endif
