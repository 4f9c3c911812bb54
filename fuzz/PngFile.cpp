#include "FuzzedReader.h"

#include <FwZel/PngFile.h>

namespace {

Texture::TexArgs argsOf(uint8_t choice, uint32_t /*fileWidth*/, uint32_t /*fileHeight*/) {
    Texture::TexArgs args = FuzzedTexture::smallest();
    const bool isSmall = (choice & 1) != 0; // than most pictures
    args.width = isSmall ? 3 : 9;
    args.height = isSmall ? 2 : 7;
    args.pitchInPix = (choice & 2) != 0 ? args.width + 3 : args.width - 1;
    args.numColours = (choice & 4) != 0 ? 3 : FuzzedReader::COMPONENTS;
    args.numBytesPerColour = (choice & 8) != 0 ? 2 : 1;
    return args;
}

size_t rowBytes(const Texture& texture, uint32_t fileWidth) {
    const size_t components = std::min(size_t{fileWidth} * FuzzedReader::COMPONENTS,
                                       size_t{texture.getWidth()} * texture.getNumColours());
    return std::min<size_t>(components * texture.getBytesPerColour(), texture.getPitch());
}

constexpr FuzzedReader READER = {getWidthHeightFromPngFile, fillTextureFromPngFile, refusalOfPngFile, argsOf,
                                 rowBytes};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    READER.read(data, size);
    return 0;
}
