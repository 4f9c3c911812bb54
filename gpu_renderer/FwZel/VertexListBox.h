#ifndef FWZEL_VERTEXLISTBOX_H
#define FWZEL_VERTEXLISTBOX_H

#include <FwZel/VertexList.h>

/// The outline of an axis-aligned rectangle in the plane z = 0, given by two x and two y coordinates, drawn
/// as a closed GL_LINE_STRIP. The host moves it with the setters and updateVertexData(), which uploads only
/// what has changed.
///
/// Only positions are written; texture coordinates, normals and colours are 0, so the program that draws it
/// must not depend on them.
///
/// Owns its host arrays until destruction. When memory for them is short, the box never uploads and draws
/// nothing. Thread and OpenGL: see VertexList.
class FWZEL_API VertexListBox : public VertexList {
public:
    /// Builds and uploads the outline. Leaves both buffer bindings 0.
    /// @param shader         see VertexList
    /// @param startX,startY  first corner
    /// @param endX,endY      opposite corner; may be equal to the first
    VertexListBox(Shader* shader, float startX, float endX, float startY, float endY);
    ~VertexListBox();

    /// Each stores one coordinate, to be drawn after the next updateVertexData().
    /// @{
    void setStartX(float val) { mStartX = val; }
    void setEndX(float val) { mEndX = val; }
    void setStartY(float val) { mStartY = val; }
    void setEndY(float val) { mEndY = val; }
    /// @}

    /// Uploads the outline if a coordinate differs from the one last uploaded, compared as floats: -0.0
    /// equals 0.0, and a NaN differs every time. Makes no OpenGL call otherwise, so it can be called every
    /// frame. Leaves both buffer bindings 0.
    void updateVertexData();

private:
    VertexListBox() = delete;
    VertexListBox(const VertexListBox&) = delete;
    VertexListBox& operator=(const VertexListBox&) = delete;

    void createBoxVertices();
    bool isUploaded() const;
    void writePositions();

    float mStartX;
    float mEndX;
    float mStartY;
    float mEndY;
    float mPrevStartX; ///< as last uploaded, like the three that follow
    float mPrevEndX;
    float mPrevStartY;
    float mPrevEndY;
    bool mIsFirst; ///< until the first upload
};

#endif
