#include "vexmap/trigonometry.h"

#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>
#include <random>
#include <vector>

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

constexpr float TOLERANCE = 1e-6f;
constexpr float TABLE_STEP = 2 * 3.14159265f / 4096;
float const NAN_VALUE = std::numeric_limits<float>::quiet_NaN();

uint32_t Bits(float value) {
    uint32_t bits = 0;
    memcpy(&bits, &value, sizeof bits);
    return bits;
}

TEST(Trigonometry, ConstantsHaveTheirExactBits) {
    EXPECT_EQ(0x3C8EFA35u, Bits(Trigonometry::DEGREES_TO_RADIANS));
    EXPECT_EQ(0x42652EE1u, Bits(Trigonometry::RADIANS_TO_DEGREES));
    EXPECT_EQ(0x2EDBE6FFu, Bits(Trigonometry::EPSILON));
    EXPECT_EQ(0x40490FDBu, Bits(Trigonometry::PI));
    EXPECT_EQ(0x40C90FDBu, Bits(Trigonometry::TWO_PI));
    EXPECT_EQ(0x3FC90FDBu, Bits(Trigonometry::HALF_PI));
    EXPECT_EQ(0x3F490FDBu, Bits(Trigonometry::QUARTER_PI));
    EXPECT_EQ(0x4016CBE4u, Bits(Trigonometry::THREE_QUARTERS_PI));
    EXPECT_EQ(0x3EA2F983u, Bits(Trigonometry::ONE_OVER_PI));
    EXPECT_EQ(0x3E22F983u, Bits(Trigonometry::ONE_OVER_TWO_PI));
}

TEST(Trigonometry, ArcSineAndArcCosineClampJustOutsideTheirDomain) {
    EXPECT_EQ(Trigonometry::HALF_PI, Trigonometry::asin(1.0000001f));
    EXPECT_EQ(-Trigonometry::HALF_PI, Trigonometry::asin(-1.0f));
    EXPECT_EQ(Trigonometry::PI, Trigonometry::acos(-2.0f));
    EXPECT_EQ(0.0f, Trigonometry::acos(1.0f));
    EXPECT_EQ(double(Trigonometry::HALF_PI), Trigonometry::asin(5.0));
    EXPECT_EQ(static_cast<long double>(Trigonometry::PI), Trigonometry::acos(-1.5L));
}

TEST(Trigonometry, ArcSineAndArcCosineLetNotANumberThrough) {
    EXPECT_TRUE(FloatingPoint::is_nan(Trigonometry::asin(NAN_VALUE)));
    EXPECT_TRUE(FloatingPoint::is_nan(Trigonometry::acos(NAN_VALUE)));
}

TEST(Trigonometry, ArcSineAndArcCosineInsideTheDomainFollowTheLibrary) {
    EXPECT_NEAR(0.5235988f, Trigonometry::asin(0.5f), TOLERANCE);
    EXPECT_NEAR(1.0471976f, Trigonometry::acos(0.5f), TOLERANCE);
}

TEST(Trigonometry, PairsHoldSineThenCosineAndLengthThenAngle) {
    auto const [sine, cosine] = Trigonometry::sin_and_cos(Trigonometry::HALF_PI);
    EXPECT_NEAR(1.0f, sine, TOLERANCE);
    EXPECT_NEAR(0.0f, cosine, TOLERANCE);
    auto const [length, angle] = Trigonometry::hypot_and_atan(3.0, 4.0);
    EXPECT_EQ(5.0, length);
    EXPECT_NEAR(0.6435011, angle, 1e-7);  // atan2(3, 4)
}

TEST(Trigonometry, TwoArgumentArcTangentTakesTheFirstArgumentAsTheNumerator) {
    EXPECT_NEAR(Trigonometry::HALF_PI, Trigonometry::atan(1.0f, 0.0f), TOLERANCE);
    EXPECT_NEAR(0.0f, Trigonometry::atan(0.0f, 1.0f), TOLERANCE);
    EXPECT_NEAR(Trigonometry::QUARTER_PI, Trigonometry::atan(1.0f), TOLERANCE);
}

TEST(Trigonometry, WidthsGiveTheSameFunctions) {
    EXPECT_NEAR(double(Trigonometry::sin(0.7f)), Trigonometry::sin(0.7), 1e-7);
    EXPECT_NEAR(double(Trigonometry::cosh(0.7f)), Trigonometry::cosh(0.7), 1e-6);
    EXPECT_NEAR(double(Trigonometry::atanh(0.5f)), double(Trigonometry::atanh(0.5L)), 1e-7);
    EXPECT_NEAR(Trigonometry::asinh(Trigonometry::sinh(0.3f)), 0.3f, TOLERANCE);
    EXPECT_NEAR(Trigonometry::acosh(Trigonometry::cosh(0.3)), 0.3, 1e-9);
    EXPECT_NEAR(Trigonometry::tan(Trigonometry::QUARTER_PI), 1.0f, TOLERANCE);
    EXPECT_NEAR(Trigonometry::tanh(0.0f), 0.0f, TOLERANCE);
}

TEST(Trigonometry, NormaliseAngleOfZeroAndAFullTurnIsAboutZero) {
    EXPECT_NEAR(0.0f, Trigonometry::normalise_angle(0.0f), TOLERANCE);
    EXPECT_NEAR(0.0f, Trigonometry::normalise_angle(Trigonometry::TWO_PI), 1e-6f);
}

TEST(Trigonometry, NormaliseAngleMapsPiToMinusPi) {
    EXPECT_NEAR(-Trigonometry::PI, Trigonometry::normalise_angle(Trigonometry::PI), TOLERANCE);
}

TEST(Trigonometry, NormaliseAngleRemovesWholeTurns) {
    for (float angle : {-10.0f, -4.0f, -3.0f, -1.0f, 0.5f, 3.0f, 4.0f, 7.5f, 100.0f}) {
        float const normalised = Trigonometry::normalise_angle(angle);
        EXPECT_GE(normalised, -Trigonometry::PI - 1e-5f) << angle;
        EXPECT_LT(normalised, Trigonometry::PI) << angle;
        EXPECT_NEAR(Trigonometry::sin(angle), Trigonometry::sin(normalised), 1e-4f) << angle;
        EXPECT_NEAR(Trigonometry::cos(angle), Trigonometry::cos(normalised), 1e-4f) << angle;
    }
}

TEST(Trigonometry, NormaliseAngleRoundsInItsOwnOrder) {
    // floor(ONE_OVER_TWO_PI * v) * -TWO_PI + v - PI, each step rounded to float.
    float const x = 5.0f;
    float const v = x + Trigonometry::PI;
    float const turns = float(int(Trigonometry::ONE_OVER_TWO_PI * v)) * -Trigonometry::TWO_PI;
    float const sum = turns + v;
    EXPECT_EQ(sum - Trigonometry::PI, Trigonometry::normalise_angle(x));
}

TEST(Trigonometry, DegreesAndRadiansConvertByTheirConstants) {
    EXPECT_EQ(180.0f * Trigonometry::DEGREES_TO_RADIANS, Trigonometry::degrees_to_radians(180.0f));
    EXPECT_EQ(Trigonometry::PI * Trigonometry::RADIANS_TO_DEGREES,
              Trigonometry::radians_to_degrees(Trigonometry::PI));
}

TEST(Trigonometry, TablesSampleOnePeriodFromMinusPi) {
    EXPECT_NEAR(0.0f, Trigonometry::SineTable[0], TOLERANCE);
    EXPECT_NEAR(-1.0f, Trigonometry::CosineTable[0], TOLERANCE);
    EXPECT_NEAR(-1.0f, Trigonometry::SineTable[1024], TOLERANCE);   // -pi/2
    EXPECT_NEAR(1.0f, Trigonometry::CosineTable[2048], TOLERANCE);  // 0
    EXPECT_EQ(-1.0f, Trigonometry::CosineTable[4096]);
}

TEST(Trigonometry, FastSineOfALargeAngleClampsToTheEndOfTheTableAndGivesMinusOne) {
    EXPECT_EQ(-1.0f, Trigonometry::fast_sin(100.0f));
    EXPECT_EQ(Trigonometry::CosineTable[0], Trigonometry::fast_sin(100.0f));
    EXPECT_EQ(-1.0f, Trigonometry::fast_cos(100.0f));
    EXPECT_EQ(Trigonometry::SineTable[0], Trigonometry::fast_sin(-100.0f));
}

TEST(Trigonometry, FastFunctionsLetNotANumberAndInfinityThrough) {
    EXPECT_TRUE(FloatingPoint::is_nan(Trigonometry::fast_sin(NAN_VALUE)));
    EXPECT_EQ(FloatingPoint::Infinity, Trigonometry::fast_cos(FloatingPoint::Infinity));
    auto const pair = Trigonometry::fast_sin_and_cos(-FloatingPoint::Infinity);
    EXPECT_EQ(-FloatingPoint::Infinity, pair.first);
    EXPECT_EQ(-FloatingPoint::Infinity, pair.second);
}

TEST(Trigonometry, FastFunctionsFollowTheLibraryWithinATableStep) {
    for (float angle = -3.1f; angle < 3.1f; angle += 0.05f) {
        auto const [sine, cosine] = Trigonometry::fast_sin_and_cos(angle);
        EXPECT_NEAR(Trigonometry::sin(angle), sine, TABLE_STEP) << angle;
        EXPECT_NEAR(Trigonometry::cos(angle), cosine, TABLE_STEP) << angle;
        EXPECT_EQ(sine, Trigonometry::fast_sin(angle));
        EXPECT_EQ(cosine, Trigonometry::fast_cos(angle));
    }
}

TEST(Trigonometry, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Trigonometry doors;
    Trigonometry& same = doors;
    doors = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Trigonometry object\n", lines[0].text);
}

TEST(Trigonometry, FloatHypotIsTheLibrarysBitForBit) {
    std::mt19937 random(7);
    for (int i = 0; i < 1000000; ++i) {
        uint32_t const a = uint32_t(random());
        uint32_t const b = uint32_t(random());
        float x = 0.0f;
        float y = 0.0f;
        std::memcpy(&x, &a, sizeof x);
        std::memcpy(&y, &b, sizeof y);
        if (i % 2 == 1) {  // map-sized values as well as every exponent
            x = float(a % 200000u) / 64.0f - 1500.0f;
            y = float(b % 200000u) / 64.0f - 1500.0f;
        }
        ASSERT_EQ(Bits(std::hypot(x, y)), Bits(Trigonometry::hypot(x, y))) << x << " " << y;
    }
}

TEST(Trigonometry, FloatHypotOfInfinityIsInfiniteEvenBesideNotANumber) {
    float const infinity = std::numeric_limits<float>::infinity();
    EXPECT_EQ(infinity, Trigonometry::hypot(-infinity, NAN_VALUE));
    EXPECT_TRUE(std::isnan(Trigonometry::hypot(NAN_VALUE, 1.0f)));
}

}  // namespace
}  // namespace quorvel::vexmap
