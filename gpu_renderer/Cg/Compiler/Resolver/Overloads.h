#ifndef CG_COMPILER_RESOLVER_OVERLOADS_H
#define CG_COMPILER_RESOLVER_OVERLOADS_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/TypedTree.h>

#include <cstddef>
#include <string>
#include <unordered_map>
#include <vector>

namespace cg {

class Declarations;
class TypeResolver;
struct Resolution;

/// The types that a function is declared with.
struct Signature {
    std::vector<const Type*> parameters;
    const Type* result = nullptr; ///< null after an error
    bool isKnown = false;         ///< not yet while these types are being resolved
};

/// Choice among the program's own functions of one name, as Cg makes it.
class Overloads {
public:
    using Functions = std::vector<const FunctionDecl*>;
    using Arguments = std::vector<TypedExpr*>;

    Overloads(Resolution& resolution, const Declarations& declarations, TypeResolver& types)
        : mResolution(resolution), mDeclarations(declarations), mTypes(types) {}

    const Signature& signatureOf(const FunctionDecl* declaration);

    /// The functions of that name that stand before the one being resolved, or else all of them; each once,
    /// with its body where it has one. None where they are too many, which is an error.
    const Functions& candidates(Name name);

    /// The methods of that name; none where the type is no struct.
    const Functions& methods(const Type* type, Name name);

    /// @return the function with its body, or null
    const FunctionDecl* definitionOf(const FunctionDecl* declaration);

    /// Cg's choice: argument by argument from the left, only the functions that take it at the least cost
    /// stay.
    /// @return null where none takes the arguments
    const FunctionDecl* choose(const Functions& functions, const Arguments& arguments);

    /// Reports that none takes the arguments, with all that there would be.
    void refuse(SourceLocation at, Name name, const Functions& functions, const Arguments& arguments);

private:
    /// Of the functions of a name: most calls see as many as the call before.
    struct Candidates {
        std::size_t visible = 0;
        Functions distinct;
    };

    Functions distinctOf(const Functions& functions);
    const Functions& bounded(const Functions& functions, Name name);
    const Functions& declarationsLike(const FunctionDecl* declaration) const;
    int argumentCost(const FunctionDecl* function, std::size_t position, const TypedExpr* argument);
    bool takes(const FunctionDecl* function, const Arguments& arguments);
    Functions cheapest(const Functions& functions, std::size_t position, const TypedExpr* argument);
    std::string objection(const FunctionDecl* function, const Arguments& arguments);
    std::string describe(const FunctionDecl* declaration);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    TypeResolver& mTypes;
    std::unordered_map<const FunctionDecl*, Signature> mSignatures;
    std::unordered_map<Name, Candidates> mCandidates;
    std::unordered_map<const StructDecl*, std::unordered_map<Name, Functions>> mMethods;
};

} // namespace cg

#endif
