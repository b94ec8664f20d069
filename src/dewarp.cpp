#include <cerrno>
#include <cstdint>
#include <exception>

#include "vexmap/bad_exception_handler.h"
#include "vexmap/channel.h"
#include "vexmap/defaults.h"
#include "vexmap/dewarp_inner.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/vector_2d.h"

using quorvel::vexmap::BadExceptionHandler;
using quorvel::vexmap::Channel;
using quorvel::vexmap::CodeLocation;
using quorvel::vexmap::Defaults;
using quorvel::vexmap::Error;
using quorvel::vexmap::FloatingPoint;
using quorvel::vexmap::Log;
using quorvel::vexmap::Vector2d;

namespace {

constexpr char const* SOURCE = "src/dewarp";

CodeLocation Here(char const* function, int line) {
    return CodeLocation(SOURCE, function, line);
}

[[noreturn]] void Refuse(CodeLocation const& location, int code, char const* message) {
    Error::SetLastError(code);
    throw Error(location, code, "%s", message);
}

// An enumeration is whatever 32-bit value the caller passed: compared unsigned, a negative one
// lies beyond every range.
void RefuseUnless(bool accepted, CodeLocation const& location, char const* message) {
    if (!accepted) {
        Refuse(location, EINVAL, message);
    }
}

// The handle is the channel itself; null is the one thing that can be told about it. Logged
// under the inner function's name, with no exception: a null handle is the caller's slip.
Channel* Handle(void* channel, char const* function) {
    if (channel == nullptr) {
        Log::err(__LINE__, __FILE__, function, "The channel parameter is invalid\n");
        Error::SetLastError(EINVAL);
    }
    return static_cast<Channel*>(channel);
}

int Result(bool succeeded) {
    return succeeded ? 0 : -1;
}

// The failure line of a call; a null text stands for an exception that has none. A line that
// cannot be written, for want of memory, is given up: nothing may leave the surface.
void Report(char const* function, char const* text) {
    try {
        if (text != nullptr) {
            Log::err(__LINE__, __FILE__, function, "%s - %s\n", function, text);
        } else {
            Log::err(__LINE__, __FILE__, function, "%s - unknown error\n", function);
        }
    } catch (...) {
    }
}

// The outer half of every call. The guard lets a std::exception through and turns anything else
// into std::bad_exception, itself one, so the last arm is a defence only.
template <typename Value, typename Inner>
Value Guarded(char const* function, Value failure, Inner&& inner) {
    try {
        return BadExceptionHandler::Run(inner);
    } catch (std::exception const& error) {
        Report(function, error.what());
    } catch (...) {
        Report(function, nullptr);
    }
    return failure;
}

}  // namespace

// The checks

void Verify(CodeLocation const& location, float value, float min, float max, char const* name) {
    // A range error leaves errno alone: only the text carries EDOM.
    if (FloatingPoint::is_less(value, min)) {
        throw Error(location, EDOM, "Invalid %s, must be %f or greater", name, double(min));
    }
    if (FloatingPoint::is_greater(value, max)) {
        throw Error(location, EDOM, "Invalid %s, must be less than %f", name, double(max));
    }
}

// The size is carried for the caller's sake and not looked at.
void Verify(CodeLocation const& location, void const* pointer, unsigned long, char const* name) {
    if (pointer == nullptr) {
        Error::SetLastError(EFAULT);
        throw Error(location, EFAULT, "Invalid pointer to %s", name);
    }
}

// A level out of range is only worth a warning: the log clamps it anyway.
void Verify(CodeLocation const&, _DEWARP_LOG_LEVEL level) {
    if (uint32_t(level) >= 5) {
        Log::warn(__LINE__, __FILE__, "Verify", "Invalid log level\n");
    }
}

void Verify(CodeLocation const& location, _DEWARP_LOG_SETTINGS const& settings) {
    Verify(location, settings.level);
}

void Verify(CodeLocation const& location, _DEWARP_INTERPOLATION interpolation) {
    RefuseUnless(uint32_t(interpolation) < 3, location, "Invalid interpolation");
}

void Verify(CodeLocation const& location, _DEWARP_PROJECTION projection) {
    RefuseUnless(uint32_t(projection) < 9, location, "Invalid projection");
}

void Verify(CodeLocation const& location, _DEWARP_VIEW view) {
    RefuseUnless(uint32_t(view) < 4, location, "Invalid view");
}

void Verify(CodeLocation const& location, _DEWARP_ASPECT_RATIO aspect_ratio) {
    RefuseUnless(uint32_t(aspect_ratio) < 4, location, "Invalid aspect ratio");
}

void Verify(CodeLocation const& location, _DEWARP_IMAGE_FORMAT format) {
    RefuseUnless(uint32_t(format) < 7, location, "Invalid image format");
}

// "that" for "than" is the message as callers know it: kept.
void Verify(CodeLocation const& location, _DEWARP_IMAGE_INFO const& info) {
    Verify(location, info.format);
    RefuseUnless(info.width != 0, location, "Zero width image");
    RefuseUnless(info.height != 0, location, "Zero height image");
    RefuseUnless(info.stride != 0, location, "Zero stride image");
    RefuseUnless(info.stride >= info.width, location, "Stride less that width");
}

void Verify(CodeLocation const& location, _DEWARP_IMAGE const& image) {
    Verify(location, image.info);
    Verify(location, image.data, SizeOf(&image), "image data");
}

// Every position is taken: the view limits it, and a NaN is the engine's own "no value".
void Verify(CodeLocation const&, _DEWARP_PTZ_POSITION const&) {}

void Verify(CodeLocation const& location, _DEWARP_CHANNEL_SETTINGS const& settings) {
    Verify(location, settings.aspect_ratio);
    Verify(location, settings.interpolation);
    Verify(location, settings.projection);
    Verify(location, settings.view);
}

// Type, mount and model share one message, by requirement.
void Verify(CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_TYPE type) {
    RefuseUnless(uint32_t(type) < 2, location, "Invalid camera mount");
}

void Verify(CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    RefuseUnless(uint32_t(mount) < 4, location, "Invalid camera mount");
}

void Verify(CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_MODEL model) {
    Verify(location, model.type);
}

unsigned long SizeOf(_DEWARP_IMAGE_INFO const&) {
    return 0;
}

unsigned long SizeOf(_DEWARP_IMAGE const*) {
    return 0;
}

// The inner functions

int SetLog(_DEWARP_LOG_SETTINGS const* settings) {
    if (settings == nullptr) {
        Log::set_logging(Defaults::LogSettings);
        return 0;
    }
    Verify(Here("SetLog", __LINE__), *settings);
    Log::set_logging(*settings);
    return 0;
}

void* Open(_DEWARP_CHANNEL_SETTINGS const* settings) {
    if (settings == nullptr) {
        return new Channel();
    }
    Verify(Here("Open", __LINE__), *settings);
    return new Channel(*settings);
}

void* Open(_DEWARP_INTERNAL_CAMERA_MODEL const* model, _DEWARP_INTERNAL_CAMERA_MOUNT mount,
           _DEWARP_CHANNEL_SETTINGS const* settings) {
    Verify(Here("Open", __LINE__), model, sizeof *model, "camera model");
    Verify(Here("Open", __LINE__), *model);
    Verify(Here("Open", __LINE__), mount);
    if (settings == nullptr) {
        return new Channel(*model, mount);
    }
    Verify(Here("Open", __LINE__), *settings);
    return new Channel(*model, mount, *settings);
}

int SetView(void* channel, _DEWARP_VIEW view) {
    Channel* const target = Handle(channel, "SetView");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetView", __LINE__), view);
    return Result(target->SetView(view));
}

int SetProjection(void* channel, _DEWARP_VIEW view, _DEWARP_PROJECTION projection) {
    Channel* const target = Handle(channel, "SetProjection");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetProjection", __LINE__), view);
    Verify(Here("SetProjection", __LINE__), projection);
    return Result(target->SetProjection(view, projection));
}

int SetInterpolation(void* channel, _DEWARP_INTERPOLATION interpolation) {
    Channel* const target = Handle(channel, "SetInterpolation");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetInterpolation", __LINE__), interpolation);
    return Result(target->SetInterpolation(interpolation));
}

int SetAspectRatio(void* channel, _DEWARP_ASPECT_RATIO aspect_ratio) {
    Channel* const target = Handle(channel, "SetAspectRatio");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetAspectRatio", __LINE__), aspect_ratio);
    return Result(target->SetAspectRatio(aspect_ratio));
}

int GetSettings(void* channel, _DEWARP_CHANNEL_SETTINGS* settings) {
    Channel* const target = Handle(channel, "GetSettings");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("GetSettings", __LINE__), settings, sizeof *settings, "Channel Settings");
    return Result(target->GetSettings(*settings));
}

int GetNativeResolution(void* channel, _DEWARP_RESOLUTION* resolution) {
    Channel* const target = Handle(channel, "GetNativeResolution");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("GetNativeResolution", __LINE__), resolution, sizeof *resolution,
           "Native Resolution");
    return Result(target->GetNativeResolution(*resolution));
}

// A null position is no slip but the request to go home.
int SetPtz(void* channel, _DEWARP_PTZ_POSITION* position) {
    Channel* const target = Handle(channel, "SetPtz");
    if (target == nullptr) {
        return -1;
    }
    if (position == nullptr) {
        return Result(target->ResetPtz());
    }
    Verify(Here("SetPtz", __LINE__), *position);
    return Result(target->SetPtz(*position));
}

int GetPtz(void* channel, _DEWARP_PTZ_POSITION* position) {
    Channel* const target = Handle(channel, "GetPtz");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("GetPtz", __LINE__), position, sizeof *position, "PTZ position");
    return Result(target->GetPtz(*position));
}

int GetPtzRange(void* channel, _DEWARP_PTZ_RANGE* range) {
    Channel* const target = Handle(channel, "GetPtzRange");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("GetPtzRange", __LINE__), range, sizeof *range, "PTZ range");
    return Result(target->GetPtzRange(*range));
}

int CalcPtzPosition(void* channel, int x, int y, float zoom, _DEWARP_PTZ_POSITION* position) {
    Channel* const target = Handle(channel, "CalcPtzPosition");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("CalcPtzPosition", __LINE__), position, sizeof *position, "PTZ position");
    return Result(target->CalcPtzPosition(Vector2d(float(x), float(y)), zoom, *position));
}

int DewarpImage(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped) {
    Channel* const target = Handle(channel, "DewarpImage");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("DewarpImage", __LINE__), warped, SizeOf(warped), "warped image");
    Verify(Here("DewarpImage", __LINE__), *warped);
    Verify(Here("DewarpImage", __LINE__), dewarped, SizeOf(dewarped), "dewarped image");
    Verify(Here("DewarpImage", __LINE__), *dewarped);
    return Result(target->DewarpImage(*warped, *dewarped));
}

int PrepareImage(void* channel, _DEWARP_IMAGE_INFO const* dewarped) {
    Channel* const target = Handle(channel, "PrepareImage");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("PrepareImage", __LINE__), dewarped, 0, "dewarped image");
    Verify(Here("PrepareImage", __LINE__), *dewarped);
    return Result(target->PrepareImage(*dewarped));
}

int DewarpImageRows(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped,
                    size_t first_row, size_t row_count) {
    Channel* const target = Handle(channel, "DewarpImageRows");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("DewarpImageRows", __LINE__), warped, SizeOf(warped), "warped image");
    Verify(Here("DewarpImageRows", __LINE__), *warped);
    Verify(Here("DewarpImageRows", __LINE__), dewarped, SizeOf(dewarped), "dewarped image");
    Verify(Here("DewarpImageRows", __LINE__), *dewarped);
    return Result(target->DewarpImageRows(*warped, *dewarped, first_row, row_count));
}

// The one way a channel ends; a closed handle is not detected and must not come back.
void Close(void* channel) {
    if (channel == nullptr) {
        Log::warn(__LINE__, __FILE__, "Close", "Could not close channel %p\n", channel);
        return;
    }
    delete static_cast<Channel*>(channel);
}

int GetModel(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL* model) {
    Channel* const target = Handle(channel, "GetModel");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("GetModel", __LINE__), model, sizeof *model, "camera model");
    *model = target->GetModel();
    return 0;
}

// The camera gets the default mount, whatever it had.
int SetModel(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL const* model) {
    Channel* const target = Handle(channel, "SetModel");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetModel", __LINE__), model, sizeof *model, "camera model");
    Verify(Here("SetModel", __LINE__), model->type);
    return Result(target->SetModel(*model));
}

// A null handle answers the default mount, which a caller cannot tell from a real one.
int GetMount(void* channel) {
    Channel* const target = Handle(channel, "GetMount");
    if (target == nullptr) {
        return int(Defaults::CameraMount);
    }
    return int(target->GetMount());
}

int SetMount(void* channel, _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    Channel* const target = Handle(channel, "SetMount");
    if (target == nullptr) {
        return -1;
    }
    Verify(Here("SetMount", __LINE__), mount);
    return Result(target->SetMount(mount));
}

// The surface

extern "C" {

int dewarp_set_log(_DEWARP_LOG_SETTINGS const* settings) {
    return Guarded("dewarp_set_log", -1, [&] { return SetLog(settings); });
}

void* dewarp_open(_DEWARP_CHANNEL_SETTINGS const* settings) {
    return Guarded("dewarp_open", static_cast<void*>(nullptr), [&] { return Open(settings); });
}

// Nothing here can throw; the guard is run all the same, as on every call.
int dewarp_channel_valid(void* channel) {
    return BadExceptionHandler::Run([&] { return channel != nullptr ? 0 : -1; });
}

int dewarp_set_view(void* channel, _DEWARP_VIEW view) {
    return Guarded("dewarp_set_view", -1, [&] { return SetView(channel, view); });
}

int dewarp_set_projection(void* channel, _DEWARP_VIEW view, _DEWARP_PROJECTION projection) {
    return Guarded("dewarp_set_projection", -1,
                   [&] { return SetProjection(channel, view, projection); });
}

int dewarp_set_interpolation(void* channel, _DEWARP_INTERPOLATION interpolation) {
    return Guarded("dewarp_set_interpolation", -1,
                   [&] { return SetInterpolation(channel, interpolation); });
}

int dewarp_set_aspect_ratio(void* channel, _DEWARP_ASPECT_RATIO aspect_ratio) {
    return Guarded("dewarp_set_aspect_ratio", -1,
                   [&] { return SetAspectRatio(channel, aspect_ratio); });
}

int dewarp_get_settings(void* channel, _DEWARP_CHANNEL_SETTINGS* settings) {
    return Guarded("dewarp_get_settings", -1, [&] { return GetSettings(channel, settings); });
}

int dewarp_get_native_resolution(void* channel, _DEWARP_RESOLUTION* resolution) {
    return Guarded("dewarp_get_native_resolution", -1,
                   [&] { return GetNativeResolution(channel, resolution); });
}

int dewarp_set_ptz(void* channel, _DEWARP_PTZ_POSITION* position) {
    return Guarded("dewarp_set_ptz", -1, [&] { return SetPtz(channel, position); });
}

int dewarp_get_ptz(void* channel, _DEWARP_PTZ_POSITION* position) {
    return Guarded("dewarp_get_ptz", -1, [&] { return GetPtz(channel, position); });
}

int dewarp_get_ptz_range(void* channel, _DEWARP_PTZ_RANGE* range) {
    return Guarded("dewarp_get_ptz_range", -1, [&] { return GetPtzRange(channel, range); });
}

int dewarp_calc_ptz_position(void* channel, int x, int y, float zoom,
                             _DEWARP_PTZ_POSITION* position) {
    return Guarded("dewarp_calc_ptz_position", -1,
                   [&] { return CalcPtzPosition(channel, x, y, zoom, position); });
}

int dewarp_image(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped) {
    return Guarded("dewarp_image", -1, [&] { return DewarpImage(channel, warped, dewarped); });
}

int dewarp_prepare_image(void* channel, _DEWARP_IMAGE_INFO const* dewarped) {
    return Guarded("dewarp_prepare_image", -1, [&] { return PrepareImage(channel, dewarped); });
}

int dewarp_image_rows(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped,
                      size_t first_row, size_t row_count) {
    return Guarded("dewarp_image_rows", -1, [&] {
        return DewarpImageRows(channel, warped, dewarped, first_row, row_count);
    });
}

// Nothing to answer: a failure is the log line alone.
void dewarp_close(void* channel) {
    Guarded("dewarp_close", 0, [&] {
        Close(channel);
        return 0;
    });
}

void* dewarp_internal_open(_DEWARP_INTERNAL_CAMERA_MODEL const* model,
                           _DEWARP_INTERNAL_CAMERA_MOUNT mount,
                           _DEWARP_CHANNEL_SETTINGS const* settings) {
    return Guarded("dewarp_internal_open", static_cast<void*>(nullptr),
                   [&] { return Open(model, mount, settings); });
}

int dewarp_internal_get_model(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL* model) {
    return Guarded("dewarp_internal_get_model", -1, [&] { return GetModel(channel, model); });
}

int dewarp_internal_set_model(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL const* model) {
    return Guarded("dewarp_internal_set_model", -1, [&] { return SetModel(channel, model); });
}

int dewarp_internal_get_mount(void* channel) {
    return Guarded("dewarp_internal_get_mount", -1, [&] { return GetMount(channel); });
}

int dewarp_internal_set_mount(void* channel, _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return Guarded("dewarp_internal_set_mount", -1, [&] { return SetMount(channel, mount); });
}

}  // extern "C"
