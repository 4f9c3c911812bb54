#ifndef HOST_BITMAPFONT_H
#define HOST_BITMAPFONT_H

#include <cstdint>
#include <string_view>

namespace host {

/// Capital letters, digits and a few signs of 5 x 7 pixels, for labels in pictures. Lower case letters are
/// drawn as capitals, signs that the font lacks as blanks.
struct BitmapFont {
    static constexpr uint32_t WIDTH = 5;
    static constexpr uint32_t HEIGHT = 7;
    static constexpr uint32_t ADVANCE = 6; ///< pixels from one character to the next

    static constexpr uint32_t textWidth(std::string_view text) {
        return text.empty() ? 0 : static_cast<uint32_t>(text.size()) * ADVANCE - (ADVANCE - WIDTH);
    }

    /// Whether a pixel of a character is set; column below WIDTH, row below HEIGHT, from the top left.
    static bool isSet(char character, uint32_t column, uint32_t row);

    /// Draws white, opaque text over pixels of four bytes. What lies outside of the picture is cut off.
    /// @param pixels  top left pixel of the picture
    /// @param width,height  size of the picture in pixels; its rows have no gaps
    /// @param left,top  top left pixel of the text
    /// @param scale  pixels of the picture a pixel of the font, each way
    static void draw(unsigned char* pixels, uint32_t width, uint32_t height, uint32_t left, uint32_t top,
                     uint32_t scale, std::string_view text);
};

} // namespace host

#endif
