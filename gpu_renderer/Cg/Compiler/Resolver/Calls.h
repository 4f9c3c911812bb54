#ifndef CG_COMPILER_RESOLVER_CALLS_H
#define CG_COMPILER_RESOLVER_CALLS_H

#include <Cg/Compiler/Resolver/Overloads.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class BuiltinCalls;
class Declarations;
class FunctionCalls;
class Initializers;
class Recursion;
class TypeResolver;
struct Resolution;

/// Calls: finds what is called, a method, a function of the program, a built-in one or a type.
class Calls {
public:
    Calls(Resolution& resolution, const Declarations& declarations, Recursion& recursion, TypeResolver& types,
          Initializers& initializers, Overloads& overloads, FunctionCalls& functions, BuiltinCalls& builtins);

    /// @return null after an error
    TypedExpr* call(const CallExpr* expr);

private:
    using Arguments = std::vector<TypedExpr*>;

    TypedExpr* callMember(const MemberExpr* callee, const Arguments& arguments);
    TypedExpr* callNamed(const CallExpr* expr, Name name, const Arguments& arguments);
    TypedExpr* callOwn(SourceLocation at, Name name, const Overloads::Functions& functions,
                       const Arguments& arguments);
    TypedExpr* callType(const CallExpr* expr, const Type* type, const Arguments& arguments);
    bool isCut(const FunctionDecl* function, const Arguments& arguments);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Recursion& mRecursion;
    TypeResolver& mTypes;
    Initializers& mInitializers;
    Overloads& mOverloads;
    FunctionCalls& mFunctions;
    BuiltinCalls& mBuiltins;
};

} // namespace cg

#endif
