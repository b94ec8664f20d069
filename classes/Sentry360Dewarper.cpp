#include "Sentry360Dewarper.h"

#include <algorithm>
#include <new>

#include "ImageProcessor.h"

namespace {

constexpr int PANORAMA = 2;
constexpr int BITS_PER_PIXEL = 24;
constexpr int BYTES_PER_PIXEL = 3;
constexpr int MAP_REPLAY_BLENDS = 2;  // nearest on a new map, blended on its replay

constexpr Sentry360Dewarper::AxisRange WALL_RANGE{-90.0f, 90.0f, 180.0f, false};
constexpr Sentry360Dewarper::AxisRange HALF_TURN_EACH_WAY{-180.0f, 180.0f, 360.0f, true};
constexpr Sentry360Dewarper::AxisRange UPPER_QUARTER{0.0f, 90.0f, 90.0f, false};

void PointAt(ImageData& record, unsigned char* buffer, int width, int height) {
    record.DeleteData();
    record.Width = width;
    record.Height = height;
    record.Stride = width * BYTES_PER_PIXEL;
    record.BitsPerPixel = BITS_PER_PIXEL;
    record.Data = buffer;
    record.OwnsData = false;
}

}  // namespace

Sentry360Dewarper::Sentry360Dewarper(DewarpParams_t const& creationParams)
    : IDewarperBaseT(creationParams), processor(nullptr) {
    Clear();
}

Sentry360Dewarper::~Sentry360Dewarper() {
    delete processor;
    processor = nullptr;
}

bool Sentry360Dewarper::Check() {
    if (processor == nullptr) {
        try {
            processor = new ImageProcessor;
        } catch (std::bad_alloc const&) {
            processor = nullptr;  // no exception may leave the library; the next frame retries
        }
    }
    return processor != nullptr;
}

// Zeroing the input size makes the next GetImageInputBuffer allocate again and so set the
// backend up anew.
void Sentry360Dewarper::SetSubMode(int newSubMode) {
    int const wanted = newSubMode == 0 ? 1 : newSubMode;
    if (wanted == subMode) {
        return;
    }
    subMode = wanted;
    inputWidth = 0;
    inputHeight = 0;
    Clear();
}

bool Sentry360Dewarper::IsSubModeSupported(int candidate) {
    return candidate == 1 || candidate == PANORAMA;
}

bool Sentry360Dewarper::IsNormalPTZSupported(int candidate) {
    return candidate == 2 || candidate == 3;
}

bool Sentry360Dewarper::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                             unsigned int* size, int* format) {
    if (subMode == PANORAMA && width != nullptr && height != nullptr) {
        *width = inputWidth / 2;
        *height = inputHeight / 2;
    }
    if (!IDewarperBase::GetImageOutputBuffer(width, height, buffer, size, format)) {
        return false;
    }
    if (subMode == PANORAMA) {
        processor->ProcessPanoramaImage();
    } else {
        processor->ProcessImage();
    }
    return true;
}

float Sentry360Dewarper::AdjustAspectRatio(float, float height) {
    return subMode == PANORAMA ? 16.0f / 9.0f : height;
}

void Sentry360Dewarper::Clear() {
    pan = 0.0f;
    tilt = 0.0f;
    zoom = 0.7f;
}

// Both outputs of the processor point at the one output buffer; only the one of the sub-mode is
// drawn. A failed allocation of the maps drops the processor and marks the options dirty, so the
// next frame starts from a clean processor instead of half-sized maps.
bool Sentry360Dewarper::InitOptions() {
    if (!Check()) {
        return false;
    }
    ImageProcessorParams setup;
    setup.InputWidth = inputWidth;
    setup.InputHeight = inputHeight;
    setup.InputStride = inputWidth * BYTES_PER_PIXEL;
    setup.InputBits = BITS_PER_PIXEL;
    setup.CircleX = params.circleX;
    setup.CircleY = params.circleY;
    setup.CircleRadius = params.circleRadius;
    setup.OutputWidth = outputWidth;
    setup.OutputHeight = outputHeight;
    setup.OutputStride = outputWidth * BYTES_PER_PIXEL;
    setup.CacheOutput = true;
    setup.OutputInterpolation = MAP_REPLAY_BLENDS;
    setup.FlipOutput = params.position == 2;
    setup.PanoramaWidth = outputWidth;
    setup.PanoramaHeight = outputHeight;
    setup.PanoramaStride = outputWidth * BYTES_PER_PIXEL;
    setup.CachePanorama = true;
    setup.PanoramaInterpolation = MAP_REPLAY_BLENDS;
    setup.FlipPanorama = params.position == 2;
    try {
        processor->SetParameters(setup);
    } catch (std::bad_alloc const&) {
        delete processor;
        processor = nullptr;
        optionsDirty = true;
        return false;
    }
    PointAt(processor->Input(), inputBuffer, inputWidth, inputHeight);
    PointAt(processor->PtzOutput(), outputBuffer, outputWidth, outputHeight);
    PointAt(processor->PanoramaOutput(), outputBuffer, outputWidth, outputHeight);
    UpdatePosition();
    return true;
}

void Sentry360Dewarper::UpdatePosition() {
    if (Check()) {
        processor->SetPanTiltZoom(double(pan), double(tilt), double(zoom));
    }
}

float Sentry360Dewarper::GetZoomScaleModifier() {
    return 0.05f;
}

// No upper limit on purpose: the processor takes any positive zoom.
float Sentry360Dewarper::LimitZoomRange(float value) {
    return std::max(0.7f, value);
}

bool Sentry360Dewarper::InvertPan() {
    return params.position == 2;
}

bool Sentry360Dewarper::InvertTilt() {
    return params.position == 2;
}

// The processor takes pan from -180 to 180 and aborts on anything else, so these ranges keep
// every value inside its limits.
void Sentry360Dewarper::GetPanRange(float& min, float& max, float& step, bool& wrap) {
    Report(params.position == 0 ? WALL_RANGE : HALF_TURN_EACH_WAY, min, max, step, wrap);
}

void Sentry360Dewarper::GetTiltRange(float& min, float& max, float& step, bool& wrap) {
    Report(params.position == 0 ? WALL_RANGE : UPPER_QUARTER, min, max, step, wrap);
}
