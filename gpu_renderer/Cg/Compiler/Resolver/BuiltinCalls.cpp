#include <Cg/Compiler/Resolver/BuiltinCalls.h>

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/ChosenCalls.h>
#include <Cg/Compiler/Resolver/PassedArguments.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerKinds.h>

#include <algorithm>
#include <cstdint>

namespace cg {

namespace {

/// A product of matrices and vectors, which no form says.
bool isProduct(Name name, std::size_t argumentCount) {
    return name == "mul" && argumentCount == 2;
}

/// It compares neighbouring pixels, or adds to the level of detail that they give.
bool isForFragments(const BuiltinFunction& function) {
    const bool isDerivative = function.form.rfind("dFd", 0) == 0 || function.form.rfind("fwidth", 0) == 0;
    constexpr Name BIAS = "bias";
    const bool isBiased = function.name.size() > BIAS.size() &&
                          function.name.substr(function.name.size() - BIAS.size()) == BIAS;
    return isDerivative || isBiased;
}

/// @return a bit for each operand that is an argument which the function writes to
std::uint32_t outOperands(const BuiltinFunction& function, const std::vector<TypedExpr*>& arguments,
                          const std::vector<TypedExpr*>& operands) {
    std::uint32_t bits = 0;
    for (std::size_t i = 0; i < arguments.size(); ++i)
        for (std::size_t j = 0; function.parameters[i].isOut && j < operands.size(); ++j)
            if (operands[j] == arguments[i])
                bits |= 1U << j;
    return bits;
}

/// The type that the name of a typed look-up asks for: `h3tex2D`.
const Type* resultType(const BuiltinLookup& lookup, const TypeTable& types) {
    const Scalar scalar = lookup.resultKind == 'h'   ? Scalar::HALF
                          : lookup.resultKind == 'x' ? Scalar::FIXED
                                                     : Scalar::FLOAT;
    return types.vector(scalar, lookup.resultSize);
}

} // namespace

BuiltinCalls::BuiltinCalls(Resolution& resolution, SamplerKinds& kinds, Places& places, ChosenCalls& chosen)
    : mResolution(resolution), mKinds(kinds), mPlaces(places), mChosen(chosen),
      mChoice(resolution.types, kinds), mForms(resolution) {}

bool BuiltinCalls::has(Name name, std::size_t argumentCount) const {
    return isProduct(name, argumentCount) || findBuiltin(name).functions;
}

TypedExpr* BuiltinCalls::call(SourceLocation at, Name name, const std::vector<TypedExpr*>& arguments,
                              bool isAlone) {
    if (isProduct(name, arguments.size()))
        return mResolution.build.product(at, arguments[0], arguments[1]);
    const BuiltinLookup lookup = findBuiltin(name);
    if (!lookup.functions || (lookup.functions->front().isGlslName && !isAlone))
        return nullptr;
    const ChosenBuiltin builtin = mChoice.choose(*lookup.functions, arguments, isAlone);
    if (!builtin.function) {
        if (isAlone)
            mChoice.refuse(at, name, *lookup.functions, arguments, mResolution.diagnostics);
        return nullptr;
    }
    if (mResolution.stage == Stage::VERTEX && isForFragments(*builtin.function)) {
        mResolution.diagnostics.error(at, inQuotes(name) + " is for fragment programs");
        return nullptr;
    }
    TypedExpr* result = call(at, builtin, arguments);
    return result && lookup.resultSize != 0
               ? mResolution.build.cast(at, result, resultType(lookup, mResolution.types))
               : result;
}

/// @return null after an error
TypedExpr* BuiltinCalls::call(SourceLocation at, const ChosenBuiltin& builtin,
                              const std::vector<TypedExpr*>& arguments) {
    PassedArguments passed(mResolution, mPlaces);
    std::vector<TypedExpr*> converted = arguments;
    if (!pass(builtin, converted, passed))
        return nullptr;
    const BuiltinForm form = mForms.expand(*builtin.function, converted, passed);
    const bool isArgument = builtin.function->form == "$0";
    TypedExpr* result = isArgument ? form.operands[0] : make(at, builtin, form, converted);
    result = mChosen.withKnownSamplers(result);
    return result ? passed.around(result) : nullptr;
}

/// Converts the arguments to what the function takes.
/// @return false after an error
bool BuiltinCalls::pass(const ChosenBuiltin& builtin, std::vector<TypedExpr*>& arguments,
                        PassedArguments& passed) {
    bool isPassed = true;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const BuiltinOperand& operand = builtin.function->parameters[i];
        const Type* type = builtin.typeOf(operand, mResolution.types);
        if (operand.kind == BuiltinOperand::Kind::SAMPLER)
            mKinds.decide(arguments[i], type, mResolution.types);
        else
            arguments[i] = passed.pass(arguments[i], type, operand.isOut ? Direction::OUT : Direction::IN);
        isPassed = isPassed && arguments[i];
    }
    return isPassed;
}

TypedExpr* BuiltinCalls::make(SourceLocation at, const ChosenBuiltin& builtin, const BuiltinForm& form,
                              const std::vector<TypedExpr*>& arguments) {
    TypedBuilder& build = mResolution.build;
    const BuiltinFunction& function = *builtin.function;
    const Type* type = builtin.typeOf(function.result, mResolution.types);
    const bool isByRows = builtin.rows > 0;
    TypedExpr* result = nullptr;
    if (isByRows && function.result.kind == BuiltinOperand::Kind::BOOLEAN) {
        result = build.asksRows(at, type, form.text, form.operands);
    } else {
        const Name text = form.text == function.form ? function.form : mResolution.arena.keep(form.text);
        result = build.builtin(at, type, text, form.operands);
    }
    result->helper = function.helper;
    result->isByRows = isByRows;
    result->outOperands = outOperands(function, arguments, form.operands);
    result->isUntyped = std::all_of(arguments.begin(), arguments.end(),
                                    [](const TypedExpr* argument) { return argument->isUntyped; });
    return result;
}

} // namespace cg
