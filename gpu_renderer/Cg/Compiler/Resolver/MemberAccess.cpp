#include <Cg/Compiler/Resolver/MemberAccess.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerLists.h>
#include <Cg/Compiler/Resolver/SamplerPieces.h>
#include <Cg/Compiler/Resolver/Swizzles.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>
#include <string>
#include <vector>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

int elementCount(const Type* type) {
    if (type->isArray())
        return type->length;
    return type->isMatrix() ? type->rows : type->columns;
}

} // namespace

TypedExpr* MemberAccess::member(SourceLocation at, TypedExpr* object, Name name) {
    const Type* type = object->type;
    if (type->isStruct())
        return field(at, object, name);
    if (type->isArray() && name == "length")
        return mResolution.number(at, type->length);
    if (type->isMatrix())
        return elementsOf(at, object, name);
    if (type->isScalarOrVector())
        return swizzle(at, object, name);
    mResolution.diagnostics.error(at, "'" + nameOf(type) + "' has no member " + inQuotes(name));
    return nullptr;
}

TypedExpr* MemberAccess::field(SourceLocation at, TypedExpr* object, Name name) {
    const StructType* structure = object->type->structure;
    const int index = structure->find(name);
    if (index < 0) {
        std::vector<Name> known;
        for (const Field& field : structure->fields)
            known.push_back(field.name);
        mResolution.diagnostics.error(at, "'" + nameOf(object->type) + "' has no member " + inQuotes(name) +
                                              suggestion(name, known));
        return nullptr;
    }
    const Type* type = structure->fields[static_cast<std::size_t>(index)].type;
    return isOpaque(type) ? mPieces.member(at, object, name, type)
                          : mResolution.build.field(at, object, index);
}

TypedExpr* MemberAccess::swizzle(SourceLocation at, TypedExpr* object, Name name) {
    const std::vector<int> components = swizzleComponents(name);
    const bool fits = std::all_of(components.begin(), components.end(),
                                  [&](int component) { return component < object->type->columns; });
    if (components.empty() || !fits) {
        mResolution.diagnostics.error(at, inQuotes(name) + " is no part of '" + nameOf(object->type) + "'");
        return nullptr;
    }
    return mResolution.build.swizzle(at, object, components);
}

TypedExpr* MemberAccess::elementsOf(SourceLocation at, TypedExpr* matrix, Name name) {
    TypedBuilder& build = mResolution.build;
    const std::vector<MatrixElement> elements = matrixElements(name);
    std::vector<TypedExpr*> values;
    TypedExpr* preparation = nullptr;
    TypedExpr* source = elements.size() > 1 ? mResolution.once(matrix, preparation) : matrix;
    for (const MatrixElement& element : elements) {
        if (element.row >= matrix->type->rows || element.column >= matrix->type->columns)
            break;
        TypedExpr* row = build.element(at, source, element.row);
        values.push_back(row->type->isScalar() ? row : build.element(at, row, element.column));
    }
    if (elements.empty() || values.size() < elements.size()) {
        mResolution.diagnostics.error(at, inQuotes(name) + " is no part of '" + nameOf(matrix->type) + "'");
        return nullptr;
    }
    if (values.size() == 1)
        return values[0];
    const Type* type = mResolution.types.vector(matrix->type->scalar, static_cast<int>(values.size()));
    return mResolution.inOrder(at, preparation, build.make(Kind::CONSTRUCT, at, type, values));
}

TypedExpr* MemberAccess::element(SourceLocation at, TypedExpr* object, TypedExpr* index) {
    TypedBuilder& build = mResolution.build;
    const Type* type = object->type;
    if (!type->isArray() && !type->isNumeric()) {
        mResolution.diagnostics.error(at, "'" + nameOf(type) + "' has no elements");
        return nullptr;
    }
    const Type* integer = mResolution.types.scalar(Scalar::INT);
    const bool isCast = index->type->isScalar() && index->type->scalar != Scalar::UINT;
    index = isCast ? build.cast(index->location, index, integer) : build.convert(index, integer);
    if (!index)
        return nullptr;
    if (object->kind == Kind::VARIABLE && object->variable->isUnsized)
        return elementOfUnsized(at, object, index);
    const int length = elementCount(type);
    const auto position = constantValue(index);
    if (position && length != Type::UNSIZED && ((*position)[0] < 0 || (*position)[0] >= length)) {
        const std::string number = std::to_string(static_cast<long long>((*position)[0]));
        mResolution.diagnostics.error(index->location,
                                      "index " + number + " is outside of '" + nameOf(type) + "'");
        return nullptr;
    }
    if (position && type->isVector())
        return build.swizzle(at, object, {static_cast<int>((*position)[0])});
    if (object->kind == Kind::CONSTRUCT && isOpaque(type))
        return mLists.element(at, object, index);
    return build.element(at, object, index);
}

/// A uniform array without a size is as long as the use of its elements asks for.
TypedExpr* MemberAccess::elementOfUnsized(SourceLocation at, TypedExpr* array, TypedExpr* index) {
    Variable* variable = array->variable;
    const auto position = constantValue(index);
    if (!position || (*position)[0] < 0 || (*position)[0] >= TypeResolver::MAX_ARRAY_LENGTH) {
        mResolution.diagnostics.error(index->location, inQuotes(variable->name) +
                                                           " has no size: the index must be a constant");
        return nullptr;
    }
    const int length = std::max(variable->type->length, static_cast<int>((*position)[0]) + 1);
    const Type* type = mTypes.checkSize(at, mResolution.types.array(variable->type->element, length));
    if (!type)
        return nullptr;
    array->type = variable->type = type;
    return mResolution.build.element(at, array, index);
}

} // namespace cg
