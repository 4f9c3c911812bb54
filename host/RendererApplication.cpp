#include "RendererApplication.h"

#include "GlErrors.h"

#include <epoxy/gl.h>

#include <stdexcept>
#include <string>

namespace host {

RendererApplication::RendererApplication(Surface& surface, const std::vector<GlFeature>& features,
                                         int statisticsWindow)
    : mSurface(surface), mFeatures(features), mTimes(statisticsWindow) {}

bool RendererApplication::onInit(int /*argc*/, char** /*ppArgv*/) {
    requireGlFeatures(mFeatures);
    build();
    return true;
}

void RendererApplication::onShutdown() {
    release();
}

void RendererApplication::onRender(int frameIndex) {
    {
        const StageTimes::Measurement measurement(mTimes, Stage::UPLOAD);
        upload(frameIndex);
    }
    {
        const StageTimes::Measurement measurement(mTimes, Stage::DRAWING);
        mSurface.beginFrame();
        glClearColor(0, 0, 0, 1);
        glClear(GL_COLOR_BUFFER_BIT);
        draw(frameIndex);
    }
    if (isFrameWanted()) {
        const StageTimes::Measurement measurement(mTimes, Stage::READBACK);
        mSurface.readFrame(mPixels);
    }
    mTimes.endFrame();
    const std::vector<std::string> errors = takeGlErrors();
    if (!errors.empty())
        throw std::runtime_error("frame " + std::to_string(frameIndex) + ": OpenGL reports " +
                                 errors.front());
    if (isFrameWanted())
        takeFrame(frameIndex, mPixels);
    mSurface.present();
    endFrame(frameIndex);
}

void RendererApplication::onResize(int w, int h) {
    if (w <= 0 || h <= 0)
        return; // a window that is an icon
    const double halfHeight = static_cast<double>(h) / w;
    glMatrixMode(GL_PROJECTION);
    glLoadIdentity();
    glOrtho(-1, 1, -halfHeight, halfHeight, -1, 1);
    glMatrixMode(GL_MODELVIEW);
    glLoadIdentity();
}

void RendererApplication::onIdle() {
    constexpr double SHORT_WHILE = 0.002;
    mSurface.wait(SHORT_WHILE);
}

} // namespace host
