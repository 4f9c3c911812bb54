#ifndef CG_COMPILER_GLSL_SYMBOLS_H
#define CG_COMPILER_GLSL_SYMBOLS_H

#include <Cg/Compiler/GlslNames.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <string>
#include <unordered_map>
#include <vector>

namespace cg {

class References;
class StageInterface;

/// What a program's types, variables and functions are called in its GLSL text.
///
/// Globals and functions have their names from the start; locals, types and members get theirs when they are
/// first asked for.
class GlslSymbols {
public:
    GlslSymbols(const TypedProgram& program, const StageInterface& interface, const References& references);

    /// A global, one of the uniforms or a temporary of their initial values that the program uses.
    bool isNamed(const Variable* variable) const { return mVariableNames.count(variable) != 0; }

    /// A struct that was asked for.
    bool isNamed(const Type* type) const { return mTypeNames.count(type) != 0; }

    /// A uniform that the program writes to: it works on a copy, which has the variable's name.
    bool isCopied(const Variable* uniform) const { return mUniformNames.count(uniform) != 0; }

    /// Empty where nothing uses the uniform.
    std::string uniformName(const Variable* uniform) const;
    const std::string& variableName(const Variable* variable);
    const std::string& functionName(const Function* function);
    const std::string& structName(const Type* type);
    const std::string& memberName(const StructType* structure, std::size_t index);

    /// `float`; an array's is that of its elements.
    const std::string& typeName(const Type* type);

    /// `float[6]`: arrays of arrays are flat.
    std::string arrayTypeName(const Type* type);

    /// `float name[6]`
    std::string declare(const Type* type, const std::string& name);

    void openScope() { mNames.openScope(); }
    void closeScope() { mNames.closeScope(); }

private:
    GlslNames mNames;
    std::unordered_map<const Variable*, std::string> mVariableNames;
    std::unordered_map<const Variable*, std::string> mUniformNames; ///< of uniforms that work on a copy
    std::unordered_map<const Function*, std::string> mFunctionNames;
    std::unordered_map<const Type*, std::string> mTypeNames;
    std::unordered_map<const StructType*, std::vector<std::string>> mMemberNames;
};

} // namespace cg

#endif
