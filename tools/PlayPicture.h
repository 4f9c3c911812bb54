#ifndef TOOLS_PLAYPICTURE_H
#define TOOLS_PLAYPICTURE_H

#include "PlaySettings.h"

#include <ProducerThread.h>

#include <FwZel/Texture.h>

#include <cstdint>
#include <memory>

/// A pattern or a picture file in a texture of the library, uploaded anew for every frame. The frames take
/// the buffers in turn; of a picture in fields, frames with an even number show the even field.
///
/// Thread: the render thread.
class PlayPicture {
public:
    /// @throw std::runtime_error  OpenGL takes no such texture, or there is no memory; what() names the
    /// picture
    PlayPicture(const PlaySource& source, const PlayLayout& layout);
    ~PlayPicture();
    PlayPicture(const PlayPicture&) = delete;
    PlayPicture& operator=(const PlayPicture&) = delete;

    /// Brings the picture of a frame into its buffer's texture. A producer thread meanwhile writes the next
    /// frame's into that one's PBO.
    void upload(int frameIndex);

    /// OpenGL name of the texture that a frame shows.
    uint32_t glTexture(int frameIndex) const { return mTexture->getGLTexID(bufferOf(frameIndex)); }

    /// OpenGL name of the texture of a field: 0 even, 1 odd. The same where the picture has no fields.
    uint32_t glTextureOfField(uint32_t field) const { return mTexture->getGLTexID(field); }

    /// What a frame's texture coordinates are shifted by to put its field on its lines.
    float verticalShift(int frameIndex) const;

    uint32_t getWidth() const { return mTexture->getWidth(); }
    uint32_t getFrameHeight() const { return mTexture->getHeight() * (mTexture->getIsInterlaced() ? 2 : 1); }
    float aspect() const;

private:
    uint32_t bufferOf(int frameIndex) const;
    void startProducer(uint32_t buffer);
    void uploadFromProducer(uint32_t buffer);

    std::unique_ptr<Texture> mTexture;
    PlayUpload mUpload;
    std::unique_ptr<host::ProducerThread> mProducer;
    uint32_t mProducedBuffer = 0;
};

/// A picture file as a texture of bytes, uploaded.
/// @throw std::runtime_error  as PlayPicture
std::unique_ptr<Texture> uploadedFile(const std::string& file);

#endif
