#include <FwZel/VertexListPlane.h>

#include <FwZel/VertexBuffers.h>

#include <epoxy/gl.h>

#include <cstdlib>
#include <initializer_list>
#include <limits>

VertexListPlane::VertexListPlane(uint32_t vertexWidth, uint32_t vertexHeight, float aspectRatio,
                                 Shader* shader)
    : VertexList(shader, GL_TRIANGLES), mVertexWidth(vertexWidth), mVertexHeight(vertexHeight),
      mAspectRatio(aspectRatio), mNormalizedVertexHeight(aspectRatio + aspectRatio) {
    createPlaneVertices();
}

VertexListPlane::~VertexListPlane() {
    std::free(mVertices);
    std::free(mIndices);
}

void VertexListPlane::createPlaneVertices() {
    constexpr unsigned int INDICES_PER_CELL = 6;
    constexpr uint64_t MAX_COUNT = std::numeric_limits<uint32_t>::max();
    if (uint64_t{mVertexWidth} * mVertexHeight > MAX_COUNT / INDICES_PER_CELL ||
        (uint64_t{mVertexWidth} + 1) * (uint64_t{mVertexHeight} + 1) > MAX_COUNT)
        return;

    mNumVertices = (mVertexWidth + 1) * (mVertexHeight + 1);
    mNumIndices = INDICES_PER_CELL * mVertexWidth * mVertexHeight;
    mVertices = allocateVertices(mNumVertices);
    mIndices = allocateIndices(mNumIndices);
    if (!mVertices || !mIndices)
        return;

    writeVertices();
    writeIndices();
    glGenBuffers(1, &mVertexDataBufferID);
    uploadVertices(mVertexDataBufferID, mVertices, mNumVertices);
    glGenBuffers(1, &mIndexDataBufferID);
    uploadIndices(mIndexDataBufferID, mIndices, mNumIndices);
}

void VertexListPlane::writeVertices() {
    const float fPosDx = 2.0F / static_cast<float>(mVertexWidth);
    const float fPosDy = (-mAspectRatio - mAspectRatio) / static_cast<float>(mVertexHeight);
    const float fUVDx = 1.0F / static_cast<float>(mVertexWidth);
    const float fUVDy = 1.0F / static_cast<float>(mVertexHeight);

    VertexData* vertex = mVertices;
    for (unsigned int y = 0; y <= mVertexHeight; ++y) {
        for (unsigned int x = 0; x <= mVertexWidth; ++x, ++vertex) {
            vertex->posX = static_cast<float>(x) * fPosDx - 1.0F;
            vertex->posY = static_cast<float>(y) * fPosDy + mAspectRatio;
            vertex->posZ = 0.0F;
            vertex->texX = fUVDx * static_cast<float>(x);
            vertex->texY = static_cast<float>(y) * fUVDy;
            vertex->nX = 0.0F;
            vertex->nY = 0.0F;
            vertex->nZ = 1.0F;
            vertex->colR = vertex->texX;
            vertex->colG = vertex->texY;
            vertex->colB = 0.0F;
            vertex->colA = 1.0F;
        }
    }
}

void VertexListPlane::writeIndices() {
    unsigned int* index = mIndices;
    for (unsigned int y = 0; y < mVertexHeight; ++y) {
        for (unsigned int x = 0; x < mVertexWidth; ++x) {
            const unsigned int topLeft = y * (mVertexWidth + 1) + x;
            const unsigned int topRight = topLeft + 1;
            const unsigned int bottomLeft = topLeft + mVertexWidth + 1;
            const unsigned int bottomRight = bottomLeft + 1;
            for (const unsigned int corner :
                 {topLeft, topRight, bottomLeft, bottomLeft, bottomRight, topRight})
                *index++ = corner;
        }
    }
}
