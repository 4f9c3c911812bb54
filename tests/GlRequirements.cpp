#include <fixture/ChildProcess.h>

#include <GlRequirements.h>
#include <HeadlessContext.h>

#include <gtest/gtest.h>

#include <unistd.h>

#include <cstdlib>
#include <stdexcept>
#include <string>

namespace {

using host::GlFeature;

const std::string NO_CONTEXT = "no context: ";

/// What a context of Mesa's lacks for everything that a host can do; NO_CONTEXT and the reason where there is
/// none.
/// @param version  OpenGL version that it claims, null for its own
/// @param without  extensions that are taken away
std::string missingWith(const char* version, const std::string& without) {
    const ChildRun child = runChild([&](int output) { // a driver reads its environment once
        setenv("LIBGL_ALWAYS_SOFTWARE", "1", 1);
        setenv("GALLIUM_DRIVER", "llvmpipe", 1);
        setenv("MESA_EXTENSION_OVERRIDE", without.c_str(), 1);
        if (version)
            setenv("MESA_GL_VERSION_OVERRIDE", version, 1);
        std::string missing;
        try {
            const host::HeadlessContext context;
            missing = host::missingGlFeatures(
                {GlFeature::TEXTURES, GlFeature::FRAMEBUFFERS, GlFeature::UPLOAD_BUFFERS,
                 GlFeature::READBACK_BUFFERS, GlFeature::HALF_FLOATS, GlFeature::FRAMEBUFFER_BLIT,
                 GlFeature::VERTEX_LISTS, GlFeature::STRIPS, GlFeature::CG_PROGRAMS});
        } catch (const std::runtime_error& error) {
            missing = NO_CONTEXT + error.what();
        }
        const bool isTold = write(output, missing.data(), missing.size()) >= 0;
        _exit(isTold ? 0 : 1); // without what the driver does at exit
    });
    return child.status == 0 ? child.text : "died with status " + std::to_string(child.status);
}

// Mesa lowers its version with an extension that the version demands; those that it cannot do without itself
// go all together.
TEST(GlRequirements, EveryNeedThatIsNotMetIsNamed) {
    const std::string missing = missingWith(nullptr, "");
    if (missing.rfind(NO_CONTEXT, 0) == 0 && !std::getenv("CI"))
        GTEST_SKIP() << missing;
    ASSERT_EQ(missing, "");
    const std::string glsl = "shaders of GLSL 3.30 (OpenGL 3.3)";
    const std::string framebuffers = "framebuffers and mip maps (GL_EXT_framebuffer_object)";
    const std::string uploads = "upload through pixel buffers (GL_ARB_pixel_buffer_object or OpenGL 2.1)";
    const std::string readbacks =
        "readback through pixel buffers (GL_ARB_pixel_buffer_object or OpenGL 2.1); ";
    const std::string pixelReadback = "readback from framebuffers (GL_EXT_framebuffer_object)";
    const std::string sizes = "textures of any size (GL_ARB_texture_non_power_of_two or OpenGL 2.0); ";
    const std::string blit = "copies between framebuffers (GL_EXT_framebuffer_blit)";
    const std::string halfFloats = "half-float textures (GL_ARB_texture_float or OpenGL 3.0); ";
    const std::string restart = "primitive restart (GL_NV_primitive_restart); ";
    const std::string all =
        "-GL_ARB_texture_non_power_of_two -GL_EXT_framebuffer_object -GL_ARB_pixel_buffer_object "
        "-GL_ARB_copy_buffer -GL_ARB_texture_float -GL_ARB_half_float_pixel "
        "-GL_EXT_framebuffer_blit -GL_ARB_vertex_buffer_object -GL_NV_primitive_restart "
        "-GL_ARB_separate_shader_objects";
    const struct {
        const char* version;
        std::string without;
        std::string missing;
    } cases[] = {
        {"1.4", "", glsl},
        {"3.2COMPAT", "", glsl},
        {"3.3COMPAT", "", ""},
        {nullptr, "-GL_ARB_texture_non_power_of_two", sizes + glsl},
        {nullptr, "-GL_EXT_framebuffer_object", framebuffers + "; " + pixelReadback + "; " + blit},
        {nullptr, "-GL_ARB_pixel_buffer_object", uploads + "; " + readbacks + glsl},
        {nullptr, "-GL_ARB_texture_float", halfFloats + glsl},
        {nullptr, "-GL_NV_primitive_restart", restart + glsl},
        {"1.4", all,
         sizes + framebuffers + "; " + uploads + "; " + readbacks + pixelReadback +
             "; copies between buffers (GL_ARB_copy_buffer or OpenGL 3.1); " + halfFloats +
             "half-float pixels (GL_ARB_half_float_pixel or OpenGL 3.0); " + blit +
             "; vertex buffers (GL_ARB_vertex_buffer_object or OpenGL 1.5); " + restart + glsl +
             "; separate shader programs (GL_ARB_separate_shader_objects or OpenGL 4.1)"},
    };
    for (const auto& c : cases)
        EXPECT_EQ(missingWith(c.version, c.without), c.missing) << (c.version ? c.version : "") << c.without;
}

} // namespace
