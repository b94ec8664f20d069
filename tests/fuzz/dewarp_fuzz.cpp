// Drives the engine's call surface with fuzzed calls: a log setting, an open call with a fuzzed
// model, mount and settings, then a run of configuration, position and frame calls on that handle,
// and the close. Every input stands alone: the log is set again and the channel closed each time.

#include <algorithm>
#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <limits>
#include <vector>

#include <fuzzer/FuzzedDataProvider.h>

#include "vexmap/dewarp.h"

namespace {

// A frame's buffer is allocated to the size its record describes; a record that describes more
// than this is handed over without pixels, which the checks must refuse before any access.
constexpr std::size_t FRAME_CAP = 192 * 1024;
constexpr int MAX_CALLS = 24;

// Every line is expanded, so that a format whose arguments do not match shows under the
// sanitizers, and then dropped.
void ExpandAndDrop(char const* format, va_list arguments) {
    char line[1024];
    std::vsnprintf(line, sizeof line, format, arguments);
}

template <typename Enumeration>
Enumeration Pick(FuzzedDataProvider& input, int count) {
    // Mostly a value near the range, one past it included; now and then any 32-bit value.
    if (input.ConsumeIntegralInRange(0, 7) == 0) {
        return static_cast<Enumeration>(input.ConsumeIntegral<int32_t>());
    }
    return static_cast<Enumeration>(input.ConsumeIntegralInRange(-1, count));
}

float Number(FuzzedDataProvider& input, float low, float high) {
    switch (input.ConsumeIntegralInRange(0, 5)) {
        case 0: {
            uint32_t const bits = input.ConsumeIntegral<uint32_t>();
            float value;
            std::memcpy(&value, &bits, sizeof value);
            return value;
        }
        case 1:
            return input.PickValueInArray({0.0f, -0.0f, std::numeric_limits<float>::quiet_NaN(),
                                           std::numeric_limits<float>::infinity(),
                                           -std::numeric_limits<float>::infinity(),
                                           std::numeric_limits<float>::denorm_min(),
                                           std::numeric_limits<float>::max(), 180.0f, 360.0f});
        default:
            return input.ConsumeFloatingPointInRange(low, high);
    }
}

std::size_t Count(FuzzedDataProvider& input, std::size_t usual) {
    if (input.ConsumeIntegralInRange(0, 15) == 0) {
        return input.ConsumeIntegral<std::size_t>();
    }
    return input.ConsumeIntegralInRange<std::size_t>(0, usual);
}

_DEWARP_INTERNAL_CAMERA_MODEL Model(FuzzedDataProvider& input) {
    _DEWARP_INTERNAL_CAMERA_MODEL model;
    model.type = Pick<_DEWARP_INTERNAL_CAMERA_TYPE>(input, 2);
    model.diagonal_fov = Number(input, 1.0f, 360.0f);
    model.horizontal_fov = Number(input, 1.0f, 360.0f);
    model.vertical_fov = Number(input, 1.0f, 360.0f);
    model.width = Count(input, 4096);
    model.height = Count(input, 4096);
    return model;
}

_DEWARP_CHANNEL_SETTINGS Settings(FuzzedDataProvider& input) {
    _DEWARP_CHANNEL_SETTINGS settings;
    settings.view = Pick<_DEWARP_VIEW>(input, 4);
    settings.projection = Pick<_DEWARP_PROJECTION>(input, 9);
    settings.aspect_ratio = Pick<_DEWARP_ASPECT_RATIO>(input, 4);
    settings.interpolation = Pick<_DEWARP_INTERPOLATION>(input, 3);
    return settings;
}

_DEWARP_PTZ_POSITION Position(FuzzedDataProvider& input) {
    _DEWARP_PTZ_POSITION position;
    position.pan = Number(input, -400.0f, 400.0f);
    position.tilt = Number(input, -400.0f, 400.0f);
    position.roll = Number(input, -400.0f, 400.0f);
    position.zoom = Number(input, -1.0f, 16.0f);
    return position;
}

// The bytes the engine's layout of a format puts in a frame: the luma plane or packed rows, then
// each chroma plane at the offset the remap gives it. None for a format it does not know.
std::size_t LayoutBytes(_DEWARP_IMAGE_FORMAT format, std::size_t samples) {
    switch (format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return samples * 4;
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
            return samples * 2;
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            return samples + 2 * (samples >> 1);
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            return samples + 2 * (samples >> 2);
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return samples + 2 * (samples >> 4);
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return samples + (samples >> 1);
    }
    return 0;
}

/// A frame record and its buffer, or no buffer where the record describes more than the cap.
class Frame {
public:
    // The remap writes the output in the layout of the source's format, whatever the output's
    // record says, so the output is sized for both.
    Frame(FuzzedDataProvider& input, _DEWARP_IMAGE_FORMAT format, _DEWARP_IMAGE_FORMAT written_as) {
        image.info.format = format;
        image.info.width = Count(input, 160);
        image.info.height = Count(input, 120);
        // Mostly a stride at or a little beyond the width; sometimes anything.
        image.info.stride =
            input.ConsumeIntegralInRange(0, 7) == 0
                ? Count(input, 200)
                : image.info.width + input.ConsumeIntegralInRange<std::size_t>(0, 9);
        image.data = nullptr;
        bool const too_large =
            image.info.stride != 0 &&
            image.info.height > FRAME_CAP / image.info.stride;  // the product would pass the cap
        std::size_t const samples = too_large ? 0 : image.info.height * image.info.stride;
        std::size_t size = std::max(LayoutBytes(format, samples), LayoutBytes(written_as, samples));
        if (!too_large && size <= FRAME_CAP && input.ConsumeIntegralInRange(0, 31) != 0) {
            pixels.resize(std::max<std::size_t>(size, 1));
            for (std::size_t index = 0; index < pixels.size(); ++index) {
                pixels[index] = static_cast<unsigned char>(index * 7 + index / 13);
            }
            image.data = pixels.data();
        }
    }

    _DEWARP_IMAGE* Get() { return &image; }

private:
    _DEWARP_IMAGE image;
    std::vector<unsigned char> pixels;
};

void* Open(FuzzedDataProvider& input) {
    _DEWARP_INTERNAL_CAMERA_MODEL const model = Model(input);
    _DEWARP_CHANNEL_SETTINGS const settings = Settings(input);
    bool const with_settings = input.ConsumeBool();
    switch (input.ConsumeIntegralInRange(0, 3)) {
        case 0:
            return dewarp_open(with_settings ? &settings : nullptr);
        case 1:
            return dewarp_internal_open(nullptr, Pick<_DEWARP_INTERNAL_CAMERA_MOUNT>(input, 4),
                                        with_settings ? &settings : nullptr);
        default:
            return dewarp_internal_open(&model, Pick<_DEWARP_INTERNAL_CAMERA_MOUNT>(input, 4),
                                        with_settings ? &settings : nullptr);
    }
}

void Call(FuzzedDataProvider& input, void* channel) {
    // A record pointer is null now and then, to take the pointer checks.
    bool const null_record = input.ConsumeIntegralInRange(0, 15) == 0;
    switch (input.ConsumeIntegralInRange(0, 18)) {
        case 0:
            dewarp_set_view(channel, Pick<_DEWARP_VIEW>(input, 4));
            break;
        case 1: {
            _DEWARP_VIEW const view = Pick<_DEWARP_VIEW>(input, 4);
            dewarp_set_projection(channel, view, Pick<_DEWARP_PROJECTION>(input, 9));
            break;
        }
        case 2:
            dewarp_set_interpolation(channel, Pick<_DEWARP_INTERPOLATION>(input, 3));
            break;
        case 3:
            dewarp_set_aspect_ratio(channel, Pick<_DEWARP_ASPECT_RATIO>(input, 4));
            break;
        case 4: {
            _DEWARP_CHANNEL_SETTINGS settings;
            dewarp_get_settings(channel, null_record ? nullptr : &settings);
            break;
        }
        case 5: {
            _DEWARP_RESOLUTION resolution;
            dewarp_get_native_resolution(channel, null_record ? nullptr : &resolution);
            break;
        }
        case 6: {
            _DEWARP_PTZ_POSITION position = Position(input);
            dewarp_set_ptz(channel, null_record ? nullptr : &position);
            break;
        }
        case 7: {
            _DEWARP_PTZ_POSITION position;
            dewarp_get_ptz(channel, null_record ? nullptr : &position);
            break;
        }
        case 8: {
            _DEWARP_PTZ_RANGE range;
            dewarp_get_ptz_range(channel, null_record ? nullptr : &range);
            break;
        }
        case 9: {
            int const x = input.ConsumeIntegral<int>();
            int const y = input.ConsumeIntegral<int>();
            float const zoom = Number(input, -1.0f, 16.0f);
            _DEWARP_PTZ_POSITION position;
            dewarp_calc_ptz_position(channel, x, y, zoom, null_record ? nullptr : &position);
            break;
        }
        case 10:
        case 11: {
            _DEWARP_IMAGE_FORMAT const format = Pick<_DEWARP_IMAGE_FORMAT>(input, 7);
            // The output's own format is mostly the source's, as a caller's would be.
            _DEWARP_IMAGE_FORMAT const output_format = input.ConsumeIntegralInRange(0, 7) == 0
                                                           ? Pick<_DEWARP_IMAGE_FORMAT>(input, 7)
                                                           : format;
            Frame warped(input, format, format);
            Frame dewarped(input, output_format, format);
            bool const null_warped = null_record && input.ConsumeBool();
            dewarp_image(channel, null_warped ? nullptr : warped.Get(),
                         null_record && !null_warped ? nullptr : dewarped.Get());
            break;
        }
        case 12: {
            _DEWARP_INTERNAL_CAMERA_MODEL model;
            dewarp_internal_get_model(channel, null_record ? nullptr : &model);
            break;
        }
        case 13: {
            _DEWARP_INTERNAL_CAMERA_MODEL const model = Model(input);
            dewarp_internal_set_model(channel, null_record ? nullptr : &model);
            break;
        }
        case 14:
            dewarp_internal_get_mount(channel);
            break;
        case 15:
            dewarp_internal_set_mount(channel, Pick<_DEWARP_INTERNAL_CAMERA_MOUNT>(input, 4));
            break;
        case 16: {
            _DEWARP_IMAGE_FORMAT const format = Pick<_DEWARP_IMAGE_FORMAT>(input, 7);
            Frame dewarped(input, format, format);
            // A size is prepared only as large as a frame the fuzzer would give pixels: a table
            // of any size asked for is built, as the caller wants it.
            if (null_record || dewarped.Get()->data != nullptr) {
                dewarp_prepare_image(channel, null_record ? nullptr : &dewarped.Get()->info);
            }
            break;
        }
        case 17: {
            // Mostly prepared for the frame's own size, then bands: mostly whole blocks inside
            // the frame, sometimes anything.
            _DEWARP_IMAGE_FORMAT const format = Pick<_DEWARP_IMAGE_FORMAT>(input, 7);
            Frame warped(input, format, format);
            Frame dewarped(input, format, format);
            if (dewarped.Get()->data != nullptr && input.ConsumeIntegralInRange(0, 7) != 0) {
                dewarp_prepare_image(channel, &dewarped.Get()->info);
            }
            std::size_t const height = dewarped.Get()->info.height;
            for (int band = input.ConsumeIntegralInRange(1, 4); band > 0; --band) {
                bool const anything = input.ConsumeIntegralInRange(0, 7) == 0;
                std::size_t const first =
                    anything ? input.ConsumeIntegral<std::size_t>()
                             : 4 * input.ConsumeIntegralInRange<std::size_t>(0, height / 4);
                std::size_t const count =
                    anything ? input.ConsumeIntegral<std::size_t>()
                             : 4 * input.ConsumeIntegralInRange<std::size_t>(0, height / 4);
                dewarp_image_rows(channel, null_record ? nullptr : warped.Get(), dewarped.Get(),
                                  first, count);
            }
            break;
        }
        default:
            dewarp_channel_valid(channel);
            break;
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, std::size_t size) {
    FuzzedDataProvider input(data, size);
    _DEWARP_LOG_SETTINGS const log{&ExpandAndDrop, Pick<_DEWARP_LOG_LEVEL>(input, 5)};
    dewarp_set_log(input.ConsumeIntegralInRange(0, 15) == 0 ? nullptr : &log);
    void* const channel = Open(input);
    for (int call = 0; call < MAX_CALLS && input.remaining_bytes() > 0; ++call) {
        Call(input, channel);
    }
    dewarp_close(channel);
    return 0;
}
