#ifndef FWZEL_EXPORT_H
#define FWZEL_EXPORT_H

/// @file
/// What the library exports.

/// Marks what libFwZel.so exports; everything else in the library is hidden.
#define FWZEL_API __attribute__((visibility("default")))

#endif
