#include <FwZel/PpmFile.h>

#include <FwZel/FieldRows.h>
#include <FwZel/PictureSize.h>
#include <FwZel/PpmBytes.h>
#include <FwZel/RefusalWords.h>
#include <FwZel/RowExpansion.h>
#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <new>

namespace {

constexpr size_t LINE_CHARS = 256; // with the terminating 0
constexpr uint32_t COMPONENTS = 4; // of a texture's pixel
constexpr size_t FILE_PIXEL_BYTES = 3;

struct PPMHeader {
    FILE* fp;
    unsigned int width;
    unsigned int height;
    char fmt[LINE_CHARS];
    char bit[LINE_CHARS];
};

enum ReadResult { HEADER_READ = 0, WRONG_MAGIC = 3, LINE_TOO_LONG = 4, STREAM_ERROR = 5 };

struct FileCloser {
    void operator()(FILE* fp) const { std::fclose(fp); }
};
using File = std::unique_ptr<FILE, FileCloser>;

File openFile(const std::string& fileName) {
    return File(std::fopen(fileName.c_str(), "rb"));
}

[[noreturn]] void endProcess() {
    std::exit(1); // the documented end of a stream error
}

// Reads up to the delimiter or the end of the file. LINE_TOO_LONG: the line is full; one character
// more has been read, which is not the last of it.
ReadResult readLine(FILE* fp, char* line, char delimiter) {
    size_t length = 0;
    line[0] = '\0';
    while (std::ferror(fp) == 0) {
        const int c = std::fgetc(fp); // an int: neither byte 0xFF nor an error is the end of the file
        if (c == static_cast<unsigned char>(delimiter) || (c == EOF && std::feof(fp) != 0))
            return HEADER_READ;
        if (c == EOF)
            continue;
        if (length == LINE_CHARS - 1)
            return LINE_TOO_LONG;
        line[length] = static_cast<char>(c);
        line[++length] = '\0';
    }
    return STREAM_ERROR;
}

ReadResult readEffectiveLine(FILE* fp, char* line) {
    ReadResult result = HEADER_READ;
    do {
        result = readLine(fp, line, '\n');
    } while (result == HEADER_READ && detComment(line) != 0);
    return result;
}

ReadResult readPPMHeader(FILE* fp, PPMHeader* header) {
    header->fp = fp;
    ReadResult result = readEffectiveLine(fp, header->fmt);
    const bool isLongComment = result == LINE_TOO_LONG && detComment(header->fmt) != 0;
    if (result != STREAM_ERROR && !isLongComment && std::strncmp(header->fmt, "P6", 2) != 0)
        return WRONG_MAGIC;
    if (result != HEADER_READ)
        return result;
    char wh[LINE_CHARS];
    result = readEffectiveLine(fp, wh);
    if (result != HEADER_READ)
        return result;
    char* const space = std::strchr(wh, ' ');
    const char* h = "";
    if (space != nullptr) {
        *space = '\0';
        h = space + 1;
    }
    result = readEffectiveLine(fp, header->bit);
    header->width = static_cast<unsigned int>(std::strtol(wh, nullptr, 10));
    header->height = static_cast<unsigned int>(std::strtol(h, nullptr, 10));
    return result;
}

// The readers' way to the header: a stream error ends the process.
bool isHeaderAccepted(FILE* fp, PPMHeader* header) {
    const ReadResult result = readPPMHeader(fp, header);
    if (result == STREAM_ERROR)
        endProcess();
    return result == HEADER_READ;
}

bool hasPixels(const PPMHeader& header) {
    return header.width != 0 && header.height != 0;
}

bool isSizeAccepted(const PPMHeader& header) {
    return pictureFits(header.width, header.height, COMPONENTS);
}

/// The first pixels of a file in order, read in pieces. Where the file ends early they go on as zeros.
class PixelStream {
public:
    /// @param fp      stands behind the header
    /// @param pixels  how many next() will be asked for in all
    PixelStream(FILE* fp, uint64_t pixels) : mFile(fp), mUnread(pixels * FILE_PIXEL_BYTES) {
        // The first piece ends at a block of the file. From there on stdio reads whole blocks straight into
        // the buffer, without its own in between.
        const long headerEnd = std::ftell(fp);
        mNextPiece = PIECE_BYTES - (headerEnd > 0 ? static_cast<size_t>(headerEnd) % BLOCK_BYTES : 0);
        mBuffer.reset(new (std::nothrow) uint8_t[CARRY_BYTES + std::min<uint64_t>(PIECE_BYTES, mUnread)]);
    }

    bool hasMemory() const { return mBuffer != nullptr; }

    /// The next pixels, valid until the next call.
    /// @param pixels  at most so many, at least 1; receives how many there are, 1 or more
    const uint8_t* next(size_t& pixels) {
        if (mEnd - mPosition < FILE_PIXEL_BYTES)
            readPiece();
        pixels = std::min(pixels, (mEnd - mPosition) / FILE_PIXEL_BYTES);
        const uint8_t* const run = mBuffer.get() + mPosition;
        mPosition += pixels * FILE_PIXEL_BYTES;
        return run;
    }

private:
    static constexpr size_t PIECE_BYTES = size_t{128} * 1024;
    static constexpr size_t BLOCK_BYTES = 4096;
    static constexpr size_t CARRY_BYTES = FILE_PIXEL_BYTES - 1; // the begun pixel at the end of a piece

    void readPiece() {
        const size_t carried = mEnd - mPosition;
        std::memmove(mBuffer.get(), mBuffer.get() + mPosition, carried);
        uint8_t* const piece = mBuffer.get() + carried;
        const auto asked = static_cast<size_t>(std::min<uint64_t>(mNextPiece, mUnread));
        const size_t bytes = mIsAtEnd ? 0 : std::fread(piece, 1, asked, mFile);
        std::memset(piece + bytes, 0, asked - bytes);
        mIsAtEnd = bytes < asked;
        mUnread -= asked;
        mNextPiece = PIECE_BYTES;
        mPosition = 0;
        mEnd = carried + asked;
    }

    FILE* mFile;
    uint64_t mUnread; // bytes
    std::unique_ptr<uint8_t[]> mBuffer;
    size_t mNextPiece;
    size_t mPosition = 0;
    size_t mEnd = 0;
    bool mIsAtEnd = false;
};

/// Writes the file's pixels as those of a texture.
class PixelWriter {
public:
    PixelWriter(uint32_t bytesPerColour, bool isFp16, uint32_t shift)
        : mExpansion(bestRowExpansion()), mForm(formOf(bytesPerColour, isFp16, shift)) {
        const uint64_t left = uint64_t{shift} + 8 * (bytesPerColour - 1);
        for (uint32_t sample = 0; sample < mShifted.size(); ++sample)
            mShifted[sample] = left < 16 ? static_cast<uint16_t>(sample << left) : uint16_t{0};
    }

    void write(const uint8_t* rgb, unsigned char* out, size_t pixels) const {
        switch (mForm) {
        case Form::BYTE:
            mExpansion.rgbToRgba(rgb, out, pixels);
            break;
        case Form::HALF:
            mExpansion.rgbToHalfRgba(rgb, out, pixels);
            break;
        case Form::SHIFTED_BYTE:
            writeShifted<uint8_t>(rgb, out, pixels, 0xFF);
            break;
        case Form::SHIFTED_WORD:
            writeShifted<uint16_t>(rgb, out, pixels, mShifted[0xFF]);
            break;
        }
    }

private:
    enum class Form { BYTE, HALF, SHIFTED_BYTE, SHIFTED_WORD };

    static Form formOf(uint32_t bytesPerColour, bool isFp16, uint32_t shift) {
        if (bytesPerColour == 1)
            return shift == 0 ? Form::BYTE : Form::SHIFTED_BYTE;
        return isFp16 ? Form::HALF : Form::SHIFTED_WORD;
    }

    template <class Element>
    void writeShifted(const uint8_t* rgb, unsigned char* out, size_t pixels, Element alpha) const {
        for (size_t i = 0; i < pixels; ++i, rgb += FILE_PIXEL_BYTES) {
            const Element pixel[COMPONENTS] = {static_cast<Element>(mShifted[rgb[0]]),
                                               static_cast<Element>(mShifted[rgb[1]]),
                                               static_cast<Element>(mShifted[rgb[2]]), alpha};
            std::memcpy(out + sizeof pixel * i, pixel, sizeof pixel);
        }
    }

    const RowExpansion& mExpansion;
    Form mForm;
    std::array<uint16_t, 256> mShifted{}; // what each sample becomes where integers are kept
};

// Whether the rows of four components that the reader writes stay in the host buffer.
bool isBufferLargeEnough(const Texture& tex) {
    const uint64_t pixelBytes = uint64_t{COMPONENTS} * tex.getBytesPerColour();
    return tex.getPitchInPix() >= tex.getWidth() && pixelBytes * tex.getPitchInPix() <= tex.getPitch();
}

} // namespace

int getLine(FILE* fp, char* str, char descripter) {
    char rest[LINE_CHARS];
    ReadResult result = readLine(fp, str, descripter);
    while (result == LINE_TOO_LONG)
        result = readLine(fp, rest, descripter);
    if (result == STREAM_ERROR)
        endProcess();
    return 0;
}

int getEffectiveLine(FILE* fp, char* str, char descripter) {
    do {
        getLine(fp, str, descripter);
    } while (detComment(str) != 0);
    return 0;
}

int detComment(char* str) {
    return str[0] == '#' ? 1 : 0;
}

int getWidthHeightFromPpmFile(std::string fname, uint32_t* width, uint32_t* height, uint32_t* bytePerCol) {
    const File file = openFile(fname);
    PPMHeader header;
    if (!file || !isHeaderAccepted(file.get(), &header))
        return -1;
    *width = header.width;
    *height = header.height;
    *bytePerCol = std::strcmp(header.bit, "65535") == 0 ? 2 : 1;
    return 0;
}

size_t fillBytesFromPpmFile(const std::string& fileName, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                            uint32_t shift, bool isFp16) {
    const uint32_t bytesPerColour = tex->getBytesPerColour();
    unsigned char* const rows = tex->getAddress(texBufIndex);
    if (rows == nullptr || (bytesPerColour != 1 && bytesPerColour != 2) || !isBufferLargeEnough(*tex))
        return 0;
    const File file = openFile(fileName);
    PPMHeader header;
    if (!file || !isHeaderAccepted(file.get(), &header) || header.width != tex->getWidth() ||
        !isSizeAccepted(header))
        return 0;
    const FieldRows field = tex->getIsInterlaced() ? fieldRows(fid) : EVERY_ROW;
    const uint32_t texRows = field.inFile(header.height, tex->getHeight());
    const uint32_t fileRows = texRows == 0 ? 0 : field.first + (texRows - 1) * field.step + 1;
    PixelStream stream(file.get(), uint64_t{fileRows} * header.width);
    if (!stream.hasMemory())
        return 0;
    const PixelWriter writer(bytesPerColour, isFp16, shift);
    const size_t pixelBytes = size_t{COMPONENTS} * bytesPerColour;
    const size_t pitch = pixelBytes * tex->getPitchInPix();
    for (uint32_t fileRow = 0; fileRow < fileRows; ++fileRow) {
        const bool isInField = fileRow % field.step == field.first;
        unsigned char* const row = rows + pitch * (fileRow / field.step);
        size_t pixels = 0;
        for (size_t x = 0; x < header.width; x += pixels) {
            pixels = header.width - x;
            const uint8_t* const rgb = stream.next(pixels);
            if (isInField)
                writer.write(rgb, row + pixelBytes * x, pixels);
        }
    }
    return pitch * texRows;
}

void fillTextureFromPpmFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                            uint32_t shift, bool isFp16) {
    fillBytesFromPpmFile(filename, tex, texBufIndex, fid, shift, isFp16);
}

std::string refusalOfPpmFile(const std::string& fileName) {
    const File file = openFile(fileName);
    if (!file)
        return notOpenedInWords(errno);
    PPMHeader header;
    switch (readPPMHeader(file.get(), &header)) {
    case STREAM_ERROR:
        return notReadInWords(errno);
    case WRONG_MAGIC:
        return "it does not start with P6, the sign of a binary PPM file";
    case LINE_TOO_LONG:
        return "a line of its header is longer than 255 characters";
    case HEADER_READ:
        break;
    }
    if (!hasPixels(header))
        return "its header has no width and height, two numbers above 0 on a line with one space between";
    return isSizeAccepted(header) ? std::string() : tooLargeInWords(header.width, header.height);
}
