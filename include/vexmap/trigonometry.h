#pragma once

#include <cmath>
#include <type_traits>
#include <utility>

namespace quorvel::vexmap {

/// The engine's one door to trigonometry, for float, double and long double alike; the engine
/// itself uses the float forms. Angles are radians. Pure; any thread.
class Trigonometry {
public:
    static constexpr float DEGREES_TO_RADIANS = __builtin_bit_cast(float, 0x3C8EFA35u);
    static constexpr float RADIANS_TO_DEGREES = __builtin_bit_cast(float, 0x42652EE1u);
    static constexpr float EPSILON = __builtin_bit_cast(float, 0x2EDBE6FFu);
    static constexpr float PI = __builtin_bit_cast(float, 0x40490FDBu);
    static constexpr float TWO_PI = __builtin_bit_cast(float, 0x40C90FDBu);
    static constexpr float HALF_PI = __builtin_bit_cast(float, 0x3FC90FDBu);
    static constexpr float QUARTER_PI = __builtin_bit_cast(float, 0x3F490FDBu);
    static constexpr float THREE_QUARTERS_PI = __builtin_bit_cast(float, 0x4016CBE4u);
    static constexpr float ONE_OVER_PI = __builtin_bit_cast(float, 0x3EA2F983u);
    static constexpr float ONE_OVER_TWO_PI = __builtin_bit_cast(float, 0x3E22F983u);

    /// One period of sine and cosine from -pi in 4096 steps, end to end: index 4096 of the sine
    /// table is the first cosine, and the cosine table has a 4097th entry of -1 for the same
    /// clamp.
    static float const* const SineTable;
    static float const* const CosineTable;

    Trigonometry();
    Trigonometry(Trigonometry const& other);
    Trigonometry& operator=(Trigonometry const& other);
    virtual ~Trigonometry();

    template <typename Real>
    static Real sin(Real x) {
        return std::sin(Checked(x));
    }
    template <typename Real>
    static Real cos(Real x) {
        return std::cos(Checked(x));
    }
    template <typename Real>
    static Real tan(Real x) {
        return std::tan(Checked(x));
    }
    template <typename Real>
    static Real sinh(Real x) {
        return std::sinh(Checked(x));
    }
    template <typename Real>
    static Real cosh(Real x) {
        return std::cosh(Checked(x));
    }
    template <typename Real>
    static Real tanh(Real x) {
        return std::tanh(Checked(x));
    }
    template <typename Real>
    static Real atan(Real x) {
        return std::atan(Checked(x));
    }
    /// atan2: the angle of (x, y) measured from the second argument's axis.
    template <typename Real>
    static Real atan(Real y, Real x) {
        return std::atan2(Checked(y), x);
    }
    template <typename Real>
    static Real asinh(Real x) {
        return std::asinh(Checked(x));
    }
    template <typename Real>
    static Real acosh(Real x) {
        return std::acosh(Checked(x));
    }
    template <typename Real>
    static Real atanh(Real x) {
        return std::atanh(Checked(x));
    }
    template <typename Real>
    static Real hypot(Real x, Real y) {
        return std::hypot(Checked(x), y);
    }
    /// In double the squares of two floats are exact, and their sum and its root each round
    /// once: that is the C library's own float hypot, bit for bit, without the call that a map
    /// build would otherwise make a million times. Infinities and NaN go to the library.
    static float hypot(float x, float y) {
        if (std::isfinite(x) && std::isfinite(y)) {
            return float(std::sqrt(double(x) * double(x) + double(y) * double(y)));
        }
        return std::hypot(x, y);
    }
    /// Guarded: a value pushed just outside [-1, 1] by rounding gives the end of the range, not
    /// NaN. NaN passes through.
    template <typename Real>
    static Real asin(Real x) {
        if (std::islessequal(Checked(x), Real(-1))) {
            return -Real(HALF_PI);
        }
        if (std::isgreaterequal(x, Real(1))) {
            return Real(HALF_PI);
        }
        return std::asin(x);
    }
    template <typename Real>
    static Real acos(Real x) {
        if (std::islessequal(Checked(x), Real(-1))) {
            return Real(PI);
        }
        if (std::isgreaterequal(x, Real(1))) {
            return Real(0);
        }
        return std::acos(x);
    }
    /// The sine first, the cosine second.
    template <typename Real>
    static std::pair<Real, Real> sin_and_cos(Real x) {
        return {std::sin(Checked(x)), std::cos(x)};
    }
    /// hypot(a, b) first, atan2(a, b) second.
    template <typename Real>
    static std::pair<Real, Real> hypot_and_atan(Real a, Real b) {
        return {hypot(Checked(a), b), std::atan2(a, b)};
    }

    /// Into [-PI, PI) by whole turns, in single precision; PI itself maps to about -PI, and
    /// rounding can leave a result just outside.
    static float normalise_angle(float x);
    static float degrees_to_radians(float x) { return x * DEGREES_TO_RADIANS; }
    static float radians_to_degrees(float x) { return x * RADIANS_TO_DEGREES; }

    /// Table lookups for an angle in [-PI, PI], with no range reduction: a larger angle clamps to
    /// the ends of the table. NaN and infinities come back unchanged.
    static float fast_sin(float x);
    static float fast_cos(float x);
    static std::pair<float, float> fast_sin_and_cos(float x);

private:
    template <typename Real>
    static Real Checked(Real x) {
        static_assert(std::is_floating_point<Real>::value, "float, double or long double only");
        return x;
    }
    static int TableIndex(float x);
};

}  // namespace quorvel::vexmap
