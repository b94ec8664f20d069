#include "vexmap/vector_3d.h"

#include <cmath>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;

constexpr float TOLERANCE = 1e-6f;
constexpr float NAN_VALUE = FloatingPoint::Nan;
constexpr float INFINITY_VALUE = FloatingPoint::Infinity;

::testing::Matcher<Vector3d> IsVector(float x, float y, float z) {
    return AllOf(Field("x", &Vector3d::x, Eq(x)), Field("y", &Vector3d::y, Eq(y)),
                 Field("z", &Vector3d::z, Eq(z)));
}

TEST(Vector3d, DefaultIsZero) {
    EXPECT_THAT(Vector3d(), IsVector(0.0f, 0.0f, 0.0f));
}

TEST(Vector3d, KeepsItsComponentsAndCopiesThem) {
    Vector3d const v(1.5f, -2.25f, 8.0f);
    EXPECT_THAT(Vector3d(v), IsVector(1.5f, -2.25f, 8.0f));
}

TEST(Vector3d, ZeroVectorIsZero) {
    EXPECT_THAT(Vector3d::ZeroVector, IsVector(0.0f, 0.0f, 0.0f));
}

TEST(Vector3d, InvalidVectorIsThreeNans) {
    EXPECT_TRUE(std::isnan(Vector3d::InvalidVector.x));
    EXPECT_TRUE(std::isnan(Vector3d::InvalidVector.y));
    EXPECT_TRUE(std::isnan(Vector3d::InvalidVector.z));
}

TEST(Vector3d, NanVectorIsNeitherEqualNorUnequalToItsTwin) {
    Vector3d const a(NAN_VALUE, 0.0f, 0.0f);
    Vector3d const b(NAN_VALUE, 0.0f, 0.0f);
    EXPECT_FALSE(a == b);
    EXPECT_FALSE(a != b);
}

// Each row: two vectors and what == and != say of them. == is plain float equality, != the
// lenient difference test.
struct ComparisonRow {
    char const* name;
    Vector3d left;
    Vector3d right;
    bool equal;
    bool unequal;
};

void PrintTo(ComparisonRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string RowName(::testing::TestParamInfo<ComparisonRow> const& row) {
    return row.param.name;
}

class Vector3dComparisonTest : public ::testing::TestWithParam<ComparisonRow> {};

TEST_P(Vector3dComparisonTest, IsStrictForEqualAndLenientForUnequal) {
    ComparisonRow const& row = GetParam();
    EXPECT_EQ(row.equal, row.left == row.right);
    EXPECT_EQ(row.unequal, row.left != row.right);
}

INSTANTIATE_TEST_SUITE_P(
    , Vector3dComparisonTest,
    ::testing::Values(
        ComparisonRow{"SameComponents", {1.0f, 2.0f, 3.0f}, {1.0f, 2.0f, 3.0f}, true, false},
        ComparisonRow{"OtherX", {1.0f, 2.0f, 3.0f}, {-1.0f, 2.0f, 3.0f}, false, true},
        ComparisonRow{"OtherY", {1.0f, 2.0f, 3.0f}, {1.0f, 2.5f, 3.0f}, false, true},
        ComparisonRow{"OtherZ", {1.0f, 2.0f, 3.0f}, {1.0f, 2.0f, 0.0f}, false, true},
        ComparisonRow{"SignedZeros", {0.0f, -0.0f, 0.0f}, {-0.0f, 0.0f, -0.0f}, true, false},
        ComparisonRow{
            "NanXAgainstItsTwin", {NAN_VALUE, 0.0f, 0.0f}, {NAN_VALUE, 0.0f, 0.0f}, false, false},
        ComparisonRow{
            "NanXAgainstANumber", {NAN_VALUE, 0.0f, 0.0f}, {1.0f, 0.0f, 0.0f}, false, false},
        ComparisonRow{"NanZOnTheRight", {1.0f, 2.0f, 3.0f}, {1.0f, 2.0f, NAN_VALUE}, false, false},
        ComparisonRow{
            "NanXButOtherZ", {NAN_VALUE, 0.0f, 0.0f}, {NAN_VALUE, 0.0f, 1.0f}, false, true},
        ComparisonRow{"InvalidAgainstInvalid",
                      {NAN_VALUE, NAN_VALUE, NAN_VALUE},
                      {NAN_VALUE, NAN_VALUE, NAN_VALUE},
                      false,
                      false},
        ComparisonRow{"InfinityAgainstItself",
                      {INFINITY_VALUE, 0.0f, 0.0f},
                      {INFINITY_VALUE, 0.0f, 0.0f},
                      true,
                      false}),
    RowName);

TEST(Vector3d, NegatesEveryComponent) {
    EXPECT_THAT(-Vector3d(1.0f, -2.0f, 3.0f), IsVector(-1.0f, 2.0f, -3.0f));
}

TEST(Vector3d, CompoundOperatorsChangeTheObjectAndReturnIt) {
    Vector3d v(1.0f, 2.0f, 3.0f);
    EXPECT_EQ(&v, &(v += Vector3d(1.0f, 1.0f, 1.0f)));
    EXPECT_THAT(v, IsVector(2.0f, 3.0f, 4.0f));
    EXPECT_EQ(&v, &(v -= Vector3d(4.0f, 1.0f, 0.5f)));
    EXPECT_THAT(v, IsVector(-2.0f, 2.0f, 3.5f));
    EXPECT_EQ(&v, &(v *= 2.0f));
    EXPECT_THAT(v, IsVector(-4.0f, 4.0f, 7.0f));
    EXPECT_EQ(&v, &(v /= 4.0f));
    EXPECT_THAT(v, IsVector(-1.0f, 1.0f, 1.75f));
}

TEST(Vector3d, AddsSubtractsMultipliesAndDividesComponentWise) {
    Vector3d const a(1.0f, 2.0f, 3.0f);
    Vector3d const b(0.5f, -4.0f, 1.0f);
    EXPECT_THAT(a + b, IsVector(1.5f, -2.0f, 4.0f));
    EXPECT_THAT(a - b, IsVector(0.5f, 6.0f, 2.0f));
    EXPECT_THAT(a * 3.0f, IsVector(3.0f, 6.0f, 9.0f));
    EXPECT_THAT(-2.0f * a, IsVector(-2.0f, -4.0f, -6.0f));
    EXPECT_THAT(a / 4.0f, IsVector(0.25f, 0.5f, 0.75f));
}

TEST(Vector3d, NumberOverVectorPutsEachComponentInTheDenominator) {
    EXPECT_THAT(12.0f / Vector3d(1.0f, 2.0f, -3.0f), IsVector(12.0f, 6.0f, -4.0f));
}

TEST(Vector3d, ProductOfTwoVectorsIsTheDotProduct) {
    // 1 * 4 + 2 * -5 + 3 * 6
    EXPECT_EQ(12.0f, Vector3d(1.0f, 2.0f, 3.0f) * Vector3d(4.0f, -5.0f, 6.0f));
    EXPECT_EQ(0.0f, Vector3d(1.0f, 0.0f, 0.0f) * Vector3d(0.0f, 1.0f, 0.0f));
}

TEST(Vector3d, CrossProductIsRightHanded) {
    EXPECT_THAT(CrossProduct(Vector3d(1.0f, 0.0f, 0.0f), Vector3d(0.0f, 1.0f, 0.0f)),
                IsVector(0.0f, 0.0f, 1.0f));
    EXPECT_THAT(CrossProduct(Vector3d(0.0f, 1.0f, 0.0f), Vector3d(0.0f, 0.0f, 1.0f)),
                IsVector(1.0f, 0.0f, 0.0f));
    // (2 * 6 - 3 * 5, 3 * 4 - 1 * 6, 1 * 5 - 2 * 4)
    EXPECT_THAT(CrossProduct(Vector3d(1.0f, 2.0f, 3.0f), Vector3d(4.0f, 5.0f, 6.0f)),
                IsVector(-3.0f, 6.0f, -3.0f));
}

TEST(Vector3d, SetZeroClearsEveryComponent) {
    Vector3d v(7.0f, -8.0f, 9.0f);
    v.SetZero();
    EXPECT_THAT(v, IsVector(0.0f, 0.0f, 0.0f));
}

TEST(Vector3d, LengthIsTheRootOfTheSumOfSquares) {
    EXPECT_THAT(Vector3d(2.0f, -3.0f, 6.0f).Length(), FloatNear(7.0f, TOLERANCE));
    EXPECT_EQ(0.0f, Vector3d().Length());
}

TEST(Vector3d, DistanceIsTheLengthOfTheDifference) {
    // The difference is (3, 4, 12), a 3-4-5 and 5-12-13 pair.
    EXPECT_THAT(Distance(Vector3d(1.0f, 2.0f, 3.0f), Vector3d(4.0f, 6.0f, 15.0f)),
                FloatNear(13.0f, TOLERANCE));
}

TEST(Vector3d, NormaliseGivesUnitLength) {
    Vector3d v(3.0f, 0.0f, -4.0f);
    v.Normalise();
    EXPECT_THAT(v.x, FloatNear(0.6f, TOLERANCE));
    EXPECT_EQ(0.0f, v.y);
    EXPECT_THAT(v.z, FloatNear(-0.8f, TOLERANCE));
}

TEST(Vector3d, NormaliseLeavesAZeroVectorAtZeroWithoutAWarning) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Vector3d v(0.0f, 0.0f, 0.0f);
    v.Normalise();
    EXPECT_THAT(v, IsVector(0.0f, 0.0f, 0.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Vector3d, ValidOnlyWhenEveryComponentIsFinite) {
    EXPECT_TRUE(Vector3d(1.0f, -1e30f, 0.0f).Valid());
    EXPECT_FALSE(Vector3d(NAN_VALUE, 0.0f, 0.0f).Valid());
    EXPECT_FALSE(Vector3d(0.0f, INFINITY_VALUE, 0.0f).Valid());
    EXPECT_FALSE(Vector3d(0.0f, 0.0f, -INFINITY_VALUE).Valid());
    EXPECT_FALSE(Vector3d::InvalidVector.Valid());
}

TEST(Vector3d, AssignmentToItselfWarnsAndKeepsTheValue) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Vector3d v(1.0f, 2.0f, 3.0f);
    Vector3d const& same = v;
    EXPECT_EQ(&v, &(v = same));
    EXPECT_THAT(v, IsVector(1.0f, 2.0f, 3.0f));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Vector3d object\n", lines[0].text);
}

TEST(Vector3d, AssignmentToItselfStaysQuietBelowTheWarningLevel) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Vector3d v(1.0f, 2.0f, 3.0f);
    Vector3d const& same = v;
    v = same;
    EXPECT_EQ(0u, sink.Count());
}

TEST(Vector3d, AssignmentFromAnotherCopiesSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Vector3d v;
    Vector3d const other(-3.0f, 4.5f, 6.0f);
    EXPECT_EQ(&v, &(v = other));
    EXPECT_THAT(v, IsVector(-3.0f, 4.5f, 6.0f));
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
