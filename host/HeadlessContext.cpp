#include "HeadlessContext.h"

#include <epoxy/egl.h>

#include <array>
#include <stdexcept>
#include <string>

namespace host {

struct HeadlessContext::Egl {
    EGLDisplay display = EGL_NO_DISPLAY;
    EGLContext context = EGL_NO_CONTEXT;

    ~Egl() {
        if (display == EGL_NO_DISPLAY)
            return;
        eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, EGL_NO_CONTEXT);
        if (context != EGL_NO_CONTEXT)
            eglDestroyContext(display, context);
        eglTerminate(display);
    }
};

namespace {

EGLDisplay surfacelessDisplay() {
    if (!epoxy_has_egl_extension(EGL_NO_DISPLAY, "EGL_MESA_platform_surfaceless"))
        return EGL_NO_DISPLAY;
    return eglGetPlatformDisplayEXT(EGL_PLATFORM_SURFACELESS_MESA, EGL_DEFAULT_DISPLAY, nullptr);
}

EGLDisplay deviceDisplay() {
    if (!epoxy_has_egl_extension(EGL_NO_DISPLAY, "EGL_EXT_device_enumeration") ||
        !epoxy_has_egl_extension(EGL_NO_DISPLAY, "EGL_EXT_platform_device"))
        return EGL_NO_DISPLAY;
    EGLDeviceEXT device = nullptr;
    EGLint count = 0;
    if (!eglQueryDevicesEXT(1, &device, &count) || count < 1)
        return EGL_NO_DISPLAY;
    return eglGetPlatformDisplayEXT(EGL_PLATFORM_DEVICE_EXT, device, nullptr);
}

/// Empty on success, else what failed.
std::string makeCompatibilityContext(EGLDisplay display, EGLContext& context) {
    EGLint major = 0;
    EGLint minor = 0;
    if (!eglInitialize(display, &major, &minor))
        return "EGL does not start";
    if (!epoxy_has_egl_extension(display, "EGL_KHR_surfaceless_context"))
        return "EGL_KHR_surfaceless_context is missing";
    if (!eglBindAPI(EGL_OPENGL_API))
        return "EGL offers no desktop OpenGL";
    const std::array<EGLint, 5> configAttributes = {EGL_RENDERABLE_TYPE, EGL_OPENGL_BIT, EGL_SURFACE_TYPE, 0,
                                                    EGL_NONE};
    EGLConfig config = nullptr;
    EGLint count = 0;
    if (!eglChooseConfig(display, configAttributes.data(), &config, 1, &count) || count < 1)
        return "EGL offers no OpenGL configuration";
    context = eglCreateContext(display, config, EGL_NO_CONTEXT, nullptr);
    if (context == EGL_NO_CONTEXT)
        return "EGL creates no OpenGL compatibility context";
    if (!eglMakeCurrent(display, EGL_NO_SURFACE, EGL_NO_SURFACE, context))
        return "EGL does not make the context current without a surface";
    return {};
}

} // namespace

HeadlessContext::HeadlessContext() {
    std::string reasons;
    for (auto* openDisplay : {surfacelessDisplay, deviceDisplay}) {
        auto egl = std::make_unique<Egl>();
        egl->display = openDisplay();
        if (egl->display == EGL_NO_DISPLAY)
            continue;
        const std::string failure = makeCompatibilityContext(egl->display, egl->context);
        if (failure.empty()) {
            mEgl = std::move(egl);
            return;
        }
        reasons += (reasons.empty() ? "" : "; ") + failure;
    }
    throw std::runtime_error("no headless OpenGL context: " +
                             (reasons.empty() ? "no surfaceless or device EGL platform" : reasons));
}

HeadlessContext::~HeadlessContext() = default;

} // namespace host
