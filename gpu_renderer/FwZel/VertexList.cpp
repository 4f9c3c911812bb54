#include <FwZel/VertexList.h>

#include <epoxy/gl.h>

#include <cstddef>

namespace {

constexpr GLsizei STRIDE = sizeof(VertexList::VertexData);
static_assert(STRIDE == 48, "the vertex record has no gaps");

/// With a buffer bound, the "pointers" to its arrays are byte offsets.
const void* offsetInBuffer(size_t bytes) {
    return reinterpret_cast<const void*>(bytes);
}

void enableVertexArrays() {
    glEnableClientState(GL_VERTEX_ARRAY);
    glVertexPointer(3, GL_FLOAT, STRIDE, offsetInBuffer(offsetof(VertexList::VertexData, posX)));
    glEnableClientState(GL_TEXTURE_COORD_ARRAY);
    glTexCoordPointer(2, GL_FLOAT, STRIDE, offsetInBuffer(offsetof(VertexList::VertexData, texX)));
    glEnableClientState(GL_NORMAL_ARRAY);
    glNormalPointer(GL_FLOAT, STRIDE, offsetInBuffer(offsetof(VertexList::VertexData, nX)));
    glEnableClientState(GL_COLOR_ARRAY);
    glColorPointer(4, GL_FLOAT, STRIDE, offsetInBuffer(offsetof(VertexList::VertexData, colR)));
}

void disableVertexArrays() {
    glDisableClientState(GL_VERTEX_ARRAY);
    glDisableClientState(GL_TEXTURE_COORD_ARRAY);
    glDisableClientState(GL_NORMAL_ARRAY);
    glDisableClientState(GL_COLOR_ARRAY);
}

} // namespace

VertexList::VertexList(Shader* shader, uint32_t primType)
    : mShader(shader), mVertices(nullptr), mIndices(nullptr), mVertexDataBufferID(0), mIndexDataBufferID(0),
      mNumVertices(0), mNumIndices(0), mPrimitiveType(primType), mLineWidth(1.0F), mHasNothingToDraw(false) {}

void VertexList::setLineWidth(float lineWidth) {
    mLineWidth = lineWidth;
}

void VertexList::render() {
    // With buffer 0 bound the array pointers would address client memory at 0.
    if (mVertexDataBufferID == 0 || mIndexDataBufferID == 0 || mHasNothingToDraw)
        return;

    glBindBuffer(GL_ARRAY_BUFFER, mVertexDataBufferID);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, mIndexDataBufferID);
    enableVertexArrays();

    switch (mPrimitiveType) {
    case GL_TRIANGLE_STRIP:
    case GL_POLYGON:
        glPrimitiveRestartIndexNV(static_cast<GLuint>(RESTART_INDEX));
        glEnableClientState(GL_PRIMITIVE_RESTART_NV);
        break;
    case GL_LINE_STRIP:
        glLineWidth(mLineWidth);
        break;
    default:
        break;
    }
    glDrawElements(mPrimitiveType, static_cast<GLsizei>(mNumIndices), GL_UNSIGNED_INT, offsetInBuffer(0));
    glFlush();

    disableVertexArrays();
    glBindBuffer(GL_ARRAY_BUFFER, 0);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
}
