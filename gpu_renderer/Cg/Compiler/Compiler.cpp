#include <Cg/Compiler/Compiler.h>

#include <Cg/Compiler/Arena.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/FlatBranches.h>
#include <Cg/Compiler/GlslEmitter.h>
#include <Cg/Compiler/GlslSymbols.h>
#include <Cg/Compiler/ParameterList.h>
#include <Cg/Compiler/Parser.h>
#include <Cg/Compiler/Preprocessor.h>
#include <Cg/Compiler/References.h>
#include <Cg/Compiler/Resolver/Resolver.h>
#include <Cg/Compiler/Resolver/SamplerKinds.h>
#include <Cg/Compiler/SourceFiles.h>
#include <Cg/Compiler/StageInterface.h>
#include <Cg/Compiler/VaryingPlaces.h>

#include <cstddef>

namespace cg {

namespace {

/// What programs ask for to know whom they are compiled by and for.
PreprocessorOptions preprocessorOptions(const CompileRequest& request) {
    PreprocessorOptions options;
    options.reader = request.reader;
    options.includeFolders = request.includeFolders;
    options.macros = {{"__CG__", "1"}, {"__CGC__", "1"}};
    if (request.stage == Stage::VERTEX)
        options.macros.insert(options.macros.end(), {{"PROFILE_GLSLV", "1"}, {"__GLSLV__", "1"}});
    else
        options.macros.insert(options.macros.end(), {{"PROFILE_GLSLF", "1"}, {"__GLSLF__", "1"}});
    options.macros.insert(options.macros.end(), request.macros.begin(), request.macros.end());
    return options;
}

bool checkInterface(const StageInterface& interface, Diagnostics& diagnostics) {
    if (const StageValue* value = interface.sharedAttribute())
        diagnostics.warning(value->place->location, "OpenGL has no attribute left for the input " +
                                                        inQuotes(value->semantic) +
                                                        ": it shares one with another input");
    const StageValue* unplaced = interface.unplaced();
    if (unplaced)
        diagnostics.error(unplaced->place->location, "there is no place left between the stages for " +
                                                         inQuotes(unplaced->semantic) +
                                                         ": use TEXCOORD0 to TEXCOORD15 as well");
    return !unplaced;
}

void translate(const CompileRequest& request, SourceFiles& files, Diagnostics& diagnostics,
               CompileResult& result) {
    const std::uint32_t mainFile = files.add(request.fileName, request.source);
    const std::vector<Token> tokens = preprocess(files, mainFile, preprocessorOptions(request), diagnostics);
    Arena arena;
    const TranslationUnit* unit = parse(tokens, arena, diagnostics);
    if (diagnostics.hasErrors())
        return;
    TypeTable types(arena);
    SamplerKinds samplerKinds;
    std::size_t known = 0;
    TypedProgram* program = nullptr;
    do {
        known = samplerKinds.plainCount();
        program =
            Resolver(*unit, request.stage, arena, types, diagnostics, samplerKinds).resolve(request.entry);
    } while (!diagnostics.hasErrors() && samplerKinds.plainCount() > known);
    if (diagnostics.hasErrors())
        return;
    VaryingPlaces ownPlaces;
    const StageInterface interface(request.stage, program->values,
                                   request.varyingPlaces ? *request.varyingPlaces : ownPlaces);
    if (!checkInterface(interface, diagnostics))
        return;
    flattenBranches(*program, types, arena);
    const References references(*program);
    GlslSymbols symbols(*program, interface, references);
    result.glsl = GlslEmitter(*program, types, interface, symbols).emit();
    result.parameters = listParameters(*program, references, symbols);
    result.ok = true;
}

} // namespace

CompileResult compile(const CompileRequest& request) {
    CompileResult result;
    SourceFiles files;
    Diagnostics diagnostics;
    try {
        translate(request, files, diagnostics, result);
    } catch (const Arena::Full&) {
        diagnostics.error({}, "the program is too large when its arrays and structs are written out");
    }
    result.listing = diagnostics.listing(files);
    return result;
}

} // namespace cg
