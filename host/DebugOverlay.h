#ifndef HOST_DEBUGOVERLAY_H
#define HOST_DEBUGOVERLAY_H

#include <cstdint>
#include <string>
#include <vector>

namespace host {

/// Draws lines of text at the top left of the current framebuffer, at the raster positions of FWDebugFont,
/// white with a black shadow. Leaves the matrices as they were. The Cg profiles must be disabled.
///
/// Thread: the render thread.
/// @param width,height  size of the framebuffer in pixels
void drawOverlay(uint32_t width, uint32_t height, const std::vector<std::string>& lines);

} // namespace host

#endif
