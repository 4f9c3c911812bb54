#include <Cg/Compiler/GlslEmitter.h>

#include <Cg/Compiler/GlslFunctions.h>
#include <Cg/Compiler/GlslSymbols.h>

#include <cstddef>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

std::string components(const std::string& expression, int have, int want) {
    return have == want ? expression
                        : expression + "." + std::string("xyzw").substr(0, static_cast<std::size_t>(want));
}

/// `float x`, `x` is what is missing to the four components that OpenGL's own variables have.
std::string padded(const std::string& expression, int size) {
    constexpr const char* PADDING[] = {"", ", 0.0, 0.0, 1.0", ", 0.0, 1.0", ", 1.0", ""};
    return size == 4 ? expression : "vec4(" + expression + PADDING[size] + ")";
}

} // namespace

GlslEmitter::GlslEmitter(const TypedProgram& program, const TypeTable& types, const StageInterface& interface,
                         GlslSymbols& symbols)
    : mProgram(program), mTypes(types), mInterface(interface), mSymbols(symbols),
      mExpressions(types, symbols) {}

/// What is declared depends on what the functions use, so they are written first.
std::string GlslEmitter::emit() {
    GlslFunctions functions(mSymbols, mExpressions);
    for (const Function* function : mProgram.functions)
        functions.add(*function);
    const std::string entry = mainFunction();
    const std::string globalText = globals();
    const std::string uniformText = uniforms();
    const std::string structText = structs();
    std::string text = "#version 330 compatibility\n#extension GL_ARB_separate_shader_objects : enable\n\n";
    const auto add = [&text](const std::string& part) {
        if (!part.empty())
            text += part + "\n";
    };
    add(stageDeclarations());
    add(structText);
    add(uniformText);
    add(globalText);
    for (const std::string& helper : mExpressions.helpers())
        add(helper + "\n");
    return text + functions.text() + entry;
}

// ---------------------------------------------------------------------------------------- declarations

void GlslEmitter::structDefinition(const Type* type, std::string& text,
                                   std::unordered_set<const Type*>& done) {
    if (!done.insert(type).second)
        return;
    const StructType* structure = type->structure;
    for (const Field& field : structure->fields)
        if (innermost(field.type)->isStruct())
            structDefinition(innermost(field.type), text, done);
    std::string body;
    for (std::size_t i = 0; i < structure->fields.size(); ++i)
        if (!isOpaque(structure->fields[i].type))
            body += "    " + mSymbols.declare(structure->fields[i].type, mSymbols.memberName(structure, i)) +
                    ";\n";
    if (body.empty())
        body = "    float nothing;\n"; // GLSL has no empty structs
    text += "struct " + mSymbols.structName(type) + " {\n" + body + "};\n";
}

std::string GlslEmitter::structs() {
    std::string text;
    std::unordered_set<const Type*> done;
    for (const Type* type : mTypes.structs())
        if (mSymbols.isNamed(type))
            structDefinition(type, text, done);
    return text;
}

std::string GlslEmitter::uniforms() {
    std::string text;
    for (const Variable* uniform : mProgram.uniforms) {
        const std::string name = mSymbols.uniformName(uniform);
        if (!name.empty() && !uniform->state)
            text += "uniform " + mSymbols.declare(uniform->type, name) + ";\n";
    }
    return text;
}

std::string GlslEmitter::globals() {
    std::string text;
    for (const Variable* variable : mProgram.temporaries)
        if (mSymbols.isNamed(variable))
            text += mSymbols.declare(variable->type, mSymbols.variableName(variable)) + ";\n";
    for (const Variable* variable : mProgram.uniforms)
        if (mSymbols.isCopied(variable))
            text += mSymbols.declare(variable->type, mSymbols.variableName(variable)) + ";\n";
    for (const Variable* variable : mProgram.globals) {
        if (!mSymbols.isNamed(variable))
            continue;
        const std::string declared = mSymbols.declare(variable->type, mSymbols.variableName(variable));
        text += variable->isConstantExpression
                    ? "const " + declared + " = " + mExpressions.value(variable->initializer)
                    : declared;
        text += ";\n";
    }
    return text;
}

std::string GlslEmitter::stageDeclarations() const {
    std::string text = mInterface.builtinDeclarations();
    for (const StageDeclaration& declaration : mInterface.declarations())
        text += "layout(location = " + std::to_string(declaration.location) + ") " +
                (declaration.isOutput ? "out" : "in") + " vec4 " + declaration.name + ";\n";
    return text;
}

// ------------------------------------------------------------------------------------------------ main

/// A stage input as the Cg program wants it.
std::string GlslEmitter::input(const StageValue& value) {
    const StageSlot slot = mInterface.slot(value);
    const Type* type = value.place->type;
    if (slot.glsl.empty())
        return mSymbols.typeName(type) + "(0)";
    const int size = type->components();
    std::string text = slot.glsl;
    if (size <= slot.size)
        text = components(text, slot.size, size);
    else
        text = slot.size == 3 ? "vec4(" + text + ", 1.0)" : components(padded(text, slot.size), 4, size);
    const bool isFloat = isFloating(type->scalar);
    return isFloat && !slot.isInteger ? text : mSymbols.typeName(type) + "(" + text + ")";
}

/// The assignments that hand an output to OpenGL.
std::string GlslEmitter::output(const StageValue& value) {
    const StageSlot slot = mInterface.slot(value);
    if (slot.glsl.empty())
        return "";
    const Type* type = value.place->type;
    std::string text = mExpressions.object(value.place);
    int size = type->components();
    if (size > slot.size) {
        text = components(text, size, slot.size);
        size = slot.size;
    }
    if (!isFloating(type->scalar))
        text = (size == 1 ? "float" : "vec" + std::to_string(size)) + "(" + text + ")";
    if (size < slot.size)
        text = padded(text, size);
    return slot.twin.empty() ? slot.glsl + " = " + text + ";"
                             : slot.glsl + " = " + slot.twin + " = " + text + ";";
}

/// The arguments of the entry that inputs are a part of.
std::unordered_set<const Variable*> GlslEmitter::inputArguments() const {
    std::unordered_set<const Variable*> arguments;
    for (const StageValue& value : mProgram.values)
        if (!value.isOutput)
            arguments.insert(rootVariable(value.place));
    return arguments;
}

/// Where an input goes: its argument is declared here, unless it is a part of one.
std::string GlslEmitter::place(const StageValue& value) {
    const bool isDeclaration = value.place->kind == Kind::VARIABLE && value.place->type->isScalarOrVector();
    return isDeclaration ? mSymbols.declare(value.place->type, mSymbols.variableName(value.place->variable))
                         : mExpressions.object(value.place);
}

std::string GlslEmitter::entryCall() {
    std::string call = mSymbols.functionName(mProgram.entry) + "(";
    for (const Variable* variable : mProgram.arguments)
        call += (variable == mProgram.arguments[0] ? "" : ", ") + mSymbols.variableName(variable);
    call += ");";
    if (const Variable* result = mProgram.result)
        call = mSymbols.declare(result->type, mSymbols.variableName(result)) + " = " + call;
    return call;
}

std::string GlslEmitter::mainFunction() {
    std::string text = "void main() {\n";
    const auto line = [&text](const std::string& statement) { text += "    " + statement + "\n"; };
    mSymbols.openScope();
    for (const Variable* uniform : mProgram.uniforms)
        if (mSymbols.isCopied(uniform))
            line(mSymbols.variableName(uniform) + " = " + mSymbols.uniformName(uniform) + ";");
    for (const Variable* variable : mProgram.globals)
        if (mSymbols.isNamed(variable) && variable->initializer && !variable->isConstantExpression)
            line(mSymbols.variableName(variable) + " = " + mExpressions.value(variable->initializer) + ";");
    const std::unordered_set<const Variable*> inputs = inputArguments();
    for (const Variable* variable : mProgram.arguments)
        if (!variable->type->isScalarOrVector() || inputs.count(variable) == 0)
            line(mSymbols.declare(variable->type, mSymbols.variableName(variable)) + ";");
    for (const StageValue& value : mProgram.values)
        if (!value.isOutput)
            line(place(value) + " = " + input(value) + ";");
    line(entryCall());
    for (const StageValue& value : mProgram.values)
        if (const std::string handed = value.isOutput ? output(value) : ""; !handed.empty())
            line(handed);
    mSymbols.closeScope();
    return text + "}\n";
}

} // namespace cg
