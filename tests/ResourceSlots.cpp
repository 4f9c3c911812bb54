#include <FwZel/CgResource.h>

#include <fixture/CapturedLog.h>
#include <fixture/CgCalls.h>

#include <gtest/gtest.h>

namespace {

using Calls = std::vector<std::string>;
using Log = std::vector<LogMessage>;

constexpr uint32_t NO_TYPE = 0xFFFFFFFF;

auto* const PROGRAM = handleNumber<CGprogram>(1);
auto* const IMAGE = handleNumber<CGparameter>(2);
auto* const KEY = handleNumber<CGparameter>(3);

LogMessage notFound(const std::string& name) {
    return {3, "GPUR 450: CgResource::getCgResourceType(" + name + ") NOT found!!\n"};
}

LogMessage noSlot(const std::string& type, const std::string& slots) {
    return {3, "CgResource::getCgResourceObj(): type=" + type + " addresses none of " + slots +
                   " slots!!, Does nothing\n"};
}

class ResourceSlots : public ::testing::Test {
protected:
    void SetUp() override {
        cgAnswers = {};
        cgAnswers.parameters = {{"image", IMAGE}, {"key", KEY}, {"missing", nullptr}};
        takeCgCalls();
        takeLog();
    }
    void TearDown() override { EXPECT_EQ(takeLog(), Log{}); }
};

TEST_F(ResourceSlots, CodesFrom10To25AddressTheFirst16Slots) {
    CgResource table(30);
    for (uint32_t type = 0; type < 30; ++type) {
        const uint32_t slot = type >= 10 && type <= 25 ? type - 10 : type;
        EXPECT_EQ(&table.getCgResourceObj(type), &table.mResource[slot]) << type;
    }
}

TEST_F(ResourceSlots, FillingLooksTheNameUpInTheProgram) {
    CgResource table(16);
    EXPECT_EQ(table.getCGProgram(), nullptr);
    table.setCgProgram(PROGRAM);
    EXPECT_EQ(table.getCGProgram(), PROGRAM);
    table.setCgResource(13, "image");
    table.setCgResource(4, "missing");
    EXPECT_EQ(takeCgCalls(), (Calls{cgCall("cgGetNamedParameter", PROGRAM, "image"),
                                    cgCall("cgGetNamedParameter", PROGRAM, "missing")}));
    EXPECT_EQ(table.getCgResourceType("image"), 13U);
    EXPECT_EQ(table.getCgResourceName(3), "image");
    EXPECT_EQ(table.getCgResourceName(13), "image");
    EXPECT_EQ(table.getCgResourceParam(3), IMAGE);
    EXPECT_EQ(table.getCgResourceParam("image"), IMAGE);
    EXPECT_EQ(table.getCgResourceType("missing"), 4U);
    EXPECT_EQ(table.getCgResourceParam("missing"), nullptr);

    cgAnswers.parameters["image"] = nullptr;
    table.setCgProgram(nullptr);
    EXPECT_EQ(table.getCgResourceParam("image"), IMAGE);
    EXPECT_EQ(takeCgCalls(), Calls{});
}

TEST_F(ResourceSlots, SameSlotIsFilledAnewByItsOtherCode) {
    CgResource table(16);
    table.setCgResource(12, "image");
    table.setCgResource(2, "key");
    EXPECT_EQ(table.getCgResourceObj(2).getType(), 2U);
    EXPECT_EQ(table.getCgResourceParam(12), KEY);
    EXPECT_EQ(table.getCgResourceType("image"), NO_TYPE);
    EXPECT_EQ(takeLog(), Log{notFound("image")});
}

TEST_F(ResourceSlots, LowestSlotWithTheExactNameAnswers) {
    CgResource table(3);
    EXPECT_EQ(table.getCgResourceType(""), 0U);
    EXPECT_EQ(table.getCgResourceParam(""), nullptr);
    table.setCgResource(2, "key");
    table.setCgResource(11, "key");
    EXPECT_EQ(table.getCgResourceType("key"), 11U);
    for (const std::string name : {"Key", "ke", "keys"}) {
        EXPECT_EQ(table.getCgResourceParam(name), nullptr);
        EXPECT_EQ(takeLog(), Log{notFound(name)});
    }
}

TEST_F(ResourceSlots, NameIsAnsweredFromTheSlotThatItsTypeCodeAddresses) {
    CgResource table(4);
    table.setCgResource(1, "image");
    table.setCgResource(2, "key");
    table.getCgResourceObj(1).setType(12);
    EXPECT_EQ(table.getCgResourceParam("image"), KEY);
}

TEST_F(ResourceSlots, TableWithoutSlotsFindsNothing) {
    CgResource table;
    EXPECT_EQ(table.getCgResourceType(""), NO_TYPE);
    EXPECT_EQ(table.getCgResourceParam("image"), nullptr);
    EXPECT_EQ(takeLog(), (Log{notFound(""), notFound("image")}));
}

TEST_F(ResourceSlots, CodeWithoutASlotIsReportedAndChangesNothing) {
    CgResource table(2);
    table.setCgResource(2, "image");
    EXPECT_EQ(takeLog(), Log{noSlot("2", "2")});
    EXPECT_EQ(table.getCgResourceName(12), "");
    EXPECT_EQ(table.getCgResourceParam(26), nullptr);
    EXPECT_EQ(takeLog(), (Log{noSlot("12", "2"), noSlot("26", "2")}));
    EXPECT_EQ(takeCgCalls(), Calls{});

    CgResourceUnit& apart = table.getCgResourceObj(NO_TYPE);
    apart.setName("image");
    EXPECT_EQ(takeLog(), Log{noSlot("-1", "2")});
    EXPECT_EQ(table.getCgResourceType("image"), NO_TYPE);
    EXPECT_EQ(takeLog(), Log{notFound("image")});
    EXPECT_EQ(table.getCgResourceName(2), "");
    EXPECT_EQ(takeLog(), Log{noSlot("2", "2")});
}

TEST_F(ResourceSlots, CopiesHaveSlotsOfTheirOwn) {
    CgResource source(2);
    source.setCgProgram(PROGRAM);
    source.setCgResource(1, "image");
    CgResource copy(source);
    CgResource assigned(5);
    assigned = source;
    const CgResource& self = assigned;
    assigned = self;
    copy.setCgResource(1, "key");
    EXPECT_EQ(source.getCgResourceParam("image"), IMAGE);
    EXPECT_EQ(assigned.getCgResourceParam("image"), IMAGE);
    EXPECT_EQ(assigned.getCGProgram(), PROGRAM);
    EXPECT_EQ(copy.getCgResourceParam("key"), KEY);
    assigned.setCgResource(4, "key");
    EXPECT_EQ(takeLog(), Log{noSlot("4", "2")});
}

TEST_F(ResourceSlots, UnitHoldsTypeNameAndHandle) {
    EXPECT_EQ(CgResourceUnit().getType(), 0U);
    CgResourceUnit unit(7);
    EXPECT_EQ(unit.getType(), 7U);
    EXPECT_EQ(unit.getName(), "");
    EXPECT_EQ(unit.getParam(), nullptr);
    unit.setType(8);
    unit.setName("image");
    unit.setParam(IMAGE);
    CgResourceUnit copy;
    copy = unit;
    unit.setName("key");
    EXPECT_EQ(copy.getType(), 8U);
    EXPECT_EQ(copy.getName(), "image");
    EXPECT_EQ(copy.getParam(), IMAGE);
}

} // namespace
