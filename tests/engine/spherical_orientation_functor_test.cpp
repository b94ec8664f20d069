#include "vexmap/spherical_orientation_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float F = 300.0f;
constexpr float TOLERANCE = 1e-3f;  // pixels, at a focal length of 300

TEST(SphericalOrientationFunctor, ZeroAnglesReturnThePointAndTheCentreExactly) {
    SphericalOrientationFunctor functor(EulerAngles(0.0f, 0.0f, 0.0f), F);
    Vector2d const centre = functor.Call(Vector2d(0.0f, 0.0f));
    EXPECT_EQ(0.0f, centre.x);
    EXPECT_EQ(0.0f, centre.y);
    for (Vector2d const& point :
         {Vector2d(10.0f, 20.0f), Vector2d(-150.0f, 80.0f), Vector2d(300.0f, -250.0f)}) {
        Vector2d const same = functor.Call(point);
        EXPECT_NEAR(point.x, same.x, TOLERANCE);
        EXPECT_NEAR(point.y, same.y, TOLERANCE);
    }
}

TEST(SphericalOrientationFunctor, APanMovesTheCentreAlongTheFisheyeRadius) {
    // On an equidistant picture a direction at angle a from the axis lies at radius f * a.
    SphericalOrientationFunctor functor(EulerAngles(0.5f, 0.0f, 0.0f), F);
    Vector2d const moved = functor.Call(Vector2d(0.0f, 0.0f));
    EXPECT_NEAR(0.5f * F, moved.x, TOLERANCE);
    EXPECT_NEAR(0.0f, moved.y, TOLERANCE);
}

TEST(SphericalOrientationFunctor, TakesThePositionsOrientation) {
    // Tilt turns the axis (0, 0, 1) about x to (0, -sin t, cos t): the centre moves down.
    SphericalOrientationFunctor functor(PtzPosition(EulerAngles(0.0f, 0.25f, 0.0f), 4.0f), F);
    Vector2d const moved = functor.Call(Vector2d(0.0f, 0.0f));
    EXPECT_NEAR(0.0f, moved.x, TOLERANCE);
    EXPECT_NEAR(-0.25f * F, moved.y, TOLERANCE);
}

TEST(SphericalOrientationFunctor, AssignmentWarnsOnItselfWithItsOwnName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    SphericalOrientationFunctor functor(EulerAngles(0.1f, 0.0f, 0.0f), F);
    SphericalOrientationFunctor& same = functor;
    functor = same;
    SphericalOrientationFunctor other;
    other = functor;
    EXPECT_EQ(F, other.focal_length);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of SphericalOrientationFunctor object\n",
              lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
