#ifndef CG_COMPILER_RESOLVER_MEMBER_ACCESS_H
#define CG_COMPILER_RESOLVER_MEMBER_ACCESS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

namespace cg {

class SamplerLists;
class SamplerPieces;
class TypeResolver;
struct Resolution;

/// Members, components and elements of values.
///
/// Operations return null after an error.
class MemberAccess {
public:
    MemberAccess(Resolution& resolution, TypeResolver& types, SamplerPieces& pieces, SamplerLists& lists)
        : mResolution(resolution), mTypes(types), mPieces(pieces), mLists(lists) {}

    /// `object.name`
    TypedExpr* member(SourceLocation at, TypedExpr* object, Name name);

    /// `matrix._m00_m11`: a CONSTRUCT of the elements where they are several
    TypedExpr* elementsOf(SourceLocation at, TypedExpr* matrix, Name name);

    /// `object[index]`
    TypedExpr* element(SourceLocation at, TypedExpr* object, TypedExpr* index);

private:
    TypedExpr* field(SourceLocation at, TypedExpr* object, Name name);
    TypedExpr* swizzle(SourceLocation at, TypedExpr* object, Name name);
    TypedExpr* elementOfUnsized(SourceLocation at, TypedExpr* array, TypedExpr* index);

    Resolution& mResolution;
    TypeResolver& mTypes;
    SamplerPieces& mPieces;
    SamplerLists& mLists;
};

} // namespace cg

#endif
