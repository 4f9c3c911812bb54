#ifndef CG_COMPILER_TYPED_BUILDER_H
#define CG_COMPILER_TYPED_BUILDER_H

#include <Cg/Compiler/ConversionBuilder.h>

namespace cg {

/// Makes typed expressions: the nodes, the conversions and, here, the operators, with what Cg converts
/// silently on both sides.
///
/// Operations that can fail report it and return null. Operands are never null.
class TypedBuilder : public ConversionBuilder {
public:
    TypedBuilder(Arena& arena, TypeTable& types, Diagnostics& diagnostics)
        : ConversionBuilder(arena, types, diagnostics) {}

    /// All operators but those that change their operand.
    TypedExpr* unary(SourceLocation at, UnaryOp op, TypedExpr* operand);

    /// All operators but COMMA.
    TypedExpr* binary(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* conditional(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                           TypedExpr* whenFalse);

    /// mul(): rows times columns.
    TypedExpr* product(SourceLocation at, TypedExpr* left, TypedExpr* right);

private:
    Scalar commonScalar(const TypedExpr* left, const TypedExpr* right) const;
    bool matchShapes(SourceLocation at, TypedExpr*& left, TypedExpr*& right);
    bool matchOperands(SourceLocation at, BinaryOp op, TypedExpr*& left, TypedExpr*& right);
    const Type* matchVectors(Scalar scalar, TypedExpr*& left, TypedExpr*& right);
    TypedExpr* compare(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* compareMatrices(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* truth(TypedExpr* matrix);
    TypedExpr* logical(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* arithmetic(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* remainder(SourceLocation at, const Type* type, TypedExpr* left, TypedExpr* right);
    TypedExpr* chooseSampler(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                             TypedExpr* whenFalse);
    TypedExpr* chooseElements(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                              TypedExpr* whenFalse);
    TypedExpr* chooseComponents(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                                TypedExpr* whenFalse);
    TypedExpr* matrixProduct(SourceLocation at, TypedExpr* left, TypedExpr* right);
    void operandError(SourceLocation at, const char* op, const TypedExpr* left, const TypedExpr* right);
};

} // namespace cg

#endif
