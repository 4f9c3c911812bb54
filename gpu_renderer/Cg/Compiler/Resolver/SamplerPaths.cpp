#include <Cg/Compiler/Resolver/SamplerPaths.h>

#include <Cg/Compiler/ConstantFolding.h>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

void appendSamplers(const Type* type, const std::string& path, int count, std::vector<SamplerPiece>& out) {
    if (type->isArray())
        appendSamplers(innermost(type), path, count * flatLength(type), out);
    if (type->isSampler())
        out.push_back({path, type, count});
    if (type->isStruct())
        for (const Field& field : type->structure->fields)
            if (containsSampler(field.type))
                appendSamplers(field.type, path + "." + std::string(field.name), count, out);
}

} // namespace

SamplerPath pathTo(const TypedExpr* expression) {
    SamplerPath path;
    if (expression->kind == Kind::VARIABLE) {
        path.root = expression->variable;
    } else if (expression->kind == Kind::FIELD) {
        path = pathTo(expression->operands[0]);
        const auto& fields = expression->operands[0]->type->structure->fields;
        path.members += "." + std::string(fields[static_cast<std::size_t>(expression->index)].name);
    } else if (expression->kind == Kind::ELEMENT) {
        path = pathTo(expression->operands[0]);
        path.elements.push_back(expression);
    }
    return path;
}

std::vector<SamplerPiece> samplersOf(const Type* type) {
    std::vector<SamplerPiece> pieces;
    appendSamplers(type, "", 1, pieces);
    return pieces;
}

bool isSameSampler(const TypedExpr* a, const TypedExpr* b) {
    if (a->kind != b->kind || (a->kind != Kind::VARIABLE && a->kind != Kind::ELEMENT))
        return false;
    if (a->kind == Kind::VARIABLE)
        return a->variable == b->variable;
    const auto first = constantValue(a->operands[1]);
    const auto second = constantValue(b->operands[1]);
    return first && second && (*first)[0] == (*second)[0] && isSameSampler(a->operands[0], b->operands[0]);
}

bool isAnyElement(const TypedExpr* sampler) {
    return sampler->kind == Kind::ELEMENT && !constantValue(sampler->operands[1]);
}

} // namespace cg
