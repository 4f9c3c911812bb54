#include "Driver.h"

#include <epoxy/gl.h>

#include <algorithm>

namespace {

constexpr int LEAST_GLSL = 330;

std::string infoLog(GLuint program) {
    GLint length = 0;
    glGetProgramiv(program, GL_INFO_LOG_LENGTH, &length);
    std::string log(static_cast<size_t>(std::max(length, 0)), '\0');
    GLsizei written = 0;
    if (length > 0)
        glGetProgramInfoLog(program, length, &written, log.data());
    log.resize(static_cast<size_t>(written));
    return log;
}

} // namespace

bool cg::driver::runsPrograms() {
    return epoxy_glsl_version() >= LEAST_GLSL &&
           (epoxy_gl_version() >= 41 || epoxy_has_gl_extension("GL_ARB_separate_shader_objects"));
}

cg::GlslTarget cg::driver::glslTarget() {
    GlslTarget target;
    target.version = std::clamp(epoxy_glsl_version(), LEAST_GLSL, 460);
    target.hasGpuShader5 = target.version >= 400 || epoxy_has_gl_extension("GL_ARB_gpu_shader5");
    return target;
}

cg::driver::LinkedProgram cg::driver::linkProgram(Stage stage, const std::string& glsl, std::string& log) {
    const char* const text = glsl.c_str();
    LinkedProgram program(
        glCreateShaderProgramv(stage == Stage::VERTEX ? GL_VERTEX_SHADER : GL_FRAGMENT_SHADER, 1, &text));
    GLint isLinked = GL_FALSE;
    if (program.name())
        glGetProgramiv(program.name(), GL_LINK_STATUS, &isLinked);
    if (isLinked)
        return program;
    log = program.name() ? infoLog(program.name()) : "no program object\n";
    return LinkedProgram(0);
}

void cg::driver::deleteProgram(unsigned int glName) {
    if (glName)
        glDeleteProgram(glName);
}
