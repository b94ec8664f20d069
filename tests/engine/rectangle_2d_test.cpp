#include "vexmap/rectangle_2d.h"

#include <cstdint>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/resolution.h"

namespace quorvel::vexmap {
namespace {

using testing::AllOf;
using testing::Field;

testing::Matcher<Rectangle2d const&> HasEdges(float left, float top, float right, float bottom) {
    return AllOf(Field("left", &Rectangle2d::left, left), Field("top", &Rectangle2d::top, top),
                 Field("right", &Rectangle2d::right, right),
                 Field("bottom", &Rectangle2d::bottom, bottom));
}

testing::Matcher<Vector2d const&> IsVector(float x, float y) {
    return AllOf(Field("x", &Vector2d::x, x), Field("y", &Vector2d::y, y));
}

// Tells the two zeros apart.
uint32_t SignBit(float value) {
    return __builtin_bit_cast(uint32_t, value) >> 31;
}

// (0, 10, 10, 0) pulled in by 6 on every side: left 6 beyond right 4, top 4 below bottom 6.
// Built in place, since a copy would normalise it.
void MakeInverted(Rectangle2d& rectangle) {
    rectangle = Rectangle2d(0.0f, 10.0f, 10.0f, 0.0f);
    rectangle.Deflate(6.0f, 6.0f);
}

TEST(Rectangle2d, DefaultIsNull) {
    Rectangle2d const rectangle;
    EXPECT_THAT(rectangle, HasEdges(0.0f, 0.0f, 0.0f, 0.0f));
    EXPECT_TRUE(rectangle.IsNull());
}

TEST(Rectangle2d, ConstructorStoresLeftTopRightBottom) {
    EXPECT_THAT(Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f), HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
}

TEST(Rectangle2d, ConstructorNormalisesSoThatTopHoldsTheLargerY) {
    EXPECT_THAT(Rectangle2d(10.0f, 0.0f, 0.0f, 20.0f), HasEdges(0.0f, 20.0f, 10.0f, 0.0f));
}

TEST(Rectangle2d, FloatArrayGivesLeftTopRightBottomNormalised) {
    float const edges[] = {10.0f, 0.0f, 0.0f, 20.0f};
    EXPECT_THAT(Rectangle2d(edges), HasEdges(0.0f, 20.0f, 10.0f, 0.0f));
    Rectangle2d assigned;
    assigned = edges;
    EXPECT_THAT(assigned, HasEdges(0.0f, 20.0f, 10.0f, 0.0f));
}

TEST(Rectangle2d, TwoVectorsGiveLeftTopThenRightBottom) {
    EXPECT_THAT(Rectangle2d(Vector2d(1.0f, 8.0f), Vector2d(5.0f, 2.0f)),
                HasEdges(1.0f, 8.0f, 5.0f, 2.0f));
    EXPECT_THAT(Rectangle2d(Vector2d(5.0f, 2.0f), Vector2d(1.0f, 8.0f)),
                HasEdges(1.0f, 8.0f, 5.0f, 2.0f));
}

TEST(Rectangle2d, VectorArrayGivesLeftTopThenRightBottomNormalised) {
    Vector2d const corners[] = {Vector2d(5.0f, 2.0f), Vector2d(1.0f, 8.0f)};
    EXPECT_THAT(Rectangle2d(corners), HasEdges(1.0f, 8.0f, 5.0f, 2.0f));
    Rectangle2d assigned;
    assigned = corners;
    EXPECT_THAT(assigned, HasEdges(1.0f, 8.0f, 5.0f, 2.0f));
}

TEST(Rectangle2d, SizeSpansFromTheOrigin) {
    EXPECT_THAT(Rectangle2d(Vector2d(640.0f, 480.0f)), HasEdges(0.0f, 480.0f, 640.0f, 0.0f));
    EXPECT_THAT(Rectangle2d(Resolution(1920, 1080)), HasEdges(0.0f, 1080.0f, 1920.0f, 0.0f));
}

TEST(Rectangle2d, SizeOfNegativeSidesIsNormalised) {
    EXPECT_THAT(Rectangle2d(Vector2d(-4.0f, -3.0f)), HasEdges(-4.0f, 0.0f, 0.0f, -3.0f));
}

TEST(Rectangle2d, CopyNormalisesAsEveryConstructorDoes) {
    Rectangle2d inverted;
    MakeInverted(inverted);
    ASSERT_THAT(inverted, HasEdges(6.0f, 4.0f, 4.0f, 6.0f));
    EXPECT_THAT(Rectangle2d(inverted), HasEdges(4.0f, 6.0f, 6.0f, 4.0f));
}

TEST(Rectangle2d, AssignmentCopiesAndNormalisesSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Rectangle2d rectangle;
    rectangle = Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f);
    EXPECT_THAT(rectangle, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
    Rectangle2d inverted;
    MakeInverted(inverted);
    rectangle = inverted;
    EXPECT_THAT(rectangle, HasEdges(4.0f, 6.0f, 6.0f, 4.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Rectangle2d, AssignmentToItselfDoesNothingAndLogsNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Rectangle2d rectangle;
    MakeInverted(rectangle);
    Rectangle2d const& same = rectangle;
    rectangle = same;
    EXPECT_THAT(rectangle, HasEdges(6.0f, 4.0f, 4.0f, 6.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Rectangle2d, NormaliseSwapsOnlyTheInvertedPair) {
    Rectangle2d rectangle;
    MakeInverted(rectangle);
    rectangle.Normalise();
    EXPECT_THAT(rectangle, HasEdges(4.0f, 6.0f, 6.0f, 4.0f));
    Rectangle2d upright(1.0f, 20.0f, 10.0f, 2.0f);
    upright.Normalise();
    EXPECT_THAT(upright, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
}

TEST(Rectangle2d, WidthAndHeight) {
    Rectangle2d const rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    EXPECT_EQ(9.0f, rectangle.Width());
    EXPECT_EQ(18.0f, rectangle.Height());
}

TEST(Rectangle2d, AreaIsNegativeForANormalisedRectangle) {
    EXPECT_EQ(-200.0f, Rectangle2d(0.0f, 20.0f, 10.0f, 0.0f).Area());
    EXPECT_EQ(-0.0f, Rectangle2d(0.0f, 20.0f, 0.0f, 0.0f).Area());
}

TEST(Rectangle2d, AspectRatioHasTheSignOfTheArea) {
    EXPECT_EQ(-0.5f, Rectangle2d(0.0f, 20.0f, 10.0f, 0.0f).AspectRatio());
}

TEST(Rectangle2d, GetSizeGivesTheHeightFirst) {
    EXPECT_THAT(Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f).GetSize(), IsVector(18.0f, 9.0f));
}

struct CornerCase {
    char const* name;
    Vector2d (Rectangle2d::*corner)() const;
    float first;
    float second;
};

std::ostream& operator<<(std::ostream& stream, CornerCase const& value) {
    return stream << value.name;
}

std::string NameOf(testing::TestParamInfo<CornerCase> const& info) {
    return info.param.name;
}

class Rectangle2dCornerTest : public testing::TestWithParam<CornerCase> {};

TEST_P(Rectangle2dCornerTest, GivesTheVerticalEdgeFirst) {
    CornerCase const& c = GetParam();
    Rectangle2d const rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    EXPECT_THAT((rectangle.*c.corner)(), IsVector(c.first, c.second));
}

INSTANTIATE_TEST_SUITE_P(
    Rectangle2d, Rectangle2dCornerTest,
    testing::Values(CornerCase{"TopLeft", &Rectangle2d::TopLeft, 20.0f, 1.0f},
                    CornerCase{"TopRight", &Rectangle2d::TopRight, 20.0f, 10.0f},
                    CornerCase{"BottomLeft", &Rectangle2d::BottomLeft, 2.0f, 1.0f},
                    CornerCase{"BottomRight", &Rectangle2d::BottomRight, 2.0f, 10.0f}),
    NameOf);

TEST(Rectangle2d, CentreGivesXFirst) {
    EXPECT_THAT(Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f).Centre(), IsVector(5.5f, 11.0f));
    EXPECT_THAT(Rectangle2d(-4.0f, 3.0f, 4.0f, -3.0f).Centre(), IsVector(0.0f, 0.0f));
}

TEST(Rectangle2d, IsEmptyWhenEitherSideIsZero) {
    EXPECT_TRUE(Rectangle2d(5.0f, 20.0f, 5.0f, 2.0f).IsEmpty());
    EXPECT_TRUE(Rectangle2d(1.0f, 7.0f, 10.0f, 7.0f).IsEmpty());
    EXPECT_TRUE(Rectangle2d().IsEmpty());
    EXPECT_FALSE(Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f).IsEmpty());
}

TEST(Rectangle2d, IsNullOnlyWhenAllFourAreZero) {
    EXPECT_TRUE(Rectangle2d(0.0f, 0.0f, 0.0f, 0.0f).IsNull());
    EXPECT_TRUE(Rectangle2d(-0.0f, 0.0f, 0.0f, -0.0f).IsNull());
    EXPECT_FALSE(Rectangle2d(5.0f, 0.0f, 5.0f, 0.0f).IsNull());
    EXPECT_FALSE(Rectangle2d(0.0f, 0.0f, 0.0f, -1.0f).IsNull());
}

struct PointCase {
    Vector2d point;
    bool inside;
};

std::ostream& operator<<(std::ostream& stream, PointCase const& value) {
    return stream << "(" << value.point.x << ", " << value.point.y << ")";
}

class Rectangle2dPointTest : public testing::TestWithParam<PointCase> {};

TEST_P(Rectangle2dPointTest, PtInRectHoldsXAgainstLeftOnBothSides) {
    PointCase const& c = GetParam();
    EXPECT_EQ(c.inside, Rectangle2d(1.0f, 20.0f, 10.0f, 2.0f).PtInRect(c.point));
}

INSTANTIATE_TEST_SUITE_P(
    Rectangle2d, Rectangle2dPointTest,
    testing::Values(PointCase{Vector2d(1.0f, 5.0f), true}, PointCase{Vector2d(1.0f, 2.0f), true},
                    PointCase{Vector2d(1.0f, 20.0f), true}, PointCase{Vector2d(5.0f, 5.0f), false},
                    PointCase{Vector2d(10.0f, 5.0f), false}, PointCase{Vector2d(0.5f, 5.0f), false},
                    PointCase{Vector2d(1.0f, 20.5f), false},
                    PointCase{Vector2d(1.0f, 1.5f), false}));

TEST(Rectangle2d, OffsetMovesLeftAndRightByXAndTopAndBottomByY) {
    Rectangle2d byVector(1.0f, 20.0f, 10.0f, 2.0f);
    byVector.Offset(Vector2d(3.0f, -4.0f));
    EXPECT_THAT(byVector, HasEdges(4.0f, 16.0f, 13.0f, -2.0f));
    Rectangle2d byFloats(1.0f, 20.0f, 10.0f, 2.0f);
    byFloats.Offset(3.0f, -4.0f);
    EXPECT_THAT(byFloats, HasEdges(4.0f, 16.0f, 13.0f, -2.0f));
}

TEST(Rectangle2d, PlusEqualsOffsetsAndMinusEqualsOffsetsBack) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    Rectangle2d& sum = rectangle += Vector2d(3.0f, -4.0f);
    EXPECT_EQ(&rectangle, &sum);
    EXPECT_THAT(rectangle, HasEdges(4.0f, 16.0f, 13.0f, -2.0f));
    Rectangle2d& difference = rectangle -= Vector2d(3.0f, -4.0f);
    EXPECT_EQ(&rectangle, &difference);
    EXPECT_THAT(rectangle, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
}

TEST(Rectangle2d, OffsetToCentreCentresASizeOnTheOrigin) {
    Rectangle2d rectangle(Vector2d(640.0f, 480.0f));
    rectangle.OffsetToCentre();
    EXPECT_THAT(rectangle, HasEdges(-320.0f, 240.0f, 320.0f, -240.0f));
}

TEST(Rectangle2d, OffsetToCentreHalvesRightAndTopBeforeSubtractingThem) {
    Rectangle2d rectangle(2.0f, 10.0f, 12.0f, 4.0f);
    rectangle.OffsetToCentre();
    EXPECT_THAT(rectangle, HasEdges(-4.0f, 5.0f, 6.0f, -1.0f));
}

TEST(Rectangle2d, ScaleMultipliesAllFour) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.Scale(2.0f);
    EXPECT_THAT(rectangle, HasEdges(2.0f, 40.0f, 20.0f, 4.0f));
}

TEST(Rectangle2d, ScaleByANegativeFactorDoesNotNormalise) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.Scale(-1.0f);
    EXPECT_THAT(rectangle, HasEdges(-1.0f, -20.0f, -10.0f, -2.0f));
}

TEST(Rectangle2d, InvScaleDividesAllFour) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.InvScale(4.0f);
    EXPECT_THAT(rectangle, HasEdges(0.25f, 5.0f, 2.5f, 0.5f));
}

class Rectangle2dInvScaleTest : public testing::TestWithParam<float> {};

TEST_P(Rectangle2dInvScaleTest, InvScaleByANumberThatIsNotNormalLeavesTheRectangle) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.InvScale(GetParam());
    EXPECT_THAT(rectangle, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
}

INSTANTIATE_TEST_SUITE_P(Rectangle2d, Rectangle2dInvScaleTest,
                         testing::Values(0.0f, -0.0f, __builtin_bit_cast(float, 0x00000001u),
                                         __builtin_bit_cast(float, 0x007FFFFFu),
                                         FloatingPoint::Infinity, FloatingPoint::Nan));

TEST(Rectangle2d, SetNullZeroesAllFour) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.SetNull();
    EXPECT_TRUE(rectangle.IsNull());
}

TEST(Rectangle2d, DeflateByFourAmountsMovesEachEdgeInwards) {
    Rectangle2d byFloats(0.0f, 20.0f, 10.0f, 0.0f);
    byFloats.Deflate(1.0f, 2.0f, 3.0f, 4.0f);
    EXPECT_THAT(byFloats, HasEdges(1.0f, 18.0f, 7.0f, 4.0f));
    Rectangle2d byRectangle(0.0f, 20.0f, 10.0f, 0.0f);
    byRectangle.Deflate(Rectangle2d(1.0f, 4.0f, 3.0f, 2.0f));
    EXPECT_THAT(byRectangle, HasEdges(1.0f, 16.0f, 7.0f, 2.0f));
}

TEST(Rectangle2d, DeflateByTwoAmountsMovesOppositeEdgesAlike) {
    Rectangle2d byFloats(0.0f, 20.0f, 10.0f, 0.0f);
    byFloats.Deflate(1.0f, 2.0f);
    EXPECT_THAT(byFloats, HasEdges(1.0f, 18.0f, 9.0f, 2.0f));
    Rectangle2d byVector(0.0f, 20.0f, 10.0f, 0.0f);
    byVector.Deflate(Vector2d(1.0f, 2.0f));
    EXPECT_THAT(byVector, HasEdges(1.0f, 18.0f, 9.0f, 2.0f));
}

TEST(Rectangle2d, DeflatePastTheMiddleLeavesTheRectangleInverted) {
    Rectangle2d rectangle;
    MakeInverted(rectangle);
    EXPECT_THAT(rectangle, HasEdges(6.0f, 4.0f, 4.0f, 6.0f));
}

TEST(Rectangle2d, InflateByFourAmountsMovesEachEdgeOutwards) {
    Rectangle2d byFloats(0.0f, 20.0f, 10.0f, 0.0f);
    byFloats.Inflate(1.0f, 2.0f, 3.0f, 4.0f);
    EXPECT_THAT(byFloats, HasEdges(-1.0f, 22.0f, 13.0f, -4.0f));
    Rectangle2d byRectangle(0.0f, 20.0f, 10.0f, 0.0f);
    byRectangle.Inflate(Rectangle2d(1.0f, 4.0f, 3.0f, 2.0f));
    EXPECT_THAT(byRectangle, HasEdges(-1.0f, 24.0f, 13.0f, -2.0f));
}

TEST(Rectangle2d, InflateByTwoAmountsMovesOppositeEdgesAlike) {
    Rectangle2d byFloats(0.0f, 20.0f, 10.0f, 0.0f);
    byFloats.Inflate(1.0f, 2.0f);
    EXPECT_THAT(byFloats, HasEdges(-1.0f, 22.0f, 11.0f, -2.0f));
    Rectangle2d byVector(0.0f, 20.0f, 10.0f, 0.0f);
    byVector.Inflate(Vector2d(1.0f, 2.0f));
    EXPECT_THAT(byVector, HasEdges(-1.0f, 22.0f, 11.0f, -2.0f));
}

TEST(Rectangle2d, IntersectionOfOverlappingRectanglesIsTheirOverlap) {
    Rectangle2d result;
    result.Intersection(Rectangle2d(0.0f, 10.0f, 10.0f, 0.0f),
                        Rectangle2d(5.0f, 15.0f, 15.0f, 5.0f));
    EXPECT_THAT(result, HasEdges(5.0f, 10.0f, 10.0f, 5.0f));
}

TEST(Rectangle2d, IntersectionOfRectanglesApartIsEmptyOnAnEdge) {
    Rectangle2d result(1.0f, 2.0f, 3.0f, 1.0f);
    result.Intersection(Rectangle2d(0.0f, 10.0f, 10.0f, 0.0f),
                        Rectangle2d(20.0f, 30.0f, 30.0f, 20.0f));
    EXPECT_TRUE(result.IsEmpty());
    EXPECT_THAT(result, HasEdges(10.0f, 10.0f, 10.0f, 10.0f));
}

TEST(Rectangle2d, IntersectionOfRectanglesApartSidewaysIsEmpty) {
    Rectangle2d result;
    result.Intersection(Rectangle2d(0.0f, 10.0f, 10.0f, 0.0f),
                        Rectangle2d(20.0f, 8.0f, 30.0f, 2.0f));
    EXPECT_TRUE(result.IsEmpty());
    EXPECT_THAT(result, HasEdges(10.0f, 8.0f, 10.0f, 2.0f));
}

TEST(Rectangle2d, IntersectionWithOneRectangleUsesThisOne) {
    Rectangle2d rectangle(0.0f, 10.0f, 10.0f, 0.0f);
    rectangle.Intersection(Rectangle2d(5.0f, 15.0f, 15.0f, 5.0f));
    EXPECT_THAT(rectangle, HasEdges(5.0f, 10.0f, 10.0f, 5.0f));
}

TEST(Rectangle2d, IntersectionWithItselfKeepsIt) {
    Rectangle2d rectangle(1.0f, 20.0f, 10.0f, 2.0f);
    rectangle.Intersection(rectangle);
    EXPECT_THAT(rectangle, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
    rectangle.Intersection(rectangle, rectangle);
    EXPECT_THAT(rectangle, HasEdges(1.0f, 20.0f, 10.0f, 2.0f));
}

TEST(Rectangle2d, IntersectionOfInvertedRectanglesIsEmptyOnAnEdge) {
    Rectangle2d first;
    MakeInverted(first);
    Rectangle2d second;
    MakeInverted(second);
    second.Offset(1.0f, 1.0f);
    Rectangle2d result;
    result.Intersection(first, second);
    EXPECT_THAT(result, HasEdges(4.0f, 4.0f, 4.0f, 4.0f));
}

TEST(Rectangle2d, IntersectionTakesTheEdgeOfTheSecondOnANaN) {
    Rectangle2d const plain(3.0f, 10.0f, 10.0f, 0.0f);
    Rectangle2d const unknown(FloatingPoint::Nan, 10.0f, 10.0f, 0.0f);
    Rectangle2d result;
    result.Intersection(unknown, plain);
    EXPECT_EQ(3.0f, result.left);
    result.Intersection(plain, unknown);
    EXPECT_THAT(result.left, testing::IsNan());
}

TEST(Rectangle2d, IntersectionAndUnionTakeTheEdgeOfTheSecondOnATie) {
    Rectangle2d const negative(-0.0f, 10.0f, 10.0f, -0.0f);
    Rectangle2d const positive(0.0f, 10.0f, 10.0f, 0.0f);
    Rectangle2d result;
    result.Intersection(negative, positive);
    EXPECT_EQ(SignBit(0.0f), SignBit(result.left));
    EXPECT_EQ(SignBit(0.0f), SignBit(result.bottom));
    result.Intersection(positive, negative);
    EXPECT_EQ(SignBit(-0.0f), SignBit(result.left));
    EXPECT_EQ(SignBit(-0.0f), SignBit(result.bottom));
    result.Union(negative, positive);
    EXPECT_EQ(SignBit(0.0f), SignBit(result.left));
    EXPECT_EQ(SignBit(0.0f), SignBit(result.bottom));
    result.Union(positive, negative);
    EXPECT_EQ(SignBit(-0.0f), SignBit(result.left));
    EXPECT_EQ(SignBit(-0.0f), SignBit(result.bottom));
}

TEST(Rectangle2d, UnionOfTwoRectanglesBoundsBoth) {
    Rectangle2d result;
    result.Union(Rectangle2d(0.0f, 10.0f, 10.0f, 0.0f), Rectangle2d(5.0f, 15.0f, 15.0f, 5.0f));
    EXPECT_THAT(result, HasEdges(0.0f, 15.0f, 15.0f, 0.0f));
}

TEST(Rectangle2d, UnionWithOneRectangleUsesThisOne) {
    Rectangle2d rectangle(0.0f, 10.0f, 10.0f, 0.0f);
    rectangle.Union(Rectangle2d(20.0f, 30.0f, 30.0f, 20.0f));
    EXPECT_THAT(rectangle, HasEdges(0.0f, 30.0f, 30.0f, 0.0f));
}

TEST(Rectangle2d, UnionOfInvertedRectanglesIsEmptyOnAnEdge) {
    Rectangle2d first;
    MakeInverted(first);
    Rectangle2d second;
    MakeInverted(second);
    second.Offset(1.0f, 1.0f);
    Rectangle2d result;
    result.Union(first, second);
    EXPECT_THAT(result, HasEdges(5.0f, 5.0f, 5.0f, 5.0f));
}

TEST(Rectangle2d, UnionTakesTheEdgeOfTheSecondOnANaN) {
    Rectangle2d const plain(3.0f, 10.0f, 10.0f, 0.0f);
    Rectangle2d const unknown(FloatingPoint::Nan, 10.0f, 10.0f, 0.0f);
    Rectangle2d result;
    result.Union(unknown, plain);
    EXPECT_EQ(3.0f, result.left);
    result.Union(plain, unknown);
    EXPECT_THAT(result.left, testing::IsNan());
}

}  // namespace
}  // namespace quorvel::vexmap
