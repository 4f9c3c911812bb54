#include <FwZel/CgResource.h>

#include <FwZel/kxsys_syslog.h>

#include <algorithm>
#include <utility>

namespace {

constexpr uint32_t NO_TYPE = 0xFFFFFFFF;

uint32_t slotIndex(uint32_t type) {
    constexpr uint32_t FIRST_SHIFTED = 10;
    constexpr uint32_t LAST_SHIFTED = 25;
    return type >= FIRST_SHIFTED && type <= LAST_SHIFTED ? type - FIRST_SHIFTED : type;
}

} // namespace

CgResource::CgResource() : CgResource(0) {}

CgResource::CgResource(uint32_t size) : mCgProgram(nullptr), mSize(size), mResource(size) {}

void CgResource::setCgProgram(CGprogram prog) {
    mCgProgram = prog;
}

CgResourceUnit& CgResource::getCgResourceObj(uint32_t type) {
    const uint32_t index = slotIndex(type);
    if (index < mSize)
        return mResource[index];
    kxsys_syslog(KXSYS_LOG_ERROR,
                 "CgResource::getCgResourceObj(): type=%d addresses none of %d slots!!, Does nothing\n",
                 static_cast<int>(type), static_cast<int>(mSize));
    return mNoSlot = CgResourceUnit();
}

void CgResource::setCgResource(uint32_t type, std::string name) {
    CgResourceUnit& slot = getCgResourceObj(type);
    if (&slot == &mNoSlot)
        return;
    slot.setType(type);
    slot.setParam(cgGetNamedParameter(mCgProgram, name.c_str()));
    slot.setName(std::move(name));
}

std::string CgResource::getCgResourceName(uint32_t type) {
    return getCgResourceObj(type).getName();
}

CGparameter CgResource::getCgResourceParam(uint32_t type) {
    return getCgResourceObj(type).getParam();
}

CGparameter CgResource::getCgResourceParam(std::string name) {
    const uint32_t type = getCgResourceType(std::move(name));
    return type == NO_TYPE ? nullptr : getCgResourceParam(type);
}

uint32_t CgResource::getCgResourceType(std::string name) const {
    const auto slot = std::find_if(mResource.begin(), mResource.end(),
                                   [&](const CgResourceUnit& unit) { return unit.getName() == name; });
    if (slot != mResource.end())
        return slot->getType();
    kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 450: CgResource::getCgResourceType(%s) NOT found!!\n", name.c_str());
    return NO_TYPE;
}
