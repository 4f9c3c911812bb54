#ifndef CG_COMPILER_GLSL_EMITTER_H
#define CG_COMPILER_GLSL_EMITTER_H

#include <Cg/Compiler/GlslExpressions.h>
#include <Cg/Compiler/StageInterface.h>
#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <unordered_set>

namespace cg {

class GlslSymbols;

/// Writes the typed tree out as a GLSL shader for people to read.
class GlslEmitter {
public:
    GlslEmitter(const TypedProgram& program, const TypeTable& types, const StageInterface& interface,
                GlslSymbols& symbols);

    std::string emit();

private:
    std::string structs();
    std::string uniforms();
    std::string globals();
    std::string stageDeclarations() const;
    std::string mainFunction();
    void structDefinition(const Type* type, std::string& text, std::unordered_set<const Type*>& done);
    std::unordered_set<const Variable*> inputArguments() const;
    std::string place(const StageValue& value);
    std::string input(const StageValue& value);
    std::string output(const StageValue& value);
    std::string entryCall();

    const TypedProgram& mProgram;
    const TypeTable& mTypes;
    const StageInterface& mInterface;
    GlslSymbols& mSymbols;
    GlslExpressions mExpressions;
};

} // namespace cg

#endif
