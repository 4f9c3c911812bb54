#include <Cg/Compiler/NumberSpelling.h>

#include <charconv>
#include <limits>
#include <system_error>

namespace cg {

namespace {

constexpr std::uint64_t LARGEST = std::numeric_limits<std::uint64_t>::max();

bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

bool isLetter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

char lower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

unsigned digitValue(char c) {
    if (isDigit(c))
        return static_cast<unsigned>(c - '0');
    const char letter = lower(c);
    return letter >= 'a' && letter <= 'f' ? static_cast<unsigned>(letter - 'a') + 10 : 255;
}

std::size_t digitsAt(std::string_view text, std::size_t at, unsigned base) {
    std::size_t end = at;
    while (end < text.size() && digitValue(text[end]) < base)
        ++end;
    return end - at;
}

std::uint64_t wholeNumber(std::string_view digits, unsigned base) {
    std::uint64_t value = 0;
    for (const char digit : digits) {
        const unsigned units = digitValue(digit);
        if (value > (LARGEST - units) / base)
            return LARGEST;
        value = value * base + units;
    }
    return value;
}

/// Infinity for what is too large, 0 for what is too small.
double realNumber(std::string_view text) {
    double value = 0;
    const auto result = std::from_chars(text.data(), text.data() + text.size(), value);
    if (result.ec != std::errc::result_out_of_range)
        return value;
    return text.find('-') == std::string_view::npos ? std::numeric_limits<double>::infinity() : 0.0;
}

/// Bytes of an exponent with at least one digit.
std::size_t exponentAt(std::string_view text, std::size_t at) {
    if (at >= text.size() || lower(text[at]) != 'e')
        return 0;
    std::size_t digits = at + 1;
    if (digits < text.size() && (text[digits] == '+' || text[digits] == '-'))
        ++digits;
    const std::size_t count = digitsAt(text, digits, 10);
    return count == 0 ? 0 : digits + count - at;
}

/// `.` and letters, once or more often: what swizzles look like.
bool isSwizzle(std::string_view rest) {
    if (rest.empty() || rest[0] != '.')
        return false;
    for (std::size_t at = 0; at < rest.size(); ++at)
        if (rest[at] == '.' && (at + 1 == rest.size() || !isLetter(rest[at + 1])))
            return false;
    return true;
}

bool isLength(char suffix) {
    return suffix == 'l' || suffix == 'i' || suffix == 's' || suffix == 't';
}

/// Bytes of a suffix that makes a float of any number.
std::size_t floatSuffixAt(std::string_view text, std::size_t at) {
    const char suffix = at < text.size() ? lower(text[at]) : '\0';
    const char second = at + 1 < text.size() ? lower(text[at + 1]) : '\0';
    if (suffix == 'l' && second == 'f') // as GLSL writes a double
        return 2;
    return suffix == 'f' || suffix == 'h' || suffix == 'x' || suffix == 'd' ? 1 : 0;
}

NumberSpelling::Kind withSuffix(std::string_view text, NumberSpelling& number, bool isWhole) {
    using Kind = NumberSpelling::Kind;
    const char suffix = number.length < text.size() ? lower(text[number.length]) : '\0';
    const char second = number.length + 1 < text.size() ? lower(text[number.length + 1]) : '\0';
    const std::size_t floatSuffix = floatSuffixAt(text, number.length);
    number.length += floatSuffix;
    if (floatSuffix > 0)
        return suffix == 'h' ? Kind::HALF : suffix == 'x' ? Kind::FIXED : Kind::FLOAT;
    if (!isWhole)
        return Kind::FLOAT;
    // An int of any length, `l` long, `i` int, `s` short and `t` char, is an int.
    const bool hasTwo = (suffix == 'u' && isLength(second)) || (suffix == 'l' && second == 'u');
    if (suffix == 'u' || isLength(suffix))
        number.length += hasTwo ? 2 : 1;
    return suffix == 'u' || hasTwo ? Kind::UNSIGNED : Kind::INTEGER;
}

NumberSpelling readHexadecimal(std::string_view text) {
    NumberSpelling number;
    const std::size_t count = digitsAt(text, 2, 16);
    number.integer = wholeNumber(text.substr(2, count), 16);
    number.value = static_cast<double>(number.integer);
    number.length = 2 + count;
    number.kind = withSuffix(text, number, true);
    return number;
}

/// `1.`, `1.5`, `1.f`, `1.e3` and `1.f.xxx` have a point; in `1.xxx` it belongs to a swizzle.
bool hasPointAt(std::string_view text, std::size_t at) {
    if (at >= text.size() || text[at] != '.')
        return false;
    const std::size_t suffix = floatSuffixAt(text, at + 1);
    const std::size_t end = at + 1 + suffix;
    const bool isBeforeSuffix = suffix > 0 && (end == text.size() || text[end] == '.');
    return !isSwizzle(text.substr(at)) || isBeforeSuffix || exponentAt(text, at + 1) > 0;
}

NumberSpelling readDecimal(std::string_view text) {
    NumberSpelling number;
    const std::size_t whole = digitsAt(text, 0, 10);
    number.length = whole;
    if (hasPointAt(text, whole))
        number.length += 1 + digitsAt(text, whole + 1, 10);
    const std::size_t exponent = exponentAt(text, number.length);
    number.length += exponent;
    const bool isWhole = number.length == whole;
    const std::string_view digits = text.substr(0, number.length);
    const bool isOctal = isWhole && whole > 1 && text[0] == '0';
    if (isOctal && digitsAt(text, 0, 8) < whole) {
        // `09` is no octal number, but `09f` is nine.
        number.kind = withSuffix(text, number, true);
        if (number.kind == NumberSpelling::Kind::INTEGER || number.kind == NumberSpelling::Kind::UNSIGNED)
            return {};
        number.value = realNumber(digits);
        return number;
    }
    number.kind = withSuffix(text, number, isWhole);
    const bool isInteger =
        number.kind == NumberSpelling::Kind::INTEGER || number.kind == NumberSpelling::Kind::UNSIGNED;
    number.integer = isWhole ? wholeNumber(digits, isOctal && isInteger ? 8 : 10) : 0;
    number.value = isInteger ? static_cast<double>(number.integer) : realNumber(digits);
    return number;
}

} // namespace

NumberSpelling readNumber(std::string_view text) {
    const bool isHexadecimal =
        text.size() > 2 && text[0] == '0' && lower(text[1]) == 'x' && digitValue(text[2]) < 16;
    const NumberSpelling number = isHexadecimal ? readHexadecimal(text) : readDecimal(text);
    if (number.length < text.size() && !isSwizzle(text.substr(number.length)))
        return {};
    return number;
}

} // namespace cg
