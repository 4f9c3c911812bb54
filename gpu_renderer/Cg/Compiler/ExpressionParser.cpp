#include <Cg/Compiler/ExpressionParser.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/NumberSpelling.h>

#include <algorithm>
#include <array>
#include <limits>
#include <optional>

namespace cg {

namespace {

/// Height of an expression's tree, which long sums make high without nesting.
constexpr int MAX_HEIGHT = 600;

/// Words that may stand before `int` and mean no more than it does.
bool isSizeWord(Name word) {
    return word == "unsigned" || word == "signed" || word == "short" || word == "long";
}

bool isIntegerWord(Name word) {
    return isSizeWord(word) || word == "int" || word == "int2" || word == "int3" || word == "int4" ||
           word == "char";
}

struct InfixOperator {
    TokenKind token;
    BinaryOp op;
    int precedence;
};

constexpr int LOWEST_PRECEDENCE = 1;

constexpr std::array INFIX_OPERATORS{
    InfixOperator{TokenKind::OR_OR, BinaryOp::OR, 1},
    InfixOperator{TokenKind::AND_AND, BinaryOp::AND, 2},
    InfixOperator{TokenKind::BAR, BinaryOp::BIT_OR, 3},
    InfixOperator{TokenKind::CARET, BinaryOp::BIT_XOR, 4},
    InfixOperator{TokenKind::AMPERSAND, BinaryOp::BIT_AND, 5},
    InfixOperator{TokenKind::EQUAL_EQUAL, BinaryOp::EQUAL, 6},
    InfixOperator{TokenKind::NOT_EQUAL, BinaryOp::NOT_EQUAL, 6},
    InfixOperator{TokenKind::LESS, BinaryOp::LESS, 7},
    InfixOperator{TokenKind::GREATER, BinaryOp::GREATER, 7},
    InfixOperator{TokenKind::LESS_EQUAL, BinaryOp::LESS_EQUAL, 7},
    InfixOperator{TokenKind::GREATER_EQUAL, BinaryOp::GREATER_EQUAL, 7},
    InfixOperator{TokenKind::SHIFT_LEFT, BinaryOp::SHIFT_LEFT, 8},
    InfixOperator{TokenKind::SHIFT_RIGHT, BinaryOp::SHIFT_RIGHT, 8},
    InfixOperator{TokenKind::PLUS, BinaryOp::ADD, 9},
    InfixOperator{TokenKind::MINUS, BinaryOp::SUBTRACT, 9},
    InfixOperator{TokenKind::STAR, BinaryOp::MULTIPLY, 10},
    InfixOperator{TokenKind::SLASH, BinaryOp::DIVIDE, 10},
    InfixOperator{TokenKind::PERCENT, BinaryOp::MODULO, 10},
};

const InfixOperator* infixOperator(TokenKind kind) {
    const auto* const found =
        std::find_if(INFIX_OPERATORS.begin(), INFIX_OPERATORS.end(),
                     [kind](const InfixOperator& infix) { return infix.token == kind; });
    return found == INFIX_OPERATORS.end() ? nullptr : found;
}

struct CompoundAssignment {
    TokenKind token;
    BinaryOp op;
};

constexpr std::array COMPOUND_ASSIGNMENTS{
    CompoundAssignment{TokenKind::PLUS_ASSIGN, BinaryOp::ADD},
    CompoundAssignment{TokenKind::MINUS_ASSIGN, BinaryOp::SUBTRACT},
    CompoundAssignment{TokenKind::STAR_ASSIGN, BinaryOp::MULTIPLY},
    CompoundAssignment{TokenKind::SLASH_ASSIGN, BinaryOp::DIVIDE},
    CompoundAssignment{TokenKind::PERCENT_ASSIGN, BinaryOp::MODULO},
    CompoundAssignment{TokenKind::SHIFT_LEFT_ASSIGN, BinaryOp::SHIFT_LEFT},
    CompoundAssignment{TokenKind::SHIFT_RIGHT_ASSIGN, BinaryOp::SHIFT_RIGHT},
    CompoundAssignment{TokenKind::AND_ASSIGN, BinaryOp::BIT_AND},
    CompoundAssignment{TokenKind::XOR_ASSIGN, BinaryOp::BIT_XOR},
    CompoundAssignment{TokenKind::OR_ASSIGN, BinaryOp::BIT_OR},
};

std::optional<UnaryOp> prefixOperator(TokenKind kind) {
    switch (kind) {
    case TokenKind::PLUS:
        return UnaryOp::PLUS;
    case TokenKind::MINUS:
        return UnaryOp::NEGATE;
    case TokenKind::NOT:
        return UnaryOp::NOT;
    case TokenKind::TILDE:
        return UnaryOp::COMPLEMENT;
    case TokenKind::PLUS_PLUS:
        return UnaryOp::PRE_INCREMENT;
    case TokenKind::MINUS_MINUS:
        return UnaryOp::PRE_DECREMENT;
    default:
        return std::nullopt;
    }
}

} // namespace

ExpressionParser::ExpressionParser(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics)
    : TokenCursor(tokens, diagnostics), mArena(arena), mTypes(arena), mScopes(mTypes) {}

void ExpressionParser::setHeight(int height) {
    mHeight = height;
    if (height <= MAX_HEIGHT)
        return;
    mDiagnostics.error(token().location,
                       "this expression has more than " + std::to_string(MAX_HEIGHT) + " operators in a row");
    throw SyntaxError();
}

// ----------------------------------------------------------------------------------------------- types

bool ExpressionParser::isTypeName(std::size_t ahead) const {
    const Token& name = token(ahead);
    if (name.kind != TokenKind::NAME)
        return false;
    if (name.text == "struct" || (name.text == "signed" && !mScopes.isVariableOrFunction(name.text)))
        return true;
    if (behindTemplate(ahead) > ahead)
        return true;
    return mScopes.isType(name.text);
}

/// @return behind `vector<float, 3>` or `matrix<float, 4, 4>`, or `ahead` where there is none
std::size_t ExpressionParser::behindTemplate(std::size_t ahead) const {
    const Name word = token(ahead).text;
    if ((word != "vector" && word != "matrix") || !isAt(TokenKind::LESS, ahead + 1) ||
        mScopes.isDeclared(word))
        return ahead;
    std::size_t at = ahead + 2;
    if (!isAt(TokenKind::NAME, at++))
        return ahead;
    for (int sizes = word == "vector" ? 1 : 2; sizes > 0; --sizes) {
        if (!isAt(TokenKind::COMMA, at) || !isAt(TokenKind::NUMBER, at + 1))
            return ahead;
        at += 2;
    }
    return isAt(TokenKind::GREATER, at) ? at + 1 : ahead;
}

/// `vector<float, 3>` is float3.
TypeSyntax* ExpressionParser::parseTemplate(std::size_t behind) {
    auto* const type = make<TypeSyntax>(token().location);
    const std::size_t rows = 4;
    std::string name(token(2).text);
    name += token(rows).text;
    if (isAt(TokenKind::COMMA, rows + 1))
        name.append("x").append(token(rows + 2).text);
    type->name = mArena.keep(name);
    for (std::size_t i = 0; i < behind; ++i)
        pass();
    return type;
}

TypeSyntax* ExpressionParser::parseTypeName() {
    if (const std::size_t behind = behindTemplate(0); behind > 0)
        return parseTemplate(behind);
    takeWord("struct");
    Token name = expectName("a type");
    auto* const type = make<TypeSyntax>(name.location);
    while (isSizeWord(name.text)) {
        type->isUnsigned = type->isUnsigned || name.text == "unsigned";
        const bool goesOn = isAt(TokenKind::NAME) && isIntegerWord(token().text);
        const bool isNone = name.text == "unsigned" || name.text == "signed";
        if (!goesOn && isNone)
            name.text = "int";
        if (!goesOn)
            break;
        name = token();
        pass();
    }
    type->name = name.text;
    return type;
}

std::vector<Expr*> ExpressionParser::parseDimensions() {
    std::vector<Expr*> dimensions;
    while (take(TokenKind::LEFT_BRACKET)) {
        dimensions.push_back(isAt(TokenKind::RIGHT_BRACKET) ? nullptr : parseExpression());
        expect(TokenKind::RIGHT_BRACKET, "after an array's size");
    }
    return dimensions;
}

// ----------------------------------------------------------------------------------------- expressions

Expr* ExpressionParser::parseExpression() {
    Expr* left = parseAssignment();
    int height = mHeight;
    while (isAt(TokenKind::COMMA)) {
        auto* const comma = make<BinaryExpr>(token().location);
        pass();
        comma->op = BinaryOp::COMMA;
        comma->left = left;
        comma->right = parseAssignment();
        setHeight(height = std::max(height, mHeight) + 1);
        left = comma;
    }
    return left;
}

Expr* ExpressionParser::parseAssignment() {
    const Level level(*this);
    Expr* const target = parseConditional();
    const int height = mHeight;
    const Token op = token();
    const auto* const compound =
        std::find_if(COMPOUND_ASSIGNMENTS.begin(), COMPOUND_ASSIGNMENTS.end(),
                     [&op](const CompoundAssignment& one) { return one.token == op.kind; });
    const bool isCompound = compound != COMPOUND_ASSIGNMENTS.end();
    if (!isCompound && op.kind != TokenKind::ASSIGN)
        return target;
    pass();
    auto* const assignment = make<AssignExpr>(op.location);
    assignment->target = target;
    assignment->isCompound = isCompound;
    if (isCompound)
        assignment->op = compound->op;
    assignment->value = parseAssignment();
    setHeight(std::max(height, mHeight) + 1);
    return assignment;
}

Expr* ExpressionParser::parseConditional() {
    Expr* const condition = parseBinary(LOWEST_PRECEDENCE);
    if (!isAt(TokenKind::QUESTION))
        return condition;
    int height = mHeight;
    auto* const conditional = make<ConditionalExpr>(condition->location);
    pass();
    conditional->condition = condition;
    conditional->whenTrue = parseExpression();
    height = std::max(height, mHeight);
    expect(TokenKind::COLON, "between the two values of '?'");
    conditional->whenFalse = parseAssignment();
    setHeight(std::max(height, mHeight) + 1);
    return conditional;
}

Expr* ExpressionParser::parseBinary(int lowest) {
    Expr* left = parseUnary();
    int height = mHeight;
    for (const InfixOperator* infix = infixOperator(token().kind);
         infix != nullptr && infix->precedence >= lowest; infix = infixOperator(token().kind)) {
        auto* const binary = make<BinaryExpr>(token().location);
        pass();
        binary->op = infix->op;
        binary->left = left;
        binary->right = parseBinary(infix->precedence + 1);
        setHeight(height = std::max(height, mHeight) + 1);
        left = binary;
    }
    mHeight = height;
    return left;
}

Expr* ExpressionParser::parseUnary() {
    if (isAtCast())
        return parseCast();
    const std::optional<UnaryOp> op = prefixOperator(token().kind);
    if (!op)
        return parsePostfix();
    const Level level(*this);
    auto* const unary = make<UnaryExpr>(token().location);
    pass();
    unary->op = *op;
    unary->operand = parseUnary();
    setHeight(mHeight + 1);
    return unary;
}

bool ExpressionParser::isAtCast() const {
    if (!isAt(TokenKind::LEFT_PAREN))
        return false;
    std::size_t at = isAtWord("const", 1) ? 2 : 1;
    if (!isTypeName(at))
        return false;
    for (at = std::max(at + 1, behindTemplate(at)); isAt(TokenKind::NAME, at); ++at)
        if (!isAtWord("struct", at - 1) && !isIntegerWord(token(at).text))
            return false;
    return isAt(TokenKind::RIGHT_PAREN, behindBrackets(at));
}

Expr* ExpressionParser::parseCast() {
    const Level level(*this);
    auto* const cast = make<CastExpr>(token().location);
    pass();
    takeWord("const");
    cast->type = parseTypeName();
    cast->type->dimensions = parseDimensions();
    expect(TokenKind::RIGHT_PAREN, "after the type of a cast");
    cast->operand = parseUnary();
    setHeight(mHeight + 1);
    return cast;
}

Expr* ExpressionParser::parsePostfix() {
    Expr* object = parsePrimary();
    for (;;) {
        if (isAt(TokenKind::DOT)) {
            pass();
            auto* const member = make<MemberExpr>(token().location);
            member->object = object;
            if (!isAt(TokenKind::NAME))
                fail("a member or a swizzle after '.'");
            member->name = token().text;
            pass();
            object = member;
        } else if (isAt(TokenKind::LEFT_BRACKET)) {
            object = parseIndex(object);
        } else if (isAt(TokenKind::LEFT_PAREN) &&
                   (object->kind == Expr::Kind::NAME || object->kind == Expr::Kind::MEMBER)) {
            object = parseCall(object);
        } else if (isAt(TokenKind::PLUS_PLUS) || isAt(TokenKind::MINUS_MINUS)) {
            auto* const unary = make<UnaryExpr>(token().location);
            unary->op = isAt(TokenKind::PLUS_PLUS) ? UnaryOp::POST_INCREMENT : UnaryOp::POST_DECREMENT;
            unary->operand = object;
            pass();
            object = unary;
        } else {
            return object;
        }
        setHeight(mHeight + 1);
    }
}

Expr* ExpressionParser::parseIndex(Expr* object) {
    const int height = mHeight;
    auto* const index = make<IndexExpr>(object->location);
    pass();
    index->object = object;
    index->index = parseExpression();
    expect(TokenKind::RIGHT_BRACKET, "after an index");
    mHeight = std::max(height, mHeight);
    return index;
}

Expr* ExpressionParser::parseCall(Expr* callee) {
    const int height = mHeight;
    auto* const call = make<CallExpr>(callee->location);
    call->callee = callee;
    call->arguments = parseArguments();
    mHeight = std::max(height, mHeight);
    return call;
}

/// From the `(` to behind the `)`; leaves the height of the highest argument.
std::vector<Expr*> ExpressionParser::parseArguments() {
    std::vector<Expr*> arguments;
    int height = 0;
    pass();
    while (!isAt(TokenKind::RIGHT_PAREN)) {
        if (!arguments.empty() && !take(TokenKind::COMMA))
            fail("',' or ')' after an argument");
        arguments.push_back(parseAssignment());
        height = std::max(height, mHeight);
    }
    pass();
    mHeight = height;
    return arguments;
}

bool ExpressionParser::isAtConstructor() const {
    if (!isTypeName())
        return false;
    std::size_t at = std::max<std::size_t>(1, behindTemplate(0));
    while (isSizeWord(token(at - 1).text) && isAt(TokenKind::NAME, at) && isIntegerWord(token(at).text))
        ++at;
    return isAt(TokenKind::LEFT_PAREN, behindBrackets(at));
}

Expr* ExpressionParser::parsePrimary() {
    mHeight = 1;
    const Token& first = token();
    if (first.kind == TokenKind::NUMBER)
        return parseNumber();
    if (first.kind == TokenKind::TEXT) {
        auto* const text = make<LiteralExpr>(first.location);
        text->type = LiteralExpr::Type::TEXT;
        text->text = first.text.substr(1, first.text.size() - 2);
        pass();
        return text;
    }
    if (isAtConstructor()) {
        auto* const construct = make<ConstructExpr>(first.location);
        construct->type = parseTypeName();
        construct->type->dimensions = parseDimensions();
        construct->arguments = parseArguments();
        setHeight(mHeight + 1);
        return construct;
    }
    if (first.kind == TokenKind::NAME)
        return parseName();
    if (!take(TokenKind::LEFT_PAREN))
        fail("an expression");
    Expr* const inner = parseExpression();
    expect(TokenKind::RIGHT_PAREN, "to close this parenthesis");
    return inner;
}

Expr* ExpressionParser::parseName() {
    const Token first = token();
    if (first.text == "true" || first.text == "false") {
        auto* const literal = make<LiteralExpr>(first.location);
        literal->type = LiteralExpr::Type::BOOL;
        literal->number = first.text == "true" ? 1 : 0;
        pass();
        return literal;
    }
    auto* const name = make<NameExpr>(first.location);
    name->name = expectName("an expression").text;
    return name;
}

Expr* ExpressionParser::parseNumber() {
    using Kind = NumberSpelling::Kind;
    const Token first = token();
    const NumberSpelling number = readNumber(first.text);
    pass();
    auto* const literal = make<LiteralExpr>(first.location);
    literal->number = number.value;
    switch (number.kind) {
    case Kind::INVALID:
        mDiagnostics.error(first.location, "no number: " + inQuotes(first.text));
        throw SyntaxError();
    case Kind::INTEGER:
    case Kind::UNSIGNED:
        literal->type = number.kind == Kind::UNSIGNED ? LiteralExpr::Type::UNSIGNED : LiteralExpr::Type::INT;
        if (number.integer > std::numeric_limits<std::uint32_t>::max()) {
            literal->type = LiteralExpr::Type::FLOAT;
            mDiagnostics.warning(first.location, "this number is too large for an int: taken as a float");
        }
        break;
    case Kind::FLOAT:
        literal->type = LiteralExpr::Type::FLOAT;
        break;
    case Kind::HALF:
        literal->type = LiteralExpr::Type::HALF;
        break;
    case Kind::FIXED:
        literal->type = LiteralExpr::Type::FIXED;
        break;
    }
    return parseGluedSwizzles(first, number.length, literal);
}

/// `.xxx.y` behind a number, which the lexer takes as a part of it.
Expr* ExpressionParser::parseGluedSwizzles(const Token& number, std::size_t at, Expr* value) {
    while (at < number.text.size()) {
        const std::size_t end = std::min(number.text.find('.', at + 1), number.text.size());
        SourceLocation swizzleAt = number.location;
        swizzleAt.column += static_cast<std::uint32_t>(at + 1);
        auto* const swizzle = make<MemberExpr>(swizzleAt);
        swizzle->object = value;
        swizzle->name = number.text.substr(at + 1, end - at - 1);
        setHeight(mHeight + 1);
        value = swizzle;
        at = end;
    }
    return value;
}

// ---------------------------------------------------------------------------------------- initializers

Expr* ExpressionParser::parseInitializer() {
    if (isAt(TokenKind::LEFT_BRACE))
        return parseInitList();
    if (isAtWord("sampler_state") && isAt(TokenKind::LEFT_BRACE, 1)) {
        pass();
        skipBracketed();
        mHeight = 0;
        return nullptr;
    }
    return parseAssignment();
}

Expr* ExpressionParser::parseInitList() {
    const Level level(*this);
    auto* const list = make<InitListExpr>(token().location);
    int height = 0;
    pass();
    while (!isAt(TokenKind::RIGHT_BRACE)) {
        if (Expr* const element = parseInitializer())
            list->elements.push_back(element);
        height = std::max(height, mHeight);
        if (!take(TokenKind::COMMA) && !isAt(TokenKind::RIGHT_BRACE))
            fail("',' or '}' after a value of the list");
    }
    pass();
    setHeight(height + 1);
    return list;
}

} // namespace cg
