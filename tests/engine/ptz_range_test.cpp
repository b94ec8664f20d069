#include "vexmap/ptz_range.h"

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float RADIAN_TOLERANCE = 1e-5f;
constexpr float DEGREE_TOLERANCE = 1e-3f;
float const PI = Trigonometry::PI;

TEST(PtzRange, IntervalConstantsHoldTheirValuesInForce) {
    EXPECT_EQ(0.0f, PtzRange::EmptyZoomRange.x);  // written from (1, 1), in force (0, 0)
    EXPECT_EQ(0.0f, PtzRange::EmptyZoomRange.y);
    EXPECT_EQ(FloatingPoint::Infinity, PtzRange::InfiniteZoomRange.x);
    EXPECT_EQ(0.5f, PtzRange::InfiniteZoomRange.y);
    EXPECT_EQ(PI, PtzRange::FullMotion.x);
    EXPECT_EQ(-PI, PtzRange::FullMotion.y);
    EXPECT_EQ(0.0f, PtzRange::NoMotion.x);
    EXPECT_EQ(0u, PtzRange::ZeroFlags);
    EXPECT_EQ(1u, PtzRange::NoDeflateHighTilt);
    EXPECT_EQ(2u, PtzRange::NoDeflateLowTilt);
}

TEST(PtzRange, PtzRangesTiltByMount) {
    _DEWARP_PTZ_RANGE const ceiling = PtzRange::CeilingPtzRange.Get();
    EXPECT_NEAR(-135.0f, ceiling.tilt_min, DEGREE_TOLERANCE);
    EXPECT_NEAR(22.5f, ceiling.tilt_max, DEGREE_TOLERANCE);
    _DEWARP_PTZ_RANGE const floor = PtzRange::FloorPtzRange.Get();
    EXPECT_NEAR(-22.5f, floor.tilt_min, DEGREE_TOLERANCE);
    EXPECT_NEAR(135.0f, floor.tilt_max, DEGREE_TOLERANCE);
    EXPECT_EQ(PtzRange::FullMotion, PtzRange::CeilingPtzRange.pan);
    EXPECT_EQ(0.5f, PtzRange::FloorPtzRange.zoom.y);
}

TEST(PtzRange, PanoramicRangesMoveOnOneAxisOnly) {
    EXPECT_EQ(PI, PtzRange::CeilingPanoramicRange.pan.x);
    EXPECT_EQ(0.0f, PtzRange::CeilingPanoramicRange.roll.x);
    EXPECT_EQ(PI, PtzRange::FloorPanoramicRange.pan.x);
    EXPECT_EQ(0.0f, PtzRange::WallPanoramicRange.pan.x);
    EXPECT_EQ(-PI, PtzRange::WallPanoramicRange.roll.y);
    EXPECT_EQ(PI, PtzRange::InvertedWallPanoramicRange.roll.x);
    EXPECT_EQ(0.0f, PtzRange::EmptyPtzRange.pan.x);
}

class PtzRangeConstantTest : public ::testing::TestWithParam<PtzRange const*> {};

TEST_P(PtzRangeConstantTest, ReadsBackWithEachLowerBoundBeforeItsUpperBound) {
    _DEWARP_PTZ_RANGE const record = GetParam()->Get();
    EXPECT_LE(record.pan_min, record.pan_max);
    EXPECT_LE(record.tilt_min, record.tilt_max);
    EXPECT_LE(record.roll_min, record.roll_max);
    EXPECT_LE(record.zoom_min, record.zoom_max);
    EXPECT_EQ(0u, GetParam()->flags);
}

INSTANTIATE_TEST_SUITE_P(EveryConstant, PtzRangeConstantTest,
                         ::testing::Values(&PtzRange::EmptyPtzRange,
                                           &PtzRange::CeilingPanoramicRange,
                                           &PtzRange::FloorPanoramicRange,
                                           &PtzRange::WallPanoramicRange,
                                           &PtzRange::InvertedWallPanoramicRange,
                                           &PtzRange::CeilingPtzRange, &PtzRange::FloorPtzRange));

TEST(PtzRange, ARecordOfAFullTurnBecomesAnIntervalWithBothBoundsAtMinusPi) {
    PtzRange const range(_DEWARP_PTZ_RANGE{-180.0f, 180.0f, -90.0f, 45.0f, 0.0f, 0.0f, 1.0f, 8.0f});
    EXPECT_NEAR(-PI, range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-PI, range.pan.y, RADIAN_TOLERANCE);
    EXPECT_NEAR(Trigonometry::QUARTER_PI, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Trigonometry::HALF_PI, range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_EQ(8.0f, range.zoom.x);
    EXPECT_EQ(1.0f, range.zoom.y);
}

TEST(PtzRange, SetFromARecordLeavesTheFlags) {
    PtzRange range(PtzRange::NoMotion, PtzRange::NoMotion, PtzRange::NoMotion, PtzRange::NoMotion,
                   PtzRange::NoDeflateLowTilt);
    range = _DEWARP_PTZ_RANGE{-10.0f, 10.0f, -10.0f, 10.0f, -10.0f, 10.0f, 1.0f, 2.0f};
    EXPECT_EQ(PtzRange::NoDeflateLowTilt, range.flags);
    _DEWARP_PTZ_RANGE const record = range.Get();
    EXPECT_NEAR(-10.0f, record.roll_min, DEGREE_TOLERANCE);
    EXPECT_NEAR(10.0f, record.roll_max, DEGREE_TOLERANCE);
    EXPECT_EQ(2.0f, record.zoom_max);
}

TEST(PtzRange, AFieldOfViewOfAFullTurnGivesAnUpperBoundBelowTheLower) {
    PtzRange const range(FieldOfView(Trigonometry::TWO_PI, Trigonometry::HALF_PI),
                         PtzRange::InfiniteZoomRange, PtzRange::ZeroFlags);
    EXPECT_NEAR(-PI, range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(PI, range.pan.y, RADIAN_TOLERANCE);
    for (float pan : {-3.0f, -1.0f, 0.0f, 2.0f, 3.1f}) {
        EXPECT_EQ(range.pan.x, range.LimitPan(pan)) << pan;  // the upper test runs last
    }
}

TEST(PtzRange, SetFromAFieldOfViewTakesHalfEachWayAndFreesRoll) {
    PtzRange range;
    range.Set(FieldOfView(1.0f, 0.5f), Vector2d(4.0f, 1.0f));
    EXPECT_NEAR(0.5f, range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-0.5f, range.pan.y, RADIAN_TOLERANCE);
    EXPECT_NEAR(0.25f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_EQ(PtzRange::FullMotion, range.roll);
    EXPECT_EQ(4.0f, range.zoom.x);
}

TEST(PtzRange, SetFromAnglesTakesHalfOfEachEachWay) {
    PtzRange const range(EulerAngles(1.0f, 0.6f, 0.2f), Vector2d(2.0f, 1.0f), 3u);
    EXPECT_NEAR(0.5f, range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-0.3f, range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_NEAR(0.1f, range.roll.x, RADIAN_TOLERANCE);
    EXPECT_EQ(3u, range.flags);
}

TEST(PtzRange, DeflateNarrowsPanAndTiltByHalfTheField) {
    PtzRange range(Vector2d(1.0f, -1.0f), Vector2d(0.8f, -0.8f), Vector2d(0.3f, -0.3f),
                   Vector2d(5.0f, 1.0f), PtzRange::ZeroFlags);
    range.Deflate(FieldOfView(0.4f, 0.2f));
    EXPECT_NEAR(0.8f, range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-0.8f, range.pan.y, RADIAN_TOLERANCE);
    EXPECT_NEAR(0.7f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-0.7f, range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_EQ(0.3f, range.roll.x);
    EXPECT_EQ(5.0f, range.zoom.x);
}

TEST(PtzRange, DeflateOfARangeNarrowerThanTheFieldLeavesItsMidpoint) {
    PtzRange range(Vector2d(0.3f, 0.1f), Vector2d(0.5f, 0.3f), PtzRange::NoMotion,
                   PtzRange::InfiniteZoomRange, PtzRange::ZeroFlags);
    range.Deflate(FieldOfView(1.0f, 1.0f));
    EXPECT_FLOAT_EQ(0.2f, range.pan.x);
    EXPECT_FLOAT_EQ(0.2f, range.pan.y);
    EXPECT_FLOAT_EQ(0.4f, range.tilt.x);
    EXPECT_FLOAT_EQ(0.4f, range.tilt.y);
}

TEST(PtzRange, DeflateAndInflateLeaveFullMotion) {
    PtzRange range(PtzRange::FullMotion, PtzRange::FullMotion, PtzRange::NoMotion,
                   PtzRange::InfiniteZoomRange, PtzRange::ZeroFlags);
    range.Deflate(FieldOfView(1.0f, 1.0f));
    EXPECT_EQ(PI, range.pan.x);
    EXPECT_EQ(-PI, range.tilt.y);
    range.Inflate(FieldOfView(1.0f, 1.0f));
    EXPECT_EQ(PI, range.pan.x);
    EXPECT_EQ(-PI, range.pan.y);
    EXPECT_EQ(PI, range.tilt.x);
}

TEST(PtzRange, InflateWidensPanAndTiltByHalfTheField) {
    PtzRange range = PtzRange::CeilingPtzRange;
    range.Inflate(FieldOfView(Trigonometry::HALF_PI, Trigonometry::HALF_PI));
    EXPECT_EQ(PI, range.pan.x);  // full motion stays
    EXPECT_NEAR(Trigonometry::QUARTER_PI * 1.5f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-PI, range.tilt.y, RADIAN_TOLERANCE);
}

TEST(PtzRange, FlagsKeepATiltBoundAndAreAnnouncedOnStandardError) {
    PtzRange range(PtzRange::NoMotion, Vector2d(0.8f, -0.8f), PtzRange::NoMotion,
                   PtzRange::InfiniteZoomRange,
                   PtzRange::NoDeflateHighTilt | PtzRange::NoDeflateLowTilt);
    ::testing::internal::CaptureStderr();
    range.Deflate(FieldOfView(0.4f, 0.2f));
    std::string const announced = ::testing::internal::GetCapturedStderr();
    EXPECT_EQ("NoDeflateHighTilt flag active\nNoDeflateLowTilt flag active\n", announced);
    EXPECT_EQ(0.8f, range.tilt.x);
    EXPECT_EQ(-0.8f, range.tilt.y);
}

TEST(PtzRange, OneFlagKeepsOnlyItsBound) {
    PtzRange range(PtzRange::NoMotion, Vector2d(0.8f, -0.8f), PtzRange::NoMotion,
                   PtzRange::InfiniteZoomRange, PtzRange::NoDeflateLowTilt);
    ::testing::internal::CaptureStderr();
    range.Deflate(FieldOfView(0.4f, 0.2f));
    EXPECT_EQ("NoDeflateLowTilt flag active\n", ::testing::internal::GetCapturedStderr());
    EXPECT_NEAR(0.7f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_EQ(-0.8f, range.tilt.y);
}

TEST(PtzRange, LimitZoomRaisesToTheLowerBoundAndHasNoUpperOneOnAnInfiniteRange) {
    PtzRange const range = PtzRange::CeilingPtzRange;
    EXPECT_EQ(0.5f, range.LimitZoom(0.25f));
    EXPECT_EQ(1000.0f, range.LimitZoom(1000.0f));
}

TEST(PtzRange, LimitLetsNotANumberThroughAndWrapsNoAngle) {
    PtzRange const range(Vector2d(1.0f, -1.0f), Vector2d(0.5f, -0.5f), PtzRange::NoMotion,
                         Vector2d(4.0f, 1.0f), PtzRange::ZeroFlags);
    EXPECT_TRUE(FloatingPoint::is_nan(range.LimitTilt(FloatingPoint::Nan)));
    EXPECT_EQ(1.0f, range.LimitPan(PI + 1.0f));
    EXPECT_EQ(-0.5f, range.LimitTilt(-3.0f));
    EXPECT_EQ(0.0f, range.LimitRoll(0.7f));
}

class PanoramicRangeTest : public ::testing::TestWithParam<PtzRange const*> {};

TEST_P(PanoramicRangeTest, LimitGivesZoomZero) {
    PtzPosition const limited = GetParam()->Limit(PtzPosition(EulerAngles(0.5f, 0.5f, 0.5f), 3.0f));
    EXPECT_EQ(0.0f, limited.zoom);
}

INSTANTIATE_TEST_SUITE_P(EveryPanoramicConstant, PanoramicRangeTest,
                         ::testing::Values(&PtzRange::CeilingPanoramicRange,
                                           &PtzRange::FloorPanoramicRange,
                                           &PtzRange::WallPanoramicRange,
                                           &PtzRange::InvertedWallPanoramicRange));

TEST(PtzRange, LimitHoldsEveryMemberOfAPosition) {
    PtzRange const range(Vector2d(1.0f, -1.0f), Vector2d(0.5f, -0.5f), Vector2d(0.2f, -0.2f),
                         Vector2d(4.0f, 1.0f), PtzRange::ZeroFlags);
    PtzPosition const limited = range.Limit(PtzPosition(EulerAngles(2.0f, -2.0f, 0.1f), 9.0f));
    EXPECT_EQ(1.0f, limited.orientation.pan);
    EXPECT_EQ(-0.5f, limited.orientation.tilt);
    EXPECT_EQ(0.1f, limited.orientation.roll);
    EXPECT_EQ(4.0f, limited.zoom);
}

TEST(PtzRange, AssignmentCopiesAllNineValuesAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PtzRange range;
    range = PtzRange(Vector2d(1.0f, -1.0f), Vector2d(0.5f, -0.5f), Vector2d(0.2f, -0.2f),
                     Vector2d(4.0f, 1.0f), 3u);
    EXPECT_EQ(-0.2f, range.roll.y);
    EXPECT_EQ(3u, range.flags);
    PtzRange& same = range;
    range = same;
    EXPECT_EQ(4.0f, range.zoom.x);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PtzRange object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
