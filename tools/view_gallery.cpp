// Renders every view kind of the engine from the built-in sample fisheye, for each mount, into
// PNG files: a way to look at what the geometry does without a host. Usage:
//   vexmap_view_gallery <output folder> [sample size]
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>
#include <boost/shared_ptr.hpp>

#include "image_file.h"
#include "picture_limits.h"
#include "sample_scene.h"
#include "tool_error.h"
#include "vexmap/camera.h"
#include "vexmap/camera_builder.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/error.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"

namespace {

using quorvel::vexmap::AbstractView;
using quorvel::vexmap::Camera;
using vexmap_host::RgbImage;

struct Output {
    char const* name;
    int width;
    int height;
};

// Pixels as 32-bit words, so that the RGB32 routine copies whole pixels.
std::vector<uint32_t> ToWords(RgbImage const& image) {
    std::vector<uint32_t> words(std::size_t(image.width) * std::size_t(image.height));
    for (std::size_t i = 0; i < words.size(); ++i) {
        words[i] = uint32_t(image.pixels[3 * i]) | uint32_t(image.pixels[3 * i + 1]) << 8 |
                   uint32_t(image.pixels[3 * i + 2]) << 16;
    }
    return words;
}

RgbImage FromWords(std::vector<uint32_t> const& words, int width, int height) {
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.resize(words.size() * 3);
    for (std::size_t i = 0; i < words.size(); ++i) {
        image.pixels[3 * i] = uint8_t(words[i]);
        image.pixels[3 * i + 1] = uint8_t(words[i] >> 8);
        image.pixels[3 * i + 2] = uint8_t(words[i] >> 16);
    }
    return image;
}

_DEWARP_IMAGE Frame(std::vector<uint32_t>& words, int width, int height) {
    _DEWARP_IMAGE frame = {};
    frame.info.format = DEWARP_IMAGE_FORMAT_RGB32_PACKED;
    frame.info.width = std::size_t(width);
    frame.info.height = std::size_t(height);
    frame.info.stride = std::size_t(width);
    frame.data = reinterpret_cast<unsigned char*>(words.data());
    return frame;
}

void Render(AbstractView& view, std::vector<uint32_t>& source, int source_size,
            Output const& output, std::string const& path) {
    std::vector<uint32_t> pixels(std::size_t(output.width) * std::size_t(output.height), 0xFFu);
    _DEWARP_IMAGE const warped = Frame(source, source_size, source_size);
    _DEWARP_IMAGE dewarped = Frame(pixels, output.width, output.height);
    view.DewarpImage(warped, dewarped);
    vexmap_host::WritePng(path, FromWords(pixels, output.width, output.height));
    std::printf("%s\n", path.c_str());
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app(
        "Renders every view kind of the engine from the built-in sample fisheye, on each mount, "
        "into PNG files.",
        "vexmap_view_gallery");
    app.footer("Exit status: 0 done, 1 the work failed, 2 usage error.");
    std::string directory;
    int size = 1024;
    app.add_option("folder", directory, "folder for the pictures, made if it is missing")
        ->required();
    app.add_option("size", size, "side of the square sample picture, even (default: 1024)")
        ->check(CLI::Range(2, int(vexmap_host::PictureLimits::MAX_SIDE)))
        ->check(CLI::Validator(
            [](std::string& text) {
                return std::atoi(text.c_str()) % 2 == 0 ? std::string()
                                                        : "the size must be even, not " + text;
            },
            "EVEN"));
    try {
        app.parse(argc, argv);
    } catch (CLI::CallForHelp const& help) {
        return app.exit(help);
    } catch (CLI::ParseError const& error) {
        std::fprintf(stderr, "vexmap_view_gallery: %s (see --help)\n", error.what());
        return 2;
    }
    try {
        std::error_code error;
        std::filesystem::create_directories(directory, error);
        if (error || !std::filesystem::is_directory(directory, error)) {
            throw vexmap_host::ToolError("cannot make the folder " + directory + ": " +
                                         (error ? error.message() : "a file has its name"));
        }
        vexmap_host::SampleFisheye const sample = vexmap_host::MakeSampleFisheye(size);
        std::vector<uint32_t> source = ToWords(sample.image);
        _DEWARP_INTERNAL_CAMERA_MODEL const model = {DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE,
                                                     180.0f,
                                                     180.0f,
                                                     180.0f,
                                                     std::size_t(size),
                                                     std::size_t(size)};
        struct Mount {
            char const* name;
            _DEWARP_INTERNAL_CAMERA_MOUNT value;
        } const mounts[] = {{"ceiling", DEWARP_INTERNAL_CAMERA_MOUNT_CEILING},
                            {"floor", DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR},
                            {"wall", DEWARP_INTERNAL_CAMERA_MOUNT_WALL}};
        for (Mount const& mount : mounts) {
            boost::shared_ptr<Camera> camera(
                quorvel::vexmap::CameraBuilder::MakeCamera(model, mount.value));
            std::string const prefix = directory + "/" + mount.name + "-";
            quorvel::vexmap::SinglePtzView ptz(camera, DEWARP_PROJECTION_RECTILINEAR);
            Render(ptz, source, size, {"ptz", 960, 540}, prefix + "single-ptz.png");
            quorvel::vexmap::QuadPtzView quad(camera, DEWARP_PROJECTION_RECTILINEAR);
            Render(quad, source, size, {"quad", 960, 540}, prefix + "quad-ptz.png");
            quorvel::vexmap::SinglePanoramicView panorama(camera, DEWARP_PROJECTION_CYLINDRICAL);
            Render(panorama, source, size, {"panorama", 1280, 360}, prefix + "single-panorama.png");
            quorvel::vexmap::DualPanoramicView dual(camera, DEWARP_PROJECTION_CYLINDRICAL);
            Render(dual, source, size, {"dual", 960, 540}, prefix + "dual-panorama.png");
        }
    } catch (quorvel::vexmap::Error const& error) {
        std::fprintf(stderr, "vexmap_view_gallery: %s\n", error.what());
        return 1;
    } catch (std::exception const& error) {
        std::fprintf(stderr, "vexmap_view_gallery: %s\n", error.what());
        return 1;
    }
    return 0;
}
