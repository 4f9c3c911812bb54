#include <fixture/CapturedLog.h>
#include <fixture/KeptLibraries.h>
#include <fixture/TemporaryFile.h>
#include <fixture/TexArgs.h>

#include <FrameLoop.h>
#include <HeadlessSurface.h>
#include <RendererApplication.h>

#include <FwZel/Shader.h>
#include <FwZel/Texture.h>
#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <gtest/gtest.h>

#include <epoxy/gl.h>

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <deque>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>

namespace {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool IS_MEMORY_STEADY = false; // the sanitizer keeps what is freed
#else
constexpr bool IS_MEMORY_STEADY = true;
#endif

/// KiB that the process has in memory.
long residentMemory() {
    long total = 0;
    long resident = 0;
    std::ifstream("/proc/self/statm") >> total >> resident;
    return resident * (sysconf(_SC_PAGESIZE) / 1024);
}

long openDescriptors() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/fd"),
                         std::filesystem::directory_iterator());
}

/// A renderer that makes a texture for every frame, of one kind after the other, and draws it with programs
/// and shapes that it made once. An error of OpenGL's ends it.
class LongRunApplication : public host::RendererApplication {
public:
    LongRunApplication(host::Surface& surface, int warmUpFrames)
        : RendererApplication(surface,
                              {host::GlFeature::UPLOAD_BUFFERS, host::GlFeature::VERTEX_LISTS,
                               host::GlFeature::CG_PROGRAMS, host::GlFeature::HALF_FLOATS},
                              100),
          mWarmUpFrames(warmUpFrames) {}

    void onEvent(host::SurfaceEvent /*event*/) override {}

    long memoryAfterWarmUp() const { return mMemoryAfterWarmUp; }
    long descriptorsAfterWarmUp() const { return mDescriptorsAfterWarmUp; }
    int wrongFrames() const { return mWrongFrames; }

protected:
    void build() override {
        mPlane.emplace(2U, 2U, 1.0F, nullptr);
        mBox.emplace(nullptr, -0.5F, 0.5F, -0.5F, 0.5F);
        for (const char* const component : {"r", "g", "b"}) {
            const TemporaryFile file(
                "program.cg",
                bytesOf(std::string("float4 Cg_Main(float2 place : TEXCOORD0, uniform float gain,"
                                    " uniform sampler2D picture : TEXUNIT0) : COLOR"
                                    " { float c = tex2D(picture, place).a * gain;"
                                    " float4 result = float4(0, 0, 0, 1); result.") +
                        component + " = c; return result; }"));
            mPrograms.emplace_back(Shader::TYPE_FRAGMENT, file.path(), "Cg_Main");
            mPrograms.back().addCgParam("gain", 0, 1);
            mPrograms.back().getNamedCgParameterAll();
        }
    }
    void release() override {
        mPicture.reset();
        mPlane.reset();
        mBox.reset();
    }
    void upload(int frame) override {
        const auto number = static_cast<uint32_t>(frame);
        Texture::TexArgs args = texArgs(8 + number % 3 * 8, 8 + number % 2 * 8);
        args.isPBO = number % 2 != 0;
        args.isMipMapped = number % 3 == 0;
        args.isFBO = number % 5 == 0;
        args.isFp16 = number % 7 == 0 && !args.isPBO;
        mPicture.emplace(uint32_t{VideoTestImage::COLOUR_MAT_WHITE}, args);
        if (args.isPBO) {
            mPicture->copyHostBufToPBO(0);
            mPicture->copyHostBufToGLTex(0);
            mPicture->copyPBOToGLTex(0);
        } else {
            mPicture->copyHostBufToGLTex(0);
        }
    }
    void draw(int frame) override {
        Shader& program = mPrograms[programOf(frame)];
        program.bindProgram();
        program.enableProfile();
        program.setCgParam("gain", 1, 0, 0, 0);
        glBindTexture(GL_TEXTURE_2D, mPicture->getGLTexID(0));
        mPlane->render();
        glBindTexture(GL_TEXTURE_2D, 0);
        program.disableProfile();
        mBox->setStartX(-0.5F + static_cast<float>(frame % 10) / 100);
        mBox->updateVertexData();
        mBox->render();
    }
    bool isFrameWanted() const override { return true; }
    void takeFrame(int frame, const std::vector<unsigned char>& pixels) override {
        std::array<unsigned char, 4> corner = {0, 0, 0, 255};
        corner[programOf(frame)] = 255;
        mWrongFrames += !std::equal(corner.begin(), corner.end(), pixels.begin());
    }
    void endFrame(int frame) override {
        if (frame != mWarmUpFrames)
            return;
        mMemoryAfterWarmUp = residentMemory();
        mDescriptorsAfterWarmUp = openDescriptors();
    }

private:
    size_t programOf(int frame) const { return static_cast<size_t>(frame) % mPrograms.size(); }

    int mWarmUpFrames;
    std::optional<Texture> mPicture;
    std::optional<VertexListPlane> mPlane;
    std::optional<VertexListBox> mBox;
    std::deque<Shader> mPrograms;
    long mMemoryAfterWarmUp = 0;
    long mDescriptorsAfterWarmUp = 0;
    int mWrongFrames = 0;
};

TEST(LongRun, MemoryAndDescriptorsStayWhatTheyAreAfterWarmUp) {
    const char* const asked = std::getenv("FWZEL_TEST_FRAMES");
    const int frames = asked ? std::atoi(asked) : 2000;
    ASSERT_GE(frames, 400) << "FWZEL_TEST_FRAMES: a number of frames of which the first quarter is a warm-up";
    std::optional<host::HeadlessSurface> surface;
    try {
        surface.emplace(16U, 16U);
    } catch (const std::runtime_error& error) {
        if (std::getenv("CI"))
            FAIL() << error.what();
        GTEST_SKIP() << error.what();
    }
    keepLibraries();
    LongRunApplication application(*surface, frames / 4);
    EXPECT_EQ(host::FrameLoop(application, *surface, {frames, 0}).run(0, nullptr), frames);
    const long grown = residentMemory() - application.memoryAfterWarmUp();
    std::printf("%d frames, %ld KiB after the first quarter, %ld more at the end\n", frames,
                application.memoryAfterWarmUp(), grown);
    if (IS_MEMORY_STEADY) {
        EXPECT_LE(grown, 1024);
    }
    EXPECT_EQ(openDescriptors(), application.descriptorsAfterWarmUp());
    EXPECT_EQ(application.wrongFrames(), 0);
    EXPECT_EQ(takeLog(), std::vector<LogMessage>{});
}

} // namespace
