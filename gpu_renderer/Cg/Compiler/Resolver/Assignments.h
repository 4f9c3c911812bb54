#ifndef CG_COMPILER_RESOLVER_ASSIGNMENTS_H
#define CG_COMPILER_RESOLVER_ASSIGNMENTS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

namespace cg {

class MemberAccess;
class Places;
class Recursion;
class SamplerAssignments;
struct Resolution;

/// `target = value` and `target += value`
class Assignments {
public:
    Assignments(Resolution& resolution, Recursion& recursion, MemberAccess& members, Places& places,
                SamplerAssignments& samplers)
        : mResolution(resolution), mRecursion(recursion), mMembers(members), mPlaces(places),
          mSamplers(samplers) {}

    /// @return null after an error
    TypedExpr* assign(const AssignExpr* expr);

private:
    TypedExpr* assignElements(const AssignExpr* expr, const MemberExpr* target, TypedExpr* matrix);
    TypedExpr* assignValue(SourceLocation at, TypedExpr* target, TypedExpr* value);
    TypedExpr* assignCombined(const AssignExpr* expr, TypedExpr* target, TypedExpr* value);

    Resolution& mResolution;
    Recursion& mRecursion;
    MemberAccess& mMembers;
    Places& mPlaces;
    SamplerAssignments& mSamplers;
};

} // namespace cg

#endif
