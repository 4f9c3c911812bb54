#ifndef CG_COMPILER_RESOLVER_LOCAL_DECLARATIONS_H
#define CG_COMPILER_RESOLVER_LOCAL_DECLARATIONS_H

#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class Initializers;
class SamplerAssignments;
class TypeResolver;
struct Resolution;

/// Declarations within functions.
class LocalDeclarations {
public:
    LocalDeclarations(Resolution& resolution, TypeResolver& types, Initializers& initializers,
                      SamplerAssignments& samplers)
        : mResolution(resolution), mTypes(types), mInitializers(initializers), mSamplers(samplers) {}

    TypedStmt* declare(const DeclStmt* stmt);

private:
    using Statements = std::vector<TypedStmt*>;

    void declareVariable(const VariableDecl* declaration, Statements& out);
    void declareStruct(const StructDecl* structure);
    void declareAlias(const TypedefDecl* alias);
    TypedExpr* initialValue(Variable* variable);
    void giveSampler(Variable* variable, Statements& out);
    bool checkSize(const VariableDecl* declaration, const Type* type);
    void addStatements(Variable* variable, TypedExpr* value, Statements& out);

    Resolution& mResolution;
    TypeResolver& mTypes;
    Initializers& mInitializers;
    SamplerAssignments& mSamplers;
};

} // namespace cg

#endif
