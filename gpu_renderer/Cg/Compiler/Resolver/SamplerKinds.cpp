#include <Cg/Compiler/Resolver/SamplerKinds.h>

#include <algorithm>
#include <vector>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

bool SamplerKinds::isPlain(TypedExpr* sampler) const {
    const std::vector<TypedExpr*> samplers = samplersIn(sampler);
    return std::any_of(samplers.begin(), samplers.end(), [this](const TypedExpr* one) {
        const Variable* root = rootVariable(one);
        return root && mPlain.count(root->name) != 0;
    });
}

void SamplerKinds::decide(TypedExpr* sampler, const Type* type, TypeTable& types) {
    if (sampler->kind == Kind::CONDITIONAL) {
        for (TypedExpr* one : samplersIn(sampler))
            decide(one, type, types);
        sampler->type = type;
        return;
    }
    Variable* root = rootVariable(sampler);
    if (!root)
        return;
    (isDepthSampler(type->sampler) ? root->comparesDepth : root->givesColour) = true;
    if (root->comparesDepth && root->givesColour)
        notePlain(root->name);
    if (sampler->type == type)
        return;
    const Type* old = root->type;
    const bool isArray = old->isArray() && !type->isArray();
    root->type = isArray ? types.array(type, old->length) : type;
    for (TypedExpr* part = sampler; part; part = part->operands.empty() ? nullptr : part->operands[0])
        part->type = part->kind == Kind::VARIABLE ? root->type : type;
}

} // namespace cg
