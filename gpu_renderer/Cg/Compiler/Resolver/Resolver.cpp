#include <Cg/Compiler/Resolver/Resolver.h>

namespace cg {

Resolver::Resolver(const TranslationUnit& unit, Stage stage, Arena& arena, TypeTable& types,
                   Diagnostics& diagnostics, SamplerKinds& kinds)
    : mResolution(stage, arena, types, diagnostics), mDeclarations(unit),
      mTypes(mResolution, mDeclarations, *this), mInitializerLists(mResolution, *this),
      mInitializers(mResolution, *this, mInitializerLists),
      mGlobals(mResolution, mDeclarations, mTypes, mInitializers),
      mOverloads(mResolution, mDeclarations, mTypes), mSamplerAliases(mResolution),
      mSamplerPieces(mResolution, mSamplerAliases), mSamplerLists(mResolution),
      mSamplerAssignments(mResolution, *this, mGlobals, mInitializerLists, mSamplerAliases, mSamplerPieces,
                          mSamplerLists),
      mBranchSamplers(mResolution, mSamplerAliases, mSamplerLists),
      mLoopSamplers(mResolution, mGlobals, mSamplerAliases, mSamplerAssignments),
      mSamplerFunctions(mResolution, mDeclarations, *this, mOverloads), mPlaces(mResolution),
      mChosenCalls(mResolution), mBuiltinCalls(mResolution, kinds, mPlaces, mChosenCalls),
      mInstances(mResolution, mDeclarations, *this, mOverloads, mSamplerPieces),
      mFunctionCalls(mResolution, mInitializers, mOverloads, mInstances, mPlaces, kinds, mSamplerAssignments,
                     mSamplerFunctions, mChosenCalls),
      mCalls(mResolution, mDeclarations, *this, mTypes, mInitializers, mOverloads, mFunctionCalls,
             mBuiltinCalls),
      mMembers(mResolution, mTypes, mSamplerPieces, mSamplerLists),
      mNames(mResolution, mDeclarations, mGlobals, mSamplerAliases, mMembers),
      mAssignments(mResolution, *this, mMembers, mPlaces, mSamplerAssignments),
      mExpressions(mResolution, mTypes, mInitializers, mNames, mMembers, mPlaces, mSamplerLists, mCalls,
                   mAssignments),
      mLocalDeclarations(mResolution, mTypes, mInitializers, mSamplerAssignments),
      mStatements(mResolution, *this, mLocalDeclarations, mBranchSamplers, mLoopSamplers),
      mEntry(mResolution, mDeclarations, *this, mTypes, mInitializers, mGlobals, mInstances, mSamplerPieces) {
}

TypedProgram* Resolver::resolve(const std::string& entry) {
    mEntry.resolve(entry);
    mEntry.addGlobals();
    return &mResolution.program;
}

} // namespace cg
