#include <Cg/Compiler/Resolver.h>

#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/StateBindings.h>

#include <algorithm>
#include <cctype>
#include <string>

namespace cg {

namespace {

constexpr int MAX_LEAVES = 1 << 18; ///< components of one variable

std::string upper(Name text) {
    std::string result(text);
    for (char& c : result)
        c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return result;
}

} // namespace

Resolver::Resolver(const TranslationUnit& unit, Stage stage, Arena& arena, TypeTable& types,
                   Diagnostics& diagnostics, std::set<Name>& plainSamplers)
    : mUnit(unit), mStage(stage), mArena(arena), mTypes(types), mDiagnostics(diagnostics),
      mPlainSamplers(plainSamplers), mBuild(arena, types, diagnostics), mProgram(arena.make<TypedProgram>()) {
    collect();
}

/// Enters all names of the program, without looking at what they stand for. A name that is declared twice
/// keeps its first meaning; a global's later declaration may bring its initializer.
void Resolver::collect() {
    std::size_t ordinal = 0;
    for (const Decl* declaration : mUnit.declarations) {
        ++ordinal;
        switch (declaration->kind) {
        case Decl::Kind::VARIABLE: {
            const auto* variable = static_cast<const VariableDecl*>(declaration);
            collectDefinition(variable->type);
            const VariableDecl*& slot = mGlobalDecls[variable->name];
            if (!slot || (!slot->initializer && variable->initializer))
                slot = variable;
            break;
        }
        case Decl::Kind::FUNCTION: {
            const auto* function = static_cast<const FunctionDecl*>(declaration);
            collectDefinition(function->returnType);
            mOrdinals[function] = ordinal;
            if (function->ownerName.empty())
                mFunctionDecls[function->name].push_back(function);
            else
                mOutsideMethods[function->ownerName].push_back(function);
            break;
        }
        case Decl::Kind::STRUCT: {
            const auto* structure = static_cast<const StructDecl*>(declaration);
            const StructDecl*& slot = mStructDecls[structure->name];
            if (!slot || (slot->members.empty() && slot->methods.empty()))
                slot = structure;
            for (const FunctionDecl* method : structure->methods)
                mOrdinals[method] = ordinal;
            break;
        }
        case Decl::Kind::TYPEDEF: {
            const auto* alias = static_cast<const TypedefDecl*>(declaration);
            collectDefinition(alias->type);
            mTypedefs.emplace(alias->name, alias);
            break;
        }
        }
    }
}

void Resolver::collectDefinition(const TypeSyntax* type) {
    if (type && type->definition && !type->definition->name.empty())
        mStructDecls.emplace(type->definition->name, type->definition);
}

// ----------------------------------------------------------------------------------------------- types

const Type* Resolver::findType(Name name) {
    for (auto it = mContext.scope.rbegin(); it != mContext.scope.rend(); ++it)
        if (it->type && it->name == name)
            return it->type;
    const auto structure = mStructDecls.find(name);
    if (structure != mStructDecls.end())
        return structType(structure->second);
    const auto alias = mTypedefs.find(name);
    if (alias == mTypedefs.end())
        return mTypes.find(name);
    const auto [slot, isNew] = mTypedefTypes.emplace(alias->second, nullptr);
    if (isNew) { // the null in the table ends a typedef of itself
        const Type* type = typeOf(alias->second->type, alias->second->dimensions);
        mTypedefTypes[alias->second] = type;
        return type;
    }
    return slot->second;
}

const Type* Resolver::typeOf(const TypeSyntax* syntax) {
    const Type* type = nullptr;
    if (syntax->definition) {
        type = structType(syntax->definition);
    } else if (syntax->isUnsigned) {
        type = mTypes.find(syntax->name);
        if (type && type->isNumeric())
            type = mTypes.withScalar(type, Scalar::UINT);
    } else {
        type = findType(syntax->name);
    }
    if (!type) {
        std::vector<Name> known = builtinTypeNames();
        for (const auto& entry : mStructDecls)
            known.push_back(entry.first);
        for (const auto& entry : mTypedefs)
            known.push_back(entry.first);
        mDiagnostics.error(syntax->location,
                           "unknown type " + inQuotes(syntax->name) + suggestion(syntax->name, known));
        return nullptr;
    }
    return withDimensions(syntax->location, type, syntax->dimensions);
}

const Type* Resolver::typeOf(const TypeSyntax* syntax, const std::vector<Expr*>& dimensions) {
    const Type* type = typeOf(syntax);
    type = type ? withDimensions(syntax->location, type, dimensions) : nullptr;
    return type ? checkSize(syntax->location, type) : nullptr;
}

const Type* Resolver::withDimensions(SourceLocation at, const Type* type,
                                     const std::vector<Expr*>& dimensions) {
    for (auto it = dimensions.rbegin(); it != dimensions.rend(); ++it) {
        const int length = *it ? arrayLength(*it) : Type::UNSIZED;
        if (length == 0)
            return nullptr;
        if (type->isArray() && type->length == Type::UNSIZED) {
            mDiagnostics.error(at, "only the first size of an array can be left open");
            return nullptr;
        }
        type = mTypes.array(type, length);
    }
    return type;
}

/// @return the length, or 0 after an error
int Resolver::arrayLength(const Expr* dimension) {
    const TypedExpr* length = expression(dimension);
    if (!length)
        return 0;
    const auto value = length->type->isScalar() ? constantValue(length) : std::nullopt;
    if (!value || (*value)[0] < 1 || (*value)[0] > MAX_ARRAY_LENGTH) {
        mDiagnostics.error(dimension->location,
                           !value ? "the size of an array must be a constant"
                                  : "an array has 1 to " + std::to_string(MAX_ARRAY_LENGTH) + " elements");
        return 0;
    }
    return static_cast<int>((*value)[0]);
}

const Type* Resolver::checkSize(SourceLocation at, const Type* type) {
    if (countLeaves(type, MAX_LEAVES) < MAX_LEAVES)
        return type;
    mDiagnostics.error(at, "'" + nameOf(type) + "' is too large");
    return nullptr;
}

const Type* Resolver::structType(const StructDecl* declaration) {
    const auto found = mStructTypes.find(declaration);
    if (found != mStructTypes.end()) {
        if (!found->second)
            mDiagnostics.error(declaration->location,
                               "struct " + inQuotes(declaration->name) + " contains itself");
        return found->second;
    }
    mStructTypes[declaration] = nullptr;
    const Type* type = mTypes.makeStruct(declaration);
    fillStruct(type);
    mStructTypes[declaration] = type;
    mTypes.noteStruct(type);
    return type;
}

void Resolver::fillStruct(const Type* type) {
    StructType* structure = type->structure;
    const StructDecl* declaration = structure->declaration;
    if (!declaration->baseName.empty()) {
        const Type* base = findType(declaration->baseName);
        if (!base || !base->isStruct())
            mDiagnostics.error(declaration->location, "unknown base " + inQuotes(declaration->baseName));
        else if (base->structure->declaration->isInterface)
            structure->interface = base->structure->declaration;
        else
            structure->fields = base->structure->fields;
    }
    for (const VariableDecl* member : declaration->members) {
        const Type* memberType = typeOf(member->type, member->dimensions);
        if (!memberType)
            continue;
        if (memberType->isVoid()) {
            mDiagnostics.error(member->location, "a member cannot be void");
            continue;
        }
        structure->fields.push_back({member->name, memberType, member});
    }
    for (const Field& field : structure->fields)
        structure->hasSamplers = structure->hasSamplers || containsSampler(field.type);
}

bool Resolver::implements(const Type* type, const Type* interface) const {
    return type->isStruct() && interface->isStruct() && type->structure->interface &&
           type->structure->interface == interface->structure->declaration;
}

// --------------------------------------------------------------------------------------------- globals

Variable* Resolver::makeVariable(Variable::Storage storage, Name name, const Type* type,
                                 const VariableDecl* declaration) {
    auto* variable = mArena.make<Variable>();
    variable->storage = storage;
    variable->name = name;
    variable->type = type;
    variable->declaration = declaration;
    return variable;
}

/// A temporary of the function that is being resolved, or of the globals' initializers.
Variable* Resolver::temporary(const Type* type) {
    Variable* variable = makeVariable(Variable::Storage::LOCAL, "temporary", type, nullptr);
    auto& temporaries = mContext.function ? mContext.function->temporaries : mProgram->temporaries;
    temporaries.push_back(variable);
    return variable;
}

/// @return null after an error
Variable* Resolver::globalVariable(const VariableDecl* declaration) {
    const auto found = mGlobals.find(declaration);
    if (found != mGlobals.end()) {
        if (found->second && !found->second->type)
            mDiagnostics.error(declaration->location, inQuotes(declaration->name) + " depends on itself");
        return found->second && found->second->type ? found->second : nullptr;
    }
    Variable* variable = makeVariable(Variable::Storage::GLOBAL, declaration->name, nullptr, declaration);
    mGlobals[declaration] = variable;
    Context outer; // a global is resolved as if no function were being resolved
    std::swap(outer, mContext);
    resolveGlobal(variable, declaration);
    std::swap(outer, mContext);
    if (!variable->type)
        mGlobals[declaration] = nullptr;
    return variable->type ? variable : nullptr;
}

/// Decides what a global is: a uniform with or without a default value, a constant, or a variable of the
/// program. Leaves its type null after an error.
void Resolver::resolveGlobal(Variable* variable, const VariableDecl* declaration) {
    const Type* type = typeOf(declaration->type, declaration->dimensions);
    if (!type)
        return;
    TypedExpr* value = nullptr;
    if (declaration->initializer && !containsSampler(type)) {
        value = initializer(type, declaration->initializer);
        if (!value)
            return;
    }
    const bool isUnsized = type->isArray() && type->length == Type::UNSIZED;
    if (type->isVoid() ||
        (isUnsized && (declaration->qualifiers.isStatic || declaration->qualifiers.isConst))) {
        mDiagnostics.error(declaration->location,
                           inQuotes(declaration->name) + " cannot be '" + nameOf(type) + "'");
        return;
    }
    variable->type = type;
    variable->isUnsized = isUnsized;
    variable->initializer = value;
    const Qualifiers& qualifiers = declaration->qualifiers;
    const bool isUniform =
        containsSampler(type) || qualifiers.isUniform ||
        (!qualifiers.isStatic && !(qualifiers.isConst && value) && (!value || constantValue(value)));
    if (qualifiers.isStatic && declaration->initializer && isOpaque(type)) { // a name for another one
        variable->storage = Variable::Storage::LOCAL;
        variable->alias = samplerValue(type, declaration->initializer);
        if (!variable->alias)
            variable->type = nullptr;
        return;
    }
    if (isUniform) {
        variable->storage = Variable::Storage::UNIFORM;
        bindState(variable);
        mProgram->uniforms.push_back(variable);
        return;
    }
    variable->isConst = qualifiers.isConst;
    variable->isConstantExpression = qualifiers.isConst && value && isGlslConstant(value);
    mProgram->globals.push_back(variable);
}

/// A uniform whose semantic names a piece of OpenGL's own state stands for that.
void Resolver::bindState(Variable* variable) {
    const SourceLocation at = variable->declaration->location;
    const std::string semantic(variable->declaration->semantic.name);
    const std::size_t point = semantic.find('.');
    const std::string root = upper(Name(semantic).substr(0, point));
    if (point == std::string::npos || (root != "STATE" && root != "GLSTATE"))
        return;
    const StateBinding state = findState(semantic.substr(point + 1), mTypes);
    if (!state.type)
        return;
    TypedExpr* value = mBuild.builtin(at, state.type, mArena.keep(state.form), {});
    value->variable = variable;
    if (mBuild.cost(value, variable->type) != TypedBuilder::IMPOSSIBLE)
        variable->state = mBuild.convert(value, variable->type);
}

// ---------------------------------------------------------------------------------------- initializers

/// @param type  an unsized array gets its length here
TypedExpr* Resolver::initializer(const Type*& type, const Expr* expr) {
    if (expr->kind == Expr::Kind::INIT_LIST) {
        const auto* list = static_cast<const InitListExpr*>(expr);
        if (type->isArray() && type->length == Type::UNSIZED)
            type = sizedByList(type, list);
        return type ? fromList(type, list) : nullptr;
    }
    TypedExpr* value = expression(expr);
    if (!value)
        return nullptr;
    if (type->isArray() && type->length == Type::UNSIZED && value->type->isArray())
        type = mTypes.array(type->element, value->type->length);
    return mBuild.convert(value, type);
}

/// The length that a list gives an array: its elements, or its scalars where it is flat.
const Type* Resolver::sizedByList(const Type* type, const InitListExpr* list) {
    const Type* element = type->element;
    int length = static_cast<int>(std::min<std::size_t>(list->elements.size(), MAX_ARRAY_LENGTH));
    if (!element->isScalar() && !list->elements.empty() && list->elements[0]->kind != Expr::Kind::INIT_LIST) {
        const TypedExpr* first = expression(list->elements[0]);
        if (!first)
            return nullptr;
        const int each = countLeaves(element, MAX_LEAVES);
        if (first->type->isScalar() && each > 1)
            length = (length + each - 1) / each;
    }
    if (length == 0) {
        mDiagnostics.error(list->location, "an empty list gives an array no size");
        return nullptr;
    }
    return mTypes.array(element, length);
}

TypedExpr* Resolver::fromList(const Type* type, const InitListExpr* list) {
    ListCursor cursor{list->elements};
    if (list->elements.empty())
        return mBuild.zero(list->location, type);
    TypedExpr* value = fillPieces(list->location, type, cursor);
    if (value && !isAtEnd(cursor))
        mDiagnostics.warning(list->elements[cursor.next]->location,
                             "more values than '" + nameOf(type) + "' takes");
    return value;
}

/// @return the value that the cursor stands on, unused; null after an error
TypedExpr* Resolver::nextValue(ListCursor& cursor) {
    if (!cursor.value) {
        cursor.value = expression(cursor.elements[cursor.next]);
        if (!cursor.value)
            cursor.next = cursor.elements.size(); // said once is enough
    }
    return cursor.value;
}

/// Takes one value of the type from the list: an inner list, a value that fits, or piece by piece.
TypedExpr* Resolver::fill(const Type* type, ListCursor& cursor) {
    if (isAtEnd(cursor))
        return mBuild.zero(cursor.elements.back()->location, type);
    const Expr* next = cursor.elements[cursor.next];
    if (next->kind == Expr::Kind::INIT_LIST && !cursor.value) {
        ++cursor.next;
        return fromList(type, static_cast<const InitListExpr*>(next));
    }
    if (type->isNumeric())
        return fillNumber(type, cursor);
    TypedExpr* value = nextValue(cursor);
    if (!value)
        return nullptr;
    const bool fits = cursor.component == 0 && mBuild.cost(value, type) != TypedBuilder::IMPOSSIBLE;
    if (!fits && (type->isArray() || type->isStruct()))
        return fillPieces(next->location, type, cursor);
    ++cursor.next;
    cursor.value = nullptr;
    return mBuild.convert(value, type);
}

/// Elements, members or components, one after another.
TypedExpr* Resolver::fillPieces(SourceLocation at, const Type* type, ListCursor& cursor) {
    std::vector<const Type*> pieces;
    const bool startsWithList = !cursor.value && cursor.elements[cursor.next]->kind == Expr::Kind::INIT_LIST;
    if (type->isArray())
        pieces.assign(static_cast<std::size_t>(std::max(type->length, 0)), type->element);
    else if (type->isStruct())
        for (const Field& field : type->structure->fields)
            pieces.push_back(isOpaque(field.type) ? nullptr : field.type);
    else if (type->isMatrix() && !type->isThinMatrix() && startsWithList)
        pieces.assign(static_cast<std::size_t>(type->rows), mTypes.vector(type->scalar, type->columns));
    else
        return fill(type, cursor);
    TypedExpr* whole = mBuild.make(TypedExpr::Kind::CONSTRUCT, at, type);
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        if (!pieces[i]) { // a sampler has no place in the value, and may be left out
            const bool isValue = cursor.value || (!isAtEnd(cursor) && cursor.elements[cursor.next]->kind !=
                                                                          Expr::Kind::INIT_LIST);
            TypedExpr* sampler = isValue ? nextValue(cursor) : nullptr;
            if (isValue && !sampler)
                return nullptr;
            const Type* wanted = type->structure->fields[i].type;
            if (!sampler || !sampler->type->isSampler() || !wanted->isSampler())
                continue;
            mListedSamplers[whole][i] = mBuild.convert(sampler, wanted);
            if (!mListedSamplers[whole][i])
                return nullptr;
            ++cursor.next;
            cursor.value = nullptr;
            continue;
        }
        TypedExpr* value = fill(pieces[i], cursor);
        if (!value)
            return nullptr;
        whole->operands.push_back(value);
    }
    return whole;
}

/// Gathers the components of a number, from as many values as it takes; a value may serve several numbers.
TypedExpr* Resolver::fillNumber(const Type* type, ListCursor& cursor) {
    TypedExpr* first = nextValue(cursor);
    if (!first)
        return nullptr;
    const SourceLocation at = first->location;
    if (!first->type->isNumeric()) {
        mDiagnostics.error(at, "cannot convert from '" + nameOf(first->type) + "' to '" + nameOf(type) + "'");
        return nullptr;
    }
    const bool isLastValue = cursor.next + 1 == cursor.elements.size();
    const bool isWhole =
        first->type->components() == type->components() || (isLastValue && !type->isScalar());
    if (cursor.component == 0 && isWhole && mBuild.cost(first, type) != TypedBuilder::IMPOSSIBLE) {
        ++cursor.next;
        cursor.value = nullptr;
        return mBuild.convert(first, type);
    }
    std::vector<TypedExpr*> parts;
    for (int wanted = type->components(); wanted > 0;) {
        if (isAtEnd(cursor) ||
            (cursor.elements[cursor.next]->kind == Expr::Kind::INIT_LIST && !cursor.value)) {
            parts.push_back(mBuild.zero(at, mTypes.scalar(type->scalar)));
            --wanted;
            continue;
        }
        TypedExpr* value = nextValue(cursor);
        if (!value)
            return nullptr;
        if (!value->type->isNumeric()) {
            mDiagnostics.error(value->location,
                               "a list for '" + nameOf(type) + "' holds no '" + nameOf(value->type) + "'");
            return nullptr;
        }
        const int available = value->type->components() - cursor.component;
        const int taken = std::min(wanted, available);
        if (value->type->isScalar() || taken == value->type->components()) {
            parts.push_back(value);
        } else {
            for (int i = cursor.component; i < cursor.component + taken; ++i) {
                const int columns = value->type->columns;
                TypedExpr* row = value->type->isMatrix() ? mBuild.element(at, value, i / columns) : value;
                parts.push_back(mBuild.swizzle(at, row, {i % columns}));
            }
        }
        wanted -= taken;
        cursor.component += taken;
        if (taken == available) {
            ++cursor.next;
            cursor.value = nullptr;
            cursor.component = 0;
        }
    }
    if (parts.size() == 1)
        return mBuild.convert(parts[0], type);
    return mBuild.construct(at, type, parts);
}

// ------------------------------------------------------------------------------------------- the entry

namespace {

/// TEXCOORD1 + 2 = TEXCOORD3; a semantic without a number counts from 0.
std::string numbered(const std::string& semantic, int offset) {
    std::size_t digits = semantic.size();
    while (digits > 0 && std::isdigit(static_cast<unsigned char>(semantic[digits - 1])) != 0)
        --digits;
    const std::string number = semantic.substr(digits);
    const int first = number.empty() || number.size() > 4 ? 0 : std::stoi(number);
    return semantic.substr(0, digits) + std::to_string(first + offset);
}

} // namespace

TypedProgram* Resolver::resolve(const std::string& entry) {
    const FunctionDecl* declaration = nullptr;
    const auto found = mFunctionDecls.find(entry);
    if (found != mFunctionDecls.end())
        for (const FunctionDecl* candidate : found->second)
            if (candidate->body)
                declaration = candidate;
    if (declaration)
        resolveEntry(declaration);
    else
        refuseEntry(entry);
    addGlobals();
    return mProgram;
}

void Resolver::refuseEntry(const std::string& entry) {
    std::vector<Name> known;
    for (const auto& function : mFunctionDecls)
        known.push_back(function.first);
    mDiagnostics.error({}, "the program has no function " + inQuotes(entry) + " to start with" +
                               suggestion(entry, known));
}

bool Resolver::hasSemantics(const Type* type) const {
    while (type->isArray())
        type = type->element;
    if (!type->isStruct())
        return false;
    const auto& fields = type->structure->fields;
    return std::any_of(fields.begin(), fields.end(), [this](const Field& field) {
        return !field.declaration->semantic.name.empty() || hasSemantics(field.type);
    });
}

bool Resolver::isUniformParameter(const VariableDecl* parameter, const Type* type) {
    const Qualifiers& qualifiers = parameter->qualifiers;
    if (qualifiers.isUniform || (containsSampler(type) && !hasSemantics(type)))
        return true;
    const bool isInput = qualifiers.direction == Direction::IN || qualifiers.direction == Direction::NONE;
    const std::string semantic = upper(parameter->semantic.name);
    if (semantic.rfind("STATE.", 0) == 0 || semantic.rfind("GLSTATE.", 0) == 0)
        return true;
    return isInput && !qualifiers.isVarying && type->isStruct() && semantic.empty() && !hasSemantics(type);
}

/// A uniform of the entry's parameter list.
Variable* Resolver::uniformVariable(const VariableDecl* declaration, const Type* type) {
    Variable* variable = makeVariable(Variable::Storage::UNIFORM, declaration->name, nullptr, declaration);
    resolveGlobal(variable, declaration);
    if (variable->type && variable->storage != Variable::Storage::UNIFORM) {
        variable->storage = Variable::Storage::UNIFORM; // without the word, or with a const
        variable->isConst = false;
        mProgram->globals.pop_back();
        mProgram->uniforms.push_back(variable);
    }
    if (!variable->type)
        variable->type = type;
    return variable;
}

void Resolver::resolveEntry(const FunctionDecl* declaration) {
    auto* function = mArena.make<Function>();
    function->name = declaration->name;
    function->declaration = declaration;
    function->result = typeOf(declaration->returnType);
    if (!function->result)
        return;
    const SourceLocation at = declaration->location;
    mProgram->entry = function;
    for (const VariableDecl* parameter : declaration->parameters) {
        const Type* type = typeOf(parameter->type, parameter->dimensions);
        if (!type)
            continue;
        if (parameter->initializer && type->isArray() && type->length == Type::UNSIZED)
            initializer(type, parameter->initializer);
        const bool isUnsized = type && type->isArray() && type->length == Type::UNSIZED;
        if (!type || type->isVoid() || (isUnsized && !isUniformParameter(parameter, type))) {
            mDiagnostics.error(parameter->location,
                               "parameter " + inQuotes(parameter->name) + " of the entry needs a known size");
            continue;
        }
        TypedParameter listed;
        listed.name = parameter->name;
        listed.type = type;
        listed.semantic = parameter->semantic.name;
        listed.direction = parameter->qualifiers.direction == Direction::NONE
                               ? Direction::IN
                               : parameter->qualifiers.direction;
        if (isUniformParameter(parameter, type)) {
            listed.variable = uniformVariable(parameter, type);
            listed.type = listed.variable->type;
            mContext.scope.push_back({parameter->name, listed.variable, nullptr});
        } else {
            listed.isUniform = false;
            Variable* inner = makeVariable(Variable::Storage::PARAMETER, parameter->name, type, parameter);
            inner->direction = listed.direction;
            inner->isConst = parameter->qualifiers.isConst && listed.direction == Direction::IN;
            function->parameters.push_back(inner);
            mContext.scope.push_back({parameter->name, inner, nullptr});
            listed.variable = makeVariable(Variable::Storage::LOCAL, parameter->name, type, parameter);
            mProgram->arguments.push_back(listed.variable);
            if (containsSampler(type))
                addUniformSamplers(inner, listed.variable);
            TypedExpr* place = mBuild.variable(parameter->location, listed.variable);
            const std::string semantic = upper(parameter->semantic.name);
            if (listed.direction != Direction::OUT)
                addStageValues(place, semantic, parameter->name, false);
            if (listed.direction != Direction::IN)
                addStageValues(place, semantic, parameter->name, true);
        }
        mProgram->parameters.push_back(listed);
    }
    if (!function->result->isVoid()) {
        mProgram->result = makeVariable(Variable::Storage::LOCAL, "result", function->result, nullptr);
        std::string semantic = upper(declaration->semantic.name);
        if (semantic.empty() && !function->result->isStruct())
            semantic = mStage == Stage::VERTEX ? "POSITION" : "COLOR";
        addStageValues(mBuild.variable(at, mProgram->result), semantic, "result", true);
        TypedParameter listed;
        listed.name = "return";
        listed.type = function->result;
        listed.semantic = declaration->semantic.name;
        listed.direction = Direction::OUT;
        listed.isUniform = false;
        listed.variable = mProgram->result;
        mProgram->parameters.push_back(listed);
    }
    mContext.function = function;
    mContext.ordinal = mOrdinals[declaration];
    function->isBeingResolved = true;
    mInstances[declaration].push_back({{}, false, function});
    function->body = block(declaration->body);
    endBody(function, declaration);
    function->isBeingResolved = false;
    mProgram->functions.push_back(function);
    mContext = Context();
}

/// Splits a value into what single semantics carry: members, elements, rows.
void Resolver::addStageValues(TypedExpr* place, std::string semantic, Name name, bool isOutput) {
    const Type* type = place->type;
    const SourceLocation at = place->location;
    if (isOpaque(type))
        return;
    if (type->isStruct()) {
        const auto& fields = type->structure->fields;
        int offset = 0;
        for (std::size_t i = 0; i < fields.size(); ++i) {
            std::string own = upper(fields[i].declaration->semantic.name);
            if (own.empty() && !semantic.empty())
                own = numbered(semantic, offset++);
            addStageValues(mBuild.field(at, place, static_cast<int>(i)), own, fields[i].name, isOutput);
        }
        return;
    }
    if (semantic.empty())
        semantic = upper(name);
    const bool isMatrix = type->isMatrix() && !type->isThinMatrix();
    if (type->isArray() || isMatrix) {
        const int count = type->isArray() ? type->length : type->rows;
        for (int i = 0; i < count; ++i)
            addStageValues(mBuild.element(at, place, i), numbered(semantic, i), name, isOutput);
        return;
    }
    mProgram->values.push_back({semantic, place, isOutput});
}

/// All globals that are parameters, referenced or not.
void Resolver::addGlobals() {
    for (const Decl* declaration : mUnit.declarations) {
        if (declaration->kind != Decl::Kind::VARIABLE)
            continue;
        const auto* variableDecl = static_cast<const VariableDecl*>(declaration);
        if (mGlobalDecls[variableDecl->name] != variableDecl || variableDecl->qualifiers.isStatic)
            continue;
        const Type* named = mTypes.find(variableDecl->type->name);
        if (named && named->kind == Type::Kind::TEXT)
            continue;
        const Variable* known = globalVariable(variableDecl);
        if (!known || known->storage != Variable::Storage::UNIFORM)
            continue;
        TypedParameter listed;
        listed.name = variableDecl->name;
        listed.type = known->type;
        listed.semantic = variableDecl->semantic.name;
        listed.isGlobal = true;
        listed.variable = mGlobals[variableDecl];
        mProgram->parameters.push_back(listed);
    }
}

} // namespace cg
