#include <Cg/Compiler/Resolver/Initializers.h>

#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

/// Where the values of a list are taken from.
class Initializers::Cursor {
public:
    explicit Cursor(const std::vector<Expr*>& elements) : mElements(elements) {}

    bool isAtEnd() const { return mNext >= mElements.size(); }
    bool isAtLast() const { return mNext + 1 == mElements.size(); }
    const Expr* element() const { return mElements[mNext]; }
    SourceLocation end() const { return mElements.back()->location; }

    /// An inner list comes next, of which nothing has been taken.
    bool isAtList() const { return !isAtEnd() && !value && element()->kind == Expr::Kind::INIT_LIST; }

    void advance() {
        ++mNext;
        value = nullptr;
        component = 0;
    }

    void stop() { mNext = mElements.size(); }

    TypedExpr* value = nullptr; ///< the resolved next element
    int component = 0;          ///< of `value`, where only a part of it is used

private:
    const std::vector<Expr*>& mElements;
    std::size_t mNext = 0;
};

TypedExpr* Initializers::value(const Type*& type, const Expr* expr) {
    if (expr->kind == Expr::Kind::INIT_LIST) {
        const auto* list = static_cast<const InitListExpr*>(expr);
        if (type->isUnsizedArray())
            type = sizedByList(type, list);
        return type ? fromList(type, list) : nullptr;
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
        type = sizedByList(type, &list);
    return type ? fromList(type, &list) : nullptr;
}

TypedExpr* Initializers::structure(SourceLocation at, const Type* type, const std::vector<Expr*>& arguments) {
    if (arguments.size() == 1) {
        TypedExpr* only = mRecursion.expression(arguments[0]);
        if (!only || only->type == type)
            return only;
    }
    InitListExpr list(at);
    list.elements = arguments;
    return fromList(type, &list);
}

TypedExpr* Initializers::listedSampler(const TypedExpr* list, std::size_t field) const {
    const auto samplers = mListedSamplers.find(list);
    if (samplers == mListedSamplers.end())
        return nullptr;
    const auto sampler = samplers->second.find(field);
    return sampler == samplers->second.end() ? nullptr : sampler->second;
}

/// The length that a list gives an array: its elements, or its scalars where it is flat.
const Type* Initializers::sizedByList(const Type* type, const InitListExpr* list) {
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

TypedExpr* Initializers::fromList(const Type* type, const InitListExpr* list) {
    Cursor cursor(list->elements);
    if (list->elements.empty())
        return mResolution.build.zero(list->location, type);
    TypedExpr* value = fillPieces(list->location, type, cursor);
    if (value && !cursor.isAtEnd())
        mResolution.diagnostics.warning(cursor.element()->location,
                                        "more values than '" + nameOf(type) + "' takes");
    return value;
}

/// @return the value that the cursor stands on, unused; null after an error
TypedExpr* Initializers::nextValue(Cursor& cursor) {
    if (!cursor.value) {
        cursor.value = mRecursion.expression(cursor.element());
        if (!cursor.value)
            cursor.stop(); // said once is enough
    }
    return cursor.value;
}

/// Takes one value of the type from the list: an inner list, a value that fits, or piece by piece.
TypedExpr* Initializers::fill(const Type* type, Cursor& cursor) {
    if (cursor.isAtEnd())
        return mResolution.build.zero(cursor.end(), type);
    const Expr* next = cursor.element();
    if (cursor.isAtList()) {
        cursor.advance();
        return fromList(type, static_cast<const InitListExpr*>(next));
    }
    if (type->isNumeric())
        return fillNumber(type, cursor);
    TypedExpr* value = nextValue(cursor);
    if (!value)
        return nullptr;
    const bool fits = cursor.component == 0 && conversionCost(value, type) != IMPOSSIBLE_CONVERSION;
    if (!fits && (type->isArray() || type->isStruct()))
        return fillPieces(next->location, type, cursor);
    cursor.advance();
    return mResolution.build.convert(value, type);
}

/// Types of the elements, members or rows that a list gives one after another, null for a sampler; none where
/// the type takes its value as a whole.
std::vector<const Type*> Initializers::piecesOf(const Type* type, const Cursor& cursor) const {
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
TypedExpr* Initializers::fillPieces(SourceLocation at, const Type* type, Cursor& cursor) {
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
bool Initializers::fillSampler(TypedExpr* whole, std::size_t field, Cursor& cursor) {
    if (cursor.isAtList() || (!cursor.value && cursor.isAtEnd()))
        return true;
    TypedExpr* sampler = nextValue(cursor);
    if (!sampler)
        return false;
    const Type* wanted = whole->type->structure->fields[field].type;
    if (!sampler->type->isSampler() || !wanted->isSampler())
        return true;
    TypedExpr* converted = mResolution.build.convert(sampler, wanted);
    mListedSamplers[whole][field] = converted;
    if (converted)
        cursor.advance();
    return converted != nullptr;
}

/// Takes a number: one value that fits as a whole, or else components.
TypedExpr* Initializers::fillNumber(const Type* type, Cursor& cursor) {
    TypedExpr* first = nextValue(cursor);
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
    if (cursor.component == 0 && isWhole && conversionCost(first, type) != IMPOSSIBLE_CONVERSION) {
        cursor.advance();
        return mResolution.build.convert(first, type);
    }
    return gatherNumber(at, type, cursor);
}

/// Gathers the components of a number, from as many values as it takes; a value may serve several numbers.
TypedExpr* Initializers::gatherNumber(SourceLocation at, const Type* type, Cursor& cursor) {
    std::vector<TypedExpr*> parts;
    for (int wanted = type->components(); wanted > 0;) {
        if (cursor.isAtEnd() || cursor.isAtList()) {
            parts.push_back(mResolution.build.zero(at, mResolution.types.scalar(type->scalar)));
            --wanted;
            continue;
        }
        const TypedExpr* value = nextValue(cursor);
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
int Initializers::takeComponents(SourceLocation at, int wanted, Cursor& cursor,
                                 std::vector<TypedExpr*>& parts) {
    TypedExpr* value = cursor.value;
    const int available = value->type->components() - cursor.component;
    const int taken = std::min(wanted, available);
    if (value->type->isScalar() || taken == value->type->components()) {
        parts.push_back(value);
    } else {
        for (int i = cursor.component; i < cursor.component + taken; ++i) {
            const int columns = value->type->columns;
            TypedExpr* row =
                value->type->isMatrix() ? mResolution.build.element(at, value, i / columns) : value;
            parts.push_back(mResolution.build.swizzle(at, row, {i % columns}));
        }
    }
    cursor.component += taken;
    if (taken == available)
        cursor.advance();
    return taken;
}

} // namespace cg
