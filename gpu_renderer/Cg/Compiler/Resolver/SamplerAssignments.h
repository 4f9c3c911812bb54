#ifndef CG_COMPILER_RESOLVER_SAMPLER_ASSIGNMENTS_H
#define CG_COMPILER_RESOLVER_SAMPLER_ASSIGNMENTS_H

#include <Cg/Compiler/Resolver/SamplerSelector.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <unordered_map>

namespace cg {

class Globals;
class InitializerLists;
class Recursion;
class SamplerAliases;
class SamplerLists;
class SamplerPieces;
struct Resolution;

/// Assignments of samplers, to variables, members and elements, and copies of structs that hold some.
class SamplerAssignments {
public:
    SamplerAssignments(Resolution& resolution, Recursion& recursion, Globals& globals,
                       const InitializerLists& initializerLists, SamplerAliases& aliases,
                       SamplerPieces& pieces, SamplerLists& lists)
        : mResolution(resolution), mRecursion(recursion), mGlobals(globals),
          mInitializerLists(initializerLists), mAliases(aliases), mPieces(pieces), mLists(lists) {}

    /// Where an assignment puts samplers, and not what stands there: a variable, a member or an element.
    /// @return null for other places, and after an error that resolving the place as an expression reports
    TypedExpr* place(const Expr* target);

    /// @param target  as place() gives it
    /// @return null after an error
    TypedExpr* assign(SourceLocation at, TypedExpr* target, TypedExpr* value);

    /// The samplers of a struct that is copied: those of the copy stand for those of the original.
    /// @return what has to be done for it, or null
    TypedExpr* copy(SourceLocation at, const TypedExpr* target, const TypedExpr* value);

    /// The sampler as it is chosen now, whatever becomes of what it is chosen by.
    /// @param preparation  receives what keeps that, behind what it holds, or nothing
    TypedExpr* frozen(TypedExpr* sampler, TypedExpr*& preparation);

    /// Assignments to the variable set a number from now on.
    void beginSelection(const Variable* variable, const SamplerSelector& selector);
    void endSelection(const Variable* variable) { mSelectors.erase(variable); }

private:
    TypedExpr* placeOfName(const NameExpr* target);
    TypedExpr* placeOfMember(const MemberExpr* target);
    TypedExpr* placeOfElement(const IndexExpr* target);
    TypedExpr* give(SourceLocation at, Variable* variable, TypedExpr* sampler);
    TypedExpr* giveListed(SourceLocation at, Variable* root, const std::string& path, const TypedExpr* list);
    TypedExpr* giveElement(SourceLocation at, const TypedExpr* element, TypedExpr* sampler);

    Resolution& mResolution;
    Recursion& mRecursion;
    Globals& mGlobals;
    const InitializerLists& mInitializerLists;
    SamplerAliases& mAliases;
    SamplerPieces& mPieces;
    SamplerLists& mLists;
    std::unordered_map<const Variable*, SamplerSelector> mSelectors; ///< of the loops and switches around
};

} // namespace cg

#endif
