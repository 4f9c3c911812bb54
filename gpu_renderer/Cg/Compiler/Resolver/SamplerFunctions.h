#ifndef CG_COMPILER_RESOLVER_SAMPLER_FUNCTIONS_H
#define CG_COMPILER_RESOLVER_SAMPLER_FUNCTIONS_H

#include <Cg/Compiler/Resolver/FunctionContext.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <vector>

namespace cg {

class Declarations;
class Overloads;
class Recursion;
struct Resolution;

/// Functions that give a sampler: GLSL has none, so what one chooses is put in place of its call.
class SamplerFunctions {
public:
    SamplerFunctions(Resolution& resolution, const Declarations& declarations, Recursion& recursion,
                     Overloads& overloads)
        : mResolution(resolution), mDeclarations(declarations), mRecursion(recursion), mOverloads(overloads) {
    }

    /// @return null after an error
    TypedExpr* call(SourceLocation at, const FunctionDecl* declaration,
                    const std::vector<TypedExpr*>& arguments);

private:
    const FunctionDecl* findDefinition(SourceLocation at, const FunctionDecl* declaration);
    bool bind(const FunctionDecl* definition, const std::vector<TypedExpr*>& arguments,
              FunctionContext& context);
    TypedExpr* chosen(const FunctionDecl* definition, const std::vector<Stmt*>& body, std::size_t& ways);
    TypedExpr* chosenByIf(const FunctionDecl* definition, const std::vector<Stmt*>& body, std::size_t& ways);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Recursion& mRecursion;
    Overloads& mOverloads;
    int mCalls = 0;
};

} // namespace cg

#endif
