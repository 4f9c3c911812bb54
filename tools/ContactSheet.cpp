#include "ContactSheet.h"

#include <BitmapFont.h>

#include <algorithm>
#include <array>

namespace {

constexpr uint32_t COLUMNS = 5;
constexpr uint32_t PLACE_WIDTH = 320;
constexpr uint32_t PLACE_HEIGHT = 180;
constexpr uint32_t GAP = 12;
constexpr uint32_t FONT_SCALE = 2;
constexpr uint32_t LABEL_HEIGHT = host::BitmapFont::HEIGHT * FONT_SCALE;
constexpr uint32_t COLUMN_STEP = PLACE_WIDTH + GAP;
constexpr uint32_t ROW_STEP = PLACE_HEIGHT + LABEL_HEIGHT + 2 * GAP;
constexpr std::array<unsigned char, 4> PAPER = {0x30, 0x34, 0x40, 0xFF};

/// Where the pixels begin that small pixel i of n stands for, of all that there are.
uint32_t begin(uint32_t i, uint32_t n, uint32_t all) {
    return static_cast<uint32_t>(uint64_t{i} * all / n);
}

/// The mean of the pixels that pixel (x, y) of a width x height copy stands for, at least one.
std::array<unsigned char, 4> meanPixel(const host::PictureView& picture, uint32_t x, uint32_t y,
                                       uint32_t width, uint32_t height) {
    const uint32_t left = begin(x, width, picture.width);
    const uint32_t top = begin(y, height, picture.height);
    const uint32_t right = std::max(left + 1, begin(x + 1, width, picture.width));
    const uint32_t bottom = std::max(top + 1, begin(y + 1, height, picture.height));
    std::array<uint64_t, 3> sum = {};
    for (uint32_t row = top; row < bottom; ++row)
        for (uint32_t column = left; column < right; ++column)
            for (size_t c = 0; c < sum.size(); ++c)
                // cppcheck-suppress constStatement ; the braces of size_t{} are taken for a block
                sum[c] += picture.row(row)[column * size_t{4} + c];
    const uint64_t count = uint64_t{right - left} * (bottom - top);
    return {static_cast<unsigned char>(sum[0] / count), static_cast<unsigned char>(sum[1] / count),
            static_cast<unsigned char>(sum[2] / count), 0xFF};
}

} // namespace

ContactSheet::ContactSheet(uint32_t numPictures)
    : mWidth(COLUMNS * COLUMN_STEP + GAP), mHeight((numPictures + COLUMNS - 1) / COLUMNS * ROW_STEP + GAP),
      mPixels(size_t{mWidth} * mHeight * 4) {
    for (size_t i = 0; i < mPixels.size(); i += PAPER.size())
        std::copy(PAPER.begin(), PAPER.end(), &mPixels[i]);
}

void ContactSheet::add(const std::string& label, const host::PictureView& picture) {
    const uint32_t left = GAP + mNumPictures % COLUMNS * COLUMN_STEP;
    const uint32_t top = GAP + mNumPictures / COLUMNS * ROW_STEP;
    ++mNumPictures;
    const uint64_t widthAtFullHeight = uint64_t{picture.width} * PLACE_HEIGHT / picture.height;
    const uint64_t heightAtFullWidth = uint64_t{picture.height} * PLACE_WIDTH / picture.width;
    const auto width = static_cast<uint32_t>(std::clamp<uint64_t>(widthAtFullHeight, 1, PLACE_WIDTH));
    const auto height = static_cast<uint32_t>(std::clamp<uint64_t>(heightAtFullWidth, 1, PLACE_HEIGHT));
    for (uint32_t y = 0; y < height; ++y)
        for (uint32_t x = 0; x < width; ++x) {
            const auto pixel = meanPixel(picture, x, y, width, height);
            const size_t place = size_t{top + y} * mWidth + left + x;
            std::copy(pixel.begin(), pixel.end(), &mPixels[place * 4]);
        }
    host::BitmapFont::draw(mPixels.data(), mWidth, mHeight, left, top + PLACE_HEIGHT + GAP / 2, FONT_SCALE,
                           label);
}
