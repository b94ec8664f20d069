#include "IDewarperBase.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <new>

namespace {

// The widest format has 4 bytes a pixel, sizes travel as 32-bit unsigned counts and backends
// count the bytes of a row in an int, so a frame beyond that is refused rather than wrapped.
bool FrameFits(int64_t width, int64_t height) {
    return width >= 0 && height >= 0 && width * 4 <= std::numeric_limits<int>::max() &&
           uint64_t(width) * uint64_t(height) * 4u <= std::numeric_limits<unsigned int>::max();
}

// A new buffer starts black, so a frame that writes nothing never shows stale heap memory.
unsigned char* AllocateZeroed(unsigned int size) {
    return new (std::nothrow) unsigned char[size]();
}

int Sign(int value) {
    return (value > 0) - (value < 0);
}

// `sign(direction) * (speed + 1)` steps; widened so that the largest speed cannot overflow.
float StepCount(int direction, int speed) {
    return float(int64_t(Sign(direction)) * (int64_t(speed) + 1));
}

// Truncation towards zero that saturates instead of overflowing.
int64_t TruncateSaturated(float value) {
    constexpr float LIMIT = 9.0e18f;
    if (!(value > -LIMIT)) {
        return -int64_t(LIMIT);
    }
    return value < LIMIT ? int64_t(value) : int64_t(LIMIT);
}

// The distance of one step: a fifth of a unit on every range whose span equals its step.
float StepSize(IDewarperBase::AxisRange const& range) {
    return (range.max - range.min) / (range.step / 0.2f);
}

// Wraps a value into [min, max) when the axis turns round, then clamps it; NaN ends at `min`.
float LimitToRange(float value, IDewarperBase::AxisRange const& range) {
    if (range.wrap) {
        float const span = range.max - range.min;
        int64_t const whole_span = TruncateSaturated(span);
        if (value < range.min && whole_span != 0) {
            int64_t const turns = TruncateSaturated(range.min - value) / whole_span + 1;
            value += float(turns) * span;
        }
        value = std::fmod(value - range.min, span) + range.min;
    }
    return std::min(std::max(range.min, value), range.max);
}

constexpr IDewarperBase::AxisRange WALL_RANGE{-90.0f, 90.0f, 180.0f, false};
constexpr IDewarperBase::AxisRange FULL_TURN{0.0f, 360.0f, 360.0f, true};
constexpr IDewarperBase::AxisRange UPPER_QUARTER{0.0f, 90.0f, 90.0f, false};
constexpr IDewarperBase::AxisRange LOWER_QUARTER{-90.0f, 0.0f, 90.0f, false};

}  // namespace

IDewarperBase::IDewarperBase(DewarpParams_t const& creationParams)
    : params(creationParams),
      type(DewarperType::DewarperNone),
      inputWidth(0),
      inputHeight(0),
      outputWidth(0),
      outputHeight(0),
      subMode(1),
      optionsDirty(true),
      pan(0.0f),
      tilt(0.0f),
      zoom(0.0f),
      inputBuffer(nullptr),
      outputBuffer(nullptr) {}

IDewarperBase::~IDewarperBase() {
    delete[] inputBuffer;
    delete[] outputBuffer;
}

int IDewarperBase::SubMode() {
    return subMode;
}

void IDewarperBase::SetSubMode(int) {}

bool IDewarperBase::IsSubModeSupported(int) {
    return false;
}

bool IDewarperBase::IsNormalPTZSupported(int) {
    return false;
}

// The argument is not looked at: what counts is the current sub-mode.
bool IDewarperBase::CanPan(int) {
    return subMode == 1;
}

bool IDewarperBase::CanTilt(int) {
    return subMode == 1;
}

bool IDewarperBase::CanZoom(int) {
    return subMode == 1;
}

// One step is 0.2 units on every range whose span equals its step.
void IDewarperBase::Pan(int direction, int speed) {
    float const delta = StepCount(direction, speed) * StepSize(PanRange());
    pan += InvertPan() ? -delta : delta;
    LimitAndUpdatePosition();
}

// A positive direction lowers tilt: the opposite sign of Pan is intended.
void IDewarperBase::Tilt(int direction, int speed) {
    float const delta = -StepCount(direction, speed) * StepSize(TiltRange());
    tilt += InvertTilt() ? -delta : delta;
    LimitAndUpdatePosition();
}

void IDewarperBase::Zoom(int direction, int speed) {
    zoom += StepCount(direction, speed) * GetZoomScaleModifier();
    LimitAndUpdatePosition();
}

void IDewarperBase::SetPosition(float newPan, float newTilt, float newZoom) {
    if (newPan == 0.0f && newTilt == 0.0f && newZoom == 0.0f) {
        ResetPosition();
        return;
    }
    pan = newPan;
    tilt = newTilt;
    zoom = newZoom;
    LimitAndUpdatePosition();
}

void IDewarperBase::GetPosition(float& currentPan, float& currentTilt, float& currentZoom) {
    currentPan = pan;
    currentTilt = tilt;
    currentZoom = zoom;
}

bool IDewarperBase::GetImageInputBuffer(int width, int height, unsigned char** buffer,
                                        unsigned int* size, int* format) {
    if (!Check()) {
        return false;
    }
    if (buffer == nullptr || size == nullptr || format == nullptr || !FrameFits(width, height)) {
        return false;
    }
    GetInputFormatAndSize(width, height, size, format);
    if (inputBuffer == nullptr || width != inputWidth || height != inputHeight) {
        unsigned char* const replacement = AllocateZeroed(*size);
        if (replacement == nullptr) {
            return false;
        }
        optionsDirty = true;
        delete[] inputBuffer;
        inputBuffer = replacement;
        inputWidth = width;
        inputHeight = height;
    }
    *buffer = inputBuffer;
    return true;
}

bool IDewarperBase::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                         unsigned int* size, int* format) {
    if (!Check()) {
        return false;
    }
    if (width == nullptr || height == nullptr || buffer == nullptr || size == nullptr ||
        format == nullptr) {
        return false;
    }
    if (*width < 0 || *height < 0) {
        return false;
    }
    int64_t const rounded_width = (int64_t(*width) + 7) / 8 * 8;
    int64_t const rounded_height = int64_t(*height) + (*height & 1);
    if (!FrameFits(rounded_width, rounded_height)) {
        return false;
    }
    *width = int(rounded_width);
    *height = int(rounded_height);
    GetOutputFormatAndSize(*width, *height, size, format);
    if (outputBuffer == nullptr || *width != outputWidth || *height != outputHeight) {
        unsigned char* const replacement = AllocateZeroed(*size);
        if (replacement == nullptr) {
            return false;
        }
        optionsDirty = true;
        delete[] outputBuffer;
        outputBuffer = replacement;
        outputWidth = *width;
        outputHeight = *height;
    }
    *buffer = outputBuffer;
    // The flag stays clear after a failed setup: each class retries its backend by its own means.
    if (optionsDirty) {
        optionsDirty = false;
        if (!InitOptions()) {
            return false;
        }
    }
    return true;
}

bool IDewarperBase::GetNeedsRotation() {
    return false;
}

bool IDewarperBase::GetFlipVertical() {
    return false;
}

bool IDewarperBase::GetFlipHorizontal() {
    return false;
}

float IDewarperBase::AdjustAspectRatio(float, float height) {
    return height;
}

DewarpParams_t* IDewarperBase::Parameters() {
    return &params;
}

int IDewarperBase::GetLens(int, char*, unsigned long) {
    return 0;
}

void IDewarperBase::SetDewarperType(DewarperType::DewarperTypes newType) {
    type = newType;
}

bool IDewarperBase::InitOptions() {
    return Check();
}

float IDewarperBase::GetZoomScaleModifier() {
    return 1.0f;
}

float IDewarperBase::LimitZoomRange(float value) {
    return std::min(std::max(0.0f, value), 200.0f);
}

bool IDewarperBase::InvertPan() {
    return false;
}

bool IDewarperBase::InvertTilt() {
    return false;
}

void IDewarperBase::Report(AxisRange const& range, float& min, float& max, float& step,
                           bool& wrap) {
    min = range.min;
    max = range.max;
    step = range.step;
    wrap = range.wrap;
}

void IDewarperBase::GetPanRange(float& min, float& max, float& step, bool& wrap) {
    Report(params.position == 0 ? WALL_RANGE : FULL_TURN, min, max, step, wrap);
}

void IDewarperBase::GetTiltRange(float& min, float& max, float& step, bool& wrap) {
    AxisRange const& range = params.position == 0   ? WALL_RANGE
                             : params.position == 2 ? LOWER_QUARTER
                                                    : UPPER_QUARTER;
    Report(range, min, max, step, wrap);
}

float IDewarperBase::LimitPanRange(float value) {
    return LimitToRange(value, PanRange());
}

float IDewarperBase::LimitTiltRange(float value) {
    return LimitToRange(value, TiltRange());
}

void IDewarperBase::GetFormatAndSize(int width, int height, unsigned int* size, int* format) {
    *format = 3;
    *size = unsigned(width) * unsigned(height) * 3u;
}

void IDewarperBase::GetInputFormatAndSize(int width, int height, unsigned int* size, int* format) {
    GetFormatAndSize(width, height, size, format);
}

void IDewarperBase::GetOutputFormatAndSize(int width, int height, unsigned int* size, int* format) {
    GetFormatAndSize(width, height, size, format);
}

void IDewarperBase::ResetPosition() {
    Clear();
    SetSubMode(1);
    if (pan != 0.0f || tilt != 0.0f || zoom != 0.0f) {
        SetPosition(pan, tilt, zoom);
    } else {
        LimitAndUpdatePosition();
    }
}

IDewarperBase::AxisRange IDewarperBase::PanRange() {
    AxisRange range{};
    GetPanRange(range.min, range.max, range.step, range.wrap);
    return range;
}

IDewarperBase::AxisRange IDewarperBase::TiltRange() {
    AxisRange range{};
    GetTiltRange(range.min, range.max, range.step, range.wrap);
    return range;
}

void IDewarperBase::LimitAndUpdatePosition() {
    pan = LimitPanRange(pan);
    tilt = LimitTiltRange(tilt);
    zoom = LimitZoomRange(zoom);
    if (!optionsDirty) {
        UpdatePosition();
    }
}
