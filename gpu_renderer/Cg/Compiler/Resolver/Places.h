#ifndef CG_COMPILER_RESOLVER_PLACES_H
#define CG_COMPILER_RESOLVER_PLACES_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

struct Resolution;

/// What a program writes to.
class Places {
public:
    explicit Places(Resolution& resolution) : mResolution(resolution) {}

    /// Notes that the place is written to.
    /// @return false after an error, where it cannot be
    bool checkAssignable(SourceLocation at, const TypedExpr* target);

    /// A whole row of an array of arrays, which is flat in GLSL: each element by itself.
    TypedExpr* assignRow(SourceLocation at, TypedExpr* target, TypedExpr* value);

    /// To places one after another, such as a matrix' elements: each gets its component of a vector.
    /// @return the assignments in their order
    std::vector<TypedExpr*> assignComponents(SourceLocation at, const std::vector<TypedExpr*>& targets,
                                             Variable* vector);

private:
    Resolution& mResolution;
};

} // namespace cg

#endif
