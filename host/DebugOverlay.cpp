#include "DebugOverlay.h"

#include "BitmapFont.h"

#include <FwZel/FWDebugFont.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>

namespace host {

namespace {

constexpr uint32_t MAX_SCALE = 6;

/// A character as glBitmap takes it: rows from the bottom, the leftmost pixel in the highest bit.
class CharacterBitmap {
public:
    CharacterBitmap(char character, uint32_t scale) {
        for (uint32_t y = 0; y < BitmapFont::HEIGHT * scale; ++y)
            for (uint32_t x = 0; x < BitmapFont::WIDTH * scale; ++x)
                if (BitmapFont::isSet(character, x / scale, BitmapFont::HEIGHT - 1 - y / scale))
                    mBits[y * ROW_BYTES + x / 8] |= static_cast<unsigned char>(0x80U >> x % 8);
    }

    const unsigned char* bits() const { return mBits.data(); }

private:
    static constexpr uint32_t ROW_BYTES = 4; ///< as GL_UNPACK_ALIGNMENT 4 wants them
    static_assert(BitmapFont::WIDTH * MAX_SCALE <= ROW_BYTES * 8, "a row holds the widest character");
    std::array<unsigned char, ROW_BYTES* BitmapFont::HEIGHT* MAX_SCALE> mBits = {};
};

void drawText(const std::string& text, uint32_t scale) {
    for (const char character : text)
        glBitmap(
            static_cast<GLsizei>(BitmapFont::WIDTH * scale), static_cast<GLsizei>(BitmapFont::HEIGHT * scale),
            0, static_cast<float>(BitmapFont::HEIGHT * scale),
            static_cast<float>(BitmapFont::ADVANCE * scale), 0, CharacterBitmap(character, scale).bits());
}

void drawLines(const std::vector<std::string>& lines, float margin, uint32_t scale) {
    FWDebugFont::setPosition(margin, margin);
    for (const std::string& line : lines) {
        FWDebugFont::setPos();
        drawText(line, scale);
    }
}

/// FWDebugFont's screen, as its class tells it.
void loadScreenMatrices() {
    glMatrixMode(GL_PROJECTION);
    glPushMatrix();
    glLoadIdentity();
    glOrtho(-4, 4, -4, 4, 1, 20);
    glMatrixMode(GL_MODELVIEW);
    glPushMatrix();
    glLoadIdentity();
}

void restoreMatrices() {
    glMatrixMode(GL_PROJECTION);
    glPopMatrix();
    glMatrixMode(GL_MODELVIEW);
    glPopMatrix();
}

} // namespace

void drawOverlay(uint32_t width, uint32_t height, const std::vector<std::string>& lines) {
    constexpr uint32_t HEIGHT_AT_SCALE_1 = 400;
    constexpr float MARGIN = 8;
    const uint32_t scale = std::clamp<uint32_t>(height / HEIGHT_AT_SCALE_1, 1, MAX_SCALE);
    const auto step = static_cast<float>(scale);
    // The cursor steps in pixels of the font, so that lines keep clear of each other at every scale.
    FWDebugFont::setScreenRes(static_cast<float>(width) / step, static_cast<float>(height) / step);
    loadScreenMatrices();
    glPixelStorei(GL_UNPACK_ALIGNMENT, 4);
    FWDebugFont::setColor(0, 0, 0, 1);
    drawLines(lines, MARGIN + 1, scale);
    FWDebugFont::setColor(1, 1, 1, 1);
    drawLines(lines, MARGIN, scale);
    restoreMatrices();
}

} // namespace host
