#ifndef FUZZ_FUZZEDFILE_H
#define FUZZ_FUZZEDFILE_H

#include <sys/mman.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>

/// A file in memory for a reader that opens its files by name.
class FuzzedFile {
public:
    FuzzedFile() : mDescriptor(memfd_create("fuzzed", 0)) {}
    ~FuzzedFile() { close(mDescriptor); }
    FuzzedFile(const FuzzedFile&) = delete;
    FuzzedFile& operator=(const FuzzedFile&) = delete;

    void write(const std::uint8_t* data, std::size_t size) const {
        if (ftruncate(mDescriptor, 0) != 0 ||
            pwrite(mDescriptor, data, size, 0) != static_cast<ssize_t>(size))
            throw std::runtime_error("cannot write the file in memory");
    }
    const std::string& path() const { return mPath; }

private:
    int mDescriptor;
    std::string mPath = "/proc/self/fd/" + std::to_string(mDescriptor);
};

#endif
