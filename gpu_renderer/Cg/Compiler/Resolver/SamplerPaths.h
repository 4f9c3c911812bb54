#ifndef CG_COMPILER_RESOLVER_SAMPLER_PATHS_H
#define CG_COMPILER_RESOLVER_SAMPLER_PATHS_H

#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <vector>

/// Where samplers are within structs and arrays.
namespace cg {

/// The way from a variable down to a member: names with points, and the elements on the way.
struct SamplerPath {
    Variable* root = nullptr; ///< null where the expression is no part of a variable
    std::string members;
    std::vector<const TypedExpr*> elements;
};

SamplerPath pathTo(const TypedExpr* expression);

/// A sampler of a type, or an array of as many samplers as the arrays on the way have.
struct SamplerPiece {
    std::string path;
    const Type* type = nullptr; ///< of one
    int count = 1;

    const Type* wholeType(TypeTable& types) const { return count > 1 ? types.array(type, count) : type; }
};

/// All samplers within a type.
std::vector<SamplerPiece> samplersOf(const Type* type);

/// Both are the same variable or the same known element of one.
bool isSameSampler(const TypedExpr* a, const TypedExpr* b);

/// An element of an array whose index is known only while the program runs.
bool isAnyElement(const TypedExpr* sampler);

} // namespace cg

#endif
