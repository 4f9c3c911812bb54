#include "Verbs.h"

#include <OutputFile.h>

#include <FwZel/TestPatternCatalogue.h>

#include <CLI/CLI.hpp>

#include <iomanip>
#include <sstream>

namespace {

void list() {
    std::ostringstream lines;
    for (const TestPatternEntry& pattern : testPatternCatalogue())
        lines << std::setw(2) << pattern.number << "  " << std::left << std::setw(16) << pattern.name
              << std::right << "  " << pattern.shows << "  [" << pattern.components << "]\n";
    host::OutputFile output("-");
    output.write(lines.str());
    output.close();
}

} // namespace

void addListVerb(CLI::App& command) {
    command.add_subcommand("list", "Lists the test patterns: number, name, what it shows, [components]")
        ->callback(list);
}
