#ifndef CG_COMPILER_RESOLVER_ENTRY_RESOLVER_H
#define CG_COMPILER_RESOLVER_ENTRY_RESOLVER_H

#include <Cg/Compiler/TypedTree.h>

#include <string>

namespace cg {

class Declarations;
class Globals;
class Initializers;
class Instances;
class Recursion;
class SamplerPieces;
class TypeResolver;
struct Resolution;

/// The entry and the parameters of the program: what the runtime sees of it, and what its stage takes in and
/// gives out.
class EntryResolver {
public:
    EntryResolver(Resolution& resolution, const Declarations& declarations, Recursion& recursion,
                  TypeResolver& types, Initializers& initializers, Globals& globals, Instances& instances,
                  SamplerPieces& pieces);

    void resolve(const std::string& entry);

    /// All globals that are parameters, referenced or not.
    void addGlobals();

private:
    const FunctionDecl* find(const std::string& entry) const;
    void refuse(const std::string& entry);
    void resolve(const FunctionDecl* declaration);
    void resolveBody(Function* function);
    const Type* parameterType(const VariableDecl* parameter);
    void addParameter(Function* function, const VariableDecl* parameter);
    void addResult(Function* function);
    Variable* uniform(const VariableDecl* parameter, const Type* type);
    Variable* stageParameter(Function* function, const VariableDecl* parameter, const Type* type);
    void addStageValues(TypedExpr* place, std::string semantic, Name name, bool isOutput);
    void addMembers(TypedExpr* structure, const std::string& semantic, bool isOutput);

    Resolution& mResolution;
    const Declarations& mDeclarations;
    Recursion& mRecursion;
    TypeResolver& mTypes;
    Initializers& mInitializers;
    Globals& mGlobals;
    Instances& mInstances;
    SamplerPieces& mPieces;
};

} // namespace cg

#endif
