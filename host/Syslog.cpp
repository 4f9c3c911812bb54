#include <FwZel/kxsys_syslog.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstdarg>
#include <cstdio>
#include <ctime>
#include <string>

namespace {

/// Severity names of RFC 5424, most severe first.
constexpr std::array<const char*, 8> SEVERITIES = {"emergency", "alert",  "critical", "error",
                                                   "warning",   "notice", "info",     "debug"};

std::string severityName(int level) {
    if (level >= 0 && level < static_cast<int>(SEVERITIES.size()))
        return SEVERITIES[static_cast<size_t>(level)];
    return "level " + std::to_string(level);
}

/// Local time to the millisecond, as "2024-05-17 09:30:01.042".
std::string timeOfDay() {
    const auto now = std::chrono::system_clock::now();
    const std::time_t seconds = std::chrono::system_clock::to_time_t(now);
    const auto milliseconds =
        std::chrono::duration_cast<std::chrono::milliseconds>(now.time_since_epoch()).count() % 1000;
    std::tm local = {};
    localtime_r(&seconds, &local);
    std::array<char, 64> text = {};
    const size_t length = std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &local);
    std::snprintf(text.data() + length, text.size() - length, ".%03d", static_cast<int>(milliseconds));
    return text.data();
}

std::string formatted(const char* format, std::va_list arguments) {
    std::va_list again;
    va_copy(again, arguments);
    const int length = std::vsnprintf(nullptr, 0, format, arguments);
    std::string text(length > 0 ? static_cast<size_t>(length) : 0, '\0');
    std::vsnprintf(text.data(), text.size() + 1, format, again);
    va_end(again);
    return text;
}

} // namespace

/// The host's log: one line a message on standard error, with time and severity.
///
/// Any thread: a message leaves in a single write to the stream, so that lines never mix. errno is kept.
extern "C" __attribute__((visibility("default"))) void kxsys_syslog(int level, const char* format, ...) {
    const int keptErrno = errno;
    std::va_list arguments;
    va_start(arguments, format);
    std::string line = timeOfDay() + ' ' + severityName(level) + ": " + formatted(format, arguments);
    va_end(arguments);
    if (line.back() != '\n')
        line += '\n';
    std::fwrite(line.data(), 1, line.size(), stderr);
    errno = keptErrno;
}
