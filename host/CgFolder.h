#ifndef HOST_CGFOLDER_H
#define HOST_CGFOLDER_H

#include <FwZel/Shader.h>

#include <string>

namespace host {

/// Path of one of the Cg programs that come with the host, such as "texture.cg": in ../share/fwzel/Cg as seen
/// from the folder of the executable. An installation has them there, and so has the build folder.
/// @throw std::runtime_error  it is not there
std::string cgProgramPath(const std::string& name);

/// The file of a Cg program that a user names: one of the host's where there is no such file and the name has
/// no folder, else the file itself.
std::string findCgProgram(const std::string& file);

/// The library's default vertex program. Shader asks for "Cg/vertex.cg" relative to the working directory;
/// that is another one only meanwhile.
/// @throw std::runtime_error  the program is not there or does not compile; what() says why
Shader makeDefaultVertexShader();

/// A fragment program that is known to compile.
/// @throw std::runtime_error  the file cannot be read or the program not be created; what() names the file
///                            and tells the compiler's listing
Shader makeFragmentShader(const std::string& file, const std::string& entry);

} // namespace host

#endif
