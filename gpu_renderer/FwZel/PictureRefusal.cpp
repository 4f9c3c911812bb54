#include <FwZel/PictureRefusal.h>

#include <FwZel/PictureFormat.h>
#include <FwZel/PngFile.h>
#include <FwZel/PpmFile.h>

std::string pictureRefusal(const std::string& fileName) {
    if (fileName.length() < extensionLength) {
        return "its name is too short for an extension";
    }
    switch (pictureFormat(fileName)) {
    case PictureFormat::PNG:
        return refusalOfPngFile(fileName);
    case PictureFormat::PPM:
        return refusalOfPpmFile(fileName);
    case PictureFormat::UNKNOWN:
        break;
    }
    return "its name ends neither in .png nor in .ppm (in lower case)";
}
