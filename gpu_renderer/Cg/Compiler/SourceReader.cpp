#include <Cg/Compiler/SourceReader.h>

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <system_error>

namespace cg {

namespace {

/// Several times what the words of the longest program take.
constexpr std::size_t MAX_BYTES = std::size_t{16} << 20;

using FilePointer = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

} // namespace

bool readSource(const std::string& path, std::string& text) {
    const FilePointer file(std::fopen(path.c_str(), "rb"), &std::fclose);
    if (!file)
        return false;
    text.clear();
    std::array<char, 16384> block{};
    std::size_t length = 0;
    while ((length = std::fread(block.data(), 1, block.size(), file.get())) > 0) {
        if (text.size() + length > MAX_BYTES) {
            errno = EFBIG;
            return false;
        }
        text.append(block.data(), length);
    }
    return std::ferror(file.get()) == 0;
}

bool readInclude(const std::string& path, std::string& text) {
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error); // an error for what is no file
    text.clear();
    return !error && (size == 0 || readSource(path, text));
}

} // namespace cg
