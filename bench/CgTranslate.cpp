// What Cg costs beside what OpenGL costs.
//
//   cg-translate   limit: OpenGL compiles and links a program's GLSL; translate: Cg to that GLSL; the large
//                  program is the effects of effects.cg twenty times over, all of them reached
//   cg-switch      limit: a switch between linked pairs and a draw; switch: the same with bound Cg programs;
//                  switch-and-enable: the profile enabled before and disabled after, as for one draw
//   cg-set         limit: glProgramUniform4fv; set: cgGLSetParameter4fv
//
// The size is the program's: lines of Cg, or 1 where it does not matter. bench/compare knows the targets.

#include "BenchmarkRow.h"

#include <Cg/Compiler/Compiler.h>
#include <Cg/cgGL.h>
#include <HeadlessContext.h>

#include <benchmark/benchmark.h>

#include <epoxy/gl.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <utility>

namespace {

std::string textOf(const char* file) {
    std::ifstream in(file);
    if (!in)
        throw std::runtime_error(std::string("cannot read ") + file);
    return {std::istreambuf_iterator<char>(in), {}};
}

cg::CompileResult translate(const std::string& source) {
    cg::CompileRequest request;
    request.source = source;
    request.fileName = "program.cg";
    request.entry = "correct";
    request.stage = cg::Stage::FRAGMENT;
    return cg::compile(request);
}

GLuint link(const std::string& vertex, const std::string& fragment) {
    const GLuint program = glCreateProgram();
    for (const auto& [type, text] : {std::pair(GL_VERTEX_SHADER, vertex), {GL_FRAGMENT_SHADER, fragment}}) {
        const GLuint shader = glCreateShader(static_cast<GLenum>(type));
        const char* const start = text.c_str();
        glShaderSource(shader, 1, &start, nullptr);
        glCompileShader(shader);
        glAttachShader(program, shader);
        glDeleteShader(shader);
    }
    glLinkProgram(program);
    GLint isLinked = GL_FALSE;
    glGetProgramiv(program, GL_LINK_STATUS, &isLinked);
    if (!isLinked)
        throw std::runtime_error("OpenGL does not link a pair");
    return program;
}

/// A small framebuffer to draw to.
void makeTarget() {
    GLuint texture = 0;
    GLuint framebuffer = 0;
    glGenTextures(1, &texture);
    glBindTexture(GL_TEXTURE_2D, texture);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, 4, 4, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    glBindTexture(GL_TEXTURE_2D, 0);
    glGenFramebuffers(1, &framebuffer);
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture, 0);
    glViewport(0, 0, 4, 4);
}

void draw() {
    static constexpr std::array<float, 6> POSITIONS = {-1, -1, 1, -1, 1, 1};
    glEnableClientState(GL_VERTEX_ARRAY);
    glVertexPointer(2, GL_FLOAT, 0, POSITIONS.data());
    glDrawArrays(GL_TRIANGLES, 0, 3);
}

CGprogram makeProgram(CGcontext context, CGprofile profile, const char* entry) {
    static const char* const SOURCE =
        "void place(float4 p : POSITION, uniform float4 value, out float4 o : POSITION) { o = p + value; }\n"
        "float4 show(uniform float4 value) : COLOR { return value; }\n";
    CGprogram program = cgCreateProgram(context, CG_SOURCE, SOURCE, profile, entry, nullptr);
    if (!program)
        throw std::runtime_error(cgGetLastListing(context));
    cgGLLoadProgram(program);
    return program;
}

/// Sets of effects one after another, each with its number in place of `#`, and an entry that applies all.
std::string largeProgram(const std::string& effects) {
    constexpr int SETS = 20;
    std::string program;
    std::string calls;
    for (int set = 0; set < SETS; ++set) {
        const std::string number = std::to_string(set);
        for (const char c : effects)
            program += c == '#' ? number : std::string(1, c);
        calls += "    colour = effects_" + number + "(colour, picture, uv);\n";
    }
    return program + "float4 correct(float2 uv : TEXCOORD0, uniform sampler2D picture) : COLOR\n{\n" +
           "    float4 colour = tex2D(picture, uv);\n" + calls + "    return colour;\n}\n";
}

void addTranslation(const std::string& source) {
    const cg::CompileResult result = translate(source);
    if (!result.ok)
        throw std::runtime_error(result.listing);
    const auto lines = std::count(source.begin(), source.end(), '\n');
    const std::string group = "cg-translate/" + std::to_string(lines);
    addLimit(group, 0, [glsl = result.glsl] {
        const char* const text = glsl.c_str();
        const GLuint program = glCreateShaderProgramv(GL_FRAGMENT_SHADER, 1, &text);
        GLint isLinked = GL_FALSE;
        glGetProgramiv(program, GL_LINK_STATUS, &isLinked);
        if (!isLinked)
            throw std::runtime_error("OpenGL does not take the GLSL");
        glDeleteProgram(program);
    });
    addRow(group + "/translate", 0, [source] { benchmark::DoNotOptimize(translate(source)); });
}

void addSwitching() {
    const std::string vertex = "#version 330 compatibility\nuniform vec4 value;\n"
                               "void main() { gl_Position = gl_Vertex + value; }\n";
    const std::string fragment = "#version 330 compatibility\nuniform vec4 value2;\n"
                                 "void main() { gl_FragColor = value2; }\n";
    const std::array<GLuint, 2> pairs = {link(vertex, fragment), link(vertex, fragment)};
    // A driver finishes its compilation at the first draw, and a row is warmed up with one of the two.
    for (const GLuint pair : pairs) {
        glUseProgram(pair);
        draw();
    }
    addLimit("cg-switch/1", 0, [pairs, which = size_t{0}]() mutable {
        which = 1 - which;
        glUseProgram(pairs[which]);
        draw();
    });
    CGcontext context = cgCreateContext();
    CGprogram place = makeProgram(context, CG_PROFILE_GLSLV, "place");
    const std::array<CGprogram, 2> shows = {makeProgram(context, CG_PROFILE_GLSLF, "show"),
                                            makeProgram(context, CG_PROFILE_GLSLF, "show")};
    const auto enable = [place] {
        glUseProgram(0);
        cgGLEnableProfile(CG_PROFILE_GLSLV);
        cgGLEnableProfile(CG_PROFILE_GLSLF);
        cgGLBindProgram(place);
    };
    enable();
    for (CGprogram show : shows) {
        cgGLBindProgram(show);
        draw();
    }
    cgGLDisableProfile(CG_PROFILE_GLSLF);
    cgGLDisableProfile(CG_PROFILE_GLSLV);
    addRow(
        "cg-switch/1/switch", 0,
        [shows, which = size_t{0}]() mutable {
            which = 1 - which;
            cgGLBindProgram(shows[which]);
            draw();
        },
        enable);
    addRow(
        "cg-switch/1/switch-and-enable", 0,
        [shows, which = size_t{0}]() mutable {
            which = 1 - which;
            cgGLEnableProfile(CG_PROFILE_GLSLF);
            cgGLBindProgram(shows[which]);
            draw();
            cgGLDisableProfile(CG_PROFILE_GLSLF);
        },
        enable);
}

void addSetting() {
    static constexpr std::array<float, 4> VALUES = {1, 2, 3, 4};
    const char* const text = "#version 330 compatibility\nuniform vec4 value;\n"
                             "void main() { gl_FragColor = value; }\n";
    const GLuint program = glCreateShaderProgramv(GL_FRAGMENT_SHADER, 1, &text);
    const GLint location = glGetUniformLocation(program, "value");
    addLimit("cg-set/1", 0, [=] { glProgramUniform4fv(program, location, 1, VALUES.data()); });
    CGprogram show = makeProgram(cgCreateContext(), CG_PROFILE_GLSLF, "show");
    CGparameter value = cgGetNamedParameter(show, "value");
    addRow("cg-set/1/set", 0, [=] { cgGLSetParameter4fv(value, VALUES.data()); });
}

} // namespace

void addRows() {
    // A driver that finds a program in its cache compiles nothing.
    setenv("MESA_SHADER_CACHE_DISABLE", "true", 1);
    static const host::HeadlessContext context;
    makeTarget();
    addTranslation(textOf(FWZEL_CG_PROGRAM));
    addTranslation(largeProgram(textOf(FWZEL_CG_EFFECTS)));
    addSwitching();
    addSetting();
}
