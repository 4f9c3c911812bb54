#include <FwZel/PictureRefusal.h>
#include <FwZel/PictureSize.h>
#include <FwZel/PngFile.h>
#include <FwZel/PpmFile.h>

#include <fixture/GlTest.h>
#include <fixture/GuardedTexture.h>
#include <fixture/PictureFiles.h>
#include <fixture/TexArgs.h>

#include <algorithm>
#include <atomic>
#include <ctime>

// What the readers take from the heap, and of time, for files that nobody sane wrote. What they write is held
// to its bounds by the tests of each reader.

namespace {

std::atomic<size_t> heapBytes{0}; // asked for since the start of the process, freed or not

} // namespace

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)

extern "C" int __sanitizer_install_malloc_and_free_hooks(void (*onMalloc)(const volatile void*, size_t),
                                                         void (*onFree)(const volatile void*));

namespace {

const int hooks = __sanitizer_install_malloc_and_free_hooks(
    [](const volatile void*, size_t size) { heapBytes += size; }, [](const volatile void*) {});

} // namespace

#else

// In place of the C library's, for the libraries too.

extern "C" void* __libc_malloc(size_t size);
extern "C" void* __libc_calloc(size_t count, size_t size);
extern "C" void* __libc_realloc(void* block, size_t size);

extern "C" __attribute__((visibility("default"))) void* malloc(size_t size) {
    heapBytes += size;
    return __libc_malloc(size);
}

extern "C" __attribute__((visibility("default"))) void* calloc(size_t count, size_t size) {
    heapBytes += count * size;
    return __libc_calloc(count, size);
}

extern "C" __attribute__((visibility("default"))) void* realloc(void* block, size_t size) {
    heapBytes += size;
    return __libc_realloc(block, size);
}

#endif

namespace {

constexpr size_t FOR_A_REFUSAL = size_t{32}
                                 << 10; // the stream's buffer, libpng's own structures, a few words
constexpr size_t FOR_READING = size_t{64} << 20;

class HostileFiles : public GlTest {};

template <class Work>
size_t heapBytesOf(Work work) {
    const size_t before = heapBytes;
    work();
    return heapBytes - before;
}

/// All that is ever done with a file: its size, a fill, and what is said of it. No file here may take a
/// second.
template <class Query, class Fill>
size_t heapBytesOfReading(const TemporaryFile& file, GuardedTexture& guarded, Query query, Fill fill) {
    const std::clock_t start = std::clock();
    const size_t bytes = heapBytesOf([&] {
        uint32_t width = 0;
        uint32_t height = 0;
        uint32_t bytesPerColour = 0;
        query(file.path(), &width, &height, &bytesPerColour);
        fill(file.path(), &guarded.texture, 0, 2, 0, false);
        pictureRefusal(file.path());
    });
    EXPECT_LT(std::clock() - start, CLOCKS_PER_SEC) << "of the processor's time, not of the clock's";
    return bytes;
}

size_t heapBytesOfPng(const TemporaryFile& file, GuardedTexture& guarded) {
    return heapBytesOfReading(file, guarded, getWidthHeightFromPngFile, fillTextureFromPngFile);
}

size_t heapBytesOfPpm(const TemporaryFile& file, GuardedTexture& guarded) {
    return heapBytesOfReading(file, guarded, getWidthHeightFromPpmFile, fillTextureFromPpmFile);
}

// Sizes around every bound: of libpng, of 16, 31 and 32 bits, and of a texture.
constexpr uint32_t EDGES[] = {0,         1,         2,        255,        256,        23170,      32767,
                              32768,     65535,     65536,    1000000,    1000001,    4000000,    16777216,
                              536870911, 536870912, 1U << 30, 0x7FFFFFFF, 0x80000000, 0xFFFFFFFE, 0xFFFFFFFF};

TEST_F(HostileFiles, DeclaredSizesTakeNoMemoryOrLittle) {
    const TemporaryFile png("picture.png");
    const TemporaryFile ppm("picture.ppm");
    GuardedTexture small(texArgs(4, 3));
    const Bytes whole = PngPicture{4, 3, 6, 16, false, false}.encode();
    size_t fitting = 0;
    for (const uint32_t width : EDGES)
        for (const uint32_t height : EDGES) {
            const std::string size = std::to_string(width) + " " + std::to_string(height);
            SCOPED_TRACE(size);
            Bytes declared(whole.begin(), whole.begin() + 100);
            declareSize(declared, width, height);
            png.write(declared);
            const bool isReadable = width > 0 && height > 0 && pictureFits(width, height, 4);
            const bool isPngReadable = isReadable && std::max(width, height) <= 1000000;
            EXPECT_EQ(pictureRefusal(png.path()).empty(), isPngReadable);
            const size_t taken = heapBytesOfPng(png, small);
            EXPECT_LT(taken, isPngReadable ? FOR_READING : FOR_A_REFUSAL);
            EXPECT_GT(taken, isPngReadable ? size_t{4} * width : 0) << "a row at least; or nobody counts";
            fitting += isPngReadable ? 1 : 0;

            ppm.write(bytesOf("P6\n" + size + "\n255\n" + std::string(60, 'x')));
            EXPECT_EQ(pictureRefusal(ppm.path()).empty(), isReadable);
            if (!isReadable || width > 4000000) {
                EXPECT_LT(heapBytesOfPpm(ppm, small), FOR_A_REFUSAL);
            } else {
                GuardedTexture asWide(texArgs(width, 2));
                EXPECT_LT(heapBytesOfPpm(ppm, asWide), FOR_READING);
            }
        }
    EXPECT_GT(fitting, 50U);
}

TEST_F(HostileFiles, CutAndChangedFilesTakeLittleMemory) {
    const TemporaryFile png("picture.png");
    const TemporaryFile ppm("picture.ppm");
    GuardedTexture guarded(texArgs(9, 7));
    const auto takesLittle = [&](const Bytes& asPng) {
        png.write(asPng);
        return heapBytesOfPng(png, guarded) < FOR_READING;
    };
    for (const bool isAdam7 : {false, true}) {
        const Bytes whole = PngPicture{9, 7, 2, 8, isAdam7, true}.encode();
        for (size_t at = 0; at < whole.size(); ++at) {
            SCOPED_TRACE(at);
            ASSERT_TRUE(takesLittle(Bytes(whole.begin(), whole.begin() + static_cast<ptrdiff_t>(at))));
            for (const int value : {0x00, 0x01, 0x04, 0x10, 0x7F, 0x80, 0xFF}) {
                Bytes changed = whole;
                changed[at] = static_cast<uint8_t>(value);
                ASSERT_TRUE(takesLittle(changed));
                mendHeaderCheckSum(changed);
                ASSERT_TRUE(takesLittle(changed));
            }
        }
    }
    const std::string header = "P6\n9 7\n255\n";
    const Bytes whole = bytesOf(header + std::string(9 * 7 * 3, 'x'));
    for (size_t at = 0; at < header.size(); ++at)
        for (int value = 0; value < 256; ++value) {
            Bytes changed = whole;
            changed[at] = static_cast<uint8_t>(value);
            ppm.write(changed);
            ASSERT_LT(heapBytesOfPpm(ppm, guarded), FOR_READING);
        }
}

} // namespace
