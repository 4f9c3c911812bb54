#ifndef FWZEL_FWZEL_H
#define FWZEL_FWZEL_H

#include <FwZel/Export.h>

/// Base class of a host renderer's application object: the hooks that the host's main loop calls.
///
/// The host derives from it, constructs its object once, calls onInit() first, then onRender(), onResize()
/// and onIdle() as its loop requires, onShutdown() last, and destroys the object. The library itself never
/// calls a hook; each has a neutral default.
///
/// Thread: the host's. getFwZel() reads a pointer that the constructor writes without a lock, so the
/// application object is constructed before any other thread asks for it.
class FWZEL_API FwZel {
public:
    /// Makes this object the one that getFwZel() returns; a later construction replaces it.
    FwZel();

    /// Leaves getFwZel() as it is: after the destruction its result must not be used.
    virtual ~FwZel();

    /// Start-up, with the host's command line.
    /// @return true to go on; the default does nothing and returns true
    virtual bool onInit(int argc, char** ppArgv);

    /// The host's loop has ended.
    virtual void onShutdown();

    /// One frame is to be drawn.
    /// @param frameIndex  the host's frame counter
    virtual void onRender(int frameIndex);

    /// The output surface has a new size.
    /// @param w  width in pixels
    /// @param h  height in pixels
    virtual void onResize(int w, int h);

    /// The host's loop has nothing to do.
    virtual void onIdle();

    /// The most recently constructed application object, null before the first.
    static FwZel* getFwZel() { return spCorm; }

private:
    FwZel(const FwZel&) = delete;
    FwZel& operator=(const FwZel&) = delete;

    static FwZel* spCorm;
};

#endif
