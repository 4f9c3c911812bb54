#include "UniformType.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>
#include <vector>

namespace cg {

namespace {

/// Towards zero; the nearest int where there is none, 0 for what is no number.
GLint toInt(float value) {
    if (std::isnan(value))
        return 0;
    constexpr float BEYOND = 2147483648.0F;
    if (value >= BEYOND)
        return std::numeric_limits<GLint>::max();
    return value < -BEYOND ? std::numeric_limits<GLint>::min() : static_cast<GLint>(value);
}

GLuint toUnsigned(float value) {
    return static_cast<GLuint>(toInt(value)); // a negative number wraps around, as in C
}

GLint toBool(float value) {
    return value != 0 ? 1 : 0;
}

template <auto& entryPoint>
void sendFloats(const UniformValues& values) {
    entryPoint(values.program, values.location, values.count, values.floats);
}

template <auto& entryPoint>
void sendMatrices(const UniformValues& values) {
    entryPoint(values.program, values.location, values.count, values.isTransposed ? GL_TRUE : GL_FALSE,
               values.floats);
}

template <int components, auto& convert, auto& entryPoint>
void sendIntegers(const UniformValues& values) {
    std::vector<decltype(convert(0))> integers(static_cast<size_t>(values.count) * components);
    std::transform(values.floats, values.floats + integers.size(), integers.begin(), convert);
    entryPoint(values.program, values.location, values.count, integers.data());
}

constexpr UniformType UNIFORM_TYPES[] = {
    {GL_FLOAT, 1, sendFloats<glProgramUniform1fv>},
    {GL_FLOAT_VEC2, 2, sendFloats<glProgramUniform2fv>},
    {GL_FLOAT_VEC3, 3, sendFloats<glProgramUniform3fv>},
    {GL_FLOAT_VEC4, 4, sendFloats<glProgramUniform4fv>},
    {GL_FLOAT_MAT2, 4, sendMatrices<glProgramUniformMatrix2fv>},
    {GL_FLOAT_MAT3, 9, sendMatrices<glProgramUniformMatrix3fv>},
    {GL_FLOAT_MAT4, 16, sendMatrices<glProgramUniformMatrix4fv>},
    {GL_FLOAT_MAT2x3, 6, sendMatrices<glProgramUniformMatrix2x3fv>},
    {GL_FLOAT_MAT3x2, 6, sendMatrices<glProgramUniformMatrix3x2fv>},
    {GL_FLOAT_MAT2x4, 8, sendMatrices<glProgramUniformMatrix2x4fv>},
    {GL_FLOAT_MAT4x2, 8, sendMatrices<glProgramUniformMatrix4x2fv>},
    {GL_FLOAT_MAT3x4, 12, sendMatrices<glProgramUniformMatrix3x4fv>},
    {GL_FLOAT_MAT4x3, 12, sendMatrices<glProgramUniformMatrix4x3fv>},
    {GL_INT, 1, sendIntegers<1, toInt, glProgramUniform1iv>},
    {GL_INT_VEC2, 2, sendIntegers<2, toInt, glProgramUniform2iv>},
    {GL_INT_VEC3, 3, sendIntegers<3, toInt, glProgramUniform3iv>},
    {GL_INT_VEC4, 4, sendIntegers<4, toInt, glProgramUniform4iv>},
    {GL_UNSIGNED_INT, 1, sendIntegers<1, toUnsigned, glProgramUniform1uiv>},
    {GL_UNSIGNED_INT_VEC2, 2, sendIntegers<2, toUnsigned, glProgramUniform2uiv>},
    {GL_UNSIGNED_INT_VEC3, 3, sendIntegers<3, toUnsigned, glProgramUniform3uiv>},
    {GL_UNSIGNED_INT_VEC4, 4, sendIntegers<4, toUnsigned, glProgramUniform4uiv>},
    {GL_BOOL, 1, sendIntegers<1, toBool, glProgramUniform1iv>},
    {GL_BOOL_VEC2, 2, sendIntegers<2, toBool, glProgramUniform2iv>},
    {GL_BOOL_VEC3, 3, sendIntegers<3, toBool, glProgramUniform3iv>},
    {GL_BOOL_VEC4, 4, sendIntegers<4, toBool, glProgramUniform4iv>},
};

constexpr UniformType WITHOUT_VALUES = {0, 0, [](const UniformValues&) {}};

} // namespace

const UniformType& uniformType(unsigned int glType) {
    const auto* const found = std::find_if(std::begin(UNIFORM_TYPES), std::end(UNIFORM_TYPES),
                                           [&](const UniformType& type) { return type.glType == glType; });
    return found == std::end(UNIFORM_TYPES) ? WITHOUT_VALUES : *found;
}

} // namespace cg
