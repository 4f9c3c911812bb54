#include <Cg/Compiler/Resolver/Resolution.h>

#include <Cg/Compiler/Diagnostics.h>

#include <utility>

namespace cg {

Resolution::Resolution(Stage theStage, Arena& theArena, TypeTable& theTypes, Diagnostics& theDiagnostics)
    : stage(theStage), arena(theArena), types(theTypes), diagnostics(theDiagnostics),
      build(theArena, theTypes, theDiagnostics), program(*theArena.make<TypedProgram>()) {}

Variable* Resolution::makeVariable(Variable::Storage storage, Name name, const Type* type,
                                   const VariableDecl* declaration) {
    auto* variable = arena.make<Variable>();
    variable->storage = storage;
    variable->name = name;
    variable->type = type;
    variable->declaration = declaration;
    return variable;
}

Variable* Resolution::temporary(const Type* type) {
    Variable* variable = makeVariable(Variable::Storage::LOCAL, "temporary", type, nullptr);
    auto& temporaries = context.function ? context.function->temporaries : program.temporaries;
    temporaries.push_back(variable);
    return variable;
}

Variable* Resolution::programTemporary(Name name, const Type* type) {
    Variable* variable = makeVariable(Variable::Storage::LOCAL, name, type, nullptr);
    program.temporaries.push_back(variable);
    return variable;
}

TypedExpr* Resolution::once(TypedExpr* value, TypedExpr*& preparation) {
    if (isSimple(value))
        return value;
    TypedExpr* place = build.variable(value->location, temporary(value->type));
    preparation = build.assign(value->location, place, value);
    return build.variable(value->location, place->variable);
}

TypedExpr* Resolution::inOrder(SourceLocation at, TypedExpr* first, TypedExpr* second) {
    if (!first || !second)
        return first ? first : second;
    return build.comma(at, first, second);
}

TypedStmt* Resolution::makeStatement(TypedStmt::Kind kind, TypedExpr* expression) {
    auto* statement = arena.make<TypedStmt>(kind);
    statement->expression = expression;
    return statement;
}

TypedExpr* Resolution::number(SourceLocation at, int value) {
    return build.literal(at, types.scalar(Scalar::INT), value);
}

TypedExpr* Resolution::isNumber(SourceLocation at, TypedExpr* value, int number) {
    return build.binary(at, BinaryOp::EQUAL, value, this->number(at, number));
}

TypedExpr* Resolution::nothing(SourceLocation at) {
    return number(at, 0);
}

CallChange::CallChange(Resolution& resolution, FunctionContext inner)
    : mContext(resolution.context, std::move(inner)), mDepth(resolution.callDepth) {
    ++mDepth;
}

bool DeclarationLevel::fits(SourceLocation at, Name name) const {
    if (mResolution.declarationDepth <= MAX_DECLARATION_DEPTH)
        return true;
    mResolution.diagnostics.error(at, inQuotes(name) + " is nested too deep");
    return false;
}

} // namespace cg
