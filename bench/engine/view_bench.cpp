// What an operator's move costs: one map build for the new position, beside the per-pixel map
// of a general-purpose fisheye library for the same view when that library is present.
#include <benchmark/benchmark.h>

#include "bench_views.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/quad_ptz_view.h"

#ifdef VEXMAP_BENCH_WITH_OPENCV
#include <opencv2/calib3d.hpp>
#include <opencv2/core.hpp>
#endif

namespace quorvel::vexmap::bench {
namespace {

void SetPixels(benchmark::State& state, int width, int height) {
    state.SetItemsProcessed(int64_t(state.iterations()) * width * height);
}

void BM_View_BuildEighthMap(benchmark::State& state) {
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    SinglePtzView view = MakeBenchPtzView(width, height);
    for (auto _ : state) {
        view.BuildEighthMap();
        benchmark::DoNotOptimize(view.GetImageMap().get());
    }
    SetPixels(state, width, height);
}
BENCHMARK(BM_View_BuildEighthMap)
    ->Args({1920, 1080})
    ->Args({3840, 2160})
    ->Unit(benchmark::kMillisecond);

void BM_View_BuildWholeMap(benchmark::State& state) {
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    SinglePtzView view = MakeBenchPtzView(width, height);
    for (auto _ : state) {
        view.BuildWholeMap();
        benchmark::DoNotOptimize(view.GetImageMap().get());
    }
    SetPixels(state, width, height);
}
BENCHMARK(BM_View_BuildWholeMap)->Args({1920, 1080})->Unit(benchmark::kMillisecond);

void BM_DualPanoramicView_BuildDualMap(benchmark::State& state) {
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    DualPanoramicView view(MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                           DEWARP_PROJECTION_CYLINDRICAL);
    view.SetDewarpedSize(Resolution(width, height));
    for (auto _ : state) {
        view.BuildDualMap();
        benchmark::DoNotOptimize(view.GetImageMap().get());
    }
    SetPixels(state, width, height);
}
BENCHMARK(BM_DualPanoramicView_BuildDualMap)->Args({1920, 1080})->Unit(benchmark::kMillisecond);

void BM_QuadPtzView_BuildQuadMap(benchmark::State& state) {
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    QuadPtzView view(MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetDewarpedSize(Resolution(width, height));
    for (auto _ : state) {
        view.BuildQuadMap();
        benchmark::DoNotOptimize(view.GetImageMap().get());
    }
    SetPixels(state, width, height);
}
BENCHMARK(BM_QuadPtzView_BuildQuadMap)->Args({1920, 1080})->Unit(benchmark::kMillisecond);

#ifdef VEXMAP_BENCH_WITH_OPENCV
// The same view as MakeBenchPtzView: an equidistant lens (no distortion terms) of our focal
// length, turned 30 degrees about the vertical, into a rectilinear picture 90 degrees across.
void BM_OpenCv_FisheyeInitUndistortRectifyMap(benchmark::State& state) {
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    int const map_type = int(state.range(2));
    float const focal = MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_WALL)->GetFocalLength();
    double const centre = SOURCE_SIZE / 2.0;
    cv::Matx33d const lens(double(focal), 0, centre, 0, double(focal), centre, 0, 0, 1);
    cv::Vec4d const distortion(0, 0, 0, 0);
    double const turn = double(OFF_AXIS_DEGREES) * CV_PI / 180.0;
    cv::Matx33d const rotation(std::cos(turn), 0, -std::sin(turn), 0, 1, 0, std::sin(turn), 0,
                               std::cos(turn));
    double const out_focal = width / 2.0;  // tan(45 degrees) = 1
    cv::Matx33d const view(out_focal, 0, width / 2.0, 0, out_focal, height / 2.0, 0, 0, 1);
    cv::Mat map1;
    cv::Mat map2;
    for (auto _ : state) {
        cv::fisheye::initUndistortRectifyMap(lens, distortion, rotation, view,
                                             cv::Size(width, height), map_type, map1, map2);
        benchmark::DoNotOptimize(map1.data);
    }
    SetPixels(state, width, height);
}
BENCHMARK(BM_OpenCv_FisheyeInitUndistortRectifyMap)
    ->Args({1920, 1080, CV_32FC1})
    ->Args({1920, 1080, CV_16SC2})
    ->Unit(benchmark::kMillisecond);
#endif

}  // namespace
}  // namespace quorvel::vexmap::bench
