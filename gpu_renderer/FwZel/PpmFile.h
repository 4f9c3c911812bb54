#ifndef FWZEL_PPMFILE_H
#define FWZEL_PPMFILE_H

#include <FwZel/Export.h>

#include <cstdint>
#include <cstdio>
#include <string>

class Texture;

/// @file
/// The reader of binary PPM files ("P6"), stricter than the format: the magic, the size (width and height
/// with one space between) and the maximum value stand on a line each, of 255 characters at most, ended by a
/// line feed. Lines that start with "#" are comments, before any of the three. Then come the pixels, three
/// bytes each, whatever the maximum value says: 16-bit samples are not decoded.
///
/// Files are untrusted. The readers hold 128 KiB of the file at most. A stream error while a header line is
/// read (a directory, a failing disk) ends the process with exit status 1.
///
/// Thread: any; each call opens the file, reads it and closes it. Nothing is logged.

/// Reads a file's size as its header states it, each number by strtol() and cut to 32 bits: 0 where there is
/// no number, and a height of 0 where anything but a space follows the width.
/// @param width,height  pixels; written on success only
/// @param bytePerCol    2 when the maximum value line is exactly "65535", else 1; written on success only
/// @return 0, or -1: the file cannot be opened, does not start with "P6" or has too long a header line
FWZEL_API int getWidthHeightFromPpmFile(std::string fname, uint32_t* width, uint32_t* height,
                                        uint32_t* bytePerCol);

/// Fills a host buffer from a file, in the component order R, G, B, alpha, four components to a pixel.
///
/// A sample s becomes, at one byte per colour, s << shift cut to 8 bits, with alpha 0xFF; at two bytes the
/// half float VideoTestImage::uint8ToFp16(s), with alpha 1.0, where isFp16, else s << (shift + 8) cut to 16
/// bits, alpha likewise from 0xFF; any other size writes nothing.
///
/// Pixels missing at the end of a short file read as 0 (opaque black). Texture rows for which the file's
/// header promises none are left alone.
///
/// Nothing is written when getWidthHeightFromPpmFile() refuses the file, its width is not the texture's,
/// width x height x 4 reaches 2 GiB, memory for reading is missing, the host buffer is null, or the host
/// buffer is too small for four components to a pixel (fewer components, a pitch shorter than the width).
/// @param texBufIndex  buffer, reduced by the texture
/// @param fid          of an interlaced texture 0: file rows 0, 2, 4 …, 1: file rows 1, 3, 5 …; any other:
///                     every row from the top. A texture that is not interlaced takes every row in any case
/// @param shift        extra left shift of integer samples in bits, any number; unused for half floats
/// @param isFp16       two-byte components are half floats
FWZEL_API void fillTextureFromPpmFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                                      uint32_t shift, bool isFp16);

/// Why fillTextureFromPpmFile() refuses a file as a whole, in words without the file's name; empty when it
/// does not. A short file is no refusal. A stream error is told like any other reason: the process goes on.
FWZEL_API std::string refusalOfPpmFile(const std::string& fileName);

/// Reads one line of a header: the characters up to the delimiter, which is read and not stored, or up to the
/// end of the file. Of a longer line the first 255 characters are stored and the rest is read away. A stream
/// error, found set or met, ends the process with exit status 1.
/// @param str         receives the text and a terminating 0: 256 characters
/// @param descripter  the delimiter, a line feed for header lines
/// @return 0
FWZEL_API int getLine(FILE* fp, char* str, char descripter);

/// Reads lines by getLine() until one is no comment. At the end of the file the line is empty.
/// @return 0
FWZEL_API int getEffectiveLine(FILE* fp, char* str, char descripter);

/// @return 1 when the text starts with "#", else 0
FWZEL_API int detComment(char* str);

#endif
