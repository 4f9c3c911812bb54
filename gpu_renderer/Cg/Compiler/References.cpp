#include <Cg/Compiler/References.h>

#include <cstddef>
#include <string_view>

namespace cg {

namespace {

/// @return the variable that an expression is a part of, and the members on the way; null where it is none
const Variable* walk(const TypedExpr* expression, std::string& path) {
    using Kind = TypedExpr::Kind;
    if (expression->kind == Kind::VARIABLE)
        return expression->variable;
    if (expression->kind != Kind::FIELD && expression->kind != Kind::ELEMENT)
        return nullptr;
    const TypedExpr* object = expression->operands[0];
    const Variable* variable = walk(object, path);
    if (variable && expression->kind == Kind::FIELD)
        path += "." + std::string(
                          object->type->structure->fields[static_cast<std::size_t>(expression->index)].name);
    return variable;
}

} // namespace

References::References(const TypedProgram& program) {
    for (const Function* function : program.functions)
        if (function->body)
            visit(function->body);
    for (const StageValue& value : program.values)
        visit(value.place);
}

void References::note(const Variable* variable, const std::string& path) {
    const bool isNew = mPaths.count(variable) == 0;
    mPaths[variable].insert(path);
    if (isNew && variable->initializer && variable->storage == Variable::Storage::GLOBAL)
        visit(variable->initializer);
    if (isNew && variable->samplerOwner)
        note(variable->samplerOwner, variable->samplerPath);
}

void References::visit(const TypedExpr* expression) {
    std::string path;
    if (const Variable* variable = walk(expression, path)) {
        note(variable, path);
        for (const TypedExpr* part = expression; part->kind != TypedExpr::Kind::VARIABLE;
             part = part->operands[0])
            if (part->kind == TypedExpr::Kind::ELEMENT)
                visit(part->operands[1]);
        return;
    }
    if (expression->kind == TypedExpr::Kind::BUILTIN && expression->variable)
        note(expression->variable, "");
    for (const TypedExpr* operand : expression->operands)
        visit(operand);
}

void References::visit(const TypedStmt* stmt) {
    if (stmt->expression)
        visit(stmt->expression);
    if (stmt->step)
        visit(stmt->step);
    for (const TypedStmt* inner : stmt->body)
        if (inner)
            visit(inner);
}

bool References::uses(const Variable* variable, const std::string& path) const {
    const auto found = mPaths.find(variable);
    if (found == mPaths.end())
        return false;
    const auto& used = found->second;
    for (std::size_t end = 0; end != std::string::npos; end = path.find('.', end + 1)) // what holds it
        if (used.count(std::string_view(path).substr(0, end)) != 0)
            return true;
    if (used.count(path) != 0)
        return true;
    const auto part = used.lower_bound(path + '.'); // of itself
    return part != used.end() && part->compare(0, path.size() + 1, path + '.') == 0;
}

} // namespace cg
