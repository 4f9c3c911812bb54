#ifndef CG_COMPILER_RESOLVER_TYPE_RESOLVER_H
#define CG_COMPILER_RESOLVER_TYPE_RESOLVER_H

#include <Cg/Compiler/SourceLocation.h>
#include <Cg/Compiler/Types.h>

#include <unordered_map>
#include <vector>

namespace cg {

class Declarations;
class Recursion;
struct Resolution;

/// What the types are that a program writes: finds their names and makes its structs and arrays.
class TypeResolver {
public:
    static constexpr int MAX_ARRAY_LENGTH = 65536;
    static constexpr int MAX_LEAVES = 1 << 18; ///< components of one variable

    TypeResolver(Resolution& resolution, const Declarations& declarations, Recursion& recursion)
        : mResolution(resolution), mDeclarations(declarations), mRecursion(recursion) {}

    /// @return null for a name that is no type
    const Type* find(Name name);

    /// @return null after an error
    const Type* typeOf(const TypeSyntax* syntax);
    const Type* typeOf(const TypeSyntax* syntax, const std::vector<Expr*>& dimensions);
    const Type* structType(const StructDecl* declaration);

    /// @return the type; null after an error where it has too many components
    const Type* checkSize(SourceLocation at, const Type* type);

private:
    const Type* aliasType(const TypedefDecl* alias);
    const Type* withDimensions(SourceLocation at, const Type* type, const std::vector<Expr*>& dimensions);
    int arrayLength(const Expr* dimension);
    void inherit(StructType* structure, const StructType* base);
    void setBase(StructType* structure);
    void addMembers(StructType* structure);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Recursion& mRecursion;
    std::unordered_map<const StructDecl*, const Type*> mStructTypes; ///< null while one is being made
    std::unordered_map<const TypedefDecl*, const Type*> mAliasTypes;
};

} // namespace cg

#endif
