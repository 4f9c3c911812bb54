#ifndef CG_COMPILER_RESOLVER_RESOLUTION_H
#define CG_COMPILER_RESOLVER_RESOLUTION_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/Resolver/FunctionContext.h>
#include <Cg/Compiler/TypedBuilder.h>
#include <Cg/Compiler/TypedTree.h>

namespace cg {

class Diagnostics;

/// What all parts of the resolver share: what they make the typed tree with, the program that it becomes, and
/// where in the source they are.
struct Resolution {
    Resolution(Stage theStage, Arena& theArena, TypeTable& theTypes, Diagnostics& theDiagnostics);
    Resolution(const Resolution&) = delete;
    Resolution& operator=(const Resolution&) = delete;

    Variable* makeVariable(Variable::Storage storage, Name name, const Type* type,
                           const VariableDecl* declaration);

    /// A temporary of the function that is being resolved, or of the globals' initializers.
    Variable* temporary(const Type* type);

    /// A temporary that other functions see as well.
    Variable* programTemporary(Name name, const Type* type);

    /// A value that is needed several times: itself, or a temporary and the assignment to it that comes
    /// before.
    /// @param preparation  receives the assignment; is left alone where there is none
    TypedExpr* once(TypedExpr* value, TypedExpr*& preparation);

    /// Both, one after the other; each may be null.
    TypedExpr* inOrder(SourceLocation at, TypedExpr* first, TypedExpr* second);

    TypedStmt* makeStatement(TypedStmt::Kind kind, TypedExpr* expression = nullptr);

    TypedExpr* number(SourceLocation at, int value);

    /// `value == number`
    TypedExpr* isNumber(SourceLocation at, TypedExpr* value, int number);

    /// What stands for an expression that leaves nothing in GLSL.
    TypedExpr* nothing(SourceLocation at);

    const Stage stage;
    Arena& arena;
    TypeTable& types;
    Diagnostics& diagnostics;
    TypedBuilder build;
    TypedProgram& program;
    FunctionContext context;
    int callDepth = 0;        ///< calls within calls within calls
    int declarationDepth = 0; ///< globals and types that are resolved for others
};

/// Calls within calls within calls: more is no program but an attack.
constexpr int MAX_CALL_DEPTH = 100;

/// Resolves what a call leads to, in a context of its own, for as long as it lives.
class CallChange {
public:
    CallChange(Resolution& resolution, FunctionContext inner);
    ~CallChange() { --mDepth; }
    CallChange(const CallChange&) = delete;
    CallChange& operator=(const CallChange&) = delete;

private:
    ContextChange mContext;
    int& mDepth;
};

/// Globals and types that name others, which name others: more is no program but an attack.
constexpr int MAX_DECLARATION_DEPTH = 500;

/// One global or type that is being resolved, for as long as it lives.
class DeclarationLevel {
public:
    explicit DeclarationLevel(Resolution& resolution) : mResolution(resolution) {
        ++mResolution.declarationDepth;
    }
    ~DeclarationLevel() { --mResolution.declarationDepth; }
    DeclarationLevel(const DeclarationLevel&) = delete;
    DeclarationLevel& operator=(const DeclarationLevel&) = delete;

    /// @return false where it is nested too deep, which is an error
    bool fits(SourceLocation at, Name name) const;

private:
    Resolution& mResolution;
};

} // namespace cg

#endif
