#include <Cg/Compiler/Resolver/Calls.h>

#include <Cg/Compiler/BuiltinFunctions.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Resolver/BuiltinCalls.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/FunctionCalls.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Refusals.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <algorithm>
#include <cstddef>

namespace cg {

namespace {

bool isAnyNull(const std::vector<TypedExpr*>& expressions) {
    return std::find(expressions.begin(), expressions.end(), nullptr) != expressions.end();
}

} // namespace

Calls::Calls(Resolution& resolution, const Declarations& declarations, Recursion& recursion,
             TypeResolver& types, Initializers& initializers, Overloads& overloads, FunctionCalls& functions,
             BuiltinCalls& builtins)
    : mResolution(resolution), mDeclarations(declarations), mRecursion(recursion), mTypes(types),
      mInitializers(initializers), mOverloads(overloads), mFunctions(functions), mBuiltins(builtins) {}

TypedExpr* Calls::call(const CallExpr* expr) {
    Arguments arguments;
    for (const Expr* argument : expr->arguments)
        arguments.push_back(mRecursion.expression(argument));
    if (expr->callee->kind == Expr::Kind::MEMBER)
        return callMember(static_cast<const MemberExpr*>(expr->callee), arguments);
    if (expr->callee->kind == Expr::Kind::NAME)
        return isAnyNull(arguments)
                   ? nullptr
                   : callNamed(expr, static_cast<const NameExpr*>(expr->callee)->name, arguments);
    mResolution.diagnostics.error(expr->location, "this is no function");
    return nullptr;
}

/// `object.method(arguments)`
TypedExpr* Calls::callMember(const MemberExpr* callee, const Arguments& arguments) {
    TypedExpr* object = mRecursion.expression(callee->object);
    if (!object || isAnyNull(arguments))
        return nullptr;
    const SourceLocation at = callee->location;
    const Name name = callee->name;
    if (object->type->isArray() && name == "length" && arguments.empty())
        return mResolution.number(at, object->type->length);
    const Overloads::Functions& methods = mOverloads.methods(object->type, name);
    if (methods.empty()) {
        mResolution.diagnostics.error(at, "'" + nameOf(object->type) + "' has no method " + inQuotes(name));
        return nullptr;
    }
    if (const FunctionDecl* method = mOverloads.choose(methods, arguments))
        return mFunctions.call(at, method, arguments, object);
    mOverloads.refuse(at, name, methods, arguments);
    return nullptr;
}

TypedExpr* Calls::callNamed(const CallExpr* expr, Name name, const Arguments& arguments) {
    const SourceLocation at = expr->location;
    if (Variable* self = mResolution.context.self)
        if (const FunctionDecl* method = mOverloads.choose(mOverloads.methods(self->type, name), arguments))
            return mFunctions.call(at, method, arguments, mResolution.build.variable(at, self));
    const Overloads::Functions& functions = mOverloads.candidates(name);
    if (!functions.empty())
        return callOwn(at, name, functions, arguments);
    if (mBuiltins.has(name, arguments.size()))
        return mBuiltins.call(at, name, arguments, true);
    const Type* type = mTypes.find(name);
    if (type && (type->isNumeric() || type->isStruct()))
        return callType(expr, type, arguments);
    if (!mDeclarations.functions(name).empty())
        return nullptr; // the error of its own declaration has been said
    std::vector<Name> known = builtinNames();
    const std::vector<Name> declared = mDeclarations.functionNames();
    known.insert(known.end(), declared.begin(), declared.end());
    mResolution.diagnostics.error(at, "undeclared function " + inQuotes(name) + suggestion(name, known));
    return nullptr;
}

/// A function of the program. One that fits only by a cut gives way to a built-in one that fits better.
TypedExpr* Calls::callOwn(SourceLocation at, Name name, const Overloads::Functions& functions,
                          const Arguments& arguments) {
    const FunctionDecl* function = mOverloads.choose(functions, arguments);
    if (!function || isCut(function, arguments))
        if (TypedExpr* builtin = mBuiltins.call(at, name, arguments, false))
            return builtin;
    if (function)
        return mFunctions.call(at, function, arguments, nullptr);
    mOverloads.refuse(at, name, functions, arguments);
    return nullptr;
}

/// The function takes less of an argument than there is.
bool Calls::isCut(const FunctionDecl* function, const Arguments& arguments) {
    const std::vector<const Type*>& parameters = mOverloads.signatureOf(function).parameters;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const Type* type = arguments[i]->type;
        if (type->isNumeric() && parameters[i]->isNumeric() &&
            type->components() > parameters[i]->components())
            return true;
    }
    return false;
}

/// A type that the grammar could not know for one.
TypedExpr* Calls::callType(const CallExpr* expr, const Type* type, const Arguments& arguments) {
    return type->isNumeric() ? mResolution.build.construct(expr->location, type, arguments)
                             : mInitializers.structure(expr->location, type, expr->arguments);
}

} // namespace cg
