#ifndef FWZEL_REFUSALWORDS_H
#define FWZEL_REFUSALWORDS_H

#include <cstdint>
#include <cstring>
#include <string>

// Private to the library: what every picture reader says of a file that it refuses.

/// @param error  the errno of the call that failed
inline std::string notOpenedInWords(int error) {
    return std::string("it cannot be opened: ") + std::strerror(error);
}

/// @param error  the errno of the call that failed
inline std::string notReadInWords(int error) {
    return std::string("it cannot be read: ") + std::strerror(error);
}

inline std::string tooLargeInWords(uint32_t width, uint32_t height) {
    return "its " + std::to_string(width) + " x " + std::to_string(height) +
           " pixels of four bytes reach 2 GiB, more than a texture holds";
}

#endif
