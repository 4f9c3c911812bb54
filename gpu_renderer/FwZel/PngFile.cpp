#include <FwZel/PngFile.h>

#include <FwZel/FieldRows.h>
#include <FwZel/HalfFloat.h>
#include <FwZel/PictureSize.h>
#include <FwZel/RefusalWords.h>
#include <FwZel/RowExpansion.h>
#include <FwZel/Texture.h>

#include <png.h>

#include <algorithm>
#include <cerrno>
#include <csetjmp>
#include <cstdio>
#include <cstring>
#include <memory>
#include <new>

namespace {

constexpr size_t SIGNATURE_BYTES = 8;
constexpr uint32_t COMPONENTS = 4; // of a row as it comes from libpng: R, G, B, A
constexpr int ADAM7_PASSES = 7;

enum class Refusal {
    NONE,
    NOT_OPENED,
    NOT_READ,
    NO_SIGNATURE,
    NO_MEMORY,
    DAMAGED_HEADER,
    COLOUR_TYPE,
    TOO_LARGE
};

/// Where the rows of the file go.
struct Destination {
    unsigned char* rows;
    size_t pitch;             // bytes from one row to the next
    uint32_t rowCount;        // rows to fill at most
    size_t elements;          // components to write in a row
    uint32_t bytesPerElement; // 1, or 2 for half floats
    FieldRows field;
};

/// A PNG file that is being read: the file, libpng's structures and a row. They are released by the
/// destructor, which no jump of libpng passes: every call that can jump stands in a step of guarded().
class PngReading {
public:
    /// Whether libpng prints what it finds wrong, or keeps it for errorText().
    enum class Errors { PRINTED, KEPT };

    explicit PngReading(Errors errors) : mErrors(errors) {}
    ~PngReading();
    PngReading(const PngReading&) = delete;
    PngReading& operator=(const PngReading&) = delete;

    /// Opens the file and reads all up to the pixels. After NONE the size, colour type and bit depth are
    /// known.
    Refusal readHeader(const char* fileName);

    /// Whether the pixels can be read, now that the header is.
    Refusal judgeContent() const;

    /// Reads the pixels. False when there was no memory for it or the file is damaged.
    bool readRows(const Destination& to);

    uint32_t width() const { return mWidth; }
    uint32_t height() const { return mHeight; }
    int colourType() const { return mColourType; }
    int bitDepth() const { return mBitDepth; }
    int systemError() const { return mSystemError; }
    const char* errorText() const { return mErrorText; }

private:
    template <class Step>
    bool guarded(Step step);
    static void keepError(png_structp png, png_const_charp text);
    static void dropWarning(png_structp /*png*/, png_const_charp /*text*/) {}

    Refusal readSignature(const char* fileName);
    void demandRgbaBytes();
    void readSequentialRows(const Destination& to);
    void readAdam7Rows(const Destination& to);
    void placePixels(const Destination& to, unsigned char* row, int pass) const;

    Errors mErrors;
    FILE* mFile = nullptr;
    png_structp mPng = nullptr;
    png_infop mInfo = nullptr;
    std::unique_ptr<uint8_t[]> mRow;
    uint32_t mWidth = 0;
    uint32_t mHeight = 0;
    int mColourType = 0;
    int mBitDepth = 0;
    int mSystemError = 0;
    char mErrorText[128] = "";
};

PngReading::~PngReading() {
    png_destroy_read_struct(&mPng, &mInfo, nullptr);
    if (mFile != nullptr)
        std::fclose(mFile);
}

// The one place that libpng jumps back to. A step has no local with a destructor.
template <class Step>
bool PngReading::guarded(Step step) {
    if (setjmp(png_jmpbuf(mPng)) != 0) // libpng's only way to report an error
        return false;
    step();
    return true;
}

void PngReading::keepError(png_structp png, png_const_charp text) {
    auto& self = *static_cast<PngReading*>(png_get_error_ptr(png));
    std::snprintf(self.mErrorText, sizeof self.mErrorText, "%s", text);
    png_longjmp(png, 1);
}

Refusal PngReading::readSignature(const char* fileName) {
    mFile = std::fopen(fileName, "rb");
    if (mFile == nullptr) {
        mSystemError = errno;
        return Refusal::NOT_OPENED;
    }
    png_byte header[SIGNATURE_BYTES] = {};
    const size_t bytes = std::fread(header, 1, SIGNATURE_BYTES, mFile);
    if (std::ferror(mFile) != 0) {
        mSystemError = errno;
        return Refusal::NOT_READ;
    }
    const bool isSigned = bytes == SIGNATURE_BYTES && png_sig_cmp(header, 0, SIGNATURE_BYTES) == 0;
    return isSigned ? Refusal::NONE : Refusal::NO_SIGNATURE;
}

Refusal PngReading::readHeader(const char* fileName) {
    const Refusal refusal = readSignature(fileName);
    if (refusal != Refusal::NONE)
        return refusal;
    // libpng takes no caller that was built for another series, so the version is that of its header.
    const bool isKept = mErrors == Errors::KEPT;
    mPng = png_create_read_struct(PNG_LIBPNG_VER_STRING, isKept ? this : nullptr,
                                  isKept ? keepError : nullptr, isKept ? dropWarning : nullptr);
    mInfo = mPng != nullptr ? png_create_info_struct(mPng) : nullptr;
    if (mInfo == nullptr)
        return Refusal::NO_MEMORY;
    const bool isRead = guarded([this] {
        png_init_io(mPng, mFile);
        png_set_sig_bytes(mPng, SIGNATURE_BYTES);
        // Chunks that the picture does not need are skipped unread: a thousand compressed texts of a few
        // kilobytes could unfold to gigabytes. IHDR, PLTE, tRNS, IDAT and IEND are always read.
        png_set_keep_unknown_chunks(mPng, PNG_HANDLE_CHUNK_NEVER, nullptr, -1);
        png_read_info(mPng, mInfo);
        mWidth = png_get_image_width(mPng, mInfo);
        mHeight = png_get_image_height(mPng, mInfo);
        mColourType = png_get_color_type(mPng, mInfo);
        mBitDepth = png_get_bit_depth(mPng, mInfo);
    });
    return isRead ? Refusal::NONE : Refusal::DAMAGED_HEADER;
}

Refusal PngReading::judgeContent() const {
    if (mColourType != PNG_COLOR_TYPE_RGB_ALPHA && mColourType != PNG_COLOR_TYPE_RGB)
        return Refusal::COLOUR_TYPE;
    return pictureFits(mWidth, mHeight, COMPONENTS) ? Refusal::NONE : Refusal::TOO_LARGE;
}

void PngReading::demandRgbaBytes() {
    png_set_scale_16(mPng);
    if (png_get_valid(mPng, mInfo, PNG_INFO_tRNS) != 0)
        png_set_tRNS_to_alpha(mPng);
    else if ((mColourType & PNG_COLOR_MASK_ALPHA) == 0)
        png_set_add_alpha(mPng, 0xFF, PNG_FILLER_AFTER);
    png_read_update_info(mPng, mInfo);
}

bool PngReading::readRows(const Destination& to) {
    mRow.reset(new (std::nothrow) uint8_t[size_t{mWidth} * COMPONENTS]);
    if (!mRow)
        return false;
    return guarded([this, &to] {
        demandRgbaBytes();
        if (png_get_rowbytes(mPng, mInfo) != size_t{mWidth} * COMPONENTS)
            png_error(mPng, "row of unexpected size");
        if (png_get_interlace_type(mPng, mInfo) == PNG_INTERLACE_NONE)
            readSequentialRows(to);
        else
            readAdam7Rows(to);
    });
}

void PngReading::readSequentialRows(const Destination& to) {
    const RowExpansion& expansion = bestRowExpansion();
    const bool isDirect = to.bytesPerElement == 1 && to.elements == size_t{mWidth} * COMPONENTS;
    const uint32_t rows = to.field.inFile(mHeight, to.rowCount);
    uint32_t fileRow = 0;
    for (uint32_t y = 0; y < rows; ++y, ++fileRow) {
        for (; fileRow < to.field.first + y * to.field.step; ++fileRow)
            png_read_row(mPng, nullptr, nullptr);
        unsigned char* const row = to.rows + y * to.pitch;
        png_read_row(mPng, isDirect ? row : mRow.get(), nullptr);
        if (to.bytesPerElement != 1)
            expansion.samplesToHalf(mRow.get(), row, to.elements);
        else if (!isDirect)
            std::memcpy(row, mRow.get(), to.elements);
    }
}

// Without libpng's own interlace handling, which would need every row of the picture to stay in memory
// through all passes, png_read_row() gives the bare rows of each pass. Their pixels go straight to their
// places.
void PngReading::readAdam7Rows(const Destination& to) {
    const uint32_t rows = to.field.inFile(mHeight, to.rowCount);
    for (int pass = 0; pass < ADAM7_PASSES; ++pass) {
        const uint32_t passRows = PNG_PASS_COLS(mWidth, pass) > 0 ? PNG_PASS_ROWS(mHeight, pass) : 0;
        for (uint32_t passRow = 0; passRow < passRows; ++passRow) {
            png_read_row(mPng, mRow.get(), nullptr);
            const uint32_t fileRow = PNG_ROW_FROM_PASS_ROW(passRow, pass);
            const uint32_t y = (fileRow - to.field.first) / to.field.step;
            const bool isInField = fileRow % to.field.step == to.field.first;
            if (isInField && y < rows)
                placePixels(to, to.rows + y * to.pitch, pass);
        }
    }
}

void PngReading::placePixels(const Destination& to, unsigned char* row, int pass) const {
    const uint8_t* pixel = mRow.get();
    const uint32_t step = PNG_PASS_COL_OFFSET(pass);
    // cppcheck-suppress constStatement ; the braces of size_t{} are taken for a block
    for (size_t e = size_t{COMPONENTS} * PNG_PASS_START_COL(pass); e < to.elements;
         e += size_t{COMPONENTS} * step, pixel += COMPONENTS) {
        const size_t count = std::min<size_t>(COMPONENTS, to.elements - e);
        if (to.bytesPerElement == 1) {
            std::memcpy(row + e, pixel, count);
            continue;
        }
        for (size_t c = 0; c < count; ++c)
            std::memcpy(row + 2 * (e + c), &HALF_FLOAT_CODES[pixel[c]], 2);
    }
}

const char* colourTypeName(int colourType) {
    switch (colourType) {
    case PNG_COLOR_TYPE_GRAY:
        return "grey";
    case PNG_COLOR_TYPE_GRAY_ALPHA:
        return "grey with alpha";
    default:
        return "palette";
    }
}

std::string inWords(Refusal refusal, const PngReading& file) {
    switch (refusal) {
    case Refusal::NONE:
        break;
    case Refusal::NOT_OPENED:
        return notOpenedInWords(file.systemError());
    case Refusal::NOT_READ:
        return notReadInWords(file.systemError());
    case Refusal::NO_SIGNATURE:
        return "it does not start with the PNG signature";
    case Refusal::NO_MEMORY:
        return "there is no memory to read it";
    case Refusal::DAMAGED_HEADER:
        return std::string("its header is damaged (libpng: ") + file.errorText() + ")";
    case Refusal::COLOUR_TYPE:
        return std::string("its colour type is ") + colourTypeName(file.colourType()) +
               "; only RGB and RGB with alpha are read";
    case Refusal::TOO_LARGE:
        return tooLargeInWords(file.width(), file.height());
    }
    return {};
}

} // namespace

int getWidthHeightFromPngFile(std::string fname, uint32_t* width, uint32_t* height, uint32_t* bytePerCol) {
    PngReading file(PngReading::Errors::PRINTED);
    if (file.readHeader(fname.c_str()) != Refusal::NONE)
        return -1;
    *width = file.width();
    *height = file.height();
    if (file.judgeContent() == Refusal::COLOUR_TYPE)
        return -1;
    *bytePerCol = file.bitDepth() == 8 ? 1 : 2;
    return 0;
}

void fillTextureFromPngFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                            uint32_t /*shift*/, bool /*isFp16*/) {
    Destination to = {};
    to.rows = tex->getAddress(texBufIndex);
    to.bytesPerElement = tex->getBytesPerColour();
    if (to.rows == nullptr || (to.bytesPerElement != 1 && to.bytesPerElement != 2))
        return;
    PngReading file(PngReading::Errors::PRINTED);
    if (file.readHeader(filename.c_str()) != Refusal::NONE || file.judgeContent() != Refusal::NONE)
        return;
    to.pitch = tex->getPitch();
    to.rowCount = tex->getHeight();
    to.elements = std::min({size_t{file.width()} * COMPONENTS, size_t{tex->getWidth()} * tex->getNumColours(),
                            to.pitch / to.bytesPerElement});
    to.field = fieldRows(fid);
    file.readRows(to);
}

std::string refusalOfPngFile(const std::string& fileName) {
    PngReading file(PngReading::Errors::KEPT);
    Refusal refusal = file.readHeader(fileName.c_str());
    if (refusal == Refusal::NONE)
        refusal = file.judgeContent();
    return inWords(refusal, file);
}
