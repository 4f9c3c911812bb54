#ifndef FUZZ_FUZZEDTEXTURE_H
#define FUZZ_FUZZEDTEXTURE_H

#include <fixture/GuardedTexture.h>
#include <fixture/TexArgs.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <cstdlib>

/// Ends the run as a finding.
inline void require(bool isTrue) {
    if (!isTrue)
        std::abort();
}

/// A texture for the readers to fill, without OpenGL.
class FuzzedTexture {
public:
    FuzzedTexture() : mGuarded((takeOpenGlAway(), texArgs(1, 1))) {}

    Texture& texture() { return mGuarded.texture; }

    /// Gives the texture another description and a host buffer that nobody has touched.
    void describeAs(const Texture::TexArgs& args) {
        texture().setArgsForTestPattern(args);
        mGuarded.reset();
    }

    /// Whether nothing was written but the first bytes of each row.
    bool isUntouchedBut(std::size_t rowBytes) const {
        const Texture& described = mGuarded.texture;
        std::size_t untouched = 0;
        std::size_t row = GuardedTexture::GUARD_BYTES;
        for (uint32_t y = 0; y < described.getHeight(); ++y, row += described.getPitch()) {
            if (!hasNothingFrom(untouched, row))
                return false;
            untouched = row + rowBytes;
        }
        return hasNothingFrom(untouched, mGuarded.memory().size());
    }

private:
    static void takeOpenGlAway() {
        epoxy_glGenTextures = [](GLsizei, GLuint*) {};
        epoxy_glBindTexture = [](GLenum, GLuint) {};
        epoxy_glTexParameteri = [](GLenum, GLenum, GLint) {};
        epoxy_glTexImage2D = [](GLenum, GLint, GLint, GLsizei, GLsizei, GLint, GLenum, GLenum, const void*) {
        };
        epoxy_glDeleteTextures = [](GLsizei, const GLuint*) {};
    }

    bool hasNothingFrom(std::size_t begin, std::size_t end) const {
        const auto memory = mGuarded.memory().begin();
        return std::all_of(memory + static_cast<std::ptrdiff_t>(begin),
                           memory + static_cast<std::ptrdiff_t>(end),
                           [](uint8_t byte) { return byte == GuardedTexture::UNTOUCHED; });
    }

    GuardedTexture mGuarded;
};

#endif
