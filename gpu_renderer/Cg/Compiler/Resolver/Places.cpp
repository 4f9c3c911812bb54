#include <Cg/Compiler/Resolver/Places.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

bool hasDuplicates(const TypedExpr* swizzle) {
    for (int i = 0; i < swizzle->type->columns; ++i)
        for (int j = 0; j < i; ++j)
            if (swizzle->components[static_cast<std::size_t>(i)] ==
                swizzle->components[static_cast<std::size_t>(j)])
                return true;
    return false;
}

/// It is all of a value in memory, or a part: no conversion changes it on the way.
bool isPlace(const TypedExpr* target) {
    if (!rootVariable(target))
        return false;
    for (const TypedExpr* part = target; !part->operands.empty(); part = part->operands[0]) {
        const Type* from = part->operands[0]->type;
        const bool isSame =
            part->type->components() == from->components() && part->type->scalar == from->scalar;
        if (part->kind == Kind::CONVERT && !isSame)
            return false;
    }
    return true;
}

} // namespace

bool Places::checkAssignable(SourceLocation at, const TypedExpr* target) {
    Diagnostics& diagnostics = mResolution.diagnostics;
    if (!isPlace(target)) {
        diagnostics.error(at, "this cannot be assigned to");
        return false;
    }
    Variable* root = rootVariable(target);
    if (root->isConst) {
        diagnostics.error(at, inQuotes(root->name) + " is const");
        return false;
    }
    for (const TypedExpr* part = target; !part->operands.empty(); part = part->operands[0])
        if (part->kind == Kind::SWIZZLE && hasDuplicates(part)) {
            diagnostics.error(at, "a component is named twice");
            return false;
        }
    root->isWritten = true;
    return true;
}

TypedExpr* Places::assignRow(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    TypedBuilder& build = mResolution.build;
    TypedExpr* result = nullptr;
    value = mResolution.once(value, result);
    TypedExpr* preparation = nullptr;
    TypedExpr* index = mResolution.once(target->operands[1], preparation);
    result = mResolution.inOrder(at, result, preparation);
    target = build.make(Kind::ELEMENT, at, target->type, {target->operands[0], index});
    for (int i = 0; i < target->type->length; ++i) {
        TypedExpr* element = build.element(at, target, i);
        TypedExpr* source = build.element(at, value, i);
        TypedExpr* assigned =
            element->type->isArray() ? assignRow(at, element, source) : build.assign(at, element, source);
        result = mResolution.inOrder(at, result, assigned);
    }
    return result;
}

std::vector<TypedExpr*> Places::assignComponents(SourceLocation at, const std::vector<TypedExpr*>& targets,
                                                 Variable* vector) {
    TypedBuilder& build = mResolution.build;
    std::vector<TypedExpr*> assignments;
    for (TypedExpr* target : targets) {
        const int component = static_cast<int>(assignments.size());
        assignments.push_back(
            build.assign(at, target, build.swizzle(at, build.variable(at, vector), {component})));
    }
    return assignments;
}

} // namespace cg
