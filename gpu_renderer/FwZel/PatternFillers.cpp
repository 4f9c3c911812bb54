#include <FwZel/VideoTestImage.h>

#include <FwZel/HalfFloat.h>
#include <FwZel/PatternPixels.h>
#include <FwZel/PixelRows.h>
#include <FwZel/WordLoops.h>

#include <algorithm>

namespace {

struct Region {
    uint32_t posX, posY, sizeX, sizeY;
};

/// Where each component of a pixel lies in memory, counted in components.
struct MemoryOrder {
    uint32_t r, g, b, a;
};

MemoryOrder memoryOrderOf(uint32_t colOrder) {
    switch (colOrder) {
    case VideoTestImage::COL_ARGB:
        return {1, 2, 3, 0};
    case VideoTestImage::COL_RGBA:
        return {0, 1, 2, 3};
    case VideoTestImage::COL_ABGR:
        return {3, 2, 1, 0};
    default:
        return {2, 3, 0, 1};
    }
}

static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "the first component in memory is the lowest bits");

// --- The layouts of a pixel

struct PackedBytes {
    using Pixel = uint32_t;
    static constexpr uint32_t COMPONENTS = COMPONENTS_PER_PIXEL;

    Pixel encode(uint32_t r, uint32_t g, uint32_t b, uint32_t a) const {
        constexpr uint32_t BITS = 8;
        return (r & 0xFF) << BITS * order.r | (g & 0xFF) << BITS * order.g | (b & 0xFF) << BITS * order.b |
               (a & 0xFF) << BITS * order.a;
    }

    static constexpr uint32_t wanted() { return PatternPicture::ALL_COMPONENTS; }

    MemoryOrder order;
};

struct PackedHalfFloats {
    using Pixel = uint64_t;
    static constexpr uint32_t COMPONENTS = COMPONENTS_PER_PIXEL;

    Pixel encode(uint32_t r, uint32_t g, uint32_t b, uint32_t a) const {
        constexpr uint32_t BITS = 16;
        const auto half = [](uint32_t code) { return Pixel{HALF_FLOAT_CODES[code & 0xFF]}; };
        return half(r) << BITS * order.r | half(g) << BITS * order.g | half(b) << BITS * order.b |
               half(a) << BITS * order.a;
    }

    static constexpr uint32_t wanted() { return PatternPicture::ALL_COMPONENTS; }

    MemoryOrder order;
};

template <class Element>
struct Plane {
    using Pixel = Element;
    static constexpr uint32_t COMPONENTS = 1;

    uint32_t wanted() const { return 1U << component; }

    uint32_t component;
};

template <class Layout>
typename Layout::Pixel encodePixel(const Layout& layout, const PatternPixel& pixel) {
    return layout.encode(pixel.r, pixel.g, pixel.b, pixel.a);
}

template <class Element>
Element encodePixel(const Plane<Element>& plane, const PatternPixel& pixel) {
    const uint32_t components[] = {pixel.r, pixel.g, pixel.b, pixel.a};
    return static_cast<Element>(components[plane.component]);
}

// The layout comes as a copy: the compiler then sees that no pixel stored can change it.

template <class Layout>
void encodeRun(Layout layout, const PatternRun& run, uint32_t count, typename Layout::Pixel* pixels) {
    const auto& [r, g, b, a] = run.components;
    for (uint32_t i = 0; i < count; ++i)
        pixels[i] = layout.encode(r[i], g[i], b[i], a[i]);
}

template <class Element>
void encodeRun(Plane<Element> plane, const PatternRun& run, uint32_t count, Element* pixels) {
    const uint32_t* const component = run.components[plane.component];
    for (uint32_t i = 0; i < count; ++i)
        pixels[i] = static_cast<Element>(component[i]);
}

// --- The fillers

/// Fills a region from left to right in pieces of columns, each from top to bottom: computes one line of each
/// sort and copies it to the others.
template <class Layout>
class PatternFiller {
public:
    using Pixel = typename Layout::Pixel;

    PatternFiller(const Layout& layout, const PatternPicture& picture, unsigned char* mem, uint32_t pitch)
        : mLayout(layout), mPicture(picture), mRows(mem, pitch, Layout::COMPONENTS) {
        mPicture.wanted = layout.wanted();
    }

    void fill(const Region& region) {
        const uint32_t endX = region.posX + region.sizeX;
        mBegin = region.posY;
        mEnd = region.posY + region.sizeY;
        if (mBegin >= mEnd)
            return;
        for (mX = region.posX; mX < endX; mX += mCount) {
            mCount = std::min(endX - mX, PIECE);
            fillColumns();
        }
    }

private:
    static constexpr uint32_t PIECE = 65536 / sizeof(Pixel);

    void fillColumns() {
        switch (lineVariationOf(mPicture.pattern)) {
        case LineVariation::BANDS:
            return fillBands();
        case LineVariation::SHIFTED:
            return fillShifted();
        case LineVariation::SPAN:
            return fillSpans();
        case LineVariation::SEPARABLE:
            return fillSeparable();
        }
    }

    void fillBands() {
        bool isBuilt = false;
        uint32_t built = 0;
        for (uint32_t y = mBegin; y < mEnd;) {
            const Band band = bandAt(mPicture, y, mEnd);
            if (band.isFlat) {
                repeatOnLines(y, band.end, pixelAt(mX, y));
            } else {
                if (!isBuilt || built != band.like)
                    build(mX, y, mCount);
                isBuilt = true;
                built = band.like;
                copyToLines(y, band.end);
            }
            y = band.end;
        }
    }

    /// The piece holds line 0 from a column that is a multiple of the period on, one period more than it
    /// fills.
    void fillShifted() {
        build(mX % DIAGONAL_PERIOD, 0, mCount + DIAGONAL_PERIOD);
        const PixelRows<Pixel> rows = mRows;
        const uint32_t x = mX;
        const uint32_t count = mCount;
        for (uint32_t y = mBegin; y < mEnd; ++y)
            rows.copy(x, y, mPiece + DIAGONAL_PERIOD - y % DIAGONAL_PERIOD, count);
    }

    void fillSpans() {
        build(mX, mBegin, mCount);
        Span held = clipped(spanAt(mPicture, mBegin));
        for (uint32_t y = mBegin; y < mEnd; ++y) {
            const Span whole = spanAt(mPicture, y);
            const Span span = clipped(whole);
            if (span.begin != held.begin || span.end != held.end) {
                const Pixel outside = pixelAt(whole.end, y);
                put(held.begin, std::min(held.end, span.begin), outside);
                put(std::max(held.begin, span.end), held.end, outside);
                const Pixel inside = pixelAt(whole.begin, y);
                put(span.begin, std::min(span.end, held.begin), inside);
                put(std::max(span.begin, held.end), span.end, inside);
                held = span;
            }
            mRows.copy(mX, y, mPiece, mCount);
        }
    }

    void fillSeparable() {
        constexpr uint32_t LINE_COMPONENT = 1U << SEPARABLE_LINE_COMPONENT;
        if (mPicture.wanted == LINE_COMPONENT)
            return fillFlatLines();
        build(mX, mBegin, mCount);
        if ((mPicture.wanted & LINE_COMPONENT) != 0)
            copyChangingLines();
        else
            copyToLines(mBegin, mEnd);
    }

    void fillFlatLines() {
        for (uint32_t y = mBegin; y < mEnd; ++y)
            repeatOnLines(y, y + 1, pixelAt(mX, y));
    }

    /// From band to band all pixels of a line change by the same bits.
    void copyChangingLines() {
        Pixel held = pixelAt(mX, mBegin);
        for (uint32_t y = mBegin; y < mEnd;) {
            const Band band = bandAt(mPicture, y, mEnd);
            const Pixel pixel = pixelAt(mX, y);
            if (pixel != held)
                flipBits(mPiece, mCount * sizeof(Pixel), repeatedInWord(static_cast<Pixel>(held ^ pixel)));
            held = pixel;
            copyToLines(y, band.end);
            y = band.end;
        }
    }

    void build(uint32_t x, uint32_t y, uint32_t count) {
        PatternRun run;
        for (uint32_t done = 0, pixels = 0; done < count; done += pixels) {
            pixels = std::min(count - done, PatternRun::MAX_PIXELS);
            patternRun(mPicture, x + done, y, pixels, run);
            encodeRun(mLayout, run, pixels, mPiece + done);
        }
    }

    Pixel pixelAt(uint32_t x, uint32_t y) const { return encodePixel(mLayout, patternPixel(mPicture, x, y)); }

    /// Works on copies: what is written to the buffer might be any member as far as the compiler knows.
    void copyToLines(uint32_t begin, uint32_t end) const {
        const PixelRows<Pixel> rows = mRows;
        const uint32_t x = mX;
        const uint32_t count = mCount;
        for (uint32_t y = begin; y < end; ++y)
            rows.copy(x, y, mPiece, count);
    }

    void repeatOnLines(uint32_t begin, uint32_t end, Pixel pixel) const {
        const PixelRows<Pixel> rows = mRows;
        const uint32_t x = mX;
        const uint32_t count = mCount;
        for (uint32_t y = begin; y < end; ++y)
            rows.repeat(x, y, pixel, count);
    }

    /// In columns of the piece.
    Span clipped(const Span& span) const {
        const auto inPiece = [&](uint32_t x) { return std::clamp(x, mX, mX + mCount) - mX; };
        return {inPiece(span.begin), inPiece(span.end)};
    }

    void put(uint32_t begin, uint32_t end, Pixel pixel) {
        if (begin < end)
            std::fill(mPiece + begin, mPiece + end, pixel);
    }

    alignas(64) Pixel mPiece[PIECE + DIAGONAL_PERIOD]; ///< the part of one line that lies in these columns

    Layout mLayout;
    PatternPicture mPicture;
    PixelRows<Pixel> mRows;

    // The lines of the region, and the columns that are being filled.
    uint32_t mBegin = 0;
    uint32_t mEnd = 0;
    uint32_t mX = 0;
    uint32_t mCount = 0;
};

template <class Layout>
void fillPattern(unsigned char* mem, uint32_t pitch, const Layout& layout, PatternPicture picture,
                 const Region& region) {
    float bars[24];
    VideoTestImage::generateColorBarData(bars, bars + 8, bars + 16, picture.pattern, 1);
    picture.bars = bars;
    PatternFiller<Layout>(layout, picture, mem, pitch).fill(region);
}

} // namespace

void VideoTestImage::fillTestPattern(unsigned char* mem, uint32_t colOrder, uint32_t width, uint32_t height,
                                     uint32_t pitch, uint32_t sig_sel, uint32_t fd, uint32_t posX,
                                     uint32_t posY, uint32_t sizeX, uint32_t sizeY, bool isFp16) {
    const PatternPicture picture = {sig_sel, width, height, 1, fd, nullptr};
    const Region region = {posX, posY, sizeX, sizeY};
    if (isFp16)
        fillPattern(mem, pitch, PackedHalfFloats{memoryOrderOf(colOrder)}, picture, region);
    else
        fillPattern(mem, pitch, PackedBytes{memoryOrderOf(colOrder)}, picture, region);
}

void VideoTestImage::fillTestPatternPlanar(unsigned char* mem, uint32_t width, uint32_t height,
                                           uint32_t pitch, uint32_t sig_sel, uint32_t fd, uint32_t colour,
                                           uint32_t byte_per_col, uint32_t posX, uint32_t posY,
                                           uint32_t sizeX, uint32_t sizeY) {
    const PatternPicture picture = {sig_sel, width, height, byte_per_col, fd, nullptr};
    const Region region = {posX, posY, sizeX, sizeY};
    switch (byte_per_col) {
    case 1:
        return fillPattern(mem, pitch, Plane<uint8_t>{colour}, picture, region);
    case 2:
        return fillPattern(mem, pitch, Plane<uint16_t>{colour}, picture, region);
    case 4:
        return fillPattern(mem, pitch, Plane<uint32_t>{colour}, picture, region);
    default:
        return;
    }
}
