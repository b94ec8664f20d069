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
RgbImage DewarpSession::Render(int sub_mode, RequestedPosition const& position,
                               RgbImage const& input, int width, int height, int frames) const {
    dewarper->SetSubMode(sub_mode);
    if (position.pan || position.tilt || position.zoom) {
        float pan = 0.0f;
        float tilt = 0.0f;
        float zoom = 0.0f;
        dewarper->GetPosition(pan, tilt, zoom);
        dewarper->SetPosition(position.pan.value_or(pan), position.tilt.value_or(tilt),
                              position.zoom.value_or(zoom));
    }
    RgbImage picture;
    for (int frame = 0; frame < frames; ++frame) {
        picture = RunFrame(input, width, height);
    }
    return picture;
}

RgbImage DewarpSession::RunFrame(RgbImage const& input, int width, int height) const {
    unsigned char* input_buffer = nullptr;
    unsigned int input_size = 0;
    int input_format = 0;
    if (!dewarper->GetImageInputBuffer(input.width, input.height, &input_buffer, &input_size,
                                       &input_format)) {
        throw ToolError("the dewarper refused an input frame of " +
                        SizeText(input.width, input.height));
    }
    PixelFormat(input_format).Encode(input, input_buffer, input_size);
    int output_width = width;
    int output_height = height;
    unsigned char* output_buffer = nullptr;
    unsigned int output_size = 0;
    int output_format = 0;
    if (!dewarper->GetImageOutputBuffer(&output_width, &output_height, &output_buffer, &output_size,
                                        &output_format)) {
        throw ToolError("the dewarper gave no picture for an output of " + SizeText(width, height));
    }
    if (output_width <= 0 || output_height <= 0) {
        throw ToolError("the dewarper gave an empty picture of " +
                        SizeText(output_width, output_height));
    }
    return PixelFormat(output_format)
        .Decode(output_width, output_height, output_buffer, output_size);
}

}  // namespace vexmap_host
