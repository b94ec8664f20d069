// vexmap: loads the dewarping plug-in as a surveillance client does and dewarps a still picture,
// a built-in sample or a YUV4MPEG2 stream, into one picture file per view kind of the chosen
// dewarper or into a YUV4MPEG2 stream of one view.

#include <cerrno>
#include <cinttypes>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <memory>
#include <new>
#include <optional>
#include <string>
#include <unistd.h>
#include <vector>

#include "camera_rules.h"
#include "command_line.h"
#include "dewarp_session.h"
#include "image_file.h"
#include "kind_catalogue.h"
#include "output_file.h"
#include "output_target.h"
#include "path_text.h"
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
constexpr char const* DEFAULT_KIND = "Brenvia";
constexpr char const* STANDARD_STREAM = "-";
constexpr int STILL_RATE = 25;  // frames a second of a stream made from a still
constexpr int DEFAULT_FRAMES = 2;
constexpr int DEFAULT_POSITION = 1;  // ceiling
constexpr FrameSize DEFAULT_SIZE{960, 540};

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

std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

std::string Number(float value) {
    char text[32];
    snprintf(text, sizeof text, "%g", double(value));
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

bool IsStreamInput(std::string const& path) {
    return path == STANDARD_STREAM || ExtensionOf(path) == "y4m";
}

// "make / model", then " / url" when there is one; an empty make or model shows as "".
std::string CameraText(ToolOptions const& options) {
    auto const shown = [](std::optional<std::string> const& text) {
        return text.value_or("").empty() ? std::string("\"\"") : *text;
    };
    std::string text = shown(options.make) + " / " + shown(options.model);
    if (!options.url.value_or("").empty()) {
        text += " / " + *options.url;
    }
    return text;
}

/// Options that do nothing for the chosen kind or view: a warning on standard error, or with
/// --strict a usage error at the first one.
class Warnings {
public:
    explicit Warnings(bool strict_mode) : strict(strict_mode) {}

    void Add(std::string const& text) const {
        if (strict) {
            throw UsageError(text + " (--strict)");
        }
        fprintf(stderr, "vexmap: warning: %s\n", text.c_str());
    }

private:
    bool strict;
};

struct Choice {
    KindEntry kind;
    std::string how;  // completes "chosen ..." in the line that names the kind
};

// The camera's row in the table the plug-in walks, for messages.
std::string RowText(CameraRules::Match const& match) {
    CameraRule const& rule = CameraRules::Rows()[std::size_t(match.row)];
    return "row " + std::to_string(match.row + 1) + " of --list-cameras: " + rule.DescribeMake() +
           ", " + rule.DescribeModel();
}

int ModeOfCamera(PluginHost const& host, ToolOptions const& options, std::string& how) {
    std::string const make = options.make.value_or("");
    std::string const model = options.model.value_or("");
    std::string const url = options.url.value_or("");
    int const mode = host.Register().GetModeByCamera(make.c_str(), model.c_str(), url.c_str());
    CameraRules::Match const match = CameraRules::Choose(make, model, url);
    if (mode == 0) {
        if (match.row < 0) {
            throw ToolError("no dewarper kind suits the camera " + CameraText(options) +
                            ": no row of --list-cameras takes the make \"" + make + "\"");
        }
        throw ToolError("no dewarper kind suits the camera " + CameraText(options) + ": " +
                        RowText(match) + ", takes the make but not the " +
                        (CameraRules::Rows()[std::size_t(match.row)].on_url ? "URL" : "model"));
    }
    how = "by camera " + CameraText(options) +
          (match.mode == mode ? " (" + RowText(match) + ")" : std::string());
    return mode;
}

Choice ChooseKind(PluginHost const& host, KindCatalogue const& catalogue,
                  ToolOptions const& options) {
    KindEntry const* kind = nullptr;
    std::string how;
    if (options.mode) {
        kind = catalogue.FindByMode(*options.mode);
        if (kind == nullptr) {
            throw UsageError("--mode " + std::to_string(*options.mode) +
                             ": no dewarper kind has this mode (see --list)");
        }
        how = "by mode";
    } else if (options.make || options.model || options.url) {
        int const mode = ModeOfCamera(host, options, how);
        kind = catalogue.FindByMode(mode);
        if (kind == nullptr) {
            throw ToolError("the camera " + CameraText(options) + " is of mode " +
                            std::to_string(mode) +
                            ", which no dewarper kind of the plug-in serves");
        }
    } else {
        std::string const name = options.kind.value_or(DEFAULT_KIND);
        kind = catalogue.FindByName(name);
        if (kind == nullptr) {
            throw UsageError("--kind " + name + ": no dewarper kind has this name; the kinds are " +
                             catalogue.NameList());
        }
        how = options.kind ? "by name" : "by default";
    }
    if (!kind->available) {
        throw ToolError("the " + kind->name + " dewarper is not available: " + kind->reason);
    }
    return {*kind, how};
}

// An open input: a still picture, or a stream whose frames are still to come.
struct Source {
    std::string name;  // for messages
    RgbImage picture;  // a still, or the first frame of a stream when the output is pictures
    std::ifstream file;
    std::optional<Y4mReader> reader;
    uint64_t file_bytes = 0;  // of a stream in a regular file; 0 when not known
    int width = 0;
    int height = 0;
};

void RequireReadable(std::string const& path) {
    std::error_code error;
    if (std::filesystem::is_directory(path, error)) {
        throw ToolError("cannot read " + path + ": it is a directory");
    }
}

// The still, or the stream's header; a stream read into pictures gives its first frame.
void Open(ToolOptions const& options, PictureLimits const& limits, bool stream_out,
          Source& source) {
    if (options.input.empty()) {
        source.name = "the built-in sample";
        source.picture = MakeSampleFisheye(SAMPLE_SIZE).image;
    } else if (IsStreamInput(options.input)) {
        std::istream* stream = &std::cin;
        source.name = options.input == STANDARD_STREAM ? "standard input" : options.input;
        if (options.input != STANDARD_STREAM) {
            RequireReadable(options.input);
            source.file.open(options.input, std::ios::binary);
            if (!source.file) {
                throw ToolError("cannot read " + options.input + ": " + strerror(errno));
            }
            std::error_code error;
            uintmax_t const bytes = std::filesystem::file_size(options.input, error);
            source.file_bytes = error ? 0 : uint64_t(bytes);
            stream = &source.file;
        }
        source.reader.emplace(*stream, source.name, limits);
        source.width = source.reader->Header().width;
        source.height = source.reader->Header().height;
        if (!stream_out) {
            YuvImage first;
            if (!source.reader->ReadFrame(first)) {
                throw ToolError(source.name + " holds no frame");
            }
            source.picture = PixelFormat::ToRgb(first, source.reader->Header().range);
            source.reader.reset();
        }
        return;
    } else {
        source.name = options.input;
        RequireReadable(options.input);
        source.picture = ReadImage(options.input, limits);
    }
    source.width = source.picture.width;
    source.height = source.picture.height;
}

void RequireCircleInside(Circle const& circle, Source const& source) {
    if (circle.x < 0 || circle.y < 0 || circle.x >= source.width || circle.y >= source.height) {
        throw UsageError("--circle " + std::to_string(circle.x) + "," + std::to_string(circle.y) +
                         "," + std::to_string(circle.radius) + ": the centre lies outside the " +
                         SizeText(source.width, source.height) + " picture");
    }
}

// The camera description a client gives, of what the kind uses; an option of something the kind
// does not use is reported instead of silently dropped.
DewarpParams Describe(ToolOptions const& options, KindEntry const& kind, DewarpRegister& registry,
                      Source const& source, Warnings const& warnings) {
    DewarpParams params{};
    if (kind.has_lenses) {
        // As a client does: the camera's default lens unless the user picked one.
        params.lens = options.lens.value_or(registry.GetDefaultLens(
            kind.mode, options.make.value_or("").c_str(), options.model.value_or("").c_str()));
        if (params.lens < 0 || std::size_t(params.lens) >= kind.lenses.size()) {
            throw UsageError("--lens " + std::to_string(params.lens) + ": the " + kind.name +
                             " dewarper's lenses are 0 to " +
                             std::to_string(int(kind.lenses.size()) - 1) + " (see --list)");
        }
    } else if (options.lens) {
        warnings.Add("--lens does nothing for the " + kind.name + " dewarper, which has no lenses");
    }
    if (kind.has_position) {
        params.position = options.position.value_or(DEFAULT_POSITION);
    } else if (options.position) {
        warnings.Add("--position does nothing for the " + kind.name +
                     " dewarper, which takes no mount");
    }
    if (kind.has_circle) {
        // Without a circle, the largest one centred in the picture.
        Circle const circle = options.circle.value_or(
            Circle{source.width / 2, source.height / 2, std::min(source.width, source.height) / 2});
        RequireCircleInside(circle, source);
        params.circleX = circle.x;
        params.circleY = circle.y;
        params.circleRadius = circle.radius;
    } else if (options.circle) {
        warnings.Add("--circle does nothing for the " + kind.name +
                     " dewarper, which takes no image circle");
    }
    return params;
}

std::vector<int> ChooseViews(DewarpSession const& session, ToolOptions const& options,
                             std::string const& kind, bool stream_out) {
    std::vector<int> sub_modes;
    if (options.sub_mode || stream_out) {
        // A stream carries one view: the PTZ one unless another is asked for.
        int const sub_mode = options.sub_mode.value_or(1);
        if (!session.Get().IsSubModeSupported(sub_mode)) {
            std::string supported;
            for (int other = 1; other <= 3; ++other) {
                if (session.Get().IsSubModeSupported(other)) {
                    supported += (supported.empty() ? "" : ", ") + std::to_string(other) + " (" +
                                 ViewName(other) + ")";
                }
            }
            throw UsageError("--submode " + std::to_string(sub_mode) + ": the " + kind +
                             " dewarper has no " + ViewName(sub_mode) +
                             " view here; its views are " + supported);
        }
        sub_modes.push_back(sub_mode);
    } else {
        for (int sub_mode = 1; sub_mode <= 3; ++sub_mode) {
            if (session.Get().IsSubModeSupported(sub_mode)) {
                sub_modes.push_back(sub_mode);
            }
        }
    }
    return sub_modes;
}

// A pan, tilt or zoom that none of the views written can use does nothing.
void WarnOfIdlePosition(DewarpSession const& session, ToolOptions const& options,
                        std::vector<int> const& sub_modes, Warnings const& warnings) {
    bool pans = false;
    bool tilts = false;
    bool zooms = false;
    for (int const sub_mode : sub_modes) {
        session.Get().SetSubMode(sub_mode);
        pans = pans || session.Get().CanPan(sub_mode);
        tilts = tilts || session.Get().CanTilt(sub_mode);
        zooms = zooms || session.Get().CanZoom(sub_mode);
    }
    std::string views;
    for (int const sub_mode : sub_modes) {
        views += (views.empty() ? "" : " or ") + std::string(ViewName(sub_mode));
    }
    for (auto [given, used, name] : {std::tuple{options.ptz.pan.has_value(), pans, "--pan"},
                                     std::tuple{options.ptz.tilt.has_value(), tilts, "--tilt"},
                                     std::tuple{options.ptz.zoom.has_value(), zooms, "--zoom"}}) {
        if (given && !used) {
            warnings.Add(std::string(name) + " does nothing for the " + views + " view");
        }
    }
}

// What was asked for, unless the size was chosen for the view: a PTZ view gets the common 16:9
// size and a panorama the shape its kind gives it, at about the same number of pixels.
// AdjustAspectRatio gives a width-to-height ratio, or gives the height back when the kind has no
// shape of its own for the view.
FrameSize ViewSize(DewarpSession const& session, ToolOptions const& options, int sub_mode) {
    if (options.size) {
        return *options.size;
    }
    if (sub_mode == 1) {
        return DEFAULT_SIZE;
    }
    session.Get().SetSubMode(sub_mode);
    float const height = float(DEFAULT_SIZE.height);
    float const ratio = session.Get().AdjustAspectRatio(float(DEFAULT_SIZE.width), height);
    if (!std::isfinite(ratio) || ratio <= 0.0f || ratio == height) {
        return DEFAULT_SIZE;
    }
    double const pixels = double(DEFAULT_SIZE.width) * double(DEFAULT_SIZE.height);
    double const width = std::sqrt(pixels * double(ratio));
    return {int(std::lround(width)), int(std::lround(pixels / width))};
}

// "960x540", or "968x544 (asked 961x541)" when the dewarper had its own way.
std::string UsedSize(int width, int height, FrameSize const& asked) {
    std::string text = SizeText(width, height);
    if (width != asked.width || height != asked.height) {
        text += " (asked " + SizeText(asked.width, asked.height) + ")";
    }
    return text;
}

// "pan 40 (asked 400), tilt 0, zoom 0.5": the position in force, and what was asked where the
// dewarper held another value.
std::string UsedPosition(Position const& used, RequestedPosition const& asked) {
    std::string text;
    for (auto [name, value, wish] :
         {std::tuple{"pan", used.pan, asked.pan}, std::tuple{"tilt", used.tilt, asked.tilt},
          std::tuple{"zoom", used.zoom, asked.zoom}}) {
        text += (text.empty() ? "" : ", ") + std::string(name) + " " + Number(value);
        if (wish && *wish != value) {
            text += " (asked " + Number(*wish) + ")";
        }
    }
    return text;
}

/// A folder the tool made for its output, removed again when the run fails and it is empty.
class MadeFolder {
public:
    explicit MadeFolder(std::string const& path) {
        std::error_code error;
        if (std::filesystem::is_directory(path, error)) {
            return;
        }
        if (!std::filesystem::create_directories(path, error) || error) {
            throw ToolError("cannot make the folder " + path + ": " + error.message());
        }
        made = path;
    }
    MadeFolder(MadeFolder const&) = delete;
    MadeFolder& operator=(MadeFolder const&) = delete;
    virtual ~MadeFolder() {
        if (!made.empty() && !kept) {
            std::error_code error;
            std::filesystem::remove(made, error);  // only when empty
        }
    }
    void Keep() { kept = true; }

private:
    std::string made;
    bool kept = false;
};

void RefuseToOverwrite(ToolOptions const& options, std::string const& output) {
    if (!options.input.empty() && options.input != STANDARD_STREAM &&
        OutputFile::SameFile(options.input, output)) {
        throw UsageError("--output " + output + " is the input " + options.input +
                         "; vexmap does not write over its input");
    }
}

// How far into a stream file the reading is, from 0 to 1; negative for a pipe.
double ShareRead(Source& source) {
    if (source.file_bytes == 0) {
        return -1.0;
    }
    std::streamoff const position = source.file.tellg();
    return position < 0 ? -1.0 : double(position) / double(source.file_bytes);
}

struct StreamRun {
    uint64_t frames = 0;
    int width = 0;
    int height = 0;
    Position position;
};

// One view into a stream, frame by frame through the one dewarper, which builds its map for the
// first frame and replays it for the others. A still gives a stream of one frame, after its
// --frames runs.
StreamRun WriteStream(ToolOptions const& options, OutputTarget const& target,
                      DewarpSession const& session, int sub_mode, FrameSize const& size,
                      Source& source) {
    std::optional<OutputFile> file;
    std::ofstream file_stream;
    std::ostream* stream = &std::cout;
    if (target.GetKind() != OutputTarget::STANDARD_OUTPUT) {
        file.emplace(target.Value());
        file_stream.open(file->Path(), std::ios::binary | std::ios::trunc);
        if (!file_stream) {
            throw ToolError("cannot write " + target.Value() + ": " + strerror(errno));
        }
        stream = &file_stream;
    }
    int numerator = STILL_RATE;
    int denominator = 1;
    if (source.reader) {
        numerator = source.reader->Header().rate_numerator;
        denominator = source.reader->Header().rate_denominator;
    }
    Y4mWriter writer(*stream, target.StreamName(), numerator, denominator,
                     source.reader ? source.reader->Header().range : ColourRange::UNSPECIFIED);
    ProgressLine progress(stderr, !options.quiet && isatty(STDERR_FILENO) != 0);
    StreamRun run;
    auto const finish = [&] {
        progress.End();
        if (file) {
            file_stream.close();
            if (!file_stream) {
                throw ToolError("cannot write " + target.Value() + ": " + strerror(errno));
            }
            file->Commit();
        }
    };
    if (!source.reader) {
        int const frames = options.frames.value_or(DEFAULT_FRAMES);
        RenderedView<YuvImage> const view =
            session.Render(sub_mode, options.ptz, PixelFormat::ToYuv(source.picture), size.width,
                           size.height, frames, [&progress, frames](int done) {
                               progress.Show(uint64_t(done), double(done) / frames);
                           });
        writer.WriteFrame(view.picture);
        finish();
        return {1, view.picture.width, view.picture.height, view.position};
    }
    session.Aim(sub_mode, options.ptz);
    YuvImage frame;
    YuvImage view;
    for (;;) {
        try {
            if (!source.reader->ReadFrame(frame)) {
                break;
            }
        } catch (ToolError const& error) {
            // A stream cut short keeps what came through before the cut.
            if (run.frames == 0) {
                throw;
            }
            finish();
            throw ToolError(std::string(error.what()) + "; " + std::to_string(run.frames) +
                            " frame" + (run.frames == 1 ? "" : "s") + " written to " +
                            target.StreamName());
        }
        session.RunFrame(frame, size.width, size.height, view);
        if (run.frames == 0) {
            run.position = session.CurrentPosition();
        }
        writer.WriteFrame(view);
        run.frames = writer.FramesWritten();
        run.width = view.width;
        run.height = view.height;
        progress.Show(run.frames, ShareRead(source));
    }
    if (run.frames == 0) {
        throw ToolError(source.name + " holds no frame");
    }
    finish();
    return run;
}

// The kind chosen and how, and its lens when it has a list of them.
void PrintKind(FILE* info, Choice const& choice, DewarpParams const& params) {
    KindEntry const& kind = choice.kind;
    fprintf(info, "%s dewarper (mode %d), chosen %s\n", kind.name.c_str(), kind.mode,
            choice.how.c_str());
    if (kind.has_lenses) {
        fprintf(info, "%s lens %d: %s\n", kind.name.c_str(), params.lens,
                kind.lenses[std::size_t(params.lens)].c_str());
    }
}

char const* YesNo(bool value) {
    return value ? "yes" : "no";
}

// Every kind the plug-in registers, as a client lists them: mode, name, what it takes, whether it
// can be used here or why not, and the lenses of a usable kind that has them.
void ListKinds(KindCatalogue const& catalogue) {
    printf("mode kind         circle lenses position  use\n");
    for (KindEntry const& kind : catalogue.Kinds()) {
        printf("%4d %-12s %-6s %-6s %-9s %s\n", kind.mode, kind.name.c_str(),
               YesNo(kind.has_circle), YesNo(kind.has_lenses), YesNo(kind.has_position),
               kind.available ? "available" : ("not available: " + kind.reason).c_str());
        for (std::size_t lens = 0; lens < kind.lenses.size(); ++lens) {
            printf("       lens %zu: %s\n", lens, kind.lenses[lens].c_str());
        }
    }
}

// The table the plug-in walks from a camera's make, model and URL to a dewarper kind.
void ListCameras(KindCatalogue const& catalogue) {
    printf(
        "The first row whose make test passes decides alone: its second test gives the kind, "
        "or none. Tests are case-sensitive.\n");
    std::vector<CameraRule> const& rows = CameraRules::Rows();
    for (std::size_t row = 0; row < rows.size(); ++row) {
        KindEntry const* const kind = catalogue.FindByMode(rows[row].mode);
        printf("%2zu  %s\n    %s\n    mode %d: %s\n", row + 1, rows[row].DescribeMake().c_str(),
               rows[row].DescribeModel().c_str(), rows[row].mode,
               kind != nullptr ? kind->name.c_str() : "no kind of the plug-in serves it");
    }
}

int Run(ToolOptions const& options) {
    OutputTarget const target(options.output);
    PictureLimits const limits(options.max_pixels);
    PluginHost const host(options.plugin.empty() ? DefaultPluginPath() : options.plugin);
    KindCatalogue const catalogue(host);
    if (options.list) {
        ListKinds(catalogue);
        return EXIT_DONE;
    }
    if (options.list_cameras) {
        ListCameras(catalogue);
        return EXIT_DONE;
    }
    Choice const choice = ChooseKind(host, catalogue, options);
    KindEntry const& kind = choice.kind;
    Warnings const warnings(options.strict);
    bool const stream_out = target.IsStream();
    Source source;
    Open(options, limits, stream_out, source);
    DewarpParams const params = Describe(options, kind, host.Register(), source, warnings);
    DewarpSession const session(
        host, kind.mode, params,
        source.reader ? source.reader->Header().range : ColourRange::LIMITED);
    std::vector<int> const sub_modes = ChooseViews(session, options, kind.name, stream_out);
    WarnOfIdlePosition(session, options, sub_modes, warnings);
    if (options.frames && source.reader) {
        warnings.Add("--frames does nothing for a stream, whose every frame is dewarped once");
    }
    FrameSize const fed = session.FedSize(source.width, source.height);

    // With the stream on standard output, what the tool has to say goes to standard error.
    FILE* const info = options.quiet                                       ? nullptr
                       : target.GetKind() == OutputTarget::STANDARD_OUTPUT ? stderr
                                                                           : stdout;
    auto const note_padding = [&] {
        if (info != nullptr && (fed.width != source.width || fed.height != source.height)) {
            fprintf(info,
                    "note: the %s input is padded to %s: the %s dewarper takes even sizes "
                    "only\n",
                    SizeText(source.width, source.height).c_str(),
                    SizeText(fed.width, fed.height).c_str(), kind.name.c_str());
        }
    };
    if (stream_out) {
        if (target.GetKind() == OutputTarget::STREAM_FILE) {
            RefuseToOverwrite(options, target.Value());
        }
        FrameSize const size = ViewSize(session, options, sub_modes.front());
        StreamRun const run =
            WriteStream(options, target, session, sub_modes.front(), size, source);
        // For a stream the lines come at its end, so that a failure midway is one line alone.
        if (info != nullptr) {
            PrintKind(info, choice, params);
            note_padding();
            fprintf(info, "%s %s view, %s, %s, %" PRIu64 " frame%s: %s\n", kind.name.c_str(),
                    ViewName(sub_modes.front()), UsedSize(run.width, run.height, size).c_str(),
                    UsedPosition(run.position, options.ptz).c_str(), run.frames,
                    run.frames == 1 ? "" : "s", target.StreamName().c_str());
        }
        return EXIT_DONE;
    }
    std::optional<MadeFolder> folder;
    if (target.GetKind() == OutputTarget::FOLDER) {
        folder.emplace(target.Value());
    }
    // Every file is opened before the work, so that an unwritable place fails at once.
    std::vector<OutputFile> files;
    for (int const sub_mode : sub_modes) {
        std::string const path =
            target.PicturePath(kind.name, ViewName(sub_mode), sub_modes.size() > 1);
        RefuseToOverwrite(options, path);
        files.emplace_back(path);
    }
    // Printed once only rendering and writing can fail, so that a refusal leaves stdout empty.
    if (info != nullptr) {
        PrintKind(info, choice, params);
        note_padding();
    }
    int const frames = options.frames.value_or(DEFAULT_FRAMES);
    for (std::size_t index = 0; index < sub_modes.size(); ++index) {
        int const sub_mode = sub_modes[index];
        FrameSize const size = ViewSize(session, options, sub_mode);
        ProgressLine progress(stderr, !options.quiet && isatty(STDERR_FILENO) != 0);
        RenderedView<RgbImage> const view =
            session.Render(sub_mode, options.ptz, source.picture, size.width, size.height, frames,
                           [&progress, frames](int done) {
                               progress.Show(uint64_t(done), double(done) / frames);
                           });
        progress.End();
        WritePicture(files[index].Path(), files[index].FinalPath(), view.picture);
        files[index].Commit();
        if (info != nullptr) {
            fprintf(
                info, "%s %s view, %s, %s: %s\n", kind.name.c_str(), ViewName(sub_mode),
                UsedSize(view.picture.width, view.picture.height, size).c_str(),
                UsedPosition(view.position, options.ptz).c_str(),
                target.PicturePath(kind.name, ViewName(sub_mode), sub_modes.size() > 1).c_str());
        }
    }
    if (folder) {
        folder->Keep();
    }
    return EXIT_DONE;
}

}  // namespace

int main(int argc, char** argv) {
    ToolOptions options;
    if (std::optional<int> const status = ParseCommandLine(argc, argv, options)) {
        return *status;
    }
    try {
        return Run(options);
    } catch (UsageError const& error) {
        fprintf(stderr, "vexmap: %s\n", error.what());
        return EXIT_USAGE;
    } catch (ToolError const& error) {
        fprintf(stderr, "vexmap: %s\n", error.what());
        return EXIT_FAILED;
    } catch (std::bad_alloc const&) {
        fprintf(stderr, "vexmap: out of memory\n");
        return EXIT_FAILED;
    }
}
