#ifndef FWZEL_FWDEBUGFONT_H
#define FWZEL_FWDEBUGFONT_H

#include <FwZel/Export.h>

#include <cstdarg>

/// A text cursor for an on-screen debug overlay: turns a pixel position into an OpenGL raster position and
/// steps one line down per call. The host draws the text. All operations and data are class-wide; there are
/// no objects of it.
///
/// The screen spans -4.0 to +4.0 from left to right and +4.0 to -4.0 from top to bottom at depth -10.0,
/// before the host's modelview and projection matrices.
///
/// Thread: the render thread; setPos() and setColor() need the host's context current.
class FWZEL_API FWDebugFont {
public:
    /// Puts the cursor at a position in screen pixels, y downwards.
    static void setPosition(float x, float y);

    /// The screen size in pixels that the cursor refers to; 480 x 270 at first, not checked.
    static void setScreenRes(float x, float y);

    /// Sets the raster position for the next line (glRasterPos3f) and moves the cursor 12 pixels down.
    static void setPos();

    /// Sets the current colour (glColor4f). OpenGL takes it over with the next raster position.
    static void setColor(float r, float g, float b, float a);

    /// Does nothing: no text is drawn.
    static void printf(const char* format, ...) __attribute__((format(printf, 1, 2)));

    /// Formats into a newly allocated string, which the caller frees with free().
    /// @param retp  receives the string; not to be used on failure
    /// @return its length, or -1 on failure
    static int my_vsprintf(char** retp, const char* format, va_list ap) __attribute__((format(printf, 2, 0)));

    static float mPosX; ///< cursor in screen pixels
    static float mPosY; ///< cursor in screen pixels, y downwards
    static float mResX; ///< screen width in pixels
    static float mResY; ///< screen height in pixels
    static float mX;    ///< raster position last computed by setPos()
    static float mY;    ///< raster position last computed by setPos()
    static float mZ;    ///< depth of the raster position

private:
    FWDebugFont() = delete;
};

#endif
