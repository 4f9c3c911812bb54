#include <Cg/Compiler/NodeBuilder.h>

#include <algorithm>
#include <cstdint>
#include <numeric>
#include <utility>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

std::vector<int> firstComponents(int count) {
    std::vector<int> components(static_cast<std::size_t>(count));
    std::iota(components.begin(), components.end(), 0);
    return components;
}

} // namespace

TypedExpr* NodeBuilder::make(TypedExpr::Kind kind, SourceLocation at, const Type* type,
                             std::vector<TypedExpr*> operands) {
    auto* expression = mArena.make<TypedExpr>(kind, at, type);
    expression->operands = std::move(operands);
    return expression;
}

TypedExpr* NodeBuilder::literal(SourceLocation at, const Type* type, double number) {
    TypedExpr* expression = make(Kind::LITERAL, at, type);
    expression->number = number;
    return expression;
}

TypedExpr* NodeBuilder::variable(SourceLocation at, Variable* variable) {
    TypedExpr* expression = make(Kind::VARIABLE, at, variable->type);
    expression->variable = variable;
    return expression;
}

TypedExpr* NodeBuilder::builtin(SourceLocation at, const Type* type, Name form,
                                std::vector<TypedExpr*> operands, Name helper) {
    TypedExpr* expression = make(Kind::BUILTIN, at, type, std::move(operands));
    expression->form = form;
    expression->helper = helper;
    return expression;
}

TypedExpr* NodeBuilder::byRows(SourceLocation at, const Type* type, Name form,
                               std::vector<TypedExpr*> operands) {
    TypedExpr* expression = builtin(at, type, form, std::move(operands));
    expression->isByRows = true;
    return expression;
}

TypedExpr* NodeBuilder::asksRows(SourceLocation at, const Type* type, const std::string& form,
                                 std::vector<TypedExpr*> operands) {
    const std::string row = "vec" + std::to_string(type->columns) + "(" + form + ")";
    return byRows(at, type, mArena.keep(row), std::move(operands));
}

TypedExpr* NodeBuilder::infix(SourceLocation at, BinaryOp op, const Type* type, TypedExpr* left,
                              TypedExpr* right) {
    TypedExpr* expression = make(Kind::BINARY, at, type, {left, right});
    expression->binary = op;
    expression->isUntyped = left->isUntyped && right->isUntyped;
    return expression;
}

TypedExpr* NodeBuilder::assign(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    return make(Kind::ASSIGN, at, target->type, {target, value});
}

TypedExpr* NodeBuilder::comma(SourceLocation at, TypedExpr* first, TypedExpr* second) {
    TypedExpr* expression = make(Kind::BINARY, at, second->type, {first, second});
    expression->binary = BinaryOp::COMMA;
    return expression;
}

TypedExpr* NodeBuilder::field(SourceLocation at, TypedExpr* object, int index) {
    const Field& member = object->type->structure->fields[static_cast<std::size_t>(index)];
    TypedExpr* expression = make(Kind::FIELD, at, member.type, {object});
    expression->index = index;
    return expression;
}

TypedExpr* NodeBuilder::element(SourceLocation at, TypedExpr* object, int index) {
    return element(at, object, literal(at, mTypes.scalar(Scalar::INT), index));
}

TypedExpr* NodeBuilder::element(SourceLocation at, TypedExpr* object, TypedExpr* index) {
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

TypedExpr* NodeBuilder::swizzle(SourceLocation at, TypedExpr* object, const std::vector<int>& components) {
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
    std::transform(components.begin(), components.end(), expression->components.begin(),
                   [](int component) { return static_cast<std::uint8_t>(component); });
    return expression;
}

TypedExpr* NodeBuilder::firstOf(SourceLocation at, TypedExpr* vector, int count) {
    return swizzle(at, vector, firstComponents(count));
}

TypedExpr* NodeBuilder::pick(TypedExpr* constructed, const std::vector<int>& components) {
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

TypedExpr* NodeBuilder::zero(SourceLocation at, const Type* type) {
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

} // namespace cg
