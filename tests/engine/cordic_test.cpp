#include "vexmap/cordic.h"

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <tuple>
#include <type_traits>

#include <gtest/gtest.h>

#include "vexmap/fixed_point.h"

namespace quorvel::vexmap {
namespace {

constexpr double ONE = 65536.0;  // one at the default scale
constexpr double PI = 3.14159265358979323846;

// Errors of the iterations at the default scale of 16 fraction bits and 16 steps, in the units of
// each result, about twice the largest seen over the grids below.
constexpr double SINE_TOLERANCE = 4e-4;
constexpr double TANGENT_TOLERANCE = 1e-3;     // relative to the larger of 1 and |tan|
constexpr double ARCTANGENT_TOLERANCE = 4e-4;  // radians
constexpr double HYPOT_TOLERANCE = 1e-3;       // relative
constexpr double ARCSINE_TOLERANCE = 3e-3;     // radians, for |v| up to 0.55
// Beyond about 0.6 the vector, still shorter than one in the early steps, lets a comparison with
// v choose the wrong way, and the later steps cannot turn all of it back.
constexpr double ARCSINE_WIDE_TOLERANCE = 5e-2;
constexpr double HYPERBOLIC_TOLERANCE = 1.5e-3;  // relative to cosh, the larger part
constexpr double TANH_TOLERANCE = 5e-4;
constexpr double ATANH_TOLERANCE = 4e-4;
constexpr double LOG_TOLERANCE = 2e-3;
constexpr double LOG10_TOLERANCE = 1e-3;
constexpr double SQRT_TOLERANCE = 2e-3;  // relative
constexpr double INVERSE_HYPERBOLIC_TOLERANCE = 2e-3;
constexpr double NORMALISE_TOLERANCE = 1e-4;  // radians, over about three turns
constexpr double DEGREES_TOLERANCE = 1e-3;    // relative: the constants are truncated

int32_t Fixed(double x) {
    return int32_t(x * ONE);
}

double Real(int32_t v) {
    return double(v) / ONE;
}

// The reference sees the input as the routine sees it, after truncation to 16 fraction bits.
double AsSeen(double x) {
    return Real(Fixed(x));
}

// The scale is class-wide: each test that changes it puts the defaults back.
class CordicTest : public ::testing::Test {
protected:
    void TearDown() override {
        Cordic::set_fixed_point(Cordic::DefaultShift, Cordic::DefaultAccuracy);
    }
};

TEST(Cordic, ConstantsAreTheGainsAndBounds) {
    EXPECT_EQ(32, Cordic::MaxAccuracy);
    EXPECT_EQ(16, Cordic::DefaultAccuracy);
    EXPECT_EQ(16, Cordic::DefaultShift);
    double circular_gain = 1.0;
    for (int i = 0; i < 32; ++i) {
        circular_gain *= std::sqrt(1.0 + std::ldexp(1.0, -2 * i));
    }
    EXPECT_NEAR(circular_gain, Cordic::K, 1e-12);
    EXPECT_NEAR(1.0, Cordic::K * Cordic::InvK, 1e-15);
    // The hyperbolic gain and bound count the repeated steps 4 and 13.
    double hyperbolic_gain = 1.0;
    double angle_sum = 0.0;
    for (int i : {1,  2,  3,  4,  4,  5,  6,  7,  8,  9,  10, 11, 12, 13, 13, 14, 15,
                  16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31}) {
        hyperbolic_gain *= std::sqrt(1.0 - std::ldexp(1.0, -2 * i));
        angle_sum += std::atanh(std::ldexp(1.0, -i));
    }
    EXPECT_NEAR(hyperbolic_gain, Cordic::Kp, 1e-12);
    EXPECT_NEAR(1.0, Cordic::Kp * Cordic::InvKp, 1e-15);
    EXPECT_NEAR(angle_sum, Cordic::MaxHyperbolic, 1e-9);
    EXPECT_NEAR(std::log10(std::exp(1.0)), Cordic::Log10E, 1e-15);
    EXPECT_NEAR(std::log(2.0), Cordic::Ln2, 1e-15);
    EXPECT_NEAR(std::sqrt(2.0), Cordic::Root2, 1e-15);
    EXPECT_NEAR(std::sqrt(0.5), Cordic::InvRoot2, 1e-15);
}

TEST(Cordic, SourceAnglesHaveSevenSignificantDigits) {
    EXPECT_EQ(0.7853982, Cordic::CordicCircular[0]);
    EXPECT_EQ(0.124355, Cordic::CordicCircular[3]);
    EXPECT_EQ(0.007812341, Cordic::CordicCircular[7]);
    EXPECT_EQ(0.5493061, Cordic::CordicHyperbolic[1]);
    EXPECT_EQ(0.007812659, Cordic::CordicHyperbolic[7]);
    EXPECT_EQ(std::numeric_limits<double>::infinity(), Cordic::CordicHyperbolic[0]);
    for (int i = 0; i < 32; ++i) {
        double const circular = std::atan(std::ldexp(1.0, -i));
        EXPECT_NEAR(circular, Cordic::CordicCircular[std::size_t(i)], 5e-7 * circular) << i;
        if (i > 0) {
            double const hyperbolic = std::atanh(std::ldexp(1.0, -i));
            EXPECT_NEAR(hyperbolic, Cordic::CordicHyperbolic[std::size_t(i)], 5e-7 * hyperbolic)
                << i;
        }
    }
}

TEST(Cordic, StateAtLoadIsThatOfTheDefaultScale) {
    EXPECT_EQ(16, Cordic::Shift);
    EXPECT_EQ(65536, Cordic::Multiplier);
    EXPECT_EQ(16, Cordic::IterationCount);
    EXPECT_EQ(107922, Cordic::FixedK);
    EXPECT_EQ(39796, Cordic::FixedInvK);
    EXPECT_EQ(54274, Cordic::FixedKp);
    EXPECT_EQ(79134, Cordic::FixedInvKp);
    EXPECT_EQ(73280, Cordic::FixedMaxHyperbolic);
    EXPECT_EQ(-73280, Cordic::FixedMinHyperbolic);
    EXPECT_EQ(28461, Cordic::FixedLog10E);
    EXPECT_EQ(45426, Cordic::FixedLn2);
    EXPECT_EQ(92681, Cordic::FixedRoot2);
    EXPECT_EQ(46340, Cordic::FixedInvRoot2);
    EXPECT_EQ(411774, Cordic::FixedTwoPi);
    EXPECT_EQ(20860, Cordic::FixedOneOverPi);
    EXPECT_EQ(1143, Cordic::FixedDegreesToRadians);
    EXPECT_EQ(3754936, Cordic::FixedRadiansToDegrees);
    EXPECT_EQ(0, Cordic::FixedEpsilon);
    EXPECT_TRUE(Cordic::CircularTableInitialiser);
    EXPECT_TRUE(Cordic::HyperbolicTableInitialiser);
}

TEST(Cordic, CircularTableHoldsTheTruncatedAnglesAtTheDefaultScale) {
    Cordic::Table const expected = {51471, 30385, 16054, 8149, 4090, 2047, 1023, 511, 255, 127, 63,
                                    31,    15,    7,     4,    2,    1,    0,    0,   0,   0,   0,
                                    0,     0,     0,     0,    0,    0,    0,    0,   0,   0};
    EXPECT_EQ(expected, Cordic::CircularTable);
}

TEST(Cordic, HyperbolicTableHoldsTheTruncatedAnglesAtTheDefaultScale) {
    Cordic::Table const expected = {0,  35999, 16738, 8235, 4101, 2048, 1024, 512, 256, 128, 64,
                                    32, 15,    7,     4,    2,    1,    0,    0,   0,   0,   0,
                                    0,  0,     0,     0,    0,    0,    0,    0,   0,   0};
    EXPECT_EQ(expected, Cordic::HyperbolicTable);
}

TEST(Cordic, SevenDigitAnglesTruncateBelowTheirPowerOfTwo) {
    // Intended: 0.0002441406 lies just below 2^-12, so entry 12 is 15 and not 16.
    EXPECT_EQ(15, Cordic::CircularTable[12]);
    EXPECT_EQ(15, Cordic::HyperbolicTable[12]);
    EXPECT_EQ(1, Cordic::CircularTable[16]);
    for (std::size_t i = 17; i < 32; ++i) {
        EXPECT_EQ(0, Cordic::CircularTable[i]) << i;
        EXPECT_EQ(0, Cordic::HyperbolicTable[i]) << i;
    }
}

TEST_F(CordicTest, SetFixedPointRescalesEveryConstantAndTable) {
    Cordic::set_fixed_point(12, 20);
    EXPECT_EQ(12, Cordic::Shift);
    EXPECT_EQ(4096, Cordic::Multiplier);
    EXPECT_EQ(20, Cordic::IterationCount);
    EXPECT_EQ(6745, Cordic::FixedK);
    EXPECT_EQ(2487, Cordic::FixedInvK);
    EXPECT_EQ(3392, Cordic::FixedKp);
    EXPECT_EQ(4945, Cordic::FixedInvKp);
    EXPECT_EQ(4580, Cordic::FixedMaxHyperbolic);
    EXPECT_EQ(-4580, Cordic::FixedMinHyperbolic);
    EXPECT_EQ(1778, Cordic::FixedLog10E);
    EXPECT_EQ(2839, Cordic::FixedLn2);
    EXPECT_EQ(5792, Cordic::FixedRoot2);
    EXPECT_EQ(2896, Cordic::FixedInvRoot2);
    EXPECT_EQ(25735, Cordic::FixedTwoPi);
    EXPECT_EQ(1303, Cordic::FixedOneOverPi);
    EXPECT_EQ(71, Cordic::FixedDegreesToRadians);
    EXPECT_EQ(234683, Cordic::FixedRadiansToDegrees);
    EXPECT_EQ(0, Cordic::FixedEpsilon);
    Cordic::Table const circular = {3216, 1899, 1003, 509, 255, 127, 63, 31, 15, 7, 3,
                                    1,    0,    0,    0,   0,   0,   0,  0,  0,  0, 0,
                                    0,    0,    0,    0,   0,   0,   0,  0,  0,  0};
    Cordic::Table const hyperbolic = {0, 2249, 1046, 514, 256, 128, 64, 32, 16, 8, 4,
                                      2, 0,    0,    0,   0,   0,   0,  0,  0,  0, 0,
                                      0, 0,    0,    0,   0,   0,   0,  0,  0,  0};
    EXPECT_EQ(circular, Cordic::CircularTable);
    EXPECT_EQ(hyperbolic, Cordic::HyperbolicTable);
}

TEST_F(CordicTest, DefaultsRestoreTheStateOfLoad) {
    Cordic::set_fixed_point(12, 20);
    Cordic::set_fixed_point(16, 16);
    EXPECT_EQ(16, Cordic::Shift);
    EXPECT_EQ(65536, Cordic::Multiplier);
    EXPECT_EQ(16, Cordic::IterationCount);
    EXPECT_EQ(107922, Cordic::FixedK);
    EXPECT_EQ(-73280, Cordic::FixedMinHyperbolic);
    EXPECT_EQ(411774, Cordic::FixedTwoPi);
    EXPECT_EQ(51471, Cordic::CircularTable[0]);
    EXPECT_EQ(35999, Cordic::HyperbolicTable[1]);
}

TEST_F(CordicTest, UnusedHyperbolicEntryStaysZeroAtEveryScale) {
    // An open choice: entry 0 is infinity in the source and never read; it is kept 0.
    EXPECT_EQ(0, Cordic::HyperbolicTable[0]);
    Cordic::set_fixed_point(20, 16);
    EXPECT_EQ(0, Cordic::HyperbolicTable[0]);
}

TEST_F(CordicTest, IterationCountIsCappedAtThirtyTwo) {
    Cordic::set_fixed_point(16, 100);
    EXPECT_EQ(32, Cordic::IterationCount);
}

TEST_F(CordicTest, IterationCountHasNoLowerBound) {
    // Intended: no lower bound; no loop runs, so the sine is 0 and the cosine the inverse gain.
    Cordic::set_fixed_point(16, -3);
    EXPECT_EQ(-3, Cordic::IterationCount);
    EXPECT_EQ(0, Cordic::sin(12345));
    EXPECT_EQ(39796, Cordic::cos(12345));
}

TEST_F(CordicTest, MultiplierTakesTheShiftModuloThirtyTwo) {
    // Intended: the shift is not checked, and 1 is shifted by its count modulo 32.
    Cordic::set_fixed_point(33, 16);
    EXPECT_EQ(33, Cordic::Shift);
    EXPECT_EQ(2, Cordic::Multiplier);
    EXPECT_EQ(3, Cordic::FixedK);
    EXPECT_EQ(12, Cordic::FixedTwoPi);
    Cordic::set_fixed_point(32, 16);
    EXPECT_EQ(1, Cordic::Multiplier);
}

TEST_F(CordicTest, ScaleOfFixedPointIsNotKeptInStep) {
    // Intended: the two families keep their own scales.
    Cordic::set_fixed_point(8, 16);
    EXPECT_EQ(256, Cordic::Multiplier);
    EXPECT_EQ(16, FixedPoint::FractionBitCount);
    EXPECT_EQ(65536, FixedPoint(1).value);
}

TEST_F(CordicTest, FinerScaleGivesFinerResults) {
    Cordic::set_fixed_point(24, 24);
    double const one = std::ldexp(1.0, 24);
    int32_t const angle = int32_t(0.5 * one);
    EXPECT_NEAR(std::sin(0.5), double(Cordic::sin(angle)) / one, 4e-6);
    EXPECT_NEAR(std::cos(0.5), double(Cordic::cos(angle)) / one, 4e-6);
    EXPECT_NEAR(std::log(3.0), double(Cordic::log(int32_t(3.0 * one))) / one, 1e-5);
    EXPECT_NEAR(std::sqrt(3.0), double(Cordic::sqrt(int32_t(3.0 * one))) / one, 1e-5);
}

TEST(Cordic, CanonicalFormCopiesNothing) {
    Cordic const first;
    Cordic second(first);
    EXPECT_EQ(&second, &(second = first));
    EXPECT_TRUE(std::has_virtual_destructor<Cordic>::value);
}

TEST(Cordic, SineOfZeroIsNearZeroAndCosineNearOne) {
    EXPECT_EQ(2, Cordic::sin(0));
    EXPECT_EQ(65535, Cordic::cos(0));
    EXPECT_EQ(Cordic::Pair(2, 65535), Cordic::sin_and_cos(0));
}

TEST_F(CordicTest, WithoutIterationsSineIsZeroAndCosineTheInverseGain) {
    Cordic::set_fixed_point(16, 0);
    EXPECT_EQ(Cordic::Pair(0, 39796), Cordic::sin_and_cos(Fixed(1.0)));
}

TEST(Cordic, TangentIsTheTruncatedQuotientOfSineAndCosine) {
    for (double const angle : {-1.3, -0.5, -0.01, 0.0, 0.2, 0.7, 1.3}) {
        int32_t const a = Fixed(angle);
        int64_t const quotient = int64_t(Cordic::sin(a)) * 65536 / Cordic::cos(a);
        EXPECT_EQ(int32_t(quotient), Cordic::tan(a)) << angle;
    }
    EXPECT_EQ(35807, Cordic::tan(32768));
}

TEST(Cordic, SinAndCosSquareUsesTheSineOfTheDoubleAngle) {
    // Intended: (1 - s) / 2 and (1 + s) / 2 with s the sine of the double angle, not its cosine.
    EXPECT_EQ(Cordic::Pair(1, 65535), Cordic::sin_and_cos_square(51471));
    for (double const angle : {-0.8, -0.3, 0.0, 0.1, 0.4, 0.85}) {
        int32_t const a = Fixed(angle);
        int32_t const half = (Cordic::sin(2 * a) + 65536) >> 1;
        EXPECT_EQ(Cordic::Pair(65536 - half, half), Cordic::sin_and_cos_square(a)) << angle;
    }
}

TEST(Cordic, HypotAndAtanGiveTheLengthThenTheAngle) {
    EXPECT_EQ(Cordic::Pair(327673, 42172), Cordic::hypot_and_atan(Fixed(3.0), Fixed(4.0)));
    EXPECT_EQ(327673, Cordic::hypot(Fixed(3.0), Fixed(4.0)));
    EXPECT_EQ(42172, Cordic::atan(Fixed(3.0), Fixed(4.0)));
    EXPECT_EQ(51470, Cordic::atan(65536, 65536));
}

TEST(Cordic, ArcsineOfOneAndArccosineOfMinusOneAreTruncatedProducts) {
    // Intended: 65536 times 1.570796 and 3.141593, truncated, before any iteration.
    EXPECT_EQ(102943, Cordic::asin(65536));
    EXPECT_EQ(205887, Cordic::acos(-65536));
    EXPECT_EQ(-102943, Cordic::asin(-65536));
    EXPECT_EQ(0, Cordic::acos(65536));
}

// The rounding of the shifts in the loops is their arithmetic and is kept: these integers come
// from a plain transcription of the loops with a branch on each decision.
struct Sample {
    double argument;
    int32_t first;
    int32_t second;
};

struct Value {
    double argument;
    int32_t expected;
};

TEST(Cordic, CircularLoopsGiveTheirExactIntegers) {
    for (Sample const& row :
         {Sample{-1.7, -64984, -8449}, Sample{-0.5, -31419, 57510}, Sample{0.3, 19364, 62608},
          Sample{1.0, 55146, 35408}, Sample{1.74, 64594, -11036}}) {
        EXPECT_EQ(Cordic::Pair(row.first, row.second), Cordic::sin_and_cos(Fixed(row.argument)))
            << row.argument;
    }
    EXPECT_EQ(Cordic::Pair(146540, 30382), Cordic::hypot_and_atan(Fixed(1.0), Fixed(2.0)));
    EXPECT_EQ(Cordic::Pair(36636, -72560), Cordic::hypot_and_atan(Fixed(-0.5), Fixed(0.25)));
    EXPECT_EQ(Cordic::Pair(327737, 101630), Cordic::hypot_and_atan(Fixed(5.0), Fixed(0.1)));
    for (Sample const& row :
         {Sample{-0.9, -73127, 176070}, Sample{-0.3, -19929, 122872}, Sample{0.1, 6549, 96394},
          Sample{0.5, 34241, 68702}, Sample{0.95, 81743, 21200}}) {
        EXPECT_EQ(row.first, Cordic::asin(Fixed(row.argument))) << row.argument;
        EXPECT_EQ(row.second, Cordic::acos(Fixed(row.argument))) << row.argument;
    }
}

TEST(Cordic, HyperbolicLoopsGiveTheirExactIntegers) {
    for (Sample const& row : {Sample{-3.0, -656637, 659864}, Sample{-0.7, -49717, 82261},
                              Sample{0.4, 26920, 70850}, Sample{1.1, 87530, 109345},
                              Sample{1.2, 98922, 118664}, Sample{7.5, 59227650, 59223963}}) {
        EXPECT_EQ(Cordic::Pair(row.first, row.second), Cordic::sinh_and_cosh(Fixed(row.argument)))
            << row.argument;
    }
    for (Value const& row :
         {Value{0.21, -102278}, Value{0.22, -99234}, Value{0.5, -45422}, Value{3.0, 72006},
          Value{8.9, 143262}, Value{9.5, 147536}, Value{1000.0, 452700}}) {
        EXPECT_EQ(row.expected, Cordic::log(Fixed(row.argument))) << row.argument;
    }
    for (Value const& row : {Value{0.3, 35891}, Value{0.49, 45868}, Value{1.5, 80258},
                             Value{2.01, 92905}, Value{3.0, 113500}, Value{100.0, 655280}}) {
        EXPECT_EQ(row.expected, Cordic::sqrt(Fixed(row.argument))) << row.argument;
    }
    for (Value const& row :
         {Value{-0.75, -63763}, Value{-0.1, -6575}, Value{0.33, 22469}, Value{0.8, 71999}}) {
        EXPECT_EQ(row.expected, Cordic::atanh(Fixed(row.argument))) << row.argument;
    }
    EXPECT_EQ(-78330, Cordic::asinh(Fixed(-1.5)));
    EXPECT_EQ(31534, Cordic::asinh(Fixed(0.5)));
    EXPECT_EQ(241788, Cordic::asinh(Fixed(20.0)));
    EXPECT_EQ(63078, Cordic::acosh(Fixed(1.5)));
    EXPECT_EQ(241704, Cordic::acosh(Fixed(20.0)));
}

TEST(Cordic, ArcsineTurnsBackwardsWhereYMeetsVExactly) {
    // Intended: the first turn brings y to exactly the inverse gain, which is not below it, so the
    // next turn is backwards on either side, and the two results are not mirror images.
    EXPECT_EQ(42669, Cordic::asin(39796));
    EXPECT_EQ(-45381, Cordic::asin(-39796));
    EXPECT_EQ(60274, Cordic::acos(39796));
    EXPECT_EQ(148324, Cordic::acos(-39796));
}

TEST_F(CordicTest, WithoutIterationsArcsineIsZeroAndArccosineAQuarterTurn) {
    Cordic::set_fixed_point(16, 0);
    EXPECT_EQ(0, Cordic::asin(1000));
    EXPECT_EQ(102943, Cordic::acos(1000));
    EXPECT_EQ(102943, Cordic::asin(65536));  // the ends are answered first
    EXPECT_EQ(205887, Cordic::acos(-65536));
}

TEST_F(CordicTest, ArcsineTurnsTwiceAtStepFour) {
    // Intended: step 4 runs twice. Below one, every turn is forwards, so the result is the sum of
    // the angles that ran.
    Cordic::set_fixed_point(16, 4);
    EXPECT_EQ(51471 + 30385 + 16054 + 8149, Cordic::asin(65535));
    Cordic::set_fixed_point(16, 5);
    EXPECT_EQ(51471 + 30385 + 16054 + 8149 + 4090 + 4090, Cordic::asin(65535));
}

TEST_F(CordicTest, HyperbolicVectoringTurnsTwiceAtStepsFourAndThirteen) {
    // Intended: steps 4 and 13 run twice. Near the bound every turn is forwards, so the result
    // is the sum of the angles that ran.
    Cordic::set_fixed_point(16, 4);
    EXPECT_EQ(35999 + 16738 + 8235, Cordic::atanh(52428));
    Cordic::set_fixed_point(16, 5);
    EXPECT_EQ(35999 + 16738 + 8235 + 4101 + 4101, Cordic::atanh(52428));
    int32_t const through_twelve =
        35999 + 16738 + 8235 + 2 * 4101 + 2048 + 1024 + 512 + 256 + 128 + 64 + 32 + 15;
    Cordic::set_fixed_point(16, 13);
    EXPECT_EQ(through_twelve, Cordic::atanh(52900));
    Cordic::set_fixed_point(16, 14);
    EXPECT_EQ(through_twelve + 7 + 7, Cordic::atanh(52900));
}

TEST(Cordic, HyperbolicPairGivesSineThenCosine) {
    EXPECT_EQ(Cordic::Pair(237689, 246557), Cordic::sinh_and_cosh(Fixed(2.0)));
    EXPECT_EQ(237689, Cordic::sinh(Fixed(2.0)));
    EXPECT_EQ(246557, Cordic::cosh(Fixed(2.0)));
}

TEST(Cordic, TanhAndExpComeFromTheHyperbolicPair) {
    for (double const v : {-3.0, -0.5, 0.0, 0.25, 1.0, 4.0}) {
        Cordic::Pair const pair = Cordic::sinh_and_cosh(Fixed(v));
        EXPECT_EQ(int32_t(int64_t(pair.first) * 65536 / pair.second), Cordic::tanh(Fixed(v))) << v;
        EXPECT_EQ(pair.first + pair.second, Cordic::exp(Fixed(v))) << v;
    }
}

TEST(Cordic, ExpWrapsPastThirtyTwoBits) {
    // Intended: no guard; cosh and sinh of 10.5 each fit, their sum does not.
    Cordic::Pair const pair = Cordic::sinh_and_cosh(Fixed(10.5));
    EXPECT_EQ(Cordic::Pair(1190855155, 1190885512), pair);
    EXPECT_EQ(-1913226629, Cordic::exp(Fixed(10.5)));
}

TEST(Cordic, SqrtOfOneIsTheRawUnit) {
    // Intended: exactly one gives one unit of the last place, not 65536; its neighbours do not.
    EXPECT_EQ(1, Cordic::sqrt(65536));
    EXPECT_EQ(65531, Cordic::sqrt(65535));
    EXPECT_EQ(65534, Cordic::sqrt(65537));
}

TEST(Cordic, SqrtOfFourIsNearTwo) {
    EXPECT_EQ(131068, Cordic::sqrt(4 * 65536));
}

TEST(Cordic, SqrtBelowOneUnitIsZero) {
    EXPECT_EQ(0, Cordic::sqrt(0));
    EXPECT_EQ(0, Cordic::sqrt(-1));
    EXPECT_EQ(0, Cordic::sqrt(std::numeric_limits<int32_t>::min()));
}

TEST(Cordic, LogOfZeroAndOfNegativesIsZero) {
    EXPECT_EQ(0, Cordic::log(0));
    EXPECT_EQ(0, Cordic::log(-1));
    EXPECT_EQ(0, Cordic::log(std::numeric_limits<int32_t>::min()));
    EXPECT_EQ(0, Cordic::log10(0));
}

TEST(Cordic, LogOfOneIsNearZero) {
    EXPECT_EQ(-2, Cordic::log(65536));
}

TEST_F(CordicTest, WithFewerThanTwoIterationsLogCountsOnlyPowersOfTwo) {
    Cordic::set_fixed_point(16, 1);
    EXPECT_EQ(0, Cordic::log(4 * 65536));
    EXPECT_EQ(2 * 45426, Cordic::log(32 * 65536));
    EXPECT_EQ(-3 * 45426, Cordic::log(65536 / 32));
    EXPECT_EQ(0, Cordic::atanh(1000));
}

TEST(Cordic, Log10IsTheScaledProductOfLog) {
    for (int32_t const v : {1, 1000, 65536, 655360, 100000000}) {
        EXPECT_EQ(int32_t((int64_t(28461) * Cordic::log(v)) >> 16), Cordic::log10(v)) << v;
    }
    EXPECT_EQ(65536, Cordic::log10(Fixed(10.0)));
}

TEST(Cordic, AsinhOfZeroIsZero) {
    EXPECT_EQ(0, Cordic::asinh(0));
}

TEST(Cordic, AsinhOfATinyValueTakesTheRawUnitRoot) {
    // Intended: below 256 units the square vanishes, and the root of exactly one is one unit.
    EXPECT_EQ(Cordic::log(101), Cordic::asinh(100));
    EXPECT_EQ(-424366, Cordic::asinh(100));
}

TEST(Cordic, AcoshOfOneIsTheLogOfOne) {
    EXPECT_EQ(Cordic::log(65536), Cordic::acosh(65536));
}

TEST(Cordic, NormaliseAngleTakesWholeTurns) {
    EXPECT_EQ(0, Cordic::normalise_angle(0));
    EXPECT_EQ(0, Cordic::normalise_angle(Cordic::FixedTwoPi));
    EXPECT_EQ(176452, Cordic::normalise_angle(1000000));
    EXPECT_EQ(-176452, Cordic::normalise_angle(-1000000));
}

TEST(Cordic, NormaliseAngleMapsPiToMinusPi) {
    EXPECT_EQ(-205887, Cordic::normalise_angle(205887));
    EXPECT_EQ(-205887, Cordic::normalise_angle(-205887));
}

TEST(Cordic, NormaliseAngleKeepsASumJustBelowZeroAtNoTurn) {
    // Intended: the quotient truncates towards zero before its fraction is cleared, so a sum
    // within one turn's 65536th below zero takes no turn and stays just below -pi.
    EXPECT_EQ(-205888, Cordic::normalise_angle(-205888));
    EXPECT_EQ(-205893, Cordic::normalise_angle(-205893));
    EXPECT_EQ(205880, Cordic::normalise_angle(-205894));
}

TEST_F(CordicTest, NormaliseAngleTurnsByTwoPiWithItsLowestBitCleared) {
    // At 12 fraction bits two pi is the odd 25735, and a turn is 25734.
    Cordic::set_fixed_point(12, 16);
    EXPECT_EQ(25735, Cordic::FixedTwoPi);
    EXPECT_EQ(-2936, Cordic::normalise_angle(100000));
    EXPECT_EQ(2936, Cordic::normalise_angle(-100000));
    EXPECT_EQ(1, Cordic::normalise_angle(25735));
}

TEST(Cordic, DegreeConversionsAreScaledProductsOfTruncatedConstants) {
    // Intended: 1143 is the truncated constant, so half a turn comes out short of 205887.
    EXPECT_EQ(205740, Cordic::degrees_to_radians(Fixed(180.0)));
    EXPECT_EQ(11796455, Cordic::radians_to_degrees(205887));
    for (int32_t const v : {-5898240, -1, 0, 1, 65536, 12345678}) {
        EXPECT_EQ(int32_t((int64_t(1143) * v) >> 16), Cordic::degrees_to_radians(v)) << v;
        EXPECT_EQ(int32_t((int64_t(3754936) * v) >> 16), Cordic::radians_to_degrees(v)) << v;
    }
    EXPECT_NEAR(PI / 2, Real(Cordic::degrees_to_radians(Fixed(90.0))), DEGREES_TOLERANCE * PI / 2);
    EXPECT_NEAR(90.0, Real(Cordic::radians_to_degrees(Fixed(PI / 2))), DEGREES_TOLERANCE * 90.0);
}

// Grids against the double-precision functions, inside each iteration's range of convergence.

class CordicRotationTest : public ::testing::TestWithParam<double> {};

TEST_P(CordicRotationTest, SineAndCosineStayNearTheReference) {
    int32_t const angle = Fixed(GetParam());
    Cordic::Pair const pair = Cordic::sin_and_cos(angle);
    EXPECT_NEAR(std::sin(Real(angle)), Real(pair.first), SINE_TOLERANCE);
    EXPECT_NEAR(std::cos(Real(angle)), Real(pair.second), SINE_TOLERANCE);
    EXPECT_EQ(pair.first, Cordic::sin(angle));
    EXPECT_EQ(pair.second, Cordic::cos(angle));
}

TEST_P(CordicRotationTest, TangentStaysNearTheReference) {
    double const angle = AsSeen(GetParam() * 0.75);  // away from the poles
    double const expected = std::tan(angle);
    EXPECT_NEAR(expected, Real(Cordic::tan(Fixed(angle))),
                TANGENT_TOLERANCE * std::fmax(1.0, std::fabs(expected)));
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicRotationTest, ::testing::Range(-1.74, 1.75, 0.04));

class CordicVectoringTest : public ::testing::TestWithParam<std::tuple<double, double>> {};

TEST_P(CordicVectoringTest, LengthAndAngleStayNearTheReference) {
    double const y = AsSeen(std::get<0>(GetParam()));
    double const x = AsSeen(std::get<1>(GetParam()));
    Cordic::Pair const pair = Cordic::hypot_and_atan(Fixed(y), Fixed(x));
    EXPECT_NEAR(std::hypot(y, x), Real(pair.first), HYPOT_TOLERANCE * std::hypot(y, x));
    EXPECT_NEAR(std::atan2(y, x), Real(pair.second), ARCTANGENT_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicVectoringTest,
                         ::testing::Combine(::testing::Values(-4.0, -1.3, -0.2, 0.0, 0.05, 0.7, 2.5,
                                                              4.0),
                                            ::testing::Values(0.1, 0.5, 1.0, 2.2, 4.0)));

class CordicArcsineTest : public ::testing::TestWithParam<double> {};

TEST_P(CordicArcsineTest, ArcsineAndArccosineStayNearTheReference) {
    double const v = AsSeen(GetParam());
    double const tolerance = std::fabs(v) <= 0.55 ? ARCSINE_TOLERANCE : ARCSINE_WIDE_TOLERANCE;
    EXPECT_NEAR(std::asin(v), Real(Cordic::asin(Fixed(v))), tolerance);
    EXPECT_NEAR(std::acos(v), Real(Cordic::acos(Fixed(v))), tolerance);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicArcsineTest, ::testing::Range(-0.99, 1.0, 0.03));

class CordicHyperbolicTest : public ::testing::TestWithParam<double> {};

TEST_P(CordicHyperbolicTest, HyperbolicFunctionsStayNearTheReference) {
    double const v = AsSeen(GetParam());
    double const scale = std::cosh(v);
    Cordic::Pair const pair = Cordic::sinh_and_cosh(Fixed(v));
    EXPECT_NEAR(std::sinh(v), Real(pair.first), HYPERBOLIC_TOLERANCE * scale);
    EXPECT_NEAR(std::cosh(v), Real(pair.second), HYPERBOLIC_TOLERANCE * scale);
    // For a negative argument exp is a difference of two large parts: its error is theirs.
    EXPECT_NEAR(std::exp(v), Real(Cordic::exp(Fixed(v))), HYPERBOLIC_TOLERANCE * scale);
    EXPECT_NEAR(std::tanh(v), Real(Cordic::tanh(Fixed(v))), TANH_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicHyperbolicTest, ::testing::Range(-5.0, 5.01, 0.25));

class CordicAtanhTest : public ::testing::TestWithParam<double> {};

TEST_P(CordicAtanhTest, StaysNearTheReference) {
    double const v = AsSeen(GetParam());
    EXPECT_NEAR(std::atanh(v), Real(Cordic::atanh(Fixed(v))), ATANH_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicAtanhTest, ::testing::Range(-0.8, 0.81, 0.05));

// Magnitudes from 2^-6 to 2^14, avoiding exactly one.
class CordicLogarithmTest : public ::testing::TestWithParam<std::tuple<int, double>> {};

TEST_P(CordicLogarithmTest, LogAndRootStayNearTheReference) {
    double const v = AsSeen(std::ldexp(std::get<1>(GetParam()), std::get<0>(GetParam())));
    EXPECT_NEAR(std::log(v), Real(Cordic::log(Fixed(v))), LOG_TOLERANCE);
    EXPECT_NEAR(std::log10(v), Real(Cordic::log10(Fixed(v))), LOG10_TOLERANCE);
    EXPECT_NEAR(std::sqrt(v), Real(Cordic::sqrt(Fixed(v))), SQRT_TOLERANCE * std::sqrt(v));
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicLogarithmTest,
                         ::testing::Combine(::testing::Range(-6, 15),
                                            ::testing::Values(1.25, 1.5, 1.75)));

class CordicInverseHyperbolicTest : public ::testing::TestWithParam<double> {};

// Down to -2 only: below, v + sqrt(v^2 + 1) loses its digits to cancellation.
TEST_P(CordicInverseHyperbolicTest, AsinhStaysNearTheReference) {
    double const v = AsSeen(GetParam());
    EXPECT_NEAR(std::asinh(v), Real(Cordic::asinh(Fixed(v))), INVERSE_HYPERBOLIC_TOLERANCE);
}

TEST_P(CordicInverseHyperbolicTest, AcoshStaysNearTheReference) {
    double const v = AsSeen(std::fabs(GetParam()) + 1.01);
    EXPECT_NEAR(std::acosh(v), Real(Cordic::acosh(Fixed(v))), INVERSE_HYPERBOLIC_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicInverseHyperbolicTest,
                         ::testing::Values(-2.0, -1.5, -1.0, -0.5, -0.25, -0.1, -0.01, 0.01, 0.1,
                                           0.25, 0.5, 1.0, 2.0, 5.0, 10.0, 30.0, 100.0));

class CordicNormaliseAngleTest : public ::testing::TestWithParam<double> {};

TEST_P(CordicNormaliseAngleTest, LandsInOneTurnAndDiffersByWholeTurns) {
    double const angle = AsSeen(GetParam());
    double const result = Real(Cordic::normalise_angle(Fixed(angle)));
    EXPECT_LT(result, PI);
    EXPECT_GE(result, -PI - NORMALISE_TOLERANCE);
    EXPECT_NEAR(0.0, std::remainder(result - angle, 2.0 * PI), NORMALISE_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(Cordic, CordicNormaliseAngleTest, ::testing::Range(-20.0, 20.0, 0.37));

}  // namespace
}  // namespace quorvel::vexmap
