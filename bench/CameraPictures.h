#ifndef BENCH_CAMERAPICTURES_H
#define BENCH_CAMERAPICTURES_H

#include <OutputFile.h>
#include <PngWriter.h>
#include <PpmWriter.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <stdexcept>
#include <string>
#include <system_error>
#include <vector>

/// A picture as PNG and as PPM in a temporary folder of its own: a ramp under noise of two bits, as from a
/// camera.
class CameraPictures {
public:
    CameraPictures(uint32_t width, uint32_t height) {
        std::string folder = (std::filesystem::temp_directory_path() / "fwzel-bench-XXXXXX").string();
        if (mkdtemp(folder.data()) == nullptr)
            throw std::runtime_error("no temporary folder " + folder);
        mFolder = folder;
        std::vector<unsigned char> pixels(size_t{4} * width * height);
        uint32_t noise = 1;
        for (size_t i = 0; i < pixels.size(); ++i) {
            noise = noise * 1664525 + 1013904223;
            const size_t ramp = i / 4 % width * 250 / width;
            pixels[i] = static_cast<unsigned char>(ramp + (noise >> 30));
        }
        const host::PictureView view = {pixels.data(), width, height, size_t{4} * width};
        host::OutputFile pngFile(png());
        host::writePng(pngFile, view, host::PngPixel::RGBA8);
        pngFile.close();
        host::OutputFile ppmFile(ppm());
        host::writePpm(ppmFile, view);
        ppmFile.close();
    }
    ~CameraPictures() {
        std::error_code ignored;
        std::filesystem::remove_all(mFolder, ignored);
    }
    CameraPictures(const CameraPictures&) = delete;
    CameraPictures& operator=(const CameraPictures&) = delete;

    std::string png() const { return mFolder + "/picture.png"; }
    std::string ppm() const { return mFolder + "/picture.ppm"; }

private:
    std::string mFolder;
};

#endif
