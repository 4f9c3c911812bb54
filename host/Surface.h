#ifndef HOST_SURFACE_H
#define HOST_SURFACE_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace host {

/// What a user asks of a running renderer.
enum class SurfaceEvent {
    NEXT,        ///< right arrow, n
    PREVIOUS,    ///< left arrow, b
    FIELD,       ///< f
    PAUSE,       ///< space, p
    HALF,        ///< h
    FULL_SCREEN, ///< return, F11
    OVERLAY,     ///< o
    QUIT,        ///< q, escape, the window's close button
};

/// Where frames are drawn, with the OpenGL context that draws them: a window, or memory.
///
/// A frame: beginFrame(), draw, readFrame() where the pixels are wanted, present().
///
/// Thread: the render thread; the context is current on the thread that made the surface, until its
/// destruction.
class Surface {
public:
    virtual ~Surface() = default;
    Surface(const Surface&) = delete;
    Surface& operator=(const Surface&) = delete;

    virtual uint32_t getWidth() const = 0;  ///< pixels
    virtual uint32_t getHeight() const = 0; ///< pixels

    /// Sends what is drawn from here on to the surface, over all of it.
    virtual void beginFrame() = 0;

    /// Reads what has been drawn: four bytes r, g, b, a a pixel, rows top to bottom without gaps. OpenGL
    /// delivers the bottom row first; the rows are turned round here.
    virtual void readFrame(std::vector<unsigned char>& pixels) = 0;

    /// Shows the frame.
    virtual void present() = 0;

    /// What the user has asked for since the last call, in order.
    virtual std::vector<SurfaceEvent> takeEvents() = 0;

    /// Passes time, less where the user asks for something.
    /// @param seconds  at most
    virtual void wait(double seconds) = 0;

    /// Whether a user sees it.
    virtual bool isWindow() const = 0;

    virtual void setTitle(const std::string& title) = 0;
    virtual void toggleFullScreen() = 0;

protected:
    Surface() = default;
};

enum class SurfaceKind {
    AUTO, ///< a window where there is a display that takes one, else headless
    WINDOW,
    HEADLESS,
};

/// Makes a surface and its context, and makes the context current.
/// @param width,height  pixels; a window may become smaller to fit its screen
/// @throw std::runtime_error  there is none of the kind; what() says why
std::unique_ptr<Surface> openSurface(SurfaceKind kind, uint32_t width, uint32_t height);

} // namespace host

#endif
