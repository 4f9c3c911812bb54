#ifndef CG_COMPILER_RESOLVER_SAMPLER_SELECTOR_H
#define CG_COMPILER_RESOLVER_SAMPLER_SELECTOR_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

struct Resolution;

/// A sampler variable that changes in a loop or a `switch`: a number says while the program runs which of
/// these samplers it stands for.
class SamplerSelector {
public:
    explicit SamplerSelector(Resolution& resolution) : mResolution(&resolution) {}

    /// Makes a sampler one of those; an element whose index is not known means all of its array.
    void add(SourceLocation at, TypedExpr* sampler);

    /// @return false where there are more than a choice may have
    bool fits() const;

    /// Makes the number, once all samplers are known.
    void makeNumber();

    /// @param sampler  one of those, with a choice or an index that can be written several times
    /// @return the assignment that selects it; null after an error
    TypedExpr* select(SourceLocation at, TypedExpr* sampler);

    /// The assignment before which the variable stands for nothing.
    TypedExpr* selectNothing(SourceLocation at);

    /// What the variable stands for.
    TypedExpr* choice(SourceLocation at, const Type* type) const;

private:
    void addOne(TypedExpr* sampler);
    TypedExpr* numberOf(SourceLocation at, TypedExpr* sampler);
    TypedExpr* numberOfElement(SourceLocation at, TypedExpr* element);
    TypedExpr* assign(SourceLocation at, TypedExpr* number);
    TypedExpr* chosen(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue, TypedExpr* whenFalse);

    Resolution* mResolution;
    Variable* mNumber = nullptr;
    std::vector<TypedExpr*> mSamplers;
};

} // namespace cg

#endif
