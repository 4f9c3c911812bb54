#include <FwZel/VertexListLines.h>

#include <FwZel/VertexBuffers.h>

#include <epoxy/gl.h>

#include <cstdlib>

VertexListLines::VertexListLines(Shader* shader, const std::vector<VertexList::VertexData>& vertexData,
                                 bool isLoop)
    : VertexList(shader, GL_LINE_STRIP), mVertexData(vertexData), mIsLoop(isLoop) {
    createVertices();
}

VertexListLines::~VertexListLines() {
    std::free(mVertices);
    std::free(mIndices);
}

void VertexListLines::setVertexData(const std::vector<VertexList::VertexData>& vertexData) {
    mVertexData = vertexData;
}

void VertexListLines::createVertices() {
    mNumVertices = numPoints();
    mNumIndices = numIndices();
    mHasNothingToDraw = !resizeArrays();
    glGenBuffers(1, &mVertexDataBufferID);
    glGenBuffers(1, &mIndexDataBufferID);
    updateVertexData();
}

void VertexListLines::updateVertexData() {
    if (!mVertices || !mIndices)
        return;
    if (numPoints() != mNumVertices && !resizeArrays())
        return;

    for (unsigned int i = 0; i < mNumVertices; ++i) {
        mIndices[i] = i;
        mVertices[i].posX = mVertexData[i].posX;
        mVertices[i].posY = mVertexData[i].posY;
        mVertices[i].posZ = mVertexData[i].posZ;
    }
    if (mIsLoop)
        mIndices[mNumVertices] = 0;
    uploadVertices(mVertexDataBufferID, mVertices, mNumVertices);
    uploadIndices(mIndexDataBufferID, mIndices, mNumIndices);
    // Closed without points, the one index refers to no vertex.
    mHasNothingToDraw = mIsLoop && mNumVertices == 0;
}

/// Makes the host arrays and counts fit the points, or leaves all as it is when memory is short.
bool VertexListLines::resizeArrays() {
    VertexData* const vertices = allocateVertices(numPoints());
    unsigned int* const indices = allocateIndices(numIndices());
    if (!vertices || !indices) {
        std::free(vertices);
        std::free(indices);
        return false;
    }
    std::free(mVertices);
    std::free(mIndices);
    mVertices = vertices;
    mIndices = indices;
    mNumVertices = numPoints();
    mNumIndices = numIndices();
    return true;
}

unsigned int VertexListLines::numPoints() const {
    return static_cast<unsigned int>(mVertexData.size());
}

unsigned int VertexListLines::numIndices() const {
    return numPoints() + (mIsLoop ? 1 : 0);
}
