// What a draw costs beside the least that it can cost.
//
//   parameter-by-name   limit: one string made of the name, one look-up in a map by it, and the copy of four
//                       floats; array, four-floats: the two forms of Shader::setCgParamValue(). The size says
//                       whether a string holds the name in itself or allocates.
//   plane-render        limit: the OpenGL calls of a draw, of the plane's own buffers; render:
//                       VertexListPlane::render(). The size is the grid of cells.

#include "BenchmarkRow.h"

#include <FwZel/Shader.h>
#include <FwZel/VertexListPlane.h>
#include <HeadlessContext.h>

#include <epoxy/gl.h>

#include <array>
#include <cstddef>
#include <cstring>
#include <map>
#include <memory>
#include <string>

namespace {

using Vector = std::array<float, 4>;

// Names of one program's parameters; a program of a graphics layer has about as many.
constexpr std::array<const char*, 12> SHORT_NAMES = {"crop",   "colour", "matte",   "gain",
                                                     "lift",   "gamma",  "offset",  "scale",
                                                     "shadow", "key",    "opacity", "border"};
constexpr std::array<const char*, 12> LONG_NAMES = {
    "layer.cropOfTheInputPicture",   "layer.colourOfTheMatte",       "layer.matteEdgeSoftness",
    "layer.gainOfTheHighlights",     "layer.liftOfTheShadows",       "layer.gammaOfTheMidtones",
    "layer.offsetOnTheOutput",       "layer.scaleOnTheOutput",       "layer.shadowDirectionAndSize",
    "layer.keyLevelAndTransparency", "layer.opacityOfTheWholeLayer", "layer.borderColourAndWidth"};
constexpr size_t ASKED = 7;

constexpr Vector VALUES = {1, 2, 3, 4};

void addParameters(const char* group, const std::array<const char*, 12>& names) {
    std::map<std::string, Vector> entries;
    const auto shader = std::make_shared<Shader>(Shader::TYPE_FRAGMENT, FWZEL_CG_PROGRAM, "Cg_Main");
    for (const char* const name : names) {
        entries[name] = {};
        shader->addCgParam(name, 4, 1);
    }
    // Through a pointer that the compiler cannot follow: it would know the name's length.
    const auto asked = [name = names[ASKED]] {
        const char* opaque = name;
        benchmark::DoNotOptimize(opaque);
        return opaque;
    };
    addLimit(group, 0, [=]() mutable {
        const std::string name = asked();
        const auto entry = entries.find(name);
        if (entry != entries.end())
            entry->second = VALUES;
    });
    addRow(std::string(group) + "/array", 0, [=] { shader->setCgParamValue(asked(), VALUES.data()); });
    addRow(std::string(group) + "/four-floats", 0, [=] { shader->setCgParamValue(asked(), 1, 2, 3, 4); });
}

/// A plane whose buffers can be drawn without it.
class OpenPlane : public VertexListPlane {
public:
    explicit OpenPlane(uint32_t cells) : VertexListPlane(cells, cells, 1.0F, nullptr) {}

    void drawByHand() const {
        const auto at = [](size_t bytes) { return reinterpret_cast<const void*>(bytes); };
        constexpr GLsizei STRIDE = sizeof(VertexData);
        glBindBuffer(GL_ARRAY_BUFFER, mVertexDataBufferID);
        glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, mIndexDataBufferID);
        glEnableClientState(GL_VERTEX_ARRAY);
        glVertexPointer(3, GL_FLOAT, STRIDE, at(offsetof(VertexData, posX)));
        glEnableClientState(GL_TEXTURE_COORD_ARRAY);
        glTexCoordPointer(2, GL_FLOAT, STRIDE, at(offsetof(VertexData, texX)));
        glEnableClientState(GL_NORMAL_ARRAY);
        glNormalPointer(GL_FLOAT, STRIDE, at(offsetof(VertexData, nX)));
        glEnableClientState(GL_COLOR_ARRAY);
        glColorPointer(4, GL_FLOAT, STRIDE, at(offsetof(VertexData, colR)));
        glDrawElements(GL_TRIANGLES, static_cast<GLsizei>(mNumIndices), GL_UNSIGNED_INT, at(0));
        glFlush();
        glDisableClientState(GL_VERTEX_ARRAY);
        glDisableClientState(GL_TEXTURE_COORD_ARRAY);
        glDisableClientState(GL_NORMAL_ARRAY);
        glDisableClientState(GL_COLOR_ARRAY);
        glBindBuffer(GL_ARRAY_BUFFER, 0);
        glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
    }
};

void addPlane(uint32_t cells) {
    const Shared<OpenPlane> plane([=] { return std::make_unique<OpenPlane>(cells); });
    const std::string side = std::to_string(cells);
    const std::string group = std::string("plane-render/").append(side).append("x").append(side);
    addLimit(group, 0, [=] { plane->drawByHand(); });
    addRow(group + "/render", 0, [=] { plane->render(); });
}

/// So small that drawing the pixels does not hide the calls.
void drawIntoSmallFramebuffer() {
    constexpr GLsizei SIDE = 4;
    GLuint texture = 0;
    GLuint framebuffer = 0;
    glGenTextures(1, &texture);
    glBindTexture(GL_TEXTURE_2D, texture);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, SIDE, SIDE, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    glBindTexture(GL_TEXTURE_2D, 0);
    glGenFramebuffers(1, &framebuffer);
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture, 0);
    glViewport(0, 0, SIDE, SIDE);
}

} // namespace

void addRows() {
    static const host::HeadlessContext context;
    drawIntoSmallFramebuffer();
    addParameters("parameter-by-name/short", SHORT_NAMES);
    addParameters("parameter-by-name/long", LONG_NAMES);
    addPlane(1);
    addPlane(16);
}
