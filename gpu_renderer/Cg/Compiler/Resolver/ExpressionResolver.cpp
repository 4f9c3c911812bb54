#include <Cg/Compiler/Resolver/ExpressionResolver.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Assignments.h>
#include <Cg/Compiler/Resolver/Calls.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/MemberAccess.h>
#include <Cg/Compiler/Resolver/NameResolver.h>
#include <Cg/Compiler/Resolver/Places.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerLists.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>

namespace cg {

ExpressionResolver::ExpressionResolver(Resolution& resolution, TypeResolver& types,
                                       Initializers& initializers, NameResolver& names, MemberAccess& members,
                                       Places& places, SamplerLists& lists, Calls& calls,
                                       Assignments& assignments)
    : mResolution(resolution), mTypes(types), mInitializers(initializers), mNames(names), mMembers(members),
      mPlaces(places), mLists(lists), mCalls(calls), mAssignments(assignments) {}

TypedExpr* ExpressionResolver::expression(const Expr* expr) {
    using Kind = Expr::Kind;
    switch (expr->kind) {
    case Kind::LITERAL:
        return literal(static_cast<const LiteralExpr*>(expr));
    case Kind::NAME:
        return mNames.name(static_cast<const NameExpr*>(expr), false);
    case Kind::MEMBER:
        return member(static_cast<const MemberExpr*>(expr));
    case Kind::INDEX:
        return index(static_cast<const IndexExpr*>(expr));
    case Kind::CALL:
        return mCalls.call(static_cast<const CallExpr*>(expr));
    case Kind::CONSTRUCT:
        return constructor(static_cast<const ConstructExpr*>(expr));
    case Kind::CAST:
        return castExpression(static_cast<const CastExpr*>(expr));
    case Kind::UNARY:
        return unary(static_cast<const UnaryExpr*>(expr));
    case Kind::BINARY:
        return binary(static_cast<const BinaryExpr*>(expr));
    case Kind::ASSIGN:
        return mAssignments.assign(static_cast<const AssignExpr*>(expr));
    case Kind::CONDITIONAL:
        return conditional(static_cast<const ConditionalExpr*>(expr));
    case Kind::INIT_LIST:
        break;
    }
    mResolution.diagnostics.error(expr->location, "a list in braces stands only as an initial value");
    return nullptr;
}

TypedExpr* ExpressionResolver::literal(const LiteralExpr* expr) {
    const auto typed = [&](Scalar scalar, bool isUntyped) {
        TypedExpr* result =
            mResolution.build.literal(expr->location, mResolution.types.scalar(scalar), expr->number);
        result->isUntyped = isUntyped;
        return result;
    };
    switch (expr->type) {
    case LiteralExpr::Type::INT:
        return typed(Scalar::INT, true);
    case LiteralExpr::Type::UNSIGNED:
        return typed(Scalar::UINT, false);
    case LiteralExpr::Type::FLOAT:
        return typed(Scalar::FLOAT, true);
    case LiteralExpr::Type::HALF:
        return typed(Scalar::HALF, false);
    case LiteralExpr::Type::FIXED:
        return typed(Scalar::FIXED, false);
    case LiteralExpr::Type::BOOL:
        return typed(Scalar::BOOL, false);
    case LiteralExpr::Type::TEXT:
        break;
    }
    mResolution.diagnostics.error(expr->location, "a text is no value here");
    return nullptr;
}

TypedExpr* ExpressionResolver::member(const MemberExpr* expr) {
    if (TypedExpr* state = mNames.state(expr))
        return state;
    TypedExpr* object = expression(expr->object);
    return object ? mMembers.member(expr->location, object, expr->name) : nullptr;
}

TypedExpr* ExpressionResolver::index(const IndexExpr* expr) {
    if (TypedExpr* state = mNames.state(expr))
        return state;
    TypedExpr* object = expr->object->kind == Expr::Kind::NAME
                            ? mNames.name(static_cast<const NameExpr*>(expr->object), true)
                            : expression(expr->object);
    TypedExpr* position = expression(expr->index);
    return object && position ? mMembers.element(expr->location, object, position) : nullptr;
}

TypedExpr* ExpressionResolver::constructor(const ConstructExpr* expr) {
    const Type* type = mTypes.typeOf(expr->type);
    if (!type)
        return nullptr;
    if (type->isArray())
        return mInitializers.array(expr->location, type, expr->arguments);
    if (type->isStruct())
        return mInitializers.structure(expr->location, type, expr->arguments);
    std::vector<TypedExpr*> arguments;
    for (const Expr* argument : expr->arguments)
        arguments.push_back(expression(argument));
    if (std::find(arguments.begin(), arguments.end(), nullptr) != arguments.end())
        return nullptr;
    return mResolution.build.construct(expr->location, type, arguments);
}

TypedExpr* ExpressionResolver::castExpression(const CastExpr* expr) {
    const Type* type = mTypes.typeOf(expr->type);
    if (type && expr->operand->kind == Expr::Kind::INIT_LIST)
        return mInitializers.value(type, expr->operand);
    TypedExpr* operand = expression(expr->operand);
    if (!type || !operand)
        return nullptr;
    if (type->isVoid() || type->isUnsizedArray())
        return operand;
    return mResolution.build.cast(expr->location, operand, type);
}

TypedExpr* ExpressionResolver::unary(const UnaryExpr* expr) {
    TypedExpr* operand = expression(expr->operand);
    if (!operand)
        return nullptr;
    return expr->op >= UnaryOp::PRE_INCREMENT ? increment(expr, operand)
                                              : mResolution.build.unary(expr->location, expr->op, operand);
}

/// `++` and `--`, before and behind.
TypedExpr* ExpressionResolver::increment(const UnaryExpr* expr, TypedExpr* operand) {
    if (!mPlaces.checkAssignable(expr->location, operand))
        return nullptr;
    if (!operand->type->isNumeric() || operand->type->scalar == Scalar::BOOL) {
        mResolution.diagnostics.error(expr->location,
                                      "the operator does not take '" + nameOf(operand->type) + "'");
        return nullptr;
    }
    TypedExpr* result =
        mResolution.build.make(TypedExpr::Kind::UNARY, expr->location, operand->type, {operand});
    result->unary = expr->op;
    return result;
}

TypedExpr* ExpressionResolver::binary(const BinaryExpr* expr) {
    TypedExpr* left = expression(expr->left);
    TypedExpr* right = expression(expr->right);
    if (!left || !right)
        return nullptr;
    return expr->op == BinaryOp::COMMA ? mResolution.build.comma(expr->location, left, right)
                                       : mResolution.build.binary(expr->location, expr->op, left, right);
}

TypedExpr* ExpressionResolver::conditional(const ConditionalExpr* expr) {
    TypedExpr* condition = expression(expr->condition);
    TypedExpr* whenTrue = expression(expr->whenTrue);
    TypedExpr* whenFalse = expression(expr->whenFalse);
    return condition && whenTrue && whenFalse ? mLists.choose(expr->location, condition, whenTrue, whenFalse)
                                              : nullptr;
}

} // namespace cg
