#ifndef CG_COMPILER_RESOLVER_RESOLVER_H
#define CG_COMPILER_RESOLVER_RESOLVER_H

#include <Cg/Compiler/Resolver/Assignments.h>
#include <Cg/Compiler/Resolver/BranchSamplers.h>
#include <Cg/Compiler/Resolver/BuiltinCalls.h>
#include <Cg/Compiler/Resolver/Calls.h>
#include <Cg/Compiler/Resolver/ChosenCalls.h>
#include <Cg/Compiler/Resolver/Declarations.h>
#include <Cg/Compiler/Resolver/EntryResolver.h>
#include <Cg/Compiler/Resolver/ExpressionResolver.h>
#include <Cg/Compiler/Resolver/FunctionCalls.h>
#include <Cg/Compiler/Resolver/Globals.h>
#include <Cg/Compiler/Resolver/InitializerLists.h>
#include <Cg/Compiler/Resolver/Initializers.h>
#include <Cg/Compiler/Resolver/Instances.h>
#include <Cg/Compiler/Resolver/LocalDeclarations.h>
#include <Cg/Compiler/Resolver/LoopSamplers.h>
#include <Cg/Compiler/Resolver/MemberAccess.h>
#include <Cg/Compiler/Resolver/NameResolver.h>
#include <Cg/Compiler/Resolver/Overloads.h>
#include <Cg/Compiler/Resolver/Places.h>
#include <Cg/Compiler/Resolver/Recursion.h>
#include <Cg/Compiler/Resolver/Resolution.h>
#include <Cg/Compiler/Resolver/SamplerAliases.h>
#include <Cg/Compiler/Resolver/SamplerAssignments.h>
#include <Cg/Compiler/Resolver/SamplerFunctions.h>
#include <Cg/Compiler/Resolver/SamplerLists.h>
#include <Cg/Compiler/Resolver/SamplerPieces.h>
#include <Cg/Compiler/Resolver/StatementResolver.h>
#include <Cg/Compiler/Resolver/TypeResolver.h>

#include <string>

namespace cg {

class SamplerKinds;

/// Turns the syntax tree into the typed tree: finds what each name means, chooses among overloads, makes
/// conversions explicit, and takes along only what the entry reaches.
///
/// Puts together the parts that do so. Each knows only those before it, and comes back to the whole by its
/// Recursion.
///
/// Errors go to the diagnostics; the typed tree is meaningful only where there are none.
class Resolver : private Recursion {
public:
    /// @param kinds  where its count of plain samplers has grown, the program has to be resolved again
    Resolver(const TranslationUnit& unit, Stage stage, Arena& arena, TypeTable& types,
             Diagnostics& diagnostics, SamplerKinds& kinds);

    TypedProgram* resolve(const std::string& entry);

private:
    TypedExpr* expression(const Expr* expr) override { return mExpressions.expression(expr); }
    void body(Function* function, const FunctionDecl* definition) override {
        mStatements.body(function, definition);
    }

    Resolution mResolution;

    // What the program declares
    Declarations mDeclarations;
    TypeResolver mTypes;
    InitializerLists mInitializerLists;
    Initializers mInitializers;
    Globals mGlobals;
    Overloads mOverloads;

    // Samplers
    SamplerAliases mSamplerAliases;
    SamplerPieces mSamplerPieces;
    SamplerLists mSamplerLists;
    SamplerAssignments mSamplerAssignments;
    BranchSamplers mBranchSamplers;
    LoopSamplers mLoopSamplers;
    SamplerFunctions mSamplerFunctions;

    // Calls
    Places mPlaces;
    ChosenCalls mChosenCalls;
    BuiltinCalls mBuiltinCalls;
    Instances mInstances;
    FunctionCalls mFunctionCalls;
    Calls mCalls;

    // Expressions
    MemberAccess mMembers;
    NameResolver mNames;
    Assignments mAssignments;
    ExpressionResolver mExpressions;

    // Statements
    LocalDeclarations mLocalDeclarations;
    StatementResolver mStatements;

    EntryResolver mEntry;
};

} // namespace cg

#endif
