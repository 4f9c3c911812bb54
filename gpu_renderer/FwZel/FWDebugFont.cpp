#include <FwZel/FWDebugFont.h>

#include <epoxy/gl.h>

#include <cstdio>

namespace {

constexpr float LINE_HEIGHT = 12.0F;
constexpr float HALF_EXTENT = 4.0F;

} // namespace

float FWDebugFont::mPosX = 0.0F;
float FWDebugFont::mPosY = 0.0F;
float FWDebugFont::mResX = 480.0F;
float FWDebugFont::mResY = 270.0F;
float FWDebugFont::mX = 0.0F;
float FWDebugFont::mY = 0.0F;
float FWDebugFont::mZ = -10.0F;

void FWDebugFont::setPosition(float x, float y) {
    mPosX = x;
    mPosY = y;
}

void FWDebugFont::setScreenRes(float x, float y) {
    mResX = x;
    mResY = y;
}

void FWDebugFont::setPos() {
    mX = (mPosX + mPosX) * HALF_EXTENT / mResX - HALF_EXTENT;
    mY = -((mPosY + mPosY) * HALF_EXTENT / mResY - HALF_EXTENT);
    glRasterPos3f(mX, mY, mZ);
    mPosY += LINE_HEIGHT;
}

void FWDebugFont::setColor(float r, float g, float b, float a) {
    glColor4f(r, g, b, a);
}

void FWDebugFont::printf(const char* /*format*/, ...) {}

int FWDebugFont::my_vsprintf(char** retp, const char* format, va_list ap) {
    return vasprintf(retp, format, ap);
}
