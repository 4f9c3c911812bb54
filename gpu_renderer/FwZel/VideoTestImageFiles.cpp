#include <FwZel/VideoTestImage.h>

#include <FwZel/PictureFormat.h>
#include <FwZel/PngFile.h>
#include <FwZel/PpmFile.h>

void VideoTestImage::fillTextureFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                                     uint32_t shift, bool isFp16) {
    switch (pictureFormat(filename)) {
    case PictureFormat::PNG:
        fillTextureFromPngFile(filename, tex, texBufIndex, fid, shift, isFp16);
        break;
    case PictureFormat::PPM:
        fillTextureFromPpmFile(filename, tex, texBufIndex, fid, shift, isFp16);
        break;
    case PictureFormat::UNKNOWN:
        break;
    }
}

int VideoTestImage::getWidthHeightFromFile(std::string fname, uint32_t* width, uint32_t* height,
                                           uint32_t* bytePerCol) {
    switch (pictureFormat(fname)) {
    case PictureFormat::PNG:
        return getWidthHeightFromPngFile(fname, width, height, bytePerCol);
    case PictureFormat::PPM:
        return getWidthHeightFromPpmFile(fname, width, height, bytePerCol);
    case PictureFormat::UNKNOWN:
        break;
    }
    return 0;
}
