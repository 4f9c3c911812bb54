#include <FwZel/WordLoops.h>

#include <cstring>

namespace {

constexpr size_t WORD = sizeof(uint64_t);

// The plain loops. Their copies for wider registers below differ in the instructions alone.

inline __attribute__((always_inline)) void storeWords(unsigned char* to, uint64_t word, size_t words) {
    for (size_t i = 0; i < words; ++i)
        std::memcpy(to + i * WORD, &word, WORD);
}

inline __attribute__((always_inline)) void flipWords(unsigned char* memory, uint64_t word, size_t words) {
    for (size_t i = 0; i < words; ++i) {
        uint64_t flipped;
        std::memcpy(&flipped, memory + i * WORD, WORD);
        flipped ^= word;
        std::memcpy(memory + i * WORD, &flipped, WORD);
    }
}

void storePlainly(unsigned char* to, uint64_t word, size_t words) {
    storeWords(to, word, words);
}
void flipPlainly(unsigned char* memory, uint64_t word, size_t words) {
    flipWords(memory, word, words);
}

using Loop = void (*)(unsigned char*, uint64_t, size_t);

#if defined(__x86_64__)

__attribute__((target("avx2"))) void storeWithAvx2(unsigned char* to, uint64_t word, size_t words) {
    storeWords(to, word, words);
}

__attribute__((target("avx2"))) void flipWithAvx2(unsigned char* memory, uint64_t word, size_t words) {
    flipWords(memory, word, words);
}

// Each compiler has its own way to be told that all 512 bits are worth it.
#if defined(__clang__)
#define FWZEL_AVX512 __attribute__((target("avx512f"), min_vector_width(512)))
#else
#define FWZEL_AVX512 __attribute__((target("avx512f,prefer-vector-width=512")))
#endif

FWZEL_AVX512 void flipWithAvx512(unsigned char* memory, uint64_t word, size_t words) {
    flipWords(memory, word, words);
}

Loop storeLoop() {
    return __builtin_cpu_supports("avx2") ? storeWithAvx2 : storePlainly;
}

Loop flipLoop() {
    if (__builtin_cpu_supports("avx512f"))
        return flipWithAvx512;
    return __builtin_cpu_supports("avx2") ? flipWithAvx2 : flipPlainly;
}

#else

Loop storeLoop() {
    return storePlainly;
}
Loop flipLoop() {
    return flipPlainly;
}

#endif

/// For long runs: claims whole cache lines without reading them first, which no loop of ordinary stores does.
void storeMany(unsigned char* to, uint64_t word, size_t words) {
#if defined(__x86_64__) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
    asm volatile("rep stosq" : "+D"(to), "+c"(words) : "a"(word) : "memory");
#else
    storePlainly(to, word, words);
#endif
}

} // namespace

void storeRepeatedly(unsigned char* to, uint64_t word, size_t bytes) {
    constexpr size_t MANY = 4096 / WORD;
    const size_t words = bytes / WORD;
    if (words >= MANY)
        storeMany(to, word, words);
    else
        storeLoop()(to, word, words);
    std::memcpy(to + words * WORD, &word, bytes % WORD);
}

void flipBits(void* memory, size_t bytes, uint64_t word) {
    auto* const start = static_cast<unsigned char*>(memory);
    const size_t words = bytes / WORD;
    flipLoop()(start, word, words);
    for (size_t i = words * WORD; i < bytes; ++i)
        start[i] = static_cast<unsigned char>(start[i] ^ word >> i % WORD * 8);
}
