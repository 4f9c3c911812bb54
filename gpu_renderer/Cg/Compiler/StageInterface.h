#ifndef CG_COMPILER_STAGE_INTERFACE_H
#define CG_COMPILER_STAGE_INTERFACE_H

#include <Cg/Compiler/Compiler.h>
#include <Cg/Compiler/TypedTree.h>
#include <Cg/Compiler/VaryingPlaces.h>

#include <map>
#include <string>
#include <vector>

/// What Cg's semantics are in GLSL: the compatibility profile's built-in variables wherever there is one, so
/// that fixed function can take the place of either stage.
namespace cg {

/// A value of the stage as GLSL has it.
struct StageSlot {
    std::string glsl; ///< an input's expression, an output's variable; empty where there is none
    int size = 4;     ///< its number of components
    bool isInteger = false;
    std::string twin; ///< an output that is written along with it: gl_BackColor
};

/// A varying or a vertex attribute that is none of the built-in ones. Varyings meet by their location; all
/// are vec4.
struct StageDeclaration {
    std::string name;
    int location = 0;
    bool isOutput = false;
};

class StageInterface {
public:
    /// @param values  all inputs and outputs of the stage
    /// @param places  gives the varyings that have no location of their own one
    StageInterface(Stage stage, const std::vector<StageValue>& values, VaryingPlaces& places);

    /// A varying that there is no place left for; null where there is none.
    const StageValue* unplaced() const { return mUnplaced; }

    /// A vertex input that has to share its attribute with another one; null where there is none.
    const StageValue* sharedAttribute() const { return mSharedAttribute; }

    StageSlot slot(const StageValue& value) const;

    const std::vector<StageDeclaration>& declarations() const { return mDeclarations; }

    /// GLSL declarations of the built-in variables that the stage uses, as separable programs need them.
    std::string builtinDeclarations() const;

private:
    StageSlot builtinSlot(const StageValue& value) const;
    std::map<std::string, const StageValue*> freeValues(bool isOutput) const;
    void declareAttributes(const std::map<std::string, const StageValue*>& values);
    void declareVaryings(const std::map<std::string, const StageValue*>& values, VaryingPlaces& places);

    const Stage mStage;
    const std::vector<StageValue>& mValues;
    bool mHasSeveralColours = false;
    std::vector<StageDeclaration> mDeclarations;
    const StageValue* mUnplaced = nullptr;
    const StageValue* mSharedAttribute = nullptr;
};

} // namespace cg

#endif
