#include <fixture/GlTest.h>
#include <fixture/TemporaryFile.h>
#include <fixture/TexArgs.h>
#include <fixture/TextureCalls.h>

#include <FwZel/Texture.h>
#include <FwZel/VideoTestImage.h>

#include <array>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <functional>
#include <future>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

using Calls = std::vector<std::string>;

Texture::TexArgs pboArgs(uint32_t access = GL_WRITE_ONLY, uint32_t numBuffers = 2) {
    Texture::TexArgs args = texArgs(16, 8);
    args.isPBO = true;
    args.numBuffers = numBuffers;
    args.pboAccessType = access;
    return args;
}

using PboMapping = GlTest;

alignas(64) std::array<uint8_t, 1024> mappedMemory;
uint8_t* nextMapping = nullptr;

/// Makes every mapping land where a test wants it.
class MappingAt {
public:
    explicit MappingAt(uint8_t* address)
        : mMap(
              "glMapBuffer", epoxy_glMapBuffer, +[](GLenum, GLenum) -> void* { return nextMapping; }),
          mUnmap(
              "glUnmapBuffer", epoxy_glUnmapBuffer, +[](GLenum) -> GLboolean { return GL_TRUE; }) {
        nextMapping = address;
    }

private:
    SwappedEntryPoint<PFNGLMAPBUFFERPROC> mMap;
    SwappedEntryPoint<PFNGLUNMAPBUFFERPROC> mUnmap;
};

TEST_F(PboMapping, DataStartsAtTheNextAlignedAddress) {
    struct Case {
        uint32_t mappedAt, alignment, offset;
    };
    for (const Case& c : {Case{8, 16, 8}, Case{16, 16, 0}, Case{1, 64, 63}, Case{3, 1, 0}, Case{5, 0, 0}}) {
        Texture::TexArgs args = pboArgs();
        args.pboAlignByte = c.alignment;
        Texture texture(VideoTestImage::H_RAMP, args);
        const MappingAt mapping(mappedMemory.data() + c.mappedAt);
        mappedMemory.fill(0xEE);
        texture.copyHostBufToPBO(1);
        EXPECT_EQ(texture.getPboOffset(3), c.offset);
        EXPECT_EQ(texture.getPboPtr(1), mappedMemory.data() + c.mappedAt) << "still the released mapping's";
        uint8_t* const data = mappedMemory.data() + c.mappedAt + c.offset;
        EXPECT_EQ(texture.getAlignedPboPtr(1), data);
        EXPECT_EQ(std::memcmp(data, texture.getHostBufPtr(1), texture.pixelBytes()), 0);
        EXPECT_EQ(data[-1], 0xEE);
        EXPECT_EQ(data[texture.pixelBytes()], 0xEE);
        EXPECT_EQ(texture.getPboOffset(0), texture.mPboOffsets[0]) << "the other buffer keeps its own";
    }
}

TEST_F(PboMapping, ReadbackComesFromTheStartOfTheMapping) {
    Texture texture(VideoTestImage::COLOUR_MAT_BLACK, pboArgs(GL_READ_ONLY));
    const MappingAt mapping(mappedMemory.data() + 8);
    for (size_t i = 0; i < mappedMemory.size(); ++i)
        mappedMemory[i] = static_cast<uint8_t>(i * 7);
    texture.readbackPBOToHostBuf(0);
    EXPECT_EQ(texture.getPboOffset(0), 8U);
    EXPECT_EQ(std::memcmp(texture.getHostBufPtr(0), mappedMemory.data() + 8, texture.pixelBytes()), 0);
}

TEST_F(PboMapping, CopiesEndWithAHostBufferOfAShorterPitch) {
    constexpr size_t HOST_BYTES = size_t{8} * 9 * 4;
    for (const uint32_t access : {uint32_t{GL_WRITE_ONLY}, uint32_t{GL_READ_ONLY}}) {
        const bool isUpload = access == GL_WRITE_ONLY;
        Texture::TexArgs args = pboArgs(access, 1);
        args.pitchInPix = 9; // of 16
        args.bufAlignByte = 1;
        Texture texture(VideoTestImage::NO_TEST_PATTERN, args);
        const MappingAt mapping(mappedMemory.data());
        std::array<uint8_t, 1024> hostMemory{};
        mappedMemory.fill(0xEE);
        void* const own = std::exchange(texture.mHostBufPtrs[0], hostMemory.data());
        if (isUpload)
            texture.copyHostBufToPBO(0);
        else
            texture.readbackPBOToHostBuf(0);
        texture.mHostBufPtrs[0] = own;
        const auto& target = isUpload ? mappedMemory : hostMemory;
        const auto& source = isUpload ? hostMemory : mappedMemory;
        EXPECT_EQ(target[HOST_BYTES - 1], source[0]);
        EXPECT_NE(target[HOST_BYTES], source[0]);
    }
}

TEST_F(PboMapping, AFailedMappingLeavesThePboBound) {
    for (const uint32_t access : {uint32_t{GL_WRITE_ONLY}, uint32_t{GL_READ_ONLY}}) {
        const bool isUpload = access == GL_WRITE_ONLY;
        Texture texture(VideoTestImage::COMBI, pboArgs(access));
        GLint bound = 0;
        const MappingAt mapping(nullptr);
        texture.mapPbo(3);
        EXPECT_EQ(takeLog(),
                  (std::vector<LogMessage>{{3, "GPUR 457: Texture::mapPbo : glMapBuffer() failed\n"}}));
        glGetIntegerv(isUpload ? GL_PIXEL_UNPACK_BUFFER_BINDING : GL_PIXEL_PACK_BUFFER_BINDING, &bound);
        EXPECT_EQ(static_cast<uint32_t>(bound), texture.getPboID(1));
        EXPECT_EQ(texture.getPboPtr(1), nullptr);
        EXPECT_EQ(texture.getAlignedPboPtr(1), nullptr);
        EXPECT_EQ(texture.getPboOffset(1), 0U);

        GlCallRecorder recorder;
        watchTextureCalls(recorder);
        texture.unmapPbo(3);
        EXPECT_EQ(recorder.take(), Calls{});
        EXPECT_EQ(takeLog(), (std::vector<LogMessage>{
                                 {3, isUpload ? "GPUR 458: Texture::unmapPbo(): mPboPtrs[1] = NULL\n"
                                              : "GPUR 459: Texture::unmapPbo(): mPboPtrs[1] = NULL\n"}}));
        glBindBuffer(isUpload ? GL_PIXEL_UNPACK_BUFFER : GL_PIXEL_PACK_BUFFER, 0);
    }
}

TEST_F(PboMapping, UnmappingTwiceFailsAndLeavesThePboBound) {
    Texture texture(VideoTestImage::COMBI, pboArgs());
    texture.mapPbo(1);
    texture.unmapPbo(1);
    texture.unmapPbo(1);
    EXPECT_EQ(takeLog(),
              (std::vector<LogMessage>{{3, "GPUR 460: Texture::unmapPbo : glUnmapBuffer() failed\n"}}));
    EXPECT_EQ(takeGlErrors(), Calls{"GL_INVALID_OPERATION"});
    GLint bound = 0;
    glGetIntegerv(GL_PIXEL_UNPACK_BUFFER_BINDING, &bound);
    EXPECT_EQ(static_cast<uint32_t>(bound), texture.getPboID(1));
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
}

boost::mutex* watchedMutex = nullptr;
std::vector<bool> lockHeld; // at each OpenGL call

void noteLock() {
    const bool isFree = watchedMutex->try_lock();
    if (isFree)
        watchedMutex->unlock();
    lockHeld.push_back(!isFree);
}

TEST_F(PboMapping, TheLockCoversTheMappingAloneAndAllOfTheUnmapping) {
    Texture texture(VideoTestImage::NO_TEST_PATTERN, pboArgs());
    // cppcheck-suppress danglingLifetime ; locked in this test alone
    watchedMutex = &texture.mPboMutex;
    const SwappedEntryPoint bind(
        "glBindBuffer", epoxy_glBindBuffer, +[](GLenum, GLuint) { noteLock(); });
    const SwappedEntryPoint align(
        "glPixelStorei", epoxy_glPixelStorei, +[](GLenum, GLint) { noteLock(); });
    const SwappedEntryPoint map(
        "glMapBuffer", epoxy_glMapBuffer, +[](GLenum, GLenum) -> void* {
            noteLock();
            return mappedMemory.data();
        });
    const SwappedEntryPoint unmap(
        "glUnmapBuffer", epoxy_glUnmapBuffer, +[](GLenum) -> GLboolean {
            noteLock();
            return GL_TRUE;
        });
    texture.mapPbo(0); // bind, align, map, bind 0
    EXPECT_EQ(std::exchange(lockHeld, {}), (std::vector<bool>{false, false, true, false}));
    texture.unmapPbo(0); // bind, unmap, bind 0
    EXPECT_EQ(std::exchange(lockHeld, {}), (std::vector<bool>{true, true, true}));
}

TEST_F(PboMapping, AProducerWaitsForTheLock) {
    Texture texture(VideoTestImage::NO_TEST_PATTERN, pboArgs());
    const std::vector<std::function<void()>> reads = {[&] { texture.getPboPtr(0); },
                                                      [&] { texture.getAlignedPboPtr(0); }};
    for (const auto& read : reads) {
        boost::mutex::scoped_lock mapping(texture.mPboMutex);
        const std::future<void> producer = std::async(std::launch::async, read);
        EXPECT_EQ(producer.wait_for(std::chrono::milliseconds(50)), std::future_status::timeout);
        mapping.unlock();
    }
    const boost::mutex::scoped_lock mapping(texture.mPboMutex);
    EXPECT_EQ(texture.getPboOffset(0), 0U) << "without the lock";
}

/// The bytes that work() hands on of a text waiting in standard output.
template <class Work>
off_t bytesFlushedBy(Work work) {
    const TemporaryFile file("output", {});
    std::fflush(stdout);
    const int kept = dup(STDOUT_FILENO);
    const int redirected = open(file.path().c_str(), O_WRONLY | O_CLOEXEC);
    dup2(redirected, STDOUT_FILENO);
    std::fputs("waiting", stdout);
    struct stat before = {};
    struct stat after = {};
    fstat(redirected, &before);
    work();
    fstat(redirected, &after);
    std::fflush(stdout);
    dup2(kept, STDOUT_FILENO);
    close(kept);
    close(redirected);
    return after.st_size - before.st_size;
}

TEST_F(PboMapping, FailuresOfOpenGlFlushStandardOutput) {
    Texture texture(VideoTestImage::NO_TEST_PATTERN, pboArgs());
    const MappingAt mapping(mappedMemory.data());
    const SwappedEntryPoint unmap(
        "glUnmapBuffer", epoxy_glUnmapBuffer, +[](GLenum) -> GLboolean { return GL_FALSE; });
    texture.mapPbo(0);
    EXPECT_EQ(bytesFlushedBy([&] { texture.unmapPbo(0); }), 7);
    nextMapping = nullptr;
    EXPECT_EQ(bytesFlushedBy([&] { texture.mapPbo(0); }), 7);
    EXPECT_EQ(takeLog(),
              (std::vector<LogMessage>{{3, "GPUR 460: Texture::unmapPbo : glUnmapBuffer() failed\n"},
                                       {3, "GPUR 457: Texture::mapPbo : glMapBuffer() failed\n"}}));
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
}

/// The bytes of a producer's frame, all of them different from those of the frames around it.
std::vector<uint8_t> frameOf(int round, size_t bytes) {
    std::vector<uint8_t> frame(bytes);
    for (size_t i = 0; i < bytes; ++i)
        frame[i] = static_cast<uint8_t>(static_cast<size_t>(round) * 29 + i * 7);
    return frame;
}

// One producer a buffer. While the render thread unmaps, uploads and maps one, the others write theirs. When
// a producer may write is agreed as a host would do it: by counters of the host's own.
TEST_F(PboMapping, EveryFrameOfTheProducersArrivesWhole) {
    constexpr size_t BUFFERS = 4;
    constexpr int ROUNDS = 10000;
    Texture texture(VideoTestImage::NO_TEST_PATTERN, pboArgs(GL_WRITE_ONLY, BUFFERS));
    const size_t frameBytes = texture.pixelBytes();
    std::array<std::atomic<int>, BUFFERS> mapped{}; // rounds of each buffer
    std::array<std::atomic<int>, BUFFERS> written{};
    const auto await = [](const std::atomic<int>& counter, int round) {
        while (counter.load(std::memory_order_acquire) <= round)
            std::this_thread::yield();
    };
    std::vector<std::thread> producers;
    for (uint32_t b = 0; b < BUFFERS; ++b)
        producers.emplace_back([&, b] {
            for (int round = 0; round < ROUNDS; ++round) {
                await(mapped[b], round);
                const std::vector<uint8_t> frame = frameOf(round + static_cast<int>(b), frameBytes);
                std::memcpy(texture.getAlignedPboPtr(b), frame.data(), frameBytes);
                written[b].store(round + 1, std::memory_order_release);
                (void)texture.getPboOffset(b + 1); // any thread may read any of them at any time
                (void)texture.getPboPtr(b + 1);
                (void)texture.getAlignedPboPtr(b + 1);
            }
        });
    std::vector<uint8_t> arrived(frameBytes);
    int badFrames = 0;
    for (int round = 0; round <= ROUNDS; ++round)
        for (uint32_t b = 0; b < BUFFERS; ++b) {
            if (round > 0) {
                await(written[b], round - 1);
                texture.unmapPbo(b);
                texture.copyPBOToGLTex(b);
                glBindTexture(GL_TEXTURE_2D, texture.getGLTexID(b));
                glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_UNSIGNED_BYTE, arrived.data());
                glBindTexture(GL_TEXTURE_2D, 0);
                badFrames += arrived != frameOf(round - 1 + static_cast<int>(b), frameBytes);
            }
            if (round < ROUNDS) {
                texture.mapPbo(b);
                mapped[b].store(round + 1, std::memory_order_release);
            }
        }
    for (std::thread& producer : producers)
        producer.join();
    EXPECT_EQ(badFrames, 0);
}

} // namespace
