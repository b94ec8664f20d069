#include <memory>

#include <benchmark/benchmark.h>

#include "ImageProcessor.h"

namespace {

// A square fisheye picture as wide as the output, with its circle filling it, and a PTZ output and
// a panorama of the output's size.
std::unique_ptr<ImageProcessor> MakeProcessor(int width, int height) {
    ImageProcessorParams params;
    params.InputWidth = width;
    params.InputHeight = width;
    params.InputStride = width * 3;
    params.InputBits = 24;
    params.CircleX = width / 2;
    params.CircleY = width / 2;
    params.CircleRadius = width / 2;
    params.OwnInput = true;
    params.OutputWidth = width;
    params.OutputHeight = height;
    params.OutputStride = width * 3;
    params.OwnOutput = true;
    params.CacheOutput = true;
    params.OutputInterpolation = 2;
    params.PanoramaWidth = width;
    params.PanoramaHeight = height;
    params.PanoramaStride = width * 3;
    params.OwnPanorama = true;
    params.CachePanorama = true;
    params.PanoramaInterpolation = 2;
    auto processor = std::make_unique<ImageProcessor>();
    processor->SetParameters(params);
    ImageData& input = processor->Input();
    for (std::size_t i = 0; i < input.ByteCount(); ++i) {
        input.Data[i] = static_cast<unsigned char>(i * 7);
    }
    return processor;
}

void SetPixelsProcessed(benchmark::State& state) {
    state.SetItemsProcessed(int64_t(state.iterations()) * state.range(0) * state.range(1));
}

// A PTZ move: every frame works the whole map out again.
void BM_ImageProcessor_BuildPtzMap(benchmark::State& state) {
    auto const processor = MakeProcessor(int(state.range(0)), int(state.range(1)));
    double pan = 0.0;
    for (auto _ : state) {
        pan = pan > 170.0 ? -170.0 : pan + 1.0;
        processor->SetPan(pan);
        processor->ProcessImage();
        benchmark::DoNotOptimize(processor->PtzOutput().Data);
    }
    SetPixelsProcessed(state);
}
BENCHMARK(BM_ImageProcessor_BuildPtzMap)->Args({1920, 1080})->Args({3840, 2160});

// The steady state: the position stands and each frame replays the map.
void BM_ImageProcessor_ReplayPtzMap(benchmark::State& state) {
    auto const processor = MakeProcessor(int(state.range(0)), int(state.range(1)));
    processor->ProcessImage();
    for (auto _ : state) {
        processor->ProcessImage();
        benchmark::DoNotOptimize(processor->PtzOutput().Data);
    }
    SetPixelsProcessed(state);
}
BENCHMARK(BM_ImageProcessor_ReplayPtzMap)->Args({1920, 1080})->Args({3840, 2160});

void BM_ImageProcessor_ReplayPanoramaMap(benchmark::State& state) {
    auto const processor = MakeProcessor(int(state.range(0)), int(state.range(1)));
    processor->ProcessPanoramaImage();
    for (auto _ : state) {
        processor->ProcessPanoramaImage();
        benchmark::DoNotOptimize(processor->PanoramaOutput().Data);
    }
    SetPixelsProcessed(state);
}
BENCHMARK(BM_ImageProcessor_ReplayPanoramaMap)->Args({1920, 1080})->Args({3840, 2160});

}  // namespace
