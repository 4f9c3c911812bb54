#ifndef CG_CGGL_H
#define CG_CGGL_H

#include <Cg/cg.h>

/**
 * @file
 * The OpenGL side of the Cg runtime: programs, parameters and textures in the OpenGL context that is current.
 *
 * A program is a separable program object. The runtime keeps one program pipeline for each OpenGL context
 * that it is used in, binds it while a profile is enabled and a program is bound to it, and binds pipeline 0
 * otherwise; the pipeline binding is the runtime's. glUseProgram() stays the host's and is never called: a
 * program that the host makes current there takes precedence over the bound Cg programs.
 *
 * A stage without a bound program of an enabled profile is OpenGL's fixed function.
 *
 * Thread: the render thread, with the host's OpenGL context current. Handles and errors: see cg.h. An
 * operation that takes a profile sets CG_INVALID_PROFILE_ERROR and does nothing else where it is not
 * CG_PROFILE_GLSLV or CG_PROFILE_GLSLF; this is not repeated below.
 *
 * OpenGL: compatibility profile 3.2 with ARB_separate_shader_objects, or 4.1. No OpenGL error is queried.
 */

#ifdef __cplusplus
extern "C" {
#endif

/* NOLINTBEGIN(modernize-use-using): C reads this too. */

/** Kinds of profiles. */
typedef enum { CG_GL_VERTEX = 8, CG_GL_FRAGMENT = 9 } CGGLenum;

/* NOLINTEND(modernize-use-using) */

/* --- Profiles --- */

/**
 * The best profile of a kind: CG_PROFILE_GLSLV for CG_GL_VERTEX, CG_PROFILE_GLSLF for CG_GL_FRAGMENT.
 * @return CG_PROFILE_UNKNOWN, with CG_INVALID_ENUMERANT_ERROR, for any other kind; the same with
 *         CG_UNSUPPORTED_GL_EXTENSION_ERROR where the OpenGL context lacks what programs need
 */
CG_API CGprofile cgGLGetLatestProfile(CGGLenum kind);

/** Whether programs of the profile run in the current OpenGL context; sets no error. */
CG_API CGbool cgGLIsProfileSupported(CGprofile profile);

/** Accepts a profile. Programs are compiled for the current OpenGL context with or without it. */
CG_API void cgGLSetOptimalOptions(CGprofile profile);

/** Switches the profile's stage from fixed function to the program that is or will be bound. */
CG_API void cgGLEnableProfile(CGprofile profile);

/** Switches the profile's stage back to fixed function. The program stays bound. */
CG_API void cgGLDisableProfile(CGprofile profile);

/* --- Programs --- */

/** Loads a program, so that it can be bound. Compiling and linking are done when it is created. */
CG_API void cgGLLoadProgram(CGprogram program);

/** Whether the program was loaded. */
CG_API CGbool cgGLIsProgramLoaded(CGprogram program);

/**
 * Makes a program the one of its profile, whether the profile is enabled or not. Where textures are managed,
 * also binds those of its parameters. CG_PROGRAM_NOT_LOADED_ERROR where it was not loaded.
 */
CG_API void cgGLBindProgram(CGprogram program);

/**
 * Leaves the profile without a program: its stage is fixed function until the next is bound. Where textures
 * are managed, unbinds those of the program's parameters.
 */
CG_API void cgGLUnbindProgram(CGprofile profile);

/* --- Values --- */

/**
 * @file
 * @par Values
 * A value is the program's own, whether it is bound or not, and stays until it is set again. At first it is
 * the one that the source gives, else 0. Vectors: values that the parameter has no component for are ignored,
 * and components without a value become 0. A matrix takes the values as its first row.
 * Values for int parameters are rounded towards zero; a bool parameter is true for every value but 0.
 *
 * CG_INVALID_PARAMETER_ERROR, and nothing else happens, where the values are null or the parameter is a
 * structure, an array, a sampler or not uniform. A parameter that the compiled program does not use accepts
 * every value silently.
 */

/** Sets a scalar or a vector. */
/** @{ */
CG_API void cgGLSetParameter1f(CGparameter parameter, float x);
CG_API void cgGLSetParameter2f(CGparameter parameter, float x, float y);
CG_API void cgGLSetParameter3f(CGparameter parameter, float x, float y, float z);
CG_API void cgGLSetParameter4f(CGparameter parameter, float x, float y, float z, float w);
CG_API void cgGLSetParameter1fv(CGparameter parameter, const float* values);
CG_API void cgGLSetParameter2fv(CGparameter parameter, const float* values);
CG_API void cgGLSetParameter3fv(CGparameter parameter, const float* values);
CG_API void cgGLSetParameter4fv(CGparameter parameter, const float* values);
/** @} */

/**
 * Sets a matrix, row by row (fr) or column by column (fc), in the size that the parameter has.
 * CG_NOT_MATRIX_PARAM_ERROR where it is not a matrix.
 */
/** @{ */
CG_API void cgGLSetMatrixParameterfr(CGparameter parameter, const float* values);
CG_API void cgGLSetMatrixParameterfc(CGparameter parameter, const float* values);
/** @} */

/**
 * Sets elements of an array of scalars or vectors, each from one to four values.
 * @param offset  first element
 * @param count   number of elements, 0 for all from offset on; elements outside the array set
 *                CG_OUT_OF_ARRAY_BOUNDS_ERROR and nothing else happens
 * CG_ARRAY_PARAM_ERROR where the parameter is not an array. An array of arrays counts as one array of its
 * innermost elements.
 */
/** @{ */
CG_API void cgGLSetParameterArray1f(CGparameter parameter, long offset, long count, const float* values);
CG_API void cgGLSetParameterArray2f(CGparameter parameter, long offset, long count, const float* values);
CG_API void cgGLSetParameterArray3f(CGparameter parameter, long offset, long count, const float* values);
CG_API void cgGLSetParameterArray4f(CGparameter parameter, long offset, long count, const float* values);
/** @} */

/** The same for an array of matrices, each in the size that the elements have. */
/** @{ */
CG_API void cgGLSetMatrixParameterArrayfr(CGparameter parameter, long offset, long count,
                                          const float* values);
CG_API void cgGLSetMatrixParameterArrayfc(CGparameter parameter, long offset, long count,
                                          const float* values);
/** @} */

/* --- Textures --- */

/**
 * @file
 * @par Textures
 * A sampler uses the texture unit that its semantic names (TEXUNIT3), else one of its own, which no sampler
 * of any program of the other stage uses. CG_INVALID_PARAMETER_ERROR, and nothing else happens, where the
 * parameter is not a sampler. The active texture unit is what it was after each of these operations.
 */

/**
 * Remembers the texture of a sampler; the texture is bound by cgGLEnableTextureParameter(), or with the
 * program where textures are managed.
 * @param texture  OpenGL name, 0 for none
 */
CG_API void cgGLSetTextureParameter(CGparameter parameter, unsigned int texture);

/**
 * Binds the sampler's texture to the sampler's unit, at the target of the sampler's type. A sampler that was
 * given no texture, or that the compiled program does not use, is passed over.
 */
CG_API void cgGLEnableTextureParameter(CGparameter parameter);

/** Leaves the target of the sampler's type without a texture at the sampler's unit; passes over likewise. */
CG_API void cgGLDisableTextureParameter(CGparameter parameter);

/** The sampler's texture unit as OpenGL's enumerant, GL_TEXTURE0 plus the unit; 0 on an error. */
CG_API unsigned int cgGLGetTextureEnum(CGparameter parameter);

/**
 * Whether cgGLBindProgram() binds the textures of the program's samplers, and cgGLUnbindProgram() unbinds
 * them, for the programs of a context. Off at first: then textures are the host's.
 */
CG_API void cgGLSetManageTextureParameters(CGcontext context, CGbool manage);

#ifdef __cplusplus
}
#endif

#endif
