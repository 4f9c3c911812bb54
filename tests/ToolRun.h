#ifndef TESTS_TOOLRUN_H
#define TESTS_TOOLRUN_H

#include <string>

/// What the command fwzel did.
struct ToolRun {
    int exitCode;
    std::string output;  ///< standard output
    std::string remarks; ///< standard error
};

/// Runs the built fwzel.
/// @param arguments    as a shell reads them
/// @param redirection  where the shell sends standard output instead, such as ">/dev/full"
/// @param environment  assignments in front of the command
ToolRun runTool(const std::string& arguments, const std::string& redirection = "",
                const std::string& environment = "");

#endif
