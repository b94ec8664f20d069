#include <atomic>
#include <cstddef>
#include <memory>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "vexmap/channel.h"
#include "vexmap/error.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace quorvel::vexmap {
namespace {

constexpr std::size_t SOURCE_SIZE = 640;
constexpr std::size_t OUTPUT_WIDTH = 320;
constexpr std::size_t OUTPUT_HEIGHT = 240;
constexpr int FRAMES_PER_THREAD = 24;

using Picture = std::vector<unsigned char>;

/// A YUV 4:2:0 frame that owns its pixels, numbered so that neighbouring source pixels differ.
class Frame {
public:
    Frame(std::size_t width, std::size_t height) : pixels(width * height * 3 / 2) {
        image.info = {DEWARP_IMAGE_FORMAT_YUV420_PLANAR, width, height, width};
        image.data = pixels.data();
        for (std::size_t index = 0; index < pixels.size(); ++index) {
            pixels[index] = static_cast<unsigned char>(index * 7 + index / width * 13);
        }
    }
    Frame(Frame const&) = delete;
    Frame& operator=(Frame const&) = delete;

    Picture const& Pixels() const { return pixels; }

    _DEWARP_IMAGE const& Image() const { return image; }
    _DEWARP_IMAGE& Image() { return image; }

private:
    _DEWARP_IMAGE image;
    Picture pixels;
};

_DEWARP_INTERNAL_CAMERA_MODEL SmallLens() {
    _DEWARP_INTERNAL_CAMERA_MODEL model = TarvexBrenvia418;
    model.width = SOURCE_SIZE;
    model.height = SOURCE_SIZE;
    return model;
}

// The positions a mover cycles through; each gives its own picture in every view below.
std::vector<_DEWARP_PTZ_POSITION> const POSITIONS = {{0.0f, -45.0f, 0.0f, 1.0f},
                                                     {60.0f, -60.0f, 0.0f, 2.0f},
                                                     {-120.0f, -30.0f, 0.0f, 1.5f},
                                                     {170.0f, -80.0f, 0.0f, 3.0f}};

_DEWARP_VIEW const VIEWS[] = {DEWARP_VIEW_SINGLE_PTZ, DEWARP_VIEW_QUAD_PTZ,
                              DEWARP_VIEW_SINGLE_PANORAMIC};
constexpr std::size_t CHANNELS = sizeof VIEWS / sizeof VIEWS[0];

std::vector<Picture> SingleThreadedPictures(_DEWARP_VIEW view, Frame const& source) {
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    channel.SetView(view);
    Frame output(OUTPUT_WIDTH, OUTPUT_HEIGHT);
    std::vector<Picture> pictures;
    for (_DEWARP_PTZ_POSITION position : POSITIONS) {
        channel.SetPtz(position);
        channel.DewarpImage(source.Image(), output.Image());
        pictures.push_back(output.Pixels());
    }
    return pictures;
}

/// What one frame saw: the moves finished before it and started after it bracket the position
/// that it was remapped at, as a move is counted as started before it locks and as finished
/// after it unlocks.
struct Seen {
    long finished_before;
    long started_after;
    long matched;  // the move whose picture the frame equals, or -1
};

TEST(Channel, FramesOnSeveralChannelsWhilePositionsMoveMatchASingleThreadedRun) {
    Frame const source(SOURCE_SIZE, SOURCE_SIZE);
    std::vector<std::vector<Picture>> expected;
    for (_DEWARP_VIEW view : VIEWS) {
        expected.push_back(SingleThreadedPictures(view, source));
        for (std::size_t a = 0; a < POSITIONS.size(); ++a) {
            for (std::size_t b = a + 1; b < POSITIONS.size(); ++b) {
                ASSERT_NE(expected.back()[a], expected.back()[b]) << "view " << view;
            }
        }
    }

    std::vector<std::unique_ptr<Channel>> channels;
    for (_DEWARP_VIEW view : VIEWS) {
        channels.push_back(
            std::make_unique<Channel>(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
        channels.back()->SetView(view);
        _DEWARP_PTZ_POSITION first = POSITIONS[0];
        channels.back()->SetPtz(first);  // move 0
    }
    std::atomic<long> started[CHANNELS] = {};
    std::atomic<long> finished[CHANNELS] = {};
    std::atomic<long> frames_done[CHANNELS] = {};
    std::atomic<std::size_t> threads_done(0);
    std::vector<std::vector<Seen>> seen(CHANNELS);

    std::vector<std::thread> threads;
    for (std::size_t c = 0; c < CHANNELS; ++c) {
        threads.emplace_back([&, c]() {
            Frame output(OUTPUT_WIDTH, OUTPUT_HEIGHT);
            for (int frame = 0; frame < FRAMES_PER_THREAD; ++frame) {
                long const before = finished[c].load();
                channels[c]->DewarpImage(source.Image(), output.Image());
                long const after = started[c].load();
                long matched = -1;
                for (long move = before; move <= after && matched < 0; ++move) {
                    if (output.Pixels() == expected[c][std::size_t(move) % POSITIONS.size()]) {
                        matched = move;
                    }
                }
                seen[c].push_back({before, after, matched});
                ++frames_done[c];
                // The next frame waits for the mover to start a move, not to finish it, so that
                // the move may land before, during or after that frame.
                while (frame + 1 < FRAMES_PER_THREAD && started[c].load() <= frame) {
                    std::this_thread::yield();
                }
            }
            ++threads_done;
        });
    }
    // The mover moves a channel once its frame thread has done a frame since the last move: one
    // move a frame, on another thread than the frames.
    threads.emplace_back([&]() {
        long moved_at[CHANNELS] = {};
        while (threads_done.load() < CHANNELS) {
            for (std::size_t c = 0; c < CHANNELS; ++c) {
                long const done = frames_done[c].load();
                if (done > moved_at[c]) {
                    moved_at[c] = done;
                    long const move = started[c].load() + 1;
                    _DEWARP_PTZ_POSITION position = POSITIONS[std::size_t(move) % POSITIONS.size()];
                    started[c] = move;
                    channels[c]->SetPtz(position);
                    finished[c] = move;
                }
            }
            std::this_thread::yield();
        }
    });
    for (std::thread& thread : threads) {
        thread.join();
    }

    for (std::size_t c = 0; c < CHANNELS; ++c) {
        ASSERT_EQ(std::size_t(FRAMES_PER_THREAD), seen[c].size());
        for (std::size_t frame = 0; frame < seen[c].size(); ++frame) {
            Seen const& s = seen[c][frame];
            EXPECT_LE(0, s.matched) << "channel " << c << ", frame " << frame << ": moves "
                                    << s.finished_before << " to " << s.started_after;
            if (s.finished_before == s.started_after) {
                EXPECT_EQ(s.finished_before, s.matched) << "channel " << c << ", frame " << frame;
            }
        }
    }
}

TEST(Channel, SeveralThreadsRemappingOneChannelAtOnceMakeIdenticalPictures) {
    Frame const source(SOURCE_SIZE, SOURCE_SIZE);
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    channel.SetView(DEWARP_VIEW_SINGLE_PTZ);
    _DEWARP_PTZ_POSITION position = POSITIONS[1];
    channel.SetPtz(position);
    Frame first(OUTPUT_WIDTH, OUTPUT_HEIGHT);
    ASSERT_TRUE(channel.DewarpImage(source.Image(), first.Image()));  // builds view and map

    constexpr std::size_t THREADS = 4;
    std::atomic<int> mismatches[THREADS] = {};
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < THREADS; ++t) {
        threads.emplace_back([&, t]() {
            Frame output(OUTPUT_WIDTH, OUTPUT_HEIGHT);
            for (int frame = 0; frame < FRAMES_PER_THREAD; ++frame) {
                if (!channel.DewarpImage(source.Image(), output.Image()) ||
                    output.Pixels() != first.Pixels()) {
                    ++mismatches[t];
                }
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (std::size_t t = 0; t < THREADS; ++t) {
        EXPECT_EQ(0, mismatches[t].load()) << "thread " << t;
    }
}

// A host's own threads share each frame out in bands of rows, all through one prepared channel at
// once, while another thread moves the view between frames: every band either draws from the
// map of a whole position or is refused until the channel is prepared again, and a frame whose
// bands all ran between two moves is the single-threaded frame of that position.
TEST(Channel, BandsOfOneFrameOnSeveralThreadsWhileTheViewMovesMatchOneThread) {
    Frame const source(SOURCE_SIZE, SOURCE_SIZE);
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    channel.SetView(DEWARP_VIEW_SINGLE_PTZ);
    std::vector<Picture> expected;
    for (_DEWARP_PTZ_POSITION position : POSITIONS) {
        channel.SetPtz(position);
        Frame frame(OUTPUT_WIDTH, OUTPUT_HEIGHT);
        ASSERT_TRUE(channel.DewarpImage(source.Image(), frame.Image()));
        expected.push_back(frame.Pixels());
    }

    constexpr std::size_t BANDS = 4;
    constexpr std::size_t BAND_ROWS = OUTPUT_HEIGHT / BANDS;
    int matched = 0;
    for (int round = 0; round < FRAMES_PER_THREAD; ++round) {
        std::size_t const at = std::size_t(round) % POSITIONS.size();
        _DEWARP_PTZ_POSITION position = POSITIONS[at];
        channel.SetPtz(position);
        Frame output(OUTPUT_WIDTH, OUTPUT_HEIGHT);
        std::atomic<int> refused{0};
        std::atomic<bool> go{false};
        std::vector<std::thread> bands;
        for (std::size_t band = 0; band < BANDS; ++band) {
            bands.emplace_back([&, band]() {
                while (!go.load()) {
                    std::this_thread::yield();
                }
                try {
                    channel.DewarpImageRows(source.Image(), output.Image(), band * BAND_ROWS,
                                            BAND_ROWS);
                } catch (Error const&) {
                    ++refused;  // the mover dropped the map before this band ran
                }
            });
        }
        // Half the rounds move the view while the bands may be running.
        std::thread mover([&]() {
            while (!go.load()) {
                std::this_thread::yield();
            }
            if (round % 2 == 1) {
                _DEWARP_PTZ_POSITION next = POSITIONS[(at + 1) % POSITIONS.size()];
                channel.SetPtz(next);
            }
        });
        ASSERT_TRUE(channel.PrepareImage(output.Image().info));
        go = true;
        for (std::thread& band : bands) {
            band.join();
        }
        mover.join();
        if (refused.load() == 0 && round % 2 == 0) {
            EXPECT_EQ(expected[at], output.Pixels()) << "round " << round;
            ++matched;
        }
    }
    EXPECT_EQ(FRAMES_PER_THREAD / 2, matched);
}

}  // namespace
}  // namespace quorvel::vexmap
