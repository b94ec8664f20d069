#include "vexmap/spherical_ptz_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/rotation.h"

namespace quorvel::vexmap {
namespace {

constexpr float F = 400.0f;
constexpr float TOLERANCE = 1e-3f;

TEST(SphericalPtzFunctor, TheCentreAtTheIdentityStaysByItsGuardsNotNan) {
    Vector2d const result =
        SphericalPtzFunctor::SphericalPerspective(Vector2d(0.0f, 0.0f), F, RotationMatrix3d());
    EXPECT_EQ(0.0f, result.x);
    EXPECT_EQ(0.0f, result.y);
    Vector2d const back =
        SphericalPtzFunctor::InvSphericalPerspective(Vector2d(0.0f, 0.0f), F, RotationMatrix3d());
    EXPECT_EQ(0.0f, back.x);
    EXPECT_EQ(0.0f, back.y);
}

TEST(SphericalPtzFunctor, PerspectivesAreTheSphericalRotationsBothWays) {
    RotationMatrix3d const m(0.3f, -0.2f, 0.1f);
    Vector2d const p(120.0f, -45.0f);
    Vector2d const forward = SphericalPtzFunctor::SphericalPerspective(p, F, m);
    Vector2d const expected = Rotation::SphericalRotation(p, F, m);
    EXPECT_EQ(expected.x, forward.x);
    EXPECT_EQ(expected.y, forward.y);
    Vector2d const back = SphericalPtzFunctor::InvSphericalPerspective(forward, F, m);
    EXPECT_NEAR(p.x, back.x, TOLERANCE);
    EXPECT_NEAR(p.y, back.y, TOLERANCE);
}

TEST(SphericalPtzFunctor, CallZoomsAboutTheCentreThenTurns) {
    SphericalPtzFunctor functor(PtzPosition(EulerAngles(0.25f, 0.0f, 0.0f), 2.0f), F);
    Vector2d const result = functor.Call(Vector2d(0.0f, 0.0f));
    EXPECT_NEAR(0.25f * F, result.x, TOLERANCE);  // the pan moves the centre by f times it
    Vector2d const zoomed =
        SphericalPtzFunctor(PtzPosition(EulerAngles(), 2.0f), F).Call(Vector2d(100.0f, -60.0f));
    EXPECT_NEAR(50.0f, zoomed.x, TOLERANCE);
    EXPECT_NEAR(-30.0f, zoomed.y, TOLERANCE);
}

TEST(SphericalPtzFunctor, ADefaultFunctorGivesNan) {
    SphericalPtzFunctor functor;
    EXPECT_TRUE(FloatingPoint::is_nan(functor.Call(Vector2d(10.0f, 10.0f)).x));
}

TEST(SphericalPtzFunctor, AssignmentCopiesAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    SphericalPtzFunctor const source(PtzPosition(EulerAngles(), 3.0f), F);
    SphericalPtzFunctor target;
    target = source;
    EXPECT_EQ(3.0f, target.zoom);
    EXPECT_EQ(F, target.focal_length);
    SphericalPtzFunctor& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of SphericalPtzFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
