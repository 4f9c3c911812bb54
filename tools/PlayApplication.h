#ifndef TOOLS_PLAYAPPLICATION_H
#define TOOLS_PLAYAPPLICATION_H

#include "PlayPicture.h"
#include "PlayProgram.h"
#include "PlaySettings.h"
#include "PlayShapes.h"
#include "Progress.h"

#include <RendererApplication.h>

#include <FwZel/Shader.h>
#include <FwZel/VertexListPlane.h>

#include <memory>
#include <string>
#include <vector>

/// "fwzel play" as an application of the library: draws pictures on a plane, with boxes and polylines over
/// them, and writes what was drawn.
///
/// Thread: the render thread.
class PlayApplication : public host::RendererApplication {
public:
    PlayApplication(const PlaySettings& settings, host::Surface& surface);

    void onEvent(host::SurfaceEvent event) override;
    bool isPaused() const override { return mIsPaused; }

protected:
    void build() override;
    void release() override;
    void upload(int frameIndex) override;
    void draw(int frameIndex) override;
    bool isFrameWanted() const override;
    void takeFrame(int frameIndex, const std::vector<unsigned char>& pixels) override;
    void endFrame(int frameIndex) override;

private:
    /// What lives while the context does.
    struct Scene {
        explicit Scene(const PlaySettings& settings);
        Shader vertexShader;
        PlayProgram program;
        PlayShapes shapes;
        std::unique_ptr<VertexListPlane> plane;
        float planeAspect = 0;
    };

    void showPicture(size_t index);
    void toggleFields();
    void toggleHalf();
    void placePlane(int frameIndex);
    void drawPlane(int frameIndex);
    void renewOverlay();
    void writeStatistics(int frameIndex);
    void setTitle();

    PlaySettings mSettings;
    std::unique_ptr<Scene> mScene;
    std::unique_ptr<PlayPicture> mPicture;
    std::vector<std::string> mOverlay; ///< lines of text
    size_t mPictureIndex = 0;
    uint32_t mShownFrames = 0; ///< of the picture
    Progress mProgress;
    bool mIsPaused = false;
};

#endif
