// The smallest complete host: the log function, the application object, a context, a pattern on a plane.

#include <GlErrors.h>
#include <GlRequirements.h>
#include <HeadlessContext.h>

#include <FwZel/FwZel.h>
#include <FwZel/Texture.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>
#include <FwZel/kxsys_syslog.h>

#include <epoxy/gl.h>

#include <cstdarg>
#include <cstdio>
#include <optional>
#include <stdexcept>

/// What the library has to report. libFwZel.so does not define it: the program does, and exports it.
extern "C" __attribute__((visibility("default"))) void kxsys_syslog(int, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    std::vfprintf(stderr, format, arguments);
    va_end(arguments);
}

class SmallestHost : public FwZel {
public:
    bool onInit(int, char**) override {
        host::requireGlFeatures({host::GlFeature::TEXTURES, host::GlFeature::FRAMEBUFFERS});
        Texture::TexArgs args;
        Texture::setDefaultValue(args); // 1920 x 1080, four components of one byte
        mPattern.emplace(VideoTestImage::COLOUR_BAR_75, args);
        mPattern->copyHostBufToGLTex(0); // a texture starts undefined
        args.isFBO = true;               // without a window there is nothing else to draw into
        mFrame.emplace(VideoTestImage::NO_TEST_PATTERN, args);
        mPlane.emplace(1, 1, 1.0F, nullptr); // one cell that fills the viewport
        return mPattern->getHostBufPtr(0) != nullptr;
    }
    void onResize(int w, int h) override { glViewport(0, 0, w, h); }
    void onRender(int frameIndex) override {
        glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, mFrame->getFboID(0));
        glBindTexture(GL_TEXTURE_2D, mPattern->getGLTexID(0));
        glEnable(GL_TEXTURE_2D);
        glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_REPLACE); // not tinted by the plane's own colours
        mPlane->render();
        unsigned char pixel[4] = {};
        glReadPixels(960, 540, 1, 1, GL_RGBA, GL_UNSIGNED_BYTE, pixel);
        std::printf("frame %d: %d %d %d in the middle\n", frameIndex, pixel[0], pixel[1], pixel[2]);
    }

private:
    std::optional<Texture> mPattern, mFrame;
    std::optional<VertexListPlane> mPlane;
};

int main(int argc, char** argv) try {
    const host::HeadlessContext context; // outlives everything that is built in it
    SmallestHost application;
    if (!application.onInit(argc, argv))
        throw std::runtime_error("no memory for the pattern");
    application.onResize(1920, 1080);
    for (int frame = 0; frame < 3; ++frame)
        application.onRender(frame);
    application.onShutdown();
    for (const std::string& error : host::takeGlErrors())
        throw std::runtime_error("OpenGL reports " + error);
} catch (const std::exception& error) {
    std::fprintf(stderr, "smallest_host: %s\n", error.what());
    return 1;
}
