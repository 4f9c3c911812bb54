#include <Cg/Compiler/GlslSymbols.h>

#include <Cg/Compiler/References.h>
#include <Cg/Compiler/StageInterface.h>

namespace cg {

namespace {

/// `[6]`; nothing where the type is no array.
std::string lengthOf(const Type* type) {
    return type->isArray() ? "[" + std::to_string(flatLength(type)) + "]" : "";
}

std::string builtinTypeName(const Type* type) {
    if (type->isVoid())
        return "void";
    if (type->isSampler()) {
        constexpr const char* SAMPLERS[] = {"sampler2D",           "sampler1D",           "sampler2D",
                                            "sampler3D",           "sampler2DRect",       "samplerCube",
                                            "sampler1DArray",      "sampler2DArray",      "sampler1DShadow",
                                            "sampler2DShadow",     "sampler2DRectShadow", "samplerCubeShadow",
                                            "sampler2DArrayShadow"};
        return SAMPLERS[static_cast<std::size_t>(type->sampler)];
    }
    if (type->isFullMatrix())
        return "mat" + std::to_string(type->rows) +
               (type->rows == type->columns ? "" : "x" + std::to_string(type->columns));
    const bool isSingle = type->components() == 1;
    const char* prefix = type->scalar == Scalar::BOOL   ? (isSingle ? "bool" : "b")
                         : type->scalar == Scalar::INT  ? (isSingle ? "int" : "i")
                         : type->scalar == Scalar::UINT ? (isSingle ? "uint" : "u")
                                                        : (isSingle ? "float" : "");
    return isSingle ? prefix : prefix + ("vec" + std::to_string(type->components()));
}

} // namespace

GlslSymbols::GlslSymbols(const TypedProgram& program, const StageInterface& interface,
                         const References& references) {
    for (const StageDeclaration& declaration : interface.declarations())
        mNames.global(declaration.name);
    for (const Variable* uniform : program.uniforms)
        if (references.uses(uniform)) {
            const std::string name = mNames.global(uniform->name);
            mVariableNames[uniform] = name;
            if (uniform->isWritten && !isOpaque(uniform->type)) {
                mUniformNames[uniform] = name;
                mVariableNames[uniform] = mNames.global(name + "_copy");
            }
        }
    for (const Variable* variable : program.globals)
        if (references.uses(variable))
            mVariableNames[variable] = mNames.global(variable->name);
    for (const Variable* variable : program.temporaries)
        if (references.uses(variable))
            mVariableNames[variable] = mNames.global(variable->name);
    for (const Function* function : program.functions) {
        std::string name(function->name);
        if (function->declaration && !function->declaration->ownerName.empty())
            name.insert(0, std::string(function->declaration->ownerName) + "_");
        mFunctionNames[function] = mNames.global(name);
    }
}

std::string GlslSymbols::uniformName(const Variable* variable) const {
    const auto uniform = mUniformNames.find(variable);
    if (uniform != mUniformNames.end())
        return uniform->second;
    const auto found = mVariableNames.find(variable);
    return found == mVariableNames.end() ? "" : found->second;
}

const std::string& GlslSymbols::variableName(const Variable* variable) {
    const auto found = mVariableNames.find(variable);
    return found != mVariableNames.end() ? found->second
                                         : mVariableNames[variable] = mNames.local(variable->name);
}

const std::string& GlslSymbols::functionName(const Function* function) {
    return mFunctionNames[function];
}

const std::string& GlslSymbols::structName(const Type* type) {
    std::string& name = mTypeNames[type];
    if (name.empty())
        name = mNames.global(type->structure->name.empty() ? "Struct" : type->structure->name);
    return name;
}

const std::string& GlslSymbols::memberName(const StructType* structure, std::size_t index) {
    std::vector<std::string>& names = mMemberNames[structure];
    if (names.empty()) {
        GlslNames members;
        for (const Field& field : structure->fields)
            names.push_back(members.global(field.name));
    }
    return names[index];
}

const std::string& GlslSymbols::typeName(const Type* type) {
    type = innermost(type);
    if (type->isStruct())
        return structName(type);
    std::string& name = mTypeNames[type];
    if (name.empty())
        name = builtinTypeName(type);
    return name;
}

std::string GlslSymbols::arrayTypeName(const Type* type) {
    return typeName(type) + lengthOf(type);
}

std::string GlslSymbols::declare(const Type* type, const std::string& name) {
    return typeName(type) + " " + name + lengthOf(type);
}

} // namespace cg
