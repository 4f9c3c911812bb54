#include <Cg/Compiler/Resolver.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <set>
#include <string>
#include <utility>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// Loops and switches that assign samplers, in a whole program: each is resolved twice.
constexpr int MAX_SELECTIONS = 256;

/// The way from a variable down to a member: names with points, and the indices on the way.
Variable* walk(const TypedExpr* expression, std::string& path, std::vector<const TypedExpr*>& elements) {
    switch (expression->kind) {
    case Kind::VARIABLE:
        return expression->variable;
    case Kind::FIELD: {
        Variable* root = walk(expression->operands[0], path, elements);
        const auto& fields = expression->operands[0]->type->structure->fields;
        path += "." + std::string(fields[static_cast<std::size_t>(expression->index)].name);
        return root;
    }
    case Kind::ELEMENT: {
        Variable* root = walk(expression->operands[0], path, elements);
        elements.push_back(expression);
        return root;
    }
    default:
        return nullptr;
    }
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

/// Paths and types of all samplers in a type; those within arrays as one array each.
void listSamplers(const Type* type, const std::string& path, int count,
                  std::vector<std::pair<std::string, std::pair<const Type*, int>>>& out) {
    if (type->isArray()) {
        listSamplers(type->element, path, count * type->length, out);
        return;
    }
    if (type->isSampler())
        out.push_back({path, {type, count}});
    if (type->isStruct())
        for (const Field& field : type->structure->fields)
            if (containsSampler(field.type))
                listSamplers(field.type, path + "." + std::string(field.name), count, out);
}

} // namespace

Variable* Resolver::samplerPiece(Variable* owner, const std::string& path, const Type* type) {
    Variable*& piece = owner->samplers[path];
    if (piece)
        return piece;
    std::string name(owner->name);
    for (const char c : path)
        name += c == '.' ? '_' : c;
    piece = makeVariable(owner->storage, mArena.keep(name), type, nullptr);
    piece->samplerOwner = owner;
    piece->samplerPath = path;
    if (owner->storage == Variable::Storage::UNIFORM)
        mProgram->uniforms.push_back(piece);
    return piece;
}

TypedExpr* Resolver::samplerMember(SourceLocation at, TypedExpr* object, Name name, const Type* type) {
    std::string path;
    std::vector<const TypedExpr*> elements;
    Variable* root = walk(object, path, elements);
    path += "." + std::string(name);
    if (!root || (!elements.empty() && type->isArray())) {
        mDiagnostics.error(at, "this sampler cannot be reached");
        return nullptr;
    }
    int count = 1;
    TypedExpr* index = nullptr;
    for (const TypedExpr* element : elements) {
        const int length = element->operands[0]->type->length;
        TypedExpr* part = element->operands[1];
        if (index) {
            index = mBuild.binary(at, BinaryOp::MULTIPLY, index,
                                  mBuild.literal(at, mTypes.scalar(Scalar::INT), length));
            index = mBuild.binary(at, BinaryOp::ADD, index, part);
        } else {
            index = part;
        }
        count *= length;
    }
    Variable* piece = samplerPiece(root, path, index ? mTypes.array(type, count) : type);
    if (isOpaque(piece->type) && isUnset(mBuild.variable(at, piece)) && !piece->alias) {
        mDiagnostics.error(at, inQuotes(name) + " has been given no sampler");
        return nullptr;
    }
    TypedExpr* whole = useVariable(at, piece);
    return index ? mBuild.element(at, whole, index) : whole;
}

/// Where an assignment puts samplers, and not what stands there: a variable, a member or an element.
/// @return null for other places, and after an error that resolving the place as an expression reports
TypedExpr* Resolver::samplerPlace(const Expr* target) {
    const SourceLocation at = target->location;
    if (target->kind == Expr::Kind::NAME) {
        const Name name = static_cast<const NameExpr*>(target)->name;
        Variable* variable = findVariable(name);
        if (!variable && mGlobalDecls.count(name) != 0)
            variable = globalVariable(mGlobalDecls[name]);
        return variable && containsSampler(variable->type) ? mBuild.variable(at, variable) : nullptr;
    }
    if (target->kind == Expr::Kind::MEMBER) {
        const auto* member = static_cast<const MemberExpr*>(target);
        TypedExpr* object = samplerPlace(member->object);
        const int index =
            object && object->type->isStruct() ? object->type->structure->find(member->name) : -1;
        if (index < 0)
            return nullptr;
        TypedExpr* field = mBuild.field(at, object, index);
        if (!isOpaque(field->type))
            return containsSampler(field->type) ? field : nullptr;
        std::string path;
        std::vector<const TypedExpr*> elements;
        Variable* root = walk(field, path, elements);
        return elements.empty() ? mBuild.variable(at, samplerPiece(root, path, field->type)) : nullptr;
    }
    if (target->kind == Expr::Kind::INDEX) {
        const auto* element = static_cast<const IndexExpr*>(target);
        TypedExpr* object = samplerPlace(element->object);
        TypedExpr* index = object && object->type->isArray() ? expression(element->index) : nullptr;
        const auto position = index && index->type->isScalar() ? constantValue(index) : std::nullopt;
        if (!position || (*position)[0] < 0 || (*position)[0] >= object->type->length)
            return nullptr;
        return mBuild.element(at, object, static_cast<int>((*position)[0]));
    }
    return nullptr;
}

/// @param target  as samplerPlace() gives it
TypedExpr* Resolver::assignSampler(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    Variable* root = target->kind == Kind::VARIABLE ? target->variable : nullptr;
    const bool isElement = target->kind == Kind::ELEMENT && target->operands[0]->kind == Kind::VARIABLE;
    if ((!root && !isElement) || mBuild.cost(value, target->type) == TypedBuilder::IMPOSSIBLE) {
        mDiagnostics.error(at, "cannot assign '" + nameOf(value->type) + "' to this sampler");
        return nullptr;
    }
    const Variable* whole = rootVariable(target);
    whole = whole->samplerOwner ? whole->samplerOwner : whole;
    if (whole->storage == Variable::Storage::PARAMETER && whole->direction != Direction::IN) {
        mDiagnostics.error(at, "a function cannot give a sampler by its parameter " + inQuotes(whole->name));
        return nullptr;
    }
    if (isElement)
        return giveElement(at, target, value);
    TypedExpr* effect = rootVariable(value) == root ? nullptr : giveSampler(at, root, value);
    return effect ? effect : nothing(at);
}

/// @return what has to be done for it, or null
TypedExpr* Resolver::giveSampler(SourceLocation at, Variable* variable, TypedExpr* sampler) {
    TypedExpr* effect = nullptr;
    sampler = frozen(sampler, effect);
    const auto selected = mSelectors.find(variable);
    if (selected == mSelectors.end()) {
        alias(variable, sampler);
        return effect;
    }
    TypedExpr* number = numberOf(at, selected->second.samplers, sampler);
    if (!number)
        return nullptr;
    TypedExpr* assigned = mBuild.assign(at, mBuild.variable(at, selected->second.number), number);
    return effect ? mBuild.comma(at, effect, assigned) : assigned;
}

/// The samplers of a list in braces, to the members of the struct that it makes.
TypedExpr* Resolver::giveListed(SourceLocation at, Variable* root, const std::string& path,
                                const TypedExpr* list) {
    TypedExpr* effects = nullptr;
    std::size_t next = 0;
    const auto& fields = list->type->structure->fields;
    for (std::size_t i = 0; i < fields.size(); ++i) {
        const std::string way = path + "." + std::string(fields[i].name);
        TypedExpr* effect = nullptr;
        if (isOpaque(fields[i].type)) {
            const auto& samplers = mListedSamplers[list];
            const auto listed = samplers.find(i);
            if (listed != samplers.end())
                effect = giveSampler(at, samplerPiece(root, way, fields[i].type), listed->second);
        } else if (next < list->operands.size()) {
            const TypedExpr* inner = list->operands[next++];
            if (containsSampler(inner->type) && inner->kind == Kind::CONSTRUCT && inner->type->isStruct())
                effect = giveListed(at, root, way, inner);
        }
        if (effect)
            effects = effects ? mBuild.comma(at, effects, effect) : effect;
    }
    return effects;
}

/// One element of an array of samplers: the array stands for a list from now on.
TypedExpr* Resolver::giveElement(SourceLocation at, const TypedExpr* element, TypedExpr* sampler) {
    Variable* array = element->operands[0]->variable;
    const Type* type = array->type;
    if (type->length > static_cast<int>(MAX_SAMPLER_CHOICES) || !type->element->isSampler()) {
        mDiagnostics.error(at, "a sampler cannot be assigned to this array");
        return nullptr;
    }
    TypedExpr* list = mBuild.make(Kind::CONSTRUCT, at, type);
    TypedExpr* before = array->alias ? array->alias : mBuild.variable(at, array);
    for (int i = 0; i < type->length; ++i)
        list->operands.push_back(before->kind == Kind::CONSTRUCT
                                     ? before->operands[static_cast<std::size_t>(i)]
                                     : mBuild.element(at, before, i));
    TypedExpr* effect = nullptr;
    const auto position = static_cast<std::size_t>((*constantValue(element->operands[1]))[0]);
    list->operands[position] = frozen(sampler, effect);
    alias(array, list);
    return effect ? effect : nothing(at);
}

/// The initial value of a sampler or of an array of them.
/// @return null after an error
TypedExpr* Resolver::samplerValue(const Type* type, const Expr* expr) {
    if (expr->kind != Expr::Kind::INIT_LIST || !type->isArray() || !type->element->isSampler()) {
        TypedExpr* value = expression(expr);
        return value ? mBuild.convert(value, type) : nullptr;
    }
    const auto* list = static_cast<const InitListExpr*>(expr);
    if (static_cast<int>(list->elements.size()) != type->length) {
        mDiagnostics.error(list->location, "the list for '" + nameOf(type) + "' has to name each sampler");
        return nullptr;
    }
    TypedExpr* whole = mBuild.make(Kind::CONSTRUCT, list->location, type);
    for (const Expr* element : list->elements) {
        TypedExpr* sampler = expression(element);
        sampler = sampler ? mBuild.convert(sampler, type->element) : nullptr;
        if (!sampler)
            return nullptr;
        whole->operands.push_back(sampler);
    }
    return whole;
}

/// A local variable's sampler that nothing has been assigned to yet.
bool Resolver::isUnset(const TypedExpr* sampler) const {
    const Variable* root = rootVariable(sampler);
    return root && root->storage == Variable::Storage::LOCAL;
}

/// An element of an array that stands for a list of samplers.
TypedExpr* Resolver::listedSampler(SourceLocation at, TypedExpr* list, TypedExpr* index) {
    const auto position = constantValue(index);
    TypedExpr* preparation = nullptr;
    TypedExpr* known = position ? index : once(index, preparation);
    TypedExpr* result = nullptr;
    for (int i = list->type->length - 1; i >= 0; --i) {
        if (position && (*position)[0] != i)
            continue;
        TypedExpr* sampler = list->operands[static_cast<std::size_t>(i)];
        if (isUnset(sampler)) {
            mDiagnostics.error(at, "element " + std::to_string(i) + " has been given no sampler");
            return nullptr;
        }
        if (!result) {
            result = sampler;
            continue;
        }
        TypedExpr* condition =
            mBuild.binary(at, BinaryOp::EQUAL, known, mBuild.literal(at, mTypes.scalar(Scalar::INT), i));
        if (i == 0 && preparation)
            condition = mBuild.comma(at, preparation, condition);
        result = mBuild.conditional(at, condition, sampler, result);
        if (!result)
            return nullptr;
    }
    return result;
}

/// `condition ? whenTrue : whenFalse`; of arrays of samplers element by element, as those may be lists.
TypedExpr* Resolver::chosenOf(SourceLocation at, TypedExpr* condition, TypedExpr* whenTrue,
                              TypedExpr* whenFalse) {
    const Type* type = whenTrue->type;
    if (!type->isArray() || !type->element->isSampler() || whenFalse->type != type)
        return mBuild.conditional(at, condition, whenTrue, whenFalse);
    if (type->length > static_cast<int>(MAX_SAMPLER_CHOICES) || !isSimple(condition)) {
        mDiagnostics.error(at, "a choice between these arrays of samplers");
        return nullptr;
    }
    TypedExpr* list = mBuild.make(Kind::CONSTRUCT, at, type);
    for (int i = 0; i < type->length; ++i) {
        const auto element = [&](TypedExpr* array) {
            return array->kind == Kind::CONSTRUCT ? array->operands[static_cast<std::size_t>(i)]
                                                  : mBuild.element(at, array, i);
        };
        TypedExpr* first = element(whenTrue);
        TypedExpr* second = element(whenFalse);
        TypedExpr* only = isUnset(second) || isSameSampler(first, second) ? first
                          : isUnset(first)                                ? second
                                                                          : nullptr;
        TypedExpr* chosen = only ? only : mBuild.conditional(at, condition, first, second);
        if (!chosen)
            return nullptr;
        list->operands.push_back(chosen);
    }
    return list;
}

/// From now on the variable stands for another sampler.
void Resolver::alias(Variable* variable, TypedExpr* sampler) {
    const std::set<const Function*>& users = mSamplerUsers[variable];
    if (users.size() > users.count(mContext.function))
        mDiagnostics.error(sampler->location,
                           inQuotes(variable->name) +
                               " is assigned after a function that looks it up was called");
    mAliased.push_back({variable, variable->alias});
    mGifts.push_back({variable, sampler, mContext.function});
    variable->alias = sampler;
}

// ------------------------------------------------------------------------------- in loops and switches

bool Resolver::isOfBlocksAround(const Variable* sampler) const {
    if (sampler->storage == Variable::Storage::UNIFORM)
        return true;
    const Variable* owner = sampler->samplerOwner ? sampler->samplerOwner : sampler;
    const auto isOwner = [owner](const ScopeEntry& entry) { return entry.variable == owner; };
    return owner == mContext.self || std::any_of(mContext.scope.begin(), mContext.scope.end(), isOwner) ||
           std::any_of(mGlobals.begin(), mGlobals.end(),
                       [owner](const auto& global) { return global.second == owner; });
}

/// A loop or a `switch`. What a sampler stands for depends on the way through it where the body assigns one:
/// then it is resolved once more, with numbers that say at run time what such samplers stand for.
/// @param resolve  the statement
TypedStmt* Resolver::withSelectors(SourceLocation at, const std::function<TypedStmt*()>& resolve) {
    const std::size_t firstAlias = mAliased.size();
    const std::size_t firstGift = mGifts.size();
    const std::size_t temporaries = mContext.function->temporaries.size();
    const std::size_t pastLoops = mContext.pastLoops.size();
    TypedStmt* result = resolve();
    std::vector<Variable*> changed;
    std::vector<TypedExpr*> given;
    for (std::size_t i = firstGift; i < mGifts.size(); ++i) {
        const Gift& gift = mGifts[i];
        if (!isOfBlocksAround(gift.variable))
            continue;
        if (gift.giver != mContext.function || gift.variable->type->isArray()) {
            mDiagnostics.error(at, inQuotes(gift.variable->name) +
                                       (gift.variable->type->isArray()
                                            ? ": elements cannot be assigned in a loop or a switch"
                                            : " is assigned in a function that is called in a loop or a "
                                              "switch"));
            return nullptr;
        }
        given.push_back(gift.sampler);
        if (std::find(changed.begin(), changed.end(), gift.variable) == changed.end())
            changed.push_back(gift.variable);
    }
    if (changed.empty() || mDiagnostics.hasErrors())
        return result;
    if (++mSelections > MAX_SELECTIONS) {
        mDiagnostics.error(at, "too many loops and switches that assign samplers");
        return nullptr;
    }
    for (; mAliased.size() > firstAlias; mAliased.pop_back())
        mAliased.back().variable->alias = mAliased.back().before;
    mGifts.resize(firstGift);
    mContext.function->temporaries.resize(temporaries);
    mContext.pastLoops.resize(pastLoops);
    for (Variable* variable : changed)
        if (variable->alias || variable->storage != Variable::Storage::LOCAL)
            given.push_back(useVariable(at, variable));
    auto* sequence = mArena.make<TypedStmt>(TypedStmt::Kind::SEQUENCE);
    std::vector<TypedStmt*>& statements = sequence->body;
    for (Variable* variable : changed)
        if (!addSelector(at, variable, given, statements))
            return nullptr;
    result = resolve();
    for (const Variable* variable : changed)
        mSelectors.erase(variable);
    if (result)
        statements.push_back(result);
    return sequence;
}

/// @param given   what the body gives to such variables, which may exchange it, and what they are before
/// @param before  receives what sets the number
/// @return whether there is one; else an error has been reported
bool Resolver::addSelector(SourceLocation at, Variable* variable, const std::vector<TypedExpr*>& given,
                           std::vector<TypedStmt*>& before) {
    const bool isSet = variable->alias || variable->storage != Variable::Storage::LOCAL;
    TypedExpr* initial = isSet ? useVariable(at, variable) : nullptr;
    Selector selector;
    const auto add = [&](TypedExpr* sampler) {
        const auto isIt = [&](const TypedExpr* known) { return isSameSampler(known, sampler); };
        if (selector.samplers.size() <= MAX_SAMPLER_CHOICES &&
            std::none_of(selector.samplers.begin(), selector.samplers.end(), isIt))
            selector.samplers.push_back(sampler);
    };
    for (TypedExpr* gift : given)
        for (TypedExpr* sampler : samplersIn(gift)) {
            if (mBuild.cost(sampler, variable->type) == TypedBuilder::IMPOSSIBLE)
                continue;
            const bool isOneOfAll = sampler->kind == Kind::ELEMENT && !constantValue(sampler->operands[1]);
            for (int i = 0; isOneOfAll && i < sampler->operands[0]->type->length; ++i)
                add(mBuild.element(at, sampler->operands[0], i));
            if (!isOneOfAll)
                add(sampler);
        }
    if (selector.samplers.size() > MAX_SAMPLER_CHOICES) {
        mDiagnostics.error(at,
                           "a choice among more than " + std::to_string(MAX_SAMPLER_CHOICES) + " samplers");
        return false;
    }
    selector.number = makeVariable(Variable::Storage::LOCAL, "choice", mTypes.scalar(Scalar::INT), nullptr);
    mProgram->temporaries.push_back(selector.number); // other functions may look up the sampler, too
    TypedExpr* number = initial ? numberOf(at, selector.samplers, initial) : nothing(at);
    if (!number)
        return false;
    auto* start = mArena.make<TypedStmt>(TypedStmt::Kind::EXPR);
    start->expression = mBuild.assign(at, mBuild.variable(at, selector.number), number);
    before.push_back(start);
    TypedExpr* choice = selector.samplers.back();
    for (std::size_t i = selector.samplers.size() - 1; i-- > 0;) {
        TypedExpr* isIt =
            mBuild.binary(at, BinaryOp::EQUAL, mBuild.variable(at, selector.number),
                          mBuild.literal(at, mTypes.scalar(Scalar::INT), static_cast<double>(i)));
        choice = mBuild.make(Kind::CONDITIONAL, at, variable->type, {isIt, selector.samplers[i], choice});
    }
    alias(variable, choice);
    mSelectors[variable] = selector;
    return true;
}

/// The number of a sampler among those that a selector chooses from, as an expression.
/// @param sampler  frozen, as its index is written several times
TypedExpr* Resolver::numberOf(SourceLocation at, const std::vector<TypedExpr*>& samplers,
                              TypedExpr* sampler) {
    const Type* integer = mTypes.scalar(Scalar::INT);
    if (sampler->kind == Kind::CONDITIONAL) {
        TypedExpr* whenTrue = numberOf(at, samplers, sampler->operands[1]);
        TypedExpr* whenFalse = whenTrue ? numberOf(at, samplers, sampler->operands[2]) : nullptr;
        return whenFalse
                   ? mBuild.make(Kind::CONDITIONAL, at, integer, {sampler->operands[0], whenTrue, whenFalse})
                   : nullptr;
    }
    for (std::size_t i = 0; i < samplers.size(); ++i)
        if (isSameSampler(samplers[i], sampler))
            return mBuild.literal(at, integer, static_cast<double>(i));
    if (sampler->kind != Kind::ELEMENT || constantValue(sampler->operands[1])) {
        mDiagnostics.error(at, "this sampler cannot be assigned in a loop or a switch");
        return nullptr;
    }
    TypedExpr* result = nullptr;
    for (int i = sampler->operands[0]->type->length - 1; i >= 0; --i) {
        TypedExpr* number = numberOf(at, samplers, mBuild.element(at, sampler->operands[0], i));
        if (!number)
            return nullptr;
        TypedExpr* isIt =
            result ? mBuild.binary(at, BinaryOp::EQUAL, sampler->operands[1], mBuild.literal(at, integer, i))
                   : nullptr;
        result = result ? mBuild.make(Kind::CONDITIONAL, at, integer, {isIt, number, result}) : number;
    }
    return result;
}

// ---------------------------------------------------------------------------------------------- copies

/// The sampler as it is chosen now, whatever becomes of what it is chosen by.
/// @param preparation  receives what keeps that, or nothing
TypedExpr* Resolver::frozen(TypedExpr* sampler, TypedExpr*& preparation) {
    const bool isChoice = sampler->kind == Kind::CONDITIONAL;
    if (!isChoice && sampler->kind != Kind::ELEMENT)
        return sampler;
    TypedExpr* result = mArena.make<TypedExpr>(*sampler);
    TypedExpr*& decision = result->operands[isChoice ? 0 : 1];
    if (!constantValue(decision)) {
        const SourceLocation at = decision->location;
        Variable* place = makeVariable(Variable::Storage::LOCAL, "choice", decision->type, nullptr);
        mProgram->temporaries.push_back(place); // other functions may look up the sampler, too
        TypedExpr* keep = mBuild.assign(at, mBuild.variable(at, place), decision);
        preparation = preparation ? mBuild.comma(at, preparation, keep) : keep;
        decision = mBuild.variable(at, place);
    }
    if (isChoice)
        for (std::size_t i = 1; i < result->operands.size(); ++i)
            result->operands[i] = frozen(result->operands[i], preparation);
    return result;
}

/// The samplers of a struct that is copied: those of the copy stand for those of the original.
/// @return what has to be done for it, or null
TypedExpr* Resolver::aliasSamplers(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    std::string targetPath;
    std::string valuePath;
    std::vector<const TypedExpr*> targetElements;
    std::vector<const TypedExpr*> valueElements;
    Variable* targetRoot = walk(target, targetPath, targetElements);
    if (targetRoot && targetElements.empty() && value->kind == Kind::CONSTRUCT && value->type->isStruct())
        return giveListed(at, targetRoot, targetPath, value);
    Variable* valueRoot = walk(value, valuePath, valueElements);
    if (!targetRoot || !valueRoot || !targetElements.empty()) {
        mDiagnostics.error(at, "samplers can only be copied between variables");
        return nullptr;
    }
    TypedExpr* effects = nullptr;
    std::vector<std::pair<std::string, std::pair<const Type*, int>>> pieces;
    listSamplers(target->type, "", 1, pieces);
    for (const auto& [path, typeAndCount] : pieces) {
        const auto [type, count] = typeAndCount;
        const Type* pieceType = count > 1 ? mTypes.array(type, count) : type;
        Variable* piece = samplerPiece(targetRoot, targetPath + path, pieceType);
        TypedExpr* source = nullptr;
        if (valueElements.empty()) {
            source = useVariable(at, samplerPiece(valueRoot, valuePath + path, pieceType));
        } else if (valueElements.size() == 1 && count == 1) {
            const TypedExpr* element = valueElements[0];
            const Type* array = mTypes.array(type, element->operands[0]->type->length);
            source = mBuild.element(at, useVariable(at, samplerPiece(valueRoot, valuePath + path, array)),
                                    element->operands[1]);
        }
        TypedExpr* effect = source ? giveSampler(at, piece, source) : nullptr;
        if (effect)
            effects = effects ? mBuild.comma(at, effects, effect) : effect;
    }
    return effects;
}

/// A look-up has decided what kind a sampler is.
void Resolver::agree(TypedExpr* sampler, const Type* type) {
    if (sampler->kind == Kind::CONDITIONAL) {
        for (TypedExpr* one : samplersIn(sampler))
            agree(one, type);
        sampler->type = type;
        return;
    }
    Variable* root = rootVariable(sampler);
    if (!root)
        return;
    (isDepthSampler(type->sampler) ? root->comparesDepth : root->givesColour) = true;
    if (root->comparesDepth && root->givesColour)
        mPlainSamplers.insert(root->name);
    if (sampler->type == type)
        return;
    const Type* old = root->type;
    const bool isArray = old->isArray() && !type->isArray();
    root->type = isArray ? mTypes.array(type, old->length) : type;
    for (TypedExpr* part = sampler; part; part = part->operands.empty() ? nullptr : part->operands[0])
        part->type = part->kind == Kind::VARIABLE ? root->type : type;
}

/// The samplers among the members of an entry's parameter that is no uniform: they are uniforms nevertheless.
/// @param outer  the variable around the entry's call
void Resolver::addUniformSamplers(Variable* inner, Variable* outer) {
    std::vector<std::pair<std::string, std::pair<const Type*, int>>> pieces;
    listSamplers(inner->type, "", 1, pieces);
    outer->storage = Variable::Storage::UNIFORM; // as its pieces are to be
    for (const auto& [path, typeAndCount] : pieces) {
        const auto [type, count] = typeAndCount;
        samplerPiece(outer, path, count > 1 ? mTypes.array(type, count) : type);
    }
    outer->storage = Variable::Storage::LOCAL;
    inner->samplers = outer->samplers;
}

void Resolver::addSamplerParameters(Function* function, Variable* parameter) {
    std::vector<std::pair<std::string, std::pair<const Type*, int>>> pieces;
    listSamplers(parameter->type, "", 1, pieces);
    for (const auto& [path, typeAndCount] : pieces) {
        const auto [type, count] = typeAndCount;
        function->parameters.push_back(
            samplerPiece(parameter, path, count > 1 ? mTypes.array(type, count) : type));
    }
}

} // namespace cg
