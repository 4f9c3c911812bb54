#ifndef FWZEL_CGRESOURCE_H
#define FWZEL_CGRESOURCE_H

#include <Cg/cg.h>
#include <FwZel/CgResourceUnit.h>
#include <FwZel/Export.h>

#include <boost/shared_ptr.hpp>

#include <cstdint>
#include <string>
#include <vector>

/// The resource slots of one Cg program: a fixed number of slots, each of which ties a resource type code of
/// the host's choice to the name of a parameter of the program and to that parameter's handle, looked up when
/// the slot is filled. A later setCgProgram() does not refresh the handles.
///
/// Type codes: 10 to 25 address slots 0 to 15, every other code the slot of its own number. So 3 and 13 are
/// the same slot, and 10 to 25 reach all of a table of 16. An operation that is given a code that addresses
/// no slot of the table writes an unnumbered message to the log at level 3, changes nothing and returns what
/// a fresh slot holds: no name, a null handle.
///
/// Names: compared byte by byte. Where several slots hold a name, the lowest one answers.
///
/// A value: a copy has its own slots with the same program and handles, which belong to the Cg runtime.
///
/// Thread: the render thread.
class FWZEL_API CgResource {
public:
    /// How a shader holds its table.
    using Ptr = boost::shared_ptr<CgResource>;

    /// No program, no slots.
    CgResource();

    /// No program.
    /// @param size  number of fresh slots
    explicit CgResource(uint32_t size);

    /// The program in which setCgResource() looks names up; may be null.
    void setCgProgram(CGprogram prog);
    CGprogram getCGProgram() const { return mCgProgram; } ///< null until set

    /// The slot that a type code addresses, valid until the table is assigned to or destroyed. For a code
    /// that addresses none, a fresh slot apart from the table, valid until the next such code.
    CgResourceUnit& getCgResourceObj(uint32_t type);

    /// Fills the slot that a type code addresses: the code itself, the name, and the handle of the program's
    /// parameter of that name (cgGetNamedParameter), null where the program has none.
    void setCgResource(uint32_t type, std::string name);

    /// Name in the slot that a type code addresses, filled or fresh.
    std::string getCgResourceName(uint32_t type);

    /// Handle in the slot that a type code addresses, filled or fresh.
    CGparameter getCgResourceParam(uint32_t type);

    /// Handle in the slot that the type code of the slot with this name addresses.
    /// @return null, after message 450, where no slot has the name
    CGparameter getCgResourceParam(std::string name);

    /// Type code of the slot with a name.
    /// @return 0xFFFFFFFF, after message 450, where no slot has the name
    uint32_t getCgResourceType(std::string name) const;

private:
    CGprogram mCgProgram;
    uint32_t mSize;
    std::vector<CgResourceUnit> mResource; ///< mSize slots
    CgResourceUnit mNoSlot;                ///< what a type code without a slot refers to
};

#endif
