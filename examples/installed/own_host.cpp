// A host outside FwZel's tree; it asks for nothing that needs OpenGL.
// Without CMake: c++ -std=c++17 own_host.cpp $(pkg-config --cflags --libs fwzel)

#include <Cg/cg.h>
#include <FwZel/CgResource.h>
#include <FwZel/FwZel.h>
#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>
#include <FwZel/kxsys_syslog.h>

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <vector>

/// What the library has to report. It is defined here, in the program, for libFwZel.so to find.
extern "C" __attribute__((visibility("default"))) void kxsys_syslog(int level, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    std::printf("log, level %d: ", level);
    std::vprintf(format, arguments);
    va_end(arguments);
}

class OwnHost : public FwZel {
public:
    bool onInit(int, char**) override {
        VideoTestImage::fillTestPattern(mPicture.data(), VideoTestImage::COL_RGBA, WIDTH, HEIGHT, WIDTH,
                                        VideoTestImage::COLOUR_BAR_75, 2, 0, 0, WIDTH, HEIGHT, false);
        const unsigned char* const pixel = mPicture.data() + (HEIGHT / 2 * WIDTH + WIDTH / 2) * 4;
        std::printf("%s: %d %d %d in the middle\n", findTestPattern(VideoTestImage::COLOUR_BAR_75)->name,
                    pixel[0], pixel[1], pixel[2]);
        return true;
    }

private:
    static constexpr uint32_t WIDTH = 1920;
    static constexpr uint32_t HEIGHT = 1080;

    std::vector<unsigned char> mPicture = std::vector<unsigned char>(size_t{WIDTH} * HEIGHT * 4);
};

int main(int argc, char** argv) {
    OwnHost host;
    const bool isReady = FwZel::getFwZel()->onInit(argc, argv);
    std::printf("Cg programs are compiled for %s\n", cgGetProfileString(CG_PROFILE_GLSLF));
    CgResource().getCgResourceType("picture"); // of no program: the library says so
    host.onShutdown();
    return isReady ? 0 : 1;
}
