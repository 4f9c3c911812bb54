#include "Errors.h"

#include <utility>

namespace {

CGerror lastError = CG_NO_ERROR;

} // namespace

void cg::setError(CGerror error) {
    lastError = error;
}

CGerror cg::takeError() {
    return std::exchange(lastError, CG_NO_ERROR);
}

CGerror cgGetError() {
    return cg::takeError();
}

const char* cgGetErrorString(CGerror error) {
    switch (error) {
    case CG_NO_ERROR:
        return "no error";
    case CG_COMPILER_ERROR:
        return "the program does not compile";
    case CG_INVALID_PARAMETER_ERROR:
        return "the operation does not apply to the parameter";
    case CG_INVALID_PROFILE_ERROR:
        return "not a profile that programs run on";
    case CG_PROGRAM_LOAD_ERROR:
        return "the program could not be loaded";
    case CG_PROGRAM_BIND_ERROR:
        return "the program could not be bound";
    case CG_PROGRAM_NOT_LOADED_ERROR:
        return "the program is not loaded";
    case CG_UNSUPPORTED_GL_EXTENSION_ERROR:
        return "the OpenGL context lacks what programs need";
    case CG_NOT_MATRIX_PARAM_ERROR:
        return "the parameter is not a matrix";
    case CG_INVALID_ENUMERANT_ERROR:
        return "the operation does not know the enumerator";
    case CG_FILE_READ_ERROR:
        return "the file could not be read";
    case CG_INVALID_CONTEXT_HANDLE_ERROR:
        return "not a handle of a context";
    case CG_INVALID_PROGRAM_HANDLE_ERROR:
        return "not a handle of a program";
    case CG_INVALID_PARAM_HANDLE_ERROR:
        return "not a handle of a parameter";
    case CG_UNKNOWN_PROFILE_ERROR:
        return "programs cannot be compiled for the profile";
    case CG_INVALID_DIMENSION_ERROR:
        return "the array has no such dimension";
    case CG_ARRAY_PARAM_ERROR:
        return "the parameter is not an array";
    case CG_OUT_OF_ARRAY_BOUNDS_ERROR:
        return "elements outside the array";
    }
    return "unknown error";
}

const char* cgGetLastErrorString(CGerror* error) {
    const CGerror last = cg::takeError();
    if (error)
        *error = last;
    return last == CG_NO_ERROR ? nullptr : cgGetErrorString(last);
}
