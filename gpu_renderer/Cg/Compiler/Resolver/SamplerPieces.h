#ifndef CG_COMPILER_RESOLVER_SAMPLER_PIECES_H
#define CG_COMPILER_RESOLVER_SAMPLER_PIECES_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <vector>

namespace cg {

class SamplerAliases;
struct Resolution;

/// The samplers of variables with a struct type. GLSL structs of ours hold none: each sampler is a variable
/// of its own, and those within arrays are arrays.
class SamplerPieces {
public:
    SamplerPieces(Resolution& resolution, SamplerAliases& aliases)
        : mResolution(resolution), mAliases(aliases) {}

    /// @param path  of members: `.layers.base`
    Variable* piece(Variable* owner, const std::string& path, const Type* type);

    /// `object.name`
    /// @return null after an error
    TypedExpr* member(SourceLocation at, TypedExpr* object, Name name, const Type* type);

    /// The samplers among the members of an entry's parameter that is no uniform: they are uniforms
    /// nevertheless.
    /// @param outer  the variable around the entry's call
    void addUniforms(Variable* inner, Variable* outer);

    void addParameters(Function* function, Variable* parameter);

private:
    TypedExpr* flatIndex(SourceLocation at, const std::vector<const TypedExpr*>& elements);

    Resolution& mResolution;
    SamplerAliases& mAliases;
};

} // namespace cg

#endif
