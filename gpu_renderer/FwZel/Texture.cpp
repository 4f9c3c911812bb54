#include <FwZel/Texture.h>

#include <FwZel/PictureFormat.h>
#include <FwZel/PictureSize.h>
#include <FwZel/VideoTestImage.h>
#include <FwZel/kxsys_syslog.h>

#include <epoxy/gl.h>

#include <malloc.h>
#include <sys/mman.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr uint32_t WHOLE_FRAME = 2;
constexpr uint32_t COMPONENTS_OF_A_FILL = 4;

GLint internalFormat(bool isFp16) {
    return isFp16 ? GL_RGBA16F : GL_RGBA;
}

GLenum pixelType(bool isFp16) {
    return isFp16 ? GL_HALF_FLOAT : GL_UNSIGNED_BYTE;
}

/// A byte offset into the buffer object that is bound, in the form in which OpenGL takes it.
void* bufferOffset(uint32_t bytes) {
    return reinterpret_cast<void*>(static_cast<uintptr_t>(bytes));
}

GLenum mappingTarget(bool isWriteAccess) {
    return isWriteAccess ? GL_PIXEL_UNPACK_BUFFER : GL_PIXEL_PACK_BUFFER;
}

/// Gets the memory of a fresh buffer: in huge pages, where the system gives them on request, and what lies
/// before and after them in one call each. The first fill would otherwise spend most of its time in page
/// faults. A request that fails changes nothing.
void populate(void* buffer, uint32_t bytes) {
    constexpr uintptr_t PAGE = 4096;
    constexpr uintptr_t HUGE_PAGE = uintptr_t{2} << 20;
    const auto up = [](uintptr_t address, uintptr_t page) { return (address + page - 1) & ~(page - 1); };
    const auto down = [](uintptr_t address, uintptr_t page) { return address & ~(page - 1); };
    const auto advise = [](uintptr_t begin, uintptr_t end, int advice) {
        if (begin < end)
            madvise(reinterpret_cast<void*>(begin), end - begin, advice);
    };
    const auto start = reinterpret_cast<uintptr_t>(buffer);
    const uintptr_t end = start + bytes;
    const uintptr_t hugeStart = up(start, HUGE_PAGE);
    const uintptr_t hugeEnd = down(end, HUGE_PAGE);
    if (hugeStart >= hugeEnd)
        return;
    advise(hugeStart, hugeEnd, MADV_HUGEPAGE);
    advise(up(start, PAGE), hugeStart, MADV_POPULATE_WRITE);
    advise(hugeEnd, down(end, PAGE), MADV_POPULATE_WRITE);
}

void createBuffer(GLenum target, uint32_t& name, uint32_t size, GLenum usage) {
    glGenBuffers(1, &name);
    glBindBuffer(target, name);
    glBufferData(target, static_cast<GLsizeiptr>(size), nullptr, usage);
    glBindBuffer(target, 0);
}

} // namespace

// --- Description

void Texture::setDefaultValue(TexArgs& args) {
    args.isMipMapped = false;
    args.isInterlaced = false;
    args.isPBO = false;
    args.isFBO = false;
    args.isFp16 = false;
    args.width = 1920;
    args.height = 1080;
    args.pitchInPix = 1920;
    args.numColours = COMPONENTS_OF_A_FILL;
    args.numBytesPerColour = 1;
    args.numBuffers = 1;
    args.bufAlignByte = 128;
    args.pboAlignByte = 16;
    args.pboAccessType = GL_WRITE_ONLY;
    args.colFormat = GL_RGBA;
}

void Texture::setArgsCommon(const TexArgs& args) {
    mNumColours = args.numColours;
    mNumBytesPerColour = args.isFp16 ? 2 : args.numBytesPerColour;
    mBytePerPix = mNumColours * mNumBytesPerColour;
    mNumBuffers = std::max(args.numBuffers, 1U);
    mBufAlignByte = std::max(args.bufAlignByte, 1U);
    mPboAlignByte = std::max(args.pboAlignByte, 1U);
    mPboAccessType = args.pboAccessType;
    mColFormat = args.colFormat;
    mColourOrder = COL_RGBA;
    mIsMipMapped = args.isMipMapped;
    mIsInterlaced = args.isInterlaced;
    mIsPBO = args.isPBO;
    mIsFBO = args.isFBO;
    mIsFp16 = args.isFp16;
}

void Texture::setSize(uint32_t width, uint32_t frameHeight, uint32_t pitchInPix) {
    mWidth = width;
    mHeight = mIsInterlaced ? frameHeight >> 1 : frameHeight;
    mPitchInPix = pitchInPix;
    mPitch = mBytePerPix * mPitchInPix;
}

void Texture::setArgsForTestPattern(const TexArgs& args) {
    setArgsCommon(args);
    setSize(args.width, args.height, args.pitchInPix);
}

int Texture::setArgsForFile(const TexArgs& args) {
    setArgsCommon(args);
    uint32_t width = 0;
    uint32_t height = 0;
    uint32_t bytesPerColour = 0;
    if (VideoTestImage::getWidthHeightFromFile(mFileName, &width, &height, &bytesPerColour) != 0)
        return -1;
    // An extension that no reader takes counts as success and leaves the size untouched.
    if (width == 0 || height == 0)
        return -1;
    if (!pictureFits(width, height, mBytePerPix))
        return -1;
    setSize(width, height, width);
    return 0;
}

void Texture::printParams() const {}

void Texture::dumpBuf(void* /*ptr*/) {}

// --- Construction and destruction

Texture::Texture(uint32_t testPattern, const TexArgs& args) : mTestPattern(testPattern) {
    setArgsForTestPattern(args);
    try {
        createTextureForTestPattern();
    } catch (...) {
        release();
        throw;
    }
}

Texture::Texture(std::string fileName, const TexArgs& args)
    : mTestPattern(VideoTestImage::COLOUR_MAT_BLACK), mFileName(std::move(fileName)) {
    const bool isReadable = setArgsForFile(args) == 0;
    if (!isReadable)
        setArgsForTestPattern(args);
    try {
        if (isReadable)
            createTextureForFile();
        else
            createTextureForTestPattern();
    } catch (...) {
        release();
        throw;
    }
}

Texture::~Texture() {
    release();
}

void Texture::release() {
    for (void* buffer : mHostBufPtrs)
        std::free(buffer);
    for (uint32_t i = 0; i < mFboIDs.size(); ++i)
        deleteGLBufObjects(i);
}

void Texture::createTextureForTestPattern() {
    resizeBuffers(static_cast<int>(mNumBuffers));
    for (uint32_t i = 0; i < mNumBuffers; ++i) {
        allocHostBufs(i);
        if (mHostBufPtrs[i] && mTestPattern != VideoTestImage::NO_TEST_PATTERN) {
            if (fillFitsHostBuf(mIsFp16 ? 2 : 1))
                VideoTestImage::fillTexturePattern(this, mTestPattern, i, fieldOfBuffer(i), mIsFp16);
            else
                clearHostBuf(i, 0);
        }
        createGLBufObjects(i);
    }
}

void Texture::createTextureForFile() {
    resizeBuffers(static_cast<int>(mNumBuffers));
    for (uint32_t i = 0; i < mNumBuffers; ++i) {
        allocHostBufs(i);
        if (mHostBufPtrs[i])
            fillHostBufFromFile(i);
        createGLBufObjects(i);
    }
}

/// What the file does not deliver holds no stale memory. Where a reader fills the buffer from its start, only
/// the rest is cleared; a PNG file may stop in the middle of a pass over the picture.
void Texture::fillHostBufFromFile(uint32_t buf_num) {
    const bool isFillable = fillFitsHostBuf(mNumBytesPerColour);
    const PictureFormat* const format = pictureFormat(mFileName);
    const bool isFilledFromStart = format != nullptr && format->fillFromStart != nullptr;
    const uint32_t field = fieldOfBuffer(buf_num);
    size_t filled = 0;
    if (isFillable && isFilledFromStart)
        filled = format->fillFromStart(mFileName, this, buf_num, field, 0, mIsFp16);
    clearHostBuf(buf_num, filled);
    if (isFillable && !isFilledFromStart)
        VideoTestImage::fillTextureFile(mFileName, this, buf_num, field, 0, mIsFp16);
}

uint32_t Texture::fieldOfBuffer(uint32_t buf_num) const {
    return mIsInterlaced ? buf_num & 1 : WHOLE_FRAME;
}

void Texture::resizeBuffers(int num_buf) {
    const auto count = static_cast<size_t>(num_buf);
    mGLTexIDs.resize(count);
    mHostBufPtrs.resize(count);
    mPboIDs.resize(count);
    mPboPtrs.resize(count);
    mPboOffsets.resize(count);
    mPboOnDeviceIDs.resize(count);
    mPboOnDevicePtrs.resize(count);
    mPboOnDeviceOffsets.resize(count);
    mFboIDs.resize(count);
}

// --- Host buffers

uint32_t Texture::ceil(uint32_t in, uint32_t alignByte) {
    return (in + alignByte - 1) & ~(alignByte - 1);
}

bool Texture::hostBufFits() const {
    if (uint64_t{mNumColours} * mNumBytesPerColour != mBytePerPix ||
        !pictureFits(mPitchInPix, mHeight, mBytePerPix))
        return false;
    const uint64_t alignment = mBufAlignByte;
    const uint64_t size = (uint64_t{mHeight} * mPitch + alignment - 1) & ~(alignment - 1);
    return (mIsMipMapped ? 2 * size : size) < HOST_BUFFER_LIMIT;
}

uint32_t Texture::hostBufBytes() {
    const uint32_t size = ceil(mHeight * mPitch, mBufAlignByte);
    return mIsMipMapped ? 2 * size : size;
}

void Texture::allocHostBufs(uint32_t fid) {
    // 32-bit sizes wrap: a picture that does not fit them gets no buffer rather than a short one.
    mHostBufPtrs[fid] = hostBufFits() ? memalign(mBufAlignByte, hostBufBytes()) : nullptr;
    if (!mHostBufPtrs[fid]) {
        kxsys_syslog(KXSYS_LOG_ERROR,
                     "GPUR 453: Texture::createTexture():: bufNum=%d, Cannot allocate texture memory\n",
                     static_cast<int>(fid));
        return;
    }
    populate(mHostBufPtrs[fid], hostBufBytes());
}

void Texture::clearHostBuf(uint32_t buf_num, size_t from) {
    std::memset(static_cast<unsigned char*>(mHostBufPtrs[buf_num]) + from, 0, hostBufBytes() - from);
}

bool Texture::fillFitsHostBuf(uint32_t bytesPerElement) {
    if (mWidth == 0 || mHeight == 0)
        return true;
    if (mBytePerPix == 0)
        return false;
    const uint64_t elementsToLastPixel =
        (uint64_t{mHeight - 1} * mPitchInPix + mWidth) * COMPONENTS_OF_A_FILL;
    return elementsToLastPixel <= hostBufBytes() / bytesPerElement;
}

void Texture::setHostBufData(uint32_t bufNum, int locX, int locY, int sizeX, int sizeY, uint8_t r, uint8_t g,
                             uint8_t b, uint8_t a) {
    unsigned char* const buffer = getAddress(bufNum);
    if (!buffer || mBytePerPix != 4)
        return;
    const int64_t endX = std::min(int64_t{locX} + sizeX, int64_t{mWidth});
    const int64_t endY = std::min(int64_t{locY} + sizeY, int64_t{mHeight});
    const int64_t bufferPixels = hostBufBytes() / 4;
    const unsigned char pixel[4] = {b, g, r, a};
    for (int64_t y = std::max(locY, 0); y < endY; ++y) {
        const int64_t rowStart = y * mPitchInPix;
        const int64_t rowEnd =
            std::min(endX, bufferPixels - rowStart); // a pitch below the width passes the end
        for (int64_t x = std::max(locX, 0); x < rowEnd; ++x)
            std::memcpy(buffer + 4 * (rowStart + x), pixel, sizeof pixel);
    }
}

uint32_t Texture::getHostBufData(uint32_t bufNum, int x, int y) {
    const unsigned char* const buffer = getAddress(bufNum);
    if (!buffer)
        return 0;
    const uint32_t wordIndex = static_cast<uint32_t>(y) * mPitchInPix + static_cast<uint32_t>(x);
    uint32_t word = 0;
    std::memcpy(&word, buffer + size_t{4} * wordIndex, sizeof word);
    return word;
}

float Texture::getInterlacedTextureOffset(int evenOdd) const {
    if (!mIsInterlaced)
        return 0.0F;
    const float halfFrameLine = 0.5F / static_cast<float>(2 * mHeight);
    return (evenOdd & 1) ? -halfFrameLine : halfFrameLine;
}

// --- OpenGL objects

void Texture::createGLBufObjects(uint32_t fid) {
    createGLTex(fid);
    if (mIsPBO)
        createPBO(fid);
    if (mIsFBO)
        createFBO(fid);
    if (mIsMipMapped)
        generateMipMap(fid);
}

void Texture::createGLTex(uint32_t buf_num) {
    glGenTextures(1, &mGLTexIDs[buf_num]);
    glBindTexture(GL_TEXTURE_2D, mGLTexIDs[buf_num]);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
    specifyLevel0(nullptr);
    glBindTexture(GL_TEXTURE_2D, 0);
}

void Texture::specifyLevel0(const void* pixels) const {
    glTexImage2D(GL_TEXTURE_2D, 0, internalFormat(mIsFp16), static_cast<GLsizei>(mWidth),
                 static_cast<GLsizei>(mHeight), 0, mColFormat, pixelType(mIsFp16), pixels);
}

void Texture::createPBO(uint32_t buf_num) {
    const uint32_t size = pixelBytes() + mPboAlignByte;
    if (isWriteAccess()) {
        createBuffer(GL_PIXEL_UNPACK_BUFFER, mPboIDs[buf_num], size, GL_STREAM_DRAW);
    } else {
        createBuffer(GL_PIXEL_PACK_BUFFER, mPboOnDeviceIDs[buf_num], size, GL_STATIC_COPY);
        createBuffer(GL_COPY_WRITE_BUFFER, mPboIDs[buf_num], size, GL_STREAM_READ);
    }
    // The first mapping records the alignment offset from which copyPBOToGLTex() reads.
    mapPbo(buf_num);
    unmapPbo(buf_num);
}

void Texture::createFBO(uint32_t buf_num) {
    glGenFramebuffersEXT(1, &mFboIDs[buf_num]);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, mFboIDs[buf_num]);
    glFramebufferTexture2DEXT(GL_FRAMEBUFFER_EXT, GL_COLOR_ATTACHMENT0_EXT, GL_TEXTURE_2D, mGLTexIDs[buf_num],
                              0);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
}

void Texture::deleteGLBufObjects(uint32_t fid) {
    glDeleteTextures(1, &mGLTexIDs[fid]);
    if (mIsPBO) {
        glDeleteBuffers(1, &mPboIDs[fid]);
        glDeleteBuffers(1, &mPboOnDeviceIDs[fid]);
    }
    if (mIsFBO)
        glDeleteFramebuffersEXT(1, &mFboIDs[fid]);
}

void Texture::generateMipMap(uint32_t fid) {
    glBindTexture(GL_TEXTURE_2D, getGLTexID(fid));
    glGenerateMipmapEXT(GL_TEXTURE_2D);
    glBindTexture(GL_TEXTURE_2D, 0);
}

void Texture::setTextureFilter(uint32_t fid, uint32_t min, uint32_t mag) {
    glBindTexture(GL_TEXTURE_2D, getGLTexID(fid));
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, static_cast<GLint>(min));
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, static_cast<GLint>(mag));
    glBindTexture(GL_TEXTURE_2D, 0);
}

void Texture::setTextureFilter(uint32_t fid) {
    setTextureFilter(fid, GL_LINEAR, GL_LINEAR);
}

// --- Transfers

bool Texture::isWriteAccess() const {
    return mPboAccessType == GL_WRITE_ONLY;
}

uint32_t Texture::pixelBytes() const {
    return mHeight * mWidth * mBytePerPix;
}

uint32_t Texture::copiedBytes() {
    return std::min(pixelBytes(), hostBufBytes());
}

void Texture::copyHostBufToGLTex(uint32_t fid) {
    copyHostBufToGLTex(fid, fid);
}

void Texture::copyHostBufToGLTex(uint32_t fidHostBuf, uint32_t fidGLTex) {
    glBindTexture(GL_TEXTURE_2D, getGLTexID(fidGLTex));
    specifyLevel0(getHostBufPtr(fidHostBuf));
    glBindTexture(GL_TEXTURE_2D, 0);
}

void Texture::copyPBOToGLTex(uint32_t fid) {
    if (!mIsPBO) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 456: Texture::copyPBOToGLTex: ERROR No PBO in this texture\n");
        return;
    }
    uploadFromPBO(fid, fid);
}

void Texture::copyPBOToGLTex(uint32_t fidPBO, uint32_t fidGLTex) {
    if (!mIsPBO) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 454: Texture::copyPBOToGLTex: ERROR No PBO in this texture\n");
        return;
    }
    uploadFromPBO(fidPBO, fidGLTex);
}

void Texture::uploadFromPBO(uint32_t fidPBO, uint32_t fidGLTex) {
    glBindTexture(GL_TEXTURE_2D, getGLTexID(fidGLTex));
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, getPboID(fidPBO));
    glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, static_cast<GLsizei>(mWidth), static_cast<GLsizei>(mHeight),
                    mColFormat, pixelType(mIsFp16), bufferOffset(mPboOffsets[bufferIndex(fidPBO)]));
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
    glBindTexture(GL_TEXTURE_2D, 0);
}

void Texture::copyHostBufToPBO(uint32_t fid) {
    writePBO(fid, fid);
}

void Texture::copyHostBufToPBO(uint32_t fidHostBuf, uint32_t fidPBO) {
    if (!mIsPBO) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 455: Texture::copyHostBufToPBO: ERROR No PBO in this texture\n");
        return;
    }
    writePBO(fidHostBuf, fidPBO);
}

void Texture::writePBO(uint32_t fidHostBuf, uint32_t fidPBO) {
    if (mIsPBO && !isWriteAccess()) {
        kxsys_syslog(KXSYS_LOG_ERROR,
                     "Texture::copyHostBufToPBO: ERROR The PBO of this texture is for readback\n");
        return;
    }
    mapPbo(fidPBO);
    const void* const hostBuf = getHostBufPtr(fidHostBuf);
    if (mPboPtrs[bufferIndex(fidPBO)] && hostBuf)
        std::memcpy(getAlignedPboPtr(fidPBO), hostBuf, copiedBytes());
    unmapPbo(fidPBO);
}

void Texture::readbackGLTexToPBO(uint32_t fid) {
    readbackGLTexToPBO(fid, fid);
}

void Texture::readbackGLTexToPBO(uint32_t fidGLTex, uint32_t fidPBO) {
    if (!mIsPBO || isWriteAccess()) {
        kxsys_syslog(KXSYS_LOG_ERROR, "Texture::readbackGLTexToPBO: ERROR No readback PBO in this texture\n");
        return;
    }
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, getFboID(fidGLTex));
    glReadBuffer(GL_COLOR_ATTACHMENT0_EXT);
    glBindBuffer(GL_PIXEL_PACK_BUFFER, mPboOnDeviceIDs[bufferIndex(fidPBO)]);
    glReadPixels(0, 0, static_cast<GLsizei>(mWidth), static_cast<GLsizei>(mHeight), mColFormat,
                 pixelType(mIsFp16), bufferOffset(0));
    glBindBuffer(GL_COPY_WRITE_BUFFER, getPboID(fidPBO));
    glCopyBufferSubData(GL_PIXEL_PACK_BUFFER, GL_COPY_WRITE_BUFFER, 0, 0,
                        static_cast<GLsizeiptr>(pixelBytes()));
    glBindBuffer(GL_COPY_WRITE_BUFFER, 0);
    glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, 0);
}

void Texture::readbackPBOToHostBuf(uint32_t fid) {
    readbackPBOToHostBuf(fid, fid);
}

void Texture::readbackPBOToHostBuf(uint32_t fidPBO, uint32_t fidHostBuf) {
    if (mIsPBO && isWriteAccess()) {
        kxsys_syslog(KXSYS_LOG_ERROR,
                     "Texture::readbackPBOToHostBuf: ERROR The PBO of this texture is for upload\n");
        return;
    }
    mapPbo(fidPBO);
    const void* const pixels = mPboPtrs[bufferIndex(fidPBO)];
    void* const hostBuf = getHostBufPtr(fidHostBuf);
    if (pixels && hostBuf)
        std::memcpy(hostBuf, pixels, copiedBytes());
    unmapPbo(fidPBO);
}

// --- PBO mapping

void Texture::mapPbo(uint32_t buf_num) {
    const uint32_t b = bufferIndex(buf_num);
    const GLenum target = mappingTarget(isWriteAccess());
    glBindBuffer(target, mPboIDs[b]);
    glPixelStorei(isWriteAccess() ? GL_UNPACK_ALIGNMENT : GL_PACK_ALIGNMENT, 4);
    {
        const boost::mutex::scoped_lock lock(mPboMutex);
        mPboPtrs[b] = glMapBuffer(target, isWriteAccess() ? GL_WRITE_ONLY : GL_READ_ONLY);
        const auto addressLow = static_cast<uint32_t>(reinterpret_cast<uintptr_t>(mPboPtrs[b]));
        // Atomic because getPboOffset() takes no lock.
        __atomic_store_n(&mPboOffsets[b], ceil(addressLow, mPboAlignByte) - addressLow, __ATOMIC_RELAXED);
    }
    if (!mPboPtrs[b]) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 457: Texture::%s : glMapBuffer() failed\n", "mapPbo");
        std::fflush(stdout);
        return;
    }
    glBindBuffer(target, 0);
}

void Texture::unmapPbo(uint32_t buf_num) {
    const uint32_t b = bufferIndex(buf_num);
    const boost::mutex::scoped_lock lock(mPboMutex);
    if (!mPboPtrs[b]) {
        kxsys_syslog(KXSYS_LOG_ERROR,
                     isWriteAccess() ? "GPUR 458: Texture::unmapPbo(): mPboPtrs[%d] = NULL\n"
                                     : "GPUR 459: Texture::unmapPbo(): mPboPtrs[%d] = NULL\n",
                     static_cast<int>(b));
        return;
    }
    const GLenum target = mappingTarget(isWriteAccess());
    glBindBuffer(target, mPboIDs[b]);
    if (glUnmapBuffer(target) != GL_TRUE) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 460: Texture::%s : glUnmapBuffer() failed\n", "unmapPbo");
        std::fflush(stdout);
        return;
    }
    glBindBuffer(target, 0);
}

void* Texture::getPboPtr(uint32_t buf_num) {
    const uint32_t b = bufferIndex(buf_num);
    const boost::mutex::scoped_lock lock(mPboMutex);
    return mPboPtrs[b];
}

void* Texture::getAlignedPboPtr(uint32_t buf_num) {
    const uint32_t b = bufferIndex(buf_num);
    const boost::mutex::scoped_lock lock(mPboMutex);
    return static_cast<unsigned char*>(mPboPtrs[b]) + mPboOffsets[b];
}

uint32_t Texture::getPboOffset(uint32_t buf_num) const {
    return __atomic_load_n(&mPboOffsets[bufferIndex(buf_num)], __ATOMIC_RELAXED);
}
