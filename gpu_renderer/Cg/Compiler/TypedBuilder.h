#ifndef CG_COMPILER_TYPED_BUILDER_H
#define CG_COMPILER_TYPED_BUILDER_H

#include <Cg/Compiler/TypedTree.h>

#include <initializer_list>
#include <string>
#include <vector>

namespace cg {

class Diagnostics;

/// Makes typed expressions, with the conversions that Cg makes silently.
///
/// Operations that can fail report it and return null. Operands are never null.
class TypedBuilder {
public:
    TypedBuilder(Arena& arena, TypeTable& types, Diagnostics& diagnostics)
        : mArena(arena), mTypes(types), mDiagnostics(diagnostics) {}

    static constexpr int IMPOSSIBLE = -1;

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

    /// What it costs Cg to pass an expression where a type is wanted: 0 for the same type, IMPOSSIBLE where
    /// there is no silent conversion.
    int cost(const TypedExpr* from, const Type* to) const;

    /// Silent conversion. Warns where components get lost; an error where there is none.
    TypedExpr* convert(TypedExpr* expression, const Type* to);

    /// The conversion of a cast: all silent ones without a word, and between shapes of equal or smaller size.
    TypedExpr* cast(SourceLocation at, TypedExpr* expression, const Type* to);

    /// `type(arguments)`
    TypedExpr* construct(SourceLocation at, const Type* type, const std::vector<TypedExpr*>& arguments);

    TypedExpr* unary(SourceLocation at, UnaryOp op, TypedExpr* operand);

    /// All operators but COMMA.
    TypedExpr* binary(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* conditional(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                           TypedExpr* whenFalse);

    /// mul(): rows times columns.
    TypedExpr* product(SourceLocation at, TypedExpr* left, TypedExpr* right);

    /// The expression as one bool.
    TypedExpr* condition(TypedExpr* expression);

private:
    TypedExpr* reshape(TypedExpr* expression, const Type* to);
    TypedExpr* withScalar(TypedExpr* expression, Scalar scalar);
    TypedExpr* vectorOf(TypedExpr* thinMatrix);
    Scalar commonScalar(const TypedExpr* left, const TypedExpr* right) const;
    bool matchShapes(SourceLocation at, TypedExpr*& left, TypedExpr*& right);
    TypedExpr* compare(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* logical(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* infix(SourceLocation at, BinaryOp op, const Type* type, TypedExpr* left, TypedExpr* right);
    TypedExpr* byRows(SourceLocation at, const Type* type, Name form, std::vector<TypedExpr*> operands,
                      Name helper = {});
    TypedExpr* truth(TypedExpr* matrix);
    TypedExpr* compareMatrices(SourceLocation at, BinaryOp op, TypedExpr* left, TypedExpr* right);
    TypedExpr* chooseSampler(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                             TypedExpr* whenFalse);
    TypedExpr* chooseElements(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                              TypedExpr* whenFalse);
    TypedExpr* matrixProduct(SourceLocation at, TypedExpr* left, TypedExpr* right);
    void operandError(SourceLocation at, const char* op, const TypedExpr* left, const TypedExpr* right);

    Arena& mArena;
    TypeTable& mTypes;
    Diagnostics& mDiagnostics;
};

/// It can be written twice in the GLSL text: no side effect and nothing worth computing once.
bool isSimple(const TypedExpr* expression);

/// Its evaluation may change something.
bool hasEffect(const TypedExpr* expression);

/// The variable that an l-value is a part of, or null.
Variable* rootVariable(const TypedExpr* expression);

/// What `c ? a : b` may be, where that is a sampler; a single one else.
std::vector<TypedExpr*> samplersIn(TypedExpr* sampler);

/// Samplers that one look-up may choose among.
constexpr std::size_t MAX_SAMPLER_CHOICES = 64;

/// How an operator is written.
const char* spelling(BinaryOp op);

} // namespace cg

#endif
