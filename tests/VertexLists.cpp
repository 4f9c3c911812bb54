#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListLines.h>
#include <FwZel/VertexListPlane.h>

#include <fixture/GlCallRecorder.h>
#include <fixture/GlTest.h>

#include <dlfcn.h>

#include <array>
#include <cmath>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <memory>
#include <optional>
#include <random>
#include <type_traits>

namespace {

using Vertex = VertexList::VertexData;

constexpr size_t HOST_ALIGNMENT = 128;

/// Number of the allocation of host arrays that fails, counted down from 0; negative for none.
int failingAllocation = -1;

} // namespace

// Stands before the C library's. Host arrays come with old contents, as memory that was used before does.
extern "C" __attribute__((visibility("default"))) void* memalign(size_t alignment, size_t bytes) noexcept {
    static const auto real = reinterpret_cast<void* (*)(size_t, size_t)>(dlsym(RTLD_NEXT, "memalign"));
    if (alignment == HOST_ALIGNMENT && failingAllocation-- == 0)
        return nullptr;
    void* const memory = real(alignment, bytes);
    if (memory && alignment == HOST_ALIGNMENT)
        std::memset(memory, 0xCD, bytes);
    return memory;
}

namespace {

/// Lets an allocation of host arrays fail, the first or a later one, while it exists.
class FailingAllocation {
public:
    explicit FailingAllocation(int number) { failingAllocation = number; }
    ~FailingAllocation() { failingAllocation = -1; }
};

/// Watches every entry point that a shape may call, and those that a shape might call and must not.
class RecordedDrawing : public GlCallRecorder {
public:
    RecordedDrawing() {
        watch<epoxy_glGenBuffers>("glGenBuffers");
        watch<epoxy_glBindBuffer>("glBindBuffer");
        watch<epoxy_glBufferData>("glBufferData");
        watch<epoxy_glEnableClientState>("glEnableClientState");
        watch<epoxy_glDisableClientState>("glDisableClientState");
        watch<epoxy_glVertexPointer>("glVertexPointer");
        watch<epoxy_glTexCoordPointer>("glTexCoordPointer");
        watch<epoxy_glNormalPointer>("glNormalPointer");
        watch<epoxy_glColorPointer>("glColorPointer");
        watch<epoxy_glPrimitiveRestartIndexNV>("glPrimitiveRestartIndexNV");
        watch<epoxy_glLineWidth>("glLineWidth");
        watch<epoxy_glDrawElements>("glDrawElements");
        watch<epoxy_glFlush>("glFlush");

        watch<epoxy_glBufferSubData>("glBufferSubData");
        watch<epoxy_glMapBuffer>("glMapBuffer");
        watch<epoxy_glDeleteBuffers>("glDeleteBuffers");
        watch<epoxy_glClientActiveTexture>("glClientActiveTexture");
        watch<epoxy_glEnable>("glEnable");
        watch<epoxy_glDisable>("glDisable");
        watch<epoxy_glIsBuffer>("glIsBuffer");
        watch<epoxy_glGetBufferParameteriv>("glGetBufferParameteriv");
        watch<epoxy_glGetIntegerv>("glGetIntegerv");
        watch<epoxy_glGetError>("glGetError");
    }
};

using Calls = std::vector<std::string>;

Calls operator+(Calls first, const Calls& second) {
    first.insert(first.end(), second.begin(), second.end());
    return first;
}

Calls uploadCalls(GLenum target, GLuint buffer, const void* data, size_t bytes) {
    return {glCall("glBindBuffer", target, buffer),
            glCall("glBufferData", target, bytes, data, GL_STATIC_DRAW), glCall("glBindBuffer", target, 0)};
}

Calls vertexUpload(const VertexList& list) {
    return uploadCalls(GL_ARRAY_BUFFER, list.mVertexDataBufferID, list.mVertices, list.mNumVertices * 48);
}

Calls indexUpload(const VertexList& list) {
    return uploadCalls(GL_ELEMENT_ARRAY_BUFFER, list.mIndexDataBufferID, list.mIndices, list.mNumIndices * 4);
}

Calls bothBuffersGenerated(const VertexList& list) {
    return {glCall("glGenBuffers", 1, &list.mVertexDataBufferID),
            glCall("glGenBuffers", 1, &list.mIndexDataBufferID)};
}

/// A whole render(), with what the primitive mode adds before the draw.
Calls drawCalls(const VertexList& list, const Calls& ofTheMode) {
    return Calls{glCall("glBindBuffer", GL_ARRAY_BUFFER, list.mVertexDataBufferID),
                 glCall("glBindBuffer", GL_ELEMENT_ARRAY_BUFFER, list.mIndexDataBufferID),
                 glCall("glEnableClientState", GL_VERTEX_ARRAY),
                 glCall("glVertexPointer", 3, GL_FLOAT, 48, 0),
                 glCall("glEnableClientState", GL_TEXTURE_COORD_ARRAY),
                 glCall("glTexCoordPointer", 2, GL_FLOAT, 48, 12),
                 glCall("glEnableClientState", GL_NORMAL_ARRAY),
                 glCall("glNormalPointer", GL_FLOAT, 48, 20),
                 glCall("glEnableClientState", GL_COLOR_ARRAY),
                 glCall("glColorPointer", 4, GL_FLOAT, 48, 32)} +
           ofTheMode +
           Calls{glCall("glDrawElements", list.mPrimitiveType, list.mNumIndices, GL_UNSIGNED_INT, 0),
                 glCall("glFlush"),
                 glCall("glDisableClientState", GL_VERTEX_ARRAY),
                 glCall("glDisableClientState", GL_TEXTURE_COORD_ARRAY),
                 glCall("glDisableClientState", GL_NORMAL_ARRAY),
                 glCall("glDisableClientState", GL_COLOR_ARRAY),
                 glCall("glBindBuffer", GL_ARRAY_BUFFER, 0),
                 glCall("glBindBuffer", GL_ELEMENT_ARRAY_BUFFER, 0)};
}

template <class Element>
std::vector<Element> bufferContents(GLenum target, GLuint buffer) {
    glBindBuffer(target, buffer);
    GLint bytes = 0;
    glGetBufferParameteriv(target, GL_BUFFER_SIZE, &bytes);
    std::vector<Element> contents(static_cast<size_t>(bytes) / sizeof(Element));
    glGetBufferSubData(target, 0, bytes, contents.data());
    glBindBuffer(target, 0);
    return contents;
}

std::vector<uint32_t> bits(const Vertex* vertices, size_t count) {
    std::vector<uint32_t> words(count * sizeof(Vertex) / sizeof(uint32_t));
    if (count > 0)
        std::memcpy(words.data(), vertices, count * sizeof(Vertex));
    return words;
}

/// What both buffer objects of a shape hold, to the bit.
void expectUploaded(const VertexList& list, const std::vector<Vertex>& vertices,
                    const std::vector<unsigned int>& indices) {
    const auto uploaded = bufferContents<Vertex>(GL_ARRAY_BUFFER, list.mVertexDataBufferID);
    EXPECT_EQ(bits(uploaded.data(), uploaded.size()), bits(vertices.data(), vertices.size()));
    EXPECT_EQ(bufferContents<unsigned int>(GL_ELEMENT_ARRAY_BUFFER, list.mIndexDataBufferID), indices);
    EXPECT_EQ(list.mNumVertices, vertices.size());
    EXPECT_EQ(list.mNumIndices, indices.size());
}

Vertex position(float x, float y, float z = 0) {
    return {x, y, z, 0, 0, 0, 0, 0, 0, 0, 0, 0};
}

/// A point whose every field is set, as a host may give it to a polyline.
Vertex point(float x, float y, float z) {
    return {x, y, z, 4, 5, 6, 7, 8, 9, 10, 11, 12};
}

/// A shape of the host's own, without host arrays: it fills its buffers itself and tells no number of
/// vertices.
class HostShape : public VertexList {
public:
    HostShape(uint32_t primitiveType, const std::vector<Vertex>& vertices,
              const std::vector<unsigned int>& indices)
        : VertexList(nullptr, primitiveType) {
        mNumIndices = static_cast<unsigned int>(indices.size());
        mVertexDataBufferID = filled(GL_ARRAY_BUFFER, vertices.data(), vertices.size() * sizeof(Vertex));
        mIndexDataBufferID = filled(GL_ELEMENT_ARRAY_BUFFER, indices.data(), indices.size() * sizeof(GLuint));
    }

private:
    static GLuint filled(GLenum target, const void* data, size_t bytes) {
        GLuint buffer = 0;
        glGenBuffers(1, &buffer);
        glBindBuffer(target, buffer);
        glBufferData(target, static_cast<GLsizeiptr>(bytes), data, GL_STATIC_DRAW);
        glBindBuffer(target, 0);
        return buffer;
    }
};

using Rgba = std::array<uint8_t, 4>;

/// A framebuffer to draw into, cleared to white, without blending or depth.
class Canvas {
public:
    Canvas(int width, int height) : mWidth(width), mHeight(height) {
        glGenFramebuffers(1, &mFramebuffer);
        glGenRenderbuffers(1, &mColour);
        glBindRenderbuffer(GL_RENDERBUFFER, mColour);
        glRenderbufferStorage(GL_RENDERBUFFER, GL_RGBA8, width, height);
        glBindFramebuffer(GL_FRAMEBUFFER, mFramebuffer);
        glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_RENDERBUFFER, mColour);
        glViewport(0, 0, width, height);
        glClearColor(1, 1, 1, 1);
        glClear(GL_COLOR_BUFFER_BIT);
    }
    ~Canvas() {
        glBindFramebuffer(GL_FRAMEBUFFER, 0);
        glDeleteFramebuffers(1, &mFramebuffer);
        glDeleteRenderbuffers(1, &mColour);
    }
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    /// Rows from the bottom up.
    std::vector<Rgba> pixels() const {
        std::vector<Rgba> read(static_cast<size_t>(mWidth) * static_cast<size_t>(mHeight));
        glReadPixels(0, 0, mWidth, mHeight, GL_RGBA, GL_UNSIGNED_BYTE, read.data());
        return read;
    }

    /// The picture from the top down, '#' where something was drawn.
    std::vector<std::string> picture() const {
        std::vector<std::string> rows(static_cast<size_t>(mHeight));
        const std::vector<Rgba> read = pixels();
        for (size_t i = 0; i < read.size(); ++i)
            rows[rows.size() - 1 - i / static_cast<size_t>(mWidth)] +=
                read[i] == Rgba{255, 255, 255, 255} ? '.' : '#';
        return rows;
    }

private:
    int mWidth;
    int mHeight;
    GLuint mFramebuffer = 0;
    GLuint mColour = 0;
};

/// With a canvas of 8 x 8 pixels to draw into.
class VertexLists : public GlTest {
protected:
    void SetUp() override {
        GlTest::SetUp();
        if (!IsSkipped() && !HasFatalFailure())
            mCanvas.emplace(8, 8);
    }
    void TearDown() override {
        if (mCanvas) {
            glDisableClientState(GL_PRIMITIVE_RESTART_NV);
            glLineWidth(1);
        }
        mCanvas.reset();
        GlTest::TearDown();
    }

    std::optional<Canvas> mCanvas;
};

static_assert(!std::is_copy_constructible_v<VertexList> && !std::is_default_constructible_v<VertexList>);
static_assert(!std::is_copy_constructible_v<VertexListPlane> && !std::is_copy_assignable_v<VertexListPlane>);
static_assert(!std::is_copy_constructible_v<VertexListBox> && !std::is_copy_assignable_v<VertexListBox>);
static_assert(!std::is_copy_constructible_v<VertexListLines> && !std::is_copy_assignable_v<VertexListLines>);
static_assert(!std::is_polymorphic_v<VertexListPlane>);

// --- Drawing

TEST_F(VertexLists, BaseAloneHoldsNothingAndMakesNoCall) {
    RecordedDrawing recorded;
    Shader* const shader = reinterpret_cast<Shader*>(&failingAllocation);
    {
        VertexList list(shader, GL_LINE_STRIP);
        EXPECT_EQ(list.mShader, shader);
        EXPECT_EQ(list.mPrimitiveType, 3U);
        EXPECT_EQ(list.mVertices, nullptr);
        EXPECT_EQ(list.mIndices, nullptr);
        EXPECT_EQ(list.mVertexDataBufferID, 0U);
        EXPECT_EQ(list.mIndexDataBufferID, 0U);
        EXPECT_EQ(list.mNumVertices, 0U);
        EXPECT_EQ(list.mNumIndices, 0U);
        EXPECT_EQ(list.mLineWidth, 1.0F);
        EXPECT_EQ(VertexList::RESTART_INDEX, -1);
        list.setLineWidth(3);
        list.render();
    }
    EXPECT_EQ(recorded.take(), Calls{});
}

struct Mode {
    const char* name;
    GLenum type;
    Calls calls;
};

class EveryMode : public VertexLists, public ::testing::WithParamInterface<Mode> {};

TEST_P(EveryMode, IsDrawnByOneSequenceOfCalls) {
    HostShape shape(GetParam().type, {position(-1, -1), position(1, -1), position(0, 1)}, {0, 1, 2});
    HostShape withoutIndices(GetParam().type, {}, {});
    shape.setLineWidth(3);
    withoutIndices.setLineWidth(3);
    RecordedDrawing recorded;
    shape.render();
    EXPECT_EQ(recorded.take(), drawCalls(shape, GetParam().calls));
    withoutIndices.render();
    EXPECT_EQ(recorded.take(), drawCalls(withoutIndices, GetParam().calls));
}

const Calls RESTART = {glCall("glPrimitiveRestartIndexNV", 0xFFFFFFFFU),
                       glCall("glEnableClientState", 0x8558)};
const Calls LINE_WIDTH = {glCall("glLineWidth", 3.0F)};

INSTANTIATE_TEST_SUITE_P(VertexLists, EveryMode,
                         ::testing::Values(Mode{"Triangles", GL_TRIANGLES, {}},
                                           Mode{"TriangleStrip", GL_TRIANGLE_STRIP, RESTART},
                                           Mode{"Polygon", GL_POLYGON, RESTART},
                                           Mode{"LineStrip", GL_LINE_STRIP, LINE_WIDTH},
                                           Mode{"Lines", GL_LINES, {}}, Mode{"LineLoop", GL_LINE_LOOP, {}},
                                           Mode{"Points", GL_POINTS, {}}, Mode{"Quads", GL_QUADS, {}}),
                         [](const auto& mode) { return std::string(mode.param.name); });

TEST_F(VertexLists, HostsOwnStripRestartsAtTheRestartIndex) {
    const Canvas canvas(5, 1);
    HostShape shape(GL_TRIANGLE_STRIP,
                    {position(-1, -1), position(-1, 1), position(-0.6F, -1), position(-0.6F, 1),
                     position(0.6F, -1), position(0.6F, 1), position(1, -1), position(1, 1)},
                    {0, 1, 2, 3, static_cast<unsigned int>(VertexList::RESTART_INDEX), 4, 5, 6, 7});
    shape.render();
    EXPECT_EQ(canvas.picture(), std::vector<std::string>{"#...#"});
}

// --- Plane

/// Each step rounded to single precision.
float rounded(float value) {
    const volatile float single = value;
    return single;
}

struct Mesh {
    std::vector<Vertex> vertices;
    std::vector<unsigned int> indices;
};

Mesh expectedPlane(unsigned int width, unsigned int height, float aspect) {
    Mesh mesh;
    for (unsigned int y = 0; y <= height; ++y) {
        for (unsigned int x = 0; x <= width; ++x) {
            const float fx = static_cast<float>(x);
            const float fy = static_cast<float>(y);
            const float u = rounded(rounded(1 / static_cast<float>(width)) * fx);
            const float v = rounded(fy * rounded(1 / static_cast<float>(height)));
            const float posX = rounded(fx * rounded(2 / static_cast<float>(width))) - 1;
            const float posY = rounded(fy * rounded(-2 * aspect / static_cast<float>(height))) + aspect;
            mesh.vertices.push_back({posX, posY, 0, u, v, 0, 0, 1, u, v, 0, 1});
        }
    }
    for (unsigned int y = 0; y < height; ++y) {
        for (unsigned int x = 0; x < width; ++x) {
            const unsigned int a = y * (width + 1) + x;
            const unsigned int c = a + width + 1;
            mesh.indices.insert(mesh.indices.end(), {a, a + 1, c, c, c + 1, a + 1});
        }
    }
    return mesh;
}

TEST_F(VertexLists, PlaneIsAGridToTheBit) {
    for (const auto& [width, height, aspect] :
         {std::tuple(1U, 1U, 0.5625F), {2U, 1U, 0.5F}, {41U, 3U, 0.75F}, {7U, 41U, 1.0F / 3.0F}}) {
        SCOPED_TRACE(width);
        const VertexListPlane plane(width, height, aspect, nullptr);
        const Mesh expected = expectedPlane(width, height, aspect);
        expectUploaded(plane, expected.vertices, expected.indices);
        EXPECT_EQ(bits(plane.mVertices, plane.mNumVertices),
                  bits(expected.vertices.data(), expected.vertices.size()));
        EXPECT_EQ(std::vector<unsigned int>(plane.mIndices, plane.mIndices + plane.mNumIndices),
                  expected.indices);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(plane.mVertices) % HOST_ALIGNMENT, 0U);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(plane.mIndices) % HOST_ALIGNMENT, 0U);
        EXPECT_EQ(plane.getNormalizedVertexHeight(), aspect + aspect);
    }
}

TEST_F(VertexLists, PlaneOf41CellsEndsOneStepBelowOne) {
    const VertexListPlane plane(41, 1, 1, nullptr);
    EXPECT_EQ(plane.mVertices[41].texX, 0.99999994F);
    EXPECT_EQ(plane.mVertices[41].posX, 0.9999999F);
}

TEST_F(VertexLists, PlaneUploadsEachBufferOnceAndLeavesThemAlive) {
    RecordedDrawing recorded;
    GLuint vertexBuffer = 0;
    {
        VertexListPlane plane(2, 1, 0.5F, nullptr);
        vertexBuffer = plane.mVertexDataBufferID;
        EXPECT_EQ(recorded.take(),
                  Calls{glCall("glGenBuffers", 1, &plane.mVertexDataBufferID)} + vertexUpload(plane) +
                      Calls{glCall("glGenBuffers", 1, &plane.mIndexDataBufferID)} + indexUpload(plane));
        plane.render();
        EXPECT_EQ(recorded.take(), drawCalls(plane, {}));
    }
    EXPECT_EQ(recorded.take(), Calls{});
    EXPECT_TRUE(glIsBuffer(vertexBuffer));
    recorded.take();
}

TEST_F(VertexLists, PlaneWithoutCellsDrawsNoIndices) {
    RecordedDrawing recorded;
    for (const auto& [width, height] : {std::pair(0U, 3U), {3U, 0U}, {0U, 0U}}) {
        VertexListPlane plane(width, height, 1, nullptr);
        EXPECT_EQ(plane.mNumIndices, 0U);
        recorded.take();
        plane.render();
        EXPECT_EQ(recorded.take(), drawCalls(plane, {}));
    }
}

TEST_F(VertexLists, PlaneThatCannotBeCountedIsNotBuilt) {
    RecordedDrawing recorded;
    constexpr uint32_t HUGE_COUNT = std::numeric_limits<uint32_t>::max();
    for (const auto& [width, height] :
         {std::pair(65536U, 65536U), {HUGE_COUNT, HUGE_COUNT}, {HUGE_COUNT, 0U}}) {
        VertexListPlane plane(width, height, 2, nullptr);
        plane.render();
        EXPECT_EQ(plane.getNormalizedVertexHeight(), 4.0F);
        EXPECT_EQ(recorded.take(), Calls{});
    }
}

TEST_F(VertexLists, PlaneShowsATextureTexelByPixelFromTheTopDown) {
    constexpr int WIDTH = 83;
    constexpr int HEIGHT = 47;
    std::vector<Rgba> texels(WIDTH * HEIGHT);
    std::mt19937 random(1);
    for (Rgba& texel : texels)
        for (uint8_t& component : texel)
            component = static_cast<uint8_t>(random());

    GLuint texture = 0;
    glGenTextures(1, &texture);
    glBindTexture(GL_TEXTURE_2D, texture);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, WIDTH, HEIGHT, 0, GL_RGBA, GL_UNSIGNED_BYTE, texels.data());
    glEnable(GL_TEXTURE_2D);
    glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_REPLACE);
    for (const auto& [width, height] : {std::pair(1U, 1U), {8U, 5U}, {41U, 3U}}) {
        SCOPED_TRACE(width);
        const Canvas canvas(WIDTH, HEIGHT);
        VertexListPlane plane(width, height, 1, nullptr);
        plane.render();
        const std::vector<Rgba> pixels = canvas.pixels();
        for (size_t row = 0; row < HEIGHT; ++row)
            for (size_t column = 0; column < WIDTH; ++column)
                ASSERT_EQ(pixels[(HEIGHT - 1 - row) * WIDTH + column], texels[row * WIDTH + column])
                    << "row " << row << ", column " << column;
    }
    glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_MODULATE);
    glDisable(GL_TEXTURE_2D);
    glDeleteTextures(1, &texture);
}

// --- Box

std::vector<Vertex> corners(float startX, float endX, float startY, float endY) {
    return {position(startX, startY), position(endX, startY), position(startX, endY), position(endX, endY)};
}

const std::vector<unsigned int> OUTLINE = {0, 1, 3, 2, 0};

TEST_F(VertexLists, BoxUploadsItsOutlineOnlyWhenACoordinateChanged) {
    std::optional<RecordedDrawing> recorded(std::in_place);
    VertexListBox box(nullptr, 0, 1, 2, 3);
    const Calls upload = vertexUpload(box) + indexUpload(box);
    EXPECT_EQ(recorded->take(), bothBuffersGenerated(box) + upload);

    box.updateVertexData();
    EXPECT_EQ(recorded->take(), Calls{});
    box.setStartX(-0.0F);
    box.setEndX(1);
    box.updateVertexData();
    EXPECT_EQ(recorded->take(), Calls{});

    for (const auto set : {&VertexListBox::setStartX, &VertexListBox::setEndX, &VertexListBox::setStartY,
                           &VertexListBox::setEndY}) {
        (box.*set)(7);
        EXPECT_EQ(recorded->take(), Calls{});
        box.updateVertexData();
        EXPECT_EQ(recorded->take(), upload);
        box.updateVertexData();
        EXPECT_EQ(recorded->take(), Calls{});
    }
    box.setEndY(std::nanf(""));
    box.updateVertexData();
    box.updateVertexData();
    EXPECT_EQ(recorded->take(), upload + upload);

    recorded.reset();
    box.setEndY(8);
    box.setStartX(-7);
    box.updateVertexData();
    expectUploaded(box, corners(-7, 7, 7, 8), OUTLINE);
}

TEST_F(VertexLists, BoxAtAllZerosUploadsOnce) {
    std::optional<RecordedDrawing> recorded(std::in_place);
    VertexListBox box(nullptr, 0, 0, 0, 0);
    EXPECT_EQ(recorded->take(), bothBuffersGenerated(box) + vertexUpload(box) + indexUpload(box));
    box.updateVertexData();
    EXPECT_EQ(recorded->take(), Calls{});
    recorded.reset();
    expectUploaded(box, corners(0, 0, 0, 0), OUTLINE);
}

TEST_F(VertexLists, BoxIsDrawnAsAClosedOutline) {
    const auto pixelCentre = [](int pixel) { return (static_cast<float>(pixel) + 0.5F) / 4.0F - 1.0F; };
    VertexListBox box(nullptr, pixelCentre(1), pixelCentre(6), pixelCentre(2), pixelCentre(6));
    box.render();
    std::vector<std::string> picture = mCanvas->picture();
    for (const size_t row : {1U, 5U})
        for (const size_t column : {1U, 6U})
            picture[row][column] = '+'; // which pixels the ends of lines cover is the driver's affair
    EXPECT_EQ(picture, (std::vector<std::string>{"........", ".+####+.", ".#....#.", ".#....#.", ".#....#.",
                                                 ".+####+.", "........", "........"}));
}

// --- Polyline

const std::vector<Vertex> TRIANGLE = {point(1, 2, 3), point(-4, 5, -6), point(7, -8, 9)};
const std::vector<Vertex> TRIANGLE_POSITIONS = {position(1, 2, 3), position(-4, 5, -6), position(7, -8, 9)};

TEST_F(VertexLists, PolylineTakesPositionsAndClosesByItsFirstIndex) {
    expectUploaded(VertexListLines(nullptr, TRIANGLE, false), TRIANGLE_POSITIONS, {0, 1, 2});
    expectUploaded(VertexListLines(nullptr, TRIANGLE, true), TRIANGLE_POSITIONS, {0, 1, 2, 0});
}

TEST_F(VertexLists, PolylineUploadsAtEveryUpdateAndAtNoOtherTime) {
    std::optional<RecordedDrawing> recorded(std::in_place);
    VertexListLines lines(nullptr, TRIANGLE, true);
    const Calls upload = vertexUpload(lines) + indexUpload(lines);
    EXPECT_EQ(recorded->take(), bothBuffersGenerated(lines) + upload);
    lines.setVertexData({point(1, 1, 1), point(2, 2, 2), point(3, 3, 3)});
    EXPECT_EQ(recorded->take(), Calls{});
    lines.updateVertexData();
    lines.updateVertexData();
    EXPECT_EQ(recorded->take(), upload + upload);
    lines.setLineWidth(2.5F);
    lines.render();
    EXPECT_EQ(recorded->take(), drawCalls(lines, {glCall("glLineWidth", 2.5F)}));
    recorded.reset();
    expectUploaded(lines, {position(1, 1, 1), position(2, 2, 2), position(3, 3, 3)}, {0, 1, 2, 0});
}

TEST_F(VertexLists, PolylineFollowsAnotherNumberOfPointsAtTheNextUpdate) {
    for (const bool isLoop : {false, true}) {
        VertexListLines lines(nullptr, TRIANGLE, isLoop);
        for (const size_t count : {5U, 1U, 0U, 2U}) {
            SCOPED_TRACE(count);
            std::vector<Vertex> points;
            std::vector<Vertex> positions;
            std::vector<unsigned int> indices;
            for (unsigned int i = 0; i < count; ++i) {
                points.push_back(point(static_cast<float>(i), 0, 1));
                positions.push_back(position(static_cast<float>(i), 0, 1));
                indices.push_back(i);
            }
            if (isLoop)
                indices.push_back(0);
            const unsigned int indicesBefore = lines.mNumIndices;
            lines.setVertexData(points);
            EXPECT_EQ(lines.mNumIndices, indicesBefore);
            lines.updateVertexData();
            expectUploaded(lines, positions, indices);
        }
    }
}

TEST_F(VertexLists, PolylineWithoutPointsIsSkippedOnlyWhenClosed) {
    RecordedDrawing recorded;
    const Calls oneWide = {glCall("glLineWidth", 1.0F)};
    VertexListLines open(nullptr, {}, false);
    VertexListLines closed(nullptr, {}, true);
    EXPECT_EQ(closed.mNumIndices, 1U);
    recorded.take();
    open.render();
    EXPECT_EQ(recorded.take(), drawCalls(open, oneWide));
    closed.render();
    EXPECT_EQ(recorded.take(), Calls{});

    closed.setVertexData(TRIANGLE);
    closed.updateVertexData();
    recorded.take();
    closed.render();
    EXPECT_EQ(recorded.take(), drawCalls(closed, oneWide));
    closed.setVertexData({});
    closed.updateVertexData();
    recorded.take();
    closed.render();
    EXPECT_EQ(recorded.take(), Calls{});
}

// --- Memory short

TEST_F(VertexLists, PlaneWithoutMemoryHasNoBuffersAndIsNotDrawn) {
    RecordedDrawing recorded;
    for (const int number : {0, 1}) {
        const FailingAllocation failing(number);
        VertexListPlane plane(2, 1, 0.5F, nullptr);
        plane.render();
        EXPECT_EQ(plane.getNormalizedVertexHeight(), 1.0F);
        EXPECT_EQ(recorded.take(), Calls{});
    }
}

TEST_F(VertexLists, BoxAndPolylineWithoutMemoryGenerateBuffersAndNothingElse) {
    RecordedDrawing recorded;
    for (const int number : {0, 1}) {
        std::optional<FailingAllocation> failing(number);
        VertexListBox box(nullptr, 0, 1, 0, 1);
        EXPECT_EQ(recorded.take(), bothBuffersGenerated(box));
        failing.emplace(number);
        VertexListLines lines(nullptr, TRIANGLE, true);
        EXPECT_EQ(recorded.take(), bothBuffersGenerated(lines));
        failing.reset();

        box.setEndX(2);
        box.updateVertexData();
        box.render();
        lines.setVertexData({point(1, 2, 3)});
        lines.updateVertexData();
        lines.render();
        EXPECT_EQ(recorded.take(), Calls{});
    }
}

TEST_F(VertexLists, PolylineThatCannotGrowStaysWhatItWasUntilItCan) {
    VertexListLines lines(nullptr, TRIANGLE, true);
    lines.setVertexData({point(1, 0, 0), point(2, 0, 0), point(3, 0, 0), point(4, 0, 0)});
    for (const int number : {0, 1}) {
        const FailingAllocation failing(number);
        RecordedDrawing recorded;
        lines.updateVertexData();
        EXPECT_EQ(recorded.take(), Calls{});
        lines.render();
        EXPECT_EQ(recorded.take(), drawCalls(lines, {glCall("glLineWidth", 1.0F)}));
    }
    expectUploaded(lines, TRIANGLE_POSITIONS, {0, 1, 2, 0});
    lines.updateVertexData();
    expectUploaded(lines, {position(1, 0), position(2, 0), position(3, 0), position(4, 0)}, {0, 1, 2, 3, 0});
}

} // namespace
