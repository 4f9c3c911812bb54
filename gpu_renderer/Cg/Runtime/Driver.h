#ifndef CG_RUNTIME_DRIVER_H
#define CG_RUNTIME_DRIVER_H

#include <Cg/Compiler/Compiler.h>

#include <string>

/// What the runtime asks of the OpenGL context that is current when it makes programs.
namespace cg::driver {

/// Whether the context has separable programs and GLSL 3.30.
bool runsPrograms();

/// The GLSL that the context takes.
GlslTarget glslTarget();

/// Compiles and links one stage as a separable program object.
/// @param log  receives the driver's log
/// @return the object's OpenGL name, 0 where the driver does not take the text
unsigned int linkProgram(Stage stage, const std::string& glsl, std::string& log);

void deleteProgram(unsigned int glName);

} // namespace cg::driver

#endif
