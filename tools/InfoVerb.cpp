#include "Verbs.h"

#include <OutputFile.h>

#include <FwZel/PictureRefusal.h>
#include <FwZel/VideoTestImage.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <cctype>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

std::string describe(const std::string& file) {
    uint32_t width = 0;
    uint32_t height = 0;
    uint32_t bytesPerColour = 0;
    VideoTestImage::getWidthHeightFromFile(file, &width, &height, &bytesPerColour);
    std::string format = file.substr(file.find_last_of('.') + 1);
    std::transform(format.begin(), format.end(), format.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    return file + ": " + format + ", " + std::to_string(width) + " x " + std::to_string(height) + ", " +
           std::to_string(bytesPerColour) + (bytesPerColour == 1 ? " byte" : " bytes") + " a component\n";
}

void info(const std::vector<std::string>& files) {
    host::OutputFile output("-");
    size_t numRefused = 0;
    for (const std::string& file : files) {
        const std::string refusal = pictureRefusal(file);
        if (refusal.empty()) {
            output.write(describe(file));
            continue;
        }
        std::cerr << "fwzel: " << file << ": " << refusal << '\n';
        ++numRefused;
    }
    output.close();
    if (numRefused > 0)
        throw std::runtime_error(std::to_string(numRefused) + " of " + std::to_string(files.size()) +
                                 (files.size() == 1 ? " file" : " files") + " refused");
}

} // namespace

void addInfoVerb(CLI::App& command) {
    CLI::App* const verb = command.add_subcommand(
        "info", "Tells what the picture readers see in PNG and PPM files, or why they refuse one");
    const auto files = std::make_shared<std::vector<std::string>>();
    verb->add_option("FILE", *files, "Pictures")->required()->type_name("");
    verb->callback([files] { info(*files); });
}
