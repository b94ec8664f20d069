#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <functional>
#include <limits>
#include <ostream>
#include <regex>
#include <stdexcept>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "dewarp_c_side.h"
#include "recording_log_sink.h"
#include "vexmap/channel.h"
#include "vexmap/defaults.h"
#include "vexmap/dewarp_inner.h"
#include "vexmap/error.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr std::size_t FENCE = 32;
constexpr unsigned char FENCE_BYTE = 0xA5;
constexpr unsigned char OUTPUT_FILL = 0x5A;  // what an output buffer holds before a frame

float const NAN_VALUE = std::numeric_limits<float>::quiet_NaN();
float const INFINITE = std::numeric_limits<float>::infinity();

// errno after a call: a code, untouched (it was 0 before), or of no interest.
constexpr int LEFT_ALONE = 0;
constexpr int NOT_LOOKED_AT = -1;

char const* const EINVAL_TEXT = "Error EINVAL (22)";
char const* const EFAULT_TEXT = "Error EFAULT (14)";
std::string const InvalidHandle = "VEXMAP: ERROR - The channel parameter is invalid\n";

/// A 180-degree circular fisheye on a 256 x 256 sensor.
_DEWARP_INTERNAL_CAMERA_MODEL const Fisheye256 = {
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 180.0f, 180.0f, 256, 256};

_DEWARP_CHANNEL_SETTINGS const PtzSettings = {DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                                              DEWARP_ASPECT_RATIO_FIT, DEWARP_INTERPOLATION_1};

template <typename Enumeration>
Enumeration Out(int value) {
    return static_cast<Enumeration>(value);
}

std::size_t Yuv420Size(std::size_t stride, std::size_t height) {
    return stride * height * 3 / 2;
}

/// A record between two fences of known bytes, so that a call that writes past it, or into it
/// when it must not, is seen.
template <typename Record>
class Fenced {
public:
    Fenced() { std::memset(&storage, FENCE_BYTE, sizeof storage); }

    Record* Get() { return &storage.record; }

    bool FencesIntact() const {
        auto const intact = [](unsigned char const* fence) {
            return std::all_of(fence, fence + FENCE,
                               [](unsigned char b) { return b == FENCE_BYTE; });
        };
        return intact(storage.before) && intact(storage.after);
    }
    std::vector<unsigned char> Bytes() const {
        std::vector<unsigned char> bytes(sizeof storage);
        std::memcpy(bytes.data(), &storage, sizeof storage);
        return bytes;
    }

private:
    struct Storage {
        unsigned char before[FENCE];
        Record record;
        unsigned char after[FENCE];
    } storage;
};

/// A frame whose buffer lies between two fences; the record describes the part between them.
class FencedImage {
public:
    FencedImage(_DEWARP_IMAGE_INFO const& info, std::size_t size, unsigned char fill)
        : bytes(FENCE + size + FENCE, FENCE_BYTE) {
        std::fill(bytes.begin() + FENCE, bytes.end() - FENCE, fill);
        image.info = info;
        image.data = bytes.data() + FENCE;
    }
    FencedImage(FencedImage const&) = delete;
    FencedImage& operator=(FencedImage const&) = delete;

    _DEWARP_IMAGE* Get() { return &image; }
    _DEWARP_IMAGE const& Image() const { return image; }
    std::vector<unsigned char> const& Bytes() const { return bytes; }
    std::vector<unsigned char> Pixels() const {
        return {bytes.begin() + FENCE, bytes.end() - FENCE};
    }
    bool FencesIntact() const {
        auto const is_fence = [](unsigned char b) { return b == FENCE_BYTE; };
        return std::all_of(bytes.begin(), bytes.begin() + FENCE, is_fence) &&
               std::all_of(bytes.end() - FENCE, bytes.end(), is_fence);
    }

protected:
    std::vector<unsigned char> bytes;
    _DEWARP_IMAGE image;
};

/// The camera's picture in YUV 4:2:0, numbered so that neighbouring pixels differ.
class Warped : public FencedImage {
public:
    explicit Warped(std::size_t width = 256, std::size_t height = 256)
        : FencedImage({DEWARP_IMAGE_FORMAT_YUV420_PLANAR, width, height, width},
                      Yuv420Size(width, height), 0) {
        for (std::size_t index = 0; index < Yuv420Size(width, height); ++index) {
            image.data[index] = static_cast<unsigned char>(index * 7 + index / width * 13);
        }
    }
};

/// A 64 x 48 YUV 4:2:0 output, filled with a value no frame writes everywhere.
class Dewarped : public FencedImage {
public:
    Dewarped()
        : FencedImage({DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 64, 48, 64}, Yuv420Size(64, 48),
                      OUTPUT_FILL) {}
};

/// Closes its handle at the end of the scope.
class OpenChannel {
public:
    explicit OpenChannel(void* channel) : handle(channel) {}
    OpenChannel(OpenChannel const&) = delete;
    OpenChannel& operator=(OpenChannel const&) = delete;
    virtual ~OpenChannel() { dewarp_close(handle); }
    void* Handle() const { return handle; }

private:
    void* handle;
};

void* OpenPtzChannel() {
    return dewarp_internal_open(&Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, &PtzSettings);
}

/// One frame of the numbered picture through a channel, checked to succeed and stay inside its
/// buffer; the output's bytes.
std::vector<unsigned char> Frame(void* channel) {
    Warped warped;
    Dewarped dewarped;
    EXPECT_EQ(0, dewarp_image(channel, warped.Get(), dewarped.Get()));
    EXPECT_TRUE(dewarped.FencesIntact());
    return dewarped.Pixels();
}

std::vector<unsigned char> FreshFrame() {
    OpenChannel const channel(OpenPtzChannel());
    return Frame(channel.Handle());
}

/// Each expanded line that reached the sink, with source lines written as N: they move with the
/// code, the rest of the line is the contract.
std::vector<std::string> Texts(RecordingLogSink const& sink) {
    static std::regex const line_number(":[0-9]+\\)");
    std::vector<std::string> texts;
    for (RecordingLogSink::Line const& line : sink.Lines()) {
        texts.push_back(std::regex_replace(line.text, line_number, ":N)"));
    }
    return texts;
}

/// The line of a call that an argument check refused.
std::string Refused(char const* function, char const* inner, char const* code,
                    std::string const& message) {
    return std::string("VEXMAP: ERROR - ") + function + " - (" + inner + "@src/dewarp:N) [" + code +
           "] - " + message + "\n";
}

std::string NoCamera(char const* function, char const* where = "Channel::GetViewObject") {
    return std::string("VEXMAP: ERROR - ") + function + " - (" + where +
           "@src/channel:N) [Error EFAULT (14)] - Invalid camera\n";
}

/// A channel on the PTZ view of the 256 camera that has dewarped one frame, so that it holds a
/// map, with a fenced record of each kind and a fenced pair of frames for the calls to use.
class Scene {
public:
    Scene() : channel(OpenPtzChannel()) {
        EXPECT_NE(nullptr, channel.Handle());
        Frame(channel.Handle());
    }
    Scene(Scene const&) = delete;
    Scene& operator=(Scene const&) = delete;
    virtual ~Scene() = default;

    void* Channel() const { return channel.Handle(); }

    /// Every byte that a refused call must leave alone; the position's own bytes are left out
    /// where the call may write them.
    std::vector<unsigned char> Memory(bool with_position) const {
        std::vector<unsigned char> memory;
        auto const add = [&memory](std::vector<unsigned char> const& bytes) {
            memory.insert(memory.end(), bytes.begin(), bytes.end());
        };
        add(warped.Bytes());
        add(dewarped.Bytes());
        add(settings.Bytes());
        add(resolution.Bytes());
        add(range.Bytes());
        add(model.Bytes());
        if (with_position) {
            add(position.Bytes());
        }
        return memory;
    }
    bool FencesIntact() const {
        return warped.FencesIntact() && dewarped.FencesIntact() && settings.FencesIntact() &&
               resolution.FencesIntact() && position.FencesIntact() && range.FencesIntact() &&
               model.FencesIntact();
    }

    Warped warped;
    Dewarped dewarped;
    Fenced<_DEWARP_CHANNEL_SETTINGS> settings;
    Fenced<_DEWARP_RESOLUTION> resolution;
    Fenced<_DEWARP_PTZ_POSITION> position;
    Fenced<_DEWARP_PTZ_RANGE> range;
    Fenced<_DEWARP_INTERNAL_CAMERA_MODEL> model;

private:
    OpenChannel const channel;
};

// A handle from an open call reads as 0, null as -1; a handle that should not exist is closed.
int Opened(void* handle) {
    if (handle == nullptr) {
        return -1;
    }
    dewarp_close(handle);
    return 0;
}

// The bad-input grid

struct BadInput {
    std::string name;
    std::function<int(Scene&)> call;
    int result;
    std::vector<std::string> lines;  // as Texts gives them
    int last_error;
    bool moves = false;  // an accepted position: the channel is put back before the last frame
};

void PrintTo(BadInput const& row, std::ostream* stream) {
    *stream << row.name;
}

BadInput ImageRow(std::string const& name, bool on_warped,
                  std::function<void(_DEWARP_IMAGE&)> spoil, int code, char const* message) {
    auto const call = [on_warped, spoil](Scene& scene) {
        _DEWARP_IMAGE warped = scene.warped.Image();
        _DEWARP_IMAGE dewarped = scene.dewarped.Image();
        spoil(on_warped ? warped : dewarped);
        return dewarp_image(scene.Channel(), &warped, &dewarped);
    };
    return {name,
            call,
            -1,
            {Refused("dewarp_image", "DewarpImage", code == EINVAL ? EINVAL_TEXT : EFAULT_TEXT,
                     message)},
            code};
}

BadInput PositionRow(std::string const& name, _DEWARP_PTZ_POSITION const& position) {
    auto const call = [position](Scene& scene) {
        *scene.position.Get() = position;
        return dewarp_set_ptz(scene.Channel(), scene.position.Get());
    };
    return {name, call, 0, {}, NOT_LOOKED_AT, true};
}

BadInput LogLevelRow(std::string const& name, int level) {
    // The sink in force is kept, so only the level changes hands.
    auto const call = [level](Scene&) {
        _DEWARP_LOG_SETTINGS const settings{Log::m_fnLogger.load(), Out<_DEWARP_LOG_LEVEL>(level)};
        return dewarp_set_log(&settings);
    };
    return {name, call, 0, {"VEXMAP: WARNING - Invalid log level\n"}, LEFT_ALONE};
}

std::vector<BadInput> NullHandles() {
    std::vector<std::string> const lines = {InvalidHandle};
    return {
        {"NullHandleSetView",
         [](Scene&) { return dewarp_set_view(nullptr, DEWARP_VIEW_SINGLE_PTZ); }, -1, lines,
         EINVAL},
        {"NullHandleSetProjection",
         [](Scene&) {
             return dewarp_set_projection(nullptr, DEWARP_VIEW_SINGLE_PTZ,
                                          DEWARP_PROJECTION_RECTILINEAR);
         },
         -1, lines, EINVAL},
        {"NullHandleSetInterpolation",
         [](Scene&) { return dewarp_set_interpolation(nullptr, DEWARP_INTERPOLATION_0); }, -1,
         lines, EINVAL},
        {"NullHandleSetAspectRatio",
         [](Scene&) { return dewarp_set_aspect_ratio(nullptr, DEWARP_ASPECT_RATIO_FILL); }, -1,
         lines, EINVAL},
        {"NullHandleGetSettings",
         [](Scene& scene) { return dewarp_get_settings(nullptr, scene.settings.Get()); }, -1, lines,
         EINVAL},
        {"NullHandleGetNativeResolution",
         [](Scene& scene) { return dewarp_get_native_resolution(nullptr, scene.resolution.Get()); },
         -1, lines, EINVAL},
        {"NullHandleSetPtz",
         [](Scene& scene) { return dewarp_set_ptz(nullptr, scene.position.Get()); }, -1, lines,
         EINVAL},
        {"NullHandleSetPtzHome", [](Scene&) { return dewarp_set_ptz(nullptr, nullptr); }, -1, lines,
         EINVAL},
        {"NullHandleGetPtz",
         [](Scene& scene) { return dewarp_get_ptz(nullptr, scene.position.Get()); }, -1, lines,
         EINVAL},
        {"NullHandleGetPtzRange",
         [](Scene& scene) { return dewarp_get_ptz_range(nullptr, scene.range.Get()); }, -1, lines,
         EINVAL},
        {"NullHandleCalcPtzPosition",
         [](Scene& scene) {
             return dewarp_calc_ptz_position(nullptr, 10, 20, 1.0f, scene.position.Get());
         },
         -1, lines, EINVAL},
        {"NullHandleImage",
         [](Scene& scene) {
             return dewarp_image(nullptr, scene.warped.Get(), scene.dewarped.Get());
         },
         -1, lines, EINVAL},
        {"NullHandleGetModel",
         [](Scene& scene) { return dewarp_internal_get_model(nullptr, scene.model.Get()); }, -1,
         lines, EINVAL},
        {"NullHandleSetModel",
         [](Scene&) { return dewarp_internal_set_model(nullptr, &Fisheye256); }, -1, lines, EINVAL},
        {"NullHandleGetMount", [](Scene&) { return dewarp_internal_get_mount(nullptr); }, 2, lines,
         EINVAL},
        {"NullHandleSetMount",
         [](Scene&) {
             return dewarp_internal_set_mount(nullptr, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
         },
         -1, lines, EINVAL},
        {"NullHandleChannelValid",
         [](Scene&) { return dewarp_channel_valid(nullptr); },
         -1,
         {},
         LEFT_ALONE},
        {"NullHandleClose",
         [](Scene&) {
             dewarp_close(nullptr);
             return 0;
         },
         0,
         {"VEXMAP: WARNING - Could not close channel (nil)\n"},
         LEFT_ALONE},
    };
}

std::vector<BadInput> NullRecords() {
    auto const refused = [](char const* function, char const* inner, char const* name) {
        return std::vector<std::string>{
            Refused(function, inner, EFAULT_TEXT, std::string("Invalid pointer to ") + name)};
    };
    return {
        {"NullSettings", [](Scene& scene) { return dewarp_get_settings(scene.Channel(), nullptr); },
         -1, refused("dewarp_get_settings", "GetSettings", "Channel Settings"), EFAULT},
        {"NullResolution",
         [](Scene& scene) { return dewarp_get_native_resolution(scene.Channel(), nullptr); }, -1,
         refused("dewarp_get_native_resolution", "GetNativeResolution", "Native Resolution"),
         EFAULT},
        {"NullPosition", [](Scene& scene) { return dewarp_get_ptz(scene.Channel(), nullptr); }, -1,
         refused("dewarp_get_ptz", "GetPtz", "PTZ position"), EFAULT},
        {"NullRange", [](Scene& scene) { return dewarp_get_ptz_range(scene.Channel(), nullptr); },
         -1, refused("dewarp_get_ptz_range", "GetPtzRange", "PTZ range"), EFAULT},
        {"NullCalculatedPosition",
         [](Scene& scene) {
             return dewarp_calc_ptz_position(scene.Channel(), 10, 20, 1.0f, nullptr);
         },
         -1, refused("dewarp_calc_ptz_position", "CalcPtzPosition", "PTZ position"), EFAULT},
        {"NullWarpedImage",
         [](Scene& scene) { return dewarp_image(scene.Channel(), nullptr, scene.dewarped.Get()); },
         -1, refused("dewarp_image", "DewarpImage", "warped image"), EFAULT},
        {"NullDewarpedImage",
         [](Scene& scene) { return dewarp_image(scene.Channel(), scene.warped.Get(), nullptr); },
         -1, refused("dewarp_image", "DewarpImage", "dewarped image"), EFAULT},
        {"NullModelToGet",
         [](Scene& scene) { return dewarp_internal_get_model(scene.Channel(), nullptr); }, -1,
         refused("dewarp_internal_get_model", "GetModel", "camera model"), EFAULT},
        {"NullModelToSet",
         [](Scene& scene) { return dewarp_internal_set_model(scene.Channel(), nullptr); }, -1,
         refused("dewarp_internal_set_model", "SetModel", "camera model"), EFAULT},
        {"NullModelToOpen",
         [](Scene&) {
             return Opened(
                 dewarp_internal_open(nullptr, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, &PtzSettings));
         },
         -1, refused("dewarp_internal_open", "Open", "camera model"), EFAULT},
    };
}

std::vector<BadInput> Enumerations() {
    std::vector<BadInput> rows;
    auto const refused = [](char const* function, char const* inner, char const* message) {
        return std::vector<std::string>{Refused(function, inner, EINVAL_TEXT, message)};
    };
    for (int const value : {4, -1}) {
        bool const high = value > 0;
        rows.push_back({high ? "ViewFour" : "ViewNegative",
                        [value](Scene& scene) {
                            return dewarp_set_view(scene.Channel(), Out<_DEWARP_VIEW>(value));
                        },
                        -1, refused("dewarp_set_view", "SetView", "Invalid view"), EINVAL});
        rows.push_back({high ? "ProjectionsViewFour" : "ProjectionsViewNegative",
                        [value](Scene& scene) {
                            return dewarp_set_projection(scene.Channel(), Out<_DEWARP_VIEW>(value),
                                                         DEWARP_PROJECTION_RECTILINEAR);
                        },
                        -1, refused("dewarp_set_projection", "SetProjection", "Invalid view"),
                        EINVAL});
        rows.push_back(
            {high ? "AspectRatioFour" : "AspectRatioNegative",
             [value](Scene& scene) {
                 return dewarp_set_aspect_ratio(scene.Channel(), Out<_DEWARP_ASPECT_RATIO>(value));
             },
             -1, refused("dewarp_set_aspect_ratio", "SetAspectRatio", "Invalid aspect ratio"),
             EINVAL});
        rows.push_back(
            {high ? "MountFour" : "MountNegative",
             [value](Scene& scene) {
                 return dewarp_internal_set_mount(scene.Channel(),
                                                  Out<_DEWARP_INTERNAL_CAMERA_MOUNT>(value));
             },
             -1, refused("dewarp_internal_set_mount", "SetMount", "Invalid camera mount"), EINVAL});
        rows.push_back({high ? "OpenMountFour" : "OpenMountNegative",
                        [value](Scene&) {
                            return Opened(dewarp_internal_open(
                                &Fisheye256, Out<_DEWARP_INTERNAL_CAMERA_MOUNT>(value), nullptr));
                        },
                        -1, refused("dewarp_internal_open", "Open", "Invalid camera mount"),
                        EINVAL});
    }
    for (int const value : {9, -1}) {
        rows.push_back({value > 0 ? "ProjectionNine" : "ProjectionNegative",
                        [value](Scene& scene) {
                            return dewarp_set_projection(scene.Channel(), DEWARP_VIEW_SINGLE_PTZ,
                                                         Out<_DEWARP_PROJECTION>(value));
                        },
                        -1, refused("dewarp_set_projection", "SetProjection", "Invalid projection"),
                        EINVAL});
    }
    for (int const value : {3, -1}) {
        rows.push_back(
            {value > 0 ? "InterpolationThree" : "InterpolationNegative",
             [value](Scene& scene) {
                 return dewarp_set_interpolation(scene.Channel(),
                                                 Out<_DEWARP_INTERPOLATION>(value));
             },
             -1, refused("dewarp_set_interpolation", "SetInterpolation", "Invalid interpolation"),
             EINVAL});
    }
    for (int const value : {2, -1}) {
        bool const high = value > 0;
        rows.push_back(
            {high ? "ModelTypeTwo" : "ModelTypeNegative",
             [value](Scene& scene) {
                 _DEWARP_INTERNAL_CAMERA_MODEL model = Fisheye256;
                 model.type = Out<_DEWARP_INTERNAL_CAMERA_TYPE>(value);
                 return dewarp_internal_set_model(scene.Channel(), &model);
             },
             -1, refused("dewarp_internal_set_model", "SetModel", "Invalid camera mount"), EINVAL});
        rows.push_back({high ? "OpenModelTypeTwo" : "OpenModelTypeNegative",
                        [value](Scene&) {
                            _DEWARP_INTERNAL_CAMERA_MODEL model = Fisheye256;
                            model.type = Out<_DEWARP_INTERNAL_CAMERA_TYPE>(value);
                            return Opened(dewarp_internal_open(
                                &model, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, nullptr));
                        },
                        -1, refused("dewarp_internal_open", "Open", "Invalid camera mount"),
                        EINVAL});
    }
    // Each field of the settings out of range, above and below, for both open calls.
    struct Field {
        char const* name;
        int high;
        void (*spoil)(_DEWARP_CHANNEL_SETTINGS&, int);
        char const* message;
    };
    Field const fields[] = {
        {"View", 4, [](_DEWARP_CHANNEL_SETTINGS& s, int v) { s.view = Out<_DEWARP_VIEW>(v); },
         "Invalid view"},
        {"Projection", 9,
         [](_DEWARP_CHANNEL_SETTINGS& s, int v) { s.projection = Out<_DEWARP_PROJECTION>(v); },
         "Invalid projection"},
        {"AspectRatio", 4,
         [](_DEWARP_CHANNEL_SETTINGS& s, int v) { s.aspect_ratio = Out<_DEWARP_ASPECT_RATIO>(v); },
         "Invalid aspect ratio"},
        {"Interpolation", 3,
         [](_DEWARP_CHANNEL_SETTINGS& s, int v) {
             s.interpolation = Out<_DEWARP_INTERPOLATION>(v);
         },
         "Invalid interpolation"},
    };
    for (Field const& field : fields) {
        for (int const value : {field.high, -1}) {
            std::string const suffix =
                std::string(field.name) + (value > 0 ? "OutOfRange" : "Negative");
            _DEWARP_CHANNEL_SETTINGS settings = PtzSettings;
            field.spoil(settings, value);
            rows.push_back({"OpenSettings" + suffix,
                            [settings](Scene&) { return Opened(dewarp_open(&settings)); }, -1,
                            refused("dewarp_open", "Open", field.message), EINVAL});
            rows.push_back({"InternalOpenSettings" + suffix,
                            [settings](Scene&) {
                                return Opened(dewarp_internal_open(
                                    &Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, &settings));
                            },
                            -1, refused("dewarp_internal_open", "Open", field.message), EINVAL});
        }
    }
    for (bool const on_warped : {true, false}) {
        rows.push_back(ImageRow(
            on_warped ? "WarpedFormatSeven" : "DewarpedFormatSeven", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.format = Out<_DEWARP_IMAGE_FORMAT>(7); }, EINVAL,
            "Invalid image format"));
        rows.push_back(ImageRow(
            on_warped ? "WarpedFormatNegative" : "DewarpedFormatNegative", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.format = Out<_DEWARP_IMAGE_FORMAT>(-1); }, EINVAL,
            "Invalid image format"));
    }
    rows.push_back(LogLevelRow("LogLevelFive", 5));
    rows.push_back(LogLevelRow("LogLevelNegative", -1));
    return rows;
}

std::vector<BadInput> Images() {
    std::vector<BadInput> rows;
    for (bool const on_warped : {true, false}) {
        rows.push_back(ImageRow(
            on_warped ? "WarpedZeroWidth" : "DewarpedZeroWidth", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.width = 0; }, EINVAL, "Zero width image"));
        rows.push_back(ImageRow(
            on_warped ? "WarpedZeroHeight" : "DewarpedZeroHeight", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.height = 0; }, EINVAL, "Zero height image"));
        rows.push_back(ImageRow(
            on_warped ? "WarpedZeroStride" : "DewarpedZeroStride", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.stride = 0; }, EINVAL, "Zero stride image"));
        rows.push_back(ImageRow(
            on_warped ? "WarpedStrideBelowWidth" : "DewarpedStrideBelowWidth", on_warped,
            [](_DEWARP_IMAGE& image) { image.info.stride = image.info.width - 1; }, EINVAL,
            "Stride less that width"));
        rows.push_back(ImageRow(
            on_warped ? "WarpedNullData" : "DewarpedNullData", on_warped,
            [](_DEWARP_IMAGE& image) { image.data = nullptr; }, EFAULT,
            "Invalid pointer to image data"));
    }
    return rows;
}

std::vector<BadInput> Positions() {
    return {
        PositionRow("PanNan", {NAN_VALUE, 0.0f, 0.0f, 1.0f}),
        PositionRow("TiltNan", {0.0f, NAN_VALUE, 0.0f, 1.0f}),
        PositionRow("RollNan", {0.0f, 0.0f, NAN_VALUE, 1.0f}),
        PositionRow("ZoomNan", {0.0f, 0.0f, 0.0f, NAN_VALUE}),
        PositionRow("AllNan", {NAN_VALUE, NAN_VALUE, NAN_VALUE, NAN_VALUE}),
        PositionRow("PanInfinite", {INFINITE, 0.0f, 0.0f, 1.0f}),
        PositionRow("TiltMinusInfinite", {0.0f, -INFINITE, 0.0f, 1.0f}),
        PositionRow("RollInfinite", {0.0f, 0.0f, INFINITE, 1.0f}),
        PositionRow("ZoomInfinite", {0.0f, 0.0f, 0.0f, INFINITE}),
        PositionRow("ZoomMinusInfinite", {0.0f, 0.0f, 0.0f, -INFINITE}),
    };
}

std::vector<BadInput> BadInputs() {
    std::vector<BadInput> rows;
    for (auto const& group :
         {NullHandles(), NullRecords(), Enumerations(), Images(), Positions()}) {
        rows.insert(rows.end(), group.begin(), group.end());
    }
    return rows;
}

class DewarpBadInputTest : public ::testing::TestWithParam<BadInput> {};

TEST_P(DewarpBadInputTest, GivesItsResultAndLineTouchesNothingElseAndLeavesTheChannelWorking) {
    BadInput const& row = GetParam();
    std::vector<unsigned char> const fresh = FreshFrame();
    Scene scene;
    _DEWARP_PTZ_POSITION before{};
    ASSERT_EQ(0, dewarp_get_ptz(scene.Channel(), &before));
    std::vector<unsigned char> const memory = scene.Memory(!row.moves);
    {
        RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
        errno = 0;
        int const result = row.call(scene);
        int const last_error = errno;
        EXPECT_EQ(row.result, result);
        if (row.last_error != NOT_LOOKED_AT) {
            EXPECT_EQ(row.last_error, last_error);
        }
        EXPECT_EQ(row.lines, Texts(sink));
    }
    EXPECT_TRUE(scene.FencesIntact());
    EXPECT_EQ(memory, scene.Memory(!row.moves));
    if (row.moves) {
        // A position is never refused: it is taken, limited as the view likes, and put back here.
        ASSERT_EQ(0, dewarp_set_ptz(scene.Channel(), &before));
    }
    EXPECT_EQ(fresh, Frame(scene.Channel()));
}

INSTANTIATE_TEST_SUITE_P(EveryArgument, DewarpBadInputTest, ::testing::ValuesIn(BadInputs()),
                         [](auto const& row) { return row.param.name; });

// A channel without a camera: every call that needs a view

struct ViewCall {
    char const* name;
    std::function<int(void*)> call;
    char const* function;
    char const* where;
};

std::vector<ViewCall> const ViewCalls = {
    {"SetView", [](void* c) { return dewarp_set_view(c, DEWARP_VIEW_QUAD_PTZ); }, "dewarp_set_view",
     "Channel::GetViewObject"},
    {"SetProjection",
     [](void* c) {
         return dewarp_set_projection(c, DEWARP_VIEW_QUAD_PTZ, DEWARP_PROJECTION_MERCATOR);
     },
     "dewarp_set_projection", "Channel::GetViewObject"},
    {"SetAspectRatio", [](void* c) { return dewarp_set_aspect_ratio(c, DEWARP_ASPECT_RATIO_FILL); },
     "dewarp_set_aspect_ratio", "Channel::GetViewObject"},
    {"GetSettings",
     [](void* c) {
         _DEWARP_CHANNEL_SETTINGS settings{};
         return dewarp_get_settings(c, &settings);
     },
     "dewarp_get_settings", "Channel::GetViewObject"},
    {"GetNativeResolution",
     [](void* c) {
         _DEWARP_RESOLUTION resolution{};
         return dewarp_get_native_resolution(c, &resolution);
     },
     "dewarp_get_native_resolution", "Channel::GetViewObject"},
    {"SetPtz",
     [](void* c) {
         _DEWARP_PTZ_POSITION position{10.0f, 0.0f, 0.0f, 2.0f};
         return dewarp_set_ptz(c, &position);
     },
     "dewarp_set_ptz", "Channel::GetViewObject"},
    {"SetPtzHome", [](void* c) { return dewarp_set_ptz(c, nullptr); }, "dewarp_set_ptz",
     "Channel::GetViewObject"},
    {"GetPtz",
     [](void* c) {
         _DEWARP_PTZ_POSITION position{};
         return dewarp_get_ptz(c, &position);
     },
     "dewarp_get_ptz", "Channel::GetViewObject"},
    {"GetPtzRange",
     [](void* c) {
         _DEWARP_PTZ_RANGE range{};
         return dewarp_get_ptz_range(c, &range);
     },
     "dewarp_get_ptz_range", "Channel::GetViewObject"},
    {"CalcPtzPosition",
     [](void* c) {
         _DEWARP_PTZ_POSITION position{};
         return dewarp_calc_ptz_position(c, 10, 20, 1.0f, &position);
     },
     "dewarp_calc_ptz_position", "Channel::GetViewObject"},
    {"Image",
     [](void* c) {
         Warped warped;
         Dewarped dewarped;
         int const result = dewarp_image(c, warped.Get(), dewarped.Get());
         EXPECT_EQ(std::vector<unsigned char>(dewarped.Pixels().size(), OUTPUT_FILL),
                   dewarped.Pixels());
         return result;
     },
     "dewarp_image", "Channel::GetViewObject"},
    {"GetModel",
     [](void* c) {
         Fenced<_DEWARP_INTERNAL_CAMERA_MODEL> model;
         std::vector<unsigned char> const before = model.Bytes();
         int const result = dewarp_internal_get_model(c, model.Get());
         EXPECT_EQ(before, model.Bytes());
         return result;
     },
     "dewarp_internal_get_model", "Channel::GetModel"},
};

_DEWARP_CHANNEL_SETTINGS const KeptSettings = {DEWARP_VIEW_SINGLE_PTZ,
                                               DEWARP_PROJECTION_RECTILINEAR,
                                               DEWARP_ASPECT_RATIO_FIT, DEWARP_INTERPOLATION_2};

class DewarpWithoutCameraTest : public ::testing::TestWithParam<ViewCall> {};

TEST_P(DewarpWithoutCameraTest, FailsWithInvalidCameraAndChangesNoSetting) {
    OpenChannel const channel(dewarp_open(&KeptSettings));
    ASSERT_NE(nullptr, channel.Handle());
    {
        RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
        errno = 0;
        int const result = GetParam().call(channel.Handle());
        EXPECT_EQ(EFAULT, errno);
        EXPECT_EQ(-1, result);
        EXPECT_EQ((std::vector<std::string>{"VEXMAP: ERROR - The camera object was invalid\n",
                                            NoCamera(GetParam().function, GetParam().where)}),
                  Texts(sink));
    }
    ASSERT_EQ(0, dewarp_internal_set_model(channel.Handle(), &Fisheye256));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(KeptSettings.view, settings.view);
    EXPECT_EQ(KeptSettings.projection, settings.projection);
    EXPECT_EQ(KeptSettings.aspect_ratio, settings.aspect_ratio);
    EXPECT_EQ(KeptSettings.interpolation, settings.interpolation);
}

void PrintTo(ViewCall const& row, std::ostream* stream) {
    *stream << row.name;
}

INSTANTIATE_TEST_SUITE_P(EveryCallThatNeedsAView, DewarpWithoutCameraTest,
                         ::testing::ValuesIn(ViewCalls),
                         [](auto const& row) { return std::string(row.param.name); });

// The edge cases of the surface

TEST(Dewarp, OpenWithoutSettingsGivesAHandleWhoseGetSettingsFailsAndWritesNothing) {
    OpenChannel const channel(dewarp_open(nullptr));
    ASSERT_NE(nullptr, channel.Handle());
    Fenced<_DEWARP_CHANNEL_SETTINGS> settings;
    std::vector<unsigned char> const before = settings.Bytes();
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(-1, dewarp_get_settings(channel.Handle(), settings.Get()));
    EXPECT_EQ(before, settings.Bytes());
    EXPECT_THAT(Texts(sink), Contains(NoCamera("dewarp_get_settings")));
}

TEST(Dewarp, SetModelOnAnOpenedHandleMakesLaterCallsWorkWithTheMountAtTwo) {
    OpenChannel const channel(dewarp_open(nullptr));
    ASSERT_EQ(0, dewarp_internal_set_model(channel.Handle(), &Fisheye256));
    EXPECT_EQ(2, dewarp_internal_get_mount(channel.Handle()));
    _DEWARP_CHANNEL_SETTINGS settings{};
    EXPECT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(Defaults::View, settings.view);
    EXPECT_EQ(Defaults::Projection, settings.projection);
    EXPECT_EQ(Defaults::AspectRatio, settings.aspect_ratio);
    EXPECT_EQ(Defaults::Interpolation, settings.interpolation);
    Warped warped;
    Dewarped dewarped;
    EXPECT_EQ(0, dewarp_image(channel.Handle(), warped.Get(), dewarped.Get()));
    EXPECT_NE(std::vector<unsigned char>(dewarped.Pixels().size(), OUTPUT_FILL), dewarped.Pixels());
}

TEST(Dewarp, SetPtzWithANullPositionGoesHomeAndReturnsZero) {
    OpenChannel const channel(
        dewarp_internal_open(&Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, &PtzSettings));
    _DEWARP_PTZ_POSITION moved{30.0f, 10.0f, 0.0f, 2.0f};
    ASSERT_EQ(0, dewarp_set_ptz(channel.Handle(), &moved));
    _DEWARP_PTZ_POSITION position{};
    ASSERT_EQ(0, dewarp_get_ptz(channel.Handle(), &position));
    ASSERT_NE(0.0f, position.pan);
    EXPECT_EQ(0, dewarp_set_ptz(channel.Handle(), nullptr));
    ASSERT_EQ(0, dewarp_get_ptz(channel.Handle(), &position));
    // On a wall the identity lies inside the range: orientation zero, zoom 1.
    EXPECT_EQ(0.0f, position.pan);
    EXPECT_EQ(0.0f, position.tilt);
    EXPECT_EQ(0.0f, position.roll);
    EXPECT_EQ(1.0f, position.zoom);
}

TEST(Dewarp, SetLogWithNullReturnsZeroAndNoFurtherLineReachesTheOldSink) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(0, dewarp_set_log(nullptr));
    EXPECT_EQ(nullptr, Log::m_fnLogger.load());
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Log::m_eLevel.load());
    EXPECT_EQ(-1, dewarp_set_view(nullptr, DEWARP_VIEW_SINGLE_PTZ));
    dewarp_close(nullptr);
    EXPECT_EQ(0u, sink.Count());
}

TEST(Dewarp, SetLogWithLevelSevenReturnsZeroWarnsAndTakesEffectAtLevelTwo) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    _DEWARP_LOG_SETTINGS const settings{Log::m_fnLogger.load(), Out<_DEWARP_LOG_LEVEL>(7)};
    EXPECT_EQ(0, dewarp_set_log(&settings));
    EXPECT_EQ(DEWARP_LOG_LEVEL_INFO, Log::m_eLevel.load());
    OpenChannel const channel(OpenPtzChannel());  // the camera tells its type at level 2
    std::vector<std::string> const texts = Texts(sink);
    ASSERT_LE(2u, texts.size());
    EXPECT_EQ("VEXMAP: WARNING - Invalid log level\n", texts[0]);
    EXPECT_EQ("VEXMAP: INFO - Camera type is circular fish eye\n", texts[1]);
}

TEST(Dewarp, SetLogInstallsTheSinkAndTheLevel) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    _DEWARP_LOG_SETTINGS const settings{Log::m_fnLogger.load(), DEWARP_LOG_LEVEL_ERROR};
    EXPECT_EQ(0, dewarp_set_log(&settings));
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Log::m_eLevel.load());
    dewarp_close(nullptr);  // a warning: below the level now
    EXPECT_EQ(-1, dewarp_set_view(nullptr, DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(std::vector<std::string>{InvalidHandle}, Texts(sink));
}

TEST(Dewarp, ImageWithStride639AndWidth640FailsWithStrideLessThatWidthAndLeavesTheOutput) {
    OpenChannel const channel(OpenPtzChannel());
    Warped warped(640, 480);
    warped.Get()->info.stride = 639;
    Dewarped dewarped;
    std::vector<unsigned char> const before = dewarped.Bytes();
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(-1, dewarp_image(channel.Handle(), warped.Get(), dewarped.Get()));
    EXPECT_EQ(std::vector<std::string>{Refused("dewarp_image", "DewarpImage", EINVAL_TEXT,
                                               "Stride less that width")},
              Texts(sink));
    EXPECT_EQ(before, dewarped.Bytes());
}

TEST(Dewarp, StrideEqualToWidthIsAccepted) {
    OpenChannel const channel(OpenPtzChannel());
    Warped warped;
    Dewarped dewarped;
    ASSERT_EQ(warped.Image().info.width, warped.Image().info.stride);
    EXPECT_EQ(0, dewarp_image(channel.Handle(), warped.Get(), dewarped.Get()));
}

TEST(Dewarp, InternalOpenWithTypeTwoFailsWithInvalidCameraMount) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = Fisheye256;
    model.type = Out<_DEWARP_INTERNAL_CAMERA_TYPE>(2);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    errno = 0;
    EXPECT_EQ(nullptr, dewarp_internal_open(&model, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, nullptr));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_EQ(std::vector<std::string>{Refused("dewarp_internal_open", "Open", EINVAL_TEXT,
                                               "Invalid camera mount")},
              Texts(sink));
}

TEST(Dewarp, SetProjectionWithABadViewAndABadProjectionReportsTheView) {
    OpenChannel const channel(OpenPtzChannel());
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(-1, dewarp_set_projection(channel.Handle(), Out<_DEWARP_VIEW>(4),
                                        Out<_DEWARP_PROJECTION>(9)));
    EXPECT_EQ(std::vector<std::string>{Refused("dewarp_set_projection", "SetProjection",
                                               EINVAL_TEXT, "Invalid view")},
              Texts(sink));
}

TEST(Dewarp, SettingsWithAllFourFieldsOutOfRangeReportTheAspectRatio) {
    _DEWARP_CHANNEL_SETTINGS const settings{Out<_DEWARP_VIEW>(4), Out<_DEWARP_PROJECTION>(9),
                                            Out<_DEWARP_ASPECT_RATIO>(4),
                                            Out<_DEWARP_INTERPOLATION>(3)};
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(nullptr, dewarp_open(&settings));
    EXPECT_EQ(nullptr,
              dewarp_internal_open(&Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, &settings));
    EXPECT_EQ((std::vector<std::string>{
                  Refused("dewarp_open", "Open", EINVAL_TEXT, "Invalid aspect ratio"),
                  Refused("dewarp_internal_open", "Open", EINVAL_TEXT, "Invalid aspect ratio")}),
              Texts(sink));
}

TEST(Dewarp, SettingsAreCheckedAspectRatioInterpolationProjectionThenView) {
    _DEWARP_CHANNEL_SETTINGS settings{Out<_DEWARP_VIEW>(4), Out<_DEWARP_PROJECTION>(9),
                                      DEWARP_ASPECT_RATIO_FIT, Out<_DEWARP_INTERPOLATION>(3)};
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(nullptr, dewarp_open(&settings));
    settings.interpolation = DEWARP_INTERPOLATION_0;
    EXPECT_EQ(nullptr, dewarp_open(&settings));
    settings.projection = DEWARP_PROJECTION_RECTILINEAR;
    EXPECT_EQ(nullptr, dewarp_open(&settings));
    EXPECT_EQ((std::vector<std::string>{
                  Refused("dewarp_open", "Open", EINVAL_TEXT, "Invalid interpolation"),
                  Refused("dewarp_open", "Open", EINVAL_TEXT, "Invalid projection"),
                  Refused("dewarp_open", "Open", EINVAL_TEXT, "Invalid view")}),
              Texts(sink));
}

TEST(Dewarp, CloseOfNullWarnsAndDoesNothingElse) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    errno = 0;
    dewarp_close(nullptr);
    EXPECT_EQ(0, errno);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Could not close channel %p\n", lines[0].format);
}

TEST(Dewarp, ChannelValidAnswersZeroForAnyPointerThatIsNotNullAlsoAClosedOne) {
    int anything = 0;
    EXPECT_EQ(0, dewarp_channel_valid(&anything));
    void* const channel = OpenPtzChannel();
    EXPECT_EQ(0, dewarp_channel_valid(channel));
    dewarp_close(channel);
    EXPECT_EQ(0, dewarp_channel_valid(channel));
    EXPECT_EQ(-1, dewarp_channel_valid(nullptr));
}

// The failure table

TEST(Dewarp, GetMountOfANullHandleAnswersTwoAndLogsTheHandle) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    errno = 0;
    EXPECT_EQ(2, dewarp_internal_get_mount(nullptr));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_EQ(std::vector<std::string>{InvalidHandle}, Texts(sink));
}

TEST(Dewarp, CallsThatNeedNoViewWorkWithoutACamera) {
    OpenChannel const channel(dewarp_open(nullptr));
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(0, dewarp_set_interpolation(channel.Handle(), DEWARP_INTERPOLATION_2));
    EXPECT_EQ(int(Defaults::CameraMount), dewarp_internal_get_mount(channel.Handle()));
    EXPECT_EQ(0, dewarp_channel_valid(channel.Handle()));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Dewarp, SetMountWithoutACameraFailsWithItsOwnLineOnly) {
    OpenChannel const channel(dewarp_open(nullptr));
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(-1, dewarp_internal_set_mount(channel.Handle(), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    EXPECT_EQ(std::vector<std::string>{"VEXMAP: ERROR - The camera was invalid\n"}, Texts(sink));
    EXPECT_EQ(2, dewarp_internal_get_mount(channel.Handle()));
}

// The surface refuses unknown view kinds itself, so the builder's own refusal is out of reach;
// a view that its traits refuse for the projection is the build failure a caller can meet.
TEST(Dewarp, AViewThatCannotBeBuiltFailsAndKeepsTheSettingsAndTheFrame) {
    OpenChannel const channel(OpenPtzChannel());
    std::vector<unsigned char> const before = Frame(channel.Handle());
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(-1, dewarp_set_projection(channel.Handle(), DEWARP_VIEW_SINGLE_PANORAMIC,
                                        DEWARP_PROJECTION_RECTILINEAR));
    std::vector<std::string> const texts = Texts(sink);
    ASSERT_FALSE(texts.empty());
    EXPECT_THAT(texts.back(), HasSubstr("VEXMAP: ERROR - dewarp_set_projection - ("));
    EXPECT_THAT(texts.back(), HasSubstr("] - Invalid projection for this orientation\n"));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(PtzSettings.view, settings.view);
    EXPECT_EQ(PtzSettings.projection, settings.projection);
    EXPECT_EQ(before, Frame(channel.Handle()));
}

// A sink that calls back into the surface, as a careless host might: the first camera line,
// which a model change logs under the channel's write lock, asks that channel for its settings.
void* g_reentered_channel = nullptr;
bool g_reentered = false;
int g_reentry_result = 0;
int g_reentry_error = 0;
int g_reentry_mount = 0;
std::vector<std::string> g_reentry_lines;

void ReenteringSink(char const* format, va_list arguments) {
    char text[512];
    vsnprintf(text, sizeof text, format, arguments);
    g_reentry_lines.emplace_back(text);
    if (!g_reentered && std::string(text).find("Camera type is") != std::string::npos) {
        g_reentered = true;
        _DEWARP_CHANNEL_SETTINGS settings{};
        g_reentry_result = dewarp_get_settings(g_reentered_channel, &settings);
        g_reentry_error = errno;
        g_reentry_mount = dewarp_internal_get_mount(g_reentered_channel);
    }
}

TEST(Dewarp, ACallFromTheSinkIntoALockedChannelFailsWithLockFailure) {
    OpenChannel const channel(OpenPtzChannel());
    g_reentered_channel = channel.Handle();
    g_reentered = false;
    g_reentry_lines.clear();
    _DEWARP_LOG_SETTINGS const previous =
        Log::set_logging({&ReenteringSink, DEWARP_LOG_LEVEL_INFO});
    int const result = dewarp_internal_set_model(channel.Handle(), &Fisheye256);
    Log::set_logging(previous);
    EXPECT_EQ(0, result);
    ASSERT_TRUE(g_reentered);
    EXPECT_EQ(-1, g_reentry_result);
    EXPECT_EQ(EDEADLK, g_reentry_error);
    EXPECT_EQ(-1, g_reentry_mount);  // not a mount: something was thrown
    std::vector<std::string> texts;
    for (std::string const& line : g_reentry_lines) {
        texts.push_back(std::regex_replace(line, std::regex(":[0-9]+\\)"), ":N)"));
    }
    // The code is printed in the platform's own numbering.
    EXPECT_THAT(texts, Contains("VEXMAP: ERROR - dewarp_get_settings - "
                                "(ReadLock::ReadLock@include/vexmap/read_write_mutex:N) "
                                "[Error EDEADLK (" +
                                std::to_string(EDEADLK) + ")] - Lock failure\n"));
    _DEWARP_CHANNEL_SETTINGS settings{};
    EXPECT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));  // the lock was let go
}

// A sink that throws once, to stand for anything foreign that reaches an inner function.
int g_throws_left = 0;
bool g_throw_standard = false;
std::vector<std::string> g_thrower_lines;

void ThrowingSink(char const* format, va_list arguments) {
    char text[512];
    vsnprintf(text, sizeof text, format, arguments);
    g_thrower_lines.emplace_back(text);
    if (g_throws_left > 0) {
        --g_throws_left;
        if (g_throw_standard) {
            throw std::runtime_error("sink gave out");
        }
        throw 42;
    }
}

/// Installs the throwing sink at the warning level for its lifetime, ready to throw once.
class ThrowingSinkInstalled {
public:
    explicit ThrowingSinkInstalled(bool standard)
        : previous(Log::set_logging({&ThrowingSink, DEWARP_LOG_LEVEL_WARNING})) {
        g_thrower_lines.clear();
        g_throws_left = 1;
        g_throw_standard = standard;
    }
    ThrowingSinkInstalled(ThrowingSinkInstalled const&) = delete;
    ThrowingSinkInstalled& operator=(ThrowingSinkInstalled const&) = delete;
    virtual ~ThrowingSinkInstalled() {
        g_throws_left = 0;
        Log::set_logging(previous);
    }

private:
    _DEWARP_LOG_SETTINGS previous;
};

TEST(Dewarp, AForeignExceptionIsDescribedThenReportedAsBadException) {
    ThrowingSinkInstalled const installed(false);
    _DEWARP_LOG_SETTINGS const settings{&ThrowingSink, Out<_DEWARP_LOG_LEVEL>(7)};
    EXPECT_EQ(-1, dewarp_set_log(&settings));
    EXPECT_EQ(
        (std::vector<std::string>{"VEXMAP: WARNING - Invalid log level\n",
                                  "VEXMAP: ERROR - Caught unexpected integer exception - 42\n",
                                  "VEXMAP: ERROR - dewarp_set_log - std::bad_exception\n"}),
        g_thrower_lines);
    EXPECT_EQ(DEWARP_LOG_LEVEL_WARNING, Log::m_eLevel.load());  // the call did not get that far
}

TEST(Dewarp, AStandardExceptionFromBelowIsReportedByItsText) {
    ThrowingSinkInstalled const installed(true);
    dewarp_close(nullptr);
    EXPECT_EQ((std::vector<std::string>{"VEXMAP: WARNING - Could not close channel (nil)\n",
                                        "VEXMAP: ERROR - dewarp_close - sink gave out\n"}),
              g_thrower_lines);
}

TEST(Dewarp, ASinkThatAlwaysThrowsCannotGetItsExceptionOut) {
    for (bool const standard : {false, true}) {
        ThrowingSinkInstalled const installed(standard);
        g_throws_left = 1000;
        int result = 0;
        EXPECT_NO_THROW(result = dewarp_set_view(nullptr, DEWARP_VIEW_SINGLE_PTZ));
        EXPECT_EQ(-1, result);
        EXPECT_NO_THROW(dewarp_close(nullptr));
    }
}

TEST(Dewarp, AnExceptionUnderTheWriteLockLeavesTheChannelUsable) {
    OpenChannel const channel(OpenPtzChannel());
    std::vector<unsigned char> const before = Frame(channel.Handle());
    {
        ThrowingSinkInstalled const installed(true);
        Log::set_logging({&ThrowingSink, DEWARP_LOG_LEVEL_INFO});
        EXPECT_EQ(-1, dewarp_internal_set_model(channel.Handle(), &Fisheye256));
        ASSERT_FALSE(g_thrower_lines.empty());
        EXPECT_EQ("VEXMAP: ERROR - dewarp_internal_set_model - sink gave out\n",
                  g_thrower_lines.back());
    }
    _DEWARP_CHANNEL_SETTINGS settings{};
    EXPECT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(before, Frame(channel.Handle()));
}

// What works

TEST(Dewarp, InternalOpenTakesTheSettingsAndTellsThemBack) {
    OpenChannel const channel(
        dewarp_internal_open(&Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, &KeptSettings));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(KeptSettings.view, settings.view);
    EXPECT_EQ(KeptSettings.projection, settings.projection);
    EXPECT_EQ(KeptSettings.aspect_ratio, settings.aspect_ratio);
    EXPECT_EQ(KeptSettings.interpolation, settings.interpolation);
    EXPECT_EQ(int(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR), dewarp_internal_get_mount(channel.Handle()));
}

TEST(Dewarp, InternalOpenWithoutSettingsTakesTheCamerasDefaults) {
    OpenChannel const channel(
        dewarp_internal_open(&Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, nullptr));
    Channel const reference(Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(Defaults::View, settings.view);
    EXPECT_EQ(Defaults::Interpolation, settings.interpolation);
    EXPECT_EQ(reference.GetProjection(), settings.projection);
    EXPECT_EQ(reference.GetAspectRatio(), settings.aspect_ratio);
}

TEST(Dewarp, OpenWithSettingsKeepsThemForTheModelToCome) {
    OpenChannel const channel(dewarp_open(&KeptSettings));
    ASSERT_EQ(0, dewarp_internal_set_model(channel.Handle(), &Fisheye256));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(KeptSettings.view, settings.view);
    EXPECT_EQ(KeptSettings.interpolation, settings.interpolation);
}

TEST(Dewarp, ImageGivesTheChannelsOwnFrame) {
    OpenChannel const channel(OpenPtzChannel());
    Channel const reference(Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, PtzSettings);
    Warped warped;
    Dewarped expected;
    ASSERT_TRUE(reference.DewarpImage(warped.Image(), *expected.Get()));
    EXPECT_EQ(expected.Pixels(), Frame(channel.Handle()));
    EXPECT_NE(std::vector<unsigned char>(expected.Pixels().size(), OUTPUT_FILL), expected.Pixels());
}

TEST(Dewarp, GettersAnswerWhatTheChannelAnswers) {
    OpenChannel const channel(OpenPtzChannel());
    Channel const reference(Fisheye256, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, PtzSettings);
    _DEWARP_RESOLUTION resolution{}, expected_resolution{};
    ASSERT_EQ(0, dewarp_get_native_resolution(channel.Handle(), &resolution));
    ASSERT_TRUE(reference.GetNativeResolution(expected_resolution));
    EXPECT_EQ(expected_resolution.width, resolution.width);
    EXPECT_EQ(expected_resolution.height, resolution.height);
    _DEWARP_PTZ_RANGE range{}, expected_range{};
    ASSERT_EQ(0, dewarp_get_ptz_range(channel.Handle(), &range));
    ASSERT_TRUE(reference.GetPtzRange(expected_range));
    EXPECT_EQ(0, std::memcmp(&expected_range, &range, sizeof range));
    EXPECT_LE(range.pan_min, range.pan_max);
    EXPECT_LE(range.tilt_min, range.tilt_max);
    _DEWARP_PTZ_POSITION position{}, expected_position{};
    ASSERT_EQ(0, dewarp_calc_ptz_position(channel.Handle(), 100, 60, 2.0f, &position));
    ASSERT_TRUE(reference.CalcPtzPosition(Vector2d(100.0f, 60.0f), 2.0f, expected_position));
    EXPECT_EQ(0, std::memcmp(&expected_position, &position, sizeof position));
    _DEWARP_INTERNAL_CAMERA_MODEL model{};
    ASSERT_EQ(0, dewarp_internal_get_model(channel.Handle(), &model));
    EXPECT_EQ(0, std::memcmp(&Fisheye256, &model, sizeof model));
}

TEST(Dewarp, SetPtzWritesTheLimitedPositionBack) {
    OpenChannel const channel(OpenPtzChannel());
    _DEWARP_PTZ_POSITION position{0.0f, 0.0f, 0.0f, 0.25f};
    EXPECT_EQ(0, dewarp_set_ptz(channel.Handle(), &position));
    EXPECT_EQ(0.5f, position.zoom);  // the lower end of the PTZ zoom range
    _DEWARP_PTZ_POSITION read{};
    ASSERT_EQ(0, dewarp_get_ptz(channel.Handle(), &read));
    EXPECT_EQ(0, std::memcmp(&position, &read, sizeof read));
}

TEST(Dewarp, SetViewAndMountReachTheChannel) {
    OpenChannel const channel(OpenPtzChannel());
    EXPECT_EQ(0, dewarp_set_view(channel.Handle(), DEWARP_VIEW_QUAD_PTZ));
    EXPECT_EQ(0, dewarp_set_aspect_ratio(channel.Handle(), DEWARP_ASPECT_RATIO_FILL));
    EXPECT_EQ(0, dewarp_set_interpolation(channel.Handle(), DEWARP_INTERPOLATION_0));
    EXPECT_EQ(0, dewarp_internal_set_mount(channel.Handle(), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(channel.Handle(), &settings));
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, settings.view);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, settings.aspect_ratio);
    EXPECT_EQ(DEWARP_INTERPOLATION_0, settings.interpolation);
    EXPECT_EQ(int(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR), dewarp_internal_get_mount(channel.Handle()));
}

// The checks on their own

TEST(Dewarp, VerifyOfAFloatRefusesWithEdomAndLeavesTheLastErrorAlone) {
    CodeLocation const here("src/dewarp", "Test", 7);
    errno = 0;
    EXPECT_THAT([&here]() { Verify(here, 0.25f, 0.5f, 4.0f, "zoom"); },
                ThrowsMessage<Error>(::testing::StrEq(
                    "(Test@src/dewarp:7) [Error EDOM (33)] - Invalid zoom, must be 0.500000 or "
                    "greater")));
    EXPECT_THAT([&here]() { Verify(here, 5.0f, 0.5f, 4.0f, "zoom"); },
                ThrowsMessage<Error>(::testing::StrEq(
                    "(Test@src/dewarp:7) [Error EDOM (33)] - Invalid zoom, must be less than "
                    "4.000000")));
    EXPECT_EQ(0, errno);
    EXPECT_NO_THROW(Verify(here, 4.0f, 0.5f, 4.0f, "zoom"));
    EXPECT_NO_THROW(Verify(here, NAN_VALUE, 0.5f, 4.0f, "zoom"));  // a NaN is no number to refuse
}

TEST(Dewarp, VerifyLetsEveryPositionThrough) {
    CodeLocation const here("src/dewarp", "Test", 7);
    EXPECT_NO_THROW(Verify(here, _DEWARP_PTZ_POSITION{NAN_VALUE, INFINITE, -INFINITE, 0.0f}));
}

TEST(Dewarp, VerifyOfAnImageChecksTheFormatFirstThenWidthHeightAndStride) {
    CodeLocation const here("src/dewarp", "Test", 7);
    _DEWARP_IMAGE_INFO info{Out<_DEWARP_IMAGE_FORMAT>(7), 0, 0, 0};
    EXPECT_THAT([&]() { Verify(here, info); },
                ThrowsMessage<Error>(HasSubstr("] - Invalid image format")));
    info.format = DEWARP_IMAGE_FORMAT_NV420_PLANAR;
    EXPECT_THAT([&]() { Verify(here, info); },
                ThrowsMessage<Error>(HasSubstr("] - Zero width image")));
    info.width = 1;
    EXPECT_THAT([&]() { Verify(here, info); },
                ThrowsMessage<Error>(HasSubstr("] - Zero height image")));
    info.height = 1;
    EXPECT_THAT([&]() { Verify(here, info); },
                ThrowsMessage<Error>(HasSubstr("] - Zero stride image")));
    info.width = 2;
    info.stride = 1;
    EXPECT_THAT([&]() { Verify(here, info); },
                ThrowsMessage<Error>(HasSubstr("] - Stride less that width")));
    _DEWARP_IMAGE image{info, nullptr};
    EXPECT_THAT([&]() { Verify(here, image); },
                ThrowsMessage<Error>(HasSubstr("] - Stride less that width")));
    image.info.stride = 2;
    EXPECT_THAT(
        [&]() { Verify(here, image); },
        ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid pointer to image data")));
}

TEST(Dewarp, VerifyOfTheCameraTypeSpeaksOfTheMount) {
    CodeLocation const here("src/dewarp", "Test", 7);
    EXPECT_THAT([&]() { Verify(here, Out<_DEWARP_INTERNAL_CAMERA_TYPE>(2)); },
                ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid camera mount")));
    EXPECT_NO_THROW(Verify(here, DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR));
}

TEST(Dewarp, SizeOfIsAlwaysZero) {
    Warped const warped;
    EXPECT_EQ(0ul, SizeOf(warped.Image().info));
    EXPECT_EQ(0ul, SizeOf(&warped.Image()));
    EXPECT_EQ(0ul, SizeOf(static_cast<_DEWARP_IMAGE const*>(nullptr)));
}

// The same calls made from C: enumerations and records cross the surface as C lays them out.
TEST(Dewarp, ACallerInCGetsTheFrameThatTheSameCallsGiveInCpp) {
    std::vector<unsigned char> input(64 * 64 * 3 / 2);
    for (size_t index = 0; index < input.size(); ++index) {
        input[index] = static_cast<unsigned char>(index * 7 + index / 64);
    }
    std::vector<unsigned char> from_c(32 * 24 * 3 / 2, 0xEE);
    ASSERT_EQ(0, c_dewarp_one_frame(input.data(), from_c.data()));

    _DEWARP_INTERNAL_CAMERA_MODEL const model{
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 180.0f, 180.0f, 64, 64};
    _DEWARP_CHANNEL_SETTINGS const settings{DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                                            DEWARP_ASPECT_RATIO_STRETCH, DEWARP_INTERPOLATION_0};
    void* const channel =
        dewarp_internal_open(&model, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, &settings);
    ASSERT_NE(nullptr, channel);
    _DEWARP_PTZ_POSITION position{30.0f, 40.0f, 0.0f, 1.0f};
    ASSERT_EQ(0, dewarp_set_ptz(channel, &position));
    std::vector<unsigned char> from_cpp(from_c.size(), 0x11);
    _DEWARP_IMAGE const warped{{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 64, 64, 64}, input.data()};
    _DEWARP_IMAGE dewarped{{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 32, 24, 32}, from_cpp.data()};
    ASSERT_EQ(0, dewarp_image(channel, &warped, &dewarped));
    dewarp_close(channel);
    EXPECT_EQ(from_cpp, from_c);
}

}  // namespace
}  // namespace quorvel::vexmap

namespace {

using namespace quorvel::vexmap;

// The frame in bands of the given rows, each through dewarp_image_rows, after the preparation.
std::vector<unsigned char> BandedFrame(void* channel, std::size_t band_rows) {
    Warped warped;
    Dewarped dewarped;
    EXPECT_EQ(0, dewarp_prepare_image(channel, &dewarped.Image().info));
    for (std::size_t first = 0; first < 48; first += band_rows) {
        EXPECT_EQ(0, dewarp_image_rows(channel, warped.Get(), dewarped.Get(), first,
                                       std::min<std::size_t>(band_rows, 48 - first)));
    }
    EXPECT_TRUE(dewarped.FencesIntact());
    return dewarped.Pixels();
}

TEST(DewarpRows, BandsAfterThePreparationMakeTheFrameThatDewarpImageMakes) {
    for (std::size_t const band_rows : {2u, 6u, 16u, 48u}) {
        OpenChannel const channel(OpenPtzChannel());
        EXPECT_EQ(FreshFrame(), BandedFrame(channel.Handle(), band_rows)) << band_rows;
    }
}

TEST(DewarpRows, AMovedViewNeedsAnotherPreparationAndThenShowsTheNewPosition) {
    OpenChannel const channel(OpenPtzChannel());
    BandedFrame(channel.Handle(), 16);
    _DEWARP_PTZ_POSITION position = {20.0f, 30.0f, 0.0f, 1.5f};
    ASSERT_EQ(0, dewarp_set_ptz(channel.Handle(), &position));
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Warped warped;
    Dewarped dewarped;
    errno = 0;
    EXPECT_EQ(-1, dewarp_image_rows(channel.Handle(), warped.Get(), dewarped.Get(), 0, 48));
    EXPECT_EQ(EINVAL, errno);
    ASSERT_FALSE(sink.Lines().empty());
    EXPECT_EQ(
        "VEXMAP: ERROR - dewarp_image_rows - (View::DewarpRows@src/view:N) [Error EINVAL (22)] - "
        "Image map not prepared\n",
        Texts(sink).back());
    EXPECT_EQ(std::vector<unsigned char>(dewarped.Pixels().size(), OUTPUT_FILL), dewarped.Pixels());
    std::vector<unsigned char> const banded = BandedFrame(channel.Handle(), 8);
    EXPECT_EQ(Frame(channel.Handle()), banded);
}

TEST(DewarpRows, AChannelNeverPreparedOrPreparedForAnotherSizeRefusesBands) {
    OpenChannel const channel(OpenPtzChannel());
    Warped warped;
    Dewarped dewarped;
    EXPECT_EQ(-1, dewarp_image_rows(channel.Handle(), warped.Get(), dewarped.Get(), 0, 2));
    _DEWARP_IMAGE_INFO other = dewarped.Image().info;
    other.width = 32;
    ASSERT_EQ(0, dewarp_prepare_image(channel.Handle(), &other));
    EXPECT_EQ(-1, dewarp_image_rows(channel.Handle(), warped.Get(), dewarped.Get(), 0, 2));
    EXPECT_EQ(std::vector<unsigned char>(dewarped.Pixels().size(), OUTPUT_FILL), dewarped.Pixels());
}

TEST(DewarpRows, ABandOffTheBlocksOrPastTheFrameFailsWithEinvalAndWritesNothing) {
    OpenChannel const channel(OpenPtzChannel());
    Warped warped;
    Dewarped dewarped;
    ASSERT_EQ(0, dewarp_prepare_image(channel.Handle(), &dewarped.Image().info));
    for (auto const& [first, count] :
         {std::pair<std::size_t, std::size_t>{1, 2}, {0, 3}, {46, 4}, {50, 0}}) {
        errno = 0;
        EXPECT_EQ(-1,
                  dewarp_image_rows(channel.Handle(), warped.Get(), dewarped.Get(), first, count))
            << first << " + " << count;
        EXPECT_EQ(EINVAL, errno);
    }
    EXPECT_EQ(std::vector<unsigned char>(dewarped.Pixels().size(), OUTPUT_FILL), dewarped.Pixels());
    EXPECT_EQ(0, dewarp_image_rows(channel.Handle(), warped.Get(), dewarped.Get(), 10, 0));
}

TEST(DewarpRows, NullHandlesAndRecordsFailWithoutACrash) {
    OpenChannel const channel(OpenPtzChannel());
    Warped warped;
    Dewarped dewarped;
    EXPECT_EQ(-1, dewarp_prepare_image(nullptr, &dewarped.Image().info));
    EXPECT_EQ(-1, dewarp_prepare_image(channel.Handle(), nullptr));
    EXPECT_EQ(-1, dewarp_image_rows(nullptr, warped.Get(), dewarped.Get(), 0, 2));
    EXPECT_EQ(-1, dewarp_image_rows(channel.Handle(), nullptr, dewarped.Get(), 0, 2));
    EXPECT_EQ(-1, dewarp_image_rows(channel.Handle(), warped.Get(), nullptr, 0, 2));
}

}  // namespace
