#include <Cg/Compiler/ConversionCost.h>

#include <cstdlib>

namespace cg {

namespace {

constexpr int SMEAR_COST = 20;
constexpr int RESHAPE_COST = 30;
constexpr int TRUNCATE_COST = 40;
constexpr int TO_SCALAR_COST = 45;

/// Cost of a conversion between scalar kinds: widening is cheaper than narrowing, staying among floating
/// kinds is cheaper than leaving them.
int scalarCost(Scalar from, Scalar to, bool isUntyped) {
    if (from == to)
        return 0;
    if (isFloating(from) && isFloating(to)) {
        const int distance = std::abs(static_cast<int>(to) - static_cast<int>(from));
        return isUntyped || to > from ? distance : distance + 5;
    }
    if (to == Scalar::BOOL)
        return 12;
    if (isFloating(to))
        return (from == Scalar::BOOL ? 7 : 3) + (static_cast<int>(Scalar::FLOAT) - static_cast<int>(to));
    if (isFloating(from))
        return to == Scalar::INT ? 9 : 10;
    return from == Scalar::BOOL ? 5 : 2;
}

/// Numbers: by kind and by shape.
int numericCost(const Type* from, const Type* to, bool isUntyped) {
    const int kindCost = scalarCost(from->scalar, to->scalar, isUntyped);
    if (from->isScalar())
        return kindCost + (to->isScalar() ? 0 : to->isVector() ? SMEAR_COST : SMEAR_COST + RESHAPE_COST);
    if (from->isMatrix() && to->isMatrix()) {
        if (to->rows > from->rows || to->columns > from->columns)
            return IMPOSSIBLE_CONVERSION;
        return kindCost + (to->rows == from->rows && to->columns == from->columns ? 0 : TRUNCATE_COST);
    }
    if (from->isFullMatrix() || to->isFullMatrix() || to->components() > from->components())
        return IMPOSSIBLE_CONVERSION;
    const int shapeCost = to->components() == from->components() ? 0
                          : to->isScalar()                       ? TO_SCALAR_COST
                                           : TRUNCATE_COST + from->components() - to->components();
    return kindCost + shapeCost + (from->kind == to->kind || to->isScalar() ? 0 : RESHAPE_COST);
}

/// Elements that GLSL holds alike: it has no conversion of whole arrays.
bool areSameInGlsl(const Type* a, const Type* b) {
    return a == b || a->isArray() || a->isSampler() ||
           (a->isNumeric() && b->isNumeric() && a->components() == b->components() && isFloating(a->scalar) &&
            isFloating(b->scalar));
}

int typeCost(const Type* from, const Type* to, bool isUntyped) {
    if (from == to)
        return 0;
    if (from->isSampler() && to->isSampler())
        return areSameTexture(from->sampler, to->sampler) ? 1 : IMPOSSIBLE_CONVERSION;
    if (from->isArray() && to->isArray()) {
        const bool isSameLength = to->length == Type::UNSIZED || to->length == from->length;
        return isSameLength && areSameInGlsl(from->element, to->element)
                   ? typeCost(from->element, to->element, false)
                   : IMPOSSIBLE_CONVERSION;
    }
    return from->isNumeric() && to->isNumeric() ? numericCost(from, to, isUntyped) : IMPOSSIBLE_CONVERSION;
}

} // namespace

int conversionCost(const TypedExpr* from, const Type* to) {
    return typeCost(from->type, to, from->isUntyped);
}

} // namespace cg
