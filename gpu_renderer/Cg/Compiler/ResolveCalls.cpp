#include <Cg/Compiler/Resolver.h>

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/ConstantFolding.h>
#include <Cg/Compiler/Diagnostics.h>

#include <algorithm>
#include <array>
#include <cctype>
#include <numeric>
#include <set>
#include <string>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// Calls within calls within calls: more is no program but an attack.
constexpr int MAX_CALL_DEPTH = 100;

/// One function, for arrays of this many sizes or samplers of this many kinds.
constexpr std::size_t MAX_INSTANCES = 64;
constexpr int MAX_DEFAULT_ARGUMENTS = 4096; ///< in a whole program

/// Functions that give samplers are put in place of their calls, what they choose by as often as they use it.
constexpr int MAX_SAMPLER_CALLS = 1024; ///< in a whole program
constexpr int MAX_CHOICE_NODES = 200;   ///< of one argument

/// A call is written out for each combination of the samplers that its arguments may be.
constexpr std::size_t MAX_COMBINATIONS = 256;
constexpr std::size_t MAX_CHOSEN_CALLS = 8192; ///< in a whole program

/// The nodes of an expression as it is written out; counts no further than the limit.
int countNodes(const TypedExpr* expression, int limit) {
    int count = 1;
    for (const TypedExpr* operand : expression->operands)
        if (count < limit)
            count += countNodes(operand, limit - count);
    return count;
}

bool isAnyNull(const std::vector<TypedExpr*>& expressions) {
    return std::find(expressions.begin(), expressions.end(), nullptr) != expressions.end();
}

Direction directionOf(const VariableDecl* parameter) {
    return parameter->qualifiers.direction == Direction::NONE ? Direction::IN
                                                              : parameter->qualifiers.direction;
}

/// The two types are one type in GLSL.
bool isSameInGlsl(const Type* a, const Type* b) {
    if (a == b)
        return true;
    return a->isNumeric() && b->isNumeric() && a->kind == b->kind && a->rows == b->rows &&
           a->columns == b->columns && isFloating(a->scalar) && isFloating(b->scalar);
}

bool isNamedAsShadow(TypedExpr* sampler) {
    if (sampler->kind == Kind::CONDITIONAL) {
        const std::vector<TypedExpr*> samplers = samplersIn(sampler);
        return std::any_of(samplers.begin(), samplers.end(), isNamedAsShadow);
    }
    const Variable* root = rootVariable(sampler);
    if (!root)
        return false;
    if (isDepthSampler(sampler->type->sampler))
        return true;
    std::string name(root->name);
    std::transform(name.begin(), name.end(), name.begin(),
                   [](char c) { return static_cast<char>(std::tolower(static_cast<unsigned char>(c))); });
    return name.find("shadow") != std::string::npos;
}

std::string listTypes(const std::vector<TypedExpr*>& arguments) {
    std::string text;
    for (const TypedExpr* argument : arguments)
        text += (text.empty() ? "" : ", ") + nameOf(argument->type);
    return text;
}

} // namespace

// ---------------------------------------------------------------------------------------------- choice

TypedExpr* Resolver::call(const CallExpr* expr) {
    std::vector<TypedExpr*> arguments;
    for (const Expr* argument : expr->arguments)
        arguments.push_back(expression(argument));
    TypedExpr* object = nullptr;
    Name name;
    if (expr->callee->kind == Expr::Kind::MEMBER) {
        const auto* member = static_cast<const MemberExpr*>(expr->callee);
        object = expression(member->object);
        name = member->name;
        if (!object)
            return nullptr;
    } else if (expr->callee->kind == Expr::Kind::NAME) {
        name = static_cast<const NameExpr*>(expr->callee)->name;
    } else {
        mDiagnostics.error(expr->location, "this is no function");
        return nullptr;
    }
    if (isAnyNull(arguments))
        return nullptr;
    if (object)
        return methodCall(expr->callee->location, object, name, arguments);
    const SourceLocation at = expr->location;
    if (mContext.self) {
        std::vector<const FunctionDecl*> methods;
        findMethod(mContext.self->type, name, methods);
        if (const FunctionDecl* method = choose(at, name, methods, arguments, false))
            return callFunction(at, method, arguments, mBuild.variable(at, mContext.self));
    }
    const std::vector<const FunctionDecl*> functions = candidates(name);
    const FunctionDecl* function = choose(at, name, functions, arguments, false);
    bool isBuiltin = false;
    if (function) {
        // A function that fits only by a cut gives way to a built-in one that fits better.
        bool isCut = false;
        const Signature& signature = signatureOf(function);
        for (std::size_t i = 0; i < arguments.size(); ++i)
            isCut = isCut || (arguments[i]->type->isNumeric() && signature.parameters[i]->isNumeric() &&
                              arguments[i]->type->components() > signature.parameters[i]->components());
        TypedExpr* builtin = isCut ? callBuiltin(at, name, arguments, false, false, isBuiltin) : nullptr;
        return builtin ? builtin : callFunction(at, function, arguments, nullptr);
    }
    if (TypedExpr* builtin =
            callBuiltin(at, name, arguments, functions.empty(), functions.empty(), isBuiltin))
        return builtin;
    if (!functions.empty()) {
        choose(at, name, functions, arguments, true);
        return nullptr;
    }
    if (isBuiltin)
        return nullptr;
    if (const Type* type = findType(name)) {
        if (type->isNumeric())
            return mBuild.construct(at, type, arguments);
        if (type->isStruct())
            return constructStruct(at, type, expr->arguments);
    }
    if (mFunctionDecls.count(name) != 0)
        return nullptr; // the error of its own declaration has been said
    std::vector<Name> known = builtinNames();
    for (const auto& entry : mFunctionDecls)
        known.push_back(entry.first);
    mDiagnostics.error(at, "undeclared function " + inQuotes(name) + suggestion(name, known));
    return nullptr;
}

/// The functions of that name that stand before the one being resolved, or else all of them; each once, with
/// its body where it has one.
std::vector<const FunctionDecl*> Resolver::candidates(Name name) {
    const auto found = mFunctionDecls.find(name);
    if (found == mFunctionDecls.end())
        return {};
    std::vector<const FunctionDecl*> visible;
    for (const FunctionDecl* function : found->second)
        if (mContext.ordinal == 0 || mOrdinals[function] <= mContext.ordinal)
            visible.push_back(function);
    const std::vector<const FunctionDecl*>& all = visible.empty() ? found->second : visible;
    std::vector<const FunctionDecl*> distinct;
    for (const FunctionDecl* function : all) {
        const Signature& signature = signatureOf(function);
        const bool isKnown = std::any_of(distinct.begin(), distinct.end(), [&](const FunctionDecl* other) {
            return signatureOf(other).parameters == signature.parameters;
        });
        if (signature.result && !isKnown)
            distinct.push_back(function);
    }
    return distinct;
}

const Resolver::Signature& Resolver::signatureOf(const FunctionDecl* declaration) {
    const auto [slot, isNew] = mSignatures.emplace(declaration, Signature());
    if (!isNew)
        return slot->second;
    Context outer; // types of a signature are looked up outside of any function
    std::swap(outer, mContext);
    Signature signature;
    signature.result = typeOf(declaration->returnType);
    for (const VariableDecl* parameter : declaration->parameters) {
        const Type* type = typeOf(parameter->type, parameter->dimensions);
        if (!type)
            signature.result = nullptr;
        signature.parameters.push_back(type);
    }
    std::swap(outer, mContext);
    return mSignatures[declaration] = signature;
}

std::string Resolver::describe(const FunctionDecl* declaration) {
    const Signature& signature = signatureOf(declaration);
    std::string text = nameOf(signature.result) + " " + std::string(declaration->name) + "(";
    for (std::size_t i = 0; i < signature.parameters.size(); ++i) {
        const Direction direction = directionOf(declaration->parameters[i]);
        text += i == 0 ? "" : ", ";
        text += direction == Direction::OUT ? "out " : direction == Direction::INOUT ? "inout " : "";
        text += nameOf(signature.parameters[i]);
    }
    return text + ")";
}

int Resolver::argumentCost(const VariableDecl* parameter, const Type* type, const TypedExpr* argument) {
    if (implements(argument->type, type))
        return 1;
    const Direction direction = directionOf(parameter);
    int cost = 0;
    if (direction != Direction::OUT) {
        cost = mBuild.cost(argument, type);
        if (cost == TypedBuilder::IMPOSSIBLE)
            return cost;
    }
    if (direction != Direction::IN) {
        if (!rootVariable(argument) && argument->kind != Kind::CONSTRUCT)
            return TypedBuilder::IMPOSSIBLE;
        const TypedExpr result(Kind::LITERAL, argument->location, type);
        const int back = type->isArray() && type->length == Type::UNSIZED
                             ? mBuild.cost(argument, type)
                             : mBuild.cost(&result, argument->type);
        if (back == TypedBuilder::IMPOSSIBLE)
            return back;
        cost = std::max(cost, back);
    }
    return cost;
}

/// Why a function does not take the arguments.
std::string Resolver::objection(const FunctionDecl* function, const std::vector<TypedExpr*>& arguments) {
    const std::vector<const Type*> parameters = signatureOf(function).parameters;
    for (std::size_t i = 0; i < std::min(arguments.size(), parameters.size()); ++i) {
        const VariableDecl* parameter = function->parameters[i];
        if (argumentCost(parameter, parameters[i], arguments[i]) != TypedBuilder::IMPOSSIBLE)
            continue;
        const std::string argument = "argument " + std::to_string(i + 1);
        const bool isPlace = rootVariable(arguments[i]) || arguments[i]->kind == Kind::CONSTRUCT;
        return directionOf(parameter) != Direction::IN && !isPlace
                   ? argument + " cannot be written to"
                   : "no conversion of " + argument + " from '" + nameOf(arguments[i]->type) + "' to '" +
                         nameOf(parameters[i]) + "'";
    }
    return "it takes " + std::to_string(parameters.size()) +
           (parameters.size() == 1 ? " argument" : " arguments");
}

/// Cg's choice: argument by argument from the left, only the functions that take it at the least cost stay.
/// @param report  an error where there is none, with all that there would be
const FunctionDecl* Resolver::choose(SourceLocation at, Name name,
                                     const std::vector<const FunctionDecl*>& functions,
                                     const std::vector<TypedExpr*>& arguments, bool report) {
    std::vector<const FunctionDecl*> fitting;
    for (const FunctionDecl* function : functions) {
        const Signature& signature = signatureOf(function);
        bool fits = signature.result && arguments.size() <= signature.parameters.size();
        for (std::size_t i = 0; fits && i < signature.parameters.size(); ++i)
            fits = i < arguments.size() ? argumentCost(function->parameters[i], signature.parameters[i],
                                                       arguments[i]) != TypedBuilder::IMPOSSIBLE
                                        : function->parameters[i]->initializer != nullptr;
        if (fits)
            fitting.push_back(function);
    }
    for (std::size_t i = 0; i < arguments.size() && fitting.size() > 1; ++i) {
        std::vector<int> costs;
        costs.reserve(fitting.size());
        for (const FunctionDecl* function : fitting)
            costs.push_back(
                argumentCost(function->parameters[i], signatureOf(function).parameters[i], arguments[i]));
        const int best = *std::min_element(costs.begin(), costs.end());
        std::vector<const FunctionDecl*> cheapest;
        for (std::size_t j = 0; j < fitting.size(); ++j)
            if (costs[j] == best)
                cheapest.push_back(fitting[j]);
        fitting = cheapest;
    }
    if (!fitting.empty())
        return fitting[0];
    if (report) {
        mDiagnostics.error(at,
                           "no matching function " + inQuotes(name) + " for (" + listTypes(arguments) + ")");
        for (const FunctionDecl* function : functions)
            if (signatureOf(function).result)
                mDiagnostics.note(function->location,
                                  "candidate: " + describe(function) + ": " + objection(function, arguments));
    }
    return nullptr;
}

// --------------------------------------------------------------------------------------------- methods

const FunctionDecl* Resolver::findMethod(const Type* type, Name name,
                                         std::vector<const FunctionDecl*>& methods) {
    if (!type->isStruct())
        return nullptr;
    const StructDecl* declaration = type->structure->declaration;
    for (const FunctionDecl* method : declaration->methods)
        if (method->name == name)
            methods.push_back(method);
    const auto outside = mOutsideMethods.find(declaration->name);
    if (outside != mOutsideMethods.end())
        for (const FunctionDecl* method : outside->second)
            if (method->name == name)
                methods.push_back(method);
    return methods.empty() ? nullptr : methods[0];
}

TypedExpr* Resolver::methodCall(SourceLocation at, TypedExpr* object, Name name,
                                std::vector<TypedExpr*>& arguments) {
    if (object->type->isArray() && name == "length" && arguments.empty())
        return mBuild.literal(at, mTypes.scalar(Scalar::INT), object->type->length);
    std::vector<const FunctionDecl*> methods;
    findMethod(object->type, name, methods);
    if (methods.empty()) {
        mDiagnostics.error(at, "'" + nameOf(object->type) + "' has no method " + inQuotes(name));
        return nullptr;
    }
    const FunctionDecl* method = choose(at, name, methods, arguments, true);
    return method ? callFunction(at, method, arguments, object) : nullptr;
}

// ------------------------------------------------------------------------------------------- instances

const FunctionDecl* Resolver::definitionOf(const FunctionDecl* declaration) {
    if (declaration->body)
        return declaration;
    const std::vector<const FunctionDecl*>& all = declaration->ownerName.empty()
                                                      ? mFunctionDecls[declaration->name]
                                                      : mOutsideMethods[declaration->ownerName];
    const std::vector<const Type*> wanted = signatureOf(declaration).parameters;
    for (const FunctionDecl* other : all)
        if (other->body && other->name == declaration->name && signatureOf(other).parameters == wanted)
            return other;
    return nullptr;
}

/// The function as a call with arguments of these types needs it.
/// @param selfModel  a method's object: PARAMETER with its direction; else null
/// @return null after an error
Function* Resolver::instance(const FunctionDecl* declaration, const std::vector<const Type*>& types,
                             Variable* selfModel) {
    const FunctionDecl* definition = definitionOf(declaration);
    if (!definition) {
        mDiagnostics.error(declaration->location,
                           inQuotes(declaration->name) + " is declared but not defined");
        return nullptr;
    }
    if (!signatureOf(definition).result)
        return nullptr; // its own error has been said
    const bool hasWritableSelf = selfModel && selfModel->direction == Direction::INOUT;
    std::vector<Instance>& instances = mInstances[definition];
    for (const Instance& known : instances)
        if ((known.types == types && known.hasWritableSelf == hasWritableSelf) ||
            known.function->isBeingResolved) {
            if (!known.function->isBeingResolved)
                return known.function;
            mDiagnostics.error(definition->location,
                               "function " + inQuotes(definition->name) + " calls itself");
            return nullptr;
        }
    if (mCallDepth >= MAX_CALL_DEPTH || instances.size() >= MAX_INSTANCES) {
        mDiagnostics.error(definition->location,
                           "the calls of " + inQuotes(definition->name) + " are nested too deep");
        return nullptr;
    }
    auto* function = mArena.make<Function>();
    function->name = definition->name;
    function->declaration = definition;
    function->isBeingResolved = true;
    instances.push_back({types, hasWritableSelf, function});
    Context outer;
    std::swap(outer, mContext);
    ++mCallDepth;
    resolveBody(function, definition, types, selfModel);
    --mCallDepth;
    std::swap(outer, mContext);
    function->isBeingResolved = false;
    mProgram->functions.push_back(function);
    return function;
}

void Resolver::resolveBody(Function* function, const FunctionDecl* definition,
                           const std::vector<const Type*>& types, Variable* selfModel) {
    mContext.function = function;
    mContext.ordinal = mOrdinals[definition];
    function->result = signatureOf(definition).result;
    if (selfModel) {
        mContext.self = makeVariable(Variable::Storage::PARAMETER, "self", selfModel->type, nullptr);
        mContext.self->direction = selfModel->direction;
        function->parameters.push_back(mContext.self);
    }
    for (std::size_t i = 0; i < types.size(); ++i) {
        const VariableDecl* parameter = definition->parameters[i];
        Variable* variable = makeVariable(Variable::Storage::PARAMETER, parameter->name, types[i], parameter);
        variable->direction = directionOf(parameter);
        variable->isConst = parameter->qualifiers.isConst && variable->direction == Direction::IN;
        function->parameters.push_back(variable);
        mContext.scope.push_back({parameter->name, variable, nullptr});
    }
    const std::size_t count = function->parameters.size();
    for (std::size_t i = 0; i < count; ++i)
        if (function->parameters[i]->type->isStruct() || function->parameters[i]->type->isArray())
            if (containsSampler(function->parameters[i]->type) && !isOpaque(function->parameters[i]->type))
                addSamplerParameters(function, function->parameters[i]);
    function->body = block(definition->body);
    endBody(function, definition);
}

// ----------------------------------------------------------------------------------------------- calls

/// Prepares one argument: converted, and by way of a temporary where GLSL could not write back to it.
TypedExpr* Resolver::passArgument(TypedExpr* argument, const Type* type, Direction direction,
                                  std::vector<TypedExpr*>& before, std::vector<TypedExpr*>& after) {
    if (direction == Direction::IN || isOpaque(type))
        return mBuild.convert(argument, type);
    const SourceLocation at = argument->location;
    const bool isElements = argument->kind == Kind::CONSTRUCT; // `m._m00_m11` as an out argument
    for (TypedExpr* part : isElements ? argument->operands : std::vector<TypedExpr*>{argument})
        if (!checkAssignable(at, part))
            return nullptr;
    const bool isRow = argument->kind == Kind::ELEMENT && type->isArray();
    if (!isElements && !isRow && argument->kind != Kind::CONVERT &&
        (isSameInGlsl(argument->type, type) || !type->isNumeric()))
        return argument;
    Variable* place = temporary(type);
    if (direction == Direction::INOUT) {
        TypedExpr* value = mBuild.convert(argument, type);
        if (!value)
            return nullptr;
        before.push_back(mBuild.assign(at, mBuild.variable(at, place), value));
    }
    TypedExpr* result = mBuild.variable(at, place);
    if (!isElements) {
        // Of a wider argument only the components that the parameter has are written.
        const int size = type->columns;
        if (argument->type->isVector() && type->isScalarOrVector() && argument->type->columns > size) {
            std::vector<int> components(static_cast<std::size_t>(size));
            std::iota(components.begin(), components.end(), 0);
            argument = mBuild.swizzle(at, argument, components);
        }
        TypedExpr* back = mBuild.convert(result, argument->type);
        if (!back)
            return nullptr;
        after.push_back(isRow ? assignRow(at, argument, back) : mBuild.assign(at, argument, back));
        return result;
    }
    for (std::size_t i = 0; i < argument->operands.size(); ++i)
        after.push_back(mBuild.assign(at, argument->operands[i],
                                      mBuild.swizzle(at, mBuild.variable(at, place), {static_cast<int>(i)})));
    return result;
}

/// The call with what has to be done before and after it, as one expression.
TypedExpr* Resolver::around(TypedExpr* call, const std::vector<TypedExpr*>& before,
                            const std::vector<TypedExpr*>& after) {
    if (before.empty() && after.empty())
        return call;
    const SourceLocation at = call->location;
    TypedExpr* result = nullptr;
    const auto then = [&](TypedExpr* next) { result = result ? mBuild.comma(at, result, next) : next; };
    for (TypedExpr* step : before)
        then(step);
    if (call->type->isVoid() || after.empty()) {
        then(call);
        for (TypedExpr* step : after)
            then(step);
        return result;
    }
    Variable* place = temporary(call->type);
    then(mBuild.assign(at, mBuild.variable(at, place), call));
    for (TypedExpr* step : after)
        then(step);
    then(mBuild.variable(at, place));
    return result;
}

/// What a call leaves out. It may call functions with default arguments of their own: those are bounded, in
/// depth and in all, as each call has its own copy.
TypedExpr* Resolver::defaultArgument(SourceLocation at, const FunctionDecl* declaration, std::size_t index,
                                     const Type* type) {
    if (mCallDepth >= MAX_CALL_DEPTH || mDefaultArguments >= MAX_DEFAULT_ARGUMENTS) {
        mDiagnostics.error(at, "too many default arguments in the calls of " + inQuotes(declaration->name));
        return nullptr;
    }
    Context outer; // it means what it means where it is written
    std::swap(outer, mContext);
    mContext.function = outer.function;
    ++mCallDepth;
    ++mDefaultArguments;
    TypedExpr* value = initializer(type, declaration->parameters[index]->initializer);
    --mCallDepth;
    std::swap(outer, mContext);
    return value;
}

/// A call of a function that gives a sampler: GLSL has none, so what it chooses is put in place of the call.
TypedExpr* Resolver::chosenSampler(SourceLocation at, const FunctionDecl* declaration,
                                   const std::vector<TypedExpr*>& arguments) {
    const FunctionDecl* definition = definitionOf(declaration);
    if (!definition || mCallDepth >= MAX_CALL_DEPTH || ++mSamplerCalls > MAX_SAMPLER_CALLS) {
        mDiagnostics.error(at, inQuotes(declaration->name) + (!definition ? " is declared but not defined"
                                                              : mCallDepth >= MAX_CALL_DEPTH
                                                                  ? " calls itself"
                                                                  : " gives a sampler too often"));
        return nullptr;
    }
    const std::vector<const Type*> parameters = signatureOf(definition).parameters;
    Context inner;
    inner.function = mContext.function;
    inner.statements = mContext.statements;
    inner.ordinal = mOrdinals[definition];
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const VariableDecl* parameter = definition->parameters[i];
        Variable* variable =
            makeVariable(Variable::Storage::LOCAL, parameter->name, parameters[i], parameter);
        variable->alias = mBuild.convert(arguments[i], parameters[i]);
        if (!variable->alias)
            return nullptr;
        const bool isLong = countNodes(variable->alias, MAX_CHOICE_NODES) >= MAX_CHOICE_NODES;
        if (isLong || hasEffect(variable->alias) || directionOf(parameter) != Direction::IN) {
            mDiagnostics.error(arguments[i]->location,
                               isLong ? "this is too long to choose a sampler by"
                                      : "a function that gives a sampler takes only values to choose by");
            return nullptr;
        }
        inner.scope.push_back({parameter->name, variable, nullptr});
    }
    std::swap(inner, mContext);
    ++mCallDepth;
    std::size_t ways = 0;
    TypedExpr* sampler = chosenSampler(definition, definition->body->statements, ways);
    --mCallDepth;
    std::swap(inner, mContext);
    return sampler;
}

/// What statements give, one after another.
/// @param ways  counts the ways through the function
TypedExpr* Resolver::chosenSampler(const FunctionDecl* definition, const std::vector<Stmt*>& body,
                                   std::size_t& ways) {
    const auto after = [&body](const std::vector<Stmt*>& first) {
        std::vector<Stmt*> statements = first;
        statements.insert(statements.end(), body.begin() + 1, body.end());
        return statements;
    };
    const Stmt* stmt = body.empty() ? nullptr : body[0];
    if (++ways > 2 * MAX_SAMPLER_CHOICES) {
        mDiagnostics.error(definition->location, "too many ways through a function that gives a sampler");
        return nullptr;
    }
    if (stmt && stmt->kind == Stmt::Kind::BLOCK)
        return chosenSampler(definition, after(static_cast<const BlockStmt*>(stmt)->statements), ways);
    if (stmt && stmt->kind == Stmt::Kind::RETURN && static_cast<const JumpStmt*>(stmt)->value) {
        TypedExpr* value = expression(static_cast<const JumpStmt*>(stmt)->value);
        return value ? mBuild.convert(value, signatureOf(definition).result) : nullptr;
    }
    if (stmt && stmt->kind == Stmt::Kind::IF) {
        const auto* branch = static_cast<const IfStmt*>(stmt);
        TypedExpr* condition = expression(branch->condition);
        std::array<TypedExpr*, 2> values{};
        Stmt* const branches[] = {branch->thenBranch, branch->elseBranch};
        for (std::size_t i = 0; condition && i < values.size() && (i == 0 || values[0]); ++i)
            values[i] = chosenSampler(definition, branches[i] ? after({branches[i]}) : after({}), ways);
        return condition && values[0] && values[1]
                   ? mBuild.conditional(stmt->location, condition, values[0], values[1])
                   : nullptr;
    }
    mDiagnostics.error(stmt ? stmt->location : definition->location,
                       stmt ? "a function that gives a sampler can hold only 'if' and 'return'"
                            : "a way through this function gives no sampler");
    return nullptr;
}

TypedExpr* Resolver::callFunction(SourceLocation at, const FunctionDecl* declaration,
                                  std::vector<TypedExpr*> arguments, TypedExpr* self) {
    const std::vector<const Type*> parameters = signatureOf(declaration).parameters;
    for (std::size_t i = arguments.size(); i < parameters.size(); ++i) {
        TypedExpr* value = defaultArgument(at, declaration, i, parameters[i]);
        if (!value)
            return nullptr;
        arguments.push_back(value);
    }
    if (isOpaque(signatureOf(declaration).result)) {
        if (!self)
            return chosenSampler(at, declaration, arguments);
        mDiagnostics.error(at, "a method cannot give a sampler");
        return nullptr;
    }
    std::vector<const Type*> types;
    for (std::size_t i = 0; i < parameters.size(); ++i) {
        const Type* argument = arguments[i]->type;
        const bool isUnsized = parameters[i]->isArray() && parameters[i]->length == Type::UNSIZED;
        const bool isUndecided =
            parameters[i]->isSampler() && argument->isSampler() && argument->sampler != Sampler::ANY;
        types.push_back(isUnsized || implements(argument, parameters[i]) || isUndecided ? argument
                                                                                        : parameters[i]);
    }
    Variable selfModel;
    if (self) {
        const Variable* root = rootVariable(self);
        const bool isWritable = root && !root->isConst && root->storage != Variable::Storage::UNIFORM &&
                                !(root->storage == Variable::Storage::PARAMETER && root == mContext.self &&
                                  root->direction == Direction::IN);
        selfModel.type = self->type;
        selfModel.direction = isWritable ? Direction::INOUT : Direction::IN;
    }
    Function* function = instance(declaration, types, self ? &selfModel : nullptr);
    if (!function)
        return nullptr;
    std::vector<TypedExpr*> before;
    std::vector<TypedExpr*> after;
    TypedExpr* result = mBuild.make(Kind::CALL, at, function->result);
    result->function = function;
    std::vector<TypedExpr*> sources = arguments;
    if (self)
        sources.insert(sources.begin(), self);
    for (std::size_t i = 0; i < sources.size(); ++i) {
        const Variable* parameter = function->parameters[i];
        if (isOpaque(parameter->type)) {
            const Type* type = parameter->type;
            agree(sources[i], type->isArray() ? type->element : type);
            if (parameter->comparesDepth && isPlainSampler(sources[i]))
                mPlainSamplers.insert(parameter->name);
        }
        TypedExpr* passed = passArgument(sources[i], parameter->type, parameter->direction, before, after);
        if (!passed)
            return nullptr;
        result->operands.push_back(passed);
    }
    for (std::size_t i = sources.size(); i < function->parameters.size(); ++i) {
        const Variable* piece = function->parameters[i];
        for (std::size_t owner = 0; owner < sources.size(); ++owner) {
            if (function->parameters[owner] != piece->samplerOwner)
                continue;
            Variable local;
            local.type = sources[owner]->type;
            local.name = "argument";
            if (TypedExpr* preparation = aliasSamplers(at, mBuild.variable(at, &local), sources[owner]))
                before.push_back(preparation);
            const auto found = local.samplers.find(piece->samplerPath);
            const bool isKnown = found != local.samplers.end() && found->second->alias;
            if (!isKnown || isUnset(found->second->alias)) {
                mDiagnostics.error(at, inQuotes(piece->samplerPath.substr(1)) +
                                           " of an argument has been given no sampler");
                return nullptr;
            }
            agree(found->second->alias, piece->type->isArray() ? piece->type->element : piece->type);
            result->operands.push_back(found->second->alias);
        }
    }
    result = withKnownSamplers(result);
    return result ? around(result, before, after) : nullptr;
}

bool Resolver::isPlainSampler(TypedExpr* sampler) const {
    const std::vector<TypedExpr*> samplers = samplersIn(sampler);
    return std::any_of(samplers.begin(), samplers.end(), [this](const TypedExpr* one) {
        const Variable* root = rootVariable(one);
        return root && mPlainSamplers.count(root->name) != 0;
    });
}

/// The call with each of its samplers known. Refuses one that would be written out too often.
TypedExpr* Resolver::withKnownSamplers(TypedExpr* call) {
    std::size_t combinations = 1;
    for (TypedExpr* operand : call->operands) {
        if (!isOpaque(operand->type))
            continue;
        if (operand->kind == Kind::CONSTRUCT) {
            mDiagnostics.error(call->location,
                               "an array of samplers whose elements were assigned cannot be passed on");
            return nullptr;
        }
        std::size_t ways = 0;
        for (const TypedExpr* sampler : samplersIn(operand)) {
            const bool isAny = sampler->kind == Kind::ELEMENT && !constantValue(sampler->operands[1]);
            ways += isAny ? static_cast<std::size_t>(sampler->operands[0]->type->length) : 1;
        }
        combinations *= ways;
        if (combinations > MAX_COMBINATIONS) {
            mDiagnostics.error(call->location, "more than " + std::to_string(MAX_COMBINATIONS) +
                                                   " combinations of samplers in one call");
            return nullptr;
        }
    }
    mChosenCalls += combinations > 1 ? combinations : 0;
    if (mChosenCalls > MAX_CHOSEN_CALLS) {
        mDiagnostics.error(call->location, "too many calls with samplers that are chosen while it runs");
        return nullptr;
    }
    return withKnownSampler(call);
}

/// GLSL knows no choice among samplers and indexes arrays of them by constants only: it becomes a choice
/// among calls.
TypedExpr* Resolver::withKnownSampler(TypedExpr* call) {
    for (std::size_t i = 0; i < call->operands.size(); ++i) {
        TypedExpr* operand = call->operands[i];
        if (!operand->type->isSampler())
            continue;
        if (operand->kind == Kind::CONDITIONAL)
            return chooseCall(call, i);
        if (operand->kind != Kind::ELEMENT)
            continue;
        TypedExpr* index = operand->operands[1];
        if (const auto value = constantValue(index))
            operand->operands[1] = mBuild.literal(index->location, index->type, (*value)[0]);
        else
            return chooseCallByIndex(call, i);
    }
    return call;
}

/// Makes sure that the operands can be written several times.
/// @param position  of the sampler, which is left as it is
TypedExpr* Resolver::withSimpleOperands(TypedExpr* call, std::size_t position) {
    TypedExpr* preparations = nullptr;
    for (std::size_t i = 0; i < call->operands.size(); ++i) {
        const bool isOut = call->kind == Kind::CALL
                               ? call->function->parameters[i]->direction != Direction::IN
                               : (call->outOperands >> i & 1U) != 0;
        TypedExpr* preparation = nullptr;
        if (i != position && !isOut && !isOpaque(call->operands[i]->type) &&
            !constantValue(call->operands[i]))
            call->operands[i] = once(call->operands[i], preparation);
        if (preparation)
            preparations =
                preparations ? mBuild.comma(call->location, preparations, preparation) : preparation;
    }
    return preparations;
}

/// `look(c ? a : b)` as `c ? look(a) : look(b)`
TypedExpr* Resolver::chooseCall(TypedExpr* call, std::size_t position) {
    TypedExpr* preparation = withSimpleOperands(call, position);
    const TypedExpr* choice = call->operands[position];
    std::array<TypedExpr*, 2> calls{};
    for (std::size_t i = 0; i < calls.size(); ++i) {
        TypedExpr* copy = mArena.make<TypedExpr>(*call);
        copy->operands[position] = choice->operands[i + 1];
        calls[i] = withKnownSampler(copy);
        if (!calls[i])
            return nullptr;
    }
    TypedExpr* result =
        mBuild.make(Kind::CONDITIONAL, call->location, call->type, {choice->operands[0], calls[0], calls[1]});
    return preparation ? mBuild.comma(call->location, preparation, result) : result;
}

TypedExpr* Resolver::chooseCallByIndex(TypedExpr* call, std::size_t position) {
    const TypedExpr* element = call->operands[position];
    TypedExpr* index = element->operands[1];
    const int length = element->operands[0]->type->length;
    if (length > static_cast<int>(MAX_SAMPLER_CHOICES)) {
        mDiagnostics.error(call->location, "an array of samplers wants a constant index here");
        return nullptr;
    }
    TypedExpr* preparation = withSimpleOperands(call, position);
    TypedExpr* indexPreparation = nullptr;
    TypedExpr* known = once(index, indexPreparation);
    if (indexPreparation)
        preparation =
            preparation ? mBuild.comma(call->location, preparation, indexPreparation) : indexPreparation;
    TypedExpr* result = nullptr;
    for (int i = length - 1; i >= 0; --i) {
        TypedExpr* copy = mArena.make<TypedExpr>(*call);
        copy->operands[position] = mBuild.element(element->location, element->operands[0], i);
        copy = withKnownSampler(copy);
        if (!copy)
            return nullptr;
        TypedExpr* number = mBuild.literal(index->location, mTypes.scalar(Scalar::INT), i);
        result =
            result
                ? mBuild.make(Kind::CONDITIONAL, call->location, call->type,
                              {mBuild.binary(index->location, BinaryOp::EQUAL, known, number), copy, result})
                : copy;
    }
    return preparation ? mBuild.comma(call->location, preparation, result) : result;
}

// ---------------------------------------------------------------------------------- built-in functions

namespace {

using Operand = BuiltinOperand;

/// What the generic operands of a built-in function are for a call.
struct Binding {
    int size = 1;
    Scalar scalar = Scalar::BOOL;
    const Type* matrix = nullptr;
    int rows = 0; ///< of generic operands that are matrices; 0 where they are none
    int columns = 0;
};

bool isGeneric(const Operand& operand) {
    return operand.kind == Operand::Kind::NUMBER || operand.kind == Operand::Kind::FLOATING ||
           operand.kind == Operand::Kind::INTEGER || operand.kind == Operand::Kind::BOOLEAN;
}

const Type* typeFor(const Operand& operand, const Binding& binding, const TypeTable& types) {
    if (binding.rows > 0 && isGeneric(operand) && operand.size == Operand::SHARED)
        return types.matrix(binding.scalar, binding.rows, binding.columns);
    const int size = operand.size == Operand::SHARED ? binding.size : operand.size;
    switch (operand.kind) {
    case Operand::Kind::VOID:
        return types.voidType();
    case Operand::Kind::TEXT:
        return types.text();
    case Operand::Kind::NUMBER:
        return types.vector(binding.scalar == Scalar::BOOL ? Scalar::INT : binding.scalar, size);
    case Operand::Kind::FLOATING:
        return types.vector(operand.isFloat || !isFloating(binding.scalar) ? Scalar::FLOAT : binding.scalar,
                            size);
    case Operand::Kind::INTEGER:
        return types.vector(Scalar::INT, size);
    case Operand::Kind::BOOLEAN:
        return types.vector(Scalar::BOOL, size);
    case Operand::Kind::SAMPLER:
        return types.sampler(operand.sampler);
    case Operand::Kind::MATRIX:
    case Operand::Kind::SQUARE:
        return binding.matrix;
    case Operand::Kind::TRANSPOSED:
        return types.matrix(binding.matrix->scalar, binding.matrix->columns, binding.matrix->rows);
    }
    return nullptr;
}

/// An operand as a programmer writes it; `floatN` is a vector of the size that all such ones share.
std::string describeOperand(const Operand& operand, const TypeTable& types) {
    const std::string size = operand.size == Operand::SHARED ? "N"
                             : operand.size == 1             ? ""
                                                             : std::to_string(operand.size);
    const std::string direction = operand.isOut ? "out " : "";
    switch (operand.kind) {
    case Operand::Kind::NUMBER:
    case Operand::Kind::FLOATING:
        return direction + "float" + size;
    case Operand::Kind::INTEGER:
        return direction + "int" + size;
    case Operand::Kind::BOOLEAN:
        return direction + "bool" + size;
    case Operand::Kind::SAMPLER:
        return nameOf(types.sampler(operand.sampler));
    case Operand::Kind::TEXT:
        return "string";
    default:
        return "matrix";
    }
}

/// Takes matrices for generic operands: of the smallest shape, and only where the function works by
/// component.
bool bindMatrices(const BuiltinFunction& function, const std::vector<TypedExpr*>& arguments,
                  Binding& binding) {
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Type* type = arguments[i]->type;
        const Operand& operand = function.parameters[i];
        if (!isGeneric(operand) || operand.size != Operand::SHARED || !type->isMatrix() ||
            type->isThinMatrix())
            continue;
        const bool isFirst = binding.rows == 0;
        binding.rows = isFirst ? type->rows : std::min(binding.rows, type->rows);
        binding.columns = isFirst ? type->columns : std::min(binding.columns, type->columns);
    }
    if (binding.rows == 0)
        return true;
    if (binding.rows == 1 || binding.columns == 1)
        return false;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Type* type = arguments[i]->type;
        const Operand& operand = function.parameters[i];
        const bool isShared = isGeneric(operand) && operand.size == Operand::SHARED;
        const bool isByComponent =
            (operand.kind == Operand::Kind::NUMBER || operand.kind == Operand::Kind::FLOATING) &&
            !operand.isVector;
        const bool isScalarOrMatrix = type->isScalar() || (type->isMatrix() && !type->isThinMatrix());
        if (isShared && (!isByComponent || !isScalarOrMatrix))
            return false;
    }
    return true;
}

/// Finds what the generic operands are: the smallest vector's size, the highest scalar kind.
bool bind(const BuiltinFunction& function, const std::vector<TypedExpr*>& arguments, Binding& binding) {
    if (!bindMatrices(function, arguments, binding))
        return false;
    int smallest = 0;
    bool hasTyped = false;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Operand& operand = function.parameters[i];
        const Type* type = arguments[i]->type;
        if (operand.kind == Operand::Kind::MATRIX || operand.kind == Operand::Kind::SQUARE) {
            if (!type->isMatrix() || (operand.kind == Operand::Kind::SQUARE && type->rows != type->columns))
                return false;
            binding.matrix = type;
            continue;
        }
        if (!isGeneric(operand))
            continue;
        const bool isMatrix = type->isMatrix() && !type->isThinMatrix();
        if (!type->isNumeric() || (isMatrix && operand.size != Operand::SHARED))
            return false;
        const bool decidesSize = operand.size == Operand::SHARED && type->components() > 1;
        if (decidesSize && (smallest == 0 || type->components() < smallest))
            smallest = type->components();
        const bool decidesScalar = !operand.isFloat && operand.kind != Operand::Kind::INTEGER &&
                                   operand.kind != Operand::Kind::BOOLEAN;
        if (!decidesScalar)
            continue;
        const bool isFirst = !hasTyped && !arguments[i]->isUntyped && isFloating(type->scalar);
        const bool isMerelyWritten = hasTyped && arguments[i]->isUntyped;
        if (isFirst)
            binding.scalar = type->scalar;
        else if (!isMerelyWritten)
            binding.scalar = std::max(binding.scalar, type->scalar);
        hasTyped = hasTyped || isFirst;
    }
    binding.size = smallest == 0 ? 1 : smallest;
    return true;
}

/// It compares neighbouring pixels, or adds to the level of detail that they give.
bool isForFragments(const BuiltinFunction& function) {
    const bool isDerivative = function.form.rfind("dFd", 0) == 0 || function.form.rfind("fwidth", 0) == 0;
    constexpr Name BIAS = "bias";
    const bool isBiased = function.name.size() > BIAS.size() &&
                          function.name.substr(function.name.size() - BIAS.size()) == BIAS;
    return isDerivative || isBiased;
}

/// `texture($0, $1.xy)` for arguments (s, c): the form `texture($0, $1)` for (s, c.xy).
struct Expansion {
    std::string form;
    std::vector<TypedExpr*> operands;
};

} // namespace

/// GLSL takes constants only as texel offsets: a known one is written as a number, another one is added to
/// the coordinates.
/// @param arguments  the offset is the last one
/// @return the look-up's form
std::string Resolver::withKnownOffset(const BuiltinFunction& function, std::vector<TypedExpr*>& arguments) {
    std::string form(function.form);
    const std::size_t word = form.find("Offset");
    if (word == std::string::npos)
        return form;
    TypedExpr*& offset = arguments.back();
    const SourceLocation at = offset->location;
    if (const auto values = constantValue(offset)) {
        std::vector<TypedExpr*> numbers;
        for (const double value : *values)
            numbers.push_back(mBuild.literal(at, mTypes.scalar(Scalar::INT), value));
        offset = mBuild.construct(at, offset->type, numbers);
        return form;
    }
    // `textureGradOffset($0, $1.xy, $2, $3, $4)` becomes `textureGrad($0, ($1.xy) + ..., $2, $3)`.
    const std::string last = "$" + std::to_string(arguments.size() - 1);
    const std::size_t start = form.find("$1");
    const std::size_t end = form.find_first_of(",)", start);
    const bool isFetch = form.find("texelFetch") != std::string::npos;
    const bool isDepth = isDepthSampler(function.parameters[0].sampler);
    const bool isRect = function.parameters[0].sampler == Sampler::RECT;
    if (isDepth || form.find("Proj") != std::string::npos) {
        mDiagnostics.error(at, "the texel offset of this look-up must be a constant");
        return form;
    }
    const int size = offset->type->columns;
    const std::string type = size == 1 ? "float" : "vec" + std::to_string(size);
    const std::string texels = isRect ? "" : " / " + type + "(textureSize($0, 0))";
    const std::string shift = isFetch ? ") + (" + last + ")" : ") + " + type + "(" + last + ")" + texels;
    const std::size_t separator = form.find(", " + last, end);
    form.erase(separator, last.size() + 2);
    form.insert(end, shift);
    form.insert(start, "(");
    return form.erase(word, std::string("Offset").size());
}

void Resolver::refuseBuiltin(SourceLocation at, Name name, const std::vector<BuiltinFunction>& functions,
                             const std::vector<TypedExpr*>& arguments) {
    mDiagnostics.error(at, "no matching function " + inQuotes(name) + " for (" + listTypes(arguments) + ")");
    std::set<std::string> described; // those of depth samplers look the same
    const auto hasCount = [&arguments](const BuiltinFunction& function) {
        return function.parameters.size() == arguments.size();
    };
    const bool isCountKnown = std::any_of(functions.begin(), functions.end(), hasCount);
    for (const BuiltinFunction& function : functions) {
        if (isCountKnown && !hasCount(function))
            continue;
        std::string text;
        for (const Operand& operand : function.parameters)
            text += (text.empty() ? "" : ", ") + describeOperand(operand, mTypes);
        if (described.insert(text).second)
            mDiagnostics.note(at, "candidate: " + std::string(name) + "(" + text + ")");
    }
}

/// @param report          an error where the name is known but takes no such arguments
/// @param withGlslNames   also GLSL's own names
/// @param isKnown         receives whether there is such a built-in function
TypedExpr* Resolver::callBuiltin(SourceLocation at, Name name, const std::vector<TypedExpr*>& arguments,
                                 bool report, bool withGlslNames, bool& isKnown) {
    if (name == "mul" && arguments.size() == 2) {
        isKnown = true;
        return mBuild.product(at, arguments[0], arguments[1]);
    }
    const BuiltinLookup lookup = findBuiltin(name);
    if (!lookup.functions || (lookup.functions->front().isGlslName && !withGlslNames))
        return nullptr;
    isKnown = true;
    const BuiltinFunction* best = nullptr;
    Binding bestBinding;
    int bestCost = 0;
    for (const BuiltinFunction& function : *lookup.functions) {
        if (function.parameters.size() != arguments.size() || (function.isGlslName && !withGlslNames))
            continue;
        Binding binding;
        if (!bind(function, arguments, binding))
            continue;
        int total = 0;
        bool comparesDepth = false;
        for (std::size_t i = 0; i < arguments.size() && total != TypedBuilder::IMPOSSIBLE; ++i) {
            const Operand& operand = function.parameters[i];
            const Type* type = typeFor(operand, binding, mTypes);
            int cost = mBuild.cost(arguments[i], type);
            if (operand.kind == Operand::Kind::SAMPLER) {
                comparesDepth = isDepthSampler(operand.sampler);
                const bool isPlain = isPlainSampler(arguments[i]);
                if (comparesDepth &&
                    (isPlain || (function.needsShadowName && !isNamedAsShadow(arguments[i]))))
                    cost = TypedBuilder::IMPOSSIBLE;
                cost = std::min(cost, 0);
            } else if (comparesDepth && i == 1 && arguments[i]->type->components() != operand.size) {
                cost = TypedBuilder::IMPOSSIBLE; // a fourth coordinate is no depth
            }
            if (operand.isOut && !rootVariable(arguments[i]))
                cost = TypedBuilder::IMPOSSIBLE;
            total = cost == TypedBuilder::IMPOSSIBLE ? cost : total + cost;
        }
        if (total != TypedBuilder::IMPOSSIBLE && (!best || total < bestCost)) {
            best = &function;
            bestBinding = binding;
            bestCost = total;
        }
    }
    if (!best) {
        if (report)
            refuseBuiltin(at, name, *lookup.functions, arguments);
        return nullptr;
    }

    if (mStage == Stage::VERTEX && isForFragments(*best)) {
        mDiagnostics.error(at, inQuotes(name) + " is for fragment programs");
        return nullptr;
    }
    std::vector<TypedExpr*> before;
    std::vector<TypedExpr*> after;
    std::vector<TypedExpr*> passed;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Operand& operand = best->parameters[i];
        const Type* type = typeFor(operand, bestBinding, mTypes);
        if (operand.kind == Operand::Kind::SAMPLER)
            agree(arguments[i], type);
        passed.push_back(operand.kind == Operand::Kind::SAMPLER
                             ? arguments[i]
                             : passArgument(arguments[i], type,
                                            operand.isOut ? Direction::OUT : Direction::IN, before, after));
    }
    if (isAnyNull(passed))
        return nullptr;

    const std::string form = withKnownOffset(*best, passed);

    // Components that the form takes of an argument become operands of their own.
    Expansion expansion;
    for (std::size_t i = 0; i < form.size(); ++i) {
        if (form[i] != '$') {
            expansion.form += form[i];
            continue;
        }
        const auto position = static_cast<std::size_t>(form[++i] - '0');
        TypedExpr* operand = passed[position];
        if (i + 1 < form.size() && form[i + 1] == '.') {
            std::vector<int> components;
            constexpr Name letters = "xyzw";
            for (i += 2; i < form.size() && letters.find(form[i]) != Name::npos; ++i)
                components.push_back(static_cast<int>(letters.find(form[i])));
            --i;
            TypedExpr* preparation = nullptr;
            if (TypedExpr* piece = mBuild.pick(operand, components)) {
                operand = piece;
            } else {
                passed[position] = once(operand, preparation);
                operand = mBuild.swizzle(operand->location, passed[position], components);
            }
            if (preparation)
                before.push_back(preparation);
        }
        const auto known = std::find(expansion.operands.begin(), expansion.operands.end(), operand);
        expansion.form += "$" + std::to_string(known - expansion.operands.begin());
        if (known == expansion.operands.end())
            expansion.operands.push_back(operand);
    }
    const Type* resultType = typeFor(best->result, bestBinding, mTypes);
    TypedExpr* result = nullptr;
    if (form == "$0") {
        result = expansion.operands[0];
    } else {
        result = bestBinding.rows > 0 && best->result.kind == Operand::Kind::BOOLEAN
                     ? mBuild.asksRows(at, resultType, expansion.form, expansion.operands)
                     : mBuild.builtin(at, resultType,
                                      expansion.form == best->form ? best->form : mArena.keep(expansion.form),
                                      expansion.operands);
        result->helper = best->helper;
        result->isByRows = bestBinding.rows > 0;
        for (std::size_t i = 0; i < passed.size(); ++i)
            for (std::size_t j = 0; best->parameters[i].isOut && j < expansion.operands.size(); ++j)
                if (expansion.operands[j] == passed[i])
                    result->outOperands |= 1U << j;
        result->isUntyped =
            std::all_of(passed.begin(), passed.end(), [](const TypedExpr* e) { return e->isUntyped; });
    }
    result = withKnownSamplers(result);
    result = result ? around(result, before, after) : nullptr;
    if (!result || lookup.resultSize == 0)
        return result;
    const Scalar scalar = lookup.resultKind == 'h'   ? Scalar::HALF
                          : lookup.resultKind == 'x' ? Scalar::FIXED
                                                     : Scalar::FLOAT;
    return mBuild.cast(at, result, mTypes.vector(scalar, lookup.resultSize));
}

} // namespace cg
