#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "ImageProcessorPrivateData.h"

/// One output pixel of a replayed map, and the arithmetic that frames which work a map out share
/// with it. The row kernels of `MapReplay` must write exactly what `Replay` writes; it is their
/// reference and finishes every row they leave.
struct ReplayPixel {
    using Fraction = ImageProcessorPrivateData::Fraction;

    /// Where a replay reads: the input's samples and sizes, with the bytes of a pixel taken from
    /// the output it writes.
    struct Source {
        unsigned char const* data;
        int width;
        int height;
        int stride;
        int bytes;
    };

    static uint32_t PackEntry(int x, int y) {
        return (uint32_t(y) & 0xFFFFu) << 16 | (uint32_t(x) & 0xFFFFu);
    }

    /// The row is the upper half of an entry read as a signed 16-bit number.
    static int EntryRow(uint32_t entry) { return int((entry >> 16) ^ 0x8000u) - 0x8000; }

    static int EntryColumn(uint32_t entry) { return int(entry & 0xFFFFu); }

    /// One sample of a bilinear blend of the 2 x 2 cell at (x, y), in single precision and in this
    /// order of operations; the sum is truncated and only its lower 8 bits are kept.
    static unsigned char AverageSample(unsigned char const* data, int stride, int bytes, int x,
                                       int y, int channel, float fx, float fy) {
        unsigned char const* p = data + std::size_t(y) * std::size_t(stride) +
                                 std::size_t(x) * std::size_t(bytes) + std::size_t(channel);
        unsigned char const* n = p + stride;
        float const sum = float(p[0]) * (1.0f - fy) * (1.0f - fx) +
                          float(p[bytes]) * (1.0f - fy) * fx + float(n[0]) * fy * (1.0f - fx) +
                          float(n[bytes]) * fy * fx;
        return static_cast<unsigned char>(uint32_t(int(sum)) & 0xFFu);
    }

    static void Blend(unsigned char const* data, int stride, int bytes, int x, int y, float fx,
                      float fy, unsigned char* pixel) {
        for (int channel = 0; channel < bytes; ++channel) {
            pixel[channel] = AverageSample(data, stride, bytes, x, y, channel, fx, fy);
        }
    }

    /// Entries beyond the present input show black; any interpolation but 0 blends, except on the
    /// input's last column and row, which have no cell to blend.
    static void Replay(Source const& in, uint32_t entry, Fraction const* fraction, bool blend,
                       unsigned char* pixel) {
        int const x = EntryColumn(entry);
        int const y = EntryRow(entry);
        std::size_t const bytes = std::size_t(in.bytes);
        if (y < 0 || x >= in.width || y >= in.height) {
            memset(pixel, 0, bytes);
        } else if (blend && x != in.width - 1 && y != in.height - 1) {
            Blend(in.data, in.stride, in.bytes, x, y, fraction->x, fraction->y, pixel);
        } else {
            memcpy(pixel,
                   in.data + std::size_t(y) * std::size_t(in.stride) + std::size_t(x) * bytes,
                   bytes);
        }
    }
};
