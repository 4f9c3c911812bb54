#ifndef FWZEL_PICTUREFORMAT_H
#define FWZEL_PICTUREFORMAT_H

#include <string>

// Private to the library: the choice of a reader.

/// The picture formats that have a reader.
enum class PictureFormat { PNG, PPM, UNKNOWN };

/// The length of every extension, its dot included.
constexpr std::string::size_type extensionLength = 4;

/// The format that a file name's last four characters tell, ".png" or ".ppm" in lower case.
/// @throw std::out_of_range  the name is shorter than four characters
inline PictureFormat pictureFormat(const std::string& fileName) {
    // Of a shorter name the position wraps round to one beyond its end: substr() throws.
    const std::string extension = fileName.substr(fileName.length() - extensionLength);
    if (extension == ".png") {
        return PictureFormat::PNG;
    }
    return extension == ".ppm" ? PictureFormat::PPM : PictureFormat::UNKNOWN;
}

#endif
