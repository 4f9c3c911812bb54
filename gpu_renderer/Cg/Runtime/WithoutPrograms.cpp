// Everything of the runtime that needs no program; the compiler, and programs with it, come next.
#include "Errors.h"

#include <Cg/cgGL.h>

#include <epoxy/gl.h>

#include <cstdint>
#include <unordered_set>

namespace {

std::unordered_set<CGcontext> contexts;
std::uintptr_t lastSerial = 0;

bool isKnown(CGcontext context) {
    if (contexts.count(context) > 0)
        return true;
    cg::setError(CG_INVALID_CONTEXT_HANDLE_ERROR);
    return false;
}

bool isRunnable(CGprofile profile) {
    return profile == CG_PROFILE_GLSLV || profile == CG_PROFILE_GLSLF;
}

void checkProfile(CGprofile profile) {
    if (!isRunnable(profile))
        cg::setError(CG_INVALID_PROFILE_ERROR);
}

bool programsRun() {
    return epoxy_gl_version() >= 41 || epoxy_has_gl_extension("GL_ARB_separate_shader_objects");
}

} // namespace

CGcontext cgCreateContext() {
    return *contexts.insert(reinterpret_cast<CGcontext>(++lastSerial)).first;
}
void cgDestroyContext(CGcontext context) {
    if (isKnown(context))
        contexts.erase(context);
}
CGbool cgIsContext(CGcontext context) {
    return contexts.count(context) > 0;
}
const char* cgGetLastListing(CGcontext context) {
    isKnown(context);
    return "";
}
CGprogram cgCreateProgram(CGcontext context, CGenum, const char*, CGprofile, const char*, const char**) {
    if (isKnown(context))
        cg::setError(CG_COMPILER_ERROR);
    return nullptr;
}
CGprogram cgCreateProgramFromFile(CGcontext context, CGenum, const char*, CGprofile, const char*,
                                  const char**) {
    if (isKnown(context))
        cg::setError(CG_COMPILER_ERROR);
    return nullptr;
}
CGprofile cgGLGetLatestProfile(CGGLenum kind) {
    if (kind != CG_GL_VERTEX && kind != CG_GL_FRAGMENT) {
        cg::setError(CG_INVALID_ENUMERANT_ERROR);
        return CG_PROFILE_UNKNOWN;
    }
    if (!programsRun()) {
        cg::setError(CG_UNSUPPORTED_GL_EXTENSION_ERROR);
        return CG_PROFILE_UNKNOWN;
    }
    return kind == CG_GL_VERTEX ? CG_PROFILE_GLSLV : CG_PROFILE_GLSLF;
}
CGbool cgGLIsProfileSupported(CGprofile profile) {
    return isRunnable(profile) && programsRun();
}
const char* cgGetProfileString(CGprofile profile) {
    return profile == CG_PROFILE_GLSLV ? "glslv" : profile == CG_PROFILE_GLSLF ? "glslf" : nullptr;
}
const char* cgGetTypeString(CGtype) {
    return "unknown type";
}
void cgGLSetManageTextureParameters(CGcontext context, CGbool) {
    isKnown(context);
}

void cgDestroyProgram(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
}
CGbool cgIsProgram(CGprogram) {
    return CG_FALSE;
}
CGbool cgIsProgramCompiled(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return CG_FALSE;
}
const char* cgGetProgramString(CGprogram, CGenum) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return "";
}
CGprofile cgGetProgramProfile(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return CG_PROFILE_UNKNOWN;
}
CGparameter cgGetNamedParameter(CGprogram, const char*) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return nullptr;
}
CGparameter cgGetFirstParameter(CGprogram, CGenum) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return nullptr;
}
CGparameter cgGetNextParameter(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return nullptr;
}
CGparameter cgGetFirstStructParameter(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return nullptr;
}
CGparameter cgGetArrayParameter(CGparameter, int) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return nullptr;
}
CGbool cgIsParameter(CGparameter) {
    return CG_FALSE;
}
const char* cgGetParameterName(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return "";
}
CGtype cgGetParameterType(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return CG_UNKNOWN_TYPE;
}
int cgGetParameterRows(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return 0;
}
int cgGetParameterColumns(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return 0;
}
int cgGetArrayDimension(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return 0;
}
int cgGetArraySize(CGparameter, int) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return -1;
}
const char* cgGetParameterSemantic(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return "";
}
CGenum cgGetParameterVariability(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return CG_ERROR;
}
CGenum cgGetParameterDirection(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return CG_ERROR;
}
CGbool cgIsParameterReferenced(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return CG_FALSE;
}
int cgGetParameterDefaultValuefr(CGparameter, int, float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return 0;
}
void cgGLSetOptimalOptions(CGprofile profile) {
    checkProfile(profile);
}
void cgGLEnableProfile(CGprofile profile) {
    checkProfile(profile);
}
void cgGLDisableProfile(CGprofile profile) {
    checkProfile(profile);
}
void cgGLLoadProgram(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
}
CGbool cgGLIsProgramLoaded(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return CG_FALSE;
}
void cgGLBindProgram(CGprogram) {
    cg::setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
}
void cgGLUnbindProgram(CGprofile profile) {
    checkProfile(profile);
}
void cgGLSetParameter1f(CGparameter, float) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter2f(CGparameter, float, float) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter3f(CGparameter, float, float, float) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter4f(CGparameter, float, float, float, float) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter1fv(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter2fv(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter3fv(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameter4fv(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetMatrixParameterfr(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetMatrixParameterfc(CGparameter, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameterArray1f(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameterArray2f(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameterArray3f(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetParameterArray4f(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetMatrixParameterArrayfr(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetMatrixParameterArrayfc(CGparameter, long, long, const float*) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLSetTextureParameter(CGparameter, unsigned int) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLEnableTextureParameter(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
void cgGLDisableTextureParameter(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
}
unsigned int cgGLGetTextureEnum(CGparameter) {
    cg::setError(CG_INVALID_PARAM_HANDLE_ERROR);
    return 0;
}
