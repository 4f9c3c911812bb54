#include <fixture/FailingCalls.h>
#include <fixture/FloatCanvas.h>
#include <fixture/GlTest.h>
#include <fixture/PictureFiles.h>
#include <fixture/TexArgs.h>

#include <Cg/cgGL.h>
#include <FwZel/FWDebugFont.h>
#include <FwZel/PictureRefusal.h>
#include <FwZel/Shader.h>
#include <FwZel/Texture.h>
#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListLines.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <boost/thread/exceptions.hpp>
#include <epoxy/gl.h>

#include <cstdarg>
#include <cstring>
#include <functional>
#include <map>
#include <optional>

namespace {

using Log = std::vector<LogMessage>;

/// The step of a scenario in which a call fails, and what came of it.
class Exposed {
public:
    Exposed(Call call, int number) : mCall(call), mNumber(number) {}

    template <class Step>
    void operator()(Step step) {
        const FailingCall failing(mCall, mNumber);
        try {
            step();
        } catch (const std::bad_alloc&) {
            mThrown = "no memory";
        } catch (const boost::thread_resource_error&) {
            mThrown = "no mutex";
        }
        mHasFailed = FailingCall::hasHappened();
    }

    Call call() const { return mCall; }
    bool hasFailed() const { return mHasFailed; }
    const std::string& thrown() const { return mThrown; }

private:
    Call mCall;
    int mNumber;
    bool mHasFailed = false;
    std::string mThrown;
};

/// The messages of the number-th failing call of a kind.
using Messages = std::function<Log(Call, int number)>;

/// An operation: built up, exposed, used as if nothing had been, and taken down.
struct Scenario {
    const char* name;
    std::function<void(Exposed&)> run;
    Messages messages;
};

Log silent(Call /*call*/, int /*number*/) {
    return {};
}

// --- Textures

std::string numbered(const char* text, int number) {
    return text + std::to_string(number);
}

/// What a texture writes whose first PBO of an operation is that of firstBuffer.
Messages ofTexture(bool isUpload, int firstBuffer = 0) {
    return [=](Call call, int number) -> Log {
        const int buffer = firstBuffer + number;
        switch (call) {
        case Call::MEMALIGN:
            return {{3, numbered("GPUR 453: Texture::createTexture():: bufNum=", buffer) +
                            ", Cannot allocate texture memory\n"}};
        case Call::MAP_BUFFER:
            return {{3, "GPUR 457: Texture::mapPbo : glMapBuffer() failed\n"},
                    {3, numbered(isUpload ? "GPUR 458: Texture::unmapPbo(): mPboPtrs["
                                          : "GPUR 459: Texture::unmapPbo(): mPboPtrs[",
                                 buffer) +
                            "] = NULL\n"}};
        case Call::UNMAP_BUFFER:
            return {{3, "GPUR 460: Texture::unmapPbo : glUnmapBuffer() failed\n"}};
        default:
            return {};
        }
    };
}

Texture::TexArgs textureArgs(bool isPbo, uint32_t access) {
    Texture::TexArgs args = texArgs(13, 11); // as the pictures
    args.numBuffers = 2;
    args.isFBO = true;
    args.isPBO = isPbo;
    args.pboAccessType = access;
    args.isMipMapped = isPbo;
    return args;
}

/// Takes every buffer to the GPU and back.
void use(Texture& texture) {
    const size_t bytes = texture.pixelBytes();
    for (uint32_t b = 0; b < texture.getNumBuffers(); ++b) {
        texture.setHostBufData(b, 1, 1, 3, 3, 10, 20, 30, 40);
        texture.copyHostBufToGLTex(b);
        const bool isUpload = texture.getIsPBO() && texture.isWriteAccess();
        if (isUpload) {
            texture.copyHostBufToPBO(b);
            texture.copyPBOToGLTex(b);
        }
        texture.generateMipMap(b);
        if (!texture.getHostBufPtr(b))
            continue;
        const std::vector<uint8_t> sent(texture.getAddress(b), texture.getAddress(b) + bytes);
        std::vector<uint8_t> arrived(bytes);
        if (texture.getIsPBO() && !isUpload) {
            std::memset(texture.getHostBufPtr(b), 0, bytes);
            texture.readbackGLTexToPBO(b);
            texture.readbackPBOToHostBuf(b);
            arrived.assign(texture.getAddress(b), texture.getAddress(b) + bytes);
        } else {
            glBindTexture(GL_TEXTURE_2D, texture.getGLTexID(b));
            glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_UNSIGNED_BYTE, arrived.data());
            glBindTexture(GL_TEXTURE_2D, 0);
        }
        EXPECT_TRUE(arrived == sent) << "buffer " << b;
    }
}

/// A failure that OpenGL's targets still show is the host's to mend.
void unbindPbos() {
    glBindBuffer(GL_PIXEL_PACK_BUFFER, 0);
    glBindBuffer(GL_PIXEL_UNPACK_BUFFER, 0);
}

template <class... Arguments>
void buildTexture(Exposed& exposed, const Arguments&... arguments) {
    std::optional<Texture> texture;
    exposed([&] { texture.emplace(arguments...); });
    unbindPbos();
    if (texture)
        use(*texture);
}

/// An operation on a texture of two buffers.
template <class Operation>
Scenario onTexture(const char* name, uint32_t access, int buffer, Operation operation) {
    return {name,
            [=](Exposed& exposed) {
                Texture texture(VideoTestImage::COMBI, textureArgs(true, access));
                exposed([&] { operation(texture); });
                unbindPbos();
                use(texture);
            },
            ofTexture(access == GL_WRITE_ONLY, buffer)};
}

const TemporaryFile& pngFile() {
    static const TemporaryFile file("a_picture_with_a_name_that_needs_memory.png", PngPicture().encode());
    return file;
}

const TemporaryFile& ppmFile() {
    static const TemporaryFile file("a_picture_with_a_name_that_needs_memory.ppm", [] {
        Bytes bytes = bytesOf("P6\n13 11\n255\n");
        bytes.resize(bytes.size() + size_t{13} * 11 * 3, 0x5A);
        return bytes;
    }());
    return file;
}

Scenario sizeOf(const char* name, const TemporaryFile& file) {
    return {name,
            [&file](Exposed& exposed) {
                uint32_t width = 0;
                uint32_t height = 0;
                uint32_t bytes = 0;
                int result = 1;
                exposed([&] {
                    result = VideoTestImage::getWidthHeightFromFile(file.path(), &width, &height, &bytes);
                });
                const int whenFailed = exposed.thrown().empty() ? -1 : 1; // 1: as it was
                EXPECT_EQ(result, exposed.hasFailed() ? whenFailed : 0);
            },
            silent};
}

/// The words of a refusal for want of what a call gives.
std::string refusalFor(Call call) {
    switch (call) {
    case Call::FOPEN:
        return "it cannot be opened: Too many open files";
    case Call::FREAD:
        return "it cannot be read: Is a directory";
    case Call::PNG_READ_STRUCT:
    case Call::PNG_INFO_STRUCT:
        return "there is no memory to read it";
    default:
        return {};
    }
}

Scenario refusalOf(const char* name, const TemporaryFile& file) {
    return {name,
            [&file](Exposed& exposed) {
                std::string refusal;
                exposed([&] { refusal = pictureRefusal(file.path()); });
                EXPECT_EQ(refusal, exposed.hasFailed() ? refusalFor(exposed.call()) : "");
            },
            silent};
}

// --- Shapes

/// The buffer objects of a shape live as long as the context; here they end with it.
template <class Shape>
void drawAndDelete(Shape& shape) {
    const FloatCanvas canvas(8, 8);
    shape.render();
    const GLuint buffers[] = {shape.mVertexDataBufferID, shape.mIndexDataBufferID};
    glDeleteBuffers(2, buffers);
}

template <class Shape, class... Arguments>
Scenario shape(const char* name, Arguments... arguments) {
    return {name,
            [=](Exposed& exposed) {
                std::optional<Shape> made;
                exposed([&] { made.emplace(arguments...); });
                if (made)
                    drawAndDelete(*made);
            },
            silent};
}

Scenario growingPolyline() {
    return {"a polyline gets more points",
            [](Exposed& exposed) {
                std::vector<VertexList::VertexData> points(2);
                VertexListLines lines(nullptr, points, true);
                points.resize(20);
                exposed([&] {
                    lines.setVertexData(points);
                    lines.updateVertexData();
                });
                const bool hasGrown = !exposed.hasFailed();
                EXPECT_EQ(lines.mNumIndices, hasGrown ? 21U : 3U);
                lines.setVertexData(points);
                lines.updateVertexData();
                EXPECT_EQ(lines.mNumIndices, 21U);
                drawAndDelete(lines);
            },
            silent};
}

// --- Cg programs

/// A context of the test's own in the place of the shared one, with all that is made in it.
class OwnCgContext {
public:
    OwnCgContext() : mShared(Shader::mCgContext) { Shader::initCgContext(); }
    ~OwnCgContext() {
        cgDestroyContext(Shader::mCgContext);
        Shader::mCgContext = mShared;
        cgGetError();
    }
    OwnCgContext(const OwnCgContext&) = delete;
    OwnCgContext& operator=(const OwnCgContext&) = delete;

private:
    CGcontext mShared;
};

const TemporaryFile& cgFile() {
    static const TemporaryFile file(
        "a_program_with_a_name_that_needs_memory.cg",
        bytesOf("float4 Cg_Main(float2 place : TEXCOORD0, uniform sampler2D picture : TEXUNIT3,\n"
                "               uniform sampler2D a_key_with_a_name_that_needs_memory,\n"
                "               uniform sampler2D mask : TEXUNIT5,\n"
                "               uniform float gain[3] = {1, 2, 3}) : COLOR\n"
                "{ return gain[0] * tex2D(picture, place) *\n"
                "         tex2D(a_key_with_a_name_that_needs_memory, place).r * tex2D(mask, place); }\n"));
    return file;
}

void use(Shader& shader) {
    shader.bindProgram();
    shader.enableProfile();
    shader.setCgParamAll();
    shader.disableProfile();
}

Scenario buildShader() {
    return {"a Cg program from a file",
            [](Exposed& exposed) {
                const std::string entry = "Cg_Main";
                const OwnCgContext context;
                for (int attempt = 0; attempt < 2; ++attempt) {
                    std::optional<Shader> shader;
                    const auto build = [&] { shader.emplace(Shader::TYPE_FRAGMENT, cgFile().path(), entry); };
                    if (attempt == 0) {
                        exposed(build);
                    } else {
                        const FailingCall counted(Call::NEW, -1); // its memory too is told from what stays
                        build();
                    }
                    if (shader) {
                        const bool mayBeNull = attempt == 0 && exposed.hasFailed();
                        EXPECT_TRUE(shader->mCgProgram || mayBeNull);
                        use(*shader);
                    }
                }
            },
            [](Call call, int /*number*/) -> Log {
                if (call == Call::NEW)
                    return {};
                return {{3, "GPUR 451: Shader::initCg(): Program Err. \n"}};
            }};
}

/// An operation on a shader, whose program stays bound.
template <class Operation>
Scenario onShader(const char* name, Operation operation) {
    return {name,
            [=](Exposed& exposed) {
                const OwnCgContext context;
                Shader shader(Shader::TYPE_FRAGMENT, cgFile().path(), "Cg_Main");
                exposed([&] { operation(shader); });
                use(shader);
            },
            silent};
}

Scenario newCgContext() {
    return {"a new shared Cg context",
            [](Exposed& exposed) {
                auto* const shared = Shader::mCgContext;
                exposed([] { Shader::initCgContext(); });
                if (Shader::mCgContext != shared)
                    cgDestroyContext(Shader::mCgContext);
                Shader::mCgContext = shared;
            },
            silent};
}

// --- Text

int format(char** text, const char* pattern, ...) {
    std::va_list arguments;
    va_start(arguments, pattern);
    const int length = FWDebugFont::my_vsprintf(text, pattern, arguments);
    va_end(arguments);
    return length;
}

Scenario formattedText() {
    return {"formatted text",
            [](Exposed& exposed) {
                char* text = nullptr;
                int length = 0;
                exposed([&] { length = format(&text, "%d", 12345); });
                EXPECT_EQ(length, exposed.hasFailed() ? -1 : 5);
                if (length >= 0)
                    std::free(text);
            },
            silent};
}

std::vector<Scenario> scenarios() {
    const std::string parameter = "a_parameter_with_a_name_that_needs_memory";
    const std::vector<VertexList::VertexData> points(3);
    std::vector<Scenario> all = {
        sizeOf("size of a PNG file", pngFile()),
        sizeOf("size of a PPM file", ppmFile()),
        refusalOf("refusal of a PNG file", pngFile()),
        refusalOf("refusal of a PPM file", ppmFile()),
        shape<VertexListPlane>("a plane", 3U, 2U, 0.5F, nullptr),
        shape<VertexListBox>("a box", nullptr, 0.0F, 1.0F, 0.0F, 1.0F),
        shape<VertexListLines>("a polyline", nullptr, points, true),
        growingPolyline(),
        newCgContext(),
        buildShader(),
        onShader("parameters declared and set",
                 [parameter](Shader& shader) {
                     shader.addCgParam(parameter, 3, 2);
                     shader.addCgParam("gain", 0, 1, 1, 2, 3, 4);
                     shader.getNamedCgParameterAll();
                     shader.setCgParam(parameter, 4, 3, 2, 1);
                 }),
        onShader("resource slots",
                 [parameter](Shader& shader) {
                     shader.createCgResource(5);
                     shader.setCgResource(2, "picture");
                     shader.setCgResource(4, parameter);
                     shader.getCgResourceParam(parameter);
                 }),
        onShader("a copy of a shader",
                 [](Shader& shader) {
                     const Shader copy(shader);
                     EXPECT_EQ(copy.mCgProgram, shader.mCgProgram);
                 }),
        formattedText(),
    };
    for (const uint32_t access : {uint32_t{GL_WRITE_ONLY}, uint32_t{GL_READ_ONLY}}) {
        const bool isUpload = access == GL_WRITE_ONLY;
        all.push_back({isUpload ? "a pattern texture to upload" : "a pattern texture to read back",
                       [=](Exposed& exposed) {
                           buildTexture(exposed, uint32_t{VideoTestImage::COMBI}, textureArgs(true, access));
                       },
                       ofTexture(isUpload)});
        all.push_back(onTexture("mapping", access, 1, [](Texture& t) {
            t.mapPbo(1);
            t.unmapPbo(1);
        }));
    }
    for (const TemporaryFile* const file : {&pngFile(), &ppmFile()})
        for (const bool isFp16 : {false, true})
            all.push_back({"a texture from a file",
                           [=](Exposed& exposed) {
                               Texture::TexArgs args = textureArgs(false, GL_WRITE_ONLY);
                               args.isFp16 = isFp16;
                               std::optional<Texture> texture;
                               exposed([&] { texture.emplace(file->path(), args); });
                               if (texture && !isFp16)
                                   use(*texture);
                           },
                           ofTexture(true)});
    all.push_back(
        onTexture("host buffer to PBO", GL_WRITE_ONLY, 1, [](Texture& t) { t.copyHostBufToPBO(0, 1); }));
    all.push_back(
        onTexture("PBO to host buffer", GL_READ_ONLY, 1, [](Texture& t) { t.readbackPBOToHostBuf(1, 0); }));
    return all;
}

class FailingSurroundings : public GlTest {};

/// What a failure of the surroundings may throw.
std::string documentedThrow(Call call) {
    return call == Call::NEW ? "no memory" : call == Call::MUTEX ? "no mutex" : "";
}

TEST_F(FailingSurroundings, EveryCallOfEveryOperationFailsInItsTurn) {
    Shader::initVertexCgProfile();
    Shader::initFragmentCgProfile();
    Shader::initCgContext();
    Shader::mIsFirstTime = false;
    const Shader missing(Shader::TYPE_VERTEX, std::string(1000, 'x'), ""); // room for the last listing
    cgGetError();
    const WatchedOpenGl watchedOpenGl;
    std::map<Call, int> failures;
    for (const Scenario& scenario : scenarios()) {
        Exposed calm(Call::NEW, -1);
        scenario.run(calm); // what is made once in a process is made here
        for (const Call call : EVERY_CALL) {
            for (int number = 0;; ++number) {
                SCOPED_TRACE(std::string(scenario.name) + ": " + nameOf(call) + " number " +
                             std::to_string(number));
                takeLog();
                const Holdings before = holdings();
                Exposed exposed(call, number);
                scenario.run(exposed);
                EXPECT_EQ(holdings(), before);
                EXPECT_EQ(takeLog(), exposed.hasFailed() ? scenario.messages(call, number) : Log{});
                EXPECT_EQ(takeGlErrors(), std::vector<std::string>{});
                EXPECT_TRUE(exposed.thrown().empty() || exposed.thrown() == documentedThrow(call))
                    << exposed.thrown();
                if (HasFailure())
                    return;
                if (!exposed.hasFailed())
                    break;
                ++failures[call];
            }
        }
    }
    for (const Call call : EVERY_CALL)
        EXPECT_GT(failures[call], 0) << nameOf(call);
}

} // namespace
