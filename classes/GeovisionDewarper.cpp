#include "GeovisionDewarper.h"

#include <algorithm>
#include <cmath>
#include <cstdint>

#include "GeoFisheyeDLL.h"
#include "IFishEye.h"

namespace {

constexpr int CLOSED = -1;
constexpr int CHANNEL = 0;  // the one channel of a dewarper's adapter
constexpr int DUAL_PANORAMA = 3;
constexpr int WALL = 0;
constexpr int FLOOR = 2;
constexpr unsigned short FRAME = 1;  // the frame of the PTZ view

// The dual panorama is the SDK's view mode 4; everything else is its single view, 8.
unsigned short ViewModeOf(int subMode) {
    return subMode == DUAL_PANORAMA ? 4 : 8;
}

// The SDK numbers mounts 0 ceiling, 1 wall, 2 floor.
unsigned short MountOf(int position) {
    if (position == FLOOR) {
        return 2;
    }
    return position == WALL ? 1 : 0;
}

// Positions are limited to -900 to 3600 and zoom to 800 before they get here; saturation only
// keeps a value that never comes from turning into an undefined conversion.
short ToShort(float value) {
    if (std::isnan(value)) {
        return 0;
    }
    return short(int(std::min(std::max(value, -32768.0f), 32767.0f)));
}

// Shrinks a request that does not fit into the input, keeping its shape: the side that sticks
// out further takes the input's size and the other follows by integer division. An empty or
// negative request is left to the base step.
void FitInto(int& width, int& height, int limitWidth, int limitHeight) {
    if ((width <= limitWidth && height <= limitHeight) || width <= 0 || height <= 0) {
        return;
    }
    if (float(width) / float(height) > float(limitWidth) / float(limitHeight)) {
        height = int(int64_t(height) * limitWidth / width);
        width = limitWidth;
    } else {
        width = int(int64_t(width) * limitHeight / height);
        height = limitHeight;
    }
}

}  // namespace

GeovisionDewarper::GeovisionDewarper(DewarpParams_t const& creationParams)
    : IDewarperBaseT(creationParams), fishEye(nullptr), fishEyeChannel(CLOSED), firstFrame(true) {
    Clear();
}

GeovisionDewarper::~GeovisionDewarper() {
    if (fishEyeChannel != CLOSED && fishEye != nullptr) {
        fishEye->GvFE_Close(fishEyeChannel);
    }
    fishEyeChannel = CLOSED;
    IFishEye_Release(fishEye);
    fishEye = nullptr;
}

// With libgeofisheye absent no adapter is made, so nothing ever calls into it.
bool GeovisionDewarper::Check() {
    if (fishEye == nullptr) {
        fishEye = IFishEye_Create();
    }
    return fishEye != nullptr;
}

void GeovisionDewarper::SetSubMode(int newSubMode) {
    int const wanted = newSubMode == 0 ? 1 : newSubMode;
    if (wanted == subMode) {
        return;
    }
    Clear();
    subMode = wanted;
    optionsDirty = true;
}

// There is no panorama here.
bool GeovisionDewarper::IsSubModeSupported(int candidate) {
    return candidate == 1 || (candidate == DUAL_PANORAMA && params.position != WALL);
}

bool GeovisionDewarper::IsNormalPTZSupported(int candidate) {
    return candidate == 2 || candidate == 3;
}

bool GeovisionDewarper::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                             unsigned int* size, int* format) {
    if (width != nullptr && height != nullptr) {
        FitInto(*width, *height, inputWidth, inputHeight);
        if (*height > 0) {
            *height -= *height % 4;
        }
    }
    if (!IDewarperBase::GetImageOutputBuffer(width, height, buffer, size, format)) {
        return false;
    }
    if (fishEyeChannel == CLOSED || fishEye == nullptr) {
        return false;
    }
    // The first frame after a setup goes to the adapter twice on purpose; a failure of either
    // call leaves it the first.
    int const feeds = firstFrame ? 2 : 1;
    for (int feed = 0; feed < feeds; ++feed) {
        if (fishEye->GvFE_VideoInput(fishEyeChannel, inputBuffer, outputBuffer, inputWidth,
                                     inputHeight, FE_FORMAT_RGB24, false) != 0) {
            return false;
        }
    }
    firstFrame = false;
    return true;
}

float GeovisionDewarper::AdjustAspectRatio(float, float height) {
    return subMode == 1 ? height : 16.0f / 9.0f;
}

void GeovisionDewarper::Clear() {
    pan = 0.0f;
    tilt = 0.0f;
    zoom = 20.0f;
}

// The adapter is rebuilt at every setup, so the library starts each stream from a clean object.
// The circle is taken as centred and filling the frame.
bool GeovisionDewarper::InitOptions() {
    if (fishEyeChannel != CLOSED) {
        if (!Check()) {
            return false;
        }
        fishEye->GvFE_Close(fishEyeChannel);
        fishEyeChannel = CLOSED;
        IFishEye_Release(fishEye);
        fishEye = nullptr;
    }
    if (!Check()) {
        return false;
    }
    if (fishEye->GvFE_Initialize(CHANNEL, inputWidth, inputHeight, outputWidth, outputHeight,
                                 FE_FORMAT_RGB24) != 0) {
        return false;
    }
    fishEyeChannel = CHANNEL;
    firstFrame = true;
    FE_CurPosParams position{};
    position.viewMode = ViewModeOf(subMode);
    position.mountType = MountOf(params.position);
    position.centerY = uint16_t(inputHeight / 2);
    position.centerX = uint16_t(inputWidth / 2);
    position.radius = uint16_t(std::min(inputWidth, inputHeight) / 2);
    position.radius2 = position.radius;
    fishEye->GvFESetPosition(fishEyeChannel, &position);
    UpdatePosition();
    return true;
}

// Only the single view has a position; the panorama cannot be moved.
void GeovisionDewarper::UpdatePosition() {
    if (subMode != 1 || fishEye == nullptr) {
        return;
    }
    fishEye->SetAbsolutePTZ(fishEyeChannel, ToShort(pan), ToShort(tilt), ToShort(zoom), FRAME);
}

float GeovisionDewarper::GetZoomScaleModifier() {
    return 4.0f;
}

float GeovisionDewarper::LimitZoomRange(float value) {
    return std::min(std::max(0.0f, value), 800.0f);
}

bool GeovisionDewarper::InvertPan() {
    return params.position == FLOOR;
}

bool GeovisionDewarper::InvertTilt() {
    return params.position == WALL;
}

// The base ranges in tenths of a degree. The step stays in degrees, so one step of Pan or Tilt
// moves 2 units, that is 0.2 degrees.
void GeovisionDewarper::GetPanRange(float& min, float& max, float& step, bool& wrap) {
    IDewarperBase::GetPanRange(min, max, step, wrap);
    min *= 10.0f;
    max *= 10.0f;
}

void GeovisionDewarper::GetTiltRange(float& min, float& max, float& step, bool& wrap) {
    IDewarperBase::GetTiltRange(min, max, step, wrap);
    min *= 10.0f;
    max *= 10.0f;
}

void GeovisionDewarper::GetInputFormatAndSize(int width, int height, unsigned int* size,
                                              int* format) {
    *format = 3;
    *size = unsigned(width) * unsigned(height) * 3u;
}

void GeovisionDewarper::GetOutputFormatAndSize(int width, int height, unsigned int* size,
                                               int* format) {
    *format = 6;
    *size = unsigned(width) * unsigned(height) * 4u;
}
