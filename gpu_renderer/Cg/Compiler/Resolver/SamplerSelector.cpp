#include <Cg/Compiler/Resolver/SamplerSelector.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerPaths.h>

#include <algorithm>
#include <cstddef>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

void SamplerSelector::add(SourceLocation at, TypedExpr* sampler) {
    if (!isAnyElement(sampler)) {
        addOne(sampler);
        return;
    }
    TypedExpr* array = sampler->operands[0];
    for (int i = 0; i < array->type->length; ++i)
        addOne(mResolution->build.element(at, array, i));
}

void SamplerSelector::addOne(TypedExpr* sampler) {
    const auto isIt = [sampler](const TypedExpr* known) { return isSameSampler(known, sampler); };
    if (fits() && std::none_of(mSamplers.begin(), mSamplers.end(), isIt))
        mSamplers.push_back(sampler);
}

bool SamplerSelector::fits() const {
    return mSamplers.size() <= MAX_SAMPLER_CHOICES;
}

void SamplerSelector::makeNumber() {
    // Other functions may look up the sampler, too.
    mNumber = mResolution->programTemporary("choice", mResolution->types.scalar(Scalar::INT));
}

TypedExpr* SamplerSelector::select(SourceLocation at, TypedExpr* sampler) {
    TypedExpr* number = numberOf(at, sampler);
    return number ? assign(at, number) : nullptr;
}

TypedExpr* SamplerSelector::selectNothing(SourceLocation at) {
    return assign(at, mResolution->nothing(at));
}

TypedExpr* SamplerSelector::assign(SourceLocation at, TypedExpr* number) {
    return mResolution->build.assign(at, mResolution->build.variable(at, mNumber), number);
}

TypedExpr* SamplerSelector::choice(SourceLocation at, const Type* type) const {
    TypedBuilder& build = mResolution->build;
    TypedExpr* choice = mSamplers.back();
    for (std::size_t i = mSamplers.size() - 1; i-- > 0;) {
        TypedExpr* isIt = mResolution->isNumber(at, build.variable(at, mNumber), static_cast<int>(i));
        choice = build.make(Kind::CONDITIONAL, at, type, {isIt, mSamplers[i], choice});
    }
    return choice;
}

/// @return the number of a sampler, as an expression; null after an error
TypedExpr* SamplerSelector::numberOf(SourceLocation at, TypedExpr* sampler) {
    if (sampler->kind == Kind::CONDITIONAL) {
        TypedExpr* whenTrue = numberOf(at, sampler->operands[1]);
        TypedExpr* whenFalse = whenTrue ? numberOf(at, sampler->operands[2]) : nullptr;
        return whenFalse ? chosen(at, sampler->operands[0], whenTrue, whenFalse) : nullptr;
    }
    const auto found = std::find_if(mSamplers.begin(), mSamplers.end(), [sampler](const TypedExpr* known) {
        return isSameSampler(known, sampler);
    });
    if (found != mSamplers.end())
        return mResolution->number(at, static_cast<int>(found - mSamplers.begin()));
    if (isAnyElement(sampler))
        return numberOfElement(at, sampler);
    mResolution->diagnostics.error(at, "this sampler cannot be assigned in a loop or a switch");
    return nullptr;
}

TypedExpr* SamplerSelector::numberOfElement(SourceLocation at, TypedExpr* element) {
    TypedExpr* array = element->operands[0];
    TypedExpr* result = nullptr;
    for (int i = array->type->length - 1; i >= 0; --i) {
        TypedExpr* number = numberOf(at, mResolution->build.element(at, array, i));
        if (!number)
            return nullptr;
        if (!result) {
            result = number;
            continue;
        }
        result = chosen(at, mResolution->isNumber(at, element->operands[1], i), number, result);
    }
    return result;
}

TypedExpr* SamplerSelector::chosen(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                   TypedExpr* whenFalse) {
    return mResolution->build.make(Kind::CONDITIONAL, at, mResolution->types.scalar(Scalar::INT),
                                   {condition, whenTrue, whenFalse});
}

} // namespace cg
