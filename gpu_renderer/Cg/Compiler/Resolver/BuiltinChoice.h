#ifndef CG_COMPILER_RESOLVER_BUILTIN_CHOICE_H
#define CG_COMPILER_RESOLVER_BUILTIN_CHOICE_H

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <string>
#include <vector>

namespace cg {

class Diagnostics;
class SamplerKinds;

/// The built-in function that a call means, and what its generic operands are there.
struct ChosenBuiltin {
    const BuiltinFunction* function = nullptr; ///< null where none takes the arguments
    int size = 1;
    Scalar scalar = Scalar::BOOL;
    const Type* matrix = nullptr; ///< null where the function takes none
    int rows = 0;                 ///< of generic operands that are matrices; 0 where they are none
    int columns = 0;

    /// The type that an operand of the function has in this call.
    const Type* typeOf(const BuiltinOperand& operand, const TypeTable& types) const;
};

/// Choice among built-in functions of one name: the one that takes the arguments at the least cost.
class BuiltinChoice {
public:
    using Arguments = std::vector<TypedExpr*>;

    BuiltinChoice(const TypeTable& types, const SamplerKinds& kinds) : mTypes(types), mKinds(kinds) {}

    /// @param withGlslNames  also functions that Cg does not have
    ChosenBuiltin choose(const std::vector<BuiltinFunction>& functions, const Arguments& arguments,
                         bool withGlslNames) const;

    /// Reports that none takes the arguments, with those that come near.
    void refuse(SourceLocation at, Name name, const std::vector<BuiltinFunction>& functions,
                const Arguments& arguments, Diagnostics& diagnostics) const;

private:
    int cost(const ChosenBuiltin& builtin, const Arguments& arguments) const;
    int operandCost(const ChosenBuiltin& builtin, std::size_t position, const Arguments& arguments) const;
    int samplerCost(const BuiltinFunction& function, const BuiltinOperand& operand, TypedExpr* sampler) const;
    std::string describe(const BuiltinOperand& operand) const;

    const TypeTable& mTypes;
    const SamplerKinds& mKinds;
};

} // namespace cg

#endif
