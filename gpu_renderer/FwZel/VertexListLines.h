#ifndef FWZEL_VERTEXLISTLINES_H
#define FWZEL_VERTEXLISTLINES_H

#include <FwZel/VertexList.h>

#include <vector>

/// A polyline through a list of points, open or closed, drawn as a GL_LINE_STRIP. A closed one repeats its
/// first index. The host replaces the points with setVertexData() and uploads them with updateVertexData().
///
/// Only the positions of the points are used; texture coordinates, normals and colours are drawn as 0, so the
/// program that draws it must not depend on them.
///
/// Owns its points and its host arrays until destruction. When memory for the arrays is short at
/// construction, the polyline never uploads and draws nothing; short for the points, the constructor and
/// setVertexData() throw std::bad_alloc and change nothing. Without points it draws nothing. Thread and
/// OpenGL: see VertexList.
class FWZEL_API VertexListLines : public VertexList {
public:
    /// Builds and uploads the polyline. Leaves both buffer bindings 0.
    /// @param shader      see VertexList
    /// @param vertexData  points, copied; may be empty
    /// @param isLoop      a segment from the last point back to the first closes the polyline
    VertexListLines(Shader* shader, const std::vector<VertexList::VertexData>& vertexData, bool isLoop);
    ~VertexListLines();

    /// Replaces the points, to be drawn after the next updateVertexData(). Their number may differ.
    void setVertexData(const std::vector<VertexList::VertexData>& vertexData);

    /// Uploads the points, changed or not. Where their number has changed, the host arrays and counts are
    /// made anew; if memory is short for that, nothing is uploaded, the polyline stays what it was, and the
    /// next call tries again. Leaves both buffer bindings 0.
    void updateVertexData();

private:
    VertexListLines() = delete;
    VertexListLines(const VertexListLines&) = delete;
    VertexListLines& operator=(const VertexListLines&) = delete;

    void createVertices();
    bool resizeArrays();
    unsigned int numPoints() const;
    unsigned int numIndices() const;

    std::vector<VertexList::VertexData> mVertexData; ///< the points
    bool mIsLoop;
};

#endif
