#ifndef CG_COMPILER_RESOLVER_PASSED_ARGUMENTS_H
#define CG_COMPILER_RESOLVER_PASSED_ARGUMENTS_H

#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class Places;
struct Resolution;

/// The arguments of one call as GLSL takes them: converted, and by way of temporaries where GLSL could not
/// write back to them.
class PassedArguments {
public:
    PassedArguments(Resolution& resolution, Places& places) : mResolution(resolution), mPlaces(places) {}

    /// @return what is passed; null after an error
    TypedExpr* pass(TypedExpr* argument, const Type* type, Direction direction);

    /// @param step  what has to be done before the call, after all steps so far; may be null
    void prepare(TypedExpr* step);

    /// The call with what has to be done before and after it, as one expression.
    TypedExpr* around(TypedExpr* call);

private:
    bool writeBack(TypedExpr* argument, Variable* place);

    Resolution& mResolution;
    Places& mPlaces;
    std::vector<TypedExpr*> mBefore;
    std::vector<TypedExpr*> mAfter;
};

} // namespace cg

#endif
