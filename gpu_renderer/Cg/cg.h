#ifndef CG_CG_H
#define CG_CG_H

/**
 * @file
 * The Cg runtime: contexts, programs and their parameters. cgGL.h is its OpenGL side.
 *
 * A program is compiled from Cg source to GLSL, and compiled and linked by the OpenGL driver, when it is
 * created. The host then sets its parameters, enables the program's profile, binds the program and draws.
 *
 * Thread: the render thread. cgCreateProgram(), cgCreateProgramFromFile(), cgDestroyProgram() and
 * cgDestroyContext() of a context with programs need the host's OpenGL context to be current, and a program
 * is used in the OpenGL context that it was created in or in one that shares objects with it. Nothing is
 * locked.
 *
 * Handles: a null handle, a handle of another kind and a handle of an object that is destroyed are all
 * invalid. An operation that is given one sets the error CG_INVALID_CONTEXT_HANDLE_ERROR,
 * CG_INVALID_PROGRAM_HANDLE_ERROR or CG_INVALID_PARAM_HANDLE_ERROR, does nothing else and returns the neutral
 * result: null, 0, CG_FALSE, an empty text or the enumerator that stands for nothing. This is not repeated
 * below.
 *
 * Errors: the process has one error state, the last error that occurred. Success leaves it as it is; reading
 * it clears it (cgGetError(), cgGetLastErrorString()).
 *
 * Memory: where it runs out, an operation throws std::bad_alloc and leaves programs, parameters and OpenGL as
 * they were. A caller in C ends with it.
 *
 * Texts that an operation returns belong to the runtime and live as long as the object that they describe.
 */

/** Marks what libFwZelCg.so exports. */
#define CG_API __attribute__((visibility("default")))

#ifdef __cplusplus
extern "C" {
#endif

/* NOLINTBEGIN(modernize-use-using): C reads this too. */

/** A set of programs. */
typedef struct CGcontextObject* CGcontext;
/** One compiled entry function. */
typedef struct CGprogramObject* CGprogram;
/** A parameter of a program, or an element or a member of one. */
typedef struct CGparameterObject* CGparameter;

/** CG_FALSE or CG_TRUE. */
typedef int CGbool;
enum { CG_FALSE = 0, CG_TRUE = 1 };

/** What went wrong. */
typedef enum {
    CG_NO_ERROR = 0,
    CG_COMPILER_ERROR = 1,           /**< Cg or GLSL did not compile or link; see cgGetLastListing() */
    CG_INVALID_PARAMETER_ERROR = 2,  /**< the operation does not apply to the parameter, or null values */
    CG_INVALID_PROFILE_ERROR = 3,    /**< not a profile that programs run on */
    CG_PROGRAM_LOAD_ERROR = 4,       /**< the program could not be loaded */
    CG_PROGRAM_BIND_ERROR = 5,       /**< the program could not be bound */
    CG_PROGRAM_NOT_LOADED_ERROR = 6, /**< the program was not loaded before it was bound */
    CG_UNSUPPORTED_GL_EXTENSION_ERROR = 7, /**< the OpenGL context lacks what programs need */
    CG_NOT_MATRIX_PARAM_ERROR = 8,         /**< the parameter is not a matrix */
    CG_INVALID_ENUMERANT_ERROR = 9,        /**< the operation does not know the enumerator */
    CG_FILE_READ_ERROR = 10,               /**< a program file could not be read */
    CG_INVALID_CONTEXT_HANDLE_ERROR = 11,
    CG_INVALID_PROGRAM_HANDLE_ERROR = 12,
    CG_INVALID_PARAM_HANDLE_ERROR = 13,
    CG_UNKNOWN_PROFILE_ERROR = 14,    /**< programs cannot be compiled for the profile */
    CG_INVALID_DIMENSION_ERROR = 15,  /**< the array has no such dimension */
    CG_ARRAY_PARAM_ERROR = 16,        /**< the parameter is not an array */
    CG_OUT_OF_ARRAY_BOUNDS_ERROR = 17 /**< elements outside the array */
} CGerror;

/** What is asked for, or what is answered. */
typedef enum {
    CG_ERROR = 0,        /**< answer: none, the handle is invalid */
    CG_SOURCE = 4112,    /**< program text: Cg source */
    CG_PROGRAM_SOURCE,   /**< cgGetProgramString(): the source as it was given */
    CG_PROGRAM_ENTRY,    /**< cgGetProgramString(): name of the entry function */
    CG_PROGRAM_PROFILE,  /**< cgGetProgramString(): name of the profile */
    CG_COMPILED_PROGRAM, /**< cgGetProgramString(): the GLSL text */
    CG_PROGRAM,          /**< name space: the parameters of the entry function */
    CG_GLOBAL,           /**< name space: the parameters declared outside functions */
    CG_VARYING,          /**< variability: comes with each vertex or fragment, or goes out with it */
    CG_UNIFORM,          /**< variability: set by the host */
    CG_CONSTANT,         /**< variability: fixed by the source */
    CG_IN,               /**< direction: into the program */
    CG_OUT,              /**< direction: out of the program */
    CG_INOUT             /**< direction: both */
} CGenum;

/** Compilation targets. Programs run on CG_PROFILE_GLSLV and CG_PROFILE_GLSLF only. */
typedef enum {
    CG_PROFILE_UNKNOWN = 6145,
    CG_PROFILE_VP20 = 6146,
    CG_PROFILE_FP20 = 6147,
    CG_PROFILE_VP30 = 6148,
    CG_PROFILE_FP30 = 6149,
    CG_PROFILE_ARBVP1 = 6150,
    CG_PROFILE_FP40 = 6151,
    CG_PROFILE_VS_1_1 = 6153,
    CG_PROFILE_VS_2_0 = 6154,
    CG_PROFILE_VS_2_X = 6155,
    CG_PROFILE_VS_2_SW = 6156,
    CG_PROFILE_VS_3_0 = 6157,
    CG_PROFILE_HLSLV = 6158,
    CG_PROFILE_PS_1_1 = 6159,
    CG_PROFILE_PS_1_2 = 6160,
    CG_PROFILE_PS_1_3 = 6161,
    CG_PROFILE_PS_2_0 = 6162,
    CG_PROFILE_PS_2_X = 6163,
    CG_PROFILE_PS_2_SW = 6164,
    CG_PROFILE_PS_3_0 = 6165,
    CG_PROFILE_HLSLF = 6166,
    CG_PROFILE_VS_4_0 = 6167,
    CG_PROFILE_PS_4_0 = 6168,
    CG_PROFILE_GS_4_0 = 6169,
    CG_PROFILE_VS_5_0 = 6170,
    CG_PROFILE_PS_5_0 = 6171,
    CG_PROFILE_GS_5_0 = 6172,
    CG_PROFILE_HS_5_0 = 6173,
    CG_PROFILE_DS_5_0 = 6174,
    CG_PROFILE_ARBFP1 = 7000,
    CG_PROFILE_VP40 = 7001,
    CG_PROFILE_GENERIC = 7002,
    CG_PROFILE_GLSLV = 7007, /**< vertex programs as GLSL */
    CG_PROFILE_GLSLF = 7008, /**< fragment programs as GLSL */
    CG_PROFILE_GLSLC = 7009,
    CG_PROFILE_GPU_FP = 7010,
    CG_PROFILE_GP4FP = 7010,
    CG_PROFILE_GPU_VP = 7011,
    CG_PROFILE_GP4VP = 7011,
    CG_PROFILE_GPU_GP = 7012,
    CG_PROFILE_GP4GP = 7012,
    CG_PROFILE_GLSLG = 7016,
    CG_PROFILE_GP5FP = 7017,
    CG_PROFILE_GP5VP = 7018,
    CG_PROFILE_GP5GP = 7019,
    CG_PROFILE_GP5TCP = 7020,
    CG_PROFILE_GP5TEP = 7021
} CGprofile;

/**
 * Types of parameters. The value of a number type is 100 times its kind (1 float, 2 half, 3 fixed, 4 int,
 * 5 bool), plus 10 times the rows of a matrix, plus the components of a vector or a row.
 */
/* clang-format off */
typedef enum {
    CG_UNKNOWN_TYPE = 0,
    CG_STRUCT = 1,
    CG_ARRAY = 2,
    CG_SAMPLER1D = 3,
    CG_SAMPLER2D = 4,
    CG_SAMPLER3D = 5,
    CG_SAMPLERRECT = 6,
    CG_SAMPLERCUBE = 7,
    CG_SAMPLER1DARRAY = 8,
    CG_SAMPLER2DARRAY = 9,

    CG_FLOAT = 100,
    CG_FLOAT1 = 101, CG_FLOAT2 = 102, CG_FLOAT3 = 103, CG_FLOAT4 = 104,
    CG_FLOAT1x1 = 111, CG_FLOAT1x2 = 112, CG_FLOAT1x3 = 113, CG_FLOAT1x4 = 114,
    CG_FLOAT2x1 = 121, CG_FLOAT2x2 = 122, CG_FLOAT2x3 = 123, CG_FLOAT2x4 = 124,
    CG_FLOAT3x1 = 131, CG_FLOAT3x2 = 132, CG_FLOAT3x3 = 133, CG_FLOAT3x4 = 134,
    CG_FLOAT4x1 = 141, CG_FLOAT4x2 = 142, CG_FLOAT4x3 = 143, CG_FLOAT4x4 = 144,
    CG_HALF = 200,
    CG_HALF1 = 201, CG_HALF2 = 202, CG_HALF3 = 203, CG_HALF4 = 204,
    CG_HALF1x1 = 211, CG_HALF1x2 = 212, CG_HALF1x3 = 213, CG_HALF1x4 = 214,
    CG_HALF2x1 = 221, CG_HALF2x2 = 222, CG_HALF2x3 = 223, CG_HALF2x4 = 224,
    CG_HALF3x1 = 231, CG_HALF3x2 = 232, CG_HALF3x3 = 233, CG_HALF3x4 = 234,
    CG_HALF4x1 = 241, CG_HALF4x2 = 242, CG_HALF4x3 = 243, CG_HALF4x4 = 244,
    CG_FIXED = 300,
    CG_FIXED1 = 301, CG_FIXED2 = 302, CG_FIXED3 = 303, CG_FIXED4 = 304,
    CG_FIXED1x1 = 311, CG_FIXED1x2 = 312, CG_FIXED1x3 = 313, CG_FIXED1x4 = 314,
    CG_FIXED2x1 = 321, CG_FIXED2x2 = 322, CG_FIXED2x3 = 323, CG_FIXED2x4 = 324,
    CG_FIXED3x1 = 331, CG_FIXED3x2 = 332, CG_FIXED3x3 = 333, CG_FIXED3x4 = 334,
    CG_FIXED4x1 = 341, CG_FIXED4x2 = 342, CG_FIXED4x3 = 343, CG_FIXED4x4 = 344,
    CG_INT = 400,
    CG_INT1 = 401, CG_INT2 = 402, CG_INT3 = 403, CG_INT4 = 404,
    CG_INT1x1 = 411, CG_INT1x2 = 412, CG_INT1x3 = 413, CG_INT1x4 = 414,
    CG_INT2x1 = 421, CG_INT2x2 = 422, CG_INT2x3 = 423, CG_INT2x4 = 424,
    CG_INT3x1 = 431, CG_INT3x2 = 432, CG_INT3x3 = 433, CG_INT3x4 = 434,
    CG_INT4x1 = 441, CG_INT4x2 = 442, CG_INT4x3 = 443, CG_INT4x4 = 444,
    CG_BOOL = 500,
    CG_BOOL1 = 501, CG_BOOL2 = 502, CG_BOOL3 = 503, CG_BOOL4 = 504,
    CG_BOOL1x1 = 511, CG_BOOL1x2 = 512, CG_BOOL1x3 = 513, CG_BOOL1x4 = 514,
    CG_BOOL2x1 = 521, CG_BOOL2x2 = 522, CG_BOOL2x3 = 523, CG_BOOL2x4 = 524,
    CG_BOOL3x1 = 531, CG_BOOL3x2 = 532, CG_BOOL3x3 = 533, CG_BOOL3x4 = 534,
    CG_BOOL4x1 = 541, CG_BOOL4x2 = 542, CG_BOOL4x3 = 543, CG_BOOL4x4 = 544,
    CG_STRING = 600 /**< no parameter of a program has this type */
} CGtype;
/* clang-format on */

/* NOLINTEND(modernize-use-using) */

/* --- Errors --- */

/** The last error that occurred since the state was read; clears it. */
CG_API CGerror cgGetError(void);

/** What an error means, in words; "unknown error" for a number that is not a CGerror. Never null. */
CG_API const char* cgGetErrorString(CGerror error);

/**
 * Reads and clears the error state, as cgGetError() does.
 * @param error  receives the code, CG_NO_ERROR where there is none; may be null
 * @return the error in words, null where there is none
 */
CG_API const char* cgGetLastErrorString(CGerror* error);

/**
 * What the compiler said about the last program created in the context: one line each, "file(line) : error:
 * text" or "file(line) : warning: text", then the driver's log where the GLSL failed; empty for a program
 * that compiled without a remark. For a context that has compiled nothing, and for an invalid handle, that of
 * the last program in the process.
 * @return never null; valid until the next program is created
 */
CG_API const char* cgGetLastListing(CGcontext context);

/* --- Contexts --- */

/** A new context without programs. Never fails and leaves the error state as it is. */
CG_API CGcontext cgCreateContext(void);

/** Destroys a context and its programs, as cgDestroyProgram() does. */
CG_API void cgDestroyContext(CGcontext context);

/** Whether the handle is that of a living context; sets no error. */
CG_API CGbool cgIsContext(CGcontext context);

/* --- Programs --- */

/**
 * Compiles a program from source text, to the end: Cg to GLSL, and GLSL in the driver.
 * The listing names the text "<string>"; files that it includes are looked for in the working directory.
 * @param type     CG_SOURCE; anything else sets CG_INVALID_ENUMERANT_ERROR
 * @param source   Cg source, ends with a null byte; null sets CG_INVALID_PARAMETER_ERROR
 * @param profile  CG_PROFILE_GLSLV or CG_PROFILE_GLSLF; anything else sets CG_UNKNOWN_PROFILE_ERROR
 * @param entry    name of the entry function; null means "main"
 * @param args     null, or compiler options "-DNAME", "-DNAME=VALUE" and "-Ipath" with a null pointer at the
 *                 end; other options are passed over
 * @return null on any error; CG_COMPILER_ERROR where the text does not compile or has no such entry
 */
CG_API CGprogram cgCreateProgram(CGcontext context, CGenum type, const char* source, CGprofile profile,
                                 const char* entry, const char** args);

/**
 * The same from a file. Files that it includes are looked for beside the including file first.
 * @param file  path of the source; CG_FILE_READ_ERROR, and a listing that names the file, where it cannot be
 *              read
 */
CG_API CGprogram cgCreateProgramFromFile(CGcontext context, CGenum type, const char* file, CGprofile profile,
                                         const char* entry, const char** args);

/** Destroys a program and its parameters; where it is bound, its stage has no program afterwards. */
CG_API void cgDestroyProgram(CGprogram program);

/** Whether the handle is that of a living program; sets no error. */
CG_API CGbool cgIsProgram(CGprogram program);

/** CG_TRUE: a program exists only when it compiled. */
CG_API CGbool cgIsProgramCompiled(CGprogram program);

/**
 * A text of the program.
 * @param what  CG_PROGRAM_SOURCE, CG_PROGRAM_ENTRY, CG_PROGRAM_PROFILE or CG_COMPILED_PROGRAM (the GLSL);
 *              anything else sets CG_INVALID_ENUMERANT_ERROR and gives an empty text
 */
CG_API const char* cgGetProgramString(CGprogram program, CGenum what);

/** The profile that the program is compiled for; CG_PROFILE_UNKNOWN for an invalid handle. */
CG_API CGprofile cgGetProgramProfile(CGprogram program);

/** Short name of a profile that programs run on, "glslv" or "glslf"; null for any other value. */
CG_API const char* cgGetProfileString(CGprofile profile);

/* --- Finding parameters --- */

/**
 * The parameter of the name that it has in the source: "gain", "levels.gain", "taps[2]", "taps[2].weight".
 * Arrays and structures have handles too. A parameter that the compiled program does not use exists and can
 * be set, to no effect.
 * @return null, without an error, where the program has none of the name or the name is null
 */
CG_API CGparameter cgGetNamedParameter(CGprogram program, const char* name);

/**
 * The first parameter in the order of the source, arrays and structures as a whole; null where there is none.
 * @param nameSpace  CG_PROGRAM or CG_GLOBAL; anything else sets CG_INVALID_ENUMERANT_ERROR
 */
CG_API CGparameter cgGetFirstParameter(CGprogram program, CGenum nameSpace);

/** The parameter, or the structure member, after this one; null after the last, and for an array element. */
CG_API CGparameter cgGetNextParameter(CGparameter parameter);

/** First member of a structure; null for any other parameter. cgGetNextParameter() goes on from it. */
CG_API CGparameter cgGetFirstStructParameter(CGparameter parameter);

/**
 * An element of an array.
 * @param index  from 0; outside the array sets CG_OUT_OF_ARRAY_BOUNDS_ERROR and gives null
 * CG_ARRAY_PARAM_ERROR and null where the parameter is not an array.
 */
CG_API CGparameter cgGetArrayParameter(CGparameter parameter, int index);

/** Whether the handle is that of a parameter of a living program; sets no error. */
CG_API CGbool cgIsParameter(CGparameter parameter);

/* --- What a parameter is --- */

/** Name from the outside in, as cgGetNamedParameter() takes it. */
CG_API const char* cgGetParameterName(CGparameter parameter);

/** CG_ARRAY, CG_STRUCT, or the type of the value. */
CG_API CGtype cgGetParameterType(CGparameter parameter);

/** A type as it is written in Cg ("float4", "sampler2D", "struct", "array"); "unknown type" for the rest. */
CG_API const char* cgGetTypeString(CGtype type);

/** Rows of a matrix, 1 for a scalar or a vector, 0 for anything else; of an array, those of its elements. */
CG_API int cgGetParameterRows(CGparameter parameter);

/** Components of a vector or of a matrix row, 1 for a scalar, 0 for anything else; of an array likewise. */
CG_API int cgGetParameterColumns(CGparameter parameter);

/** Number of dimensions of an array; 0 for any other parameter. */
CG_API int cgGetArrayDimension(CGparameter parameter);

/**
 * Number of elements of an array.
 * @param dimension  from 0, the outermost; one that the array has not sets CG_INVALID_DIMENSION_ERROR and
 *                   gives -1
 * CG_ARRAY_PARAM_ERROR and -1 where the parameter is not an array, -1 for an invalid handle.
 */
CG_API int cgGetArraySize(CGparameter parameter, int dimension);

/** The semantic, as it is written in the source ("POSITION", "TEXUNIT1"); empty where there is none. */
CG_API const char* cgGetParameterSemantic(CGparameter parameter);

/** CG_UNIFORM, CG_VARYING or CG_CONSTANT. */
CG_API CGenum cgGetParameterVariability(CGparameter parameter);

/** CG_IN, CG_OUT or CG_INOUT; uniform parameters are CG_IN. */
CG_API CGenum cgGetParameterDirection(CGparameter parameter);

/** Whether the compiled program uses the parameter, or any part of it. */
CG_API CGbool cgIsParameterReferenced(CGparameter parameter);

/**
 * The value that the source gives a uniform parameter, matrices row by row, arrays and structures element by
 * element.
 * @param count   number of floats that values holds; the rest of the value is left out
 * @param values  receives the value; null or a negative count sets CG_INVALID_PARAMETER_ERROR
 * @return number of floats written: 0 where the source gives no value
 */
CG_API int cgGetParameterDefaultValuefr(CGparameter parameter, int count, float* values);

#ifdef __cplusplus
}
#endif

#endif
