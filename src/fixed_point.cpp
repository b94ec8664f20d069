#include "vexmap/fixed_point.h"

namespace quorvel::vexmap {
namespace {

// The sum of two words as the processor forms it: in unsigned, so that a wrap is defined.
int32_t WrappedSum(int32_t a, int32_t b) {
    return int32_t(uint32_t(a) + uint32_t(b));
}

int32_t WrappedDifference(int32_t a, int32_t b) {
    return int32_t(uint32_t(a) - uint32_t(b));
}

}  // namespace

FixedPoint::FixedPoint() : value(0) {}

FixedPoint::FixedPoint(FixedPoint const&) = default;

FixedPoint::FixedPoint(int n) : value(0) {
    Assign(n);
}

FixedPoint::FixedPoint(float const& x) : value(0) {
    Assign(x);
}

FixedPoint::FixedPoint(double const& x) : value(0) {
    Assign(x);
}

FixedPoint::FixedPoint(long double const& x) : value(0) {
    Assign(x);
}

FixedPoint& FixedPoint::operator=(FixedPoint const& other) {
    if (this != &other) {
        value = other.value;
    }
    return *this;
}

FixedPoint::~FixedPoint() = default;

FixedPoint& FixedPoint::Assign(int n) {
    value = int32_t(uint32_t(n) << FractionBitCount);
    return *this;
}

FixedPoint& FixedPoint::Assign(float const& x) {
    value = int32_t(float(ConversionScale) * x);
    return *this;
}

FixedPoint& FixedPoint::Assign(double const& x) {
    value = int32_t(double(ConversionScale) * x);
    return *this;
}

FixedPoint& FixedPoint::Assign(long double const& x) {
    value = int32_t(static_cast<long double>(ConversionScale) * x);
    return *this;
}

FixedPoint& FixedPoint::operator+=(FixedPoint const& other) {
    value = WrappedSum(value, other.value);
    return *this;
}

FixedPoint& FixedPoint::operator-=(FixedPoint const& other) {
    value = WrappedDifference(value, other.value);
    return *this;
}

FixedPoint FixedPoint::operator+(FixedPoint const& other) const {
    FixedPoint sum(*this);
    return sum += other;
}

FixedPoint FixedPoint::operator-(FixedPoint const& other) const {
    FixedPoint difference(*this);
    return difference -= other;
}

FixedPoint FixedPoint::operator-() const {
    FixedPoint negative;
    negative.value = WrappedDifference(0, value);
    return negative;
}

FixedPoint& FixedPoint::operator*=(FixedPoint const&) {
    return *this;
}

FixedPoint& FixedPoint::operator/=(FixedPoint const&) {
    return *this;
}

FixedPoint FixedPoint::operator*(FixedPoint const&) const {
    return FixedPoint();
}

FixedPoint FixedPoint::operator/(FixedPoint const&) const {
    return FixedPoint();
}

FixedPoint::operator float() const {
    return float(value) / float(ConversionScale);
}

FixedPoint::operator int() const {
    return value >> FractionBitCount;
}

}  // namespace quorvel::vexmap
