#include <FwZel/VideoTestImage.h>

#include <FwZel/Texture.h>
#include <FwZel/kxsys_syslog.h>

#include <cstddef>

namespace {

constexpr uint32_t COMPONENTS = 4;
constexpr uint32_t WHOLE_FRAME = 2;

struct Colour {
    uint32_t inMemoryOrder[COMPONENTS];
};

Colour orderedColour(uint32_t colOrder, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K) {
    switch (colOrder) {
    case VideoTestImage::COL_ARGB:
        return {{K, Cr, Y, Cb}};
    case VideoTestImage::COL_RGBA:
        return {{Cr, Y, Cb, K}};
    case VideoTestImage::COL_ABGR:
        return {{K, Cb, Y, Cr}};
    default:
        return {{Cb, K, Cr, Y}};
    }
}

bool isFourBytesPerPixel(const Texture& tex) {
    if (tex.getNumColours() == COMPONENTS && tex.getBytesPerColour() == 1)
        return true;
    kxsys_syslog(KXSYS_LOG_ERROR,
                 "VideoTestImage::fillTextureColourPartial(): numColours=%d or numBytesPerColour=%d is not "
                 "supported!!, Does nothing\n",
                 static_cast<int>(tex.getNumColours()), static_cast<int>(tex.getBytesPerColour()));
    return false;
}

} // namespace

void VideoTestImage::fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t posX, uint32_t posY,
                                        uint32_t sizeX, uint32_t sizeY, uint32_t texBufIndex, uint32_t fid,
                                        bool isFp16) {
    unsigned char* const buffer = tex->getAddress(texBufIndex);
    if (buffer == nullptr)
        return;
    fillTestPattern(buffer, tex->getColourOrder(), tex->getWidth(), tex->getHeight(), tex->getPitchInPix(),
                    pattern, fid, posX, posY, sizeX, sizeY, isFp16);
}

void VideoTestImage::fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t texBufIndex, uint32_t fid,
                                        bool isFp16) {
    fillTexturePattern(tex, pattern, 0, 0, tex->getWidth(), tex->getHeight(), texBufIndex, fid, isFp16);
}

void VideoTestImage::fillTextureColour(Texture* tex, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K,
                                       uint32_t posX, uint32_t posY, uint32_t sizeX, uint32_t sizeY,
                                       uint32_t fid) {
    if (!isFourBytesPerPixel(*tex))
        return;
    const bool isFrame = fid == WHOLE_FRAME;
    const uint32_t rows = isFrame ? sizeY : sizeY >> 1;
    const uint32_t step = isFrame ? tex->getPitch() : 2 * tex->getPitch();
    const size_t firstRow = fid == 1 ? tex->getPitch() : 0;
    Colour colour = orderedColour(tex->getColourOrder(), Cr, Y, Cb, K);
    for (uint32_t i = 0; i < tex->getNumBuffers(); ++i) {
        unsigned char* const buffer = tex->getAddress(i);
        if (buffer == nullptr)
            continue;
        unsigned char* const start = buffer + tex->getPitch() * posY + COMPONENTS * posX + firstRow;
        fillColour(start, sizeX, rows, step / COMPONENTS, colour.inMemoryOrder);
    }
}

void VideoTestImage::fillTextureColour(Texture* tex, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K,
                                       uint32_t fid) {
    fillTextureColour(tex, Cr, Y, Cb, K, 0, 0, tex->getWidth(), tex->getHeight(), fid);
}
