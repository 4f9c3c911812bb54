#include <Cg/Compiler/GlslEmitter.h>

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/TypedBuilder.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// How strongly GLSL's operators bind.
enum Precedence {
    COMMA_LEVEL,
    ASSIGN_LEVEL,
    CONDITIONAL_LEVEL,
    OR_LEVEL,
    AND_LEVEL,
    BIT_OR_LEVEL,
    BIT_XOR_LEVEL,
    BIT_AND_LEVEL,
    EQUALITY_LEVEL,
    RELATION_LEVEL,
    SHIFT_LEVEL,
    SUM_LEVEL,
    PRODUCT_LEVEL,
    UNARY_LEVEL,
    POSTFIX_LEVEL
};

int precedenceOf(BinaryOp op) {
    switch (op) {
    case BinaryOp::MULTIPLY:
    case BinaryOp::DIVIDE:
    case BinaryOp::MODULO:
        return PRODUCT_LEVEL;
    case BinaryOp::ADD:
    case BinaryOp::SUBTRACT:
        return SUM_LEVEL;
    case BinaryOp::SHIFT_LEFT:
    case BinaryOp::SHIFT_RIGHT:
        return SHIFT_LEVEL;
    case BinaryOp::LESS:
    case BinaryOp::GREATER:
    case BinaryOp::LESS_EQUAL:
    case BinaryOp::GREATER_EQUAL:
        return RELATION_LEVEL;
    case BinaryOp::EQUAL:
    case BinaryOp::NOT_EQUAL:
        return EQUALITY_LEVEL;
    case BinaryOp::BIT_AND:
        return BIT_AND_LEVEL;
    case BinaryOp::BIT_XOR:
        return BIT_XOR_LEVEL;
    case BinaryOp::BIT_OR:
        return BIT_OR_LEVEL;
    case BinaryOp::AND:
        return AND_LEVEL;
    case BinaryOp::OR:
        return OR_LEVEL;
    case BinaryOp::COMMA:
        break;
    }
    return COMMA_LEVEL;
}

std::string floatText(double number) {
    const auto value = static_cast<float>(number);
    if (std::isnan(value))
        return "(0.0 / 0.0)";
    if (std::isinf(value))
        return value > 0 ? "(1.0 / 0.0)" : "(-1.0 / 0.0)";
    char buffer[40];
    const auto end = std::to_chars(buffer, buffer + sizeof buffer, value).ptr;
    std::string text(buffer, end);
    return text.find_first_of(".e") == std::string::npos ? text + ".0" : text;
}

std::string components(const std::string& expression, int have, int want) {
    return have == want ? expression
                        : expression + "." + std::string("xyzw").substr(0, static_cast<std::size_t>(want));
}

/// `float x`, `x` is what is missing to the four components that OpenGL's own variables have.
std::string padded(const std::string& expression, int size) {
    constexpr const char* PADDING[] = {"", ", 0.0, 0.0, 1.0", ", 0.0, 1.0", ", 1.0", ""};
    return size == 4 ? expression : "vec4(" + expression + PADDING[size] + ")";
}

const Type* innermost(const Type* type) {
    while (type->isArray())
        type = type->element;
    return type;
}

/// Elements of an array, those of arrays within it counted singly: GLSL's arrays are flat.
int flatLength(const Type* type) {
    int length = 1;
    for (; type->isArray(); type = type->element)
        length *= type->length;
    return length;
}

/// A form with its operands in place of `$0`, `$1`, ...
template <class Print>
std::string filledIn(Name form, const Print& print) {
    std::string text;
    for (std::size_t i = 0; i < form.size(); ++i) {
        if (form[i] == '$' && i + 1 < form.size())
            text += print(static_cast<std::size_t>(form[++i] - '0'));
        else
            text += form[i];
    }
    return text;
}

/// The `if` that stands alone behind an `else`; null where there is none.
const TypedStmt* chained(const TypedStmt* stmt) {
    const TypedStmt* otherwise = stmt->body[1];
    const bool isChained =
        otherwise && otherwise->body.size() == 1 && otherwise->body[0]->kind == TypedStmt::Kind::IF;
    return isChained ? otherwise->body[0] : nullptr;
}

} // namespace

GlslEmitter::GlslEmitter(const TypedProgram& program, const TypeTable& types, const StageInterface& interface,
                         const References& references)
    : mProgram(program), mTypes(types), mReferences(references), mInterface(interface) {}

std::string GlslEmitter::emit() {
    nameGlobals();
    for (const Function* function : mProgram.functions)
        this->function(*function);
    const std::string functions = std::move(mText);
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
    for (const std::string& helper : mHelpers)
        add(helper + "\n");
    return text + functions + entry;
}

// ----------------------------------------------------------------------------------------------- names

void GlslEmitter::nameGlobals() {
    for (const StageDeclaration& declaration : mInterface.declarations())
        mNames.global(declaration.name);
    for (const Variable* uniform : mProgram.uniforms)
        if (mReferences.uses(uniform)) {
            const std::string name = mNames.global(uniform->name);
            mVariableNames[uniform] = name;
            if (uniform->isWritten && !isOpaque(uniform->type)) {
                mUniformNames[uniform] = name;
                mVariableNames[uniform] = mNames.global(name + "_copy");
            }
        }
    for (const Variable* variable : mProgram.globals)
        if (mReferences.uses(variable))
            mVariableNames[variable] = mNames.global(variable->name);
    for (const Variable* variable : mProgram.temporaries)
        if (mReferences.uses(variable))
            mVariableNames[variable] = mNames.global(variable->name);
    for (const Function* function : mProgram.functions) {
        std::string name(function->name);
        if (function->declaration && !function->declaration->ownerName.empty())
            name.insert(0, std::string(function->declaration->ownerName) + "_");
        mFunctionNames[function] = mNames.global(name);
    }
}

std::string GlslEmitter::nameOfVariable(const Variable* variable) const {
    const auto uniform = mUniformNames.find(variable);
    if (uniform != mUniformNames.end())
        return uniform->second;
    const auto found = mVariableNames.find(variable);
    return found == mVariableNames.end() ? "" : found->second;
}

const std::string& GlslEmitter::variableName(const Variable* variable) {
    const auto found = mVariableNames.find(variable);
    return found != mVariableNames.end() ? found->second
                                         : mVariableNames[variable] = mNames.local(variable->name);
}

const std::string& GlslEmitter::functionName(const Function* function) {
    return mFunctionNames[function];
}

const std::string& GlslEmitter::structName(const Type* type) {
    std::string& name = mTypeNames[type];
    if (name.empty())
        name = mNames.global(type->structure->name.empty() ? "Struct" : type->structure->name);
    return name;
}

const std::string& GlslEmitter::memberName(const StructType* structure, std::size_t index) {
    std::vector<std::string>& names = mMemberNames[structure];
    if (names.empty()) {
        GlslNames members;
        for (const Field& field : structure->fields)
            names.push_back(members.global(field.name));
    }
    return names[index];
}

const std::string& GlslEmitter::typeName(const Type* type) {
    type = innermost(type);
    if (type->isStruct())
        return structName(type);
    std::string& name = mTypeNames[type];
    if (!name.empty())
        return name;
    if (type->isVoid()) {
        name = "void";
    } else if (type->isSampler()) {
        constexpr const char* SAMPLERS[] = {"sampler2D",           "sampler1D",           "sampler2D",
                                            "sampler3D",           "sampler2DRect",       "samplerCube",
                                            "sampler1DArray",      "sampler2DArray",      "sampler1DShadow",
                                            "sampler2DShadow",     "sampler2DRectShadow", "samplerCubeShadow",
                                            "sampler2DArrayShadow"};
        name = SAMPLERS[static_cast<std::size_t>(type->sampler)];
    } else if (type->isMatrix() && !type->isThinMatrix()) {
        name = "mat" + std::to_string(type->rows);
        if (type->rows != type->columns)
            name += "x" + std::to_string(type->columns);
    } else {
        const bool isSingle = type->components() == 1;
        const char* prefix = type->scalar == Scalar::BOOL   ? (isSingle ? "bool" : "b")
                             : type->scalar == Scalar::INT  ? (isSingle ? "int" : "i")
                             : type->scalar == Scalar::UINT ? (isSingle ? "uint" : "u")
                                                            : (isSingle ? "float" : "");
        name = isSingle ? prefix : prefix + ("vec" + std::to_string(type->components()));
    }
    return name;
}

std::string GlslEmitter::declare(const Type* type, const std::string& name) {
    std::string text = typeName(type) + " " + name;
    if (type->isArray())
        text += "[" + std::to_string(flatLength(type)) + "]";
    return text;
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
            body += "    " + declare(structure->fields[i].type, memberName(structure, i)) + ";\n";
    if (body.empty())
        body = "    float nothing;\n"; // GLSL has no empty structs
    text += "struct " + structName(type) + " {\n" + body + "};\n";
}

std::string GlslEmitter::structs() {
    std::string text;
    std::unordered_set<const Type*> done;
    for (const Type* type : mTypes.structs())
        if (mTypeNames.count(type) != 0)
            structDefinition(type, text, done);
    return text;
}

std::string GlslEmitter::uniforms() {
    std::string text;
    for (const Variable* uniform : mProgram.uniforms) {
        const std::string name = nameOfVariable(uniform);
        if (!name.empty() && !uniform->state)
            text += "uniform " + declare(uniform->type, name) + ";\n";
    }
    return text;
}

std::string GlslEmitter::globals() {
    std::string text;
    for (const Variable* variable : mProgram.temporaries)
        if (mVariableNames.count(variable) != 0)
            text += declare(variable->type, variableName(variable)) + ";\n";
    for (const Variable* variable : mProgram.uniforms)
        if (mUniformNames.count(variable) != 0)
            text += declare(variable->type, variableName(variable)) + ";\n";
    for (const Variable* variable : mProgram.globals) {
        if (mVariableNames.count(variable) == 0)
            continue;
        const std::string declared = declare(variable->type, variableName(variable));
        text += variable->isConstantExpression
                    ? "const " + declared + " = " + print(variable->initializer, ASSIGN_LEVEL)
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

void GlslEmitter::function(const Function& function) {
    mNames.openScope();
    std::string parameters;
    for (const Variable* parameter : function.parameters) {
        constexpr const char* DIRECTIONS[] = {"", "", "out ", "inout "};
        parameters += (parameters.empty() ? "" : ", ") +
                      std::string(DIRECTIONS[static_cast<std::size_t>(parameter->direction)]) +
                      declare(parameter->type, variableName(parameter));
    }
    std::string result = typeName(function.result);
    if (function.result->isArray())
        result += "[" + std::to_string(flatLength(function.result)) + "]";
    line(result + " " + functionName(&function) + "(" + parameters + ") {");
    ++mIndent;
    for (const Variable* variable : function.temporaries)
        line(declare(variable->type, variableName(variable)) + ";");
    if (function.body)
        for (const TypedStmt* stmt : function.body->body)
            statement(stmt);
    --mIndent;
    line("}");
    line("");
    mNames.closeScope();
}

// ------------------------------------------------------------------------------------------------ main

/// A stage input as the Cg program wants it.
std::string GlslEmitter::input(const StageValue& value) {
    const StageSlot slot = mInterface.slot(value);
    const Type* type = value.place->type;
    if (slot.glsl.empty())
        return typeName(type) + "(0)";
    const int size = type->components();
    std::string text = slot.glsl;
    if (size <= slot.size)
        text = components(text, slot.size, size);
    else
        text = slot.size == 3 ? "vec4(" + text + ", 1.0)" : components(padded(text, slot.size), 4, size);
    const bool isFloat = isFloating(type->scalar);
    return isFloat && !slot.isInteger ? text : typeName(type) + "(" + text + ")";
}

/// The assignments that hand an output to OpenGL.
std::string GlslEmitter::output(const StageValue& value) {
    const StageSlot slot = mInterface.slot(value);
    if (slot.glsl.empty())
        return "";
    const Type* type = value.place->type;
    std::string text = print(value.place, POSTFIX_LEVEL);
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

bool GlslEmitter::isOnlyOutput(const Variable* argument) const {
    return std::none_of(mProgram.values.begin(), mProgram.values.end(), [argument](const StageValue& value) {
        return !value.isOutput && rootVariable(value.place) == argument;
    });
}

std::string GlslEmitter::mainFunction() {
    mText.clear();
    mNames.openScope();
    line("void main() {");
    ++mIndent;
    for (const Variable* variable : mProgram.uniforms)
        if (mUniformNames.count(variable) != 0)
            line(variableName(variable) + " = " + mUniformNames[variable] + ";");
    for (const Variable* variable : mProgram.globals)
        if (mVariableNames.count(variable) != 0 && variable->initializer && !variable->isConstantExpression)
            line(variableName(variable) + " = " + print(variable->initializer, ASSIGN_LEVEL) + ";");
    for (const Variable* variable : mProgram.arguments)
        if (!variable->type->isScalarOrVector() || isOnlyOutput(variable))
            line(declare(variable->type, variableName(variable)) + ";");
    for (const StageValue& value : mProgram.values) {
        if (value.isOutput)
            continue;
        const std::string place = value.place->kind == Kind::VARIABLE && value.place->type->isScalarOrVector()
                                      ? declare(value.place->type, variableName(value.place->variable))
                                      : print(value.place, POSTFIX_LEVEL);
        line(place + " = " + input(value) + ";");
    }
    std::string call = functionName(mProgram.entry) + "(";
    for (const Variable* variable : mProgram.arguments)
        call += (variable == mProgram.arguments[0] ? "" : ", ") + variableName(variable);
    call += ");";
    line(mProgram.result ? declare(mProgram.result->type, variableName(mProgram.result)) + " = " + call
                         : call);
    for (const StageValue& value : mProgram.values)
        if (value.isOutput)
            if (const std::string text = output(value); !text.empty())
                line(text);
    --mIndent;
    line("}");
    mNames.closeScope();
    return std::move(mText);
}

// ------------------------------------------------------------------------------------------ statements

void GlslEmitter::line(const std::string& text) {
    if (!text.empty())
        mText.append(static_cast<std::size_t>(mIndent) * 4, ' ');
    mText += text;
    mText += '\n';
}

void GlslEmitter::block(const std::vector<TypedStmt*>& body) {
    mNames.openScope();
    ++mIndent;
    for (const TypedStmt* stmt : body)
        if (stmt)
            statement(stmt);
    --mIndent;
    mNames.closeScope();
}

void GlslEmitter::statement(const TypedStmt* stmt) {
    using StmtKind = TypedStmt::Kind;
    switch (stmt->kind) {
    case StmtKind::BLOCK:
        line("{");
        block(stmt->body);
        line("}");
        break;
    case StmtKind::SEQUENCE:
        for (const TypedStmt* inner : stmt->body)
            statement(inner);
        break;
    case StmtKind::DECLARE:
        declaration(stmt);
        break;
    case StmtKind::EXPR:
        effect(stmt->expression);
        break;
    case StmtKind::IF:
        branch(stmt);
        break;
    case StmtKind::FOR:
        forLoop(stmt);
        break;
    case StmtKind::WHILE:
        line("while (" + print(stmt->expression) + ") {");
        block(stmt->body[0]->body);
        line("}");
        break;
    case StmtKind::DO:
        line("do {");
        block(stmt->body[0]->body);
        line("} while (" + print(stmt->expression) + ");");
        break;
    case StmtKind::SWITCH:
        line("switch (" + print(stmt->expression) + ") {");
        block(stmt->body);
        line("}");
        break;
    case StmtKind::CASE:
        line(stmt->expression ? "case " + print(stmt->expression) + ":" : "default:");
        break;
    case StmtKind::RETURN:
        line(stmt->expression ? "return " + print(stmt->expression) + ";" : "return;");
        break;
    case StmtKind::DISCARD:
        line("discard;");
        break;
    case StmtKind::BREAK:
        line("break;");
        break;
    case StmtKind::CONTINUE:
        line("continue;");
        break;
    }
}

/// An `if` with all its `else if`.
void GlslEmitter::branch(const TypedStmt* stmt) {
    line("if (" + print(stmt->expression) + ") {");
    block(stmt->body[0]->body);
    const TypedStmt* last = stmt;
    for (const TypedStmt* next = chained(last); next; next = chained(last)) {
        line("} else if (" + print(next->expression) + ") {");
        block(next->body[0]->body);
        last = next;
    }
    if (last->body[1]) {
        line("} else {");
        block(last->body[1]->body);
    }
    line("}");
}

void GlslEmitter::declaration(const TypedStmt* stmt) {
    const std::string value = stmt->expression ? " = " + print(stmt->expression, ASSIGN_LEVEL) : "";
    line(declare(stmt->variable->type, variableName(stmt->variable)) + value + ";");
}

/// An expression for its effect; the steps of a comma one after another.
void GlslEmitter::effect(const TypedExpr* expression) {
    if (expression->kind == Kind::BINARY && expression->binary == BinaryOp::COMMA) {
        effect(expression->operands[0]);
        effect(expression->operands[1]);
        return;
    }
    if (expression->kind == Kind::CONDITIONAL && expression->type->isVoid()) {
        line("if (" + print(expression->operands[0]) + ") {");
        for (std::size_t i = 1; i < expression->operands.size(); ++i) {
            ++mIndent;
            effect(expression->operands[i]);
            --mIndent;
            line(i == 1 ? "} else {" : "}");
        }
        return;
    }
    if (expression->kind != Kind::VARIABLE && expression->kind != Kind::LITERAL)
        line(print(expression) + ";");
}

/// What stands first in a for's parentheses, or nothing where it cannot stand there.
std::string GlslEmitter::forInitializer(const TypedStmt* stmt) {
    if (stmt->kind == TypedStmt::Kind::EXPR)
        return print(stmt->expression);
    const Type* type = nullptr;
    for (const TypedStmt* inner : stmt->body) {
        const bool fits = inner->kind == TypedStmt::Kind::DECLARE && !inner->variable->type->isArray() &&
                          (!type || type == inner->variable->type);
        if (!fits)
            return "";
        type = inner->variable->type;
    }
    if (!type)
        return "";
    std::string text = typeName(type) + " ";
    for (const TypedStmt* inner : stmt->body) {
        const std::string value = inner->expression ? " = " + print(inner->expression, ASSIGN_LEVEL) : "";
        text += (inner == stmt->body[0] ? "" : ", ") + variableName(inner->variable) + value;
    }
    return text;
}

void GlslEmitter::forLoop(const TypedStmt* stmt) {
    mNames.openScope();
    const TypedStmt* first = stmt->body[0];
    const std::string head = first ? forInitializer(first) : "";
    const bool isApart = first && head.empty();
    if (isApart) {
        line("{");
        ++mIndent;
        statement(first);
    }
    const std::string condition = stmt->expression ? " " + print(stmt->expression) : "";
    const std::string step = stmt->step ? " " + print(stmt->step) : "";
    line("for (" + head + ";" + condition + ";" + step + ") {");
    block(stmt->body[1]->body);
    line("}");
    if (isApart) {
        --mIndent;
        line("}");
    }
    mNames.closeScope();
}

// ----------------------------------------------------------------------------------------- expressions

std::string GlslEmitter::print(const TypedExpr* expression, int minimum) {
    int precedence = POSTFIX_LEVEL;
    std::string text = printed(expression, precedence);
    return precedence < minimum ? "(" + text + ")" : text;
}

std::string GlslEmitter::printed(const TypedExpr* expression, int& precedence) {
    const auto& operands = expression->operands;
    switch (expression->kind) {
    case Kind::LITERAL:
        return literal(expression, precedence);
    case Kind::VARIABLE:
        return variableName(expression->variable);
    case Kind::FIELD:
        return print(operands[0], POSTFIX_LEVEL) + "." +
               memberName(operands[0]->type->structure, static_cast<std::size_t>(expression->index));
    case Kind::SWIZZLE: {
        std::string text = print(operands[0], POSTFIX_LEVEL) + ".";
        for (int i = 0; i < expression->type->columns; ++i)
            text += "xyzw"[expression->components[static_cast<std::size_t>(i)]];
        return text;
    }
    case Kind::ELEMENT: {
        const std::string array = print(operands[0], POSTFIX_LEVEL);
        const std::string index =
            print(operands[1], expression->type->isArray() ? POSTFIX_LEVEL : COMMA_LEVEL);
        if (!expression->type->isArray())
            return array + "[" + index + "]";
        // A row of a flat array.
        const int length = flatLength(expression->type);
        const std::string first = array + "[" + index + " * " + std::to_string(length) + " + ";
        std::string text = typeName(expression->type) + "[" + std::to_string(length) + "](";
        for (int i = 0; i < length; ++i) {
            text += i == 0 ? first : ", " + first;
            text += std::to_string(i) + "]";
        }
        return text + ")";
    }
    case Kind::CALL:
        return functionName(expression->function) + "(" + arguments(expression) + ")";
    case Kind::BUILTIN:
        return builtin(expression);
    case Kind::UNARY:
        return unary(expression, precedence);
    case Kind::BINARY: {
        precedence = precedenceOf(expression->binary);
        const std::string left = print(operands[0], precedence);
        const std::string right = print(operands[1], precedence + 1);
        return left + (expression->binary == BinaryOp::COMMA ? "" : " ") + spelling(expression->binary) +
               " " + right;
    }
    case Kind::ASSIGN:
        precedence = ASSIGN_LEVEL;
        return assign(expression);
    case Kind::CONDITIONAL:
        precedence = CONDITIONAL_LEVEL;
        return print(operands[0], OR_LEVEL) + " ? " + print(operands[1], CONDITIONAL_LEVEL + 1) + " : " +
               print(operands[2], CONDITIONAL_LEVEL);
    case Kind::CONSTRUCT:
        return construct(expression);
    case Kind::CONVERT:
        return convert(expression, precedence);
    }
    return "";
}

std::string GlslEmitter::literal(const TypedExpr* expression, int& precedence) const {
    const double number = expression->number;
    if (number < 0)
        precedence = UNARY_LEVEL;
    switch (expression->type->scalar) {
    case Scalar::BOOL:
        return number != 0 ? "true" : "false";
    case Scalar::INT: {
        const auto bits = static_cast<std::uint32_t>(
            static_cast<std::int64_t>(std::clamp(number, -2147483648.0, 4294967295.0)));
        const auto value = static_cast<std::int32_t>(bits);
        if (value < 0)
            precedence = UNARY_LEVEL;
        return value == INT32_MIN ? "(-2147483647 - 1)" : std::to_string(value);
    }
    case Scalar::UINT:
        precedence = POSTFIX_LEVEL;
        return std::to_string(static_cast<std::uint32_t>(
                   static_cast<std::int64_t>(std::clamp(number, -2147483648.0, 4294967295.0)))) +
               "u";
    default:
        return floatText(number);
    }
}

std::string GlslEmitter::arguments(const TypedExpr* expression) {
    std::string text;
    for (const TypedExpr* operand : expression->operands)
        text += (text.empty() ? "" : ", ") + print(operand, ASSIGN_LEVEL);
    return text;
}

/// @param type  that of the helper's first operand
void GlslEmitter::addHelper(Name helper, const std::string& type) {
    for (bool isFirst = true; !helper.empty(); isFirst = false) {
        const HelperFunction function = findHelper(helper, isFirst ? type : "float");
        if (!mKnownHelpers.insert(function.text).second)
            break;
        mHelpers.push_back(function.text);
        // What it calls comes before it.
        if (!isFirst)
            std::rotate(mHelpers.rbegin(), mHelpers.rbegin() + 1, mHelpers.rbegin() + 2);
        helper = function.needs;
    }
}

std::string GlslEmitter::builtin(const TypedExpr* expression) {
    if (expression->isByRows)
        return byRows(expression);
    if (!expression->helper.empty())
        addHelper(expression->helper, typeName(expression->operands[0]->type));
    return filledIn(expression->form,
                    [&](std::size_t operand) { return print(expression->operands[operand], ASSIGN_LEVEL); });
}

/// GLSL's functions take vectors: one of our own applies them to each row of its matrices.
std::string GlslEmitter::byRows(const TypedExpr* expression) {
    const auto& operands = expression->operands;
    const auto nameOfOperand = [](std::size_t i) { return std::string(1, static_cast<char>('a' + i)); };
    int rows = 0;
    std::string parameters;
    for (std::size_t i = 0; i < operands.size(); ++i) {
        const Type* type = operands[i]->type;
        if (type->isMatrix())
            rows = type->rows;
        parameters += (i == 0 ? "" : ", ") +
                      std::string((expression->outOperands >> i & 1U) != 0 ? "out " : "") +
                      declare(type, nameOfOperand(i));
    }
    if (!expression->helper.empty()) {
        const Type* first = operands[0]->type;
        addHelper(expression->helper,
                  typeName(first->isMatrix() ? mTypes.vector(first->scalar, first->columns) : first));
    }
    const bool isVoid = expression->type->isVoid();
    std::string body = isVoid ? "" : "    return " + typeName(expression->type) + "(";
    for (int row = 0; row < rows; ++row) {
        const std::string call = filledIn(expression->form, [&](std::size_t operand) {
            const bool isMatrix = operands[operand]->type->isMatrix();
            return nameOfOperand(operand) + (isMatrix ? "[" + std::to_string(row) + "]" : "");
        });
        if (isVoid)
            body += "    " + call + ";\n";
        else
            body += (row == 0 ? "" : ", ") + call;
    }
    if (!isVoid)
        body += ");\n";
    const std::string rest = "(" + parameters + ") {\n" + body + "}";
    std::string& name = mRowFunctions[typeName(expression->type) + rest];
    if (name.empty()) {
        name = "cg_rows" + std::to_string(mRowFunctions.size());
        mHelpers.push_back(typeName(expression->type) + " " + name + rest);
    }
    return name + "(" + arguments(expression) + ")";
}

std::string GlslEmitter::construct(const TypedExpr* expression) {
    const Type* type = expression->type;
    if (!type->isArray()) {
        const std::string values = arguments(expression);
        return typeName(type) + "(" + (values.empty() ? "0.0" : values) + ")";
    }
    std::string text;
    for (const TypedExpr* operand : expression->operands) {
        const bool isNested = operand->type->isArray() && operand->kind == Kind::CONSTRUCT;
        const std::string value = print(operand, ASSIGN_LEVEL);
        // The elements of an inner constructor without its head.
        const std::size_t head = isNested ? value.find('(') + 1 : 0;
        text += (text.empty() ? "" : ", ") + (isNested ? value.substr(head, value.size() - head - 1) : value);
    }
    return typeName(type) + "[" + std::to_string(flatLength(type)) + "](" + text + ")";
}

std::string GlslEmitter::convert(const TypedExpr* expression, int& precedence) {
    const TypedExpr* operand = expression->operands[0];
    const std::string& to = typeName(expression->type);
    if (to == typeName(operand->type))
        return printed(operand, precedence);
    return to + "(" + print(operand, ASSIGN_LEVEL) + ")";
}

std::string GlslEmitter::unary(const TypedExpr* expression, int& precedence) {
    const TypedExpr* operand = expression->operands[0];
    precedence = UNARY_LEVEL;
    switch (expression->unary) {
    case UnaryOp::POST_INCREMENT:
    case UnaryOp::POST_DECREMENT:
        precedence = POSTFIX_LEVEL;
        return print(operand, POSTFIX_LEVEL) + (expression->unary == UnaryOp::POST_INCREMENT ? "++" : "--");
    case UnaryOp::PRE_INCREMENT:
        return "++" + print(operand, POSTFIX_LEVEL);
    case UnaryOp::PRE_DECREMENT:
        return "--" + print(operand, POSTFIX_LEVEL);
    case UnaryOp::NOT:
        return "!" + print(operand, UNARY_LEVEL);
    case UnaryOp::COMPLEMENT:
        return "~" + print(operand, UNARY_LEVEL);
    case UnaryOp::NEGATE:
    case UnaryOp::PLUS:
        break;
    }
    return "-" + print(operand, POSTFIX_LEVEL); // so that no two minus signs meet
}

std::string GlslEmitter::assign(const TypedExpr* expression) {
    const std::string op = expression->isCompound ? spelling(expression->binary) : "";
    return print(expression->operands[0], POSTFIX_LEVEL) + " " + op + "= " +
           print(expression->operands[1], ASSIGN_LEVEL);
}

} // namespace cg
