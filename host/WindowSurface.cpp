#include "WindowSurface.h"

#include <epoxy/gl.h>

#define GLFW_INCLUDE_NONE
#include <GLFW/glfw3.h>

#include <algorithm>
#include <iterator>
#include <stdexcept>
#include <utility>

namespace host {

namespace {

struct KeyEvent {
    int key;
    SurfaceEvent event;
};

constexpr KeyEvent KEYS[] = {
    {GLFW_KEY_RIGHT, SurfaceEvent::NEXT},      {GLFW_KEY_N, SurfaceEvent::NEXT},
    {GLFW_KEY_LEFT, SurfaceEvent::PREVIOUS},   {GLFW_KEY_B, SurfaceEvent::PREVIOUS},
    {GLFW_KEY_F, SurfaceEvent::FIELD},         {GLFW_KEY_SPACE, SurfaceEvent::PAUSE},
    {GLFW_KEY_P, SurfaceEvent::PAUSE},         {GLFW_KEY_H, SurfaceEvent::HALF},
    {GLFW_KEY_F11, SurfaceEvent::FULL_SCREEN}, {GLFW_KEY_ENTER, SurfaceEvent::FULL_SCREEN},
    {GLFW_KEY_O, SurfaceEvent::OVERLAY},       {GLFW_KEY_Q, SurfaceEvent::QUIT},
    {GLFW_KEY_ESCAPE, SurfaceEvent::QUIT},
};

std::string glfwReason() {
    const char* text = nullptr;
    glfwGetError(&text);
    return text ? text : "GLFW gives no reason";
}

/// Shrinks a size, at its own proportions, to what the primary monitor has room for.
void fitScreen(int& width, int& height) {
    GLFWmonitor* const monitor = glfwGetPrimaryMonitor();
    if (!monitor)
        return;
    int left = 0;
    int top = 0;
    int roomX = 0;
    int roomY = 0;
    glfwGetMonitorWorkarea(monitor, &left, &top, &roomX, &roomY);
    if (roomX <= 0 || roomY <= 0 || (width <= roomX && height <= roomY))
        return;
    const double scale = std::min(static_cast<double>(roomX) / width, static_cast<double>(roomY) / height);
    width = std::max(1, static_cast<int>(width * scale));
    height = std::max(1, static_cast<int>(height * scale));
}

} // namespace

WindowSurface::Library::Library() {
    if (!glfwInit())
        throw std::runtime_error("no window: " + glfwReason());
}

WindowSurface::Library::~Library() {
    glfwTerminate();
}

void WindowSurface::Destroy::operator()(GLFWwindow* window) const {
    glfwDestroyWindow(window);
}

WindowSurface::WindowSurface(uint32_t width, uint32_t height) {
    // Without a wish for a version, drivers give the highest compatibility profile that they have.
    int windowWidth = static_cast<int>(width);
    int windowHeight = static_cast<int>(height);
    fitScreen(windowWidth, windowHeight);
    glfwWindowHint(GLFW_ALPHA_BITS, 8);
    mWindow.reset(glfwCreateWindow(windowWidth, windowHeight, "", nullptr, nullptr));
    if (!mWindow)
        throw std::runtime_error("no window: " + glfwReason());
    glfwSetWindowUserPointer(mWindow.get(), this);
    glfwSetKeyCallback(mWindow.get(), onKey);
    glfwSetWindowCloseCallback(mWindow.get(), onClose);
    glfwMakeContextCurrent(mWindow.get());
    glfwSwapInterval(1);
}

void WindowSurface::onKey(GLFWwindow* window, int key, int /*scanCode*/, int action, int /*modifiers*/) {
    if (action == GLFW_RELEASE)
        return;
    const auto* const known =
        std::find_if(std::begin(KEYS), std::end(KEYS), [&](const KeyEvent& row) { return row.key == key; });
    if (known != std::end(KEYS))
        static_cast<WindowSurface*>(glfwGetWindowUserPointer(window))->mEvents.push_back(known->event);
}

void WindowSurface::onClose(GLFWwindow* window) {
    static_cast<WindowSurface*>(glfwGetWindowUserPointer(window))->mEvents.push_back(SurfaceEvent::QUIT);
}

WindowSurface::Extent WindowSurface::framebufferSize() const {
    int width = 0;
    int height = 0;
    glfwGetFramebufferSize(mWindow.get(), &width, &height);
    return {static_cast<uint32_t>(width), static_cast<uint32_t>(height)};
}

void WindowSurface::beginFrame() {
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    const Extent extent = framebufferSize();
    glViewport(0, 0, static_cast<GLsizei>(extent.width), static_cast<GLsizei>(extent.height));
}

void WindowSurface::readFrame(std::vector<unsigned char>& pixels) {
    const Extent extent = framebufferSize();
    const size_t rowBytes = size_t{extent.width} * 4;
    mBottomFirst.resize(rowBytes * extent.height);
    pixels.resize(mBottomFirst.size());
    glReadBuffer(GL_BACK);
    glReadPixels(0, 0, static_cast<GLsizei>(extent.width), static_cast<GLsizei>(extent.height), GL_RGBA,
                 GL_UNSIGNED_BYTE, mBottomFirst.data());
    for (size_t y = 0; y < extent.height; ++y)
        std::copy_n(mBottomFirst.data() + (extent.height - 1 - y) * rowBytes, rowBytes,
                    pixels.data() + y * rowBytes);
}

void WindowSurface::present() {
    glfwSwapBuffers(mWindow.get());
}

std::vector<SurfaceEvent> WindowSurface::takeEvents() {
    glfwPollEvents();
    return std::exchange(mEvents, {});
}

void WindowSurface::wait(double seconds) {
    glfwWaitEventsTimeout(seconds);
}

void WindowSurface::setTitle(const std::string& title) {
    glfwSetWindowTitle(mWindow.get(), title.c_str());
}

void WindowSurface::toggleFullScreen() {
    GLFWwindow* const window = mWindow.get();
    if (glfwGetWindowMonitor(window)) {
        glfwSetWindowMonitor(window, nullptr, mPlacement.x, mPlacement.y, mPlacement.width, mPlacement.height,
                             GLFW_DONT_CARE);
        return;
    }
    GLFWmonitor* const monitor = glfwGetPrimaryMonitor();
    const GLFWvidmode* const mode = monitor ? glfwGetVideoMode(monitor) : nullptr;
    if (!mode)
        return;
    glfwGetWindowPos(window, &mPlacement.x, &mPlacement.y);
    glfwGetWindowSize(window, &mPlacement.width, &mPlacement.height);
    glfwSetWindowMonitor(window, monitor, 0, 0, mode->width, mode->height, mode->refreshRate);
}

} // namespace host
