#include <Cg/Compiler/Resolver/ListCursor.h>

#include <Cg/Compiler/Resolver/Recursion.h>

namespace cg {

TypedExpr* ListCursor::value() {
    if (!mValue) {
        mValue = mRecursion.expression(element());
        if (!mValue)
            mNext = mElements.size();
    }
    return mValue;
}

void ListCursor::take(int components) {
    mTaken += components;
    if (mTaken == mValue->type->components())
        advance();
}

void ListCursor::advance() {
    ++mNext;
    mValue = nullptr;
    mTaken = 0;
}

} // namespace cg
