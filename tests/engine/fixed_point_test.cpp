#include "vexmap/fixed_point.h"

#include <cstdint>
#include <limits>
#include <type_traits>

#include <gtest/gtest.h>

namespace quorvel::vexmap {
namespace {

FixedPoint Raw(int32_t value) {
    FixedPoint number;
    number.value = value;
    return number;
}

constexpr int32_t LOWEST = std::numeric_limits<int32_t>::min();
constexpr int32_t HIGHEST = std::numeric_limits<int32_t>::max();

TEST(FixedPoint, ConstantsDescribeSixteenFractionBits) {
    EXPECT_EQ(16, FixedPoint::FractionBitCount);
    EXPECT_EQ(65536, FixedPoint::ConversionScale);
    EXPECT_EQ(0xFFFFu, FixedPoint::FractionBitMask);
    EXPECT_EQ(0x8000u, FixedPoint::RoundBitMask);
    EXPECT_EQ(0xFFFF0000u, FixedPoint::IntegerBitMask);
    EXPECT_EQ(0x80000000u, FixedPoint::SignBitMask);
}

TEST(FixedPoint, DefaultIsZero) {
    EXPECT_EQ(0, FixedPoint().value);
}

TEST(FixedPoint, IntegerShiftsIntoTheIntegerBits) {
    EXPECT_EQ(196608, FixedPoint(3).value);
    EXPECT_EQ(-131072, FixedPoint(-2).value);
    EXPECT_EQ(0, FixedPoint(0).value);
}

TEST(FixedPoint, IntegerBeyondFifteenBitsWrapsUnchecked) {
    // Intended: no check for overflow, the bits shifted out are lost.
    EXPECT_EQ(-1673527296, FixedPoint(40000).value);
    EXPECT_EQ(LOWEST, FixedPoint(32768).value);
    EXPECT_EQ(0, FixedPoint(65536).value);
}

TEST(FixedPoint, FloatIsScaledAndTruncatedTowardsZero) {
    EXPECT_EQ(98304, FixedPoint(1.5f).value);
    EXPECT_EQ(-98304, FixedPoint(-1.5f).value);
    EXPECT_EQ(131071, FixedPoint(1.99999f).value);
    EXPECT_EQ(-131071, FixedPoint(-1.99999f).value);
    EXPECT_EQ(0, FixedPoint(1e-6f).value);
    EXPECT_EQ(0, FixedPoint(-1e-6f).value);
}

TEST(FixedPoint, DoubleIsScaledAndTruncatedTowardsZero) {
    EXPECT_EQ(98304, FixedPoint(1.5).value);
    EXPECT_EQ(205887, FixedPoint(3.14159265358979).value);
    EXPECT_EQ(-205887, FixedPoint(-3.14159265358979).value);
    EXPECT_EQ(0, FixedPoint(-1e-6).value);
}

TEST(FixedPoint, LongDoubleIsScaledAndTruncatedTowardsZero) {
    EXPECT_EQ(98304, FixedPoint(1.5L).value);
    EXPECT_EQ(-205887, FixedPoint(-3.14159265358979L).value);
    EXPECT_EQ(0, FixedPoint(1e-6L).value);
}

TEST(FixedPoint, AssignConvertsAsTheConstructorsDoAndReturnsItself) {
    FixedPoint number;
    EXPECT_EQ(&number, &number.Assign(3));
    EXPECT_EQ(196608, number.value);
    EXPECT_EQ(&number, &number.Assign(-1.5f));
    EXPECT_EQ(-98304, number.value);
    EXPECT_EQ(&number, &number.Assign(2.25));
    EXPECT_EQ(147456, number.value);
    EXPECT_EQ(&number, &number.Assign(-0.75L));
    EXPECT_EQ(-49152, number.value);
}

TEST(FixedPoint, CopiesTakeTheValue) {
    FixedPoint const original = Raw(12345);
    FixedPoint const copy(original);
    EXPECT_EQ(12345, copy.value);
    FixedPoint assigned;
    EXPECT_EQ(&assigned, &(assigned = original));
    EXPECT_EQ(12345, assigned.value);
}

TEST(FixedPoint, AssignmentToItselfKeepsTheValue) {
    FixedPoint number = Raw(-777);
    FixedPoint const& same = number;
    EXPECT_EQ(&number, &(number = same));
    EXPECT_EQ(-777, number.value);
}

TEST(FixedPoint, AddsSubtractsAndNegatesValues) {
    EXPECT_EQ(163840, (FixedPoint(1.5) + FixedPoint(1)).value);
    EXPECT_EQ(32768, (FixedPoint(1.5) - FixedPoint(1)).value);
    EXPECT_EQ(-98304, (-FixedPoint(1.5)).value);
    EXPECT_EQ(3, (Raw(1) + Raw(2)).value);
}

TEST(FixedPoint, CompoundAdditionAndSubtractionChangeTheLeftOperand) {
    FixedPoint number(2);
    EXPECT_EQ(&number, &(number += FixedPoint(0.5)));
    EXPECT_EQ(163840, number.value);
    EXPECT_EQ(&number, &(number -= FixedPoint(3)));
    EXPECT_EQ(-32768, number.value);
}

TEST(FixedPoint, SumsAndDifferencesWrapAroundThirtyTwoBits) {
    EXPECT_EQ(LOWEST, (Raw(HIGHEST) + Raw(1)).value);
    EXPECT_EQ(HIGHEST, (Raw(LOWEST) - Raw(1)).value);
    EXPECT_EQ(LOWEST, (-Raw(LOWEST)).value);
    FixedPoint number = Raw(HIGHEST);
    number += Raw(2);
    EXPECT_EQ(LOWEST + 1, number.value);
}

TEST(FixedPoint, ProductIsZeroWhateverTheOperands) {
    // Intended: multiplication is empty by design.
    EXPECT_EQ(0, (FixedPoint(3) * FixedPoint(4)).value);
    EXPECT_EQ(0, (FixedPoint(-1.5) * FixedPoint(1)).value);
}

TEST(FixedPoint, QuotientIsZeroWhateverTheOperands) {
    // Intended: division is empty by design, and a zero divisor does no harm.
    EXPECT_EQ(0, (FixedPoint(12) / FixedPoint(4)).value);
    EXPECT_EQ(0, (FixedPoint(1) / FixedPoint()).value);
}

TEST(FixedPoint, MultiplyAssignLeavesTheNumberAsItIs) {
    // Intended: the compound product does nothing but return the left operand.
    FixedPoint number(3);
    EXPECT_EQ(&number, &(number *= FixedPoint(4)));
    EXPECT_EQ(196608, number.value);
}

TEST(FixedPoint, DivideAssignLeavesTheNumberAsItIs) {
    // Intended: the compound quotient does nothing but return the left operand.
    FixedPoint number(-5);
    EXPECT_EQ(&number, &(number /= FixedPoint()));
    EXPECT_EQ(-327680, number.value);
}

TEST(FixedPoint, FloatConversionDividesByTheScale) {
    EXPECT_EQ(1.5f, float(Raw(98304)));
    EXPECT_EQ(-0.75f, float(Raw(-49152)));
    EXPECT_EQ(1.0f / 65536.0f, float(Raw(1)));
}

TEST(FixedPoint, IntConversionRoundsTowardsMinusInfinity) {
    // Intended: the integer part is an arithmetic shift, a floor and not a truncation.
    EXPECT_EQ(-1, int(FixedPoint(-0.5f)));
    EXPECT_EQ(-3, int(FixedPoint(-2.25)));
    EXPECT_EQ(-1, int(Raw(-1)));
    EXPECT_EQ(2, int(FixedPoint(2.75)));
    EXPECT_EQ(0, int(Raw(65535)));
}

TEST(FixedPoint, HasAVirtualDestructor) {
    EXPECT_TRUE(std::has_virtual_destructor<FixedPoint>::value);
    EXPECT_TRUE(std::is_polymorphic<FixedPoint>::value);
}

}  // namespace
}  // namespace quorvel::vexmap
