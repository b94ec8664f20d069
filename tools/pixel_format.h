#pragma once

#include <cstddef>

#include "rgb_image.h"
#include "yuv_image.h"

namespace vexmap_host {

/// The frame formats of the plug-in as this host decodes them. Format 3 is 24-bit RGB in the order
/// of the file, and format 6 the same with a fourth, padding byte (written 255, ignored when read);
/// formats 0 and 23 are both planar 4:2:0 (luma, then U, then V) with BT.601 limited-range values,
/// and take only even sizes. A format the tool does not know is refused with a ToolError.
class PixelFormat {
public:
    static constexpr int I420 = 0;
    static constexpr int RGB24 = 3;
    static constexpr int RGBX32 = 6;
    static constexpr int PLANAR_420 = 23;

    /// Throws ToolError for a format the tool cannot convert. `range` is the one of the 4:2:0
    /// pictures that Encode and Decode convert to and from RGB.
    explicit PixelFormat(int format, ColourRange range = ColourRange::LIMITED);
    PixelFormat(PixelFormat const&) = default;
    PixelFormat& operator=(PixelFormat const&) = default;
    virtual ~PixelFormat() = default;

    /// The byte count of the plug-in for a frame; 0 for an empty or negative size.
    std::size_t FrameBytes(int width, int height) const;
    /// Fill a frame buffer of `size` bytes from a picture, converting its colours when the format
    /// differs; throw if the size does not match. A 4:2:0 picture goes into format 0 unchanged.
    void Encode(RgbImage const& image, unsigned char* buffer, std::size_t size) const;
    void Encode(YuvImage const& image, unsigned char* buffer, std::size_t size) const;
    RgbImage Decode(int width, int height, unsigned char const* buffer, std::size_t size) const;
    YuvImage DecodeYuv(int width, int height, unsigned char const* buffer, std::size_t size) const;

    /// BT.601, by default in limited range, the range of the plug-in's own black (luma 16,
    /// chroma 128) and of ordinary 8-bit video; full range as a stream marked so carries it. A
    /// chroma sample is the mean of the 2 x 2 pixels it covers, which puts it at their centre.
    static YuvImage ToYuv(RgbImage const& image, ColourRange range = ColourRange::LIMITED);
    static RgbImage ToRgb(YuvImage const& image, ColourRange range = ColourRange::LIMITED);

private:
    bool IsPlanar420() const { return format == I420 || format == PLANAR_420; }
    std::size_t BytesPerRgbPixel() const { return format == RGBX32 ? 4 : 3; }
    void RequireSize(int width, int height, std::size_t size) const;
    /// Copies a picture into a frame buffer of its own kind, padding each pixel for format 6.
    void Store(RgbImage const& image, unsigned char* buffer, std::size_t size) const;
    void Store(YuvImage const& image, unsigned char* buffer, std::size_t size) const;
    /// A whole frame of format 3 or 6, whose size has been checked, as 24-bit RGB.
    RgbImage Unpack(int width, int height, unsigned char const* buffer) const;

    int format;
    ColourRange range;
};

}  // namespace vexmap_host
