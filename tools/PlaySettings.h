#ifndef TOOLS_PLAYSETTINGS_H
#define TOOLS_PLAYSETTINGS_H

#include "Arguments.h"

#include <Surface.h>

#include <FwZel/TestPatternCatalogue.h>

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// The command line of "fwzel play" as it came; what was not given is empty.
struct PlayOptions {
    std::vector<std::string> pictures;
    std::string size;
    bool isInterlaced = false;
    bool isFp16 = false;
    std::optional<uint32_t> numBuffers;
    std::string upload = "host";
    std::string filter;
    std::string program;
    std::string entry;
    std::vector<std::string> parameters;
    std::vector<std::string> textures;
    std::string tessellation = "1x1";
    std::string aspect;
    std::vector<std::string> boxes;
    std::vector<std::string> polylines;
    bool isClosed = false;
    std::string colour = "1,1,1,1";
    float lineWidth = 1;
    bool isMoving = false;
    std::optional<uint32_t> frames;
    double rate = 0;
    std::string output;
    bool hasStatistics = false;
    uint32_t statisticsWindow = 60;
    bool hasOverlay = false;
    std::string surface = "auto";
};

enum class PlayUpload { HOST, PBO, PRODUCER };

/// What is shown: a pattern, or a file where the pattern is null.
struct PlaySource {
    const TestPatternEntry* pattern = nullptr;
    std::string file;

    std::string name() const { return pattern ? pattern->name : file; }
};

/// "name=what" of an option.
struct PlayAssignment {
    std::string name;
    std::string text;
};

struct PlayParameter {
    std::string name;
    std::vector<float> values;
};

/// A Cg fragment program of the user and what it is fed with; without a file, the host's own.
struct PlayProgramSettings {
    std::string file; ///< as it was named, see host::findCgProgram()
    std::string entry;
    std::vector<PlayParameter> parameters;
    std::vector<PlayAssignment> textures;
};

/// Boxes and polylines, in the coordinates of the plane.
struct PlayShapeSettings {
    std::vector<std::array<float, 4>> boxes;   ///< x, y of a corner, x, y of the opposite one
    std::vector<std::vector<float>> polylines; ///< x and y of each point in turn
    bool isClosed = false;
    std::array<float, 4> colour = {};
    float lineWidth = 1;
    bool isMoving = false;
};

/// How pictures lie in their textures.
struct PlayLayout {
    Size size = {}; ///< of patterns
    bool isInterlaced = false;
    bool isFp16 = false;
    uint32_t numBuffers = 1;
    PlayUpload upload = PlayUpload::HOST;
    bool isFiltered = false; ///< linear, not nearest
};

/// What is to be shown and how, with every option checked that can be checked without OpenGL.
struct PlaySettings {
    std::vector<PlaySource> sources;
    Size size = {}; ///< of the surface
    PlayLayout layout;
    PlayProgramSettings program;
    PlayShapeSettings shapes;
    Size tessellation = {};
    std::optional<float> aspect;   ///< height divided by width of the plane
    uint32_t framesPerPicture = 0; ///< 0 for no end
    int frames = 0;                ///< in all; 0 for no end
    double rate = 0;
    std::string output;
    bool hasStatistics = false;
    int statisticsWindow = 1;
    bool hasOverlay = false;
    host::SurfaceKind surface = host::SurfaceKind::AUTO;
};

/// @throw WrongCall  options that are impossible or do not go together
/// @throw std::runtime_error  a picture file is refused; what() names it and the reason
PlaySettings settingsOf(const PlayOptions& options);

/// Sets what depends on the surface that there is: headless, a picture that was not given a number of frames
/// has one; statistics are taken over no more frames than there are.
/// @throw WrongCall  the frames of all pictures pass the frame counter
void settleFrames(PlaySettings& settings, bool isWindow);

#endif
