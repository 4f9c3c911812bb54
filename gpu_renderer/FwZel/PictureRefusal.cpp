#include <FwZel/PictureRefusal.h>

#include <FwZel/PictureFormat.h>

namespace {

std::string unknownExtensionInWords() {
    std::string words = "its name ends";
    const char* link = " neither in ";
    for (const PictureFormat& format : PICTURE_FORMATS) {
        words.append(link).append(format.extension);
        link = " nor in ";
    }
    return words + " (in lower case)";
}

} // namespace

std::string pictureRefusal(const std::string& fileName) {
    if (fileName.length() < extensionLength)
        return "its name is too short for an extension";
    const PictureFormat* const format = pictureFormat(fileName);
    return format != nullptr ? format->refusal(fileName) : unknownExtensionInWords();
}
