// A host with threads of its own: one frame in two bands of rows on two threads, through one
// prepared channel, beside the same frame as one band on one thread.
#include <atomic>
#include <chrono>
#include <thread>
#include <vector>

#include <benchmark/benchmark.h>

#include "bench_views.h"
#include "vexmap/dewarp.h"

namespace quorvel::vexmap::bench {
namespace {

constexpr std::size_t OUTPUT_WIDTH = 1920;
constexpr std::size_t OUTPUT_HEIGHT = 1080;
constexpr int TURNS = 30;

double WallMilliseconds() {
    return std::chrono::duration<double, std::milli>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

/// A YUV 4:2:0 frame that owns its pixels.
struct Frame {
    Frame(std::size_t width, std::size_t height) : pixels(width * height * 3 / 2) {
        image.info = {DEWARP_IMAGE_FORMAT_YUV420_PLANAR, width, height, width};
        image.data = pixels.data();
        for (std::size_t i = 0; i < pixels.size(); ++i) {
            pixels[i] = static_cast<unsigned char>(i * 7 + i / width * 13);
        }
    }
    std::vector<unsigned char> pixels;
    _DEWARP_IMAGE image;
};

/// A second thread that dewarps the lower band each time it is asked, and says when it is done.
class BandWorker {
public:
    BandWorker(void* channel_value, Frame const& source_value, Frame& output_value)
        : channel(channel_value),
          source(source_value),
          output(output_value),
          thread([this] { Run(); }) {}
    BandWorker(BandWorker const&) = delete;
    BandWorker& operator=(BandWorker const&) = delete;
    ~BandWorker() {
        asked.store(-1);
        thread.join();
    }
    void Start() { asked.fetch_add(1); }
    void Wait() const {
        while (done.load() != asked.load()) {
        }
    }

private:
    void Run() {
        int seen = 0;
        for (;;) {
            int const now = asked.load();
            if (now < 0) {
                return;
            }
            if (now != seen) {
                dewarp_image_rows(channel, &source.image, &output.image, OUTPUT_HEIGHT / 2,
                                  OUTPUT_HEIGHT / 2);
                seen = now;
                done.store(now);
            }
        }
    }

    void* channel;
    Frame const& source;
    Frame& output;
    std::atomic<int> asked{0};
    std::atomic<int> done{0};
    std::thread thread;
};

// `two_over_one` is the elapsed time of the frame in two bands on two threads over that of the
// frame in one band, the fastest of each from runs in turns: at most 0.6 on two free cores.
void BM_Channel_TwoBandsOnTwoThreads(benchmark::State& state) {
    _DEWARP_INTERNAL_CAMERA_MODEL const model = BenchModel();
    void* const channel =
        dewarp_internal_open(&model, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, nullptr);
    Frame const source(SOURCE_SIZE, SOURCE_SIZE);
    Frame output(OUTPUT_WIDTH, OUTPUT_HEIGHT);
    if (channel == nullptr || dewarp_prepare_image(channel, &output.image.info) != 0) {
        state.SkipWithError("the channel could not be prepared");
        return;
    }
    BandWorker worker(channel, source, output);
    auto two_bands = [&] {
        worker.Start();
        dewarp_image_rows(channel, &source.image, &output.image, 0, OUTPUT_HEIGHT / 2);
        worker.Wait();
    };
    for (auto _ : state) {
        two_bands();
    }
    state.SetItemsProcessed(int64_t(state.iterations()) * int64_t(OUTPUT_WIDTH * OUTPUT_HEIGHT));
    double one = 1e9;
    double two = 1e9;
    for (int turn = 0; turn < TURNS; ++turn) {
        double const start = WallMilliseconds();
        dewarp_image_rows(channel, &source.image, &output.image, 0, OUTPUT_HEIGHT);
        double const middle = WallMilliseconds();
        two_bands();
        double const end = WallMilliseconds();
        one = std::min(one, middle - start);
        two = std::min(two, end - middle);
    }
    state.counters["one_band_ms"] = one;
    state.counters["two_bands_ms"] = two;
    state.counters["two_over_one"] = two / one;
    dewarp_close(channel);
}
BENCHMARK(BM_Channel_TwoBandsOnTwoThreads)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
}  // namespace quorvel::vexmap::bench
