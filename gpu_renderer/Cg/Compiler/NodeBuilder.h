#ifndef CG_COMPILER_NODE_BUILDER_H
#define CG_COMPILER_NODE_BUILDER_H

#include <Cg/Compiler/TypedTree.h>

#include <string>
#include <vector>

namespace cg {

/// Makes the nodes of the typed tree, of operands that have the right types already. Operands are never null.
class NodeBuilder {
public:
    TypedExpr* make(TypedExpr::Kind kind, SourceLocation at, const Type* type,
                    std::vector<TypedExpr*> operands = {});
    TypedExpr* literal(SourceLocation at, const Type* type, double number);
    TypedExpr* variable(SourceLocation at, Variable* variable);
    TypedExpr* builtin(SourceLocation at, const Type* type, Name form, std::vector<TypedExpr*> operands,
                       Name helper = {});

    /// A question with the answer 0 or 1 for each component of a matrix.
    /// @param form  gives bools for the rows `$0`, `$1`, ...
    TypedExpr* asksRows(SourceLocation at, const Type* type, const std::string& form,
                        std::vector<TypedExpr*> operands);
    TypedExpr* field(SourceLocation at, TypedExpr* object, int index);
    TypedExpr* element(SourceLocation at, TypedExpr* object, TypedExpr* index);
    TypedExpr* element(SourceLocation at, TypedExpr* object, int index);
    TypedExpr* swizzle(SourceLocation at, TypedExpr* object, const std::vector<int>& components);

    /// Some components, one after another, of what a constructor makes, where they can be had without it:
    /// `uv` of `float4(uv, 0, 0)`; else null.
    TypedExpr* pick(TypedExpr* constructed, const std::vector<int>& components);
    TypedExpr* assign(SourceLocation at, TypedExpr* target, TypedExpr* value);
    TypedExpr* comma(SourceLocation at, TypedExpr* first, TypedExpr* second);

    /// Zeros of any type.
    TypedExpr* zero(SourceLocation at, const Type* type);

protected:
    NodeBuilder(Arena& arena, TypeTable& types) : mArena(arena), mTypes(types) {}

    TypedExpr* infix(SourceLocation at, BinaryOp op, const Type* type, TypedExpr* left, TypedExpr* right);

    /// A form for each row of the operands that are matrices.
    TypedExpr* byRows(SourceLocation at, const Type* type, Name form, std::vector<TypedExpr*> operands);

    /// So many components of a vector from its first on; of a scalar, copies of it.
    TypedExpr* firstOf(SourceLocation at, TypedExpr* vector, int count);

    Arena& mArena;
    TypeTable& mTypes;
};

} // namespace cg

#endif
