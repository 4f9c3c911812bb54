#ifndef HOST_HEADLESSCONTEXT_H
#define HOST_HEADLESSCONTEXT_H

#include <memory>

namespace host {

/// An OpenGL compatibility context without a window, through EGL: on Mesa's surfaceless platform, else on the
/// first EGL device. It has no default framebuffer, so draws need an FBO.
///
/// Thread: the context is current on the thread that constructed it, until its destruction.
class HeadlessContext {
public:
    /// Creates the context with the highest compatibility version there is and makes it current.
    /// @throw std::runtime_error  no EGL platform gives such a context; what() says why
    HeadlessContext();
    ~HeadlessContext();

    HeadlessContext(const HeadlessContext&) = delete;
    HeadlessContext& operator=(const HeadlessContext&) = delete;

private:
    struct Egl;
    std::unique_ptr<Egl> mEgl;
};

} // namespace host

#endif
