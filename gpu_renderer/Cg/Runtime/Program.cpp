#include "Program.h"

#include "Context.h"
#include "Driver.h"
#include "Errors.h"
#include "Handles.h"
#include "Pipeline.h"
#include "TextureUnits.h"
#include "Uniforms.h"

#include <Cg/Compiler/SourceReader.h>
#include <Cg/Compiler/VaryingPlaces.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <memory>
#include <utility>

namespace cg {

namespace {

HandleTable<CGprogram, Program> handles;

/// Any vertex program may be drawn with any fragment program.
VaryingPlaces varyingPlaces;

/// Takes "-DNAME", "-DNAME=VALUE" and "-Ipath"; passes over the rest.
void addOptions(const char** args, CompileRequest& request) {
    for (; args && *args; ++args) {
        const std::string_view option = *args;
        const std::string value(option.substr(std::min<size_t>(2, option.size())));
        if (option.rfind("-I", 0) == 0) {
            request.includeFolders.push_back(value);
        } else if (option.rfind("-D", 0) == 0) {
            const size_t equals = value.find('=');
            request.macros.emplace_back(value.substr(0, equals),
                                        equals == std::string::npos ? "1" : value.substr(equals + 1));
        }
    }
}

/// Sets the error and gives null where the context cannot compile what is asked for.
Context* contextThatCompiles(CGcontext context, CGenum type, CGprofile profile, const char* text) {
    Context* const found = contextOf(context);
    if (!found)
        return nullptr;
    CGerror error = CG_NO_ERROR;
    if (type != CG_SOURCE)
        error = CG_INVALID_ENUMERANT_ERROR;
    else if (!isProgramProfile(profile))
        error = CG_UNKNOWN_PROFILE_ERROR;
    else if (!text)
        error = CG_INVALID_PARAMETER_ERROR;
    else if (!driver::runsPrograms())
        error = CG_UNSUPPORTED_GL_EXTENSION_ERROR;
    if (error == CG_NO_ERROR)
        return found;
    setError(error);
    return nullptr;
}

CGprogram fail(Context& context, CGerror error, std::string listing) {
    context.setListing(std::move(listing));
    setError(error);
    return nullptr;
}

CGprogram compileInto(Context& context, Program::Origin origin, const char** args) {
    CompileRequest request;
    request.source = origin.source;
    request.fileName = origin.fileName;
    request.entry = origin.entry;
    request.stage = origin.profile == CG_PROFILE_GLSLV ? Stage::VERTEX : Stage::FRAGMENT;
    request.target = driver::glslTarget();
    request.reader = &readInclude;
    request.varyingPlaces = &varyingPlaces;
    addOptions(args, request);

    CompileResult compiled = compile(request);
    if (!compiled.ok)
        return fail(context, CG_COMPILER_ERROR, std::move(compiled.listing));
    std::string log;
    driver::LinkedProgram linked = driver::linkProgram(request.stage, compiled.glsl, log);
    if (!linked.name())
        return fail(context, CG_COMPILER_ERROR,
                    compiled.listing + origin.fileName + " : error: OpenGL does not take the GLSL of \"" +
                        origin.entry + "\":\n" + log);
    context.setListing(std::move(compiled.listing));
    auto program = std::make_unique<Program>(context, std::move(origin), std::move(compiled), linked.name());
    linked.release();
    return context.add(std::move(program));
}

std::string entryOrMain(const char* entry) {
    return entry ? entry : "main";
}

} // namespace

Program::Program(Context& context, Origin origin, CompileResult compiled, unsigned int glName)
    : mContext(context), mOrigin(std::move(origin)), mCompiled(std::move(compiled)), mGlName(glName) {
    Pipeline::current().checkContext();
    mParameters.reserve(mCompiled.parameters.size());
    for (const Parameter& parameter : mCompiled.parameters)
        mParameters.emplace_back(parameter, *this);
    linkSiblings(mParameters);
    addNames(mParameters);
    findUniforms(mGlName, mParameters);
    mSamplers = assignTextureUnits(stage(), mParameters);
    try {
        sendDefaults(mParameters);
        mHandle = handles.add(*this);
    } catch (...) { // no memory
        releaseTextureUnits(stage(), mSamplers);
        throw;
    }
}

void Program::retire() {
    Pipeline::forget(*this);
    driver::deleteProgram(mGlName);
    releaseTextureUnits(stage(), mSamplers);
    removeHandles(mParameters);
    handles.remove(mHandle);
}

ProgramParameter* Program::parameterNamed(std::string_view name) const {
    const auto found = mByName.find(name);
    return found == mByName.end() ? nullptr : found->second;
}

ProgramParameter* Program::firstParameter(bool isGlobal) {
    for (ProgramParameter& parameter : mParameters)
        if (parameter.description.isGlobal == isGlobal)
            return &parameter;
    return nullptr;
}

void Program::addNames(std::vector<ProgramParameter>& parameters) {
    for (ProgramParameter& parameter : parameters) {
        mByName.emplace(parameter.description.name, &parameter);
        addNames(parameter.children);
    }
}

Program* programOf(CGprogram handle) {
    Program* const found = handles.find(handle);
    if (!found)
        setError(CG_INVALID_PROGRAM_HANDLE_ERROR);
    return found;
}

bool isProgramProfile(CGprofile profile) {
    return profile == CG_PROFILE_GLSLV || profile == CG_PROFILE_GLSLF;
}

} // namespace cg

CGprogram cgCreateProgram(CGcontext context, CGenum type, const char* source, CGprofile profile,
                          const char* entry, const char** args) {
    cg::Context* const found = cg::contextThatCompiles(context, type, profile, source);
    if (!found)
        return nullptr;
    return cg::compileInto(*found, {source, "<string>", cg::entryOrMain(entry), profile}, args);
}

CGprogram cgCreateProgramFromFile(CGcontext context, CGenum type, const char* file, CGprofile profile,
                                  const char* entry, const char** args) {
    cg::Context* const found = cg::contextThatCompiles(context, type, profile, file);
    if (!found)
        return nullptr;
    std::string source;
    if (!cg::readSource(file, source))
        return cg::fail(*found, CG_FILE_READ_ERROR,
                        std::string(file) + " : error: cannot read the file: " + std::strerror(errno) + '\n');
    return cg::compileInto(*found, {std::move(source), file, cg::entryOrMain(entry), profile}, args);
}

void cgDestroyProgram(CGprogram program) {
    cg::Program* const found = cg::programOf(program);
    if (found)
        found->context().destroy(*found);
}

CGbool cgIsProgram(CGprogram program) {
    return cg::handles.find(program) ? CG_TRUE : CG_FALSE;
}

CGbool cgIsProgramCompiled(CGprogram program) {
    return cg::programOf(program) ? CG_TRUE : CG_FALSE;
}

const char* cgGetProgramString(CGprogram program, CGenum what) {
    const cg::Program* const found = cg::programOf(program);
    if (!found)
        return "";
    switch (what) {
    case CG_PROGRAM_SOURCE:
        return found->origin().source.c_str();
    case CG_PROGRAM_ENTRY:
        return found->origin().entry.c_str();
    case CG_PROGRAM_PROFILE:
        return cgGetProfileString(found->origin().profile);
    case CG_COMPILED_PROGRAM:
        return found->glsl().c_str();
    default:
        cg::setError(CG_INVALID_ENUMERANT_ERROR);
        return "";
    }
}

CGprofile cgGetProgramProfile(CGprogram program) {
    const cg::Program* const found = cg::programOf(program);
    return found ? found->origin().profile : CG_PROFILE_UNKNOWN;
}

const char* cgGetProfileString(CGprofile profile) {
    if (!cg::isProgramProfile(profile))
        return nullptr;
    return profile == CG_PROFILE_GLSLV ? "glslv" : "glslf";
}
