#include "NumberedName.h"

#include "Verbs.h"

namespace {

/// Where the number stands in a name, and how many digits it has at least.
struct Place {
    size_t begin;
    size_t end;
    size_t digits;
};

/// With begin beyond the name where there is none.
Place placeIn(const std::string& name) {
    const Place none = {std::string::npos, 0, 0};
    const size_t begin = name.find('%');
    if (begin == std::string::npos)
        return none;
    const size_t letter = name.find_first_not_of("0123456789", begin + 1);
    if (letter == std::string::npos || name[letter] != 'd' || letter > begin + 3)
        return none;
    const std::string digits = name.substr(begin + 1, letter - begin - 1);
    if (!digits.empty() && digits.front() != '0')
        return none;
    return {begin, letter + 1, digits.empty() ? 0 : std::stoul(digits)};
}

} // namespace

void refuseFrameName(const std::string& name) {
    const Place place = placeIn(name);
    if (place.begin == std::string::npos || name.find('%', place.end) != std::string::npos)
        throw WrongCall("--out: \"" + name +
                        "\" has no place for the frame's number; write it as frame_%05d.png, or - for raw "
                        "frames on standard output");
    constexpr size_t EXTENSION = 4;
    if (name.size() < EXTENSION || name.substr(name.size() - EXTENSION) != ".png")
        throw WrongCall("--out: \"" + name + "\" does not end in .png");
}

std::string numberedName(const std::string& name, int number) {
    const Place place = placeIn(name);
    std::string digits = std::to_string(number);
    digits.insert(0, place.digits > digits.size() ? place.digits - digits.size() : 0, '0');
    return name.substr(0, place.begin) + digits + name.substr(place.end);
}
