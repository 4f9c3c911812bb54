#ifndef FWZEL_PPMBYTES_H
#define FWZEL_PPMBYTES_H

#include <cstddef>
#include <cstdint>
#include <string>

class Texture;

// Private to the library: how much of a host buffer a PPM file fills.

/// Works as fillTextureFromPpmFile().
/// @return the bytes from the start of the buffer to the end of the last row that was written, none of which
///         is left as it was where the rows follow one another without a gap; 0 when nothing was written
size_t fillBytesFromPpmFile(const std::string& fileName, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                            uint32_t shift, bool isFp16);

#endif
