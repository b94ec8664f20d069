#include "vexmap/transform_2d_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float TOLERANCE = 1e-5f;

Transform2dFunctor::_TRANSFORM_2D Nothing() {
    return Transform2dFunctor::_TRANSFORM_2D{0, 0, 0, 0, 0, 0, 0, false, false};
}

TEST(Transform2dFunctor, ARecordOfZerosGivesTheIdentity) {
    Transform2dFunctor functor(Nothing());
    Vector2d const result = functor.Call(Vector2d(3.5f, -2.0f));
    EXPECT_EQ(3.5f, result.x);
    EXPECT_EQ(-2.0f, result.y);
    EXPECT_EQ(0.0f, functor.matrix.m12);
    EXPECT_EQ(1.0f, functor.matrix.m33);
}

TEST(Transform2dFunctor, ScalesDivide) {
    auto transform = Nothing();
    transform.scale_x = 2.0f;
    transform.scale_y = 4.0f;
    Vector2d const result = Transform2dFunctor(transform).Call(Vector2d(8.0f, 8.0f));
    EXPECT_EQ(4.0f, result.x);
    EXPECT_EQ(2.0f, result.y);
}

TEST(Transform2dFunctor, OneNormalScaleRunsTheStepWithAnInfiniteFactorForTheZero) {
    auto transform = Nothing();
    transform.scale_x = 2.0f;
    Transform2dFunctor const functor(transform);
    EXPECT_EQ(0.5f, functor.matrix.m11);
    EXPECT_EQ(FloatingPoint::Infinity, functor.matrix.m22);
}

TEST(Transform2dFunctor, AnUpwardOffsetMovesAPointDownAndTheScaleActsOnTheShiftedPoint) {
    auto transform = Nothing();
    transform.offset_y = 10.0f;
    Vector2d const shifted = Transform2dFunctor(transform).Call(Vector2d(1.0f, 30.0f));
    EXPECT_EQ(1.0f, shifted.x);
    EXPECT_EQ(20.0f, shifted.y);
    transform.scale_x = 2.0f;
    transform.scale_y = 2.0f;
    Vector2d const scaled = Transform2dFunctor(transform).Call(Vector2d(1.0f, 30.0f));
    EXPECT_EQ(0.5f, scaled.x);
    EXPECT_EQ(10.0f, scaled.y);  // (30 - 10) / 2
}

TEST(Transform2dFunctor, ZeroAngleWithACentreHasNoEffect) {
    auto transform = Nothing();
    transform.centre_x = 100.0f;
    transform.centre_y = -50.0f;
    Vector2d const result = Transform2dFunctor(transform).Call(Vector2d(3.0f, 4.0f));
    EXPECT_EQ(3.0f, result.x);
    EXPECT_EQ(4.0f, result.y);
}

TEST(Transform2dFunctor, RotatesAboutItsCentre) {
    auto transform = Nothing();
    transform.centre_x = 1.0f;
    transform.centre_y = 1.0f;
    transform.angle = Trigonometry::HALF_PI;
    Transform2dFunctor functor(transform);
    Vector2d const centre = functor.Call(Vector2d(1.0f, 1.0f));
    EXPECT_NEAR(1.0f, centre.x, TOLERANCE);
    EXPECT_NEAR(1.0f, centre.y, TOLERANCE);
    Vector2d const turned = functor.Call(Vector2d(2.0f, 1.0f));  // a quarter turn anticlockwise
    EXPECT_NEAR(1.0f, turned.x, TOLERANCE);
    EXPECT_NEAR(2.0f, turned.y, TOLERANCE);
}

TEST(Transform2dFunctor, MirrorsComeFirstThenTheShift) {
    auto transform = Nothing();
    transform.mirror_x = true;
    transform.offset_x = 5.0f;
    Vector2d const result = Transform2dFunctor(transform).Call(Vector2d(2.0f, 3.0f));
    EXPECT_EQ(3.0f, result.x);  // -2 + 5
    EXPECT_EQ(3.0f, result.y);
    transform = Nothing();
    transform.mirror_y = true;
    EXPECT_EQ(-3.0f, Transform2dFunctor(transform).Call(Vector2d(2.0f, 3.0f)).y);
}

TEST(Transform2dFunctor, SetupStartsAgainFromTheIdentity) {
    auto transform = Nothing();
    transform.scale_x = 2.0f;
    transform.scale_y = 2.0f;
    Transform2dFunctor functor(transform);
    functor.Setup(Nothing());
    EXPECT_EQ(8.0f, functor.Call(Vector2d(8.0f, 0.0f)).x);
}

TEST(Transform2dFunctor, AssignmentCopiesTheMatrixAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    auto transform = Nothing();
    transform.offset_x = 3.0f;
    Transform2dFunctor const source(transform);
    Transform2dFunctor target;
    target = source;
    EXPECT_EQ(3.0f, target.Call(Vector2d()).x);
    Transform2dFunctor& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Transform2dFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
