#include <FwZel/TestPatternCatalogue.h>

#include <FwZel/VideoTestImage.h>

#include <algorithm>

namespace {

using Image = VideoTestImage;

constexpr const char* GREY = "R'G'B': three equal components, opaque";
constexpr const char* LUMA = "Y'CbCr: neutral chroma, the picture is in the luma";

constexpr std::array<TestPatternEntry, NUM_TEST_PATTERNS> CATALOGUE = {{
    {Image::COMBI, "combi",
     "a ramp in one component on each of lines 0 to 3, a vertical grey ramp to line 255, a horizontal one "
     "below",
     "R'G'B': B, G, R and alpha on lines 0 to 3 with the others at 0, grey and opaque below"},
    {Image::H_RAMP, "h-ramp", "horizontal grey ramp, one code a pixel, again every 256 pixels", GREY},
    {Image::V_RAMP, "v-ramp", "vertical grey ramp, one code a line, again every 256 lines", GREY},
    {Image::HV_RAMP, "hv-ramp", "all chroma values: Cr across the width, Cb down the height",
     "Y'CbCr: Cr and Cb ramp to just below full scale, luma at mid code"},
    {Image::H_RAMP_SHAROW, "h-ramp-sharow", "grey ramp across the width, to just below full scale", GREY},
    {Image::H_RAMP_SHAROW_Y, "h-ramp-sharow-y", "luma ramp across the width, to just below full scale", LUMA},
    {Image::H_RAMP_10BIT, "h-ramp-10bit", "horizontal ramp of 10-bit codes, one a pixel, low bits 0",
     "R'G'B': three equal components, opaque; 8-bit codes at one byte a component"},
    {Image::H_RAMP_10BIT_2, "h-ramp-10bit-2",
     "horizontal ramp of 10-bit codes, one a pixel, low bits from the pixel's index",
     "R'G'B': three equal components, opaque; 8-bit codes at one byte a component"},
    {Image::H_RAMP_MAXVAL, "h-ramp-maxval", "ramp down from full scale, one code a pixel",
     "R'G'B': all four components are equal, alpha ramps too"},
    {Image::CENTRE, "centre", "cross through the middle, two columns and two frame lines wide", GREY},
    {Image::WHITE_FRAME, "white-frame", "border of one pixel", LUMA},
    {Image::H_GRID, "h-grid", "vertical lines, every third column", LUMA},
    {Image::V_GRID, "v-grid", "horizontal lines, two in every hundred", LUMA},
    {Image::H_IMPULSE, "h-impulse", "one vertical line in the middle on video black",
     "Y'CbCr: neutral chroma and video black; all three components are high on the line"},
    {Image::CIRCLE, "circle", "white disc in the middle, an eighth of the width wide", GREY},
    {Image::DIGONAL_LINE, "digonal-line", "dark diagonal lines every 50 pixels on a light field", LUMA},
    {Image::COLOUR_MATS, "colour-mats",
     "two rows of four fields, one component high in each of the first three",
     "R'G'B' in the upper row, the other components at 0; Y'CbCr in the lower, the other chroma at mid code"},
    {Image::COLOUR_BAR_100, "colour-bar-100", "eight vertical bars at 100 %, from white to black",
     "R'G'B', opaque; as the bar table says where a host generates pixels with its own"},
    {Image::COLOUR_BAR_75, "colour-bar-75",
     "eight vertical bars at 75 %, white at 100 %, from white to black",
     "R'G'B', opaque; as the bar table says where a host generates pixels with its own"},
    {Image::H_SWEEP, "h-sweep", "frequency sweep from 0 to half a cycle a pixel at the right edge",
     "Y'CbCr: the luma sweeps; both chroma components reach half of its frequency"},
    {Image::COLOUR_MAT_BLACK, "colour-mat-black", "black", GREY},
    {Image::COLOUR_MAT_WHITE, "colour-mat-white", "white", GREY},
}};

} // namespace

const std::array<TestPatternEntry, NUM_TEST_PATTERNS>& testPatternCatalogue() {
    return CATALOGUE;
}

const TestPatternEntry* findTestPattern(std::string nameOrNumber) {
    const auto* const found =
        std::find_if(CATALOGUE.begin(), CATALOGUE.end(), [&](const TestPatternEntry& entry) {
            return nameOrNumber == entry.name || nameOrNumber == std::to_string(entry.number);
        });
    return found == CATALOGUE.end() ? nullptr : found;
}

const TestPatternEntry* findTestPattern(uint32_t number) {
    return number < CATALOGUE.size() ? &CATALOGUE[number] : nullptr;
}
