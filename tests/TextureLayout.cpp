#include <fixture/GlTest.h>
#include <fixture/GuardedTexture.h>
#include <fixture/TexArgs.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>
#include <malloc.h>

#include <cstddef>
#include <cstring>
#include <vector>

namespace {

Texture::TexArgs smallArgs() {
    return texArgs(12, 10);
}

using TextureLayout = GlTest;

TEST_F(TextureLayout, DefaultsDescribeAnHdFrame) {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    const Texture texture(VideoTestImage::NO_TEST_PATTERN, args);
    EXPECT_EQ(texture.getWidth(), 1920U);
    EXPECT_EQ(texture.getHeight(), 1080U);
    EXPECT_EQ(texture.getPitchInPix(), 1920U);
    EXPECT_EQ(texture.getPitch(), 7680U);
    EXPECT_EQ(texture.getNumColours(), 4U);
    EXPECT_EQ(texture.getBytesPerColour(), 1U);
    EXPECT_EQ(texture.getBytePerPix(), 4U);
    EXPECT_EQ(texture.getBytesPerPixel(), 4U);
    EXPECT_EQ(texture.getNumBuffers(), 1U);
    EXPECT_EQ(texture.getColourOrder(), Texture::COL_RGBA);
    EXPECT_EQ(texture.getColFormat(), static_cast<uint32_t>(GL_RGBA));
    EXPECT_FALSE(texture.getIsMipMapped() || texture.getIsPBO() || texture.getIsInterlaced());
    EXPECT_EQ(texture.mPboAccessType, static_cast<uint32_t>(GL_WRITE_ONLY));
    EXPECT_EQ(texture.mBufAlignByte, 128U);
    EXPECT_EQ(texture.mPboAlignByte, 16U);
}

TEST_F(TextureLayout, SizesFollowFlagsAndPitch) {
    struct Case {
        const char* name;
        bool isInterlaced, isFp16, isMipMapped;
        uint32_t height, pitchInPix, bytesPerColour, bufAlign;
        uint32_t rows, bytePerPix, pitch, bufferBytes;
    };
    const Case cases[] = {
        {"progressive", false, false, false, 10, 12, 1, 128, 10, 4, 48, 512},
        {"interlaced", true, false, false, 10, 12, 1, 1, 5, 4, 48, 240},
        {"interlaced, odd height", true, false, false, 11, 12, 1, 2, 5, 4, 48, 240},
        {"half floats over a stated byte", false, true, false, 10, 12, 1, 4, 10, 8, 96, 960},
        {"half floats over stated words", false, true, false, 10, 12, 4, 128, 10, 8, 96, 1024},
        {"wide pitch", false, false, false, 10, 16, 1, 64, 10, 4, 64, 640},
        {"mip-mapped", false, false, true, 10, 12, 1, 128, 10, 4, 48, 1024},
        {"alignment 0 works as 1", false, false, false, 10, 12, 1, 0, 10, 4, 48, 480},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Texture::TexArgs args = smallArgs();
        args.isInterlaced = c.isInterlaced;
        args.isFp16 = c.isFp16;
        args.isMipMapped = c.isMipMapped;
        args.height = c.height;
        args.pitchInPix = c.pitchInPix;
        args.numBytesPerColour = c.bytesPerColour;
        args.bufAlignByte = c.bufAlign;
        Texture texture(VideoTestImage::COLOUR_MAT_WHITE, args);
        EXPECT_EQ(texture.getHeight(), c.rows);
        EXPECT_EQ(texture.getBytePerPix(), c.bytePerPix);
        EXPECT_EQ(texture.getPitch(), c.pitch);
        EXPECT_EQ(texture.hostBufBytes(), c.bufferBytes);
        EXPECT_GE(malloc_usable_size(texture.getHostBufPtr(0)), c.bufferBytes);
        const uint32_t alignment = std::max(c.bufAlign, 1U);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(texture.getHostBufPtr(0)) % alignment, 0U);
    }
}

TEST_F(TextureLayout, RoundingUpToAnAlignment) {
    Texture texture(VideoTestImage::NO_TEST_PATTERN, smallArgs());
    EXPECT_EQ(texture.ceil(0, 16), 0U);
    EXPECT_EQ(texture.ceil(16, 16), 16U);
    EXPECT_EQ(texture.ceil(17, 16), 32U);
    EXPECT_EQ(texture.ceil(100, 128), 128U);
    EXPECT_EQ(texture.ceil(5, 1), 5U);
    EXPECT_EQ(texture.ceil(0xFFFFFFFF, 16), 0U);
}

TEST_F(TextureLayout, IdentifiersAreMaskedIntoBufferNumbers) {
    Texture::TexArgs args = smallArgs();
    args.numBuffers = 4;
    args.isPBO = true;
    args.isFBO = true;
    Texture texture(VideoTestImage::COMBI, args);
    for (uint32_t id : {0U, 1U, 2U, 3U, 4U, 7U, 0xFFFFFFFEU}) {
        EXPECT_EQ(texture.getHostBufPtr(id), texture.mHostBufPtrs[id % 4]);
        EXPECT_EQ(texture.getAddress(id), texture.mHostBufPtrs[id % 4]);
        EXPECT_EQ(texture.getGLTexID(id), texture.mGLTexIDs[id % 4]);
        EXPECT_EQ(texture.getPboID(id), texture.mPboIDs[id % 4]);
        EXPECT_EQ(texture.getFboID(id), texture.mFboIDs[id % 4]);
        EXPECT_EQ(texture.getPboPtr(id), texture.mPboPtrs[id % 4]);
    }
    args.numBuffers = 0;
    Texture single(VideoTestImage::COMBI, args);
    EXPECT_EQ(single.getNumBuffers(), 1U);
    EXPECT_NE(single.getHostBufPtr(5), nullptr);
    EXPECT_EQ(single.getHostBufPtr(5), single.getHostBufPtr(0));
}

/// Rows of a host buffer, one string of bytes each.
std::vector<std::vector<uint8_t>> rowsOf(Texture& texture, uint32_t buffer) {
    std::vector<std::vector<uint8_t>> rows;
    for (uint32_t y = 0; y < texture.getHeight(); ++y) {
        const uint8_t* row = texture.getAddress(buffer) + size_t{y} * texture.getPitch();
        rows.emplace_back(row, row + size_t{texture.getWidth()} * texture.getBytePerPix());
    }
    return rows;
}

TEST_F(TextureLayout, EachBufferHoldsItsField) {
    struct Case {
        std::vector<uint32_t> fields;
        bool isInterlaced;
        bool isFp16 = false;
    };
    const Case cases[] = {{{2, 2}, false}, {{0}, true}, {{0, 1, 0, 1}, true}, {{0, 1}, true, true}};
    for (const Case& c : cases) {
        Texture::TexArgs args = smallArgs();
        args.isInterlaced = c.isInterlaced;
        args.isFp16 = c.isFp16;
        args.height = 24;
        args.width = args.pitchInPix = 64;
        args.numBuffers = static_cast<uint32_t>(c.fields.size());
        // CIRCLE differs between the two fields and the frame.
        Texture texture(VideoTestImage::CIRCLE, args);
        for (uint32_t i = 0; i < args.numBuffers; ++i) {
            Texture::TexArgs fieldArgs = args;
            fieldArgs.isInterlaced = false;
            fieldArgs.numBuffers = 1;
            fieldArgs.height = texture.getHeight();
            Texture expected(VideoTestImage::NO_TEST_PATTERN, fieldArgs);
            VideoTestImage::fillTexturePattern(&expected, VideoTestImage::CIRCLE, 0, c.fields[i], c.isFp16);
            EXPECT_EQ(rowsOf(texture, i), rowsOf(expected, 0)) << "buffer " << i;
        }
    }
}

TEST_F(TextureLayout, RectanglesAreClippedAtEveryEdge) {
    Texture::TexArgs args = smallArgs();
    args.pitchInPix = 16;
    Texture texture(VideoTestImage::COLOUR_MAT_BLACK, args);
    constexpr uint32_t BLACK = 0xFF000000;
    constexpr uint32_t COLOUR = 0x04010203;
    struct Case {
        const char* name;
        int x, y, w, h;
        int left, top, right, bottom;
    };
    const Case cases[] = {
        {"inside", 2, 3, 4, 2, 2, 3, 6, 5},
        {"past right and bottom", 10, 8, 9, 9, 10, 8, 12, 10},
        {"past left and top", -3, -2, 5, 4, 0, 0, 2, 2},
        {"all over", -100, -100, 1000, 1000, 0, 0, 12, 10},
        {"far end overflows", 11, 9, 0x7FFFFFFF, 0x7FFFFFFF, 11, 9, 12, 10},
        {"empty", 4, 4, 0, 5, 0, 0, 0, 0},
        {"negative size", 4, 4, 3, -5, 0, 0, 0, 0},
        {"outside", 12, 0, 3, 3, 0, 0, 0, 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        texture.setHostBufData(0, 0, 0, 12, 10, 0, 0, 0, 0xFF);
        texture.setHostBufData(0, c.x, c.y, c.w, c.h, 1, 2, 3, 4);
        for (int y = 0; y < 10; ++y)
            for (int x = 0; x < 12; ++x) {
                const bool isInside = x >= c.left && x < c.right && y >= c.top && y < c.bottom;
                ASSERT_EQ(texture.getHostBufData(0, x, y), isInside ? COLOUR : BLACK) << x << ',' << y;
            }
    }
    const uint8_t* firstPixelOfRow1 = texture.getAddress(0) + texture.getPitch();
    texture.setHostBufData(0, 0, 1, 1, 1, 1, 2, 3, 4);
    EXPECT_EQ(std::vector<uint8_t>(firstPixelOfRow1, firstPixelOfRow1 + 4),
              (std::vector<uint8_t>{3, 2, 1, 4}));
}

TEST_F(TextureLayout, RectanglesNeedFourBytesPerPixel) {
    Texture::TexArgs args = smallArgs();
    args.isFp16 = true;
    Texture texture(VideoTestImage::COLOUR_MAT_BLACK, args);
    const auto before = rowsOf(texture, 0);
    texture.setHostBufData(0, 0, 0, 12, 10, 1, 2, 3, 4);
    EXPECT_EQ(rowsOf(texture, 0), before);
}

TEST_F(TextureLayout, FieldShiftIsHalfAFrameLine) {
    Texture::TexArgs args = smallArgs();
    const Texture progressive(VideoTestImage::NO_TEST_PATTERN, args);
    EXPECT_EQ(progressive.getInterlacedTextureOffset(0), 0.0F);
    EXPECT_EQ(progressive.getInterlacedTextureOffset(1), 0.0F);
    args.isInterlaced = true;
    args.height = 1080;
    const Texture interlaced(VideoTestImage::NO_TEST_PATTERN, args);
    EXPECT_EQ(interlaced.getInterlacedTextureOffset(0), 0.5F / 1080.0F);
    EXPECT_EQ(interlaced.getInterlacedTextureOffset(2), 0.5F / 1080.0F);
    EXPECT_EQ(interlaced.getInterlacedTextureOffset(1), -0.5F / 1080.0F);
    EXPECT_EQ(interlaced.getInterlacedTextureOffset(-1), -0.5F / 1080.0F);
}

TEST_F(TextureLayout, AHostBufferOfTwoGigabytesIsRefused) {
    struct Case {
        const char* name;
        uint32_t height, pitchInPix, numColours, bytesPerColour;
        bool isMipMapped;
        uint32_t bufAlignByte = 128;
    };
    const Case cases[] = {
        {"2 GiB", 8192, 65536, 4, 1, false},
        {"2 GiB by the mip chain", 4096, 65536, 4, 1, true},
        {"2 GiB by the mip chain, at any address", 4096, 65536, 4, 1, true, 1},
        {"wraps to 0 in 32 bits", 65536, 65536, 4, 1, false},
        {"wraps to 0 in 64 bits", 0x80000000, 0x80000000, 4, 1, false},
        {"a pitch that wraps alone", 1, 0x40000000, 4, 1, false},
        {"bytes of a pixel that wrap", 1, 1, 0x10001, 0x10000, false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Texture::TexArgs args = smallArgs();
        args.height = c.height;
        args.pitchInPix = c.pitchInPix;
        args.numColours = c.numColours;
        args.numBytesPerColour = c.bytesPerColour;
        args.isMipMapped = c.isMipMapped;
        args.bufAlignByte = c.bufAlignByte;
        args.numBuffers = 2;
        Texture texture(VideoTestImage::COMBI, args);
        EXPECT_EQ(
            takeLog(),
            (std::vector<LogMessage>{
                {3, "GPUR 453: Texture::createTexture():: bufNum=0, Cannot allocate texture memory\n"},
                {3, "GPUR 453: Texture::createTexture():: bufNum=1, Cannot allocate texture memory\n"}}));
        EXPECT_EQ(texture.getHostBufPtr(1), nullptr);
        EXPECT_EQ(texture.getAddress(1), nullptr);
        EXPECT_EQ(texture.getHostBufData(1, 0, 0), 0U);
        texture.setHostBufData(1, 0, 0, 4, 4, 1, 2, 3, 4);
        takeGlErrors(); // some of these heights are no texture size either
    }
    Texture texture(VideoTestImage::NO_TEST_PATTERN, smallArgs());
    texture.mIsMipMapped = true;
    texture.mPitchInPix = 65536;
    texture.mPitch = 4 * texture.mPitchInPix;
    texture.mHeight = 4095;
    EXPECT_TRUE(texture.hostBufFits()) << "a line less";
}

TEST_F(TextureLayout, AFillThatDoesNotFitClearsTheBuffer) {
    struct Case {
        const char* name;
        uint32_t width, height, pitchInPix, numColours;
        bool isFp16;
    };
    const Case cases[] = {{"three components", 12, 10, 12, 3, false},
                          {"one line of three components", 12, 1, 12, 3, false},
                          {"one column of three components", 1, 10, 1, 3, false},
                          {"one pixel of three components", 1, 1, 1, 3, false},
                          {"short pitch", 12, 10, 11, 4, false},
                          {"short pitch of half floats", 12, 10, 11, 4, true}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Texture::TexArgs args = smallArgs();
        args.width = c.width;
        args.height = c.height;
        args.pitchInPix = c.pitchInPix;
        args.numColours = c.numColours;
        args.isFp16 = c.isFp16;
        args.bufAlignByte = 1;
        Texture texture(VideoTestImage::COLOUR_MAT_WHITE, args);
        const uint8_t* const begin = texture.getAddress(0);
        EXPECT_EQ(std::vector<uint8_t>(begin, begin + texture.hostBufBytes()),
                  std::vector<uint8_t>(texture.hostBufBytes(), 0));
    }
}

TEST_F(TextureLayout, ARectangleInABufferOfAShorterPitchEndsWithTheBuffer) {
    Texture::TexArgs args = smallArgs();
    args.pitchInPix = 6;
    args.bufAlignByte = 1;
    GuardedTexture guarded(args);
    guarded.texture.setHostBufData(0, 0, 0, 12, 10, 1, 2, 3, 4);
    EXPECT_EQ(guarded.texture.getHostBufData(0, 5, 9), 0x04010203U);
    const auto memory = guarded.memory();
    EXPECT_EQ(memory[memory.size() - GuardedTexture::GUARD_BYTES], GuardedTexture::UNTOUCHED);
}

} // namespace
