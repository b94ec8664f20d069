#include "MapReplay.h"

#include <cstddef>

// The AVX2 row kernels, compiled in a file of their own with that instruction set.
MapReplay::Kernels const& Avx2ReplayKernels();

MapReplay::Kernels const& MapReplay::Plain() {
    static Kernels const none{nullptr, nullptr, nullptr, nullptr};
    return none;
}

MapReplay::Kernels const& MapReplay::Avx2() {
    static Kernels const& kernels = __builtin_cpu_supports("avx2") ? Avx2ReplayKernels() : Plain();
    return kernels;
}

MapReplay::Kernels const& MapReplay::Widest() {
    return Avx2();
}

MapReplay::MapReplay() : input(nullptr), map(nullptr), fractions(nullptr) {}

MapReplay::MapReplay(MapReplay const& other) = default;

MapReplay::MapReplay(ImageData const& source, uint32_t const* entries,
                     Fraction const* cell_fractions)
    : input(&source), map(entries), fractions(cell_fractions) {}

MapReplay& MapReplay::operator=(MapReplay const& other) = default;

MapReplay::~MapReplay() = default;

void MapReplay::Into(ImageData& output, int width, int height, int interpolation) const {
    Into(output, width, height, interpolation, Widest());
}

void MapReplay::Into(ImageData& output, int width, int height, int interpolation,
                     Kernels const& kernels) const {
    if (input == nullptr) {
        return;
    }
    int const bytes = output.BitsPerPixel / 8;
    bool const blend = interpolation != 0;
    ReplayPixel::Source const in{input->Data, input->Width, input->Height, input->Stride, bytes};
    RowKernel kernel = nullptr;
    if (bytes == 3) {
        kernel = blend ? kernels.blend_3 : kernels.nearest_3;
    } else if (bytes == 4) {
        kernel = blend ? kernels.blend_4 : kernels.nearest_4;
    }
    for (int row = 0; row < height; ++row) {
        std::size_t const first = std::size_t(row) * std::size_t(width);
        Row const line{map + first, fractions + first,
                       output.Data + std::size_t(row) * std::size_t(output.Stride), width};
        int const done = kernel != nullptr ? kernel(in, line) : 0;
        unsigned char* pixel = line.pixels + std::size_t(done) * std::size_t(bytes);
        for (int column = done; column < width; ++column, pixel += bytes) {
            ReplayPixel::Replay(in, line.entries[column], line.fractions + column, blend, pixel);
        }
    }
}
