#include <Cg/Compiler/TypedBuilder.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// GLSL's comparison of two vectors.
const char* comparisonForm(BinaryOp op) {
    switch (op) {
    case BinaryOp::LESS:
        return "lessThan($0, $1)";
    case BinaryOp::LESS_EQUAL:
        return "lessThanEqual($0, $1)";
    case BinaryOp::GREATER:
        return "greaterThan($0, $1)";
    case BinaryOp::GREATER_EQUAL:
        return "greaterThanEqual($0, $1)";
    case BinaryOp::EQUAL:
        return "equal($0, $1)";
    default:
        return "notEqual($0, $1)";
    }
}

} // namespace

void TypedBuilder::operandError(SourceLocation at, const char* op, const TypedExpr* left,
                                const TypedExpr* right) {
    mDiagnostics.error(at, std::string("operator '") + op + "' does not take '" + nameOf(left->type) +
                               "' and '" + nameOf(right->type) + "'");
}

Scalar TypedBuilder::commonScalar(const TypedExpr* left, const TypedExpr* right) const {
    const Scalar a = left->type->scalar;
    const Scalar b = right->type->scalar;
    if (isFloating(a) && isFloating(b) && left->isUntyped != right->isUntyped)
        return left->isUntyped ? b : a;
    return std::max(a, b);
}

/// Brings two numbers to one shape; a scalar beside a vector or matrix stays one.
bool TypedBuilder::matchShapes(SourceLocation at, TypedExpr*& left, TypedExpr*& right) {
    if (left->type->isScalar() || right->type->isScalar())
        return true;
    if (left->type->isMatrix() != right->type->isMatrix()) {
        left = vectorOf(left);
        right = vectorOf(right);
    }
    if (left->type->isMatrix() != right->type->isMatrix())
        return false;
    const int rows = std::min(left->type->rows, right->type->rows);
    const int columns = std::min(left->type->columns, right->type->columns);
    const auto typeFor = [&](const TypedExpr* operand) {
        return operand->type->isMatrix() ? mTypes.matrix(operand->type->scalar, rows, columns)
                                         : mTypes.vector(operand->type->scalar, columns);
    };
    if (left->type->components() != right->type->components())
        mDiagnostics.warning(at, "operands '" + nameOf(left->type) + "' and '" + nameOf(right->type) +
                                     "' are cut to the smaller size");
    left = reshape(left, typeFor(left));
    right = reshape(right, typeFor(right));
    return true;
}

bool TypedBuilder::matchOperands(SourceLocation at, BinaryOp op, TypedExpr*& left, TypedExpr*& right) {
    if (left->type->isNumeric() && right->type->isNumeric() && matchShapes(at, left, right))
        return true;
    operandError(at, spelling(op), left, right);
    return false;
}

/// Brings operands other than full matrices to vectors of one size, or to scalars where both are.
/// @return their type
const Type* TypedBuilder::matchVectors(Scalar scalar, TypedExpr*& left, TypedExpr*& right) {
    left = withScalar(vectorOf(left), scalar);
    right = withScalar(vectorOf(right), scalar);
    const Type* type = left->type->isVector() ? left->type : right->type;
    left = reshape(left, type);
    right = reshape(right, type);
    return type;
}

// ------------------------------------------------------------------------------------------- operators

TypedExpr* TypedBuilder::unary(SourceLocation at, UnaryOp op, TypedExpr* operand) {
    const Type* type = operand->type;
    if (!type->isNumeric() || (type->isFullMatrix() && op == UnaryOp::COMPLEMENT)) {
        mDiagnostics.error(at, "the operator does not take '" + nameOf(type) + "'");
        return nullptr;
    }
    if (op == UnaryOp::NOT && type->isFullMatrix())
        return compareMatrices(at, BinaryOp::EQUAL, operand, zero(at, type));
    if (op == UnaryOp::NOT) {
        operand = withScalar(vectorOf(operand), Scalar::BOOL);
        if (operand->type->isVector())
            return builtin(at, operand->type, "not($0)", {operand});
    } else if (type->scalar == Scalar::BOOL || (op == UnaryOp::COMPLEMENT && isFloating(type->scalar))) {
        operand = withScalar(operand, Scalar::INT);
    }
    if (op == UnaryOp::PLUS)
        return operand;
    if (op == UnaryOp::NEGATE && operand->kind == Kind::LITERAL) {
        TypedExpr* negative = literal(at, operand->type, -operand->number);
        negative->isUntyped = operand->isUntyped;
        return negative;
    }
    TypedExpr* expression = make(Kind::UNARY, at, operand->type, {operand});
    expression->unary = op;
    expression->isUntyped = operand->isUntyped;
    return expression;
}

TypedExpr* TypedBuilder::binary(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    switch (op) {
    case BinaryOp::LESS:
    case BinaryOp::GREATER:
    case BinaryOp::LESS_EQUAL:
    case BinaryOp::GREATER_EQUAL:
    case BinaryOp::EQUAL:
    case BinaryOp::NOT_EQUAL:
        return compare(at, op, left, right);
    case BinaryOp::AND:
    case BinaryOp::OR:
        return logical(at, op, left, right);
    default:
        return arithmetic(at, op, left, right);
    }
}

TypedExpr* TypedBuilder::arithmetic(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    if (!matchOperands(at, op, left, right))
        return nullptr;
    const bool isShift = op == BinaryOp::SHIFT_LEFT || op == BinaryOp::SHIFT_RIGHT;
    const bool isBitOperation =
        isShift || op == BinaryOp::BIT_AND || op == BinaryOp::BIT_OR || op == BinaryOp::BIT_XOR;
    if (isBitOperation && (left->type->isFullMatrix() || right->type->isFullMatrix())) {
        operandError(at, spelling(op), left, right);
        return nullptr;
    }
    Scalar scalar = commonScalar(left, right);
    if (scalar == Scalar::BOOL || (isBitOperation && isFloating(scalar)))
        scalar = Scalar::INT;
    left = withScalar(left, scalar);
    right = withScalar(right, scalar);
    // A vector beside a scalar is GLSL's own business, but for the vector on the right of a shift.
    const Type* type = left->type->isScalar() ? right->type : left->type;
    if (isShift)
        left = reshape(left, type);
    if (op == BinaryOp::MODULO)
        return remainder(at, type, left, right);
    const bool isProductByElement =
        op == BinaryOp::MULTIPLY && left->type->isFullMatrix() && right->type->isFullMatrix();
    return isProductByElement ? builtin(at, type, "matrixCompMult($0, $1)", {left, right})
                              : infix(at, op, type, left, right);
}

/// GLSL has none of floats, and leaves that of a negative number open; Cg's has the sign of the dividend.
TypedExpr* TypedBuilder::remainder(SourceLocation at, const Type* type, TypedExpr* left, TypedExpr* right) {
    if (isFloating(type->scalar)) {
        TypedExpr* result =
            builtin(at, type, "cg_fmod($0, $1)", {reshape(left, type), reshape(right, type)}, "cg_fmod");
        result->isByRows = type->isFullMatrix();
        return result;
    }
    if (type->scalar == Scalar::UINT || (constantValue(left) && constantValue(right)))
        return infix(at, BinaryOp::MODULO, type, left, right);
    return builtin(at, type, "cg_remainder($0, $1)", {reshape(left, type), reshape(right, type)},
                   "cg_remainder");
}

TypedExpr* TypedBuilder::compare(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    const bool isEquality = op == BinaryOp::EQUAL || op == BinaryOp::NOT_EQUAL;
    const Type* boolean = mTypes.scalar(Scalar::BOOL);
    if (!left->type->isNumeric() && left->type == right->type && isEquality && !left->type->isSampler())
        return infix(at, op, boolean, left, right);
    if (!matchOperands(at, op, left, right))
        return nullptr;
    if (left->type->isFullMatrix() || right->type->isFullMatrix())
        return compareMatrices(at, op, left, right);
    Scalar scalar = commonScalar(left, right);
    if (scalar == Scalar::BOOL && !isEquality)
        scalar = Scalar::INT;
    const Type* type = matchVectors(scalar, left, right);
    if (type->isScalar())
        return infix(at, op, boolean, left, right);
    return builtin(at, mTypes.vector(Scalar::BOOL, type->columns), comparisonForm(op), {left, right});
}

/// By component, with 0 and 1 for the answers: matrices of bools are matrices of floats in GLSL. A scalar
/// beside a matrix is compared with all of it.
TypedExpr* TypedBuilder::compareMatrices(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    const Type* shape = left->type->isMatrix() ? left->type : right->type;
    const Type* type = mTypes.matrix(Scalar::FLOAT, shape->rows, shape->columns);
    left = reshape(withScalar(left, Scalar::FLOAT), type);
    right = reshape(withScalar(right, Scalar::FLOAT), type);
    return asksRows(at, type, comparisonForm(op), {left, right});
}

TypedExpr* TypedBuilder::truth(TypedExpr* matrix) {
    return compareMatrices(matrix->location, BinaryOp::NOT_EQUAL, matrix,
                           zero(matrix->location, matrix->type));
}

TypedExpr* TypedBuilder::logical(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    if (!matchOperands(at, op, left, right))
        return nullptr;
    const bool isAnd = op == BinaryOp::AND;
    if (left->type->isFullMatrix() || right->type->isFullMatrix()) {
        const Type* shape = left->type->isMatrix() ? left->type : right->type;
        const Type* type = mTypes.matrix(Scalar::FLOAT, shape->rows, shape->columns);
        left = truth(reshape(withScalar(left, Scalar::FLOAT), type));
        right = truth(reshape(withScalar(right, Scalar::FLOAT), type));
        return byRows(at, type, isAnd ? "min($0, $1)" : "max($0, $1)", {left, right});
    }
    const Type* type = matchVectors(Scalar::BOOL, left, right);
    if (type->isScalar())
        return infix(at, op, type, left, right);
    return builtin(at, type, isAnd ? "cg_and($0, $1)" : "cg_or($0, $1)", {left, right},
                   isAnd ? "cg_and" : "cg_or");
}

// --------------------------------------------------------------------------------------------- choices

TypedExpr* TypedBuilder::conditional(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                     TypedExpr* whenFalse) {
    if (!condition->type->isNumeric())
        return this->condition(condition); // which tells the error
    if (whenTrue->type->isSampler() && whenFalse->type->isSampler())
        return chooseSampler(at, condition, whenTrue, whenFalse);
    const bool areNumbers = whenTrue->type->isNumeric() && whenFalse->type->isNumeric();
    if (areNumbers ? !matchShapes(at, whenTrue, whenFalse) : whenTrue->type != whenFalse->type) {
        operandError(at, "?:", whenTrue, whenFalse);
        return nullptr;
    }
    if (areNumbers && condition->type->isFullMatrix())
        return chooseElements(at, condition, whenTrue, whenFalse);
    condition = condition->type->isFullMatrix() ? this->condition(condition)
                                                : withScalar(vectorOf(condition), Scalar::BOOL);
    const bool isUntyped = areNumbers && whenTrue->isUntyped && whenFalse->isUntyped;
    if (areNumbers) {
        const Scalar scalar = commonScalar(whenTrue, whenFalse);
        whenTrue = withScalar(whenTrue, scalar);
        whenFalse = withScalar(whenFalse, scalar);
        const Type* type = whenTrue->type->isScalar() ? whenFalse->type : whenTrue->type;
        whenTrue = reshape(whenTrue, type);
        whenFalse = reshape(whenFalse, type);
    }
    if (condition->type->isVector()) {
        if (areNumbers && !whenTrue->type->isFullMatrix())
            return chooseComponents(at, condition, whenTrue, whenFalse);
        condition = firstOf(at, condition, 1);
    }
    TypedExpr* expression = make(Kind::CONDITIONAL, at, whenTrue->type, {condition, whenTrue, whenFalse});
    expression->isUntyped = isUntyped;
    return expression;
}

/// `vector ? a : b`, the values being of one type, no full matrices.
TypedExpr* TypedBuilder::chooseComponents(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                          TypedExpr* whenFalse) {
    whenTrue = vectorOf(whenTrue);
    whenFalse = vectorOf(whenFalse);
    const int size = whenTrue->type->isScalar() ? condition->type->columns
                                                : std::min(condition->type->columns, whenTrue->type->columns);
    const Type* type = mTypes.vector(whenTrue->type->scalar, size);
    condition = reshape(condition, mTypes.vector(Scalar::BOOL, size));
    whenTrue = reshape(whenTrue, type);
    whenFalse = reshape(whenFalse, type);
    if (isFloating(type->scalar))
        return builtin(at, type, "mix($0, $1, $2)", {whenFalse, whenTrue, condition});
    return builtin(at, type, "cg_select($2, $0, $1)", {whenTrue, whenFalse, condition}, "cg_select");
}

/// GLSL has no such expression: the resolver makes a choice among look-ups of it.
TypedExpr* TypedBuilder::chooseSampler(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                       TypedExpr* whenFalse) {
    if (!areSameTexture(whenTrue->type->sampler, whenFalse->type->sampler)) {
        operandError(at, "?:", whenTrue, whenFalse);
        return nullptr;
    }
    condition = this->condition(condition);
    const Type* type = whenTrue->type->sampler == Sampler::ANY ? whenFalse->type : whenTrue->type;
    TypedExpr* result = make(Kind::CONDITIONAL, at, type, {condition, whenTrue, whenFalse});
    if (samplersIn(result).size() <= MAX_SAMPLER_CHOICES)
        return result;
    mDiagnostics.error(at, "a choice among more than " + std::to_string(MAX_SAMPLER_CHOICES) + " samplers");
    return nullptr;
}

/// `matrix ? a : b`, the values being matrices or scalars.
TypedExpr* TypedBuilder::chooseElements(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                        TypedExpr* whenFalse) {
    const auto isFitting = [](const Type* type) { return type->isScalar() || type->isFullMatrix(); };
    if (!isFitting(whenTrue->type) || !isFitting(whenFalse->type)) {
        operandError(at, "?:", whenTrue, whenFalse);
        return nullptr;
    }
    int rows = condition->type->rows;
    int columns = condition->type->columns;
    for (const TypedExpr* value : {whenTrue, whenFalse})
        if (value->type->isMatrix()) {
            rows = std::min(rows, value->type->rows);
            columns = std::min(columns, value->type->columns);
        }
    Scalar scalar = commonScalar(whenTrue, whenFalse);
    if (!isFloating(scalar))
        scalar = Scalar::FLOAT;
    const Type* type = mTypes.matrix(scalar, rows, columns);
    whenTrue = reshape(withScalar(whenTrue, scalar), type);
    whenFalse = reshape(withScalar(whenFalse, scalar), type);
    const std::string form = "mix($2, $1, bvec" + std::to_string(columns) + "($0))";
    return byRows(at, type, mArena.keep(form), {reshape(condition, type), whenTrue, whenFalse});
}

// -------------------------------------------------------------------------------------------- products

TypedExpr* TypedBuilder::product(SourceLocation at, TypedExpr* left, TypedExpr* right) {
    if (!left->type->isNumeric() || !right->type->isNumeric()) {
        operandError(at, "mul", left, right);
        return nullptr;
    }
    Scalar scalar = commonScalar(left, right);
    if (!isFloating(scalar))
        scalar = Scalar::FLOAT;
    left = withScalar(left, scalar);
    right = withScalar(right, scalar);
    if (left->type->isScalar() || right->type->isScalar())
        return binary(at, BinaryOp::MULTIPLY, left, right);
    if (left->type->isVector() && right->type->isVector()) {
        matchShapes(at, left, right);
        return builtin(at, mTypes.scalar(scalar), "dot($0, $1)", {left, right});
    }
    return matrixProduct(at, left, right);
}

/// At least one operand is a matrix. A vector on the left is a row, one on the right a column. The matrices
/// here are GLSL's transposed ones, so the product is turned around.
TypedExpr* TypedBuilder::matrixProduct(SourceLocation at, TypedExpr* left, TypedExpr* right) {
    const Type* leftType = left->type;
    const Type* rightType = right->type;
    const int rows = leftType->isMatrix() ? leftType->rows : 1;
    const int columns = rightType->isMatrix() ? rightType->columns : 1;
    const int rightRows = rightType->isMatrix() ? rightType->rows : rightType->columns;
    const int inner = std::min(leftType->columns, rightRows);
    if (leftType->columns != rightRows)
        mDiagnostics.warning(at, "mul cuts '" + nameOf(leftType) + "' and '" + nameOf(rightType) +
                                     "' to sizes that fit");
    const Scalar scalar = leftType->scalar;
    const Type* result = leftType->isMatrix() && rightType->isMatrix()
                             ? mTypes.matrix(scalar, rows, columns)
                             : mTypes.vector(scalar, rows * columns);
    // Matrices of one row or column, which GLSL has not, are vectors from here on.
    left = vectorOf(reshape(left, leftType->isMatrix() ? mTypes.matrix(scalar, rows, inner)
                                                       : mTypes.vector(scalar, inner)));
    right = vectorOf(reshape(right, rightType->isMatrix() ? mTypes.matrix(scalar, inner, columns)
                                                          : mTypes.vector(scalar, inner)));
    if (rows == 1 && columns == 1)
        return builtin(at, result, "dot($0, $1)", {left, right});
    if (left->type->isVector() && right->type->isVector())
        return builtin(at, result, "outerProduct($1, $0)", {left, right});
    return infix(at, BinaryOp::MULTIPLY, result, right, left);
}

} // namespace cg
