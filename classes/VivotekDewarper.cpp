#include "VivotekDewarper.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "VivotekLibrary.h"

namespace {

constexpr unsigned int LIBRARY_VERSION = 0x30303133;  // "3100" as it lies in memory: 3.1.0.0
constexpr int FORMAT = 0;
constexpr int FALLBACK_LENS = 2;  // "FE8172", for "Default" and any index out of the list
constexpr float MIN_ZOOM = 70.0f;
constexpr float MAX_ZOOM = 1200.0f;

VivotekFunctions const& Api() {
    return VivotekLibraryInstance.Api();
}

// Sub-modes past 3 are not offered to the host; should one be set, it gets the single view.
int32_t DewarpTypeOf(int subMode) {
    switch (subMode) {
        case 2:
            return 1;
        case 3:
            return 2;
        default:
            return 0;
    }
}

// A record that names one field; the library reads nothing else of it.
Fisheye_Option Only(uint32_t flag) {
    Fisheye_Option option{};
    option.flags = flag;
    return option;
}

}  // namespace

VivotekDewarper::VivotekDewarper(DewarpParams_t const& creationParams)
    : IDewarperBaseT(creationParams), handle(nullptr) {
    Clear();
}

VivotekDewarper::~VivotekDewarper() {
    ReleaseHandle();
}

bool VivotekDewarper::Check() {
    // A library that is not open is never called: without it there is no object to make.
    if (!VivotekLibraryInstance.IsOpen()) {
        return false;
    }
    if (handle != nullptr) {
        return true;
    }
    if (Api().Fisheye_Initial(&handle, LIBRARY_VERSION) == 0) {
        return true;
    }
    handle = nullptr;  // whatever a failed call left there is no object; the next Check asks again
    return false;
}

// The library is built anew for each sub-mode: zeroing the input size makes the next input
// request allocate again and so set the new object up.
void VivotekDewarper::SetSubMode(int newSubMode) {
    int const wanted = newSubMode == 0 ? 1 : newSubMode;
    if (wanted == subMode) {
        return;
    }
    subMode = wanted;
    inputWidth = 0;
    inputHeight = 0;
    ReleaseHandle();
}

bool VivotekDewarper::IsSubModeSupported(int candidate) {
    return candidate == 1 || candidate == 2 || (candidate == 3 && params.position != 0);
}

bool VivotekDewarper::IsNormalPTZSupported(int candidate) {
    return candidate == 2 || candidate == 3;
}

// A ceiling or floor panorama turns, so it pans in every sub-mode.
bool VivotekDewarper::CanPan(int) {
    return subMode == 1 || params.position != 0;
}

bool VivotekDewarper::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                           unsigned int* size, int* format) {
    if (!IDewarperBase::GetImageOutputBuffer(width, height, buffer, size, format)) {
        return false;
    }
    return Api().Fisheye_OneFrame(handle) == 0;
}

float VivotekDewarper::AdjustAspectRatio(float, float height) {
    switch (subMode) {
        case 1:
            return height;
        case 2:
            return 16.0f / 9.0f;
        default:
            return 2.0f / 3.0f;
    }
}

void VivotekDewarper::Clear() {
    pan = 0.0f;
    tilt = 0.0f;
    zoom = MIN_ZOOM;
}

// The list is ours, so it needs no library. Nothing fits in a buffer of no bytes; the length is
// still the answer.
int VivotekDewarper::GetLens(int lens, char* buffer, unsigned long size) {
    if (lens < 0 || lens >= VivotekLenses::COUNT) {
        return 0;
    }
    char const* const name = VivotekLenses::LensTypes[lens];
    if (buffer != nullptr && size > 0) {
        std::strncpy(buffer, name, size);
        buffer[size - 1] = '\0';
    }
    return int(std::strlen(name));
}

// The picture circle is taken to fill the frame, centred, whatever the parameters say. Both calls
// are made before either result is looked at.
bool VivotekDewarper::InitOptions() {
    if (!Check()) {
        return false;
    }
    int const lens =
        params.lens >= 1 && params.lens < VivotekLenses::COUNT ? params.lens : FALLBACK_LENS;
    int const named = Api().Fisheye_SetModelName(handle, VivotekLenses::LensTypes[lens]);
    Fisheye_Option setup = Only(FISHEYE_OPTION_SETUP);
    setup.inputWidth = inputWidth;
    setup.inputHeight = inputHeight;
    setup.inputStride = inputWidth;
    setup.inputFormat = FORMAT;
    setup.input = inputBuffer;
    setup.outputWidth = outputWidth;
    setup.outputHeight = outputHeight;
    setup.outputStride = outputWidth;
    setup.outputFormat = FORMAT;
    setup.output = outputBuffer;
    setup.centerX = inputWidth / 2;
    setup.centerY = inputHeight / 2;
    setup.radius = inputHeight / 2;
    setup.mount = params.position;
    setup.dewarpType = DewarpTypeOf(subMode);
    setup.left = 0;
    setup.top = 0;
    setup.width = outputWidth;
    setup.height = outputHeight;
    int const set = Api().Fisheye_SetOption(handle, &setup);
    if (named != 0 || set != 0) {
        inputWidth = 0;  // the next input request starts over
        inputHeight = 0;
        return false;
    }
    UpdatePosition();
    return true;
}

// One field a call, zoom first; the library's answers are not looked at. Without the library's
// object there is nothing to tell: the next setup sends the position anyway.
void VivotekDewarper::UpdatePosition() {
    if (handle == nullptr || !VivotekLibraryInstance.IsOpen()) {
        return;
    }
    Fisheye_Option zoomOption = Only(FISHEYE_OPTION_ZOOM);
    zoomOption.zoom = int32_t(zoom);
    Api().Fisheye_SetOption(handle, &zoomOption);
    Fisheye_Option tiltOption = Only(FISHEYE_OPTION_TILT);
    tiltOption.tilt = tilt;
    Api().Fisheye_SetOption(handle, &tiltOption);
    if (params.position != 0) {
        Fisheye_Option panOption = Only(FISHEYE_OPTION_PAN);
        panOption.pan = pan;
        Api().Fisheye_SetOption(handle, &panOption);
        Fisheye_Option rotationOption = Only(FISHEYE_OPTION_ROTATION);
        rotationOption.rotation = float(params.panoramaOffset);
        Api().Fisheye_SetOption(handle, &rotationOption);
    } else {
        Fisheye_Option wallPanOption = Only(FISHEYE_OPTION_WALL_PAN);
        wallPanOption.wallPan = pan;
        Api().Fisheye_SetOption(handle, &wallPanOption);
    }
}

float VivotekDewarper::GetZoomScaleModifier() {
    return 5.65f;
}

float VivotekDewarper::LimitZoomRange(float value) {
    return std::min(std::max(MIN_ZOOM, value), MAX_ZOOM);
}

// Twelve bits a pixel, counted as the host counts them: signed, the division truncating.
void VivotekDewarper::GetFormatAndSize(int width, int height, unsigned int* size, int* format) {
    *format = FORMAT;
    *size = unsigned(int64_t(width) * int64_t(height) * 3 / 2);
}

// Without the library open its object is gone with it: the handle is only forgotten.
void VivotekDewarper::ReleaseHandle() {
    if (handle != nullptr && VivotekLibraryInstance.IsOpen()) {
        Api().Fisheye_Release(&handle);
    }
    handle = nullptr;
}
