#ifndef CG_RUNTIME_PROGRAM_H
#define CG_RUNTIME_PROGRAM_H

#include "Parameter.h"

#include <Cg/Compiler/Compiler.h>
#include <Cg/cg.h>

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cg {

class Context;

/// One compiled entry function and its OpenGL program object.
class Program {
public:
    /// What the program was made from.
    struct Origin {
        std::string source;
        std::string fileName;
        std::string entry;
        CGprofile profile;
    };

    /// @param glName  the linked OpenGL program object, which the program owns from its construction
    ///                until retire()
    Program(Context& context, Origin origin, CompileResult compiled, unsigned int glName);

    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    /// Unbinds the program, deletes its OpenGL object and makes its handles invalid. Not the destructor's
    /// work: at the end of the process there is no OpenGL context, and the tables of handles may be gone.
    void retire();

    CGprogram handle() const { return mHandle; }
    Context& context() const { return mContext; }
    const Origin& origin() const { return mOrigin; }
    const std::string& glsl() const { return mCompiled.glsl; }
    unsigned int glName() const { return mGlName; }
    Stage stage() const { return mOrigin.profile == CG_PROFILE_GLSLV ? Stage::VERTEX : Stage::FRAGMENT; }

    bool isLoaded() const { return mIsLoaded; }
    void setLoaded() { mIsLoaded = true; }

    /// Null where there is none of the name.
    ProgramParameter* parameterNamed(std::string_view name) const;

    /// Null where the name space is empty.
    ProgramParameter* firstParameter(bool isGlobal);

    /// The samplers that have a texture unit.
    const std::vector<ProgramParameter*>& samplers() const { return mSamplers; }

private:
    void addNames(std::vector<ProgramParameter>& parameters);

    Context& mContext;
    const Origin mOrigin;
    const CompileResult mCompiled;
    CGprogram mHandle = nullptr;
    const unsigned int mGlName;
    bool mIsLoaded = false;
    std::vector<ProgramParameter> mParameters;
    std::unordered_map<std::string_view, ProgramParameter*> mByName;
    std::vector<ProgramParameter*> mSamplers;
};

/// The program of a handle; null, with the error state set, where the handle is invalid.
Program* programOf(CGprogram handle);

/// Whether programs are compiled for the profile and run on it.
bool isProgramProfile(CGprofile profile);

} // namespace cg

#endif
