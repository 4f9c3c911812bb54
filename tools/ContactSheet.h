#ifndef TOOLS_CONTACTSHEET_H
#define TOOLS_CONTACTSHEET_H

#include <PictureView.h>

#include <cstdint>
#include <string>
#include <vector>

/// Many pictures made small, in a grid on one sheet, each with a label under it.
class ContactSheet {
public:
    /// @param numPictures  how many pictures the sheet has room for
    explicit ContactSheet(uint32_t numPictures);

    /// Puts a picture of four bytes r, g, b, a a pixel into the next place, fitted into the place at its own
    /// proportions. Each pixel is the mean of those that it stands for; alpha is ignored.
    void add(const std::string& label, const host::PictureView& picture);

    /// Four bytes r, g, b, a a pixel.
    host::PictureView view() const { return {mPixels.data(), mWidth, mHeight, size_t{mWidth} * 4}; }

private:
    uint32_t mWidth;
    uint32_t mHeight;
    uint32_t mNumPictures = 0;
    std::vector<unsigned char> mPixels;
};

#endif
