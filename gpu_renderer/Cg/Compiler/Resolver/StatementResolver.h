#ifndef CG_COMPILER_RESOLVER_STATEMENT_RESOLVER_H
#define CG_COMPILER_RESOLVER_STATEMENT_RESOLVER_H

#include <Cg/Compiler/TypedTree.h>

#include <vector>

namespace cg {

class BranchSamplers;
class LocalDeclarations;
class LoopSamplers;
class Recursion;
struct Resolution;

/// Statements and bodies of functions.
class StatementResolver {
public:
    StatementResolver(Resolution& resolution, Recursion& recursion, LocalDeclarations& declarations,
                      BranchSamplers& branchSamplers, LoopSamplers& loopSamplers)
        : mResolution(resolution), mRecursion(recursion), mDeclarations(declarations),
          mBranchSamplers(branchSamplers), mLoopSamplers(loopSamplers) {}

    /// The body of the function that is being resolved.
    void body(Function* function, const FunctionDecl* definition);

private:
    TypedStmt* statement(const Stmt* stmt);
    TypedStmt* block(const std::vector<Stmt*>& statements);
    TypedStmt* scoped(Stmt* stmt);
    TypedStmt* ifStatement(const IfStmt* stmt);
    TypedStmt* loop(const LoopStmt* stmt);
    TypedStmt* forLoop(const ForStmt* stmt);
    TypedStmt* switchStatement(const SwitchStmt* stmt);
    TypedStmt* label(const CaseStmt* stmt);
    TypedStmt* leave(const Stmt* stmt);
    TypedStmt* returnStatement(const JumpStmt* stmt);
    TypedStmt* discardStatement(const JumpStmt* stmt);
    TypedStmt* expressionStatement(TypedExpr* expression);
    TypedExpr* condition(const Expr* expr);
    void endBody(Function* function, const FunctionDecl* definition);

    Resolution& mResolution;
    Recursion& mRecursion;
    LocalDeclarations& mDeclarations;
    BranchSamplers& mBranchSamplers;
    LoopSamplers& mLoopSamplers;
};

} // namespace cg

#endif
