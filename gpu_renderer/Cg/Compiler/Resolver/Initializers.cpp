#include <Cg/Compiler/Resolver/Initializers.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/InitializerLists.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

TypedExpr* Initializers::value(const Type*& type, const Expr* expr) {
    if (expr->kind == Expr::Kind::INIT_LIST) {
        const auto* list = static_cast<const InitListExpr*>(expr);
        if (type->isUnsizedArray())
            type = mLists.sized(type, list);
        return type ? mLists.value(type, list) : nullptr;
    }
    TypedExpr* value = mRecursion.expression(expr);
    if (!value)
        return nullptr;
    if (type->isUnsizedArray() && value->type->isArray())
        type = mResolution.types.array(type->element, value->type->length);
    return mResolution.build.convert(value, type);
}

TypedExpr* Initializers::sampler(const Type* type, const Expr* expr) {
    if (expr->kind != Expr::Kind::INIT_LIST || !type->isArray() || !type->element->isSampler()) {
        TypedExpr* value = mRecursion.expression(expr);
        return value ? mResolution.build.convert(value, type) : nullptr;
    }
    const auto* list = static_cast<const InitListExpr*>(expr);
    if (static_cast<int>(list->elements.size()) != type->length) {
        mResolution.diagnostics.error(list->location,
                                      "the list for '" + nameOf(type) + "' has to name each sampler");
        return nullptr;
    }
    TypedExpr* whole = mResolution.build.make(Kind::CONSTRUCT, list->location, type);
    for (const Expr* element : list->elements) {
        TypedExpr* sampler = mRecursion.expression(element);
        sampler = sampler ? mResolution.build.convert(sampler, type->element) : nullptr;
        if (!sampler)
            return nullptr;
        whole->operands.push_back(sampler);
    }
    return whole;
}

TypedExpr* Initializers::array(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments) {
    InitListExpr list(at);
    list.elements = arguments;
    if (type->isUnsizedArray())
        type = mLists.sized(type, &list);
    return type ? mLists.value(type, &list) : nullptr;
}

TypedExpr* Initializers::structure(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments) {
    if (arguments.size() == 1) {
        TypedExpr* only = mRecursion.expression(arguments[0]);
        if (!only || only->type == type)
            return only;
    }
    InitListExpr list(at);
    list.elements = arguments;
    return mLists.value(type, &list);
}

} // namespace cg
