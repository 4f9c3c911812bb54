#ifndef FWZEL_PATTERNPIXELS_H
#define FWZEL_PATTERNPIXELS_H

#include <cstdint>

// Private to the library: what the pixels of a pattern are, one or a run of them at a time, and how its lines
// resemble one another, so that the fillers may compute one line of each sort and repeat it.

inline constexpr uint32_t COMPONENTS_PER_PIXEL = 4;

/// A pattern on a picture; the fields are the parameters of VideoTestImage::generatePatternData().
struct PatternPicture {
    static constexpr uint32_t ALL_COMPONENTS = 0xF;

    uint32_t pattern; ///< VideoTestImage::testPattern; any other value is a picture of zeros
    uint32_t width;
    uint32_t height;
    uint32_t bytesPerColour;
    uint32_t field;
    const float* bars; ///< 24 entries; read by the colour bars alone

    /// Bit c: somebody looks at component c. A component that nobody looks at may be anything.
    uint32_t wanted = ALL_COMPONENTS;
};

/// The components of one pixel.
struct PatternPixel {
    uint32_t r, g, b, a;
};

/// A run of pixels, component by component: loops over it need no shuffling.
struct PatternRun {
    static constexpr uint32_t MAX_PIXELS = 256;
    uint32_t components[COMPONENTS_PER_PIXEL][MAX_PIXELS];
};

/// Computes the pixel at column x of line y. This is what VideoTestImage::generatePatternData() gives.
PatternPixel patternPixel(const PatternPicture& picture, uint32_t x, uint32_t y);

/// Computes that of the columns from x on, count of them, at most MAX_PIXELS.
void patternRun(const PatternPicture& picture, uint32_t x, uint32_t y, uint32_t count, PatternRun& run);

/// How the lines of a pattern differ.
enum class LineVariation {
    BANDS,     ///< the lines come in bands of equal lines: see bandAt()
    SHIFTED,   ///< line y is line 0 moved y columns to the right; along a line, the pattern repeats itself
               ///< every DIAGONAL_PERIOD columns
    SPAN,      ///< one colour, but for a span of columns in another: see spanAt()
    SEPARABLE, ///< component SEPARABLE_LINE_COMPONENT is constant along a line, the others are alike on all
               ///< lines; lines with the same constant come in bands
};

LineVariation lineVariationOf(uint32_t pattern);

/// Lines that are equal, and equal to those of any other band with the same `like`.
struct Band {
    uint32_t end;  ///< the first line after the band
    bool isFlat;   ///< all pixels of a line are equal
    uint32_t like; ///< tells the bands of a picture that are not flat from one another
};

/// The band at line y of a pattern of BANDS or SEPARABLE.
/// @param limit  where to stop looking for the band's end; above y
Band bandAt(const PatternPicture& picture, uint32_t y, uint32_t limit);

/// Columns from begin to before end.
struct Span {
    uint32_t begin, end;
};

/// The columns of line y that differ from the rest, for a pattern of SPAN; empty as 0, 0.
Span spanAt(const PatternPicture& picture, uint32_t y);

inline constexpr uint32_t DIAGONAL_PERIOD = 50;
inline constexpr uint32_t SEPARABLE_LINE_COMPONENT = 2;

#endif
