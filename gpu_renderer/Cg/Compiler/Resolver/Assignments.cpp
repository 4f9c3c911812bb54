#include <Cg/Compiler/Resolver/Assignments.h>

#include <Cg/Compiler/Resolver/MemberAccess.h>
#include <Cg/Compiler/Resolver/Places.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAssignments.h>
#include <Cg/Compiler/Resolver/Swizzles.h>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// @return the member where its name says several elements of a matrix; else null
const MemberExpr* elementsOfMatrix(const Expr* target) {
    if (target->kind != Expr::Kind::MEMBER)
        return nullptr;
    const auto* member = static_cast<const MemberExpr*>(target);
    return matrixElements(member->name).size() > 1 ? member : nullptr;
}

} // namespace

TypedExpr* Assignments::assign(const AssignExpr* expr) {
    if (const MemberExpr* member = elementsOfMatrix(expr->target)) {
        TypedExpr* object = mRecursion.expression(member->object);
        if (!object)
            return nullptr;
        if (object->type->isMatrix())
            return assignElements(expr, member, object);
    }
    TypedExpr* target = mSamplers.place(expr->target);
    if (!target || !isOpaque(target->type))
        target = mRecursion.expression(expr->target);
    TypedExpr* value = mRecursion.expression(expr->value);
    if (!target || !value)
        return nullptr;
    if (isOpaque(target->type))
        return mSamplers.assign(expr->location, target, value);
    if (!mPlaces.checkAssignable(expr->location, target))
        return nullptr;
    return expr->isCompound ? assignCombined(expr, target, value)
                            : assignValue(expr->location, target, value);
}

TypedExpr* Assignments::assignValue(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    value = mResolution.build.convert(value, target->type);
    if (!value)
        return nullptr;
    if (target->kind == Kind::ELEMENT && target->type->isArray())
        return mPlaces.assignRow(at, target, value);
    TypedExpr* samplers = containsSampler(target->type) ? mSamplers.copy(at, target, value) : nullptr;
    return mResolution.inOrder(at, samplers, mResolution.build.assign(at, target, value));
}

TypedExpr* Assignments::assignCombined(const AssignExpr* expr, TypedExpr* target, TypedExpr* value) {
    TypedBuilder& build = mResolution.build;
    TypedExpr* combined = build.binary(expr->location, expr->op, target, value);
    combined = combined ? build.convert(combined, target->type) : nullptr;
    if (!combined)
        return nullptr;
    // GLSL's own operator where the target itself is the left operand.
    const bool isPlain = combined->kind == Kind::BINARY && combined->operands[0] == target;
    TypedExpr* result = build.assign(expr->location, target, isPlain ? combined->operands[1] : combined);
    result->isCompound = isPlain;
    result->binary = expr->op;
    return result;
}

/// `m._m00_m11 = value`: each element by itself.
TypedExpr* Assignments::assignElements(const AssignExpr* expr, const MemberExpr* target, TypedExpr* matrix) {
    TypedBuilder& build = mResolution.build;
    const SourceLocation at = expr->location;
    TypedExpr* value = mRecursion.expression(expr->value);
    TypedExpr* elements = mMembers.elementsOf(target->location, matrix, target->name);
    if (!value || !elements || !mPlaces.checkAssignable(at, matrix))
        return nullptr;
    if (expr->isCompound)
        value = build.binary(at, expr->op, elements, value);
    value = value ? build.convert(value, elements->type) : nullptr;
    if (!value)
        return nullptr;
    Variable* place = mResolution.temporary(elements->type);
    TypedExpr* result = build.assign(at, build.variable(at, place), value);
    for (TypedExpr* step : mPlaces.assignComponents(at, elements->operands, place))
        result = build.comma(at, result, step);
    return build.comma(at, result, build.variable(at, place));
}

} // namespace cg
