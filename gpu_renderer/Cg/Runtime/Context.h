#ifndef CG_RUNTIME_CONTEXT_H
#define CG_RUNTIME_CONTEXT_H

#include <Cg/cg.h>

#include <memory>
#include <string>
#include <vector>

namespace cg {

class Program;

/// A set of programs, and what the compiler said about the last of them.
class Context {
public:
    Context();
    ~Context();

    Context(const Context&) = delete;
    Context& operator=(const Context&) = delete;

    /// Retires the programs and makes the handle invalid. Not the destructor's work: at the end of the
    /// process there is no OpenGL context, and the table of handles may be gone.
    void retire();

    CGcontext handle() const { return mHandle; }

    CGprogram add(std::unique_ptr<Program> program);

    /// Retires and destroys one of this context's programs.
    void destroy(Program& program);

    /// Keeps what the compiler said, for this context and for the process.
    void setListing(std::string listing);

    /// Null where the context has compiled nothing.
    const std::string* listing() const { return mHasCompiled ? &mListing : nullptr; }

    bool managesTextures() const { return mManagesTextures; }
    void setManagesTextures(bool manages) { mManagesTextures = manages; }

private:
    CGcontext mHandle;
    std::vector<std::unique_ptr<Program>> mPrograms;
    std::string mListing;
    bool mHasCompiled = false;
    bool mManagesTextures = false;
};

/// The context of a handle; null, with the error state set, where the handle is invalid.
Context* contextOf(CGcontext handle);

} // namespace cg

#endif
