#ifndef CG_COMPILER_CONVERSION_BUILDER_H
#define CG_COMPILER_CONVERSION_BUILDER_H

#include <Cg/Compiler/NodeBuilder.h>

#include <vector>

namespace cg {

class Diagnostics;

/// Makes expressions of another type of what there is: Cg's silent conversions, casts and constructors.
///
/// Operations that can fail report it and return null.
class ConversionBuilder : public NodeBuilder {
public:
    /// Silent conversion. Warns where components get lost; an error where there is none.
    TypedExpr* convert(TypedExpr* expression, const Type* to);

    /// The expression as one bool. A comparison of matrices: equal ones are equal in all components, unequal
    /// ones in any.
    TypedExpr* condition(TypedExpr* expression);

    /// The conversion of a cast: all silent ones without a word, and between shapes of equal or smaller size.
    TypedExpr* cast(SourceLocation at, TypedExpr* expression, const Type* to);

    /// `type(arguments)`
    TypedExpr* construct(SourceLocation at, const Type* type, const std::vector<TypedExpr*>& arguments);

protected:
    ConversionBuilder(Arena& arena, TypeTable& types, Diagnostics& diagnostics)
        : NodeBuilder(arena, types), mDiagnostics(diagnostics) {}

    /// Numbers only: the same components, fewer of them, or one for all.
    TypedExpr* reshape(TypedExpr* expression, const Type* to);

    /// The same shape of another scalar kind.
    TypedExpr* withScalar(TypedExpr* expression, Scalar scalar);

    /// A matrix of one row or column as the vector that it is in GLSL; everything else as it is.
    TypedExpr* vectorOf(TypedExpr* expression);

    Diagnostics& mDiagnostics;

private:
    TypedExpr* smear(TypedExpr* scalar, const Type* to);
    TypedExpr* reshapeRows(TypedExpr* matrix, const Type* to);
    TypedExpr* castStruct(SourceLocation at, TypedExpr* structure, const Type* to);
};

} // namespace cg

#endif
