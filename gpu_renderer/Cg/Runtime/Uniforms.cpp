#include "Uniforms.h"

#include "Program.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <string>
#include <unordered_map>

namespace cg {

namespace {

/// The types of a program's uniforms, by their names without a first element's "[0]".
using UniformTypes = std::unordered_map<std::string, GLenum>;

UniformTypes uniformTypes(GLuint program) {
    GLint count = 0;
    GLint longest = 0;
    glGetProgramiv(program, GL_ACTIVE_UNIFORMS, &count);
    glGetProgramiv(program, GL_ACTIVE_UNIFORM_MAX_LENGTH, &longest);
    UniformTypes types;
    std::string buffer(static_cast<size_t>(std::max(longest, 1)), '\0');
    for (GLuint i = 0; i < static_cast<GLuint>(count); ++i) {
        GLsizei length = 0;
        GLint size = 0;
        GLenum type = 0;
        glGetActiveUniform(program, i, longest, &length, &size, &type, buffer.data());
        std::string name(buffer, 0, static_cast<size_t>(length));
        if (name.size() > 3 && name.compare(name.size() - 3, 3, "[0]") == 0)
            name.resize(name.size() - 3);
        types.emplace(std::move(name), type);
    }
    return types;
}

/// 0 where OpenGL has no uniform of the name, or of the array that the name is an element of.
GLenum typeOf(const std::string& name, const UniformTypes& types) {
    auto found = types.find(name);
    if (found == types.end() && !name.empty() && name.back() == ']')
        found = types.find(name.substr(0, name.rfind('[')));
    return found == types.end() ? 0 : found->second;
}

void findUniform(GLuint program, const UniformTypes& types, ProgramParameter& parameter) {
    const std::string& name = parameter.description.glslName;
    const GLenum type = name.empty() ? 0 : typeOf(name, types);
    if (type != 0) {
        parameter.type = &uniformType(type);
        parameter.location = glGetUniformLocation(program, name.c_str());
    }
    for (ProgramParameter& child : parameter.children)
        findUniform(program, types, child);
}

bool hasValue(const std::vector<float>& defaults) {
    return std::any_of(defaults.begin(), defaults.end(), [](float value) { return value != 0; });
}

} // namespace

void findUniforms(unsigned int glProgram, std::vector<ProgramParameter>& parameters) {
    const UniformTypes types = uniformTypes(glProgram);
    for (ProgramParameter& parameter : parameters)
        findUniform(glProgram, types, parameter);
}

void sendValues(const ProgramParameter& first, int count, const float* values, Layout layout) {
    // The rows of a Cg matrix are the columns of its GLSL matrix.
    first.type->send(
        {first.program.glName(), first.location, count, values, layout == Layout::COLUMN_BY_COLUMN});
}

void sendDefaults(const std::vector<ProgramParameter>& parameters) {
    for (const ProgramParameter& parameter : parameters) {
        if (parameter.location >= 0 && hasValue(parameter.description.defaults))
            sendValues(parameter, 1, parameter.description.defaults.data());
        sendDefaults(parameter.children);
    }
}

} // namespace cg
