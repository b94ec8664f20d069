#pragma once

#include <cstdint>

namespace quorvel::vexmap {

/// A signed number with 16 fraction bits in one 32-bit word (Q15.16): `value` is the number times
/// 65536. Sums and differences wrap; multiplication and division are empty. A value; any thread
/// may use its own copies.
class FixedPoint {
public:
    static constexpr int FractionBitCount = 16;
    static constexpr int32_t ConversionScale = 65536;
    // Unsigned masks, so that the integer and sign masks keep their bits in the type.
    static constexpr uint32_t FractionBitMask = 0xFFFFu;
    static constexpr uint32_t RoundBitMask = 0x8000u;
    static constexpr uint32_t IntegerBitMask = 0xFFFF0000u;
    static constexpr uint32_t SignBitMask = 0x80000000u;

    FixedPoint();  // zero
    FixedPoint(FixedPoint const& other);
    // Conversions in and out are explicit, so that a mixed expression such as `a + 1` is never
    // ambiguous between them.
    explicit FixedPoint(int n);  // shifted up, with no check for overflow
    explicit FixedPoint(float const& x);
    explicit FixedPoint(double const& x);
    explicit FixedPoint(long double const& x);
    FixedPoint& operator=(FixedPoint const& other);
    virtual ~FixedPoint();

    // The same conversions as the constructors; each returns *this.
    FixedPoint& Assign(int n);
    FixedPoint& Assign(float const& x);  // scaled and truncated towards zero
    FixedPoint& Assign(double const& x);
    FixedPoint& Assign(long double const& x);

    FixedPoint& operator+=(FixedPoint const& other);
    FixedPoint& operator-=(FixedPoint const& other);
    FixedPoint operator+(FixedPoint const& other) const;
    FixedPoint operator-(FixedPoint const& other) const;
    FixedPoint operator-() const;
    /// Multiplication and division are empty by design: the compound forms leave the number as it
    /// is, the plain forms give zero, whatever the operands.
    FixedPoint& operator*=(FixedPoint const& other);
    FixedPoint& operator/=(FixedPoint const& other);
    FixedPoint operator*(FixedPoint const& other) const;
    FixedPoint operator/(FixedPoint const& other) const;

    explicit operator float() const;
    /// The integer part by arithmetic shift, so it rounds towards minus infinity.
    explicit operator int() const;

    int32_t value;
};

}  // namespace quorvel::vexmap
