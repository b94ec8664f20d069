#include "vexmap/vector_2d.h"

#include <cmath>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

using ::testing::FloatNear;

constexpr float TOLERANCE = 1e-6f;
constexpr float NAN_VALUE = FloatingPoint::Nan;
constexpr float INFINITY_VALUE = FloatingPoint::Infinity;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float PI_VALUE = 3.14159265f;

TEST(Vector2d, DefaultIsZero) {
    Vector2d const v;
    EXPECT_EQ(0.0f, v.x);
    EXPECT_EQ(0.0f, v.y);
}

TEST(Vector2d, KeepsItsComponentsAndCopiesThem) {
    Vector2d const v(1.5f, -2.25f);
    Vector2d const copy(v);
    EXPECT_EQ(1.5f, copy.x);
    EXPECT_EQ(-2.25f, copy.y);
}

TEST(Vector2d, InvalidVectorIsTwoQuietNans) {
    EXPECT_TRUE(std::isnan(Vector2d::InvalidVector.x));
    EXPECT_TRUE(std::isnan(Vector2d::InvalidVector.y));
}

TEST(Vector2d, InfiniteVectorIsTwoPositiveInfinities) {
    EXPECT_EQ(INFINITY_VALUE, Vector2d::InfiniteVector.x);
    EXPECT_EQ(INFINITY_VALUE, Vector2d::InfiniteVector.y);
    EXPECT_GT(Vector2d::InfiniteVector.x, 0.0f);
}

TEST(Vector2d, ZeroAndIdentityVectorsHoldZerosAndOnes) {
    EXPECT_EQ(0.0f, Vector2d::ZeroVector.x);
    EXPECT_EQ(0.0f, Vector2d::ZeroVector.y);
    EXPECT_EQ(1.0f, Vector2d::IdentityVector.x);
    EXPECT_EQ(1.0f, Vector2d::IdentityVector.y);
}

TEST(Vector2d, InvalidVectorEqualsAnyVector) {
    Vector2d const other(1.0f, 2.0f);
    EXPECT_TRUE(Vector2d::InvalidVector == other);
    EXPECT_FALSE(Vector2d::InvalidVector != other);
}

// Each row: two vectors and what == and != say of them.
struct ComparisonRow {
    char const* name;
    Vector2d left;
    Vector2d right;
    bool equal;
    bool unequal;
};

void PrintTo(ComparisonRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string RowName(::testing::TestParamInfo<ComparisonRow> const& row) {
    return row.param.name;
}

class Vector2dComparisonTest : public ::testing::TestWithParam<ComparisonRow> {};

TEST_P(Vector2dComparisonTest, FollowsTheLenientTest) {
    ComparisonRow const& row = GetParam();
    EXPECT_EQ(row.equal, row.left == row.right);
    EXPECT_EQ(row.unequal, row.left != row.right);
}

INSTANTIATE_TEST_SUITE_P(
    , Vector2dComparisonTest,
    ::testing::Values(
        ComparisonRow{"SameComponents", {1.0f, 2.0f}, {1.0f, 2.0f}, true, false},
        ComparisonRow{"OtherX", {1.0f, 2.0f}, {3.0f, 2.0f}, false, true},
        ComparisonRow{"OtherY", {1.0f, 2.0f}, {1.0f, -2.0f}, false, true},
        ComparisonRow{"SignedZeros", {0.0f, -0.0f}, {-0.0f, 0.0f}, true, false},
        ComparisonRow{"NanXAgainstANumber", {NAN_VALUE, 2.0f}, {1.0f, 2.0f}, true, false},
        ComparisonRow{"NanYOnTheRight", {1.0f, 2.0f}, {1.0f, NAN_VALUE}, true, false},
        ComparisonRow{"NanXButOtherY", {NAN_VALUE, 2.0f}, {1.0f, 5.0f}, false, true},
        ComparisonRow{
            "NansAgainstEachOther", {NAN_VALUE, NAN_VALUE}, {NAN_VALUE, NAN_VALUE}, true, false},
        ComparisonRow{
            "InfinityAgainstItself", {INFINITY_VALUE, 1.0f}, {INFINITY_VALUE, 1.0f}, true, false},
        ComparisonRow{
            "InfinityAgainstANumber", {INFINITY_VALUE, 1.0f}, {1e30f, 1.0f}, false, true}),
    RowName);

TEST(Vector2d, AddsSubtractsAndNegatesComponentWise) {
    Vector2d const a(1.0f, 2.0f);
    Vector2d const b(0.5f, -4.0f);
    Vector2d const sum = a + b;
    Vector2d const difference = a - b;
    Vector2d const negated = -a;
    EXPECT_EQ(1.5f, sum.x);
    EXPECT_EQ(-2.0f, sum.y);
    EXPECT_EQ(0.5f, difference.x);
    EXPECT_EQ(6.0f, difference.y);
    EXPECT_EQ(-1.0f, negated.x);
    EXPECT_EQ(-2.0f, negated.y);
}

TEST(Vector2d, MultipliesAndDividesByAFactor) {
    Vector2d const v(3.0f, -6.0f);
    Vector2d const times = v * 2.0f;
    Vector2d const before = 0.5f * v;
    Vector2d const over = v / 3.0f;
    EXPECT_EQ(6.0f, times.x);
    EXPECT_EQ(-12.0f, times.y);
    EXPECT_EQ(1.5f, before.x);
    EXPECT_EQ(-3.0f, before.y);
    EXPECT_EQ(1.0f, over.x);
    EXPECT_EQ(-2.0f, over.y);
}

TEST(Vector2d, NumberOverVectorPutsEachComponentInTheDenominator) {
    Vector2d const v = 12.0f / Vector2d(3.0f, -4.0f);
    EXPECT_EQ(4.0f, v.x);
    EXPECT_EQ(-3.0f, v.y);
}

TEST(Vector2d, SetZeroClearsBothComponents) {
    Vector2d v(7.0f, -8.0f);
    v.SetZero();
    EXPECT_EQ(0.0f, v.x);
    EXPECT_EQ(0.0f, v.y);
}

TEST(Vector2d, LengthIsTheHypotenuse) {
    EXPECT_THAT(Vector2d(3.0f, -4.0f).Length(), FloatNear(5.0f, TOLERANCE));
    EXPECT_EQ(0.0f, Vector2d().Length());
}

TEST(Vector2d, ScaleMultipliesInPlaceAndReturnsTheObject) {
    Vector2d v(3.0f, -2.0f);
    Vector2d& result = v.Scale(Vector2d(2.0f, 0.5f));
    EXPECT_EQ(&v, &result);
    EXPECT_EQ(6.0f, v.x);
    EXPECT_EQ(-1.0f, v.y);
}

TEST(Vector2d, AngleIsMeasuredFromPlusYTowardsPlusX) {
    EXPECT_THAT(Vector2d(0.0f, 1.0f).Angle(), FloatNear(0.0f, TOLERANCE));
    EXPECT_THAT(Vector2d(1.0f, 0.0f).Angle(), FloatNear(HALF_PI_VALUE, TOLERANCE));
    EXPECT_THAT(Vector2d(-1.0f, 0.0f).Angle(), FloatNear(-HALF_PI_VALUE, TOLERANCE));
    EXPECT_THAT(Vector2d(0.0f, -1.0f).Angle(), FloatNear(PI_VALUE, TOLERANCE));
    EXPECT_THAT(Vector2d(1.0f, 1.0f).Angle(), FloatNear(0.5f * HALF_PI_VALUE, TOLERANCE));
}

TEST(Vector2d, ValidOnlyWhenBothComponentsAreFinite) {
    EXPECT_TRUE(Vector2d(1.0f, -1e30f).Valid());
    EXPECT_FALSE(Vector2d(NAN_VALUE, 0.0f).Valid());
    EXPECT_FALSE(Vector2d(0.0f, NAN_VALUE).Valid());
    EXPECT_FALSE(Vector2d(INFINITY_VALUE, 0.0f).Valid());
    EXPECT_FALSE(Vector2d(0.0f, -INFINITY_VALUE).Valid());
    EXPECT_FALSE(Vector2d::InvalidVector.Valid());
    EXPECT_FALSE(Vector2d::InfiniteVector.Valid());
}

// A derived class narrows Valid(); a call through the base has to reach it.
class NeverValid : public Vector2d {
public:
    bool Valid() const override { return false; }
};

TEST(Vector2d, ValidIsReachedThroughTheBase) {
    NeverValid const never;
    Vector2d const& base = never;
    EXPECT_FALSE(base.Valid());
}

TEST(Vector2d, DistanceIsTheLengthOfTheDifference) {
    EXPECT_THAT(Distance(Vector2d(1.0f, 1.0f), Vector2d(4.0f, 5.0f)), FloatNear(5.0f, TOLERANCE));
    EXPECT_THAT(Distance(Vector2d(4.0f, 5.0f), Vector2d(1.0f, 1.0f)), FloatNear(5.0f, TOLERANCE));
}

TEST(Vector2d, AssignmentToItselfIsSilent) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Vector2d v(1.0f, 2.0f);
    Vector2d const& same = v;
    v = same;
    EXPECT_EQ(0u, sink.Count());
    EXPECT_EQ(1.0f, v.x);
    EXPECT_EQ(2.0f, v.y);
}

TEST(Vector2d, AssignmentCopiesBothComponents) {
    Vector2d v;
    v = Vector2d(-3.0f, 4.5f);
    EXPECT_EQ(-3.0f, v.x);
    EXPECT_EQ(4.5f, v.y);
}

}  // namespace
}  // namespace quorvel::vexmap
