#include <Cg/cg.h>

#include <array>
#include <string>
#include <unordered_map>

namespace {

/// The types by name: each scalar kind alone, as a vector and as a matrix, and the rest.
std::unordered_map<int, std::string> namedTypes() {
    std::unordered_map<int, std::string> names = {{CG_STRUCT, "struct"},
                                                  {CG_ARRAY, "array"},
                                                  {CG_SAMPLER1D, "sampler1D"},
                                                  {CG_SAMPLER2D, "sampler2D"},
                                                  {CG_SAMPLER3D, "sampler3D"},
                                                  {CG_SAMPLERRECT, "samplerRECT"},
                                                  {CG_SAMPLERCUBE, "samplerCUBE"},
                                                  {CG_SAMPLER1DARRAY, "sampler1DARRAY"},
                                                  {CG_SAMPLER2DARRAY, "sampler2DARRAY"},
                                                  {CG_STRING, "string"}};
    const std::array<std::pair<int, const char*>, 5> kinds = {
        {{CG_FLOAT, "float"}, {CG_HALF, "half"}, {CG_FIXED, "fixed"}, {CG_INT, "int"}, {CG_BOOL, "bool"}}};
    for (const auto& [value, name] : kinds) {
        names[value] = name;
        for (int columns = 1; columns <= 4; ++columns) {
            names[value + columns] = name + std::to_string(columns);
            for (int rows = 1; rows <= 4; ++rows)
                names[value + 10 * rows + columns] =
                    name + std::to_string(rows) + 'x' + std::to_string(columns);
        }
    }
    return names;
}

} // namespace

const char* cgGetTypeString(CGtype type) {
    static const std::unordered_map<int, std::string> names = namedTypes();
    const auto found = names.find(type);
    return found == names.end() ? "unknown type" : found->second.c_str();
}
