#include "vexmap/resolution.h"

#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

using testing::AllOf;
using testing::Field;

testing::Matcher<Vector2d const&> IsVector(float x, float y) {
    return AllOf(Field("x", &Vector2d::x, x), Field("y", &Vector2d::y, y));
}

// A Resolution that holds a fraction, as the compound operators leave it.
Resolution Fractional(float width, float height) {
    Resolution size;
    size.x = width;
    size.y = height;
    return size;
}

TEST(Resolution, DefaultIsZero) {
    EXPECT_THAT(Resolution(), IsVector(0.0f, 0.0f));
}

struct FlooredCase {
    float x;
    float y;
    float floored_x;
    float floored_y;
};

std::ostream& operator<<(std::ostream& stream, FlooredCase const& value) {
    return stream << "(" << value.x << ", " << value.y << ")";
}

class ResolutionFloorTest : public testing::TestWithParam<FlooredCase> {};

TEST_P(ResolutionFloorTest, FloatConstructorFloorsEachValue) {
    FlooredCase const& c = GetParam();
    EXPECT_THAT(Resolution(c.x, c.y), IsVector(c.floored_x, c.floored_y));
}

TEST_P(ResolutionFloorTest, VectorConstructorFloorsEachComponent) {
    FlooredCase const& c = GetParam();
    EXPECT_THAT(Resolution(Vector2d(c.x, c.y)), IsVector(c.floored_x, c.floored_y));
}

TEST_P(ResolutionFloorTest, AssignmentFromAVectorFloorsEachComponent) {
    FlooredCase const& c = GetParam();
    Resolution size(7, 9);
    size = Vector2d(c.x, c.y);
    EXPECT_THAT(size, IsVector(c.floored_x, c.floored_y));
}

INSTANTIATE_TEST_SUITE_P(Resolution, ResolutionFloorTest,
                         testing::Values(FlooredCase{640.7f, 480.2f, 640.0f, 480.0f},
                                         FlooredCase{-0.5f, 0.5f, -1.0f, 0.0f},
                                         FlooredCase{1920.0f, 1080.0f, 1920.0f, 1080.0f},
                                         FlooredCase{-2.0f, 0.999f, -2.0f, 0.0f}));

TEST(Resolution, IntegerConstructorConvertsEachValue) {
    EXPECT_THAT(Resolution(640, 480), IsVector(640.0f, 480.0f));
    EXPECT_THAT(Resolution(-3, 7), IsVector(-3.0f, 7.0f));
}

TEST(Resolution, UnsignedConstructorConvertsValuesBeyondTheSignedRange) {
    EXPECT_THAT(Resolution(3000000000u, 2u), IsVector(3000000000.0f, 2.0f));
}

TEST(Resolution, InvalidResolutionHoldsZerosAndEqualsADefaultResolution) {
    EXPECT_EQ(0.0f, Resolution::InvalidResolution.x);
    EXPECT_EQ(0.0f, Resolution::InvalidResolution.y);
    EXPECT_FALSE(FloatingPoint::is_nan(Resolution::InvalidResolution.x));
    EXPECT_FALSE(FloatingPoint::is_nan(Resolution::InvalidResolution.y));
    EXPECT_TRUE(Resolution::InvalidResolution == Resolution());
    EXPECT_FALSE(Resolution::InvalidResolution != Resolution());
}

TEST(Resolution, InvalidResolutionIsNotValid) {
    EXPECT_FALSE(Resolution::InvalidResolution.Valid());
}

TEST(Resolution, CopyCarriesAFraction) {
    Resolution const copy(Fractional(320.5f, 240.5f));
    EXPECT_THAT(copy, IsVector(320.5f, 240.5f));
}

TEST(Resolution, AssignmentFromAResolutionCopiesWithoutFlooring) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Resolution size;
    size = Fractional(320.5f, 240.5f);
    EXPECT_THAT(size, IsVector(320.5f, 240.5f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Resolution, AssignmentToItselfWarnsAndKeepsTheSize) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Resolution size = Fractional(320.5f, 240.5f);
    Resolution const& same = size;
    size = same;
    EXPECT_THAT(size, IsVector(320.5f, 240.5f));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Resolution object\n", lines[0].text);
}

TEST(Resolution, VectorAssignmentToItselfFloorsWithoutWarning) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Resolution size = Fractional(320.5f, 240.5f);
    Vector2d const& same = size;
    size = same;
    EXPECT_THAT(size, IsVector(320.0f, 240.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Resolution, EqualityIsLenientAsForVector2d) {
    EXPECT_TRUE(Resolution(640, 480) == Vector2d::InvalidVector);
    EXPECT_FALSE(Resolution(640, 480) != Vector2d::InvalidVector);
    EXPECT_TRUE(Resolution(640, 480) == Vector2d(640.0f, 480.0f));
    EXPECT_TRUE(Resolution(640, 480) == Resolution(640, 480));
    EXPECT_FALSE(Resolution(640, 480) == Resolution(640, 481));
    EXPECT_TRUE(Resolution(640, 480) != Resolution(640, 481));
    EXPECT_TRUE(Resolution(640, 480) != Vector2d(641.0f, 480.0f));
}

TEST(Resolution, UnaryMinusFloorsTheNegatedComponents) {
    EXPECT_THAT(-Fractional(320.5f, 240.5f), IsVector(-321.0f, -241.0f));
    EXPECT_THAT(-Resolution(640, 480), IsVector(-640.0f, -480.0f));
}

TEST(Resolution, AdditionFloorsTheSum) {
    EXPECT_THAT(Resolution(640, 480) + Vector2d(0.5f, 0.75f), IsVector(640.0f, 480.0f));
    EXPECT_THAT(Resolution(640, 480) + Resolution(2, 3), IsVector(642.0f, 483.0f));
    EXPECT_THAT(Fractional(0.5f, 0.5f) + Fractional(0.25f, 0.75f), IsVector(0.0f, 1.0f));
}

TEST(Resolution, SubtractionFloorsTheDifference) {
    EXPECT_THAT(Resolution(640, 480) - Vector2d(0.5f, 0.25f), IsVector(639.0f, 479.0f));
    EXPECT_THAT(Resolution(640, 480) - Resolution(40, 80), IsVector(600.0f, 400.0f));
}

TEST(Resolution, MultiplicationByAFloatFloors) {
    EXPECT_THAT(Resolution(640, 480) * 0.5f, IsVector(320.0f, 240.0f));
    EXPECT_THAT(Resolution(641, 481) * 0.5f, IsVector(320.0f, 240.0f));
}

TEST(Resolution, DivisionByAFloatFloors) {
    EXPECT_THAT(Resolution(641, 481) / 2.0f, IsVector(320.0f, 240.0f));
}

TEST(Resolution, CompoundMultiplicationKeepsTheFraction) {
    Resolution size(641, 481);
    Resolution& result = size *= 0.5f;
    EXPECT_EQ(&size, &result);
    EXPECT_THAT(size, IsVector(320.5f, 240.5f));
}

TEST(Resolution, CompoundDivisionKeepsTheFraction) {
    Resolution size(641, 481);
    Resolution& result = size /= 2.0f;
    EXPECT_EQ(&size, &result);
    EXPECT_THAT(size, IsVector(320.5f, 240.5f));
}

TEST(Resolution, CompoundAdditionKeepsTheFraction) {
    Resolution size(640, 480);
    Resolution& result = size += Vector2d(0.25f, 0.5f);
    EXPECT_EQ(&size, &result);
    EXPECT_THAT(size, IsVector(640.25f, 480.5f));
    size += Resolution(10, 20);
    EXPECT_THAT(size, IsVector(650.25f, 500.5f));
}

TEST(Resolution, CompoundSubtractionKeepsTheFraction) {
    Resolution size(640, 480);
    Resolution& result = size -= Vector2d(0.25f, 0.5f);
    EXPECT_EQ(&size, &result);
    EXPECT_THAT(size, IsVector(639.75f, 479.5f));
    size -= Resolution(10, 20);
    EXPECT_THAT(size, IsVector(629.75f, 459.5f));
}

TEST(Resolution, AspectRatioIsWidthOverHeight) {
    EXPECT_EQ(640.0f / 480.0f, Resolution(640, 480).AspectRatio());
    EXPECT_EQ(0.5f, Resolution(100, 200).AspectRatio());
}

TEST(Resolution, BestFitWithItsOwnAspectKeepsTheWidth) {
    Resolution const size(640, 480);
    float const aspect = size.AspectRatio();
    EXPECT_THAT(size.BestFit(aspect), IsVector(640.0f, 640.0f / aspect));
}

TEST(Resolution, BestFitOfAWiderAspectKeepsTheWidth) {
    EXPECT_THAT(Resolution(640, 480).BestFit(2.0f), IsVector(640.0f, 320.0f));
}

TEST(Resolution, BestFitOfANarrowerAspectKeepsTheHeight) {
    EXPECT_THAT(Resolution(640, 480).BestFit(1.0f), IsVector(480.0f, 480.0f));
    EXPECT_THAT(Resolution(640, 480).BestFit(0.5f), IsVector(240.0f, 480.0f));
}

TEST(Resolution, BestFitIsNotFloored) {
    EXPECT_THAT(Resolution(641, 480).BestFit(2.0f), IsVector(641.0f, 320.5f));
    EXPECT_THAT(Resolution(640, 481).BestFit(0.5f), IsVector(240.5f, 481.0f));
}

TEST(Resolution, BestScaleOfAWiderSizeFitsItsWidth) {
    EXPECT_EQ(640.0f / 1920.0f, Resolution(640, 480).BestScale(Resolution(1920, 1080)));
}

TEST(Resolution, BestScaleOfANarrowerSizeFitsItsHeight) {
    EXPECT_EQ(2.25f, Resolution(1920, 1080).BestScale(Resolution(640, 480)));
}

TEST(Resolution, BestScaleOfTheSameAspectUsesTheWidths) {
    EXPECT_EQ(0.5f, Resolution(320, 240).BestScale(Resolution(640, 480)));
}

struct NeighbourCase {
    Vector2d point;
    float x;
    float y;
};

std::ostream& operator<<(std::ostream& stream, NeighbourCase const& value) {
    return stream << "(" << value.point.x << ", " << value.point.y << ")";
}

class ResolutionNeighbourTest : public testing::TestWithParam<NeighbourCase> {};

TEST_P(ResolutionNeighbourTest, NearestNeighbourRoundsThenLimitsToZeroAndTheSizeItself) {
    NeighbourCase const& c = GetParam();
    EXPECT_THAT(Resolution(640, 480).NearestNeighbour(c.point), IsVector(c.x, c.y));
}

INSTANTIATE_TEST_SUITE_P(Resolution, ResolutionNeighbourTest,
                         testing::Values(NeighbourCase{Vector2d(-3.0f, 2000.0f), 0.0f, 480.0f},
                                         NeighbourCase{Vector2d(639.6f, 479.6f), 640.0f, 480.0f},
                                         NeighbourCase{Vector2d(2.4f, 3.6f), 2.0f, 4.0f},
                                         // halves round to even
                                         NeighbourCase{Vector2d(2.5f, 3.5f), 2.0f, 4.0f},
                                         NeighbourCase{Vector2d(700.0f, -0.6f), 640.0f, 0.0f},
                                         NeighbourCase{Vector2d(0.0f, 0.0f), 0.0f, 0.0f}));

TEST(Resolution, NearestNeighbourOnANegativeSizeEndsAtTheSize) {
    EXPECT_THAT(Resolution(-10, -20).NearestNeighbour(Vector2d(3.0f, -4.0f)),
                IsVector(-10.0f, -20.0f));
}

struct ValidityCase {
    Vector2d size;
    bool valid;
};

std::ostream& operator<<(std::ostream& stream, ValidityCase const& value) {
    return stream << "(" << value.size.x << ", " << value.size.y << ")";
}

class ResolutionValidityTest : public testing::TestWithParam<ValidityCase> {};

TEST_P(ResolutionValidityTest, ValidNeedsFiniteSidesAboveZero) {
    ValidityCase const& c = GetParam();
    EXPECT_EQ(c.valid, Fractional(c.size.x, c.size.y).Valid());
}

INSTANTIATE_TEST_SUITE_P(
    Resolution, ResolutionValidityTest,
    testing::Values(ValidityCase{Vector2d(640.0f, 480.0f), true},
                    ValidityCase{Vector2d(0.5f, 0.5f), true},
                    ValidityCase{Vector2d(0.0f, 480.0f), false},
                    ValidityCase{Vector2d(640.0f, 0.0f), false},
                    ValidityCase{Vector2d(-640.0f, 480.0f), false},
                    ValidityCase{Vector2d(640.0f, -480.0f), false},
                    ValidityCase{Vector2d(FloatingPoint::Infinity, 480.0f), false},
                    ValidityCase{Vector2d(640.0f, FloatingPoint::Nan), false}));

TEST(Resolution, ValidOverridesVector2dThroughABaseReference) {
    Resolution const size;
    Vector2d const& base = size;
    EXPECT_TRUE(Vector2d().Valid());
    EXPECT_FALSE(base.Valid());
}

struct CompassCase {
    char const* name;
    Vector2d (Resolution::*point)() const;
    float x;
    float y;
};

std::ostream& operator<<(std::ostream& stream, CompassCase const& value) {
    return stream << value.name;
}

std::string NameOf(testing::TestParamInfo<CompassCase> const& info) {
    return info.param.name;
}

class ResolutionCompassTest : public testing::TestWithParam<CompassCase> {};

TEST_P(ResolutionCompassTest, PointOf640By480) {
    CompassCase const& c = GetParam();
    Resolution const size(640, 480);
    EXPECT_THAT((size.*c.point)(), IsVector(c.x, c.y));
}

INSTANTIATE_TEST_SUITE_P(
    Resolution, ResolutionCompassTest,
    testing::Values(CompassCase{"Centre", &Resolution::Centre, 320.0f, 240.0f},
                    CompassCase{"North", &Resolution::North, 320.0f, 480.0f},
                    CompassCase{"South", &Resolution::South, 320.0f, 0.0f},
                    CompassCase{"East", &Resolution::East, 640.0f, 240.0f},
                    CompassCase{"West", &Resolution::West, 0.0f, 240.0f},
                    CompassCase{"NorthEast", &Resolution::NorthEast, 640.0f, 480.0f},
                    CompassCase{"SouthEast", &Resolution::SouthEast, 640.0f, 0.0f},
                    CompassCase{"NorthWest", &Resolution::NorthWest, 0.0f, 480.0f},
                    CompassCase{"SouthWest", &Resolution::SouthWest, 0.0f, 0.0f},
                    CompassCase{"NorthOffset", &Resolution::NorthOffset, 0.0f, 240.0f},
                    CompassCase{"SouthOffset", &Resolution::SouthOffset, 0.0f, -240.0f},
                    CompassCase{"EastOffset", &Resolution::EastOffset, 320.0f, 0.0f},
                    CompassCase{"WestOffset", &Resolution::WestOffset, -320.0f, 0.0f},
                    CompassCase{"NorthEastOffset", &Resolution::NorthEastOffset, 320.0f, 240.0f},
                    CompassCase{"SouthEastOffset", &Resolution::SouthEastOffset, 320.0f, -240.0f},
                    CompassCase{"NorthWestOffset", &Resolution::NorthWestOffset, -320.0f, 240.0f},
                    CompassCase{"SouthWestOffset", &Resolution::SouthWestOffset, -320.0f, -240.0f}),
    NameOf);

TEST(Resolution, CompassPointsOfAnOddSizeKeepTheHalves) {
    Resolution const size(641, 481);
    EXPECT_THAT(size.Centre(), IsVector(320.5f, 240.5f));
    EXPECT_THAT(size.SouthWestOffset(), IsVector(-320.5f, -240.5f));
}

}  // namespace
}  // namespace quorvel::vexmap
