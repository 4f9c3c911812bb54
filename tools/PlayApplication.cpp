#include "PlayApplication.h"

#include <CgFolder.h>
#include <DebugOverlay.h>
#include <OutputFile.h>
#include <PngWriter.h>

#include "NumberedName.h"

#include <epoxy/gl.h>

#include <algorithm>
#include <iomanip>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

namespace {

using host::GlFeature;

std::vector<GlFeature> featuresOf(const PlaySettings& settings) {
    std::vector<GlFeature> features = {GlFeature::TEXTURES, GlFeature::VERTEX_LISTS, GlFeature::CG_PROGRAMS};
    if (settings.layout.upload != PlayUpload::HOST)
        features.push_back(GlFeature::UPLOAD_BUFFERS);
    if (settings.layout.isFp16)
        features.push_back(GlFeature::HALF_FLOATS);
    return features;
}

/// "upload    0.52    0.48    0.91": average, minimum and maximum in milliseconds.
std::string lineOf(const PerfMeasure::ProcTimeData& record) {
    std::ostringstream line;
    line << std::left << std::setw(8) << record.name << std::right << std::fixed << std::setprecision(2);
    for (const float time : {record.aveTime, record.minTime, record.maxTime})
        line << ' ' << std::setw(8) << time;
    return line.str();
}

} // namespace

PlayApplication::Scene::Scene(const PlaySettings& settings)
    : vertexShader(host::makeDefaultVertexShader()), program(settings.program), shapes(settings.shapes) {}

PlayApplication::PlayApplication(const PlaySettings& settings, host::Surface& surface)
    : RendererApplication(surface, featuresOf(settings), settings.statisticsWindow), mSettings(settings) {
    times().setWaiting(settings.hasStatistics || settings.hasOverlay);
}

void PlayApplication::build() {
    mScene = std::make_unique<Scene>(mSettings);
    showPicture(0);
    mScene->planeAspect = mSettings.aspect.value_or(mPicture->aspect());
    mScene->plane =
        std::make_unique<VertexListPlane>(mSettings.tessellation.width, mSettings.tessellation.height,
                                          mScene->planeAspect, &mScene->vertexShader);
}

void PlayApplication::release() {
    mPicture.reset();
    mScene.reset();
}

void PlayApplication::showPicture(size_t index) {
    mPictureIndex = index % mSettings.sources.size();
    mPicture.reset(); // the two do not need memory at once
    mPicture = std::make_unique<PlayPicture>(mSettings.sources[mPictureIndex], mSettings.layout);
    mShownFrames = 0;
    setTitle();
}

void PlayApplication::onEvent(host::SurfaceEvent event) {
    using host::SurfaceEvent;
    switch (event) {
    case SurfaceEvent::NEXT:
        return showPicture(mPictureIndex + 1);
    case SurfaceEvent::PREVIOUS:
        return showPicture(mPictureIndex + mSettings.sources.size() - 1);
    case SurfaceEvent::FIELD:
        return toggleFields();
    case SurfaceEvent::HALF:
        return toggleHalf();
    case SurfaceEvent::PAUSE:
        mIsPaused = !mIsPaused;
        return setTitle();
    case SurfaceEvent::OVERLAY:
        mSettings.hasOverlay = !mSettings.hasOverlay;
        return times().setWaiting(mSettings.hasStatistics || mSettings.hasOverlay);
    case SurfaceEvent::FULL_SCREEN:
        return surface().toggleFullScreen();
    case SurfaceEvent::QUIT:
        return; // the loop's affair
    }
}

void PlayApplication::toggleFields() {
    PlayLayout& layout = mSettings.layout;
    layout.isInterlaced = !layout.isInterlaced;
    layout.isFiltered = layout.isInterlaced;
    layout.numBuffers = std::max(layout.numBuffers, 2U);
    showPicture(mPictureIndex);
}

void PlayApplication::toggleHalf() {
    const std::string missing = host::missingGlFeatures({GlFeature::HALF_FLOATS});
    if (!missing.empty()) {
        std::cerr << "fwzel: OpenGL lacks " << missing << '\n';
        return;
    }
    mSettings.layout.isFp16 = !mSettings.layout.isFp16;
    showPicture(mPictureIndex);
}

void PlayApplication::setTitle() {
    std::string title = mSettings.sources[mPictureIndex].name() + ", " +
                        std::to_string(mPicture->getWidth()) + " x " +
                        std::to_string(mPicture->getFrameHeight());
    title += mSettings.layout.isInterlaced ? ", fields" : "";
    title += mSettings.layout.isFp16 ? ", half floats" : "";
    title += mIsPaused ? ", paused" : "";
    surface().setTitle(title + " - fwzel");
}

void PlayApplication::upload(int frameIndex) {
    mPicture->upload(frameIndex);
}

void PlayApplication::draw(int frameIndex) {
    mScene->vertexShader.enableProfile();
    mScene->vertexShader.bindProgram();
    drawPlane(frameIndex);
    if (!mScene->shapes.isEmpty())
        mScene->shapes.draw(frameIndex);
    mScene->vertexShader.disableProfile();
    if (mSettings.hasOverlay)
        host::drawOverlay(surface().getWidth(), surface().getHeight(), mOverlay);
}

/// Only closed windows are shown: minimum and maximum of the one that runs are not those of the mean.
void PlayApplication::renewOverlay() {
    mOverlay = {"ms           mean      min      max"};
    for (const PerfMeasure::ProcTimeData& record : times().records())
        mOverlay.push_back(lineOf(record));
}

/// As large as the surface lets it be, with the picture's own shape unless another was asked for.
void PlayApplication::placePlane(int frameIndex) {
    const float aspect = mSettings.aspect.value_or(mPicture->aspect());
    const float room = static_cast<float>(surface().getHeight()) / static_cast<float>(surface().getWidth());
    const float size = std::min(1.0F, room / aspect);
    glMatrixMode(GL_TEXTURE);
    glLoadIdentity();
    if (mScene->program.showsField())
        glTranslatef(0, mPicture->verticalShift(frameIndex), 0);
    glMatrixMode(GL_MODELVIEW);
    glLoadIdentity();
    glScalef(size, size * (aspect / mScene->planeAspect), 1);
}

void PlayApplication::drawPlane(int frameIndex) {
    placePlane(frameIndex);
    mScene->program.begin(*mPicture, frameIndex);
    mScene->plane->render();
    mScene->program.end();
}

bool PlayApplication::isFrameWanted() const {
    return !mSettings.output.empty();
}

void PlayApplication::takeFrame(int frameIndex, const std::vector<unsigned char>& pixels) {
    if (mSettings.output == "-") {
        host::OutputFile output("-");
        output.write(pixels.data(), pixels.size());
        output.close();
        return;
    }
    host::OutputFile file(numberedName(mSettings.output, frameIndex));
    const uint32_t width = surface().getWidth();
    writePng(file, {pixels.data(), width, surface().getHeight(), size_t{width} * 4}, host::PngPixel::RGBA8);
    file.close();
}

void PlayApplication::endFrame(int frameIndex) {
    if (times().isWindowClosed())
        renewOverlay();
    if (mSettings.hasStatistics && times().isWindowClosed())
        writeStatistics(frameIndex);
    if (!surface().isWindow())
        mProgress.show(frameIndex + 1, mSettings.frames);
    ++mShownFrames;
    const bool isEnd = frameIndex + 1 == mSettings.frames;
    if (!isEnd && mSettings.framesPerPicture > 0 && mShownFrames >= mSettings.framesPerPicture)
        showPicture(mPictureIndex + 1);
}

void PlayApplication::writeStatistics(int frameIndex) {
    std::ostringstream table;
    const int first = frameIndex + 1 - mSettings.statisticsWindow;
    table << "frames " << std::max(first, 0) << " to " << frameIndex
          << ": milliseconds, mean, least and most\n";
    for (const PerfMeasure::ProcTimeData& record : times().records())
        table << "  " << lineOf(record) << '\n';
    if (mSettings.output == "-") {
        std::cerr << table.str();
        return;
    }
    host::OutputFile output("-");
    output.write(table.str());
    output.close();
}
