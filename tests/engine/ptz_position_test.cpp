#include "vexmap/ptz_position.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float DEGREE_TOLERANCE = 1e-3f;
constexpr float RADIAN_TOLERANCE = 1e-5f;

TEST(PtzPosition, DefaultLooksAheadAtZoomOne) {
    PtzPosition const position;
    EXPECT_EQ(0.0f, position.orientation.pan);
    EXPECT_EQ(0.0f, position.orientation.tilt);
    EXPECT_EQ(0.0f, position.orientation.roll);
    EXPECT_EQ(1.0f, position.zoom);
    EXPECT_EQ(1.0f, PtzPosition::DefaultZoom);
    EXPECT_EQ(0.0f, PtzPosition::DefaultOrientation.pan);
    EXPECT_EQ(1.0f, PtzPosition::Identity.zoom);
    EXPECT_EQ(0.0f, PtzPosition::Identity.orientation.tilt);
}

TEST(PtzPosition, SetTakesDegreesIntoNormalisedRadiansAndTheZoomAsItIs) {
    PtzPosition const position(_DEWARP_PTZ_POSITION{90.0f, -45.0f, 30.0f, 2.5f});
    EXPECT_NEAR(Trigonometry::HALF_PI, position.orientation.pan, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Trigonometry::QUARTER_PI, position.orientation.tilt, RADIAN_TOLERANCE);
    EXPECT_NEAR(Trigonometry::PI / 6, position.orientation.roll, RADIAN_TOLERANCE);
    EXPECT_EQ(2.5f, position.zoom);
}

TEST(PtzPosition, APanOfHalfATurnReadsBackAsMinusHalfATurn) {
    PtzPosition position;
    position = _DEWARP_PTZ_POSITION{180.0f, 0.0f, 0.0f, 1.0f};
    EXPECT_NEAR(-180.0f, position.Get().pan, DEGREE_TOLERANCE);
}

TEST(PtzPosition, AnAngleBeyondATurnReadsBackNormalised) {
    PtzPosition position;
    position.Set(_DEWARP_PTZ_POSITION{370.0f, -350.0f, 0.0f, 1.0f});
    _DEWARP_PTZ_POSITION record{};
    position.Get(record);
    EXPECT_NEAR(10.0f, record.pan, DEGREE_TOLERANCE);
    EXPECT_NEAR(10.0f, record.tilt, DEGREE_TOLERANCE);
}

TEST(PtzPosition, GetDoesNotNormalise) {
    PtzPosition const position(EulerAngles(4.0f, 0.0f, 0.0f), 3.0f);
    _DEWARP_PTZ_POSITION const record = position.Get();
    EXPECT_NEAR(4.0f * 57.29578f, record.pan, DEGREE_TOLERANCE);
    EXPECT_EQ(3.0f, record.zoom);
}

TEST(PtzPosition, SetIdentityKeepsTheZoom) {
    PtzPosition position(EulerAngles(1.0f, 0.5f, 0.2f), 4.0f);
    position.SetIdentity();
    EXPECT_EQ(0.0f, position.orientation.pan);
    EXPECT_EQ(0.0f, position.orientation.roll);
    EXPECT_EQ(4.0f, position.zoom);
}

TEST(PtzPosition, AClearedPositionComparesEqualToAnyPosition) {
    PtzPosition cleared;
    cleared.Clear();
    EXPECT_TRUE(FloatingPoint::is_nan(cleared.zoom));
    EXPECT_TRUE(FloatingPoint::is_nan(cleared.orientation.pan));
    EXPECT_TRUE(cleared == PtzPosition(EulerAngles(1.0f, 2.0f, 3.0f), 7.0f));
    EXPECT_FALSE(cleared != PtzPosition(EulerAngles(1.0f, 2.0f, 3.0f), 7.0f));
}

TEST(PtzPosition, ADifferenceInAnyMemberMakesPositionsUnequal) {
    PtzPosition const base(EulerAngles(1.0f, 2.0f, 3.0f), 2.0f);
    EXPECT_TRUE(base == PtzPosition(EulerAngles(1.0f, 2.0f, 3.0f), 2.0f));
    EXPECT_TRUE(base != PtzPosition(EulerAngles(1.0f, 2.0f, 3.0f), 2.5f));
    EXPECT_TRUE(base != PtzPosition(EulerAngles(1.0f, 2.5f, 3.0f), 2.0f));
    EXPECT_FALSE(base == PtzPosition(EulerAngles(1.0f, 2.0f, 3.0f), 2.5f));
}

TEST(PtzPosition, IsValidIsFalseForEveryPosition) {
    EXPECT_FALSE(PtzPosition().IsValid());
    EXPECT_FALSE(PtzPosition(EulerAngles(0.1f, 0.2f, 0.3f), 2.0f).IsValid());
}

TEST(PtzPosition, ConcatenateComposesOrientationsAndMultipliesZooms) {
    PtzPosition position(EulerAngles(0.3f, 0.0f, 0.0f), 2.0f);
    position.Concatenate(PtzPosition(EulerAngles(0.2f, 0.0f, 0.0f), 1.5f));
    EXPECT_NEAR(0.5f, position.orientation.pan, RADIAN_TOLERANCE);  // turns about one axis add
    EXPECT_NEAR(0.0f, position.orientation.tilt, RADIAN_TOLERANCE);
    EXPECT_EQ(3.0f, position.zoom);
}

TEST(PtzPosition, ConcatenateWithAnOrientationLeavesTheZoom) {
    PtzPosition position(EulerAngles(0.0f, 0.1f, 0.0f), 2.0f);
    position.Concatenate(EulerAngles(0.0f, 0.2f, 0.0f));
    EXPECT_NEAR(0.3f, position.orientation.tilt, RADIAN_TOLERANCE);
    EXPECT_EQ(2.0f, position.zoom);
}

TEST(PtzPosition, StaticConcatenateLeavesBothOperands) {
    PtzPosition const a(EulerAngles(0.3f, 0.0f, 0.0f), 2.0f);
    PtzPosition const b(EulerAngles(0.2f, 0.0f, 0.0f), 3.0f);
    PtzPosition const sum = PtzPosition::Concatenate(a, b);
    EXPECT_NEAR(0.5f, sum.orientation.pan, RADIAN_TOLERANCE);
    EXPECT_EQ(6.0f, sum.zoom);
    EXPECT_EQ(0.3f, a.orientation.pan);
}

TEST(PtzPosition, AssignmentToItselfWarnsAndKeepsThePosition) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PtzPosition position(EulerAngles(0.1f, 0.2f, 0.3f), 2.0f);
    PtzPosition& same = position;
    position = same;
    EXPECT_EQ(2.0f, position.zoom);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PtzPosition object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
