#ifndef FWZEL_TESTPATTERNCATALOGUE_H
#define FWZEL_TESTPATTERNCATALOGUE_H

#include <FwZel/Export.h>

#include <array>
#include <cstdint>
#include <string>

/// @file
/// The test patterns in words.

/// What a person is told of one test pattern. The texts are in English, without a full stop, and live as long
/// as the library.
struct TestPatternEntry {
    uint32_t number;        ///< a VideoTestImage::testPattern value
    const char* name;       ///< the enumerator in lower case with hyphens: "colour-bar-75"
    const char* shows;      ///< the picture
    const char* components; ///< how the four components are to be read: R', G', B', alpha or Cr, Y', Cb, key
};

/// Numbered from 0 on.
inline constexpr uint32_t NUM_TEST_PATTERNS = 22;

/// Every pattern, at the index that is its number. Any thread.
FWZEL_API const std::array<TestPatternEntry, NUM_TEST_PATTERNS>& testPatternCatalogue();

/// Looks a pattern up. Any thread.
/// @param nameOrNumber  a name as the catalogue spells it, or a number in decimal digits without sign, blanks
///                      or leading zeros
/// @return null when no pattern is called so; NO_TEST_PATTERN is none
FWZEL_API const TestPatternEntry* findTestPattern(std::string nameOrNumber);

/// As above, by number.
FWZEL_API const TestPatternEntry* findTestPattern(uint32_t number);

#endif
