#include "Pipeline.h"

#include "Program.h"

#include <epoxy/gl.h>

#include <dlfcn.h>

#include <map>

namespace cg {

namespace {

using CurrentContext = void* (*)();

/// A window system's function that names the current context; null where the process has not loaded it.
CurrentContext findCurrentContext(const char* library, const char* function) {
    void* const loaded = dlopen(library, RTLD_LAZY | RTLD_NOLOAD);
    return loaded ? reinterpret_cast<CurrentContext>(dlsym(loaded, function)) : nullptr;
}

/// Tells OpenGL contexts apart. OpenGL itself has no name for them, so EGL and GLX are asked, whichever the
/// host uses; null where neither knows.
void* currentContext() {
    static const CurrentContext egl = findCurrentContext("libEGL.so.1", "eglGetCurrentContext");
    static const CurrentContext dispatchedGlx = findCurrentContext("libGLX.so.0", "glXGetCurrentContext");
    static const CurrentContext glx =
        dispatchedGlx ? dispatchedGlx : findCurrentContext("libGL.so.1", "glXGetCurrentContext");
    void* const context = egl ? egl() : nullptr;
    return context || !glx ? context : glx();
}

std::map<void*, Pipeline> pipelines;

} // namespace

Pipeline& Pipeline::current() {
    return pipelines[currentContext()];
}

void Pipeline::forget(const Program& program) {
    for (auto& [context, pipeline] : pipelines)
        if (pipeline.program(program.stage()) == &program)
            pipeline.mStages[index(program.stage())].program = nullptr;
    Pipeline& pipeline = current();
    pipeline.update();
    if (pipeline.mStages[index(program.stage())].shown == program.glName())
        pipeline.show(program.stage(), 0);
}

void Pipeline::checkContext() {
    if (mName != 0 && !glIsProgramPipeline(mName))
        *this = Pipeline();
}

void Pipeline::setEnabled(Stage stage, bool isEnabled) {
    mStages[index(stage)].isEnabled = isEnabled;
    update();
}

void Pipeline::setProgram(Stage stage, Program* program) {
    mStages[index(stage)].program = program;
    update();
}

void Pipeline::show(Stage stage, unsigned int glProgram) {
    unsigned int& shown = mStages[index(stage)].shown;
    if (shown == glProgram)
        return;
    glUseProgramStages(mName, stage == Stage::VERTEX ? GL_VERTEX_SHADER_BIT : GL_FRAGMENT_SHADER_BIT,
                       glProgram);
    shown = glProgram;
}

void Pipeline::update() {
    std::array<unsigned int, 2> wanted{};
    for (size_t i = 0; i < wanted.size(); ++i)
        if (mStages[i].isEnabled && mStages[i].program)
            wanted[i] = mStages[i].program->glName();
    const bool isWanted = wanted[0] != 0 || wanted[1] != 0;
    if (isWanted && mName == 0)
        glGenProgramPipelines(1, &mName);
    if (isWanted) {
        show(Stage::VERTEX, wanted[0]);
        show(Stage::FRAGMENT, wanted[1]);
    }
    if (isWanted != mIsBound)
        glBindProgramPipeline(isWanted ? mName : 0);
    mIsBound = isWanted;
}

} // namespace cg
