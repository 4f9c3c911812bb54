#include "OutputFile.h"

#include <cerrno>
#include <system_error>
#include <utility>

namespace host {

OutputFile::OutputFile(const std::string& name)
    : mName(name == "-" ? "standard output" : name),
      mStream(name == "-" ? stdout : std::fopen(name.c_str(), "wb")) {
    if (!mStream)
        throw std::system_error(errno, std::generic_category(), mName);
}

OutputFile::~OutputFile() {
    if (mStream && mStream != stdout)
        std::fclose(mStream);
}

void OutputFile::write(const void* data, size_t size) {
    if (std::fwrite(data, 1, size, mStream) != size)
        throw std::system_error(errno, std::generic_category(), mName);
}

void OutputFile::close() {
    std::FILE* const stream = std::exchange(mStream, nullptr);
    if ((stream == stdout ? std::fflush(stream) : std::fclose(stream)) != 0)
        throw std::system_error(errno, std::generic_category(), mName);
}

} // namespace host
