#ifndef FWZEL_WORDLOOPS_H
#define FWZEL_WORDLOOPS_H

#include <cstddef>
#include <cstdint>
#include <limits>

// Private to the library: loops over memory in words of 64 bits, on the widest registers that the machine
// has.

/// A pixel as often as it goes into a word.
template <class Pixel>
constexpr uint64_t repeatedInWord(Pixel pixel) {
    constexpr uint64_t ONE_IN_EACH = ~uint64_t{0} / std::numeric_limits<Pixel>::max();
    return pixel * ONE_IN_EACH;
}

/// Stores a word over and over, the last time as many of its first bytes as there is room for.
/// @param to     any alignment; never read
void storeRepeatedly(unsigned char* to, uint64_t word, size_t bytes);

/// Inverts the bits that are set in a word, over and over, likewise.
void flipBits(void* memory, size_t bytes, uint64_t word);

#endif
