#ifndef CG_COMPILER_PREPROCESSOR_H
#define CG_COMPILER_PREPROCESSOR_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/Token.h>

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace cg {

class Diagnostics;
class SourceFiles;

struct PreprocessorOptions {
    FileReader reader; ///< empty: no include is found
    std::vector<std::pair<std::string, std::string>>
        macros;                              ///< name and text; `f(x)` as a name takes arguments
    std::vector<std::string> includeFolders; ///< where to look last
};

/// Runs the directives of a file and of what it includes, and expands its macros.
///
/// An include is looked for in the folder of the including file, then in those of the files that include that
/// one, up to the main file, then in includeFolders; `"x"` and `<x>` are the same. `#pragma` is ignored but
/// for `#pragma once`. Words after `#else`, `#endif` and `#ifdef NAME` are a warning.
///
/// What is left of the program's size is bounded, so that no text takes long: 64 nested includes, a million
/// tokens in all, with what macros and repeated includes produce. Beyond it there is an error and the program
/// ends there.
///
/// @param mainFile  index of a file in `files`; included files are added to `files`
/// @return the program's tokens, with END as the last
std::vector<Token> preprocess(SourceFiles& files, std::uint32_t mainFile, const PreprocessorOptions& options,
                              Diagnostics& diagnostics);

} // namespace cg

#endif
