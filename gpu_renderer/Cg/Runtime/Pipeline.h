#ifndef CG_RUNTIME_PIPELINE_H
#define CG_RUNTIME_PIPELINE_H

#include <Cg/Compiler/Compiler.h>

#include <array>

namespace cg {

class Program;

/// The programmable stages of one OpenGL context: which are enabled, which program each has, and the program
/// pipeline object that shows OpenGL both.
///
/// Makes the OpenGL calls that a change needs and no others. With no stage to show it binds pipeline 0, since
/// a draw with an empty pipeline fails.
class Pipeline {
public:
    /// That of the OpenGL context that is current.
    static Pipeline& current();

    /// Takes a program out of the pipelines of all contexts.
    static void forget(const Program& program);

    /// Starts anew where the OpenGL context that this pipeline was made in is gone and another has come in
    /// its place. Called when a program is created, which a new context needs before anything else.
    void checkContext();

    void setEnabled(Stage stage, bool isEnabled);
    void setProgram(Stage stage, Program* program);
    Program* program(Stage stage) const { return mStages[index(stage)].program; }

private:
    struct StageState {
        bool isEnabled = false;
        Program* program = nullptr;
        unsigned int shown = 0; ///< OpenGL program that the pipeline object has for the stage
    };

    static size_t index(Stage stage) { return stage == Stage::VERTEX ? 0 : 1; }

    void show(Stage stage, unsigned int glProgram);
    void update();

    unsigned int mName = 0;
    bool mIsBound = false;
    std::array<StageState, 2> mStages;
};

} // namespace cg

#endif
