#ifndef CG_COMPILER_DIAGNOSTICS_H
#define CG_COMPILER_DIAGNOSTICS_H

#include <Cg/Compiler/SourceLocation.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace cg {

class SourceFiles;

enum class Severity { WARNING, ERROR };

struct Diagnostic {
    /// A line more under an error or a warning: a candidate, an earlier declaration.
    struct Note {
        SourceLocation location;
        std::string message;
    };

    Severity severity = Severity::ERROR;
    SourceLocation location;
    std::string message; ///< one line: what and why, in the user's words
    std::vector<Note> notes;
};

/// Collects the errors and warnings of one compilation, from all its stages.
///
/// Of each severity the first MAX_COUNT are kept. What says the same about the same place is kept once, so a
/// function that is checked twice complains once.
class Diagnostics {
public:
    static constexpr std::size_t MAX_COUNT = 50;

    void error(SourceLocation location, std::string message);
    void warning(SourceLocation location, std::string message);

    /// Adds a line to the error or warning that was reported last; nothing where that one was not kept.
    void note(SourceLocation location, std::string message);

    bool hasErrors() const { return mErrorCount > 0; }

    /// No further error would be kept: a stage may stop.
    bool isFull() const { return mErrorCount >= MAX_COUNT; }

    const std::vector<Diagnostic>& all() const { return mDiagnostics; } ///< in the order of their reports

    /// Every message in the order of the source: `file(line) : error: what and why`, under it the line of the
    /// source and a caret under the column. Ends in a line end; empty where there is nothing to say.
    std::string listing(const SourceFiles& files) const;

private:
    void report(Severity severity, SourceLocation location, std::string message);

    std::vector<Diagnostic> mDiagnostics;
    std::size_t mErrorCount = 0;
    std::size_t mWarningCount = 0;
    bool mKeptLast = false;
};

/// A piece of the source as messages quote it: in single quotes, cut where it is long, bytes that do not
/// print as `\x8f`.
std::string inQuotes(std::string_view text);

} // namespace cg

#endif
