#include "command_line.h"

#include <cmath>
#include <cstdio>
#include <map>

#include <CLI/CLI.hpp>

#include "tool_error.h"

namespace vexmap_host {
namespace {

constexpr int MAX_FRAMES = 1000000;

std::string Shown(float value) {
    char text[32];
    snprintf(text, sizeof text, "%g", double(value));
    return text;
}

// NaN and the infinities parse as numbers, but no dewarper position means anything with them.
std::function<void(float)> PositionSetter(char const* name, std::optional<float>& field,
                                          bool positive) {
    return [name, &field, positive](float value) {
        if (!std::isfinite(value)) {
            throw CLI::ValidationError(name, "must be a finite number, not " + Shown(value));
        }
        if (positive && value <= 0.0f) {
            throw CLI::ValidationError(name, "must be above 0, not " + Shown(value));
        }
        field = value;
    };
}

void AddOptions(CLI::App& app, ToolOptions& options) {
    app.add_option("--input", options.input,
                   "PNG or JPEG fisheye picture, or YUV4MPEG2 stream (.y4m, or - for standard "
                   "input); a stream written as pictures gives its first frame (default: built-in "
                   "sample)");
    auto* mode = app.add_option("--mode", options.mode, "dewarper mode number (see --list)");
    auto* kind = app.add_option("--kind", options.kind,
                                "dewarper kind by name, in any case (see --list; default: Brenvia)")
                     ->excludes(mode);
    for (auto [name, field, text] :
         {std::tuple{"--make", &options.make,
                     "camera make as the device reports it; the camera picks the kind as a "
                     "client would (see --list-cameras)"},
          std::tuple{"--model", &options.model, "camera model as the device reports it"},
          std::tuple{"--url", &options.url, "stream URL of the camera"}}) {
        app.add_option(name, *field, text)->excludes(mode)->excludes(kind);
    }
    app.add_option("--submode", options.sub_mode,
                   "view kind: 1 PTZ, 2 panorama, 3 dual panorama (default: every supported one; "
                   "PTZ for a stream)")
        ->check(CLI::Range(1, 3));
    app.add_option("--lens", options.lens,
                   "lens number of a kind that has a lens list (see --list; default: the "
                   "camera's own, else 0)");
    app.add_flag("--list", options.list,
                 "list the dewarper kinds of the plug-in: what each takes (circle, lenses, "
                 "position), whether it can be used here and why not, and its lenses");
    app.add_flag("--list-cameras", options.list_cameras,
                 "print the table that --make, --model and --url consult");
    app.add_option("--position", options.position, "camera mount: wall, ceiling or floor")
        ->transform(CLI::CheckedTransformer(
            std::map<std::string, int>{{"wall", 0}, {"ceiling", 1}, {"floor", 2}}))
        ->default_str("ceiling");
    app.add_option_function<std::string>(
        "--circle",
        [&options](std::string const& text) {
            int values[3] = {0, 0, 0};
            char tail = 0;
            if (sscanf(text.c_str(), "%d,%d,%d%c", &values[0], &values[1], &values[2], &tail) !=
                3) {
                throw CLI::ValidationError("--circle", "expected X,Y,R in pixels, not " + text);
            }
            if (values[2] <= 0) {
                throw CLI::ValidationError(
                    "--circle",
                    "the radius must be above 0, not " + std::to_string(values[2]) + " in " + text);
            }
            options.circle = Circle{values[0], values[1], values[2]};
        },
        "image circle in the input: X,Y,R in pixels (default: centred, as large as fits)");
    app.add_option_function<float>("--pan", PositionSetter("--pan", options.ptz.pan, false),
                                   "pan, in the kind's units (see README)");
    app.add_option_function<float>("--tilt", PositionSetter("--tilt", options.ptz.tilt, false),
                                   "tilt, in the kind's units");
    app.add_option_function<float>("--zoom", PositionSetter("--zoom", options.ptz.zoom, true),
                                   "zoom, above 0, in the kind's units");
    app.add_option_function<std::string>(
        "--size",
        [&options](std::string const& text) {
            int values[2] = {0, 0};
            char tail = 0;
            if (sscanf(text.c_str(), "%dx%d%c", &values[0], &values[1], &tail) != 2 ||
                values[0] <= 0 || values[1] <= 0) {
                throw CLI::ValidationError("--size",
                                           "expected a positive WIDTHxHEIGHT, not " + text);
            }
            options.size = FrameSize{values[0], values[1]};
        },
        "wished output size WIDTHxHEIGHT; the dewarper has the last word (default: 960x540 for "
        "a PTZ view, the view's own shape for a panorama)");
    app.add_option("--max-pixels", options.max_pixels,
                   "largest picture, stream frame or output size taken, in pixels; a side is at "
                   "most 16384 whatever this says (default: 16384x16384)")
        ->check(CLI::Range(uint64_t(1), PictureLimits::DEFAULT_MAX_PIXELS));
    app.add_option("--output", options.output,
                   "PNG or JPEG file (.png, .jpg, .jpeg), folder for one file per view, or "
                   "YUV4MPEG2 stream of one view (.y4m, a device such as /dev/null, or - for "
                   "standard output; a still gives one frame) (default: out)");
    app.add_option("--plugin", options.plugin,
                   "plug-in to load (default: libvexmap_dewarp.so beside this program, or in "
                   "the installed plug-in folder " VEXMAP_PLUGIN_FROM_TOOL ")");
    app.add_option("--frames", options.frames,
                   "frames run per view of a still; from the second on a dewarper replays its "
                   "cached map, as in a live stream (default: 2)")
        ->check(CLI::Range(1, MAX_FRAMES));
    app.add_flag("--quiet", options.quiet,
                 "say nothing but errors and warnings: no list of views written, no progress");
    app.add_flag("--strict", options.strict,
                 "treat warnings (an option that does nothing for the chosen kind or view) as "
                 "usage errors");
}

}  // namespace

std::optional<int> ParseCommandLine(int argc, char** argv, ToolOptions& options) {
    CLI::App app(
        "Dewarps a fisheye picture through the vexmap plug-in, loaded as a client "
        "loads it.",
        "vexmap");
    app.set_version_flag("--version", std::string("vexmap ") + VEXMAP_VERSION);
    app.footer(
        "Exit status: 0 done, 1 the work failed (a file, the plug-in or the dewarper), 2 usage "
        "error (an option or argument that cannot be used as given; with --strict also an "
        "option that does nothing).");
    AddOptions(app, options);
    try {
        app.parse(argc, argv);
        if (options.size) {
            PictureLimits(options.max_pixels)
                .Check("--size", uint64_t(options.size->width), uint64_t(options.size->height));
        }
    } catch (CLI::CallForHelp const& help) {
        return app.exit(help);
    } catch (CLI::CallForVersion const& version) {
        return app.exit(version);
    } catch (CLI::ConversionError const& error) {
        // "Could not convert: --pan = left" in the parser's words.
        std::string const text = error.what();
        std::size_t const name = text.find("--");
        std::size_t const equals = text.find(" = ", name);
        if (name == std::string::npos || equals == std::string::npos) {
            fprintf(stderr, "vexmap: %s (see --help)\n", text.c_str());
        } else {
            fprintf(stderr, "vexmap: %s: %s is not a number (see --help)\n",
                    text.substr(name, equals - name).c_str(), text.substr(equals + 3).c_str());
        }
        return EXIT_USAGE;
    } catch (CLI::ParseError const& error) {
        fprintf(stderr, "vexmap: %s (see --help)\n", error.what());
        return EXIT_USAGE;
    } catch (ToolError const& error) {
        fprintf(stderr, "vexmap: %s\n", error.what());
        return EXIT_USAGE;
    }
    return std::nullopt;
}

}  // namespace vexmap_host
