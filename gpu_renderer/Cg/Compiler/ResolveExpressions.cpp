#include <Cg/Compiler/Resolver.h>

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/StateBindings.h>

#include <algorithm>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// Number of single-letter changes from one name to the other; stops counting above the limit.
std::size_t editDistance(Name a, Name b, std::size_t limit) {
    if (a.size() > b.size() + limit || b.size() > a.size() + limit)
        return limit + 1;
    std::vector<std::size_t> row(b.size() + 1);
    for (std::size_t j = 0; j <= b.size(); ++j)
        row[j] = j;
    for (std::size_t i = 1; i <= a.size(); ++i) {
        std::size_t diagonal = row[0];
        row[0] = i;
        for (std::size_t j = 1; j <= b.size(); ++j) {
            const std::size_t above = row[j];
            row[j] = std::min({row[j] + 1, row[j - 1] + 1, diagonal + (a[i - 1] == b[j - 1] ? 0U : 1U)});
            diagonal = above;
        }
    }
    return row[b.size()];
}

constexpr std::size_t MAX_SUGGESTED_NAME = 40;

/// Positions of a swizzle's letters, or nothing: all of one set.
std::vector<int> swizzleComponents(Name name) {
    if (name.empty() || name.size() > 4)
        return {};
    for (const Name set : {Name("xyzw"), Name("rgba"), Name("stpq")}) {
        std::vector<int> components;
        for (const char letter : name) {
            const std::size_t position = set.find(letter);
            if (position == Name::npos)
                break;
            components.push_back(static_cast<int>(position));
        }
        if (components.size() == name.size())
            return components;
    }
    return {};
}

struct MatrixElement {
    int row;
    int column;
};

/// `_m00_m11` counts from 0, `_11_22` from 1; nothing where the name is neither.
std::vector<MatrixElement> matrixSwizzle(Name name) {
    std::vector<MatrixElement> elements;
    while (!name.empty()) {
        const bool fromZero = name.size() >= 4 && name[0] == '_' && name[1] == 'm';
        const std::size_t length = fromZero ? 4 : 3;
        if (name.size() < length || name[0] != '_' || elements.size() == 4)
            return {};
        const Name digits = fromZero ? "0123" : "1234";
        const std::size_t row = digits.find(name[length - 2]);
        const std::size_t column = digits.find(name[length - 1]);
        if (row == Name::npos || column == Name::npos)
            return {};
        elements.push_back({static_cast<int>(row), static_cast<int>(column)});
        name = name.substr(length);
    }
    return elements;
}

bool hasDuplicates(const TypedExpr* swizzle) {
    for (int i = 0; i < swizzle->type->columns; ++i)
        for (int j = 0; j < i; ++j)
            if (swizzle->components[static_cast<std::size_t>(i)] ==
                swizzle->components[static_cast<std::size_t>(j)])
                return true;
    return false;
}

/// The source text of `state.light[0].position`, from the second step on; empty where it is something else.
std::string statePath(const Expr* expr, Name& root) {
    if (expr->kind == Expr::Kind::NAME) {
        root = static_cast<const NameExpr*>(expr)->name;
        return {};
    }
    if (expr->kind == Expr::Kind::MEMBER) {
        const auto* member = static_cast<const MemberExpr*>(expr);
        const std::string path = statePath(member->object, root);
        return path.empty() ? std::string(member->name) : path + "." + std::string(member->name);
    }
    if (expr->kind == Expr::Kind::INDEX) {
        const auto* index = static_cast<const IndexExpr*>(expr);
        const std::string path = statePath(index->object, root);
        if (index->index->kind != Expr::Kind::LITERAL || path.empty())
            return {};
        const double number = static_cast<const LiteralExpr*>(index->index)->number;
        return path + "[" + std::to_string(static_cast<int>(std::clamp(number, 0.0, 999.0))) + "]";
    }
    return {};
}

} // namespace

TypedExpr* Resolver::expression(const Expr* expr) {
    using ExprKind = Expr::Kind;
    switch (expr->kind) {
    case ExprKind::LITERAL:
        return literal(static_cast<const LiteralExpr*>(expr));
    case ExprKind::NAME:
        return name(static_cast<const NameExpr*>(expr));
    case ExprKind::MEMBER:
        return member(static_cast<const MemberExpr*>(expr));
    case ExprKind::INDEX:
        return index(static_cast<const IndexExpr*>(expr));
    case ExprKind::CALL:
        return call(static_cast<const CallExpr*>(expr));
    case ExprKind::CONSTRUCT:
        return constructor(static_cast<const ConstructExpr*>(expr));
    case ExprKind::CAST:
        return castExpression(static_cast<const CastExpr*>(expr));
    case ExprKind::UNARY:
        return unary(static_cast<const UnaryExpr*>(expr));
    case ExprKind::BINARY:
        return binary(static_cast<const BinaryExpr*>(expr));
    case ExprKind::ASSIGN:
        return assignment(static_cast<const AssignExpr*>(expr));
    case ExprKind::CONDITIONAL:
        return conditional(static_cast<const ConditionalExpr*>(expr));
    case ExprKind::INIT_LIST:
        break;
    }
    mDiagnostics.error(expr->location, "a list in braces stands only as an initial value");
    return nullptr;
}

TypedExpr* Resolver::literal(const LiteralExpr* expr) {
    const auto typed = [&](Scalar scalar, bool isUntyped) {
        TypedExpr* result = mBuild.literal(expr->location, mTypes.scalar(scalar), expr->number);
        result->isUntyped = isUntyped;
        return result;
    };
    switch (expr->type) {
    case LiteralExpr::Type::INT:
        return typed(Scalar::INT, true);
    case LiteralExpr::Type::UNSIGNED:
        return typed(Scalar::UINT, false);
    case LiteralExpr::Type::FLOAT:
        return typed(Scalar::FLOAT, true);
    case LiteralExpr::Type::HALF:
        return typed(Scalar::HALF, false);
    case LiteralExpr::Type::FIXED:
        return typed(Scalar::FIXED, false);
    case LiteralExpr::Type::BOOL:
        return typed(Scalar::BOOL, false);
    case LiteralExpr::Type::TEXT:
        break;
    }
    mDiagnostics.error(expr->location, "a text is no value here");
    return nullptr;
}

// ----------------------------------------------------------------------------------------------- names

Variable* Resolver::findVariable(Name name) {
    for (auto it = mContext.scope.rbegin(); it != mContext.scope.rend(); ++it)
        if (it->variable && it->name == name)
            return it->variable;
    return nullptr;
}

TypedExpr* Resolver::useVariable(SourceLocation at, Variable* variable) {
    if (isOpaque(variable->type) && mContext.function && mContext.function != mProgram->entry)
        mSamplerUsers[variable].insert(mContext.function);
    if (variable->alias) {
        Variable* original = rootVariable(variable->alias);
        return original == variable ? mBuild.variable(at, variable) : variable->alias;
    }
    if (variable->state)
        return variable->state;
    return mBuild.variable(at, variable);
}

namespace {

/// A local sampler is only a name for another one.
bool isUnsetSampler(const Variable* variable) {
    return isOpaque(variable->type) && variable->storage == Variable::Storage::LOCAL && !variable->alias;
}

} // namespace

/// Of a uniform array without a size only elements can be used: it is as long as they ask for.
TypedExpr* Resolver::useName(const NameExpr* expr, Variable* variable) {
    if (isUnsetSampler(variable)) {
        mDiagnostics.error(expr->location, inQuotes(expr->name) + " has been given no sampler");
        return nullptr;
    }
    if (!variable->isUnsized || mIndexed == expr)
        return useVariable(expr->location, variable);
    mDiagnostics.error(expr->location,
                       inQuotes(expr->name) + " has no size: it can be used element by element only");
    return nullptr;
}

TypedExpr* Resolver::name(const NameExpr* expr) {
    if (Variable* variable = findVariable(expr->name))
        return useName(expr, variable);
    if (mContext.self) {
        TypedExpr* self = mBuild.variable(expr->location, mContext.self);
        if (expr->name == "this")
            return self;
        if (self->type->structure->find(expr->name) >= 0)
            return memberOf(expr->location, self, expr->name);
    }
    const auto global = mGlobalDecls.find(expr->name);
    if (global != mGlobalDecls.end()) {
        Variable* variable = globalVariable(global->second);
        return variable ? useName(expr, variable) : nullptr;
    }
    if (Variable* variable = outliveLoop(expr->location, expr->name))
        return useVariable(expr->location, variable);
    if (Variable* variable = ownValue(expr))
        return mBuild.variable(expr->location, variable);
    std::vector<Name> known;
    for (const ScopeEntry& entry : mContext.scope)
        if (entry.variable)
            known.push_back(entry.name);
    for (const auto& entry : mGlobalDecls)
        known.push_back(entry.first);
    mDiagnostics.error(expr->location,
                       "undeclared name " + inQuotes(expr->name) + suggestion(expr->name, known));
    return nullptr;
}

/// The variable within its own initial value, `float sum = sum + 1;`: as in C it is in scope, but has no
/// value. What else has the name comes first.
Variable* Resolver::ownValue(const NameExpr* expr) {
    Variable* variable = mContext.declared;
    if (!variable || !variable->type || variable->name != expr->name)
        return nullptr;
    mDiagnostics.warning(expr->location, inQuotes(expr->name) + " is used before it has a value");
    mContext.isDeclaredUsed = true;
    return variable;
}

/// "; did you mean 'length'?", or nothing.
std::string Resolver::suggestion(Name name, const std::vector<Name>& known) {
    if (name.size() < 2 || name.size() > MAX_SUGGESTED_NAME)
        return {};
    const std::size_t limit = name.size() < 4 ? 1 : 2;
    Name best;
    std::size_t bestDistance = limit + 1;
    for (const Name candidate : known) {
        const std::size_t distance = editDistance(name, candidate, limit);
        if (distance < bestDistance || (distance == bestDistance && distance <= limit && candidate < best)) {
            bestDistance = distance;
            best = candidate;
        }
    }
    return bestDistance <= limit ? "; did you mean " + inQuotes(best) + "?" : std::string();
}

TypedExpr* Resolver::nothing(SourceLocation at) {
    return mBuild.literal(at, mTypes.scalar(Scalar::INT), 0);
}

// --------------------------------------------------------------------------------------------- members

TypedExpr* Resolver::stateVariable(const Expr* expr) {
    Name root;
    const std::string path = statePath(expr, root);
    const bool isState = root == "glstate" || root == "state";
    if (path.empty() || !isState || findVariable(root) || mGlobalDecls.count(root) != 0)
        return nullptr;
    const StateBinding state = findState(path, mTypes);
    return state.type ? mBuild.builtin(expr->location, state.type, mArena.keep(state.form), {}) : nullptr;
}

TypedExpr* Resolver::member(const MemberExpr* expr) {
    if (TypedExpr* state = stateVariable(expr))
        return state;
    TypedExpr* object = expression(expr->object);
    return object ? memberOf(expr->location, object, expr->name) : nullptr;
}

TypedExpr* Resolver::memberOf(SourceLocation at, TypedExpr* object, Name name) {
    const Type* type = object->type;
    if (type->isStruct()) {
        const int index = type->structure->find(name);
        if (index < 0) {
            std::vector<Name> known;
            for (const Field& field : type->structure->fields)
                known.push_back(field.name);
            mDiagnostics.error(at, "'" + nameOf(type) + "' has no member " + inQuotes(name) +
                                       suggestion(name, known));
            return nullptr;
        }
        const Type* memberType = type->structure->fields[static_cast<std::size_t>(index)].type;
        return isOpaque(memberType) ? samplerMember(at, object, name, memberType)
                                    : mBuild.field(at, object, index);
    }
    if (type->isArray() && name == "length")
        return mBuild.literal(at, mTypes.scalar(Scalar::INT), type->length);
    if (type->isMatrix())
        return matrixElements(at, object, name);
    if (type->isScalarOrVector())
        return swizzle(at, object, name);
    mDiagnostics.error(at, "'" + nameOf(type) + "' has no member " + inQuotes(name));
    return nullptr;
}

TypedExpr* Resolver::swizzle(SourceLocation at, TypedExpr* object, Name name) {
    const std::vector<int> components = swizzleComponents(name);
    const bool fits = std::all_of(components.begin(), components.end(),
                                  [&](int component) { return component < object->type->columns; });
    if (components.empty() || !fits) {
        mDiagnostics.error(at, inQuotes(name) + " is no part of '" + nameOf(object->type) + "'");
        return nullptr;
    }
    return mBuild.swizzle(at, object, components);
}

TypedExpr* Resolver::matrixElements(SourceLocation at, TypedExpr* matrix, Name name) {
    const std::vector<MatrixElement> elements = matrixSwizzle(name);
    std::vector<TypedExpr*> values;
    TypedExpr* preparation = nullptr;
    TypedExpr* source = elements.size() > 1 ? once(matrix, preparation) : matrix;
    for (const MatrixElement& element : elements) {
        if (element.row >= matrix->type->rows || element.column >= matrix->type->columns)
            break;
        TypedExpr* row = mBuild.element(at, source, element.row);
        values.push_back(row->type->isScalar() ? row : mBuild.element(at, row, element.column));
    }
    if (elements.empty() || values.size() < elements.size()) {
        mDiagnostics.error(at, inQuotes(name) + " is no part of '" + nameOf(matrix->type) + "'");
        return nullptr;
    }
    TypedExpr* result =
        values.size() == 1
            ? values[0]
            : mBuild.make(Kind::CONSTRUCT, at,
                          mTypes.vector(matrix->type->scalar, static_cast<int>(values.size())), values);
    return preparation ? mBuild.comma(at, preparation, result) : result;
}

TypedExpr* Resolver::index(const IndexExpr* expr) {
    if (TypedExpr* state = stateVariable(expr))
        return state;
    mIndexed = expr->object;
    TypedExpr* object = expression(expr->object);
    TypedExpr* position = expression(expr->index);
    return object && position ? elementOf(expr->location, object, position) : nullptr;
}

TypedExpr* Resolver::elementOf(SourceLocation at, TypedExpr* object, TypedExpr* index) {
    const Type* type = object->type;
    if (!type->isArray() && !type->isNumeric()) {
        mDiagnostics.error(at, "'" + nameOf(type) + "' has no elements");
        return nullptr;
    }
    if (index->type->isScalar() && index->type->scalar != Scalar::UINT)
        index = mBuild.cast(index->location, index, mTypes.scalar(Scalar::INT));
    else
        index = mBuild.convert(index, mTypes.scalar(Scalar::INT));
    if (!index)
        return nullptr;
    const int length = type->isArray() ? type->length : type->isMatrix() ? type->rows : type->columns;
    const auto position = constantValue(index);
    if (object->kind == Kind::VARIABLE && object->variable->isUnsized)
        return elementOfUnsized(at, object, index);
    if (position && length != Type::UNSIZED && ((*position)[0] < 0 || (*position)[0] >= length)) {
        mDiagnostics.error(index->location, "index " +
                                                std::to_string(static_cast<long long>((*position)[0])) +
                                                " is outside of '" + nameOf(type) + "'");
        return nullptr;
    }
    if (position && type->isVector())
        return mBuild.swizzle(at, object, {static_cast<int>((*position)[0])});
    if (object->kind == Kind::CONSTRUCT && isOpaque(type))
        return listedSampler(at, object, index);
    return mBuild.element(at, object, index);
}

TypedExpr* Resolver::elementOfUnsized(SourceLocation at, TypedExpr* array, TypedExpr* index) {
    Variable* variable = array->variable;
    const auto position = constantValue(index);
    if (!position || (*position)[0] < 0 || (*position)[0] >= MAX_ARRAY_LENGTH) {
        mDiagnostics.error(index->location, inQuotes(variable->name) + " has no size: the index must be a "
                                                                       "constant");
        return nullptr;
    }
    const int length = std::max(variable->type->length, static_cast<int>((*position)[0]) + 1);
    const Type* type = checkSize(at, mTypes.array(variable->type->element, length));
    if (!type)
        return nullptr;
    array->type = variable->type = type;
    return mBuild.element(at, array, index);
}

// ---------------------------------------------------------------------------------------- construction

TypedExpr* Resolver::constructor(const ConstructExpr* expr) {
    const Type* type = typeOf(expr->type);
    if (!type)
        return nullptr;
    if (type->isArray())
        return constructArray(expr->location, type, expr->arguments);
    if (type->isStruct())
        return constructStruct(expr->location, type, expr->arguments);
    std::vector<TypedExpr*> arguments;
    for (const Expr* argument : expr->arguments)
        arguments.push_back(expression(argument));
    if (std::find(arguments.begin(), arguments.end(), nullptr) != arguments.end())
        return nullptr;
    return mBuild.construct(expr->location, type, arguments);
}

TypedExpr* Resolver::constructArray(SourceLocation at, const Type* type,
                                    const std::vector<Expr*>& arguments) {
    InitListExpr list(at);
    list.elements = arguments;
    if (type->length == Type::UNSIZED)
        type = sizedByList(type, &list);
    return type ? fromList(type, &list) : nullptr;
}

TypedExpr* Resolver::constructStruct(SourceLocation at, const Type* type,
                                     const std::vector<Expr*>& arguments) {
    if (arguments.size() == 1) {
        TypedExpr* only = expression(arguments[0]);
        if (!only || only->type == type)
            return only;
    }
    InitListExpr list(at);
    list.elements = arguments;
    return fromList(type, &list);
}

TypedExpr* Resolver::castExpression(const CastExpr* expr) {
    const Type* type = typeOf(expr->type);
    if (type && expr->operand->kind == Expr::Kind::INIT_LIST)
        return initializer(type, expr->operand);
    TypedExpr* operand = expression(expr->operand);
    if (!type || !operand)
        return nullptr;
    if (type->isVoid())
        return operand;
    if (type->isArray() && type->length == Type::UNSIZED)
        return operand;
    return mBuild.cast(expr->location, operand, type);
}

// ------------------------------------------------------------------------------------------- operators

/// A value that is needed several times: itself, or a temporary and the assignment to it that comes before.
TypedExpr* Resolver::once(TypedExpr* value, TypedExpr*& preparation) {
    if (isSimple(value))
        return value;
    TypedExpr* place = mBuild.variable(value->location, temporary(value->type));
    preparation = mBuild.assign(value->location, place, value);
    return mBuild.variable(value->location, place->variable);
}

bool Resolver::checkAssignable(SourceLocation at, TypedExpr* target) {
    Variable* root = rootVariable(target);
    bool isPlace = root != nullptr;
    for (const TypedExpr* part = target; isPlace && !part->operands.empty(); part = part->operands[0])
        isPlace = part->kind != Kind::CONVERT ||
                  (part->type->components() == part->operands[0]->type->components() &&
                   part->type->scalar == part->operands[0]->type->scalar);
    if (!isPlace) {
        mDiagnostics.error(at, "this cannot be assigned to");
        return false;
    }
    if (root->isConst) {
        mDiagnostics.error(at, inQuotes(root->name) + " is const");
        return false;
    }
    for (const TypedExpr* part = target; !part->operands.empty(); part = part->operands[0])
        if (part->kind == Kind::SWIZZLE && hasDuplicates(part)) {
            mDiagnostics.error(at, "a component is named twice");
            return false;
        }
    root->isWritten = true;
    return true;
}

TypedExpr* Resolver::unary(const UnaryExpr* expr) {
    TypedExpr* operand = expression(expr->operand);
    if (!operand)
        return nullptr;
    if (expr->op >= UnaryOp::PRE_INCREMENT) {
        if (!checkAssignable(expr->location, operand))
            return nullptr;
        if (!operand->type->isNumeric() || operand->type->scalar == Scalar::BOOL) {
            mDiagnostics.error(expr->location, "the operator does not take '" + nameOf(operand->type) + "'");
            return nullptr;
        }
        TypedExpr* result = mBuild.make(Kind::UNARY, expr->location, operand->type, {operand});
        result->unary = expr->op;
        return result;
    }
    return mBuild.unary(expr->location, expr->op, operand);
}

TypedExpr* Resolver::binary(const BinaryExpr* expr) {
    TypedExpr* left = expression(expr->left);
    TypedExpr* right = expression(expr->right);
    if (!left || !right)
        return nullptr;
    return expr->op == BinaryOp::COMMA ? mBuild.comma(expr->location, left, right)
                                       : mBuild.binary(expr->location, expr->op, left, right);
}

TypedExpr* Resolver::conditional(const ConditionalExpr* expr) {
    TypedExpr* condition = expression(expr->condition);
    TypedExpr* whenTrue = expression(expr->whenTrue);
    TypedExpr* whenFalse = expression(expr->whenFalse);
    return condition && whenTrue && whenFalse ? chosenOf(expr->location, condition, whenTrue, whenFalse)
                                              : nullptr;
}

TypedExpr* Resolver::assignment(const AssignExpr* expr) {
    const SourceLocation at = expr->location;
    if (expr->target->kind == Expr::Kind::MEMBER) {
        const auto* member = static_cast<const MemberExpr*>(expr->target);
        if (matrixSwizzle(member->name).size() > 1) {
            TypedExpr* object = expression(member->object);
            if (!object || object->type->isMatrix())
                return object ? assignElements(expr, member, object) : nullptr;
        }
    }
    TypedExpr* target = samplerPlace(expr->target);
    if (!target || !isOpaque(target->type))
        target = expression(expr->target);
    TypedExpr* value = expression(expr->value);
    if (!target || !value)
        return nullptr;
    if (isOpaque(target->type))
        return assignSampler(at, target, value);
    if (!checkAssignable(at, target))
        return nullptr;
    if (!expr->isCompound) {
        value = mBuild.convert(value, target->type);
        if (!value)
            return nullptr;
        if (target->kind == Kind::ELEMENT && target->type->isArray())
            return assignRow(at, target, value);
        TypedExpr* samplers = containsSampler(target->type) ? aliasSamplers(at, target, value) : nullptr;
        TypedExpr* result = mBuild.assign(at, target, value);
        return samplers ? mBuild.comma(at, samplers, result) : result;
    }
    TypedExpr* combined = mBuild.binary(at, expr->op, target, value);
    combined = combined ? mBuild.convert(combined, target->type) : nullptr;
    if (!combined)
        return nullptr;
    // GLSL's own operator where the target itself is the left operand.
    const bool isPlain = combined->kind == Kind::BINARY && combined->operands[0] == target;
    TypedExpr* result = mBuild.assign(at, target, isPlain ? combined->operands[1] : combined);
    result->isCompound = isPlain;
    result->binary = expr->op;
    return result;
}

/// A whole row of an array of arrays, which is flat in GLSL: each element by itself.
TypedExpr* Resolver::assignRow(SourceLocation at, TypedExpr* target, TypedExpr* value) {
    TypedExpr* result = nullptr;
    const auto then = [&](TypedExpr* next) { result = result ? mBuild.comma(at, result, next) : next; };
    TypedExpr* preparation = nullptr;
    value = once(value, preparation);
    if (preparation)
        then(preparation);
    preparation = nullptr;
    target = mBuild.make(Kind::ELEMENT, at, target->type,
                         {target->operands[0], once(target->operands[1], preparation)});
    if (preparation)
        then(preparation);
    for (int i = 0; i < target->type->length; ++i) {
        TypedExpr* element = mBuild.element(at, target, i);
        TypedExpr* source = mBuild.element(at, value, i);
        then(element->type->isArray() ? assignRow(at, element, source) : mBuild.assign(at, element, source));
    }
    return result;
}

/// `m._m00_m11 = value`: each element by itself.
TypedExpr* Resolver::assignElements(const AssignExpr* expr, const MemberExpr* target, TypedExpr* matrix) {
    const SourceLocation at = expr->location;
    TypedExpr* value = expression(expr->value);
    TypedExpr* elements = matrixElements(target->location, matrix, target->name);
    if (!value || !elements || !checkAssignable(at, matrix))
        return nullptr;
    if (expr->isCompound)
        value = mBuild.binary(at, expr->op, elements, value);
    value = value ? mBuild.convert(value, elements->type) : nullptr;
    if (!value)
        return nullptr;
    TypedExpr* place = mBuild.variable(at, temporary(elements->type));
    TypedExpr* result = mBuild.assign(at, place, value);
    for (std::size_t i = 0; i < elements->operands.size(); ++i)
        result = mBuild.comma(
            at, result,
            mBuild.assign(at, elements->operands[i],
                          mBuild.swizzle(at, mBuild.variable(at, place->variable), {static_cast<int>(i)})));
    return mBuild.comma(at, result, mBuild.variable(at, place->variable));
}

} // namespace cg
