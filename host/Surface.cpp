#include "Surface.h"

#include "HeadlessSurface.h"
#include "WindowSurface.h"

#include <algorithm>
#include <cstdlib>
#include <stdexcept>

namespace host {

namespace {

bool isDisplayNamed() {
    const auto names = {"DISPLAY", "WAYLAND_DISPLAY"};
    return std::any_of(names.begin(), names.end(), [](const char* name) {
        const char* const value = std::getenv(name);
        return value && *value != '\0';
    });
}

} // namespace

std::unique_ptr<Surface> openSurface(SurfaceKind kind, uint32_t width, uint32_t height) {
    if (kind == SurfaceKind::WINDOW)
        return std::make_unique<WindowSurface>(width, height);
    if (kind == SurfaceKind::AUTO && isDisplayNamed()) {
        try {
            return std::make_unique<WindowSurface>(width, height);
        } catch (const std::runtime_error&) {
            // A display that is named and not there, as in a shell without its session, is no display.
        }
    }
    return std::make_unique<HeadlessSurface>(width, height);
}

} // namespace host
