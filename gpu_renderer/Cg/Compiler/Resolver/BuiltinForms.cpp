#include <Cg/Compiler/Resolver/BuiltinForms.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/PassedArguments.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <algorithm>

namespace cg {

namespace {

constexpr Name OFFSET = "Offset";

/// Reads `.xyw` and moves on behind it.
std::vector<int> takeComponents(const std::string& form, std::size_t& at) {
    constexpr Name letters = "xyzw";
    std::vector<int> components;
    if (at >= form.size() || form[at] != '.')
        return components;
    for (++at; at < form.size() && letters.find(form[at]) != Name::npos; ++at)
        components.push_back(static_cast<int>(letters.find(form[at])));
    return components;
}

/// The look-up with its offset, the last operand, added to the coordinates:
/// `textureGradOffset($0, $1.xy, $2, $3, $4)` becomes `textureGrad($0, ($1.xy) + ..., $2, $3)`.
std::string withMovedCoordinates(const BuiltinFunction& function, int offsetSize) {
    std::string form(function.form);
    const std::string last = "$" + std::to_string(function.parameters.size() - 1);
    const std::string type = offsetSize == 1 ? "float" : "vec" + std::to_string(offsetSize);
    const bool isFetch = form.find("texelFetch") != std::string::npos;
    const bool isRect = function.parameters[0].sampler == Sampler::RECT;
    const std::string texels = isRect ? "" : " / " + type + "(textureSize($0, 0))";
    const std::string shift = isFetch ? ") + (" + last + ")" : ") + " + type + "(" + last + ")" + texels;
    const std::size_t start = form.find("$1");
    const std::size_t end = form.find_first_of(",)", start);
    form.erase(form.find(", " + last, end), last.size() + 2);
    form.insert(end, shift);
    form.insert(start, "(");
    return form.erase(form.find(OFFSET), OFFSET.size());
}

} // namespace

/// GLSL takes constants only as texel offsets: a known one is written as a number, another one is added to
/// the coordinates.
/// @param arguments  the offset is the last one
/// @return the look-up's form
std::string BuiltinForms::withKnownOffset(const BuiltinFunction& function,
                                          std::vector<TypedExpr*>& arguments) {
    std::string form(function.form);
    if (form.find(OFFSET) == std::string::npos)
        return form;
    TypedExpr*& offset = arguments.back();
    const SourceLocation at = offset->location;
    if (const auto values = constantValue(offset)) {
        std::vector<TypedExpr*> numbers;
        for (const double value : *values)
            numbers.push_back(mResolution.build.literal(at, mResolution.types.scalar(Scalar::INT), value));
        offset = mResolution.build.construct(at, offset->type, numbers);
        return form;
    }
    const bool isDepth = isDepthSampler(function.parameters[0].sampler);
    if (isDepth || form.find("Proj") != std::string::npos) {
        mResolution.diagnostics.error(at, "the texel offset of this look-up must be a constant");
        return form;
    }
    return withMovedCoordinates(function, offset->type->columns);
}

BuiltinForm BuiltinForms::expand(const BuiltinFunction& function, std::vector<TypedExpr*>& arguments,
                                 PassedArguments& passed) {
    const std::string form = withKnownOffset(function, arguments);
    BuiltinForm result;
    for (std::size_t at = 0; at < form.size();) {
        if (form[at] != '$') {
            result.text += form[at++];
            continue;
        }
        TypedExpr*& argument = arguments[static_cast<std::size_t>(form[at + 1] - '0')];
        at += 2;
        const std::vector<int> components = takeComponents(form, at);
        TypedExpr* operand = components.empty() ? argument : partOf(argument, components, passed);
        const auto known = std::find(result.operands.begin(), result.operands.end(), operand);
        result.text += "$" + std::to_string(known - result.operands.begin());
        if (known == result.operands.end())
            result.operands.push_back(operand);
    }
    return result;
}

TypedExpr* BuiltinForms::partOf(TypedExpr*& argument, const std::vector<int>& components,
                                PassedArguments& passed) {
    if (TypedExpr* piece = mResolution.build.pick(argument, components))
        return piece;
    TypedExpr* preparation = nullptr;
    const SourceLocation at = argument->location;
    argument = mResolution.once(argument, preparation);
    passed.prepare(preparation);
    return mResolution.build.swizzle(at, argument, components);
}

} // namespace cg
