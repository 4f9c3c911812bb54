#include "HeadlessSurface.h"

#include "GlRequirements.h"

#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <chrono>
#include <stdexcept>
#include <thread>

namespace host {

namespace {

Texture::TexArgs describeTarget(uint32_t width, uint32_t height) {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = width;
    args.height = height;
    args.pitchInPix = width;
    args.isFBO = true;
    args.isPBO = true;
    args.pboAccessType = GL_READ_ONLY;
    return args;
}

} // namespace

HeadlessSurface::HeadlessSurface(uint32_t width, uint32_t height) {
    requireGlFeatures({GlFeature::TEXTURES, GlFeature::FRAMEBUFFERS, GlFeature::READBACK_BUFFERS});
    requireTextureSize(width, height);
    mTarget = std::make_unique<Texture>(VideoTestImage::NO_TEST_PATTERN, describeTarget(width, height));
    bindTarget();
    if (!mTarget->getHostBufPtr(0) ||
        glCheckFramebufferStatusEXT(GL_FRAMEBUFFER_EXT) != GL_FRAMEBUFFER_COMPLETE_EXT)
        throw std::runtime_error("no memory or no framebuffer for a surface of " + std::to_string(width) +
                                 " x " + std::to_string(height));
}

void HeadlessSurface::bindTarget() {
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, mTarget->getFboID(0));
    glViewport(0, 0, static_cast<GLsizei>(mTarget->getWidth()), static_cast<GLsizei>(mTarget->getHeight()));
}

void HeadlessSurface::readFrame(std::vector<unsigned char>& pixels) {
    mTarget->readbackGLTexToPBO(0);
    mTarget->readbackPBOToHostBuf(0);
    const size_t rowBytes = mTarget->getPitch();
    pixels.resize(rowBytes * getHeight());
    for (size_t y = 0; y < getHeight(); ++y)
        std::copy_n(mTarget->getAddress(0) + (getHeight() - 1 - y) * rowBytes, rowBytes,
                    pixels.data() + y * rowBytes);
}

void HeadlessSurface::wait(double seconds) {
    std::this_thread::sleep_for(std::chrono::duration<double>(seconds));
}

} // namespace host
