#include "FuzzedFile.h"
#include "FuzzedTexture.h"

#include <FwZel/PictureSize.h>
#include <FwZel/PngFile.h>

// Any bytes as a PNG file: its size, and a fill or why it is refused. The last byte, which lies behind the
// end of a whole file, chooses the texture and the field; from 128 on, the words.

namespace {

constexpr uint32_t COMPONENTS = 4;

Texture::TexArgs argsOf(uint8_t choice) {
    Texture::TexArgs args = FuzzedTexture::smallest();
    const bool isSmall = (choice & 1) != 0; // than most pictures
    args.width = isSmall ? 3 : 9;
    args.height = isSmall ? 2 : 7;
    args.pitchInPix = (choice & 2) != 0 ? args.width + 3 : args.width - 1;
    args.numColours = (choice & 4) != 0 ? 3 : COMPONENTS;
    args.numBytesPerColour = (choice & 8) != 0 ? 2 : 1;
    return args;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const FuzzedFile file;
    static FuzzedTexture fuzzed;
    file.write(data, size);
    uint32_t width = 0;
    uint32_t height = 0;
    uint32_t bytesPerColour = 0;
    const bool hasSize = getWidthHeightFromPngFile(file.path(), &width, &height, &bytesPerColour) == 0;
    const bool isAccepted = hasSize && pictureFits(width, height, COMPONENTS);
    require(!hasSize || (width > 0 && height > 0 && (bytesPerColour == 1 || bytesPerColour == 2)));

    const uint8_t choice = size > 0 ? data[size - 1] : 0;
    if (choice >= 128) {
        require(refusalOfPngFile(file.path()).empty() == isAccepted);
        return 0;
    }
    fuzzed.describeAs(argsOf(choice));
    const Texture& texture = fuzzed.texture();
    fillTextureFromPngFile(file.path(), &fuzzed.texture(), 0, choice >> 4 & 3, 0, true);
    if (!isAccepted) {
        require(fuzzed.isUntouched());
        return 0;
    }
    const size_t components =
        std::min(size_t{width} * COMPONENTS, size_t{texture.getWidth()} * texture.getNumColours());
    require(fuzzed.isUntouchedBut(
        std::min<size_t>(components * texture.getBytesPerColour(), texture.getPitch())));
    return 0;
}
