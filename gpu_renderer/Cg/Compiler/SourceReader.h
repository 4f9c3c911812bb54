#ifndef CG_COMPILER_SOURCE_READER_H
#define CG_COMPILER_SOURCE_READER_H

#include <string>

namespace cg {

/// Reads a file of Cg source, one of 16 MiB at most.
/// @return false, with the reason in errno, where that fails
bool readSource(const std::string& path, std::string& text);

/// Reads a file that a program includes. What a program names may be anything: only files that have a size
/// are read, as a pipe or a device would block the process or never end. Of a file whose size is 0 nothing is
/// read, since the kernel makes such files up as they are read.
/// @return false where there is no such file, or it is none for a program
bool readInclude(const std::string& path, std::string& text);

} // namespace cg

#endif
