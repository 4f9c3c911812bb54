#include "PlayPicture.h"

#include <GlErrors.h>
#include <GlRequirements.h>

#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <cstring>
#include <stdexcept>

namespace {

Texture::TexArgs describe(const PlayLayout& layout) {
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.width = layout.size.width;
    args.height = layout.size.height;
    args.pitchInPix = layout.size.width;
    args.isInterlaced = layout.isInterlaced;
    args.isFp16 = layout.isFp16;
    args.isPBO = layout.upload != PlayUpload::HOST;
    args.numBuffers = layout.numBuffers;
    return args;
}

void refuseTooLarge(const PlaySource& source, const PlayLayout& layout) {
    Size size = layout.size;
    uint32_t bytesPerColour = 0;
    if (!source.pattern)
        VideoTestImage::getWidthHeightFromFile(source.file, &size.width, &size.height, &bytesPerColour);
    host::requireTextureSize(size.width, size.height);
    if (layout.isInterlaced && size.height < 2)
        throw std::runtime_error(source.name() + ": a picture of one line has no fields");
}

std::unique_ptr<Texture> build(const PlaySource& source, const PlayLayout& layout) {
    refuseTooLarge(source, layout);
    auto texture = source.pattern ? std::make_unique<Texture>(source.pattern->number, describe(layout))
                                  : std::make_unique<Texture>(source.file, describe(layout));
    const uint32_t filter = layout.isFiltered ? GL_LINEAR : GL_NEAREST;
    for (uint32_t buffer = 0; buffer < texture->getNumBuffers(); ++buffer) {
        if (!texture->getHostBufPtr(buffer))
            throw std::runtime_error(source.name() + ": no memory for its pixels");
        texture->setTextureFilter(buffer, filter, filter);
        texture->copyHostBufToGLTex(buffer);
    }
    const std::vector<std::string> errors = host::takeGlErrors();
    if (!errors.empty())
        throw std::runtime_error(source.name() + ": OpenGL reports " + errors.front());
    return texture;
}

} // namespace

PlayPicture::PlayPicture(const PlaySource& source, const PlayLayout& layout)
    : mTexture(build(source, layout)), mUpload(layout.upload) {
    if (mUpload != PlayUpload::PRODUCER)
        return;
    mProducer = std::make_unique<host::ProducerThread>();
    startProducer(0);
}

PlayPicture::~PlayPicture() {
    if (!mProducer)
        return;
    mProducer->finish();
    mTexture->unmapPbo(mProducedBuffer);
}

uint32_t PlayPicture::bufferOf(int frameIndex) const {
    return static_cast<uint32_t>(frameIndex) & (mTexture->getNumBuffers() - 1);
}

void PlayPicture::upload(int frameIndex) {
    const uint32_t buffer = bufferOf(frameIndex);
    switch (mUpload) {
    case PlayUpload::HOST:
        mTexture->copyHostBufToGLTex(buffer);
        break;
    case PlayUpload::PBO:
        mTexture->copyHostBufToPBO(buffer);
        mTexture->copyPBOToGLTex(buffer);
        break;
    case PlayUpload::PRODUCER:
        uploadFromProducer(buffer);
        break;
    }
}

void PlayPicture::startProducer(uint32_t buffer) {
    mProducedBuffer = buffer;
    mTexture->mapPbo(buffer);
    mProducer->start([texture = mTexture.get(), buffer] {
        if (texture->getPboPtr(buffer))
            std::memcpy(texture->getAlignedPboPtr(buffer), texture->getHostBufPtr(buffer),
                        size_t{texture->getPitch()} * texture->getHeight());
    });
}

void PlayPicture::uploadFromProducer(uint32_t buffer) {
    mProducer->finish();
    if (mProducedBuffer != buffer) { // the frames do not follow each other: the picture is new
        mTexture->unmapPbo(mProducedBuffer);
        startProducer(buffer);
        mProducer->finish();
    }
    mTexture->unmapPbo(buffer);
    mTexture->copyPBOToGLTex(buffer);
    startProducer((buffer + 1) & (mTexture->getNumBuffers() - 1));
}

float PlayPicture::verticalShift(int frameIndex) const {
    return mTexture->getInterlacedTextureOffset(static_cast<int>(bufferOf(frameIndex)));
}

float PlayPicture::aspect() const {
    return static_cast<float>(getFrameHeight()) / static_cast<float>(getWidth());
}

std::unique_ptr<Texture> uploadedFile(const std::string& file) {
    PlaySource source;
    source.file = file;
    PlayLayout layout;
    layout.isFiltered = true;
    return build(source, layout);
}
