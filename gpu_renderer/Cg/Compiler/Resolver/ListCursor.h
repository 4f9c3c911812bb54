#ifndef CG_COMPILER_RESOLVER_LIST_CURSOR_H
#define CG_COMPILER_RESOLVER_LIST_CURSOR_H

#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <vector>

namespace cg {

class Recursion;

/// Where the values of a list in braces are taken from: an element, and the components of its value that are
/// left.
class ListCursor {
public:
    /// @param list  not empty
    ListCursor(const InitListExpr* list, Recursion& recursion)
        : mElements(list->elements), mRecursion(recursion) {}

    bool isAtEnd() const { return mNext >= mElements.size(); }
    bool isAtLast() const { return mNext + 1 == mElements.size(); }

    /// An inner list comes next.
    bool isAtList() const { return !isAtEnd() && mElements[mNext]->kind == Expr::Kind::INIT_LIST; }

    /// The element that it stands on; at the end the last one.
    const Expr* element() const { return isAtEnd() ? mElements.back() : mElements[mNext]; }

    /// @return the element's value; null after an error, and the cursor is at the end: said once is enough
    TypedExpr* value();

    /// Components of the value that have been taken.
    int taken() const { return mTaken; }

    /// Takes so many more, and goes on where the value has no others.
    void take(int components);

    void advance();

private:
    const std::vector<Expr*>& mElements;
    Recursion& mRecursion;
    std::size_t mNext = 0;
    TypedExpr* mValue = nullptr;
    int mTaken = 0;
};

} // namespace cg

#endif
