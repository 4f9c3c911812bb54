#include "Verbs.h"

#include <CgFolder.h>
#include <OutputFile.h>

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/SourceReader.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <iomanip>
#include <iostream>
#include <map>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

struct ShaderOptions {
    std::string file;
    std::string entry;
    cg::Stage stage = cg::Stage::FRAGMENT;
    std::vector<std::string> macros;
    std::vector<std::string> includeFolders;
    bool isGlsl = false;
    bool isWarning = false;
};

cg::CompileRequest requestOf(const ShaderOptions& options) {
    cg::CompileRequest request;
    const std::string file = host::findCgProgram(options.file);
    if (!cg::readSource(file, request.source))
        throw std::runtime_error(file + ": it cannot be read: " + std::strerror(errno));
    request.fileName = file;
    request.entry = options.entry;
    request.stage = options.stage;
    request.reader = cg::readInclude;
    request.includeFolders = options.includeFolders;
    for (const std::string& macro : options.macros) {
        const size_t equals = macro.find('=');
        request.macros.emplace_back(macro.substr(0, equals),
                                    equals == std::string::npos ? "1" : macro.substr(equals + 1));
    }
    return request;
}

// --- The table of parameters

enum Column { NAME, TYPE, SIZE, KIND, SEMANTIC, UNIT, DEFAULT, NUM_COLUMNS };
using Row = std::array<std::string, NUM_COLUMNS>;

constexpr const char* NOTHING = "-";

std::string scalarName(cg::ScalarKind kind) {
    constexpr const char* NAMES[] = {"float", "half", "fixed", "int", "bool"};
    return NAMES[static_cast<size_t>(kind)];
}

std::string samplerName(cg::SamplerKind kind) {
    constexpr const char* NAMES[] = {"sampler1D",   "sampler2D",      "sampler3D",     "samplerRECT",
                                     "samplerCUBE", "sampler1DARRAY", "sampler2DARRAY"};
    return NAMES[static_cast<size_t>(kind)];
}

std::string typeName(const cg::Parameter& parameter) {
    switch (parameter.parameterClass) {
    case cg::ParameterClass::SCALAR:
        return scalarName(parameter.scalarKind);
    case cg::ParameterClass::VECTOR:
        return scalarName(parameter.scalarKind) + std::to_string(parameter.columns);
    case cg::ParameterClass::MATRIX:
        return scalarName(parameter.scalarKind) + std::to_string(parameter.rows) + 'x' +
               std::to_string(parameter.columns);
    case cg::ParameterClass::SAMPLER:
        return samplerName(parameter.samplerKind);
    case cg::ParameterClass::STRUCT:
        return parameter.structName.empty() ? "struct" : parameter.structName;
    case cg::ParameterClass::ARRAY:
        return parameter.children.empty() ? "array" : typeName(parameter.children.front());
    }
    return {};
}

std::string kindName(const cg::Parameter& parameter) {
    if (parameter.variability == cg::ParameterVariability::UNIFORM)
        return parameter.isReferenced ? "uniform" : "unused";
    if (parameter.variability == cg::ParameterVariability::CONSTANT)
        return "constant";
    constexpr const char* DIRECTIONS[] = {"in", "out", "inout"};
    return DIRECTIONS[static_cast<size_t>(parameter.direction)];
}

std::string unitName(const cg::Parameter& parameter) {
    if (parameter.parameterClass != cg::ParameterClass::SAMPLER)
        return NOTHING;
    return parameter.textureUnit < 0 ? "any" : std::to_string(parameter.textureUnit);
}

/// Of an array, those of its elements one after the other.
void addDefaults(const cg::Parameter& parameter, std::vector<float>& values) {
    values.insert(values.end(), parameter.defaults.begin(), parameter.defaults.end());
    for (const cg::Parameter& child : parameter.children)
        addDefaults(child, values);
}

std::string defaultText(const cg::Parameter& parameter) {
    std::vector<float> values;
    addDefaults(parameter, values);
    std::ostringstream text;
    for (const float value : values)
        text << (text.tellp() > 0 ? " " : "") << value;
    return values.empty() ? NOTHING : text.str();
}

bool holdsStructures(const cg::Parameter& parameter) {
    return parameter.parameterClass == cg::ParameterClass::STRUCT ||
           (!parameter.children.empty() && holdsStructures(parameter.children.front()));
}

/// A row for each thing that a host sets or connects: structures are taken apart, arrays of anything else are
/// not.
void addRows(const cg::Parameter& parameter, std::vector<Row>& rows) {
    if (holdsStructures(parameter)) {
        for (const cg::Parameter& child : parameter.children)
            addRows(child, rows);
        return;
    }
    const bool isArray = parameter.parameterClass == cg::ParameterClass::ARRAY;
    rows.push_back({parameter.name, typeName(parameter),
                    std::to_string(isArray ? parameter.children.size() : 1), kindName(parameter),
                    parameter.semantic.empty() ? NOTHING : parameter.semantic, unitName(parameter),
                    defaultText(parameter)});
}

std::string tableOf(const std::vector<cg::Parameter>& parameters) {
    std::vector<Row> rows = {{"name", "type", "size", "kind", "semantic", "unit", "default"}};
    for (const cg::Parameter& parameter : parameters)
        addRows(parameter, rows);
    std::array<size_t, NUM_COLUMNS> widths{};
    for (const Row& row : rows)
        for (size_t column = 0; column < NUM_COLUMNS; ++column)
            widths[column] = std::max(widths[column], row[column].size());
    std::ostringstream text;
    for (const Row& row : rows) {
        for (size_t column = 0; column < DEFAULT; ++column)
            text << std::left << std::setw(static_cast<int>(widths[column]) + 2) << row[column];
        text << row[DEFAULT] << '\n';
    }
    return text.str();
}

void shader(const ShaderOptions& options) {
    const cg::CompileResult result = cg::compile(requestOf(options));
    if (!result.ok || options.isWarning)
        std::cerr << result.listing;
    if (!result.ok)
        throw std::runtime_error(options.file + ": it does not compile");
    host::OutputFile output("-");
    output.write(options.isGlsl ? result.glsl : tableOf(result.parameters));
    output.close();
}

} // namespace

void addShaderVerb(CLI::App& command) {
    CLI::App* const verb = command.add_subcommand(
        "shader",
        "Compiles a Cg program and lists its parameters; needs no OpenGL. Sizes are numbers of elements");
    const auto options = std::make_shared<ShaderOptions>();
    const std::map<std::string, cg::Stage> stages = {{"vertex", cg::Stage::VERTEX},
                                                     {"fragment", cg::Stage::FRAGMENT}};
    verb->add_option("FILE", options->file, "Cg source")->required()->type_name("");
    verb->add_option("--entry", options->entry, "Entry function")->required()->type_name("NAME");
    verb->add_option("--stage", options->stage, "Stage that it is for")
        ->required()
        ->transform(CLI::CheckedTransformer(stages).description(""))
        ->type_name("vertex|fragment");
    verb->add_option("-D,--define", options->macros, "Macro, as NAME or NAME=TEXT")->type_name("MACRO");
    verb->add_option("-I,--include", options->includeFolders, "Folder to look for includes in")
        ->type_name("DIR");
    verb->add_flag("--glsl", options->isGlsl, "Print the GLSL instead");
    verb->add_flag("--warnings", options->isWarning, "Print the compiler's warnings");
    verb->callback([options] { shader(*options); });
}
