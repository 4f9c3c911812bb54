#ifndef CG_COMPILER_VARYING_PLACES_H
#define CG_COMPILER_VARYING_PLACES_H

#include <array>
#include <cstdint>
#include <map>
#include <set>
#include <string>

namespace cg {

/// Where varyings with semantics of the program's own meet. The stages are compiled apart, so a name keeps
/// its place for all programs that are compiled with the same object, whichever other names they have. Once
/// there are more names than places, some share one; where two of these meet in a program, the one that was
/// used last stays and the other moves. So no name of the program just before, which is likely the other
/// stage, moves.
///
/// Thread: that of the compilations that share it.
class VaryingPlaces {
public:
    static constexpr int COUNT = 20;

    /// Places, from 0, for the names of one program: no two have the same one.
    /// @return for all of the names, or for COUNT of them where there are more
    std::map<std::string, int> assign(const std::set<std::string>& names);

private:
    /// A name's place, and the last program that had it there.
    struct Occupancy {
        int place = 0;
        std::uint64_t program = 0;
    };

    int oldestPlace(const std::string& name, const std::set<int>& taken) const;

    std::uint64_t mProgram = 0; ///< counts them
    std::map<std::string, Occupancy> mNames;
    std::array<std::uint64_t, COUNT> mLastPrograms{}; ///< by place: the last that used it, 0 where none has
};

} // namespace cg

#endif
