#include <FwZel/PngFile.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <fixture/GlTest.h>
#include <fixture/GuardedTexture.h>
#include <fixture/PictureFiles.h>
#include <fixture/TexArgs.h>

#include <algorithm>
#include <cstring>

namespace {

constexpr int RGB = 2;
constexpr int RGB_ALPHA = 6;

class PngFiles : public GlTest {};

Texture::TexArgs argsOf(uint32_t width, uint32_t height, uint32_t bytesPerColour = 1) {
    Texture::TexArgs args = texArgs(width, height);
    args.numBytesPerColour = bytesPerColour;
    return args;
}

std::string describe(const PngPicture& picture, const Texture& texture, uint32_t fid) {
    return "colour type " + std::to_string(picture.colourType) + ", " + std::to_string(picture.bitDepth) +
           " bits" + (picture.isAdam7 ? ", Adam7" : "") + (picture.hasTransparentColour ? ", tRNS" : "") +
           ", " + std::to_string(picture.width) + " x " + std::to_string(picture.height) + " into " +
           std::to_string(texture.getWidth()) + " x " + std::to_string(texture.getHeight()) + " x " +
           std::to_string(texture.getNumColours()) + " of " + std::to_string(texture.getBytesPerColour()) +
           " bytes, pitch " + std::to_string(texture.getPitch()) + ", fid " + std::to_string(fid);
}

/// Component by component: what a reader writes of the picture, nothing where it writes nothing.
Bytes expectedMemory(const PngPicture& picture, const GuardedTexture& guarded, uint32_t fid) {
    const Texture& texture = guarded.texture;
    const uint32_t bytes = texture.getBytesPerColour();
    const uint32_t components = std::min(
        {4 * picture.width, texture.getWidth() * texture.getNumColours(), texture.getPitch() / bytes});
    Bytes memory = guarded.untouched();
    for (uint32_t y = 0; y < texture.getHeight(); ++y) {
        const uint32_t fileRow = fid > 1 ? y : 2 * y + fid;
        for (uint32_t i = 0; fileRow < picture.height && i < components; ++i) {
            const uint8_t sample = picture.rgba(i / 4, fileRow)[i % 4];
            const uint16_t component = bytes == 1 ? sample : VideoTestImage::uint8ToFp16(sample);
            const size_t at =
                GuardedTexture::GUARD_BYTES + size_t{y} * texture.getPitch() + size_t{i} * bytes;
            std::memcpy(&memory[at], &component, bytes);
        }
    }
    return memory;
}

std::vector<PngPicture> everyKindOfPicture() {
    std::vector<PngPicture> pictures;
    for (const auto& [width, height] : {std::pair{13U, 11U}, {1U, 9U}, {40U, 3U}}) {
        for (const int colourType : {RGB, RGB_ALPHA}) {
            for (const int bitDepth : {8, 16}) {
                for (const bool isAdam7 : {false, true}) {
                    pictures.push_back({width, height, colourType, bitDepth, isAdam7, false});
                    if (colourType == RGB)
                        pictures.push_back({width, height, colourType, bitDepth, isAdam7, true});
                }
            }
        }
    }
    return pictures;
}

std::vector<Texture::TexArgs> everyKindOfTexture() {
    std::vector<Texture::TexArgs> all;
    for (const uint32_t bytesPerColour : {1U, 2U}) {
        const auto same = argsOf(13, 11, bytesPerColour);
        auto widePitch = same;
        widePitch.pitchInPix = 17;
        auto shortPitch = same;
        shortPitch.pitchInPix = 9;
        auto threeColours = same;
        threeColours.numColours = 3;
        auto interlaced = same;
        interlaced.isInterlaced = true;
        for (const auto& args : {same, argsOf(6, 4, bytesPerColour), argsOf(44, 20, bytesPerColour),
                                 widePitch, shortPitch, threeColours, interlaced})
            all.push_back(args);
    }
    return all;
}

TEST_F(PngFiles, EveryKindFillsWhatPictureAndTextureHaveInCommon) {
    const TemporaryFile file("picture.png");
    for (const auto& args : everyKindOfTexture()) {
        GuardedTexture guarded(args);
        for (const auto& picture : everyKindOfPicture()) {
            file.write(picture.encode());
            for (const uint32_t fid : {0U, 1U, 2U, 3U}) {
                SCOPED_TRACE(describe(picture, guarded.texture, fid));
                guarded.reset();
                // Neither the shift nor the flag for half floats says anything here.
                VideoTestImage::fillTextureFile(file.path(), &guarded.texture, 0, fid, 3,
                                                args.numBytesPerColour == 1);
                ASSERT_EQ(guarded.memory(), expectedMemory(picture, guarded, fid));
            }
        }
    }
}

TEST_F(PngFiles, SizeIsToldBeforeTheColourTypeIsJudged) {
    const TemporaryFile file("picture.png");
    GuardedTexture guarded(argsOf(13, 11));
    struct Case {
        int colourType;
        int bitDepth;
        int result;
        uint32_t bytesPerColour;
        const char* refusal;
    };
    const Case cases[] = {
        {RGB_ALPHA, 8, 0, 1, ""},
        {RGB_ALPHA, 16, 0, 2, ""},
        {RGB, 8, 0, 1, ""},
        {RGB, 16, 0, 2, ""},
        {0, 1, -1, 77, "its colour type is grey; only RGB and RGB with alpha are read"},
        {0, 8, -1, 77, "its colour type is grey; only RGB and RGB with alpha are read"},
        {0, 16, -1, 77, "its colour type is grey; only RGB and RGB with alpha are read"},
        {3, 4, -1, 77, "its colour type is palette; only RGB and RGB with alpha are read"},
        {3, 8, -1, 77, "its colour type is palette; only RGB and RGB with alpha are read"},
        {4, 8, -1, 77, "its colour type is grey with alpha; only RGB and RGB with alpha are read"},
    };
    for (const auto& [colourType, bitDepth, result, bytesPerColour, refusal] : cases) {
        const PngPicture picture = {13, 11, colourType, bitDepth, false, false};
        SCOPED_TRACE(describe(picture, guarded.texture, 2));
        file.write(picture.encode());
        uint32_t width = 0;
        uint32_t height = 0;
        uint32_t bytes = 77;
        EXPECT_EQ(getWidthHeightFromPngFile(file.path(), &width, &height, &bytes), result);
        EXPECT_EQ(width, 13U);
        EXPECT_EQ(height, 11U);
        EXPECT_EQ(bytes, bytesPerColour);
        EXPECT_EQ(refusalOfPngFile(file.path()), refusal);
        guarded.reset();
        fillTextureFromPngFile(file.path(), &guarded.texture, 0, 2, 0, false);
        EXPECT_EQ(guarded.memory() != guarded.untouched(), result == 0);
    }
}

// A file cut off anywhere leaves whole rows of the picture, then rows that nobody touched.
TEST_F(PngFiles, TruncatedFileFillsTheRowsBeforeTheCut) {
    const PngPicture picture = {6, 7, RGB_ALPHA, 8, false, false};
    const Bytes whole = picture.encode();
    const TemporaryFile file("picture.png");
    GuardedTexture guarded(argsOf(6, 7));
    const Bytes full = expectedMemory(picture, guarded, 2);
    const size_t rowBytes = guarded.texture.getPitch();
    size_t rowsBefore = 0;
    for (size_t size = 0; size <= whole.size(); ++size) {
        SCOPED_TRACE("cut to " + std::to_string(size) + " of " + std::to_string(whole.size()) + " bytes");
        file.write(Bytes(whole.begin(), whole.begin() + static_cast<ptrdiff_t>(size)));
        guarded.reset();
        fillTextureFromPngFile(file.path(), &guarded.texture, 0, 2, 0, false);
        const Bytes& memory = guarded.memory();
        size_t rows = 0;
        while (rows < 7 && std::equal(memory.begin(),
                                      memory.begin() + static_cast<ptrdiff_t>(GuardedTexture::GUARD_BYTES +
                                                                              (rows + 1) * rowBytes),
                                      full.begin()))
            ++rows;
        Bytes expected = guarded.untouched();
        std::copy_n(full.begin(), GuardedTexture::GUARD_BYTES + rows * rowBytes, expected.begin());
        ASSERT_EQ(memory, expected);
        ASSERT_GE(rows, rowsBefore);
        rowsBefore = rows;
    }
    EXPECT_EQ(rowsBefore, 7U);
}

bool doGuardsHold(const Bytes& memory) {
    const auto isUntouched = [](uint8_t byte) { return byte == GuardedTexture::UNTOUCHED; };
    return std::all_of(memory.begin(), memory.begin() + GuardedTexture::GUARD_BYTES, isUntouched) &&
           std::all_of(memory.end() - GuardedTexture::GUARD_BYTES, memory.end(), isUntouched);
}

// Once with the check sum of the header left wrong, so that the file is refused, and once with it mended, so
// that the reader meets every size, depth, colour type and method.
TEST_F(PngFiles, NoDamagedByteMakesTheFillWritePastTheBuffer) {
    constexpr size_t HEADER_START = 8;
    constexpr size_t HEADER_END = 33;
    const TemporaryFile file("picture.png");
    GuardedTexture guarded(argsOf(5, 4, 2));
    for (const bool isAdam7 : {false, true}) {
        const Bytes whole = PngPicture{5, 4, RGB, 8, isAdam7, true}.encode();
        for (size_t at = 0; at < whole.size(); ++at) {
            for (const int change : {0x01, 0x80}) {
                SCOPED_TRACE("byte " + std::to_string(at) + " changed by " + std::to_string(change));
                Bytes damaged = whole;
                damaged[at] ^= static_cast<uint8_t>(change);
                file.write(damaged);
                guarded.reset();
                fillTextureFromPngFile(file.path(), &guarded.texture, 0, 0, 0, true);
                ASSERT_TRUE(doGuardsHold(guarded.memory()));
                if (at >= HEADER_END)
                    continue;
                ASSERT_EQ(guarded.memory(), guarded.untouched());
                ASSERT_NE(refusalOfPngFile(file.path()), "");
                if (at < HEADER_START)
                    continue;
                mendHeaderCheckSum(damaged);
                file.write(damaged);
                fillTextureFromPngFile(file.path(), &guarded.texture, 0, 1, 0, true);
                ASSERT_TRUE(doGuardsHold(guarded.memory()));
            }
        }
    }
}

TEST_F(PngFiles, PicturesOfOtherProgramsShowWhatTheirPpmShows) {
    const std::string folder = FWZEL_TEST_PICTURES;
    const auto read = [&folder](const std::string& name) {
        uint32_t width = 0;
        uint32_t height = 0;
        uint32_t bytes = 0;
        EXPECT_EQ(VideoTestImage::getWidthHeightFromFile(folder + name, &width, &height, &bytes), 0);
        GuardedTexture guarded(argsOf(width, height));
        VideoTestImage::fillTextureFile(folder + name, &guarded.texture, 0, 2, 0, false);
        return guarded.memory();
    };
    const Bytes ridge = read("ridge.ppm");
    EXPECT_EQ(ridge.size(), 4 * 23 * 15 + 2 * GuardedTexture::GUARD_BYTES);
    EXPECT_EQ(read("ridge-netpbm-adam7.png"), ridge);
    EXPECT_EQ(read("ridge-imagemagick-16bit-adam7.png"), ridge);
    EXPECT_EQ(read("ridge-imagemagick-alpha.png"), ridge);
}

TEST_F(PngFiles, NullBufferAndOtherComponentSizesAreLeftAlone) {
    const TemporaryFile file("picture.png", PngPicture().encode());
    GuardedTexture fourBytes(argsOf(13, 11, 4));
    fillTextureFromPngFile(file.path(), &fourBytes.texture, 0, 2, 0, false);
    EXPECT_EQ(fourBytes.memory(), fourBytes.untouched());

    GuardedTexture withoutBuffer(argsOf(13, 11));
    withoutBuffer.texture.mHostBufPtrs[0] = nullptr;
    fillTextureFromPngFile(file.path(), &withoutBuffer.texture, 0, 2, 0, false);
}

} // namespace
