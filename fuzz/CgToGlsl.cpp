#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/VaryingPlaces.h>

#include <cstdint>
#include <cstdlib>
#include <set>
#include <sstream>
#include <string>

// The whole way from Cg to GLSL, on any bytes: nothing crashes, hangs or leaks, and the result is one that
// Compiler.h promises. What was compiled before changes nothing in whether a program compiles. An input names
// its entries as the programs of tests/cg/ do, in lines "//! vertex NAME" and "//! fragment NAME"; without
// them its function main is compiled for both stages.

namespace {

std::string entryOf(const std::string& source, const std::string& stage) {
    const std::string directive = "//! " + stage + " ";
    const std::size_t at = source.find(directive);
    std::string name = "main";
    if (at != std::string::npos)
        std::istringstream(source.substr(at + directive.size(), 80)) >> name;
    return name;
}

bool readHeader(const std::string&, std::string& text) {
    text = "#ifndef HEADER\n#define HEADER\nfloat3 included(float3 c) { return c; }\n#endif\n";
    return true;
}

/// As if a process had compiled three programs: names that fuzzed programs are likely to have share places.
cg::VaryingPlaces usedPlaces() {
    cg::VaryingPlaces places;
    for (const char* const word : {"OWN", "MY_OWN", "A"}) {
        std::set<std::string> names;
        for (int i = 0; i < cg::VaryingPlaces::COUNT; ++i)
            names.insert("varying_" + std::string(word) + std::to_string(i));
        places.assign(names);
    }
    return places;
}

void compileFor(cg::Stage stage, const std::string& entry, const std::string& source) {
    cg::CompileRequest request;
    request.source = source;
    request.fileName = "fuzz.cg";
    request.entry = entry;
    request.stage = stage;
    if (source.size() % 2 != 0) // so that both targets see inputs
        request.target = {460, true};
    request.reader = readHeader;
    const cg::CompileResult result = cg::compile(request);
    const bool hasError = result.listing.find(" : error: ") != std::string::npos;
    const bool hasText = result.glsl.rfind("#version ", 0) == 0;
    if (result.ok == hasError || result.ok != hasText)
        std::abort();
    static const cg::VaryingPlaces used = usedPlaces();
    cg::VaryingPlaces places = used; // of this input alone: it can be tried again
    request.varyingPlaces = &places;
    if (cg::compile(request).ok != result.ok)
        std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string source(data, data + size);
    compileFor(cg::Stage::VERTEX, entryOf(source, "vertex"), source);
    compileFor(cg::Stage::FRAGMENT, entryOf(source, "fragment"), source);
    return 0;
}
