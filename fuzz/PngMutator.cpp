#include <zlib.h>

#include <cstddef>
#include <cstdint>

// The fuzzer's own changes to a PNG file, after which the check sums of the chunks are mended: libpng gives
// up a chunk with a wrong one before it looks into it. One change in four stays as it is.

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t* data, std::size_t size, std::size_t maxSize);

namespace {

constexpr std::size_t SIGNATURE_BYTES = 8;
constexpr std::size_t AROUND_DATA = 12; // length and type before a chunk's data, check sum after it

std::uint32_t load(const std::uint8_t* from) {
    return std::uint32_t{from[0]} << 24 | std::uint32_t{from[1]} << 16 | std::uint32_t{from[2]} << 8 |
           from[3];
}

void mendCheckSums(std::uint8_t* data, std::size_t size) {
    std::size_t chunk = SIGNATURE_BYTES;
    while (chunk + AROUND_DATA <= size) {
        const std::size_t length = load(data + chunk);
        if (length > size - chunk - AROUND_DATA)
            return;
        const auto sum =
            static_cast<std::uint32_t>(crc32(0, data + chunk + 4, static_cast<uInt>(length + 4)));
        for (std::size_t i = 0; i < 4; ++i)
            data[chunk + 8 + length + i] = static_cast<std::uint8_t>(sum >> (24 - 8 * i));
        chunk += AROUND_DATA + length;
    }
}

} // namespace

extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t* data, std::size_t size, std::size_t maxSize,
                                               unsigned int seed) {
    const std::size_t mutated = LLVMFuzzerMutate(data, size, maxSize);
    if (seed % 4 != 0)
        mendCheckSums(data, mutated);
    return mutated;
}
