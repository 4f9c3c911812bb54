#ifndef FWZEL_SHADER_H
#define FWZEL_SHADER_H

#include <Cg/cg.h>
#include <FwZel/CgParam.h>
#include <FwZel/CgResource.h>
#include <FwZel/Export.h>

#include <cstdint>
#include <string>

/// A Cg vertex or fragment program, compiled from a source file by the constructor and loaded into OpenGL,
/// with its named uniform parameters and, where asked, its resource slots.
///
/// All shaders share one Cg context and the latest vertex and fragment profile that the OpenGL context
/// supports. The first shader constructed creates them; nothing destroys them. A program stays in the context
/// when its shader is gone. A shader whose program could not be created keeps a null program for its life.
///
/// Per draw: enableProfile(), bindProgram(), set parameters, draw, disableProfile().
///
/// A copy shares the program and the resource slots and has its own parameter values.
///
/// Errors: those met while the shared context or a profile is set up end the process with exit status 1; a
/// program that cannot be created is logged; no other Cg error is read. Where memory for names, values and
/// tables runs out, an operation throws std::bad_alloc; the shader stays usable.
///
/// Thread: the render thread, with the host's context current. Nothing is locked.
class FWZEL_API Shader {
public:
    /// The stage of a program.
    enum ShaderType { TYPE_VERTEX = 0, TYPE_FRAGMENT = 1 };

    /// A vertex program from the file "Cg/vertex.cg", relative to the working directory, with the entry
    /// function "Cg_Main". Otherwise as below.
    Shader();

    /// Compiles and loads a program. Logs 451 where it cannot be created: the file is missing or does not
    /// compile, or the entry function is missing. The compiler's listing is in cgGetLastListing().
    /// @param type      TYPE_VERTEX; any other value makes a fragment program
    /// @param progName  path of the Cg source, handed to the Cg runtime unchanged
    /// @param entName   name of the entry function
    Shader(ShaderType type, std::string progName, std::string entName);

    ~Shader();

    // --- What all shaders share

    /// Puts a new Cg context in the place of the shared one; programs stay in the one that they are in. A Cg
    /// error ends the process, see checkForCgError().
    static void initCgContext();

    /// Ask for the latest profile again and have its best options used. A Cg error from the first of these
    /// ends the process, see checkForCgError().
    /// @{
    static void initVertexCgProfile();
    static void initFragmentCgProfile();
    /// @}

    /// The shared context, null before the first shader is constructed.
    static CGcontext getCgContext() { return mCgContext; }

    /// Reads and clears the Cg runtime's error state. On an error ends the process by exit() with status 1; a
    /// compiler error logs 452 with the shared context's last listing before.
    /// @param situation  where the error was met; not written
    static void checkForCgError(std::string situation);

    // --- Drawing

    /// Switch the stage of the program's profile on and off.
    /// @{
    void enableProfile();
    void disableProfile();
    /// @}

    /// Makes the program the current one of its profile.
    void bindProgram();

    // --- Resource slots

    /// @class Shader
    /// @par Resource slots
    /// Without a table, setCgResource() and getCgResourceParam() write an unnumbered message to the log at
    /// level 3, do nothing else, and the latter returns null.

    /// Gives the shader a new table for its program; the shader lets go of the one that it had.
    /// @param num  number of slots; a negative one counts as 0
    void createCgResource(int num);

    /// As CgResource::setCgResource().
    void setCgResource(uint32_t type, std::string name);
    /// As CgResource::getCgResourceParam().
    CGparameter getCgResourceParam(std::string name) const;

    // --- Named parameters

    /// Each is the operation of CgParam of the same name and arguments.
    /// @{
    void addCgParam(std::string name, uint32_t type, uint32_t size);
    void addCgParam(std::string name, uint32_t type, uint32_t size, const float* value);
    void addCgParam(std::string name, uint32_t type, uint32_t size, float v0, float v1, float v2, float v3);
    void getNamedCgParameterAll();
    void setCgParamValue(std::string name, const float* value);
    void setCgParamValue(std::string name, float v0, float v1, float v2, float v3);
    void setCgParam(std::string name);
    void setCgParam(std::string name, const float* value);
    void setCgParam(std::string name, float v0, float v1, float v2, float v3);
    void setCgParamAll();
    /// @}

private:
    void init();
    void initCg();

    /// Enumerator name of a profile; "error" for a value that names none.
    static std::string getCgProfileString(CGprofile prof);

    static bool mIsFirstTime;
    static CGcontext mCgContext;
    static CGprofile mCgVertexProfile;
    static CGprofile mCgFragmentProfile;

    CGprofile mCgProfile; ///< what the program is compiled for
    ShaderType mType;
    std::string mProgramName;
    std::string mProgramEntryName;
    CGprogram mCgProgram;        ///< null where its creation failed
    CgResource::Ptr mCgResource; ///< empty until createCgResource()
    CgParam mCgParam;
};

#endif
