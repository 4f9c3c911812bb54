#ifndef CG_COMPILER_RESOLVER_SAMPLER_LISTS_H
#define CG_COMPILER_RESOLVER_SAMPLER_LISTS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

namespace cg {

struct Resolution;

/// Arrays of samplers, whose elements may have been assigned one by one: such an array stands for a list of
/// samplers, a CONSTRUCT.
///
/// Operations return null after an error.
class SamplerLists {
public:
    explicit SamplerLists(Resolution& resolution) : mResolution(resolution) {}

    /// `list[index]`: a choice where the index is known only while the program runs.
    TypedExpr* element(SourceLocation at, TypedExpr* list, TypedExpr* index);

    /// `condition ? whenTrue : whenFalse`; of arrays of samplers element by element.
    TypedExpr* choose(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue, TypedExpr* whenFalse);

    /// The array with another sampler at one position.
    TypedExpr* withElement(SourceLocation at, const Type* type, TypedExpr* array, int position,
                           TypedExpr* sampler);

private:
    TypedExpr* part(SourceLocation at, TypedExpr* array, int position);
    TypedExpr* chooseOne(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue, TypedExpr* whenFalse);

    Resolution& mResolution;
};

} // namespace cg

#endif
