#include <fixture/GlCallRecorder.h>
#include <fixture/GlTest.h>
#include <fixture/PictureFiles.h>
#include <fixture/TexArgs.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <malloc.h>

#include <cstring>
#include <stdexcept>

namespace {

class FileTextures : public GlTest {
protected:
    // A fresh host buffer is not all zeros by chance.
    static void SetUpTestSuite() { mallopt(M_PERTURB, 0x5A); }
    static void TearDownTestSuite() { mallopt(M_PERTURB, 0); }
};

/// Describes another picture than any file of these tests holds.
Texture::TexArgs otherArgs() {
    Texture::TexArgs args = texArgs(20, 6);
    args.pitchInPix = 24;
    args.numBuffers = 4;
    return args;
}

/// The components of a pixel in a host buffer, half floats as they are.
std::vector<uint16_t> pixelOf(Texture& texture, uint32_t buffer, uint32_t x, uint32_t y) {
    const uint32_t bytes = texture.getBytesPerColour();
    std::vector<uint16_t> components(4);
    for (uint32_t c = 0; c < 4; ++c)
        std::memcpy(&components[c],
                    texture.getAddress(buffer) + size_t{y} * texture.getPitch() + (4 * x + c) * bytes, bytes);
    return components;
}

TEST_F(FileTextures, TakeTheirSizeFromTheFileAndAFieldForEachBuffer) {
    const PngPicture picture = {13, 11, 6, 16, false, false};
    const TemporaryFile file("picture.png", picture.encode());
    for (const bool isInterlaced : {false, true})
        for (const bool isFp16 : {false, true}) {
            Texture::TexArgs args = otherArgs();
            args.isInterlaced = isInterlaced;
            args.isFp16 = isFp16;
            Texture texture(file.path(), args);
            EXPECT_EQ(texture.getWidth(), 13U);
            EXPECT_EQ(texture.getPitchInPix(), 13U);
            EXPECT_EQ(texture.getPitch(), 13U * texture.getBytePerPix());
            EXPECT_EQ(texture.getBytePerPix(), isFp16 ? 8U : 4U) << "the file's 16 bits say nothing";
            ASSERT_EQ(texture.getHeight(), isInterlaced ? 5U : 11U);
            for (uint32_t buffer = 0; buffer < 4; ++buffer)
                for (uint32_t y = 0; y < texture.getHeight(); ++y)
                    for (uint32_t x = 0; x < 13; ++x) {
                        std::vector<uint16_t> expected;
                        for (const uint8_t code : picture.rgba(x, isInterlaced ? 2 * y + buffer % 2 : y))
                            expected.push_back(isFp16 ? VideoTestImage::uint8ToFp16(code) : code);
                        ASSERT_EQ(pixelOf(texture, buffer, x, y), expected)
                            << "buffer " << buffer << ", pixel " << x << ", " << y;
                    }
        }
}

TEST_F(FileTextures, TakeTheSamplesOfAPpmFileAsTheyAre) {
    const TemporaryFile file("picture.ppm", bytesOf("P6\n1 2\n255\n\x01\x02\x7F\x80\xFE\xFF"));
    for (const bool isFp16 : {false, true}) {
        Texture::TexArgs args = otherArgs();
        args.isFp16 = isFp16;
        GlCallRecorder recorder;
        recorder.watch<epoxy_glGenTextures>("glGenTextures");
        Texture texture(file.path(), args);
        EXPECT_EQ(recorder.take().size(), args.numBuffers);
        const auto expected = [isFp16](std::vector<uint16_t> pixel) {
            for (uint16_t& component : pixel)
                component = isFp16 ? VideoTestImage::uint8ToFp16(static_cast<uint8_t>(component)) : component;
            return pixel;
        };
        EXPECT_EQ(pixelOf(texture, 3, 0, 0), expected({0x01, 0x02, 0x7F, 0xFF})) << isFp16;
        EXPECT_EQ(pixelOf(texture, 3, 0, 1), expected({0x80, 0xFE, 0xFF, 0xFF})) << isFp16;
    }
}

TEST_F(FileTextures, WithoutAReadableSizeAreBlackInTheSizeAskedFor) {
    const PngPicture grey = {13, 11, 0, 8, false, false};
    const struct {
        const char* name;
        Bytes content;
    } files[] = {
        {"text.png", bytesOf("no picture")},      {"grey.png", grey.encode()},
        {"picture.PNG", PngPicture().encode()},   {"wraps.ppm", bytesOf("P6\n65536 65536\n255\n")},
        {"flat.ppm", bytesOf("P6\n12 0\n255\n")},
    };
    for (const auto& [name, content] : files) {
        SCOPED_TRACE(name);
        const TemporaryFile file(name, content);
        Texture::TexArgs args = otherArgs();
        args.isInterlaced = true;
        Texture texture(file.path(), args);
        EXPECT_EQ(texture.getWidth(), 20U);
        EXPECT_EQ(texture.getPitchInPix(), 24U);
        ASSERT_EQ(texture.getHeight(), 3U);
        for (uint32_t y = 0; y < 3; ++y)
            for (uint32_t x = 0; x < 20; ++x)
                ASSERT_EQ(pixelOf(texture, 3, x, y), (std::vector<uint16_t>{0, 0, 0, 255}));
    }
    EXPECT_THROW(Texture("png", otherArgs()), std::out_of_range);
}

TEST_F(FileTextures, HoldNoStaleMemoryWhereTheFileDeliversNothing) {
    // Large enough that libpng has rows before it meets the end.
    const Bytes whole = PngPicture{100, 60, 6, 8, false, false}.encode();
    const TemporaryFile cut("cut.png", Bytes(whole.begin(), whole.end() - ptrdiff_t{300}));
    const TemporaryFile complete("complete.png", whole);
    const TemporaryFile completePpm("complete.ppm", bytesOf("P6\n1 1\n255\n\x01\x02\x03"));
    Texture damaged(cut.path(), otherArgs());
    ASSERT_EQ(damaged.getWidth(), 100U);
    EXPECT_NE(pixelOf(damaged, 3, 0, 0), std::vector<uint16_t>(4));
    EXPECT_EQ(pixelOf(damaged, 3, 99, 59), std::vector<uint16_t>(4));

    struct Case {
        const char* name;
        uint32_t numColours, bytesPerColour;
    };
    for (const Case& c : {Case{"no room for four components", 3, 1}, Case{"no reader for the depth", 4, 4},
                          Case{"components of no bytes", 4, 0}, Case{"no components", 0, 1}}) {
        SCOPED_TRACE(c.name);
        Texture::TexArgs args = otherArgs();
        args.numColours = c.numColours;
        args.numBytesPerColour = c.bytesPerColour;
        for (const TemporaryFile* file : {&complete, &completePpm}) {
            Texture texture(file->path(), args);
            const uint8_t* const begin = texture.getAddress(1);
            EXPECT_EQ(Bytes(begin, begin + texture.hostBufBytes()), Bytes(texture.hostBufBytes()));
        }
    }
}

} // namespace
