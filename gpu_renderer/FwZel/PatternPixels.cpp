#include <FwZel/PatternPixels.h>

#include <FwZel/SineEstimate.h>
#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <algorithm>
#include <cmath>

namespace {

/// The codes of one component depth.
struct Depth {
    uint32_t shift;      ///< moves an 8-bit code to the top byte
    uint32_t shift10bit; ///< moves a 10-bit code to the top bits
    uint32_t lowBits10;  ///< the bits below a 10-bit code
    uint32_t half;       ///< mid code: neutral chroma
    uint32_t black;      ///< code 16 of the 8-bit scale: video black
    uint32_t max;        ///< full scale, and the mask of a component
    float maxF;          ///< max in single precision: 2^32 at four bytes

    constexpr uint32_t line() const { return max - 1; } ///< level of drawn lines
};

constexpr Depth depthOf(uint32_t bytesPerColour) {
    switch (bytesPerColour) {
    case 2:
        return {8, 6, 0x3F, 0x8000, 0x1000, 0xFFFF, 65535.0f};
    case 4:
        return {24, 22, 0x3FFFFF, 0x80000000, 0x10000000, 0xFFFFFFFF, 4294967296.0f};
    default:
        return {0, 0, 0, 0x80, 0x10, 0xFF, 255.0f};
    }
}
static_assert(depthOf(3).max == 0xFF, "every other size works at one byte");

using Pixel = PatternPixel;

/// What a pattern is asked: a picture at one depth.
struct Canvas : PatternPicture {
    // cppcheck-suppress uninitDerivedMemberVar ; the base is copied whole
    explicit Canvas(const PatternPicture& picture)
        : PatternPicture(picture), depth(depthOf(picture.bytesPerColour)) {}

    Pixel grey(uint32_t code) const { return {code, code, code, depth.max}; }
    /// Luma in the second component, neutral chroma.
    Pixel luma(uint32_t code) const { return {depth.half, code, depth.half, depth.max}; }
    Pixel lineOn(bool isLine, uint32_t background) const { return luma(isLine ? depth.line() : background); }
    bool isWanted(uint32_t component) const { return (wanted >> component & 1) != 0; }
    /// An 8-bit code at the top of a component.
    uint32_t top8(uint32_t code) const { return (code << depth.shift) & depth.max; }
    uint32_t top10(uint32_t code) const { return (code << depth.shift10bit) & depth.max; }

    Depth depth;
};

/// Truncates toward zero and keeps the low 32 bits, through a 64-bit integer because full scale is 2^32 at
/// four bytes; 0 for what not even that holds.
uint32_t truncated(float value) {
    constexpr float LIMIT = 9223372036854775808.0f;
    return value > -LIMIT && value < LIMIT ? static_cast<uint32_t>(static_cast<int64_t>(value)) : 0;
}

constexpr uint32_t maskOf(bool isSet) {
    return 0U - static_cast<uint32_t>(isSet);
}

/// From 0 at position 0 to full scale at position size.
uint32_t rampTo(uint32_t position, uint32_t size, const Depth& depth) {
    return truncated(static_cast<float>(position) * depth.maxF / static_cast<float>(size));
}

// --- Geometry that both a pattern and the resemblance of its lines go by

constexpr uint32_t COMBI_COMPONENT_LINES = 4;
constexpr uint32_t COMBI_LAST_VERTICAL_LINE = 255;

constexpr uint32_t GRID_COLUMNS = 3;
constexpr uint32_t GRID_LINES = 100;
constexpr uint32_t GRID_LINE_WIDTH = 2;

bool isCentreLine(const PatternPicture& picture, uint32_t y) {
    const uint32_t below = picture.height >> 1;
    const uint32_t above = below - 1;
    switch (picture.field) {
    case 0:
        return y == below;
    case 1:
        return y == above;
    case 2:
        return y == below || y == above;
    default:
        return false;
    }
}

bool isBorderLine(const PatternPicture& picture, uint32_t y) {
    return y == 0 || y == picture.height - 1;
}

bool isUpperHalf(const PatternPicture& picture, uint32_t y) {
    return y < picture.height >> 1;
}

bool isGridLine(uint32_t y) {
    return y % GRID_LINES < GRID_LINE_WIDTH;
}

/// Half the width of the disc on a line, in columns: it lies strictly between this many columns left and
/// right of the middle column. 0 where it does not reach. A whole frame measures in lines; a field in frame
/// lines, so that both fields make one disc.
int32_t discHalfWidth(const PatternPicture& picture, uint32_t y) {
    const int64_t radius = picture.width >> 4;
    const int64_t distance = static_cast<int32_t>(
        picture.field == 2 ? y - (picture.height >> 1) : 2 * y - picture.height + picture.field);
    if (distance <= -radius || distance >= radius)
        return 0;
    return static_cast<int32_t>(std::sqrt(static_cast<float>(radius * radius - distance * distance)));
}

// --- The patterns, each a function of the canvas and the position

struct Combi {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        // Masks rather than choices: a loop along the line then takes several pixels at a time.
        const uint32_t grey = maskOf(y >= COMBI_COMPONENT_LINES);
        const uint32_t vertical = grey & maskOf(y <= COMBI_LAST_VERTICAL_LINE);
        const uint32_t level = canvas.top8((y & vertical) | (x & ~vertical));
        return {level & (grey | maskOf(y == 2)), level & (grey | maskOf(y == 1)),
                level & (grey | maskOf(y == 0)), (canvas.depth.max & grey) | (level & maskOf(y == 3))};
    }
};

struct HRamp {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) { return canvas.grey(canvas.top8(x)); }
};

struct VRamp {
    static Pixel at(const Canvas& canvas, uint32_t, uint32_t y) { return canvas.grey(canvas.top8(y)); }
};

struct HVRamp {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        return {rampTo(x, canvas.width, canvas.depth), canvas.depth.half,
                rampTo(y, canvas.height, canvas.depth), canvas.depth.max};
    }
};

struct HRampSharow {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        return canvas.grey(rampTo(x, canvas.width, canvas.depth));
    }
};

struct HRampSharowY {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        return canvas.luma(rampTo(x, canvas.width, canvas.depth));
    }
};

struct HRamp10bit {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) { return canvas.grey(canvas.top10(x)); }
};

struct HRamp10bit2 {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        const Depth& depth = canvas.depth;
        return canvas.grey(((x << depth.shift10bit) + (x & depth.lowBits10)) & depth.max);
    }
};

struct HRampMaxval {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        const uint32_t code = (canvas.depth.max - x) & canvas.depth.max;
        return {code, code, code, code};
    }
};

struct Centre {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        const uint32_t right = canvas.width >> 1;
        const bool isCross = x == right || x == right - 1 || isCentreLine(canvas, y);
        return canvas.grey(isCross ? canvas.depth.line() : 0);
    }
};

struct WhiteFrame {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        return canvas.lineOn(isBorderLine(canvas, y) || x == 0 || x == canvas.width - 1, 0);
    }
};

struct HGrid {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        return canvas.lineOn(x % GRID_COLUMNS == GRID_COLUMNS - 1, 0);
    }
};

struct VGrid {
    static Pixel at(const Canvas& canvas, uint32_t, uint32_t y) { return canvas.lineOn(isGridLine(y), 0); }
};

struct HImpulse {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        return x == canvas.width >> 1 ? canvas.grey(canvas.depth.line()) : canvas.luma(canvas.depth.black);
    }
};

struct Circle {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        const int32_t halfWidth = discHalfWidth(canvas, y);
        const auto column = static_cast<int32_t>(x - (canvas.width >> 1));
        return canvas.grey(-halfWidth < column && column < halfWidth ? canvas.depth.max : 0);
    }
};

struct DigonalLine {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        return canvas.luma(x % DIAGONAL_PERIOD == y % DIAGONAL_PERIOD ? 0 : canvas.depth.line());
    }
};

struct ColourMats {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t y) {
        const Depth& depth = canvas.depth;
        const uint32_t quarter = canvas.width >> 2;
        const uint32_t other = isUpperHalf(canvas, y) ? 0 : depth.half;
        if (x < quarter)
            return {depth.line(), 0, other, depth.max};
        if (x < canvas.width >> 1)
            return {other, depth.line(), other, depth.max};
        if (x >= 3 * quarter)
            return canvas.grey(depth.half);
        return {0, other, depth.line(), depth.max};
    }
};

struct ColourBar {
    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        constexpr uint32_t NUM_BARS = 8;
        const uint32_t barWidth = canvas.width / NUM_BARS;
        const uint32_t index = barWidth == 0 ? 0 : x / barWidth % NUM_BARS;
        const auto code = [&](uint32_t array) {
            return canvas.isWanted(array)
                       ? truncated(canvas.bars[array * NUM_BARS + index] * canvas.depth.maxF) &
                             canvas.depth.max
                       : 0;
        };
        return {code(0), code(1), code(2), canvas.depth.max};
    }
};

struct HSweep {
    static float lumaPhase(const Canvas& canvas, uint32_t x) {
        const auto position = static_cast<float>(x);
        return position * kY(canvas, position) * PI;
    }

    static float chromaPhase(const Canvas& canvas, uint32_t x) {
        const auto position = static_cast<float>(x);
        return kY(canvas, position) * 0.5f * position * PI;
    }

    static float level(const Canvas& canvas, float sine) { return (sine * 0.4f + 0.5f) * canvas.depth.maxF; }

    static uint32_t code(const Canvas& canvas, float phase) {
        return truncated(level(canvas, std::sin(phase))) & canvas.depth.max;
    }

    static bool hasChroma(const Canvas& canvas) { return canvas.isWanted(0) || canvas.isWanted(2); }
    static bool hasLuma(const Canvas& canvas) { return canvas.isWanted(1); }

    static Pixel at(const Canvas& canvas, uint32_t x, uint32_t) {
        const uint32_t chroma = hasChroma(canvas) ? code(canvas, chromaPhase(canvas, x)) : 0;
        const uint32_t luma = hasLuma(canvas) ? code(canvas, lumaPhase(canvas, x)) : 0;
        return {chroma, luma, chroma, canvas.depth.max};
    }

private:
    static constexpr float PI = 3.14159274f;

    static float kY(const Canvas& canvas, float position) {
        return position * 0.5f / static_cast<float>(canvas.width);
    }
};

struct ColourMatBlack {
    static Pixel at(const Canvas& canvas, uint32_t, uint32_t) { return canvas.grey(0); }
};

struct ColourMatWhite {
    static Pixel at(const Canvas& canvas, uint32_t, uint32_t) { return canvas.grey(canvas.depth.max); }
};

struct NoPattern {
    static Pixel at(const Canvas&, uint32_t, uint32_t) { return {0, 0, 0, 0}; }
};

// Each pattern has its own loop, so that the choice of the pattern stays out of it.

struct Operations {
    Pixel (*pixel)(const PatternPicture&, uint32_t x, uint32_t y);
    void (*run)(const PatternPicture&, uint32_t x, uint32_t y, uint32_t count, PatternRun&);
};

template <class Pattern>
Pixel pixelOf(const PatternPicture& picture, uint32_t x, uint32_t y) {
    return Pattern::at(Canvas(picture), x, y);
}

template <class Pattern>
void runOf(const PatternPicture& picture, uint32_t x, uint32_t y, uint32_t count, PatternRun& run) {
    const Canvas canvas(picture);
    for (uint32_t i = 0; i < count; ++i) {
        const Pixel pixel = Pattern::at(canvas, x + i, y);
        run.components[0][i] = pixel.r;
        run.components[1][i] = pixel.g;
        run.components[2][i] = pixel.b;
        run.components[3][i] = pixel.a;
    }
}

/// The codes of the sweep at the columns from x on. Most of them follow from the bound on the sine.
///
/// A level rises with the sine, also as rounded, so the code of std::sin() lies between the codes at both
/// ends of the bound; where these are equal, it is known. At one byte one sine in ten thousand is needed, at
/// two bytes one in fifty. At four bytes a code has more bits than the bound.
template <class Phase>
void sweepCodes(const Canvas& canvas, uint32_t x, uint32_t count, Phase phase, uint32_t* codes) {
    constexpr uint32_t OPEN = 0xFFFFFFFF;
    constexpr uint32_t WIDEST_CODE = 0xFFFF;
    // Phases rise from left to right. Negated, because that of a picture without columns is not a number.
    if (canvas.depth.max > WIDEST_CODE || !(phase(canvas, x + count - 1) <= LAST_ESTIMATED_PHASE)) {
        for (uint32_t i = 0; i < count; ++i)
            codes[i] = HSweep::code(canvas, phase(canvas, x + i));
        return;
    }
    uint32_t differences = 0;
    for (uint32_t i = 0; i < count; ++i) {
        const float sine = estimatedSine(phase(canvas, x + i));
        // Levels of so few bits need neither 64 bits nor the mask.
        const auto least = static_cast<int32_t>(HSweep::level(canvas, sine - SINE_BOUND));
        const auto most = static_cast<int32_t>(HSweep::level(canvas, sine + SINE_BOUND));
        codes[i] = least == most ? static_cast<uint32_t>(least) : OPEN;
        differences |= static_cast<uint32_t>(least ^ most);
    }
    if (differences == 0)
        return;
    for (uint32_t i = 0; i < count; ++i)
        if (codes[i] == OPEN)
            codes[i] = HSweep::code(canvas, phase(canvas, x + i));
}

template <>
void runOf<HSweep>(const PatternPicture& picture, uint32_t x, uint32_t, uint32_t count, PatternRun& run) {
    // A copy: the compiler then sees that no code stored can change it.
    const Canvas canvas(picture);
    auto& [chroma, luma, sameChroma, alpha] = run.components;
    if (HSweep::hasChroma(canvas)) {
        sweepCodes(canvas, x, count, HSweep::chromaPhase, chroma);
        std::copy_n(chroma, count, sameChroma);
    }
    if (HSweep::hasLuma(canvas))
        sweepCodes(canvas, x, count, HSweep::lumaPhase, luma);
    std::fill_n(alpha, count, canvas.depth.max);
}

template <class Pattern>
constexpr Operations OF = {pixelOf<Pattern>, runOf<Pattern>};

/// By pattern number.
constexpr Operations PATTERNS[] = {
    OF<Combi>,          OF<HRamp>,          OF<VRamp>,       OF<HVRamp>,      OF<HRampSharow>,
    OF<HRampSharowY>,   OF<HRamp10bit>,     OF<HRamp10bit2>, OF<HRampMaxval>, OF<Centre>,
    OF<WhiteFrame>,     OF<HGrid>,          OF<VGrid>,       OF<HImpulse>,    OF<Circle>,
    OF<DigonalLine>,    OF<ColourMats>,     OF<ColourBar>,   OF<ColourBar>,   OF<HSweep>,
    OF<ColourMatBlack>, OF<ColourMatWhite>,
};
constexpr uint32_t NUM_PATTERNS = sizeof PATTERNS / sizeof PATTERNS[0];
static_assert(NUM_PATTERNS == NUM_TEST_PATTERNS, "one entry for each pattern number");

const Operations& operationsOf(uint32_t pattern) {
    static constexpr Operations NONE = OF<NoPattern>;
    return pattern < NUM_PATTERNS ? PATTERNS[pattern] : NONE;
}

/// The first line after y at which a test turns out otherwise than at y, at most limit.
template <class Test>
uint32_t endOfRun(uint32_t y, uint32_t limit, Test test) {
    const bool atY = test(y);
    uint32_t end = y + 1;
    while (end < limit && test(end) == atY)
        ++end;
    return end;
}

} // namespace

PatternPixel patternPixel(const PatternPicture& picture, uint32_t x, uint32_t y) {
    return operationsOf(picture.pattern).pixel(picture, x, y);
}

void patternRun(const PatternPicture& picture, uint32_t x, uint32_t y, uint32_t count, PatternRun& run) {
    operationsOf(picture.pattern).run(picture, x, y, count, run);
}

void VideoTestImage::generatePatternData(uint32_t sig_sel, uint32_t width, uint32_t height, uint32_t x,
                                         uint32_t y, uint32_t byte_per_col, uint32_t fd, uint32_t* data,
                                         float* colbarCol) {
    const Pixel pixel = patternPixel({sig_sel, width, height, byte_per_col, fd, colbarCol}, x, y);
    data[0] = pixel.r;
    data[1] = pixel.g;
    data[2] = pixel.b;
    data[3] = pixel.a;
}

LineVariation lineVariationOf(uint32_t pattern) {
    switch (pattern) {
    case VideoTestImage::HV_RAMP:
        return LineVariation::SEPARABLE;
    case VideoTestImage::CIRCLE:
        return LineVariation::SPAN;
    case VideoTestImage::DIGONAL_LINE:
        return LineVariation::SHIFTED;
    default:
        return LineVariation::BANDS;
    }
}

Band bandAt(const PatternPicture& picture, uint32_t y, uint32_t limit) {
    const auto split = [&](auto test, bool isFlat) {
        return Band{endOfRun(y, limit, test), isFlat, test(y) ? 1U : 0U};
    };
    switch (picture.pattern) {
    case VideoTestImage::HV_RAMP: {
        const Depth depth = depthOf(picture.bytesPerColour);
        const uint32_t level = rampTo(y, picture.height, depth);
        const auto isLevel = [&](uint32_t line) { return rampTo(line, picture.height, depth) == level; };
        return {endOfRun(y, limit, isLevel), false, y};
    }
    case VideoTestImage::COMBI:
        if (y < COMBI_COMPONENT_LINES)
            return {y + 1, false, y};
        if (y <= COMBI_LAST_VERTICAL_LINE)
            return {y + 1, true, 0};
        return {limit, false, COMBI_COMPONENT_LINES};
    case VideoTestImage::V_RAMP:
        return {y + 1, true, 0};
    case VideoTestImage::V_GRID:
        return split(isGridLine, true);
    case VideoTestImage::CENTRE: {
        const auto onLine = [&](uint32_t line) { return isCentreLine(picture, line); };
        return split(onLine, onLine(y));
    }
    case VideoTestImage::WHITE_FRAME: {
        const auto onLine = [&](uint32_t line) { return isBorderLine(picture, line); };
        return split(onLine, onLine(y));
    }
    case VideoTestImage::COLOUR_MATS:
        return split([&](uint32_t line) { return isUpperHalf(picture, line); }, false);
    case VideoTestImage::COLOUR_MAT_BLACK:
    case VideoTestImage::COLOUR_MAT_WHITE:
        return {limit, true, 0};
    default:
        return {limit, picture.pattern >= NUM_PATTERNS, 0};
    }
}

Span spanAt(const PatternPicture& picture, uint32_t y) {
    const auto halfWidth = static_cast<uint32_t>(discHalfWidth(picture, y));
    const uint32_t middle = picture.width >> 1;
    if (halfWidth == 0)
        return {0, 0};
    return {middle - halfWidth + 1, middle + halfWidth};
}
