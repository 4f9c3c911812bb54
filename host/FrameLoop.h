#ifndef HOST_FRAMELOOP_H
#define HOST_FRAMELOOP_H

namespace host {

class RendererApplication;
class Surface;

/// The main loop of a host: calls an application's hooks in their order.
///
/// onInit() once; then, until the end, onEvent() for what the user asks, onResize() at first and whenever the
/// surface has another size, onRender() for each frame, and onIdle() while no frame is due; onShutdown()
/// last, also after an exception from a frame.
///
/// Interrupted by SIGINT (Ctrl-C) or SIGTERM it ends after the frame that it is at; a second one ends the
/// process at once.
///
/// Thread: the render thread.
class FrameLoop {
public:
    struct Limits {
        int frames;  ///< to draw; 0 for no end
        double rate; ///< frames a second at most; 0 as fast as they come
    };

    FrameLoop(RendererApplication& application, Surface& surface, Limits limits);

    /// @return frames drawn
    int run(int argc, char** argv);

    /// Whether a signal ended it.
    bool isInterrupted() const { return mIsInterrupted; }

private:
    void takeEvents();
    void followSize();
    bool isDue() const;
    void step();

    RendererApplication& mApplication;
    Surface& mSurface;
    Limits mLimits;
    int mFrame = 0;
    double mStart = 0;
    int mWidth = 0;
    int mHeight = 0;
    bool mIsStale = false; ///< a paused picture has changed
    bool mHasQuit = false;
    bool mIsInterrupted = false;
};

} // namespace host

#endif
