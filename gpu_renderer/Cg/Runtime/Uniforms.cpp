#include "Uniforms.h"

#include "Program.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <cmath>
#include <limits>
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
    parameter.glType = name.empty() ? 0 : typeOf(name, types);
    if (parameter.glType != 0)
        parameter.location = glGetUniformLocation(program, name.c_str());
    for (ProgramParameter& child : parameter.children)
        findUniform(program, types, child);
}

bool isBool(GLenum type) {
    return type == GL_BOOL || type == GL_BOOL_VEC2 || type == GL_BOOL_VEC3 || type == GL_BOOL_VEC4;
}

/// Towards zero; the nearest int where there is none, 0 for what is no number.
GLint toInt(float value) {
    if (std::isnan(value))
        return 0;
    constexpr float BEYOND = 2147483648.0F;
    if (value >= BEYOND)
        return std::numeric_limits<GLint>::max();
    return value < -BEYOND ? std::numeric_limits<GLint>::min() : static_cast<GLint>(value);
}

std::vector<GLint> toInts(GLenum type, int count, const float* values) {
    std::vector<GLint> ints(static_cast<size_t>(count) * static_cast<size_t>(valueCount(type)));
    if (isBool(type))
        std::transform(values, values + ints.size(), ints.begin(), [](float v) { return v != 0 ? 1 : 0; });
    else
        std::transform(values, values + ints.size(), ints.begin(), &toInt);
    return ints;
}

void sendUnsigned(GLuint program, GLint location, GLenum type, int count, const float* values) {
    const std::vector<GLint> ints = toInts(type, count, values);
    const std::vector<GLuint> bits(ints.begin(), ints.end()); // a negative number wraps around, as in C
    switch (valueCount(type)) {
    case 1:
        return glProgramUniform1uiv(program, location, count, bits.data());
    case 2:
        return glProgramUniform2uiv(program, location, count, bits.data());
    case 3:
        return glProgramUniform3uiv(program, location, count, bits.data());
    default:
        return glProgramUniform4uiv(program, location, count, bits.data());
    }
}

void sendInts(GLuint program, GLint location, GLenum type, int count, const float* values) {
    const std::vector<GLint> ints = toInts(type, count, values);
    switch (valueCount(type)) {
    case 1:
        return glProgramUniform1iv(program, location, count, ints.data());
    case 2:
        return glProgramUniform2iv(program, location, count, ints.data());
    case 3:
        return glProgramUniform3iv(program, location, count, ints.data());
    case 4:
        return glProgramUniform4iv(program, location, count, ints.data());
    default:
        return;
    }
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

int valueCount(unsigned int glType) {
    switch (glType) {
    case GL_FLOAT:
    case GL_INT:
    case GL_UNSIGNED_INT:
    case GL_BOOL:
        return 1;
    case GL_FLOAT_VEC2:
    case GL_INT_VEC2:
    case GL_UNSIGNED_INT_VEC2:
    case GL_BOOL_VEC2:
        return 2;
    case GL_FLOAT_VEC3:
    case GL_INT_VEC3:
    case GL_UNSIGNED_INT_VEC3:
    case GL_BOOL_VEC3:
        return 3;
    case GL_FLOAT_VEC4:
    case GL_INT_VEC4:
    case GL_UNSIGNED_INT_VEC4:
    case GL_BOOL_VEC4:
    case GL_FLOAT_MAT2:
        return 4;
    case GL_FLOAT_MAT2x3:
    case GL_FLOAT_MAT3x2:
        return 6;
    case GL_FLOAT_MAT2x4:
    case GL_FLOAT_MAT4x2:
        return 8;
    case GL_FLOAT_MAT3:
        return 9;
    case GL_FLOAT_MAT3x4:
    case GL_FLOAT_MAT4x3:
        return 12;
    case GL_FLOAT_MAT4:
        return 16;
    default:
        return 0;
    }
}

void sendValues(const ProgramParameter& first, int count, const float* values, Layout layout) {
    const GLuint program = first.program.glName();
    const GLint location = first.location;
    // The rows of a Cg matrix are the columns of its GLSL matrix.
    const GLboolean isTransposed = layout == Layout::COLUMN_BY_COLUMN ? GL_TRUE : GL_FALSE;
    switch (first.glType) {
    case GL_FLOAT:
        return glProgramUniform1fv(program, location, count, values);
    case GL_FLOAT_VEC2:
        return glProgramUniform2fv(program, location, count, values);
    case GL_FLOAT_VEC3:
        return glProgramUniform3fv(program, location, count, values);
    case GL_FLOAT_VEC4:
        return glProgramUniform4fv(program, location, count, values);
    case GL_FLOAT_MAT2:
        return glProgramUniformMatrix2fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT3:
        return glProgramUniformMatrix3fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT4:
        return glProgramUniformMatrix4fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT2x3:
        return glProgramUniformMatrix2x3fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT3x2:
        return glProgramUniformMatrix3x2fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT2x4:
        return glProgramUniformMatrix2x4fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT4x2:
        return glProgramUniformMatrix4x2fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT3x4:
        return glProgramUniformMatrix3x4fv(program, location, count, isTransposed, values);
    case GL_FLOAT_MAT4x3:
        return glProgramUniformMatrix4x3fv(program, location, count, isTransposed, values);
    case GL_UNSIGNED_INT:
    case GL_UNSIGNED_INT_VEC2:
    case GL_UNSIGNED_INT_VEC3:
    case GL_UNSIGNED_INT_VEC4:
        return sendUnsigned(program, location, first.glType, count, values);
    default:
        return sendInts(program, location, first.glType, count, values);
    }
}

void sendDefaults(const std::vector<ProgramParameter>& parameters) {
    for (const ProgramParameter& parameter : parameters) {
        if (parameter.location >= 0 && hasValue(parameter.description.defaults))
            sendValues(parameter, 1, parameter.description.defaults.data());
        sendDefaults(parameter.children);
    }
}

} // namespace cg
