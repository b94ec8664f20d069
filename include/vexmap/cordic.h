#pragma once

#include <array>
#include <cstdint>
#include <limits>
#include <utility>

namespace quorvel::vexmap {

/// Elementary functions on 32-bit fixed-point numbers by CORDIC: shifts, adds and two small
/// tables, with no multiply and no branch on a sign inside the iterations. Values and angles
/// (radians) are integers at the class-wide scale of `Shift`, which is its own and not that of
/// `FixedPoint`. No data per object; the class-wide state is valid from load and written only by
/// set_fixed_point, with no lock, so that call belongs before any other thread uses the class.
/// Every other operation only reads it, from any thread. Nothing in the engine calls this family.
class Cordic {
public:
    static constexpr int MaxAccuracy = 32;
    static constexpr int DefaultAccuracy = 16;
    static constexpr int DefaultShift = 16;
    static constexpr double K = 1.6467602581210656;  // circular gain
    static constexpr double InvK = 0.6072529350088812;
    static constexpr double Kp = 0.8281593609602156;  // hyperbolic gain, with its repeated steps
    static constexpr double InvKp = 1.207497067763072;
    // The sum of the hyperbolic angles: beyond it the hyperbolic iteration cannot converge.
    static constexpr double MaxHyperbolic = 1.1181730155265037;
    static constexpr double Log10E = 0.434294481903252;
    static constexpr double Ln2 = 0.693147180559945;
    static constexpr double Root2 = 1.414213562373095;
    static constexpr double InvRoot2 = 0.707106781186547;

    using Table = std::array<int32_t, MaxAccuracy>;
    using Pair = std::pair<int32_t, int32_t>;  // in the order each operation names its two results

    /// atan(2^-i) and atanh(2^-i), to seven significant digits; that precision is part of the
    /// values, as the scaled tables show. Entry 0 of the hyperbolic one is never read.
    static constexpr std::array<double, MaxAccuracy> CordicCircular = {
        0.7853982,    0.4636476,    0.2449787,    0.124355,     0.06241881,   0.03123983,
        0.01562373,   0.007812341,  0.00390623,   0.001953123,  0.0009765622, 0.0004882812,
        0.0002441406, 0.0001220703, 6.103516e-05, 3.051758e-05, 1.525879e-05, 7.629395e-06,
        3.814697e-06, 1.907349e-06, 9.536743e-07, 4.768372e-07, 2.384186e-07, 1.192093e-07,
        5.960464e-08, 2.980232e-08, 1.490116e-08, 7.450581e-09, 3.72529e-09,  1.862645e-09,
        9.313226e-10, 4.656613e-10};
    static constexpr std::array<double, MaxAccuracy> CordicHyperbolic = {
        std::numeric_limits<double>::infinity(),  // atanh 1
        0.5493061,
        0.2554128,
        0.1256572,
        0.06258157,
        0.03126018,
        0.01562627,
        0.007812659,
        0.00390627,
        0.001953127,
        0.0009765628,
        0.0004882813,
        0.0002441406,
        0.0001220703,
        6.103516e-05,
        3.051758e-05,
        1.525879e-05,
        7.629395e-06,
        3.814697e-06,
        1.907349e-06,
        9.536743e-07,
        4.768372e-07,
        2.384186e-07,
        1.192093e-07,
        5.960464e-08,
        2.980232e-08,
        1.490116e-08,
        7.450581e-09,
        3.72529e-09,
        1.862645e-09,
        9.313226e-10,
        4.656613e-10};

    // Class-wide state, at the scale of `Shift`; set_fixed_point is its one writer.
    static int Shift;           // fraction bits
    static int32_t Multiplier;  // one
    static int IterationCount;  // of every loop
    static int32_t FixedK;
    static int32_t FixedInvK;
    static int32_t FixedKp;
    static int32_t FixedInvKp;
    static int32_t FixedMaxHyperbolic;
    static int32_t FixedMinHyperbolic;
    static int32_t FixedLog10E;
    static int32_t FixedLn2;
    static int32_t FixedRoot2;
    static int32_t FixedInvRoot2;
    static int32_t FixedTwoPi;
    static int32_t FixedOneOverPi;
    static int32_t FixedDegreesToRadians;
    static int32_t FixedRadiansToDegrees;
    static int32_t FixedEpsilon;
    static Table CircularTable;    // CordicCircular at this scale
    static Table HyperbolicTable;  // CordicHyperbolic at this scale
    // The tables are constant-initialised, so they hold their values before any initialiser of
    // any file runs; these flags record that they were filled at load.
    static bool const CircularTableInitialiser;
    static bool const HyperbolicTableInitialiser;

    Cordic();
    Cordic(Cordic const& other);
    Cordic& operator=(Cordic const& other);  // there is nothing to copy
    virtual ~Cordic();

    /// Fraction bits and iteration count, which is capped at MaxAccuracy and has no lower bound;
    /// `shift` is not checked.
    static void set_fixed_point(int shift, int accuracy);

    // Circular rotation: the angle must lie within about +-1.74 rad, nothing reduces it.
    static Pair sin_and_cos(int32_t angle);  // sine, cosine
    /// (1 - s) / 2 and (1 + s) / 2 with s the sine of twice the angle, not its cosine, so not the
    /// squares of the sine and cosine of the angle; that is what the routine gives.
    static Pair sin_and_cos_square(int32_t angle);
    static int32_t sin(int32_t angle);
    static int32_t cos(int32_t angle);
    static int32_t tan(int32_t angle);  // a cosine of 0 divides by zero

    // Circular vectoring of (x, y): x should not be negative.
    static Pair hypot_and_atan(int32_t y, int32_t x);  // length, angle
    static int32_t hypot(int32_t y, int32_t x);
    static int32_t atan(int32_t y, int32_t x);

    static int32_t asin(int32_t v);
    static int32_t acos(int32_t v);

    // Hyperbolic rotation; a large argument is halved first and the result doubled back.
    static Pair sinh_and_cosh(int32_t v);  // hyperbolic sine, hyperbolic cosine
    static int32_t sinh(int32_t v);
    static int32_t cosh(int32_t v);
    static int32_t tanh(int32_t v);
    static int32_t exp(int32_t v);

    static int32_t asinh(int32_t v);
    static int32_t acosh(int32_t v);
    static int32_t atanh(int32_t v);  // |v| below about 0.8
    static int32_t log(int32_t v);    // 0 for v below one unit
    static int32_t log10(int32_t v);
    /// 0 for v below one unit; and for v of exactly one, the raw value 1, one unit of the last
    /// place, not `Multiplier`.
    static int32_t sqrt(int32_t v);

    /// Into [-pi, pi) by whole turns of FixedTwoPi with its lowest bit cleared.
    static int32_t normalise_angle(int32_t angle);
    static int32_t degrees_to_radians(int32_t v);
    static int32_t radians_to_degrees(int32_t v);
};

}  // namespace quorvel::vexmap
