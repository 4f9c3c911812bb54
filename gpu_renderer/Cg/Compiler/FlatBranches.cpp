#include <Cg/Compiler/FlatBranches.h>

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

namespace cg {

namespace {

/// How many stand in a row: half of the levels that drivers take, which leaves the others to what is around
/// and within.
constexpr std::size_t MAX_ROW = 16;

using Kind = TypedStmt::Kind;
using Statements = std::vector<TypedStmt*>;

/// The statements with those of sequences in their place.
Statements withoutSequences(const Statements& statements) {
    Statements result;
    for (TypedStmt* stmt : statements) {
        if (stmt && stmt->kind == Kind::SEQUENCE) {
            const Statements inner = withoutSequences(stmt->body);
            result.insert(result.end(), inner.begin(), inner.end());
        } else if (stmt) {
            result.push_back(stmt);
        }
    }
    return result;
}

/// An `if` and the ones that stand alone behind its `else`.
Statements chainOf(TypedStmt* first) {
    Statements links = {first};
    for (const TypedStmt* otherwise = first->body[1];
         otherwise && otherwise->body.size() == 1 && otherwise->body[0]->kind == Kind::IF;
         otherwise = links.back()->body[1])
        links.push_back(otherwise->body[0]);
    return links;
}

/// Nothing runs on from the statement to the one behind it.
bool isJump(const TypedStmt* stmt) {
    switch (stmt->kind) {
    case Kind::BREAK:
    case Kind::CONTINUE:
    case Kind::RETURN:
        return true;
    case Kind::BLOCK:
    case Kind::SEQUENCE:
        return !stmt->body.empty() && isJump(stmt->body.back());
    case Kind::IF:
        return stmt->body[1] && isJump(stmt->body[0]) && isJump(stmt->body[1]);
    default:
        return false;
    }
}

/// Those that a flag can stand for: a loop's, and those of a `switch` within another, have to stay.
std::size_t countReturns(const TypedStmt* stmt, bool isInSwitch = false) {
    const bool isSwitch = stmt->kind == Kind::SWITCH;
    const bool isEntered = stmt->kind == Kind::BLOCK || stmt->kind == Kind::SEQUENCE ||
                           stmt->kind == Kind::IF || (isSwitch && !isInSwitch);
    std::size_t count = stmt->kind == Kind::RETURN ? 1 : 0;
    if (isEntered)
        for (const TypedStmt* inner : stmt->body)
            count += inner ? countReturns(inner, isInSwitch || isSwitch) : 0;
    return count;
}

/// What of a `switch` runs together: from one label to where nothing runs on to the next.
std::vector<Statements> sectionsOf(const TypedStmt* stmt) {
    std::vector<Statements> sections;
    for (TypedStmt* inner : withoutSequences(stmt->body)) {
        if (sections.empty() || (inner->kind == Kind::CASE && isJump(sections.back().back())))
            sections.emplace_back();
        sections.back().push_back(inner);
    }
    return sections;
}

bool hasDefault(const Statements& section) {
    return std::any_of(section.begin(), section.end(),
                       [](const TypedStmt* stmt) { return stmt->kind == Kind::CASE && !stmt->expression; });
}

class Flattener {
public:
    Flattener(const TypeTable& types, Arena& arena) : mTypes(types), mArena(arena) {}

    void flatten(Function& function) {
        if (countReturns(function.body) > MAX_ROW && !isOpaque(function.result))
            gatherReturns(function);
        visit(function.body);
    }

private:
    TypedStmt* make(Kind kind, TypedExpr* expression = nullptr, Statements body = {}) {
        auto* stmt = mArena.make<TypedStmt>(kind);
        stmt->expression = expression;
        stmt->body = std::move(body);
        return stmt;
    }

    TypedStmt* ifSo(TypedExpr* condition, Statements body) {
        return make(Kind::IF, condition, {make(Kind::BLOCK, nullptr, std::move(body)), nullptr});
    }

    Variable* makeVariable(Name name, const Type* type) {
        auto* variable = mArena.make<Variable>();
        variable->name = name;
        variable->type = type;
        return variable;
    }

    TypedStmt* declare(Variable* variable, TypedExpr* value) {
        TypedStmt* stmt = make(Kind::DECLARE, value);
        stmt->variable = variable;
        return stmt;
    }

    TypedExpr* use(Variable* variable) {
        auto* expression =
            mArena.make<TypedExpr>(TypedExpr::Kind::VARIABLE, SourceLocation(), variable->type);
        expression->variable = variable;
        return expression;
    }

    TypedExpr* truth(bool value) {
        auto* expression = mArena.make<TypedExpr>(TypedExpr::Kind::LITERAL, SourceLocation(), flagType());
        expression->number = value ? 1 : 0;
        return expression;
    }

    TypedExpr* isNot(Variable* flag) {
        auto* expression = mArena.make<TypedExpr>(TypedExpr::Kind::UNARY, SourceLocation(), flagType());
        expression->unary = UnaryOp::NOT;
        expression->operands = {use(flag)};
        return expression;
    }

    TypedStmt* set(Variable* variable, TypedExpr* value) {
        auto* expression = mArena.make<TypedExpr>(TypedExpr::Kind::ASSIGN, SourceLocation(), variable->type);
        expression->operands = {use(variable), value};
        return make(Kind::EXPR, expression);
    }

    const Type* flagType() const { return mTypes.scalar(Scalar::BOOL); }

    /// Moves a declaration to those of what is around; its initial value stays.
    void moveOut(const TypedStmt* declaration, Statements& around, Statements& here) {
        around.push_back(declare(declaration->variable, nullptr));
        if (declaration->expression)
            here.push_back(set(declaration->variable, declaration->expression));
    }

    // ------------------------------------------------------------------------------------------ returns

    /// A function with many returns gets a single one, at its end.
    void gatherReturns(Function& function) {
        const bool isVoid = function.result->isVoid();
        mResult = isVoid ? nullptr : makeVariable("returned", function.result);
        mIsOver = makeVariable("isOver", flagType());
        mDeclarations = {declare(mIsOver, truth(false))};
        if (mResult)
            mDeclarations.push_back(declare(mResult, nullptr));
        Statements& body = function.body->body;
        guard(body);
        body.insert(body.begin(), mDeclarations.begin(), mDeclarations.end());
        if (mResult)
            body.push_back(make(Kind::RETURN, use(mResult)));
    }

    /// Sets what comes behind a statement that may have returned behind an `if`.
    /// @return whether one of the statements may have returned
    bool guard(Statements& statements) {
        Statements guarded;
        Statements* row = &guarded;
        bool isOpen = true;
        for (TypedStmt* stmt : withoutSequences(statements)) {
            if (!isOpen) {
                guarded.push_back(ifSo(isNot(mIsOver), {}));
                row = &guarded.back()->body[0]->body;
            }
            if (row != &guarded && stmt->kind == Kind::DECLARE)
                moveOut(stmt, mDeclarations, *row);
            else
                row->push_back(stmt);
            isOpen = !replaceReturns(stmt, false);
        }
        const bool mayReturn = row != &guarded || !isOpen;
        statements = std::move(guarded);
        return mayReturn;
    }

    /// @return whether there was one
    bool replaceReturns(TypedStmt* stmt, bool isInSwitch) {
        bool isFound = false;
        switch (stmt->kind) {
        case Kind::RETURN: {
            Statements steps = {set(mIsOver, truth(true))};
            if (stmt->expression)
                steps.insert(steps.begin(), set(mResult, stmt->expression));
            if (isInSwitch)
                steps.push_back(make(Kind::BREAK));
            *stmt = TypedStmt(Kind::SEQUENCE);
            stmt->body = std::move(steps);
            return true;
        }
        case Kind::SWITCH:
            if (isInSwitch)
                return false;
            isInSwitch = true;
            break;
        case Kind::BLOCK:
            if (!isInSwitch)
                return guard(stmt->body);
            break;
        case Kind::SEQUENCE:
        case Kind::IF:
            break;
        default:
            return false;
        }
        for (TypedStmt* inner : stmt->body)
            isFound = (inner && replaceReturns(inner, isInSwitch)) || isFound;
        return isFound;
    }

    // ------------------------------------------------------------------------------- chains and switches

    void visit(TypedStmt* stmt) {
        if (stmt->kind == Kind::IF)
            return visitChain(stmt);
        for (TypedStmt* inner : stmt->body)
            if (inner)
                visit(inner);
        if (stmt->kind == Kind::SWITCH)
            splitSwitch(stmt);
    }

    void visitChain(TypedStmt* stmt) {
        Statements links = chainOf(stmt);
        for (const TypedStmt* link : links)
            visit(link->body[0]);
        if (TypedStmt* otherwise = links.back()->body[1])
            visit(otherwise);
        if (links.size() <= MAX_ROW)
            return;
        links[0] = mArena.make<TypedStmt>(*stmt);
        Variable* rest = makeVariable("rest", flagType());
        Statements rows;
        for (std::size_t i = 0; i < links.size(); i += MAX_ROW) {
            if (i + MAX_ROW < links.size())
                links[i + MAX_ROW - 1]->body[1] = make(Kind::BLOCK, nullptr, {set(rest, truth(true))});
            rows.push_back(links[i]);
        }
        *stmt = TypedStmt(Kind::BLOCK);
        stmt->body = {declare(rest, truth(false))};
        add(rows, rest, stmt->body);
    }

    /// Rows each of which sets the flag where it leaves the choice to the next.
    void add(const Statements& rows, Variable* rest, Statements& to) {
        for (TypedStmt* row : rows) {
            if (row == rows.front())
                to.push_back(row);
            else if (row == rows.back())
                to.push_back(ifSo(use(rest), {row}));
            else
                to.push_back(ifSo(use(rest), {set(rest, truth(false)), row}));
        }
    }

    void splitSwitch(TypedStmt* stmt) {
        std::vector<Statements> sections = sectionsOf(stmt);
        if (sections.size() <= MAX_ROW || sections[0][0]->kind != Kind::CASE)
            return;
        if (!isJump(sections.back().back()))
            sections.back().push_back(make(Kind::BREAK));
        std::stable_partition(sections.begin(), sections.end(),
                              [](const Statements& section) { return !hasDefault(section); });
        Variable* selector = makeVariable("selector", stmt->expression->type);
        Variable* rest = makeVariable("rest", flagType());
        Statements body = {declare(selector, stmt->expression), declare(rest, truth(false))};
        Statements rows;
        for (std::size_t i = 0; i < sections.size(); ++i) {
            if (i % MAX_ROW == 0)
                rows.push_back(make(Kind::SWITCH, use(selector)));
            Statements& row = rows.back()->body;
            for (TypedStmt* inner : sections[i]) {
                if (inner->kind == Kind::DECLARE)
                    moveOut(inner, body, row);
                else
                    row.push_back(inner);
            }
            if (i % MAX_ROW == MAX_ROW - 1 && i + 1 < sections.size()) {
                row.push_back(make(Kind::CASE));
                row.push_back(set(rest, truth(true)));
            }
        }
        *stmt = TypedStmt(Kind::BLOCK);
        stmt->body = std::move(body);
        add(rows, rest, stmt->body);
    }

    const TypeTable& mTypes;
    Arena& mArena;
    Variable* mResult = nullptr; ///< of the function at hand; null for void
    Variable* mIsOver = nullptr; ///< it has returned
    Statements mDeclarations;    ///< to be put at its start
};

} // namespace

void flattenBranches(TypedProgram& program, const TypeTable& types, Arena& arena) {
    Flattener flattener(types, arena);
    for (Function* function : program.functions)
        if (function->body)
            flattener.flatten(*function);
}

} // namespace cg
