#ifndef CG_COMPILER_GLSL_EMITTER_H
#define CG_COMPILER_GLSL_EMITTER_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/GlslNames.h>
#include <Cg/Compiler/References.h>
#include <Cg/Compiler/StageInterface.h>
#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace cg {

/// Writes the typed tree out as a GLSL shader for people to read.
class GlslEmitter {
public:
    GlslEmitter(const TypedProgram& program, const TypeTable& types, const StageInterface& interface,
                const References& references);

    std::string emit();

    /// The GLSL name of a uniform or global after emit(); empty where it was not emitted.
    std::string nameOfVariable(const Variable* variable) const;

    /// The GLSL name of a struct's member.
    const std::string& memberName(const StructType* structure, std::size_t index);

private:
    void nameGlobals();
    std::string structs();
    std::string uniforms();
    std::string globals();
    std::string stageDeclarations() const;
    std::string mainFunction();
    void function(const Function& function);
    void structDefinition(const Type* type, std::string& text, std::unordered_set<const Type*>& done);

    void statement(const TypedStmt* stmt);
    void block(const std::vector<TypedStmt*>& body);
    void branch(const TypedStmt* stmt);
    void declaration(const TypedStmt* stmt);
    void forLoop(const TypedStmt* stmt);
    std::string forInitializer(const TypedStmt* stmt);
    void effect(const TypedExpr* expression);
    void line(const std::string& text);

    std::string print(const TypedExpr* expression, int minimum = 0);
    std::string printed(const TypedExpr* expression, int& precedence);
    std::string literal(const TypedExpr* expression, int& precedence) const;
    std::string builtin(const TypedExpr* expression);
    std::string byRows(const TypedExpr* expression);
    void addHelper(Name helper, const std::string& type);
    std::string arguments(const TypedExpr* expression);
    std::string construct(const TypedExpr* expression);
    std::string convert(const TypedExpr* expression, int& precedence);
    std::string unary(const TypedExpr* expression, int& precedence);
    std::string assign(const TypedExpr* expression);

    const std::string& typeName(const Type* type);
    std::string declare(const Type* type, const std::string& name);
    const std::string& variableName(const Variable* variable);
    const std::string& functionName(const Function* function);
    const std::string& structName(const Type* type);

    bool isOnlyOutput(const Variable* argument) const;
    std::string input(const StageValue& value);
    std::string output(const StageValue& value);

    const TypedProgram& mProgram;
    const TypeTable& mTypes;
    const References& mReferences;
    const StageInterface& mInterface;
    GlslNames mNames;
    std::unordered_map<const Variable*, std::string> mVariableNames;
    std::unordered_map<const Variable*, std::string> mUniformNames; ///< of uniforms that work on a copy
    std::unordered_map<const Function*, std::string> mFunctionNames;
    std::unordered_map<const Type*, std::string> mTypeNames;
    std::unordered_map<const StructType*, std::vector<std::string>> mMemberNames;
    std::vector<std::string> mHelpers;
    std::unordered_set<std::string> mKnownHelpers;
    std::unordered_map<std::string, std::string> mRowFunctions; ///< names, by what else there is of them
    std::string mText;
    int mIndent = 0;
};

} // namespace cg

#endif
