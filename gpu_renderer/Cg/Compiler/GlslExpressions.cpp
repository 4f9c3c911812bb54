#include <Cg/Compiler/GlslExpressions.h>

#include <Cg/Compiler/GlslSymbols.h>
#include <Cg/Compiler/HelperFunctions.h>

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

/// The 32 bits of a whole number.
std::uint32_t bitsOf(double number) {
    return static_cast<std::uint32_t>(
        static_cast<std::int64_t>(std::clamp(number, -2147483648.0, 4294967295.0)));
}

std::string literal(const TypedExpr* expression, int& precedence) {
    const double number = expression->number;
    if (number < 0)
        precedence = UNARY_LEVEL;
    switch (expression->type->scalar) {
    case Scalar::BOOL:
        return number != 0 ? "true" : "false";
    case Scalar::INT: {
        const auto value = static_cast<std::int32_t>(bitsOf(number));
        if (value < 0)
            precedence = UNARY_LEVEL;
        return value == INT32_MIN ? "(-2147483647 - 1)" : std::to_string(value);
    }
    case Scalar::UINT:
        precedence = POSTFIX_LEVEL;
        return std::to_string(bitsOf(number)) + "u";
    default:
        return floatText(number);
    }
}

/// `a`, `b`, ...: parameters of a function that works row by row.
std::string rowParameter(std::size_t operand) {
    return std::string(1, static_cast<char>('a' + operand));
}

} // namespace

std::string GlslExpressions::whole(const TypedExpr* expression) {
    return print(expression, COMMA_LEVEL);
}

std::string GlslExpressions::value(const TypedExpr* expression) {
    return print(expression, ASSIGN_LEVEL);
}

std::string GlslExpressions::object(const TypedExpr* expression) {
    return print(expression, POSTFIX_LEVEL);
}

std::string GlslExpressions::print(const TypedExpr* expression, int minimum) {
    int precedence = POSTFIX_LEVEL;
    std::string text = printed(expression, precedence);
    return precedence < minimum ? "(" + text + ")" : text;
}

/// @param precedence  POSTFIX_LEVEL; receives what is lower
std::string GlslExpressions::printed(const TypedExpr* expression, int& precedence) {
    switch (expression->kind) {
    case Kind::LITERAL:
        return literal(expression, precedence);
    case Kind::VARIABLE:
        return mSymbols.variableName(expression->variable);
    case Kind::FIELD: {
        const TypedExpr* owner = expression->operands[0];
        return object(owner) + "." +
               mSymbols.memberName(owner->type->structure, static_cast<std::size_t>(expression->index));
    }
    case Kind::SWIZZLE:
        return swizzle(expression);
    case Kind::ELEMENT:
        return element(expression);
    case Kind::CALL:
        return mSymbols.functionName(expression->function) + "(" + arguments(expression) + ")";
    case Kind::BUILTIN:
        return builtin(expression);
    case Kind::UNARY:
        return unary(expression, precedence);
    case Kind::BINARY:
        return binary(expression, precedence);
    case Kind::ASSIGN:
        precedence = ASSIGN_LEVEL;
        return assign(expression);
    case Kind::CONDITIONAL:
        precedence = CONDITIONAL_LEVEL;
        return conditional(expression);
    case Kind::CONSTRUCT:
        return construct(expression);
    case Kind::CONVERT:
        return convert(expression, precedence);
    }
    return "";
}

std::string GlslExpressions::swizzle(const TypedExpr* expression) {
    std::string text = object(expression->operands[0]) + ".";
    for (int i = 0; i < expression->type->columns; ++i)
        text += "xyzw"[expression->components[static_cast<std::size_t>(i)]];
    return text;
}

std::string GlslExpressions::element(const TypedExpr* expression) {
    const Type* type = expression->type;
    const std::string array = object(expression->operands[0]);
    if (!type->isArray())
        return array + "[" + whole(expression->operands[1]) + "]";
    // A row of a flat array.
    const int length = flatLength(type);
    const std::string first =
        array + "[" + object(expression->operands[1]) + " * " + std::to_string(length) + " + ";
    std::string text = mSymbols.arrayTypeName(type) + "(";
    for (int i = 0; i < length; ++i) {
        text += i == 0 ? first : ", " + first;
        text += std::to_string(i) + "]";
    }
    return text + ")";
}

std::string GlslExpressions::binary(const TypedExpr* expression, int& precedence) {
    precedence = precedenceOf(expression->binary);
    const std::string left = print(expression->operands[0], precedence);
    const std::string right = print(expression->operands[1], precedence + 1);
    return left + (expression->binary == BinaryOp::COMMA ? "" : " ") + spelling(expression->binary) + " " +
           right;
}

std::string GlslExpressions::conditional(const TypedExpr* expression) {
    const auto& operands = expression->operands;
    return print(operands[0], OR_LEVEL) + " ? " + print(operands[1], CONDITIONAL_LEVEL + 1) + " : " +
           print(operands[2], CONDITIONAL_LEVEL);
}

std::string GlslExpressions::arguments(const TypedExpr* expression) {
    std::string text;
    for (const TypedExpr* operand : expression->operands)
        text += (text.empty() ? "" : ", ") + value(operand);
    return text;
}

/// What it calls comes before it.
/// @param typeName  that of the helper's first operand
void GlslExpressions::addHelper(Name helper, const std::string& typeName) {
    const HelperFunction function = findHelper(helper, typeName);
    if (!mKnownHelpers.insert(function.text).second)
        return;
    if (!function.needs.empty())
        addHelper(function.needs, "float");
    mHelpers.push_back(function.text);
}

std::string GlslExpressions::builtin(const TypedExpr* expression) {
    if (expression->isByRows)
        return byRows(expression);
    if (!expression->helper.empty())
        addHelper(expression->helper, mSymbols.typeName(expression->operands[0]->type));
    return filledIn(expression->form,
                    [&](std::size_t operand) { return value(expression->operands[operand]); });
}

/// GLSL's functions take vectors: one of our own applies them to each row of its matrices.
std::string GlslExpressions::byRows(const TypedExpr* expression) {
    const auto& operands = expression->operands;
    std::string parameters;
    for (std::size_t i = 0; i < operands.size(); ++i)
        parameters += (i == 0 ? "" : ", ") +
                      std::string((expression->outOperands >> i & 1U) != 0 ? "out " : "") +
                      mSymbols.declare(operands[i]->type, rowParameter(i));
    if (!expression->helper.empty()) {
        const Type* first = operands[0]->type;
        const Type* row = first->isMatrix() ? mTypes.vector(first->scalar, first->columns) : first;
        addHelper(expression->helper, mSymbols.typeName(row));
    }
    const std::string& result = mSymbols.typeName(expression->type);
    const std::string rest = "(" + parameters + ") {\n" + rowsBody(expression) + "}";
    std::string& name = mRowFunctions[result + rest];
    if (name.empty()) {
        name = "cg_rows" + std::to_string(mRowFunctions.size());
        mHelpers.push_back(result + " " + name + rest);
    }
    return name + "(" + arguments(expression) + ")";
}

/// The form for one row after the other, of as many as the last of the matrices has.
std::string GlslExpressions::rowsBody(const TypedExpr* expression) {
    const auto& operands = expression->operands;
    int rows = 0;
    for (const TypedExpr* operand : operands)
        if (operand->type->isMatrix())
            rows = operand->type->rows;
    const bool isVoid = expression->type->isVoid();
    std::string body = isVoid ? "" : "    return " + mSymbols.typeName(expression->type) + "(";
    for (int row = 0; row < rows; ++row) {
        const std::string call = filledIn(expression->form, [&](std::size_t operand) {
            const bool isMatrix = operands[operand]->type->isMatrix();
            return rowParameter(operand) + (isMatrix ? "[" + std::to_string(row) + "]" : "");
        });
        body += isVoid ? "    " + call + ";\n" : (row == 0 ? "" : ", ") + call;
    }
    return isVoid ? body : body + ");\n";
}

std::string GlslExpressions::construct(const TypedExpr* expression) {
    const Type* type = expression->type;
    if (!type->isArray()) {
        const std::string values = arguments(expression);
        return mSymbols.typeName(type) + "(" + (values.empty() ? "0.0" : values) + ")";
    }
    std::string text;
    for (const TypedExpr* operand : expression->operands) {
        const bool isNested = operand->type->isArray() && operand->kind == Kind::CONSTRUCT;
        const std::string element = value(operand);
        // The elements of an inner constructor without its head.
        const std::size_t head = isNested ? element.find('(') + 1 : 0;
        text += (text.empty() ? "" : ", ") +
                (isNested ? element.substr(head, element.size() - head - 1) : element);
    }
    return mSymbols.arrayTypeName(type) + "(" + text + ")";
}

std::string GlslExpressions::convert(const TypedExpr* expression, int& precedence) {
    const TypedExpr* operand = expression->operands[0];
    const std::string& to = mSymbols.typeName(expression->type);
    if (to == mSymbols.typeName(operand->type))
        return printed(operand, precedence);
    return to + "(" + value(operand) + ")";
}

std::string GlslExpressions::unary(const TypedExpr* expression, int& precedence) {
    const TypedExpr* operand = expression->operands[0];
    precedence = UNARY_LEVEL;
    switch (expression->unary) {
    case UnaryOp::POST_INCREMENT:
    case UnaryOp::POST_DECREMENT:
        precedence = POSTFIX_LEVEL;
        return object(operand) + (expression->unary == UnaryOp::POST_INCREMENT ? "++" : "--");
    case UnaryOp::PRE_INCREMENT:
        return "++" + object(operand);
    case UnaryOp::PRE_DECREMENT:
        return "--" + object(operand);
    case UnaryOp::NOT:
        return "!" + print(operand, UNARY_LEVEL);
    case UnaryOp::COMPLEMENT:
        return "~" + print(operand, UNARY_LEVEL);
    case UnaryOp::NEGATE:
    case UnaryOp::PLUS:
        break;
    }
    return "-" + object(operand); // so that no two minus signs meet
}

std::string GlslExpressions::assign(const TypedExpr* expression) {
    const std::string op = expression->isCompound ? spelling(expression->binary) : "";
    return object(expression->operands[0]) + " " + op + "= " + value(expression->operands[1]);
}

} // namespace cg
