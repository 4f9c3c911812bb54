#include "PlayShapes.h"

#include <CgFolder.h>

#include <epoxy/gl.h>

#include <cmath>

namespace {

constexpr float FRAMES_OF_A_TURN = 100;
constexpr float BOX_WAY = 0.25F; ///< in the plane's coordinates
constexpr float FULL_TURN = 6.2831853F;

using Points = std::vector<VertexList::VertexData>;

/// The points of a polyline, turned round their middle.
Points pointsOf(const std::vector<float>& coordinates, float angle) {
    Points points(coordinates.size() / 2);
    float middleX = 0;
    float middleY = 0;
    for (size_t i = 0; i < points.size(); ++i) {
        middleX += coordinates[2 * i] / static_cast<float>(points.size());
        middleY += coordinates[2 * i + 1] / static_cast<float>(points.size());
    }
    for (size_t i = 0; i < points.size(); ++i) {
        const float x = coordinates[2 * i] - middleX;
        const float y = coordinates[2 * i + 1] - middleY;
        points[i].posX = middleX + x * std::cos(angle) - y * std::sin(angle);
        points[i].posY = middleY + x * std::sin(angle) + y * std::cos(angle);
    }
    return points;
}

} // namespace

PlayShapes::PlayShapes(const PlayShapeSettings& settings)
    : mSettings(settings), mShader(host::makeFragmentShader(host::cgProgramPath("colour.cg"), "Cg_Main")) {
    constexpr uint32_t VECTOR = 4;
    mShader.addCgParam("colour", VECTOR, 1, settings.colour.data());
    mShader.getNamedCgParameterAll();
    for (const std::array<float, 4>& box : settings.boxes)
        mBoxes.push_back(std::make_unique<VertexListBox>(&mShader, box[0], box[2], box[1], box[3]));
    for (const std::vector<float>& polyline : settings.polylines)
        mLines.push_back(
            std::make_unique<VertexListLines>(&mShader, pointsOf(polyline, 0), settings.isClosed));
    for (const auto& box : mBoxes)
        box->setLineWidth(settings.lineWidth);
    for (const auto& lines : mLines)
        lines->setLineWidth(settings.lineWidth);
}

void PlayShapes::move(int frameIndex) {
    const float angle =
        FULL_TURN * std::fmod(static_cast<float>(frameIndex), FRAMES_OF_A_TURN) / FRAMES_OF_A_TURN;
    const float shift = BOX_WAY * std::sin(angle);
    for (size_t i = 0; i < mBoxes.size(); ++i) {
        mBoxes[i]->setStartX(mSettings.boxes[i][0] + shift);
        mBoxes[i]->setEndX(mSettings.boxes[i][2] + shift);
        mBoxes[i]->updateVertexData();
    }
    for (size_t i = 0; i < mLines.size(); ++i) {
        mLines[i]->setVertexData(pointsOf(mSettings.polylines[i], angle));
        mLines[i]->updateVertexData();
    }
}

void PlayShapes::draw(int frameIndex) {
    if (mSettings.isMoving)
        move(frameIndex);
    mShader.enableProfile();
    mShader.bindProgram();
    mShader.setCgParamAll();
    glEnable(GL_BLEND);
    glBlendFuncSeparate(GL_SRC_ALPHA, GL_ONE_MINUS_SRC_ALPHA, GL_ONE, GL_ONE_MINUS_SRC_ALPHA);
    for (const auto& box : mBoxes)
        box->render();
    for (const auto& lines : mLines)
        lines->render();
    glDisable(GL_BLEND);
    mShader.disableProfile();
}
