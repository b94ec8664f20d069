#include "vexmap/vector_2d.h"

#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {

Vector2d const Vector2d::InvalidVector(FloatingPoint::Nan, FloatingPoint::Nan);
Vector2d const Vector2d::InfiniteVector(FloatingPoint::Infinity, FloatingPoint::Infinity);
Vector2d const Vector2d::ZeroVector(0.0f, 0.0f);
Vector2d const Vector2d::IdentityVector(1.0f, 1.0f);

bool Vector2d::operator==(Vector2d const& other) const {
    return !(*this != other);
}

bool Vector2d::operator!=(Vector2d const& other) const {
    return FloatingPoint::is_lessgreater(x, other.x) || FloatingPoint::is_lessgreater(y, other.y);
}

Vector2d Vector2d::operator-() const {
    return Vector2d(-x, -y);
}

Vector2d Vector2d::operator/(float divisor) const {
    return Vector2d(x / divisor, y / divisor);
}

void Vector2d::SetZero() {
    x = 0.0f;
    y = 0.0f;
}

float Vector2d::Length() const {
    return Trigonometry::hypot(x, y);
}

Vector2d& Vector2d::Scale(Vector2d const& factors) {
    x *= factors.x;
    y *= factors.y;
    return *this;
}

float Vector2d::Angle() const {
    return Trigonometry::atan(x, y);
}

bool Vector2d::Valid() const {
    return FloatingPoint::is_finite(x) && FloatingPoint::is_finite(y);
}

Vector2d operator*(float factor, Vector2d const& vector) {
    return Vector2d(factor * vector.x, factor * vector.y);
}

Vector2d operator/(float numerator, Vector2d const& vector) {
    return Vector2d(numerator / vector.x, numerator / vector.y);
}

float Distance(Vector2d const& a, Vector2d const& b) {
    return (a - b).Length();
}

}  // namespace quorvel::vexmap
