// Construction and transfers of textures beside the raw OpenGL calls, or beside memcpy where the driver does
// no more.

#include "BenchmarkRow.h"
#include "CameraPictures.h"

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>
#include <HeadlessContext.h>

#include <epoxy/gl.h>

#include <malloc.h>

#include <cstdlib>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

struct Format {
    const char* name;
    bool isHalf;
    size_t bytesPerPixel;
    GLint internal;
    GLenum type;
};

constexpr Format FORMATS[] = {{"8bit", false, 4, GL_RGBA, GL_UNSIGNED_BYTE},
                              {"half", true, 8, GL_RGBA16F, GL_HALF_FLOAT}};

struct Size {
    const char* name;
    uint32_t width, height;
};

constexpr Size SIZES[] = {{"1920x1080", 1920, 1080}, {"3840x2160", 3840, 2160}};

Texture::TexArgs argsOf(const Size& size, const Format& format) {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = args.pitchInPix = size.width;
    args.height = size.height;
    args.isFp16 = format.isHalf;
    return args;
}

void addCompared(const std::string& group, const Size& size, const Format& format, const Work& limit,
                 const Work& ours) {
    const std::string prefix = group + '-' + format.name + '/' + size.name;
    const size_t bytes = size_t{size.width} * size.height * format.bytesPerPixel;
    addLimit(prefix, bytes, limit);
    addRow(prefix + "/ours", bytes, ours);
}

void setParameters() {
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
}

/// A fresh buffer filled by copies of one row, and the OpenGL calls of a texture without PBOs and FBOs.
void constructByHand(const Size& size, const Format& format) {
    constexpr size_t ALIGNMENT = 128;
    const size_t pitch = size.width * format.bytesPerPixel;
    const std::unique_ptr<void, decltype(&std::free)> buffer(memalign(ALIGNMENT, pitch * size.height),
                                                             &std::free);
    const std::vector<unsigned char> row(pitch, 0x55);
    for (size_t y = 0; y < size.height; ++y)
        std::memcpy(static_cast<unsigned char*>(buffer.get()) + y * pitch, row.data(), pitch);
    GLuint name = 0;
    glGenTextures(1, &name);
    glBindTexture(GL_TEXTURE_2D, name);
    setParameters();
    glTexImage2D(GL_TEXTURE_2D, 0, format.internal, static_cast<GLsizei>(size.width),
                 static_cast<GLsizei>(size.height), 0, GL_RGBA, format.type, nullptr);
    glBindTexture(GL_TEXTURE_2D, 0);
    glDeleteTextures(1, &name);
}

void addConstruction(const Size& size, const Format& format) {
    addCompared(
        "construction", size, format, [=] { constructByHand(size, format); },
        [=] { const Texture texture(VideoTestImage::COLOUR_BAR_75, argsOf(size, format)); });
}

/// The same fresh buffer, filled by the reader alone.
void addFileConstruction(const Size& size, const Format& format) {
    const Shared<CameraPictures> pictures(
        [=] { return std::make_unique<CameraPictures>(size.width, size.height); });
    const auto add = [&](const char* group, std::string (CameraPictures::*path)() const) {
        addCompared(
            group, size, format,
            [=] {
                Texture texture(VideoTestImage::NO_TEST_PATTERN, argsOf(size, format));
                VideoTestImage::fillTextureFile(((*pictures).*path)(), &texture, 0, 2, 0, format.isHalf);
            },
            [=] { const Texture texture(((*pictures).*path)(), argsOf(size, format)); });
    };
    add("construction-png", &CameraPictures::png);
    add("construction-ppm", &CameraPictures::ppm);
}

void addUploads(const Size& size, const Format& format) {
    Texture::TexArgs args = argsOf(size, format);
    args.isPBO = true;
    const Shared<Texture> texture(
        [=] { return std::make_unique<Texture>(VideoTestImage::COLOUR_BAR_75, args); });
    const size_t bytes = size_t{size.width} * size.height * format.bytesPerPixel;
    const auto width = static_cast<GLsizei>(size.width);
    const auto height = static_cast<GLsizei>(size.height);

    addCompared(
        "transfer-host-to-texture", size, format,
        [=] {
            glBindTexture(GL_TEXTURE_2D, texture->getGLTexID(0));
            glTexImage2D(GL_TEXTURE_2D, 0, format.internal, width, height, 0, GL_RGBA, format.type,
                         texture->getHostBufPtr(0));
            glBindTexture(GL_TEXTURE_2D, 0);
        },
        [=] { texture->copyHostBufToGLTex(0); });
    addCompared(
        "transfer-host-to-pbo", size, format,
        [=] {
            glBindBuffer(GL_PIXEL_UNPACK_BUFFER, texture->getPboID(0));
            std::memcpy(glMapBuffer(GL_PIXEL_UNPACK_BUFFER, GL_WRITE_ONLY), texture->getHostBufPtr(0), bytes);
            glUnmapBuffer(GL_PIXEL_UNPACK_BUFFER);
            glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
        },
        [=] { texture->copyHostBufToPBO(0); });
    addCompared(
        "transfer-pbo-to-texture", size, format,
        [=] {
            glBindTexture(GL_TEXTURE_2D, texture->getGLTexID(0));
            glBindBuffer(GL_PIXEL_UNPACK_BUFFER, texture->getPboID(0));
            glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, width, height, GL_RGBA, format.type, nullptr);
            glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
            glBindTexture(GL_TEXTURE_2D, 0);
        },
        [=] { texture->copyPBOToGLTex(0); });
}

/// A texture with content, and the buffer on the device that its pixels pass through: both sides use the same
/// memory, since what lies in the cache decides the time of a copy.
class ReadTexture : public Texture {
public:
    explicit ReadTexture(const TexArgs& args) : Texture(VideoTestImage::COLOUR_BAR_75, args) {
        copyHostBufToGLTex(0);
        constexpr GLuint ABOVE_ALL_NAMES = 4096;
        for (GLuint name = ABOVE_ALL_NAMES; mOnDevice == 0 && --name > 0;) // the last made beside the PBO
            if (glIsBuffer(name) == GL_TRUE && name != getPboID(0))
                mOnDevice = name;
        if (mOnDevice == 0)
            throw std::runtime_error("the buffer on the device has not been found");
        readbackGLTexToPBO(0); // memory that nobody has written yet may all be one page of zeros
    }
    GLuint onDevice() const { return mOnDevice; }

private:
    GLuint mOnDevice = 0;
};

void addReadback(const Size& size, const Format& format) {
    Texture::TexArgs args = argsOf(size, format);
    args.isPBO = args.isFBO = true;
    args.pboAccessType = GL_READ_ONLY;
    const Shared<ReadTexture> texture([=] { return std::make_unique<ReadTexture>(args); });
    const size_t bytes = size_t{size.width} * size.height * format.bytesPerPixel;
    const auto width = static_cast<GLsizei>(size.width);
    const auto height = static_cast<GLsizei>(size.height);

    addCompared(
        "transfer-texture-to-pbo", size, format,
        [=] {
            glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, texture->getFboID(0));
            glReadBuffer(GL_COLOR_ATTACHMENT0_EXT);
            glBindBuffer(GL_PIXEL_PACK_BUFFER, texture->onDevice());
            glReadPixels(0, 0, width, height, GL_RGBA, format.type, nullptr);
            glBindBuffer(GL_COPY_WRITE_BUFFER, texture->getPboID(0));
            glCopyBufferSubData(GL_PIXEL_PACK_BUFFER, GL_COPY_WRITE_BUFFER, 0, 0,
                                static_cast<GLsizeiptr>(bytes));
            glBindBuffer(GL_COPY_WRITE_BUFFER, 0);
            glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
            glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
        },
        [=] { texture->readbackGLTexToPBO(0); });
    addCompared(
        "transfer-pbo-to-host", size, format,
        [=] {
            glBindBuffer(GL_PIXEL_PACK_BUFFER, texture->getPboID(0));
            std::memcpy(texture->getHostBufPtr(0), glMapBuffer(GL_PIXEL_PACK_BUFFER, GL_READ_ONLY), bytes);
            glUnmapBuffer(GL_PIXEL_PACK_BUFFER);
            glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
        },
        [=] { texture->readbackPBOToHostBuf(0); });
}

} // namespace

void addRows() {
    // Both sides of a construction get fresh pages: glibc would raise the threshold after the first large
    // buffer.
    constexpr int ONE_MIB = 1 << 20;
    mallopt(M_MMAP_THRESHOLD, ONE_MIB);
    static const host::HeadlessContext context;
    for (const Size& size : SIZES)
        for (const Format& format : FORMATS) {
            addConstruction(size, format);
            addFileConstruction(size, format);
            addUploads(size, format);
            addReadback(size, format);
        }
}
