#ifndef FWZEL_TEXTURE_H
#define FWZEL_TEXTURE_H

#include <FwZel/Export.h>

#include <boost/thread/mutex.hpp>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

/// OpenGL's own name for an enumerant, declared here so that no OpenGL loader is dragged in.
using GLenum = unsigned int;

/// A set of buffers, one or a power of two of them, each a host buffer paired with an OpenGL 2D texture and,
/// where asked, pixel buffer objects (PBOs) and a framebuffer object (FBO). An interlaced texture keeps the
/// even field in the even-numbered buffers and the odd field in the odd-numbered ones.
///
/// Owns its host buffers and every OpenGL name that it made, except a name given to setGLTexID(). It is built
/// whole by a constructor and never changes its size, number of buffers or formats afterwards. The OpenGL
/// textures start with undefined contents: upload the host buffers before the first draw.
///
/// Buffer numbers: every operation that takes a buffer number or a field identifier (0 even field, 1 odd
/// field, 2 whole frame) reduces it by AND with numBuffers - 1. On a two-buffer interlaced texture
/// identifiers 0 and 1 select the fields' buffers; on a one-buffer texture every identifier selects buffer 0.
///
/// Per frame, upload: mapPbo(b); a producer on any thread writes at getAlignedPboPtr(b); unmapPbo(b);
/// copyPBOToGLTex(b). Readback: draw into getFboID(b); readbackGLTexToPBO(b); later readbackPBOToHostBuf(b).
///
/// Thread: the render thread, with the host's context current. getPboPtr(), getAlignedPboPtr(),
/// getPboOffset() and the accessors of the description may be called from any thread. The contents of host
/// buffers are not guarded.
///
/// OpenGL: compatibility profile with EXT_framebuffer_object; pixel buffer objects where isPBO;
/// ARB_copy_buffer for readback; half-float textures where isFp16. No OpenGL error is queried.
///
/// Errors go to the log (kxsys_syslog.h) at level 3; no operation returns one.
class FWZEL_API Texture {
public:
    /// Order of a pixel's components in memory, from the lowest address. The pattern fillers read it through
    /// getColourOrder(); every texture reports COL_RGBA.
    enum texColourOrder { COL_ARGB = 0, COL_RGBA = 1, COL_ABGR = 2, COL_BARG = 3 };

    /// Description of a texture. Fill it with setDefaultValue() first.
    struct TexArgs {
        bool isMipMapped;  ///< build a mip chain at creation; host buffers are twice as large; default false
        bool isInterlaced; ///< one field per buffer, stored height = height / 2 rounded down; default false
        bool isPBO;        ///< create PBOs for each buffer; default false
        bool isFBO;        ///< create an FBO with the texture as colour attachment 0; default false
        bool isFp16;       ///< components are binary16 half floats, 2 bytes each; default false
        uint32_t width;    ///< pixels; default 1920; ignored for a readable file
        uint32_t height; ///< lines of the whole frame, both fields; default 1080; ignored for a readable file
        uint32_t pitchInPix; ///< pixels from one host-buffer row to the next; default 1920; likewise ignored
        uint32_t numColours; ///< components per pixel; default 4
        uint32_t numBytesPerColour; ///< bytes per component; default 1; 2 whatever it says when isFp16
        uint32_t numBuffers;        ///< a power of two; default 1; 0 works as 1
        uint32_t bufAlignByte;  ///< alignment and size unit of host buffers in bytes, a power of two; default
                                ///< 128; 0 works as 1
        uint32_t pboAlignByte;  ///< alignment of data in a mapped PBO in bytes, a power of two; default 16; 0
                                ///< works as 1
        uint32_t pboAccessType; ///< GL_WRITE_ONLY (0x88B9, the default): upload; any other value: readback
        GLenum colFormat;       ///< OpenGL pixel format of every transfer; default GL_RGBA (0x1908)
    };

    /// Writes the default of every field.
    static void setDefaultValue(TexArgs& args);

    /// Builds a pattern texture.
    /// Leaves GL_TEXTURE_2D, the pixel buffer and copy buffer targets and the framebuffer unbound; with PBOs
    /// GL_UNPACK_ALIGNMENT (upload) or GL_PACK_ALIGNMENT (readback) stays 4.
    /// @param testPattern  a VideoTestImage::testPattern value; NO_TEST_PATTERN leaves the host buffers
    ///                     uncleared. A fill that would write past a host buffer (fewer than four components,
    ///                     a pitch shorter than the width) is not made and the buffer is cleared instead.
    /// @throw boost::thread_resource_error  the mutex cannot be created; nothing is left behind
    /// @throw std::bad_alloc  memory is short for the tables of the buffers; nothing is left behind
    /// Logs 453 for each host buffer that cannot be allocated (2 GiB and more included); that buffer stays
    /// null.
    Texture(uint32_t testPattern, const TexArgs& args);

    /// Builds a texture with the size and the pixels of a PNG or PPM file (see
    /// VideoTestImage::fillTextureFile). When the file's size cannot be read, or does not fit 32-bit sizes,
    /// the texture becomes an opaque black pattern texture of the size in args, and nothing is logged. Rows
    /// that a damaged file does not deliver are cleared. Otherwise as the constructor above.
    /// @throw std::out_of_range  the file name is shorter than four characters
    Texture(std::string fileName, const TexArgs& args);

    /// Frees the host buffers and deletes the OpenGL objects. A PBO that is still mapped is unmapped by its
    /// deletion; stop every producer thread first.
    virtual ~Texture();

    // --- Description

    uint32_t getWidth() const { return mWidth; }   ///< pixels
    uint32_t getHeight() const { return mHeight; } ///< rows of one buffer: the field height when interlaced
    uint32_t getPitch() const { return mPitch; }   ///< bytes from one host-buffer row to the next
    uint32_t getPitchInPix() const { return mPitchInPix; } ///< pixels from one host-buffer row to the next
    uint32_t getBytePerPix() const { return mBytePerPix; } ///< components times bytes per component
    uint32_t getBytesPerPixel() const { return mNumBytesPerColour * mNumColours; } ///< the same
    /// What the texture was built with, see TexArgs.
    /// @{
    uint32_t getNumColours() const { return mNumColours; }
    uint32_t getBytesPerColour() const { return mNumBytesPerColour; }
    uint32_t getNumBuffers() const { return mNumBuffers; }
    bool getIsMipMapped() const { return mIsMipMapped; }
    bool getIsPBO() const { return mIsPBO; }
    bool getIsInterlaced() const { return mIsInterlaced; }
    /// @}
    uint32_t getColourOrder() const { return mColourOrder; } ///< a texColourOrder value, always COL_RGBA
    uint32_t getColFormat() const { return mColFormat; }     ///< OpenGL pixel format of transfers
    /// Replaces the OpenGL pixel format of every later transfer.
    void setColFormat(uint32_t fmt) { mColFormat = fmt; }

    /// OpenGL name of a buffer's texture.
    uint32_t getGLTexID(uint32_t buf_num) const { return mGLTexIDs[bufferIndex(buf_num)]; }
    /// Replaces the texture name of buffer 0 without deleting the texture that was there.
    void setGLTexID(uint32_t texId) { mGLTexIDs[0] = texId; }
    /// Name of the PBO that the CPU maps, 0 without PBOs.
    uint32_t getPboID(uint32_t buf_num) const { return mPboIDs[bufferIndex(buf_num)]; }
    /// Name of the framebuffer, 0 without FBOs.
    uint32_t getFboID(uint32_t buf_num) const { return mFboIDs[bufferIndex(buf_num)]; }

    // --- Host buffers

    /// Start of a host buffer, null when its allocation failed.
    void* getHostBufPtr(uint32_t buf_num) { return mHostBufPtrs[bufferIndex(buf_num)]; }
    /// The same address, as bytes.
    unsigned char* getAddress(uint32_t buffer) { return static_cast<unsigned char*>(getHostBufPtr(buffer)); }

    /// Fills a rectangle of a host buffer with the bytes b, g, r, a, in this memory order whatever the colour
    /// order. The rectangle is clipped at all four edges of width x height. Ignored for a null buffer, and on
    /// a texture whose pixels do not have four bytes.
    /// @param locX,locY    top left corner in pixels; a negative position is clipped at 0
    /// @param sizeX,sizeY  size in pixels; nothing is written when either is 0 or less
    void setHostBufData(uint32_t bufNum, int locX, int locY, int sizeX, int sizeY, uint8_t r, uint8_t g,
                        uint8_t b, uint8_t a);

    /// The 32-bit word of one pixel in the machine's byte order: on a little-endian machine a, r, g, b from
    /// the highest byte down for a pixel written by setHostBufData(). 0 for a null buffer. For textures of
    /// four bytes per pixel; x below the pitch in pixels and y below the height are not checked.
    uint32_t getHostBufData(uint32_t bufNum, int x, int y);

    /// Vertical shift, in normalised texture coordinates, that puts a field on its frame lines: half a frame
    /// line (0.5 / frame height), positive for the even field, negative for the odd one; 0 for a progressive
    /// texture.
    /// @param evenOdd  bit 0 tells the field: 0 even, 1 odd
    float getInterlacedTextureOffset(int evenOdd) const;

    /// Does nothing.
    void printParams() const;

    // --- Texture objects

    /// Builds the mip chain of a texture from its level 0. Leaves GL_TEXTURE_2D unbound.
    void generateMipMap(uint32_t fid);

    /// Sets the filters of a texture (GL_LINEAR both at creation). Leaves GL_TEXTURE_2D unbound.
    /// @param min  a GL_TEXTURE_MIN_FILTER value
    /// @param mag  a GL_TEXTURE_MAG_FILTER value
    void setTextureFilter(uint32_t fid, uint32_t min, uint32_t mag);

    /// Sets both filters to GL_LINEAR.
    void setTextureFilter(uint32_t fid);

    // --- Transfers

    /// @class Texture
    /// @par Transfers
    /// One identifier: the same buffer on both sides. Two: the source first, then the destination. OpenGL
    /// moves width x height pixels under the pixel-store state of the host's context; the library sets no row
    /// length, so host buffers whose pitch differs from the width move as if their rows were width pixels
    /// long. With a pitch below the width a copy to or from a PBO ends with the host buffer; a texture upload
    /// from such a buffer would read past its end and is the caller's to avoid.

    /// Host buffer to texture: specifies the whole level 0 again. Leaves GL_TEXTURE_2D unbound.
    /// @{
    void copyHostBufToGLTex(uint32_t fid);
    void copyHostBufToGLTex(uint32_t fidHostBuf, uint32_t fidGLTex);
    /// @}

    /// PBO to texture, from the recorded alignment offset. The PBO must not be mapped. Leaves GL_TEXTURE_2D
    /// and GL_PIXEL_UNPACK_BUFFER unbound. Logs 456 (one identifier) or 454 (two) on a texture without PBOs,
    /// and makes no OpenGL call.
    /// @{
    void copyPBOToGLTex(uint32_t fid);
    void copyPBOToGLTex(uint32_t fidPBO, uint32_t fidGLTex);
    /// @}

    /// Host buffer to upload PBO: height x width x bytes per pixel, to the aligned address of a mapping that
    /// it makes and ends itself. A null host buffer copies nothing. Without PBOs the two-identifier form logs
    /// 455; the one-identifier form fails to map (457, 458). On a texture with readback PBOs it is refused
    /// with a message before any OpenGL call.
    /// @{
    void copyHostBufToPBO(uint32_t fid);
    void copyHostBufToPBO(uint32_t fidHostBuf, uint32_t fidPBO);
    /// @}

    /// Texture, through its FBO, to the device-side PBO and on the GPU into the PBO that the CPU maps. A
    /// texture without FBOs reads framebuffer 0. Leaves framebuffer 0 and no pixel pack or copy write buffer
    /// bound; the FBO's read buffer is colour attachment 0. Refused with a message before any OpenGL call on
    /// a texture without PBOs or with upload PBOs.
    /// @{
    void readbackGLTexToPBO(uint32_t fid);
    void readbackGLTexToPBO(uint32_t fidGLTex, uint32_t fidPBO);
    /// @}

    /// Readback PBO to host buffer: height x width x bytes per pixel from the start of a mapping that it
    /// makes and ends itself. A null host buffer copies nothing. On a texture with upload PBOs it is refused
    /// with a message before any OpenGL call; without PBOs the mapping fails (457, then 458 or 459).
    /// @{
    void readbackPBOToHostBuf(uint32_t fid);
    void readbackPBOToHostBuf(uint32_t fidPBO, uint32_t fidHostBuf);
    /// @}

    // --- PBO mapping

    /// Maps a buffer's PBO, write-only for upload and read-only for readback, and records address and
    /// alignment offset. Sets GL_UNPACK_ALIGNMENT (upload) or GL_PACK_ALIGNMENT (readback) to 4 and leaves
    /// the target unbound. When OpenGL cannot map it: logs 457, flushes standard output, and leaves the PBO
    /// bound.
    void mapPbo(uint32_t buf_num);

    /// Unmaps a buffer's PBO and leaves the target unbound; the recorded address and offset stay.
    /// Logs 458 (upload) or 459 (readback), before any OpenGL call, when there is no recorded address; logs
    /// 460, flushes standard output and leaves the PBO bound when OpenGL cannot unmap it.
    void unmapPbo(uint32_t buf_num);

    /// Address of the latest mapping, null when that failed. Valid until unmapPbo(). Any thread.
    void* getPboPtr(uint32_t buf_num);

    /// The first address of the latest mapping that is a multiple of pboAlignByte: where a producer writes.
    /// Valid until unmapPbo(). Any thread.
    void* getAlignedPboPtr(uint32_t buf_num);

    /// Bytes from getPboPtr() to getAlignedPboPtr(), read without the lock. Any thread.
    uint32_t getPboOffset(uint32_t buf_num) const;

private:
    Texture(const Texture&) = delete;
    Texture& operator=(const Texture&) = delete;

    uint32_t bufferIndex(uint32_t fid) const { return fid & (mNumBuffers - 1); }
    bool isWriteAccess() const;
    uint32_t pixelBytes() const;
    uint32_t copiedBytes();
    uint32_t hostBufBytes();
    bool hostBufFits() const;

    void setArgsCommon(const TexArgs& args);
    void setSize(uint32_t width, uint32_t frameHeight, uint32_t pitchInPix);
    void setArgsForTestPattern(const TexArgs& args);
    int setArgsForFile(const TexArgs& args);
    uint32_t ceil(uint32_t in, uint32_t alignByte);

    // From here to deleteGLBufObjects: a buffer index below mNumBuffers, not reduced.
    void createTextureForTestPattern();
    void createTextureForFile();
    void resizeBuffers(int num_buf);
    uint32_t fieldOfBuffer(uint32_t buf_num) const;
    void allocHostBufs(uint32_t fid);
    void clearHostBuf(uint32_t buf_num, size_t from);
    void fillHostBufFromFile(uint32_t buf_num);
    bool fillFitsHostBuf(uint32_t bytesPerElement);
    void createGLBufObjects(uint32_t fid);
    void createGLTex(uint32_t buf_num);
    void createPBO(uint32_t buf_num);
    void createFBO(uint32_t buf_num);
    void deleteGLBufObjects(uint32_t fid);

    void release();
    void specifyLevel0(const void* pixels) const;
    void uploadFromPBO(uint32_t fidPBO, uint32_t fidGLTex);
    void writePBO(uint32_t fidHostBuf, uint32_t fidPBO);
    void dumpBuf(void* ptr);

    uint32_t mTestPattern;
    std::string mFileName;
    uint32_t mWidth;
    uint32_t mHeight;
    uint32_t mPitch;
    uint32_t mPitchInPix;
    uint32_t mNumColours;
    uint32_t mNumBytesPerColour;
    uint32_t mBytePerPix;
    uint32_t mNumBuffers;
    uint32_t mBufAlignByte;
    uint32_t mPboAlignByte;
    bool mIsMipMapped;
    bool mIsInterlaced;
    bool mIsPBO;
    bool mIsFBO;
    bool mIsFp16;
    uint32_t mColourOrder;
    GLenum mColFormat;
    uint32_t mPboAccessType;
    std::vector<uint32_t> mPboPtrsMapped;
    std::vector<uint32_t> mGLTexIDs;
    std::vector<void*> mHostBufPtrs;
    std::vector<uint32_t> mPboIDs;
    std::vector<void*> mPboPtrs;
    std::vector<uint32_t> mPboOffsets;
    std::vector<uint32_t> mPboOnDeviceIDs;
    std::vector<void*> mPboOnDevicePtrs;
    std::vector<uint32_t> mPboOnDeviceOffsets;
    std::vector<uint32_t> mFboIDs;
    boost::mutex mPboMutex;
};

#endif
