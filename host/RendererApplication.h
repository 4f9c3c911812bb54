#ifndef HOST_RENDERERAPPLICATION_H
#define HOST_RENDERERAPPLICATION_H

#include "GlRequirements.h"
#include "StageTimes.h"
#include "Surface.h"

#include <FwZel/FwZel.h>

#include <vector>

namespace host {

/// A renderer on a surface: the library's application object, whose hooks a FrameLoop calls. A frame has
/// three stages, each measured; what is built, uploaded and drawn is a derived class's affair.
///
/// Thread: the render thread.
class RendererApplication : public FwZel {
public:
    /// @param surface  kept, not owned; outlives the object
    /// @param features  what the derived class uses of OpenGL
    /// @param statisticsWindow  frames, see StageTimes
    RendererApplication(Surface& surface, const std::vector<GlFeature>& features, int statisticsWindow);

    /// Checks the context, then builds.
    /// @throw std::runtime_error  the context lacks a feature; nothing is built then
    bool onInit(int argc, char** ppArgv) override;

    /// Gives back what build() made, while the context is still there.
    void onShutdown() override;

    /// Uploads, draws, reads back where a frame is wanted, and shows the frame.
    /// @throw std::runtime_error  OpenGL reports an error; what() names it
    void onRender(int frameIndex) override;

    /// Takes the size over: units are the same both ways, x runs from -1 to 1 over the surface.
    void onResize(int w, int h) override;

    /// Passes a little time.
    void onIdle() override;

    virtual void onEvent(SurfaceEvent event) = 0;

    /// Whether the frame counter stands.
    virtual bool isPaused() const { return false; }

protected:
    virtual void build() = 0;
    virtual void release() = 0;
    virtual void upload(int frameIndex) = 0;
    virtual void draw(int frameIndex) = 0;

    /// Whether the pixels of each frame are read back.
    virtual bool isFrameWanted() const = 0;

    /// Takes the frame that was read back, see Surface::readFrame().
    virtual void takeFrame(int frameIndex, const std::vector<unsigned char>& pixels) = 0;

    /// All stages of the frame are done and accounted.
    virtual void endFrame(int frameIndex) = 0;

    Surface& surface() { return mSurface; }
    StageTimes& times() { return mTimes; }

private:
    Surface& mSurface;
    std::vector<GlFeature> mFeatures;
    StageTimes mTimes;
    std::vector<unsigned char> mPixels;
};

} // namespace host

#endif
