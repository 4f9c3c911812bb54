#include "Errors.h"
#include "Uniforms.h"

#include <Cg/cgGL.h>

#include <algorithm>
#include <array>

namespace {

using cg::Layout;
using cg::ParameterClass;
using cg::ProgramParameter;

bool isUniform(const ProgramParameter& parameter) {
    return parameter.description.variability == cg::ParameterVariability::UNIFORM;
}

bool isNumber(const ProgramParameter& parameter) {
    const ParameterClass what = parameter.description.parameterClass;
    return what == ParameterClass::SCALAR || what == ParameterClass::VECTOR || what == ParameterClass::MATRIX;
}

/// Whether values were given and the parameter is one that takes them; else the error state is set.
bool accepts(const ProgramParameter& parameter, const float* values) {
    if (values && isUniform(parameter) && isNumber(parameter))
        return true;
    cg::setError(CG_INVALID_PARAMETER_ERROR);
    return false;
}

void setVector(CGparameter handle, const float* values, int given) {
    const ProgramParameter* const parameter = cg::parameterOf(handle);
    if (!parameter || !accepts(*parameter, values) || parameter->location < 0)
        return;
    if (given >= parameter->type->floats) {
        cg::sendValues(*parameter, 1, values);
        return;
    }
    std::array<float, 16> padded{};
    std::copy_n(values, given, padded.begin());
    cg::sendValues(*parameter, 1, padded.data());
}

void setMatrix(CGparameter handle, const float* values, Layout layout) {
    const ProgramParameter* const parameter = cg::parameterOf(handle);
    if (!parameter || !accepts(*parameter, values))
        return;
    if (parameter->description.parameterClass != ParameterClass::MATRIX)
        cg::setError(CG_NOT_MATRIX_PARAM_ERROR);
    else if (parameter->location >= 0)
        cg::sendValues(*parameter, 1, values, layout);
}

/// Values for elements of an array, as a setter is given them.
struct ArrayValues {
    long offset;
    long count; ///< 0: to the end of the array
    const float* values;
    int perElement; ///< 0: a matrix, as many as the elements have
    Layout layout;
};

/// The arrays of one dimension that an array consists of, in order.
void appendInnermost(const ProgramParameter& array, std::vector<const ProgramParameter*>& innermost) {
    if (array.children.empty() ||
        array.children.front().description.parameterClass != ParameterClass::ARRAY) {
        innermost.push_back(&array);
        return;
    }
    for (const ProgramParameter& child : array.children)
        appendInnermost(child, innermost);
}

/// One OpenGL call.
void sendElements(const ProgramParameter& first, long count, const float* values, int given, Layout layout) {
    const int taken = first.type->floats;
    if (given == taken) {
        cg::sendValues(first, static_cast<int>(count), values, layout);
        return;
    }
    std::vector<float> fitted(static_cast<size_t>(count) * static_cast<size_t>(taken));
    for (long i = 0; i < count; ++i)
        std::copy_n(values + i * given, std::min(given, taken), fitted.begin() + i * taken);
    cg::sendValues(first, static_cast<int>(count), fitted.data(), layout);
}

/// The error that setting the values is, where they lie in an array of size elements like the one given.
CGerror errorOf(const ArrayValues& what, long size, const ProgramParameter& element) {
    if (what.offset < 0 || what.count < 0 || what.offset >= size || what.count > size - what.offset)
        return CG_OUT_OF_ARRAY_BOUNDS_ERROR;
    if (!what.values || !isUniform(element) || !isNumber(element))
        return CG_INVALID_PARAMETER_ERROR;
    const bool isMatrix = element.description.parameterClass == ParameterClass::MATRIX;
    return what.perElement == 0 && !isMatrix ? CG_NOT_MATRIX_PARAM_ERROR : CG_NO_ERROR;
}

void setArray(CGparameter handle, const ArrayValues& what) {
    const ProgramParameter* const array = cg::parameterOf(handle);
    if (!array)
        return;
    if (array->description.parameterClass != ParameterClass::ARRAY)
        return cg::setError(CG_ARRAY_PARAM_ERROR);
    std::vector<const ProgramParameter*> innermost;
    appendInnermost(*array, innermost);
    const std::vector<ProgramParameter>& firstRow = innermost.front()->children;
    if (firstRow.empty())
        return cg::setError(CG_OUT_OF_ARRAY_BOUNDS_ERROR);
    const ProgramParameter& element = firstRow.front();
    const long rowSize = static_cast<long>(firstRow.size());
    const long size = rowSize * static_cast<long>(innermost.size());
    const CGerror error = errorOf(what, size, element);
    if (error != CG_NO_ERROR)
        return cg::setError(error);

    const cg::Parameter& shape = element.description;
    const int given = what.perElement != 0 ? what.perElement : shape.rows * shape.columns;
    const long end = what.count == 0 ? size : what.offset + what.count;
    for (long at = what.offset; at < end;) {
        const ProgramParameter& first =
            innermost[static_cast<size_t>(at / rowSize)]->children[static_cast<size_t>(at % rowSize)];
        const long count = std::min(end - at, rowSize - at % rowSize);
        if (first.location >= 0)
            sendElements(first, count, what.values + (at - what.offset) * given, given, what.layout);
        at += count;
    }
}

} // namespace

void cgGLSetParameter1f(CGparameter parameter, float x) {
    setVector(parameter, &x, 1);
}

void cgGLSetParameter2f(CGparameter parameter, float x, float y) {
    const std::array<float, 2> values = {x, y};
    setVector(parameter, values.data(), 2);
}

void cgGLSetParameter3f(CGparameter parameter, float x, float y, float z) {
    const std::array<float, 3> values = {x, y, z};
    setVector(parameter, values.data(), 3);
}

void cgGLSetParameter4f(CGparameter parameter, float x, float y, float z, float w) {
    const std::array<float, 4> values = {x, y, z, w};
    setVector(parameter, values.data(), 4);
}

void cgGLSetParameter1fv(CGparameter parameter, const float* values) {
    setVector(parameter, values, 1);
}

void cgGLSetParameter2fv(CGparameter parameter, const float* values) {
    setVector(parameter, values, 2);
}

void cgGLSetParameter3fv(CGparameter parameter, const float* values) {
    setVector(parameter, values, 3);
}

void cgGLSetParameter4fv(CGparameter parameter, const float* values) {
    setVector(parameter, values, 4);
}

void cgGLSetMatrixParameterfr(CGparameter parameter, const float* values) {
    setMatrix(parameter, values, Layout::ROW_BY_ROW);
}

void cgGLSetMatrixParameterfc(CGparameter parameter, const float* values) {
    setMatrix(parameter, values, Layout::COLUMN_BY_COLUMN);
}

void cgGLSetParameterArray1f(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 1, Layout::ROW_BY_ROW});
}

void cgGLSetParameterArray2f(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 2, Layout::ROW_BY_ROW});
}

void cgGLSetParameterArray3f(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 3, Layout::ROW_BY_ROW});
}

void cgGLSetParameterArray4f(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 4, Layout::ROW_BY_ROW});
}

void cgGLSetMatrixParameterArrayfr(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 0, Layout::ROW_BY_ROW});
}

void cgGLSetMatrixParameterArrayfc(CGparameter parameter, long offset, long count, const float* values) {
    setArray(parameter, {offset, count, values, 0, Layout::COLUMN_BY_COLUMN});
}
