#pragma once

#include <cstddef>

#include "rgb_image.h"

namespace vexmap_host {

/// The frame formats of the plug-in as this host decodes them. Format 3 is 24-bit RGB in the order
/// of the file; a format the tool does not know is refused with a ToolError.
class PixelFormat {
public:
    static constexpr int RGB24 = 3;

    explicit PixelFormat(int format);  // throws ToolError for a format the tool cannot convert
    PixelFormat(PixelFormat const&) = default;
    PixelFormat& operator=(PixelFormat const&) = default;
    virtual ~PixelFormat() = default;

    std::size_t FrameBytes(int width, int height) const;
    /// Fills a frame buffer of `size` bytes from `image`; throws if the size does not match.
    void Encode(RgbImage const& image, unsigned char* buffer, std::size_t size) const;
    RgbImage Decode(int width, int height, unsigned char const* buffer, std::size_t size) const;

private:
    void RequireSize(int width, int height, std::size_t size) const;

    int format;
};

}  // namespace vexmap_host
