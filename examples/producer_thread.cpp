// A new picture every frame: a producer thread writes one while the render thread draws the one before.

#include <GlErrors.h>
#include <GlRequirements.h>
#include <HeadlessContext.h>

#include <FwZel/Texture.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <future>
#include <stdexcept>

namespace {

constexpr uint32_t WIDTH = 640, HEIGHT = 360, BAR_WIDTH = 32, NUM_FRAMES = 20;

/// On a producer's thread, here a new one each frame: writes a white bar that moves right.
void produce(Texture& texture, uint32_t frame) {
    using Image = VideoTestImage;
    auto* const pixels = static_cast<unsigned char*>(texture.getAlignedPboPtr(frame));
    Image::fillTestPattern(pixels, Image::COL_RGBA, WIDTH, HEIGHT, WIDTH, Image::COLOUR_MAT_BLACK, 2, 0, 0,
                           WIDTH, HEIGHT, false);
    Image::fillTestPattern(pixels, Image::COL_RGBA, WIDTH, HEIGHT, WIDTH, Image::COLOUR_MAT_WHITE, 2,
                           frame * BAR_WIDTH, 0, BAR_WIDTH, HEIGHT, false);
}

/// On the render thread: draws a frame and tells where the bar stands in it.
void draw(const Texture& texture, VertexListPlane& plane, uint32_t frame) {
    glBindTexture(GL_TEXTURE_2D, texture.getGLTexID(frame));
    plane.render();
    std::array<unsigned char, WIDTH> line = {};
    glReadPixels(0, HEIGHT / 2, WIDTH, 1, GL_RED, GL_UNSIGNED_BYTE, line.data());
    std::printf("frame %u: bar at %td\n", frame, std::find(line.begin(), line.end(), 255) - line.begin());
}

} // namespace

int main() try {
    const host::HeadlessContext context;
    host::requireGlFeatures(
        {host::GlFeature::TEXTURES, host::GlFeature::FRAMEBUFFERS, host::GlFeature::UPLOAD_BUFFERS});
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = args.pitchInPix = WIDTH;
    args.height = HEIGHT;
    args.isFBO = true;
    const Texture target(VideoTestImage::NO_TEST_PATTERN, args);
    args.isPBO = true;
    args.numBuffers = 2; // one is written while the other is drawn; a frame number alternates between them
    Texture texture(VideoTestImage::NO_TEST_PATTERN, args);
    VertexListPlane plane(1, 1, 1.0F, nullptr);
    glViewport(0, 0, WIDTH, HEIGHT);
    glEnable(GL_TEXTURE_2D);
    glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_REPLACE);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, target.getFboID(0));
    for (uint32_t frame = 0; frame < NUM_FRAMES; ++frame) {
        texture.mapPbo(frame);
        if (!texture.getPboPtr(frame))
            throw std::runtime_error("a pixel buffer cannot be mapped");
        const auto written = std::async(std::launch::async, produce, std::ref(texture), frame);
        if (frame > 0)
            draw(texture, plane, frame - 1);
        written.wait();
        texture.unmapPbo(frame);
        texture.copyPBOToGLTex(frame);
    }
    draw(texture, plane, NUM_FRAMES - 1);
    for (const std::string& error : host::takeGlErrors())
        throw std::runtime_error("OpenGL reports " + error);
} catch (const std::exception& error) {
    std::fprintf(stderr, "producer_thread: %s\n", error.what());
    return 1;
}
