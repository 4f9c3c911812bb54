#include <Cg/Compiler/Resolver/SamplerPieces.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/Resolver/SamplerPaths.h>

namespace cg {

Variable* SamplerPieces::piece(Variable* owner, const std::string& path, const Type* type) {
    Variable*& piece = owner->samplers[path];
    if (piece)
        return piece;
    std::string name(owner->name);
    for (const char c : path)
        name += c == '.' ? '_' : c;
    piece = mResolution.makeVariable(owner->storage, mResolution.arena.keep(name), type, nullptr);
    piece->samplerOwner = owner;
    piece->samplerPath = path;
    if (owner->storage == Variable::Storage::UNIFORM)
        mResolution.program.uniforms.push_back(piece);
    return piece;
}

TypedExpr* SamplerPieces::member(SourceLocation at, TypedExpr* object, Name name, const Type* type) {
    const SamplerPath way = pathTo(object);
    if (!way.root || (!way.elements.empty() && type->isArray())) {
        mResolution.diagnostics.error(at, "this sampler cannot be reached");
        return nullptr;
    }
    int count = 1;
    for (const TypedExpr* element : way.elements)
        count *= element->operands[0]->type->length;
    TypedExpr* index = flatIndex(at, way.elements);
    Variable* sampler = piece(way.root, way.members + "." + std::string(name),
                              index ? mResolution.types.array(type, count) : type);
    if (isOpaque(sampler->type) && !standsForSampler(sampler)) {
        mResolution.diagnostics.error(at, inQuotes(name) + " has been given no sampler");
        return nullptr;
    }
    TypedExpr* whole = mAliases.use(at, sampler);
    return index ? mResolution.build.element(at, whole, index) : whole;
}

/// The index of a sampler in the one array that those within arrays of arrays are.
/// @return null where there are no arrays on the way
TypedExpr* SamplerPieces::flatIndex(SourceLocation at, const std::vector<const TypedExpr*>& elements) {
    TypedBuilder& build = mResolution.build;
    TypedExpr* index = nullptr;
    for (const TypedExpr* element : elements) {
        TypedExpr* part = element->operands[1];
        if (index) {
            const int length = element->operands[0]->type->length;
            index = build.binary(at, BinaryOp::MULTIPLY, index, mResolution.number(at, length));
            index = build.binary(at, BinaryOp::ADD, index, part);
        } else {
            index = part;
        }
    }
    return index;
}

void SamplerPieces::addUniforms(Variable* inner, Variable* outer) {
    outer->storage = Variable::Storage::UNIFORM; // as its pieces are to be
    for (const SamplerPiece& found : samplersOf(inner->type))
        piece(outer, found.path, found.wholeType(mResolution.types));
    outer->storage = Variable::Storage::LOCAL;
    inner->samplers = outer->samplers;
}

void SamplerPieces::addParameters(Function* function, Variable* parameter) {
    for (const SamplerPiece& found : samplersOf(parameter->type))
        function->parameters.push_back(piece(parameter, found.path, found.wholeType(mResolution.types)));
}

} // namespace cg
