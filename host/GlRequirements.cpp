#include "GlRequirements.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <stdexcept>

namespace host {

namespace {

/// A need is met by an OpenGL version, as 10 x major + minor, or by an extension; version 0 never meets it,
/// because the library calls the entry points that only the extension has.
struct Need {
    GlFeature feature;
    int version;
    const char* what;
    const char* extension;
};

constexpr Need NEEDS[] = {
    {GlFeature::TEXTURES, 20, "textures of any size", "GL_ARB_texture_non_power_of_two"},
    {GlFeature::FRAMEBUFFERS, 0, "framebuffers and mip maps", "GL_EXT_framebuffer_object"},
    {GlFeature::UPLOAD_BUFFERS, 21, "upload through pixel buffers", "GL_ARB_pixel_buffer_object"},
    {GlFeature::READBACK_BUFFERS, 21, "readback through pixel buffers", "GL_ARB_pixel_buffer_object"},
    {GlFeature::READBACK_BUFFERS, 0, "readback from framebuffers", "GL_EXT_framebuffer_object"},
    {GlFeature::READBACK_BUFFERS, 31, "copies between buffers", "GL_ARB_copy_buffer"},
    {GlFeature::HALF_FLOATS, 30, "half-float textures", "GL_ARB_texture_float"},
    {GlFeature::HALF_FLOATS, 30, "half-float pixels", "GL_ARB_half_float_pixel"},
    {GlFeature::FRAMEBUFFER_BLIT, 0, "copies between framebuffers", "GL_EXT_framebuffer_blit"},
};

bool isMet(const Need& need) {
    return (need.version != 0 && epoxy_gl_version() >= need.version) ||
           epoxy_has_gl_extension(need.extension);
}

std::string describe(const Need& need) {
    std::string text = std::string(need.what) + " (" + need.extension;
    if (need.version != 0)
        text += " or OpenGL " + std::to_string(need.version / 10) + '.' + std::to_string(need.version % 10);
    return text + ')';
}

/// Fixed-function state and client arrays are gone from core profiles and from OpenGL ES.
bool isCompatibilityContext() {
    if (!epoxy_is_desktop_gl())
        return false;
    if (epoxy_gl_version() < 31)
        return true;
    if (epoxy_gl_version() == 31)
        return epoxy_has_gl_extension("GL_ARB_compatibility");
    GLint profile = 0;
    glGetIntegerv(GL_CONTEXT_PROFILE_MASK, &profile);
    return (profile & GL_CONTEXT_COMPATIBILITY_PROFILE_BIT) != 0;
}

} // namespace

std::string missingGlFeatures(std::initializer_list<GlFeature> features) {
    if (!isCompatibilityContext())
        return "an OpenGL compatibility profile";
    std::string missing;
    for (const Need& need : NEEDS)
        if (std::find(features.begin(), features.end(), need.feature) != features.end() && !isMet(need))
            missing += (missing.empty() ? "" : "; ") + describe(need);
    return missing;
}

void requireGlFeatures(std::initializer_list<GlFeature> features) {
    const std::string missing = missingGlFeatures(features);
    if (missing.empty())
        return;
    const auto* const version = reinterpret_cast<const char*>(glGetString(GL_VERSION));
    const auto* const renderer = reinterpret_cast<const char*>(glGetString(GL_RENDERER));
    throw std::runtime_error(std::string("OpenGL ") + (version ? version : "?") + " on " +
                             (renderer ? renderer : "?") + " lacks " + missing);
}

} // namespace host
