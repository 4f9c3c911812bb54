#include <Cg/Compiler/Resolver/StatementResolver.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/BranchSamplers.h>
#include <Cg/Compiler/Resolver/LocalDeclarations.h>
#include <Cg/Compiler/Resolver/LoopSamplers.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <algorithm>
#include <cstddef>
#include <optional>
#include <vector>

namespace cg {

namespace {

using Kind = TypedStmt::Kind;

/// It leaves no statement in the GLSL text, or only braces.
bool isEmpty(const TypedStmt* stmt) {
    return (stmt->kind == Kind::SEQUENCE || stmt->kind == Kind::BLOCK) &&
           std::all_of(stmt->body.begin(), stmt->body.end(), isEmpty);
}

/// All ways through it end in `discard`.
bool endsInDiscard(const TypedStmt* stmt) {
    switch (stmt->kind) {
    case Kind::DISCARD:
        return true;
    case Kind::BLOCK:
    case Kind::SEQUENCE:
        return std::any_of(stmt->body.begin(), stmt->body.end(), endsInDiscard);
    case Kind::IF:
        return stmt->body[1] && endsInDiscard(stmt->body[0]) && endsInDiscard(stmt->body[1]);
    default:
        return false;
    }
}

} // namespace

void StatementResolver::body(Function* function, const FunctionDecl* definition) {
    function->body = block(definition->body->statements);
    endBody(function, definition);
}

/// A function that gives a value has to say which. GLSL wants a `return` even where all is discarded.
void StatementResolver::endBody(Function* function, const FunctionDecl* definition) {
    if (function->result->isVoid() || mResolution.context.hasReturn)
        return;
    if (!endsInDiscard(function->body)) {
        mResolution.diagnostics.error(definition->location, "function " + inQuotes(definition->name) +
                                                                " has no 'return' for its '" +
                                                                nameOf(function->result) + "'");
        return;
    }
    TypedExpr* zero = mResolution.build.zero(definition->location, function->result);
    function->body->body.push_back(mResolution.makeStatement(Kind::RETURN, zero));
}

/// @return null for a statement without effect, and after an error
TypedStmt* StatementResolver::statement(const Stmt* stmt) {
    if (!stmt || mResolution.diagnostics.isFull())
        return nullptr;
    switch (stmt->kind) {
    case Stmt::Kind::BLOCK:
        return block(static_cast<const BlockStmt*>(stmt)->statements);
    case Stmt::Kind::DECL:
        return mDeclarations.declare(static_cast<const DeclStmt*>(stmt));
    case Stmt::Kind::EXPR:
        return expressionStatement(mRecursion.expression(static_cast<const ExprStmt*>(stmt)->expression));
    case Stmt::Kind::IF:
        return ifStatement(static_cast<const IfStmt*>(stmt));
    case Stmt::Kind::FOR:
        return mLoopSamplers.resolve(stmt->location,
                                     [&] { return forLoop(static_cast<const ForStmt*>(stmt)); });
    case Stmt::Kind::WHILE:
    case Stmt::Kind::DO:
        return mLoopSamplers.resolve(stmt->location,
                                     [&] { return loop(static_cast<const LoopStmt*>(stmt)); });
    case Stmt::Kind::SWITCH:
        return mLoopSamplers.resolve(stmt->location,
                                     [&] { return switchStatement(static_cast<const SwitchStmt*>(stmt)); });
    case Stmt::Kind::CASE:
        return label(static_cast<const CaseStmt*>(stmt));
    case Stmt::Kind::RETURN:
        return returnStatement(static_cast<const JumpStmt*>(stmt));
    case Stmt::Kind::DISCARD:
        return discardStatement(static_cast<const JumpStmt*>(stmt));
    case Stmt::Kind::BREAK:
    case Stmt::Kind::CONTINUE:
        return leave(stmt);
    }
    return nullptr;
}

TypedStmt* StatementResolver::block(const std::vector<Stmt*>& statements) {
    FunctionContext& context = mResolution.context;
    TypedStmt* result = mResolution.makeStatement(Kind::BLOCK);
    const FunctionContext::ScopeStart start = context.scopeStart();
    const std::size_t outerLoops = context.pastLoops.size();
    for (const Stmt* inner : statements)
        if (TypedStmt* resolved = statement(inner))
            result->body.push_back(resolved);
    context.endScope(start);
    context.pastLoops.endScope(outerLoops);
    return result;
}

/// A branch or a loop's body: always a block, never null.
TypedStmt* StatementResolver::scoped(Stmt* stmt) {
    if (!stmt)
        return block({});
    return stmt->kind == Stmt::Kind::BLOCK ? block(static_cast<const BlockStmt*>(stmt)->statements)
                                           : block({stmt});
}

TypedStmt* StatementResolver::expressionStatement(TypedExpr* expression) {
    return expression && hasEffect(expression) ? mResolution.makeStatement(Kind::EXPR, expression) : nullptr;
}

/// @return the expression as one bool; null after an error
TypedExpr* StatementResolver::condition(const Expr* expr) {
    TypedExpr* condition = mRecursion.expression(expr);
    return condition ? mResolution.build.condition(condition) : nullptr;
}

// ------------------------------------------------------------------------------------ branches and loops

TypedStmt* StatementResolver::ifStatement(const IfStmt* stmt) {
    return mBranchSamplers.resolve(
        stmt->location, condition(stmt->condition), [&] { return scoped(stmt->thenBranch); },
        [&] { return stmt->elseBranch ? scoped(stmt->elseBranch) : nullptr; });
}

TypedStmt* StatementResolver::loop(const LoopStmt* stmt) {
    TypedStmt* result = mResolution.makeStatement(stmt->kind == Stmt::Kind::WHILE ? Kind::WHILE : Kind::DO,
                                                  condition(stmt->condition));
    ++mResolution.context.loops;
    result->body = {scoped(stmt->body)};
    --mResolution.context.loops;
    return result->expression ? result : nullptr;
}

TypedStmt* StatementResolver::forLoop(const ForStmt* stmt) {
    FunctionContext& context = mResolution.context;
    const FunctionContext::ScopeStart start = context.scopeStart();
    TypedStmt* result = mResolution.makeStatement(Kind::FOR);
    TypedStmt* first = statement(stmt->initializer);
    if (stmt->condition)
        result->expression = condition(stmt->condition);
    if (stmt->step)
        result->step = mRecursion.expression(stmt->step);
    ++context.loops;
    result->body = {first, scoped(stmt->body)};
    --context.loops;
    for (std::size_t i = start.variables; i < context.variables.size(); ++i)
        context.pastLoops.declare(context.variables.nameAt(i), {context.variables.at(i), result});
    context.endScope(start);
    return result;
}

TypedStmt* StatementResolver::switchStatement(const SwitchStmt* stmt) {
    TypedExpr* selector = mRecursion.expression(stmt->selector);
    selector =
        selector ? mResolution.build.convert(selector, mResolution.types.scalar(Scalar::INT)) : nullptr;
    if (!selector)
        return nullptr;
    TypedStmt* result = mResolution.makeStatement(Kind::SWITCH, selector);
    ++mResolution.context.switches;
    result->body = block(stmt->body->statements)->body;
    --mResolution.context.switches;
    // GLSL wants a statement behind the last label.
    const auto last = std::find_if_not(result->body.rbegin(), result->body.rend(), isEmpty);
    if (last != result->body.rend() && (*last)->kind == Kind::CASE)
        result->body.push_back(mResolution.makeStatement(Kind::BREAK));
    return result;
}

/// `case 3:` and `default:`
TypedStmt* StatementResolver::label(const CaseStmt* stmt) {
    if (!stmt->value)
        return mResolution.makeStatement(Kind::CASE);
    TypedExpr* value = mRecursion.expression(stmt->value);
    value = value ? mResolution.build.convert(value, mResolution.types.scalar(Scalar::INT)) : nullptr;
    if (const auto known = value ? constantValue(value) : std::nullopt)
        value = mResolution.build.literal(stmt->location, value->type, (*known)[0]);
    return value ? mResolution.makeStatement(Kind::CASE, value) : nullptr;
}

// ----------------------------------------------------------------------------------------------- jumps

/// `break` and `continue`
TypedStmt* StatementResolver::leave(const Stmt* stmt) {
    const FunctionContext& context = mResolution.context;
    const bool isBreak = stmt->kind == Stmt::Kind::BREAK;
    if (context.loops == 0 && !(isBreak && context.switches > 0)) {
        mResolution.diagnostics.error(stmt->location, isBreak ? "'break' outside of a loop or a switch"
                                                              : "'continue' outside of a loop");
        return nullptr;
    }
    return mResolution.makeStatement(isBreak ? Kind::BREAK : Kind::CONTINUE);
}

TypedStmt* StatementResolver::returnStatement(const JumpStmt* stmt) {
    FunctionContext& context = mResolution.context;
    context.hasReturn = true;
    const Type* wanted = context.function->result;
    TypedStmt* result = mResolution.makeStatement(Kind::RETURN);
    if (!stmt->value) {
        if (wanted->isVoid())
            return result;
        mResolution.diagnostics.error(stmt->location, "return without a value in a function that gives '" +
                                                          nameOf(wanted) + "'");
        return nullptr;
    }
    TypedExpr* value = mRecursion.expression(stmt->value);
    if (!value)
        return nullptr;
    if (wanted->isVoid() && value->type->isVoid()) {
        TypedStmt* effect = expressionStatement(value);
        if (!effect)
            return result;
        TypedStmt* both = mResolution.makeStatement(Kind::SEQUENCE);
        both->body = {effect, result};
        return both;
    }
    if (wanted->isVoid()) {
        mResolution.diagnostics.error(stmt->location, "return with a value in a void function");
        return nullptr;
    }
    result->expression = mResolution.build.convert(value, wanted);
    return result->expression ? result : nullptr;
}

TypedStmt* StatementResolver::discardStatement(const JumpStmt* stmt) {
    TypedBuilder& build = mResolution.build;
    if (mResolution.stage == Stage::VERTEX) {
        mResolution.diagnostics.error(stmt->location, "discard is for fragment programs");
        return nullptr;
    }
    TypedStmt* result = mResolution.makeStatement(Kind::DISCARD);
    if (!stmt->value)
        return result;
    TypedExpr* condition = mRecursion.expression(stmt->value);
    if (!condition)
        return nullptr;
    if (condition->type->isVector()) {
        const Type* bools = mResolution.types.vector(Scalar::BOOL, condition->type->columns);
        condition = build.builtin(stmt->location, mResolution.types.scalar(Scalar::BOOL), "any($0)",
                                  {build.cast(stmt->location, condition, bools)});
    }
    condition = build.condition(condition);
    if (!condition)
        return nullptr;
    TypedStmt* body = mResolution.makeStatement(Kind::BLOCK);
    body->body.push_back(result);
    TypedStmt* branch = mResolution.makeStatement(Kind::IF, condition);
    branch->body = {body, nullptr};
    return branch;
}

} // namespace cg
