// Drives every dewarper kind through the interface a host holds, with fuzzed parameters and a
// fuzzed run of calls in the host's order: sub-modes, moves and positions, frames of fuzzed sizes
// and contents (an input request, the decoded frame, the output request), lens and shape queries.
// The vendor kinds run on the stand-ins of their libraries, which the input may tell to fail.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>
#include <string>
#include <vector>

#include <fuzzer/FuzzedDataProvider.h>

#include "DewarperRegistry.h"
#include "fisheyesw_standin.h"
#include "geofisheye_standin.h"
#include "imv1_standin.h"

namespace {

constexpr int MAX_CALLS = 24;
constexpr int MAX_SIDE = 160;  // frames stay small, so that a run goes through many inputs

float Number(FuzzedDataProvider& input) {
    switch (input.ConsumeIntegralInRange(0, 4)) {
        case 0: {
            uint32_t const bits = input.ConsumeIntegral<uint32_t>();
            float value;
            std::memcpy(&value, &bits, sizeof value);
            return value;
        }
        case 1:
            return input.PickValueInArray({0.0f, -0.0f, std::numeric_limits<float>::quiet_NaN(),
                                           std::numeric_limits<float>::infinity(),
                                           -std::numeric_limits<float>::infinity(), 360.0f, -900.0f,
                                           1200.0f, 40000.0f});
        default:
            return input.ConsumeFloatingPointInRange(-4000.0f, 4000.0f);
    }
}

int Small(FuzzedDataProvider& input, int low, int high) {
    // Mostly a value near the range; now and then any 32-bit value.
    if (input.ConsumeIntegralInRange(0, 15) == 0) {
        return input.ConsumeIntegral<int32_t>();
    }
    return input.ConsumeIntegralInRange(low, high);
}

// Tells one call of one stand-in to fail from now on.
void FailOneCall(FuzzedDataProvider& input) {
    int const code = input.ConsumeIntegralInRange(1, 3);
    switch (input.ConsumeIntegralInRange(0, 2)) {
        case 0:
            imv1_standin::SetResult(
                input.PickValueInArray<std::string>(
                    {"SetLens", "SetVideoParams", "SetZoomLimits", "SetPosition", "Update"}),
                code);
            break;
        case 1:
            fisheyesw_standin::SetResult(
                input.PickValueInArray<std::string>({"Fisheye_Initial", "Fisheye_SetModelName",
                                                     "Fisheye_SetOption", "Fisheye_OneFrame"}),
                code);
            break;
        default:
            geofisheye_standin::Fail(
                input.PickValueInArray<std::string>(
                    {"geo_fisheye_create_object", "geo_fisheye_init_object",
                     "geo_fisheye_update_object_image", "geo_fisheye_create_render_result",
                     "geo_fisheye_get_object_controller_info"}),
                input.ConsumeIntegralInRange(0, 3));
            break;
    }
}

// One frame as a host runs it: the input buffer for the decoded size, the frame written into it,
// then the output request.
void RunFrame(FuzzedDataProvider& input, IDewarper& dewarper) {
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = 0;
    int const inputWidth = Small(input, -2, MAX_SIDE);
    int const inputHeight = Small(input, -2, MAX_SIDE);
    if (inputWidth > MAX_SIDE || inputHeight > MAX_SIDE) {
        return;  // the host decodes no frame this large here; the buffer would be all it tests
    }
    if (!dewarper.GetImageInputBuffer(inputWidth, inputHeight, &buffer, &size, &format)) {
        return;
    }
    if (buffer != nullptr) {
        std::memset(buffer, input.ConsumeIntegral<uint8_t>(), size);
    }
    int width = Small(input, -2, MAX_SIDE);
    int height = Small(input, -2, MAX_SIDE);
    if (width > MAX_SIDE || height > MAX_SIDE) {
        return;
    }
    unsigned char* output = nullptr;
    if (dewarper.GetImageOutputBuffer(&width, &height, &output, &size, &format) && size > 0) {
        // The host reads the whole picture it was given.
        unsigned char volatile last = output[size - 1];
        (void)last;
    }
}

void RunCall(FuzzedDataProvider& input, IDewarper& dewarper) {
    switch (input.ConsumeIntegralInRange(0, 9)) {
        case 0:
            dewarper.SetSubMode(Small(input, -1, 4));
            break;
        case 1:
            dewarper.Pan(Small(input, -3, 3), Small(input, -1, 10));
            break;
        case 2:
            dewarper.Tilt(Small(input, -3, 3), Small(input, -1, 10));
            break;
        case 3:
            dewarper.Zoom(Small(input, -3, 3), Small(input, -1, 10));
            break;
        case 4:
            dewarper.SetPosition(Number(input), Number(input), Number(input));
            break;
        case 5: {
            char name[16];
            std::memset(name, 'x', sizeof name);
            dewarper.GetLens(Small(input, -2, 9), name,
                             input.ConsumeIntegralInRange<unsigned long>(0, sizeof name));
            break;
        }
        case 6: {
            int const subMode = Small(input, -1, 4);
            dewarper.IsSubModeSupported(subMode);
            dewarper.IsNormalPTZSupported(subMode);
            dewarper.CanPan(subMode);
            dewarper.CanTilt(subMode);
            dewarper.CanZoom(subMode);
            dewarper.AdjustAspectRatio(Number(input), Number(input));
            float pan = 0;
            float tilt = 0;
            float zoom = 0;
            dewarper.GetPosition(pan, tilt, zoom);
            break;
        }
        case 7:
            dewarper.Clear();
            break;
        case 8:
            FailOneCall(input);
            break;
        default:
            RunFrame(input, dewarper);
            break;
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, std::size_t size) {
    FuzzedDataProvider input(data, size);
    imv1_standin::Reset();
    fisheyesw_standin::Reset();
    geofisheye_standin::Reset();
    int const mode = input.PickValueInArray({1, 2, 3, 7, 8, 9});
    DewarpParams_t params;
    params.lens = Small(input, -2, 9);
    params.position = Small(input, -1, 3);
    params.panoramaOffset = Small(input, -360, 360);
    params.circleX = Small(input, -2, MAX_SIDE);
    params.circleY = Small(input, -2, MAX_SIDE);
    params.circleRadius = Small(input, -2, MAX_SIDE);
    IDewarper* const dewarper = DewarperRegistryInstance.LoadAndCreate(mode, params);
    if (dewarper == nullptr) {
        return 0;
    }
    int const calls = input.ConsumeIntegralInRange(0, MAX_CALLS);
    for (int call = 0; call < calls && input.remaining_bytes() > 0; ++call) {
        RunCall(input, *dewarper);
    }
    DeleteDewarper(dewarper);
    return 0;
}
