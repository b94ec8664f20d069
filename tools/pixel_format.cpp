#include "pixel_format.h"

#include <algorithm>
#include <string>

#include "tool_error.h"

namespace vexmap_host {

PixelFormat::PixelFormat(int frame_format) : format(frame_format) {
    if (format != RGB24) {
        throw ToolError("the tool cannot convert pixel format " + std::to_string(format));
    }
}

std::size_t PixelFormat::FrameBytes(int width, int height) const {
    return width > 0 && height > 0 ? std::size_t(width) * std::size_t(height) * 3 : 0;
}

void PixelFormat::RequireSize(int width, int height, std::size_t size) const {
    if (FrameBytes(width, height) != size) {
        throw ToolError("a " + std::to_string(width) + "x" + std::to_string(height) +
                        " frame of format " + std::to_string(format) + " takes " +
                        std::to_string(FrameBytes(width, height)) + " bytes, the plug-in gave " +
                        std::to_string(size));
    }
}

void PixelFormat::Encode(RgbImage const& image, unsigned char* buffer, std::size_t size) const {
    RequireSize(image.width, image.height, size);
    if (image.pixels.size() != size) {
        throw ToolError("the picture holds " + std::to_string(image.pixels.size()) +
                        " bytes, not the " + std::to_string(size) + " of its size");
    }
    std::copy(image.pixels.begin(), image.pixels.end(), buffer);
}

RgbImage PixelFormat::Decode(int width, int height, unsigned char const* buffer,
                             std::size_t size) const {
    RequireSize(width, height, size);
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.assign(buffer, buffer + size);
    return image;
}

}  // namespace vexmap_host
