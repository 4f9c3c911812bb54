// A drawn frame comes back: from a texture's framebuffer through a pixel buffer into a host buffer and a PNG
// file.

#include <GlErrors.h>
#include <GlRequirements.h>
#include <HeadlessContext.h>
#include <OutputFile.h>
#include <PngWriter.h>

#include <FwZel/Texture.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <cstdio>
#include <stdexcept>

namespace {

Texture::TexArgs describe() {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = args.pitchInPix = 640;
    args.height = 360;
    return args;
}

Texture::TexArgs describeReadback() {
    Texture::TexArgs args = describe();
    args.isFBO = true;                 // to draw into
    args.isPBO = true;                 // to read through
    args.pboAccessType = GL_READ_ONLY; // which makes the pixel buffers those of a readback
    return args;
}

/// Pixel for pixel: the frame has the size of the picture, and nothing is filtered.
void draw(Texture& picture, const Texture& frame) {
    VertexListPlane plane(1, 1, 1.0F, nullptr);
    picture.setTextureFilter(0, GL_NEAREST, GL_NEAREST);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, frame.getFboID(0));
    glViewport(0, 0, static_cast<GLsizei>(frame.getWidth()), static_cast<GLsizei>(frame.getHeight()));
    glLoadIdentity();
    glScalef(1, -1, 1); // OpenGL's lowest row comes back first, so the picture is drawn on its head
    glBindTexture(GL_TEXTURE_2D, picture.getGLTexID(0));
    glEnable(GL_TEXTURE_2D);
    glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_REPLACE);
    plane.render();
}

} // namespace

int main(int argc, char** argv) try {
    if (argc != 2)
        throw std::invalid_argument("usage: readback_to_file FILE.png");
    const host::HeadlessContext context;
    host::requireGlFeatures(
        {host::GlFeature::TEXTURES, host::GlFeature::FRAMEBUFFERS, host::GlFeature::READBACK_BUFFERS});
    Texture picture(VideoTestImage::COMBI, describe());
    Texture frame(VideoTestImage::NO_TEST_PATTERN, describeReadback());
    picture.copyHostBufToGLTex(0);
    draw(picture, frame);
    frame.readbackGLTexToPBO(0);   // the GPU's part; a frame loop has other work to do meanwhile,
    frame.readbackPBOToHostBuf(0); // because this waits for it
    for (const std::string& error : host::takeGlErrors())
        throw std::runtime_error("OpenGL reports " + error);
    if (!frame.getHostBufPtr(0))
        throw std::runtime_error("no memory for the frame");
    host::OutputFile file(argv[1]);
    host::writePng(file, {frame.getAddress(0), frame.getWidth(), frame.getHeight(), frame.getPitch()},
                   host::PngPixel::RGBA8);
    file.close();
} catch (const std::exception& error) {
    std::fprintf(stderr, "readback_to_file: %s\n", error.what());
    return 1;
}
