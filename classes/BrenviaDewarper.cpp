#include "BrenviaDewarper.h"

#include <algorithm>
#include <cmath>

#include "vexmap/dewarp.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace {

// The host counts its tilt from a horizon that sits ten times the root of the zoom above the
// engine's; both directions work in double from the single-precision root.
float ToInnerTilt(float tilt, float zoom) {
    return float(double(tilt) - 10.0 * double(std::sqrt(zoom)));
}

float ToHostTilt(float tilt, float zoom) {
    return float(double(tilt) + 10.0 * double(std::sqrt(zoom)));
}

_DEWARP_CHANNEL_SETTINGS SettingsOf(int subMode) {
    _DEWARP_CHANNEL_SETTINGS settings{DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                                      DEWARP_ASPECT_RATIO_STRETCH, DEWARP_INTERPOLATION_0};
    if (subMode == 2) {
        settings.view = DEWARP_VIEW_SINGLE_PANORAMIC;
        settings.projection = DEWARP_PROJECTION_CYLINDRICAL;
    } else if (subMode == 3) {
        settings.view = DEWARP_VIEW_DUAL_PANORAMIC;
        settings.projection = DEWARP_PROJECTION_CYLINDRICAL;
    }
    return settings;
}

_DEWARP_INTERNAL_CAMERA_MOUNT MountOf(int position) {
    switch (position) {
        case 1:
            return DEWARP_INTERNAL_CAMERA_MOUNT_CEILING;
        case 2:
            return DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
        default:
            return DEWARP_INTERNAL_CAMERA_MOUNT_WALL;
    }
}

}  // namespace

BrenviaDewarper::BrenviaDewarper(DewarpParams_t const& creationParams)
    : IDewarperBaseT(creationParams), channel(nullptr), camera() {
    Clear();
}

// The engine answers a null handle with a warning, so no test is needed.
BrenviaDewarper::~BrenviaDewarper() {
    dewarp_close(channel);
}

bool BrenviaDewarper::Check() {
    return true;
}

void BrenviaDewarper::SetSubMode(int newSubMode) {
    int const wanted = newSubMode == 0 ? 1 : newSubMode;
    if (wanted == subMode) {
        return;
    }
    dewarp_close(channel);
    channel = nullptr;
    Clear();
    subMode = wanted;
    optionsDirty = true;
}

bool BrenviaDewarper::IsSubModeSupported(int candidate) {
    return candidate >= 1 && candidate <= 3;
}

bool BrenviaDewarper::IsNormalPTZSupported(int candidate) {
    return candidate == 2 || candidate == 3;
}

void BrenviaDewarper::SetPosition(float newPan, float newTilt, float newZoom) {
    if (newPan == 0.0f && newTilt == 0.0f && newZoom == 0.0f) {
        ResetPosition();
        return;
    }
    IDewarperBase::SetPosition(newPan, ToInnerTilt(newTilt, newZoom), newZoom);
}

void BrenviaDewarper::GetPosition(float& currentPan, float& currentTilt, float& currentZoom) {
    currentPan = pan;
    currentTilt = ToHostTilt(tilt, zoom);
    currentZoom = zoom;
}

bool BrenviaDewarper::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                           unsigned int* size, int* format) {
    if (!IDewarperBase::GetImageOutputBuffer(width, height, buffer, size, format)) {
        return false;
    }
    _DEWARP_IMAGE const input = Frame(inputWidth, inputHeight, inputBuffer);
    _DEWARP_IMAGE output = Frame(*width, *height, outputBuffer);
    return dewarp_image(channel, &input, &output) == 0;
}

_DEWARP_IMAGE BrenviaDewarper::Frame(int width, int height, unsigned char* data) const {
    _DEWARP_IMAGE image{};
    image.info.format = DEWARP_IMAGE_FORMAT_YUV420_PLANAR;
    image.info.width = size_t(unsigned(width));
    image.info.height = size_t(unsigned(height));
    image.info.stride = size_t(unsigned(width));
    image.data = data;
    return image;
}

// A fixed shape by sub-mode and mount; the host's size plays no part.
float BrenviaDewarper::AdjustAspectRatio(float, float) {
    bool const wall = params.position == 0;
    switch (subMode) {
        case 1:
            return 4.0f / 3.0f;
        case 2:
            return wall ? 16.0f / 9.0f : 64.0f / 9.0f;
        default:
            return wall ? 4.0f / 9.0f : 16.0f / 9.0f;
    }
}

void BrenviaDewarper::Clear() {
    pan = 0.0f;
    tilt = 0.0f;
    zoom = 0.5f;
}

// Mode 10 has wider lens angles; it is not registered, so the branch is kept but not reached.
void BrenviaDewarper::SetDewarperType(DewarperType::DewarperTypes newType) {
    type = newType;
    camera = quorvel::vexmap::GetTarvexBrenvia418Camera();
    if (newType == DewarperType::DewarperAxis) {
        camera.diagonal_fov = 284.0f;
        camera.horizontal_fov = 225.0f;
        camera.vertical_fov = 174.0f;
    }
}

// The channel stands while the stream keeps its size; the output size travels with each frame.
// A failed open leaves the handle null, which the next frame's dewarp reports.
bool BrenviaDewarper::InitOptions() {
    if (!Check()) {
        return false;
    }
    bool const same_stream = camera.width == size_t(unsigned(inputWidth)) &&
                             camera.height == size_t(unsigned(inputHeight));
    if (!same_stream || channel == nullptr) {
        if (channel != nullptr) {
            dewarp_close(channel);
            channel = nullptr;
        }
        _DEWARP_CHANNEL_SETTINGS const settings = SettingsOf(subMode);
        camera.width = size_t(unsigned(inputWidth));
        camera.height = size_t(unsigned(inputHeight));
        channel = dewarp_internal_open(&camera, MountOf(params.position), &settings);
    }
    UpdatePosition();
    return true;
}

// The engine limits the position to what the view can show and says so in the record; on a
// ceiling or floor the host keeps its own pan, counted round the whole turn.
void BrenviaDewarper::UpdatePosition() {
    if (subMode != 1) {
        return;
    }
    _DEWARP_PTZ_POSITION position{pan, tilt, 0.0f, zoom};
    dewarp_set_ptz(channel, &position);
    if (params.position == 0) {
        pan = position.pan;
    }
    tilt = position.tilt;
    zoom = position.zoom;
}

float BrenviaDewarper::GetZoomScaleModifier() {
    return 0.0475f;
}

float BrenviaDewarper::LimitZoomRange(float value) {
    return std::min(std::max(0.5f, value), 10.0f);
}

void BrenviaDewarper::GetTiltRange(float& min, float& max, float& step, bool& wrap) {
    IDewarperBase::GetTiltRange(min, max, step, wrap);
    if (channel != nullptr) {
        _DEWARP_PTZ_RANGE range{};
        dewarp_get_ptz_range(channel, &range);
        min = range.tilt_min;
        max = range.tilt_max;
    }
}

// No range is known before the channel opens.
float BrenviaDewarper::LimitTiltRange(float value) {
    if (channel == nullptr) {
        return value;
    }
    return IDewarperBase::LimitTiltRange(value);
}

void BrenviaDewarper::GetFormatAndSize(int width, int height, unsigned int* size, int* format) {
    *format = 0;
    *size = unsigned(width) * unsigned(height) * 3u / 2u;
}
