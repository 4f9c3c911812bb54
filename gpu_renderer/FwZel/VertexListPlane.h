#ifndef FWZEL_VERTEXLISTPLANE_H
#define FWZEL_VERTEXLISTPLANE_H

#include <FwZel/VertexList.h>

/// A flat rectangle, tessellated into a grid of cells, that shows a texture: centred on the origin in the
/// plane z = 0, from -1 to 1 across and from +aspectRatio at the top to -aspectRatio at the bottom, drawn as
/// GL_TRIANGLES. Texture row 0 lies at its top edge. It never changes after construction.
///
/// Vertices stand row by row from the top left. Each has the texture coordinate that runs from (0, 0) at the
/// top left to (1, 1) at the bottom right, the normal (0, 0, 1) and the colour (texX, texY, 0, 1). A
/// coordinate is a single-precision multiple of one step, so that the far edge may miss 1 by a rounding.
///
/// Of each cell the first triangle runs clockwise and the second counter-clockwise when +y points up: draw
/// with face culling disabled.
///
/// Owns its host arrays until destruction. When memory for them is short, or the grid has 2^32 vertices or
/// indices or more, the plane has no buffer objects and draws nothing. Thread and OpenGL: see VertexList.
class FWZEL_API VertexListPlane : public VertexList {
public:
    /// Builds and uploads the mesh. Leaves both buffer bindings 0.
    /// @param vertexWidth   cells across; 0 draws nothing
    /// @param vertexHeight  cells down; 0 draws nothing
    /// @param aspectRatio   height divided by width
    /// @param shader        see VertexList
    VertexListPlane(uint32_t vertexWidth, uint32_t vertexHeight, float aspectRatio, Shader* shader);
    ~VertexListPlane();

    /// Height of the plane in the units in which its width is 2: twice the aspect ratio.
    float getNormalizedVertexHeight() const { return mNormalizedVertexHeight; }

private:
    VertexListPlane() = delete;
    VertexListPlane(const VertexListPlane&) = delete;
    VertexListPlane& operator=(const VertexListPlane&) = delete;

    void createPlaneVertices();
    void writeVertices();
    void writeIndices();

    unsigned int mVertexWidth;  ///< cells across
    unsigned int mVertexHeight; ///< cells down
    float mAspectRatio;
    float mNormalizedVertexHeight;
};

#endif
