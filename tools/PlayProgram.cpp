#include "PlayProgram.h"

#include "Verbs.h"

#include <CgFolder.h>

#include <Cg/cgGL.h>

#include <algorithm>
#include <array>

namespace {

// Type codes of CgParam.
constexpr uint32_t VECTOR = 4;
constexpr uint32_t MATRIX = 14;
constexpr size_t MATRIX_VALUES = 16;
constexpr size_t VECTOR_VALUES = 4;

constexpr std::array<const char*, 3> OWN_PARAMETERS = {"pictureSize", "field", "frame"};

Shader build(const PlayProgramSettings& settings) {
    return settings.file.empty()
               ? host::makeFragmentShader(host::cgProgramPath("texture.cg"), "Cg_Main")
               : host::makeFragmentShader(host::findCgProgram(settings.file), settings.entry);
}

bool isSampler(CGparameter parameter) {
    const CGtype type = cgGetParameterType(parameter);
    return std::string(cgGetTypeString(type)).rfind("sampler", 0) == 0;
}

} // namespace

PlayProgram::PlayProgram(const PlayProgramSettings& settings)
    : mFile(settings.file), mShader(build(settings)) {
    for (const PlayParameter& parameter : settings.parameters)
        addParameter(parameter);
    const auto isGiven = [&](const std::string& name) {
        return std::any_of(settings.parameters.begin(), settings.parameters.end(),
                           [&](const PlayParameter& parameter) { return parameter.name == name; });
    };
    for (const char* const name : OWN_PARAMETERS)
        if (!isGiven(name) && find(name)) {
            mShader.addCgParam(name, VECTOR, 1);
            mOwnParameters.push_back(name);
        }
    mShader.getNamedCgParameterAll();
    mPictureSampler = find("picture");
    mEvenSampler = find("even");
    mOddSampler = find("odd");
    for (const PlayAssignment& texture : settings.textures)
        addTexture(texture);
}

CGparameter PlayProgram::find(const std::string& name) {
    // A shader hands out handles through its resource slots.
    mShader.createCgResource(1);
    mShader.setCgResource(0, name);
    return mShader.getCgResourceParam(name);
}

void PlayProgram::addParameter(const PlayParameter& parameter) {
    auto* const handle = find(parameter.name);
    if (!handle)
        throw WrongCall("--param: " + mFile + " has no parameter " + parameter.name);
    const auto rows = static_cast<size_t>(std::max(cgGetParameterRows(handle), 0));
    const auto columns = static_cast<size_t>(std::max(cgGetParameterColumns(handle), 0));
    if (isSampler(handle))
        throw WrongCall("--param: " + parameter.name + " is a sampler; give it a picture with --texture");
    if (cgGetArrayDimension(handle) > 0 || rows * columns == 0)
        throw WrongCall("--param: " + parameter.name + " is an array or a structure; name its parts");
    if (parameter.values.size() != rows * columns)
        throw WrongCall("--param: " + parameter.name + " has " + std::to_string(rows * columns) +
                        " values, not " + std::to_string(parameter.values.size()));
    std::vector<float> values = parameter.values;
    values.resize(rows > 1 ? MATRIX_VALUES : VECTOR_VALUES);
    mShader.addCgParam(parameter.name, rows > 1 ? MATRIX : static_cast<uint32_t>(columns), 1, values.data());
}

CGparameter PlayProgram::findSampler(const std::string& name) {
    auto* const handle = find(name);
    if (!handle || !isSampler(handle))
        throw WrongCall("--texture: " + mFile + " has no sampler " + name);
    return handle;
}

void PlayProgram::addTexture(const PlayAssignment& texture) {
    auto* const sampler = findSampler(texture.name);
    mTextures.push_back(uploadedFile(texture.text));
    mTextureBindings.push_back({sampler, mTextures.back()->getGLTexID(0)});
    for (CGparameter* const own : {&mPictureSampler, &mEvenSampler, &mOddSampler})
        if (*own == sampler)
            *own = nullptr;
}

void PlayProgram::bind(CGparameter sampler, uint32_t glTexture) {
    if (!sampler)
        return;
    cgGLSetTextureParameter(sampler, glTexture);
    cgGLEnableTextureParameter(sampler);
    mBound.push_back(sampler);
}

void PlayProgram::begin(const PlayPicture& picture, int frameIndex) {
    mShader.enableProfile();
    mShader.bindProgram();
    for (const Binding& binding : mTextureBindings)
        bind(binding.sampler, binding.glTexture);
    bind(mPictureSampler, picture.glTexture(frameIndex));
    bind(mEvenSampler, picture.glTextureOfField(0));
    bind(mOddSampler, picture.glTextureOfField(1));
    setOwnParameters(picture, frameIndex);
    mShader.setCgParamAll();
}

void PlayProgram::setOwnParameters(const PlayPicture& picture, int frameIndex) {
    for (const std::string& name : mOwnParameters) {
        if (name == "pictureSize")
            mShader.setCgParamValue(name, static_cast<float>(picture.getWidth()),
                                    static_cast<float>(picture.getFrameHeight()), 0, 0);
        else
            mShader.setCgParamValue(name, static_cast<float>(name == "field" ? frameIndex & 1 : frameIndex),
                                    0, 0, 0);
    }
}

void PlayProgram::end() {
    for (auto* const sampler : mBound)
        cgGLDisableTextureParameter(sampler);
    mBound.clear();
    mShader.disableProfile();
}
