#ifndef TOOLS_PLAYSHAPES_H
#define TOOLS_PLAYSHAPES_H

#include "PlaySettings.h"

#include <FwZel/Shader.h>
#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListLines.h>

#include <memory>
#include <vector>

/// Boxes and polylines in one colour, moving if asked: boxes from side to side, polylines round their middle.
///
/// Thread: the render thread.
class PlayShapes {
public:
    explicit PlayShapes(const PlayShapeSettings& settings);

    bool isEmpty() const { return mBoxes.empty() && mLines.empty(); }

    /// Draws them; a vertex program is enabled.
    void draw(int frameIndex);

private:
    void move(int frameIndex);

    PlayShapeSettings mSettings;
    Shader mShader;
    std::vector<std::unique_ptr<VertexListBox>> mBoxes;
    std::vector<std::unique_ptr<VertexListLines>> mLines;
};

#endif
