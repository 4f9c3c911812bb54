#ifndef CG_COMPILER_RESOLVER_INITIALIZER_LISTS_H
#define CG_COMPILER_RESOLVER_INITIALIZER_LISTS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <map>
#include <unordered_map>
#include <vector>

namespace cg {

class ListCursor;
class Recursion;
struct Resolution;

/// Lists in braces as values.
///
/// Operations return null after an error.
class InitializerLists {
public:
    InitializerLists(Resolution& resolution, Recursion& recursion)
        : mResolution(resolution), mRecursion(recursion) {}

    TypedExpr* value(const Type* type, const InitListExpr* list);

    /// An array without a size as long as the list asks for.
    const Type* sized(const Type* type, const InitListExpr* list);

    /// @param list  what a list has become
    /// @return the sampler that it gave a field of its struct: the value has no place for it; or null
    TypedExpr* sampler(const TypedExpr* list, std::size_t field) const;

private:
    TypedExpr* fill(const Type* type, ListCursor& cursor);
    std::vector<const Type*> piecesOf(const Type* type, const ListCursor& cursor) const;
    TypedExpr* fillPieces(SourceLocation at, const Type* type, ListCursor& cursor);
    bool fillSampler(TypedExpr* whole, std::size_t field, ListCursor& cursor);
    TypedExpr* fillNumber(const Type* type, ListCursor& cursor);
    TypedExpr* gatherNumber(SourceLocation at, const Type* type, ListCursor& cursor);
    int takeComponents(SourceLocation at, int wanted, ListCursor& cursor, std::vector<TypedExpr*>& parts);

    Resolution& mResolution;
    Recursion& mRecursion;
    std::unordered_map<const TypedExpr*, std::map<std::size_t, TypedExpr*>> mSamplers; ///< by field
};

} // namespace cg

#endif
