#include <Cg/Compiler/Resolver/BuiltinChoice.h>

#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/SamplerKinds.h>

#include <algorithm>
#include <cctype>
#include <set>

namespace cg {

namespace {

using Operand = BuiltinOperand;
using Arguments = BuiltinChoice::Arguments;

bool isGeneric(const Operand& operand) {
    return operand.kind == Operand::Kind::NUMBER || operand.kind == Operand::Kind::FLOATING ||
           operand.kind == Operand::Kind::INTEGER || operand.kind == Operand::Kind::BOOLEAN;
}

bool isShared(const Operand& operand) {
    return isGeneric(operand) && operand.size == Operand::SHARED;
}

/// Takes matrices row by row.
bool isByComponent(const Operand& operand) {
    return (operand.kind == Operand::Kind::NUMBER || operand.kind == Operand::Kind::FLOATING) &&
           !operand.isVector;
}

/// Takes matrices for generic operands: of the smallest shape, and only where the function works by
/// component.
/// @return false where the function does not take these
bool bindMatrices(const Arguments& arguments, ChosenBuiltin& builtin) {
    const std::vector<Operand>& parameters = builtin.function->parameters;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Type* type = arguments[i]->type;
        if (!isShared(parameters[i]) || !type->isFullMatrix())
            continue;
        const bool isFirst = builtin.rows == 0;
        builtin.rows = isFirst ? type->rows : std::min(builtin.rows, type->rows);
        builtin.columns = isFirst ? type->columns : std::min(builtin.columns, type->columns);
    }
    if (builtin.rows == 0)
        return true;
    if (builtin.rows == 1 || builtin.columns == 1)
        return false;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Type* type = arguments[i]->type;
        const bool isScalarOrMatrix = type->isScalar() || type->isFullMatrix();
        if (isShared(parameters[i]) && (!isByComponent(parameters[i]) || !isScalarOrMatrix))
            return false;
    }
    return true;
}

/// What the generic operands are, as one argument after another says: the smallest vector's size, the highest
/// scalar kind.
class Binder {
public:
    explicit Binder(ChosenBuiltin& builtin) : mBuiltin(builtin) {}

    /// @return false where the function does not take the argument
    bool bind(const Operand& operand, const TypedExpr* argument) {
        const Type* type = argument->type;
        if (operand.kind == Operand::Kind::MATRIX || operand.kind == Operand::Kind::SQUARE) {
            mBuiltin.matrix = type;
            return type->isMatrix() && (operand.kind == Operand::Kind::MATRIX || type->rows == type->columns);
        }
        if (!isGeneric(operand))
            return true;
        if (!type->isNumeric() || (type->isFullMatrix() && operand.size != Operand::SHARED))
            return false;
        if (operand.size == Operand::SHARED && type->components() > 1) {
            mBuiltin.size = mHasSize ? std::min(mBuiltin.size, type->components()) : type->components();
            mHasSize = true;
        }
        if (!operand.isFloat && operand.kind != Operand::Kind::INTEGER &&
            operand.kind != Operand::Kind::BOOLEAN)
            bindScalar(argument);
        return true;
    }

private:
    /// A number that is merely written, as `2`, takes the kind of the others.
    void bindScalar(const TypedExpr* argument) {
        const Scalar scalar = argument->type->scalar;
        const bool isFirst = !mHasTyped && !argument->isUntyped && isFloating(scalar);
        const bool isMerelyWritten = mHasTyped && argument->isUntyped;
        if (isFirst)
            mBuiltin.scalar = scalar;
        else if (!isMerelyWritten)
            mBuiltin.scalar = std::max(mBuiltin.scalar, scalar);
        mHasTyped = mHasTyped || isFirst;
    }

    ChosenBuiltin& mBuiltin;
    bool mHasSize = false;
    bool mHasTyped = false;
};

/// Finds what the generic operands are.
bool bind(const Arguments& arguments, ChosenBuiltin& builtin) {
    if (!bindMatrices(arguments, builtin))
        return false;
    Binder binder(builtin);
    for (std::size_t i = 0; i < arguments.size(); ++i)
        if (!binder.bind(builtin.function->parameters[i], arguments[i]))
            return false;
    return true;
}

bool isNamedAsShadow(TypedExpr* sampler) {
    if (sampler->kind == TypedExpr::Kind::CONDITIONAL) {
        const std::vector<TypedExpr*> samplers = samplersIn(sampler);
        return std::any_of(samplers.begin(), samplers.end(), isNamedAsShadow);
    }
    const Variable* root = rootVariable(sampler);
    if (!root)
        return false;
    if (isDepthSampler(sampler->type->sampler))
        return true;
    std::string name(root->name);
    std::transform(name.begin(), name.end(), name.begin(),
                   [](char c) { return static_cast<char>(std::tolower(static_cast<unsigned char>(c))); });
    return name.find("shadow") != std::string::npos;
}

} // namespace

const Type* ChosenBuiltin::typeOf(const BuiltinOperand& operand, const TypeTable& types) const {
    if (rows > 0 && isShared(operand))
        return types.matrix(scalar, rows, columns);
    const int operandSize = operand.size == Operand::SHARED ? size : operand.size;
    switch (operand.kind) {
    case Operand::Kind::VOID:
        return types.voidType();
    case Operand::Kind::TEXT:
        return types.text();
    case Operand::Kind::NUMBER:
        return types.vector(scalar == Scalar::BOOL ? Scalar::INT : scalar, operandSize);
    case Operand::Kind::FLOATING:
        return types.vector(operand.isFloat || !isFloating(scalar) ? Scalar::FLOAT : scalar, operandSize);
    case Operand::Kind::INTEGER:
        return types.vector(Scalar::INT, operandSize);
    case Operand::Kind::BOOLEAN:
        return types.vector(Scalar::BOOL, operandSize);
    case Operand::Kind::SAMPLER:
        return types.sampler(operand.sampler);
    case Operand::Kind::MATRIX:
    case Operand::Kind::SQUARE:
        return matrix;
    case Operand::Kind::TRANSPOSED:
        return matrix ? types.matrix(matrix->scalar, matrix->columns, matrix->rows) : nullptr;
    }
    return nullptr;
}

ChosenBuiltin BuiltinChoice::choose(const std::vector<BuiltinFunction>& functions, const Arguments& arguments,
                                    bool withGlslNames) const {
    ChosenBuiltin best;
    int bestCost = 0;
    for (const BuiltinFunction& function : functions) {
        if (function.parameters.size() != arguments.size() || (function.isGlslName && !withGlslNames))
            continue;
        ChosenBuiltin candidate;
        candidate.function = &function;
        if (!bind(arguments, candidate))
            continue;
        const int total = cost(candidate, arguments);
        if (total != IMPOSSIBLE_CONVERSION && (!best.function || total < bestCost)) {
            best = candidate;
            bestCost = total;
        }
    }
    return best;
}

int BuiltinChoice::cost(const ChosenBuiltin& builtin, const Arguments& arguments) const {
    int total = 0;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const int cost = operandCost(builtin, i, arguments);
        if (cost == IMPOSSIBLE_CONVERSION)
            return cost;
        total += cost;
    }
    return total;
}

int BuiltinChoice::operandCost(const ChosenBuiltin& builtin, std::size_t position,
                               const Arguments& arguments) const {
    const std::vector<Operand>& parameters = builtin.function->parameters;
    const Operand& operand = parameters[position];
    TypedExpr* argument = arguments[position];
    if (operand.kind == Operand::Kind::SAMPLER)
        return samplerCost(*builtin.function, operand, argument);
    const bool isCoordinate = position == 1 && parameters[0].kind == Operand::Kind::SAMPLER;
    if (isCoordinate && isDepthSampler(parameters[0].sampler) && argument->type->components() != operand.size)
        return IMPOSSIBLE_CONVERSION; // a fourth coordinate is no depth
    if (operand.isOut && !rootVariable(argument))
        return IMPOSSIBLE_CONVERSION;
    return conversionCost(argument, builtin.typeOf(operand, mTypes));
}

/// No sampler costs more than another, so only coordinates decide.
int BuiltinChoice::samplerCost(const BuiltinFunction& function, const BuiltinOperand& operand,
                               TypedExpr* sampler) const {
    if (isDepthSampler(operand.sampler) &&
        (mKinds.isPlain(sampler) || (function.needsShadowName && !isNamedAsShadow(sampler))))
        return IMPOSSIBLE_CONVERSION;
    return std::min(conversionCost(sampler, mTypes.sampler(operand.sampler)), 0);
}

void BuiltinChoice::refuse(SourceLocation at, Name name, const std::vector<BuiltinFunction>& functions,
                           const Arguments& arguments, Diagnostics& diagnostics) const {
    diagnostics.error(at, noMatchingFunction(name, arguments));
    const auto hasCount = [&arguments](const BuiltinFunction& function) {
        return function.parameters.size() == arguments.size();
    };
    const bool isCountKnown = std::any_of(functions.begin(), functions.end(), hasCount);
    std::set<std::string> described; // those of depth samplers look the same
    for (const BuiltinFunction& function : functions) {
        if (isCountKnown && !hasCount(function))
            continue;
        std::string text;
        for (const Operand& operand : function.parameters)
            text += (text.empty() ? "" : ", ") + describe(operand);
        if (described.insert(text).second)
            diagnostics.note(at, "candidate: " + std::string(name) + "(" + text + ")");
    }
}

/// An operand as a programmer writes it; `floatN` is a vector of the size that all such ones share.
std::string BuiltinChoice::describe(const BuiltinOperand& operand) const {
    const std::string size = operand.size == Operand::SHARED ? "N"
                             : operand.size == 1             ? ""
                                                             : std::to_string(operand.size);
    const std::string direction = operand.isOut ? "out " : "";
    switch (operand.kind) {
    case Operand::Kind::NUMBER:
    case Operand::Kind::FLOATING:
        return direction + "float" + size;
    case Operand::Kind::INTEGER:
        return direction + "int" + size;
    case Operand::Kind::BOOLEAN:
        return direction + "bool" + size;
    case Operand::Kind::SAMPLER:
        return nameOf(mTypes.sampler(operand.sampler));
    case Operand::Kind::TEXT:
        return "string";
    default:
        return "matrix";
    }
}

} // namespace cg
