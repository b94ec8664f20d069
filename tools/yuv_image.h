#pragma once

#include <cstdint>
#include <vector>

namespace vexmap_host {

/// How 8-bit YCbCr values span their byte: limited (video) range puts black at luma 16 and white
/// at 235, full range at 0 and 255. Unspecified streams are read as limited, as video players do.
enum class ColourRange { UNSPECIFIED, LIMITED, FULL };

/// A picture as a YUV4MPEG2 stream carries it: 8-bit planar 4:2:0, the luma plane, then U, then V,
/// each row after row with no padding. A chroma sample covers 2 x 2 pixels, so a chroma plane is
/// half the size rounded up: an odd width or height keeps its last column or row.
struct YuvImage {
    int width = 0;
    int height = 0;
    std::vector<uint8_t> bytes;  // FrameBytes(width, height) bytes

    static uint64_t ChromaWidth(uint64_t luma_width) { return (luma_width + 1) / 2; }
    static uint64_t ChromaHeight(uint64_t luma_height) { return (luma_height + 1) / 2; }
    /// In 64 bits, so that any pair of 32-bit sides is counted without overflow.
    static uint64_t FrameBytes(uint64_t luma_width, uint64_t luma_height) {
        return luma_width * luma_height + 2 * ChromaWidth(luma_width) * ChromaHeight(luma_height);
    }
};

}  // namespace vexmap_host
