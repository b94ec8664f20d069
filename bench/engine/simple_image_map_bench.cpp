// What a frame costs once its map stands: one walk of the table for each pixel layout, beside a
// memcpy of as many output bytes and, when OpenCV is present, its nearest-neighbour remap of the
// same YUV 4:2:0 frame through the same coordinates.
#include "vexmap/simple_image_map.h"

#include <cstdint>
#include <cstring>
#include <vector>

#include <benchmark/benchmark.h>
#include <boost/shared_ptr.hpp>
#ifdef VEXMAP_BENCH_WITH_OPENCV
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>
#endif

#include "bench_views.h"
#include "in_turns.h"
#include "vexmap/batch_lanes.h"

namespace quorvel::vexmap {
namespace {

constexpr int SOURCE_SIDE = bench::SOURCE_SIZE;
constexpr int OUTPUT_WIDTH = 1920;
constexpr int OUTPUT_HEIGHT = 1080;

// Built once by the engine's own PTZ view: every benchmark walks the same table.
SimpleImageMap const& BenchMap() {
    static SimpleImageMap const map = [] {
        SinglePtzView view = bench::MakeBenchPtzView(OUTPUT_WIDTH, OUTPUT_HEIGHT);
        view.BuildMap();
        return *view.GetImageMap();
    }();
    return map;
}

size_t FrameBytes(_DEWARP_IMAGE_FORMAT format, size_t width, size_t height) {
    size_t const plane = width * height;
    switch (format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return plane * 4;
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            return plane * 2;
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return plane + plane / 2;
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return plane + plane / 8;
    }
    return plane * 4;
}

/// A frame over bytes of its own, rows without padding.
struct BenchFrame {
    BenchFrame(_DEWARP_IMAGE_FORMAT format, size_t width, size_t height)
        : bytes(FrameBytes(format, width, height)), image{{format, width, height, width}, nullptr} {
        for (size_t i = 0; i < bytes.size(); ++i) {
            bytes[i] = static_cast<unsigned char>(i * 7 + 3);
        }
        image.data = bytes.data();
    }
    BenchFrame(BenchFrame const&) = delete;
    BenchFrame& operator=(BenchFrame const&) = delete;

    std::vector<unsigned char> bytes;
    _DEWARP_IMAGE image;
};

void SetProcessed(benchmark::State& state, size_t output_bytes) {
    state.SetItemsProcessed(int64_t(state.iterations()) * OUTPUT_WIDTH * OUTPUT_HEIGHT);
    state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(output_bytes));
}

// Bytes per second count the output frame, so that the figures meet the memcpy's.
void RunRemap(benchmark::State& state, _DEWARP_IMAGE_FORMAT format) {
    SimpleImageMap const& map = BenchMap();
    BenchFrame const source(format, SOURCE_SIDE, SOURCE_SIDE);
    BenchFrame destination(format, OUTPUT_WIDTH, OUTPUT_HEIGHT);
    for (auto _ : state) {
        map.Remap(source.image, destination.image);
        benchmark::DoNotOptimize(destination.bytes.data());
        benchmark::ClobberMemory();
    }
    SetProcessed(state, destination.bytes.size());
}

void BM_SimpleImageMap_RemapRgb32Packed(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_RGB32_PACKED);
}
BENCHMARK(BM_SimpleImageMap_RemapRgb32Packed);

void BM_SimpleImageMap_RemapYuv422aPacked(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_YUV422A_PACKED);
}
BENCHMARK(BM_SimpleImageMap_RemapYuv422aPacked);

void BM_SimpleImageMap_RemapYuv422bPacked(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_YUV422B_PACKED);
}
BENCHMARK(BM_SimpleImageMap_RemapYuv422bPacked);

void BM_SimpleImageMap_RemapYuv422Planar(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_YUV422_PLANAR);
}
BENCHMARK(BM_SimpleImageMap_RemapYuv422Planar);

void BM_SimpleImageMap_RemapYuv420Planar(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_YUV420_PLANAR);
}
BENCHMARK(BM_SimpleImageMap_RemapYuv420Planar);

// The plain path alone, and the widest vector path against it in turns: `vector_speedup` is the
// plain frame's time over the vector one's; 4:2:0 and NV12, the layouts with vector kernels.
void BM_SimpleImageMap_PlainAndVector(benchmark::State& state) {
    auto const format = static_cast<_DEWARP_IMAGE_FORMAT>(state.range(0));
    SimpleImageMap const& map = BenchMap();
    BenchFrame const source(format, SOURCE_SIDE, SOURCE_SIDE);
    BenchFrame destination(format, OUTPUT_WIDTH, OUTPUT_HEIGHT);
    for (auto _ : state) {
        map.RemapWithLanes(BatchLanes::Sse2(), source.image, destination.image);
        benchmark::DoNotOptimize(destination.bytes.data());
        benchmark::ClobberMemory();
    }
    SetProcessed(state, destination.bytes.size());
    bench::Turns const turns = bench::InTurns(
        20, [&] { map.RemapWithLanes(BatchLanes::Sse2(), source.image, destination.image); },
        [&] { map.RemapWithLanes(BatchLanes::Widest(), source.image, destination.image); });
    state.counters["vector_speedup"] = turns.Ratio();
}
BENCHMARK(BM_SimpleImageMap_PlainAndVector)
    ->ArgName("format")
    ->Arg(DEWARP_IMAGE_FORMAT_YUV420_PLANAR)
    ->Arg(DEWARP_IMAGE_FORMAT_NV420_PLANAR);

void BM_SimpleImageMap_RemapYuv411Planar(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_YUV411_PLANAR);
}
BENCHMARK(BM_SimpleImageMap_RemapYuv411Planar);

void BM_SimpleImageMap_RemapNv420Planar(benchmark::State& state) {
    RunRemap(state, DEWARP_IMAGE_FORMAT_NV420_PLANAR);
}
BENCHMARK(BM_SimpleImageMap_RemapNv420Planar);

// The floor: copying the output frame's bytes (4:2:0, 4:2:2, RGB32) from one buffer to another.
void BM_Memcpy_OutputFrame(benchmark::State& state) {
    size_t const bytes = size_t(state.range(0));
    std::vector<unsigned char> const from(bytes, 7);
    std::vector<unsigned char> to(bytes);
    for (auto _ : state) {
        std::memcpy(to.data(), from.data(), bytes);
        benchmark::DoNotOptimize(to.data());
        benchmark::ClobberMemory();
    }
    SetProcessed(state, bytes);
}
BENCHMARK(BM_Memcpy_OutputFrame)
    ->Arg(OUTPUT_WIDTH* OUTPUT_HEIGHT * 3 / 2)
    ->Arg(OUTPUT_WIDTH* OUTPUT_HEIGHT * 2)
    ->Arg(OUTPUT_WIDTH* OUTPUT_HEIGHT * 4);

#ifdef VEXMAP_BENCH_WITH_OPENCV
/// The same 4:2:0 frame through cv::remap: the luma plane with the full map, each chroma plane
/// with a half-size map of the blocks' top left entries, all in fixed point and one thread.
class OpenCvYuv420Remap {
public:
    OpenCvYuv420Remap(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                      _DEWARP_IMAGE& destination) {
        int const width = int(destination.info.width);
        int const height = int(destination.info.height);
        int const side = int(source.info.height);
        size_t const plane = source.info.height * source.info.stride;
        size_t const out_plane = destination.info.height * destination.info.stride;
        luma = cv::Mat(side, side, CV_8UC1, source.data, source.info.stride);
        u = cv::Mat(side / 2, side / 2, CV_8UC1, source.data + plane, source.info.stride / 2);
        v = cv::Mat(side / 2, side / 2, CV_8UC1, source.data + plane + plane / 4,
                    source.info.stride / 2);
        out_luma = cv::Mat(height, width, CV_8UC1, destination.data, destination.info.stride);
        out_u = cv::Mat(height / 2, width / 2, CV_8UC1, destination.data + out_plane,
                        destination.info.stride / 2);
        out_v = cv::Mat(height / 2, width / 2, CV_8UC1,
                        destination.data + out_plane + out_plane / 4, destination.info.stride / 2);
        cv::Mat x(height, width, CV_32FC1);
        cv::Mat y(height, width, CV_32FC1);
        cv::Mat half_x(height / 2, width / 2, CV_32FC1);
        cv::Mat half_y(height / 2, width / 2, CV_32FC1);
        unsigned short const* entry = map.GetMap();
        int const pitch = map.GetMapWidth();
        for (int row = 0; row < height; ++row) {
            for (int column = 0; column < width; ++column) {
                unsigned short const* const e = entry + 2 * (row * pitch + column);
                // Words beyond a 16-bit signed coordinate are outside the picture either way.
                bool const usable = e[0] <= 32767 && e[1] <= 32767;
                x.at<float>(row, column) = usable ? float(e[0]) : -1.0f;
                y.at<float>(row, column) = usable ? float(e[1]) : -1.0f;
                if (row % 2 == 0 && column % 2 == 0) {
                    half_x.at<float>(row / 2, column / 2) = usable ? float(e[0] >> 1) : -1.0f;
                    half_y.at<float>(row / 2, column / 2) = usable ? float(e[1] >> 1) : -1.0f;
                }
            }
        }
        cv::Mat unused;
        cv::convertMaps(x, y, luma_map, unused, CV_16SC2, true);
        cv::convertMaps(half_x, half_y, chroma_map, unused, CV_16SC2, true);
    }

    void operator()() {
        cv::remap(luma, out_luma, luma_map, cv::noArray(), cv::INTER_NEAREST, cv::BORDER_CONSTANT,
                  cv::Scalar(16));
        cv::remap(u, out_u, chroma_map, cv::noArray(), cv::INTER_NEAREST, cv::BORDER_CONSTANT,
                  cv::Scalar(128));
        cv::remap(v, out_v, chroma_map, cv::noArray(), cv::INTER_NEAREST, cv::BORDER_CONSTANT,
                  cv::Scalar(128));
    }

private:
    cv::Mat luma;
    cv::Mat u;
    cv::Mat v;
    cv::Mat out_luma;
    cv::Mat out_u;
    cv::Mat out_v;
    cv::Mat luma_map;
    cv::Mat chroma_map;
};

// OpenCV's 4:2:0 frame, ours and a memcpy of our output's bytes, in turns (the fastest of 20 runs
// of each), for a view, an output size and a source side: `vexmap_speedup` is OpenCV's time over
// ours and `over_memcpy` ours over the copy's. Each map is checked to give OpenCV's bytes first.
void BM_OpenCv_RemapYuv420Planar(benchmark::State& state) {
    cv::setNumThreads(1);
    auto const kind = bench::ViewKind(state.range(0));
    int const width = int(state.range(1));
    int const height = int(state.range(2));
    int const side = int(state.range(3));
    boost::shared_ptr<View> const view = bench::MakeView(kind, width, height, side);
    view->BuildMap();
    SimpleImageMap const& map = *view->GetImageMap();
    BenchFrame const source(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, size_t(side), size_t(side));
    BenchFrame destination(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, size_t(width), size_t(height));
    BenchFrame ours(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, size_t(width), size_t(height));
    OpenCvYuv420Remap opencv(map, source.image, destination.image);
    opencv();
    map.Remap(source.image, ours.image);
    if (destination.bytes != ours.bytes) {
        state.SkipWithError("OpenCV and SimpleImageMap disagree: not the same work");
        return;
    }
    for (auto _ : state) {
        opencv();
        benchmark::DoNotOptimize(destination.bytes.data());
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(int64_t(state.iterations()) * width * height);
    state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(destination.bytes.size()));
    auto const remap = [&] { map.Remap(source.image, ours.image); };
    bench::Turns const turns = bench::InTurns(20, opencv, remap);
    state.counters["opencv_ms"] = turns.first_ms;
    state.counters["vexmap_ms"] = turns.second_ms;
    state.counters["vexmap_speedup"] = turns.Ratio();
    std::vector<unsigned char> copy(ours.bytes.size());
    bench::Turns const bound = bench::InTurns(20, remap, [&] {
        std::memcpy(copy.data(), ours.bytes.data(), copy.size());
        benchmark::DoNotOptimize(copy.data());
    });
    state.counters["over_memcpy"] = bound.Ratio();
}
BENCHMARK(BM_OpenCv_RemapYuv420Planar)
    ->ArgNames({"view", "width", "height", "source"})
    ->Args({bench::PTZ, 1280, 720, 2880})
    ->Args({bench::PTZ, 1920, 1080, 1920})
    ->Args({bench::PTZ, 1920, 1080, 2880})
    ->Args({bench::PTZ, 1920, 1080, 4000})
    ->Args({bench::PTZ, 3840, 2160, 2880})
    ->Args({bench::PANORAMA, 1920, 1080, 2880})
    ->Args({bench::DUAL_PANORAMA, 1920, 1080, 2880})
    ->Args({bench::QUAD, 1920, 1080, 2880})
    ->Unit(benchmark::kMillisecond);
#endif

}  // namespace
}  // namespace quorvel::vexmap
