#ifndef FWZEL_PICTUREFORMAT_H
#define FWZEL_PICTUREFORMAT_H

#include <FwZel/PngFile.h>
#include <FwZel/PpmBytes.h>
#include <FwZel/PpmFile.h>

#include <cstddef>
#include <cstdint>
#include <string>

// Private to the library: the choice of a reader.

/// A picture format and its reader.
struct PictureFormat {
    const char* extension; ///< the end of its files' names, in lower case: a dot and three letters

    /// As getWidthHeightFromPngFile().
    int (*readSize)(std::string fileName, uint32_t* width, uint32_t* height, uint32_t* bytePerCol);

    /// As fillTextureFromPngFile().
    void (*fill)(std::string fileName, Texture* tex, uint32_t texBufIndex, uint32_t fid, uint32_t shift,
                 bool isFp16);

    /// As fillBytesFromPpmFile(). Null where a damaged file may leave gaps between what is filled.
    size_t (*fillFromStart)(const std::string& fileName, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                            uint32_t shift, bool isFp16);

    /// As refusalOfPngFile().
    std::string (*refusal)(const std::string& fileName);
};

inline constexpr PictureFormat PICTURE_FORMATS[] = {
    {".png", getWidthHeightFromPngFile, fillTextureFromPngFile, nullptr, refusalOfPngFile},
    {".ppm", getWidthHeightFromPpmFile, fillTextureFromPpmFile, fillBytesFromPpmFile, refusalOfPpmFile},
};

/// The length of every extension, its dot included.
constexpr std::string::size_type extensionLength = 4;

/// The format that a file name's last four characters tell, or null.
/// @throw std::out_of_range  the name is shorter than four characters
inline const PictureFormat* pictureFormat(const std::string& fileName) {
    // Of a shorter name the position wraps round to one beyond its end: substr() throws.
    const std::string extension = fileName.substr(fileName.length() - extensionLength);
    for (const PictureFormat& format : PICTURE_FORMATS)
        if (extension == format.extension)
            return &format;
    return nullptr;
}

#endif
