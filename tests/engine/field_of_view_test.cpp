#include "vexmap/field_of_view.h"

#include <cmath>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using testing::AllOf;
using testing::Field;

// hypot in float against the same root taken in double.
constexpr double DIAGONAL_TOLERANCE = 1e-6;

testing::Matcher<FieldOfView const&> HasAngles(float horizontal, float vertical, float diagonal) {
    return AllOf(Field("horizontal", &FieldOfView::horizontal, horizontal),
                 Field("vertical", &FieldOfView::vertical, vertical),
                 Field("diagonal", &FieldOfView::diagonal, diagonal));
}

double Hypotenuse(float a, float b) {
    return std::sqrt(double(a) * double(a) + double(b) * double(b));
}

TEST(FieldOfView, DefaultIsZero) {
    EXPECT_THAT(FieldOfView(), HasAngles(0.0f, 0.0f, 0.0f));
}

TEST(FieldOfView, ThreeValuesAreTakenAsTheyCome) {
    EXPECT_THAT(FieldOfView(1.0f, 1.0f, 5.0f), HasAngles(1.0f, 1.0f, 5.0f));
}

TEST(FieldOfView, TwoValuesGiveTheirHypotenuseAsDiagonal) {
    EXPECT_THAT(FieldOfView(3.0f, 4.0f), HasAngles(3.0f, 4.0f, 5.0f));
    FieldOfView const angles(1.2f, 0.7f);
    EXPECT_NEAR(Hypotenuse(1.2f, 0.7f), double(angles.diagonal), DIAGONAL_TOLERANCE);
}

TEST(FieldOfView, VectorGivesHorizontalFromXAndVerticalFromY) {
    EXPECT_THAT(FieldOfView(Vector2d(3.0f, 4.0f)), HasAngles(3.0f, 4.0f, 5.0f));
}

TEST(FieldOfView, SetRecomputesTheDiagonal) {
    FieldOfView angles(1.0f, 1.0f, 5.0f);
    angles.Set(6.0f, 8.0f);
    EXPECT_THAT(angles, HasAngles(6.0f, 8.0f, 10.0f));
}

TEST(FieldOfView, CopiesAndAssignmentsCarryAllThreeSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    FieldOfView const original(1.0f, 2.0f, 7.0f);
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization) the copy is under test
    FieldOfView const copy(original);
    FieldOfView assigned;
    assigned = original;
    EXPECT_THAT(copy, HasAngles(1.0f, 2.0f, 7.0f));
    EXPECT_THAT(assigned, HasAngles(1.0f, 2.0f, 7.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(FieldOfView, AssignmentToItselfWarnsAndKeepsTheAngles) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    FieldOfView angles(1.0f, 2.0f, 7.0f);
    FieldOfView const& same = angles;
    angles = same;
    EXPECT_THAT(angles, HasAngles(1.0f, 2.0f, 7.0f));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of FieldOfView object\n", lines[0].text);
}

TEST(FieldOfView, ZeroFieldOfViewIsZero) {
    EXPECT_THAT(FieldOfView::ZeroFieldOfView, HasAngles(0.0f, 0.0f, 0.0f));
}

TEST(FieldOfView, InvalidFieldOfViewIsNanInAllThree) {
    EXPECT_THAT(FieldOfView::InvalidFieldOfView,
                AllOf(Field("horizontal", &FieldOfView::horizontal, testing::IsNan()),
                      Field("vertical", &FieldOfView::vertical, testing::IsNan()),
                      Field("diagonal", &FieldOfView::diagonal, testing::IsNan())));
    EXPECT_FALSE(FieldOfView::InvalidFieldOfView.Valid());
}

TEST(FieldOfView, CeilingFieldOfViewIsAFullTurnByAQuarterTurn) {
    FieldOfView const& ceiling = FieldOfView::CeilingFieldOfView;
    EXPECT_EQ(Trigonometry::TWO_PI, ceiling.horizontal);
    EXPECT_EQ(Trigonometry::HALF_PI, ceiling.vertical);
    EXPECT_NEAR(Hypotenuse(Trigonometry::TWO_PI, Trigonometry::HALF_PI), double(ceiling.diagonal),
                DIAGONAL_TOLERANCE);
}

TEST(FieldOfView, CeilingAndFloorFieldsOfViewAreEqualInAllFields) {
    FieldOfView const& ceiling = FieldOfView::CeilingFieldOfView;
    FieldOfView const& floor = FieldOfView::FloorFieldOfView;
    EXPECT_EQ(ceiling.horizontal, floor.horizontal);
    EXPECT_EQ(ceiling.vertical, floor.vertical);
    EXPECT_EQ(ceiling.diagonal, floor.diagonal);
}

TEST(FieldOfView, PtzFieldOfViewIsAQuarterTurnEachWay) {
    FieldOfView const& ptz = FieldOfView::PtzFieldOfView;
    EXPECT_EQ(Trigonometry::HALF_PI, ptz.horizontal);
    EXPECT_EQ(Trigonometry::HALF_PI, ptz.vertical);
    EXPECT_NEAR(Hypotenuse(Trigonometry::HALF_PI, Trigonometry::HALF_PI), double(ptz.diagonal),
                DIAGONAL_TOLERANCE);
}

TEST(FieldOfView, EqualAnglesAreEqualAndNotUnequal) {
    EXPECT_TRUE(FieldOfView(1.0f, 2.0f, 3.0f) == FieldOfView(1.0f, 2.0f, 3.0f));
    EXPECT_FALSE(FieldOfView(1.0f, 2.0f, 3.0f) != FieldOfView(1.0f, 2.0f, 3.0f));
}

struct AnglesCase {
    char const* name;
    FieldOfView angles;
};

std::ostream& operator<<(std::ostream& stream, AnglesCase const& value) {
    return stream << value.name;
}

std::string NameOf(testing::TestParamInfo<AnglesCase> const& info) {
    return info.param.name;
}

class FieldOfViewDifferenceTest : public testing::TestWithParam<AnglesCase> {};

TEST_P(FieldOfViewDifferenceTest, OneDifferingFieldMakesThemUnequal) {
    FieldOfView const base(1.0f, 2.0f, 3.0f);
    EXPECT_FALSE(base == GetParam().angles);
    EXPECT_TRUE(base != GetParam().angles);
}

INSTANTIATE_TEST_SUITE_P(FieldOfView, FieldOfViewDifferenceTest,
                         testing::Values(AnglesCase{"Horizontal", FieldOfView(1.5f, 2.0f, 3.0f)},
                                         AnglesCase{"Vertical", FieldOfView(1.0f, 2.5f, 3.0f)},
                                         AnglesCase{"Diagonal", FieldOfView(1.0f, 2.0f, 3.5f)}),
                         NameOf);

TEST(FieldOfView, NanComparesEqualToAnythingUnderEquality) {
    EXPECT_TRUE(FieldOfView::InvalidFieldOfView == FieldOfView(1.0f, 2.0f, 3.0f));
    EXPECT_TRUE(FieldOfView(FloatingPoint::Nan, 2.0f, 3.0f) == FieldOfView(1.0f, 2.0f, 3.0f));
}

TEST(FieldOfView, NanComparesUnequalToAnythingUnderInequality) {
    EXPECT_TRUE(FieldOfView::InvalidFieldOfView != FieldOfView(1.0f, 2.0f, 3.0f));
    EXPECT_TRUE(FieldOfView(FloatingPoint::Nan, 2.0f, 3.0f) != FieldOfView(1.0f, 2.0f, 3.0f));
}

TEST(FieldOfView, NanPairIsBothEqualAndUnequal) {
    FieldOfView const& invalid = FieldOfView::InvalidFieldOfView;
    EXPECT_TRUE(invalid == invalid);
    EXPECT_TRUE(invalid != invalid);
}

TEST(FieldOfView, UnaryMinusNegatesAllThree) {
    EXPECT_THAT(-FieldOfView(1.0f, 2.0f, 5.0f), HasAngles(-1.0f, -2.0f, -5.0f));
}

TEST(FieldOfView, AdditionAddsTheDiagonalsWithoutRecomputingThem) {
    EXPECT_THAT(FieldOfView(1.0f, 1.0f, 5.0f) + FieldOfView(1.0f, 1.0f, 5.0f),
                HasAngles(2.0f, 2.0f, 10.0f));
}

TEST(FieldOfView, SubtractionWorksOnAllThree) {
    EXPECT_THAT(FieldOfView(4.0f, 3.0f, 9.0f) - FieldOfView(1.0f, 1.0f, 5.0f),
                HasAngles(3.0f, 2.0f, 4.0f));
}

TEST(FieldOfView, MultiplicationAndDivisionByAFloatWorkOnAllThree) {
    EXPECT_THAT(FieldOfView(1.0f, 2.0f, 5.0f) * 2.0f, HasAngles(2.0f, 4.0f, 10.0f));
    EXPECT_THAT(FieldOfView(1.0f, 2.0f, 5.0f) / 2.0f, HasAngles(0.5f, 1.0f, 2.5f));
}

TEST(FieldOfView, CompoundOperatorsWorkInPlaceOnAllThree) {
    FieldOfView angles(1.0f, 2.0f, 5.0f);
    EXPECT_EQ(&angles, &(angles += FieldOfView(1.0f, 1.0f, 1.0f)));
    EXPECT_THAT(angles, HasAngles(2.0f, 3.0f, 6.0f));
    EXPECT_EQ(&angles, &(angles -= FieldOfView(0.5f, 1.0f, 2.0f)));
    EXPECT_THAT(angles, HasAngles(1.5f, 2.0f, 4.0f));
    EXPECT_EQ(&angles, &(angles *= 2.0f));
    EXPECT_THAT(angles, HasAngles(3.0f, 4.0f, 8.0f));
    EXPECT_EQ(&angles, &(angles /= 4.0f));
    EXPECT_THAT(angles, HasAngles(0.75f, 1.0f, 2.0f));
}

TEST(FieldOfView, FloatTimesFieldOfViewMultipliesAllThree) {
    EXPECT_THAT(3.0f * FieldOfView(1.0f, 2.0f, 5.0f), HasAngles(3.0f, 6.0f, 15.0f));
}

TEST(FieldOfView, FloatOverFieldOfViewDividesTheFloatByEachField) {
    EXPECT_THAT(2.0f / FieldOfView(1.0f, 4.0f, 8.0f), HasAngles(2.0f, 0.5f, 0.25f));
}

TEST(FieldOfView, SetZeroZeroesAllThree) {
    FieldOfView angles(1.0f, 2.0f, 5.0f);
    angles.SetZero();
    EXPECT_THAT(angles, HasAngles(0.0f, 0.0f, 0.0f));
}

class FieldOfViewValidityTest : public testing::TestWithParam<AnglesCase> {};

TEST_P(FieldOfViewValidityTest, ValidNeedsAllThreeFinite) {
    EXPECT_FALSE(GetParam().angles.Valid());
}

INSTANTIATE_TEST_SUITE_P(
    FieldOfView, FieldOfViewValidityTest,
    testing::Values(
        AnglesCase{"NanHorizontal", FieldOfView(FloatingPoint::Nan, 1.0f, 1.0f)},
        AnglesCase{"NanVertical", FieldOfView(1.0f, FloatingPoint::Nan, 1.0f)},
        AnglesCase{"NanDiagonal", FieldOfView(1.0f, 1.0f, FloatingPoint::Nan)},
        AnglesCase{"InfiniteHorizontal", FieldOfView(FloatingPoint::Infinity, 1.0f, 1.0f)},
        AnglesCase{"InfiniteVertical", FieldOfView(1.0f, -FloatingPoint::Infinity, 1.0f)},
        AnglesCase{"InfiniteDiagonal", FieldOfView(1.0f, 1.0f, FloatingPoint::Infinity)}),
    NameOf);

TEST(FieldOfView, ValidAcceptsFiniteAnglesOfAnySign) {
    EXPECT_TRUE(FieldOfView().Valid());
    EXPECT_TRUE(FieldOfView(-1.0f, 2.0f, 0.0f).Valid());
    EXPECT_TRUE(FieldOfView::CeilingFieldOfView.Valid());
}

}  // namespace
}  // namespace quorvel::vexmap
