#include <Cg/Compiler/SourceFiles.h>

#include <algorithm>
#include <utility>

namespace cg {

namespace {

constexpr std::string_view BYTE_ORDER_MARK = "\xEF\xBB\xBF";

} // namespace

std::uint32_t SourceFiles::add(std::string name, std::string text) {
    File& file = mFiles.emplace_back();
    file.name = std::move(name);
    if (text.compare(0, BYTE_ORDER_MARK.size(), BYTE_ORDER_MARK) == 0)
        text.erase(0, BYTE_ORDER_MARK.size());
    file.text = std::move(text);
    const auto index = static_cast<std::uint32_t>(mFiles.size() - 1);
    mIndexByName.emplace(file.name, index);
    return index;
}

std::optional<std::uint32_t> SourceFiles::find(std::string_view name) const {
    const auto found = mIndexByName.find(name);
    if (found == mIndexByName.end())
        return std::nullopt;
    return found->second;
}

std::string_view SourceFiles::line(std::uint32_t file, std::uint32_t line) const {
    if (file >= mFiles.size() || line == 0)
        return {};
    const std::string_view text = mFiles[file].text;
    std::size_t start = 0;
    for (std::uint32_t passed = 1; passed < line; ++passed) {
        const std::size_t end = text.find_first_of("\r\n", start);
        if (end == std::string_view::npos)
            return {};
        start = end + (text.compare(end, 2, "\r\n") == 0 ? 2 : 1);
    }
    return text.substr(start, text.find_first_of("\r\n", start) - start);
}

void SourceFiles::renumber(std::uint32_t file, std::uint32_t line, std::uint32_t shownLine,
                           std::string_view shownName) {
    std::vector<Renumbering>& all = mFiles[file].renumberings;
    const auto later =
        std::lower_bound(all.begin(), all.end(), line,
                         [](const Renumbering& one, std::uint32_t wanted) { return one.line < wanted; });
    if (later != all.end() && later->line == line) // the file is included once more
        return;
    const std::string_view name = shownName.empty() ? shown({file, line, 1}).name : keep(shownName);
    all.insert(later, {line, shownLine, name});
}

SourceFiles::Shown SourceFiles::shown(SourceLocation location) const {
    if (location.file >= mFiles.size())
        return {};
    const File& file = mFiles[location.file];
    const auto later =
        std::upper_bound(file.renumberings.begin(), file.renumberings.end(), location.line,
                         [](std::uint32_t wanted, const Renumbering& one) { return wanted < one.line; });
    if (later == file.renumberings.begin())
        return {file.name, location.line};
    const Renumbering& last = *std::prev(later);
    return {last.shownName, last.shownLine + (location.line - last.line)};
}

} // namespace cg
