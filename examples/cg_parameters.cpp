// A Cg program and its parameters: a tinted picture on a plane, and a box around it in the full colour.

#include <GlErrors.h>
#include <GlRequirements.h>
#include <HeadlessContext.h>

#include <Cg/cgGL.h>
#include <FwZel/Shader.h>
#include <FwZel/Texture.h>
#include <FwZel/VertexListBox.h>
#include <FwZel/VertexListPlane.h>
#include <FwZel/VideoTestImage.h>

#include <epoxy/gl.h>

#include <cstdio>
#include <stdexcept>

namespace {

void throwOnError(std::string subject) {
    if (const CGerror error = cgGetError(); error != CG_NO_ERROR)
        throw std::runtime_error(subject + ": " + cgGetErrorString(error) + '\n' +
                                 cgGetLastListing(Shader::getCgContext()));
    for (const std::string& error : host::takeGlErrors())
        throw std::runtime_error(subject.append(": OpenGL reports ").append(error));
}

void tellPixel(const char* subject, int x, int y) {
    unsigned char pixel[4] = {};
    glReadPixels(x, y, 1, 1, GL_RGBA, GL_UNSIGNED_BYTE, pixel);
    std::printf("%s: %d %d %d\n", subject, pixel[0], pixel[1], pixel[2]);
}

} // namespace

int main(int argc, char** argv) try {
    if (argc != 2)
        throw std::invalid_argument("usage: cg_parameters PROGRAM.cg");
    const host::HeadlessContext context;
    host::requireGlFeatures({host::GlFeature::TEXTURES, host::GlFeature::FRAMEBUFFERS});
    if (!cgGLIsProfileSupported(CG_PROFILE_GLSLV) || !cgGLIsProfileSupported(CG_PROFILE_GLSLF))
        throw std::runtime_error("the OpenGL context has no separable programs");
    Texture::TexArgs args;
    Texture::setDefaultValue(args);
    args.isFBO = true;
    Texture bars(VideoTestImage::COLOUR_BAR_75, args), frame(VideoTestImage::NO_TEST_PATTERN, args);
    bars.copyHostBufToGLTex(0);
    glBindTexture(GL_TEXTURE_2D, bars.getGLTexID(0)); // at unit 0, which the program names
    glBindFramebufferEXT(GL_FRAMEBUFFER_EXT, frame.getFboID(0));
    glViewport(0, 0, 1920, 1080);
    Shader vertex(Shader::TYPE_VERTEX, argv[1], "place");
    throwOnError(argv[1]);
    Shader fragment(Shader::TYPE_FRAGMENT, argv[1], "tint");
    throwOnError(argv[1]);
    vertex.addCgParam("scale", 2, 1, 0.75F, 0.5F, 0, 0); // a type code, elements, a value
    fragment.addCgParam("colour", 4, 1, 1, 0.8F, 0, 1);
    fragment.addCgParam("amount", 1, 1, 0.4F, 0, 0, 0);
    for (Shader* const shader : {&vertex, &fragment}) {
        shader->getNamedCgParameterAll(); // looks the names up in the program
        shader->setCgParamAll();
        shader->bindProgram();
        shader->enableProfile();
    }
    VertexListPlane plane(1, 1, 1.0F, &fragment);
    plane.render();
    fragment.setCgParam("amount", 1, 0, 0, 0);
    VertexListBox box(&fragment, -1, 1, -1, 1);
    box.setLineWidth(5);
    box.render();
    vertex.disableProfile();
    fragment.disableProfile();
    throwOnError("drawing");
    tellPixel("plane", 1000, 540);
    tellPixel("box", 1000, 270);
} catch (const std::exception& error) {
    std::fprintf(stderr, "cg_parameters: %s\n", error.what());
    return 1;
}
