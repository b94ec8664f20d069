#include "vexmap/vector_3d.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

Vector3d const Vector3d::ZeroVector(0.0f, 0.0f, 0.0f);
Vector3d const Vector3d::InvalidVector(FloatingPoint::Nan, FloatingPoint::Nan, FloatingPoint::Nan);

Vector3d& Vector3d::operator=(Vector3d const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Vector3d");
        return *this;
    }
    x = other.x;
    y = other.y;
    z = other.z;
    return *this;
}

// Plain equality here and the lenient test in != are both intended: a NaN pair is neither.
bool Vector3d::operator==(Vector3d const& other) const {
    return x == other.x && y == other.y && z == other.z;
}

bool Vector3d::operator!=(Vector3d const& other) const {
    return FloatingPoint::is_lessgreater(x, other.x) || FloatingPoint::is_lessgreater(y, other.y) ||
           FloatingPoint::is_lessgreater(z, other.z);
}

Vector3d Vector3d::operator-() const {
    return Vector3d(-x, -y, -z);
}

Vector3d& Vector3d::operator+=(Vector3d const& other) {
    x += other.x;
    y += other.y;
    z += other.z;
    return *this;
}

Vector3d& Vector3d::operator-=(Vector3d const& other) {
    x -= other.x;
    y -= other.y;
    z -= other.z;
    return *this;
}

Vector3d& Vector3d::operator*=(float factor) {
    x *= factor;
    y *= factor;
    z *= factor;
    return *this;
}

Vector3d& Vector3d::operator/=(float divisor) {
    x /= divisor;
    y /= divisor;
    z /= divisor;
    return *this;
}

Vector3d Vector3d::operator+(Vector3d const& other) const {
    return Vector3d(x + other.x, y + other.y, z + other.z);
}

Vector3d Vector3d::operator-(Vector3d const& other) const {
    return Vector3d(x - other.x, y - other.y, z - other.z);
}

Vector3d Vector3d::operator*(float factor) const {
    return Vector3d(x * factor, y * factor, z * factor);
}

Vector3d Vector3d::operator/(float divisor) const {
    return Vector3d(x / divisor, y / divisor, z / divisor);
}

float Vector3d::operator*(Vector3d const& other) const {
    return x * other.x + y * other.y + z * other.z;
}

void Vector3d::SetZero() {
    x = 0.0f;
    y = 0.0f;
    z = 0.0f;
}

void Vector3d::Normalise() {
    float const squared_length = x * x + y * y + z * z;
    if (squared_length > 0.0f) {
        float const scale = 1.0f / FloatingPoint::sqrt(squared_length);
        x *= scale;
        y *= scale;
        z *= scale;
    }
}

float Vector3d::Length() const {
    return FloatingPoint::sqrt(FloatingPoint::square(x) + FloatingPoint::square(y) +
                               FloatingPoint::square(z));
}

bool Vector3d::Valid() const {
    return FloatingPoint::is_finite(x) && FloatingPoint::is_finite(y) &&
           FloatingPoint::is_finite(z);
}

Vector3d operator*(float factor, Vector3d const& vector) {
    return Vector3d(factor * vector.x, factor * vector.y, factor * vector.z);
}

Vector3d operator/(float numerator, Vector3d const& vector) {
    return Vector3d(numerator / vector.x, numerator / vector.y, numerator / vector.z);
}

Vector3d CrossProduct(Vector3d const& a, Vector3d const& b) {
    return Vector3d(a.y * b.z - a.z * b.y, a.z * b.x - a.x * b.z, a.x * b.y - a.y * b.x);
}

float Distance(Vector3d const& a, Vector3d const& b) {
    return (a - b).Length();
}

}  // namespace quorvel::vexmap
