#include "RoundTrip.h"

#include <GlErrors.h>

#include <FwZel/PictureRefusal.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <stdexcept>
#include <thread>

namespace {

Texture::TexArgs describeUpload(const RoundTrip::Source& source) {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = source.width;
    args.height = source.height;
    args.pitchInPix = source.width;
    args.isInterlaced = source.isInterlaced;
    args.numBuffers = source.isInterlaced ? 2 : 1;
    args.isFp16 = source.isFp16;
    args.isPBO = true;
    args.isFBO = true;
    return args;
}

/// As the texture that is to be read back, whose size a file may have given.
Texture::TexArgs describeReadback(const RoundTrip::Source& source, const Texture& upload) {
    Texture::TexArgs args = describeUpload(source);
    args.width = upload.getWidth();
    args.height = upload.getHeight() * upload.getNumBuffers();
    args.pitchInPix = upload.getWidth();
    args.pboAccessType = GL_READ_ONLY;
    return args;
}

/// A texture of a file that no reader takes is black and says nothing, so the reason is asked for first.
Texture buildUpload(const RoundTrip::Source& source) {
    if (source.file.empty())
        return Texture(source.pattern, describeUpload(source));
    const std::string refusal = pictureRefusal(source.file);
    if (!refusal.empty())
        throw std::runtime_error(source.file + ": " + refusal);
    return Texture(source.file, describeUpload(source));
}

void finish(const std::string& step) {
    glFinish();
    const std::vector<std::string> errors = host::takeGlErrors();
    if (!errors.empty())
        throw std::runtime_error(step + ": OpenGL reports " + errors.front());
}

bool isComplete(Texture& texture, uint32_t buffer) {
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, texture.getFboID(buffer));
    const GLenum status = glCheckFramebufferStatusEXT(GL_FRAMEBUFFER_EXT);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
    return texture.getHostBufPtr(buffer) && status == GL_FRAMEBUFFER_COMPLETE_EXT;
}

/// The byte that a half float of the library's encoder was made from.
unsigned char byteOf(uint16_t half) {
    static const std::array<uint16_t, 256> halves = [] {
        std::array<uint16_t, 256> table = {};
        for (size_t code = 0; code < table.size(); ++code)
            table[code] = VideoTestImage::uint8ToFp16(static_cast<uint8_t>(code));
        return table;
    }();
    const auto next = std::upper_bound(halves.begin() + 1, halves.end(), half);
    return static_cast<unsigned char>(next - halves.begin() - 1);
}

} // namespace

RoundTrip::RoundTrip(const Source& source)
    : mUpload(buildUpload(source)),
      mReadback(VideoTestImage::NO_TEST_PATTERN, describeReadback(source, mUpload)) {
    finish("building textures");
    throwIfIncomplete(source);
}

void RoundTrip::throwIfIncomplete(const Source& source) {
    if (mUpload.getHeight() == 0)
        throw std::runtime_error(source.file + ": a field of a one-line picture has no lines");
    for (uint32_t buffer = 0; buffer < mUpload.getNumBuffers(); ++buffer)
        if (!isComplete(mUpload, buffer) || !isComplete(mReadback, buffer))
            throw std::runtime_error("no memory or no framebuffer for a texture of " +
                                     std::to_string(getWidth()) + " x " + std::to_string(getHeight()));
}

void RoundTrip::wipe() {
    glClearColor(0.125F, 0.375F, 0.625F, 0.875F);
    for (Texture* const texture : {&mUpload, &mReadback})
        for (uint32_t buffer = 0; buffer < texture->getNumBuffers(); ++buffer) {
            glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, texture->getFboID(buffer));
            glClear(GL_COLOR_BUFFER_BIT);
        }
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
    readBack();
}

void RoundTrip::uploadFromHostBuffers() {
    for (uint32_t buffer = 0; buffer < mUpload.getNumBuffers(); ++buffer)
        mUpload.copyHostBufToGLTex(buffer);
    finish("upload from host buffers");
}

void RoundTrip::uploadFromProducerThread() {
    const uint32_t numBuffers = mUpload.getNumBuffers();
    for (uint32_t buffer = 0; buffer < numBuffers; ++buffer)
        mUpload.mapPbo(buffer);
    std::thread producer([&] {
        for (uint32_t buffer = 0; buffer < numBuffers; ++buffer)
            if (mUpload.getPboPtr(buffer))
                std::memcpy(mUpload.getAlignedPboPtr(buffer), mUpload.getHostBufPtr(buffer), bufferBytes());
    });
    producer.join();
    for (uint32_t buffer = 0; buffer < numBuffers; ++buffer) {
        mUpload.unmapPbo(buffer);
        mUpload.copyPBOToGLTex(buffer);
    }
    finish("upload from a producer thread");
}

void RoundTrip::copyOnGpu() {
    const auto width = static_cast<GLint>(mUpload.getWidth());
    const auto height = static_cast<GLint>(mUpload.getHeight());
    for (uint32_t buffer = 0; buffer < mUpload.getNumBuffers(); ++buffer) {
        glBindFramebufferEXT(GL_READ_FRAMEBUFFER_EXT, mUpload.getFboID(buffer));
        glBindFramebufferEXT(GL_DRAW_FRAMEBUFFER_EXT, mReadback.getFboID(buffer));
        glBlitFramebufferEXT(0, 0, width, height, 0, 0, width, height, GL_COLOR_BUFFER_BIT, GL_NEAREST);
    }
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
    finish("copy between framebuffers");
}

void RoundTrip::readBack() {
    for (uint32_t buffer = 0; buffer < mReadback.getNumBuffers(); ++buffer)
        mReadback.readbackGLTexToPBO(buffer);
    for (uint32_t buffer = 0; buffer < mReadback.getNumBuffers(); ++buffer)
        mReadback.readbackPBOToHostBuf(buffer);
    finish("readback");
}

std::string RoundTrip::difference() {
    for (uint32_t buffer = 0; buffer < mUpload.getNumBuffers(); ++buffer) {
        const unsigned char* const up = mUpload.getAddress(buffer);
        const unsigned char* const back = mReadback.getAddress(buffer);
        if (std::memcmp(up, back, bufferBytes()) == 0)
            continue;
        const auto offset = static_cast<size_t>(std::mismatch(up, up + bufferBytes(), back).first - up);
        return "buffer " + std::to_string(buffer) + ", pixel " +
               std::to_string(offset % mUpload.getPitch() / mUpload.getBytePerPix()) + ", row " +
               std::to_string(offset / mUpload.getPitch()) + ": " + std::to_string(up[offset]) +
               " came back as " + std::to_string(back[offset]);
    }
    return {};
}

std::vector<unsigned char> RoundTrip::frame() {
    const size_t rowElements = size_t{getWidth()} * mReadback.getNumColours();
    std::vector<unsigned char> pixels(rowElements * getHeight());
    for (uint32_t y = 0; y < getHeight(); ++y) {
        // One buffer holds every line, two hold every other one each.
        const uint32_t buffer = y % mReadback.getNumBuffers();
        const uint32_t line = y / mReadback.getNumBuffers();
        const unsigned char* const row = mReadback.getAddress(buffer) + size_t{line} * mReadback.getPitch();
        unsigned char* const out = pixels.data() + y * rowElements;
        if (mReadback.getBytesPerColour() == 1)
            std::copy_n(row, rowElements, out);
        else
            std::transform(reinterpret_cast<const uint16_t*>(row),
                           reinterpret_cast<const uint16_t*>(row) + rowElements, out, byteOf);
    }
    return pixels;
}
