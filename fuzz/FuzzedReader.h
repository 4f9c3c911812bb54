#ifndef FUZZ_FUZZEDREADER_H
#define FUZZ_FUZZEDREADER_H

#include "FuzzedFile.h"
#include "FuzzedTexture.h"

#include <FwZel/PictureSize.h>

#include <cstddef>
#include <cstdint>
#include <string>

/// A picture reader, and what may be asked of it.
struct FuzzedReader {
    static constexpr uint32_t COMPONENTS = 4; // of a pixel that it writes

    int (*readSize)(std::string fileName, uint32_t* width, uint32_t* height, uint32_t* bytesPerColour);
    void (*fill)(std::string fileName, Texture* texture, uint32_t buffer, uint32_t field, uint32_t shift,
                 bool isFp16);
    std::string (*refusal)(const std::string& fileName);

    bool tellsEmptySizes; ///< reports a size of 0 as success

    /// A texture for a file of this size.
    Texture::TexArgs (*argsOf)(uint8_t choice, uint32_t fileWidth, uint32_t fileHeight);

    /// How much of each row of a texture a file of this width may fill.
    size_t (*rowBytes)(const Texture& texture, uint32_t fileWidth);

    /// Any bytes as a file: its size, and a fill or why it is refused. The last byte, which lies behind the
    /// end of a whole file, chooses the texture and the field; from 128 on, the words.
    void read(const uint8_t* data, size_t size) const {
        static const FuzzedFile file;
        static FuzzedTexture fuzzed;
        file.write(data, size);
        uint32_t width = 0;
        uint32_t height = 0;
        uint32_t bytesPerColour = 0;
        const bool hasSize = readSize(file.path(), &width, &height, &bytesPerColour) == 0;
        const bool isAccepted = hasSize && width > 0 && height > 0 && pictureFits(width, height, COMPONENTS);
        require(!hasSize || tellsEmptySizes || (width > 0 && height > 0));
        require(!hasSize || bytesPerColour == 1 || bytesPerColour == 2);

        const uint8_t choice = size > 0 ? data[size - 1] : 0;
        if (choice >= 128) {
            require(refusal(file.path()).empty() == isAccepted);
            return;
        }
        fuzzed.describeAs(argsOf(choice, width, height));
        fill(file.path(), &fuzzed.texture(), 0, choice >> 4 & 3, choice >> 2 & 3, (choice & 64) != 0);
        require(fuzzed.isUntouchedBut(isAccepted ? rowBytes(fuzzed.texture(), width) : 0));
    }
};

#endif
