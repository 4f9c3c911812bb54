#include <FwZel/CgParamUnit.h>

#include <utility>

namespace {

uint32_t floatsPerElement(uint32_t type) {
    switch (type) {
    case 0:
    case 1:
        return 1;
    case 2:
        return 2;
    case 3:
        return 3;
    case 14:
        return 16;
    default:
        return 4;
    }
}

} // namespace

CgParamUnit::CgParamUnit() : mParam(nullptr), mType(0), mSize(0) {}

CgParamUnit::CgParamUnit(std::string name, uint32_t type, uint32_t size)
    : mName(std::move(name)), mParam(nullptr), mType(type), mSize(size),
      mValue(size * floatsPerElement(type)) {}

CgParamUnit::CgParamUnit(std::string name, uint32_t type, uint32_t size, const float* value)
    : CgParamUnit(std::move(name), type, size) {
    setValue(value);
}
