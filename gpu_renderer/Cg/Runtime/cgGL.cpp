#include "Context.h"
#include "Driver.h"
#include "Errors.h"
#include "Pipeline.h"
#include "Program.h"
#include "TextureUnits.h"

#include <Cg/cgGL.h>

#include <epoxy/gl.h>

namespace {

/// Whether programs run on the profile; else the error state is set.
bool accepts(CGprofile profile) {
    if (cg::isProgramProfile(profile))
        return true;
    cg::setError(CG_INVALID_PROFILE_ERROR);
    return false;
}

cg::Stage stageOf(CGprofile profile) {
    return profile == CG_PROFILE_GLSLV ? cg::Stage::VERTEX : cg::Stage::FRAGMENT;
}

/// The sampler of a handle; null, with the error state set, where it is none.
cg::ProgramParameter* samplerOf(CGparameter handle) {
    cg::ProgramParameter* const found = cg::parameterOf(handle);
    if (!found || found->description.parameterClass == cg::ParameterClass::SAMPLER)
        return found;
    cg::setError(CG_INVALID_PARAMETER_ERROR);
    return nullptr;
}

} // namespace

CGprofile cgGLGetLatestProfile(CGGLenum kind) {
    if (kind != CG_GL_VERTEX && kind != CG_GL_FRAGMENT) {
        cg::setError(CG_INVALID_ENUMERANT_ERROR);
        return CG_PROFILE_UNKNOWN;
    }
    if (!cg::driver::runsPrograms()) {
        cg::setError(CG_UNSUPPORTED_GL_EXTENSION_ERROR);
        return CG_PROFILE_UNKNOWN;
    }
    return kind == CG_GL_VERTEX ? CG_PROFILE_GLSLV : CG_PROFILE_GLSLF;
}

CGbool cgGLIsProfileSupported(CGprofile profile) {
    return cg::isProgramProfile(profile) && cg::driver::runsPrograms() ? CG_TRUE : CG_FALSE;
}

void cgGLSetOptimalOptions(CGprofile profile) {
    accepts(profile);
}

void cgGLEnableProfile(CGprofile profile) {
    if (accepts(profile))
        cg::Pipeline::current().setEnabled(stageOf(profile), true);
}

void cgGLDisableProfile(CGprofile profile) {
    if (accepts(profile))
        cg::Pipeline::current().setEnabled(stageOf(profile), false);
}

void cgGLLoadProgram(CGprogram program) {
    cg::Program* const found = cg::programOf(program);
    if (found)
        found->setLoaded();
}

CGbool cgGLIsProgramLoaded(CGprogram program) {
    const cg::Program* const found = cg::programOf(program);
    return found && found->isLoaded() ? CG_TRUE : CG_FALSE;
}

void cgGLBindProgram(CGprogram program) {
    cg::Program* const found = cg::programOf(program);
    if (!found)
        return;
    if (!found->isLoaded())
        return cg::setError(CG_PROGRAM_NOT_LOADED_ERROR);
    cg::Pipeline::current().setProgram(found->stage(), found);
    if (found->context().managesTextures())
        cg::bindTextures(found->samplers());
}

void cgGLUnbindProgram(CGprofile profile) {
    if (!accepts(profile))
        return;
    cg::Pipeline& pipeline = cg::Pipeline::current();
    const cg::Program* const bound = pipeline.program(stageOf(profile));
    if (bound && bound->context().managesTextures())
        cg::unbindTextures(bound->samplers());
    pipeline.setProgram(stageOf(profile), nullptr);
}

void cgGLSetTextureParameter(CGparameter parameter, unsigned int texture) {
    cg::ProgramParameter* const sampler = samplerOf(parameter);
    if (!sampler)
        return;
    sampler->texture = texture;
    sampler->hasTexture = true;
}

void cgGLEnableTextureParameter(CGparameter parameter) {
    cg::ProgramParameter* const sampler = samplerOf(parameter);
    if (sampler && sampler->textureUnit >= 0)
        cg::bindTextures({sampler});
}

void cgGLDisableTextureParameter(CGparameter parameter) {
    cg::ProgramParameter* const sampler = samplerOf(parameter);
    if (sampler && sampler->textureUnit >= 0)
        cg::unbindTextures({sampler});
}

unsigned int cgGLGetTextureEnum(CGparameter parameter) {
    const cg::ProgramParameter* const sampler = samplerOf(parameter);
    return sampler && sampler->textureUnit >= 0 ? GL_TEXTURE0 + static_cast<GLenum>(sampler->textureUnit) : 0;
}

void cgGLSetManageTextureParameters(CGcontext context, CGbool manage) {
    cg::Context* const found = cg::contextOf(context);
    if (found)
        found->setManagesTextures(manage != CG_FALSE);
}
