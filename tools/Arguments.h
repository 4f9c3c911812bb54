#ifndef TOOLS_ARGUMENTS_H
#define TOOLS_ARGUMENTS_H

#include <cstdint>
#include <string>

struct Size {
    uint32_t width;
    uint32_t height;
};

struct Region {
    uint32_t x;
    uint32_t y;
    uint32_t width;
    uint32_t height;
};

/// Reads "1920x1080".
/// @param option  names the argument in the message
/// @throw WrongCall  the text is something else, a size is 0, or a number passes 32 bits
Size parseSize(const std::string& option, const std::string& text);

/// Reads "200x100+50+40": width, height, and the position of the top left corner.
/// @throw WrongCall  as parseSize()
Region parseRegion(const std::string& option, const std::string& text);

#endif
