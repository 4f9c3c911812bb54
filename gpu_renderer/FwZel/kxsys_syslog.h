#ifndef FWZEL_KXSYS_SYSLOG_H
#define FWZEL_KXSYS_SYSLOG_H

/// @file
/// The log function that the host provides.

/// The level of every message of the library: error, on the syslog scale of severities (RFC 5424).
inline constexpr int KXSYS_LOG_ERROR = 3;

/// The log sink, the one channel through which the library reports errors.
///
/// The library calls it and does not define it: the symbol stays unresolved in libFwZel.so and is bound when
/// a process loads the library, so that process must define and export it. A definition that writes the
/// formatted text to standard error is enough.
///
/// Thread: called on whichever thread runs the reporting operation, without a lock. A host that uses the
/// library from several threads accepts concurrent calls.
///
/// @param level   always KXSYS_LOG_ERROR
/// @param format  printf format with %d and %s conversions only; every message ends in a newline
extern "C" void kxsys_syslog(int level, const char* format, ...) __attribute__((format(printf, 2, 3)));

#endif
