#include "FrameLoop.h"

#include "RendererApplication.h"
#include "StopSignal.h"
#include "Surface.h"

#include <chrono>

namespace host {

namespace {

/// Unlike PerfMeasure's clock this one is never set.
double secondsNow() {
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count();
}

} // namespace

FrameLoop::FrameLoop(RendererApplication& application, Surface& surface, Limits limits)
    : mApplication(application), mSurface(surface), mLimits(limits) {}

int FrameLoop::run(int argc, char** argv) {
    const StopSignal stopSignal;
    if (!mApplication.onInit(argc, argv))
        return 0;
    mStart = secondsNow();
    try {
        while (!mHasQuit && !StopSignal::isRaised() && (mLimits.frames == 0 || mFrame < mLimits.frames))
            step();
    } catch (...) {
        mApplication.onShutdown();
        throw;
    }
    mIsInterrupted = StopSignal::isRaised();
    mApplication.onShutdown();
    return mFrame;
}

void FrameLoop::step() {
    takeEvents();
    followSize();
    if (mHasQuit)
        return;
    if (mApplication.isPaused()) {
        if (mIsStale)
            mApplication.onRender(mFrame);
        else
            mApplication.onIdle();
        // The frames that were not drawn meanwhile are not made up for.
        mStart = mLimits.rate > 0 ? secondsNow() - mFrame / mLimits.rate : 0;
    } else if (isDue()) {
        mApplication.onRender(mFrame++);
    } else {
        mApplication.onIdle();
    }
    mIsStale = false;
}

void FrameLoop::takeEvents() {
    for (const SurfaceEvent event : mSurface.takeEvents()) {
        mIsStale = true;
        if (event == SurfaceEvent::QUIT)
            mHasQuit = true;
        else
            mApplication.onEvent(event);
    }
}

void FrameLoop::followSize() {
    const auto width = static_cast<int>(mSurface.getWidth());
    const auto height = static_cast<int>(mSurface.getHeight());
    if (width == mWidth && height == mHeight)
        return;
    mWidth = width;
    mHeight = height;
    mIsStale = true;
    mApplication.onResize(width, height);
}

bool FrameLoop::isDue() const {
    return mLimits.rate <= 0 || secondsNow() >= mStart + mFrame / mLimits.rate;
}

} // namespace host
