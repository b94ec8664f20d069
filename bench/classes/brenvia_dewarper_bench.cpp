// What the plug-in layer adds to a frame: mode 8 from GetImageOutputBuffer down to the remap,
// beside the bare remap of the same map. A 1920 x 1080 PTZ view of a 2880 x 2880 ceiling fisheye.
#include <algorithm>
#include <ctime>
#include <vector>

#include <benchmark/benchmark.h>

#include "BrenviaDewarper.h"
#include "in_turns.h"
#include "vexmap/channel.h"
#include "vexmap/view.h"

namespace {

constexpr int SOURCE_SIZE = 2880;
constexpr int OUTPUT_WIDTH = 1920;
constexpr int OUTPUT_HEIGHT = 1080;
constexpr int CEILING = 1;

/// Mode 8 with its channel in reach, its input fed and its map built by a first frame.
class ReadyDewarper : public BrenviaDewarper {
public:
    ReadyDewarper() : BrenviaDewarper(Params()) {
        SetDewarperType(DewarperType::DewarperBrenvia);
        unsigned char* input = nullptr;
        unsigned int size = 0;
        int format = 0;
        GetImageInputBuffer(SOURCE_SIZE, SOURCE_SIZE, &input, &size, &format);
        for (unsigned int i = 0; i < size; ++i) {
            input[i] = static_cast<unsigned char>(i * 7 + 3);
        }
        Frame();
    }
    static DewarpParams_t Params() {
        DewarpParams_t params;
        params.position = CEILING;
        return params;
    }
    unsigned char* Frame() {
        int width = OUTPUT_WIDTH;
        int height = OUTPUT_HEIGHT;
        unsigned char* output = nullptr;
        unsigned int size = 0;
        int format = 0;
        GetImageOutputBuffer(&width, &height, &output, &size, &format);
        return output;
    }
    /// One step of an operator's drag: the pan moves by a degree, round and round.
    void MoveOn() {
        pan_degrees = pan_degrees >= 179.0f ? -179.0f : pan_degrees + 1.0f;
        SetPosition(pan_degrees, 40.0f, 1.0f);
    }
    void* Channel() const { return channel; }
    unsigned char* Input() const { return inputBuffer; }

private:
    float pan_degrees = 0.0f;
};

_DEWARP_IMAGE Image(int width, int height, unsigned char* data) {
    _DEWARP_IMAGE image{};
    image.info.format = DEWARP_IMAGE_FORMAT_YUV420_PLANAR;
    image.info.width = std::size_t(width);
    image.info.height = std::size_t(height);
    image.info.stride = std::size_t(width);
    image.data = data;
    return image;
}

// The map of the view that the dewarper's channel holds: a handle is the channel itself.
boost::shared_ptr<quorvel::vexmap::SimpleImageMap> MapOf(void* channel) {
    using namespace quorvel::vexmap;
    boost::shared_ptr<AbstractView> const view = static_cast<Channel*>(channel)->GetViewObject();
    return dynamic_cast<View&>(*view).GetImageMap();
}

void SetPixels(benchmark::State& state) {
    state.SetItemsProcessed(int64_t(state.iterations()) * OUTPUT_WIDTH * OUTPUT_HEIGHT);
}

void BM_BrenviaDewarper_GetImageOutputBuffer(benchmark::State& state) {
    ReadyDewarper dewarper;
    for (auto _ : state) {
        benchmark::DoNotOptimize(dewarper.Frame());
        benchmark::ClobberMemory();
    }
    SetPixels(state);
}
BENCHMARK(BM_BrenviaDewarper_GetImageOutputBuffer)->Unit(benchmark::kMillisecond);

void BM_BrenviaDewarper_BareRemapOfTheSameMap(benchmark::State& state) {
    ReadyDewarper dewarper;
    boost::shared_ptr<quorvel::vexmap::SimpleImageMap> const map = MapOf(dewarper.Channel());
    std::vector<unsigned char> output(std::size_t(OUTPUT_WIDTH) * OUTPUT_HEIGHT * 3 / 2);
    _DEWARP_IMAGE const source = Image(SOURCE_SIZE, SOURCE_SIZE, dewarper.Input());
    _DEWARP_IMAGE destination = Image(OUTPUT_WIDTH, OUTPUT_HEIGHT, output.data());
    map->Remap(source, destination);
    unsigned char const* const through_plugin = dewarper.Frame();
    if (!std::equal(output.begin(), output.end(), through_plugin)) {
        state.SkipWithError("the bare remap differs from the dewarper's frame");
        return;
    }
    for (auto _ : state) {
        map->Remap(source, destination);
        benchmark::DoNotOptimize(output.data());
        benchmark::ClobberMemory();
    }
    SetPixels(state);
}
BENCHMARK(BM_BrenviaDewarper_BareRemapOfTheSameMap)->Unit(benchmark::kMillisecond);

// The two paths in turns, frame by frame, so that both meet the same state of a shared machine;
// `overhead_percent` compares the fastest frame of each.
void BM_BrenviaDewarper_OverheadInTurns(benchmark::State& state) {
    ReadyDewarper dewarper;
    boost::shared_ptr<quorvel::vexmap::SimpleImageMap> const map = MapOf(dewarper.Channel());
    std::vector<unsigned char> output(std::size_t(OUTPUT_WIDTH) * OUTPUT_HEIGHT * 3 / 2);
    _DEWARP_IMAGE const source = Image(SOURCE_SIZE, SOURCE_SIZE, dewarper.Input());
    _DEWARP_IMAGE destination = Image(OUTPUT_WIDTH, OUTPUT_HEIGHT, output.data());
    double best_plugin = 1e9;
    double best_bare = 1e9;
    for (auto _ : state) {
        double const start = quorvel::vexmap::bench::ThreadMilliseconds();
        benchmark::DoNotOptimize(dewarper.Frame());
        double const middle = quorvel::vexmap::bench::ThreadMilliseconds();
        map->Remap(source, destination);
        benchmark::DoNotOptimize(output.data());
        double const end = quorvel::vexmap::bench::ThreadMilliseconds();
        best_plugin = std::min(best_plugin, middle - start);
        best_bare = std::min(best_bare, end - middle);
    }
    state.counters["plugin_ms"] = best_plugin;
    state.counters["bare_ms"] = best_bare;
    state.counters["overhead_percent"] = (best_plugin - best_bare) / best_bare * 100.0;
}
BENCHMARK(BM_BrenviaDewarper_OverheadInTurns)->Iterations(200)->Unit(benchmark::kMillisecond);

// A frame while the operator drags: the position moves before every frame, so every frame
// builds the map anew and then remaps.
void BM_BrenviaDewarper_FrameDuringPan(benchmark::State& state) {
    ReadyDewarper dewarper;
    for (auto _ : state) {
        dewarper.MoveOn();
        benchmark::DoNotOptimize(dewarper.Frame());
        benchmark::ClobberMemory();
    }
    SetPixels(state);
}
BENCHMARK(BM_BrenviaDewarper_FrameDuringPan)->Unit(benchmark::kMillisecond);

// A frame during a pan and a steady frame, in turns: `pan_over_steady` compares the fastest of
// each, the figure that must stay at or below 2.
void BM_BrenviaDewarper_PanFrameInTurns(benchmark::State& state) {
    ReadyDewarper dewarper;
    quorvel::vexmap::bench::Turns turns;
    for (auto _ : state) {
        quorvel::vexmap::bench::Turns const round = quorvel::vexmap::bench::InTurns(
            1,
            [&] {
                dewarper.MoveOn();
                benchmark::DoNotOptimize(dewarper.Frame());
            },
            [&] { benchmark::DoNotOptimize(dewarper.Frame()); });
        turns.first_ms = std::min(turns.first_ms, round.first_ms);
        turns.second_ms = std::min(turns.second_ms, round.second_ms);
    }
    state.counters["pan_ms"] = turns.first_ms;
    state.counters["steady_ms"] = turns.second_ms;
    state.counters["pan_over_steady"] = turns.Ratio();
}
BENCHMARK(BM_BrenviaDewarper_PanFrameInTurns)->Iterations(100)->Unit(benchmark::kMillisecond);

}  // namespace
