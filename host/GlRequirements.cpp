#include "GlRequirements.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <stdexcept>

namespace host {

namespace {

/// A need is met by an OpenGL version, as 10 x major + minor, or by an extension; version 0 never meets it,
/// because the library calls the entry points that only the extension has. Without an extension the version
/// alone meets it.
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
    {GlFeature::VERTEX_LISTS, 15, "vertex buffers", "GL_ARB_vertex_buffer_object"},
    {GlFeature::STRIPS, 0, "primitive restart", "GL_NV_primitive_restart"},
    {GlFeature::CG_PROGRAMS, 33, "shaders of GLSL 3.30", nullptr},
    {GlFeature::CG_PROGRAMS, 41, "separate shader programs", "GL_ARB_separate_shader_objects"},
};

bool isMet(const Need& need) {
    return (need.version != 0 && epoxy_gl_version() >= need.version) ||
           (need.extension && epoxy_has_gl_extension(need.extension));
}

std::string describe(const Need& need) {
    std::string means = need.extension ? need.extension : "";
    if (need.version != 0)
        means += (means.empty() ? "OpenGL " : " or OpenGL ") + std::to_string(need.version / 10) + '.' +
                 std::to_string(need.version % 10);
    return std::string(need.what) + " (" + means + ')';
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

std::string driverName() {
    const auto* const version = reinterpret_cast<const char*>(glGetString(GL_VERSION));
    const auto* const renderer = reinterpret_cast<const char*>(glGetString(GL_RENDERER));
    return std::string("OpenGL ") + (version ? version : "?") + " on " + (renderer ? renderer : "?");
}

} // namespace

std::string missingGlFeatures(const std::vector<GlFeature>& features) {
    if (!isCompatibilityContext())
        return "an OpenGL compatibility profile";
    std::string missing;
    for (const Need& need : NEEDS)
        if (std::find(features.begin(), features.end(), need.feature) != features.end() && !isMet(need))
            missing += (missing.empty() ? "" : "; ") + describe(need);
    return missing;
}

void requireGlFeatures(const std::vector<GlFeature>& features) {
    const std::string missing = missingGlFeatures(features);
    if (missing.empty())
        return;
    throw std::runtime_error(driverName() + " lacks " + missing);
}

void requireTextureSize(uint32_t width, uint32_t height) {
    GLint limit = 0;
    glGetIntegerv(GL_MAX_TEXTURE_SIZE, &limit);
    if (width > static_cast<uint32_t>(limit) || height > static_cast<uint32_t>(limit))
        throw std::runtime_error(driverName() + " has no textures of " + std::to_string(width) + " x " +
                                 std::to_string(height) + "; its limit is " + std::to_string(limit));
}

} // namespace host
