#include <fixture/GlTest.h>
#include <fixture/TexArgs.h>
#include <fixture/TextureCalls.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <functional>

namespace {

using Calls = std::vector<std::string>;
using Bytes = std::vector<uint8_t>;

Texture::TexArgs smallArgs(bool isPBO, uint32_t access) {
    Texture::TexArgs args = texArgs(20, 14);
    args.numBuffers = 2;
    args.isPBO = isPBO;
    args.isFBO = true;
    args.pboAccessType = access;
    return args;
}

Bytes hostBytes(Texture& texture, uint32_t buffer) {
    const uint8_t* const begin = texture.getAddress(buffer);
    return Bytes(begin, begin + texture.pixelBytes());
}

/// What level 0 of a buffer's texture holds, read by OpenGL directly.
Bytes textureBytes(Texture& texture, uint32_t buffer) {
    Bytes bytes(texture.pixelBytes());
    glBindTexture(GL_TEXTURE_2D, texture.getGLTexID(buffer));
    glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, texture.mIsFp16 ? GL_HALF_FLOAT : GL_UNSIGNED_BYTE,
                  bytes.data());
    glBindTexture(GL_TEXTURE_2D, 0);
    return bytes;
}

void fillBuffer(Texture& texture, uint32_t buffer, uint32_t pattern) {
    VideoTestImage::fillTexturePattern(&texture, pattern, buffer, 2, texture.mIsFp16);
}

void clearTexture(Texture& texture, uint32_t buffer) {
    const Bytes zeros(texture.pixelBytes());
    glBindTexture(GL_TEXTURE_2D, texture.getGLTexID(buffer));
    glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, static_cast<int>(texture.getWidth()),
                    static_cast<int>(texture.getHeight()), GL_RGBA,
                    texture.mIsFp16 ? GL_HALF_FLOAT : GL_UNSIGNED_BYTE, zeros.data());
    glBindTexture(GL_TEXTURE_2D, 0);
}

class TextureTransfers : public GlTest, public ::testing::WithParamInterface<bool> {
protected:
    Texture::TexArgs args(bool isPBO, uint32_t access) const {
        Texture::TexArgs result = smallArgs(isPBO, access);
        result.isFp16 = GetParam();
        return result;
    }
};

INSTANTIATE_TEST_SUITE_P(Depth, TextureTransfers, ::testing::Values(false, true),
                         [](const auto& depth) { return depth.param ? "HalfFloat" : "EightBit"; });

TEST_P(TextureTransfers, HostBufferGoesToTheTextureOfTheSecondIdentifier) {
    Texture texture(VideoTestImage::H_RAMP, args(false, GL_WRITE_ONLY));
    fillBuffer(texture, 1, VideoTestImage::DIGONAL_LINE);
    texture.copyHostBufToGLTex(0, 3);
    EXPECT_EQ(textureBytes(texture, 1), hostBytes(texture, 0));
    texture.copyHostBufToGLTex(1);
    EXPECT_EQ(textureBytes(texture, 1), hostBytes(texture, 1));
    texture.copyHostBufToGLTex(2);
    EXPECT_EQ(textureBytes(texture, 0), hostBytes(texture, 0));
}

TEST_P(TextureTransfers, HostBufferGoesThroughThePbo) {
    Texture texture(VideoTestImage::H_RAMP, args(true, GL_WRITE_ONLY));
    fillBuffer(texture, 1, VideoTestImage::DIGONAL_LINE);
    clearTexture(texture, 0);
    clearTexture(texture, 1);
    texture.copyHostBufToPBO(0);
    texture.copyHostBufToPBO(0, 3); // host buffer 0 to PBO 1
    texture.copyPBOToGLTex(1);
    EXPECT_EQ(textureBytes(texture, 1), hostBytes(texture, 0));
    texture.copyHostBufToPBO(3, 3);
    texture.copyPBOToGLTex(3, 0); // PBO 1 to texture 0
    EXPECT_EQ(textureBytes(texture, 0), hostBytes(texture, 1));
    EXPECT_EQ(textureBytes(texture, 1), hostBytes(texture, 0));
}

TEST_P(TextureTransfers, TextureComesBackThroughFboAndPbos) {
    Texture texture(VideoTestImage::COLOUR_BAR_75, args(true, GL_READ_ONLY));
    fillBuffer(texture, 1, VideoTestImage::DIGONAL_LINE);
    texture.copyHostBufToGLTex(0);
    texture.copyHostBufToGLTex(1);
    const Bytes first = hostBytes(texture, 0);
    const Bytes second = hostBytes(texture, 1);
    texture.readbackGLTexToPBO(0, 1);
    texture.readbackGLTexToPBO(1, 0);
    texture.readbackPBOToHostBuf(0);
    texture.readbackPBOToHostBuf(3);
    EXPECT_EQ(hostBytes(texture, 0), second);
    EXPECT_EQ(hostBytes(texture, 1), first);
    texture.readbackGLTexToPBO(1);
    texture.readbackPBOToHostBuf(1, 0); // PBO 1 to host buffer 0
    EXPECT_EQ(hostBytes(texture, 0), second);
}

using TextureTransferCalls = GlTest;

TEST_F(TextureTransferCalls, SequencesOfOpenGlCalls) {
    Texture upload(VideoTestImage::COMBI, smallArgs(true, GL_WRITE_ONLY));
    Texture readback(VideoTestImage::COMBI, smallArgs(true, GL_READ_ONLY));
    GlCallRecorder recorder;
    watchTextureCalls(recorder);

    upload.setColFormat(GL_BGRA);
    upload.copyHostBufToGLTex(1, 0);
    EXPECT_EQ(recorder.take(), (Calls{glCall("glBindTexture", GL_TEXTURE_2D, upload.getGLTexID(0)),
                                      glCall("glTexImage2D", GL_TEXTURE_2D, 0, GL_RGBA, 20, 14, 0, GL_BGRA,
                                             GL_UNSIGNED_BYTE, upload.getHostBufPtr(1)),
                                      glCall("glBindTexture", GL_TEXTURE_2D, 0)}));

    upload.mPboOffsets[1] = 8;
    upload.copyPBOToGLTex(1, 0);
    EXPECT_EQ(recorder.take(),
              (Calls{glCall("glBindTexture", GL_TEXTURE_2D, upload.getGLTexID(0)),
                     glCall("glBindBuffer", GL_PIXEL_UNPACK_BUFFER, upload.getPboID(1)),
                     glCall("glTexSubImage2D", GL_TEXTURE_2D, 0, 0, 0, 20, 14, GL_BGRA, GL_UNSIGNED_BYTE, 8),
                     glCall("glBindBuffer", GL_PIXEL_UNPACK_BUFFER, 0),
                     glCall("glBindTexture", GL_TEXTURE_2D, 0)}));

    readback.readbackGLTexToPBO(0, 1);
    EXPECT_EQ(recorder.take(),
              (Calls{glCall("glBindFramebufferEXT", GL_FRAMEBUFFER_EXT, readback.getFboID(0)),
                     glCall("glReadBuffer", GL_COLOR_ATTACHMENT0_EXT),
                     glCall("glBindBuffer", GL_PIXEL_PACK_BUFFER, readback.mPboOnDeviceIDs[1]),
                     glCall("glReadPixels", 0, 0, 20, 14, GL_RGBA, GL_UNSIGNED_BYTE, nullptr),
                     glCall("glBindBuffer", GL_COPY_WRITE_BUFFER, readback.getPboID(1)),
                     glCall("glCopyBufferSubData", GL_PIXEL_PACK_BUFFER, GL_COPY_WRITE_BUFFER, 0, 0, 1120),
                     glCall("glBindBuffer", GL_COPY_WRITE_BUFFER, 0),
                     glCall("glBindBuffer", GL_PIXEL_PACK_BUFFER, 0),
                     glCall("glBindFramebufferEXT", GL_FRAMEBUFFER_EXT, 0)}));
}

TEST_F(TextureTransferCalls, RefusalsComeBeforeAnyOpenGlCall) {
    Texture none(VideoTestImage::COMBI, smallArgs(false, GL_WRITE_ONLY));
    Texture upload(VideoTestImage::COMBI, smallArgs(true, GL_WRITE_ONLY));
    Texture readback(VideoTestImage::COMBI, smallArgs(true, GL_READ_ONLY));
    GlCallRecorder recorder;
    watchTextureCalls(recorder);

    const char* const noReadback = "Texture::readbackGLTexToPBO: ERROR No readback PBO in this texture\n";
    const char* const forReadback =
        "Texture::copyHostBufToPBO: ERROR The PBO of this texture is for readback\n";
    const char* const forUpload =
        "Texture::readbackPBOToHostBuf: ERROR The PBO of this texture is for upload\n";
    struct Case {
        std::function<void()> call;
        const char* message;
    };
    const Case cases[] = {
        {[&] { none.copyPBOToGLTex(0); },
         "GPUR 456: Texture::copyPBOToGLTex: ERROR No PBO in this texture\n"},
        {[&] { none.copyPBOToGLTex(0, 1); },
         "GPUR 454: Texture::copyPBOToGLTex: ERROR No PBO in this texture\n"},
        {[&] { none.copyHostBufToPBO(0, 1); },
         "GPUR 455: Texture::copyHostBufToPBO: ERROR No PBO in this texture\n"},
        {[&] { none.readbackGLTexToPBO(0); }, noReadback},
        {[&] { none.readbackGLTexToPBO(0, 1); }, noReadback},
        {[&] { upload.readbackGLTexToPBO(0); }, noReadback},
        {[&] { upload.readbackGLTexToPBO(0, 1); }, noReadback},
        {[&] { readback.copyHostBufToPBO(0); }, forReadback},
        {[&] { readback.copyHostBufToPBO(0, 1); }, forReadback},
        {[&] { upload.readbackPBOToHostBuf(0); }, forUpload},
        {[&] { upload.readbackPBOToHostBuf(0, 1); }, forUpload},
    };
    for (const Case& c : cases) {
        c.call();
        EXPECT_EQ(takeLog(), (std::vector<LogMessage>{{3, c.message}}));
        EXPECT_EQ(recorder.take(), Calls{});
    }
}

TEST_F(TextureTransferCalls, WithoutPbosTheMappingFormsFailToMap) {
    for (const uint32_t access : {uint32_t{GL_WRITE_ONLY}, uint32_t{GL_READ_ONLY}}) {
        Texture none(VideoTestImage::COMBI, smallArgs(false, access));
        const Bytes before = hostBytes(none, 1);
        const std::vector<LogMessage> expected = {
            {3, "GPUR 457: Texture::mapPbo : glMapBuffer() failed\n"},
            {3, access == GL_WRITE_ONLY ? "GPUR 458: Texture::unmapPbo(): mPboPtrs[1] = NULL\n"
                                        : "GPUR 459: Texture::unmapPbo(): mPboPtrs[1] = NULL\n"}};
        none.copyHostBufToPBO(3);
        EXPECT_EQ(takeLog(), expected);
        EXPECT_EQ(takeGlErrors(), Calls{"GL_INVALID_OPERATION"});
        none.readbackPBOToHostBuf(1, 0);
        EXPECT_EQ(takeLog(), expected);
        EXPECT_EQ(takeGlErrors(), Calls{"GL_INVALID_OPERATION"});
        EXPECT_EQ(hostBytes(none, 1), before);
    }
}

TEST_F(TextureTransferCalls, ANullHostBufferCopiesNothing) {
    Texture::TexArgs args = smallArgs(true, GL_WRITE_ONLY);
    for (const uint32_t access : {uint32_t{GL_WRITE_ONLY}, uint32_t{GL_READ_ONLY}}) {
        args.pboAccessType = access;
        Texture texture(VideoTestImage::COMBI, args);
        void* const buffer = std::exchange(texture.mHostBufPtrs[0], nullptr);
        texture.copyHostBufToGLTex(0);
        if (access == GL_WRITE_ONLY)
            texture.copyHostBufToPBO(0);
        else
            texture.readbackPBOToHostBuf(0);
        texture.mHostBufPtrs[0] = buffer;
        GLint isMapped = GL_TRUE;
        glBindBuffer(GL_COPY_READ_BUFFER, texture.getPboID(0));
        glGetBufferParameteriv(GL_COPY_READ_BUFFER, GL_BUFFER_MAPPED, &isMapped);
        glBindBuffer(GL_COPY_READ_BUFFER, 0);
        EXPECT_FALSE(isMapped);
    }
}

} // namespace
