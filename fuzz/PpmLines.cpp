#include <FwZel/PpmFile.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>

// The line readers of the PPM header, on any bytes, against what they are defined to give. The last byte is
// the delimiter of the first lines; from the first empty one on it is a line feed, and comments are passed
// over.

namespace {

constexpr std::size_t LINE_CHARS = 256;

struct StreamCloser {
    void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using Stream = std::unique_ptr<std::FILE, StreamCloser>;

/// Takes a line off the text.
std::string takeLine(std::string& text, char delimiter) {
    const std::size_t end = std::min(text.find(delimiter), text.size());
    const std::string line = text.substr(0, std::min(end, LINE_CHARS - 1));
    text.erase(0, end + 1);
    return line.substr(0, line.find('\0')); // as far as the caller can tell
}

std::string takeEffectiveLine(std::string& text) {
    std::string line;
    do
        line = takeLine(text, '\n');
    while (!line.empty() && line[0] == '#');
    return line;
}

template <class Read>
std::string lineBy(Read read, const Stream& stream, char delimiter) {
    // On the heap, where AddressSanitizer tells a byte too many.
    const std::unique_ptr<char[]> line(new char[LINE_CHARS]);
    std::memset(line.get(), 'x', LINE_CHARS);
    if (read(stream.get(), line.get(), delimiter) != 0)
        std::abort();
    return line.get();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size == 0)
        return 0;
    const std::unique_ptr<std::uint8_t[]> bytes(new std::uint8_t[size]);
    std::memcpy(bytes.get(), data, size);
    const Stream stream(fmemopen(bytes.get(), size, "rb"));
    std::string text(data, data + size);
    const char delimiter = text.back();
    std::string line;
    do {
        line = takeLine(text, delimiter);
        if (lineBy(getLine, stream, delimiter) != line)
            std::abort();
    } while (!line.empty());
    bool isAtEnd = false;
    while (!isAtEnd) {
        isAtEnd = text.empty();
        if (lineBy(getEffectiveLine, stream, '\n') != takeEffectiveLine(text))
            std::abort();
    }
    return 0;
}
