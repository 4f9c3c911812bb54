#ifndef FWZEL_CGPARAM_H
#define FWZEL_CGPARAM_H

#include <Cg/cg.h>
#include <FwZel/CgParamUnit.h>
#include <FwZel/Export.h>

#include <cstdint>
#include <map>
#include <string>

/// The named uniform parameters of one Cg program that a host drives: declared once, resolved in the program
/// once, then staged and sent every frame, one by one or all at once.
///
/// Order: setCgProgram(); an addCgParam() for each parameter; getNamedCgParameterAll(). An entry that is
/// added later, or before the program was set anew, keeps its handle until it is resolved again. Per frame:
/// setCgParam() with values, or setCgParamValue() several times and then setCgParamAll().
///
/// Sent are only entries of one element, by the setter of their type code: 0 and 1 cgGLSetParameter1fv, 2
/// cgGLSetParameter2fv, 3 cgGLSetParameter3fv, 14 cgGLSetMatrixParameterfr, every other code
/// cgGLSetParameter4fv. Arrays are staged and never sent. An entry that is not resolved is sent with a null
/// handle; no Cg error is read.
///
/// Names: compared byte by byte; all entries are visited in that order. An operation by name for a name that
/// has no entry does nothing and returns an empty string, null or 0.
///
/// Four floats: the forms with v0 to v3 fill an entry of up to four floats. On a larger one they stage its
/// first four and leave the rest; on a smaller one the superfluous ones are dropped.
///
/// A value: a copy has its own entries and values, and the same program and handles, which belong to the Cg
/// runtime.
///
/// Thread: the render thread, with the host's context current for what resolves and sends. Nothing is logged.
class FWZEL_API CgParam {
public:
    /// No program, no entries.
    CgParam();

    /// The program whose parameters are looked up; may be null. Entries keep their handles.
    void setCgProgram(CGprogram prog);

    /// Declares a parameter: null handle, a value of 0.0. A name that has an entry keeps it unchanged.
    /// @param name  as in the Cg program
    /// @param type  type code, see CgParamUnit
    /// @param size  number of elements
    void addCgParam(std::string name, uint32_t type, uint32_t size);

    /// The same, and then stages a value, also where the name had an entry. An array has as many floats as
    /// the entry; that is not checked.
    /// @{
    void addCgParam(std::string name, uint32_t type, uint32_t size, const float* value);
    void addCgParam(std::string name, uint32_t type, uint32_t size, float v0, float v1, float v2, float v3);
    /// @}

    /// Looks the entry's parameter up in the program (cgGetNamedParameter) and stores the handle, null where
    /// the program has none of the name.
    /// @return the new handle
    CGparameter getNamedCgParameter(std::string name);

    /// The same for every entry.
    void getNamedCgParameterAll();

    /// Stages a value; sends nothing. An array has as many floats as the entry; that is not checked.
    /// @{
    void setCgParamValue(std::string name, const float* value);
    void setCgParamValue(std::string name, float v0, float v1, float v2, float v3);
    /// @}

    /// Sends the staged value.
    void setCgParam(std::string name);

    /// Stages a value and sends it. An array has as many floats as the entry; that is not checked.
    /// @{
    void setCgParam(std::string name, const float* value);
    void setCgParam(std::string name, float v0, float v1, float v2, float v3);
    /// @}

    /// Sends the staged value of every entry.
    void setCgParamAll();

    std::string getCgParamName(std::string name);   ///< as declared
    CGparameter getCgParamParam(std::string name);  ///< null until resolved
    uint32_t getCgParamType(std::string name);      ///< type code
    uint32_t getCgParamSize(std::string name);      ///< number of elements
    uint32_t getCgParamTotalSize(std::string name); ///< number of floats
    float* getCgParamValue(std::string name); ///< the staged value, writable; see CgParamUnit::getValue()

    /// Does nothing.
    void printCgParams();

private:
    friend class Shader; // hands its calls on by reference: the name is a copy already

    void stage(const std::string& name, const float* value);
    void stage(const std::string& name, float v0, float v1, float v2, float v3);
    CgParamUnit* find(const std::string& name);
    CgParamUnit& declare(std::string name, uint32_t type, uint32_t size);
    CGparameter resolve(CgParamUnit& unit);
    void send(CgParamUnit& unit);
    void setCgParameter(CGparameter param, uint32_t type, uint32_t size, const float* value);

    CGprogram mCgProgram;
    std::map<std::string, CgParamUnit> mCgParams; ///< by name
};

#endif
