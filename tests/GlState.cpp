#include <fixture/FloatCanvas.h>
#include <fixture/GlState.h>
#include <fixture/GlTest.h>
#include <fixture/PictureFiles.h>
#include <fixture/SwappedEntryPoint.h>
#include <fixture/TexArgs.h>

#include <Cg/cgGL.h>
#include <FwZel/FWDebugFont.h>
#include <FwZel/Shader.h>
#include <FwZel/Texture.h>
#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListLines.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <array>
#include <functional>
#include <initializer_list>
#include <memory>
#include <optional>

namespace {

constexpr int HOSTS_UNIT = 2; // that is active

/// What an operation may change, and to what; no numbers: to anything, or not at all.
using Changes = GlState;
const std::vector<double> ANYTHING;

Changes operator+(Changes some, const Changes& others) {
    some.insert(others.begin(), others.end());
    return some;
}

/// A host's context, where every value that the library could touch differs from what it starts and ends
/// with.
class HostsContext {
public:
    HostsContext() {
        glGenTextures(static_cast<GLsizei>(mTextures.size()), mTextures.data());
        glGenBuffers(static_cast<GLsizei>(mBuffers.size()), mBuffers.data());
        glGenVertexArrays(1, &mVertexArray);
        glGenSamplers(1, &mSampler);
        glGenRenderbuffers(1, &mRenderbuffer);
        const char* const text = "#version 330 compatibility\nvoid main() { gl_FragColor = vec4(1); }";
        mProgram = glCreateShaderProgramv(GL_FRAGMENT_SHADER, 1, &text);
    }
    ~HostsContext() {
        if (mIsSet)
            restore();
        glUseProgram(0);
        glBindVertexArray(0);
        for (const GLenum target : BUFFER_TARGETS)
            glBindBuffer(target, 0);
        glDeleteTextures(static_cast<GLsizei>(mTextures.size()), mTextures.data());
        glDeleteBuffers(static_cast<GLsizei>(mBuffers.size()), mBuffers.data());
        glDeleteVertexArrays(1, &mVertexArray);
        glDeleteSamplers(1, &mSampler);
        glDeleteRenderbuffers(1, &mRenderbuffer);
        glDeleteProgram(mProgram);
    }
    HostsContext(const HostsContext&) = delete;
    HostsContext& operator=(const HostsContext&) = delete;

    /// Sets everything anew.
    void set() {
        if (mIsSet)
            restore();
        glPushAttrib(GL_ALL_ATTRIB_BITS);
        glPushClientAttrib(GL_CLIENT_ALL_ATTRIB_BITS);
        mIsSet = true;
        setBindings();
        setArrays();
        setFixedFunction();
        setPixelStore();
    }

private:
    static constexpr std::array<GLenum, 6> BUFFER_TARGETS = {GL_ARRAY_BUFFER,      GL_ELEMENT_ARRAY_BUFFER,
                                                             GL_PIXEL_PACK_BUFFER, GL_COPY_READ_BUFFER,
                                                             GL_COPY_WRITE_BUFFER, GL_UNIFORM_BUFFER};
    static constexpr std::array<GLenum, 5> TEXTURE_TARGETS = {GL_TEXTURE_1D, GL_TEXTURE_2D, GL_TEXTURE_3D,
                                                              GL_TEXTURE_RECTANGLE, GL_TEXTURE_CUBE_MAP};

    void restore() const {
        glBindFramebuffer(GL_FRAMEBUFFER, mCanvasName); // the attributes are those of its buffers
        glPopClientAttrib();
        glPopAttrib();
    }
    void setBindings() {
        auto texture = mTextures.begin();
        for (GLenum unit = 0; unit < GL_STATE_UNITS; ++unit) {
            glActiveTexture(GL_TEXTURE0 + unit);
            for (const GLenum target : TEXTURE_TARGETS)
                glBindTexture(target, *texture++);
            glBindSampler(unit, mSampler);
        }
        glActiveTexture(GL_TEXTURE0 + HOSTS_UNIT);
        glUseProgram(mProgram);
        glBindVertexArray(mVertexArray);
        for (size_t i = 0; i < mBuffers.size(); ++i) {
            glBindBuffer(BUFFER_TARGETS[i], mBuffers[i]);
            glBufferData(BUFFER_TARGETS[i], 4096, nullptr, GL_STATIC_DRAW);
        }
        glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0); // as textures expect it
        glBindRenderbuffer(GL_RENDERBUFFER, mRenderbuffer);
        glBindFramebuffer(GL_FRAMEBUFFER, mCanvasName);
    }
    static void setArrays() {
        glClientActiveTexture(GL_TEXTURE1);
        glTexCoordPointer(3, GL_SHORT, 8, nullptr);
        glVertexPointer(2, GL_SHORT, 8, nullptr);
        glNormalPointer(GL_SHORT, 8, nullptr);
        glColorPointer(3, GL_UNSIGNED_BYTE, 8, nullptr);
        for (const GLenum array : std::initializer_list<GLenum>{GL_VERTEX_ARRAY, GL_NORMAL_ARRAY,
                                                                GL_COLOR_ARRAY, GL_TEXTURE_COORD_ARRAY})
            glEnableClientState(array);
        glPrimitiveRestartIndexNV(77);
        glDisableClientState(GL_PRIMITIVE_RESTART_NV);
    }
    static void setFixedFunction() {
        for (const GLenum capability : std::initializer_list<GLenum>{
                 GL_SCISSOR_TEST, GL_DEPTH_TEST, GL_BLEND, GL_CULL_FACE, GL_LINE_SMOOTH, GL_TEXTURE_1D,
                 GL_ALPHA_TEST, GL_NORMALIZE, GL_COLOR_MATERIAL})
            glEnable(capability);
        glDisable(GL_DITHER);
        glViewport(1, 2, 5, 6);
        glScissor(1, 1, 6, 5);
        glDepthFunc(GL_GEQUAL);
        glDepthMask(GL_FALSE);
        glDepthRange(0.25, 0.75);
        glAlphaFunc(GL_GEQUAL, 0.25F);
        glStencilMask(3);
        glBlendFuncSeparate(GL_ONE, GL_SRC_ALPHA, GL_DST_ALPHA, GL_SRC_COLOR);
        glBlendEquationSeparate(GL_FUNC_SUBTRACT, GL_MAX);
        glBlendColor(0.25F, 0.5F, 0.75F, 0.125F);
        glColorMask(GL_TRUE, GL_FALSE, GL_TRUE, GL_FALSE);
        glClearColor(0.5F, 0.25F, 0.125F, 0.75F);
        glCullFace(GL_FRONT);
        glFrontFace(GL_CW);
        glPolygonMode(GL_FRONT_AND_BACK, GL_LINE);
        glLineWidth(3);
        glPointSize(2);
        glShadeModel(GL_FLAT);
        for (const GLenum mode : std::initializer_list<GLenum>{GL_MODELVIEW, GL_PROJECTION, GL_TEXTURE}) {
            glMatrixMode(mode);
            glLoadIdentity();
            glScalef(0.125F, 0.25F, 0.0625F);
        }
        glColor4f(0.25F, 0.5F, 0.75F, 0.5F);
        glNormal3f(1, 0, 0);
        glMultiTexCoord2f(GL_TEXTURE0 + HOSTS_UNIT, 0.25F, 0.5F);
        glRasterPos2f(0.5F, 0.5F);
    }
    /// Uploads and readbacks are made under these: what the library needs of them stays as it starts.
    static void setPixelStore() {
        glPixelStorei(GL_UNPACK_ALIGNMENT, 2);
        glPixelStorei(GL_PACK_ALIGNMENT, 2);
        glPixelStorei(GL_UNPACK_IMAGE_HEIGHT, 40);
        glPixelStorei(GL_PACK_IMAGE_HEIGHT, 40);
    }

    static GLuint currentFramebuffer() {
        GLint name = 0;
        glGetIntegerv(GL_FRAMEBUFFER_BINDING, &name);
        return static_cast<GLuint>(name);
    }

    const FloatCanvas mCanvas{8, 8};
    const GLuint mCanvasName = currentFramebuffer();
    std::array<GLuint, GL_STATE_UNITS * TEXTURE_TARGETS.size()> mTextures{};
    std::array<GLuint, BUFFER_TARGETS.size()> mBuffers{};
    GLuint mVertexArray = 0;
    GLuint mSampler = 0;
    GLuint mRenderbuffer = 0;
    GLuint mProgram = 0;
    bool mIsSet = false;
};

// --- What the headers say

std::string ofUnit(const char* binding, int unit) {
    return binding + std::string(" of unit ") + std::to_string(unit);
}

Changes textureAt(int unit, unsigned int name) {
    return {{ofUnit("TEXTURE_BINDING_2D", unit), {static_cast<double>(name)}}};
}

const Changes NOTHING;
const Changes TEXTURE_UNBOUND = textureAt(HOSTS_UNIT, 0);
const Changes UNPACK_UNBOUND = {{"PIXEL_UNPACK_BUFFER_BINDING", {0}}};
const Changes UNPACK_ALIGNED = {{"UNPACK_ALIGNMENT", {4}}};
const Changes PACK_UNBOUND = {{"PIXEL_PACK_BUFFER_BINDING", {0}}};
const Changes PACK_ALIGNED = {{"PACK_ALIGNMENT", {4}}};
const Changes COPY_UNBOUND = {{"COPY_WRITE_BUFFER_BINDING", {0}}};
/// With the buffers to draw and to read, which are the framebuffer's.
const Changes FRAMEBUFFER_UNBOUND = {{"DRAW_FRAMEBUFFER_BINDING", {0}},
                                     {"READ_FRAMEBUFFER_BINDING", {0}},
                                     {"DRAW_BUFFER", ANYTHING},
                                     {"READ_BUFFER", ANYTHING}};
const Changes SHAPE_UNBOUND = {{"ARRAY_BUFFER_BINDING", {0}}, {"ELEMENT_ARRAY_BUFFER_BINDING", {0}}};

Changes arraysOf(const char* array, bool hasSize) {
    Changes changes = {{array, {0}}};
    for (const char* const value : {"_TYPE", "_STRIDE", "_BUFFER_BINDING"})
        changes[std::string(array) + value] = ANYTHING;
    if (hasSize)
        changes[std::string(array) + "_SIZE"] = ANYTHING;
    return changes;
}

const Changes RENDERED =
    SHAPE_UNBOUND + arraysOf("VERTEX_ARRAY", true) + arraysOf("NORMAL_ARRAY", false) +
    arraysOf("COLOR_ARRAY", true) + arraysOf("TEXTURE_COORD_ARRAY", true) +
    Changes{{"CURRENT_COLOR", ANYTHING}, {"CURRENT_NORMAL", ANYTHING}, {"CURRENT_TEXTURE_COORDS", ANYTHING}};

struct Operation {
    const char* name;
    std::function<void()> run;
    Changes changes;
    std::function<void()> prepare = [] {}; ///< after the host has set its context
};

class GlStateTest : public GlTest {
protected:
    /// The operations in their order; several work on what the one before has left.
    void compare(const std::vector<Operation>& operations) {
        for (const Operation& operation : operations) {
            SCOPED_TRACE(operation.name);
            mHost.value().set();
            operation.prepare();
            glEnable(GL_TRIANGLES); // an error of the host's, which nobody takes from it
            const GlState before = glState();
            operation.run();
            const GlState after = glState();
            EXPECT_EQ(takeGlErrors(), std::vector<std::string>{"GL_INVALID_ENUM"});
            for (const auto& [name, value] : after) {
                const auto change = operation.changes.find(name);
                if (change == operation.changes.end()) {
                    EXPECT_EQ(value, before.at(name)) << name;
                } else if (change->second != ANYTHING) {
                    EXPECT_EQ(value, change->second) << name;
                }
            }
        }
    }
    void SetUp() override {
        GlTest::SetUp();
        if (IsSkipped() || HasFatalFailure())
            return;
        mHost.emplace();
        EXPECT_GE(glState().size(), 25U);
        takeGlErrors(); // of values that this driver does not have
    }
    void TearDown() override {
        mHost.reset();
        GlTest::TearDown();
    }

    std::optional<HostsContext> mHost;
};

Texture::TexArgs textureArgs(uint32_t access, bool isPbo = true) {
    Texture::TexArgs args = texArgs(8, 6);
    args.isPBO = isPbo;
    args.isFBO = args.isMipMapped = isPbo;
    args.pboAccessType = access;
    return args;
}

GLuint boundAt(GLenum query) {
    GLint bound = 0;
    glGetIntegerv(query, &bound);
    return static_cast<GLuint>(bound);
}

/// Where an operation expects nothing of it.
void bindUnpackBuffer() {
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, boundAt(GL_ARRAY_BUFFER_BINDING));
}

/// The one message since the last call, which an operation that refused or failed has left.
void expectMessage(const char* text) {
    const std::vector<LogMessage> log = takeLog();
    ASSERT_EQ(log.size(), 1U) << text;
    EXPECT_NE(log.front().text.find(text), std::string::npos) << log.front();
}

TEST_F(GlStateTest, TexturesThatFailOrRefuseChangeWhatIsDocumented) {
    Texture plain(VideoTestImage::COMBI, textureArgs(GL_WRITE_ONLY, false));
    Texture upload(VideoTestImage::COMBI, textureArgs(GL_WRITE_ONLY));
    Texture readback(VideoTestImage::COMBI, textureArgs(GL_READ_ONLY));
    const Changes uploadBound = {{"PIXEL_UNPACK_BUFFER_BINDING", {static_cast<double>(upload.getPboID(0))}}};
    const Changes readbackBound = {
        {"PIXEL_PACK_BUFFER_BINDING", {static_cast<double>(readback.getPboID(0))}}};
    const auto mapInVain = [](Texture& texture) {
        const SwappedEntryPoint map(
            "glMapBuffer", epoxy_glMapBuffer, +[](GLenum, GLenum) -> void* { return nullptr; });
        texture.mapPbo(0);
        expectMessage("GPUR 457");
    };
    const auto unmapInVain = [](Texture& texture) {
        const SwappedEntryPoint unmap(
            "glUnmapBuffer", epoxy_glUnmapBuffer, +[](GLenum) -> GLboolean { return GL_FALSE; });
        texture.unmapPbo(0);
        expectMessage("GPUR 460");
    };
    const auto refused = [](const char* message, auto operation) {
        return [=] {
            operation();
            expectMessage(message);
        };
    };
    compare({
        {"mapPbo, upload", [&] { mapInVain(upload); }, uploadBound + UNPACK_ALIGNED},
        {"mapPbo, readback", [&] { mapInVain(readback); }, readbackBound + PACK_ALIGNED},
        {"unmapPbo, upload, not mapped", refused("GPUR 458", [&] { upload.unmapPbo(0); }), NOTHING,
         bindUnpackBuffer},
        {"unmapPbo, readback, not mapped", refused("GPUR 459", [&] { readback.unmapPbo(0); }), NOTHING},
        {"unmapPbo, upload", [&] { unmapInVain(upload); }, uploadBound, [&] { upload.mapPbo(0); }},
        {"unmapPbo, readback", [&] { unmapInVain(readback); }, readbackBound, [&] { readback.mapPbo(0); }},
        {"copyPBOToGLTex", refused("GPUR 456", [&] { plain.copyPBOToGLTex(0); }), NOTHING, bindUnpackBuffer},
        {"copyPBOToGLTex, two", refused("GPUR 454", [&] { plain.copyPBOToGLTex(0, 0); }), NOTHING,
         bindUnpackBuffer},
        {"copyHostBufToPBO", refused("GPUR 455", [&] { plain.copyHostBufToPBO(0, 0); }), NOTHING,
         bindUnpackBuffer},
        {"copyHostBufToPBO, readback", refused("for readback", [&] { readback.copyHostBufToPBO(0); }),
         NOTHING, bindUnpackBuffer},
        {"readbackGLTexToPBO", refused("No readback PBO", [&] { upload.readbackGLTexToPBO(0); }), NOTHING},
        {"readbackPBOToHostBuf", refused("for upload", [&] { upload.readbackPBOToHostBuf(0); }), NOTHING},
    });
}

TEST_F(GlStateTest, TexturesChangeWhatTheyDocument) {
    const TemporaryFile file("picture.png", PngPicture().encode());
    std::unique_ptr<Texture> plain;
    std::unique_ptr<Texture> upload;
    std::unique_ptr<Texture> readback;
    const uint32_t pattern = VideoTestImage::COMBI;
    const Changes uploadMapped = UNPACK_UNBOUND + UNPACK_ALIGNED;
    const Changes readbackMapped = PACK_UNBOUND + PACK_ALIGNED;
    compare({
        {"constructor, file",
         [&] { plain = std::make_unique<Texture>(file.path(), textureArgs(GL_WRITE_ONLY, false)); },
         TEXTURE_UNBOUND},
        {"constructor, pattern",
         [&] { plain = std::make_unique<Texture>(pattern, textureArgs(GL_WRITE_ONLY, false)); },
         TEXTURE_UNBOUND},
        {"constructor, upload",
         [&] { upload = std::make_unique<Texture>(pattern, textureArgs(GL_WRITE_ONLY)); },
         TEXTURE_UNBOUND + uploadMapped + FRAMEBUFFER_UNBOUND},
        {"constructor, readback",
         [&] { readback = std::make_unique<Texture>(pattern, textureArgs(GL_READ_ONLY)); },
         TEXTURE_UNBOUND + readbackMapped + COPY_UNBOUND + FRAMEBUFFER_UNBOUND},
        {"generateMipMap", [&] { plain->generateMipMap(0); }, TEXTURE_UNBOUND},
        {"setTextureFilter", [&] { plain->setTextureFilter(0, GL_NEAREST, GL_NEAREST); }, TEXTURE_UNBOUND},
        {"setTextureFilter, default", [&] { plain->setTextureFilter(0); }, TEXTURE_UNBOUND},
        {"copyHostBufToGLTex", [&] { plain->copyHostBufToGLTex(0); }, TEXTURE_UNBOUND},
        {"copyHostBufToGLTex, two", [&] { plain->copyHostBufToGLTex(0, 0); }, TEXTURE_UNBOUND},
        {"copyHostBufToPBO", [&] { upload->copyHostBufToPBO(0); }, uploadMapped, bindUnpackBuffer},
        {"copyHostBufToPBO, two", [&] { upload->copyHostBufToPBO(0, 0); }, uploadMapped, bindUnpackBuffer},
        {"copyPBOToGLTex", [&] { upload->copyPBOToGLTex(0); }, TEXTURE_UNBOUND + UNPACK_UNBOUND,
         bindUnpackBuffer},
        {"copyPBOToGLTex, two", [&] { upload->copyPBOToGLTex(0, 0); }, TEXTURE_UNBOUND + UNPACK_UNBOUND,
         bindUnpackBuffer},
        {"mapPbo, upload", [&] { upload->mapPbo(0); }, uploadMapped, bindUnpackBuffer},
        {"unmapPbo, upload", [&] { upload->unmapPbo(0); }, UNPACK_UNBOUND, bindUnpackBuffer},
        {"readbackGLTexToPBO", [&] { readback->readbackGLTexToPBO(0); },
         FRAMEBUFFER_UNBOUND + PACK_UNBOUND + COPY_UNBOUND},
        {"readbackGLTexToPBO, two", [&] { readback->readbackGLTexToPBO(0, 0); },
         FRAMEBUFFER_UNBOUND + PACK_UNBOUND + COPY_UNBOUND},
        {"readbackPBOToHostBuf", [&] { readback->readbackPBOToHostBuf(0); }, readbackMapped},
        {"readbackPBOToHostBuf, two", [&] { readback->readbackPBOToHostBuf(0, 0); }, readbackMapped},
        {"mapPbo, readback", [&] { readback->mapPbo(0); }, readbackMapped},
        {"unmapPbo, readback", [&] { readback->unmapPbo(0); }, PACK_UNBOUND},
        {"host buffers and pointers",
         [&] {
             upload->setHostBufData(0, 0, 0, 8, 6, 1, 2, 3, 4);
             upload->getHostBufData(0, 1, 1);
             upload->getAlignedPboPtr(0);
             VideoTestImage::fillTexturePattern(upload.get(), pattern, 0, 2, false);
             VideoTestImage::fillTextureFile(file.path(), plain.get(), 0, 2, 0, false);
         },
         NOTHING},
        {"destructor",
         [&] {
             plain.reset();
             upload.reset();
             readback.reset();
         },
         NOTHING},
    });
}

/// A host's own shape.
class OwnShape : public VertexList {
public:
    explicit OwnShape(GLenum primitive) : VertexList(nullptr, primitive) {
        GLuint buffers[2] = {};
        glGenBuffers(2, buffers);
        mVertexDataBufferID = buffers[0];
        mIndexDataBufferID = buffers[1];
        const VertexData vertices[3] = {};
        const GLuint indices[3] = {0, 1, 2};
        glBindBuffer(GL_ARRAY_BUFFER, buffers[0]);
        glBufferData(GL_ARRAY_BUFFER, sizeof vertices, vertices, GL_STATIC_DRAW);
        glBindBuffer(GL_ARRAY_BUFFER, buffers[1]);
        glBufferData(GL_ARRAY_BUFFER, sizeof indices, indices, GL_STATIC_DRAW);
        glBindBuffer(GL_ARRAY_BUFFER, 0);
        mNumIndices = 3;
    }
};

TEST_F(GlStateTest, ShapesChangeWhatTheyDocument) {
    const std::vector<VertexList::VertexData> points(3);
    std::unique_ptr<VertexListPlane> plane;
    std::unique_ptr<VertexListBox> box;
    std::unique_ptr<VertexListLines> lines;
    OwnShape strip(GL_TRIANGLE_STRIP);
    OwnShape polygon(GL_POLYGON);
    glPrimitiveRestartIndexNV(0xFFFFFFFF); // for the number that this driver gives for it, -1 perhaps
    const Changes restarting = {{"PRIMITIVE_RESTART_NV", {1}},
                                {"PRIMITIVE_RESTART_INDEX_NV", glState().at("PRIMITIVE_RESTART_INDEX_NV")},
                                {"PRIMITIVE_RESTART", ANYTHING},
                                {"PRIMITIVE_RESTART_INDEX", ANYTHING}};
    compare({
        {"plane, constructor", [&] { plane = std::make_unique<VertexListPlane>(3U, 2U, 0.5F, nullptr); },
         SHAPE_UNBOUND},
        {"box, constructor", [&] { box = std::make_unique<VertexListBox>(nullptr, 0.F, 1.F, 0.F, 1.F); },
         SHAPE_UNBOUND},
        {"polyline, constructor", [&] { lines = std::make_unique<VertexListLines>(nullptr, points, true); },
         SHAPE_UNBOUND},
        {"box, unchanged", [&] { box->updateVertexData(); }, NOTHING},
        {"box, changed",
         [&] {
             box->setStartX(0.5F);
             box->updateVertexData();
         },
         SHAPE_UNBOUND},
        {"polyline, updated", [&] { lines->updateVertexData(); }, SHAPE_UNBOUND},
        {"setters",
         [&] {
             lines->setVertexData(points);
             lines->setLineWidth(2);
         },
         NOTHING},
        {"plane, render", [&] { plane->render(); }, RENDERED},
        {"box, render", [&] { box->render(); }, RENDERED + Changes{{"LINE_WIDTH", {1}}}},
        {"polyline, render", [&] { lines->render(); }, RENDERED + Changes{{"LINE_WIDTH", {2}}}},
        {"strip, render", [&] { strip.render(); }, RENDERED + restarting},
        {"polygon, render", [&] { polygon.render(); }, RENDERED + restarting},
        {"base without buffers", [] { VertexList(nullptr, GL_TRIANGLES).render(); }, NOTHING},
        {"setColor", [] { FWDebugFont::setColor(1, 0, 0, 1); }, {{"CURRENT_COLOR", {1, 0, 0, 1}}}},
        {"setPos",
         [] { FWDebugFont::setPos(); },
         {{"CURRENT_RASTER_POSITION", ANYTHING},
          {"CURRENT_RASTER_COLOR", ANYTHING},
          {"CURRENT_RASTER_TEXTURE_COORDS", ANYTHING},
          {"CURRENT_RASTER_DISTANCE", ANYTHING},
          {"CURRENT_RASTER_POSITION_VALID", ANYTHING}}},
        {"destructors",
         [&] {
             plane.reset();
             box.reset();
             lines.reset();
         },
         NOTHING},
    });
}

TEST_F(GlStateTest, ProgramsChangeWhatTheyDocument) {
    const TemporaryFile file(
        "program.cg",
        bytesOf("float4 Cg_Main(float2 place : TEXCOORD0, uniform sampler2D picture : TEXUNIT5,\n"
                "               uniform float3 gain, uniform float4x4 m) : COLOR\n"
                "{ return mul(m, float4(gain, 1)) * tex2D(picture, place); }\n"));
    constexpr int SAMPLERS_UNIT = 5;
    std::unique_ptr<Shader> shader;
    CGcontext context = nullptr;
    GLuint picture = 0;
    glGenTextures(1, &picture);
    const Changes pipelineBound = {{"PROGRAM_PIPELINE_BINDING", ANYTHING}};
    const Changes pipelineUnbound = {{"PROGRAM_PIPELINE_BINDING", {0}}};
    // Mesa 22 leaves a pipeline bound as long as a program is current, which goes before it.
    const auto withoutProgram = [] { glUseProgram(0); };
    const auto sampler = [&] { return cgGetNamedParameter(shader->mCgProgram, "picture"); };
    const auto manage = [&](CGbool on) { cgGLSetManageTextureParameters(Shader::getCgContext(), on); };
    compare({
        {"constructor",
         [&] { shader = std::make_unique<Shader>(Shader::TYPE_FRAGMENT, file.path(), "Cg_Main"); }, NOTHING},
        {"parameters",
         [&] {
             shader->addCgParam("gain", 3, 1);
             shader->addCgParam("m", 14, 1);
             shader->getNamedCgParameterAll();
             shader->setCgParam("gain", 1, 1, 1, 1);
             shader->setCgParamAll();
             shader->createCgResource(1);
             shader->setCgResource(0, "picture");
             EXPECT_EQ(shader->getCgResourceParam("picture"), sampler());
         },
         NOTHING},
        {"bindProgram, not enabled", [&] { shader->bindProgram(); }, NOTHING},
        {"enableProfile", [&] { shader->enableProfile(); }, pipelineBound},
        {"bindProgram, enabled", [&] { shader->bindProgram(); }, NOTHING},
        {"parameters, enabled", [&] { shader->setCgParamAll(); }, NOTHING},
        {"disableProfile", [&] { shader->disableProfile(); }, pipelineUnbound, withoutProgram},
        {"cgGLSetTextureParameter", [&] { cgGLSetTextureParameter(sampler(), picture); }, NOTHING},
        {"cgGLEnableTextureParameter", [&] { cgGLEnableTextureParameter(sampler()); },
         textureAt(SAMPLERS_UNIT, picture)},
        {"cgGLDisableTextureParameter", [&] { cgGLDisableTextureParameter(sampler()); },
         textureAt(SAMPLERS_UNIT, 0)},
        {"cgGLSetManageTextureParameters", [&] { manage(CG_TRUE); }, NOTHING},
        {"bindProgram, managed", [&] { shader->bindProgram(); }, textureAt(SAMPLERS_UNIT, picture)},
        {"enableProfile, managed", [&] { shader->enableProfile(); }, pipelineBound},
        {"cgGLUnbindProgram", [&] { cgGLUnbindProgram(CG_PROFILE_GLSLF); },
         textureAt(SAMPLERS_UNIT, 0) + pipelineUnbound, withoutProgram},
        {"bindProgram, enabled and managed", [&] { shader->bindProgram(); },
         textureAt(SAMPLERS_UNIT, picture) + pipelineBound},
        {"cgDestroyProgram", [&] { cgDestroyProgram(shader->mCgProgram); }, pipelineUnbound, withoutProgram},
        {"destructor", [&] { shader.reset(); }, NOTHING},
        {"cgDestroyContext", [&] { cgDestroyContext(context); }, pipelineUnbound,
         [&] {
             context = cgCreateContext();
             CGprogram program = cgCreateProgramFromFile(context, CG_SOURCE, file.path().c_str(),
                                                         CG_PROFILE_GLSLF, "Cg_Main", nullptr);
             cgGLLoadProgram(program);
             cgGLBindProgram(program);
             EXPECT_NE(boundAt(GL_PROGRAM_PIPELINE_BINDING), 0U);
             withoutProgram();
         }},
    });
    manage(CG_FALSE);
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    glDeleteTextures(1, &picture);
}

} // namespace
