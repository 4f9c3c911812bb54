#include "GlErrors.h"

#include <epoxy/gl.h>

namespace host {

namespace {

std::string glErrorName(GLenum error) {
    switch (error) {
    case GL_INVALID_ENUM:
        return "GL_INVALID_ENUM";
    case GL_INVALID_VALUE:
        return "GL_INVALID_VALUE";
    case GL_INVALID_OPERATION:
        return "GL_INVALID_OPERATION";
    case GL_INVALID_FRAMEBUFFER_OPERATION:
        return "GL_INVALID_FRAMEBUFFER_OPERATION";
    case GL_OUT_OF_MEMORY:
        return "GL_OUT_OF_MEMORY";
    case GL_STACK_UNDERFLOW:
        return "GL_STACK_UNDERFLOW";
    case GL_STACK_OVERFLOW:
        return "GL_STACK_OVERFLOW";
    default:
        return "OpenGL error " + std::to_string(error);
    }
}

} // namespace

std::vector<std::string> takeGlErrors() {
    std::vector<std::string> errors;
    for (GLenum error = glGetError(); error != GL_NO_ERROR; error = glGetError())
        errors.push_back(glErrorName(error));
    return errors;
}

} // namespace host
