#ifndef TOOLS_NUMBEREDNAME_H
#define TOOLS_NUMBEREDNAME_H

#include <string>

/// Checks the name of the files that frames go to, such as "frame_%05d.png".
/// @throw WrongCall  it has no place for a number, or another one than that, or does not end in .png
void refuseFrameName(const std::string& name);

/// The name with a number, not negative, in its place.
std::string numberedName(const std::string& name, int number);

#endif
