#include "vexmap/rotation.h"

#include <ostream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/euler_angles.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;
using ::testing::Matcher;

constexpr float TOLERANCE = 1e-6f;        // unit vectors
constexpr float PIXEL_TOLERANCE = 1e-3f;  // image points at a focal length of some hundreds
constexpr float FOCAL = 500.0f;           // pixels
constexpr float PI_VALUE = 3.14159265f;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float THIRD_PI = 1.04719755f;
constexpr float QUARTER_PI = 0.78539816f;
constexpr float SIXTH_PI = 0.52359878f;
constexpr float ROOT_HALF = 0.70710678f;
constexpr float SQRT3_OVER_2 = 0.86602540f;
constexpr float SQRT3 = 1.73205081f;

Matcher<Vector3d> IsNearVector(float x, float y, float z) {
    return AllOf(Field("x", &Vector3d::x, FloatNear(x, TOLERANCE)),
                 Field("y", &Vector3d::y, FloatNear(y, TOLERANCE)),
                 Field("z", &Vector3d::z, FloatNear(z, TOLERANCE)));
}

Matcher<Vector2d> IsNearPoint(float x, float y) {
    return AllOf(Field("x", &Vector2d::x, FloatNear(x, PIXEL_TOLERANCE)),
                 Field("y", &Vector2d::y, FloatNear(y, PIXEL_TOLERANCE)));
}

Matcher<Vector2d> IsPoint(float x, float y) {
    return AllOf(Field("x", &Vector2d::x, Eq(x)), Field("y", &Vector2d::y, Eq(y)));
}

RotationMatrix3d Pan(float angle) {
    return RotationMatrix3d(angle, 0.0f, 0.0f);
}

RotationMatrix3d Tilt(float angle) {
    return RotationMatrix3d(0.0f, angle, 0.0f);
}

RotationMatrix3d Roll(float angle) {
    return RotationMatrix3d(0.0f, 0.0f, angle);
}

TEST(Rotation, AssignmentDoesNothingAndSaysNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    Rotation rotation;
    Rotation const copy(rotation);
    EXPECT_EQ(&rotation, &(rotation = copy));
    Rotation const& same = rotation;
    EXPECT_EQ(&rotation, &(rotation = same));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Rotation, SphericalCentreIsTheAxisOfView) {
    Vector3d const v = Rotation::SphericalToVector3d(Vector2d(0.0f, 0.0f), FOCAL);
    EXPECT_EQ(0.0f, v.x);
    EXPECT_EQ(0.0f, v.y);
    EXPECT_EQ(1.0f, v.z);
}

TEST(Rotation, SphericalRadiusOverFocalLengthIsTheAngleOffTheAxis) {
    EXPECT_THAT(Rotation::SphericalToVector3d(Vector2d(FOCAL * HALF_PI_VALUE, 0.0f), FOCAL),
                IsNearVector(1.0f, 0.0f, 0.0f));
    EXPECT_THAT(Rotation::SphericalToVector3d(Vector2d(0.0f, FOCAL * THIRD_PI), FOCAL),
                IsNearVector(0.0f, SQRT3_OVER_2, 0.5f));
    // Radius pi/4 in the direction (0.6, 0.8).
    EXPECT_THAT(Rotation::SphericalToVector3d(
                    Vector2d(0.6f * FOCAL * QUARTER_PI, 0.8f * FOCAL * QUARTER_PI), FOCAL),
                IsNearVector(0.6f * ROOT_HALF, 0.8f * ROOT_HALF, ROOT_HALF));
    // Beyond a quarter turn the direction looks backwards.
    EXPECT_THAT(Rotation::SphericalToVector3d(Vector2d(-FOCAL * 3.0f * QUARTER_PI, 0.0f), FOCAL),
                IsNearVector(-ROOT_HALF, 0.0f, -ROOT_HALF));
}

TEST(Rotation, DirectionToSphericalTakesTheAngleOffTheAxisTimesFocalLength) {
    EXPECT_THAT(Rotation::Vector3dToSpherical(Vector3d(1.0f, 0.0f, 0.0f), FOCAL),
                IsNearPoint(FOCAL * HALF_PI_VALUE, 0.0f));
    // (0, sqrt 3, 1) is pi/3 off the axis; its length does not matter.
    EXPECT_THAT(Rotation::Vector3dToSpherical(Vector3d(0.0f, SQRT3, 1.0f), FOCAL),
                IsNearPoint(0.0f, FOCAL * THIRD_PI));
    EXPECT_THAT(Rotation::Vector3dToSpherical(Vector3d(-1.0f, 0.0f, -1.0f), FOCAL),
                IsNearPoint(-FOCAL * 3.0f * QUARTER_PI, 0.0f));
}

TEST(Rotation, DirectionAlongTheAxisIsTheSphericalCentre) {
    EXPECT_THAT(Rotation::Vector3dToSpherical(Vector3d(0.0f, 0.0f, 2.0f), FOCAL),
                IsPoint(0.0f, 0.0f));
    // Straight back has no direction in the image either: it falls on the centre as well.
    EXPECT_THAT(Rotation::Vector3dToSpherical(Vector3d(0.0f, 0.0f, -1.0f), FOCAL),
                IsPoint(0.0f, 0.0f));
}

TEST(Rotation, SphericalRotationByAPanOfAQuarterTurnMovesTheCentreSideways) {
    // The axis of view (0, 0, 1) turns into (1, 0, 0), a quarter turn to the right; the inverse
    // turns it into (-1, 0, 0).
    EXPECT_THAT(Rotation::SphericalRotation(Vector2d(0.0f, 0.0f), FOCAL, Pan(HALF_PI_VALUE)),
                IsNearPoint(FOCAL * HALF_PI_VALUE, 0.0f));
    EXPECT_THAT(Rotation::InverseSphericalRotation(Vector2d(0.0f, 0.0f), FOCAL, Pan(HALF_PI_VALUE)),
                IsNearPoint(-FOCAL * HALF_PI_VALUE, 0.0f));
}

TEST(Rotation, SphericalRotationByARollTurnsThePointAboutTheCentre) {
    EXPECT_THAT(Rotation::SphericalRotation(Vector2d(300.0f, 100.0f), FOCAL, Roll(HALF_PI_VALUE)),
                IsNearPoint(-100.0f, 300.0f));
    EXPECT_THAT(
        Rotation::InverseSphericalRotation(Vector2d(300.0f, 100.0f), FOCAL, Roll(HALF_PI_VALUE)),
        IsNearPoint(100.0f, -300.0f));
}

TEST(Rotation, RectilinearRotationByARollTurnsThePointAboutTheCentre) {
    EXPECT_THAT(Rotation::RectilinearRotation(Vector2d(300.0f, 100.0f), FOCAL, Roll(HALF_PI_VALUE)),
                IsNearPoint(-100.0f, 300.0f));
    EXPECT_THAT(
        Rotation::InverseRectilinearRotation(Vector2d(300.0f, 100.0f), FOCAL, Roll(HALF_PI_VALUE)),
        IsNearPoint(100.0f, -300.0f));
}

TEST(Rotation, RectilinearRotationProjectsTheTurnedRayOntoThePlane) {
    // The ray (0, 0, f) turned by a pan of a meets the plane at f tan a; a tilt looks down.
    EXPECT_THAT(Rotation::RectilinearRotation(Vector2d(0.0f, 0.0f), FOCAL, Pan(QUARTER_PI)),
                IsNearPoint(FOCAL, 0.0f));
    EXPECT_THAT(Rotation::RectilinearRotation(Vector2d(0.0f, 0.0f), FOCAL, Pan(SIXTH_PI)),
                IsNearPoint(FOCAL / SQRT3, 0.0f));
    EXPECT_THAT(Rotation::RectilinearRotation(Vector2d(0.0f, 0.0f), FOCAL, Tilt(QUARTER_PI)),
                IsNearPoint(0.0f, -FOCAL));
    EXPECT_THAT(Rotation::InverseRectilinearRotation(Vector2d(0.0f, 0.0f), FOCAL, Pan(QUARTER_PI)),
                IsNearPoint(-FOCAL, 0.0f));
}

TEST(Rotation, ShiftedRectilinearRotationShiftsBeforeAndScalesAndShiftsBackAfter) {
    // p = (10, 20), shift (2, -4), scale 2. Identity: ((10 + 2) / 2 - 2, (20 - 4) / 2 + 4).
    // A roll of a quarter turn takes (12, 16) to (-16, 12), its inverse to (16, -12).
    Vector2d const p(10.0f, 20.0f);
    Vector2d const shift(2.0f, -4.0f);
    EXPECT_THAT(Rotation::RectilinearRotation(p, FOCAL, RotationMatrix3d::Identity, shift, 2.0f),
                IsNearPoint(4.0f, 12.0f));
    EXPECT_THAT(
        Rotation::InverseRectilinearRotation(p, FOCAL, RotationMatrix3d::Identity, shift, 2.0f),
        IsNearPoint(4.0f, 12.0f));
    EXPECT_THAT(Rotation::RectilinearRotation(p, FOCAL, Roll(HALF_PI_VALUE), shift, 2.0f),
                IsNearPoint(-10.0f, 10.0f));
    EXPECT_THAT(Rotation::InverseRectilinearRotation(p, FOCAL, Roll(HALF_PI_VALUE), shift, 2.0f),
                IsNearPoint(6.0f, -2.0f));
}

TEST(Rotation, ShiftedRectilinearRotationWithoutShiftOrScaleIsThePlainOne) {
    RotationMatrix3d const m(0.3f, -0.2f, 0.1f);
    Vector2d const p(120.0f, -80.0f);
    Vector2d const plain = Rotation::RectilinearRotation(p, FOCAL, m);
    Vector2d const inverse = Rotation::InverseRectilinearRotation(p, FOCAL, m);
    EXPECT_THAT(Rotation::RectilinearRotation(p, FOCAL, m, Vector2d(0.0f, 0.0f), 1.0f),
                IsNearPoint(plain.x, plain.y));
    EXPECT_THAT(Rotation::InverseRectilinearRotation(p, FOCAL, m, Vector2d(0.0f, 0.0f), 1.0f),
                IsNearPoint(inverse.x, inverse.y));
}

TEST(Rotation, EquirectangularCentreLooksAlongMinusZ) {
    EXPECT_THAT(Rotation::EquirectangularToVector3d(Vector2d(0.0f, 0.0f), FOCAL),
                IsNearVector(0.0f, 0.0f, -1.0f));
}

TEST(Rotation, EquirectangularPointsAreLongitudeAndLatitudeTimesFocalLength) {
    EXPECT_THAT(Rotation::EquirectangularToVector3d(Vector2d(FOCAL * HALF_PI_VALUE, 0.0f), FOCAL),
                IsNearVector(1.0f, 0.0f, 0.0f));
    EXPECT_THAT(Rotation::EquirectangularToVector3d(Vector2d(0.0f, FOCAL * SIXTH_PI), FOCAL),
                IsNearVector(0.0f, 0.5f, -SQRT3_OVER_2));
    EXPECT_THAT(Rotation::EquirectangularToVector3d(
                    Vector2d(-FOCAL * HALF_PI_VALUE, FOCAL * QUARTER_PI), FOCAL),
                IsNearVector(-ROOT_HALF, ROOT_HALF, 0.0f));
    EXPECT_THAT(Rotation::EquirectangularToVector3d(Vector2d(FOCAL * PI_VALUE, 0.0f), FOCAL),
                IsNearVector(0.0f, 0.0f, 1.0f));
}

TEST(Rotation, DirectionToEquirectangularGivesLongitudeAndLatitudeTimesFocalLength) {
    EXPECT_THAT(Rotation::Vector3dToEquirectangular(Vector3d(0.0f, 0.0f, -1.0f), FOCAL),
                IsNearPoint(0.0f, 0.0f));
    EXPECT_THAT(Rotation::Vector3dToEquirectangular(Vector3d(1.0f, 0.0f, 0.0f), FOCAL),
                IsNearPoint(FOCAL * HALF_PI_VALUE, 0.0f));
    // Length 2, latitude asin(1/2) = pi/6.
    EXPECT_THAT(Rotation::Vector3dToEquirectangular(Vector3d(0.0f, 1.0f, -SQRT3), FOCAL),
                IsNearPoint(0.0f, FOCAL * SIXTH_PI));
    EXPECT_THAT(Rotation::Vector3dToEquirectangular(Vector3d(-3.0f, 0.0f, 0.0f), FOCAL),
                IsNearPoint(-FOCAL * HALF_PI_VALUE, 0.0f));
    EXPECT_THAT(Rotation::Vector3dToEquirectangular(Vector3d(0.0f, 0.0f, 1.0f), FOCAL),
                IsNearPoint(FOCAL * PI_VALUE, 0.0f));
}

// An image point in pixels, x right and y up from the centre.
struct Point {
    float x;
    float y;
};

void PrintTo(Point const& point, std::ostream* out) {
    *out << "(" << point.x << ", " << point.y << ")";
}

// Image points at FOCAL, each within a half turn of the centre.
class RotationSphericalPointTest : public ::testing::TestWithParam<Point> {};

TEST_P(RotationSphericalPointTest, SurvivesTheWayThroughADirection) {
    Vector2d const p(GetParam().x, GetParam().y);
    EXPECT_THAT(Rotation::Vector3dToSpherical(Rotation::SphericalToVector3d(p, FOCAL), FOCAL),
                IsNearPoint(p.x, p.y));
}

TEST_P(RotationSphericalPointTest, StaysPutUnderTheIdentity) {
    Vector2d const p(GetParam().x, GetParam().y);
    EXPECT_THAT(Rotation::SphericalRotation(p, FOCAL, RotationMatrix3d::Identity),
                IsNearPoint(p.x, p.y));
    EXPECT_THAT(Rotation::InverseSphericalRotation(p, FOCAL, RotationMatrix3d::Identity),
                IsNearPoint(p.x, p.y));
    EXPECT_THAT(Rotation::RectilinearRotation(p, FOCAL, RotationMatrix3d::Identity),
                IsNearPoint(p.x, p.y));
    EXPECT_THAT(Rotation::InverseRectilinearRotation(p, FOCAL, RotationMatrix3d::Identity),
                IsNearPoint(p.x, p.y));
}

TEST_P(RotationSphericalPointTest, InverseSphericalRotationUndoesTheRotation) {
    Vector2d const p(GetParam().x, GetParam().y);
    RotationMatrix3d const m(0.3f, -0.2f, 0.4f);
    Vector2d const turned = Rotation::SphericalRotation(p, FOCAL, m);
    EXPECT_THAT(Rotation::InverseSphericalRotation(turned, FOCAL, m), IsNearPoint(p.x, p.y));
}

TEST_P(RotationSphericalPointTest, InverseRectilinearRotationUndoesTheRotation) {
    Vector2d const p(GetParam().x, GetParam().y);
    RotationMatrix3d const m(0.1f, -0.15f, 0.4f);
    Vector2d const turned = Rotation::RectilinearRotation(p, FOCAL, m);
    EXPECT_THAT(Rotation::InverseRectilinearRotation(turned, FOCAL, m), IsNearPoint(p.x, p.y));
}

INSTANTIATE_TEST_SUITE_P(, RotationSphericalPointTest,
                         ::testing::Values(Point{0.0f, 0.0f}, Point{100.0f, -50.0f},
                                           Point{-300.0f, 200.0f}, Point{450.0f, 350.0f},
                                           Point{-20.0f, -480.0f}));

// Points of an equirectangular image in pixels at FOCAL: longitude within a half turn, latitude
// within a quarter turn.
class RotationEquirectangularPointTest : public ::testing::TestWithParam<Point> {};

TEST_P(RotationEquirectangularPointTest, SurvivesTheWayThroughADirection) {
    Vector2d const p(GetParam().x, GetParam().y);
    EXPECT_THAT(
        Rotation::Vector3dToEquirectangular(Rotation::EquirectangularToVector3d(p, FOCAL), FOCAL),
        IsNearPoint(p.x, p.y));
}

INSTANTIATE_TEST_SUITE_P(, RotationEquirectangularPointTest,
                         ::testing::Values(Point{0.0f, 0.0f}, Point{300.0f, -200.0f},
                                           Point{-1200.0f, 600.0f}, Point{1500.0f, -700.0f},
                                           Point{-400.0f, 0.0f}));

}  // namespace
}  // namespace quorvel::vexmap
