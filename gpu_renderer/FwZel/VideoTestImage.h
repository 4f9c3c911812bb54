#ifndef FWZEL_VIDEOTESTIMAGE_H
#define FWZEL_VIDEOTESTIMAGE_H

#include <FwZel/Export.h>

#include <cstdint>
#include <string>

class Texture;

/// Broadcast video test patterns and flat colours: single pixels, raw memory and textures; and the numbers
/// under them: ITU-R BT.709 colour conversion, colour bars and half floats.
///
/// Stateless: every operation is static. Makes no OpenGL call. Results are single precision and the same on
/// every machine.
///
/// Components: a pixel has four, called r, g, b, a; in a Y'CbCr picture the same positions carry Cr, Y', Cb
/// and the key K. No pattern is converted: some are laid out for one reading, some for the other
/// (TestPatternCatalogue.h says which).
///
/// Field: 0 even field, 1 odd field, 2 whole frame. In a field, heights and line numbers are those of the
/// field; its line y lies on frame line 2 * y + field.
///
/// Packed pixels: four components, one byte each or one 16-bit half float each, in the memory order of a
/// texColourOrder. Planes: one component an element, 1, 2 or 4 bytes in the machine's byte order.
///
/// The fillers write and never read their destination, which may be a write-only mapping; they allocate
/// nothing, do not throw, use less than 128 KiB of stack, and take destinations of any alignment. What lies
/// outside the region keeps its bytes. Indices into the destination are computed in unsigned 32 bits and
/// counted in components; a region whose right or bottom edge passes 2^32 - 1 is empty. Regions, pitches and
/// component numbers are not checked against the buffer.
///
/// Thread: any. Nothing is locked: keep others away from a buffer while it is filled.
class FWZEL_API VideoTestImage {
public:
    /// Order of a packed pixel's components in memory, from the lowest address. Any other value works as
    /// COL_BARG.
    enum texColourOrder { COL_ARGB = 0, COL_RGBA = 1, COL_ABGR = 2, COL_BARG = 3 };

    /// The patterns. At a component depth of 1, 2 or 4 bytes, full scale is all bits set, a line has full
    /// scale less 1, the mid code has the highest bit alone, and video black is code 16 in the top byte.
    /// Unless said otherwise a is full scale.
    enum testPattern : uint32_t {
        /// Lines 0 to 3 ramp b, g, r, a alone, the others 0; lines 4 to 255 are V_RAMP, the rest is H_RAMP.
        COMBI = 0,
        H_RAMP = 1,  ///< grey, x in the top byte, from 0 again every 256 columns
        V_RAMP = 2,  ///< grey, y in the top byte, from 0 again every 256 lines
        HV_RAMP = 3, ///< r from 0 to just below full scale across the width, b down the height; g mid code
        H_RAMP_SHAROW = 4,   ///< grey, from 0 to just below full scale across the width
        H_RAMP_SHAROW_Y = 5, ///< g from 0 to just below full scale across the width; r and b mid code
        /// Grey, x in the top 10 bits, from 0 again every 1024 columns. At one byte as H_RAMP.
        H_RAMP_10BIT = 6,
        H_RAMP_10BIT_2 = 7, ///< as H_RAMP_10BIT, the bits below filled with the low bits of x
        H_RAMP_MAXVAL = 8,  ///< all four components fall from full scale, one code a column
        /// Cross of grey lines on black: columns width / 2 - 1 and width / 2; in a frame lines height / 2 - 1
        /// and height / 2, the odd field having the first of them and the even field the second.
        CENTRE = 9,
        WHITE_FRAME = 10, ///< border one pixel wide: g a line, 0 within; r and b mid code
        H_GRID = 11,      ///< columns 2, 5, 8 ...: g a line, 0 between; r and b mid code
        V_GRID = 12,      ///< lines 0, 1, 100, 101, 200 ...: g a line, 0 between; r and b mid code
        H_IMPULSE = 13,   ///< column width / 2 a grey line; elsewhere g video black, r and b mid code
        /// White disc in the middle, on black; its radius is a sixteenth of the width, in columns and in
        /// lines of the frame.
        CIRCLE = 14,
        DIGONAL_LINE = 15, ///< where x mod 50 = y mod 50 g is 0, elsewhere a line; r and b mid code
        /// Quarters of the width: r, g and b a line, then grey mid code. The others of r, g, b are 0 in the
        /// upper half; in the lower half they are mid code, but g in the field of r and r in the field of b
        /// stay 0.
        COLOUR_MATS = 16,
        /// Eight bars, width / 8 wide, from the caller's table; in what is left of the width the first again.
        COLOUR_BAR_100 = 17,
        COLOUR_BAR_75 = 18, ///< the same: the table makes the difference
        /// Sines between 10 % and 90 % of full scale, the frequency rising from 0 at the left edge to 0.5
        /// cycle a pixel at the right edge in g, 0.25 in r and b.
        H_SWEEP = 19,
        COLOUR_MAT_BLACK = 20,       ///< black
        COLOUR_MAT_WHITE = 21,       ///< full scale in all components
        NO_TEST_PATTERN = 0xFFFFFFFF ///< 0 in all components, as for every other number
    };

    VideoTestImage() = default;
    ~VideoTestImage() = default;

    /// Converts R'G'B' to Cr, Y', Cb with the coefficients of ITU-R BT.709 and its studio range on a scale of
    /// 256 steps: Y' from 16/256 to 235/256, Cr and Cb from 16/256 to 240/256, each raised by 1/2048, half a
    /// step at 10 bits. Nothing is clamped.
    /// @param src  R', G', B', each from 0 to 1
    /// @param dst  receives Cr, Y', Cb; may be src
    static void RGBToCrYCb(float* src, float* dst);

    /// Writes the colour bars white, yellow, cyan, green, magenta, red, blue, black.
    /// @param Cr,Y,Cb  eight entries each, from 0 to 1; receive R', G', B' when isRGB
    /// @param type     COLOUR_BAR_75: bars at 75 % with a white at 100 %; any other value: bars at 100 %
    /// @param isRGB    0: studio range, at 75 % the 8-bit codes of the ITU-R BT.709 bars divided by 255, at
    ///                 100 % what RGBToCrYCb() gives
    static void generateColorBarData(float* Cr, float* Y, float* Cb, uint32_t type, uint32_t isRGB);

    /// The half float (IEEE 754 binary16) of in / 255: 0 gives 0x0000, 255 gives 0x3C00. Truncated, not
    /// rounded: 123 of the 256 codes are one unit below what rounding hardware gives.
    static uint16_t uint8ToFp16(uint8_t in);

    /// Computes one pixel of a pattern. This is the definition of the patterns; every filler writes what it
    /// gives.
    /// @param sig_sel       a testPattern value
    /// @param width,height  the whole picture in pixels; bars narrower than 8 pixels in all: every column is
    ///                      bar 0
    /// @param x,y           position in the picture; beyond its edges the patterns go on
    /// @param byte_per_col  component depth in bytes: 1, 2 or 4; any other value works as 1
    /// @param fd            field; CENTRE and CIRCLE go by it
    /// @param data          receives r, g, b, a. The three ramps across the width or height may exceed full
    ///                      scale beyond the picture's edges
    /// @param colbarCol     three arrays of eight entries, one after the other, as generateColorBarData()
    ///                      makes them; read for the colour bars only. An entry of 1 gives 0 at four bytes,
    ///                      where full scale in single precision is 2^32
    static void generatePatternData(uint32_t sig_sel, uint32_t width, uint32_t height, uint32_t x, uint32_t y,
                                    uint32_t byte_per_col, uint32_t fd, uint32_t* data, float* colbarCol);

    /// Fills a region of packed pixels with the part of a pattern that lies under it, at one byte a
    /// component. Colour bars are R'G'B'.
    /// @param mem            pixel 0, 0 of the buffer
    /// @param colOrder       a texColourOrder value
    /// @param width,height   the whole picture in pixels
    /// @param pitch          pixels from one row to the next
    /// @param sig_sel        a testPattern value
    /// @param fd             field
    /// @param posX,posY      top left corner of the region in pixels
    /// @param sizeX,sizeY    its size in pixels; 0 writes nothing
    /// @param isFp16         components are half floats, as uint8ToFp16() makes them
    static void fillTestPattern(unsigned char* mem, uint32_t colOrder, uint32_t width, uint32_t height,
                                uint32_t pitch, uint32_t sig_sel, uint32_t fd, uint32_t posX, uint32_t posY,
                                uint32_t sizeX, uint32_t sizeY, bool isFp16);

    /// Fills a region of one plane with one component of a pattern. Colour bars are R'G'B'.
    /// @param pitch         elements from one row to the next
    /// @param colour        component: 0 r, 1 g, 2 b, 3 a; above 3 is outside the contract
    /// @param byte_per_col  bytes an element, and the depth of the pattern: 1, 2 or 4; any other value writes
    ///                      nothing
    /// The others as above.
    static void fillTestPatternPlanar(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                      uint32_t sig_sel, uint32_t fd, uint32_t colour, uint32_t byte_per_col,
                                      uint32_t posX, uint32_t posY, uint32_t sizeX, uint32_t sizeY);

    /// Fills width x height packed 8-bit pixels from mem on with one colour.
    /// @param pitch  pixels from one row to the next
    /// @param fill   four components in memory order; the low byte of each is stored
    static void fillColour(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                           uint32_t* fill);

    /// Fills width x height elements of one plane from mem on.
    /// @param pitch         elements from one row to the next
    /// @param byte_per_col  bytes an element: 1, 2 or 4; any other value writes nothing
    /// @param fill          its low bits are stored
    static void fillColourPlanar(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                 uint32_t byte_per_col, uint32_t fill);

    /// Fills a region of one host buffer with the part of a pattern that lies under it, in the texture's size
    /// and colour order. Does nothing to a null buffer.
    /// @param tex          four components of one byte a pixel, or of two when isFp16; not checked
    /// @param texBufIndex  buffer number, reduced by AND with the number of buffers - 1
    /// @param fid          field that the pattern is computed for
    /// @param isFp16       writes half floats; goes before the texture's own format
    static void fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t posX, uint32_t posY,
                                   uint32_t sizeX, uint32_t sizeY, uint32_t texBufIndex, uint32_t fid,
                                   bool isFp16);

    /// Fills the whole of one host buffer.
    static void fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t texBufIndex, uint32_t fid,
                                   bool isFp16);

    /// Fills a region of every host buffer with one colour, in the texture's colour order; null buffers are
    /// passed over. Logs a message without number, and writes nothing, when the texture does not have four
    /// components of one byte.
    /// @param Cr,Y,Cb,K  the colour, Cr in the place of r and so on; the low byte of each is stored
    /// @param sizeY      lines
    /// @param fid        lines within each buffer: 2 every line of the region; 0 its first, third, fifth line
    ///                   ...; 1 its second, fourth ...; any other value as 0. Except for 2, sizeY / 2 lines
    ///                   in all, so the last line of an odd number keeps its pixels
    static void fillTextureColour(Texture* tex, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K,
                                  uint32_t posX, uint32_t posY, uint32_t sizeX, uint32_t sizeY, uint32_t fid);

    /// Fills every host buffer, whole.
    static void fillTextureColour(Texture* tex, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K,
                                  uint32_t fid);

    /// Fills a host buffer of a texture from a picture file, by the reader that the file name's last four
    /// characters choose: ".png" fillTextureFromPngFile() (PngFile.h), ".ppm" fillTextureFromPpmFile()
    /// (PpmFile.h), in lower case. Any other extension does nothing. What is written, and of which files,
    /// stands with the readers; pictureRefusal() (PictureRefusal.h) tells in words why a file is refused.
    /// @param texBufIndex  buffer, reduced by the texture
    /// @param fid          0 even field, 1 odd field, 2 whole frame
    /// @param shift        extra left shift of integer samples in bits (PPM only), 0 for none
    /// @param isFp16       two-byte components are half floats (PPM only: of PNG files they always are)
    /// @throw std::out_of_range  the name is shorter than four characters
    static void fillTextureFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                                uint32_t shift, bool isFp16);

    /// Reads a picture file's size by the reader that fillTextureFile() takes.
    /// @param width,height  pixels, as the file declares them: any 32-bit number
    /// @param bytePerCol    1 or 2: the size of the file's samples, which the readers convert from
    /// @return the reader's result: 0, or -1 for a file that cannot be opened or whose header is refused. An
    ///         extension without a reader gives 0 and writes nothing: preset width and height to 0 to tell.
    /// @throw std::out_of_range  the name is shorter than four characters
    static int getWidthHeightFromFile(std::string fname, uint32_t* width, uint32_t* height,
                                      uint32_t* bytePerCol);

private:
    union fp32Union {
        int i;
        float f;
    };

    static uint16_t fp32Tofp16(float fp32);
};

#endif
