#include "vexmap/fisheye_camera.h"

#include <cerrno>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr float ANGLE_TOLERANCE = 1e-4f;

FisheyeCamera Mounted(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return FisheyeCamera(TarvexBrenvia418, mount);
}

TEST(FisheyeCamera, HomeOrientationsFollowTheMount) {
    EXPECT_EQ(Trigonometry::HALF_PI,
              Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING).GetHomePosition().orientation.tilt);
    PtzPosition const floor = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR).GetHomePosition();
    EXPECT_EQ(Trigonometry::HALF_PI, floor.orientation.tilt);
    EXPECT_EQ(Trigonometry::PI, floor.orientation.roll);
    PtzPosition const wall = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL).GetHomePosition();
    EXPECT_EQ(0.0f, wall.orientation.tilt);
    EXPECT_EQ(0.0f, wall.orientation.roll);
    EXPECT_EQ(
        Trigonometry::PI,
        Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL).GetHomePosition().orientation.roll);
    EXPECT_EQ(1.0f, floor.zoom);
}

TEST(FisheyeCamera, AnUnknownMountThrowsInvalidCameraMount) {
    FisheyeCamera const camera = Mounted(static_cast<_DEWARP_INTERNAL_CAMERA_MOUNT>(4));
    errno = 0;
    EXPECT_THAT(
        [&camera] { camera.GetHomePosition(); },
        ThrowsMessage<Error>(HasSubstr("(FisheyeCamera::GetHomePosition@src/fisheye_camera:")));
    EXPECT_THAT([&camera] { camera.GetHomePosition(); },
                ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid camera mount")));
    EXPECT_EQ(EINVAL, errno);
}

TEST(FisheyeCamera, TheCentreOfAWallCameraLooksStraightAhead) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Vector2d const direction =
        Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL).MapHitPoint(Vector2d(968.0f, 968.0f));
    EXPECT_NEAR(0.0f, direction.x, ANGLE_TOLERANCE);
    EXPECT_NEAR(0.0f, direction.y, ANGLE_TOLERANCE);
}

TEST(FisheyeCamera, AHitToTheRightOfAWallCameraPansByItsAngle) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    FisheyeCamera const camera = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    float const f = camera.GetFocalLength();
    // An equidistant lens puts the direction 0.5 radians off the axis at 0.5 f from the centre.
    Vector2d const direction = camera.MapHitPoint(Vector2d(968.0f + 0.5f * f, 968.0f));
    EXPECT_NEAR(0.5f, direction.x, ANGLE_TOLERANCE);
    EXPECT_NEAR(0.0f, direction.y, ANGLE_TOLERANCE);
}

TEST(FisheyeCamera, AFarHitOnAWallMapsAsItsRayAtNinetyFivePercentOfHalfTheWidth) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    FisheyeCamera const camera = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    float const width = camera.GetResolution().x;
    Vector2d const centre(968.0f, 968.0f);
    Vector2d const ray(0.6f, 0.8f);  // unit length
    Vector2d const far = camera.MapHitPoint(centre + ray * (width / 1.5f));
    Vector2d const pulled_in = camera.MapHitPoint(centre + ray * (0.475f * width));
    EXPECT_NEAR(pulled_in.x, far.x, ANGLE_TOLERANCE);
    EXPECT_NEAR(pulled_in.y, far.y, ANGLE_TOLERANCE);
}

TEST(FisheyeCamera, PanOnAWallLiesWithinAHalfTurnAroundZero) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    for (auto mount :
         {DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL}) {
        FisheyeCamera const camera = Mounted(mount);
        for (float x = 0.0f; x <= 1936.0f; x += 121.0f) {
            for (float y = 0.0f; y <= 1936.0f; y += 121.0f) {
                float const pan = camera.MapHitPoint(Vector2d(x, y)).x;
                EXPECT_GE(pan, -Trigonometry::HALF_PI - ANGLE_TOLERANCE) << x << "," << y;
                EXPECT_LE(pan, Trigonometry::HALF_PI + ANGLE_TOLERANCE) << x << "," << y;
            }
        }
    }
}

TEST(FisheyeCamera, OnCeilingAndFloorAnOffCentreHitIsNotFinite) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    for (auto mount : {DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR}) {
        Vector2d const direction = Mounted(mount).MapHitPoint(Vector2d(1200.0f, 700.0f));
        EXPECT_FALSE(FloatingPoint::is_finite(direction.x)) << mount;
        EXPECT_FALSE(FloatingPoint::is_finite(direction.y)) << mount;
    }
}

TEST(FisheyeCamera, EveryStepOfAHitIsLoggedAtTheErrorLevel) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL).MapHitPoint(Vector2d(968.0f, 968.0f));
    auto const lines = sink.Lines();
    ASSERT_EQ(5u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Input hit point is (%f,%f)\n", lines[0].format);
    EXPECT_EQ("VEXMAP: ERROR - Input hit point is (968.000000,968.000000)\n", lines[0].text);
    EXPECT_EQ("VEXMAP: ERROR - Normalised hit point is (0.000000,0.000000)\n", lines[1].text);
    EXPECT_EQ("VEXMAP: ERROR - Scaled hit point is (%f,%f)\n", lines[2].format);
    EXPECT_EQ("VEXMAP: ERROR - Rotated hit point is (%f,%f)\n", lines[3].format);
    EXPECT_EQ("VEXMAP: ERROR - Mapped hit point is (%f,%f) degrees\n", lines[4].format);
}

TEST(FisheyeCamera, RotateHitPointTurnsBackFromTheHomeOrientation) {
    FisheyeCamera const wall = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    Vector2d const same = wall.RotateHitPoint(Vector2d(40.0f, -30.0f), 600.0f);
    EXPECT_NEAR(40.0f, same.x, 1e-3f);
    EXPECT_NEAR(-30.0f, same.y, 1e-3f);
}

TEST(FisheyeCamera, TheTwoArgumentMapHitPointConvertsToEquirectangular) {
    FisheyeCamera const camera = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    Vector2d const point = camera.MapHitPoint(Vector2d(100.0f, 0.0f), 500.0f);
    EXPECT_NEAR(100.0f, point.x, 1e-3f);  // along the equator both are f times the angle
    EXPECT_NEAR(0.0f, point.y, 1e-3f);
}

TEST(FisheyeCamera, AssignmentCopiesNothingAndWarnsOnItselfWithItsOwnName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    FisheyeCamera const source = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    FisheyeCamera target;
    target = source;
    EXPECT_EQ(0.0f, target.GetResolution().x);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, target.GetMount());
    FisheyeCamera& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of FisheyeCamera object\n", lines[0].text);
}

TEST(FisheyeCamera, CopiesKeepTheModel) {
    FisheyeCamera const source = Mounted(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    FisheyeCamera const copy(source);
    EXPECT_EQ(1936.0f, copy.GetResolution().y);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, copy.GetMount());
}

}  // namespace
}  // namespace quorvel::vexmap
