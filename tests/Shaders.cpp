#include <FwZel/Shader.h>
#include <FwZel/VertexListPlane.h>

#include <fixture/CgCalls.h>
#include <fixture/ChildProcess.h>
#include <fixture/FloatCanvas.h>
#include <fixture/GlTest.h>
#include <fixture/TemporaryFile.h>

#include <unistd.h>

#include <cstdlib>
#include <map>
#include <memory>
#include <sstream>

namespace {

using Calls = std::vector<std::string>;
using Log = std::vector<LogMessage>;

constexpr CGprofile VERTEX_PROFILE = CG_PROFILE_GLSLV;
constexpr CGprofile FRAGMENT_PROFILE = CG_PROFILE_GLSLF;
const char* const NO_SUCH_FILE = "no such file.cg";
auto* const PROGRAM = handleNumber<CGprogram>(1);
auto* const GAIN = handleNumber<CGparameter>(2);

const LogMessage PROGRAM_ERROR = {3, "GPUR 451: Shader::initCg(): Program Err. \n"};

/// Each test finds the class-wide state as it is when the library has just been loaded.
class Shaders : public GlTest {
protected:
    void SetUp() override {
        GlTest::SetUp();
        cgAnswers = {};
        Shader::mIsFirstTime = true;
        Shader::mCgContext = nullptr;
        Shader::mCgVertexProfile = {};
        Shader::mCgFragmentProfile = {};
        if (!IsSkipped())
            cgGetError();
        takeCgCalls();
    }
};

const std::string CHECK = cgCall("cgGetLastErrorString");

Calls setUpCalls() {
    return {cgCall("cgCreateContext"),
            CHECK,
            cgCall("cgGLGetLatestProfile", 8),
            CHECK,
            cgCall("cgGLSetOptimalOptions", 7007),
            cgCall("cgGLGetLatestProfile", 9),
            CHECK,
            cgCall("cgGLSetOptimalOptions", 7008)};
}

std::string creation(const char* file, CGprofile profile, const char* entry) {
    return cgCall("cgCreateProgramFromFile", Shader::getCgContext(), 4112, file, profile, entry, nullptr);
}

Calls operator+(Calls first, const Calls& second) {
    first.insert(first.end(), second.begin(), second.end());
    return first;
}

TEST_F(Shaders, FirstShaderCreatesWhatAllShare) {
    EXPECT_EQ(Shader::getCgContext(), nullptr);
    cgAnswers.program = PROGRAM;
    const Shader first;
    auto* const context = Shader::getCgContext();
    EXPECT_NE(context, nullptr);
    EXPECT_EQ(takeCgCalls(), (setUpCalls() + Calls{creation("Cg/vertex.cg", VERTEX_PROFILE, "Cg_Main"),
                                                   cgCall("cgGLLoadProgram", PROGRAM)}));

    const Shader second(Shader::TYPE_FRAGMENT, "host/../key.cg", "main");
    EXPECT_EQ(Shader::getCgContext(), context);
    EXPECT_EQ(takeCgCalls(), (Calls{creation("host/../key.cg", FRAGMENT_PROFILE, "main"),
                                    cgCall("cgGLLoadProgram", PROGRAM)}));
}

TEST_F(Shaders, EachIsSwitchedAndBoundInItsOwnProfile) {
    cgAnswers.program = PROGRAM;
    for (const auto& [type, profile] :
         {std::pair(Shader::TYPE_VERTEX, VERTEX_PROFILE), {Shader::TYPE_FRAGMENT, FRAGMENT_PROFILE}}) {
        Shader shader(type, "a.cg", "main");
        takeCgCalls();
        shader.enableProfile();
        shader.bindProgram();
        shader.disableProfile();
        EXPECT_EQ(takeCgCalls(),
                  (Calls{cgCall("cgGLEnableProfile", profile), cgCall("cgGLBindProgram", PROGRAM),
                         cgCall("cgGLDisableProfile", profile)}));
    }
}

TEST_F(Shaders, ProgramThatCannotBeCreatedIsLoggedAndStaysNull) {
    Shader shader(Shader::TYPE_VERTEX, NO_SUCH_FILE, "main");
    EXPECT_EQ(takeLog(), Log{PROGRAM_ERROR});
    EXPECT_EQ(takeCgCalls(), (setUpCalls() + Calls{creation(NO_SUCH_FILE, VERTEX_PROFILE, "main")}));

    shader.bindProgram();
    shader.addCgParam("gain", 1, 1);
    shader.getNamedCgParameterAll();
    shader.createCgResource(1);
    shader.setCgResource(0, "gain");
    EXPECT_EQ(takeCgCalls(),
              (Calls{cgCall("cgGLBindProgram", nullptr), cgCall("cgGetNamedParameter", nullptr, "gain"),
                     cgCall("cgGetNamedParameter", nullptr, "gain")}));
}

TEST_F(Shaders, DestructionAndLaterShadersLeaveWhatIsShared) {
    cgAnswers.program = PROGRAM;
    auto shader = std::make_unique<Shader>();
    auto* const context = Shader::getCgContext();
    shader->createCgResource(4);
    takeCgCalls();
    shader.reset();
    EXPECT_EQ(takeCgCalls(), Calls{});
    const Shader later;
    EXPECT_EQ(Shader::getCgContext(), context);
}

TEST_F(Shaders, SharedStateIsMadeAnewOnRequest) {
    cgAnswers.program = PROGRAM;
    const Shader shader;
    auto* const context = Shader::getCgContext();
    cgGetError(); // of loading a program that is none
    takeCgCalls();
    Shader::initCgContext();
    Shader::initVertexCgProfile();
    Shader::initFragmentCgProfile();
    EXPECT_EQ(takeCgCalls(), setUpCalls());
    EXPECT_NE(Shader::getCgContext(), context);
}

TEST_F(Shaders, ParametersAreForwardedToTheTableOfTheProgram) {
    cgAnswers.program = PROGRAM;
    cgAnswers.parameters = {{"gain", GAIN}};
    const float values[] = {5, 6, 7, 8};
    Shader shader;
    takeCgCalls();
    shader.addCgParam("gain", 2, 1);
    shader.addCgParam("gain", 1, 1, values);
    shader.getNamedCgParameterAll();
    EXPECT_EQ(takeCgCalls(), Calls{cgCall("cgGetNamedParameter", PROGRAM, "gain")});
    const auto sent = [](float x, float y) { return Calls{cgCall("cgGLSetParameter2fv", GAIN, x, y)}; };
    shader.setCgParam("gain");
    EXPECT_EQ(takeCgCalls(), sent(5, 6));
    shader.addCgParam("gain", 1, 1, 1, 2, 3, 4);
    shader.setCgParamAll();
    EXPECT_EQ(takeCgCalls(), sent(1, 2));
    shader.setCgParamValue("gain", &values[1]);
    shader.setCgParamAll();
    EXPECT_EQ(takeCgCalls(), sent(6, 7));
    shader.setCgParamValue("gain", 2, 3, 4, 5);
    shader.setCgParam("gain");
    EXPECT_EQ(takeCgCalls(), sent(2, 3));
    shader.setCgParam("gain", &values[2]);
    shader.setCgParam("gain", 8, 9, 10, 11);
    EXPECT_EQ(takeCgCalls(), sent(7, 8) + sent(8, 9));
}

TEST_F(Shaders, ResourceTableIsReplacedWithItsSlots) {
    cgAnswers.program = PROGRAM;
    cgAnswers.parameters = {{"gain", GAIN}};
    Shader shader;
    takeCgCalls();
    shader.createCgResource(16);
    shader.setCgResource(13, "gain");
    EXPECT_EQ(takeCgCalls(), Calls{cgCall("cgGetNamedParameter", PROGRAM, "gain")});
    EXPECT_EQ(shader.getCgResourceParam("gain"), GAIN);

    const Shader copy = shader;
    for (const int slots : {16, 0, -1}) {
        shader.createCgResource(slots);
        EXPECT_EQ(shader.getCgResourceParam("gain"), nullptr);
        EXPECT_EQ(takeLog(), (Log{{3, "GPUR 450: CgResource::getCgResourceType(gain) NOT found!!\n"}}));
    }
    EXPECT_EQ(copy.getCgResourceParam("gain"), GAIN);
}

TEST_F(Shaders, WithoutAResourceTableResourceOperationsAreReported) {
    cgAnswers.program = PROGRAM;
    Shader shader;
    takeCgCalls();
    shader.setCgResource(0, "gain");
    EXPECT_EQ(shader.getCgResourceParam("gain"), nullptr);
    EXPECT_EQ(takeLog(), (Log{{3, "Shader::setCgResource(): no resource slots!!, Does nothing\n"},
                              {3, "Shader::getCgResourceParam(): no resource slots!!, Does nothing\n"}}));
    EXPECT_EQ(takeCgCalls(), Calls{});
}

TEST_F(Shaders, PlaneIsDrawnByBothProgramsWithTheirParameters) {
    const TemporaryFile file("shaders.cg", bytesOf(R"(
        uniform float gain;
        void place(float4 position : POSITION, uniform float2 scale,
                   out float4 placed : POSITION, out float4 colour : COLOR) {
            placed = float4(position.xy * scale, position.zw);
            colour = float4(gain, 0, 0, 1);
        }
        float4 mixed(float4 colour : COLOR, uniform float4x4 mixing, uniform float3 lift) : COLOR {
            return gain * (mul(mixing, colour) + float4(lift, 0));
        })"));
    Shader vertex(Shader::TYPE_VERTEX, file.path(), "place");
    Shader fragment(Shader::TYPE_FRAGMENT, file.path(), "mixed");
    const float firstRowLast[] = {0, 0, 0, 1, 0, 1, 0, 0, 0, 0, 1, 0, 1, 0, 0, 0};
    vertex.addCgParam("gain", 1, 1, 0.25F, 0, 0, 0);
    vertex.addCgParam("scale", 2, 1, 2, 4, 0, 0);
    fragment.addCgParam("gain", 1, 1, 0.5F, 0, 0, 0);
    fragment.addCgParam("mixing", 14, 1, firstRowLast);
    fragment.addCgParam("lift", 3, 1, 0, 0.125F, 0.5F, 0);
    for (Shader* const shader : {&vertex, &fragment}) {
        shader->getNamedCgParameterAll();
        shader->setCgParamAll();
        shader->bindProgram();
        shader->enableProfile();
    }
    FloatCanvas canvas(4, 4);
    VertexListPlane plane(1, 1, 0.25F, &fragment);
    plane.render();
    vertex.disableProfile();
    fragment.disableProfile();
    EXPECT_EQ(canvas.pixels(), std::vector<Pixel>(16, Pixel{0.5F, 0.0625F, 0.25F, 0.125F}));
    EXPECT_EQ(cgGetError(), CG_NO_ERROR);
}

TEST_F(Shaders, ProfilesHaveTheNamesOfTheirEnumerators) {
    const std::map<int, std::string> names = {
        {6145, "CG_PROFILE_UNKNOWN"},
        {6146, "CG_PROFILE_VP20"},
        {6147, "CG_PROFILE_FP20"},
        {6148, "CG_PROFILE_VP30"},
        {6149, "CG_PROFILE_FP30"},
        {6150, "CG_PROFILE_ARBVP1"},
        {6151, "CG_PROFILE_FP40"},
        {6153, "CG_PROFILE_VS_1_1"},
        {6154, "CG_PROFILE_VS_2_0"},
        {6155, "CG_PROFILE_VS_2_X"},
        {6156, "CG_PROFILE_VS_2_SW"},
        {6157, "CG_PROFILE_VS_3_0"},
        {6158, "CG_PROFILE_HLSLV"},
        {6159, "CG_PROFILE_PS_1_1"},
        {6160, "CG_PROFILE_PS_1_2"},
        {6161, "CG_PROFILE_PS_1_3"},
        {6162, "CG_PROFILE_PS_2_0"},
        {6163, "CG_PROFILE_PS_2_X"},
        {6164, "CG_PROFILE_PS_2_SW"},
        {6165, "CG_PROFILE_PS_3_0"},
        {6166, "CG_PROFILE_HLSLF"},
        {6167, "CG_PROFILE_VS_4_0"},
        {6168, "CG_PROFILE_PS_4_0"},
        {6169, "CG_PROFILE_GS_4_0"},
        {6170, "CG_PROFILE_VS_5_0"},
        {6171, "CG_PROFILE_PS_5_0"},
        {6172, "CG_PROFILE_GS_5_0"},
        {6173, "CG_PROFILE_HS_5_0"},
        {6174, "CG_PROFILE_DS_5_0"},
        {7000, "CG_PROFILE_ARBFP1"},
        {7001, "CG_PROFILE_VP40"},
        {7002, "CG_PROFILE_GENERIC"},
        {7007, "CG_PROFILE_GLSLV"},
        {7008, "CG_PROFILE_GLSLF"},
        {7009, "CG_PROFILE_GLSLC"},
        {7010, "CG_PROFILE_GPU_FP or CG_PROFILE_GP4FP"},
        {7011, "CG_PROFILE_GPU_VP or CG_PROFILE_GP4VP"},
        {7012, "CG_PROFILE_GPU_GP or CG_PROFILE_GP4GP"},
        {7016, "CG_PROFILE_GLSLG"},
        {7017, "CG_PROFILE_GP5FP"},
        {7018, "CG_PROFILE_GP5VP"},
        {7019, "CG_PROFILE_GP5GP"},
        {7020, "CG_PROFILE_GP5TCP"},
        {7021, "CG_PROFILE_GP5TEP"},
    };
    for (int value = 0; value < 8192; ++value) {
        const auto name = names.find(value);
        EXPECT_EQ(Shader::getCgProfileString(static_cast<CGprofile>(value)),
                  name == names.end() ? "error" : name->second)
            << value;
    }
}

// --- Ends of the process

/// How a child process ended, with the messages that it logged: status, then a line each.
void reportAndLeave(int status, void* output) {
    std::ostringstream report;
    report << "exit " << status << '\n';
    for (const LogMessage& message : takeLog())
        report << message.level << ' ' << message.text;
    const std::string text = report.str();
    if (write(*static_cast<int*>(output), text.data(), text.size()) < 0)
        _exit(99);
    _exit(status);
}

/// Runs something in a child process and tells how it ended: by exit(), with its status and log, or not.
template <class Action>
std::string endOf(Action action) {
    const ChildRun child = runChild([&action](int output) {
        takeLog();
        on_exit(reportAndLeave, &output);
        action();
    });
    return child.text.empty() ? "did not exit" : child.text;
}

/// Leaves a compiler error, and a listing, in the runtime; returns the listing.
std::string failToCompile() {
    auto* const context = cgCreateContext();
    cgCreateProgram(context, CG_SOURCE, "float4 main( {", VERTEX_PROFILE, "main", nullptr);
    return cgGetLastListing(context);
}

void leaveAnotherError() {
    cgGLEnableProfile(CG_PROFILE_UNKNOWN);
}

TEST_F(Shaders, PendingCompilerErrorIsLoggedAndEndsTheProcess) {
    const std::string listing = failToCompile();
    EXPECT_NE(listing, "");
    EXPECT_EQ(endOf([] { const Shader shader; }), "exit 1\n3 GPUR 452: " + listing + "\n");
    EXPECT_EQ(endOf([] { Shader::checkForCgError("loading"); }), "exit 1\n3 GPUR 452: " + listing + "\n");
}

TEST_F(Shaders, AnyOtherPendingErrorEndsTheProcessSilently) {
    leaveAnotherError();
    EXPECT_EQ(endOf([] { const Shader shader; }), "exit 1\n");
    EXPECT_EQ(endOf([] { Shader::initCgContext(); }), "exit 1\n");
    EXPECT_EQ(endOf([] { Shader::checkForCgError("loading"); }), "exit 1\n");
    cgGetError();
    EXPECT_EQ(endOf([] { Shader::checkForCgError("loading"); }), "did not exit");
}

TEST_F(Shaders, ErrorOfEitherProfileEndsTheProcess) {
    for (const int kind : {CG_GL_VERTEX, CG_GL_FRAGMENT}) {
        EXPECT_EQ(endOf([&] {
                      cgAnswers.meanwhile = [&](const std::string& call) {
                          if (call == cgCall("cgGLGetLatestProfile", kind))
                              leaveAnotherError();
                      };
                      const Shader shader;
                  }),
                  "exit 1\n");
    }
}

TEST_F(Shaders, ErrorsOfEveryOtherOperationAreNotRead) {
    EXPECT_EQ(endOf([] {
                  cgAnswers.program = PROGRAM;
                  cgAnswers.meanwhile = [](const std::string& call) {
                      if (call.rfind("cgGLSetOptimalOptions(7008", 0) == 0 || call.rfind("cgGLLoad", 0) == 0)
                          cgGetNamedParameter(nullptr, "");
                  };
                  Shader first;
                  first.enableProfile();
                  first.bindProgram();
                  first.disableProfile();
                  const Shader second;
              }),
              "did not exit");
}

} // namespace
