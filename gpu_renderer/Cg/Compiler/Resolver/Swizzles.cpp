#include <Cg/Compiler/Resolver/Swizzles.h>

#include <cstddef>

namespace cg {

std::vector<int> swizzleComponents(Name name) {
    if (name.empty() || name.size() > 4)
        return {};
    for (const Name set : {Name("xyzw"), Name("rgba"), Name("stpq")}) {
        std::vector<int> components;
        for (const char letter : name) {
            const std::size_t position = set.find(letter);
            if (position == Name::npos)
                break;
            components.push_back(static_cast<int>(position));
        }
        if (components.size() == name.size())
            return components;
    }
    return {};
}

std::vector<MatrixElement> matrixElements(Name name) {
    std::vector<MatrixElement> elements;
    while (!name.empty()) {
        const bool fromZero = name.size() >= 4 && name[0] == '_' && name[1] == 'm';
        const std::size_t length = fromZero ? 4 : 3;
        if (name.size() < length || name[0] != '_' || elements.size() == 4)
            return {};
        const Name digits = fromZero ? "0123" : "1234";
        const std::size_t row = digits.find(name[length - 2]);
        const std::size_t column = digits.find(name[length - 1]);
        if (row == Name::npos || column == Name::npos)
            return {};
        elements.push_back({static_cast<int>(row), static_cast<int>(column)});
        name = name.substr(length);
    }
    return elements;
}

} // namespace cg
