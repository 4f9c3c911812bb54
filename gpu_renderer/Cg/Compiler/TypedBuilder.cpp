#include <Cg/Compiler/TypedBuilder.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <numeric>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

constexpr int SMEAR_COST = 20;
constexpr int RESHAPE_COST = 30;
constexpr int TRUNCATE_COST = 40;
constexpr int TO_SCALAR_COST = 45;

/// Cost of a conversion between scalar kinds: widening is cheaper than narrowing, staying among floating
/// kinds is cheaper than leaving them.
int scalarCost(Scalar from, Scalar to, bool isUntyped) {
    if (from == to)
        return 0;
    if (isFloating(from) && isFloating(to)) {
        const int distance = std::abs(static_cast<int>(to) - static_cast<int>(from));
        return isUntyped || to > from ? distance : distance + 5;
    }
    if (to == Scalar::BOOL)
        return 12;
    if (isFloating(to))
        return (from == Scalar::BOOL ? 7 : 3) + (static_cast<int>(Scalar::FLOAT) - static_cast<int>(to));
    if (isFloating(from))
        return to == Scalar::INT ? 9 : 10;
    return from == Scalar::BOOL ? 5 : 2;
}

std::vector<int> firstComponents(int count) {
    std::vector<int> components(static_cast<std::size_t>(count));
    std::iota(components.begin(), components.end(), 0);
    return components;
}

bool isFullMatrix(const Type* type) {
    return type->isMatrix() && !type->isThinMatrix();
}

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

bool isSameSampler(Sampler a, Sampler b) {
    const auto plain = [](Sampler sampler) {
        switch (sampler) {
        case Sampler::D1_SHADOW:
            return Sampler::D1;
        case Sampler::D2_SHADOW:
            return Sampler::D2;
        case Sampler::RECT_SHADOW:
            return Sampler::RECT;
        case Sampler::CUBE_SHADOW:
            return Sampler::CUBE;
        case Sampler::D2_ARRAY_SHADOW:
            return Sampler::D2_ARRAY;
        default:
            return sampler;
        }
    };
    return a == Sampler::ANY || b == Sampler::ANY || plain(a) == plain(b);
}

} // namespace

const char* spelling(BinaryOp op) {
    constexpr const char* SPELLINGS[] = {"*",  "/",  "%",  "+", "-", "<<", ">>", "<",  ">", "<=",
                                         ">=", "==", "!=", "&", "^", "|",  "&&", "||", ","};
    return SPELLINGS[static_cast<std::size_t>(op)];
}

bool isSimple(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::LITERAL:
    case Kind::VARIABLE:
        return true;
    case Kind::FIELD:
    case Kind::SWIZZLE:
        return isSimple(expression->operands[0]);
    case Kind::ELEMENT:
        return isSimple(expression->operands[0]) && isSimple(expression->operands[1]);
    case Kind::BUILTIN:
        return expression->operands.empty();
    default:
        return false;
    }
}

Variable* rootVariable(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::VARIABLE:
        return expression->variable;
    case Kind::FIELD:
    case Kind::SWIZZLE:
    case Kind::ELEMENT:
    case Kind::CONVERT: // between types that are one in GLSL
        return rootVariable(expression->operands[0]);
    default:
        return nullptr;
    }
}

bool hasEffect(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::CALL:
    case Kind::ASSIGN:
    case Kind::BUILTIN: // some write to their arguments
        return true;
    case Kind::UNARY:
        return expression->unary >= UnaryOp::PRE_INCREMENT || hasEffect(expression->operands[0]);
    default:
        return std::any_of(expression->operands.begin(), expression->operands.end(), hasEffect);
    }
}

std::vector<TypedExpr*> samplersIn(TypedExpr* sampler) {
    if (sampler->kind != Kind::CONDITIONAL)
        return {sampler};
    std::vector<TypedExpr*> samplers = samplersIn(sampler->operands[1]);
    for (TypedExpr* other : samplersIn(sampler->operands[2]))
        samplers.push_back(other);
    return samplers;
}

// ----------------------------------------------------------------------------------------- plain nodes

TypedExpr* TypedBuilder::make(TypedExpr::Kind kind, SourceLocation at, const Type* type,
                              std::vector<TypedExpr*> operands) {
    auto* expression = mArena.make<TypedExpr>(kind, at, type);
    expression->operands = std::move(operands);
    return expression;
}

TypedExpr* TypedBuilder::literal(SourceLocation at, const Type* type, double number) {
    TypedExpr* expression = make(Kind::LITERAL, at, type);
    expression->number = number;
    return expression;
}

TypedExpr* TypedBuilder::variable(SourceLocation at, Variable* variable) {
    TypedExpr* expression = make(Kind::VARIABLE, at, variable->type);
    expression->variable = variable;
    return expression;
}

TypedExpr* TypedBuilder::builtin(SourceLocation at, const Type* type, Name form,
                                 std::vector<TypedExpr*> operands, Name helper) {
    TypedExpr* expression = make(Kind::BUILTIN, at, type, std::move(operands));
    expression->form = form;
    expression->helper = helper;
    return expression;
}

TypedExpr* TypedBuilder::byRows(SourceLocation at, const Type* type, Name form,
                                std::vector<TypedExpr*> operands, Name helper) {
    TypedExpr* expression = builtin(at, type, form, std::move(operands), helper);
    expression->isByRows = true;
    return expression;
}

TypedExpr* TypedBuilder::asksRows(SourceLocation at, const Type* type, const std::string& form,
                                  std::vector<TypedExpr*> operands) {
    const std::string row = "vec" + std::to_string(type->columns) + "(" + form + ")";
    return byRows(at, type, mArena.keep(row), std::move(operands));
}

TypedExpr* TypedBuilder::field(SourceLocation at, TypedExpr* object, int index) {
    const Field& member = object->type->structure->fields[static_cast<std::size_t>(index)];
    TypedExpr* expression = make(Kind::FIELD, at, member.type, {object});
    expression->index = index;
    return expression;
}

TypedExpr* TypedBuilder::element(SourceLocation at, TypedExpr* object, int index) {
    return element(at, object, literal(at, mTypes.scalar(Scalar::INT), index));
}

TypedExpr* TypedBuilder::element(SourceLocation at, TypedExpr* object, TypedExpr* index) {
    const Type* type = object->type;
    if (type->isScalar())
        return object;
    if (type->isArray() && object->kind == Kind::ELEMENT && object->operands[0]->type->isArray()) {
        // Arrays of arrays are flat in GLSL.
        TypedExpr* length = literal(at, mTypes.scalar(Scalar::INT), type->length);
        const Type* integer = mTypes.scalar(Scalar::INT);
        TypedExpr* first = infix(at, BinaryOp::MULTIPLY, integer, object->operands[1], length);
        TypedExpr* flat = infix(at, BinaryOp::ADD, integer, first, index);
        return make(Kind::ELEMENT, at, type->element, {object->operands[0], flat});
    }
    if (type->isArray())
        return make(Kind::ELEMENT, at, type->element, {object, index});
    if (type->isVector())
        return make(Kind::ELEMENT, at, mTypes.scalar(type->scalar), {object, index});
    const Type* row = mTypes.vector(type->scalar, type->columns);
    if (type->rows > 1)
        return make(Kind::ELEMENT, at, row, {object, index});
    return make(Kind::CONVERT, at, row, {object}); // the only row of a vector-like matrix
}

TypedExpr* TypedBuilder::swizzle(SourceLocation at, TypedExpr* object, const std::vector<int>& components) {
    const int count = static_cast<int>(components.size());
    const Type* type = mTypes.vector(object->type->scalar, count);
    if (object->type->isScalar())
        return count == 1 ? object : make(Kind::CONVERT, at, type, {object});
    if (count == object->type->columns && components == firstComponents(count))
        return object;
    if (object->kind == Kind::SWIZZLE) {
        std::vector<int> inner;
        inner.reserve(components.size());
        for (const int component : components)
            inner.push_back(object->components[static_cast<std::size_t>(component)]);
        return swizzle(at, object->operands[0], inner);
    }
    TypedExpr* expression = make(Kind::SWIZZLE, at, type, {object});
    for (std::size_t i = 0; i < components.size(); ++i)
        expression->components[i] = static_cast<std::uint8_t>(components[i]);
    return expression;
}

TypedExpr* TypedBuilder::pick(TypedExpr* constructed, const std::vector<int>& components) {
    if (constructed->kind != Kind::CONSTRUCT || !constructed->type->isVector())
        return nullptr;
    std::vector<TypedExpr*> parts;
    const int last = components[0] + static_cast<int>(components.size());
    int first = 0;
    int wanted = components[0];
    for (TypedExpr* operand : constructed->operands) {
        const int size = operand->type->components();
        const int end = first + size;
        if (wanted < end && wanted < last) {
            const bool isWhole = wanted == first && end <= last;
            if (!isWhole && !isSimple(operand))
                return nullptr;
            std::vector<int> inner;
            for (int component = wanted; component < std::min(end, last); ++component)
                inner.push_back(component - first);
            parts.push_back(isWhole ? operand : swizzle(operand->location, operand, inner));
            wanted = end;
        }
        first = end;
    }
    const Type* type = mTypes.vector(constructed->type->scalar, static_cast<int>(components.size()));
    return parts.size() == 1 ? parts[0] : make(Kind::CONSTRUCT, constructed->location, type, parts);
}

TypedExpr* TypedBuilder::assign(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    return make(Kind::ASSIGN, at, target->type, {target, value});
}

TypedExpr* TypedBuilder::comma(SourceLocation at, TypedExpr* first, TypedExpr* second) {
    TypedExpr* expression = make(Kind::BINARY, at, second->type, {first, second});
    expression->binary = BinaryOp::COMMA;
    return expression;
}

TypedExpr* TypedBuilder::infix(SourceLocation at, BinaryOp op, const Type* type, TypedExpr* left,
                               TypedExpr* right) {
    TypedExpr* expression = make(Kind::BINARY, at, type, {left, right});
    expression->binary = op;
    expression->isUntyped = left->isUntyped && right->isUntyped;
    return expression;
}

TypedExpr* TypedBuilder::zero(SourceLocation at, const Type* type) {
    if (type->isScalar())
        return literal(at, type, 0);
    if (type->isVector() || type->isThinMatrix())
        return make(Kind::CONVERT, at, type, {literal(at, mTypes.scalar(type->scalar), 0)});
    TypedExpr* expression = make(Kind::CONSTRUCT, at, type);
    if (type->isMatrix())
        expression->operands.push_back(literal(at, mTypes.scalar(type->scalar), 0));
    for (int i = 0; type->isArray() && i < type->length; ++i)
        expression->operands.push_back(zero(at, type->element));
    if (type->isStruct())
        for (const Field& member : type->structure->fields)
            if (!isOpaque(member.type))
                expression->operands.push_back(zero(at, member.type));
    return expression;
}

// ----------------------------------------------------------------------------------------- conversions

int TypedBuilder::cost(const TypedExpr* from, const Type* to) const {
    const Type* type = from->type;
    if (type == to)
        return 0;
    if (type->isSampler() && to->isSampler())
        return isSameSampler(type->sampler, to->sampler) ? 1 : IMPOSSIBLE;
    if (type->isArray() && to->isArray()) {
        if (to->length != Type::UNSIZED && to->length != type->length)
            return IMPOSSIBLE;
        const TypedExpr element(Kind::LITERAL, from->location, type->element);
        const bool isSameInGlsl = type->element == to->element || type->element->isArray() ||
                                  type->element->isSampler() ||
                                  (type->element->isNumeric() && to->element->isNumeric() &&
                                   type->element->components() == to->element->components() &&
                                   isFloating(type->element->scalar) && isFloating(to->element->scalar));
        return isSameInGlsl ? cost(&element, to->element) : IMPOSSIBLE;
    }
    if (!type->isNumeric() || !to->isNumeric())
        return IMPOSSIBLE;
    const int kindCost = scalarCost(type->scalar, to->scalar, from->isUntyped);
    if (type->isScalar())
        return kindCost + (to->isScalar() ? 0 : to->isVector() ? SMEAR_COST : SMEAR_COST + RESHAPE_COST);
    if (type->isMatrix() && to->isMatrix()) {
        if (to->rows > type->rows || to->columns > type->columns)
            return IMPOSSIBLE;
        return kindCost + (to->rows == type->rows && to->columns == type->columns ? 0 : TRUNCATE_COST);
    }
    if ((type->isMatrix() && !type->isThinMatrix()) || (to->isMatrix() && !to->isThinMatrix()))
        return IMPOSSIBLE;
    if (to->components() > type->components())
        return IMPOSSIBLE;
    const int shapeCost = to->components() == type->components() ? 0
                          : to->isScalar()                       ? TO_SCALAR_COST
                                           : TRUNCATE_COST + type->components() - to->components();
    return kindCost + shapeCost + (type->kind == to->kind || to->isScalar() ? 0 : RESHAPE_COST);
}

TypedExpr* TypedBuilder::vectorOf(TypedExpr* thinMatrix) {
    const Type* type = thinMatrix->type;
    if (!type->isThinMatrix())
        return thinMatrix;
    return make(Kind::CONVERT, thinMatrix->location, mTypes.vector(type->scalar, type->components()),
                {thinMatrix});
}

TypedExpr* TypedBuilder::withScalar(TypedExpr* expression, Scalar scalar) {
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

/// Numbers only: the same components, fewer of them, or one for all.
TypedExpr* TypedBuilder::reshape(TypedExpr* expression, const Type* to) {
    const Type* type = expression->type;
    const SourceLocation at = expression->location;
    const Type* target = mTypes.withScalar(to, type->scalar);
    if (type == target ||
        (type->isMatrix() == to->isMatrix() && type->rows == to->rows && type->columns == to->columns))
        return expression;
    if (type->isScalar()) {
        if (!to->isMatrix() || to->isThinMatrix())
            return make(Kind::CONVERT, at, target, {expression});
        TypedExpr* row = make(Kind::CONVERT, at, mTypes.vector(type->scalar, to->columns), {expression});
        return make(Kind::CONSTRUCT, at, target,
                    std::vector<TypedExpr*>(static_cast<std::size_t>(to->rows), row));
    }
    const bool isMatrixToMatrix = type->isMatrix() && to->isMatrix();
    if (isMatrixToMatrix && !type->isThinMatrix() && !to->isThinMatrix())
        return make(Kind::CONVERT, at, target, {expression});
    if (type->isMatrix() && !type->isThinMatrix()) {
        // To something with the components of a vector: row by row, as many as are wanted.
        std::vector<TypedExpr*> rows;
        const int columns = to->isMatrix() ? to->columns : type->columns;
        for (int row = 0; row < type->rows && row * columns < to->components(); ++row)
            rows.push_back(swizzle(at, element(at, expression, row), firstComponents(columns)));
        if (to->isScalar())
            return swizzle(at, rows[0], {0});
        return rows.size() == 1 ? reshape(rows[0], to) : make(Kind::CONSTRUCT, at, target, rows);
    }
    TypedExpr* vector = vectorOf(expression);
    if (to->isMatrix() && !to->isThinMatrix())
        return make(Kind::CONSTRUCT, at, target, {vector});
    TypedExpr* shorter = swizzle(at, vector, firstComponents(to->components()));
    return to->isMatrix() ? make(Kind::CONVERT, at, target, {shorter}) : shorter;
}

TypedExpr* TypedBuilder::convert(TypedExpr* expression, const Type* to) {
    const Type* type = expression->type;
    if (type == to)
        return expression;
    if (isFullMatrix(type) && to == mTypes.scalar(Scalar::BOOL))
        return condition(expression);
    if (cost(expression, to) == IMPOSSIBLE) {
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

TypedExpr* TypedBuilder::cast(SourceLocation at, TypedExpr* expression, const Type* to) {
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
    if (cost(expression, to) != IMPOSSIBLE)
        return convert(expression, to);
    if (type->isStruct() && to->isStruct() &&
        type->structure->fields.size() >= to->structure->fields.size() && isSimple(expression)) {
        TypedExpr* result = make(Kind::CONSTRUCT, at, to);
        for (std::size_t i = 0; i < to->structure->fields.size(); ++i) {
            TypedExpr* member =
                convert(field(at, expression, static_cast<int>(i)), to->structure->fields[i].type);
            if (!member)
                return nullptr;
            result->operands.push_back(member);
        }
        return result;
    }
    mDiagnostics.error(at, "cannot cast from '" + nameOf(type) + "' to '" + nameOf(to) + "'");
    return nullptr;
}

TypedExpr* TypedBuilder::construct(SourceLocation at, const Type* type,
                                   const std::vector<TypedExpr*>& arguments) {
    if (arguments.size() == 1 && (type->isNumeric() || arguments[0]->type == type))
        return cast(at, arguments[0], type);
    if (!type->isNumeric()) {
        mDiagnostics.error(at, "'" + nameOf(type) + "' cannot be made of these values");
        return nullptr;
    }
    int components = 0;
    std::vector<TypedExpr*> operands;
    bool isUntyped = true;
    for (TypedExpr* argument : arguments) {
        if (!argument->type->isNumeric()) {
            mDiagnostics.error(argument->location,
                               "'" + nameOf(argument->type) + "' is no component of '" + nameOf(type) + "'");
            return nullptr;
        }
        const int wanted = type->components() - components;
        if (wanted <= 0)
            break;
        if (argument->type->isMatrix() && !argument->type->isThinMatrix()) {
            for (int row = 0; row < argument->type->rows; ++row)
                operands.push_back(withScalar(element(at, argument, row), type->scalar));
        } else {
            TypedExpr* vector = vectorOf(argument);
            if (vector->type->components() > wanted)
                vector = swizzle(at, vector, firstComponents(wanted));
            operands.push_back(withScalar(vector, type->scalar));
        }
        components += argument->type->components();
        isUntyped = isUntyped && argument->isUntyped;
    }
    if (components < type->components()) {
        mDiagnostics.error(at, "too few values for '" + nameOf(type) + "': " + std::to_string(components) +
                                   " of " + std::to_string(type->components()));
        return nullptr;
    }
    if (type->isScalar())
        return swizzle(at, operands[0], {0});
    TypedExpr* expression = make(Kind::CONSTRUCT, at, type, std::move(operands));
    return expression;
}

// ------------------------------------------------------------------------------------------- operators

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

TypedExpr* TypedBuilder::unary(SourceLocation at, UnaryOp op, TypedExpr* operand) {
    const Type* type = operand->type;
    if (!type->isNumeric() || (isFullMatrix(type) && op == UnaryOp::COMPLEMENT)) {
        mDiagnostics.error(at, "the operator does not take '" + nameOf(type) + "'");
        return nullptr;
    }
    if (op == UnaryOp::NOT && isFullMatrix(type))
        return compareMatrices(at, BinaryOp::EQUAL, operand, zero(at, type));
    if (op == UnaryOp::NOT) {
        operand = withScalar(vectorOf(operand), Scalar::BOOL);
        if (operand->type->isVector())
            return builtin(at, operand->type, "not($0)", {operand});
    } else if (op == UnaryOp::COMPLEMENT && (isFloating(type->scalar) || type->scalar == Scalar::BOOL)) {
        operand = withScalar(operand, Scalar::INT);
    } else if (type->scalar == Scalar::BOOL) {
        operand =
            withScalar(operand, op == UnaryOp::NEGATE || op == UnaryOp::PLUS ? Scalar::INT : Scalar::BOOL);
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

TypedExpr* TypedBuilder::compare(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right) {
    const bool isEquality = op == BinaryOp::EQUAL || op == BinaryOp::NOT_EQUAL;
    const Type* boolean = mTypes.scalar(Scalar::BOOL);
    if (!left->type->isNumeric() && left->type == right->type && isEquality && !left->type->isSampler())
        return infix(at, op, boolean, left, right);
    if (!left->type->isNumeric() || !right->type->isNumeric() || !matchShapes(at, left, right)) {
        operandError(at, spelling(op), left, right);
        return nullptr;
    }
    if (isFullMatrix(left->type) || isFullMatrix(right->type))
        return compareMatrices(at, op, left, right);
    Scalar scalar = commonScalar(left, right);
    if (scalar == Scalar::BOOL && !isEquality)
        scalar = Scalar::INT;
    left = withScalar(vectorOf(left), scalar);
    right = withScalar(vectorOf(right), scalar);
    if (left->type->isScalar() && right->type->isScalar())
        return infix(at, op, boolean, left, right);
    const Type* type = left->type->isVector() ? left->type : right->type;
    left = reshape(left, type);
    right = reshape(right, type);
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
    if (!left->type->isNumeric() || !right->type->isNumeric() || !matchShapes(at, left, right)) {
        operandError(at, spelling(op), left, right);
        return nullptr;
    }
    if (isFullMatrix(left->type) || isFullMatrix(right->type)) {
        const Type* shape = left->type->isMatrix() ? left->type : right->type;
        const Type* type = mTypes.matrix(Scalar::FLOAT, shape->rows, shape->columns);
        left = truth(reshape(withScalar(left, Scalar::FLOAT), type));
        right = truth(reshape(withScalar(right, Scalar::FLOAT), type));
        return byRows(at, type, op == BinaryOp::AND ? "min($0, $1)" : "max($0, $1)", {left, right});
    }
    left = vectorOf(left);
    right = vectorOf(right);
    left = withScalar(left, Scalar::BOOL);
    right = withScalar(right, Scalar::BOOL);
    if (left->type->isScalar() && right->type->isScalar())
        return infix(at, op, left->type, left, right);
    const Type* type = left->type->isVector() ? left->type : right->type;
    left = reshape(left, type);
    right = reshape(right, type);
    const bool isAnd = op == BinaryOp::AND;
    return builtin(at, type, isAnd ? "cg_and($0, $1)" : "cg_or($0, $1)", {left, right},
                   isAnd ? "cg_and" : "cg_or");
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
        break;
    }
    if (!left->type->isNumeric() || !right->type->isNumeric() || !matchShapes(at, left, right)) {
        operandError(at, spelling(op), left, right);
        return nullptr;
    }
    const bool isBitOperation = op == BinaryOp::BIT_AND || op == BinaryOp::BIT_OR ||
                                op == BinaryOp::BIT_XOR || op == BinaryOp::SHIFT_LEFT ||
                                op == BinaryOp::SHIFT_RIGHT;
    if (isBitOperation && (isFullMatrix(left->type) || isFullMatrix(right->type))) {
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
    if (op == BinaryOp::SHIFT_LEFT || op == BinaryOp::SHIFT_RIGHT)
        left = reshape(left, type);
    if (op == BinaryOp::MODULO && isFloating(scalar)) {
        TypedExpr* result =
            builtin(at, type, "cg_fmod($0, $1)", {reshape(left, type), reshape(right, type)}, "cg_fmod");
        result->isByRows = isFullMatrix(type);
        return result;
    }
    // GLSL leaves the remainder of a negative number open; Cg's has the sign of the dividend.
    if (op == BinaryOp::MODULO && scalar == Scalar::INT && !(constantValue(left) && constantValue(right)))
        return builtin(at, type, "cg_remainder($0, $1)", {reshape(left, type), reshape(right, type)},
                       "cg_remainder");
    const bool isMatrixProduct =
        op == BinaryOp::MULTIPLY && left->type->isMatrix() && right->type->isMatrix();
    if (isMatrixProduct && !type->isThinMatrix())
        return builtin(at, type, "matrixCompMult($0, $1)", {left, right});
    return infix(at, op, type, left, right);
}

/// A comparison of matrices as one bool: equal ones are equal in all components, unequal ones in any.
TypedExpr* TypedBuilder::condition(TypedExpr* expression) {
    if (isFullMatrix(expression->type)) {
        const bool isAny = expression->isByRows && expression->form.find("notEqual") != Name::npos;
        return builtin(expression->location, mTypes.scalar(Scalar::BOOL), isAny ? "cg_any($0)" : "cg_all($0)",
                       {expression}, isAny ? "cg_any" : "cg_all");
    }
    return convert(expression, mTypes.scalar(Scalar::BOOL));
}

TypedExpr* TypedBuilder::conditional(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                     TypedExpr* whenFalse) {
    if (whenTrue->type->isSampler() && whenFalse->type->isSampler())
        return chooseSampler(at, condition, whenTrue, whenFalse);
    const bool areNumbers = whenTrue->type->isNumeric() && whenFalse->type->isNumeric();
    if (!condition->type->isNumeric() || (!areNumbers && whenTrue->type != whenFalse->type) ||
        (areNumbers && !matchShapes(at, whenTrue, whenFalse))) {
        operandError(at, "?:", whenTrue, whenFalse);
        return nullptr;
    }
    if (areNumbers && isFullMatrix(condition->type))
        return chooseElements(at, condition, whenTrue, whenFalse);
    condition = isFullMatrix(condition->type) ? this->condition(condition)
                                              : withScalar(vectorOf(condition), Scalar::BOOL);
    bool isUntyped = false;
    if (areNumbers) {
        const Scalar scalar = commonScalar(whenTrue, whenFalse);
        isUntyped = whenTrue->isUntyped && whenFalse->isUntyped;
        whenTrue = withScalar(whenTrue, scalar);
        whenFalse = withScalar(whenFalse, scalar);
        const Type* type = whenTrue->type->isScalar() ? whenFalse->type : whenTrue->type;
        whenTrue = reshape(whenTrue, type);
        whenFalse = reshape(whenFalse, type);
    }
    const Type* type = whenTrue->type;
    if (condition->type->isVector() && type->isMatrix() && !type->isThinMatrix())
        condition = swizzle(at, condition, {0});
    if (condition->type->isScalar() || !areNumbers) {
        if (condition->type->isVector())
            condition = swizzle(at, condition, {0});
        TypedExpr* expression = make(Kind::CONDITIONAL, at, type, {condition, whenTrue, whenFalse});
        expression->isUntyped = isUntyped;
        return expression;
    }
    whenTrue = vectorOf(whenTrue);
    whenFalse = vectorOf(whenFalse);
    const int size = whenTrue->type->isScalar() ? condition->type->columns
                                                : std::min(condition->type->columns, whenTrue->type->columns);
    const Type* result = mTypes.vector(whenTrue->type->scalar, size);
    condition = reshape(condition, mTypes.vector(Scalar::BOOL, size));
    whenTrue = reshape(whenTrue, result);
    whenFalse = reshape(whenFalse, result);
    if (size == 1)
        return make(Kind::CONDITIONAL, at, result, {condition, whenTrue, whenFalse});
    if (isFloating(result->scalar))
        return builtin(at, result, "mix($0, $1, $2)", {whenFalse, whenTrue, condition});
    return builtin(at, result, "cg_select($2, $0, $1)", {whenTrue, whenFalse, condition}, "cg_select");
}

/// GLSL has no such expression: the resolver makes a choice among look-ups of it.
TypedExpr* TypedBuilder::chooseSampler(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                       TypedExpr* whenFalse) {
    if (!isSameSampler(whenTrue->type->sampler, whenFalse->type->sampler) || !condition->type->isNumeric()) {
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
    const auto isFitting = [](const Type* type) { return type->isScalar() || isFullMatrix(type); };
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
    const int leftColumns = left->type->columns;
    const int rightRows = right->type->isMatrix() ? right->type->rows : right->type->columns;
    const int inner = std::min(leftColumns, rightRows);
    if (leftColumns != rightRows)
        mDiagnostics.warning(at, "mul cuts '" + nameOf(left->type) + "' and '" + nameOf(right->type) +
                                     "' to sizes that fit");
    const Scalar scalar = left->type->scalar;
    const Type* leftType = left->type->isMatrix() ? mTypes.matrix(scalar, left->type->rows, inner)
                                                  : mTypes.vector(scalar, inner);
    const Type* rightType = right->type->isMatrix() ? mTypes.matrix(scalar, inner, right->type->columns)
                                                    : mTypes.vector(scalar, inner);
    left = reshape(left, leftType);
    right = reshape(right, rightType);
    const bool isLeftPlain = !left->type->isThinMatrix() && !left->type->isScalar();
    const bool isRightPlain = !right->type->isThinMatrix() && !right->type->isScalar();
    const int rows = left->type->isMatrix() ? left->type->rows : 1;
    const int columns = right->type->isMatrix() ? right->type->columns : 1;
    const Type* result = left->type->isMatrix() && right->type->isMatrix()
                             ? mTypes.matrix(scalar, rows, columns)
                             : mTypes.vector(scalar, rows * columns);
    if (isLeftPlain && isRightPlain)
        return infix(at, BinaryOp::MULTIPLY, result, right, left);
    // GLSL has no matrices of one row or column: a row of the left by a column of the right.
    const bool isRowTimesMatrix = rows == 1 && isRightPlain;
    const bool isMatrixTimesColumn = columns == 1 && isLeftPlain;
    left = isLeftPlain ? left : vectorOf(left);
    right = isRightPlain ? right : vectorOf(right);
    if (isRowTimesMatrix || isMatrixTimesColumn)
        return infix(at, BinaryOp::MULTIPLY, result, right, left);
    if (rows == 1 && columns == 1)
        return builtin(at, result, "dot($0, $1)", {left, right});
    return builtin(at, result, "outerProduct($1, $0)", {left, right});
}

} // namespace cg
