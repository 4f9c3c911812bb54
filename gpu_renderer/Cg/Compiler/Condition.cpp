#include <Cg/Compiler/Condition.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/NumberSpelling.h>

#include <algorithm>
#include <limits>
#include <string>

namespace cg {

namespace {

constexpr int MAX_DEPTH = 200;
constexpr int CONDITIONAL_PRECEDENCE = 0;

/// 0 for what is no operator between two operands.
int precedence(TokenKind kind) {
    switch (kind) {
    case TokenKind::OR_OR:
        return 1;
    case TokenKind::AND_AND:
        return 2;
    case TokenKind::BAR:
        return 3;
    case TokenKind::CARET:
        return 4;
    case TokenKind::AMPERSAND:
        return 5;
    case TokenKind::EQUAL_EQUAL:
    case TokenKind::NOT_EQUAL:
        return 6;
    case TokenKind::LESS:
    case TokenKind::GREATER:
    case TokenKind::LESS_EQUAL:
    case TokenKind::GREATER_EQUAL:
        return 7;
    case TokenKind::SHIFT_LEFT:
    case TokenKind::SHIFT_RIGHT:
        return 8;
    case TokenKind::PLUS:
    case TokenKind::MINUS:
        return 9;
    case TokenKind::STAR:
    case TokenKind::SLASH:
    case TokenKind::PERCENT:
        return 10;
    default:
        return 0;
    }
}

std::int64_t wrapped(std::uint64_t bits) {
    return static_cast<std::int64_t>(bits);
}

std::uint64_t bitsOf(std::int64_t value) {
    return static_cast<std::uint64_t>(value);
}

std::int64_t shifted(std::int64_t value, std::int64_t left) {
    constexpr int BITS = std::numeric_limits<std::uint64_t>::digits;
    if (left >= BITS)
        return 0;
    if (left >= 0)
        return wrapped(bitsOf(value) << left);
    if (left <= -BITS)
        return value < 0 ? -1 : 0;
    return value >> -left;
}

std::int64_t combined(TokenKind op, std::int64_t left, std::int64_t right) {
    switch (op) {
    case TokenKind::OR_OR:
        return left != 0 || right != 0 ? 1 : 0;
    case TokenKind::AND_AND:
        return left != 0 && right != 0 ? 1 : 0;
    case TokenKind::BAR:
        return left | right;
    case TokenKind::CARET:
        return left ^ right;
    case TokenKind::AMPERSAND:
        return left & right;
    case TokenKind::EQUAL_EQUAL:
        return left == right ? 1 : 0;
    case TokenKind::NOT_EQUAL:
        return left != right ? 1 : 0;
    case TokenKind::LESS:
        return left < right ? 1 : 0;
    case TokenKind::GREATER:
        return left > right ? 1 : 0;
    case TokenKind::LESS_EQUAL:
        return left <= right ? 1 : 0;
    case TokenKind::GREATER_EQUAL:
        return left >= right ? 1 : 0;
    case TokenKind::SHIFT_LEFT:
        return shifted(left, right);
    case TokenKind::SHIFT_RIGHT:
        return shifted(left, right == std::numeric_limits<std::int64_t>::min() ? 0 : -right);
    case TokenKind::PLUS:
        return wrapped(bitsOf(left) + bitsOf(right));
    case TokenKind::MINUS:
        return wrapped(bitsOf(left) - bitsOf(right));
    default:
        return wrapped(bitsOf(left) * bitsOf(right));
    }
}

class Evaluator {
public:
    Evaluator(const std::vector<Token>& tokens, Diagnostics& diagnostics)
        : mTokens(tokens), mDiagnostics(diagnostics) {}

    std::optional<std::int64_t> evaluate() {
        const std::int64_t value = conditional(true);
        if (!mHasFailed && token().kind != TokenKind::END)
            fail("expected an operator");
        return mHasFailed ? std::nullopt : std::optional(value);
    }

private:
    const Token& token() const { return mTokens[mAt]; }

    /// Never passes the END.
    void pass() {
        if (token().kind != TokenKind::END)
            ++mAt;
    }

    bool take(TokenKind kind) {
        if (token().kind != kind)
            return false;
        pass();
        return true;
    }

    /// Reports the first fault only, and ends the evaluation.
    std::int64_t fail(const std::string& expected) {
        if (!mHasFailed)
            mDiagnostics.error(token().location,
                               expected + " in the condition of '#if', found " +
                                   (token().text.empty() ? "the end of the line" : inQuotes(token().text)));
        mHasFailed = true;
        mAt = mTokens.size() - 1;
        return 0;
    }

    /// @param isNeeded  false for what a short circuit leaves out
    std::int64_t conditional(bool isNeeded) {
        if (++mDepth > MAX_DEPTH)
            return fail("this is nested too deeply: expected fewer parentheses");
        std::int64_t value = binary(CONDITIONAL_PRECEDENCE + 1, isNeeded);
        if (take(TokenKind::QUESTION)) {
            const bool isTrue = value != 0;
            const std::int64_t whenTrue = conditional(isNeeded && isTrue);
            if (!take(TokenKind::COLON))
                return fail("expected ':'");
            const std::int64_t whenFalse = conditional(isNeeded && !isTrue);
            value = isTrue ? whenTrue : whenFalse;
        }
        --mDepth;
        return value;
    }

    std::int64_t binary(int lowest, bool isNeeded) {
        std::int64_t left = unary(isNeeded);
        while (precedence(token().kind) >= lowest) {
            const Token op = token();
            pass();
            const bool isShort =
                (op.kind == TokenKind::AND_AND && left == 0) || (op.kind == TokenKind::OR_OR && left != 0);
            const std::int64_t right = binary(precedence(op.kind) + 1, isNeeded && !isShort);
            if (op.kind == TokenKind::SLASH || op.kind == TokenKind::PERCENT)
                left = divided(op, left, right, isNeeded);
            else
                left = combined(op.kind, left, right);
        }
        return left;
    }

    std::int64_t divided(const Token& op, std::int64_t left, std::int64_t right, bool isNeeded) {
        if (right == 0) {
            if (isNeeded && !mHasFailed) {
                mHasFailed = true;
                mDiagnostics.error(op.location, "division by zero in the condition of '#if'");
            }
            return 0;
        }
        const bool isRemainder = op.kind == TokenKind::PERCENT;
        if (right == -1) // the smallest number has no positive counterpart
            return isRemainder ? 0 : wrapped(0 - bitsOf(left));
        return isRemainder ? left % right : left / right;
    }

    std::int64_t unary(bool isNeeded) {
        std::vector<TokenKind> signs;
        for (; token().kind == TokenKind::NOT || token().kind == TokenKind::TILDE ||
               token().kind == TokenKind::PLUS || token().kind == TokenKind::MINUS;
             pass())
            signs.push_back(token().kind);
        std::int64_t value = primary(isNeeded);
        for (auto sign = signs.rbegin(); sign != signs.rend(); ++sign) {
            if (*sign == TokenKind::NOT)
                value = value == 0 ? 1 : 0;
            else if (*sign == TokenKind::TILDE)
                value = ~value;
            else if (*sign == TokenKind::MINUS)
                value = wrapped(0 - bitsOf(value));
        }
        return value;
    }

    std::int64_t primary(bool isNeeded) {
        const Token& first = token();
        if (first.kind == TokenKind::NAME) {
            pass();
            return first.text == "true" ? 1 : 0;
        }
        if (first.kind == TokenKind::NUMBER) {
            const NumberSpelling number = readNumber(first.text);
            if (number.kind == NumberSpelling::Kind::INVALID || number.length < first.text.size())
                return fail("expected a number");
            pass();
            return whole(first, number);
        }
        if (!take(TokenKind::LEFT_PAREN))
            return fail("expected a number, a name or '('");
        const std::int64_t value = conditional(isNeeded);
        if (!take(TokenKind::RIGHT_PAREN))
            return fail("expected ')'");
        return value;
    }

    /// A condition counts in whole numbers: of `1.5` the 1 is left.
    std::int64_t whole(const Token& token, const NumberSpelling& number) {
        if (number.kind == NumberSpelling::Kind::INTEGER || number.kind == NumberSpelling::Kind::UNSIGNED)
            return wrapped(number.integer);
        constexpr double LARGEST = 9e18;
        const auto cut = static_cast<std::int64_t>(std::min(number.value, LARGEST));
        mDiagnostics.warning(token.location,
                             inQuotes(token.text) + " in a condition is cut to " + std::to_string(cut));
        return cut;
    }

    const std::vector<Token>& mTokens;
    Diagnostics& mDiagnostics;
    std::size_t mAt = 0;
    int mDepth = 0;
    bool mHasFailed = false;
};

} // namespace

std::optional<std::int64_t> evaluateCondition(const std::vector<Token>& tokens, Diagnostics& diagnostics) {
    return Evaluator(tokens, diagnostics).evaluate();
}

} // namespace cg
