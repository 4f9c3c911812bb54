#ifndef CG_COMPILER_VARYING_PLACES_H
#define CG_COMPILER_VARYING_PLACES_H

#include <array>
#include <map>
#include <optional>
#include <set>
#include <string>

namespace cg {

/// Where varyings with semantics of the program's own meet. The stages are compiled apart, so a name keeps
/// its place for all programs that are compiled with the same object, whichever other names they have.
///
/// Thread: that of the compilations that share it.
class VaryingPlaces {
public:
    static constexpr int COUNT = 20;

    /// The place that a name has, from 0.
    std::optional<int> find(const std::string& name) const;

    /// Gives a name a place: one that no name has, or else one that is not taken.
    /// @param taken  places of other names of the same program
    /// @return the place, or nothing where all are taken
    std::optional<int> add(const std::string& name, const std::set<int>& taken);

private:
    std::map<std::string, int> mPlaces;
    std::array<bool, COUNT> mIsUsed{};
};

} // namespace cg

#endif
