#include <FwZel/Shader.h>

#include <FwZel/kxsys_syslog.h>

#include <Cg/cgGL.h>

#include <boost/make_shared.hpp>

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <utility>

namespace {

struct ProfileName {
    CGprofile profile;
    const char* name;
};

constexpr ProfileName PROFILE_NAMES[] = {
    {CG_PROFILE_UNKNOWN, "CG_PROFILE_UNKNOWN"},
    {CG_PROFILE_VP20, "CG_PROFILE_VP20"},
    {CG_PROFILE_FP20, "CG_PROFILE_FP20"},
    {CG_PROFILE_VP30, "CG_PROFILE_VP30"},
    {CG_PROFILE_FP30, "CG_PROFILE_FP30"},
    {CG_PROFILE_ARBVP1, "CG_PROFILE_ARBVP1"},
    {CG_PROFILE_FP40, "CG_PROFILE_FP40"},
    {CG_PROFILE_VS_1_1, "CG_PROFILE_VS_1_1"},
    {CG_PROFILE_VS_2_0, "CG_PROFILE_VS_2_0"},
    {CG_PROFILE_VS_2_X, "CG_PROFILE_VS_2_X"},
    {CG_PROFILE_VS_2_SW, "CG_PROFILE_VS_2_SW"},
    {CG_PROFILE_VS_3_0, "CG_PROFILE_VS_3_0"},
    {CG_PROFILE_HLSLV, "CG_PROFILE_HLSLV"},
    {CG_PROFILE_PS_1_1, "CG_PROFILE_PS_1_1"},
    {CG_PROFILE_PS_1_2, "CG_PROFILE_PS_1_2"},
    {CG_PROFILE_PS_1_3, "CG_PROFILE_PS_1_3"},
    {CG_PROFILE_PS_2_0, "CG_PROFILE_PS_2_0"},
    {CG_PROFILE_PS_2_X, "CG_PROFILE_PS_2_X"},
    {CG_PROFILE_PS_2_SW, "CG_PROFILE_PS_2_SW"},
    {CG_PROFILE_PS_3_0, "CG_PROFILE_PS_3_0"},
    {CG_PROFILE_HLSLF, "CG_PROFILE_HLSLF"},
    {CG_PROFILE_VS_4_0, "CG_PROFILE_VS_4_0"},
    {CG_PROFILE_PS_4_0, "CG_PROFILE_PS_4_0"},
    {CG_PROFILE_GS_4_0, "CG_PROFILE_GS_4_0"},
    {CG_PROFILE_VS_5_0, "CG_PROFILE_VS_5_0"},
    {CG_PROFILE_PS_5_0, "CG_PROFILE_PS_5_0"},
    {CG_PROFILE_GS_5_0, "CG_PROFILE_GS_5_0"},
    {CG_PROFILE_HS_5_0, "CG_PROFILE_HS_5_0"},
    {CG_PROFILE_DS_5_0, "CG_PROFILE_DS_5_0"},
    {CG_PROFILE_ARBFP1, "CG_PROFILE_ARBFP1"},
    {CG_PROFILE_VP40, "CG_PROFILE_VP40"},
    {CG_PROFILE_GENERIC, "CG_PROFILE_GENERIC"},
    {CG_PROFILE_GLSLV, "CG_PROFILE_GLSLV"},
    {CG_PROFILE_GLSLF, "CG_PROFILE_GLSLF"},
    {CG_PROFILE_GLSLC, "CG_PROFILE_GLSLC"},
    {CG_PROFILE_GPU_FP, "CG_PROFILE_GPU_FP or CG_PROFILE_GP4FP"},
    {CG_PROFILE_GPU_VP, "CG_PROFILE_GPU_VP or CG_PROFILE_GP4VP"},
    {CG_PROFILE_GPU_GP, "CG_PROFILE_GPU_GP or CG_PROFILE_GP4GP"},
    {CG_PROFILE_GLSLG, "CG_PROFILE_GLSLG"},
    {CG_PROFILE_GP5FP, "CG_PROFILE_GP5FP"},
    {CG_PROFILE_GP5VP, "CG_PROFILE_GP5VP"},
    {CG_PROFILE_GP5GP, "CG_PROFILE_GP5GP"},
    {CG_PROFILE_GP5TCP, "CG_PROFILE_GP5TCP"},
    {CG_PROFILE_GP5TEP, "CG_PROFILE_GP5TEP"},
};

} // namespace

bool Shader::mIsFirstTime = true;
CGcontext Shader::mCgContext = nullptr;
CGprofile Shader::mCgVertexProfile{};
CGprofile Shader::mCgFragmentProfile{};

Shader::Shader() : Shader(TYPE_VERTEX, "Cg/vertex.cg", "Cg_Main") {}

Shader::Shader(ShaderType type, std::string progName, std::string entName)
    : mCgProfile{}, mType(type), mProgramName(std::move(progName)), mProgramEntryName(std::move(entName)),
      mCgProgram(nullptr) {
    init();
}

Shader::~Shader() = default;

void Shader::init() {
    if (mIsFirstTime) {
        initCgContext();
        initVertexCgProfile();
        initFragmentCgProfile();
        mIsFirstTime = false;
    }
    initCg();
}

void Shader::initCg() {
    mCgProfile = mType == TYPE_VERTEX ? mCgVertexProfile : mCgFragmentProfile;
    mCgProgram = cgCreateProgramFromFile(mCgContext, CG_SOURCE, mProgramName.c_str(), mCgProfile,
                                         mProgramEntryName.c_str(), nullptr);
    if (!mCgProgram) {
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 451: Shader::initCg(): Program Err. \n");
        return;
    }
    mCgParam.setCgProgram(mCgProgram);
    cgGLLoadProgram(mCgProgram);
}

void Shader::initCgContext() {
    mCgContext = cgCreateContext();
    checkForCgError("Graphics::cgCreateContext()");
}

void Shader::initVertexCgProfile() {
    mCgVertexProfile = cgGLGetLatestProfile(CG_GL_VERTEX);
    checkForCgError("Shader::cgGLGetLatestProfile(CG_GL_VERTEX)");
    cgGLSetOptimalOptions(mCgVertexProfile);
}

void Shader::initFragmentCgProfile() {
    mCgFragmentProfile = cgGLGetLatestProfile(CG_GL_FRAGMENT);
    checkForCgError("Shader::cgGLGetLatestProfile(CG_GL_FRAGMENT)");
    cgGLSetOptimalOptions(mCgFragmentProfile);
}

void Shader::checkForCgError(std::string /*situation*/) {
    CGerror error = CG_NO_ERROR;
    cgGetLastErrorString(&error);
    if (error == CG_NO_ERROR)
        return;
    if (error == CG_COMPILER_ERROR)
        kxsys_syslog(KXSYS_LOG_ERROR, "GPUR 452: %s\n", cgGetLastListing(mCgContext));
    std::exit(1);
}

void Shader::enableProfile() {
    cgGLEnableProfile(mCgProfile);
}

void Shader::disableProfile() {
    cgGLDisableProfile(mCgProfile);
}

void Shader::bindProgram() {
    cgGLBindProgram(mCgProgram);
}

void Shader::createCgResource(int num) {
    mCgResource = boost::make_shared<CgResource>(static_cast<uint32_t>(std::max(num, 0)));
    mCgResource->setCgProgram(mCgProgram);
}

void Shader::setCgResource(uint32_t type, std::string name) {
    if (mCgResource)
        mCgResource->setCgResource(type, std::move(name));
    else
        kxsys_syslog(KXSYS_LOG_ERROR, "Shader::setCgResource(): no resource slots!!, Does nothing\n");
}

CGparameter Shader::getCgResourceParam(std::string name) const {
    if (mCgResource)
        return mCgResource->getCgResourceParam(std::move(name));
    kxsys_syslog(KXSYS_LOG_ERROR, "Shader::getCgResourceParam(): no resource slots!!, Does nothing\n");
    return nullptr;
}

void Shader::addCgParam(std::string name, uint32_t type, uint32_t size) {
    mCgParam.addCgParam(std::move(name), type, size);
}

void Shader::addCgParam(std::string name, uint32_t type, uint32_t size, const float* value) {
    mCgParam.addCgParam(std::move(name), type, size, value);
}

void Shader::addCgParam(std::string name, uint32_t type, uint32_t size, float v0, float v1, float v2,
                        float v3) {
    mCgParam.addCgParam(std::move(name), type, size, v0, v1, v2, v3);
}

void Shader::getNamedCgParameterAll() {
    mCgParam.getNamedCgParameterAll();
}

void Shader::setCgParamValue(std::string name, const float* value) {
    mCgParam.stage(name, value);
}

void Shader::setCgParamValue(std::string name, float v0, float v1, float v2, float v3) {
    mCgParam.stage(name, v0, v1, v2, v3);
}

void Shader::setCgParam(std::string name) {
    mCgParam.setCgParam(std::move(name));
}

void Shader::setCgParam(std::string name, const float* value) {
    mCgParam.setCgParam(std::move(name), value);
}

void Shader::setCgParam(std::string name, float v0, float v1, float v2, float v3) {
    mCgParam.setCgParam(std::move(name), v0, v1, v2, v3);
}

void Shader::setCgParamAll() {
    mCgParam.setCgParamAll();
}

std::string Shader::getCgProfileString(CGprofile prof) {
    const auto* const known = std::find_if(std::begin(PROFILE_NAMES), std::end(PROFILE_NAMES),
                                           [&](const ProfileName& row) { return row.profile == prof; });
    return known == std::end(PROFILE_NAMES) ? "error" : known->name;
}
