#ifndef FWZEL_CGRESOURCEUNIT_H
#define FWZEL_CGRESOURCEUNIT_H

#include <Cg/cg.h>
#include <FwZel/Export.h>

#include <cstdint>
#include <string>

/// One slot of a resource table (CgResource): a resource type code of the host's choice, the name of a
/// parameter of the program, and that parameter's handle.
///
/// A value: copies all three. The handle belongs to the Cg runtime.
///
/// Thread: that of its owner; makes no call to the Cg runtime.
class FWZEL_API CgResourceUnit {
public:
    /// A fresh slot: type 0, no name, no handle.
    CgResourceUnit();

    /// A slot of a type, without name and handle.
    explicit CgResourceUnit(uint32_t type);

    void setType(uint32_t type);      ///< resource type code
    void setName(std::string name);   ///< name in the program
    void setParam(CGparameter param); ///< handle of the parameter

    uint32_t getType() const { return mType; }      ///< resource type code
    std::string getName() const { return mName; }   ///< name in the program
    CGparameter getParam() const { return mParam; } ///< null where the program has no parameter of the name

    /// Does nothing.
    void printResourceUnit() const;

private:
    uint32_t mType;
    std::string mName;
    CGparameter mParam;
};

#endif
