// What an operator's move costs: one map build for the new position, timed by itself, and in turns
// with two yardsticks in the same binary: the former arithmetic, point by point through the
// chain (the plain reference of the tests), and, for the PTZ view, the per-pixel map of a
// general-purpose fisheye library when that library is present.
#include <benchmark/benchmark.h>
#include <boost/shared_ptr.hpp>

#include "bench_views.h"
#include "in_turns.h"
#include "reference_map.h"

#ifdef VEXMAP_BENCH_WITH_OPENCV
#include <opencv2/calib3d.hpp>
#include <opencv2/core.hpp>
#endif

namespace quorvel::vexmap::bench {
namespace {

constexpr int TURNS = 15;

void SetPixels(benchmark::State& state, int width, int height) {
    state.SetItemsProcessed(int64_t(state.iterations()) * width * height);
}

// The builder that the view's BuildMap runs, timed by itself; then in turns with the former
// arithmetic: `vexmap_share` is our time over the former one, the figure that must stay at or
// below 0.1.
void BM_View_BuildMap(benchmark::State& state) {
    ViewKind const kind = ViewKind(state.range(0));
    int const width = int(state.range(1));
    int const height = int(state.range(2));
    boost::shared_ptr<View> const view = MakeView(kind, width, height);
    for (auto _ : state) {
        view->BuildMap();
        benchmark::DoNotOptimize(view->GetImageMap().get());
    }
    SetPixels(state, width, height);
    Turns const turns = InTurns(
        TURNS, [&] { view->BuildMap(); },
        [&] { benchmark::DoNotOptimize(reference::MapOf(*view).words.data()); });
    state.counters["vexmap_ms"] = turns.first_ms;
    state.counters["former_ms"] = turns.second_ms;
    state.counters["vexmap_share"] = turns.Ratio();
}
BENCHMARK(BM_View_BuildMap)
    ->ArgNames({"view", "width", "height"})
    ->Args({PTZ, 1280, 720})
    ->Args({PTZ, 1920, 1080})
    ->Args({PTZ, 3840, 2160})
    ->Args({PANORAMA, 1920, 1080})
    ->Args({DUAL_PANORAMA, 1920, 1080})
    ->Args({QUAD, 1920, 1080})
    ->Unit(benchmark::kMillisecond);

// Every column through the chain, as the complete map of the engine's own users will have it.
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

#ifdef VEXMAP_BENCH_WITH_OPENCV
// The same view as MakeBenchPtzView: an equidistant lens (no distortion terms) of our focal
// length, turned 30 degrees about the vertical, into a rectilinear picture 90 degrees across.
class OpenCvFisheyeMap {
public:
    OpenCvFisheyeMap(int width_value, int height_value, int map_type_value)
        : width(width_value), height(height_value), map_type(map_type_value) {
        float const focal = MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_WALL)->GetFocalLength();
        double const centre = SOURCE_SIZE / 2.0;
        lens = cv::Matx33d(double(focal), 0, centre, 0, double(focal), centre, 0, 0, 1);
        double const turn = double(OFF_AXIS_DEGREES) * CV_PI / 180.0;
        rotation = cv::Matx33d(std::cos(turn), 0, -std::sin(turn), 0, 1, 0, std::sin(turn), 0,
                               std::cos(turn));
        double const out_focal = width / 2.0;  // tan(45 degrees) = 1
        view = cv::Matx33d(out_focal, 0, width / 2.0, 0, out_focal, height / 2.0, 0, 0, 1);
    }
    void operator()() {
        cv::fisheye::initUndistortRectifyMap(lens, cv::Vec4d(0, 0, 0, 0), rotation, view,
                                             cv::Size(width, height), map_type, map1, map2);
        benchmark::DoNotOptimize(map1.data);
    }

private:
    int width;
    int height;
    int map_type;
    cv::Matx33d lens;
    cv::Matx33d rotation;
    cv::Matx33d view;
    cv::Mat map1;
    cv::Mat map2;
};

// OpenCV's map timed by itself; then ours and OpenCV's in turns: `vexmap_share` is our time over
// OpenCV's, the figure that must stay at or below 0.1.
void BM_OpenCv_FisheyeInitUndistortRectifyMap(benchmark::State& state) {
    cv::setNumThreads(1);
    int const width = int(state.range(0));
    int const height = int(state.range(1));
    OpenCvFisheyeMap opencv(width, height, int(state.range(2)));
    for (auto _ : state) {
        opencv();
    }
    SetPixels(state, width, height);
    SinglePtzView view = MakeBenchPtzView(width, height);
    Turns const turns = InTurns(
        TURNS, [&] { view.BuildMap(); }, [&] { opencv(); });
    state.counters["vexmap_ms"] = turns.first_ms;
    state.counters["opencv_ms"] = turns.second_ms;
    state.counters["vexmap_share"] = turns.Ratio();
}
BENCHMARK(BM_OpenCv_FisheyeInitUndistortRectifyMap)
    ->ArgNames({"width", "height", "type"})
    ->Args({1280, 720, CV_32FC1})
    ->Args({1920, 1080, CV_32FC1})
    ->Args({1920, 1080, CV_16SC2})
    ->Args({3840, 2160, CV_32FC1})
    ->Unit(benchmark::kMillisecond);
#endif

}  // namespace
}  // namespace quorvel::vexmap::bench
