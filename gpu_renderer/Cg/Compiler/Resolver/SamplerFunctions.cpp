#include <Cg/Compiler/Resolver/SamplerFunctions.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Overloads.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>

#include <utility>

namespace cg {

namespace {

/// What the functions choose by is written as often as they use it.
constexpr int MAX_CALLS = 1024;       ///< in a whole program
constexpr int MAX_CHOICE_NODES = 200; ///< of one argument

/// The nodes of an expression as it is written out; counts no further than the limit.
int countNodes(const TypedExpr* expression, int limit) {
    int count = 1;
    for (const TypedExpr* operand : expression->operands)
        if (count < limit)
            count += countNodes(operand, limit - count);
    return count;
}

/// The statements that run where some come in place of the first one of a body.
std::vector<Stmt*> withFirst(const std::vector<Stmt*>& first, const std::vector<Stmt*>& body) {
    std::vector<Stmt*> statements = first;
    statements.insert(statements.end(), body.begin() + 1, body.end());
    return statements;
}

} // namespace

TypedExpr* SamplerFunctions::call(SourceLocation at, const FunctionDecl* declaration,
                                  const std::vector<TypedExpr*>& arguments) {
    const FunctionDecl* definition = findDefinition(at, declaration);
    if (!definition)
        return nullptr;
    FunctionContext context;
    context.function = mResolution.context.function;
    context.ordinal = mDeclarations.ordinal(definition);
    if (!bind(definition, arguments, context))
        return nullptr;
    const CallChange change(mResolution, std::move(context));
    std::size_t ways = 0;
    return chosen(definition, definition->body->statements, ways);
}

const FunctionDecl* SamplerFunctions::findDefinition(SourceLocation at, const FunctionDecl* declaration) {
    const FunctionDecl* definition = mOverloads.definitionOf(declaration);
    const char* reason = nullptr;
    if (!definition)
        reason = " is declared but not defined";
    else if (mResolution.callDepth >= MAX_CALL_DEPTH)
        reason = " calls itself";
    else if (++mCalls > MAX_CALLS)
        reason = " gives a sampler too often";
    if (!reason)
        return definition;
    mResolution.diagnostics.error(at, inQuotes(declaration->name) + reason);
    return nullptr;
}

/// Lets the parameters stand for the arguments.
/// @return false after an error
bool SamplerFunctions::bind(const FunctionDecl* definition, const std::vector<TypedExpr*>& arguments,
                            FunctionContext& context) {
    const std::vector<const Type*> parameters = mOverloads.signatureOf(definition).parameters;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const VariableDecl* parameter = definition->parameters[i];
        Variable* variable =
            mResolution.makeVariable(Variable::Storage::LOCAL, parameter->name, parameters[i], parameter);
        variable->alias = mResolution.build.convert(arguments[i], parameters[i]);
        if (!variable->alias)
            return false;
        const bool isLong = countNodes(variable->alias, MAX_CHOICE_NODES) >= MAX_CHOICE_NODES;
        if (isLong || hasEffect(variable->alias) || directionOf(parameter) != Direction::IN) {
            mResolution.diagnostics.error(
                arguments[i]->location,
                isLong ? "this is too long to choose a sampler by"
                       : "a function that gives a sampler takes only values to choose by");
            return false;
        }
        context.variables.declare(parameter->name, variable);
    }
    return true;
}

/// What statements give, one after another.
/// @param ways  counts the ways through the function
TypedExpr* SamplerFunctions::chosen(const FunctionDecl* definition, const std::vector<Stmt*>& body,
                                    std::size_t& ways) {
    Diagnostics& diagnostics = mResolution.diagnostics;
    if (++ways > 2 * MAX_SAMPLER_CHOICES) {
        diagnostics.error(definition->location, "too many ways through a function that gives a sampler");
        return nullptr;
    }
    if (body.empty()) {
        diagnostics.error(definition->location, "a way through this function gives no sampler");
        return nullptr;
    }
    const Stmt* stmt = body[0];
    if (stmt->kind == Stmt::Kind::BLOCK)
        return chosen(definition, withFirst(static_cast<const BlockStmt*>(stmt)->statements, body), ways);
    if (stmt->kind == Stmt::Kind::RETURN && static_cast<const JumpStmt*>(stmt)->value) {
        TypedExpr* value = mRecursion.expression(static_cast<const JumpStmt*>(stmt)->value);
        return value ? mResolution.build.convert(value, mOverloads.signatureOf(definition).result) : nullptr;
    }
    if (stmt->kind == Stmt::Kind::IF)
        return chosenByIf(definition, body, ways);
    diagnostics.error(stmt->location, "a function that gives a sampler can hold only 'if' and 'return'");
    return nullptr;
}

/// @param body  starts with the `if`; what follows it follows both of its branches
TypedExpr* SamplerFunctions::chosenByIf(const FunctionDecl* definition, const std::vector<Stmt*>& body,
                                        std::size_t& ways) {
    const auto* branch = static_cast<const IfStmt*>(body[0]);
    const auto after = [&](Stmt* taken) {
        return chosen(definition, withFirst(taken ? std::vector<Stmt*>{taken} : std::vector<Stmt*>(), body),
                      ways);
    };
    TypedExpr* condition = mRecursion.expression(branch->condition);
    TypedExpr* whenTrue = condition ? after(branch->thenBranch) : nullptr;
    TypedExpr* whenFalse = whenTrue ? after(branch->elseBranch) : nullptr;
    return whenFalse ? mResolution.build.conditional(branch->location, condition, whenTrue, whenFalse)
                     : nullptr;
}

} // namespace cg
