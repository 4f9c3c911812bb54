#include <Cg/Compiler/Resolver/ChosenCalls.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerPaths.h>

#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// A call is written out for each combination of the samplers that its arguments may be.
constexpr std::size_t MAX_COMBINATIONS = 256;
constexpr std::size_t MAX_WRITTEN = 8192; ///< in a whole program

/// Samplers that one operand may be.
std::size_t countWays(TypedExpr* operand) {
    std::size_t ways = 0;
    for (const TypedExpr* sampler : samplersIn(operand))
        ways += isAnyElement(sampler) ? static_cast<std::size_t>(sampler->operands[0]->type->length) : 1;
    return ways;
}

bool isOutOperand(const TypedExpr* call, std::size_t position) {
    return call->kind == Kind::CALL ? call->function->parameters[position]->direction != Direction::IN
                                    : (call->outOperands >> position & 1U) != 0;
}

} // namespace

TypedExpr* ChosenCalls::withKnownSamplers(TypedExpr* call) {
    return count(call) ? expand(call) : nullptr;
}

/// @return false after an error
bool ChosenCalls::count(const TypedExpr* call) {
    Diagnostics& diagnostics = mResolution.diagnostics;
    std::size_t combinations = 1;
    for (TypedExpr* operand : call->operands) {
        if (!isOpaque(operand->type))
            continue;
        if (operand->kind == Kind::CONSTRUCT) {
            diagnostics.error(call->location,
                              "an array of samplers whose elements were assigned cannot be passed on");
            return false;
        }
        combinations *= countWays(operand);
        if (combinations > MAX_COMBINATIONS) {
            diagnostics.error(call->location, "more than " + std::to_string(MAX_COMBINATIONS) +
                                                  " combinations of samplers in one call");
            return false;
        }
    }
    mWritten += combinations > 1 ? combinations : 0;
    if (mWritten <= MAX_WRITTEN)
        return true;
    diagnostics.error(call->location, "too many calls with samplers that are chosen while it runs");
    return false;
}

TypedExpr* ChosenCalls::expand(TypedExpr* call) {
    for (std::size_t i = 0; i < call->operands.size(); ++i) {
        TypedExpr* operand = call->operands[i];
        if (!operand->type->isSampler())
            continue;
        if (operand->kind == Kind::CONDITIONAL)
            return chooseByCondition(call, i);
        if (operand->kind != Kind::ELEMENT)
            continue;
        TypedExpr* index = operand->operands[1];
        const auto value = constantValue(index);
        if (!value)
            return chooseByIndex(call, i);
        operand->operands[1] = mResolution.build.literal(index->location, index->type, (*value)[0]);
    }
    return call;
}

/// Makes sure that the operands can be written several times.
/// @param position  of the sampler, which is left as it is
/// @return what has to be done before, or null
TypedExpr* ChosenCalls::withSimpleOperands(TypedExpr* call, std::size_t position) {
    TypedExpr* preparations = nullptr;
    for (std::size_t i = 0; i < call->operands.size(); ++i) {
        TypedExpr*& operand = call->operands[i];
        if (i == position || isOutOperand(call, i) || isOpaque(operand->type) || constantValue(operand))
            continue;
        TypedExpr* preparation = nullptr;
        operand = mResolution.once(operand, preparation);
        preparations = mResolution.inOrder(call->location, preparations, preparation);
    }
    return preparations;
}

/// The call with one of its samplers at the position of all of them.
TypedExpr* ChosenCalls::expandWith(const TypedExpr* call, std::size_t position, TypedExpr* sampler) {
    TypedExpr* copy = mResolution.arena.make<TypedExpr>(*call);
    copy->operands[position] = sampler;
    return expand(copy);
}

/// `look(c ? a : b)` as `c ? look(a) : look(b)`
TypedExpr* ChosenCalls::chooseByCondition(TypedExpr* call, std::size_t position) {
    TypedExpr* preparation = withSimpleOperands(call, position);
    const TypedExpr* choice = call->operands[position];
    TypedExpr* whenTrue = expandWith(call, position, choice->operands[1]);
    TypedExpr* whenFalse = whenTrue ? expandWith(call, position, choice->operands[2]) : nullptr;
    if (!whenFalse)
        return nullptr;
    TypedExpr* result = mResolution.build.make(Kind::CONDITIONAL, call->location, call->type,
                                               {choice->operands[0], whenTrue, whenFalse});
    return mResolution.inOrder(call->location, preparation, result);
}

/// `look(a[i])` as `i == 0 ? look(a[0]) : look(a[1])`
TypedExpr* ChosenCalls::chooseByIndex(TypedExpr* call, std::size_t position) {
    TypedBuilder& build = mResolution.build;
    const TypedExpr* element = call->operands[position];
    TypedExpr* index = element->operands[1];
    const int length = element->operands[0]->type->length;
    if (length > static_cast<int>(MAX_SAMPLER_CHOICES)) {
        mResolution.diagnostics.error(call->location, "an array of samplers wants a constant index here");
        return nullptr;
    }
    TypedExpr* preparation = withSimpleOperands(call, position);
    TypedExpr* indexPreparation = nullptr;
    TypedExpr* known = mResolution.once(index, indexPreparation);
    preparation = mResolution.inOrder(call->location, preparation, indexPreparation);
    TypedExpr* result = nullptr;
    for (int i = length - 1; i >= 0; --i) {
        TypedExpr* one =
            expandWith(call, position, build.element(element->location, element->operands[0], i));
        if (!one)
            return nullptr;
        if (!result) {
            result = one;
            continue;
        }
        TypedExpr* isIt = mResolution.isNumber(index->location, known, i);
        result = build.make(Kind::CONDITIONAL, call->location, call->type, {isIt, one, result});
    }
    return mResolution.inOrder(call->location, preparation, result);
}

} // namespace cg
