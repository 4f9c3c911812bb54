#ifndef CG_COMPILER_RESOLVER_INITIALIZERS_H
#define CG_COMPILER_RESOLVER_INITIALIZERS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <map>
#include <unordered_map>
#include <vector>

namespace cg {

class Recursion;
struct Resolution;

/// Initial values: lists in braces, and constructors that read as such lists.
///
/// Operations return null after an error.
class Initializers {
public:
    Initializers(Resolution& resolution, Recursion& recursion)
        : mResolution(resolution), mRecursion(recursion) {}

    /// @param type  an unsized array gets its length here
    TypedExpr* value(const Type*& type, const Expr* expr);

    /// Of a sampler or of an array of them.
    TypedExpr* sampler(const Type* type, const Expr* expr);

    /// `float[](1, 2)`
    TypedExpr* array(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);

    /// `Light(position, colour)`
    TypedExpr* structure(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments);

    /// @param list  what a list has become
    /// @return the sampler that it gave a field of its struct: such values have no place in the list; or null
    TypedExpr* listedSampler(const TypedExpr* list, std::size_t field) const;

private:
    class Cursor;

    TypedExpr* fromList(const Type* type, const InitListExpr* list);
    const Type* sizedByList(const Type* type, const InitListExpr* list);
    TypedExpr* nextValue(Cursor& cursor);
    TypedExpr* fill(const Type* type, Cursor& cursor);
    std::vector<const Type*> piecesOf(const Type* type, const Cursor& cursor) const;
    TypedExpr* fillPieces(SourceLocation at, const Type* type, Cursor& cursor);
    bool fillSampler(TypedExpr* whole, std::size_t field, Cursor& cursor);
    TypedExpr* fillNumber(const Type* type, Cursor& cursor);
    TypedExpr* gatherNumber(SourceLocation at, const Type* type, Cursor& cursor);
    int takeComponents(SourceLocation at, int wanted, Cursor& cursor, std::vector<TypedExpr*>& parts);

    Resolution& mResolution;
    Recursion& mRecursion;
    std::unordered_map<const TypedExpr*, std::map<std::size_t, TypedExpr*>> mListedSamplers; ///< by field
};

} // namespace cg

#endif
