#include "ToolRun.h"

#include <fixture/FileText.h>
#include <fixture/ShellCommand.h>
#include <fixture/TemporaryFile.h>

ToolRun runTool(const std::string& arguments, const std::string& redirection,
                const std::string& environment) {
    const TemporaryFile remarks("remarks");
    const TemporaryFile exitCode("exit-code");
    const std::string output =
        runShell("{ " + environment + " '" FWZEL_TOOL "' " + arguments + " 2>'" + remarks.path() +
                 "'; echo $? >'" + exitCode.path() + "'; } " + redirection)
            .output;
    return {std::stoi(fileText(exitCode.path())), output, fileText(remarks.path())};
}
