#include <Cg/Compiler/Diagnostics.h>

#include <Cg/Compiler/SourceFiles.h>

#include <algorithm>
#include <utility>

namespace cg {

namespace {

constexpr std::size_t MAX_QUOTED_BYTES = 48;

/// Bytes of a source line that an excerpt shows to either side of the caret.
constexpr std::size_t EXCERPT_REACH = 80;

bool isControl(char c) {
    return static_cast<unsigned char>(c) < 0x20 || c == 0x7F;
}

bool isUtf8Continuation(char c) {
    return (static_cast<unsigned char>(c) & 0xC0) == 0x80;
}

void appendHead(std::string& listing, const SourceFiles& files, SourceLocation location, const char* kind,
                const std::string& message) {
    const SourceFiles::Shown shown = files.shown(location);
    listing.append(shown.name).append("(").append(std::to_string(shown.line)).append(") : ");
    listing.append(kind).append(": ").append(message).append("\n");
}

/// The line of the source, and a caret under its column.
void appendExcerpt(std::string& listing, const SourceFiles& files, SourceLocation location) {
    const std::string_view line = files.line(location.file, location.line);
    if (line.empty() || location.column == 0)
        return;
    const std::size_t caret = std::min<std::size_t>(location.column - 1, line.size());
    std::size_t begin = caret > EXCERPT_REACH ? caret - EXCERPT_REACH : 0;
    while (begin < caret && isUtf8Continuation(line[begin]))
        ++begin;
    std::string shown;
    std::string indent;
    for (std::size_t at = begin; at < line.size() && at < caret + EXCERPT_REACH; ++at) {
        const char c = line[at] == '\t' || !isControl(line[at]) ? line[at] : ' ';
        shown += c;
        if (at < caret && !isUtf8Continuation(c))
            indent += c == '\t' ? '\t' : ' ';
    }
    listing.append("    ").append(shown).append("\n    ").append(indent).append("^\n");
}

} // namespace

void Diagnostics::error(SourceLocation location, std::string message) {
    report(Severity::ERROR, location, std::move(message));
}

void Diagnostics::warning(SourceLocation location, std::string message) {
    report(Severity::WARNING, location, std::move(message));
}

void Diagnostics::note(SourceLocation location, std::string message) {
    if (mKeptLast)
        mDiagnostics.back().notes.push_back({location, std::move(message)});
}

void Diagnostics::report(Severity severity, SourceLocation location, std::string message) {
    std::size_t& count = severity == Severity::ERROR ? mErrorCount : mWarningCount;
    mKeptLast =
        count < MAX_COUNT &&
        std::none_of(mDiagnostics.begin(), mDiagnostics.end(), [&](const Diagnostic& known) {
            return known.severity == severity && known.location == location && known.message == message;
        });
    if (!mKeptLast)
        return;
    ++count;
    mDiagnostics.push_back({severity, location, std::move(message), {}});
}

std::string Diagnostics::listing(const SourceFiles& files) const {
    std::vector<const Diagnostic*> ordered;
    for (const Diagnostic& one : mDiagnostics)
        ordered.push_back(&one);
    std::stable_sort(ordered.begin(), ordered.end(), [](const Diagnostic* left, const Diagnostic* right) {
        return left->location < right->location;
    });
    std::string listing;
    for (const Diagnostic* one : ordered) {
        const char* const kind = one->severity == Severity::ERROR ? "error" : "warning";
        appendHead(listing, files, one->location, kind, one->message);
        appendExcerpt(listing, files, one->location);
        if (const SourceFiles::Expansion* expansion = files.expansionAt(one->location)) {
            const bool isInSource = expansion->definition.line > 0;
            appendHead(listing, files, isInSource ? expansion->definition : one->location, "note",
                       "in the expansion of macro " + inQuotes(expansion->macro) +
                           (isInSource ? ", which is defined here" : ""));
        }
        for (const Diagnostic::Note& note : one->notes)
            appendHead(listing, files, note.location, "note", note.message);
    }
    return listing;
}

std::string inQuotes(std::string_view text) {
    static constexpr char HEX[] = "0123456789abcdef";
    std::string result = "'";
    for (const char c : text.substr(0, MAX_QUOTED_BYTES)) {
        const auto byte = static_cast<unsigned char>(c);
        if (!isControl(c) && byte < 0x80)
            result += c;
        else
            result.append("\\x").append(1, HEX[byte >> 4]).append(1, HEX[byte & 15]);
    }
    return result + (text.size() > MAX_QUOTED_BYTES ? "...'" : "'");
}

} // namespace cg
