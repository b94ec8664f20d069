#include "dewarp_session.h"

#include <string>

#include "pixel_format.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {
std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}
}  // namespace

DewarpSession::DewarpSession(PluginHost const& plugin, int mode, DewarpParams const& params)
    : host(plugin), dewarper(plugin.CreateDewarper(mode, params)) {
    if (dewarper == nullptr) {
        throw ToolError("the plug-in made no dewarper of mode " + std::to_string(mode));
    }
}

DewarpSession::~DewarpSession() {
    host.DeleteDewarper(dewarper);
}

// The sub-mode goes first: changing it may put the position back to the kind's defaults.
void DewarpSession::Aim(int sub_mode, RequestedPosition const& position) const {
    dewarper->SetSubMode(sub_mode);
    if (position.pan || position.tilt || position.zoom) {
        float pan = 0.0f;
        float tilt = 0.0f;
        float zoom = 0.0f;
        dewarper->GetPosition(pan, tilt, zoom);
        dewarper->SetPosition(position.pan.value_or(pan), position.tilt.value_or(tilt),
                              position.zoom.value_or(zoom));
    }
}

RgbImage DewarpSession::Render(int sub_mode, RequestedPosition const& position,
                               RgbImage const& input, int width, int height, int frames) const {
    Aim(sub_mode, position);
    RgbImage picture;
    for (int frame = 0; frame < frames; ++frame) {
        picture = RunFrame(input, width, height);
    }
    return picture;
}

RgbImage DewarpSession::RunFrame(RgbImage const& input, int width, int height) const {
    Feed(input);
    Output const output = Fetch(width, height);
    return PixelFormat(output.format)
        .Decode(output.width, output.height, output.buffer, output.size);
}

YuvImage DewarpSession::RunFrame(YuvImage const& input, int width, int height) const {
    Feed(input);
    Output const output = Fetch(width, height);
    return PixelFormat(output.format)
        .DecodeYuv(output.width, output.height, output.buffer, output.size);
}

template <typename Picture>
void DewarpSession::Feed(Picture const& input) const {
    unsigned char* input_buffer = nullptr;
    unsigned int input_size = 0;
    int input_format = 0;
    if (!dewarper->GetImageInputBuffer(input.width, input.height, &input_buffer, &input_size,
                                       &input_format)) {
        throw ToolError("the dewarper refused an input frame of " +
                        SizeText(input.width, input.height));
    }
    PixelFormat(input_format).Encode(input, input_buffer, input_size);
}

DewarpSession::Output DewarpSession::Fetch(int width, int height) const {
    Output output{width, height, nullptr, 0, 0};
    unsigned char* buffer = nullptr;
    if (!dewarper->GetImageOutputBuffer(&output.width, &output.height, &buffer, &output.size,
                                        &output.format)) {
        throw ToolError("the dewarper gave no picture for an output of " + SizeText(width, height));
    }
    if (output.width <= 0 || output.height <= 0) {
        throw ToolError("the dewarper gave an empty picture of " +
                        SizeText(output.width, output.height));
    }
    output.buffer = buffer;
    return output;
}

}  // namespace vexmap_host
