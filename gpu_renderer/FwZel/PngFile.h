#ifndef FWZEL_PNGFILE_H
#define FWZEL_PNGFILE_H

#include <FwZel/Export.h>

#include <cstdint>
#include <string>

class Texture;

/// @file
/// The reader of PNG files (ISO/IEC 15948), by libpng. RGB and RGB with alpha are read, 8 or 16 bits a
/// sample, Adam7 or not; grey and palette files are refused. Samples are taken as they are: no gamma or
/// colour profile is applied, and every ancillary chunk but tRNS is skipped.
///
/// Files are untrusted. A file wider or higher than 1,000,000 pixels (libpng's own bound) is refused, and the
/// reader holds a few rows of the file at most.
///
/// Thread: any; each call opens the file, reads it and closes it. Nothing is logged. libpng writes its errors
/// and warnings to standard error.

/// Reads a file's size.
/// @param width,height  pixels; written as soon as the header is read, even if the colour type is then
/// refused
/// @param bytePerCol    bytes per sample: 1 for 8 bits, else 2; written on success only
/// @return 0, or -1: the file cannot be opened, has no PNG signature, a damaged header or another colour type
FWZEL_API int getWidthHeightFromPngFile(std::string fname, uint32_t* width, uint32_t* height,
                                        uint32_t* bytePerCol);

/// Fills a host buffer from a file, in the component order R, G, B, A: bytes where the texture has one byte
/// per colour, half floats (VideoTestImage::uint8ToFp16()) where it has two; any other size writes nothing.
/// Alpha is 255 in RGB files, or what their tRNS chunk says. 16-bit samples are scaled to 8 bits.
///
/// A file of another size than the texture fills what both have: the smaller of both widths and of both
/// numbers of rows. Nothing is written past a row's components or its pitch. Of a damaged file the rows
/// before the damage are written (of an Adam7 file the pixels before it); the rest of the buffer is left as
/// it was.
///
/// Nothing is written when getWidthHeightFromPngFile() refuses the file, when width x height x 4 reaches
/// 2 GiB, when memory for a row is missing, or when the host buffer is null.
/// @param texBufIndex  buffer, reduced by the texture
/// @param fid          0: file rows 0, 2, 4 …; 1: file rows 1, 3, 5 …; any other: every row from the top,
///                     whether or not the texture is interlaced
/// @param shift        not used
/// @param isFp16       not used: the texture's bytes per colour decide
FWZEL_API void fillTextureFromPngFile(std::string filename, Texture* tex, uint32_t texBufIndex, uint32_t fid,
                                      uint32_t shift, bool isFp16);

/// Why fillTextureFromPngFile() refuses a file as a whole, in words without the file's name; empty when it
/// does not. Damage after the header is no refusal. Writes nothing to standard error.
FWZEL_API std::string refusalOfPngFile(const std::string& fileName);

#endif
