#include "vexmap/floating_point.h"

#include <cfloat>
#include <cstdint>
#include <cstring>
#include <limits>

#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

uint32_t Bits(float value) {
    uint32_t bits = 0;
    memcpy(&bits, &value, sizeof bits);
    return bits;
}

float const NAN_VALUE = std::numeric_limits<float>::quiet_NaN();

TEST(FloatingPoint, ConstantsHaveTheirExactBits) {
    EXPECT_EQ(0x7FC00000u, Bits(FloatingPoint::Nan));
    EXPECT_EQ(0x7F800000u, Bits(FloatingPoint::Infinity));
    EXPECT_EQ(0x00000000u, Bits(FloatingPoint::Zero));
}

TEST(FloatingPoint, SquareRootOfANegativeValueIsTheRootOfItsMagnitudeWithAWarning) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EXPECT_EQ(2.0f, FloatingPoint::sqrt(-4.0f));
    EXPECT_EQ(3.0, FloatingPoint::sqrt(-9.0));
    EXPECT_EQ(5.0L, FloatingPoint::sqrt(-25.0L));
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());
    EXPECT_EQ(
        "VEXMAP: WARNING - Attempted square root of a negative value. Returning root of "
        "absolute.\n",
        lines[0].format);
}

TEST(FloatingPoint, SquareRootOfNotANumberOrNegativeZeroPassesSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EXPECT_TRUE(FloatingPoint::is_nan(FloatingPoint::sqrt(NAN_VALUE)));
    float const negative_zero = FloatingPoint::sqrt(-0.0f);
    EXPECT_EQ(0x80000000u, Bits(negative_zero));
    EXPECT_EQ(3.0f, FloatingPoint::sqrt(9.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(FloatingPoint, ThinOperationsFollowTheLibrary) {
    EXPECT_EQ(2.5f, FloatingPoint::fabs(-2.5f));
    EXPECT_EQ(6.25, FloatingPoint::square(-2.5));
    EXPECT_EQ(8.0f, FloatingPoint::pow(2.0f, 3.0f));
    EXPECT_FLOAT_EQ(1.0f, FloatingPoint::log(2.7182817f));
    EXPECT_EQ(-3.0f, FloatingPoint::floor(-2.5f));
    EXPECT_EQ(-2.0f, FloatingPoint::ceiling(-2.5f));
    EXPECT_EQ(2.0L, FloatingPoint::nearbyint(2.5L));  // to even, in the default rounding mode
    EXPECT_EQ(FP_NORMAL, FloatingPoint::classify(1.0f));
    EXPECT_EQ(FP_SUBNORMAL, FloatingPoint::classify(FLT_MIN / 2));
}

TEST(FloatingPoint, ZeroIsExactAndSignless) {
    EXPECT_FALSE(FloatingPoint::is_zero(1e-30f));
    EXPECT_TRUE(FloatingPoint::is_zero(-0.0f));
    EXPECT_TRUE(FloatingPoint::is_zero(0.0));
    EXPECT_FALSE(FloatingPoint::is_zero(DBL_MIN / 4));
}

TEST(FloatingPoint, ClassesOfValues) {
    EXPECT_TRUE(FloatingPoint::is_finite(FLT_MAX));
    EXPECT_FALSE(FloatingPoint::is_finite(FloatingPoint::Infinity));
    EXPECT_FALSE(FloatingPoint::is_finite(NAN_VALUE));
    EXPECT_TRUE(FloatingPoint::is_normal(FLT_MIN));
    EXPECT_FALSE(FloatingPoint::is_normal(FLT_MIN / 2));
    EXPECT_FALSE(FloatingPoint::is_normal(0.0f));
    EXPECT_FALSE(FloatingPoint::is_normal(FloatingPoint::Infinity));
    EXPECT_TRUE(FloatingPoint::is_nan(NAN_VALUE));
    EXPECT_FALSE(FloatingPoint::is_nan(FloatingPoint::Infinity));
    EXPECT_TRUE(FloatingPoint::is_inf(-FloatingPoint::Infinity));
    EXPECT_FALSE(FloatingPoint::is_inf(FLT_MAX));
    EXPECT_FALSE(FloatingPoint::is_inf(NAN_VALUE));
}

TEST(FloatingPoint, ComparisonsWithNotANumberAreAllFalseButUnordered) {
    EXPECT_FALSE(FloatingPoint::is_less(NAN_VALUE, 1.0f));
    EXPECT_FALSE(FloatingPoint::is_greater(NAN_VALUE, 1.0f));
    EXPECT_FALSE(FloatingPoint::is_lessgreater(NAN_VALUE, 1.0f));
    EXPECT_FALSE(FloatingPoint::is_lessequal(1.0f, NAN_VALUE));
    EXPECT_FALSE(FloatingPoint::is_greaterequal(NAN_VALUE, NAN_VALUE));
    EXPECT_TRUE(FloatingPoint::is_unordered(NAN_VALUE, 1.0f));
    EXPECT_FALSE(FloatingPoint::is_unordered(2.0f, 1.0f));
}

TEST(FloatingPoint, ComparisonsOfNumbers) {
    EXPECT_TRUE(FloatingPoint::is_less(1.0f, 2.0f));
    EXPECT_TRUE(FloatingPoint::is_lessequal(2.0, 2.0));
    EXPECT_TRUE(FloatingPoint::is_greater(3.0L, 2.0L));
    EXPECT_TRUE(FloatingPoint::is_greaterequal(2.0f, 2.0f));
    EXPECT_TRUE(FloatingPoint::is_lessgreater(1.0f, 2.0f));
    EXPECT_FALSE(FloatingPoint::is_lessgreater(2.0f, 2.0f));
    EXPECT_FALSE(FloatingPoint::is_lessgreater(0.0f, -0.0f));
}

TEST(FloatingPoint, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    FloatingPoint doors;
    FloatingPoint& same = doors;
    doors = same;
    FloatingPoint const other;
    doors = other;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of FloatingPoint object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
