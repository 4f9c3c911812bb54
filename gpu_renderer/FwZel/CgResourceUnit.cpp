#include <FwZel/CgResourceUnit.h>

#include <utility>

CgResourceUnit::CgResourceUnit() : CgResourceUnit(0) {}

CgResourceUnit::CgResourceUnit(uint32_t type) : mType(type), mParam(nullptr) {}

void CgResourceUnit::setType(uint32_t type) {
    mType = type;
}

void CgResourceUnit::setName(std::string name) {
    mName = std::move(name);
}

void CgResourceUnit::setParam(CGparameter param) {
    mParam = param;
}

void CgResourceUnit::printResourceUnit() const {}
