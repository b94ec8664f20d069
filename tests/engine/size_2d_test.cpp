#include "vexmap/size_2d.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

using testing::AllOf;
using testing::Field;

Point2d At(int x, int y) {
    Point2d point;
    point.x = x;
    point.y = y;
    return point;
}

testing::Matcher<Point2d const&> IsPoint(int x, int y) {
    return AllOf(Field("x", &Point2d::x, x), Field("y", &Point2d::y, y));
}

TEST(Point2d, DefaultIsTheOrigin) {
    EXPECT_THAT(Point2d(), IsPoint(0, 0));
    EXPECT_THAT(Point2d::Origin, IsPoint(0, 0));
}

TEST(Point2d, CopiesAndAssignmentsCarryBothComponents) {
    Point2d const original = At(3, -4);
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization) the copy is under test
    Point2d const copy(original);
    Point2d assigned;
    assigned = original;
    EXPECT_THAT(copy, IsPoint(3, -4));
    EXPECT_THAT(assigned, IsPoint(3, -4));
}

TEST(Point2d, AssignmentToItselfIsSilent) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Point2d point = At(3, -4);
    Point2d const& same = point;
    point = same;
    EXPECT_THAT(point, IsPoint(3, -4));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Point2d, EqualityComparesBothComponents) {
    EXPECT_TRUE(At(3, 4) == At(3, 4));
    EXPECT_FALSE(At(3, 4) != At(3, 4));
    EXPECT_FALSE(At(3, 4) == At(3, 5));
    EXPECT_TRUE(At(3, 4) != At(3, 5));
    EXPECT_FALSE(At(3, 4) == At(2, 4));
    EXPECT_TRUE(At(3, 4) != At(2, 4));
}

TEST(Point2d, SetZeroReturnsToTheOrigin) {
    Point2d point = At(7, -9);
    point.SetZero();
    EXPECT_THAT(point, IsPoint(0, 0));
}

TEST(Point2d, ScaleMultipliesComponentByComponentInPlace) {
    Point2d point = At(3, -4);
    Point2d& result = point.Scale(At(5, 6));
    EXPECT_EQ(&point, &result);
    EXPECT_THAT(point, IsPoint(15, -24));
}

TEST(Point2d, IntegerTimesPointMultipliesBothComponents) {
    EXPECT_THAT(3 * At(4, -5), IsPoint(12, -15));
}

TEST(Point2d, IntegerOverPointDividesByEachComponentTowardsZero) {
    EXPECT_THAT(7 / At(2, -3), IsPoint(3, -2));
    EXPECT_THAT(-7 / At(2, 8), IsPoint(-3, 0));
}

TEST(Point2dDeathTest, IntegerOverPointWithAZeroComponentIsNotGuarded) {
    int volatile zero = 0;  // keeps the divisor out of the compiler's sight
    Point2d const divisor = At(1, zero);
    EXPECT_DEATH(static_cast<void>(7 / divisor), "");
}

}  // namespace
}  // namespace quorvel::vexmap
