#include "dewarp_session.h"

#include <algorithm>
#include <cstring>
#include <string>

#include "pixel_format.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

bool TakesEvenSizesOnly(int format) {
    return format == PixelFormat::I420 || format == PixelFormat::PLANAR_420;
}

// Copies row after row, each followed by its last pixel again when the width grows, and the
// last row again when the height grows: the edge of the picture goes on, instead of a black
// line that a view near the edge would show.
void CopyPadded(uint8_t const* source, std::size_t width, std::size_t height, std::size_t pixel,
                uint8_t* destination, std::size_t padded_width, std::size_t padded_height) {
    for (std::size_t row = 0; row < padded_height; ++row) {
        uint8_t const* from = source + std::min(row, height - 1) * width * pixel;
        uint8_t* to = destination + row * padded_width * pixel;
        std::copy_n(from, width * pixel, to);
        for (std::size_t column = width; column < padded_width; ++column) {
            std::copy_n(from + (width - 1) * pixel, pixel, to + column * pixel);
        }
    }
}

}  // namespace

DewarpSession::DewarpSession(PluginHost const& plugin, int mode, DewarpParams const& params,
                             ColourRange colour_range)
    : host(plugin), dewarper(plugin.CreateDewarper(mode, params)), range(colour_range) {
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
        Position const now = CurrentPosition();
        dewarper->SetPosition(position.pan.value_or(now.pan), position.tilt.value_or(now.tilt),
                              position.zoom.value_or(now.zoom));
    }
}

Position DewarpSession::CurrentPosition() const {
    Position position;
    dewarper->GetPosition(position.pan, position.tilt, position.zoom);
    return position;
}

FrameSize DewarpSession::FedSize(int width, int height) const {
    if (!input_format) {
        Request(width, height);
    }
    if (TakesEvenSizesOnly(*input_format)) {
        return {width + width % 2, height + height % 2};
    }
    return {width, height};
}

template <typename Picture>
RenderedView<Picture> DewarpSession::Render(int sub_mode, RequestedPosition const& position,
                                            Picture const& input, int width, int height, int frames,
                                            std::function<void(int)> const& each_frame) const {
    Aim(sub_mode, position);
    FrameSize const fed = FedSize(input.width, input.height);
    Picture const picture =
        fed.width != input.width || fed.height != input.height ? PaddedToEven(input) : input;
    InputBuffer const first = Request(picture.width, picture.height);
    PixelFormat(first.format, range).Encode(picture, first.bytes, first.size);
    std::vector<unsigned char> const encoded(first.bytes, first.bytes + first.size);
    RenderedView<Picture> view;
    Output output{};
    for (int frame = 0; frame < frames; ++frame) {
        if (frame > 0) {
            InputBuffer const next = Request(picture.width, picture.height);
            std::copy(encoded.begin(), encoded.end(), next.bytes);
        }
        output = Fetch(width, height);
        if (frame == 0) {
            view.position = CurrentPosition();
        }
        if (each_frame) {
            each_frame(frame + 1);
        }
    }
    Decode(output, view.picture);
    return view;
}

template RenderedView<RgbImage> DewarpSession::Render(int, RequestedPosition const&,
                                                      RgbImage const&, int, int, int,
                                                      std::function<void(int)> const&) const;
template RenderedView<YuvImage> DewarpSession::Render(int, RequestedPosition const&,
                                                      YuvImage const&, int, int, int,
                                                      std::function<void(int)> const&) const;

RgbImage DewarpSession::RunFrame(RgbImage const& input, int width, int height) const {
    FrameSize const fed = FedSize(input.width, input.height);
    if (fed.width != input.width || fed.height != input.height) {
        Feed(PaddedToEven(input));
    } else {
        Feed(input);
    }
    RgbImage view;
    Decode(Fetch(width, height), view);
    return view;
}

YuvImage DewarpSession::RunFrame(YuvImage const& input, int width, int height) const {
    YuvImage view;
    RunFrame(input, width, height, view);
    return view;
}

void DewarpSession::RunFrame(YuvImage const& input, int width, int height, YuvImage& view) const {
    FrameSize const fed = FedSize(input.width, input.height);
    Feed(fed.width != input.width || fed.height != input.height ? PaddedToEven(input) : input);
    Decode(Fetch(width, height), view);
}

void DewarpSession::Decode(Output const& output, RgbImage& picture) const {
    picture = PixelFormat(output.format, range)
                  .Decode(output.width, output.height, output.buffer, output.size);
}

void DewarpSession::Decode(Output const& output, YuvImage& picture) const {
    if (!TakesEvenSizesOnly(output.format)) {
        picture = PixelFormat(output.format, range)
                      .DecodeYuv(output.width, output.height, output.buffer, output.size);
        return;
    }
    // The plug-in's 4:2:0 layout is the stream's: one copy into storage kept between frames.
    if (PixelFormat(output.format, range).FrameBytes(output.width, output.height) != output.size) {
        throw ToolError("the dewarper gave " + std::to_string(output.size) + " bytes for a " +
                        SizeText(output.width, output.height) + " frame");
    }
    picture.width = output.width;
    picture.height = output.height;
    picture.bytes.assign(output.buffer, output.buffer + output.size);
}

RgbImage DewarpSession::PaddedToEven(RgbImage const& input) const {
    RgbImage even;
    even.width = input.width + input.width % 2;
    even.height = input.height + input.height % 2;
    even.pixels.resize(std::size_t(even.width) * std::size_t(even.height) * 3);
    CopyPadded(input.pixels.data(), std::size_t(input.width), std::size_t(input.height), 3,
               even.pixels.data(), std::size_t(even.width), std::size_t(even.height));
    return even;
}

// The chroma planes of an odd side already cover the added column or row (they round up), so
// only the luma plane grows.
YuvImage const& DewarpSession::PaddedToEven(YuvImage const& input) const {
    std::size_t const width = std::size_t(input.width);
    std::size_t const height = std::size_t(input.height);
    std::size_t const even_width = width + width % 2;
    std::size_t const even_height = height + height % 2;
    padded.width = int(even_width);
    padded.height = int(even_height);
    padded.bytes.resize(YuvImage::FrameBytes(even_width, even_height));
    CopyPadded(input.bytes.data(), width, height, 1, padded.bytes.data(), even_width, even_height);
    std::size_t const chroma = 2 * YuvImage::ChromaWidth(width) * YuvImage::ChromaHeight(height);
    std::copy_n(input.bytes.data() + width * height, chroma,
                padded.bytes.data() + even_width * even_height);
    return padded;
}

DewarpSession::InputBuffer DewarpSession::Request(int width, int height) const {
    InputBuffer input{nullptr, 0, 0};
    if (!dewarper->GetImageInputBuffer(width, height, &input.bytes, &input.size, &input.format)) {
        throw ToolError("the dewarper refused an input frame of " + SizeText(width, height));
    }
    input_format = input.format;
    return input;
}

template <typename Picture>
void DewarpSession::Feed(Picture const& input) const {
    InputBuffer const buffer = Request(input.width, input.height);
    PixelFormat(buffer.format, range).Encode(input, buffer.bytes, buffer.size);
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
