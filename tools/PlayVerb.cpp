#include "Verbs.h"

#include "PlayApplication.h"
#include "PlaySettings.h"

#include <FrameLoop.h>
#include <Surface.h>

#include <epoxy/gl.h>

#include <CLI/CLI.hpp>

#include <iostream>
#include <memory>
#include <string>
#include <vector>

namespace {

void play(const PlayOptions& options) {
    PlaySettings settings = settingsOf(options);
    const std::unique_ptr<host::Surface> surface =
        host::openSurface(settings.surface, settings.size.width, settings.size.height);
    std::cerr << "fwzel: OpenGL " << glGetString(GL_VERSION) << " on " << glGetString(GL_RENDERER) << ", "
              << (surface->isWindow() ? "in a window" : "headless") << '\n';
    settleFrames(settings, surface->isWindow());
    PlayApplication application(settings, *surface);
    host::FrameLoop loop(application, *surface, {settings.frames, settings.rate});
    std::string name = "fwzel";
    char* arguments[] = {name.data(), nullptr};
    const int frames = loop.run(1, arguments);
    if (loop.isInterrupted())
        std::cerr << "fwzel: interrupted after " << frames << (frames == 1 ? " frame\n" : " frames\n");
}

template <class Value>
CLI::Option* allow(CLI::Option* option, const std::vector<Value>& values) {
    return option->check(CLI::IsMember(values).description(""))->type_name(CLI::detail::join(values, "|"));
}

/// An option that may stand several times, with one value each.
void addRepeated(CLI::App& verb, const std::string& name, std::vector<std::string>& values,
                 const std::string& description, const std::string& form) {
    verb.add_option(name, values, description)->allow_extra_args(false)->type_name(form);
}

void addPictures(CLI::App& verb, PlayOptions& options) {
    verb.add_option("PICTURE", options.pictures,
                    "Patterns, as fwzel list tells them, and PNG and PPM files; default every pattern")
        ->type_name("");
    verb.add_option("--size", options.size,
                    "Size of patterns and of what is drawn on; default 1920x1080, or the first file's")
        ->type_name("WIDTHxHEIGHT");
    verb.add_flag("--fields", options.isInterlaced,
                  "Pictures as two fields: even frames show the even field, odd ones the odd field");
    verb.add_flag("--half", options.isFp16, "Half floats in place of bytes");
    verb.add_option("--buffers", options.numBuffers,
                    "Buffers of a texture, a power of two; default 1, with fields 2")
        ->type_name("NUMBER");
    allow(verb.add_option("--upload", options.upload,
                          "How each frame goes up: from its host buffer, through a pixel buffer, or from a "
                          "thread that writes into the mapped pixel buffer"),
          std::vector<std::string>{"host", "pbo", "producer"})
        ->capture_default_str();
    allow(verb.add_option("--filter", options.filter, "Default nearest, with fields linear"),
          std::vector<std::string>{"nearest", "linear"});
}

void addDrawing(CLI::App& verb, PlayOptions& options) {
    verb.add_option("--program", options.program,
                    "Cg file with the fragment program to draw pictures with, or the name of one that comes "
                    "with fwzel")
        ->type_name("FILE");
    verb.add_option("--entry", options.entry, "Its entry function; default Cg_Main")->type_name("NAME");
    addRepeated(verb, "--param", options.parameters,
                "A uniform parameter's values, matrices row by row; more than once", "NAME=VALUE,...");
    addRepeated(verb, "--texture", options.textures, "A sampler's picture; more than once", "NAME=FILE");
    verb.add_option("--tessellation", options.tessellation, "Cells of the plane across and down")
        ->type_name("ACROSSxDOWN")
        ->capture_default_str();
    verb.add_option("--aspect", options.aspect, "Shape of the plane; default the picture's")
        ->type_name("WIDTH:HEIGHT");
    addRepeated(verb, "--box", options.boxes, "Two opposite corners of a box; more than once", "X,Y,X,Y");
    addRepeated(verb, "--polyline", options.polylines, "Points of a polyline; more than once", "X,Y,...");
    verb.add_flag("--closed", options.isClosed, "Polylines go back to their first point");
    verb.add_option("--colour", options.colour, "Of boxes and polylines, from 0 to 1")
        ->type_name("R,G,B[,A]")
        ->capture_default_str();
    verb.add_option("--line-width", options.lineWidth, "Of boxes and polylines, in pixels")
        ->type_name("PIXELS")
        ->capture_default_str();
    verb.add_flag("--move", options.isMoving, "Boxes and polylines move");
}

void addRunning(CLI::App& verb, PlayOptions& options) {
    verb.add_option("--frames", options.frames,
                    "Frames of each picture; default without end in a window, else 1")
        ->type_name("NUMBER");
    verb.add_option("--rate", options.rate, "Frames a second at most; 0 as fast as they come")
        ->type_name("NUMBER")
        ->capture_default_str();
    verb.add_option("--out", options.output,
                    "Writes every frame as PNG; - writes raw r, g, b, a bytes to standard output")
        ->type_name("frame_%05d.png|-");
    verb.add_flag("--stats", options.hasStatistics,
                  "Tells mean, least and most milliseconds of upload, drawing and readback");
    verb.add_option("--stats-window", options.statisticsWindow, "Frames that they are taken over")
        ->type_name("FRAMES")
        ->capture_default_str();
    verb.add_flag("--overlay", options.hasOverlay, "Draws these times over the picture");
    allow(verb.add_option("--surface", options.surface,
                          "auto: headless with --out and where there is no display, else a window"),
          std::vector<std::string>{"auto", "window", "headless"})
        ->capture_default_str();
}

constexpr const char* FOOTER =
    "Corners and points are in the coordinates of the plane: x from -1 to 1 across, y upwards in the same "
    "unit.\n"
    "A program gets by itself, where it has them: the samplers picture (what the frame shows), even and odd\n"
    "(its fields), float2 pictureSize, float field (0 even, 1 odd) and float frame.\n"
    "Those that come with fwzel are in share/fwzel/Cg below where it is installed.\n"
    "Keys in the window: right and left arrow or n and b picture, f fields, h half floats, space pause,\n"
    "o stage times, return full screen, q quit.\n"
    "Examples:\n"
    "  fwzel play\n"
    "  fwzel play combi --fields --upload producer --frames 250 --out - --stats > combi.rgba\n"
    "  fwzel play logo.png --program key_over_checkerboard.cg --param cell=32 --out logo_%d.png";

} // namespace

void addPlayVerb(CLI::App& command) {
    CLI::App* const verb = command.add_subcommand(
        "play", "Shows patterns and pictures in a window, or renders them without one");
    const auto options = std::make_shared<PlayOptions>();
    addPictures(*verb, *options);
    addDrawing(*verb, *options);
    addRunning(*verb, *options);
    verb->footer(FOOTER);
    verb->callback([options] { play(*options); });
}
