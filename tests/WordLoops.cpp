#include <FwZel/WordLoops.h>

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <vector>

namespace {

constexpr unsigned char GUARD = 0xA5;
constexpr size_t GUARDS = 64;
constexpr uint64_t WORD = 0x8877665544332211;

/// Lengths on both sides of what a vector, a cache line and the loop for many words take.
std::vector<size_t> lengths() {
    std::vector<size_t> all;
    for (size_t length = 0; length < 260; ++length)
        all.push_back(length);
    for (const size_t middle : {4096U, 8192U, 65536U})
        for (size_t length = middle - 9; length <= middle + 9; ++length)
            all.push_back(length);
    return all;
}

/// What a loop leaves of bytes that hold GUARD before, at each alignment, beside the byte-by-byte result.
template <class Loop, class Byte>
void expectBytes(const Loop& loop, const Byte& byte) {
    for (const size_t length : lengths())
        for (size_t offset = 0; offset < 8; ++offset) {
            std::vector<unsigned char> memory(GUARDS + offset + length + GUARDS, GUARD);
            std::vector<unsigned char> expected = memory;
            for (size_t i = 0; i < length; ++i)
                expected[GUARDS + offset + i] = byte(static_cast<unsigned char>(WORD >> i % 8 * 8));
            loop(memory.data() + GUARDS + offset, length);
            ASSERT_EQ(memory, expected) << length << " bytes at alignment " << offset;
        }
}

} // namespace

TEST(WordLoops, StoreTheBytesOfAWordAndNoOther) {
    expectBytes([](unsigned char* to, size_t bytes) { storeRepeatedly(to, WORD, bytes); },
                [](unsigned char ofWord) { return ofWord; });
}

TEST(WordLoops, FlipTheBitsOfAWordAndNoOther) {
    expectBytes([](void* memory, size_t bytes) { flipBits(memory, bytes, WORD); },
                [](unsigned char ofWord) { return static_cast<unsigned char>(GUARD ^ ofWord); });
}
