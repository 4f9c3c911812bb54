#include "Parameter.h"

#include "Errors.h"
#include "Handles.h"
#include "Program.h"

#include <algorithm>

namespace cg {

namespace {

HandleTable<CGparameter, ProgramParameter> handles;

/// The description of an array's innermost elements; of anything else, its own.
const Parameter& elementOf(const Parameter& parameter) {
    const Parameter* element = &parameter;
    while (element->parameterClass == ParameterClass::ARRAY && !element->children.empty())
        element = &element->children.front();
    return *element;
}

bool isNumber(const Parameter& parameter) {
    return parameter.parameterClass == ParameterClass::SCALAR ||
           parameter.parameterClass == ParameterClass::VECTOR ||
           parameter.parameterClass == ParameterClass::MATRIX;
}

int kindOf(ScalarKind kind) {
    switch (kind) {
    case ScalarKind::FLOAT:
        return CG_FLOAT;
    case ScalarKind::HALF:
        return CG_HALF;
    case ScalarKind::FIXED:
        return CG_FIXED;
    case ScalarKind::INT:
        return CG_INT;
    case ScalarKind::BOOL:
        return CG_BOOL;
    }
    return CG_UNKNOWN_TYPE;
}

CGtype samplerType(SamplerKind kind) {
    switch (kind) {
    case SamplerKind::SAMPLER_1D:
        return CG_SAMPLER1D;
    case SamplerKind::SAMPLER_2D:
        return CG_SAMPLER2D;
    case SamplerKind::SAMPLER_3D:
        return CG_SAMPLER3D;
    case SamplerKind::SAMPLER_RECT:
        return CG_SAMPLERRECT;
    case SamplerKind::SAMPLER_CUBE:
        return CG_SAMPLERCUBE;
    case SamplerKind::SAMPLER_1D_ARRAY:
        return CG_SAMPLER1DARRAY;
    case SamplerKind::SAMPLER_2D_ARRAY:
        return CG_SAMPLER2DARRAY;
    }
    return CG_UNKNOWN_TYPE;
}

CGtype typeOf(const Parameter& parameter) {
    switch (parameter.parameterClass) {
    case ParameterClass::SCALAR:
        return static_cast<CGtype>(kindOf(parameter.scalarKind));
    case ParameterClass::VECTOR:
        return static_cast<CGtype>(kindOf(parameter.scalarKind) + parameter.columns);
    case ParameterClass::MATRIX:
        return static_cast<CGtype>(kindOf(parameter.scalarKind) + 10 * parameter.rows + parameter.columns);
    case ParameterClass::SAMPLER:
        return samplerType(parameter.samplerKind);
    case ParameterClass::STRUCT:
        return CG_STRUCT;
    case ParameterClass::ARRAY:
        return CG_ARRAY;
    }
    return CG_UNKNOWN_TYPE;
}

bool hasDefault(const Parameter& parameter) {
    return !parameter.defaults.empty() ||
           std::any_of(parameter.children.begin(), parameter.children.end(), hasDefault);
}

void appendDefault(const Parameter& parameter, std::vector<float>& values) {
    if (!parameter.defaults.empty())
        values.insert(values.end(), parameter.defaults.begin(), parameter.defaults.end());
    else if (isNumber(parameter))
        values.resize(values.size() + static_cast<size_t>(parameter.rows * parameter.columns));
    for (const Parameter& child : parameter.children)
        appendDefault(child, values);
}

/// The parameter of a handle where it is an array; else null, with the error state set.
ProgramParameter* arrayOf(CGparameter handle) {
    ProgramParameter* const found = parameterOf(handle);
    if (!found || found->description.parameterClass == ParameterClass::ARRAY)
        return found;
    setError(CG_ARRAY_PARAM_ERROR);
    return nullptr;
}

} // namespace

ProgramParameter::ProgramParameter(const Parameter& described, Program& owner)
    : description(described), program(owner) {
    children.reserve(described.children.size());
    for (const Parameter& child : described.children)
        children.emplace_back(child, owner);
    if (described.parameterClass == ParameterClass::STRUCT)
        linkSiblings(children);
}

void linkSiblings(std::vector<ProgramParameter>& siblings) {
    for (size_t i = 1; i < siblings.size(); ++i)
        if (siblings[i].description.isGlobal == siblings[i - 1].description.isGlobal)
            siblings[i - 1].next = &siblings[i];
}

ProgramParameter* parameterOf(CGparameter handle) {
    ProgramParameter* const found = handles.find(handle);
    if (!found)
        setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return found;
}

CGparameter handleOf(ProgramParameter* parameter) {
    if (parameter && !parameter->handle)
        parameter->handle = handles.add(*parameter);
    return parameter ? parameter->handle : nullptr;
}

void removeHandles(const std::vector<ProgramParameter>& parameters) {
    for (const ProgramParameter& parameter : parameters) {
        handles.remove(parameter.handle);
        removeHandles(parameter.children);
    }
}

} // namespace cg

using cg::ProgramParameter;

CGparameter cgGetNamedParameter(CGprogram program, const char* name) {
    cg::Program* const found = cg::programOf(program);
    return found && name ? cg::handleOf(found->parameterNamed(name)) : nullptr;
}

CGparameter cgGetFirstParameter(CGprogram program, CGenum nameSpace) {
    cg::Program* const found = cg::programOf(program);
    if (!found)
        return nullptr;
    if (nameSpace != CG_PROGRAM && nameSpace != CG_GLOBAL) {
        cg::setError(CG_INVALID_ENUMERANT_ERROR);
        return nullptr;
    }
    return cg::handleOf(found->firstParameter(nameSpace == CG_GLOBAL));
}

CGparameter cgGetNextParameter(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    return found ? cg::handleOf(found->next) : nullptr;
}

CGparameter cgGetFirstStructParameter(CGparameter parameter) {
    ProgramParameter* const found = cg::parameterOf(parameter);
    const bool hasMembers =
        found && found->description.parameterClass == cg::ParameterClass::STRUCT && !found->children.empty();
    return hasMembers ? cg::handleOf(&found->children.front()) : nullptr;
}

CGparameter cgGetArrayParameter(CGparameter parameter, int index) {
    ProgramParameter* const array = cg::arrayOf(parameter);
    if (!array)
        return nullptr;
    if (index < 0 || static_cast<size_t>(index) >= array->children.size()) {
        cg::setError(CG_OUT_OF_ARRAY_BOUNDS_ERROR);
        return nullptr;
    }
    return cg::handleOf(&array->children[static_cast<size_t>(index)]);
}

CGbool cgIsParameter(CGparameter parameter) {
    return cg::handles.find(parameter) ? CG_TRUE : CG_FALSE;
}

const char* cgGetParameterName(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    return found ? found->description.name.c_str() : "";
}

CGtype cgGetParameterType(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    return found ? cg::typeOf(found->description) : CG_UNKNOWN_TYPE;
}

int cgGetParameterRows(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    if (!found)
        return 0;
    const cg::Parameter& element = cg::elementOf(found->description);
    return cg::isNumber(element) ? element.rows : 0;
}

int cgGetParameterColumns(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    if (!found)
        return 0;
    const cg::Parameter& element = cg::elementOf(found->description);
    return cg::isNumber(element) ? element.columns : 0;
}

int cgGetArrayDimension(CGparameter parameter) {
    const ProgramParameter* level = cg::parameterOf(parameter);
    int dimensions = 0;
    while (level && level->description.parameterClass == cg::ParameterClass::ARRAY) {
        ++dimensions;
        level = level->children.empty() ? nullptr : &level->children.front();
    }
    return dimensions;
}

int cgGetArraySize(CGparameter parameter, int dimension) {
    const ProgramParameter* level = cg::arrayOf(parameter);
    if (!level)
        return -1;
    for (int outer = 0; outer < dimension && level; ++outer)
        level = level->children.empty() ? nullptr : &level->children.front();
    if (dimension < 0 || !level || level->description.parameterClass != cg::ParameterClass::ARRAY) {
        cg::setError(CG_INVALID_DIMENSION_ERROR);
        return -1;
    }
    return static_cast<int>(level->children.size());
}

const char* cgGetParameterSemantic(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    return found ? found->description.semantic.c_str() : "";
}

CGenum cgGetParameterVariability(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    if (!found)
        return CG_ERROR;
    switch (found->description.variability) {
    case cg::ParameterVariability::UNIFORM:
        return CG_UNIFORM;
    case cg::ParameterVariability::VARYING:
        return CG_VARYING;
    case cg::ParameterVariability::CONSTANT:
        return CG_CONSTANT;
    }
    return CG_ERROR;
}

CGenum cgGetParameterDirection(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    if (!found)
        return CG_ERROR;
    switch (found->description.direction) {
    case cg::ParameterDirection::IN:
        return CG_IN;
    case cg::ParameterDirection::OUT:
        return CG_OUT;
    case cg::ParameterDirection::INOUT:
        return CG_INOUT;
    }
    return CG_ERROR;
}

CGbool cgIsParameterReferenced(CGparameter parameter) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    return found && found->description.isReferenced ? CG_TRUE : CG_FALSE;
}

int cgGetParameterDefaultValuefr(CGparameter parameter, int count, float* values) {
    const ProgramParameter* const found = cg::parameterOf(parameter);
    if (!found)
        return 0;
    if (!values || count < 0) {
        cg::setError(CG_INVALID_PARAMETER_ERROR);
        return 0;
    }
    if (!cg::hasDefault(found->description))
        return 0;
    std::vector<float> whole;
    cg::appendDefault(found->description, whole);
    const size_t written = std::min(whole.size(), static_cast<size_t>(count));
    std::copy_n(whole.begin(), written, values);
    return static_cast<int>(written);
}
