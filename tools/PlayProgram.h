#ifndef TOOLS_PLAYPROGRAM_H
#define TOOLS_PLAYPROGRAM_H

#include "PlayPicture.h"

#include <FwZel/Shader.h>

#include <memory>
#include <string>
#include <vector>

/// The Cg fragment program that pictures are drawn with, and what it is fed with.
///
/// By itself it gets, where it has parameters of these names that are not given: the samplers picture (what
/// the frame shows), even and odd (its fields); float2 pictureSize (width and height of the frame in pixels);
/// float field (0 even, 1 odd); float frame (the frame counter).
///
/// Thread: the render thread.
class PlayProgram {
public:
    /// @throw WrongCall  a parameter that the program does not have, or of another kind
    /// @throw std::runtime_error  the program cannot be created
    explicit PlayProgram(const PlayProgramSettings& settings);

    /// Whether it shows one field a frame, so that texture coordinates are shifted onto the field.
    bool showsField() const { return mPictureSampler != nullptr; }

    /// Makes it the current program, with the textures and values of a frame.
    void begin(const PlayPicture& picture, int frameIndex);

    /// Back to fixed function; the samplers' units are without textures.
    void end();

private:
    struct Binding {
        CGparameter sampler;
        uint32_t glTexture;
    };

    CGparameter find(const std::string& name);
    CGparameter findSampler(const std::string& name);
    void addParameter(const PlayParameter& parameter);
    void addTexture(const PlayAssignment& texture);
    void setOwnParameters(const PlayPicture& picture, int frameIndex);
    void bind(CGparameter sampler, uint32_t glTexture);

    std::string mFile;
    Shader mShader;
    std::vector<std::unique_ptr<Texture>> mTextures;
    std::vector<Binding> mTextureBindings;
    CGparameter mPictureSampler = nullptr;
    CGparameter mEvenSampler = nullptr;
    CGparameter mOddSampler = nullptr;
    std::vector<CGparameter> mBound;
    std::vector<std::string> mOwnParameters; ///< those that it sets by itself
};

#endif
