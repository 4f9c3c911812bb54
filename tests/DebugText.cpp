#include <FwZel/FWDebugFont.h>

#include <fixture/GlCallRecorder.h>
#include <fixture/GlTest.h>

#include <cstdlib>

namespace {

class DebugText : public GlTest {
protected:
    void SetUp() override {
        GlTest::SetUp();
        if (IsSkipped() || HasFatalFailure())
            return;
        FWDebugFont::setScreenRes(480, 270);
        FWDebugFont::setPosition(0, 0);
    }
};

/// @return what vasprintf returned; the text goes to text
int format(std::string& text, const char* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    char* formatted = nullptr;
    const int length = FWDebugFont::my_vsprintf(&formatted, format, arguments);
    va_end(arguments);
    if (length >= 0)
        text = formatted;
    std::free(formatted);
    return length;
}

TEST_F(DebugText, LinesStepDownTheScreenFromTheTopLeft) {
    GlCallRecorder recorder;
    recorder.watch<epoxy_glRasterPos3f>("glRasterPos3f");
    FWDebugFont::setPos();
    FWDebugFont::setPos();
    FWDebugFont::setPosition(240, 135);
    FWDebugFont::setPos();
    FWDebugFont::setScreenRes(1920, 1080);
    FWDebugFont::setPosition(1920, 1080);
    FWDebugFont::setPos();
    const std::vector<std::string> expected = {
        glCall("glRasterPos3f", -4.0F, 4.0F, -10.0F),
        glCall("glRasterPos3f", -4.0F, -(24.0F * 4.0F / 270.0F - 4.0F), -10.0F),
        glCall("glRasterPos3f", 0.0F, -0.0F, -10.0F),
        glCall("glRasterPos3f", 4.0F, -4.0F, -10.0F),
    };
    EXPECT_EQ(recorder.take(), expected);
    EXPECT_EQ(FWDebugFont::mPosY, 1092.0F);
    EXPECT_EQ(FWDebugFont::mX, 4.0F);
    EXPECT_EQ(FWDebugFont::mY, -4.0F);
}

TEST_F(DebugText, ColourBecomesTheCurrentColour) {
    FWDebugFont::setColor(0.25F, 0.5F, 0.75F, 1.0F);
    float colour[4] = {};
    glGetFloatv(GL_CURRENT_COLOR, colour);
    EXPECT_EQ(std::vector<float>(colour, colour + 4), (std::vector<float>{0.25F, 0.5F, 0.75F, 1.0F}));
}

TEST_F(DebugText, PrintfDrawsNothingAndLeavesTheCursor) {
    testing::internal::CaptureStdout();
    FWDebugFont::printf("%d frames", 25);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
    EXPECT_EQ(FWDebugFont::mPosX, 0.0F);
    EXPECT_EQ(FWDebugFont::mPosY, 0.0F);
}

TEST_F(DebugText, FormattingAllocatesAsMuchAsTheTextNeeds) {
    std::string text;
    EXPECT_EQ(format(text, "%s: %d", std::string(1000, 'x').c_str(), -42), 1005);
    EXPECT_EQ(text, std::string(1000, 'x') + ": -42");
    // No wide character beyond the C locale's can be converted.
    EXPECT_EQ(format(text, "%ls", L"\x1F600"), -1);
}

} // namespace
