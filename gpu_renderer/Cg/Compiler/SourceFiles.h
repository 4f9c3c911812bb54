#ifndef CG_COMPILER_SOURCE_FILES_H
#define CG_COMPILER_SOURCE_FILES_H

#include <Cg/Compiler/Arena.h>
#include <Cg/Compiler/SourceLocation.h>

#include <cstdint>
#include <deque>
#include <map>
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

    /// What stands at a location comes out of a macro whose name is written there.
    struct Expansion {
        std::string_view macro;
        SourceLocation definition; ///< in no line for a macro that the host defines
    };

    /// Of macros within macros the outermost counts, which is noted first.
    void noteExpansion(SourceLocation location, const Expansion& expansion) {
        mExpansions.emplace(location, expansion);
    }

    /// Null where no macro was expanded.
    const Expansion* expansionAt(SourceLocation location) const {
        const auto found = mExpansions.find(location);
        return found == mExpansions.end() ? nullptr : &found->second;
    }

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
    std::map<SourceLocation, Expansion> mExpansions;
    Arena mSpellings;
};

} // namespace cg

#endif
