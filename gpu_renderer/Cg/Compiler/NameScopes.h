#ifndef CG_COMPILER_NAME_SCOPES_H
#define CG_COMPILER_NAME_SCOPES_H

#include <Cg/Compiler/ScopedNames.h>

#include <cstddef>
#include <string_view>
#include <unordered_map>

namespace cg {

class TypeTable;

/// Which names are types, at the place that the parser has reached. The grammar depends on nothing else: any
/// name that the program declares as a variable or a function is that, even `texture` or `vec2`.
class NameScopes {
public:
    /// @param types  knows the types that the language has
    explicit NameScopes(const TypeTable& types) : mTypes(types) {}

    /// Opens a scope for as long as it lives.
    class Scope {
    public:
        explicit Scope(NameScopes& scopes) : mScopes(scopes), mStart(scopes.mIsType.size()) {}
        ~Scope() { mScopes.mIsType.endScope(mStart); }
        Scope(const Scope&) = delete;
        Scope& operator=(const Scope&) = delete;

    private:
        NameScopes& mScopes;
        std::size_t mStart;
    };

    void declareType(std::string_view name) { declare(name, true); }
    void declareOther(std::string_view name) { declare(name, false); } ///< a variable or a function

    /// Declared by the program, or a type that the language has.
    bool isType(std::string_view name) const;

    bool isDeclared(std::string_view name) const; ///< by the program, as whatever
    bool isVariableOrFunction(std::string_view name) const;

private:
    void declare(std::string_view name, bool isType);

    const TypeTable& mTypes;
    mutable std::unordered_map<std::string_view, bool> mBuiltIn; ///< answers of mTypes so far
    ScopedNames<bool> mIsType;                                   ///< what the program declares
};

} // namespace cg

#endif
