#pragma once

#include <cmath>
#include <type_traits>

#include "vexmap/log.h"

namespace quorvel::vexmap {

/// The engine's one door to floating-point arithmetic beyond plus and times. Every operation is a
/// thin static call for float, double and long double alike; the engine itself uses the float
/// forms. Pure apart from the warning of `sqrt`; any thread.
class FloatingPoint {
public:
    static constexpr float Nan = __builtin_bit_cast(float, 0x7FC00000u);
    static constexpr float Infinity = __builtin_bit_cast(float, 0x7F800000u);
    static constexpr float Zero = __builtin_bit_cast(float, 0x00000000u);

    FloatingPoint();
    FloatingPoint(FloatingPoint const& other);
    FloatingPoint& operator=(FloatingPoint const& other);
    virtual ~FloatingPoint();

    /// The root of a negative value is the root of its magnitude, with a warning. NaN and -0.0
    /// pass through silently.
    template <typename Real>
    static Real sqrt(Real x) {
        RequireReal<Real>();
        if (0 > x) {
            WarnNegativeRoot();
            return std::sqrt(-x);
        }
        return std::sqrt(x);
    }
    template <typename Real>
    static Real fabs(Real x) {
        RequireReal<Real>();
        return std::fabs(x);
    }
    template <typename Real>
    static Real square(Real x) {
        RequireReal<Real>();
        return x * x;
    }
    template <typename Real>
    static Real pow(Real x, Real y) {
        RequireReal<Real>();
        return std::pow(x, y);
    }
    template <typename Real>
    static Real log(Real x) {
        RequireReal<Real>();
        return std::log(x);
    }
    template <typename Real>
    static Real floor(Real x) {
        RequireReal<Real>();
        return std::floor(x);
    }
    template <typename Real>
    static Real ceiling(Real x) {
        RequireReal<Real>();
        return std::ceil(x);
    }
    /// Follows the current rounding mode.
    template <typename Real>
    static Real nearbyint(Real x) {
        RequireReal<Real>();
        return std::nearbyint(x);
    }
    template <typename Real>
    static int classify(Real x) {
        RequireReal<Real>();
        return std::fpclassify(x);
    }
    template <typename Real>
    static bool is_finite(Real x) {
        RequireReal<Real>();
        return std::isfinite(x);
    }
    template <typename Real>
    static bool is_normal(Real x) {
        RequireReal<Real>();
        return std::isnormal(x);
    }
    template <typename Real>
    static bool is_nan(Real x) {
        RequireReal<Real>();
        return x != x;  // NOLINT(misc-redundant-expression) the definition of NaN
    }
    template <typename Real>
    static bool is_inf(Real x) {
        RequireReal<Real>();
        return std::fabs(x) >= Real(Infinity);
    }
    /// Exact: no tolerance, and both signed zeros are zero.
    template <typename Real>
    static bool is_zero(Real x) {
        return classify(x) == FP_ZERO;
    }
    // The comparisons are false when either side is NaN.
    template <typename Real>
    static bool is_greater(Real a, Real b) {
        RequireReal<Real>();
        return std::isgreater(a, b);
    }
    template <typename Real>
    static bool is_greaterequal(Real a, Real b) {
        RequireReal<Real>();
        return std::isgreaterequal(a, b);
    }
    template <typename Real>
    static bool is_less(Real a, Real b) {
        RequireReal<Real>();
        return std::isless(a, b);
    }
    template <typename Real>
    static bool is_lessequal(Real a, Real b) {
        RequireReal<Real>();
        return std::islessequal(a, b);
    }
    /// The engine's test for a difference.
    template <typename Real>
    static bool is_lessgreater(Real a, Real b) {
        RequireReal<Real>();
        return std::islessgreater(a, b);
    }
    template <typename Real>
    static bool is_unordered(Real a, Real b) {
        RequireReal<Real>();
        return std::isunordered(a, b);
    }

private:
    template <typename Real>
    static constexpr void RequireReal() {
        static_assert(std::is_floating_point<Real>::value, "float, double or long double only");
    }
    static void WarnNegativeRoot();
};

}  // namespace quorvel::vexmap
