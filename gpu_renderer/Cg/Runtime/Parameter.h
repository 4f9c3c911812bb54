#ifndef CG_RUNTIME_PARAMETER_H
#define CG_RUNTIME_PARAMETER_H

#include "UniformType.h"

#include <Cg/Compiler/Compiler.h>
#include <Cg/cg.h>

#include <vector>

namespace cg {

class Program;

/// One parameter of a program, one element of an array or one member of a structure: what the compiler says
/// of it, and what it is in the program's OpenGL object. The tree has the shape of the descriptions.
struct ProgramParameter {
    ProgramParameter(const Parameter& described, Program& owner);

    const Parameter& description;
    Program& program;
    std::vector<ProgramParameter> children;
    ProgramParameter* next = nullptr; ///< the following one of the name space, or of the structure
    CGparameter handle = nullptr;     ///< null until the host asks for it

    int location = -1;                 ///< of the uniform; -1 where OpenGL has none
    const UniformType* type = nullptr; ///< of the uniform, of an array its elements'; null likewise
    int textureUnit = -1;              ///< of a sampler that the program uses, else -1
    unsigned int texture = 0;          ///< of a sampler: OpenGL name
    bool hasTexture = false;           ///< the host has given the sampler a texture
};

/// Sets each one's next to its follower of the same name space.
void linkSiblings(std::vector<ProgramParameter>& siblings);

/// The parameter of a handle; null, with the error state set, where the handle is invalid.
ProgramParameter* parameterOf(CGparameter handle);

/// The handle of a parameter, made at the first call; null for null.
CGparameter handleOf(ProgramParameter* parameter);

/// Makes the handles of the parameters, and of their parts, invalid.
void removeHandles(const std::vector<ProgramParameter>& parameters);

} // namespace cg

#endif
