#include "vexmap/cordic.h"

#include <cstddef>

#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr int32_t LOAD_MULTIPLIER = 65536;  // one, at the default shift

// Towards zero, as every conversion into fixed point here. Out of range or NaN, where the language
// leaves the conversion undefined, gives what the processor gives: the lowest integer.
constexpr int32_t Truncated(double x) {
    return x > -2147483649.0 && x < 2147483648.0 ? int32_t(x) : std::numeric_limits<int32_t>::min();
}

constexpr int32_t FromDouble(double x, int32_t multiplier) {
    return Truncated(x * double(multiplier));
}

// The product stays in single precision, as the float constants are.
constexpr int32_t FromFloat(float x, int32_t multiplier) {
    return Truncated(double(x * float(multiplier)));
}

constexpr Cordic::Table Scaled(std::array<double, Cordic::MaxAccuracy> const& angles,
                               int32_t multiplier) {
    Cordic::Table table{};
    for (std::size_t i = 0; i < table.size(); ++i) {
        // Entry 0 of the hyperbolic angles is infinity and never read: 0 at every scale, as at
        // load, rather than a conversion of infinity.
        table[i] = angles[i] < std::numeric_limits<double>::infinity()
                       ? FromDouble(angles[i], multiplier)
                       : 0;
    }
    return table;
}

// 32-bit sums and doubles wrap, in unsigned so that the wrap is defined.
int32_t Sum(int32_t a, int32_t b) {
    return int32_t(uint32_t(a) + uint32_t(b));
}

int32_t Difference(int32_t a, int32_t b) {
    return int32_t(uint32_t(a) - uint32_t(b));
}

int32_t Twice(int32_t a) {
    return int32_t(uint32_t(a) << 1);
}

int32_t Product(int32_t a, int32_t b) {
    return int32_t(uint32_t(a) * uint32_t(b));
}

// All ones where v is negative, zero otherwise.
int32_t SignMask(int32_t v) {
    return v >> 31;
}

// a + t where d is all ones and a - t where d is zero, with no jump: t ^ d is -t - 1 or t.
int32_t AddWhereSet(int32_t a, int32_t t, int32_t d) {
    return int32_t(uint32_t(a) + uint32_t(d) - (uint32_t(t) ^ uint32_t(d)));
}

// The mirror: a - t where d is all ones and a + t where d is zero.
int32_t SubtractWhereSet(int32_t a, int32_t t, int32_t d) {
    return int32_t(uint32_t(a) - uint32_t(d) + (uint32_t(t) ^ uint32_t(d)));
}

// (a * b) >> shift in 64 bits; the top word is dropped.
int32_t ScaledProduct(int32_t a, int32_t b, int shift) {
    return int32_t((int64_t(a) * int64_t(b)) >> shift);
}

// (a << shift) / b in 64 bits, truncating; the shift goes through unsigned, a may be negative.
int32_t ScaledQuotient(int32_t a, int32_t b, int shift) {
    return int32_t(int64_t(uint64_t(int64_t(a)) << shift) / b);
}

int32_t CircularAngle(int i) {
    return Cordic::CircularTable[std::size_t(i)];
}

int32_t HyperbolicAngle(int i) {
    return Cordic::HyperbolicTable[std::size_t(i)];
}

// Runs step(i) for i from `first` up to `count`; the steps 4, 13, 40 (each three times the last
// plus one) run twice, deciding afresh, as the hyperbolic iteration needs to converge.
template <typename Step>
void Iterate(int first, int count, Step const& step) {
    int repeat = 4;
    for (int i = first; i < count; ++i) {
        step(i);
        if (i == repeat) {
            repeat = 3 * repeat + 1;
            step(i);
        }
    }
}

// Turns (InvK, 0) through the angle: sine, cosine.
Cordic::Pair RotateCircular(int32_t angle) {
    int32_t x = Cordic::FixedInvK;
    int32_t y = 0;
    int32_t z = angle;
    for (int i = 0; i < Cordic::IterationCount; ++i) {
        int32_t const d = SignMask(z);
        int32_t const dx = y >> i;
        int32_t const dy = x >> i;
        x = AddWhereSet(x, dx, d);
        y = SubtractWhereSet(y, dy, d);
        z = AddWhereSet(z, CircularAngle(i), d);
    }
    return {y, x};
}

// Turns (x, y) onto the x axis: length, angle.
Cordic::Pair VectorCircular(int32_t y, int32_t x) {
    int32_t z = 0;
    for (int i = 0; i < Cordic::IterationCount; ++i) {
        int32_t const d = SignMask(y);
        int32_t const dx = y >> i;
        int32_t const dy = x >> i;
        x = SubtractWhereSet(x, dx, d);
        y = AddWhereSet(y, dy, d);
        z = SubtractWhereSet(z, CircularAngle(i), d);
    }
    return {ScaledProduct(x, Cordic::FixedInvK, Cordic::Shift), z};
}

// Turns (InvK, 0) until its y reaches v; the angle turned is minus the arcsine.
int32_t ArcSineAngle(int32_t v) {
    int32_t x = Cordic::FixedInvK;
    int32_t y = 0;
    int32_t z = 0;
    Iterate(0, Cordic::IterationCount, [&](int i) {
        int32_t const d = -int32_t(y < v);
        int32_t const dx = y >> i;
        int32_t const dy = x >> i;
        x = SubtractWhereSet(x, dx, d);
        y = AddWhereSet(y, dy, d);
        z = SubtractWhereSet(z, CircularAngle(i), d);
    });
    return z;
}

// Hyperbolic sine and cosine. The argument is halved into the range of convergence, and each
// halving undone by sinh 2a = 2 sinh a cosh a and cosh 2a = 2 cosh^2 a - 1.
Cordic::Pair RotateHyperbolic(int32_t a) {
    int halvings = 0;
    while (a > Cordic::FixedMaxHyperbolic) {
        a >>= 1;
        ++halvings;
    }
    while (a < Cordic::FixedMinHyperbolic) {
        a >>= 1;
        ++halvings;
    }
    int32_t x = Cordic::FixedInvKp;
    int32_t y = 0;
    int32_t z = a;
    Iterate(1, Cordic::IterationCount, [&](int i) {
        int32_t const d = SignMask(z);
        int32_t const dx = y >> i;
        int32_t const dy = x >> i;
        x = SubtractWhereSet(x, dx, d);
        y = SubtractWhereSet(y, dy, d);
        z = AddWhereSet(z, HyperbolicAngle(i), d);
    });
    for (; halvings > 0; --halvings) {
        int64_t const old_x = x;
        y = int32_t((int64_t(y) * old_x) >> (Cordic::Shift - 1));
        x = int32_t(((old_x * old_x) >> (Cordic::Shift - 1)) - Cordic::Multiplier);
    }
    return {y, x};
}

// Turns (x, y) onto the x axis hyperbolically: x ends as Kp sqrt(x^2 - y^2), z as atanh(y / x).
Cordic::Pair VectorHyperbolic(int32_t x, int32_t y) {
    int32_t z = 0;
    Iterate(1, Cordic::IterationCount, [&](int i) {
        int32_t const d = SignMask(y);
        int32_t const dx = y >> i;
        int32_t const dy = x >> i;
        x = AddWhereSet(x, dx, d);
        y = AddWhereSet(y, dy, d);
        z = SubtractWhereSet(z, HyperbolicAngle(i), d);
    });
    return {x, z};
}

// (v * v) >> Shift, the 64-bit square shifted logically.
int32_t ScaledSquare(int32_t v) {
    return int32_t(uint64_t(int64_t(v) * int64_t(v)) >> Cordic::Shift);
}

}  // namespace

// Constant-initialised: valid before any dynamic initialiser of any file runs, and equal to what
// set_fixed_point(16, 16) gives.
int Cordic::Shift = DefaultShift;
int32_t Cordic::Multiplier = LOAD_MULTIPLIER;
int Cordic::IterationCount = DefaultAccuracy;
int32_t Cordic::FixedK = FromDouble(K, LOAD_MULTIPLIER);
int32_t Cordic::FixedInvK = FromDouble(InvK, LOAD_MULTIPLIER);
int32_t Cordic::FixedKp = FromDouble(Kp, LOAD_MULTIPLIER);
int32_t Cordic::FixedInvKp = FromDouble(InvKp, LOAD_MULTIPLIER);
int32_t Cordic::FixedMaxHyperbolic = FromDouble(MaxHyperbolic, LOAD_MULTIPLIER);
int32_t Cordic::FixedMinHyperbolic = FromDouble(-MaxHyperbolic, LOAD_MULTIPLIER);
int32_t Cordic::FixedLog10E = FromDouble(Log10E, LOAD_MULTIPLIER);
int32_t Cordic::FixedLn2 = FromDouble(Ln2, LOAD_MULTIPLIER);
int32_t Cordic::FixedRoot2 = FromDouble(Root2, LOAD_MULTIPLIER);
int32_t Cordic::FixedInvRoot2 = FromDouble(InvRoot2, LOAD_MULTIPLIER);
int32_t Cordic::FixedTwoPi = FromFloat(Trigonometry::TWO_PI, LOAD_MULTIPLIER);
int32_t Cordic::FixedOneOverPi = FromFloat(Trigonometry::ONE_OVER_PI, LOAD_MULTIPLIER);
int32_t Cordic::FixedDegreesToRadians =
    FromFloat(Trigonometry::DEGREES_TO_RADIANS, LOAD_MULTIPLIER);
int32_t Cordic::FixedRadiansToDegrees =
    FromFloat(Trigonometry::RADIANS_TO_DEGREES, LOAD_MULTIPLIER);
int32_t Cordic::FixedEpsilon = FromFloat(Trigonometry::EPSILON, LOAD_MULTIPLIER);
Cordic::Table Cordic::CircularTable = Scaled(CordicCircular, LOAD_MULTIPLIER);
Cordic::Table Cordic::HyperbolicTable = Scaled(CordicHyperbolic, LOAD_MULTIPLIER);
bool const Cordic::CircularTableInitialiser = true;
bool const Cordic::HyperbolicTableInitialiser = true;

Cordic::Cordic() = default;

Cordic::Cordic(Cordic const&) = default;

Cordic& Cordic::operator=(Cordic const&) {
    return *this;
}

Cordic::~Cordic() = default;

void Cordic::set_fixed_point(int shift, int accuracy) {
    Shift = shift;
    // The count of a 32-bit shift is taken modulo 32, as the processor takes it.
    Multiplier = int32_t(1u << (uint32_t(shift) & 31u));
    IterationCount = accuracy > MaxAccuracy ? MaxAccuracy : accuracy;
    FixedK = FromDouble(K, Multiplier);
    FixedInvK = FromDouble(InvK, Multiplier);
    FixedKp = FromDouble(Kp, Multiplier);
    FixedInvKp = FromDouble(InvKp, Multiplier);
    FixedMaxHyperbolic = FromDouble(MaxHyperbolic, Multiplier);
    FixedMinHyperbolic = FromDouble(-MaxHyperbolic, Multiplier);
    FixedLog10E = FromDouble(Log10E, Multiplier);
    FixedLn2 = FromDouble(Ln2, Multiplier);
    FixedRoot2 = FromDouble(Root2, Multiplier);
    FixedInvRoot2 = FromDouble(InvRoot2, Multiplier);
    FixedTwoPi = FromFloat(Trigonometry::TWO_PI, Multiplier);
    FixedOneOverPi = FromFloat(Trigonometry::ONE_OVER_PI, Multiplier);
    FixedDegreesToRadians = FromFloat(Trigonometry::DEGREES_TO_RADIANS, Multiplier);
    FixedRadiansToDegrees = FromFloat(Trigonometry::RADIANS_TO_DEGREES, Multiplier);
    FixedEpsilon = FromFloat(Trigonometry::EPSILON, Multiplier);
    CircularTable = Scaled(CordicCircular, Multiplier);
    HyperbolicTable = Scaled(CordicHyperbolic, Multiplier);
}

Cordic::Pair Cordic::sin_and_cos(int32_t angle) {
    return RotateCircular(angle);
}

// The sine of the double angle, not its cosine, is what the routine halves; it stays so.
Cordic::Pair Cordic::sin_and_cos_square(int32_t angle) {
    int32_t const half = Sum(RotateCircular(Twice(angle)).first, Multiplier) >> 1;
    return {Difference(Multiplier, half), half};
}

int32_t Cordic::sin(int32_t angle) {
    return RotateCircular(angle).first;
}

int32_t Cordic::cos(int32_t angle) {
    return RotateCircular(angle).second;
}

int32_t Cordic::tan(int32_t angle) {
    Pair const sine_and_cosine = RotateCircular(angle);
    return ScaledQuotient(sine_and_cosine.first, sine_and_cosine.second, Shift);
}

Cordic::Pair Cordic::hypot_and_atan(int32_t y, int32_t x) {
    return VectorCircular(y, x);
}

int32_t Cordic::hypot(int32_t y, int32_t x) {
    return VectorCircular(y, x).first;
}

int32_t Cordic::atan(int32_t y, int32_t x) {
    return VectorCircular(y, x).second;
}

// The ends are the truncated products of the constants, checked before the iteration count.
int32_t Cordic::asin(int32_t v) {
    if (v == Difference(0, Multiplier)) {
        return FromDouble(-1.570796, Multiplier);
    }
    if (v == Multiplier) {
        return FromDouble(1.570796, v);
    }
    if (IterationCount < 1) {
        return 0;
    }
    return Difference(0, ArcSineAngle(v));
}

int32_t Cordic::acos(int32_t v) {
    if (v == Difference(0, Multiplier)) {
        return FromDouble(3.141593, Multiplier);
    }
    if (v == Multiplier) {
        return 0;
    }
    if (IterationCount < 1) {
        return FixedTwoPi >> 2;
    }
    return Sum(FixedTwoPi >> 2, ArcSineAngle(v));
}

Cordic::Pair Cordic::sinh_and_cosh(int32_t v) {
    return RotateHyperbolic(v);
}

int32_t Cordic::sinh(int32_t v) {
    return RotateHyperbolic(v).first;
}

int32_t Cordic::cosh(int32_t v) {
    return RotateHyperbolic(v).second;
}

int32_t Cordic::tanh(int32_t v) {
    Pair const sine_and_cosine = RotateHyperbolic(v);
    return ScaledQuotient(sine_and_cosine.first, sine_and_cosine.second, Shift);
}

int32_t Cordic::exp(int32_t v) {
    Pair const sine_and_cosine = RotateHyperbolic(v);
    return Sum(sine_and_cosine.second, sine_and_cosine.first);
}

int32_t Cordic::asinh(int32_t v) {
    if (v == 0) {
        return 0;
    }
    return log(Sum(v, sqrt(Sum(ScaledSquare(v), Multiplier))));
}

int32_t Cordic::acosh(int32_t v) {
    return log(Sum(v, sqrt(Difference(ScaledSquare(v), Multiplier))));
}

int32_t Cordic::atanh(int32_t v) {
    if (IterationCount < 2) {
        return 0;
    }
    return VectorHyperbolic(Multiplier, v).second;
}

// ln v = 2 atanh((v - 1) / (v + 1)), after v is brought by powers of two into [0.2, 9], where
// that vectoring converges.
int32_t Cordic::log(int32_t v) {
    if (v < 1) {
        return 0;
    }
    int32_t exponent = 0;
    while (v < Multiplier / 5) {
        v = Twice(v);
        --exponent;
    }
    while (v > Product(9, Multiplier)) {
        v >>= 1;
        ++exponent;
    }
    int32_t const powers_of_two = Product(exponent, FixedLn2);
    if (IterationCount < 2) {
        return powers_of_two;
    }
    int32_t const angle = VectorHyperbolic(Sum(v, Multiplier), Difference(v, Multiplier)).second;
    return Sum(Twice(angle), powers_of_two);
}

int32_t Cordic::log10(int32_t v) {
    return ScaledProduct(FixedLog10E, log(v), Shift);
}

// sqrt v = sqrt((v + 1/4)^2 - (v - 1/4)^2), after v is brought by powers of two into [0.5, 2]
// with a root of two per step into the gain. The gain products are 64-bit, as the final one: at
// the default scale the gain times a root of two already passes 2^31.
int32_t Cordic::sqrt(int32_t v) {
    if (v < 1) {
        return 0;
    }
    if (v == Multiplier) {
        return 1;  // one unit of the last place, not Multiplier: intended, and kept
    }
    int32_t gain = FixedInvKp;
    while (v < (Multiplier >> 1)) {
        v = Twice(v);
        gain = ScaledProduct(gain, FixedInvRoot2, Shift);
    }
    while (v > Twice(Multiplier)) {
        v >>= 1;
        gain = ScaledProduct(gain, FixedRoot2, Shift);
    }
    int32_t const quarter = Multiplier >> 2;
    int32_t const x = VectorHyperbolic(Sum(v, quarter), Difference(v, quarter)).first;
    return ScaledProduct(x, gain, Shift);
}

// Whole turns of w: the quotient truncates towards zero, then its fraction is cleared, which
// floors a negative quotient but leaves a sum just below zero at no turn.
int32_t Cordic::normalise_angle(int32_t angle) {
    int32_t const half_turn = FixedTwoPi >> 1;
    int32_t const t = Sum(angle, half_turn);
    int64_t const w = FixedTwoPi & ~int32_t(1);
    int64_t const fraction = (int64_t(1) << Shift) - 1;
    int64_t const turns = (int64_t(uint64_t(int64_t(t)) << Shift) / w) & ~fraction;
    return int32_t(int64_t(t) - ((turns * w) >> Shift) - half_turn);
}

int32_t Cordic::degrees_to_radians(int32_t v) {
    return ScaledProduct(FixedDegreesToRadians, v, Shift);
}

int32_t Cordic::radians_to_degrees(int32_t v) {
    return ScaledProduct(FixedRadiansToDegrees, v, Shift);
}

}  // namespace quorvel::vexmap
