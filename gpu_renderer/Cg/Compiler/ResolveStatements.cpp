#include <Cg/Compiler/Resolver.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <array>

namespace cg {

namespace {

TypedStmt* make(Arena& arena, TypedStmt::Kind kind, TypedExpr* expression = nullptr) {
    auto* stmt = arena.make<TypedStmt>(kind);
    stmt->expression = expression;
    return stmt;
}

/// It leaves no statement in the GLSL text, or only braces.
bool isEmpty(const TypedStmt* stmt) {
    return (stmt->kind == TypedStmt::Kind::SEQUENCE || stmt->kind == TypedStmt::Kind::BLOCK) &&
           std::all_of(stmt->body.begin(), stmt->body.end(), isEmpty);
}

/// All ways through it end in `discard`.
bool endsInDiscard(const TypedStmt* stmt) {
    switch (stmt->kind) {
    case TypedStmt::Kind::DISCARD:
        return true;
    case TypedStmt::Kind::BLOCK:
    case TypedStmt::Kind::SEQUENCE:
        return std::any_of(stmt->body.begin(), stmt->body.end(), endsInDiscard);
    case TypedStmt::Kind::IF:
        return stmt->body[1] && endsInDiscard(stmt->body[0]) && endsInDiscard(stmt->body[1]);
    default:
        return false;
    }
}

} // namespace

/// @return null for a statement without effect, and after an error
TypedStmt* Resolver::statement(const Stmt* stmt) {
    using Kind = Stmt::Kind;
    if (!stmt || mDiagnostics.isFull())
        return nullptr;
    switch (stmt->kind) {
    case Kind::BLOCK:
        return block(static_cast<const BlockStmt*>(stmt));
    case Kind::DECL:
        return declarations(static_cast<const DeclStmt*>(stmt));
    case Kind::EXPR:
        return expressionStatement(expression(static_cast<const ExprStmt*>(stmt)->expression));
    case Kind::IF:
        return ifStatement(static_cast<const IfStmt*>(stmt));
    case Kind::FOR:
        return withSelectors(stmt->location, [&] { return forLoop(static_cast<const ForStmt*>(stmt)); });
    case Kind::WHILE:
    case Kind::DO:
        return withSelectors(stmt->location, [&] { return loop(static_cast<const LoopStmt*>(stmt)); });
    case Kind::SWITCH:
        return withSelectors(stmt->location,
                             [&] { return switchStatement(static_cast<const SwitchStmt*>(stmt)); });
    case Kind::CASE: {
        const auto* label = static_cast<const CaseStmt*>(stmt);
        TypedExpr* value = label->value ? expression(label->value) : nullptr;
        value = value ? mBuild.convert(value, mTypes.scalar(Scalar::INT)) : nullptr;
        if (const auto known = value ? constantValue(value) : std::nullopt)
            value = mBuild.literal(stmt->location, value->type, (*known)[0]);
        return value || !label->value ? make(mArena, TypedStmt::Kind::CASE, value) : nullptr;
    }
    case Kind::RETURN:
        return returnStatement(static_cast<const JumpStmt*>(stmt));
    case Kind::DISCARD:
        return discardStatement(static_cast<const JumpStmt*>(stmt));
    case Kind::BREAK:
    case Kind::CONTINUE:
        return leave(stmt);
    }
    return nullptr;
}

/// A sampler that a branch assigns stands for a choice by the condition behind the `if`.
TypedStmt* Resolver::ifStatement(const IfStmt* stmt) {
    TypedExpr* condition = expression(stmt->condition);
    condition = condition ? mBuild.condition(condition) : nullptr;
    TypedStmt* result = make(mArena, TypedStmt::Kind::IF, condition);
    const std::size_t start = mAliased.size();
    struct Assigned {
        Variable* variable;
        std::array<TypedExpr*, 2> samplers;
    };
    std::vector<Assigned> assigned; // in the order of the source
    const Stmt* const branches[] = {stmt->thenBranch, stmt->elseBranch};
    for (std::size_t i = 0; i < 2; ++i) {
        result->body.push_back(i == 0 || branches[i] ? scoped(branches[i]) : nullptr);
        for (std::size_t one = start; one < mAliased.size(); ++one) {
            Variable* variable = mAliased[one].variable;
            auto known = std::find_if(assigned.begin(), assigned.end(),
                                      [&](const Assigned& other) { return other.variable == variable; });
            if (known == assigned.end())
                known = assigned.insert(known, {variable, {}});
            known->samplers[i] = variable->alias;
        }
        for (; mAliased.size() > start; mAliased.pop_back())
            mAliased.back().variable->alias = mAliased.back().before;
    }
    if (!condition)
        return nullptr;
    if (assigned.empty())
        return result;
    Variable* taken = makeVariable(Variable::Storage::LOCAL, "taken", condition->type, nullptr);
    mProgram->temporaries.push_back(taken);
    result->expression = mBuild.assign(stmt->location, mBuild.variable(stmt->location, taken), condition);
    for (const auto& [variable, samplers] : assigned) {
        TypedExpr* before = variable->alias || variable->storage != Variable::Storage::LOCAL
                                ? useVariable(stmt->location, variable)
                                : nullptr; // nothing yet: whatever the other branch gives
        TypedExpr* whenTrue = samplers[0] ? samplers[0] : before ? before : samplers[1];
        TypedExpr* whenFalse = samplers[1] ? samplers[1] : before ? before : samplers[0];
        if (TypedExpr* choice =
                chosenOf(stmt->location, mBuild.variable(stmt->location, taken), whenTrue, whenFalse))
            alias(variable, choice);
    }
    return result;
}

TypedStmt* Resolver::block(const BlockStmt* stmt) {
    TypedStmt* result = make(mArena, TypedStmt::Kind::BLOCK);
    const std::size_t outerScope = mContext.scope.size();
    const std::size_t outerLoops = mContext.pastLoops.size();
    std::vector<TypedStmt*>* outerStatements = mContext.statements;
    mContext.statements = &result->body;
    for (const Stmt* inner : stmt->statements)
        if (TypedStmt* resolved = statement(inner))
            result->body.push_back(resolved);
    mContext.statements = outerStatements;
    mContext.scope.resize(outerScope);
    mContext.pastLoops.resize(outerLoops);
    return result;
}

/// A branch or a loop's body: always a block, never null.
TypedStmt* Resolver::scoped(const Stmt* stmt) {
    if (stmt && stmt->kind == Stmt::Kind::BLOCK)
        return block(static_cast<const BlockStmt*>(stmt));
    BlockStmt only(stmt ? stmt->location : SourceLocation());
    if (stmt)
        only.statements.push_back(const_cast<Stmt*>(stmt));
    return block(&only);
}

TypedStmt* Resolver::expressionStatement(TypedExpr* expression) {
    return expression && hasEffect(expression) ? make(mArena, TypedStmt::Kind::EXPR, expression) : nullptr;
}

TypedStmt* Resolver::declarations(const DeclStmt* stmt) {
    TypedStmt* result = make(mArena, TypedStmt::Kind::SEQUENCE);
    std::vector<TypedStmt*>* outer = mContext.statements;
    mContext.statements = &result->body;
    for (const Decl* declaration : stmt->declarations)
        switch (declaration->kind) {
        case Decl::Kind::VARIABLE:
            declareLocal(static_cast<const VariableDecl*>(declaration), result->body);
            break;
        case Decl::Kind::STRUCT: {
            const auto* structure = static_cast<const StructDecl*>(declaration);
            mContext.scope.push_back({structure->name, nullptr, structType(structure)});
            break;
        }
        case Decl::Kind::TYPEDEF: {
            const auto* alias = static_cast<const TypedefDecl*>(declaration);
            if (const Type* type = typeOf(alias->type, alias->dimensions))
                mContext.scope.push_back({alias->name, nullptr, type});
            break;
        }
        case Decl::Kind::FUNCTION: // a prototype within a function says nothing new
            break;
        }
    mContext.statements = outer;
    return result;
}

void Resolver::declareLocal(const VariableDecl* declaration, std::vector<TypedStmt*>& out) {
    const Type* type = typeOf(declaration->type, declaration->dimensions);
    const StructDecl* definition = declaration->type->definition;
    if (definition && !definition->name.empty())
        mContext.scope.push_back({definition->name, nullptr, structType(definition)});
    Variable* variable = makeVariable(Variable::Storage::LOCAL, declaration->name, type, declaration);
    TypedExpr* value = nullptr;
    mContext.isDeclaredUsed = false;
    if (type && declaration->initializer && !isOpaque(type)) {
        mContext.declared = variable;
        value = initializer(type, declaration->initializer);
        mContext.declared = nullptr;
        variable->type = type;
        if (!value)
            type = nullptr;
    } else if (type && declaration->initializer) {
        TypedExpr* sampler = samplerValue(type, declaration->initializer);
        TypedExpr* preparation = nullptr;
        variable->alias = sampler ? frozen(sampler, preparation) : nullptr;
        if (preparation)
            out.push_back(make(mArena, TypedStmt::Kind::EXPR, preparation));
    }
    const bool isSized = type && !type->isVoid() && (!type->isArray() || type->length != Type::UNSIZED);
    if (type && !isSized)
        mDiagnostics.error(declaration->location,
                           inQuotes(declaration->name) + " cannot be '" + nameOf(type) + "'");
    if (!variable->type)
        variable->type = mTypes.scalar(Scalar::FLOAT); // after an error: the name is known at least
    variable->isConst = declaration->qualifiers.isConst;
    if (variable->isConst && !mContext.isDeclaredUsed)
        variable->initializer = value;
    mContext.scope.push_back({declaration->name, variable, nullptr});
    if (!isSized || isOpaque(variable->type))
        return;
    if (value && containsSampler(variable->type))
        if (TypedExpr* preparation =
                aliasSamplers(declaration->location, mBuild.variable(declaration->location, variable), value))
            out.push_back(make(mArena, TypedStmt::Kind::EXPR, preparation));
    TypedExpr* assigned = nullptr;
    if (value && mContext.isDeclaredUsed) { // GLSL knows the name only behind the initial value
        assigned =
            mBuild.assign(declaration->location, mBuild.variable(declaration->location, variable), value);
        value = nullptr;
    }
    TypedStmt* stmt = make(mArena, TypedStmt::Kind::DECLARE, value);
    stmt->variable = variable;
    out.push_back(stmt);
    if (assigned)
        out.push_back(make(mArena, TypedStmt::Kind::EXPR, assigned));
}

TypedStmt* Resolver::loop(const LoopStmt* stmt) {
    TypedExpr* condition = expression(stmt->condition);
    condition = condition ? mBuild.condition(condition) : nullptr;
    TypedStmt* result = make(
        mArena, stmt->kind == Stmt::Kind::WHILE ? TypedStmt::Kind::WHILE : TypedStmt::Kind::DO, condition);
    ++mContext.loops;
    result->body = {scoped(stmt->body)};
    --mContext.loops;
    return condition ? result : nullptr;
}

TypedStmt* Resolver::forLoop(const ForStmt* stmt) {
    const std::size_t outerScope = mContext.scope.size();
    TypedStmt* result = make(mArena, TypedStmt::Kind::FOR);
    TypedStmt* first = statement(stmt->initializer);
    if (stmt->condition) {
        TypedExpr* condition = expression(stmt->condition);
        result->expression = condition ? mBuild.condition(condition) : nullptr;
    }
    if (stmt->step)
        result->step = expression(stmt->step);
    ++mContext.loops;
    result->body = {first, scoped(stmt->body)};
    --mContext.loops;
    for (std::size_t i = outerScope; i < mContext.scope.size(); ++i)
        if (Variable* variable = mContext.scope[i].variable)
            mContext.pastLoops.push_back({variable, result});
    mContext.scope.resize(outerScope);
    return result;
}

/// The variable of a `for` that is used after its loop, as old C++ allowed: its declaration moves out.
/// @return null where no loop of the blocks around had one of that name
Variable* Resolver::outliveLoop(SourceLocation at, Name name) {
    const auto found = std::find_if(mContext.pastLoops.rbegin(), mContext.pastLoops.rend(),
                                    [name](const LoopVariable& past) { return past.variable->name == name; });
    if (found == mContext.pastLoops.rend())
        return nullptr;
    const auto [variable, loop] = *found;
    const bool isMovedAlready = loop->kind == TypedStmt::Kind::SEQUENCE;
    if (isMovedAlready)
        return variable;
    mDiagnostics.warning(at, inQuotes(name) + " is used after its loop");
    auto* inner = mArena.make<TypedStmt>(*loop);
    TypedStmt* declarations = inner->body[0];
    inner->body[0] = nullptr;
    *loop = TypedStmt(TypedStmt::Kind::SEQUENCE);
    loop->body = {declarations, inner};
    return variable;
}

TypedStmt* Resolver::switchStatement(const SwitchStmt* stmt) {
    TypedExpr* selector = expression(stmt->selector);
    selector = selector ? mBuild.convert(selector, mTypes.scalar(Scalar::INT)) : nullptr;
    if (!selector)
        return nullptr;
    TypedStmt* result = make(mArena, TypedStmt::Kind::SWITCH, selector);
    ++mContext.switches;
    result->body = block(stmt->body)->body;
    --mContext.switches;
    // GLSL wants a statement behind the last label.
    const auto last = std::find_if_not(result->body.rbegin(), result->body.rend(), isEmpty);
    if (last != result->body.rend() && (*last)->kind == TypedStmt::Kind::CASE)
        result->body.push_back(make(mArena, TypedStmt::Kind::BREAK));
    return result;
}

/// `break` and `continue`
TypedStmt* Resolver::leave(const Stmt* stmt) {
    const bool isBreak = stmt->kind == Stmt::Kind::BREAK;
    if (mContext.loops == 0 && !(isBreak && mContext.switches > 0)) {
        mDiagnostics.error(stmt->location, isBreak ? "'break' outside of a loop or a switch"
                                                   : "'continue' outside of a loop");
        return nullptr;
    }
    return make(mArena, isBreak ? TypedStmt::Kind::BREAK : TypedStmt::Kind::CONTINUE);
}

/// A function that gives a value has to say which. GLSL wants a `return` even where all is discarded.
void Resolver::endBody(Function* function, const FunctionDecl* definition) {
    if (function->result->isVoid() || mContext.hasReturn)
        return;
    if (!endsInDiscard(function->body)) {
        mDiagnostics.error(definition->location, "function " + inQuotes(definition->name) +
                                                     " has no 'return' for its '" + nameOf(function->result) +
                                                     "'");
        return;
    }
    TypedStmt* end = make(mArena, TypedStmt::Kind::RETURN);
    end->expression = mBuild.zero(definition->location, function->result);
    function->body->body.push_back(end);
}

TypedStmt* Resolver::returnStatement(const JumpStmt* stmt) {
    mContext.hasReturn = true;
    const Type* wanted = mContext.function->result;
    TypedStmt* result = make(mArena, TypedStmt::Kind::RETURN);
    if (!stmt->value) {
        if (wanted->isVoid())
            return result;
        mDiagnostics.error(stmt->location,
                           "return without a value in a function that gives '" + nameOf(wanted) + "'");
        return nullptr;
    }
    TypedExpr* value = expression(stmt->value);
    if (!value)
        return nullptr;
    if (wanted->isVoid() && value->type->isVoid()) {
        if (TypedStmt* effect = expressionStatement(value))
            mContext.statements->push_back(effect);
        return result;
    }
    if (wanted->isVoid()) {
        mDiagnostics.error(stmt->location, "return with a value in a void function");
        return nullptr;
    }
    result->expression = mBuild.convert(value, wanted);
    return result->expression ? result : nullptr;
}

TypedStmt* Resolver::discardStatement(const JumpStmt* stmt) {
    if (mStage == Stage::VERTEX) {
        mDiagnostics.error(stmt->location, "discard is for fragment programs");
        return nullptr;
    }
    TypedStmt* result = make(mArena, TypedStmt::Kind::DISCARD);
    if (!stmt->value)
        return result;
    TypedExpr* condition = expression(stmt->value);
    if (!condition)
        return nullptr;
    if (condition->type->isVector()) {
        const Type* bools = mTypes.vector(Scalar::BOOL, condition->type->columns);
        condition = mBuild.builtin(stmt->location, mTypes.scalar(Scalar::BOOL), "any($0)",
                                   {mBuild.cast(stmt->location, condition, bools)});
    }
    condition = mBuild.condition(condition);
    if (!condition)
        return nullptr;
    TypedStmt* body = make(mArena, TypedStmt::Kind::BLOCK);
    body->body.push_back(result);
    TypedStmt* branch = make(mArena, TypedStmt::Kind::IF, condition);
    branch->body = {body, nullptr};
    return branch;
}

} // namespace cg
