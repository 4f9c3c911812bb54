#ifndef FWZEL_FIELDROWS_H
#define FWZEL_FIELDROWS_H

#include <algorithm>
#include <cstdint>

// Private to the library: the rows of a field.

/// Which rows of a picture file go into the rows of a texture's buffer: row y takes file row first + y x
/// step.
struct FieldRows {
    uint32_t first;
    uint32_t step;

    /// Rows that a file of so many rows has for a buffer of so many rows.
    constexpr uint32_t inFile(uint32_t fileRows, uint32_t bufferRows) const {
        return fileRows <= first ? 0 : std::min(bufferRows, (fileRows - first - 1) / step + 1);
    }
};

/// Every row of the file, from the top.
constexpr FieldRows EVERY_ROW = {0, 1};

/// @param fid  field identifier: 0 even field, 1 odd field, any other whole frame
constexpr FieldRows fieldRows(uint32_t fid) {
    return fid > 1 ? EVERY_ROW : FieldRows{fid, 2};
}

#endif
