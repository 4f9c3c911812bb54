#include "FuzzedFile.h"
#include "FuzzedTexture.h"

#include <FwZel/PictureSize.h>
#include <FwZel/PpmFile.h>

// Any bytes as a PPM file: its size, and a fill or why it is refused. The last byte chooses the texture and
// the field.

namespace {

constexpr uint32_t COMPONENTS = 4;
constexpr uint32_t LARGEST = 64; // a texture of the file's own size is made up to here

Texture::TexArgs argsOf(uint8_t choice, uint32_t fileWidth, uint32_t fileHeight) {
    Texture::TexArgs args = FuzzedTexture::smallest();
    if (fileWidth <= LARGEST)
        args.width = fileWidth;
    args.height = fileHeight <= LARGEST && (choice & 1) != 0 ? fileHeight : 9;
    args.pitchInPix = args.width + (choice >> 1 & 1);
    args.numBytesPerColour = (choice & 4) != 0 ? 2 : 1;
    args.isInterlaced = (choice & 8) != 0;
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
    const bool hasSize = getWidthHeightFromPpmFile(file.path(), &width, &height, &bytesPerColour) == 0;
    const bool isAccepted = hasSize && width > 0 && height > 0 && pictureFits(width, height, COMPONENTS);
    require(!hasSize || bytesPerColour == 1 || bytesPerColour == 2);

    const uint8_t choice = size > 0 ? data[size - 1] : 0;
    if (choice >= 128) {
        require(refusalOfPpmFile(file.path()).empty() == isAccepted);
        return 0;
    }
    fuzzed.describeAs(argsOf(choice, width, height));
    const Texture& texture = fuzzed.texture();
    fillTextureFromPpmFile(file.path(), &fuzzed.texture(), 0, choice >> 4 & 3, choice >> 2 & 3,
                           (choice & 64) != 0);
    if (!isAccepted || width != texture.getWidth())
        require(fuzzed.isUntouched());
    else
        require(fuzzed.isUntouchedBut(size_t{width} * texture.getBytesPerPixel()));
    return 0;
}
