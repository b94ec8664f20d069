#include "vexmap/ptz_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

// The base is abstract; this link hands its point back.
class Probe : public PtzFunctor {
public:
    using PtzFunctor::PtzFunctor;
    using PtzFunctor::operator=;
    Vector2d Call(Vector2d const& point) override { return point; }
};

TEST(PtzFunctor, DefaultHasNoTurnZoomOneAndNoFocalLength) {
    Probe const probe;
    EXPECT_EQ(1.0f, probe.rotation.m11);
    EXPECT_EQ(1.0f, probe.zoom);
    EXPECT_TRUE(FloatingPoint::is_nan(probe.focal_length));
    EXPECT_EQ(0u, probe.reserved);
    EXPECT_EQ(0.0f, probe.zoom_centre.x);
}

TEST(PtzFunctor, ZoomByOneReturnsThePoint) {
    Probe const probe;
    Vector2d const result = probe.Zoom(Vector2d(12.0f, -7.0f), 1.0f);
    EXPECT_EQ(12.0f, result.x);
    EXPECT_EQ(-7.0f, result.y);
}

TEST(PtzFunctor, ZoomByTwoAboutTheDefaultCentreHalvesThePoint) {
    Probe const probe;
    Vector2d const result = probe.Zoom(Vector2d(12.0f, -7.0f), 2.0f);
    EXPECT_EQ(6.0f, result.x);
    EXPECT_EQ(-3.5f, result.y);
}

TEST(PtzFunctor, ZoomGoesTowardsTheZoomCentre) {
    Probe probe;
    probe.zoom_centre = Vector2d(10.0f, 10.0f);
    Vector2d const result = probe.Zoom(Vector2d(30.0f, 10.0f), 4.0f);
    EXPECT_EQ(15.0f, result.x);
    EXPECT_EQ(10.0f, result.y);
}

TEST(PtzFunctor, SetTakesThePositionAndClearsTheVectors) {
    Probe probe;
    probe.zoom_centre = Vector2d(5.0f, 5.0f);
    probe.reserved_b = Vector2d(1.0f, 1.0f);
    probe.Set(PtzPosition(EulerAngles(Trigonometry::HALF_PI, 0.0f, 0.0f), 3.0f), 250.0f);
    EXPECT_EQ(3.0f, probe.zoom);
    EXPECT_EQ(250.0f, probe.focal_length);
    EXPECT_NEAR(1.0f, probe.rotation.m13, 1e-6f);  // a quarter pan looks along x
    EXPECT_EQ(0.0f, probe.zoom_centre.x);
    EXPECT_EQ(0.0f, probe.reserved_b.y);
}

TEST(PtzFunctor, CopiesCarryEveryMemberAndSelfAssignmentWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Probe source(PtzPosition(EulerAngles(0.2f, 0.1f, 0.0f), 2.0f), 100.0f);
    source.reserved = 42;
    source.reserved_c = Vector2d(7.0f, 8.0f);
    Probe target;
    target = source;
    EXPECT_EQ(42u, target.reserved);
    EXPECT_EQ(8.0f, target.reserved_c.y);
    EXPECT_EQ(2.0f, target.zoom);
    EXPECT_EQ(source.rotation.m12, target.rotation.m12);
    PtzFunctor& same = target;
    same = static_cast<PtzFunctor const&>(target);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PtzFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
