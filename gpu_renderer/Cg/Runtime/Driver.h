#ifndef CG_RUNTIME_DRIVER_H
#define CG_RUNTIME_DRIVER_H

#include <Cg/Compiler/Compiler.h>

#include <string>
#include <utility>

/// What the runtime asks of the OpenGL context that is current when it makes programs.
namespace cg::driver {

/// Whether the context has separable programs and GLSL 3.30.
bool runsPrograms();

/// The GLSL that the context takes.
GlslTarget glslTarget();

/// Passes over name 0.
void deleteProgram(unsigned int glName);

/// An OpenGL program object, deleted with its owner: what throws on the way to a program leaves none behind.
class LinkedProgram {
public:
    explicit LinkedProgram(unsigned int glName) : mGlName(glName) {}
    LinkedProgram(LinkedProgram&& other) noexcept : mGlName(other.release()) {}
    ~LinkedProgram() { deleteProgram(mGlName); }

    LinkedProgram(const LinkedProgram&) = delete;
    LinkedProgram& operator=(const LinkedProgram&) = delete;

    /// 0 for none.
    unsigned int name() const { return mGlName; }

    /// Hands the object over.
    unsigned int release() { return std::exchange(mGlName, 0); }

private:
    unsigned int mGlName;
};

/// Compiles and links one stage as a separable program object.
/// @param log  receives the driver's log
/// @return none where the driver does not take the text
LinkedProgram linkProgram(Stage stage, const std::string& glsl, std::string& log);

} // namespace cg::driver

#endif
