#include <Cg/Compiler/GlslFunctions.h>

#include <Cg/Compiler/GlslExpressions.h>
#include <Cg/Compiler/GlslSymbols.h>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// The `if` that stands alone behind an `else`; null where there is none.
const TypedStmt* chained(const TypedStmt* stmt) {
    const TypedStmt* otherwise = stmt->body[1];
    const bool isChained =
        otherwise && otherwise->body.size() == 1 && otherwise->body[0]->kind == TypedStmt::Kind::IF;
    return isChained ? otherwise->body[0] : nullptr;
}

} // namespace

void GlslFunctions::add(const Function& function) {
    mSymbols.openScope();
    std::string parameters;
    for (const Variable* parameter : function.parameters) {
        constexpr const char* DIRECTIONS[] = {"", "", "out ", "inout "};
        parameters += (parameters.empty() ? "" : ", ") +
                      std::string(DIRECTIONS[static_cast<std::size_t>(parameter->direction)]) +
                      mSymbols.declare(parameter->type, mSymbols.variableName(parameter));
    }
    line(mSymbols.arrayTypeName(function.result) + " " + mSymbols.functionName(&function) + "(" + parameters +
         ") {");
    ++mIndent;
    for (const Variable* variable : function.temporaries)
        line(mSymbols.declare(variable->type, mSymbols.variableName(variable)) + ";");
    if (function.body)
        for (const TypedStmt* stmt : function.body->body)
            statement(stmt);
    --mIndent;
    line("}");
    line("");
    mSymbols.closeScope();
}

void GlslFunctions::line(const std::string& text) {
    if (!text.empty())
        mText.append(static_cast<std::size_t>(mIndent) * 4, ' ');
    mText += text;
    mText += '\n';
}

void GlslFunctions::block(const std::vector<TypedStmt*>& body) {
    mSymbols.openScope();
    ++mIndent;
    for (const TypedStmt* stmt : body)
        if (stmt)
            statement(stmt);
    --mIndent;
    mSymbols.closeScope();
}

/// Statements in braces.
/// @param head  what stands before them, with the `{`
void GlslFunctions::enclosed(const std::string& head, const std::vector<TypedStmt*>& body) {
    line(head);
    block(body);
    line("}");
}

void GlslFunctions::statement(const TypedStmt* stmt) {
    using StmtKind = TypedStmt::Kind;
    switch (stmt->kind) {
    case StmtKind::BLOCK:
        enclosed("{", stmt->body);
        break;
    case StmtKind::SEQUENCE:
        for (const TypedStmt* inner : stmt->body)
            statement(inner);
        break;
    case StmtKind::DECLARE:
        declaration(stmt);
        break;
    case StmtKind::EXPR:
        effect(stmt->expression);
        break;
    case StmtKind::IF:
        branch(stmt);
        break;
    case StmtKind::FOR:
        forLoop(stmt);
        break;
    case StmtKind::WHILE:
        enclosed("while (" + mExpressions.whole(stmt->expression) + ") {", stmt->body[0]->body);
        break;
    case StmtKind::DO:
        doLoop(stmt);
        break;
    case StmtKind::SWITCH:
        enclosed("switch (" + mExpressions.whole(stmt->expression) + ") {", stmt->body);
        break;
    case StmtKind::CASE:
    case StmtKind::RETURN:
    case StmtKind::DISCARD:
    case StmtKind::BREAK:
    case StmtKind::CONTINUE:
        line(jump(stmt));
        break;
    }
}

/// A statement of one word, with or without a value.
std::string GlslFunctions::jump(const TypedStmt* stmt) {
    switch (stmt->kind) {
    case TypedStmt::Kind::CASE:
        return stmt->expression ? "case " + mExpressions.whole(stmt->expression) + ":" : "default:";
    case TypedStmt::Kind::RETURN:
        return stmt->expression ? "return " + mExpressions.whole(stmt->expression) + ";" : "return;";
    case TypedStmt::Kind::DISCARD:
        return "discard;";
    case TypedStmt::Kind::BREAK:
        return "break;";
    default:
        return "continue;";
    }
}

/// An `if` with all its `else if`.
void GlslFunctions::branch(const TypedStmt* stmt) {
    line("if (" + mExpressions.whole(stmt->expression) + ") {");
    block(stmt->body[0]->body);
    const TypedStmt* last = stmt;
    for (const TypedStmt* next = chained(last); next; next = chained(last)) {
        line("} else if (" + mExpressions.whole(next->expression) + ") {");
        block(next->body[0]->body);
        last = next;
    }
    if (last->body[1]) {
        line("} else {");
        block(last->body[1]->body);
    }
    line("}");
}

/// ` = 1.0`; nothing where a declaration has none.
std::string GlslFunctions::initialValue(const TypedStmt* stmt) {
    return stmt->expression ? " = " + mExpressions.value(stmt->expression) : "";
}

void GlslFunctions::declaration(const TypedStmt* stmt) {
    const std::string value = initialValue(stmt);
    line(mSymbols.declare(stmt->variable->type, mSymbols.variableName(stmt->variable)) + value + ";");
}

/// An expression for its effect; the steps of a comma one after another.
void GlslFunctions::effect(const TypedExpr* expression) {
    if (expression->kind == Kind::BINARY && expression->binary == BinaryOp::COMMA) {
        effect(expression->operands[0]);
        effect(expression->operands[1]);
        return;
    }
    if (expression->kind == Kind::CONDITIONAL && expression->type->isVoid()) {
        line("if (" + mExpressions.whole(expression->operands[0]) + ") {");
        for (std::size_t i = 1; i < expression->operands.size(); ++i) {
            ++mIndent;
            effect(expression->operands[i]);
            --mIndent;
            line(i == 1 ? "} else {" : "}");
        }
        return;
    }
    if (expression->kind != Kind::VARIABLE && expression->kind != Kind::LITERAL)
        line(mExpressions.whole(expression) + ";");
}

void GlslFunctions::doLoop(const TypedStmt* stmt) {
    line("do {");
    block(stmt->body[0]->body);
    line("} while (" + mExpressions.whole(stmt->expression) + ");");
}

/// What stands first in a for's parentheses, or nothing where it cannot stand there.
std::string GlslFunctions::forInitializer(const TypedStmt* stmt) {
    if (stmt->kind == TypedStmt::Kind::EXPR)
        return mExpressions.whole(stmt->expression);
    const Type* type = nullptr;
    for (const TypedStmt* inner : stmt->body) {
        const bool fits = inner->kind == TypedStmt::Kind::DECLARE && !inner->variable->type->isArray() &&
                          (!type || type == inner->variable->type);
        if (!fits)
            return "";
        type = inner->variable->type;
    }
    if (!type)
        return "";
    std::string text = mSymbols.typeName(type) + " ";
    for (const TypedStmt* inner : stmt->body) {
        const std::string value = initialValue(inner);
        text += (inner == stmt->body[0] ? "" : ", ") + mSymbols.variableName(inner->variable) + value;
    }
    return text;
}

void GlslFunctions::forLoop(const TypedStmt* stmt) {
    mSymbols.openScope();
    const TypedStmt* first = stmt->body[0];
    const std::string head = first ? forInitializer(first) : "";
    const bool isApart = first && head.empty();
    if (isApart) {
        line("{");
        ++mIndent;
        statement(first);
    }
    const std::string condition = stmt->expression ? " " + mExpressions.whole(stmt->expression) : "";
    const std::string step = stmt->step ? " " + mExpressions.whole(stmt->step) : "";
    enclosed("for (" + head + ";" + condition + ";" + step + ") {", stmt->body[1]->body);
    if (isApart) {
        --mIndent;
        line("}");
    }
    mSymbols.closeScope();
}

} // namespace cg
