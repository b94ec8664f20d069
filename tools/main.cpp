// vexmap: loads the dewarping plug-in as a surveillance client does and dewarps a still picture,
// a built-in sample or a YUV4MPEG2 stream, into one PNG file per view kind of the chosen dewarper
// or into a YUV4MPEG2 stream of one view.

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cinttypes>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <optional>
#include <string>
#include <unistd.h>
#include <vector>

#include <CLI/CLI.hpp>

#include "dewarp_session.h"
#include "image_file.h"
#include "pixel_format.h"
#include "plugin_host.h"
#include "progress_line.h"
#include "sample_scene.h"
#include "tool_error.h"
#include "y4m_reader.h"
#include "y4m_writer.h"

namespace {

using namespace vexmap_host;

constexpr int SAMPLE_SIZE = 1024;
constexpr int USAGE_ERROR = 2;
constexpr char const* DEFAULT_KIND = "Brenvia";
constexpr char const* STANDARD_STREAM = "-";
constexpr int STILL_RATE = 25;  // frames a second of a stream made from a still

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
    std::optional<int> lens;
    bool list = false;
    int position = 1;
    std::optional<Circle> circle;
    RequestedPosition ptz;
    int width = 960;
    int height = 540;
    std::string output = "out";
    std::string plugin;
    int frames = 2;
    bool quiet = false;
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

// Beside the program in a build tree; in an installed tree, in the plug-in folder of the library
// folder that lies beside the program's own.
std::string DefaultPluginPath() {
    char const* const file = "libvexmap_dewarp.so";
    std::error_code error;
    std::filesystem::path const folder =
        std::filesystem::read_symlink("/proc/self/exe", error).parent_path();
    if (error) {
        return file;
    }
    std::filesystem::path const beside = folder / file;
    if (std::filesystem::exists(beside, error)) {
        return beside.string();
    }
    return (folder / VEXMAP_PLUGIN_FROM_TOOL / file).lexically_normal().string();
}

bool EndsWith(std::string const& path, std::string const& extension) {
    return path.size() > extension.size() &&
           Lowercase(path.substr(path.size() - extension.size())) == extension;
}

bool EndsWithPng(std::string const& path) {
    return EndsWith(path, ".png");
}

// "-" is the standard stream of its side; a path ending in .y4m is a file.
bool IsStream(std::string const& path) {
    return path == STANDARD_STREAM || EndsWith(path, ".y4m");
}

std::string StreamName(std::string const& path, char const* standard_name) {
    return path == STANDARD_STREAM ? standard_name : path;
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
        std::string const kind = options.kind.empty() ? DEFAULT_KIND : options.kind;
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
                        " dewarper is not available: its vendor library is not installed");
    }
    return choice;
}

void RequireCircleInside(Circle const& circle, int width, int height) {
    if (circle.radius <= 0 || circle.x < 0 || circle.y < 0 || circle.x >= width ||
        circle.y >= height) {
        throw ToolError("the circle " + std::to_string(circle.x) + "," + std::to_string(circle.y) +
                        "," + std::to_string(circle.radius) + " lies outside the " +
                        std::to_string(width) + "x" + std::to_string(height) + " picture");
    }
}

// An open input: a still picture, or a stream whose frames are still to come.
struct Source {
    RgbImage picture;  // a still, or the first frame of a stream when the output is pictures
    std::ifstream file;
    std::optional<Y4mReader> reader;
};

// The still, or the stream's header; a stream read into pictures gives its first frame.
void Open(Options const& options, Source& source, Circle& circle) {
    if (options.input.empty()) {
        SampleFisheye sample = MakeSampleFisheye(SAMPLE_SIZE);
        source.picture = std::move(sample.image);
        circle = {sample.circle_x, sample.circle_y, sample.circle_radius};
        return;
    }
    int width = 0;
    int height = 0;
    if (IsStream(options.input)) {
        std::istream* stream = &std::cin;
        if (options.input != STANDARD_STREAM) {
            source.file.open(options.input, std::ios::binary);
            if (!source.file) {
                throw ToolError("cannot read " + options.input + ": " + strerror(errno));
            }
            stream = &source.file;
        }
        source.reader.emplace(*stream, StreamName(options.input, "standard input"));
        width = source.reader->Header().width;
        height = source.reader->Header().height;
        if (!IsStream(options.output)) {
            YuvImage first;
            if (!source.reader->ReadFrame(first)) {
                throw ToolError(StreamName(options.input, "standard input") + " holds no frame");
            }
            source.picture = PixelFormat::ToRgb(first);
            source.reader.reset();
        }
    } else {
        source.picture = ReadImage(options.input);
        width = source.picture.width;
        height = source.picture.height;
    }
    // Without a circle, the largest one centred in the picture.
    circle = {width / 2, height / 2, std::min(width, height) / 2};
}

struct StreamRun {
    uint64_t frames = 0;
    int width = 0;
    int height = 0;
};

// One view into a stream, frame by frame through the one dewarper, which builds its map for the
// first frame and replays it for the others. A still gives a stream of one frame.
StreamRun WriteStream(Options const& options, DewarpSession const& session, int sub_mode,
                      Source& source) {
    std::ofstream file;
    std::ostream* stream = &std::cout;
    if (options.output != STANDARD_STREAM) {
        file.open(options.output, std::ios::binary | std::ios::trunc);
        if (!file) {
            throw ToolError("cannot write " + options.output + ": " + strerror(errno));
        }
        stream = &file;
    }
    int numerator = STILL_RATE;
    int denominator = 1;
    if (source.reader) {
        numerator = source.reader->Header().rate_numerator;
        denominator = source.reader->Header().rate_denominator;
    }
    Y4mWriter writer(*stream, StreamName(options.output, "standard output"), numerator,
                     denominator);
    session.Aim(sub_mode, options.ptz);
    StreamRun run;
    if (!source.reader) {
        YuvImage const still = PixelFormat::ToYuv(source.picture);
        YuvImage view;
        for (int frame = 0; frame < options.frames; ++frame) {
            view = session.RunFrame(still, options.width, options.height);
        }
        writer.WriteFrame(view);
        return {1, view.width, view.height};
    }
    ProgressLine progress(stderr, !options.quiet && isatty(STDERR_FILENO) != 0);
    YuvImage frame;
    while (source.reader->ReadFrame(frame)) {
        YuvImage const view = session.RunFrame(frame, options.width, options.height);
        writer.WriteFrame(view);
        run = {writer.FramesWritten(), view.width, view.height};
        progress.Show(run.frames);
    }
    if (run.frames == 0) {
        throw ToolError(StreamName(options.input, "standard input") + " holds no frame");
    }
    return run;
}

// The name of lens `lens` of a kind, or "" past the end of its list.
std::string LensName(DewarpRegister& registry, int mode, int lens) {
    char name[256] = {};
    return registry.GetLens(mode, lens, name, sizeof name) > 0 ? name : "";
}

// The kind chosen and how, and its lens when it has a list of them.
void PrintKind(FILE* info, DewarpRegister& registry, Choice const& choice,
               DewarpParams const& params, bool has_lenses) {
    char const* const kind = registry.GetName(choice.mode);
    fprintf(info, "%s dewarper (mode %d), chosen %s\n", kind, choice.mode, choice.how.c_str());
    if (has_lenses) {
        fprintf(info, "%s lens %d: %s\n", kind, params.lens,
                LensName(registry, choice.mode, params.lens).c_str());
    }
}

// Every kind the plug-in registers, as a client lists them: mode, name, whether it can be used
// here, and the lenses of a usable kind that has them.
void ListKinds(PluginHost const& host) {
    DewarpRegister& registry = host.Register();
    for (int mode = 0; mode < registry.GetModeCount(); ++mode) {
        std::string const name = registry.GetName(mode);
        if (name.empty()) {
            continue;
        }
        bool const loaded = host.DewarperLoaded(mode);
        printf("%2d %-12s %s\n", mode, name.c_str(),
               loaded ? "available" : "not available (vendor library not installed)");
        bool has_lenses = false;
        bool has_circle = false;
        bool has_position = false;
        registry.GetSupportedFeatures(mode, has_lenses, has_circle, has_position);
        for (int lens = 0; loaded && has_lenses; ++lens) {
            std::string const lens_name = LensName(registry, mode, lens);
            if (lens_name.empty()) {
                break;
            }
            printf("     lens %d: %s\n", lens, lens_name.c_str());
        }
    }
}

int Run(Options const& options) {
    PluginHost const host(options.plugin.empty() ? DefaultPluginPath() : options.plugin);
    if (options.list) {
        ListKinds(host);
        return 0;
    }
    Source source;
    Circle circle;
    Open(options, source, circle);
    circle = options.circle.value_or(circle);
    int const input_width = source.reader ? source.reader->Header().width : source.picture.width;
    int const input_height = source.reader ? source.reader->Header().height : source.picture.height;
    RequireCircleInside(circle, input_width, input_height);

    Choice const choice = ChooseMode(host, options);
    int const mode = choice.mode;
    DewarpRegister& registry = host.Register();
    std::string const kind = registry.GetName(mode);
    bool has_lenses = false;
    bool has_circle = false;
    bool has_position = false;
    registry.GetSupportedFeatures(mode, has_lenses, has_circle, has_position);
    DewarpParams params{};
    if (has_lenses) {
        // As a client does: the camera's default lens unless the user picked one.
        params.lens = options.lens.value_or(registry.GetDefaultLens(
            mode, options.make.value_or("").c_str(), options.model.value_or("").c_str()));
    }
    if (has_position) {
        params.position = options.position;
    }
    if (has_circle) {
        params.circleX = circle.x;
        params.circleY = circle.y;
        params.circleRadius = circle.radius;
    }
    DewarpSession const session(host, mode, params);

    bool const stream_out = IsStream(options.output);
    std::vector<int> sub_modes;
    if (options.sub_mode || stream_out) {
        // A stream carries one view: the PTZ one unless another is asked for.
        int const sub_mode = options.sub_mode.value_or(1);
        if (!session.Get().IsSubModeSupported(sub_mode)) {
            throw ToolError("the " + kind + " dewarper has no sub-mode " +
                            std::to_string(sub_mode));
        }
        sub_modes.push_back(sub_mode);
    } else {
        for (int sub_mode = 1; sub_mode <= 3; ++sub_mode) {
            if (session.Get().IsSubModeSupported(sub_mode)) {
                sub_modes.push_back(sub_mode);
            }
        }
    }
    // With the stream on standard output, what the tool has to say goes to standard error.
    FILE* const info = options.quiet                       ? nullptr
                       : options.output == STANDARD_STREAM ? stderr
                                                           : stdout;
    if (stream_out) {
        StreamRun const run = WriteStream(options, session, sub_modes.front(), source);
        // For a stream the lines come at its end, so that a failure midway is one line alone.
        if (info != nullptr) {
            PrintKind(info, registry, choice, params, has_lenses);
            fprintf(info, "%s %s view, %dx%d, %" PRIu64 " frame%s: %s\n", kind.c_str(),
                    ViewName(sub_modes.front()), run.width, run.height, run.frames,
                    run.frames == 1 ? "" : "s",
                    StreamName(options.output, "standard output").c_str());
        }
        return 0;
    }
    // Printed once only rendering and writing can fail, so that a refusal leaves stdout empty.
    if (info != nullptr) {
        PrintKind(info, registry, choice, params, has_lenses);
    }
    for (int const sub_mode : sub_modes) {
        RgbImage const view = session.Render(sub_mode, options.ptz, source.picture, options.width,
                                             options.height, options.frames);
        std::string const path = OutputPath(options, kind, sub_mode, sub_modes.size() > 1);
        WritePng(path, view);
        if (info != nullptr) {
            fprintf(info, "%s %s view, %dx%d: %s\n", kind.c_str(), ViewName(sub_mode), view.width,
                    view.height, path.c_str());
        }
    }
    return 0;
}

void AddOptions(CLI::App& app, Options& options) {
    app.add_option("--input", options.input,
                   "PNG or JPEG fisheye picture, or YUV4MPEG2 stream (.y4m, or - for standard "
                   "input); a stream written as pictures gives its first frame (default: built-in "
                   "sample)");
    auto* mode = app.add_option("--mode", options.mode, "dewarper mode number");
    auto* kind =
        app.add_option("--kind", options.kind, "dewarper kind by display name (default: Brenvia)")
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
    app.add_option(
           "--submode", options.sub_mode,
           "view kind: 1 PTZ, 2 panorama, 3 dual panorama (default: every supported one; PTZ "
           "for a stream)")
        ->check(CLI::Range(1, 3));
    app.add_option("--lens", options.lens,
                   "lens number of a kind that has a lens list (see --list; default: the "
                   "camera's own, else 0)")
        ->check(CLI::NonNegativeNumber);
    app.add_flag("--list", options.list,
                 "list the dewarper kinds of the plug-in, whether each is available here, and "
                 "their lenses");
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
                   "PNG file, directory for one file per view, or YUV4MPEG2 stream of one view "
                   "(.y4m, or - for standard output; a still gives one frame) (default: out)");
    app.add_option("--plugin", options.plugin,
                   "plug-in to load (default: libvexmap_dewarp.so beside this program, or in "
                   "the installed plug-in folder " VEXMAP_PLUGIN_FROM_TOOL ")");
    app.add_option("--frames", options.frames,
                   "frames run per view of a still; from the second on a dewarper replays its "
                   "cached map, as in a live stream (default: 2)")
        ->check(CLI::Range(1, 1000));
    app.add_flag("--quiet", options.quiet,
                 "say nothing but errors: no list of views written, no progress of a stream");
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app(
        "Dewarps a fisheye picture through the vexmap plug-in, loaded as a client "
        "loads it.",
        "vexmap");
    app.set_version_flag("--version", std::string("vexmap ") + VEXMAP_VERSION);
    Options options;
    AddOptions(app, options);
    try {
        app.parse(argc, argv);
    } catch (CLI::CallForHelp const& help) {
        return app.exit(help);
    } catch (CLI::CallForVersion const& version) {
        return app.exit(version);
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
