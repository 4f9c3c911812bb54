#include "Arguments.h"

#include "Verbs.h"

#include <charconv>
#include <string_view>

namespace {

/// Reads a number at the front of the text and the separator behind it; 0 as separator stands for the end.
bool takeNumber(std::string_view& text, char separator, uint32_t& number) {
    const char* const end = text.data() + text.size();
    const auto [rest, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc())
        return false;
    text.remove_prefix(static_cast<size_t>(rest - text.data()));
    if (separator == 0)
        return text.empty();
    if (text.empty() || text.front() != separator)
        return false;
    text.remove_prefix(1);
    return true;
}

} // namespace

Size parseSize(const std::string& option, const std::string& text) {
    std::string_view rest = text;
    Size size = {};
    if (!takeNumber(rest, 'x', size.width) || !takeNumber(rest, 0, size.height) || size.width == 0 ||
        size.height == 0)
        throw WrongCall(option + ": \"" + text + "\" is no size; write it as 1920x1080");
    return size;
}

Region parseRegion(const std::string& option, const std::string& text) {
    std::string_view rest = text;
    Region region = {};
    if (!takeNumber(rest, 'x', region.width) || !takeNumber(rest, '+', region.height) ||
        !takeNumber(rest, '+', region.x) || !takeNumber(rest, 0, region.y) || region.width == 0 ||
        region.height == 0)
        throw WrongCall(option + ": \"" + text + "\" is no region; write it as 200x100+50+40");
    return region;
}
