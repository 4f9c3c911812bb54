#include <fixture/GlTest.h>
#include <fixture/TexArgs.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <cstdint>
#include <cstring>
#include <utility>
#include <vector>

namespace {

using Image = VideoTestImage;
using Bytes = std::vector<unsigned char>;

constexpr uint32_t WIDTH = 61;
constexpr uint32_t HEIGHT = 23;
constexpr uint32_t PITCH = 67;

Texture::TexArgs arguments(bool isFp16 = false) {
    Texture::TexArgs args = texArgs(WIDTH, HEIGHT);
    args.pitchInPix = PITCH;
    args.numBuffers = 2;
    args.isFp16 = isFp16;
    return args;
}

/// A texture whose host buffers hold a known background.
class FilledTexture : public Texture {
public:
    explicit FilledTexture(const TexArgs& args) : Texture(Image::NO_TEST_PATTERN, args) {
        for (uint32_t i = 0; i < getNumBuffers(); ++i)
            std::memset(getAddress(i), 0xE7, bytes());
    }
    size_t bytes() const { return size_t{getPitch()} * getHeight(); }
    Bytes contents(uint32_t buffer) { return {getAddress(buffer), getAddress(buffer) + bytes()}; }
};

class TextureFillers : public GlTest {};

TEST_F(TextureFillers, ARegionOfAPatternShowsThePartOfThePictureUnderIt) {
    for (const bool isFp16 : {false, true}) {
        FilledTexture whole(arguments(isFp16));
        FilledTexture region(arguments(isFp16));
        const Bytes background = region.contents(0);
        Image::fillTexturePattern(&whole, Image::CIRCLE, 1, 1, isFp16);
        Image::fillTexturePattern(&region, Image::CIRCLE, 29, 9, 5, 7, 3, 1, isFp16); // buffer 3 is buffer 1
        EXPECT_EQ(region.contents(0), background);

        Bytes expected = background;
        const Bytes picture = whole.contents(1);
        const size_t pixel = isFp16 ? 8 : 4;
        for (size_t y = 9; y < 9 + 7; ++y)
            std::memcpy(&expected[(y * PITCH + 29) * pixel], &picture[(y * PITCH + 29) * pixel], 5 * pixel);
        EXPECT_EQ(region.contents(1), expected) << "half floats: " << isFp16;
    }
}

TEST_F(TextureFillers, AWholePatternIsTheRawFillInTheTexturesOrder) {
    FilledTexture texture(arguments());
    texture.mColourOrder = Image::COL_BARG;
    Bytes expected = texture.contents(0);
    Image::fillTestPattern(expected.data(), Image::COL_BARG, WIDTH, HEIGHT, PITCH, Image::COLOUR_BAR_75, 2, 0,
                           0, WIDTH, HEIGHT, false);
    Image::fillTexturePattern(&texture, Image::COLOUR_BAR_75, 2, 2, false);
    EXPECT_EQ(texture.contents(0), expected);
}

/// The colour on the lines that a field identifier chooses, pixel by pixel.
void colourSlowly(Bytes& bytes, const unsigned char* colour, uint32_t posX, uint32_t posY, uint32_t sizeX,
                  uint32_t sizeY, uint32_t fid) {
    const uint32_t lines = fid == 2 ? sizeY : sizeY / 2;
    for (uint32_t i = 0; i < lines; ++i) {
        const uint32_t y = fid == 2 ? posY + i : posY + 2 * i + (fid == 1 ? 1 : 0);
        for (uint32_t x = posX; x < posX + sizeX; ++x)
            std::memcpy(&bytes[(y * PITCH + x) * 4], colour, 4);
    }
}

TEST_F(TextureFillers, AColourGoesToEveryBufferOnTheLinesOfItsField) {
    for (const uint32_t fid : {0U, 1U, 2U, 3U})
        for (const uint32_t sizeY : {1U, 8U, 9U}) {
            FilledTexture texture(arguments());
            Bytes expected = texture.contents(0);
            const unsigned char colour[] = {16, 235, 128, 255};
            colourSlowly(expected, colour, 3, 5, 50, sizeY, fid);
            Image::fillTextureColour(&texture, 256 + 16, 235, 128, 255, 3, 5, 50, sizeY, fid);
            EXPECT_EQ(texture.contents(0), expected) << "field " << fid << ", " << sizeY << " lines";
            EXPECT_EQ(texture.contents(1), expected) << "field " << fid << ", " << sizeY << " lines";
        }
}

TEST_F(TextureFillers, AColourFollowsTheTexturesOrderAndPassesOverNullBuffers) {
    const unsigned char inOrder[][4] = {{4, 1, 2, 3}, {1, 2, 3, 4}, {4, 3, 2, 1}, {3, 4, 1, 2}, {3, 4, 1, 2}};
    for (const uint32_t order : {0U, 1U, 2U, 3U, 4U}) {
        FilledTexture texture(arguments());
        texture.mColourOrder = order;
        Bytes expected = texture.contents(1);
        colourSlowly(expected, inOrder[order], 0, 0, WIDTH, HEIGHT, 2);
        void* const buffer = std::exchange(texture.mHostBufPtrs[0], nullptr);
        Image::fillTextureColour(&texture, 1, 2, 3, 4, 2);
        Image::fillTexturePattern(&texture, Image::H_RAMP, 0, 2, false);
        texture.mHostBufPtrs[0] = buffer;
        EXPECT_EQ(texture.contents(1), expected) << "order " << order;
    }
}

TEST_F(TextureFillers, AColourOnAnotherPixelLayoutIsRefusedOnce) {
    FilledTexture texture(arguments(true));
    const Bytes background = texture.contents(0);
    Image::fillTextureColour(&texture, 1, 2, 3, 4, 2);
    EXPECT_EQ(texture.contents(0), background);
    EXPECT_EQ(takeLog(),
              (std::vector<LogMessage>{{3, "VideoTestImage::fillTextureColourPartial(): numColours=4 or "
                                           "numBytesPerColour=2 is not supported!!, Does nothing\n"}}));
}

} // namespace
