#include "vexmap/equirectangular_ptz_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/fisheye_camera.h"
#include "vexmap/floating_point.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float LIMIT = 100.0f;

TEST(EquirectangularPtzFunctor, ThreeAndAHalfLimitsWrapByTwoTurnsToMinusHalf) {
    Vector2d const result = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(3.5f * LIMIT, 0.0f), 1.0f, LIMIT, Vector2d());
    EXPECT_EQ(-0.5f * LIMIT, result.x);
    EXPECT_EQ(0.0f, result.y);
}

TEST(EquirectangularPtzFunctor, APointAtTheLimitStays) {
    Vector2d const result = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(LIMIT, -LIMIT), 1.0f, LIMIT, Vector2d());
    EXPECT_EQ(LIMIT, result.x);
    EXPECT_EQ(-LIMIT, result.y);
}

TEST(EquirectangularPtzFunctor, TheVerticalWrapsLikeTheHorizontal) {
    Vector2d const result = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(0.0f, -1.25f * LIMIT), 1.0f, LIMIT, Vector2d());
    EXPECT_EQ(0.75f * LIMIT, result.y);
}

TEST(EquirectangularPtzFunctor, TheOffsetComesFirstAndTheZoomArgumentIsUnused) {
    Vector2d const result = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(90.0f, 10.0f), 7.0f, LIMIT, Vector2d(20.0f, 5.0f));
    EXPECT_EQ(-90.0f, result.x);  // 110 is past the limit by 10
    EXPECT_EQ(15.0f, result.y);
}

TEST(EquirectangularPtzFunctor, NotANumberLeavesTheLoopsAtOnce) {
    Vector2d const point = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(FloatingPoint::Nan, 5.0f), 1.0f, LIMIT, Vector2d());
    EXPECT_TRUE(FloatingPoint::is_nan(point.x));
    EXPECT_EQ(5.0f, point.y);
    Vector2d const unlimited = EquirectangularPtzFunctor::EquirectangularPerspective(
        Vector2d(1e6f, -1e6f), 1.0f, FloatingPoint::Nan, Vector2d());
    EXPECT_EQ(1e6f, unlimited.x);
    EXPECT_EQ(-1e6f, unlimited.y);
}

TEST(EquirectangularPtzFunctor, SetupTakesHalfATurnAndThePositionInPixels) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    float const f = camera.GetFocalLength();
    EquirectangularPtzFunctor const functor(camera,
                                            PtzPosition(EulerAngles(0.5f, -0.25f, 1.0f), 2.0f));
    EXPECT_FLOAT_EQ(Trigonometry::PI * f, functor.limit);
    EXPECT_FLOAT_EQ(0.5f * f, functor.offset.x);
    EXPECT_FLOAT_EQ(-0.25f * f, functor.offset.y);
    EXPECT_EQ(2.0f, functor.zoom);
}

TEST(EquirectangularPtzFunctor, SetupTouchesOnlyTheLimitAndTheOffset) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EquirectangularPtzFunctor functor;
    functor.Setup(camera, PtzPosition(EulerAngles(0.5f, 0.0f, 0.0f), 3.0f));
    EXPECT_EQ(1.0f, functor.zoom);
    EXPECT_TRUE(FloatingPoint::is_nan(functor.focal_length));
    EXPECT_EQ(1.0f, functor.rotation.m11);
}

TEST(EquirectangularPtzFunctor, CallZoomsThenShiftsAndWraps) {
    EquirectangularPtzFunctor functor;
    functor.zoom = 2.0f;
    functor.limit = LIMIT;
    functor.offset = Vector2d(50.0f, 0.0f);
    Vector2d const result = functor.Call(Vector2d(120.0f, 40.0f));
    EXPECT_EQ(-90.0f, result.x);  // 120 / 2 + 50 = 110, past the limit by 10
    EXPECT_EQ(20.0f, result.y);
}

TEST(EquirectangularPtzFunctor, AssignmentCopiesAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EquirectangularPtzFunctor source;
    source.limit = 5.0f;
    source.offset = Vector2d(1.0f, 2.0f);
    EquirectangularPtzFunctor target;
    target = source;
    EXPECT_EQ(5.0f, target.limit);
    EXPECT_EQ(2.0f, target.offset.y);
    EquirectangularPtzFunctor& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of EquirectangularPtzFunctor object\n",
              lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
