#include <FwZel/PpmFile.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <fixture/GlTest.h>
#include <fixture/GuardedTexture.h>
#include <fixture/TemporaryFile.h>
#include <fixture/TexArgs.h>

#include <cstring>

namespace {

class PpmFiles : public GlTest {};

struct PpmPicture {
    uint32_t width;
    uint32_t height;
    std::string comment = {}; // moves the pixels to another place of the file
    size_t missing = 0;       // bytes at the end

    std::string header() const {
        return "P6\n" + comment + std::to_string(width) + " " + std::to_string(height) + "\n255\n";
    }
    size_t bytes() const { return size_t{3} * width * height; }
    uint8_t sample(size_t index) const {
        const auto noise = static_cast<uint32_t>(index) * 2654435761U;
        return static_cast<uint8_t>(index + missing >= bytes() ? 0 : noise >> 24 ^ noise >> 13);
    }
    Bytes encode() const {
        Bytes file = bytesOf(header());
        for (size_t i = 0; i + missing < bytes(); ++i)
            file.push_back(sample(i));
        return file;
    }
};

struct Form {
    uint32_t bytesPerColour;
    bool isFp16;
    uint32_t shift;
};

constexpr Form EVERY_FORM[] = {{1, false, 0},  {1, true, 0},  {1, false, 1}, {1, false, 8},
                               {1, false, 32}, {2, false, 0}, {2, false, 7}, {2, false, 0xFFFFFFFF},
                               {2, true, 0},   {2, true, 5}};

uint32_t shifted(uint32_t sample, uint64_t shift) {
    return shift < 32 ? sample << shift : 0;
}

/// Component by component, from the definition.
Bytes expectedMemory(const PpmPicture& picture, const GuardedTexture& guarded, uint32_t fid,
                     const Form& form) {
    const Texture& texture = guarded.texture;
    const bool isField = texture.getIsInterlaced() && fid < 2;
    Bytes memory = guarded.untouched();
    for (uint32_t y = 0; y < texture.getHeight(); ++y) {
        const uint32_t fileRow = isField ? 2 * y + fid : y;
        for (uint32_t i = 0; fileRow < picture.height && i < 4 * picture.width; ++i) {
            const size_t from = 3 * (size_t{fileRow} * picture.width + i / 4) + i % 4;
            const uint8_t sample = i % 4 == 3 ? uint8_t{0xFF} : picture.sample(from);
            uint32_t component = sample;
            if (form.bytesPerColour == 1 && i % 4 != 3)
                component = shifted(sample, form.shift);
            else if (form.bytesPerColour == 2)
                component = form.isFp16 ? VideoTestImage::uint8ToFp16(sample)
                                        : shifted(sample, uint64_t{form.shift} + 8);
            const size_t element = size_t{y} * texture.getPitchInPix() * 4 + i;
            std::memcpy(&memory[GuardedTexture::GUARD_BYTES + element * form.bytesPerColour], &component,
                        form.bytesPerColour);
        }
    }
    return memory;
}

Texture::TexArgs argsOf(uint32_t width, uint32_t height, const Form& form = {1, false, 0}) {
    Texture::TexArgs args = texArgs(width, height);
    args.numBytesPerColour = form.bytesPerColour;
    return args;
}

void fill(const TemporaryFile& file, GuardedTexture& guarded, uint32_t fid, const Form& form) {
    guarded.reset();
    VideoTestImage::fillTextureFile(file.path(), &guarded.texture, 0, fid, form.shift, form.isFp16);
}

TEST_F(PpmFiles, EveryComponentFormAndFieldIsAsDefined) {
    const TemporaryFile file("picture.ppm");
    for (const PpmPicture& picture : {PpmPicture{13, 11}, PpmPicture{1, 1}, PpmPicture{64, 5}}) {
        file.write(picture.encode());
        for (const Form& form : EVERY_FORM) {
            auto same = argsOf(picture.width, picture.height, form);
            auto widePitch = same;
            widePitch.pitchInPix += 5;
            auto interlaced = same;
            interlaced.isInterlaced = true;
            const auto shorter = argsOf(picture.width, (picture.height + 1) / 2, form);
            auto taller = argsOf(picture.width, 2 * picture.height + 6, form);
            taller.isInterlaced = true;
            for (const auto& args : {same, widePitch, interlaced, shorter, taller}) {
                GuardedTexture guarded(args);
                for (const uint32_t fid : {0U, 1U, 2U}) {
                    SCOPED_TRACE(std::to_string(picture.width) + " x " + std::to_string(picture.height) +
                                 ", texture height " + std::to_string(guarded.texture.getHeight()) + ", " +
                                 std::to_string(form.bytesPerColour) + " bytes, shift " +
                                 std::to_string(form.shift) + (form.isFp16 ? ", half, fid " : ", fid ") +
                                 std::to_string(fid));
                    fill(file, guarded, fid, form);
                    ASSERT_EQ(guarded.memory(), expectedMemory(picture, guarded, fid, form));
                }
            }
        }
    }
}

// Pieces of the file end within rows and within pixels, at places that the length of the header moves.
TEST_F(PpmFiles, PicturesOfManyPiecesComeWhole) {
    const TemporaryFile file("picture.ppm");
    for (const size_t commentLength : {size_t{0}, size_t{1}, size_t{2}, size_t{100}}) {
        const std::string comment = commentLength == 0 ? "" : "#" + std::string(commentLength, 'x') + "\n";
        for (const PpmPicture& picture : {PpmPicture{1021, 260, comment}, PpmPicture{50001, 7, comment},
                                          PpmPicture{50001, 7, comment, 400000}}) {
            SCOPED_TRACE(picture.header());
            file.write(picture.encode());
            auto args = argsOf(picture.width, picture.height);
            for (const bool isInterlaced : {false, true}) {
                args.isInterlaced = isInterlaced;
                GuardedTexture guarded(args);
                fill(file, guarded, 1, EVERY_FORM[0]);
                ASSERT_TRUE(guarded.memory() == expectedMemory(picture, guarded, 1, EVERY_FORM[0]));
            }
        }
    }
}

TEST_F(PpmFiles, WhatAShortFileLacksIsOpaqueBlack) {
    const TemporaryFile file("picture.ppm");
    PpmPicture picture = {5, 4};
    GuardedTexture guarded(argsOf(5, 4));
    for (; picture.missing <= picture.bytes(); ++picture.missing) {
        SCOPED_TRACE(picture.missing);
        file.write(picture.encode());
        fill(file, guarded, 2, EVERY_FORM[0]);
        ASSERT_EQ(guarded.memory(), expectedMemory(picture, guarded, 2, EVERY_FORM[0]));
    }
    // Cut within the header: the maximum value may be missing, but not a digit of the size.
    const std::string header = picture.header();
    for (size_t size = 0; size < header.size(); ++size) {
        SCOPED_TRACE(size);
        file.write(bytesOf(header.substr(0, size)));
        fill(file, guarded, 2, EVERY_FORM[0]);
        const bool isSizeThere = size >= std::string("P6\n5 4").size();
        ASSERT_EQ(guarded.memory(),
                  isSizeThere ? expectedMemory(picture, guarded, 2, EVERY_FORM[0]) : guarded.untouched());
    }
}

TEST_F(PpmFiles, RefusedFilesAndTexturesLeaveTheBufferAlone) {
    const TemporaryFile file("picture.ppm");
    const auto isLeftAlone = [&file](const Texture::TexArgs& args, const std::string& content) {
        file.write(bytesOf(content));
        GuardedTexture guarded(args);
        fillTextureFromPpmFile(file.path(), &guarded.texture, 0, 2, 0, false);
        return guarded.memory() == guarded.untouched();
    };
    const std::string good = "P6\n4 2\n255\nabcdefghijklmnopqrstuvwx";
    EXPECT_FALSE(isLeftAlone(argsOf(4, 2), good));
    EXPECT_TRUE(isLeftAlone(argsOf(5, 2), good)) << "another width";
    EXPECT_TRUE(isLeftAlone(argsOf(3, 2), good)) << "another width";
    EXPECT_TRUE(isLeftAlone(argsOf(4, 2, {4, false, 0}), good)) << "four bytes per colour";
    EXPECT_TRUE(isLeftAlone(argsOf(4, 2), "P3" + good.substr(2))) << "another magic";
    EXPECT_TRUE(isLeftAlone(argsOf(4, 2), "#" + std::string(255, 'x') + "\n" + good)) << "line too long";
    EXPECT_TRUE(isLeftAlone(argsOf(65536, 1), "P6\n65536 65536\n255\n")) << "2^32 pixels";
    auto threeColours = argsOf(4, 2);
    threeColours.numColours = 3;
    EXPECT_TRUE(isLeftAlone(threeColours, good)) << "no room for four components";
    auto shortPitch = argsOf(4, 2);
    shortPitch.pitchInPix = 3;
    EXPECT_TRUE(isLeftAlone(shortPitch, good)) << "a pitch shorter than the width";

    GuardedTexture withoutBuffer(argsOf(4, 2));
    withoutBuffer.texture.mHostBufPtrs[0] = nullptr;
    file.write(bytesOf(good));
    fillTextureFromPpmFile(file.path(), &withoutBuffer.texture, 0, 2, 0, false);
}

TEST_F(PpmFiles, NoHeaderMakesTheFillWritePastTheBuffer) {
    const TemporaryFile file("picture.ppm");
    const PpmPicture picture = {5, 4};
    const Bytes whole = picture.encode();
    GuardedTexture guarded(argsOf(5, 4));
    const Bytes full = expectedMemory(picture, guarded, 2, EVERY_FORM[0]);
    for (size_t at = 0; at < picture.header().size(); ++at) {
        for (const int value :
             {0, int{'\n'}, int{' '}, int{'#'}, int{'-'}, int{'0'}, int{'6'}, int{'9'}, 255}) {
            SCOPED_TRACE("byte " + std::to_string(at) + " is " + std::to_string(value));
            Bytes changed = whole;
            changed[at] = static_cast<uint8_t>(value);
            file.write(changed);
            fill(file, guarded, 2, EVERY_FORM[0]);
            const Bytes& memory = guarded.memory();
            const size_t guard = GuardedTexture::GUARD_BYTES;
            ASSERT_EQ(std::memcmp(memory.data(), full.data(), guard), 0);
            ASSERT_EQ(std::memcmp(memory.data() + memory.size() - guard, full.data(), guard), 0);
        }
    }
}

} // namespace
