#include "ToolRun.h"

#include <fixture/PictureFiles.h>

#include <array>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace {

std::string textOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

} // namespace

ToolRun runTool(const std::string& arguments, const std::string& redirection,
                const std::string& environment) {
    const TemporaryFile remarks("remarks");
    const TemporaryFile exitCode("exit-code");
    const std::string command = "{ " + environment + " '" FWZEL_TOOL "' " + arguments + " 2>'" +
                                remarks.path() + "'; echo $? >'" + exitCode.path() + "'; } " + redirection;
    std::FILE* const pipe = popen(command.c_str(), "r");
    if (!pipe)
        throw std::runtime_error("the shell does not start");
    std::string output;
    std::array<char, 65536> chunk = {};
    for (size_t size = 1; size > 0;) {
        size = std::fread(chunk.data(), 1, chunk.size(), pipe);
        output.append(chunk.data(), size);
    }
    pclose(pipe);
    return {std::stoi(textOf(exitCode.path())), output, textOf(remarks.path())};
}
