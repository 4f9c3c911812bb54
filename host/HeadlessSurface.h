#ifndef HOST_HEADLESSSURFACE_H
#define HOST_HEADLESSSURFACE_H

#include "HeadlessContext.h"
#include "Surface.h"

#include <FwZel/Texture.h>

#include <memory>

namespace host {

/// A surface in memory: a texture of the library, of four bytes a pixel, drawn into by its FBO and read back
/// by its PBO.
class HeadlessSurface : public Surface {
public:
    /// @throw std::runtime_error  there is no context, it lacks what the texture needs, or the size is beyond
    ///                            what it takes
    HeadlessSurface(uint32_t width, uint32_t height);

    uint32_t getWidth() const override { return mTarget->getWidth(); }
    uint32_t getHeight() const override { return mTarget->getHeight(); }
    void beginFrame() override { bindTarget(); }
    void readFrame(std::vector<unsigned char>& pixels) override;
    void present() override {}
    std::vector<SurfaceEvent> takeEvents() override { return {}; }
    void wait(double seconds) override;
    bool isWindow() const override { return false; }
    void setTitle(const std::string& /*title*/) override {}
    void toggleFullScreen() override {}

private:
    void bindTarget();

    HeadlessContext mContext;
    std::unique_ptr<Texture> mTarget;
};

} // namespace host

#endif
