#include <FwZel/VideoTestImage.h>

#include <FwZel/PictureFormat.h>

void VideoTestImage::fillTextureFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                                     uint32_t shift, bool isFp16) {
    if (const PictureFormat* const format = pictureFormat(filename))
        format->fill(filename, tex, texBufIndex, fid, shift, isFp16);
}

int VideoTestImage::getWidthHeightFromFile(std::string fname, uint32_t* width, uint32_t* height,
                                           uint32_t* bytePerCol) {
    const PictureFormat* const format = pictureFormat(fname);
    return format != nullptr ? format->readSize(fname, width, height, bytePerCol) : 0;
}
