#include "vexmap/orientation_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float TOLERANCE = 1e-6f;

// The base is abstract; this link hands back the point the rotation makes of (0, 0, 1)'s
// neighbour, so the stored state can be seen.
class Probe : public OrientationFunctor {
public:
    using OrientationFunctor::OrientationFunctor;
    Vector2d Call(Vector2d const& point) override { return point; }
};

TEST(OrientationFunctor, DefaultHasNoRotationAndNoFocalLength) {
    Probe const probe;
    EXPECT_EQ(1.0f, probe.rotation.m11);
    EXPECT_EQ(0.0f, probe.rotation.m12);
    EXPECT_TRUE(FloatingPoint::is_nan(probe.focal_length));
}

TEST(OrientationFunctor, SetBuildsTheRotationFromTheAnglesAndKeepsTheFocalLength) {
    Probe probe;
    probe.Set(EulerAngles(Trigonometry::HALF_PI, 0.0f, 0.0f), 500.0f);
    EXPECT_EQ(500.0f, probe.focal_length);
    // A quarter pan turns the axis of view (0, 0, 1) to (1, 0, 0).
    Vector3d const axis = probe.rotation.ObjectToInertial(Vector3d(0.0f, 0.0f, 1.0f));
    EXPECT_NEAR(1.0f, axis.x, TOLERANCE);
    EXPECT_NEAR(0.0f, axis.z, TOLERANCE);
}

TEST(OrientationFunctor, APositionGivesItsOrientationAndNotItsZoom) {
    Probe const probe(PtzPosition(EulerAngles(0.0f, 0.3f, 0.0f), 8.0f), 200.0f);
    Probe const same(EulerAngles(0.0f, 0.3f, 0.0f), 200.0f);
    EXPECT_EQ(same.rotation.m23, probe.rotation.m23);
    EXPECT_EQ(same.rotation.m22, probe.rotation.m22);
    EXPECT_EQ(200.0f, probe.focal_length);
}

TEST(OrientationFunctor, AssignmentCopiesAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Probe const source(EulerAngles(0.4f, 0.0f, 0.0f), 10.0f);
    Probe target;
    target = source;
    EXPECT_EQ(10.0f, target.focal_length);
    EXPECT_EQ(source.rotation.m13, target.rotation.m13);
    OrientationFunctor& same = target;
    same = static_cast<OrientationFunctor const&>(target);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of OrientationFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
