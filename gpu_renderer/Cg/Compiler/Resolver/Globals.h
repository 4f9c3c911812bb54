#ifndef CG_COMPILER_RESOLVER_GLOBALS_H
#define CG_COMPILER_RESOLVER_GLOBALS_H

#include <Cg/Compiler/TypedTree.h>

#include <unordered_map>

namespace cg {

class Declarations;
class Initializers;
class TypeResolver;
struct Resolution;

/// The variables of a program outside of its functions, resolved where they are first used: uniforms,
/// constants and variables of the program.
class Globals {
public:
    Globals(Resolution& resolution, const Declarations& declarations, TypeResolver& types,
            Initializers& initializers);

    /// @return null where the program has none of that name, and after an error
    Variable* find(Name name);

    /// @return null after an error
    Variable* variable(const VariableDecl* declaration);

    /// A uniform of the entry's parameter list.
    /// @param type  what it is after an error
    Variable* parameter(const VariableDecl* declaration, const Type* type);

    bool has(const Variable* variable) const;

private:
    void resolve(Variable* variable);
    bool initialize(Variable* variable);
    void decide(Variable* variable);
    void nameAnother(Variable* sampler);
    void bindState(Variable* variable);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    TypeResolver& mTypes;
    Initializers& mInitializers;
    std::unordered_map<const VariableDecl*, Variable*> mVariables; ///< null after an error
};

} // namespace cg

#endif
