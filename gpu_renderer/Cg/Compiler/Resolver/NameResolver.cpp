#include <Cg/Compiler/Resolver/NameResolver.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Globals.h>
#include <Cg/Compiler/Resolver/MemberAccess.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/StateBindings.h>

#include <algorithm>
#include <cstddef>
#include <string>
#include <vector>

namespace cg {

namespace {

/// The source text of `state.light[0].position`, from the second step on; empty where it is something else.
std::string statePath(const Expr* expr, Name& root) {
    if (expr->kind == Expr::Kind::NAME) {
        root = static_cast<const NameExpr*>(expr)->name;
        return {};
    }
    if (expr->kind == Expr::Kind::MEMBER) {
        const auto* member = static_cast<const MemberExpr*>(expr);
        const std::string path = statePath(member->object, root);
        return path.empty() ? std::string(member->name) : path + "." + std::string(member->name);
    }
    if (expr->kind == Expr::Kind::INDEX) {
        const auto* index = static_cast<const IndexExpr*>(expr);
        const std::string path = statePath(index->object, root);
        if (index->index->kind != Expr::Kind::LITERAL || path.empty())
            return {};
        const double number = static_cast<const LiteralExpr*>(index->index)->number;
        return path + "[" + std::to_string(static_cast<int>(std::clamp(number, 0.0, 999.0))) + "]";
    }
    return {};
}

/// The declaration of a loop's variable moves out of the loop.
void moveDeclarationOut(Arena& arena, TypedStmt* loop) {
    auto* inner = arena.make<TypedStmt>(*loop);
    TypedStmt* declarations = inner->body[0];
    inner->body[0] = nullptr;
    *loop = TypedStmt(TypedStmt::Kind::SEQUENCE);
    loop->body = {declarations, inner};
}

} // namespace

TypedExpr* NameResolver::name(const NameExpr* expr, bool isIndexed) {
    if (Variable* variable = mResolution.context.findVariable(expr->name))
        return use(expr, variable, isIndexed);
    if (isOfSelf(expr->name))
        return ofSelf(expr);
    if (mDeclarations.findGlobal(expr->name)) {
        Variable* variable = mGlobals.find(expr->name);
        return variable ? use(expr, variable, isIndexed) : nullptr;
    }
    if (Variable* variable = pastLoopVariable(expr))
        return mAliases.use(expr->location, variable);
    if (Variable* variable = ownValue(expr))
        return mResolution.build.variable(expr->location, variable);
    refuse(expr);
    return nullptr;
}

/// Of a uniform array without a size only elements can be used: it is as long as they ask for.
TypedExpr* NameResolver::use(const NameExpr* expr, Variable* variable, bool isIndexed) {
    const bool isLost = isOpaque(variable->type) && !standsForSampler(variable);
    if (!isLost && (!variable->isUnsized || isIndexed))
        return mAliases.use(expr->location, variable);
    mResolution.diagnostics.error(
        expr->location,
        inQuotes(expr->name) +
            (isLost ? " has been given no sampler" : " has no size: it can be used element by element only"));
    return nullptr;
}

/// It is a method's object or a member of that.
bool NameResolver::isOfSelf(Name name) const {
    const Variable* self = mResolution.context.self;
    return self && (name == "this" || self->type->structure->find(name) >= 0);
}

TypedExpr* NameResolver::ofSelf(const NameExpr* expr) {
    TypedExpr* self = mResolution.build.variable(expr->location, mResolution.context.self);
    return expr->name == "this" ? self : mMembers.member(expr->location, self, expr->name);
}

/// The variable of a `for` that is used after its loop, as old C++ allowed.
/// @return null where no loop of the blocks around had one of that name
Variable* NameResolver::pastLoopVariable(const NameExpr* expr) {
    const FunctionContext::LoopVariable* found = mResolution.context.pastLoops.find(expr->name);
    if (!found)
        return nullptr;
    const bool isMovedAlready = found->loop->kind == TypedStmt::Kind::SEQUENCE;
    if (!isMovedAlready) {
        mResolution.diagnostics.warning(expr->location, inQuotes(expr->name) + " is used after its loop");
        moveDeclarationOut(mResolution.arena, found->loop);
    }
    return found->variable;
}

/// The variable within its own initial value, `float sum = sum + 1;`: as in C it is in scope, but has no
/// value. What else has the name comes first.
Variable* NameResolver::ownValue(const NameExpr* expr) {
    Variable* variable = mResolution.context.declared;
    if (!variable || !variable->type || variable->name != expr->name)
        return nullptr;
    mResolution.diagnostics.warning(expr->location, inQuotes(expr->name) + " is used before it has a value");
    mResolution.context.isDeclaredUsed = true;
    return variable;
}

void NameResolver::refuse(const NameExpr* expr) {
    std::vector<Name> known = mDeclarations.globalNames();
    const auto& locals = mResolution.context.variables;
    for (std::size_t i = 0; i < locals.size(); ++i)
        known.push_back(locals.nameAt(i));
    mResolution.diagnostics.error(expr->location,
                                  "undeclared name " + inQuotes(expr->name) + suggestion(expr->name, known));
}

TypedExpr* NameResolver::state(const Expr* expr) {
    Name root;
    const std::string path = statePath(expr, root);
    const bool isState = root == "glstate" || root == "state";
    if (path.empty() || !isState || mResolution.context.findVariable(root) || mDeclarations.findGlobal(root))
        return nullptr;
    const StateBinding state = findState(path, mResolution.types);
    return state.type
               ? mResolution.build.builtin(expr->location, state.type, mResolution.arena.keep(state.form), {})
               : nullptr;
}

} // namespace cg
