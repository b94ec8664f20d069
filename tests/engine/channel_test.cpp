#include "vexmap/channel.h"

#include <atomic>
#include <cerrno>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <limits>
#include <memory>
#include <vector>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/ptz_position.h"
#include "vexmap/ptz_range.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/read_write_mutex.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/view.h"

// Allocations are counted at malloc: operator new is replaced elsewhere in this binary, and that
// replacement, like every other allocation of the process, ends there. AddressSanitizer brings
// its own malloc, and replacing it would blind the sanitizer for the whole binary, so under it the
// counting is left out and its test skips.
#if defined(__SANITIZE_ADDRESS__)
#define VEXMAP_TEST_UNDER_ASAN 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define VEXMAP_TEST_UNDER_ASAN 1
#endif
#endif

#ifndef VEXMAP_TEST_UNDER_ASAN

namespace {

// Counts the allocations of every thread while counting is on, and apart those of a megabyte or
// more: a map's table.
std::atomic<bool> g_counting(false);
std::atomic<long> g_allocations(0);
std::atomic<long> g_large_allocations(0);

void CountAllocation(std::size_t size) {
    if (g_counting.load()) {
        g_allocations.fetch_add(1);
        if (size >= (std::size_t(1) << 20)) {
            g_large_allocations.fetch_add(1);
        }
    }
}

}  // namespace

// glibc's own allocator, which a replacement malloc may call. The four are replaced together, as
// glibc asks, and each goes straight to its own.
extern "C" {
// NOLINTBEGIN(bugprone-reserved-identifier): glibc's names for its allocator
void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* memory, std::size_t size);
void __libc_free(void* memory);
// NOLINTEND(bugprone-reserved-identifier)

__attribute__((visibility("default"))) void* malloc(std::size_t size) noexcept {
    CountAllocation(size);
    return __libc_malloc(size);
}

__attribute__((visibility("default"))) void* calloc(std::size_t count, std::size_t size) noexcept {
    CountAllocation(count * size);
    return __libc_calloc(count, size);
}

__attribute__((visibility("default"))) void* realloc(void* memory, std::size_t size) noexcept {
    CountAllocation(size);
    return __libc_realloc(memory, size);
}

__attribute__((visibility("default"))) void free(void* memory) noexcept {
    __libc_free(memory);
}
}

#endif

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

/// Reaches the protected state of a channel for the tests.
class TestChannel : public Channel {
public:
    TestChannel() = default;
    explicit TestChannel(_DEWARP_CHANNEL_SETTINGS const& settings) : Channel(settings) {}
    TestChannel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount)
        : Channel(model, mount) {}
    TestChannel(TestChannel const& other) = default;
    TestChannel& operator=(TestChannel const& other) = default;
    ~TestChannel() override = default;

    boost::shared_ptr<ReadWriteMutex> Mutex() const { return m_pMutex; }
    boost::shared_ptr<Camera> CameraObject() const { return m_pCamera; }
    boost::shared_ptr<AbstractView> CurrentView() const { return m_pView; }
    std::size_t CacheSize() const { return m_Cache.Size(); }
    void ForgetCache() { m_Cache.Clear(); }
};

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

    std::vector<unsigned char> const& Pixels() const { return pixels; }

    _DEWARP_IMAGE const& Image() const { return image; }
    _DEWARP_IMAGE& Image() { return image; }

private:
    _DEWARP_IMAGE image;
    std::vector<unsigned char> pixels;
};

// The built-in lens on a sensor of the given size, as the plug-in opens it for a stream.
_DEWARP_INTERNAL_CAMERA_MODEL Lens(std::size_t size) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = TarvexBrenvia418;
    model.width = size;
    model.height = size;
    return model;
}

_DEWARP_INTERNAL_CAMERA_MODEL SmallLens() {
    return Lens(640);
}

_DEWARP_CHANNEL_SETTINGS const SomeSettings{DEWARP_VIEW_QUAD_PTZ, DEWARP_PROJECTION_MERCATOR,
                                            DEWARP_ASPECT_RATIO_FIT, DEWARP_INTERPOLATION_2};

void ExpectSamePosition(_DEWARP_PTZ_POSITION const& expected, _DEWARP_PTZ_POSITION const& actual) {
    EXPECT_EQ(expected.pan, actual.pan);
    EXPECT_EQ(expected.tilt, actual.tilt);
    EXPECT_EQ(expected.roll, actual.roll);
    EXPECT_EQ(expected.zoom, actual.zoom);
}

void ExpectInvalidCamera(std::vector<RecordingLogSink::Line> const& lines) {
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - The camera object was invalid\n", lines[0].text);
}

// Constructors

TEST(Channel, DefaultConstructorTakesTheDefaultsAndHasNoCamera) {
    TestChannel const channel;
    EXPECT_EQ(Defaults::View, channel.GetView());
    EXPECT_EQ(Defaults::Projection, channel.GetProjection());
    EXPECT_EQ(Defaults::Interpolation, channel.GetInterpolation());
    EXPECT_EQ(Defaults::AspectRatio, channel.GetAspectRatio());
    EXPECT_EQ(Defaults::CameraMount, channel.GetMount());
    EXPECT_EQ(nullptr, channel.CameraObject());
    EXPECT_NE(nullptr, channel.Mutex());
}

TEST(Channel, WithoutCameraGetSettingsThrowsInvalidCameraYetGetViewAnswersTheDefault) {
    TestChannel const channel;
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    _DEWARP_CHANNEL_SETTINGS settings = SomeSettings;
    errno = 0;
    EXPECT_THAT([&]() { channel.GetSettings(settings); },
                ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid camera")));
    EXPECT_EQ(EFAULT, errno);
    ExpectInvalidCamera(sink.Lines());
    EXPECT_EQ(SomeSettings.view, settings.view);  // the record is not touched
    EXPECT_EQ(Defaults::View, channel.GetView());
}

TEST(Channel, SettingsConstructorTakesTheRecordAndNoCamera) {
    TestChannel const channel(SomeSettings);
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, channel.GetView());
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, channel.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, channel.GetAspectRatio());
    EXPECT_EQ(DEWARP_INTERPOLATION_2, channel.GetInterpolation());
    EXPECT_EQ(nullptr, channel.CameraObject());
}

TEST(Channel, ModelConstructorBuildsTheCameraAndTakesItsDefaults) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    TestChannel const channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_NE(nullptr, channel.CameraObject());
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, channel.GetMount());
    EXPECT_EQ(Defaults::View, channel.GetView());
    EXPECT_EQ(Defaults::Interpolation, channel.GetInterpolation());
    EXPECT_EQ(channel.CameraObject()->GetDefaultAspectRatio(), channel.GetAspectRatio());
    EXPECT_EQ(channel.CameraObject()->GetDefaultProjection(), channel.GetProjection());
    auto const lines = sink.Lines();
    ASSERT_FALSE(lines.empty());
    EXPECT_EQ("VEXMAP: INFO - Camera type is circular fish eye\n", lines[0].text);
}

TEST(Channel, ModelAndSettingsConstructorTakesTheRecord) {
    _DEWARP_CHANNEL_SETTINGS const settings{DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                                            DEWARP_ASPECT_RATIO_FILL, DEWARP_INTERPOLATION_0};
    Channel const channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, settings);
    EXPECT_EQ(DEWARP_VIEW_SINGLE_PTZ, channel.GetView());
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR, channel.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, channel.GetAspectRatio());
    EXPECT_EQ(DEWARP_INTERPOLATION_0, channel.GetInterpolation());
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, channel.GetMount());
    EXPECT_EQ(640u, channel.GetModel().width);
}

TEST(Channel, ModelOfAnUnknownTypeLeavesNoCamera) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = SmallLens();
    model.type = static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(2);
    TestChannel const channel(model, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_EQ(nullptr, channel.CameraObject());
    EXPECT_EQ(Defaults::Projection, channel.GetProjection());
    EXPECT_EQ(Defaults::AspectRatio, channel.GetAspectRatio());
}

TEST(Channel, ConstructorsAndGettersBuildNoView) {
    TestChannel const channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    channel.GetView();
    channel.GetProjection();
    channel.GetInterpolation();
    channel.GetAspectRatio();
    channel.GetModel();
    channel.GetMount();
    EXPECT_EQ(nullptr, channel.CurrentView());
    EXPECT_EQ(0u, channel.CacheSize());
}

// Model

TEST(Channel, SetModelGivesANewViewObjectOnTheDefaultMount) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const before = channel.GetViewObject();
    EXPECT_TRUE(channel.SetModel(SmallLens()));
    EXPECT_NE(before, channel.CurrentView());
    EXPECT_NE(nullptr, channel.CurrentView());
    EXPECT_EQ(Defaults::CameraMount, channel.GetMount());
}

TEST(Channel, SetModelDropsEveryViewAndBuildsTheCurrentOneForTheNewCamera) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_QUAD_PTZ));
    boost::shared_ptr<Camera> const old_camera = channel.CameraObject();
    EXPECT_TRUE(channel.SetModel(Lens(1936), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    EXPECT_EQ(1u, channel.CacheSize());
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_EQ(channel.CameraObject().get(), &channel.CurrentView()->GetCamera());
    EXPECT_NE(old_camera, channel.CameraObject());
    EXPECT_EQ(1, old_camera.use_count());  // no view of the old camera is left
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, channel.GetMount());
    EXPECT_EQ(1936u, channel.GetModel().width);
}

TEST(Channel, SetModelGivesAChannelWithoutCameraItsFirstView) {
    TestChannel channel;
    EXPECT_TRUE(channel.SetModel(SmallLens()));
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_NE(nullptr, dynamic_cast<SinglePanoramicView*>(channel.CurrentView().get()));
}

TEST(Channel, GetModelAnswersTheModelAsGiven) {
    _DEWARP_INTERNAL_CAMERA_MODEL const model = Lens(1000);
    Channel const channel(model, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    _DEWARP_INTERNAL_CAMERA_MODEL const answer = channel.GetModel();
    EXPECT_EQ(model.type, answer.type);
    EXPECT_EQ(model.diagonal_fov, answer.diagonal_fov);
    EXPECT_EQ(model.horizontal_fov, answer.horizontal_fov);
    EXPECT_EQ(model.vertical_fov, answer.vertical_fov);
    EXPECT_EQ(model.width, answer.width);
    EXPECT_EQ(model.height, answer.height);
}

TEST(Channel, GetModelWithoutCameraLogsAndThrowsInvalidCamera) {
    Channel const channel;
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    errno = 0;
    EXPECT_THAT([&channel]() { channel.GetModel(); },
                ThrowsMessage<Error>(HasSubstr("(Channel::GetModel@src/channel:")));
    EXPECT_EQ(EFAULT, errno);
    ExpectInvalidCamera(sink.Lines());
}

// View and projection

TEST(Channel, SetViewBuildsTheKindAndMakesItCurrent) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_TRUE(channel.SetView(DEWARP_VIEW_QUAD_PTZ));
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, channel.GetView());
    EXPECT_NE(nullptr, dynamic_cast<QuadPtzView*>(channel.CurrentView().get()));
    EXPECT_EQ(1u, channel.CacheSize());
}

TEST(Channel, ReturningToAViewKindFindsTheSameViewObject) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_QUAD_PTZ));
    boost::shared_ptr<AbstractView> const first = channel.CurrentView();
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_NE(first, channel.CurrentView());
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_QUAD_PTZ));
    EXPECT_EQ(first, channel.CurrentView());
    EXPECT_EQ(2u, channel.CacheSize());
}

TEST(Channel, SetViewHandsTheCurrentAspectRatioToACachedView) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const ptz = channel.CurrentView();
    EXPECT_EQ(Defaults::AspectRatio, ptz->GetAspectRatio());
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PANORAMIC));
    ASSERT_TRUE(channel.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT));
    EXPECT_EQ(Defaults::AspectRatio, ptz->GetAspectRatio());  // not current, not told
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, ptz->GetAspectRatio());
}

TEST(Channel, SetViewWithAnUnknownKindThrowsAndKeepsTheCurrentView) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const current = channel.CurrentView();
    EXPECT_THAT([&channel]() { channel.SetView(static_cast<_DEWARP_VIEW>(4)); },
                ThrowsMessage<Error>(HasSubstr("Invalid view")));
    EXPECT_EQ(DEWARP_VIEW_SINGLE_PTZ, channel.GetView());
    EXPECT_EQ(current, channel.CurrentView());
}

TEST(Channel, SetProjectionWithAnotherViewChangesTheViewKindToo) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PANORAMIC));
    EXPECT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR));
    EXPECT_EQ(DEWARP_VIEW_SINGLE_PTZ, channel.GetView());
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR, channel.GetProjection());
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_NE(nullptr, dynamic_cast<SinglePtzView*>(channel.CurrentView().get()));
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR, channel.CurrentView()->GetProjection());
}

TEST(Channel, AViewThatFailsToBuildLeavesTheChannelAsItWasEachTime) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const current = channel.CurrentView();
    for (int attempt = 0; attempt < 2; ++attempt) {
        EXPECT_THAT(
            [&channel]() {
                channel.SetProjection(DEWARP_VIEW_SINGLE_PANORAMIC, DEWARP_PROJECTION_RECTILINEAR);
            },
            ThrowsMessage<Error>(HasSubstr("Invalid projection for this orientation")));
        EXPECT_EQ(DEWARP_VIEW_SINGLE_PTZ, channel.GetView());
        EXPECT_EQ(Defaults::Projection, channel.GetProjection());
        EXPECT_EQ(current, channel.CurrentView());
        EXPECT_EQ(1u, channel.CacheSize());
    }
}

// Interpolation and aspect ratio

TEST(Channel, SetInterpolationOnAChannelWithoutCameraReturnsTrue) {
    Channel channel;
    EXPECT_TRUE(channel.SetInterpolation(DEWARP_INTERPOLATION_2));
    EXPECT_EQ(DEWARP_INTERPOLATION_2, channel.GetInterpolation());
}

TEST(Channel, SetAspectRatioWithoutCameraThrowsAndKeepsTheRatio) {
    Channel channel;
    EXPECT_THAT([&channel]() { channel.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT); },
                ThrowsMessage<Error>(HasSubstr("(Channel::GetViewObject@src/channel:")));
    EXPECT_EQ(Defaults::AspectRatio, channel.GetAspectRatio());
}

TEST(Channel, SetAspectRatioReachesTheCurrentView) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_TRUE(channel.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL));
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, channel.GetAspectRatio());
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, channel.CurrentView()->GetAspectRatio());
}

TEST(Channel, AViewFoundAgainThroughAMountChangeKeepsItsOwnAspectRatio) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const ceiling_view = channel.CurrentView();
    ASSERT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    ASSERT_TRUE(channel.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT));
    ASSERT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    EXPECT_EQ(ceiling_view, channel.CurrentView());
    EXPECT_EQ(Defaults::AspectRatio, ceiling_view->GetAspectRatio());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, channel.GetAspectRatio());
}

TEST(Channel, GetSettingsWritesAllFour) {
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_QUAD_PTZ, DEWARP_PROJECTION_RECTILINEAR));
    ASSERT_TRUE(channel.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT_WIDTH));
    ASSERT_TRUE(channel.SetInterpolation(DEWARP_INTERPOLATION_0));
    _DEWARP_CHANNEL_SETTINGS settings = SomeSettings;
    EXPECT_TRUE(channel.GetSettings(settings));
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, settings.view);
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR, settings.projection);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT_WIDTH, settings.aspect_ratio);
    EXPECT_EQ(DEWARP_INTERPOLATION_0, settings.interpolation);
}

TEST(Channel, GetNativeResolutionTruncatesTheViewsProjectionSize) {
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    _DEWARP_RESOLUTION resolution{0, 0};
    EXPECT_TRUE(channel.GetNativeResolution(resolution));
    Resolution const size = channel.GetViewObject()->GetProjectionSize();
    EXPECT_EQ(std::size_t(size.x), resolution.width);
    EXPECT_EQ(std::size_t(size.y), resolution.height);
    EXPECT_LT(0u, resolution.width);
}

TEST(Channel, GetNativeResolutionOfAnAbsurdLensIsHeldAtTheEndsOfTheCount) {
    // Next to no field of view across a wide sensor: a projection far beyond any 64-bit count.
    _DEWARP_INTERNAL_CAMERA_MODEL const absurd = {
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 94.6f, 1e-31f, 1e-31f, 3084, 500};
    Channel channel(absurd, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    _DEWARP_RESOLUTION resolution{1, 1};
    ASSERT_TRUE(channel.GetNativeResolution(resolution));
    Resolution const size = channel.GetViewObject()->GetProjectionSize();
    for (auto const& [side, count] : {std::pair<float, std::size_t>{size.x, resolution.width},
                                      std::pair<float, std::size_t>{size.y, resolution.height}}) {
        if (side >= 18446744073709551616.0f) {
            EXPECT_EQ(std::numeric_limits<std::size_t>::max(), count);
        } else {
            EXPECT_EQ(std::size_t(side), count);
        }
    }
}

// Mount

TEST(Channel, SetMountWithoutCameraLogsAndReturnsFalse) {
    Channel channel;
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_FALSE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - The camera was invalid\n", lines[0].text);
    EXPECT_EQ(Defaults::CameraMount, channel.GetMount());
}

TEST(Channel, SetMountMovesTheCameraAndBuildsTheCurrentViewForIt) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const ceiling_view = channel.CurrentView();
    EXPECT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, channel.GetMount());
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, channel.CameraObject()->GetMount());
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_NE(ceiling_view, channel.CurrentView());
    EXPECT_EQ(2u, channel.CacheSize());  // the ceiling's view stays
}

TEST(Channel, SetMountToTheSameMountFindsTheSameViewInTheCache) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const current = channel.CurrentView();
    EXPECT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    EXPECT_EQ(current, channel.CurrentView());
    EXPECT_EQ(1u, channel.CacheSize());
}

TEST(Channel, SetMountToTheSameMountStillDropsTheCurrentPointer) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const current = channel.CurrentView();
    channel.ForgetCache();  // only a dropped pointer can now lead to a new object
    EXPECT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_NE(current, channel.CurrentView());
}

// Position

TEST(Channel, SetPtzWritesTheLimitedPositionBack) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    float const too_small = 0.01f;
    _DEWARP_PTZ_POSITION position{20.0f, -60.0f, 0.0f, too_small};
    EXPECT_TRUE(channel.SetPtz(position));
    float const lowest = channel.CurrentView()->GetPtzRange().zoom.y;
    EXPECT_EQ(lowest, position.zoom);
    EXPECT_NE(too_small, position.zoom);
    ExpectSamePosition(channel.CurrentView()->GetPtz().Get(), position);
}

TEST(Channel, GetPtzAnswersThePositionThatSetPtzReturned) {
    Channel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    _DEWARP_PTZ_POSITION position{-45.0f, -50.0f, 0.0f, 2.5f};
    ASSERT_TRUE(channel.SetPtz(position));
    _DEWARP_PTZ_POSITION found{};
    EXPECT_TRUE(channel.GetPtz(found));
    ExpectSamePosition(position, found);
}

TEST(Channel, ResetPtzGoesBackToTheLimitedIdentity) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    _DEWARP_PTZ_POSITION position{-45.0f, -50.0f, 0.0f, 2.5f};
    ASSERT_TRUE(channel.SetPtz(position));
    EXPECT_TRUE(channel.ResetPtz());
    _DEWARP_PTZ_POSITION found{};
    channel.GetPtz(found);
    ExpectSamePosition(channel.CurrentView()->LimitPtz(PtzPosition::Identity).Get(), found);
}

TEST(Channel, GetPtzRangeConvertsTheViewsRange) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    _DEWARP_PTZ_RANGE range{};
    EXPECT_TRUE(channel.GetPtzRange(range));
    _DEWARP_PTZ_RANGE const expected = channel.CurrentView()->GetPtzRange().Get();
    EXPECT_EQ(expected.pan_min, range.pan_min);
    EXPECT_EQ(expected.pan_max, range.pan_max);
    EXPECT_EQ(expected.tilt_min, range.tilt_min);
    EXPECT_EQ(expected.tilt_max, range.tilt_max);
    EXPECT_EQ(expected.roll_min, range.roll_min);
    EXPECT_EQ(expected.roll_max, range.roll_max);
    EXPECT_EQ(expected.zoom_min, range.zoom_min);
    EXPECT_EQ(expected.zoom_max, range.zoom_max);
}

TEST(Channel, CalcPtzPositionAnswersTheViewsResultAndMovesNothing) {
    // On a wall: a ceiling camera's hit points are not numbers, by that camera's design.
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    Vector2d const point(400.0f, 250.0f);
    _DEWARP_PTZ_POSITION position{};
    EXPECT_TRUE(channel.CalcPtzPosition(point, 2.0f, position));
    EXPECT_TRUE(std::isfinite(position.pan) && std::isfinite(position.tilt));
    ExpectSamePosition(channel.CurrentView()->CalcPtzPosition(point, 2.0f).Get(), position);
    EXPECT_EQ(PtzPosition::Identity, channel.CurrentView()->GetPtz());
}

// Frames

TEST(Channel, DewarpImageBuildsTheCurrentViewAndFillsTheOutput) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    Frame const source(640, 640);
    Frame output(320, 240);
    std::vector<unsigned char> const before = output.Pixels();
    EXPECT_TRUE(channel.DewarpImage(source.Image(), output.Image()));
    ASSERT_NE(nullptr, channel.CurrentView());
    EXPECT_NE(before, output.Pixels());
}

TEST(Channel, DewarpImageWithoutCameraThrowsInvalidCamera) {
    Channel channel;
    Frame const source(64, 64);
    Frame output(32, 32);
    EXPECT_THAT([&]() { channel.DewarpImage(source.Image(), output.Image()); },
                ThrowsMessage<Error>(HasSubstr("Invalid camera")));
}

TEST(Channel, DewarpImageAllocatesNothingAfterTheFirstFrame) {
#ifdef VEXMAP_TEST_UNDER_ASAN
    GTEST_SKIP() << "AddressSanitizer owns malloc, so allocations cannot be counted";
#else
    Channel channel(Lens(2880), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    Frame const source(2880, 2880);
    Frame output(1920, 1080);
    g_allocations = 0;
    g_counting = true;
    bool const first = channel.DewarpImage(source.Image(), output.Image());
    long const first_allocations = g_allocations.exchange(0);
    bool const second = channel.DewarpImage(source.Image(), output.Image());
    bool const third = channel.DewarpImage(source.Image(), output.Image());
    g_counting = false;
    ASSERT_TRUE(first && second && third);
    EXPECT_LT(0, first_allocations);  // the map; shows that the counting works
    EXPECT_EQ(0, g_allocations.load());
#endif
}

// A move drops the map, and the next frame builds the new one in the same table: an operator's
// drag allocates no table.
TEST(Channel, AMoveAndTheNextFrameAllocateNoNewTable) {
#ifdef VEXMAP_TEST_UNDER_ASAN
    GTEST_SKIP() << "AddressSanitizer owns malloc, so allocations cannot be counted";
#else
    Channel channel(Lens(2880), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    Frame const source(2880, 2880);
    Frame first(1920, 1080);
    Frame moved(1920, 1080);
    g_large_allocations = 0;
    g_counting = true;
    ASSERT_TRUE(channel.DewarpImage(source.Image(), first.Image()));
    long const first_tables = g_large_allocations.exchange(0);
    _DEWARP_PTZ_POSITION position = {30.0f, 50.0f, 0.0f, 1.5f};
    ASSERT_TRUE(channel.SetPtz(position));
    ASSERT_TRUE(channel.DewarpImage(source.Image(), moved.Image()));
    g_counting = false;
    EXPECT_EQ(1, first_tables);  // shows that the counting sees a table
    EXPECT_EQ(0, g_large_allocations.load());
    EXPECT_NE(first.Pixels(), moved.Pixels());
#endif
}

// Copy and assignment

TEST(Channel, ACopyReportsTheDefaultProjectionWhateverTheSourceHas) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(source.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_MERCATOR));
    TestChannel const copy(source);
    EXPECT_EQ(Defaults::Projection, copy.GetProjection());
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, source.GetProjection());
}

TEST(Channel, SetProjectionOnACopyOrItsSourceLeavesTheOthersCurrentView) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(source.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const shared = source.CurrentView();
    TestChannel copy(source);
    ASSERT_TRUE(copy.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_MERCATOR));
    EXPECT_NE(shared, copy.CurrentView());
    EXPECT_EQ(shared, source.CurrentView());
    EXPECT_EQ(1u, source.CacheSize());  // the copy's cache is a map of its own
    EXPECT_EQ(2u, copy.CacheSize());

    boost::shared_ptr<AbstractView> const copys = copy.CurrentView();
    ASSERT_TRUE(source.SetProjection(DEWARP_VIEW_QUAD_PTZ, DEWARP_PROJECTION_RECTILINEAR));
    EXPECT_EQ(copys, copy.CurrentView());
    EXPECT_NE(copys, source.CurrentView());
}

TEST(Channel, ACopySharesTheLockCameraAndViewsAndCopiesTheOtherSettings) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(source.SetView(DEWARP_VIEW_QUAD_PTZ));
    ASSERT_TRUE(source.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL));
    ASSERT_TRUE(source.SetInterpolation(DEWARP_INTERPOLATION_0));
    TestChannel const copy(source);
    EXPECT_EQ(source.Mutex(), copy.Mutex());
    EXPECT_EQ(source.CameraObject(), copy.CameraObject());
    EXPECT_EQ(source.CurrentView(), copy.CurrentView());
    EXPECT_EQ(1u, copy.CacheSize());
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, copy.GetView());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, copy.GetAspectRatio());
    EXPECT_EQ(DEWARP_INTERPOLATION_0, copy.GetInterpolation());
}

TEST(Channel, AfterAssignmentTheTargetKeepsItsViewKindAndLocksWithTheSourcesMutex) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(source.SetView(DEWARP_VIEW_QUAD_PTZ));
    TestChannel target(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    ASSERT_TRUE(target.SetView(DEWARP_VIEW_SINGLE_PTZ));
    target = source;
    EXPECT_EQ(DEWARP_VIEW_SINGLE_PTZ, target.GetView());
    EXPECT_EQ(source.Mutex(), target.Mutex());
    // Held for writing by this thread, the source's lock makes the target's reader fail.
    WriteLock const held(*source.Mutex());
    EXPECT_THAT([&target]() { target.GetView(); }, ThrowsMessage<Error>(HasSubstr("Lock failure")));
}

TEST(Channel, AssignmentTakesTheCameraViewsAndOtherSettings) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(source.SetProjection(DEWARP_VIEW_QUAD_PTZ, DEWARP_PROJECTION_MERCATOR));
    ASSERT_TRUE(source.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL));
    ASSERT_TRUE(source.SetInterpolation(DEWARP_INTERPOLATION_2));
    TestChannel target(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    ASSERT_TRUE(target.SetView(DEWARP_VIEW_SINGLE_PTZ));
    ASSERT_TRUE(target.SetView(DEWARP_VIEW_SINGLE_PANORAMIC));
    target = source;
    EXPECT_EQ(source.CameraObject(), target.CameraObject());
    EXPECT_EQ(source.CurrentView(), target.CurrentView());
    EXPECT_EQ(1u, target.CacheSize());
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, target.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, target.GetAspectRatio());
    EXPECT_EQ(DEWARP_INTERPOLATION_2, target.GetInterpolation());
}

TEST(Channel, AssignmentReleasesTheTargetsOwnLock) {
    TestChannel const source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    TestChannel target;
    boost::shared_ptr<ReadWriteMutex> const own = target.Mutex();
    target = source;
    EXPECT_TRUE(own->LockWrite());
    own->Unlock();
    EXPECT_TRUE(source.Mutex()->LockWrite());
    source.Mutex()->Unlock();
}

TEST(Channel, AssignmentBetweenChannelsThatShareOneMutexTakesItOnce) {
    TestChannel source(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    TestChannel target(source);
    ASSERT_TRUE(source.SetInterpolation(DEWARP_INTERPOLATION_0));
    target = source;
    EXPECT_EQ(DEWARP_INTERPOLATION_0, target.GetInterpolation());
    EXPECT_TRUE(source.Mutex()->LockWrite());
    source.Mutex()->Unlock();
}

TEST(Channel, AssignmentToItselfWarnsAndChangesNothing) {
    TestChannel channel(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_MERCATOR));
    boost::shared_ptr<AbstractView> const current = channel.CurrentView();
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    TestChannel& same = channel;
    channel = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Channel object\n", lines[0].text);
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, channel.GetProjection());
    EXPECT_EQ(current, channel.CurrentView());
}

TEST(Channel, DestructionTakesNoLockAndReleasesTheViews) {
    auto channel = std::make_unique<TestChannel>(SmallLens(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel->SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::weak_ptr<AbstractView> const view = channel->CurrentView();
    boost::shared_ptr<ReadWriteMutex> const mutex = channel->Mutex();
    WriteLock const held(*mutex);  // a destructor that locked would fail here
    channel.reset();
    EXPECT_TRUE(view.expired());
}

}  // namespace
}  // namespace quorvel::vexmap
