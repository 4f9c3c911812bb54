#include "Verbs.h"

#include "Arguments.h"

#include <OutputFile.h>
#include <PngWriter.h>
#include <PpmWriter.h>

#include <FwZel/PictureSize.h>
#include <FwZel/TestPatternCatalogue.h>
#include <FwZel/VideoTestImage.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <array>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace {

/// The command line as it came; what was not given is empty.
struct PatternOptions {
    std::string pattern;
    std::string output;
    std::string format;
    std::string field = "frame";
    std::string order;
    std::string component;
    std::string size = "1920x1080";
    std::string region;
    std::optional<uint32_t> pitch;
    std::optional<uint32_t> bytes;
    std::optional<uint32_t> frames;
    bool isHalf = false;
};

enum class Format { PNG, PPM, RAW };

/// What is to be drawn and how it is laid out, with every option checked.
struct PatternPicture {
    const TestPatternEntry* pattern = nullptr;
    Format format = Format::RAW;
    uint32_t width = 0;
    uint32_t height = 0; ///< rows: the field height of a field
    uint32_t pitch = 0;  ///< pixels from one row to the next
    uint32_t field = 2;
    uint32_t order = VideoTestImage::COL_RGBA;
    std::optional<uint32_t> component; ///< the one component of a planar picture
    uint32_t bytesPerComponent = 1;
    bool isHalf = false;
    Region region = {};

    uint32_t bytesPerPixel() const { return component ? bytesPerComponent : isHalf ? 8 : 4; }
    size_t rowBytes() const { return size_t{pitch} * bytesPerPixel(); }
};

constexpr std::array<std::pair<const char*, Format>, 3> FORMATS = {
    {{"png", Format::PNG}, {"ppm", Format::PPM}, {"raw", Format::RAW}}};
constexpr std::array<std::pair<const char*, uint32_t>, 3> FIELDS = {{{"even", 0}, {"odd", 1}, {"frame", 2}}};
constexpr std::array<std::pair<const char*, uint32_t>, 4> ORDERS = {{{"argb", VideoTestImage::COL_ARGB},
                                                                     {"rgba", VideoTestImage::COL_RGBA},
                                                                     {"abgr", VideoTestImage::COL_ABGR},
                                                                     {"barg", VideoTestImage::COL_BARG}}};
constexpr std::array<std::pair<const char*, uint32_t>, 8> COMPONENTS = {
    {{"r", 0}, {"g", 1}, {"b", 2}, {"a", 3}, {"cr", 0}, {"y", 1}, {"cb", 2}, {"k", 3}}};

template <class Table>
std::vector<std::string> namesOf(const Table& table) {
    std::vector<std::string> names(table.size());
    std::transform(table.begin(), table.end(), names.begin(), [](const auto& entry) { return entry.first; });
    return names;
}

/// The value of a name that the option's check has let through.
template <class Table>
auto valueOf(const Table& table, const std::string& name) {
    return std::find_if(table.begin(), table.end(), [&](const auto& entry) { return entry.first == name; })
        ->second;
}

Format formatOf(const PatternOptions& options) {
    if (!options.format.empty())
        return valueOf(FORMATS, options.format);
    if (options.output == "-")
        return Format::RAW;
    const size_t dot = options.output.find_last_of("./");
    const std::string extension =
        dot == std::string::npos || options.output[dot] == '/' ? "" : options.output.substr(dot + 1);
    for (const auto& [name, format] : FORMATS)
        if (extension == name)
            return format;
    throw WrongCall(options.output +
                    ": the extension tells no format (.png, .ppm or .raw); name one with --format");
}

void refuseWhatTheFormatCannotHold(const PatternOptions& options, Format format) {
    if (format == Format::RAW)
        return;
    const std::string name = format == Format::PNG ? "PNG" : "PPM";
    if (options.isHalf)
        throw WrongCall("--half: " + name + " holds no half floats; write raw");
    if (!options.order.empty())
        throw WrongCall("--order: " + name + " fixes the order of components; write raw");
    if (options.pitch)
        throw WrongCall("--pitch: rows in " + name + " have no gaps; write raw");
    if (options.frames)
        throw WrongCall("--frames: " + name + " holds one picture; write raw");
    if (format == Format::PPM && !options.component.empty())
        throw WrongCall("--component: PPM always has three components; write PNG or raw");
    if (options.bytes == 4)
        throw WrongCall("--bytes 4: PNG samples have one or two bytes; write raw");
}

void refuseWhatDoesNotGoTogether(const PatternOptions& options) {
    if (!options.component.empty() && options.isHalf)
        throw WrongCall("--half: a single component is an integer of 1, 2 or 4 bytes");
    if (!options.component.empty() && !options.order.empty())
        throw WrongCall("--order: a single component has no order");
    if (options.component.empty() && options.bytes)
        throw WrongCall("--bytes: only a single component has a choice of sizes; add --component");
    if (options.frames == 0U)
        throw WrongCall("--frames: 0 frames are no output");
}

void refuseImpossibleSize(const PatternPicture& picture) {
    constexpr uint32_t NUM_BARS = 8;
    const uint32_t number = picture.pattern->number;
    if ((number == VideoTestImage::COLOUR_BAR_100 || number == VideoTestImage::COLOUR_BAR_75) &&
        picture.width < NUM_BARS)
        throw WrongCall("--size: eight colour bars need a width of 8 pixels or more");
    if (picture.height == 0)
        throw WrongCall("--size: a field of one line has no rows");
    if (picture.format == Format::PNG && std::max(picture.width, picture.height) > host::MAX_PNG_SIDE)
        throw WrongCall("--size: PNG takes " + std::to_string(host::MAX_PNG_SIDE) +
                        " pixels a side at most; write raw or PPM");
    if (picture.pitch < picture.width)
        throw WrongCall("--pitch: " + std::to_string(picture.pitch) + " pixels are less than the width, " +
                        std::to_string(picture.width));
    if (!pictureFits(picture.pitch, picture.height, picture.bytesPerPixel()))
        throw WrongCall("--size: the picture takes 2 GiB or more");
    const Region& region = picture.region;
    if (uint64_t{region.x} + region.width > picture.width ||
        uint64_t{region.y} + region.height > picture.height)
        throw WrongCall("--region: reaches beyond the picture of " + std::to_string(picture.width) + "x" +
                        std::to_string(picture.height));
}

PatternPicture pictureOf(const PatternOptions& options) {
    PatternPicture picture;
    picture.pattern = findTestPattern(options.pattern);
    if (!picture.pattern)
        throw WrongCall("\"" + options.pattern +
                        "\" is no pattern; fwzel list tells their names and numbers");
    picture.format = formatOf(options);
    refuseWhatDoesNotGoTogether(options);
    refuseWhatTheFormatCannotHold(options, picture.format);

    const Size size = parseSize("--size", options.size);
    picture.field = valueOf(FIELDS, options.field);
    picture.width = size.width;
    picture.height = picture.field == 2 ? size.height : size.height / 2;
    picture.pitch = options.pitch.value_or(size.width);
    if (!options.order.empty())
        picture.order = valueOf(ORDERS, options.order);
    if (!options.component.empty())
        picture.component = valueOf(COMPONENTS, options.component);
    picture.bytesPerComponent = options.bytes.value_or(1);
    picture.isHalf = options.isHalf;
    picture.region = options.region.empty() ? Region{0, 0, picture.width, picture.height}
                                            : parseRegion("--region", options.region);
    refuseImpossibleSize(picture);
    return picture;
}

std::vector<unsigned char> draw(const PatternPicture& picture) {
    std::vector<unsigned char> pixels(picture.rowBytes() * picture.height);
    const Region& region = picture.region;
    if (picture.component)
        VideoTestImage::fillTestPatternPlanar(pixels.data(), picture.width, picture.height, picture.pitch,
                                              picture.pattern->number, picture.field, *picture.component,
                                              picture.bytesPerComponent, region.x, region.y, region.width,
                                              region.height);
    else
        VideoTestImage::fillTestPattern(pixels.data(), picture.order, picture.width, picture.height,
                                        picture.pitch, picture.pattern->number, picture.field, region.x,
                                        region.y, region.width, region.height, picture.isHalf);
    return pixels;
}

void writePattern(const PatternOptions& options) {
    const PatternPicture picture = pictureOf(options);
    const std::vector<unsigned char> pixels = draw(picture);
    const host::PictureView view = {pixels.data(), picture.width, picture.height, picture.rowBytes()};
    host::OutputFile output(options.output);
    switch (picture.format) {
    case Format::PNG:
        writePng(output, view,
                 !picture.component               ? host::PngPixel::RGBA8
                 : picture.bytesPerComponent == 2 ? host::PngPixel::GREY16
                                                  : host::PngPixel::GREY8);
        break;
    case Format::PPM:
        writePpm(output, view);
        break;
    case Format::RAW:
        for (uint32_t frame = 0; frame < options.frames.value_or(1); ++frame)
            output.write(pixels.data(), pixels.size());
        break;
    }
    output.close();
}

/// Lets the option take these values only, and tells them in the help.
template <class Value>
CLI::Option* allow(CLI::Option* option, const std::vector<Value>& values) {
    return option->check(CLI::IsMember(values).description(""))->type_name(CLI::detail::join(values, "|"));
}

void addWhatIsDrawn(CLI::App& verb, PatternOptions& options) {
    verb.add_option("--size", options.size, "Size of the frame; a field has half its lines")
        ->type_name("WIDTHxHEIGHT")
        ->capture_default_str();
    allow(verb.add_option("--field", options.field, "The whole frame, or the lines of one field"),
          namesOf(FIELDS))
        ->capture_default_str();
    verb.add_option("--region", options.region,
                    "Draws this rectangle of the picture alone; the rest is 0 in every component")
        ->type_name("WIDTHxHEIGHT+X+Y");
    allow(verb.add_option("--component", options.component,
                          "One component alone; r is the same as cr, g as y, b as cb, a as k"),
          namesOf(COMPONENTS));
    allow(verb.add_option("--bytes", options.bytes,
                          "Bytes of that component, in the machine's byte order; default 1"),
          std::vector<uint32_t>{1, 2, 4});
}

void addRawLayout(CLI::App& verb, PatternOptions& options) {
    verb.add_flag("--half", options.isHalf, "Half floats in place of bytes; raw only");
    allow(verb.add_option("--order", options.order,
                          "Components from the lowest address; raw only, default rgba"),
          namesOf(ORDERS));
    verb.add_option("--pitch", options.pitch, "Pixels from one row to the next; raw only, default the width")
        ->type_name("PIXELS");
    verb.add_option("--frames", options.frames, "Writes the picture this many times; raw only, default 1")
        ->type_name("NUMBER");
}

} // namespace

void addPatternVerb(CLI::App& command) {
    CLI::App* const verb =
        command.add_subcommand("pattern", "Writes a test pattern as PNG, PPM or raw pixels");
    const auto options = std::make_shared<PatternOptions>();
    verb->add_option("PATTERN", options->pattern, "Name or number, as fwzel list tells them")
        ->required()
        ->type_name("NAME|NUMBER");
    verb->add_option("-o,--output", options->output, "File to write; - is standard output")
        ->required()
        ->type_name("FILE");
    allow(verb->add_option("--format", options->format,
                           "Format; default what the extension says, raw on standard output"),
          namesOf(FORMATS));
    addWhatIsDrawn(*verb, *options);
    addRawLayout(*verb, *options);
    verb->footer("Examples:\n"
                 "  fwzel pattern colour-bar-75 -o bars.png\n"
                 "  fwzel pattern circle --size 720x576 --field odd -o circle.ppm\n"
                 "  fwzel pattern h-sweep --component y --bytes 2 -o luma.raw\n"
                 "  fwzel pattern combi --frames 250 -o - |\n"
                 "    ffplay -f rawvideo -pixel_format rgba -video_size 1920x1080 -");
    verb->callback([options] { writePattern(*options); });
}
