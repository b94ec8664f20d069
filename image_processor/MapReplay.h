#pragma once

#include <cstdint>

#include "ImageData.h"
#include "ImageProcessorPrivateData.h"
#include "ReplayPixel.h"

/// Writes an output from a map that a frame worked out: per pixel the recorded input pixel, or the
/// blend of its cell by the recorded fractions. Output rows go through the row kernels of the
/// widest instruction set the processor has, chosen once, and `ReplayPixel` finishes each row; the
/// result is byte for byte that of `ReplayPixel` alone. Keeps pointers only; changes nothing but
/// the output, so threads may replay one map into different outputs.
class MapReplay {
public:
    using Fraction = ImageProcessorPrivateData::Fraction;

    /// One row of the output and its entries: the kernels' share of the work.
    struct Row {
        uint32_t const* entries;
        Fraction const* fractions;
        unsigned char* pixels;
        int width;
    };
    /// Returns how many pixels from the start of the row it wrote.
    using RowKernel = int (*)(ReplayPixel::Source const& in, Row const& row);
    /// The kernels of one instruction set; null where it has none for the pixel size.
    struct Kernels {
        RowKernel nearest_3;
        RowKernel nearest_4;
        RowKernel blend_3;
        RowKernel blend_4;
    };
    static Kernels const& Plain();   // none: ReplayPixel does every pixel
    static Kernels const& Avx2();    // Plain on a processor without AVX2
    static Kernels const& Widest();  // what the processor runs

    MapReplay();
    MapReplay(MapReplay const& other);
    MapReplay(ImageData const& source, uint32_t const* entries, Fraction const* cell_fractions);
    MapReplay& operator=(MapReplay const& other);
    virtual ~MapReplay();

    /// The first `width` x `height` pixels of the output; blends for any interpolation but 0.
    void Into(ImageData& output, int width, int height, int interpolation) const;
    void Into(ImageData& output, int width, int height, int interpolation,
              Kernels const& kernels) const;

private:
    ImageData const* input;
    uint32_t const* map;
    Fraction const* fractions;
};
