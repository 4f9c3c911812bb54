#include <Cg/Compiler/ConstantFolding.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;
using Values = std::vector<double>;
using MaybeValues = std::optional<Values>;

/// Two's complement arithmetic, without overflow being undefined. Nothing where a divisor is 0.
std::optional<double> integerOperation(BinaryOp op, double left, double right) {
    const auto a = static_cast<std::int64_t>(left);
    const auto b = static_cast<std::int64_t>(right);
    const auto bits = static_cast<unsigned>(b & 31);
    switch (op) {
    case BinaryOp::DIVIDE:
        if (b == 0)
            return std::nullopt;
        return std::trunc(left / right);
    case BinaryOp::MODULO:
        if (b == 0)
            return std::nullopt;
        return static_cast<double>(a % b);
    case BinaryOp::SHIFT_LEFT:
        return static_cast<double>(static_cast<std::int32_t>(static_cast<std::uint32_t>(a) << bits));
    case BinaryOp::SHIFT_RIGHT:
        return static_cast<double>(a >> bits);
    case BinaryOp::BIT_AND:
        return static_cast<double>(a & b);
    case BinaryOp::BIT_OR:
        return static_cast<double>(a | b);
    case BinaryOp::BIT_XOR:
        return static_cast<double>(a ^ b);
    default:
        return std::nullopt;
    }
}

std::optional<double> operation(BinaryOp op, double left, double right, Scalar scalar) {
    switch (op) {
    case BinaryOp::MULTIPLY:
        return left * right;
    case BinaryOp::ADD:
        return left + right;
    case BinaryOp::SUBTRACT:
        return left - right;
    case BinaryOp::LESS:
        return left < right;
    case BinaryOp::GREATER:
        return left > right;
    case BinaryOp::LESS_EQUAL:
        return left <= right;
    case BinaryOp::GREATER_EQUAL:
        return left >= right;
    case BinaryOp::EQUAL:
        return left == right;
    case BinaryOp::NOT_EQUAL:
        return left != right;
    case BinaryOp::AND:
        return left != 0 && right != 0;
    case BinaryOp::OR:
        return left != 0 || right != 0;
    case BinaryOp::DIVIDE:
        return isFloating(scalar) ? left / right : integerOperation(op, left, right);
    default:
        return integerOperation(op, left, right);
    }
}

struct ComponentFunction {
    Name form;
    double (*compute)(double, double, double);
};

/// Functions that work on each component, by their GLSL form.
constexpr ComponentFunction COMPONENT_FUNCTIONS[] = {
    {"abs($0)", [](double x, double, double) { return std::fabs(x); }},
    {"ceil($0)", [](double x, double, double) { return std::ceil(x); }},
    {"floor($0)", [](double x, double, double) { return std::floor(x); }},
    {"fract($0)", [](double x, double, double) { return x - std::floor(x); }},
    {"trunc($0)", [](double x, double, double) { return std::trunc(x); }},
    {"roundEven($0)", [](double x, double, double) { return std::nearbyint(x); }},
    {"sqrt($0)", [](double x, double, double) { return std::sqrt(x); }},
    {"inversesqrt($0)", [](double x, double, double) { return 1 / std::sqrt(x); }},
    {"exp($0)", [](double x, double, double) { return std::exp(x); }},
    {"exp2($0)", [](double x, double, double) { return std::exp2(x); }},
    {"log($0)", [](double x, double, double) { return std::log(x); }},
    {"log2($0)", [](double x, double, double) { return std::log2(x); }},
    {"cg_log10($0)", [](double x, double, double) { return std::log10(x); }},
    {"cg_rcp($0)", [](double x, double, double) { return 1 / x; }},
    {"sin($0)", [](double x, double, double) { return std::sin(x); }},
    {"cos($0)", [](double x, double, double) { return std::cos(x); }},
    {"tan($0)", [](double x, double, double) { return std::tan(x); }},
    {"asin($0)", [](double x, double, double) { return std::asin(x); }},
    {"acos($0)", [](double x, double, double) { return std::acos(x); }},
    {"atan($0)", [](double x, double, double) { return std::atan(x); }},
    {"atan($0, $1)", [](double y, double x, double) { return std::atan2(y, x); }},
    {"radians($0)", [](double x, double, double) { return x * 0.017453292519943295; }},
    {"degrees($0)", [](double x, double, double) { return x * 57.29577951308232; }},
    {"sign($0)", [](double x, double, double) { return x > 0   ? 1.0
                                                       : x < 0 ? -1.0
                                                               : 0.0; }},
    {"pow($0, $1)", [](double x, double y, double) { return std::pow(x, y); }},
    {"cg_fmod($0, $1)", [](double x, double y, double) { return x - y * std::trunc(x / y); }},
    {"min($0, $1)", [](double x, double y, double) { return std::min(x, y); }},
    {"max($0, $1)", [](double x, double y, double) { return std::max(x, y); }},
    {"step($0, $1)", [](double edge, double x, double) { return x < edge ? 0.0 : 1.0; }},
    {"clamp($0, $1, $2)", [](double x, double low, double high) { return std::min(std::max(x, low), high); }},
    {"clamp($0, 0.0, 1.0)", [](double x, double, double) { return std::min(std::max(x, 0.0), 1.0); }},
    {"mix($0, $1, $2)", [](double x, double y, double t) { return x * (1 - t) + y * t; }},
};

/// A component of one operand among several: a scalar stands beside each.
double component(const Values& values, std::size_t i) {
    return values.size() == 1 ? values.front() : values[i];
}

class Evaluator {
public:
    MaybeValues evaluate(const TypedExpr* expression) {
        if (mStepsLeft == 0)
            return std::nullopt;
        --mStepsLeft;
        switch (expression->kind) {
        case Kind::LITERAL:
            return Values{valueAs(expression->number, expression->type->scalar)};
        case Kind::VARIABLE:
            return constantVariable(expression->variable);
        case Kind::SWIZZLE:
            return swizzle(expression);
        case Kind::ELEMENT:
            return element(expression);
        case Kind::UNARY:
            return unary(expression);
        case Kind::BINARY:
            return binary(expression);
        case Kind::CONDITIONAL:
            return conditional(expression);
        case Kind::CONSTRUCT:
            return construct(expression);
        case Kind::CONVERT:
            return convert(expression);
        case Kind::BUILTIN:
            return builtin(expression);
        default:
            return std::nullopt;
        }
    }

private:
    static bool isKnown(const Variable* variable) {
        return variable->isConst && !variable->isWritten && variable->initializer;
    }

    MaybeValues constantVariable(const Variable* variable) {
        return isKnown(variable) ? within(variable->initializer) : std::nullopt;
    }

    /// Of an expression that stands elsewhere.
    MaybeValues within(const TypedExpr* expression) {
        if (mDepth > MAX_DEPTH)
            return std::nullopt;
        ++mDepth;
        MaybeValues values = evaluate(expression);
        --mDepth;
        return values;
    }

    MaybeValues swizzle(const TypedExpr* expression) {
        const MaybeValues object = evaluate(expression->operands[0]);
        if (!object)
            return std::nullopt;
        Values values;
        for (int i = 0; i < expression->type->columns; ++i) {
            values.push_back((*object)[expression->components[static_cast<std::size_t>(i)]]);
        }
        return values;
    }

    MaybeValues element(const TypedExpr* expression) {
        const MaybeValues index = evaluate(expression->operands[1]);
        if (!index || index->front() < 0)
            return std::nullopt;
        if (const TypedExpr* alone = elementOf(expression, static_cast<std::size_t>(index->front())))
            return within(alone);
        const MaybeValues object = evaluate(expression->operands[0]);
        if (!object)
            return std::nullopt;
        const auto size =
            static_cast<std::size_t>(countLeaves(expression->type, std::numeric_limits<int>::max()));
        const auto first = static_cast<std::size_t>(index->front()) * size;
        if (first + size > object->size())
            return std::nullopt;
        const auto begin = object->begin() + static_cast<std::ptrdiff_t>(first);
        return Values(begin, begin + static_cast<std::ptrdiff_t>(size));
    }

    /// What gives the element of a listed array, or null. It is evaluated alone, since thousands of sizes may
    /// ask a table of thousands.
    static const TypedExpr* elementOf(const TypedExpr* expression, std::size_t position) {
        const TypedExpr* array = expression->operands[0];
        const bool isNamed = array->kind == Kind::VARIABLE && isKnown(array->variable);
        const TypedExpr* list = isNamed ? array->variable->initializer : array;
        if (list->kind != Kind::CONSTRUCT || !list->type->isArray() || position >= list->operands.size())
            return nullptr;
        const TypedExpr* element = list->operands[position];
        return element->type == expression->type ? element : nullptr; // rows of arrays are listed flat
    }

    MaybeValues unary(const TypedExpr* expression) {
        MaybeValues values = evaluate(expression->operands[0]);
        if (!values)
            return std::nullopt;
        for (double& value : *values)
            switch (expression->unary) {
            case UnaryOp::PLUS:
                break;
            case UnaryOp::NEGATE:
                value = -value;
                break;
            case UnaryOp::NOT:
                value = value == 0;
                break;
            case UnaryOp::COMPLEMENT:
                value = static_cast<double>(~static_cast<std::int64_t>(value));
                break;
            default:
                return std::nullopt;
            }
        return rounded(*values, expression->type);
    }

    MaybeValues binary(const TypedExpr* expression) {
        const TypedExpr* left = expression->operands[0];
        const TypedExpr* right = expression->operands[1];
        if (!left->type->isNumeric() || !right->type->isNumeric() || !expression->type->isNumeric())
            return std::nullopt;
        const bool isMatrixProduct = expression->binary == BinaryOp::MULTIPLY &&
                                     (left->type->isMatrix() || right->type->isMatrix()) &&
                                     !left->type->isScalar() && !right->type->isScalar();
        if (isMatrixProduct)
            return std::nullopt;
        const MaybeValues a = evaluate(left);
        const MaybeValues b = evaluate(right);
        if (!a || !b)
            return std::nullopt;
        const std::size_t count = std::max(a->size(), b->size());
        Values values;
        for (std::size_t i = 0; i < count; ++i) {
            const auto value =
                operation(expression->binary, component(*a, i), component(*b, i), left->type->scalar);
            if (!value)
                return std::nullopt;
            values.push_back(*value);
        }
        return rounded(values, expression->type);
    }

    MaybeValues conditional(const TypedExpr* expression) {
        const MaybeValues condition = evaluate(expression->operands[0]);
        if (!condition)
            return std::nullopt;
        return evaluate(expression->operands[condition->front() != 0 ? 1 : 2]);
    }

    MaybeValues construct(const TypedExpr* expression) {
        Values values;
        for (const TypedExpr* operand : expression->operands) {
            const MaybeValues part = evaluate(operand);
            if (!part)
                return std::nullopt;
            values.insert(values.end(), part->begin(), part->end());
        }
        const Type* type = expression->type;
        if (!type->isNumeric())
            return values;
        // One value is the zero of a whole matrix; values too many are dropped.
        values.resize(static_cast<std::size_t>(type->components()), values.front());
        return rounded(values, type);
    }

    MaybeValues convert(const TypedExpr* expression) {
        const Type* from = expression->operands[0]->type;
        const Type* to = expression->type;
        MaybeValues values = evaluate(expression->operands[0]);
        if (!values || !to->isNumeric())
            return values;
        if (from->isScalar())
            values->resize(static_cast<std::size_t>(to->components()), values->front());
        if (from->isFullMatrix() && to->isFullMatrix()) {
            Values cut;
            for (int row = 0; row < to->rows; ++row)
                for (int column = 0; column < to->columns; ++column)
                    cut.push_back(
                        (*values)[static_cast<std::size_t>(row) * static_cast<std::size_t>(from->columns) +
                                  static_cast<std::size_t>(column)]);
            values = cut;
        }
        return rounded(*values, to);
    }

    MaybeValues builtin(const TypedExpr* expression) {
        std::vector<Values> operands;
        std::size_t count = 0;
        for (const TypedExpr* operand : expression->operands) {
            MaybeValues values = evaluate(operand);
            if (!values)
                return std::nullopt;
            count = std::max(count, values->size());
            operands.push_back(std::move(*values));
        }
        if (expression->form == "dot($0, $1)" || expression->form == "length($0)" ||
            expression->form == "normalize($0)")
            return geometric(expression, operands);
        for (const ComponentFunction& function : COMPONENT_FUNCTIONS) {
            if (function.form != expression->form)
                continue;
            Values values;
            const auto argument = [&operands](std::size_t operand, std::size_t i) {
                return operand < operands.size() ? component(operands[operand], i) : 0;
            };
            for (std::size_t i = 0; i < count; ++i)
                values.push_back(function.compute(argument(0, i), argument(1, i), argument(2, i)));
            return rounded(values, expression->type);
        }
        return std::nullopt;
    }

    static MaybeValues geometric(const TypedExpr* expression, const std::vector<Values>& operands) {
        const Values& a = operands[0];
        const Values& b = operands.back();
        double sum = 0;
        for (std::size_t i = 0; i < a.size(); ++i)
            sum += a[i] * b[i];
        if (expression->form == "dot($0, $1)")
            return rounded({sum}, expression->type);
        if (expression->form == "length($0)")
            return rounded({std::sqrt(sum)}, expression->type);
        Values values = a;
        for (double& value : values)
            value /= std::sqrt(sum);
        return rounded(values, expression->type);
    }

    static Values rounded(Values values, const Type* type) {
        for (double& value : values)
            value = valueAs(value, type->scalar);
        return values;
    }

    static constexpr int MAX_DEPTH = 64;

    /// Constants that are made of constants can double at each level.
    static constexpr int MAX_STEPS = 200000;
    int mDepth = 0;
    int mStepsLeft = MAX_STEPS;
};

} // namespace

double valueAs(double value, Scalar scalar) {
    if (isFloating(scalar))
        return static_cast<double>(static_cast<float>(value));
    if (scalar == Scalar::BOOL)
        return value != 0;
    const bool fits = value >= -2147483648.0 && value <= 4294967295.0; // an int or a uint, and is a number
    const auto bits = fits ? static_cast<std::uint32_t>(static_cast<std::int64_t>(value)) : 0U;
    return scalar == Scalar::INT ? static_cast<double>(static_cast<std::int32_t>(bits))
                                 : static_cast<double>(bits);
}

std::optional<std::vector<double>> constantValue(const TypedExpr* expression) {
    return Evaluator().evaluate(expression);
}

bool isGlslConstant(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::LITERAL:
        return true;
    case Kind::VARIABLE:
        return expression->variable->storage == Variable::Storage::GLOBAL &&
               expression->variable->isConstantExpression;
    case Kind::BUILTIN:
        if (expression->operands.empty() || !expression->helper.empty() || expression->isByRows ||
            expression->form.find("texture") != Name::npos || expression->form.find("texel") != Name::npos ||
            expression->form.find("dFd") != Name::npos || expression->form.find("fwidth") != Name::npos)
            return false;
        break;
    case Kind::UNARY:
        if (expression->unary >= UnaryOp::PRE_INCREMENT)
            return false;
        break;
    case Kind::BINARY:
        if (expression->binary == BinaryOp::COMMA)
            return false;
        break;
    case Kind::CALL:
    case Kind::ASSIGN:
        return false;
    default:
        break;
    }
    return std::all_of(expression->operands.begin(), expression->operands.end(), isGlslConstant);
}

} // namespace cg
