#include <fixture/GlTest.h>
#include <fixture/TexArgs.h>
#include <fixture/TextureCalls.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

namespace {

using Calls = std::vector<std::string>;

Texture::TexArgs smallArgs() {
    return texArgs(12, 10);
}

Calls& operator+=(Calls& calls, const Calls& more) {
    calls.insert(calls.end(), more.begin(), more.end());
    return calls;
}

Calls textureCreation(uint32_t name, int internal, uint32_t type) {
    return {glCall("glGenTextures", 1, &name),
            glCall("glBindTexture", GL_TEXTURE_2D, name),
            glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR),
            glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR),
            glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE),
            glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE),
            glCall("glTexImage2D", GL_TEXTURE_2D, 0, internal, 12, 10, 0, GL_RGBA, type, nullptr),
            glCall("glBindTexture", GL_TEXTURE_2D, 0)};
}

Calls bufferCreation(uint32_t target, uint32_t name, int size, uint32_t usage) {
    return {glCall("glGenBuffers", 1, &name), glCall("glBindBuffer", target, name),
            glCall("glBufferData", target, size, nullptr, usage), glCall("glBindBuffer", target, 0)};
}

Calls mapAndUnmap(uint32_t target, uint32_t alignment, uint32_t access, uint32_t name) {
    return {glCall("glBindBuffer", target, name),  glCall("glPixelStorei", alignment, 4),
            glCall("glMapBuffer", target, access), glCall("glBindBuffer", target, 0),
            glCall("glBindBuffer", target, name),  glCall("glUnmapBuffer", target),
            glCall("glBindBuffer", target, 0)};
}

class TextureObjects : public GlTest {
protected:
    void SetUp() override {
        GlTest::SetUp();
        if (!IsSkipped())
            watchTextureCalls(mRecorder);
    }

    GlCallRecorder mRecorder;
};

TEST_F(TextureObjects, APlainTextureIsOneTexture) {
    const Texture texture(VideoTestImage::COMBI, smallArgs());
    EXPECT_EQ(mRecorder.take(), textureCreation(texture.getGLTexID(0), GL_RGBA, GL_UNSIGNED_BYTE));
    EXPECT_EQ(texture.getPboID(0), 0U);
    EXPECT_EQ(texture.mPboOnDeviceIDs[0], 0U);
    EXPECT_EQ(texture.getFboID(0), 0U);
}

TEST_F(TextureObjects, UploadBuffersAreCompleteOneAfterTheOther) {
    Texture::TexArgs args = smallArgs();
    args.numBuffers = 2;
    args.isPBO = args.isFBO = args.isMipMapped = args.isFp16 = true;
    args.pboAlignByte = 32;
    const Texture texture(VideoTestImage::NO_TEST_PATTERN, args);
    Calls expected;
    for (uint32_t i : {0U, 1U}) {
        const uint32_t name = texture.getGLTexID(i);
        const uint32_t pbo = texture.getPboID(i);
        const uint32_t fbo = texture.getFboID(i);
        expected += textureCreation(name, GL_RGBA16F, GL_HALF_FLOAT);
        expected += bufferCreation(GL_PIXEL_UNPACK_BUFFER, pbo, 10 * 12 * 8 + 32, GL_STREAM_DRAW);
        expected += mapAndUnmap(GL_PIXEL_UNPACK_BUFFER, GL_UNPACK_ALIGNMENT, GL_WRITE_ONLY, pbo);
        expected += {glCall("glGenFramebuffersEXT", 1, &fbo),
                     glCall("glBindFramebufferEXT", GL_FRAMEBUFFER_EXT, fbo),
                     glCall("glFramebufferTexture2DEXT", GL_FRAMEBUFFER_EXT, GL_COLOR_ATTACHMENT0_EXT,
                            GL_TEXTURE_2D, name, 0),
                     glCall("glBindFramebufferEXT", GL_FRAMEBUFFER_EXT, 0),
                     glCall("glBindTexture", GL_TEXTURE_2D, name),
                     glCall("glGenerateMipmapEXT", GL_TEXTURE_2D),
                     glCall("glBindTexture", GL_TEXTURE_2D, 0)};
    }
    EXPECT_EQ(mRecorder.take(), expected);
}

TEST_F(TextureObjects, ReadbackHasADeviceSideAndAHostReadablePbo) {
    Texture::TexArgs args = smallArgs();
    args.isPBO = true;
    args.pboAccessType = GL_READ_WRITE; // whatever is not GL_WRITE_ONLY
    const Texture texture(VideoTestImage::NO_TEST_PATTERN, args);
    const uint32_t onDevice = texture.mPboOnDeviceIDs[0];
    Calls expected = textureCreation(texture.getGLTexID(0), GL_RGBA, GL_UNSIGNED_BYTE);
    expected += bufferCreation(GL_PIXEL_PACK_BUFFER, onDevice, 496, GL_STATIC_COPY);
    expected += bufferCreation(GL_COPY_WRITE_BUFFER, texture.getPboID(0), 496, GL_STREAM_READ);
    expected += mapAndUnmap(GL_PIXEL_PACK_BUFFER, GL_PACK_ALIGNMENT, GL_READ_ONLY, texture.getPboID(0));
    EXPECT_EQ(mRecorder.take(), expected);
}

TEST_F(TextureObjects, DestructionDeletesWhatWasAskedForBufferByBuffer) {
    const uint32_t name = 0;
    struct Case {
        bool isPBO, isFBO;
        Calls perBuffer;
    };
    const Calls textures = {glCall("glDeleteTextures", 1, &name)};
    const Calls buffers = {glCall("glDeleteBuffers", 1, &name), glCall("glDeleteBuffers", 1, &name)};
    const Calls framebuffers = {glCall("glDeleteFramebuffersEXT", 1, &name)};
    Calls all = textures;
    all += buffers;
    all += framebuffers;
    for (const Case& c : {Case{false, false, textures}, Case{true, true, all}}) {
        uint32_t texture = 0;
        uint32_t pbo = 0;
        uint32_t fbo = 0;
        {
            Texture::TexArgs args = smallArgs();
            args.numBuffers = 2;
            args.isPBO = c.isPBO;
            args.isFBO = c.isFBO;
            const Texture built(VideoTestImage::COMBI, args);
            texture = built.getGLTexID(1);
            pbo = built.getPboID(1);
            fbo = built.getFboID(1);
            mRecorder.take();
        }
        Calls expected = c.perBuffer;
        expected += c.perBuffer;
        EXPECT_EQ(mRecorder.take(), expected);
        EXPECT_FALSE(glIsTexture(texture));
        EXPECT_FALSE(glIsBuffer(pbo));
        EXPECT_FALSE(glIsFramebufferEXT(fbo));
    }
}

TEST_F(TextureObjects, FiltersAreSetMinificationFirst) {
    Texture::TexArgs args = smallArgs();
    args.numBuffers = 2;
    Texture texture(VideoTestImage::COMBI, args);
    mRecorder.take();
    texture.setTextureFilter(3, GL_NEAREST, GL_LINEAR);
    EXPECT_EQ(mRecorder.take(),
              (Calls{glCall("glBindTexture", GL_TEXTURE_2D, texture.getGLTexID(1)),
                     glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST),
                     glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR),
                     glCall("glBindTexture", GL_TEXTURE_2D, 0)}));
    texture.setTextureFilter(1);
    EXPECT_EQ(mRecorder.take()[1],
              glCall("glTexParameteri", GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR));
}

TEST_F(TextureObjects, AForeignTextureReplacesBufferZerosNameAlone) {
    uint32_t foreign = 0;
    glGenTextures(1, &foreign);
    Texture::TexArgs args = smallArgs();
    args.numBuffers = 2;
    uint32_t original = 0;
    {
        Texture texture(VideoTestImage::COMBI, args);
        original = texture.getGLTexID(0);
        const uint32_t second = texture.getGLTexID(1);
        texture.setGLTexID(foreign);
        EXPECT_EQ(texture.getGLTexID(0), foreign);
        EXPECT_EQ(texture.getGLTexID(1), second);
    }
    EXPECT_TRUE(glIsTexture(original));
    glDeleteTextures(1, &original);
}

} // namespace
