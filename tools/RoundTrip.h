#ifndef TOOLS_ROUNDTRIP_H
#define TOOLS_ROUNDTRIP_H

#include <FwZel/Texture.h>

#include <cstdint>
#include <string>
#include <vector>

/// A picture on its way to the GPU and back: built as a texture, uploaded, copied on the GPU into a readback
/// texture of the same format, read back into host memory, and compared there with what went up. There are
/// two textures because the direction of a texture's PBOs is fixed when it is built.
///
/// Each step waits until OpenGL has done its work, and throws std::runtime_error if OpenGL reports an error.
///
/// Thread: the render thread, with a context current that has every host::GlFeature.
class RoundTrip {
public:
    /// A picture file, or a test pattern where the file name is empty.
    struct Source {
        std::string file;
        uint32_t pattern = 0;
        uint32_t width = 0;        ///< pixels; of a pattern
        uint32_t height = 0;       ///< lines of the whole frame; of a pattern
        bool isInterlaced = false; ///< two buffers with a field each
        bool isFp16 = false;
    };

    /// Builds both textures.
    /// @throw std::runtime_error  the file is refused, or the textures cannot be had in full
    explicit RoundTrip(const Source& source);

    uint32_t getWidth() const { return mUpload.getWidth(); }
    /// Lines of the frame that the buffers hold together.
    uint32_t getHeight() const { return mUpload.getHeight() * mUpload.getNumBuffers(); }

    /// Overwrites the contents of both textures and of the readback buffers, so that nothing which an earlier
    /// upload left there can pass for the result of the next one.
    void wipe();

    /// Host buffers to textures.
    void uploadFromHostBuffers();

    /// Pixel buffers to textures, after another thread has written the picture into the mapped pixel buffers.
    void uploadFromProducerThread();

    /// Textures to readback textures.
    void copyOnGpu();

    /// Readback textures to host buffers.
    void readBack();

    /// Empty when every byte came back as it went up, else where the first other one lies.
    std::string difference();

    /// What came back, fields woven into a frame, in bytes r, g, b, a; half floats become the codes that they
    /// were made from.
    std::vector<unsigned char> frame();

private:
    void throwIfIncomplete(const Source& source);
    size_t bufferBytes() const { return size_t{mUpload.getHeight()} * mUpload.getPitch(); }

    Texture mUpload;
    Texture mReadback;
};

#endif
