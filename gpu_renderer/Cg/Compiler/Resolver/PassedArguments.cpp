#include <Cg/Compiler/Resolver/PassedArguments.h>

#include <Cg/Compiler/Resolver/Places.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <cstddef>
#include <numeric>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// The two types are one type in GLSL.
bool isOneTypeInGlsl(const Type* a, const Type* b) {
    if (a == b)
        return true;
    return a->isNumeric() && b->isNumeric() && a->kind == b->kind && a->rows == b->rows &&
           a->columns == b->columns && isFloating(a->scalar) && isFloating(b->scalar);
}

/// `m._m00_m11` as an out argument
bool isElements(const TypedExpr* argument) {
    return argument->kind == Kind::CONSTRUCT;
}

/// A row of an array of arrays, which is flat in GLSL.
bool isRow(const TypedExpr* argument, const Type* type) {
    return argument->kind == Kind::ELEMENT && type->isArray();
}

/// GLSL writes to the argument itself.
bool takesResult(const TypedExpr* argument, const Type* type) {
    return !isElements(argument) && !isRow(argument, type) && argument->kind != Kind::CONVERT &&
           (isOneTypeInGlsl(argument->type, type) || !type->isNumeric());
}

} // namespace

TypedExpr* PassedArguments::pass(TypedExpr* argument, const Type* type, Direction direction) {
    TypedBuilder& build = mResolution.build;
    if (direction == Direction::IN || isOpaque(type))
        return build.convert(argument, type);
    const SourceLocation at = argument->location;
    for (const TypedExpr* part :
         isElements(argument) ? argument->operands : std::vector<TypedExpr*>{argument})
        if (!mPlaces.checkAssignable(at, part))
            return nullptr;
    if (takesResult(argument, type))
        return argument;
    Variable* place = mResolution.temporary(type);
    if (direction == Direction::INOUT) {
        TypedExpr* value = build.convert(argument, type);
        if (!value)
            return nullptr;
        prepare(build.assign(at, build.variable(at, place), value));
    }
    return writeBack(argument, place) ? build.variable(at, place) : nullptr;
}

/// @return false after an error
bool PassedArguments::writeBack(TypedExpr* argument, Variable* place) {
    TypedBuilder& build = mResolution.build;
    const SourceLocation at = argument->location;
    const Type* type = place->type;
    if (isElements(argument)) {
        const std::vector<TypedExpr*> steps = mPlaces.assignComponents(at, argument->operands, place);
        mAfter.insert(mAfter.end(), steps.begin(), steps.end());
        return true;
    }
    const bool isWholeRow = isRow(argument, type);
    // Of a wider argument only the components that the parameter has are written.
    if (argument->type->isVector() && type->isScalarOrVector() && argument->type->columns > type->columns) {
        std::vector<int> components(static_cast<std::size_t>(type->columns));
        std::iota(components.begin(), components.end(), 0);
        argument = build.swizzle(at, argument, components);
    }
    TypedExpr* back = build.convert(build.variable(at, place), argument->type);
    if (back)
        mAfter.push_back(isWholeRow ? mPlaces.assignRow(at, argument, back)
                                    : build.assign(at, argument, back));
    return back != nullptr;
}

void PassedArguments::prepare(TypedExpr* step) {
    if (step)
        mBefore.push_back(step);
}

TypedExpr* PassedArguments::around(TypedExpr* call) {
    if (mBefore.empty() && mAfter.empty())
        return call;
    TypedBuilder& build = mResolution.build;
    const SourceLocation at = call->location;
    TypedExpr* result = nullptr;
    const auto then = [&](TypedExpr* next) { result = mResolution.inOrder(at, result, next); };
    for (TypedExpr* step : mBefore)
        then(step);
    const bool isKept = !call->type->isVoid() && !mAfter.empty();
    Variable* place = isKept ? mResolution.temporary(call->type) : nullptr;
    then(isKept ? build.assign(at, build.variable(at, place), call) : call);
    for (TypedExpr* step : mAfter)
        then(step);
    if (isKept)
        then(build.variable(at, place));
    return result;
}

} // namespace cg
