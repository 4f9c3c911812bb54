#include <FwZel/CgParam.h>

#include <fixture/CgCalls.h>

#include <gtest/gtest.h>

#include <array>
#include <type_traits>

namespace {

using Calls = std::vector<std::string>;
using Floats = std::vector<float>;

constexpr uint32_t MATRIX = 14;
constexpr std::array<float, 16> COUNTING = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16};

auto* const PROGRAM = handleNumber<CGprogram>(1);
auto* const GAIN = handleNumber<CGparameter>(2);
auto* const LIFT = handleNumber<CGparameter>(3);

class ShaderParameters : public ::testing::Test {
protected:
    void SetUp() override {
        cgAnswers = {};
        cgAnswers.parameters = {{"gain", GAIN}, {"lift", LIFT}};
        takeCgCalls();
    }

    static Floats staged(CgParam& params, const std::string& name) {
        const float* const value = params.getCgParamValue(name);
        return {value, value + params.getCgParamTotalSize(name)};
    }
};

struct TypeCode {
    uint32_t type;
    uint32_t floats;
    std::string sent;
};

class EveryTypeCode : public ShaderParameters, public ::testing::WithParamInterface<TypeCode> {};

TEST_P(EveryTypeCode, HasItsFloatsAndItsSetter) {
    const auto& [type, floats, sent] = GetParam();
    CgParam params;
    params.setCgProgram(PROGRAM);
    params.addCgParam("gain", type, 1);
    EXPECT_EQ(params.getCgParamName("gain"), "gain");
    EXPECT_EQ(params.getCgParamType("gain"), type);
    EXPECT_EQ(params.getCgParamSize("gain"), 1U);
    EXPECT_EQ(params.getCgParamParam("gain"), nullptr);
    EXPECT_EQ(staged(params, "gain"), Floats(floats));
    EXPECT_EQ(params.getNamedCgParameter("gain"), GAIN);
    EXPECT_EQ(takeCgCalls(), Calls{cgCall("cgGetNamedParameter", PROGRAM, "gain")});
    params.setCgParam("gain", COUNTING.data());
    EXPECT_EQ(takeCgCalls(), Calls{sent});

    for (const uint32_t size : {0U, 2U, 7U}) {
        const std::string name = "array" + std::to_string(size);
        params.addCgParam(name, type, size);
        EXPECT_EQ(params.getCgParamTotalSize(name), size * floats);
        params.setCgParam(name);
    }
    params.setCgParamAll();
    EXPECT_EQ(takeCgCalls(), Calls{sent});
}

const std::string FOUR = cgCall("cgGLSetParameter4fv", GAIN, 1.0F, 2.0F, 3.0F, 4.0F);

INSTANTIATE_TEST_SUITE_P(
    ShaderParameters, EveryTypeCode,
    ::testing::Values(TypeCode{0, 1, cgCall("cgGLSetParameter1fv", GAIN, 1.0F)},
                      TypeCode{1, 1, cgCall("cgGLSetParameter1fv", GAIN, 1.0F)},
                      TypeCode{2, 2, cgCall("cgGLSetParameter2fv", GAIN, 1.0F, 2.0F)},
                      TypeCode{3, 3, cgCall("cgGLSetParameter3fv", GAIN, 1.0F, 2.0F, 3.0F)},
                      TypeCode{4, 4, FOUR}, TypeCode{5, 4, FOUR}, TypeCode{13, 4, FOUR},
                      TypeCode{MATRIX, 16,
                               cgCall("cgGLSetMatrixParameterfr", GAIN, 1.0F, 2.0F, 3.0F, 4.0F, 5.0F, 6.0F,
                                      7.0F, 8.0F, 9.0F, 10.0F, 11.0F, 12.0F, 13.0F, 14.0F, 15.0F, 16.0F)},
                      TypeCode{15, 4, FOUR}, TypeCode{0xFFFFFFFF, 4, FOUR}),
    [](const auto& row) { return "Code" + std::to_string(row.param.type); });

TEST_F(ShaderParameters, SecondDeclarationKeepsTheEntryAndStagesItsValue) {
    CgParam params;
    params.addCgParam("gain", 1, 1, 0.5F, 0, 0, 0);
    params.getNamedCgParameterAll();
    params.addCgParam("gain", 4, 1);
    EXPECT_EQ(staged(params, "gain"), Floats{0.5F});
    params.addCgParam("gain", 4, 1, 1, 2, 3, 4);
    EXPECT_EQ(params.getCgParamType("gain"), 1U);
    EXPECT_EQ(params.getCgParamParam("gain"), GAIN);
    EXPECT_EQ(staged(params, "gain"), Floats{1});
    params.addCgParam("gain", 4, 2, &COUNTING[4]);
    EXPECT_EQ(staged(params, "gain"), Floats{5});
}

TEST_F(ShaderParameters, StagingSendsNothingUntilAsked) {
    CgParam params;
    params.addCgParam("gain", 2, 1);
    params.getNamedCgParameterAll();
    takeCgCalls();
    params.setCgParamValue("gain", 1, 2, 3, 4);
    params.setCgParamValue("gain", &COUNTING[6]);
    EXPECT_EQ(takeCgCalls(), Calls{});
    params.setCgParam("gain");
    params.setCgParam("gain", 3, 4, 5, 6);
    params.getCgParamValue("gain")[0] = -1;
    params.setCgParamAll();
    EXPECT_EQ(takeCgCalls(), (Calls{cgCall("cgGLSetParameter2fv", GAIN, 7.0F, 8.0F),
                                    cgCall("cgGLSetParameter2fv", GAIN, 3.0F, 4.0F),
                                    cgCall("cgGLSetParameter2fv", GAIN, -1.0F, 4.0F)}));
}

TEST_F(ShaderParameters, FourFloatsLeaveTheRestOfALargerEntry) {
    CgParam params;
    params.addCgParam("matrix", MATRIX, 1, COUNTING.data());
    params.setCgParamValue("matrix", -1, -2, -3, -4);
    EXPECT_EQ(staged(params, "matrix"), (Floats{-1, -2, -3, -4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}));
    params.addCgParam("empty", 4, 0, 1, 2, 3, 4);
    EXPECT_EQ(params.getCgParamTotalSize("empty"), 0U);
}

TEST_F(ShaderParameters, AllAreVisitedInTheOrderOfTheirBytes) {
    CgParam params;
    params.setCgProgram(PROGRAM);
    const std::vector<std::string> names = {"B", "a", "ab", "b", "\x80"};
    for (const size_t i : {4U, 3U, 1U, 2U, 0U}) {
        cgAnswers.parameters[names[i]] = handleNumber<CGparameter>(10 + i);
        params.addCgParam(names[i], 1, 1);
    }
    Calls resolved;
    Calls sent;
    for (size_t i = 0; i < names.size(); ++i) {
        resolved.push_back(cgCall("cgGetNamedParameter", PROGRAM, names[i].c_str()));
        sent.push_back(cgCall("cgGLSetParameter1fv", handleNumber<CGparameter>(10 + i), 0.0F));
    }
    params.getNamedCgParameterAll();
    EXPECT_EQ(takeCgCalls(), resolved);
    params.setCgParamAll();
    EXPECT_EQ(takeCgCalls(), sent);
}

TEST_F(ShaderParameters, ResolvingAgainReplacesTheHandleEvenByNull) {
    CgParam params;
    params.addCgParam("gain", 1, 1);
    params.setCgParam("gain");
    EXPECT_EQ(takeCgCalls(), Calls{cgCall("cgGLSetParameter1fv", nullptr, 0.0F)});
    params.getNamedCgParameterAll();
    params.setCgProgram(PROGRAM);
    EXPECT_EQ(params.getCgParamParam("gain"), GAIN);
    cgAnswers.parameters["gain"] = nullptr;
    EXPECT_EQ(params.getNamedCgParameter("gain"), nullptr);
    EXPECT_EQ(params.getCgParamParam("gain"), nullptr);
}

TEST_F(ShaderParameters, UndeclaredNameTouchesNothing) {
    CgParam params;
    params.addCgParam("gains", 1, 1);
    params.setCgParamValue("gain", COUNTING.data());
    params.setCgParamValue("gain", 1, 2, 3, 4);
    params.setCgParam("gain");
    params.setCgParam("gain", COUNTING.data());
    params.setCgParam("gain", 1, 2, 3, 4);
    EXPECT_EQ(params.getNamedCgParameter("gain"), nullptr);
    EXPECT_EQ(params.getCgParamName("gain"), "");
    EXPECT_EQ(params.getCgParamParam("gain"), nullptr);
    EXPECT_EQ(params.getCgParamType("gain"), 0U);
    EXPECT_EQ(params.getCgParamSize("gain"), 0U);
    EXPECT_EQ(params.getCgParamTotalSize("gain"), 0U);
    EXPECT_EQ(params.getCgParamValue("gain"), nullptr);
    EXPECT_EQ(takeCgCalls(), Calls{});
    EXPECT_EQ(staged(params, "gains"), Floats{0});
}

TEST_F(ShaderParameters, CopiesShareHandlesAndNoValues) {
    CgParam source;
    source.setCgProgram(PROGRAM);
    source.addCgParam("gain", 2, 1, 1, 2, 0, 0);
    source.getNamedCgParameterAll();
    CgParam copy(source);
    CgParam assigned;
    assigned.addCgParam("lift", 1, 1);
    assigned = source;
    const CgParam& self = assigned;
    assigned = self;
    copy.setCgParamValue("gain", 3, 4, 0, 0);
    EXPECT_EQ(staged(source, "gain"), (Floats{1, 2}));
    EXPECT_EQ(staged(assigned, "gain"), (Floats{1, 2}));
    EXPECT_EQ(assigned.getCgParamParam("gain"), GAIN);
    EXPECT_EQ(assigned.getCgParamName("lift"), "");
    takeCgCalls();
    copy.getNamedCgParameter("gain");
    EXPECT_EQ(takeCgCalls(), Calls{cgCall("cgGetNamedParameter", PROGRAM, "gain")});
}

TEST_F(ShaderParameters, UnitTakesShapeAndValueByAssignment) {
    CgParamUnit unit("gain", 3, 2, COUNTING.data());
    unit.setParam(GAIN);
    CgParamUnit other;
    EXPECT_EQ(other.getName(), "");
    EXPECT_EQ(other.getTotalSize(), 0U);
    other = unit;
    unit.setValue(&COUNTING[10]);
    EXPECT_EQ(other.getName(), "gain");
    EXPECT_EQ(other.getParam(), GAIN);
    EXPECT_EQ(other.getType(), 3U);
    EXPECT_EQ(other.getSize(), 2U);
    EXPECT_EQ(Floats(other.getValue(), other.getValue() + other.getTotalSize()), (Floats{1, 2, 3, 4, 5, 6}));
    EXPECT_EQ(Floats(unit.getValue(), unit.getValue() + 6), (Floats{11, 12, 13, 14, 15, 16}));
}

} // namespace
