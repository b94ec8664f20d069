#include "pixel_format.h"

#include <algorithm>
#include <cmath>
#include <string>

#include "tool_error.h"

namespace vexmap_host {
namespace {

// BT.601: luma weighs red, green and blue by KR, 1 - KR - KB and KB. Limited range puts luma's
// 0 to 1 on 16 to 235 and each colour difference's -1/2 to 1/2 on 16 to 240; with B - Y' spanning
// 2 (1 - KB) and R - Y' spanning 2 (1 - KR), a byte of RGB maps as below.
constexpr double KR = 0.299;
constexpr double KB = 0.114;
constexpr double KG = 1.0 - KR - KB;
constexpr double CHROMA_ZERO = 128.0;

/// Bytes of Y'CbCr from bytes of RGB: luma = black + luma_scale * Y', a colour difference =
/// 128 + its scale * (B - Y') or (R - Y'). Full range spans the whole byte, so its luma scale is 1
/// and each difference, spanning 2 (1 - KB) or 2 (1 - KR), is divided by that span.
struct Scales {
    double luma_black;
    double luma_scale;
    double cb_scale;
    double cr_scale;
};

constexpr Scales LIMITED_SCALES{16.0, 219.0 / 255.0, 224.0 / 255.0 / (2.0 * (1.0 - KB)),
                                224.0 / 255.0 / (2.0 * (1.0 - KR))};
constexpr Scales FULL_SCALES{0.0, 1.0, 1.0 / (2.0 * (1.0 - KB)), 1.0 / (2.0 * (1.0 - KR))};

Scales const& ScalesOf(ColourRange range) {
    return range == ColourRange::FULL ? FULL_SCALES : LIMITED_SCALES;
}

uint8_t ToByte(double value) {
    return uint8_t(std::lround(std::clamp(value, 0.0, 255.0)));
}

std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

void RequireWhole(YuvImage const& image) {
    if (image.width < 0 || image.height < 0 ||
        image.bytes.size() != YuvImage::FrameBytes(uint64_t(image.width), uint64_t(image.height))) {
        throw ToolError("the " + SizeText(image.width, image.height) + " picture holds " +
                        std::to_string(image.bytes.size()) + " bytes, not those of its size");
    }
}

}  // namespace

PixelFormat::PixelFormat(int frame_format, ColourRange colour_range)
    : format(frame_format), range(colour_range) {
    if (format != I420 && format != RGB24 && format != RGBX32 && format != PLANAR_420) {
        throw ToolError("the tool cannot convert pixel format " + std::to_string(format));
    }
}

std::size_t PixelFormat::FrameBytes(int width, int height) const {
    if (width <= 0 || height <= 0) {
        return 0;
    }
    std::size_t const pixels = std::size_t(width) * std::size_t(height);
    return IsPlanar420() ? pixels * 3 / 2 : pixels * BytesPerRgbPixel();
}

// An odd side has no place in the plug-in's 4:2:0 frame: its chroma rows are half the luma row
// rounded down, which would drop or misplace the chroma of the last column.
void PixelFormat::RequireSize(int width, int height, std::size_t size) const {
    if (IsPlanar420() && (width % 2 != 0 || height % 2 != 0)) {
        throw ToolError("4:2:0 frames of the plug-in need an even width and height, not " +
                        SizeText(width, height));
    }
    if (FrameBytes(width, height) != size) {
        throw ToolError("a " + SizeText(width, height) + " frame of format " +
                        std::to_string(format) + " takes " +
                        std::to_string(FrameBytes(width, height)) + " bytes, the plug-in gave " +
                        std::to_string(size));
    }
}

void PixelFormat::Encode(RgbImage const& image, unsigned char* buffer, std::size_t size) const {
    if (IsPlanar420()) {
        Store(ToYuv(image, range), buffer, size);
    } else {
        Store(image, buffer, size);
    }
}

void PixelFormat::Encode(YuvImage const& image, unsigned char* buffer, std::size_t size) const {
    if (IsPlanar420()) {
        Store(image, buffer, size);
    } else {
        Store(ToRgb(image, range), buffer, size);
    }
}

RgbImage PixelFormat::Decode(int width, int height, unsigned char const* buffer,
                             std::size_t size) const {
    RequireSize(width, height, size);
    if (IsPlanar420()) {
        YuvImage const image{width, height, std::vector<uint8_t>(buffer, buffer + size)};
        return ToRgb(image, range);
    }
    return Unpack(width, height, buffer);
}

RgbImage PixelFormat::Unpack(int width, int height, unsigned char const* buffer) const {
    std::size_t const pixels = std::size_t(width) * std::size_t(height);
    std::size_t const stride = BytesPerRgbPixel();
    RgbImage image{width, height, std::vector<uint8_t>(pixels * 3)};
    for (std::size_t pixel = 0; pixel < pixels; ++pixel) {
        std::copy_n(buffer + pixel * stride, 3, &image.pixels[pixel * 3]);
    }
    return image;
}

YuvImage PixelFormat::DecodeYuv(int width, int height, unsigned char const* buffer,
                                std::size_t size) const {
    RequireSize(width, height, size);
    if (IsPlanar420()) {
        return YuvImage{width, height, std::vector<uint8_t>(buffer, buffer + size)};
    }
    return ToYuv(Unpack(width, height, buffer), range);
}

void PixelFormat::Store(RgbImage const& image, unsigned char* buffer, std::size_t size) const {
    RequireSize(image.width, image.height, size);
    std::size_t const pixels = size / BytesPerRgbPixel();
    if (image.pixels.size() != pixels * 3) {
        throw ToolError("the picture holds " + std::to_string(image.pixels.size()) +
                        " bytes, not the " + std::to_string(pixels * 3) + " of its size");
    }
    if (format == RGB24) {
        std::copy(image.pixels.begin(), image.pixels.end(), buffer);
        return;
    }
    for (std::size_t pixel = 0; pixel < pixels; ++pixel) {
        std::copy_n(&image.pixels[pixel * 3], 3, buffer + pixel * 4);
        buffer[pixel * 4 + 3] = 255;
    }
}

void PixelFormat::Store(YuvImage const& image, unsigned char* buffer, std::size_t size) const {
    RequireSize(image.width, image.height, size);
    RequireWhole(image);
    std::copy(image.bytes.begin(), image.bytes.end(), buffer);
}

YuvImage PixelFormat::ToYuv(RgbImage const& image, ColourRange range) {
    Scales const& scales = ScalesOf(range);
    if (image.width < 0 || image.height < 0 ||
        image.pixels.size() != std::size_t(image.width) * std::size_t(image.height) * 3) {
        throw ToolError("the " + SizeText(image.width, image.height) + " picture holds " +
                        std::to_string(image.pixels.size()) + " bytes, not those of its size");
    }
    std::size_t const width = std::size_t(image.width);
    std::size_t const height = std::size_t(image.height);
    std::size_t const chroma_width = YuvImage::ChromaWidth(width);
    std::size_t const chroma_height = YuvImage::ChromaHeight(height);
    YuvImage yuv;
    yuv.width = image.width;
    yuv.height = image.height;
    yuv.bytes.resize(YuvImage::FrameBytes(width, height));
    uint8_t* const luma = yuv.bytes.data();
    uint8_t* const u_plane = luma + width * height;
    uint8_t* const v_plane = u_plane + chroma_width * chroma_height;
    for (std::size_t row = 0; row < height; ++row) {
        for (std::size_t column = 0; column < width; ++column) {
            uint8_t const* pixel = &image.pixels[(row * width + column) * 3];
            double const y = KR * pixel[0] + KG * pixel[1] + KB * pixel[2];
            luma[row * width + column] = ToByte(scales.luma_black + scales.luma_scale * y);
        }
    }
    // The colour differences are linear in RGB, so those of the block's mean are the mean of the
    // pixels' own. A block on an odd edge averages the one or two pixels it has.
    for (std::size_t block_row = 0; block_row < chroma_height; ++block_row) {
        for (std::size_t block_column = 0; block_column < chroma_width; ++block_column) {
            double sum[3] = {0.0, 0.0, 0.0};
            int count = 0;
            for (std::size_t row = 2 * block_row; row < std::min(2 * block_row + 2, height);
                 ++row) {
                for (std::size_t column = 2 * block_column;
                     column < std::min(2 * block_column + 2, width); ++column) {
                    uint8_t const* pixel = &image.pixels[(row * width + column) * 3];
                    for (std::size_t channel = 0; channel < 3; ++channel) {
                        sum[channel] += pixel[channel];
                    }
                    ++count;
                }
            }
            double const r = sum[0] / count;
            double const g = sum[1] / count;
            double const b = sum[2] / count;
            double const y = KR * r + KG * g + KB * b;
            std::size_t const index = block_row * chroma_width + block_column;
            u_plane[index] = ToByte(CHROMA_ZERO + scales.cb_scale * (b - y));
            v_plane[index] = ToByte(CHROMA_ZERO + scales.cr_scale * (r - y));
        }
    }
    return yuv;
}

RgbImage PixelFormat::ToRgb(YuvImage const& yuv, ColourRange range) {
    Scales const& scales = ScalesOf(range);
    RequireWhole(yuv);
    std::size_t const width = std::size_t(yuv.width);
    std::size_t const height = std::size_t(yuv.height);
    std::size_t const chroma_width = YuvImage::ChromaWidth(width);
    std::size_t const chroma_height = YuvImage::ChromaHeight(height);
    uint8_t const* const luma = yuv.bytes.data();
    uint8_t const* const u_plane = luma + width * height;
    uint8_t const* const v_plane = u_plane + chroma_width * chroma_height;
    RgbImage image;
    image.width = yuv.width;
    image.height = yuv.height;
    image.pixels.resize(width * height * 3);
    for (std::size_t row = 0; row < height; ++row) {
        for (std::size_t column = 0; column < width; ++column) {
            std::size_t const chroma = (row / 2) * chroma_width + column / 2;
            double const y = (luma[row * width + column] - scales.luma_black) / scales.luma_scale;
            double const b = y + (u_plane[chroma] - CHROMA_ZERO) / scales.cb_scale;
            double const r = y + (v_plane[chroma] - CHROMA_ZERO) / scales.cr_scale;
            double const g = (y - KR * r - KB * b) / KG;
            uint8_t* pixel = &image.pixels[(row * width + column) * 3];
            pixel[0] = ToByte(r);
            pixel[1] = ToByte(g);
            pixel[2] = ToByte(b);
        }
    }
    return image;
}

}  // namespace vexmap_host
