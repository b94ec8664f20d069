#include "vexmap/camera.h"

#include <cerrno>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"
#include "vexmap/fisheye_camera.h"
#include "vexmap/floating_point.h"
#include "vexmap/projection.h"
#include "vexmap/rectilinear_camera.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

_DEWARP_INTERNAL_CAMERA_MODEL Model(_DEWARP_INTERNAL_CAMERA_TYPE type, float diagonal,
                                    float horizontal, float vertical, size_t width, size_t height) {
    return _DEWARP_INTERNAL_CAMERA_MODEL{type, diagonal, horizontal, vertical, width, height};
}

TEST(Camera, DefaultIsARectilinearCameraWithoutSizeOnAWall) {
    RectilinearCamera const camera;
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, camera.GetType());
    EXPECT_EQ(0.0f, camera.GetResolution().x);
    EXPECT_EQ(0.0f, camera.GetFieldOfView().diagonal);
    EXPECT_EQ(0u, camera.GetModel().width);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, camera.GetMount());
}

TEST(Camera, KeepsTheModelConvertedAndAsGiven) {
    FisheyeCamera const camera(
        Model(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 200.0f, 180.0f, 90.0f, 1920, 1080),
        DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_NEAR(Trigonometry::PI, camera.GetFieldOfView().horizontal, 1e-6f);
    EXPECT_NEAR(Trigonometry::HALF_PI, camera.GetFieldOfView().vertical, 1e-6f);
    EXPECT_NEAR(200.0f * Trigonometry::DEGREES_TO_RADIANS, camera.GetFieldOfView().diagonal,
                1e-6f);  // given, not worked out from the other two
    EXPECT_EQ(1920.0f, camera.GetResolution().x);
    EXPECT_EQ(1080.0f, camera.GetResolution().y);
    EXPECT_EQ(180.0f, camera.GetModel().horizontal_fov);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, camera.GetMount());
}

TEST(Camera, SetCameraModelKeepsTheMount) {
    FisheyeCamera camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    camera.SetCameraModel(Model(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, 90, 80, 60, 640, 480));
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, camera.GetType());
    EXPECT_EQ(640.0f, camera.GetResolution().x);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, camera.GetMount());
    camera.SetCameraMount(DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL, camera.GetMount());
}

TEST(Camera, DefaultsAreCylindricalAndStretchedOnBothKinds) {
    FisheyeCamera const fisheye(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    RectilinearCamera const rectilinear;
    EXPECT_EQ(1, fisheye.GetDefaultProjection());
    EXPECT_EQ(1, rectilinear.GetDefaultProjection());
    EXPECT_EQ(2, fisheye.GetDefaultAspectRatio());
    EXPECT_EQ(2, rectilinear.GetDefaultAspectRatio());
}

TEST(Camera, ShiftIsZeroOnAWallAndOfOppositeSignsOnCeilingAndFloor) {
    Vector2d const size(800.0f, 600.0f);
    FisheyeCamera camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EXPECT_EQ(0.0f, camera.GetShift(DEWARP_PROJECTION_CYLINDRICAL, size).y);
    camera.SetCameraMount(DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL);
    EXPECT_EQ(0.0f, camera.GetShift(DEWARP_PROJECTION_CYLINDRICAL, size).y);
    camera.SetCameraMount(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    Vector2d const ceiling = camera.GetShift(DEWARP_PROJECTION_CYLINDRICAL, size);
    camera.SetCameraMount(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    Vector2d const floor = camera.GetShift(DEWARP_PROJECTION_RECTILINEAR, size);
    EXPECT_EQ(0.0f, ceiling.x);
    EXPECT_EQ(300.0f, ceiling.y);
    EXPECT_EQ(-300.0f, floor.y);
}

TEST(Camera, ScaleIsTheIdentityScaleInForce) {
    Vector2d const scale = FisheyeCamera().GetScale();
    EXPECT_EQ(0.0f, scale.x);
    EXPECT_EQ(0.0f, scale.y);
}

TEST(Camera, FocalLengthComesFromHalfTheWidthAndHalfTheField) {
    FisheyeCamera const fisheye(
        Model(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180, 180, 180, 1000, 1000),
        DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EXPECT_NEAR(500.0f / Trigonometry::HALF_PI, fisheye.GetFocalLength(), 1e-3f);
    RectilinearCamera const rectilinear(
        Model(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, 100, 90, 60, 1000, 600),
        DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EXPECT_NEAR(500.0f, rectilinear.GetFocalLength(), 1e-2f);  // tan 45 degrees is 1
}

TEST(Camera, AnUnknownTypeHasNoFocalLengthAndNoPtzOffset) {
    RectilinearCamera const camera(
        Model(static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(5), 100, 90, 60, 1000, 600),
        DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EXPECT_TRUE(FloatingPoint::is_nan(camera.GetFocalLength()));
    EXPECT_TRUE(FloatingPoint::is_nan(camera.GetPtzOffset(Vector2d(1.0f, 1.0f)).x));
}

TEST(Camera, PtzOffsetIsTheResolutionOfTheFieldAtTheFocalLength) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    Vector2d const offset = camera.GetPtzOffset(Vector2d(0.5f, 0.25f));
    Vector2d const expected =
        Projection::FisheyeResolution(Vector2d(0.5f, 0.25f), camera.GetFocalLength());
    EXPECT_EQ(expected.x, offset.x);
    EXPECT_EQ(expected.y, offset.y);
}

TEST(Camera, MapSizeOfTheBuiltInCameraIsInWholePixels) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    for (int projection = 0; projection <= 8; ++projection) {
        Resolution const size =
            camera.GetProjectionMapSize(static_cast<_DEWARP_PROJECTION>(projection));
        EXPECT_EQ(FloatingPoint::floor(size.x), size.x) << projection;
        EXPECT_EQ(FloatingPoint::floor(size.y), size.y) << projection;
    }
}

TEST(Camera, MapSizeOfAnEquirectangularPictureSpansTheEdgesThroughTheConversion) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    float const f = camera.GetFocalLength();
    Vector2d const east = Projection::EquirectangularToFisheye(Vector2d(968.0f, 0.0f), f);
    Vector2d const west = Projection::EquirectangularToFisheye(Vector2d(-968.0f, 0.0f), f);
    Resolution const size = camera.GetProjectionMapSize(DEWARP_PROJECTION_EQUIRECTANGULAR);
    EXPECT_EQ(FloatingPoint::floor(east.x - west.x), size.x);
}

TEST(Camera, FieldOfViewAndResolutionUseTheProjectionsFormulas) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    float const f = camera.GetFocalLength();
    FieldOfView const field =
        camera.GetProjectionFieldOfView(Resolution(800, 600), DEWARP_PROJECTION_MERCATOR);
    Vector2d const expected = Projection::MercatorFieldOfView(Vector2d(800.0f, 600.0f), f);
    EXPECT_EQ(expected.x, field.horizontal);
    EXPECT_EQ(expected.y, field.vertical);
    Resolution const size =
        camera.GetProjectionResolution(FieldOfView(1.0f, 0.5f), DEWARP_PROJECTION_RECTILINEAR);
    Vector2d const unfloored = Projection::RectilinearResolution(Vector2d(1.0f, 0.5f), f);
    EXPECT_EQ(FloatingPoint::floor(unfloored.x), size.x);  // assigned to a Resolution: floored
    EXPECT_EQ(FloatingPoint::floor(unfloored.y), size.y);
}

TEST(Camera, AProjectionOutsideThePublicNineThrowsInvalidProjection) {
    FisheyeCamera const camera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    errno = 0;
    EXPECT_THAT(
        [&camera] {
            camera.GetProjectionFieldOfView(Resolution(10, 10), static_cast<_DEWARP_PROJECTION>(9));
        },
        ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid projection")));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_THROW(camera.GetProjectionResolution(FieldOfView(1.0f, 1.0f),
                                                static_cast<_DEWARP_PROJECTION>(-1)),
                 Error);
}

TEST(Camera, TypeNames) {
    EXPECT_EQ("rectilinear", Camera::GetCameraTypeName(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR));
    EXPECT_EQ("circular fish eye",
              Camera::GetCameraTypeName(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE));
    EXPECT_EQ("<unknown>", Camera::GetCameraTypeName(static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(2)));
}

TEST(Camera, LogCameraInfoNamesTheDiagonalAndTheVerticalField) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    FisheyeCamera const camera(
        Model(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 284.0f, 225.0f, 174.0f, 2048, 1536),
        DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    camera.LogCameraInfo();
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());
    EXPECT_EQ("VEXMAP: INFO - Camera type is circular fish eye\n", lines[0].text);
    EXPECT_EQ("VEXMAP: INFO - Camera resolution is (2048, 1536)\n", lines[1].text);
    EXPECT_EQ("VEXMAP: INFO - Camera FOV is (284.000000, 174.000000)\n", lines[2].text);
    EXPECT_EQ("VEXMAP: INFO - Camera FOV is (%f, %f)\n", lines[2].format);
}

TEST(Camera, MaxRectilinearFovIs140DegreesInRadians) {
    EXPECT_EQ(Trigonometry::DEGREES_TO_RADIANS * 140.0f, Camera::MaxRectilinearFov);
}

// A camera of its own kind whose assignment is the base class's.
class PlainCamera : public Camera {
public:
    using Camera::Camera;
    using Camera::operator=;
    PtzPosition GetHomePosition() const override { return PtzPosition::Identity; }
    Vector2d MapHitPoint(Vector2d const&) const override { return Vector2d::ZeroVector; }
};

TEST(Camera, AssignmentCopiesEveryMemberAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PlainCamera const source(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    PlainCamera target;
    static_cast<Camera&>(target) = source;
    EXPECT_EQ(1936.0f, target.GetResolution().x);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, target.GetMount());
    EXPECT_EQ(183.0f, target.GetModel().diagonal_fov);
    Camera& same = target;
    same = target;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Camera object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
