#ifndef HOST_GLREQUIREMENTS_H
#define HOST_GLREQUIREMENTS_H

#include <cstdint>
#include <string>
#include <vector>

namespace host {

/// What a host is about to use of OpenGL; each feature has its own needs of the context.
enum class GlFeature {
    TEXTURES,         ///< Texture, of any size
    FRAMEBUFFERS,     ///< Texture with isFBO or isMipMapped
    UPLOAD_BUFFERS,   ///< Texture with isPBO and write access
    READBACK_BUFFERS, ///< Texture with isPBO and readback access
    HALF_FLOATS,      ///< Texture with isFp16
    FRAMEBUFFER_BLIT, ///< copying from texture to texture on the GPU, the host's own work
    VERTEX_LISTS,     ///< VertexList of triangles and lines
    STRIPS,           ///< VertexList of GL_TRIANGLE_STRIP or GL_POLYGON
    CG_PROGRAMS,      ///< Shader
};

/// What the current context lacks for the features, in words, empty when it has all of it: one entry a need,
/// separated by "; ". The library tests nothing of the kind, and an entry point that is not there ends the
/// process, so a host asks before it builds its first object.
///
/// Thread: the render thread, with a context current.
std::string missingGlFeatures(const std::vector<GlFeature>& features);

/// As above, for a host that cannot go on without.
/// @throw std::runtime_error  something is missing; what() names the driver and what it lacks
void requireGlFeatures(const std::vector<GlFeature>& features);

/// Asks whether the current context takes textures and framebuffers of a size.
/// @throw std::runtime_error  it does not; what() names the driver and its limit
void requireTextureSize(uint32_t width, uint32_t height);

} // namespace host

#endif
