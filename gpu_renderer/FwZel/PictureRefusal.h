#ifndef FWZEL_PICTUREREFUSAL_H
#define FWZEL_PICTUREREFUSAL_H

#include <FwZel/Export.h>

#include <string>

/// @file
/// Picture files that are refused.

/// Why the picture readers refuse a file, in words for a user: a phrase without the file's name and without a
/// full stop, such as "its colour type is grey; only RGB and RGB with alpha are read". Empty when the file is
/// accepted. The reasons come from the readers' own checks (VideoTestImage::getWidthHeightFromFile() and
/// fillTextureFile(), which say nothing themselves), made for a texture of the file's own size.
///
/// Told are the extension, what the system says of opening and reading, the header, and a size that no
/// texture has. Damage after the header is no refusal: what such a file delivers is used.
///
/// Thread: any. The process goes on whatever the file is; nothing is logged.
FWZEL_API std::string pictureRefusal(const std::string& fileName);

#endif
