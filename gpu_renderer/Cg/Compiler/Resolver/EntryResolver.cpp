#include <Cg/Compiler/Resolver/EntryResolver.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/Globals.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Instances.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerPieces.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>
#include <Cg/Compiler/StateBindings.h>

#include <algorithm>
#include <cctype>
#include <cstddef>

namespace cg {

namespace {

std::string upper(Name text) {
    std::string result(text);
    for (char& c : result)
        c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return result;
}

/// TEXCOORD1 + 2 = TEXCOORD3; a semantic without a number counts from 0.
std::string numbered(const std::string& semantic, int offset) {
    std::size_t digits = semantic.size();
    while (digits > 0 && std::isdigit(static_cast<unsigned char>(semantic[digits - 1])) != 0)
        --digits;
    const std::string number = semantic.substr(digits);
    const int first = number.empty() || number.size() > 4 ? 0 : std::stoi(number);
    return semantic.substr(0, digits) + std::to_string(first + offset);
}

bool hasSemantics(const Type* type) {
    type = innermost(type);
    if (!type->isStruct())
        return false;
    const auto& fields = type->structure->fields;
    return std::any_of(fields.begin(), fields.end(), [](const Field& field) {
        return !field.declaration->semantic.name.empty() || hasSemantics(field.type);
    });
}

bool isUniformParameter(const VariableDecl* parameter, const Type* type) {
    const Qualifiers& qualifiers = parameter->qualifiers;
    if (qualifiers.isUniform || (containsSampler(type) && !hasSemantics(type)))
        return true;
    if (stateSemantic(parameter->semantic.name))
        return true;
    return directionOf(parameter) == Direction::IN && !qualifiers.isVarying && type->isStruct() &&
           parameter->semantic.name.empty() && !hasSemantics(type);
}

} // namespace

EntryResolver::EntryResolver(Resolution& resolution, const Declarations& declarations, Recursion& recursion,
                             TypeResolver& types, Initializers& initializers, Globals& globals,
                             Instances& instances, SamplerPieces& pieces)
    : mResolution(resolution), mDeclarations(declarations), mRecursion(recursion), mTypes(types),
      mInitializers(initializers), mGlobals(globals), mInstances(instances), mPieces(pieces) {}

void EntryResolver::resolve(const std::string& entry) {
    if (const FunctionDecl* declaration = find(entry))
        resolve(declaration);
    else
        refuse(entry);
}

/// Of several functions with a body the last one.
const FunctionDecl* EntryResolver::find(const std::string& entry) const {
    const auto& functions = mDeclarations.functions(entry);
    const auto found = std::find_if(functions.rbegin(), functions.rend(),
                                    [](const FunctionDecl* function) { return function->body; });
    return found == functions.rend() ? nullptr : *found;
}

void EntryResolver::refuse(const std::string& entry) {
    mResolution.diagnostics.error({}, "the program has no function " + inQuotes(entry) + " to start with" +
                                          suggestion(entry, mDeclarations.functionNames()));
}

void EntryResolver::resolve(const FunctionDecl* declaration) {
    auto* function = mResolution.arena.make<Function>();
    function->name = declaration->name;
    function->declaration = declaration;
    function->result = mTypes.typeOf(declaration->returnType);
    if (!function->result)
        return;
    mResolution.program.entry = function;
    for (const VariableDecl* parameter : declaration->parameters)
        addParameter(function, parameter);
    if (!function->result->isVoid())
        addResult(function);
    resolveBody(function);
}

void EntryResolver::resolveBody(Function* function) {
    mResolution.context.function = function;
    mResolution.context.ordinal = mDeclarations.ordinal(function->declaration);
    function->isBeingResolved = true;
    mInstances.addEntry(function);
    mRecursion.body(function, function->declaration);
    function->isBeingResolved = false;
    mResolution.program.functions.push_back(function);
    mResolution.context = FunctionContext();
}

// ------------------------------------------------------------------------------------------ parameters

/// @return null after an error
const Type* EntryResolver::parameterType(const VariableDecl* parameter) {
    const Type* type = mTypes.typeOf(parameter->type, parameter->dimensions);
    if (!type)
        return nullptr;
    if (parameter->initializer && type->isUnsizedArray())
        mInitializers.value(type, parameter->initializer);
    if (type && !type->isVoid() && (!type->isUnsizedArray() || isUniformParameter(parameter, type)))
        return type;
    mResolution.diagnostics.error(parameter->location, "parameter " + inQuotes(parameter->name) +
                                                           " of the entry needs a known size");
    return nullptr;
}

void EntryResolver::addParameter(Function* function, const VariableDecl* parameter) {
    const Type* type = parameterType(parameter);
    if (!type)
        return;
    TypedParameter listed;
    listed.name = parameter->name;
    listed.semantic = parameter->semantic.name;
    listed.direction = directionOf(parameter);
    listed.isUniform = isUniformParameter(parameter, type);
    listed.variable = listed.isUniform ? uniform(parameter, type) : stageParameter(function, parameter, type);
    listed.type = listed.variable->type;
    mResolution.program.parameters.push_back(listed);
}

Variable* EntryResolver::uniform(const VariableDecl* parameter, const Type* type) {
    Variable* variable = mGlobals.parameter(parameter, type);
    mResolution.context.variables.declare(parameter->name, variable);
    return variable;
}

/// A parameter that the stage takes in or gives out.
/// @return the variable around the entry's call
Variable* EntryResolver::stageParameter(Function* function, const VariableDecl* parameter, const Type* type) {
    Variable* inner =
        mResolution.makeVariable(Variable::Storage::PARAMETER, parameter->name, type, parameter);
    inner->direction = directionOf(parameter);
    inner->isConst = parameter->qualifiers.isConst && inner->direction == Direction::IN;
    function->parameters.push_back(inner);
    mResolution.context.variables.declare(parameter->name, inner);
    Variable* outer = mResolution.makeVariable(Variable::Storage::LOCAL, parameter->name, type, parameter);
    mResolution.program.arguments.push_back(outer);
    if (containsSampler(type))
        mPieces.addUniforms(inner, outer);
    TypedExpr* place = mResolution.build.variable(parameter->location, outer);
    const std::string semantic = upper(parameter->semantic.name);
    if (inner->direction != Direction::OUT)
        addStageValues(place, semantic, parameter->name, false);
    if (inner->direction != Direction::IN)
        addStageValues(place, semantic, parameter->name, true);
    return outer;
}

void EntryResolver::addResult(Function* function) {
    const FunctionDecl* declaration = function->declaration;
    Variable* result =
        mResolution.makeVariable(Variable::Storage::LOCAL, "result", function->result, nullptr);
    mResolution.program.result = result;
    std::string semantic = upper(declaration->semantic.name);
    if (semantic.empty() && !function->result->isStruct())
        semantic = mResolution.stage == Stage::VERTEX ? "POSITION" : "COLOR";
    addStageValues(mResolution.build.variable(declaration->location, result), semantic, "result", true);
    TypedParameter listed;
    listed.name = "return";
    listed.type = function->result;
    listed.semantic = declaration->semantic.name;
    listed.direction = Direction::OUT;
    listed.isUniform = false;
    listed.variable = result;
    mResolution.program.parameters.push_back(listed);
}

void EntryResolver::addGlobals() {
    for (const VariableDecl* declaration : mDeclarations.globals()) {
        const Type* named = mResolution.types.find(declaration->type->name);
        const bool isText = named && named->kind == Type::Kind::TEXT;
        if (declaration->qualifiers.isStatic || isText)
            continue;
        Variable* variable = mGlobals.variable(declaration);
        if (!variable || variable->storage != Variable::Storage::UNIFORM)
            continue;
        TypedParameter listed;
        listed.name = declaration->name;
        listed.type = variable->type;
        listed.semantic = declaration->semantic.name;
        listed.isGlobal = true;
        listed.variable = variable;
        mResolution.program.parameters.push_back(listed);
    }
}

// ----------------------------------------------------------------------------------------- stage values

/// Splits a value into what single semantics carry: members, elements, rows.
void EntryResolver::addStageValues(TypedExpr* place, std::string semantic, Name name, bool isOutput) {
    const Type* type = place->type;
    if (isOpaque(type))
        return;
    if (type->isStruct()) {
        addMembers(place, semantic, isOutput);
        return;
    }
    if (semantic.empty())
        semantic = upper(name);
    const bool isMatrix = type->isFullMatrix();
    if (!type->isArray() && !isMatrix) {
        mResolution.program.values.push_back({semantic, place, isOutput});
        return;
    }
    const int count = type->isArray() ? type->length : type->rows;
    for (int i = 0; i < count; ++i)
        addStageValues(mResolution.build.element(place->location, place, i), numbered(semantic, i), name,
                       isOutput);
}

/// Members without a semantic share that of their struct, with numbers of their own.
void EntryResolver::addMembers(TypedExpr* structure, const std::string& semantic, bool isOutput) {
    const auto& fields = structure->type->structure->fields;
    int offset = 0;
    for (std::size_t i = 0; i < fields.size(); ++i) {
        std::string own = upper(fields[i].declaration->semantic.name);
        if (own.empty() && !semantic.empty())
            own = numbered(semantic, offset++);
        addStageValues(mResolution.build.field(structure->location, structure, static_cast<int>(i)), own,
                       fields[i].name, isOutput);
    }
}

} // namespace cg
