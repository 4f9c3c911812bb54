#include "Context.h"

#include "Errors.h"
#include "Handles.h"
#include "Program.h"

#include <algorithm>
#include <utility>

namespace cg {

namespace {

HandleTable<CGcontext, Context> handles;
std::vector<std::unique_ptr<Context>> contexts;
std::string lastListing;

} // namespace

Context::Context() : mHandle(handles.add(*this)) {}

Context::~Context() = default;

void Context::retire() {
    for (const std::unique_ptr<Program>& program : mPrograms)
        program->retire();
    handles.remove(mHandle);
}

CGprogram Context::add(std::unique_ptr<Program> program) {
    try {
        mPrograms.push_back(std::move(program));
    } catch (...) { // no memory; the program is still the caller's
        // cppcheck-suppress accessMoved ; nothing was moved by the call that threw
        program->retire();
        throw;
    }
    return mPrograms.back()->handle();
}

void Context::destroy(Program& program) {
    program.retire();
    const auto found = std::find_if(mPrograms.begin(), mPrograms.end(),
                                    [&](const auto& candidate) { return candidate.get() == &program; });
    mPrograms.erase(found);
}

void Context::setListing(std::string listing) {
    mListing = std::move(listing);
    mHasCompiled = true;
    lastListing = mListing;
}

Context* contextOf(CGcontext handle) {
    Context* const found = handles.find(handle);
    if (!found)
        setError(CG_INVALID_CONTEXT_HANDLE_ERROR);
    return found;
}

} // namespace cg

CGcontext cgCreateContext() {
    auto context = std::make_unique<cg::Context>();
    try {
        cg::contexts.push_back(std::move(context));
    } catch (...) { // no memory; the context is still ours
        // cppcheck-suppress accessMoved ; nothing was moved by the call that threw
        context->retire();
        throw;
    }
    return cg::contexts.back()->handle();
}

void cgDestroyContext(CGcontext context) {
    cg::Context* const found = cg::contextOf(context);
    if (!found)
        return;
    found->retire();
    const auto owner = std::find_if(cg::contexts.begin(), cg::contexts.end(),
                                    [&](const auto& candidate) { return candidate.get() == found; });
    cg::contexts.erase(owner);
}

CGbool cgIsContext(CGcontext context) {
    return cg::handles.find(context) ? CG_TRUE : CG_FALSE;
}

const char* cgGetLastListing(CGcontext context) {
    const cg::Context* const found = cg::contextOf(context);
    const std::string* const own = found ? found->listing() : nullptr;
    return own ? own->c_str() : cg::lastListing.c_str();
}
