#ifndef FWZEL_VIDEOTESTIMAGE_H
#define FWZEL_VIDEOTESTIMAGE_H

#include <FwZel/Export.h>

#include <cstdint>
#include <string>

class Texture;

class FWZEL_API VideoTestImage {
public:
    enum texColourOrder { COL_ARGB = 0, COL_RGBA = 1, COL_ABGR = 2, COL_BARG = 3 };

    enum testPattern : uint32_t {
        COMBI = 0,
        H_RAMP = 1,
        V_RAMP = 2,
        HV_RAMP = 3,
        H_RAMP_SHAROW = 4,
        H_RAMP_SHAROW_Y = 5,
        H_RAMP_10BIT = 6,
        H_RAMP_10BIT_2 = 7,
        H_RAMP_MAXVAL = 8,
        CENTRE = 9,
        WHITE_FRAME = 10,
        H_GRID = 11,
        V_GRID = 12,
        H_IMPULSE = 13,
        CIRCLE = 14,
        DIGONAL_LINE = 15,
        COLOUR_MATS = 16,
        COLOUR_BAR_100 = 17,
        COLOUR_BAR_75 = 18,
        H_SWEEP = 19,
        COLOUR_MAT_BLACK = 20,
        COLOUR_MAT_WHITE = 21,
        NO_TEST_PATTERN = 0xFFFFFFFF
    };

    VideoTestImage() = default;
    ~VideoTestImage() = default;

    static void RGBToCrYCb(float* src, float* dst);
    static void generateColorBarData(float* Cr, float* Y, float* Cb, uint32_t type, uint32_t isRGB);
    static uint16_t uint8ToFp16(uint8_t in);

    static void generatePatternData(uint32_t sig_sel, uint32_t width, uint32_t height, uint32_t x, uint32_t y,
                                    uint32_t byte_per_col, uint32_t fd, uint32_t* data, float* colbarCol);

    static void fillTestPattern(unsigned char* mem, uint32_t colOrder, uint32_t width, uint32_t height,
                                uint32_t pitch, uint32_t sig_sel, uint32_t fd, uint32_t posX, uint32_t posY,
                                uint32_t sizeX, uint32_t sizeY, bool isFp16);
    static void fillTestPatternPlanar(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                      uint32_t sig_sel, uint32_t fd, uint32_t colour, uint32_t byte_per_col,
                                      uint32_t posX, uint32_t posY, uint32_t sizeX, uint32_t sizeY);
    static void fillColour(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                           uint32_t* fill);
    static void fillColourPlanar(unsigned char* mem, uint32_t width, uint32_t height, uint32_t pitch,
                                 uint32_t byte_per_col, uint32_t fill);
    static void fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t posX, uint32_t posY,
                                   uint32_t sizeX, uint32_t sizeY, uint32_t texBufIndex, uint32_t fid,
                                   bool isFp16);
    static void fillTexturePattern(Texture* tex, uint32_t pattern, uint32_t texBufIndex, uint32_t fid,
                                   bool isFp16);
    static void fillTextureColour(Texture* tex, uint32_t Cr, uint32_t Y, uint32_t Cb, uint32_t K,
                                  uint32_t posX, uint32_t posY, uint32_t sizeX, uint32_t sizeY, uint32_t fid);
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
