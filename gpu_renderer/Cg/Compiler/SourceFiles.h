#ifndef CG_COMPILER_SOURCE_FILES_H
#define CG_COMPILER_SOURCE_FILES_H

#include <Cg/Compiler/Arena.h>
#include <Cg/Compiler/SourceLocation.h>

#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cg {

/// The files of one compilation. Owns their texts and every spelling that is in none of them, so tokens and
/// tree hold plain views; must outlive both.
class SourceFiles {
public:
    /// Takes a file in, without its byte order mark; the first one is the program's main file.
    /// @param name  as errors show it, and the path that its includes are relative to
    /// @return its index, for SourceLocation::file
    std::uint32_t add(std::string name, std::string text);

    /// The index of the file that add() took under this name, if any.
    std::optional<std::uint32_t> find(std::string_view name) const;

    const std::string& name(std::uint32_t file) const { return mFiles[file].name; }

    /// The whole text; a view into it lives as long as this object.
    std::string_view text(std::uint32_t file) const { return mFiles[file].text; }

    /// One line without its line end; empty for a line that the file has not. Searches from the file's start.
    /// @param line  from 1, counted in the file itself
    std::string_view line(std::uint32_t file, std::uint32_t line) const;

    /// Copies a spelling that stands in no file: the result of `##` or of a `\` within a word.
    std::string_view keep(std::string_view spelling) { return mSpellings.keep(spelling); }

    /// What `#line` says: from a line of the file on, lines count from another number.
    /// @param line       first line concerned, counted in the file itself
    /// @param shownLine  its number from now on
    /// @param shownName  the file's name from now on; empty leaves it
    void renumber(std::uint32_t file, std::uint32_t line, std::uint32_t shownLine,
                  std::string_view shownName);

    /// File name and line as the user is to see them, after `#line`.
    struct Shown {
        std::string_view name;
        std::uint32_t line = 0;
    };
    Shown shown(SourceLocation location) const;

private:
    struct Renumbering {
        std::uint32_t line;
        std::uint32_t shownLine;
        std::string_view shownName;
    };
    struct File {
        std::string name;
        std::string text;
        std::vector<Renumbering> renumberings; ///< by line
    };

    std::deque<File> mFiles; ///< a deque: texts stay where they are
    std::unordered_map<std::string_view, std::uint32_t> mIndexByName;
    Arena mSpellings;
};

} // namespace cg

#endif
