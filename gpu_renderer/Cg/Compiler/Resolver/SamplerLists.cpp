#include <Cg/Compiler/Resolver/SamplerLists.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/Resolver/SamplerPaths.h>

#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

TypedExpr* SamplerLists::element(SourceLocation at, TypedExpr* list, TypedExpr* index) {
    const auto position = constantValue(index);
    TypedExpr* preparation = nullptr;
    TypedExpr* known = position ? index : mResolution.once(index, preparation);
    TypedExpr* result = nullptr;
    for (int i = list->type->length - 1; i >= 0; --i) {
        if (position && (*position)[0] != i)
            continue;
        TypedExpr* sampler = list->operands[static_cast<std::size_t>(i)];
        if (isUnset(sampler)) {
            mResolution.diagnostics.error(at, "element " + std::to_string(i) + " has been given no sampler");
            return nullptr;
        }
        if (!result) {
            result = sampler;
            continue;
        }
        TypedExpr* condition = mResolution.isNumber(at, known, i);
        if (i == 0)
            condition = mResolution.inOrder(at, preparation, condition);
        result = mResolution.build.conditional(at, condition, sampler, result);
        if (!result)
            return nullptr;
    }
    return result;
}

TypedExpr* SamplerLists::choose(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                TypedExpr* whenFalse) {
    const Type* type = whenTrue->type;
    if (!type->isArray() || !type->element->isSampler() || whenFalse->type != type)
        return mResolution.build.conditional(at, condition, whenTrue, whenFalse);
    if (type->length > static_cast<int>(MAX_SAMPLER_CHOICES) || !isSimple(condition)) {
        mResolution.diagnostics.error(at, "a choice between these arrays of samplers");
        return nullptr;
    }
    TypedExpr* list = mResolution.build.make(Kind::CONSTRUCT, at, type);
    for (int i = 0; i < type->length; ++i) {
        TypedExpr* chosen = chooseOne(at, condition, part(at, whenTrue, i), part(at, whenFalse, i));
        if (!chosen)
            return nullptr;
        list->operands.push_back(chosen);
    }
    return list;
}

/// One that nothing has been assigned to leaves no choice.
TypedExpr* SamplerLists::chooseOne(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                   TypedExpr* whenFalse) {
    if (isUnset(whenFalse) || isSameSampler(whenTrue, whenFalse))
        return whenTrue;
    return isUnset(whenTrue) ? whenFalse : mResolution.build.conditional(at, condition, whenTrue, whenFalse);
}

TypedExpr* SamplerLists::withElement(SourceLocation at, const Type* type, TypedExpr* array, int position,
                                     TypedExpr* sampler) {
    TypedExpr* list = mResolution.build.make(Kind::CONSTRUCT, at, type);
    for (int i = 0; i < type->length; ++i)
        list->operands.push_back(i == position ? sampler : part(at, array, i));
    return list;
}

TypedExpr* SamplerLists::part(SourceLocation at, TypedExpr* array, int position) {
    return array->kind == Kind::CONSTRUCT ? array->operands[static_cast<std::size_t>(position)]
                                          : mResolution.build.element(at, array, position);
}

} // namespace cg
