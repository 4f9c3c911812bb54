#include "TextureUnits.h"

#include "Program.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <set>

namespace cg {

namespace {

using Units = std::multiset<int>;

size_t index(Stage stage) {
    return stage == Stage::VERTEX ? 0 : 1;
}

/// The units that semantics name in the living programs of each stage.
Units& namedUnits(Stage stage) {
    static std::array<Units, 2> units;
    return units[index(stage)];
}

int limit(GLenum name) {
    GLint value = 0;
    glGetIntegerv(name, &value);
    return value;
}

bool isSampler(const ProgramParameter& parameter) {
    return parameter.description.parameterClass == ParameterClass::SAMPLER;
}

void appendSamplers(std::vector<ProgramParameter>& parameters, std::vector<ProgramParameter*>& samplers) {
    for (ProgramParameter& parameter : parameters) {
        if (isSampler(parameter) && parameter.description.isReferenced)
            samplers.push_back(&parameter);
        appendSamplers(parameter.children, samplers);
    }
}

GLenum targetOf(SamplerKind kind) {
    switch (kind) {
    case SamplerKind::SAMPLER_1D:
        return GL_TEXTURE_1D;
    case SamplerKind::SAMPLER_2D:
        return GL_TEXTURE_2D;
    case SamplerKind::SAMPLER_3D:
        return GL_TEXTURE_3D;
    case SamplerKind::SAMPLER_RECT:
        return GL_TEXTURE_RECTANGLE;
    case SamplerKind::SAMPLER_CUBE:
        return GL_TEXTURE_CUBE_MAP;
    case SamplerKind::SAMPLER_1D_ARRAY:
        return GL_TEXTURE_1D_ARRAY;
    case SamplerKind::SAMPLER_2D_ARRAY:
        return GL_TEXTURE_2D_ARRAY;
    }
    return GL_TEXTURE_2D;
}

/// Selects texture units and puts the host's active unit back when it goes out of scope.
class ActiveUnit {
public:
    ActiveUnit() {
        glGetIntegerv(GL_ACTIVE_TEXTURE, &mHosts);
        mActive = mHosts;
    }
    ~ActiveUnit() { select(mHosts); }

    ActiveUnit(const ActiveUnit&) = delete;
    ActiveUnit& operator=(const ActiveUnit&) = delete;

    void bind(const ProgramParameter& sampler, GLuint texture) {
        select(GL_TEXTURE0 + sampler.textureUnit);
        glBindTexture(targetOf(sampler.description.samplerKind), texture);
    }

private:
    void select(GLint unit) {
        if (unit != mActive)
            glActiveTexture(static_cast<GLenum>(unit));
        mActive = unit;
    }

    GLint mHosts = 0;
    GLint mActive = 0;
};

} // namespace

std::vector<ProgramParameter*> assignTextureUnits(Stage stage, std::vector<ProgramParameter>& parameters) {
    std::vector<ProgramParameter*> samplers;
    appendSamplers(parameters, samplers);
    if (samplers.empty())
        return samplers;

    const int unitCount = limit(GL_MAX_COMBINED_TEXTURE_IMAGE_UNITS);
    std::set<int> taken(namedUnits(stage == Stage::VERTEX ? Stage::FRAGMENT : Stage::VERTEX).begin(),
                        namedUnits(stage == Stage::VERTEX ? Stage::FRAGMENT : Stage::VERTEX).end());
    Units newlyNamed;
    for (ProgramParameter* const sampler : samplers) {
        const int named = sampler->description.textureUnit;
        if (named < 0 || named >= unitCount)
            continue;
        sampler->textureUnit = named;
        taken.insert(named);
        newlyNamed.insert(named);
    }
    int next = stage == Stage::VERTEX ? limit(GL_MAX_TEXTURE_IMAGE_UNITS) : 0;
    for (ProgramParameter* const sampler : samplers) {
        if (sampler->textureUnit < 0) {
            while (taken.count(next) > 0)
                ++next;
            sampler->textureUnit = next++;
        }
        if (sampler->location >= 0)
            glProgramUniform1i(sampler->program.glName(), sampler->location, sampler->textureUnit);
    }
    namedUnits(stage).merge(newlyNamed); // last, and without allocating: all of it is done or nothing
    return samplers;
}

void releaseTextureUnits(Stage stage, const std::vector<ProgramParameter*>& samplers) {
    for (const ProgramParameter* const sampler : samplers) {
        const auto named = namedUnits(stage).find(sampler->description.textureUnit);
        if (named != namedUnits(stage).end())
            namedUnits(stage).erase(named);
    }
}

void bindTextures(const std::vector<ProgramParameter*>& samplers) {
    if (samplers.empty())
        return;
    ActiveUnit unit;
    for (const ProgramParameter* const sampler : samplers)
        if (sampler->hasTexture)
            unit.bind(*sampler, sampler->texture);
}

void unbindTextures(const std::vector<ProgramParameter*>& samplers) {
    if (samplers.empty())
        return;
    ActiveUnit unit;
    for (const ProgramParameter* const sampler : samplers)
        if (sampler->hasTexture)
            unit.bind(*sampler, 0);
}

} // namespace cg
