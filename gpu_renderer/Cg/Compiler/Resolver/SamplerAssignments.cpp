#include <Cg/Compiler/Resolver/SamplerAssignments.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Globals.h>
#include <Cg/Compiler/Resolver/InitializerLists.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/Resolver/SamplerLists.h>
#include <Cg/Compiler/Resolver/SamplerPaths.h>
#include <Cg/Compiler/Resolver/SamplerPieces.h>

#include <optional>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

} // namespace

// ---------------------------------------------------------------------------------------------- places

TypedExpr* SamplerAssignments::place(const Expr* target) {
    switch (target->kind) {
    case Expr::Kind::NAME:
        return placeOfName(static_cast<const NameExpr*>(target));
    case Expr::Kind::MEMBER:
        return placeOfMember(static_cast<const MemberExpr*>(target));
    case Expr::Kind::INDEX:
        return placeOfElement(static_cast<const IndexExpr*>(target));
    default:
        return nullptr;
    }
}

TypedExpr* SamplerAssignments::placeOfName(const NameExpr* target) {
    Variable* variable = mResolution.context.findVariable(target->name);
    if (!variable)
        variable = mGlobals.find(target->name);
    return variable && containsSampler(variable->type)
               ? mResolution.build.variable(target->location, variable)
               : nullptr;
}

TypedExpr* SamplerAssignments::placeOfMember(const MemberExpr* target) {
    const SourceLocation at = target->location;
    TypedExpr* object = place(target->object);
    const int index = object && object->type->isStruct() ? object->type->structure->find(target->name) : -1;
    if (index < 0)
        return nullptr;
    TypedExpr* field = mResolution.build.field(at, object, index);
    if (!isOpaque(field->type))
        return containsSampler(field->type) ? field : nullptr;
    const SamplerPath way = pathTo(field);
    return way.elements.empty()
               ? mResolution.build.variable(at, mPieces.piece(way.root, way.members, field->type))
               : nullptr;
}

TypedExpr* SamplerAssignments::placeOfElement(const IndexExpr* target) {
    TypedExpr* object = place(target->object);
    TypedExpr* index = object && object->type->isArray() ? mRecursion.expression(target->index) : nullptr;
    const auto position = index && index->type->isScalar() ? constantValue(index) : std::nullopt;
    if (!position || (*position)[0] < 0 || (*position)[0] >= object->type->length)
        return nullptr;
    return mResolution.build.element(target->location, object, static_cast<int>((*position)[0]));
}

// ----------------------------------------------------------------------------------------- assignments

TypedExpr* SamplerAssignments::assign(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    Variable* root = target->kind == Kind::VARIABLE ? target->variable : nullptr;
    const bool isElement = target->kind == Kind::ELEMENT && target->operands[0]->kind == Kind::VARIABLE;
    if ((!root && !isElement) || conversionCost(value, target->type) == IMPOSSIBLE_CONVERSION) {
        mResolution.diagnostics.error(at, "cannot assign '" + nameOf(value->type) + "' to this sampler");
        return nullptr;
    }
    const Variable* whole = rootVariable(target);
    whole = whole->samplerOwner ? whole->samplerOwner : whole;
    if (whole->storage == Variable::Storage::PARAMETER && whole->direction != Direction::IN) {
        mResolution.diagnostics.error(at, "a function cannot give a sampler by its parameter " +
                                              inQuotes(whole->name));
        return nullptr;
    }
    if (isElement)
        return giveElement(at, target, value);
    TypedExpr* effect = rootVariable(value) == root ? nullptr : give(at, root, value);
    return effect ? effect : mResolution.nothing(at);
}

/// @return what has to be done for it, or null
TypedExpr* SamplerAssignments::give(SourceLocation at, Variable* variable, TypedExpr* sampler) {
    TypedExpr* effect = nullptr;
    sampler = frozen(sampler, effect);
    const auto selector = mSelectors.find(variable);
    if (selector == mSelectors.end()) {
        mAliases.set(variable, sampler);
        return effect;
    }
    TypedExpr* selected = selector->second.select(at, sampler);
    return selected ? mResolution.inOrder(at, effect, selected) : nullptr;
}

/// The samplers of a list in braces, to the members of the struct that it makes.
TypedExpr* SamplerAssignments::giveListed(SourceLocation at, Variable* root, const std::string& path,
                                          const TypedExpr* list) {
    TypedExpr* effects = nullptr;
    std::size_t next = 0;
    const auto& fields = list->type->structure->fields;
    for (std::size_t i = 0; i < fields.size(); ++i) {
        const std::string way = path + "." + std::string(fields[i].name);
        TypedExpr* effect = nullptr;
        if (isOpaque(fields[i].type)) {
            if (TypedExpr* sampler = mInitializerLists.sampler(list, i))
                effect = give(at, mPieces.piece(root, way, fields[i].type), sampler);
        } else if (next < list->operands.size()) {
            const TypedExpr* inner = list->operands[next++];
            if (containsSampler(inner->type) && inner->kind == Kind::CONSTRUCT && inner->type->isStruct())
                effect = giveListed(at, root, way, inner);
        }
        effects = mResolution.inOrder(at, effects, effect);
    }
    return effects;
}

/// One element of an array of samplers: the array stands for a list from now on.
TypedExpr* SamplerAssignments::giveElement(SourceLocation at, const TypedExpr* element, TypedExpr* sampler) {
    Variable* array = element->operands[0]->variable;
    const Type* type = array->type;
    if (type->length > static_cast<int>(MAX_SAMPLER_CHOICES) || !type->element->isSampler()) {
        mResolution.diagnostics.error(at, "a sampler cannot be assigned to this array");
        return nullptr;
    }
    TypedExpr* before = array->alias ? array->alias : mResolution.build.variable(at, array);
    const int position = static_cast<int>((*constantValue(element->operands[1]))[0]);
    TypedExpr* effect = nullptr;
    TypedExpr* given = frozen(sampler, effect);
    mAliases.set(array, mLists.withElement(at, type, before, position, given));
    return effect ? effect : mResolution.nothing(at);
}

void SamplerAssignments::beginSelection(const Variable* variable, const SamplerSelector& selector) {
    mSelectors.insert_or_assign(variable, selector);
}

// ---------------------------------------------------------------------------------------------- copies

TypedExpr* SamplerAssignments::frozen(TypedExpr* sampler, TypedExpr*& preparation) {
    const bool isChoice = sampler->kind == Kind::CONDITIONAL;
    if (!isChoice && sampler->kind != Kind::ELEMENT)
        return sampler;
    TypedExpr* result = mResolution.arena.make<TypedExpr>(*sampler);
    TypedExpr*& decision = result->operands[isChoice ? 0 : 1];
    if (!constantValue(decision)) {
        const SourceLocation at = decision->location;
        // Other functions may look up the sampler, too.
        Variable* place = mResolution.programTemporary("choice", decision->type);
        preparation = mResolution.inOrder(
            at, preparation, mResolution.build.assign(at, mResolution.build.variable(at, place), decision));
        decision = mResolution.build.variable(at, place);
    }
    if (isChoice)
        for (std::size_t i = 1; i < result->operands.size(); ++i)
            result->operands[i] = frozen(result->operands[i], preparation);
    return result;
}

TypedExpr* SamplerAssignments::copy(SourceLocation at, const TypedExpr* target, const TypedExpr* value) {
    const SamplerPath to = pathTo(target);
    if (to.root && to.elements.empty() && value->kind == Kind::CONSTRUCT && value->type->isStruct())
        return giveListed(at, to.root, to.members, value);
    const SamplerPath from = pathTo(value);
    if (!to.root || !from.root || !to.elements.empty()) {
        mResolution.diagnostics.error(at, "samplers can only be copied between variables");
        return nullptr;
    }
    TypedExpr* effects = nullptr;
    for (const SamplerPiece& found : samplersOf(target->type)) {
        const Type* type = found.wholeType(mResolution.types);
        Variable* piece = mPieces.piece(to.root, to.members + found.path, type);
        TypedExpr* source = nullptr;
        if (from.elements.empty()) {
            source = mAliases.use(at, mPieces.piece(from.root, from.members + found.path, type));
        } else if (from.elements.size() == 1 && found.count == 1) {
            const TypedExpr* element = from.elements[0];
            const Type* array = mResolution.types.array(found.type, element->operands[0]->type->length);
            Variable* all = mPieces.piece(from.root, from.members + found.path, array);
            source = mResolution.build.element(at, mAliases.use(at, all), element->operands[1]);
        }
        if (source)
            effects = mResolution.inOrder(at, effects, give(at, piece, source));
    }
    return effects;
}

} // namespace cg
