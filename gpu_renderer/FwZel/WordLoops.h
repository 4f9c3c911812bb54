#ifndef FWZEL_WORDLOOPS_H
#define FWZEL_WORDLOOPS_H

#include <cstddef>
#include <cstdint>
#include <cstring>

// Private to the library: loops over memory in words of 64 bits, on the widest registers that the machine
// has.

/// A pixel as often as it goes into a word.
template <class Pixel>
uint64_t repeatedInWord(Pixel pixel) {
    static_assert(sizeof(uint64_t) % sizeof pixel == 0);
    unsigned char bytes[sizeof(uint64_t)];
    for (size_t offset = 0; offset < sizeof bytes; offset += sizeof pixel)
        std::memcpy(bytes + offset, &pixel, sizeof pixel);
    uint64_t word;
    std::memcpy(&word, bytes, sizeof word);
    return word;
}

/// Stores a word over and over, the last time as many of its first bytes as there is room for.
/// @param to     any alignment; never read
void storeRepeatedly(unsigned char* to, uint64_t word, size_t bytes);

/// Inverts the bits that are set in a word, over and over, likewise.
void flipBits(void* memory, size_t bytes, uint64_t word);

#endif
