#include <Cg/Compiler/Resolver/InitializerLists.h>

#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/ListCursor.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

TypedExpr* InitializerLists::sampler(const TypedExpr* list, std::size_t field) const {
    const auto samplers = mSamplers.find(list);
    if (samplers == mSamplers.end())
        return nullptr;
    const auto sampler = samplers->second.find(field);
    return sampler == samplers->second.end() ? nullptr : sampler->second;
}

/// The length that a list gives an array: its elements, or its scalars where it is flat.
const Type* InitializerLists::sized(const Type* type, const InitListExpr* list) {
    const Type* element = type->element;
    int length =
        static_cast<int>(std::min<std::size_t>(list->elements.size(), TypeResolver::MAX_ARRAY_LENGTH));
    if (!element->isScalar() && !list->elements.empty() && list->elements[0]->kind != Expr::Kind::INIT_LIST) {
        const TypedExpr* first = mRecursion.expression(list->elements[0]);
        if (!first)
            return nullptr;
        const int each = countLeaves(element, TypeResolver::MAX_LEAVES);
        if (first->type->isScalar() && each > 1)
            length = (length + each - 1) / each;
    }
    if (length == 0) {
        mResolution.diagnostics.error(list->location, "an empty list gives an array no size");
        return nullptr;
    }
    return mResolution.types.array(element, length);
}

TypedExpr* InitializerLists::value(const Type* type, const InitListExpr* list) {
    if (list->elements.empty())
        return mResolution.build.zero(list->location, type);
    ListCursor cursor(list, mRecursion);
    TypedExpr* value = fillPieces(list->location, type, cursor);
    if (value && !cursor.isAtEnd())
        mResolution.diagnostics.warning(cursor.element()->location,
                                        "more values than '" + nameOf(type) + "' takes");
    return value;
}

/// Takes one value of the type from the list: an inner list, a value that fits, or piece by piece.
TypedExpr* InitializerLists::fill(const Type* type, ListCursor& cursor) {
    if (cursor.isAtEnd())
        return mResolution.build.zero(cursor.element()->location, type);
    const Expr* next = cursor.element();
    if (cursor.isAtList()) {
        cursor.advance();
        return value(type, static_cast<const InitListExpr*>(next));
    }
    if (type->isNumeric())
        return fillNumber(type, cursor);
    TypedExpr* value = cursor.value();
    if (!value)
        return nullptr;
    const bool fits = cursor.taken() == 0 && conversionCost(value, type) != IMPOSSIBLE_CONVERSION;
    if (!fits && (type->isArray() || type->isStruct()))
        return fillPieces(next->location, type, cursor);
    cursor.advance();
    return mResolution.build.convert(value, type);
}

/// Types of the elements, members or rows that a list gives one after another, null for a sampler; none where
/// the type takes its value as a whole.
std::vector<const Type*> InitializerLists::piecesOf(const Type* type, const ListCursor& cursor) const {
    std::vector<const Type*> pieces;
    if (type->isArray())
        pieces.assign(static_cast<std::size_t>(std::max(type->length, 0)), type->element);
    else if (type->isStruct())
        for (const Field& field : type->structure->fields)
            pieces.push_back(isOpaque(field.type) ? nullptr : field.type);
    else if (type->isFullMatrix() && cursor.isAtList())
        pieces.assign(static_cast<std::size_t>(type->rows),
                      mResolution.types.vector(type->scalar, type->columns));
    return pieces;
}

/// Elements, members or components, one after another.
TypedExpr* InitializerLists::fillPieces(SourceLocation at, const Type* type, ListCursor& cursor) {
    const std::vector<const Type*> pieces = piecesOf(type, cursor);
    if (pieces.empty() && !type->isArray() && !type->isStruct())
        return fill(type, cursor);
    TypedExpr* whole = mResolution.build.make(Kind::CONSTRUCT, at, type);
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        if (!pieces[i]) {
            if (!fillSampler(whole, i, cursor))
                return nullptr;
            continue;
        }
        TypedExpr* value = fill(pieces[i], cursor);
        if (!value)
            return nullptr;
        whole->operands.push_back(value);
    }
    return whole;
}

/// A sampler has no place in the value, and may be left out.
/// @return false after an error
bool InitializerLists::fillSampler(TypedExpr* whole, std::size_t field, ListCursor& cursor) {
    if (cursor.isAtList() || cursor.isAtEnd())
        return true;
    TypedExpr* sampler = cursor.value();
    if (!sampler)
        return false;
    const Type* wanted = whole->type->structure->fields[field].type;
    if (!sampler->type->isSampler() || !wanted->isSampler())
        return true;
    TypedExpr* converted = mResolution.build.convert(sampler, wanted);
    mSamplers[whole][field] = converted;
    if (converted)
        cursor.advance();
    return converted != nullptr;
}

/// Takes a number: one value that fits as a whole, or else components.
TypedExpr* InitializerLists::fillNumber(const Type* type, ListCursor& cursor) {
    TypedExpr* first = cursor.value();
    if (!first)
        return nullptr;
    const SourceLocation at = first->location;
    if (!first->type->isNumeric()) {
        mResolution.diagnostics.error(at, "cannot convert from '" + nameOf(first->type) + "' to '" +
                                              nameOf(type) + "'");
        return nullptr;
    }
    const bool isWhole =
        first->type->components() == type->components() || (cursor.isAtLast() && !type->isScalar());
    if (cursor.taken() == 0 && isWhole && conversionCost(first, type) != IMPOSSIBLE_CONVERSION) {
        cursor.advance();
        return mResolution.build.convert(first, type);
    }
    return gatherNumber(at, type, cursor);
}

/// Gathers the components of a number, from as many values as it takes; a value may serve several numbers.
TypedExpr* InitializerLists::gatherNumber(SourceLocation at, const Type* type, ListCursor& cursor) {
    std::vector<TypedExpr*> parts;
    for (int wanted = type->components(); wanted > 0;) {
        if (cursor.isAtEnd() || cursor.isAtList()) {
            parts.push_back(mResolution.build.zero(at, mResolution.types.scalar(type->scalar)));
            --wanted;
            continue;
        }
        const TypedExpr* value = cursor.value();
        if (!value)
            return nullptr;
        if (!value->type->isNumeric()) {
            mResolution.diagnostics.error(value->location, "a list for '" + nameOf(type) + "' holds no '" +
                                                               nameOf(value->type) + "'");
            return nullptr;
        }
        wanted -= takeComponents(at, wanted, cursor, parts);
    }
    if (parts.size() == 1)
        return mResolution.build.convert(parts[0], type);
    return mResolution.build.construct(at, type, parts);
}

/// Takes components of the value that the cursor stands on, and goes on where it has no more.
/// @return how many
int InitializerLists::takeComponents(SourceLocation at, int wanted, ListCursor& cursor,
                                     std::vector<TypedExpr*>& parts) {
    TypedExpr* value = cursor.value();
    const int first = cursor.taken();
    const int taken = std::min(wanted, value->type->components() - first);
    if (value->type->isScalar() || taken == value->type->components()) {
        parts.push_back(value);
    } else {
        for (int i = first; i < first + taken; ++i) {
            const int columns = value->type->columns;
            TypedExpr* row =
                value->type->isMatrix() ? mResolution.build.element(at, value, i / columns) : value;
            parts.push_back(mResolution.build.swizzle(at, row, {i % columns}));
        }
    }
    cursor.take(taken);
    return taken;
}

} // namespace cg
