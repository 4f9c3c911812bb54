#ifndef HOST_WINDOWSURFACE_H
#define HOST_WINDOWSURFACE_H

#include "Surface.h"

#include <memory>

struct GLFWwindow;

namespace host {

/// A surface that is a window, through GLFW. There is one at a time.
///
/// Thread: the process's main thread.
class WindowSurface : public Surface {
public:
    /// @throw std::runtime_error  there is no display, or it gives no window with OpenGL
    WindowSurface(uint32_t width, uint32_t height);

    uint32_t getWidth() const override { return framebufferSize().width; }
    uint32_t getHeight() const override { return framebufferSize().height; }
    void beginFrame() override;
    void readFrame(std::vector<unsigned char>& pixels) override;
    void present() override;
    std::vector<SurfaceEvent> takeEvents() override;
    void wait(double seconds) override;
    bool isWindow() const override { return true; }
    void setTitle(const std::string& title) override;
    void toggleFullScreen() override;

private:
    struct Extent {
        uint32_t width;
        uint32_t height;
    };
    struct Placement {
        int x, y, width, height;
    };
    struct Library {
        Library();
        ~Library();
        Library(const Library&) = delete;
        Library& operator=(const Library&) = delete;
    };
    struct Destroy {
        void operator()(GLFWwindow* window) const;
    };

    static void onKey(GLFWwindow* window, int key, int scanCode, int action, int modifiers);
    static void onClose(GLFWwindow* window);
    Extent framebufferSize() const;

    Library mLibrary;
    std::unique_ptr<GLFWwindow, Destroy> mWindow;
    std::vector<SurfaceEvent> mEvents;
    Placement mPlacement = {}; ///< of the window before it became full screen
    std::vector<unsigned char> mBottomFirst;
};

} // namespace host

#endif
