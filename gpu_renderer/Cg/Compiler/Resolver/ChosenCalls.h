#ifndef CG_COMPILER_RESOLVER_CHOSEN_CALLS_H
#define CG_COMPILER_RESOLVER_CHOSEN_CALLS_H

#include <Cg/Compiler/TypedTree.h>

#include <cstddef>

namespace cg {

struct Resolution;

/// Calls with samplers that are chosen while the program runs. GLSL knows no choice among samplers and
/// indexes arrays of them by constants only: such a call becomes a choice among calls.
class ChosenCalls {
public:
    explicit ChosenCalls(Resolution& resolution) : mResolution(resolution) {}

    /// The call with each of its samplers known. Refuses one that would be written out too often.
    /// @return null after an error
    TypedExpr* withKnownSamplers(TypedExpr* call);

private:
    bool count(const TypedExpr* call);
    TypedExpr* expand(TypedExpr* call);
    TypedExpr* withSimpleOperands(TypedExpr* call, std::size_t position);
    TypedExpr* chooseByCondition(TypedExpr* call, std::size_t position);
    TypedExpr* chooseByIndex(TypedExpr* call, std::size_t position);
    TypedExpr* expandWith(const TypedExpr* call, std::size_t position, TypedExpr* sampler);

    Resolution& mResolution;
    std::size_t mWritten = 0; ///< calls that stand for ones with samplers to be chosen
};

} // namespace cg

#endif
