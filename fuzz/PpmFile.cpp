#include "FuzzedReader.h"

#include <fixture/TexArgs.h>

#include <FwZel/PpmFile.h>

namespace {

constexpr uint32_t LARGEST = 64; // a texture of the file's own size is made up to here

Texture::TexArgs argsOf(uint8_t choice, uint32_t fileWidth, uint32_t fileHeight) {
    Texture::TexArgs args = texArgs(fileWidth <= LARGEST ? fileWidth : 1,
                                    fileHeight <= LARGEST && (choice & 1) != 0 ? fileHeight : 9);
    args.pitchInPix += choice >> 1 & 1;
    args.numBytesPerColour = (choice & 4) != 0 ? 2 : 1;
    args.isInterlaced = (choice & 8) != 0;
    return args;
}

size_t rowBytes(const Texture& texture, uint32_t fileWidth) {
    return fileWidth == texture.getWidth() ? size_t{fileWidth} * texture.getBytesPerPixel() : 0;
}

constexpr FuzzedReader READER = {
    getWidthHeightFromPpmFile, fillTextureFromPpmFile, refusalOfPpmFile, true, argsOf, rowBytes};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    READER.read(data, size);
    return 0;
}
