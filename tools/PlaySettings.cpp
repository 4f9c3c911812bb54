#include "PlaySettings.h"

#include "NumberedName.h"
#include "Verbs.h"

#include <FwZel/PictureRefusal.h>
#include <FwZel/PictureSize.h>
#include <FwZel/VideoTestImage.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>
#include <stdexcept>

namespace {

constexpr Size DEFAULT_SIZE = {1920, 1080};
constexpr uint32_t MAX_FRAMES = std::numeric_limits<int>::max();

WrongCall noNumbers(const std::string& option, const std::string& text) {
    return WrongCall(option + ": \"" + text + "\" is no list of numbers; write it as 0.5,-1,2");
}

/// Reads "0.5,-1,2".
std::vector<float> parseNumbers(const std::string& option, const std::string& text) {
    std::vector<float> numbers;
    const char* at = text.c_str();
    for (;;) {
        char* end = nullptr;
        numbers.push_back(std::strtof(at, &end));
        const bool isNumber = end != at && std::isfinite(numbers.back());
        if (isNumber && *end == '\0')
            return numbers;
        if (!isNumber || *end != ',')
            throw noNumbers(option, text);
        at = end + 1;
    }
}

PlayAssignment parseAssignment(const std::string& option, const std::string& text) {
    const size_t equals = text.find('=');
    if (equals == 0 || equals == std::string::npos || equals + 1 == text.size())
        throw WrongCall(option + ": \"" + text + "\" names nothing; write it as name=value");
    return {text.substr(0, equals), text.substr(equals + 1)};
}

/// Reads "16:9", width and height.
float parseAspect(const std::string& text) {
    const size_t colon = text.find(':');
    const std::string numbers =
        colon == std::string::npos ? text : text.substr(0, colon) + ',' + text.substr(colon + 1);
    const std::vector<float> sides = parseNumbers("--aspect", numbers);
    if (colon == std::string::npos || sides.size() != 2 || sides[0] <= 0 || sides[1] <= 0)
        throw WrongCall("--aspect: \"" + text + "\" is no shape; write it as 16:9");
    return sides[1] / sides[0];
}

void refuseUnreadable(const std::string& file) {
    const std::string refusal = pictureRefusal(file);
    if (!refusal.empty())
        throw std::runtime_error(file + ": " + refusal);
}

/// What has the name of a pattern is one; everything else is a file.
PlaySource sourceOf(const std::string& picture) {
    PlaySource source;
    source.pattern = findTestPattern(picture);
    if (source.pattern)
        return source;
    if (picture.find_first_of("./") == std::string::npos)
        throw WrongCall("\"" + picture +
                        "\" is no pattern and no picture file; fwzel list tells the patterns");
    source.file = picture;
    refuseUnreadable(picture);
    return source;
}

std::vector<PlaySource> sourcesOf(const PlayOptions& options) {
    std::vector<PlaySource> sources;
    for (const std::string& picture : options.pictures)
        sources.push_back(sourceOf(picture));
    if (sources.empty())
        for (const TestPatternEntry& pattern : testPatternCatalogue())
            sources.push_back({&pattern, ""});
    return sources;
}

Size sizeOf(const PlayOptions& options, const PlaySource& first) {
    if (!options.size.empty())
        return parseSize("--size", options.size);
    if (first.pattern)
        return DEFAULT_SIZE;
    Size size = {};
    uint32_t bytesPerColour = 0;
    VideoTestImage::getWidthHeightFromFile(first.file, &size.width, &size.height, &bytesPerColour);
    return size;
}

void refuseImpossibleSize(const PlaySettings& settings) {
    constexpr uint32_t NUM_BARS = 8;
    constexpr uint32_t MAX_BYTES_PER_PIXEL = 8;
    const Size& size = settings.size;
    if (!pictureFits(size.width, size.height, MAX_BYTES_PER_PIXEL))
        throw WrongCall("--size: a picture of " + std::to_string(size.width) + "x" +
                        std::to_string(size.height) + " takes 2 GiB or more");
    const bool hasBars =
        std::any_of(settings.sources.begin(), settings.sources.end(), [](const PlaySource& source) {
            return source.pattern && (source.pattern->number == VideoTestImage::COLOUR_BAR_100 ||
                                      source.pattern->number == VideoTestImage::COLOUR_BAR_75);
        });
    if (hasBars && size.width < NUM_BARS)
        throw WrongCall("--size: eight colour bars need a width of 8 pixels or more");
    if (settings.layout.isInterlaced && size.height < 2)
        throw WrongCall("--fields: a frame of one line has no odd field");
}

PlayLayout layoutOf(const PlayOptions& options, const Size& size) {
    PlayLayout layout;
    layout.size = size;
    layout.isInterlaced = options.isInterlaced;
    layout.isFp16 = options.isFp16;
    layout.numBuffers = options.numBuffers.value_or(options.isInterlaced ? 2 : 1);
    layout.upload = options.upload == "producer" ? PlayUpload::PRODUCER
                    : options.upload == "pbo"    ? PlayUpload::PBO
                                                 : PlayUpload::HOST;
    // Between the lines of a field there is nothing nearest.
    layout.isFiltered = options.filter.empty() ? options.isInterlaced : options.filter == "linear";
    const uint32_t count = layout.numBuffers;
    if (count == 0 || (count & (count - 1)) != 0 || count > 64)
        throw WrongCall("--buffers: " + std::to_string(count) + " is none of 1, 2, 4, 8, 16, 32, 64");
    if (layout.isInterlaced && count < 2)
        throw WrongCall("--buffers: two fields need two buffers or more");
    return layout;
}

PlayProgramSettings programOf(const PlayOptions& options) {
    PlayProgramSettings program;
    program.file = options.program;
    program.entry = options.entry.empty() ? "Cg_Main" : options.entry;
    if (program.file.empty() &&
        (!options.entry.empty() || !options.parameters.empty() || !options.textures.empty()))
        throw WrongCall("--entry, --param and --texture tell of a program; add --program FILE");
    for (const std::string& text : options.parameters) {
        const PlayAssignment assignment = parseAssignment("--param", text);
        program.parameters.push_back(
            {assignment.name, parseNumbers("--param " + assignment.name, assignment.text)});
    }
    for (const std::string& text : options.textures) {
        program.textures.push_back(parseAssignment("--texture", text));
        refuseUnreadable(program.textures.back().text);
    }
    return program;
}

PlayShapeSettings shapesOf(const PlayOptions& options) {
    PlayShapeSettings shapes;
    for (const std::string& text : options.boxes) {
        const std::vector<float> sides = parseNumbers("--box", text);
        if (sides.size() != 4)
            throw WrongCall("--box: \"" + text + "\" is no box; write it as X,Y,X,Y");
        shapes.boxes.push_back({sides[0], sides[1], sides[2], sides[3]});
    }
    for (const std::string& text : options.polylines) {
        shapes.polylines.push_back(parseNumbers("--polyline", text));
        if (shapes.polylines.back().size() % 2 != 0)
            throw WrongCall("--polyline: \"" + text + "\" lacks the y of its last point");
    }
    std::vector<float> colour = parseNumbers("--colour", options.colour);
    if (colour.size() == 3)
        colour.push_back(1);
    if (colour.size() != 4)
        throw WrongCall("--colour: \"" + options.colour + "\" is no colour; write it as R,G,B or R,G,B,A");
    std::copy(colour.begin(), colour.end(), shapes.colour.begin());
    if (!(options.lineWidth > 0) || !std::isfinite(options.lineWidth))
        throw WrongCall("--line-width: lines have a width above 0");
    shapes.lineWidth = options.lineWidth;
    shapes.isClosed = options.isClosed;
    shapes.isMoving = options.isMoving;
    if (shapes.isMoving && shapes.boxes.empty() && shapes.polylines.empty())
        throw WrongCall("--move: there is no --box and no --polyline to move");
    return shapes;
}

host::SurfaceKind surfaceOf(const PlayOptions& options) {
    if (options.surface == "window")
        return host::SurfaceKind::WINDOW;
    // A window may not get the size that is asked for, and what covers it may show in what is read back.
    return options.surface == "headless" || !options.output.empty() ? host::SurfaceKind::HEADLESS
                                                                    : host::SurfaceKind::AUTO;
}

void setFrames(PlaySettings& settings, const PlayOptions& options) {
    if (options.frames == 0U)
        throw WrongCall("--frames: 0 frames are nothing to show");
    if (!(options.rate >= 0) || !std::isfinite(options.rate))
        throw WrongCall("--rate: frames a second are 0 (as fast as they come) or more");
    if (options.statisticsWindow == 0)
        throw WrongCall("--stats-window: 0 frames have no average");
    if (options.statisticsWindow > MAX_FRAMES)
        throw WrongCall("--stats-window: the frame counter ends at " + std::to_string(MAX_FRAMES));
    settings.framesPerPicture = options.frames.value_or(0);
    settings.rate = options.rate;
    settings.statisticsWindow = static_cast<int>(options.statisticsWindow);
}

} // namespace

PlaySettings settingsOf(const PlayOptions& options) {
    PlaySettings settings;
    settings.sources = sourcesOf(options);
    settings.size = sizeOf(options, settings.sources.front());
    settings.layout = layoutOf(options, settings.size);
    refuseImpossibleSize(settings);
    settings.program = programOf(options);
    settings.shapes = shapesOf(options);
    settings.tessellation = parseSize("--tessellation", options.tessellation);
    if (!options.aspect.empty())
        settings.aspect = parseAspect(options.aspect);
    setFrames(settings, options);
    settings.output = options.output;
    if (!options.output.empty() && options.output != "-")
        refuseFrameName(options.output);
    settings.hasStatistics = options.hasStatistics;
    settings.hasOverlay = options.hasOverlay;
    settings.surface = surfaceOf(options);
    return settings;
}

void settleFrames(PlaySettings& settings, bool isWindow) {
    if (settings.framesPerPicture == 0 && !isWindow)
        settings.framesPerPicture = 1;
    const uint64_t frames = uint64_t{settings.framesPerPicture} * settings.sources.size();
    if (frames > MAX_FRAMES)
        throw WrongCall("--frames: the frame counter ends at " + std::to_string(MAX_FRAMES));
    settings.frames = static_cast<int>(frames);
    if (settings.frames > 0)
        settings.statisticsWindow = std::min(settings.statisticsWindow, settings.frames);
}
