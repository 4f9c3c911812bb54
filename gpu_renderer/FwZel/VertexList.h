#ifndef FWZEL_VERTEXLIST_H
#define FWZEL_VERTEXLIST_H

#include <FwZel/Export.h>

#include <cstdint>

class Shader;

/// Base of every drawable shape: a vertex and an index array in host memory, the two OpenGL buffer objects
/// with their copies, and one indexed draw call through the fixed-function client arrays.
///
/// The base knows nothing of the shape. A subclass, of the library or of the host, sets the counts, creates
/// both buffer objects (glGenBuffers) and fills them (glBufferData with GL_STATIC_DRAW); then render() draws.
/// Host arrays are the subclass's affair: the base neither reads nor frees them, and a shape without them
/// draws as well. Buffer objects are deleted by no class here; they live as long as the OpenGL context.
///
/// The shader is kept and never called: the caller binds and enables it, sets its parameters and binds the
/// textures before render(), and disables them after it.
///
/// Nothing is virtual: destroy a shape through a pointer of its own type. Shapes cannot be copied.
///
/// Thread: the render thread. The library's shapes are constructed, updated, drawn and destroyed with the
/// host's context current. Nothing is logged and no OpenGL error is queried.
///
/// OpenGL: compatibility profile with buffer objects; NV_primitive_restart for strips and polygons.
class FWZEL_API VertexList {
public:
    /// The vertex record, in memory and in the vertex buffer: twelve floats, 48 bytes, no gaps.
    struct VertexData {
        /// Position, at byte offset 0; texture coordinate, at 12; normal, at 20; colour, at 32.
        /// @{
        float posX, posY, posZ;
        float texX, texY;
        float nX, nY, nZ;
        float colR, colG, colB, colA;
        /// @}
    };

    /// An empty list: null arrays, buffer names 0, counts 0, line width 1.0. Makes no OpenGL call.
    /// @param shader    kept, not owned, never called; may be null
    /// @param primType  OpenGL primitive mode of the draw call, such as GL_TRIANGLES
    VertexList(Shader* shader, uint32_t primType);

    ~VertexList() = default;

    /// Width in pixels of the lines of a GL_LINE_STRIP list from the next render() on; others ignore it.
    void setLineWidth(float lineWidth);

    /// Draws mNumIndices indices of the index buffer (GL_UNSIGNED_INT, from its first entry) with one
    /// glDrawElements, and flushes. Texture coordinates go to the client-active texture unit.
    ///
    /// Makes no OpenGL call at all where there is nothing valid to draw: a buffer name is 0, or
    /// mHasNothingToDraw is set. A list of 0 indices is drawn like any other, to no effect.
    ///
    /// Leaves the four client arrays disabled, with other pointers, and both buffer bindings 0; the current
    /// colour, normal and texture coordinate are undefined, as OpenGL has it of drawing from arrays. After
    /// GL_TRIANGLE_STRIP and GL_POLYGON primitive restart stays enabled with index 0xFFFFFFFF; after
    /// GL_LINE_STRIP the line width stays.
    void render();

protected:
    Shader* mShader;              ///< not owned
    VertexData* mVertices;        ///< host array of mNumVertices records, null until a subclass makes it
    unsigned int* mIndices;       ///< host array of mNumIndices indices, null until a subclass makes it
    uint32_t mVertexDataBufferID; ///< OpenGL name of the vertex buffer, 0 until a subclass creates it
    uint32_t mIndexDataBufferID;  ///< OpenGL name of the index buffer, 0 until a subclass creates it
    unsigned int mNumVertices;    ///< number of vertex records; render() does not need it
    unsigned int mNumIndices;     ///< number of indices, the count of the draw call
    uint32_t mPrimitiveType;      ///< OpenGL primitive mode, fixed at construction
    static constexpr int RESTART_INDEX = -1; ///< separates two strips in an index array, as 0xFFFFFFFF
    float mLineWidth;                        ///< pixels

    /// Set by a shape whose buffer objects exist but cannot be drawn: they never received data, or the
    /// indices refer to vertices that do not exist. render() skips it. False at construction.
    bool mHasNothingToDraw;

private:
    VertexList() = delete;
    VertexList(const VertexList&) = delete;
    VertexList& operator=(const VertexList&) = delete;
};

#endif
