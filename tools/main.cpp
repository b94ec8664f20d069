// vexmap: loads the dewarping plug-in as a surveillance client does and dewarps a still picture,
// or a built-in sample, into one PNG file per view kind of the chosen dewarper.

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <filesystem>
#include <optional>
#include <string>
#include <unistd.h>
#include <vector>

#include <CLI/CLI.hpp>

#include "dewarp_session.h"
#include "image_file.h"
#include "plugin_host.h"
#include "sample_scene.h"
#include "tool_error.h"

namespace {

using namespace vexmap_host;

constexpr int SAMPLE_SIZE = 1024;
constexpr int USAGE_ERROR = 2;

struct Circle {
    int x = 0;
    int y = 0;
    int radius = 0;
};

struct Options {
    std::string input;
    std::optional<int> mode;
    std::string kind;
    // A camera as a client knows it; given at all, it picks the kind through the registry.
    std::optional<std::string> make;
    std::optional<std::string> model;
    std::optional<std::string> url;
    std::optional<int> sub_mode;
    int position = 1;
    std::optional<Circle> circle;
    RequestedPosition ptz;
    int width = 960;
    int height = 540;
    std::string output = "out";
    std::string plugin;
    int frames = 2;
};

char const* ViewName(int sub_mode) {
    switch (sub_mode) {
        case 1:
            return "ptz";
        case 2:
            return "panorama";
        default:
            return "dual-panorama";
    }
}

std::string Lowercase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return char(std::tolower(c)); });
    return text;
}

std::string DefaultPluginPath() {
    std::error_code error;
    std::filesystem::path const self = std::filesystem::read_symlink("/proc/self/exe", error);
    return error ? "libvexmap_dewarp.so" : (self.parent_path() / "libvexmap_dewarp.so").string();
}

bool EndsWithPng(std::string const& path) {
    return path.size() > 4 && Lowercase(path.substr(path.size() - 4)) == ".png";
}

// A path ending in .png names the file (with the view inserted when there are several views);
// anything else is a directory, made if it is missing.
std::string OutputPath(Options const& options, std::string const& kind, int sub_mode,
                       bool several_views) {
    if (EndsWithPng(options.output)) {
        if (!several_views) {
            return options.output;
        }
        return options.output.substr(0, options.output.size() - 4) + "-" + ViewName(sub_mode) +
               ".png";
    }
    std::error_code error;
    std::filesystem::create_directories(options.output, error);
    if (error) {
        throw ToolError("cannot make the directory " + options.output + ": " + error.message());
    }
    return (std::filesystem::path(options.output) /
            (Lowercase(kind) + "-" + ViewName(sub_mode) + ".png"))
        .string();
}

bool HasCamera(Options const& options) {
    return options.make || options.model || options.url;
}

// "make / model", then " / url" when there is one; an empty make or model shows as "".
std::string CameraText(Options const& options) {
    auto const shown = [](std::optional<std::string> const& text) {
        return text.value_or("").empty() ? std::string("\"\"") : *text;
    };
    std::string text = shown(options.make) + " / " + shown(options.model);
    if (!options.url.value_or("").empty()) {
        text += " / " + *options.url;
    }
    return text;
}

struct Choice {
    int mode = 0;
    std::string how;  // completes "chosen ..." in the line that names the kind
};

Choice ChooseMode(PluginHost const& host, Options const& options) {
    DewarpRegister& registry = host.Register();
    Choice choice;
    if (options.mode) {
        choice = {*options.mode, "by mode"};
    } else if (HasCamera(options)) {
        choice.mode = registry.GetModeByCamera(options.make.value_or("").c_str(),
                                               options.model.value_or("").c_str(),
                                               options.url.value_or("").c_str());
        if (choice.mode == 0) {
            throw ToolError("no dewarper kind suits the camera " + CameraText(options));
        }
        choice.how = "by camera " + CameraText(options);
    } else {
        std::string const kind = options.kind.empty() ? "Sentry360" : options.kind;
        choice = {registry.GetModeByName(kind.c_str()),
                  options.kind.empty() ? "by default" : "by name"};
        if (choice.mode == 0) {
            throw ToolError("unknown dewarper kind \"" + kind + "\"");
        }
    }
    if (std::string(registry.GetName(choice.mode)).empty()) {
        throw ToolError("no dewarper kind has mode " + std::to_string(choice.mode));
    }
    if (!host.DewarperLoaded(choice.mode)) {
        throw ToolError(std::string("the ") + registry.GetName(choice.mode) +
                        " dewarper is not loaded");
    }
    return choice;
}

void RequireCircleInside(Circle const& circle, RgbImage const& picture) {
    if (circle.radius <= 0 || circle.x < 0 || circle.y < 0 || circle.x >= picture.width ||
        circle.y >= picture.height) {
        throw ToolError("the circle " + std::to_string(circle.x) + "," + std::to_string(circle.y) +
                        "," + std::to_string(circle.radius) + " lies outside the " +
                        std::to_string(picture.width) + "x" + std::to_string(picture.height) +
                        " picture");
    }
}

int Run(Options const& options) {
    PluginHost const host(options.plugin.empty() ? DefaultPluginPath() : options.plugin);
    RgbImage picture;
    Circle circle;
    if (options.input.empty()) {
        SampleFisheye sample = MakeSampleFisheye(SAMPLE_SIZE);
        picture = std::move(sample.image);
        circle = {sample.circle_x, sample.circle_y, sample.circle_radius};
    } else {
        picture = ReadImage(options.input);
        // Without a circle, the largest one centred in the picture.
        circle = {picture.width / 2, picture.height / 2,
                  std::min(picture.width, picture.height) / 2};
    }
    circle = options.circle.value_or(circle);
    RequireCircleInside(circle, picture);

    Choice const choice = ChooseMode(host, options);
    int const mode = choice.mode;
    DewarpRegister& registry = host.Register();
    std::string const kind = registry.GetName(mode);
    bool has_lenses = false;
    bool has_circle = false;
    bool has_position = false;
    registry.GetSupportedFeatures(mode, has_lenses, has_circle, has_position);
    DewarpParams params{};
    if (has_position) {
        params.position = options.position;
    }
    if (has_circle) {
        params.circleX = circle.x;
        params.circleY = circle.y;
        params.circleRadius = circle.radius;
    }
    DewarpSession const session(host, mode, params);

    std::vector<int> sub_modes;
    for (int sub_mode = 1; sub_mode <= 3; ++sub_mode) {
        if (options.sub_mode ? *options.sub_mode == sub_mode
                             : session.Get().IsSubModeSupported(sub_mode)) {
            sub_modes.push_back(sub_mode);
        }
    }
    if (options.sub_mode && !session.Get().IsSubModeSupported(*options.sub_mode)) {
        throw ToolError("the " + kind + " dewarper has no sub-mode " +
                        std::to_string(*options.sub_mode));
    }
    // Printed once only rendering and writing can fail, so that a refusal leaves stdout empty.
    printf("%s dewarper (mode %d), chosen %s\n", kind.c_str(), mode, choice.how.c_str());
    for (int const sub_mode : sub_modes) {
        RgbImage const view = session.Render(sub_mode, options.ptz, picture, options.width,
                                             options.height, options.frames);
        std::string const path = OutputPath(options, kind, sub_mode, sub_modes.size() > 1);
        WritePng(path, view);
        printf("%s %s view, %dx%d: %s\n", kind.c_str(), ViewName(sub_mode), view.width, view.height,
               path.c_str());
    }
    return 0;
}

void AddOptions(CLI::App& app, Options& options) {
    app.add_option("--input", options.input,
                   "PNG or JPEG fisheye picture (default: built-in sample)");
    auto* mode = app.add_option("--mode", options.mode, "dewarper mode number");
    auto* kind =
        app.add_option("--kind", options.kind, "dewarper kind by display name (default: Sentry360)")
            ->excludes(mode);
    app.add_option("--make", options.make,
                   "camera make as the device reports it; the camera picks the kind as a client "
                   "would")
        ->excludes(mode)
        ->excludes(kind);
    app.add_option("--model", options.model, "camera model as the device reports it")
        ->excludes(mode)
        ->excludes(kind);
    app.add_option("--url", options.url, "stream URL of the camera")
        ->excludes(mode)
        ->excludes(kind);
    app.add_option("--submode", options.sub_mode,
                   "view kind: 1 PTZ, 2 panorama, 3 dual panorama (default: every supported one)")
        ->check(CLI::Range(1, 3));
    app.add_option("--position", options.position, "camera mount: wall, ceiling or floor")
        ->transform(CLI::CheckedTransformer(
            std::map<std::string, int>{{"wall", 0}, {"ceiling", 1}, {"floor", 2}}))
        ->default_str("ceiling");
    app.add_option_function<std::string>(
        "--circle",
        [&options](std::string const& text) {
            Circle circle;
            char tail = 0;
            if (sscanf(text.c_str(), "%d,%d,%d%c", &circle.x, &circle.y, &circle.radius, &tail) !=
                3) {
                throw CLI::ValidationError("--circle", "expected X,Y,R in pixels: " + text);
            }
            options.circle = circle;
        },
        "image circle in the input: X,Y,R in pixels (default: centred, as large as fits)");
    app.add_option_function<float>(
        "--pan", [&options](float value) { options.ptz.pan = value; }, "pan, in the kind's units");
    app.add_option_function<float>(
        "--tilt", [&options](float value) { options.ptz.tilt = value; },
        "tilt, in the kind's units");
    app.add_option_function<float>(
        "--zoom", [&options](float value) { options.ptz.zoom = value; },
        "zoom, in the kind's units");
    app.add_option_function<std::string>(
        "--size",
        [&options](std::string const& text) {
            char tail = 0;
            if (sscanf(text.c_str(), "%dx%d%c", &options.width, &options.height, &tail) != 2 ||
                options.width <= 0 || options.height <= 0) {
                throw CLI::ValidationError("--size", "expected a positive WIDTHxHEIGHT: " + text);
            }
        },
        "wished output size WIDTHxHEIGHT; the dewarper has the last word (default: 960x540)");
    app.add_option("--output", options.output,
                   "PNG file, or directory for one file per view (default: out)");
    app.add_option("--plugin", options.plugin,
                   "plug-in to load (default: libvexmap_dewarp.so beside this program)");
    app.add_option("--frames", options.frames,
                   "frames run per view; from the second on a dewarper replays its cached map, "
                   "as in a live stream (default: 2)")
        ->check(CLI::Range(1, 1000));
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app(
        "Dewarps a fisheye picture through the vexmap plug-in, loaded as a client "
        "loads it.",
        "vexmap");
    Options options;
    AddOptions(app, options);
    try {
        app.parse(argc, argv);
    } catch (CLI::CallForHelp const& help) {
        return app.exit(help);
    } catch (CLI::ParseError const& error) {
        fprintf(stderr, "vexmap: %s (see --help)\n", error.what());
        return USAGE_ERROR;
    }
    try {
        return Run(options);
    } catch (std::exception const& error) {
        fprintf(stderr, "vexmap: %s\n", error.what());
        return 1;
    }
}
