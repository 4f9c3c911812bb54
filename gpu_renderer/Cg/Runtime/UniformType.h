#ifndef CG_RUNTIME_UNIFORMTYPE_H
#define CG_RUNTIME_UNIFORMTYPE_H

#include <cstddef>

namespace cg {

/// Values for a uniform, or for elements of an array from one on.
struct UniformValues {
    unsigned int program;
    int location;
    int count;           ///< of elements
    const float* floats; ///< count times as many as the type has
    bool isTransposed;   ///< of matrices: row by row of GLSL's
};

/// A type of uniforms.
struct UniformType {
    unsigned int glType;                       ///< OpenGL's enumerant
    int floats;                                ///< how many values a uniform has, 0 where it takes none
    void (*send)(const UniformValues& values); ///< one OpenGL call
};

/// One without values where the type is not a number's, as that of samplers.
const UniformType& uniformType(unsigned int glType);

} // namespace cg

#endif
