#ifndef CG_COMPILER_RESOLVER_SAMPLER_KINDS_H
#define CG_COMPILER_RESOLVER_SAMPLER_KINDS_H

#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <set>

namespace cg {

/// What look-ups say of the kinds of samplers. Outlives the resolving of a program: one with a sampler that
/// is found to be looked up both with and without a comparison of depths, which GLSL has no type for, has to
/// be resolved again, with no comparison for samplers of that name.
class SamplerKinds {
public:
    /// A look-up has decided what kind a sampler is.
    void decide(TypedExpr* sampler, const Type* type, TypeTable& types);

    /// A sampler with that name compares no depth, whatever coordinates a look-up has.
    void notePlain(Name name) { mPlain.insert(name); }

    /// @param sampler  of a choice it is enough that one is plain
    bool isPlain(TypedExpr* sampler) const;

    /// @return number of plain names: where it has grown, the program has to be resolved again
    std::size_t plainCount() const { return mPlain.size(); }

private:
    std::set<Name> mPlain;
};

} // namespace cg

#endif
