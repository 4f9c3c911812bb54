#ifndef CG_COMPILER_SOURCE_LOCATION_H
#define CG_COMPILER_SOURCE_LOCATION_H

#include <cstdint>

namespace cg {

/// A place in the source as the user wrote it: what a macro expands to stands where the macro's name is
/// written, a macro's argument where the argument is written.
///
/// Lines are counted in the file itself; SourceFiles knows what `#line` makes of them.
struct SourceLocation {
    std::uint32_t file = 0;   ///< index into SourceFiles
    std::uint32_t line = 0;   ///< from 1; 0 for what stands in no file
    std::uint32_t column = 0; ///< from 1, in bytes
};

constexpr bool operator==(SourceLocation a, SourceLocation b) {
    return a.file == b.file && a.line == b.line && a.column == b.column;
}

constexpr bool operator!=(SourceLocation a, SourceLocation b) {
    return !(a == b);
}

/// The order of the source: file by file in the order of their first inclusion, the main file first.
constexpr bool operator<(SourceLocation a, SourceLocation b) {
    if (a.file != b.file)
        return a.file < b.file;
    return a.line != b.line ? a.line < b.line : a.column < b.column;
}

} // namespace cg

#endif
