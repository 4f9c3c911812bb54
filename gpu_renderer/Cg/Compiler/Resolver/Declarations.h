#ifndef CG_COMPILER_RESOLVER_DECLARATIONS_H
#define CG_COMPILER_RESOLVER_DECLARATIONS_H

#include <Cg/Compiler/SyntaxTree.h>

#include <cstddef>
#include <unordered_map>
#include <vector>

namespace cg {

/// All names that a program declares, without a look at what they stand for. A name that is declared twice
/// keeps its first meaning; a global's later declaration may bring its initializer.
class Declarations {
public:
    using Functions = std::unordered_map<Name, std::vector<const FunctionDecl*>>;

    explicit Declarations(const TranslationUnit& unit);

    /// @return null where the program has none of that name
    const StructDecl* findStruct(Name name) const;
    const TypedefDecl* findTypedef(Name name) const;
    const VariableDecl* findGlobal(Name name) const;

    /// @return all of that name, prototypes as well, in the order of the source
    const std::vector<const FunctionDecl*>& functions(Name name) const;

    /// @return the methods of a struct that stand outside of it, by name: `Light::shade`
    const Functions& outsideMethods(Name owner) const;

    /// @return how many declarations of the program stand before the function's, and itself; 0 where it is
    ///         none of them
    std::size_t ordinal(const FunctionDecl* function) const;

    /// @return those that findGlobal() gives, in the order of the source
    std::vector<const VariableDecl*> globals() const;

    /// For "did you mean", in no order.
    std::vector<Name> typeNames() const;
    std::vector<Name> functionNames() const;
    std::vector<Name> globalNames() const;

private:
    void add(const VariableDecl* variable);
    void add(const FunctionDecl* function, std::size_t ordinal);
    void add(const StructDecl* structure, std::size_t ordinal);
    void add(const TypedefDecl* alias);
    void addDefinition(const TypeSyntax* type);

    const TranslationUnit& mUnit;
    std::unordered_map<Name, const StructDecl*> mStructs;
    std::unordered_map<Name, const TypedefDecl*> mTypedefs;
    std::unordered_map<Name, const VariableDecl*> mGlobals;
    Functions mFunctions;
    std::unordered_map<Name, Functions> mOutsideMethods; ///< by owner
    std::unordered_map<const FunctionDecl*, std::size_t> mOrdinals;
};

} // namespace cg

#endif
