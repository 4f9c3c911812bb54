#ifndef CG_COMPILER_RESOLVER_SAMPLER_ALIASES_H
#define CG_COMPILER_RESOLVER_SAMPLER_ALIASES_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <set>
#include <unordered_map>
#include <vector>

namespace cg {

struct Resolution;

/// What sampler variables stand for. GLSL cannot copy samplers, so one that was assigned to is another name
/// of what was assigned.
class SamplerAliases {
public:
    struct Assigned {
        Variable* variable;
        TypedExpr* sampler;
    };

    /// A sampler that was given to a variable.
    struct Gift {
        Variable* variable;
        TypedExpr* sampler;
        const Function* giver;
    };

    /// A place in the order of all that happens.
    struct Mark {
        std::size_t assignments;
        std::size_t gifts;
    };

    explicit SamplerAliases(Resolution& resolution) : mResolution(resolution) {}

    /// A variable where it is named: itself, or what it stands for.
    TypedExpr* use(SourceLocation at, Variable* variable);

    /// From now on the variable stands for another sampler.
    void set(Variable* variable, TypedExpr* sampler);

    Mark mark() const { return {mAssigned.size(), mGifts.size()}; }

    /// All since the mark, also those that were taken back.
    std::vector<Gift> giftsSince(Mark mark) const;

    /// Variables stand again for what they stood for at the mark; the gifts stay known.
    /// @return what they stood for until now, in the order in which they were first assigned
    std::vector<Assigned> takeBack(Mark mark);

    /// As if nothing had been assigned since the mark.
    void forget(Mark mark);

private:
    Resolution& mResolution;
    std::vector<Assigned> mAssigned; ///< with what they stood for before, in their order
    std::vector<Gift> mGifts;        ///< all of them, also those of branches
    std::unordered_map<const Variable*, std::set<const Function*>>
        mUsers; ///< functions that are resolved once, of the samplers of the program
};

/// It is a sampler of the program or has been assigned to.
bool standsForSampler(const Variable* variable);

/// A local variable's sampler that nothing has been assigned to yet.
bool isUnset(const TypedExpr* sampler);

} // namespace cg

#endif
