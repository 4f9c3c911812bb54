#include <FwZel/CgParam.h>

#include <Cg/cgGL.h>

#include <algorithm>
#include <array>
#include <utility>

namespace {

/// Stages four floats, or as many of them as the entry has.
void stageFour(CgParamUnit& unit, const std::array<float, 4>& values) {
    float* const staged = unit.getValue();
    if (unit.getTotalSize() >= values.size())
        std::copy(values.begin(), values.end(), staged); // of a fixed size: no call, no loop
    else
        std::copy_n(values.begin(), unit.getTotalSize(), staged);
}

} // namespace

CgParam::CgParam() : mCgProgram(nullptr) {}

void CgParam::setCgProgram(CGprogram prog) {
    mCgProgram = prog;
}

void CgParam::addCgParam(std::string name, uint32_t type, uint32_t size) {
    declare(std::move(name), type, size);
}

void CgParam::addCgParam(std::string name, uint32_t type, uint32_t size, const float* value) {
    // cppcheck-suppress accessMoved ; each overload has a name of its own
    declare(std::move(name), type, size).setValue(value);
}

void CgParam::addCgParam(std::string name, uint32_t type, uint32_t size, float v0, float v1, float v2,
                         float v3) {
    stageFour(declare(std::move(name), type, size), {v0, v1, v2, v3});
}

CGparameter CgParam::getNamedCgParameter(std::string name) {
    CgParamUnit* const unit = find(name);
    return unit ? resolve(*unit) : nullptr;
}

void CgParam::getNamedCgParameterAll() {
    for (auto& [name, unit] : mCgParams)
        resolve(unit);
}

void CgParam::setCgParamValue(std::string name, const float* value) {
    stage(name, value);
}

void CgParam::setCgParamValue(std::string name, float v0, float v1, float v2, float v3) {
    stage(name, v0, v1, v2, v3);
}

void CgParam::setCgParam(std::string name) {
    if (CgParamUnit* const unit = find(name))
        send(*unit);
}

void CgParam::setCgParam(std::string name, const float* value) {
    if (CgParamUnit* const unit = find(name)) {
        unit->setValue(value);
        send(*unit);
    }
}

void CgParam::setCgParam(std::string name, float v0, float v1, float v2, float v3) {
    if (CgParamUnit* const unit = find(name)) {
        stageFour(*unit, {v0, v1, v2, v3});
        send(*unit);
    }
}

void CgParam::setCgParamAll() {
    for (auto& [name, unit] : mCgParams)
        send(unit);
}

std::string CgParam::getCgParamName(std::string name) {
    const CgParamUnit* const unit = find(name);
    return unit ? unit->getName() : std::string();
}

CGparameter CgParam::getCgParamParam(std::string name) {
    const CgParamUnit* const unit = find(name);
    return unit ? unit->getParam() : nullptr;
}

uint32_t CgParam::getCgParamType(std::string name) {
    const CgParamUnit* const unit = find(name);
    return unit ? unit->getType() : 0;
}

uint32_t CgParam::getCgParamSize(std::string name) {
    const CgParamUnit* const unit = find(name);
    return unit ? unit->getSize() : 0;
}

uint32_t CgParam::getCgParamTotalSize(std::string name) {
    const CgParamUnit* const unit = find(name);
    return unit ? unit->getTotalSize() : 0;
}

float* CgParam::getCgParamValue(std::string name) {
    CgParamUnit* const unit = find(name);
    return unit ? unit->getValue() : nullptr;
}

void CgParam::printCgParams() {}

void CgParam::stage(const std::string& name, const float* value) {
    if (CgParamUnit* const unit = find(name))
        unit->setValue(value);
}

void CgParam::stage(const std::string& name, float v0, float v1, float v2, float v3) {
    if (CgParamUnit* const unit = find(name))
        stageFour(*unit, {v0, v1, v2, v3});
}

CgParamUnit* CgParam::find(const std::string& name) {
    const auto entry = mCgParams.find(name);
    return entry == mCgParams.end() ? nullptr : &entry->second;
}

CgParamUnit& CgParam::declare(std::string name, uint32_t type, uint32_t size) {
    return mCgParams.try_emplace(name, name, type, size).first->second;
}

CGparameter CgParam::resolve(CgParamUnit& unit) {
    unit.setParam(cgGetNamedParameter(mCgProgram, unit.getName().c_str()));
    return unit.getParam();
}

void CgParam::send(CgParamUnit& unit) {
    setCgParameter(unit.getParam(), unit.getType(), unit.getSize(), unit.getValue());
}

void CgParam::setCgParameter(CGparameter param, uint32_t type, uint32_t size, const float* value) {
    if (size != 1)
        return;
    switch (type) {
    case 0:
    case 1:
        cgGLSetParameter1fv(param, value);
        break;
    case 2:
        cgGLSetParameter2fv(param, value);
        break;
    case 3:
        cgGLSetParameter3fv(param, value);
        break;
    case 14:
        cgGLSetMatrixParameterfr(param, value);
        break;
    default:
        cgGLSetParameter4fv(param, value);
        break;
    }
}
