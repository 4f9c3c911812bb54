#ifndef HOST_GLERRORS_H
#define HOST_GLERRORS_H

#include <string>
#include <vector>

namespace host {

/// The pending OpenGL errors by name, oldest first; the error queue is empty afterwards. The library queries
/// none, so a host looks after a piece of work. Thread: the render thread.
std::vector<std::string> takeGlErrors();

} // namespace host

#endif
