#include <Cg/Compiler/VaryingPlaces.h>

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

std::optional<int> VaryingPlaces::find(const std::string& name) const {
    const auto found = mPlaces.find(name);
    return found == mPlaces.end() ? std::nullopt : std::optional<int>(found->second);
}

std::optional<int> VaryingPlaces::add(const std::string& name, const std::set<int>& taken) {
    const int first = firstChoice(name);
    std::optional<int> place;
    for (int i = 0; i < COUNT; ++i) {
        const int candidate = (first + i) % COUNT;
        if (taken.count(candidate) != 0)
            continue;
        const bool isFree = !mIsUsed[static_cast<std::size_t>(candidate)];
        if (!place || isFree)
            place = candidate;
        if (isFree)
            break;
    }
    if (!place)
        return std::nullopt;
    mIsUsed[static_cast<std::size_t>(*place)] = true;
    mPlaces[name] = *place;
    return place;
}

} // namespace cg
