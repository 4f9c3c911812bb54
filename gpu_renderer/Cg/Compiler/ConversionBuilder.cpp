#include <Cg/Compiler/ConversionBuilder.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <string>
#include <utility>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

TypedExpr* ConversionBuilder::vectorOf(TypedExpr* expression) {
    const Type* type = expression->type;
    if (!type->isThinMatrix())
        return expression;
    return make(Kind::CONVERT, expression->location, mTypes.vector(type->scalar, type->components()),
                {expression});
}

TypedExpr* ConversionBuilder::withScalar(TypedExpr* expression, Scalar scalar) {
    const Type* type = expression->type;
    if (!type->isNumeric() || type->scalar == scalar)
        return expression;
    if (expression->kind == Kind::LITERAL) {
        // A number without a type of its own has no 32 bits to wrap at yet.
        const double held =
            expression->isUntyped ? expression->number : valueAs(expression->number, type->scalar);
        const double number = isFloating(scalar) ? held : valueAs(held, scalar);
        TypedExpr* converted = literal(expression->location, mTypes.scalar(scalar), number);
        converted->isUntyped = expression->isUntyped;
        return converted;
    }
    // What one number for all components is made of, so that `float3 v = 1` needs no conversion of ints.
    if (expression->kind == Kind::CONVERT && expression->operands[0]->type == mTypes.scalar(type->scalar)) {
        TypedExpr* operand = withScalar(expression->operands[0], scalar);
        return make(Kind::CONVERT, expression->location, mTypes.withScalar(type, scalar), {operand});
    }
    TypedExpr* converted =
        make(Kind::CONVERT, expression->location, mTypes.withScalar(type, scalar), {expression});
    converted->isUntyped = expression->isUntyped;
    return converted;
}

TypedExpr* ConversionBuilder::reshape(TypedExpr* expression, const Type* to) {
    const Type* type = expression->type;
    if (type->isMatrix() == to->isMatrix() && type->rows == to->rows && type->columns == to->columns)
        return expression;
    if (type->isScalar())
        return smear(expression, to);
    const SourceLocation at = expression->location;
    const Type* target = mTypes.withScalar(to, type->scalar);
    if (type->isFullMatrix())
        return to->isFullMatrix() ? make(Kind::CONVERT, at, target, {expression})
                                  : reshapeRows(expression, to);
    TypedExpr* vector = vectorOf(expression);
    if (to->isFullMatrix())
        return make(Kind::CONSTRUCT, at, target, {vector});
    TypedExpr* shorter = firstOf(at, vector, to->components());
    return to->isMatrix() ? make(Kind::CONVERT, at, target, {shorter}) : shorter;
}

/// One value for all components. GLSL's matrix of one scalar would have it on its diagonal alone.
TypedExpr* ConversionBuilder::smear(TypedExpr* scalar, const Type* to) {
    const SourceLocation at = scalar->location;
    const Type* target = mTypes.withScalar(to, scalar->type->scalar);
    if (!to->isFullMatrix())
        return make(Kind::CONVERT, at, target, {scalar});
    TypedExpr* row = make(Kind::CONVERT, at, mTypes.vector(scalar->type->scalar, to->columns), {scalar});
    return make(Kind::CONSTRUCT, at, target,
                std::vector<TypedExpr*>(static_cast<std::size_t>(to->rows), row));
}

/// To something with the components of a vector, no more than the matrix has: row by row, as many as are
/// wanted.
TypedExpr* ConversionBuilder::reshapeRows(TypedExpr* matrix, const Type* to) {
    const SourceLocation at = matrix->location;
    const Type* type = matrix->type;
    const int columns = to->isMatrix() ? to->columns : type->columns;
    std::vector<TypedExpr*> rows;
    for (int row = 0; row * columns < to->components(); ++row)
        rows.push_back(firstOf(at, element(at, matrix, row), columns));
    if (to->isScalar())
        return firstOf(at, rows[0], 1);
    return rows.size() == 1 ? reshape(rows[0], to)
                            : make(Kind::CONSTRUCT, at, mTypes.withScalar(to, type->scalar), rows);
}

TypedExpr* ConversionBuilder::convert(TypedExpr* expression, const Type* to) {
    const Type* type = expression->type;
    if (type == to)
        return expression;
    if (type->isFullMatrix() && to == mTypes.scalar(Scalar::BOOL))
        return condition(expression);
    if (conversionCost(expression, to) == IMPOSSIBLE_CONVERSION) {
        mDiagnostics.error(expression->location,
                           "cannot convert from '" + nameOf(type) + "' to '" + nameOf(to) + "'");
        return nullptr;
    }
    if (!type->isNumeric())
        return type->isArray() && to->length != Type::UNSIZED
                   ? make(Kind::CONVERT, expression->location, to, {expression})
                   : expression;
    if (type->components() > to->components())
        mDiagnostics.warning(expression->location, "'" + nameOf(type) + "' is cut to '" + nameOf(to) + "'");
    return withScalar(reshape(expression, to), to->scalar);
}

TypedExpr* ConversionBuilder::condition(TypedExpr* expression) {
    const Type* boolean = mTypes.scalar(Scalar::BOOL);
    if (!expression->type->isFullMatrix())
        return convert(expression, boolean);
    const bool isAny = expression->isByRows && expression->form.find("notEqual") != Name::npos;
    return builtin(expression->location, boolean, isAny ? "cg_any($0)" : "cg_all($0)", {expression},
                   isAny ? "cg_any" : "cg_all");
}

TypedExpr* ConversionBuilder::cast(SourceLocation at, TypedExpr* expression, const Type* to) {
    const Type* type = expression->type;
    if (type == to)
        return expression;
    if (type->isNumeric() && to->isNumeric() &&
        (type->isScalar() || type->components() >= to->components()) &&
        !(type->isMatrix() && to->isMatrix() && (type->rows < to->rows || type->columns < to->columns))) {
        TypedExpr* result = withScalar(reshape(expression, to), to->scalar);
        if (result == expression)
            return expression;
        result->isUntyped = false;
        return result;
    }
    const bool isZero = expression->kind == Kind::LITERAL && expression->number == 0;
    if ((to->isStruct() || to->isArray()) && isZero && !containsSampler(to))
        return zero(at, to);
    if (conversionCost(expression, to) != IMPOSSIBLE_CONVERSION)
        return convert(expression, to);
    if (type->isStruct() && to->isStruct() &&
        type->structure->fields.size() >= to->structure->fields.size() && isSimple(expression))
        return castStruct(at, expression, to);
    mDiagnostics.error(at, "cannot cast from '" + nameOf(type) + "' to '" + nameOf(to) + "'");
    return nullptr;
}

/// Member by member, in order; what the target has no member for is dropped.
TypedExpr* ConversionBuilder::castStruct(SourceLocation at, TypedExpr* structure, const Type* to) {
    TypedExpr* result = make(Kind::CONSTRUCT, at, to);
    for (std::size_t i = 0; i < to->structure->fields.size(); ++i) {
        TypedExpr* member = convert(field(at, structure, static_cast<int>(i)), to->structure->fields[i].type);
        if (!member)
            return nullptr;
        result->operands.push_back(member);
    }
    return result;
}

TypedExpr* ConversionBuilder::construct(SourceLocation at, const Type* type,
                                        const std::vector<TypedExpr*>& arguments) {
    if (arguments.size() == 1 && (type->isNumeric() || arguments[0]->type == type))
        return cast(at, arguments[0], type);
    if (!type->isNumeric()) {
        mDiagnostics.error(at, "'" + nameOf(type) + "' cannot be made of these values");
        return nullptr;
    }
    int components = 0;
    std::vector<TypedExpr*> operands;
    for (TypedExpr* argument : arguments) {
        if (!argument->type->isNumeric()) {
            mDiagnostics.error(argument->location,
                               "'" + nameOf(argument->type) + "' is no component of '" + nameOf(type) + "'");
            return nullptr;
        }
        const int wanted = type->components() - components;
        if (wanted <= 0)
            break;
        if (argument->type->isFullMatrix()) {
            for (int row = 0; row < argument->type->rows; ++row)
                operands.push_back(withScalar(element(at, argument, row), type->scalar));
        } else {
            const int taken = std::min(wanted, argument->type->components());
            operands.push_back(withScalar(firstOf(at, vectorOf(argument), taken), type->scalar));
        }
        components += argument->type->components();
    }
    if (components < type->components()) {
        mDiagnostics.error(at, "too few values for '" + nameOf(type) + "': " + std::to_string(components) +
                                   " of " + std::to_string(type->components()));
        return nullptr;
    }
    if (type->isScalar())
        return firstOf(at, operands[0], 1);
    return make(Kind::CONSTRUCT, at, type, std::move(operands));
}

} // namespace cg
