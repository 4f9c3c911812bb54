#include <Cg/Compiler/VaryingPlaces.h>

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

namespace cg {

namespace {

/// Where the search for a name's place starts, so that most names have the same one in every process.
int firstChoice(const std::string& name) {
    unsigned hash = 2166136261U;
    for (const char c : name)
        hash = (hash ^ static_cast<unsigned char>(c)) * 16777619U;
    return static_cast<int>(hash % VaryingPlaces::COUNT);
}

} // namespace

std::map<std::string, int> VaryingPlaces::assign(const std::set<std::string>& names) {
    ++mProgram;
    std::vector<std::pair<std::string, Occupancy>> known;
    for (const std::string& name : names)
        if (const auto found = mNames.find(name); found != mNames.end())
            known.emplace_back(*found);
    std::sort(known.begin(), known.end(),
              [](const auto& a, const auto& b) { return a.second.program > b.second.program; });

    std::map<std::string, int> places;
    std::set<int> taken;
    for (const auto& [name, occupancy] : known)
        if (taken.insert(occupancy.place).second)
            places[name] = occupancy.place;
    for (const std::string& name : names)
        if (places.count(name) == 0 && taken.size() < COUNT)
            taken.insert(places[name] = oldestPlace(name, taken));
    for (const auto& [name, place] : places) {
        mNames[name] = {place, mProgram};
        mLastPrograms[static_cast<std::size_t>(place)] = mProgram;
    }
    return places;
}

/// The place that has been without a program the longest, of those that are not taken: there is one.
int VaryingPlaces::oldestPlace(const std::string& name, const std::set<int>& taken) const {
    const auto lastProgram = [&](int place) { return mLastPrograms[static_cast<std::size_t>(place)]; };
    int oldest = -1;
    for (int i = 0; i < COUNT; ++i) {
        const int place = (firstChoice(name) + i) % COUNT;
        if (taken.count(place) == 0 && (oldest < 0 || lastProgram(place) < lastProgram(oldest)))
            oldest = place;
    }
    return oldest;
}

} // namespace cg
