#include "Verbs.h"

#include "Arguments.h"
#include "ContactSheet.h"
#include "RoundTrip.h"

#include <GlRequirements.h>
#include <HeadlessContext.h>
#include <OutputFile.h>
#include <PngWriter.h>

#include <FwZel/PictureRefusal.h>
#include <FwZel/TestPatternCatalogue.h>

#include <epoxy/gl.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iomanip>
#include <iostream>
#include <map>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

struct RoundTripOptions {
    std::string folder = "out";
    std::string size = "1920x1080";
    std::vector<std::string> files;
    std::vector<std::string> interlacedFiles;
};

struct Picture {
    std::string name; ///< without blanks, for the table and the file that is written
    RoundTrip::Source source;
};

/// Milliseconds of each stage; those that run once an upload are the mean of both uploads.
struct StageTimes {
    double build = 0;
    double hostUpload = 0;
    double producerUpload = 0;
    double copy = 0;
    double readback = 0;
    double compare = 0;
    double write = 0;
};

template <class Work>
double millisecondsOf(Work work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
}

/// Sends pictures to the GPU and back, and writes the table and the files that tell of it.
class RoundTripReport {
public:
    explicit RoundTripReport(const RoundTripOptions& options)
        : mFolder(options.folder), mTable("-"), mSheet(NUM_TEST_PATTERNS) {
        std::filesystem::create_directories(mFolder);
        mTable.write("picture                 size       depth   build   host    PBO     copy    back    "
                     "compare write   equal\n");
    }

    void run(const Picture& picture);

    /// @throw std::runtime_error  some picture did not come back as it went up
    void close();

private:
    std::string bothWays(RoundTrip& trip, StageTimes& times);
    void writePicture(const Picture& picture, const host::PictureView& view);
    void writeRow(const Picture& picture, const RoundTrip& trip, const StageTimes& times,
                  const std::string& difference);

    std::filesystem::path mFolder;
    host::OutputFile mTable;
    ContactSheet mSheet;
    size_t mNumPictures = 0;
    size_t mNumChanged = 0;
};

void RoundTripReport::run(const Picture& picture) {
    StageTimes times;
    std::unique_ptr<RoundTrip> trip;
    times.build = millisecondsOf([&] { trip = std::make_unique<RoundTrip>(picture.source); });
    const std::string difference = bothWays(*trip, times);
    times.write = millisecondsOf([&] {
        const std::vector<unsigned char> pixels = trip->frame();
        writePicture(picture,
                     {pixels.data(), trip->getWidth(), trip->getHeight(), size_t{trip->getWidth()} * 4});
    });
    writeRow(picture, *trip, times, difference);
    ++mNumPictures;
    mNumChanged += difference.empty() ? 0 : 1;
}

std::string RoundTripReport::bothWays(RoundTrip& trip, StageTimes& times) {
    std::string difference;
    const auto fromTextureToComparison = [&](const char* way) {
        times.copy += millisecondsOf([&] { trip.copyOnGpu(); }) / 2;
        times.readback += millisecondsOf([&] { trip.readBack(); }) / 2;
        times.compare += millisecondsOf([&] {
                             const std::string found = trip.difference();
                             if (!found.empty())
                                 difference +=
                                     std::string(difference.empty() ? "" : "; ") + way + ": " + found;
                         }) /
                         2;
    };
    trip.wipe();
    times.hostUpload = millisecondsOf([&] { trip.uploadFromHostBuffers(); });
    fromTextureToComparison("host");
    trip.wipe();
    times.producerUpload = millisecondsOf([&] { trip.uploadFromProducerThread(); });
    fromTextureToComparison("PBO");
    return difference;
}

void RoundTripReport::writePicture(const Picture& picture, const host::PictureView& view) {
    const char* const depth = picture.source.isFp16 ? "-half.png" : "-8bit.png";
    host::OutputFile file((mFolder / (picture.name + depth)).string());
    writePng(file, view, host::PngPixel::RGBA8);
    file.close();
    if (picture.source.file.empty() && !picture.source.isFp16)
        mSheet.add(picture.name, view);
}

void RoundTripReport::writeRow(const Picture& picture, const RoundTrip& trip, const StageTimes& times,
                               const std::string& difference) {
    std::ostringstream row;
    row << std::left << std::setw(22) << picture.name << "  " << std::setw(9)
        << std::to_string(trip.getWidth()) + 'x' + std::to_string(trip.getHeight()) << "  "
        << (picture.source.isFp16 ? "half " : "8-bit") << std::right << std::fixed << std::setprecision(1);
    for (const double time : {times.build, times.hostUpload, times.producerUpload, times.copy, times.readback,
                              times.compare, times.write})
        row << "  " << std::setw(6) << time;
    row << "  " << (difference.empty() ? "yes" : "NO, " + difference) << '\n';
    mTable.write(row.str());
}

void RoundTripReport::close() {
    host::OutputFile sheet((mFolder / "contact-sheet.png").string());
    writePng(sheet, mSheet.view(), host::PngPixel::RGBA8);
    sheet.close();
    mTable.close();
    if (mNumChanged > 0)
        throw std::runtime_error(std::to_string(mNumChanged) + " of " + std::to_string(mNumPictures) +
                                 " pictures came back changed");
    std::cerr << "fwzel: " << mNumPictures
              << " pictures came back as they went up, by host buffer and by PBO; "
              << "times are in milliseconds\nfwzel: look at " << (mFolder / "contact-sheet.png").string()
              << " and the other pictures in " << mFolder.string() << '\n';
}

Picture pictureOfFile(const std::string& file, bool isInterlaced) {
    Picture picture;
    picture.name = std::filesystem::path(file).filename().string() + (isInterlaced ? "-fields" : "");
    picture.source.file = file;
    picture.source.isInterlaced = isInterlaced;
    return picture;
}

Picture pictureOfPattern(const TestPatternEntry& pattern, const Size& size) {
    Picture picture;
    picture.name = (pattern.number < 10 ? "0" : "") + std::to_string(pattern.number) + '-' + pattern.name;
    picture.source.pattern = pattern.number;
    picture.source.width = size.width;
    picture.source.height = size.height;
    return picture;
}

/// Files of one name in several folders would overwrite one another in the output folder.
void tellApart(std::vector<Picture>& pictures) {
    std::map<std::string, int> uses;
    for (Picture& picture : pictures) {
        std::replace(picture.name.begin(), picture.name.end(), ' ', '_');
        const int use = ++uses[picture.name];
        if (use > 1)
            picture.name += '-' + std::to_string(use);
    }
}

/// @throw std::runtime_error  a file is refused; what() names it and the reason
std::vector<Picture> picturesOf(const RoundTripOptions& options) {
    const Size size = parseSize("--size", options.size);
    std::vector<Picture> pictures;
    for (const std::string& file : options.files)
        pictures.push_back(pictureOfFile(file, false));
    for (const std::string& file : options.interlacedFiles)
        pictures.push_back(pictureOfFile(file, true));
    for (const Picture& picture : pictures) {
        const std::string refusal = pictureRefusal(picture.source.file);
        if (!refusal.empty())
            throw std::runtime_error(picture.source.file + ": " + refusal);
    }
    tellApart(pictures);
    for (const TestPatternEntry& pattern : testPatternCatalogue())
        pictures.push_back(pictureOfPattern(pattern, size));
    return pictures;
}

void roundTrip(const RoundTripOptions& options) {
    std::vector<Picture> pictures = picturesOf(options);
    using host::GlFeature;
    const host::HeadlessContext context;
    host::requireGlFeatures({GlFeature::TEXTURES, GlFeature::FRAMEBUFFERS, GlFeature::UPLOAD_BUFFERS,
                             GlFeature::READBACK_BUFFERS, GlFeature::HALF_FLOATS,
                             GlFeature::FRAMEBUFFER_BLIT});
    std::cerr << "fwzel: OpenGL " << glGetString(GL_VERSION) << " on " << glGetString(GL_RENDERER) << '\n';
    RoundTripReport report(options);
    for (Picture& picture : pictures)
        for (const bool isFp16 : {false, true}) {
            picture.source.isFp16 = isFp16;
            report.run(picture);
        }
    report.close();
}

} // namespace

void addRoundTripVerb(CLI::App& command) {
    CLI::App* const verb = command.add_subcommand(
        "roundtrip", "Sends every pattern and the given pictures to the GPU and back, and compares");
    const auto options = std::make_shared<RoundTripOptions>();
    verb->add_option("FILE", options->files, "PNG and PPM pictures, as whole frames")->type_name("");
    verb->add_option("--interlaced", options->interlacedFiles,
                     "A picture as two fields, a buffer each; more than once")
        ->allow_extra_args(false)
        ->type_name("FILE");
    verb->add_option("--size", options->size, "Size of the patterns")
        ->type_name("WIDTHxHEIGHT")
        ->capture_default_str();
    verb->add_option("--out", options->folder, "Folder for what came back, as PNG, with a contact sheet")
        ->type_name("FOLDER")
        ->capture_default_str();
    verb->footer(
        "A picture goes up from its host buffer and again from a thread that writes into its mapped PBO,\n"
        "in bytes and in half floats; on the GPU it is copied to a texture that is read back. The table\n"
        "gives the milliseconds of each stage (copy, back and compare: mean of both uploads) and whether\n"
        "every byte came back. Any that did not makes the exit status 1.");
    verb->callback([options] { roundTrip(*options); });
}
