#include "FuzzedReader.h"

#include <fixture/TexArgs.h>

#include <FwZel/PngFile.h>

#include <algorithm>

namespace {

Texture::TexArgs argsOf(uint8_t choice, uint32_t /*fileWidth*/, uint32_t /*fileHeight*/) {
    const bool isSmall = (choice & 1) != 0; // than most pictures
    Texture::TexArgs args = isSmall ? texArgs(3, 2) : texArgs(9, 7);
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

constexpr FuzzedReader READER = {
    getWidthHeightFromPngFile, fillTextureFromPngFile, refusalOfPngFile, false, argsOf, rowBytes};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    READER.read(data, size);
    return 0;
}
