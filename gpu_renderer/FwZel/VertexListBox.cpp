#include <FwZel/VertexListBox.h>

#include <FwZel/VertexBuffers.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <cstdlib>

namespace {

/// Around the rectangle and back to the first corner.
constexpr std::array<unsigned int, 5> OUTLINE = {0, 1, 3, 2, 0};

} // namespace

VertexListBox::VertexListBox(Shader* shader, float startX, float endX, float startY, float endY)
    : VertexList(shader, GL_LINE_STRIP), mStartX(startX), mEndX(endX), mStartY(startY), mEndY(endY),
      mPrevStartX(0.0F), mPrevEndX(0.0F), mPrevStartY(0.0F), mPrevEndY(0.0F), mIsFirst(true) {
    createBoxVertices();
}

VertexListBox::~VertexListBox() {
    std::free(mVertices);
    std::free(mIndices);
}

void VertexListBox::createBoxVertices() {
    mNumVertices = 4;
    mNumIndices = OUTLINE.size();
    mVertices = allocateVertices(mNumVertices);
    mIndices = allocateIndices(mNumIndices);
    mHasNothingToDraw = !mVertices || !mIndices;
    glGenBuffers(1, &mVertexDataBufferID);
    glGenBuffers(1, &mIndexDataBufferID);
    updateVertexData();
}

void VertexListBox::updateVertexData() {
    if (!mVertices || !mIndices || isUploaded())
        return;
    mPrevStartX = mStartX;
    mPrevEndX = mEndX;
    mPrevStartY = mStartY;
    mPrevEndY = mEndY;
    mIsFirst = false;

    writePositions();
    std::copy(OUTLINE.begin(), OUTLINE.end(), mIndices);
    uploadVertices(mVertexDataBufferID, mVertices, mNumVertices);
    uploadIndices(mIndexDataBufferID, mIndices, mNumIndices);
}

bool VertexListBox::isUploaded() const {
    return !mIsFirst && mStartX == mPrevStartX && mEndX == mPrevEndX && mStartY == mPrevStartY &&
           mEndY == mPrevEndY;
}

void VertexListBox::writePositions() {
    for (unsigned int corner = 0; corner < mNumVertices; ++corner) {
        mVertices[corner].posX = corner % 2 == 0 ? mStartX : mEndX;
        mVertices[corner].posY = corner < 2 ? mStartY : mEndY;
        mVertices[corner].posZ = 0.0F;
    }
}
