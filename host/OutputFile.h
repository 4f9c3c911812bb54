#ifndef HOST_OUTPUTFILE_H
#define HOST_OUTPUTFILE_H

#include <cstddef>
#include <cstdio>
#include <string>
#include <string_view>

namespace host {

/// A file being written, or standard output. Every failure is a std::system_error whose what() names the file
/// and the reason, so a full disk or a closed pipe never passes for a written file: end with close().
///
/// A host that writes to pipes ignores SIGPIPE, else the signal ends the process before the error is seen.
class OutputFile {
public:
    /// Creates or empties a file.
    /// @param name  path; "-" is standard output
    explicit OutputFile(const std::string& name);

    /// Closes without a report, as after an exception.
    ~OutputFile();

    OutputFile(const OutputFile&) = delete;
    OutputFile& operator=(const OutputFile&) = delete;

    void write(const void* data, size_t size);
    void write(std::string_view text) { write(text.data(), text.size()); }

    /// Hands everything to the system and closes the file; standard output is flushed and stays open.
    void close();

    /// As messages name it.
    const std::string& name() const { return mName; }

private:
    std::string mName;
    std::FILE* mStream;
};

} // namespace host

#endif
