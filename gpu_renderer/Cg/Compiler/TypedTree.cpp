#include <Cg/Compiler/TypedTree.h>

#include <algorithm>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

const char* spelling(BinaryOp op) {
    constexpr const char* SPELLINGS[] = {"*",  "/",  "%",  "+", "-", "<<", ">>", "<",  ">", "<=",
                                         ">=", "==", "!=", "&", "^", "|",  "&&", "||", ","};
    return SPELLINGS[static_cast<std::size_t>(op)];
}

bool isSimple(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::LITERAL:
    case Kind::VARIABLE:
        return true;
    case Kind::FIELD:
    case Kind::SWIZZLE:
        return isSimple(expression->operands[0]);
    case Kind::ELEMENT:
        return isSimple(expression->operands[0]) && isSimple(expression->operands[1]);
    case Kind::BUILTIN:
        return expression->operands.empty();
    default:
        return false;
    }
}

Variable* rootVariable(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::VARIABLE:
        return expression->variable;
    case Kind::FIELD:
    case Kind::SWIZZLE:
    case Kind::ELEMENT:
    case Kind::CONVERT: // between types that are one in GLSL
        return rootVariable(expression->operands[0]);
    default:
        return nullptr;
    }
}

bool hasEffect(const TypedExpr* expression) {
    switch (expression->kind) {
    case Kind::CALL:
    case Kind::ASSIGN:
    case Kind::BUILTIN: // some write to their arguments
        return true;
    case Kind::UNARY:
        return expression->unary >= UnaryOp::PRE_INCREMENT || hasEffect(expression->operands[0]);
    default:
        return std::any_of(expression->operands.begin(), expression->operands.end(), hasEffect);
    }
}

std::vector<TypedExpr*> samplersIn(TypedExpr* sampler) {
    if (sampler->kind != Kind::CONDITIONAL)
        return {sampler};
    std::vector<TypedExpr*> samplers = samplersIn(sampler->operands[1]);
    for (TypedExpr* other : samplersIn(sampler->operands[2]))
        samplers.push_back(other);
    return samplers;
}

} // namespace cg
