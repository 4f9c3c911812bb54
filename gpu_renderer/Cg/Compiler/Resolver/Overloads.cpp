#include <Cg/Compiler/Resolver/Overloads.h>

#include <Cg/Compiler/ConversionCost.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>
#include <set>
#include <utility>

namespace cg {

namespace {

using Kind = TypedExpr::Kind;

/// Each call looks at all functions of its name: more is no program but an attack.
constexpr std::size_t MAX_OVERLOADS = 256;

const Overloads::Functions NONE;

std::string fromTo(const Type* from, const char* way, const Type* to) {
    return " from '" + nameOf(from) + "'" + way + " to '" + nameOf(to) + "'";
}

/// A function could write to it.
bool mayBeOut(const TypedExpr* argument) {
    return rootVariable(argument) || argument->kind == Kind::CONSTRUCT;
}

} // namespace

const Signature& Overloads::signatureOf(const FunctionDecl* declaration) {
    const auto [slot, isNew] = mSignatures.try_emplace(declaration);
    if (!isNew)
        return slot->second;
    const ContextChange outside(mResolution.context, {}); // its types mean the same for all callers
    Signature signature;
    signature.result = mTypes.typeOf(declaration->returnType);
    for (const VariableDecl* parameter : declaration->parameters) {
        const Type* type = mTypes.typeOf(parameter->type, parameter->dimensions);
        if (!type)
            signature.result = nullptr;
        signature.parameters.push_back(type);
    }
    signature.isKnown = true;
    return mSignatures[declaration] = signature;
}

const Overloads::Functions& Overloads::candidates(Name name) {
    const Functions& all = bounded(mDeclarations.functions(name), name); // in the order of the source
    const std::size_t ordinal = mResolution.context.ordinal;
    const auto end = std::partition_point(all.begin(), all.end(), [&](const FunctionDecl* function) {
        return mDeclarations.ordinal(function) <= ordinal;
    });
    const Functions visible(all.begin(), end == all.begin() ? all.end() : end);
    if (mCandidates[name].visible != visible.size()) {
        Functions distinct = distinctOf(visible); // may look up candidates itself
        // A function whose own parameters ask for this is missing among them, and only for now.
        const bool areKnown = std::all_of(visible.begin(), visible.end(), [&](const FunctionDecl* function) {
            return signatureOf(function).isKnown;
        });
        mCandidates[name] = {areKnown ? visible.size() : 0, std::move(distinct)};
    }
    return mCandidates[name].distinct;
}

/// @return the functions, or none where they are too many
const Overloads::Functions& Overloads::bounded(const Functions& functions, Name name) {
    if (functions.size() <= MAX_OVERLOADS)
        return functions;
    mResolution.diagnostics.error(functions[MAX_OVERLOADS]->location,
                                  "more than " + std::to_string(MAX_OVERLOADS) + " functions are called " +
                                      inQuotes(name));
    return NONE;
}

Overloads::Functions Overloads::distinctOf(const Functions& functions) {
    Functions distinct;
    std::set<std::vector<const Type*>> known;
    for (const FunctionDecl* function : functions) {
        const Signature& signature = signatureOf(function);
        if (signature.result && known.insert(signature.parameters).second)
            distinct.push_back(function);
    }
    return distinct;
}

const Overloads::Functions& Overloads::methods(const Type* type, Name name) {
    if (!type->isStruct())
        return NONE;
    const StructDecl* declaration = type->structure->declaration;
    const auto [known, isNew] = mMethods.try_emplace(declaration);
    auto& methods = known->second;
    if (isNew) {
        for (const FunctionDecl* method : declaration->methods)
            methods[method->name].push_back(method);
        for (const auto& [outsideName, outside] : mDeclarations.outsideMethods(declaration->name)) {
            Functions& all = methods[outsideName];
            all.insert(all.end(), outside.begin(), outside.end());
        }
    }
    const auto found = methods.find(name);
    return found == methods.end() ? NONE : bounded(found->second, name);
}

/// The functions that may be the body of a prototype.
const Overloads::Functions& Overloads::declarationsLike(const FunctionDecl* declaration) const {
    if (declaration->ownerName.empty())
        return mDeclarations.functions(declaration->name);
    const auto& methods = mDeclarations.outsideMethods(declaration->ownerName);
    const auto found = methods.find(declaration->name);
    return found == methods.end() ? NONE : found->second;
}

const FunctionDecl* Overloads::definitionOf(const FunctionDecl* declaration) {
    if (declaration->body)
        return declaration;
    const Functions& all = declarationsLike(declaration);
    const std::vector<const Type*> wanted = signatureOf(declaration).parameters;
    const auto found = std::find_if(all.begin(), all.end(), [&](const FunctionDecl* other) {
        return other->body && signatureOf(other).parameters == wanted;
    });
    return found == all.end() ? nullptr : *found;
}

/// @return what it costs to pass the argument; IMPOSSIBLE where it cannot be passed
int Overloads::argumentCost(const FunctionDecl* function, std::size_t position, const TypedExpr* argument) {
    const Type* type = signatureOf(function).parameters[position];
    if (implements(argument->type, type))
        return 1;
    const Direction direction = directionOf(function->parameters[position]);
    const int there = direction == Direction::OUT ? 0 : conversionCost(argument, type);
    if (there == IMPOSSIBLE_CONVERSION || direction == Direction::IN)
        return there;
    if (!mayBeOut(argument))
        return IMPOSSIBLE_CONVERSION;
    const TypedExpr result(Kind::LITERAL, argument->location, type);
    const int back =
        type->isUnsizedArray() ? conversionCost(argument, type) : conversionCost(&result, argument->type);
    return back == IMPOSSIBLE_CONVERSION ? back : std::max(there, back);
}

bool Overloads::takes(const FunctionDecl* function, const Arguments& arguments) {
    const Signature& signature = signatureOf(function);
    if (!signature.result || arguments.size() > signature.parameters.size())
        return false;
    for (std::size_t i = 0; i < signature.parameters.size(); ++i) {
        const bool isTaken = i < arguments.size()
                                 ? argumentCost(function, i, arguments[i]) != IMPOSSIBLE_CONVERSION
                                 : function->parameters[i]->initializer != nullptr;
        if (!isTaken)
            return false;
    }
    return true;
}

Overloads::Functions Overloads::cheapest(const Functions& functions, std::size_t position,
                                         const TypedExpr* argument) {
    Functions cheapest;
    int best = 0;
    for (const FunctionDecl* function : functions) {
        const int cost = argumentCost(function, position, argument);
        if (cheapest.empty() || cost < best) {
            cheapest.clear();
            best = cost;
        }
        if (cost == best)
            cheapest.push_back(function);
    }
    return cheapest;
}

const FunctionDecl* Overloads::choose(const Functions& functions, const Arguments& arguments) {
    Functions fitting;
    for (const FunctionDecl* function : functions)
        if (takes(function, arguments))
            fitting.push_back(function);
    for (std::size_t i = 0; i < arguments.size() && fitting.size() > 1; ++i)
        fitting = cheapest(fitting, i, arguments[i]);
    return fitting.empty() ? nullptr : fitting[0];
}

void Overloads::refuse(SourceLocation at, Name name, const Functions& functions, const Arguments& arguments) {
    mResolution.diagnostics.error(at, noMatchingFunction(name, arguments));
    for (const FunctionDecl* function : functions)
        if (signatureOf(function).result)
            mResolution.diagnostics.note(function->location, "candidate: " + describe(function) + ": " +
                                                                 objection(function, arguments));
}

/// Why a function does not take the arguments.
std::string Overloads::objection(const FunctionDecl* function, const Arguments& arguments) {
    const std::vector<const Type*>& parameters = signatureOf(function).parameters;
    for (std::size_t i = 0; i < std::min(arguments.size(), parameters.size()); ++i) {
        if (argumentCost(function, i, arguments[i]) != IMPOSSIBLE_CONVERSION)
            continue;
        const std::string argument = "argument " + std::to_string(i + 1);
        const Direction direction = directionOf(function->parameters[i]);
        if (direction != Direction::IN && !mayBeOut(arguments[i]))
            return argument + " cannot be written to";
        const bool isWayBack = direction == Direction::OUT ||
                               (direction == Direction::INOUT &&
                                conversionCost(arguments[i], parameters[i]) != IMPOSSIBLE_CONVERSION);
        return "no conversion of " + argument +
               (isWayBack ? fromTo(parameters[i], " back", arguments[i]->type)
                          : fromTo(arguments[i]->type, "", parameters[i]));
    }
    return "it takes " + std::to_string(parameters.size()) +
           (parameters.size() == 1 ? " argument" : " arguments");
}

std::string Overloads::describe(const FunctionDecl* declaration) {
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

} // namespace cg
