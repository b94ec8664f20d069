#include <memory>

#include <benchmark/benchmark.h>
#ifdef VEXMAP_BENCH_WITH_OPENCV
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>
#endif

#include "ImageProcessor.h"
#include "MapReplay.h"
#include "in_turns.h"

namespace {

// A square fisheye picture as wide as the output, with its circle filling it, and a PTZ output and
// a panorama of the output's size.
std::unique_ptr<ImageProcessor> MakeProcessor(int width, int height, int interpolation = 2) {
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
    params.OutputInterpolation = interpolation;
    params.PanoramaWidth = width;
    params.PanoramaHeight = height;
    params.PanoramaStride = width * 3;
    params.OwnPanorama = true;
    params.CachePanorama = true;
    params.PanoramaInterpolation = interpolation;
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

// A replayed PTZ frame, nearest (0) or blended (2), by the plain loop and by the widest kernels in
// turns: `vector_speedup` is the plain frame's time over the kernels'.
void BM_ImageProcessor_ReplayPlainAndVector(benchmark::State& state) {
    int const interpolation = int(state.range(2));
    auto const processor = MakeProcessor(int(state.range(0)), int(state.range(1)), interpolation);
    processor->ProcessImage();
    ImageProcessorPrivateData const& data = processor->PrivateData();
    MapReplay const replay(processor->Input(), data.PtzMap.data(), data.PtzFractions.data());
    ImageData& output = processor->PtzOutput();
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    for (auto _ : state) {
        replay.Into(output, width, height, interpolation, MapReplay::Plain());
        benchmark::DoNotOptimize(output.Data);
    }
    SetPixelsProcessed(state);
    quorvel::vexmap::bench::Turns const turns = quorvel::vexmap::bench::InTurns(
        20, [&] { replay.Into(output, width, height, interpolation, MapReplay::Plain()); },
        [&] { replay.Into(output, width, height, interpolation, MapReplay::Widest()); });
    state.counters["vector_speedup"] = turns.Ratio();
}
BENCHMARK(BM_ImageProcessor_ReplayPlainAndVector)->Args({1920, 1080, 0})->Args({1920, 1080, 2});

#ifdef VEXMAP_BENCH_WITH_OPENCV
/// The processor's PTZ map as OpenCV's remap takes it: fixed point, with the recorded fractions
/// for a blend, and a lookup outside the input where the map has none.
struct OpenCvMaps {
    OpenCvMaps(ImageProcessor& processor, int width, int height, bool blend) {
        ImageProcessorPrivateData const& data = processor.PrivateData();
        ImageData const& input = processor.Input();
        cv::Mat x(height, width, CV_32FC1);
        cv::Mat y(height, width, CV_32FC1);
        for (int row = 0; row < height; ++row) {
            for (int column = 0; column < width; ++column) {
                std::size_t const i = std::size_t(row) * std::size_t(width) + std::size_t(column);
                uint32_t const entry = data.PtzMap[i];
                int const ex = ReplayPixel::EntryColumn(entry);
                int const ey = ReplayPixel::EntryRow(entry);
                bool const inside = ey >= 0 && ex < input.Width && ey < input.Height;
                bool const blended =
                    blend && inside && ex != input.Width - 1 && ey != input.Height - 1;
                x.at<float>(row, column) =
                    inside ? float(ex) + (blended ? data.PtzFractions[i].x : 0.0f) : -1.0f;
                y.at<float>(row, column) =
                    inside ? float(ey) + (blended ? data.PtzFractions[i].y : 0.0f) : -1.0f;
            }
        }
        cv::convertMaps(x, y, coordinates, fractions, CV_16SC2, !blend);
    }

    cv::Mat coordinates;
    cv::Mat fractions;
};

// OpenCV's nearest (0) or linear (2) remap of the same 24-bit picture through the same map on one
// thread, and the processor's replay, in turns: `vexmap_speedup` is OpenCV's time over ours.
void BM_OpenCv_RemapLikeImageProcessorReplay(benchmark::State& state) {
    cv::setNumThreads(1);
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    int const interpolation = int(state.range(2));
    auto const processor = MakeProcessor(width, height, interpolation);
    processor->ProcessImage();
    ImageData& input = processor->Input();
    ImageData& output = processor->PtzOutput();
    OpenCvMaps const maps(*processor, width, height, interpolation != 0);
    cv::Mat const source(input.Height, input.Width, CV_8UC3, input.Data, std::size_t(input.Stride));
    cv::Mat target(height, width, CV_8UC3);
    auto const opencv = [&] {
        cv::remap(source, target, maps.coordinates, maps.fractions,
                  interpolation != 0 ? cv::INTER_LINEAR : cv::INTER_NEAREST, cv::BORDER_CONSTANT,
                  cv::Scalar::all(0));
    };
    for (auto _ : state) {
        opencv();
        benchmark::DoNotOptimize(target.data);
    }
    SetPixelsProcessed(state);
    quorvel::vexmap::bench::Turns const turns =
        quorvel::vexmap::bench::InTurns(20, opencv, [&] { processor->ProcessImage(); });
    state.counters["vexmap_speedup"] = turns.Ratio();
    benchmark::DoNotOptimize(output.Data);
}
BENCHMARK(BM_OpenCv_RemapLikeImageProcessorReplay)
    ->Args({1920, 1080, 0})
    ->Args({1920, 1080, 2})
    ->Args({3840, 2160, 0})
    ->Args({3840, 2160, 2});
#endif

}  // namespace
