#ifndef FWZEL_CGPARAMUNIT_H
#define FWZEL_CGPARAMUNIT_H

#include <Cg/cg.h>
#include <FwZel/Export.h>

#include <cstdint>
#include <string>
#include <vector>

/// One named uniform parameter of a Cg program: its handle, its shape, and a value staged in host memory.
///
/// The shape is a type code and a number of elements. A type code gives the floats of one element: 0 and 1
/// one, 2 two, 3 three, 14 sixteen (a 4 x 4 matrix, row by row), every other code four. Shape and number of
/// floats are fixed at construction; assignment from another unit replaces them.
///
/// A value: a copy has its own staged value and the same handle. The handle belongs to the Cg runtime.
///
/// Thread: that of its owner; makes no call to the Cg runtime.
class FWZEL_API CgParamUnit {
public:
    /// No name, no handle, no elements.
    CgParamUnit();

    /// @param name  as in the Cg program
    /// @param type  type code
    /// @param size  number of elements; size x floats of one element stays below 2^31
    /// The handle is null, the staged value all 0.0.
    CgParamUnit(std::string name, uint32_t type, uint32_t size);

    /// The same with a staged value.
    /// @param value  getTotalSize() floats; not checked
    CgParamUnit(std::string name, uint32_t type, uint32_t size, const float* value);

    /// Stores a handle; may be null.
    void setParam(CGparameter param) { mParam = param; }

    /// Stages a value.
    /// @param value  getTotalSize() floats; not checked
    void setValue(const float* value) {
        // A loop: so few floats are copied before the C library has been called.
        for (float& staged : mValue)
            staged = *value++;
    }

    std::string getName() const { return mName; }                                  ///< as in the Cg program
    CGparameter getParam() const { return mParam; }                                ///< null until set
    uint32_t getType() const { return mType; }                                     ///< type code
    uint32_t getSize() const { return mSize; }                                     ///< number of elements
    uint32_t getTotalSize() const { return static_cast<uint32_t>(mValue.size()); } ///< number of floats

    /// The staged value, writable; valid until the unit is assigned to or destroyed.
    float* getValue() { return mValue.data(); }

private:
    std::string mName;
    CGparameter mParam;
    uint32_t mType;
    uint32_t mSize;
    std::vector<float> mValue;
};

#endif
