#ifndef HOST_PPMWRITER_H
#define HOST_PPMWRITER_H

#include "PictureView.h"

namespace host {

class OutputFile;

/// Writes a picture of four bytes r, g, b, a a pixel as binary PPM (P6), without its alpha. The file is the
/// caller's to close.
/// @throw std::system_error  the file cannot be written; what() names the file and the reason
void writePpm(OutputFile& file, const PictureView& picture);

} // namespace host

#endif
