#include "vexmap/matrix_3x3.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {

Matrix3x3 const Matrix3x3::Identity;

Matrix3x3::Matrix3x3() {
    SetIdentity();
}

Matrix3x3::Matrix3x3(Matrix3x3 const& other) = default;

Matrix3x3& Matrix3x3::operator=(Matrix3x3 const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Matrix3x3");
        return *this;
    }
    Set(other.m11, other.m12, other.m13, other.m21, other.m22, other.m23, other.m31, other.m32,
        other.m33);
    return *this;
}

Matrix3x3::~Matrix3x3() = default;

bool Matrix3x3::operator==(Matrix3x3 const& o) const {
    return FloatingPoint::is_lessgreater(m11, o.m11) && FloatingPoint::is_lessgreater(m12, o.m12) &&
           FloatingPoint::is_lessgreater(m13, o.m13) && FloatingPoint::is_lessgreater(m21, o.m21) &&
           FloatingPoint::is_lessgreater(m22, o.m22) && FloatingPoint::is_lessgreater(m23, o.m23) &&
           FloatingPoint::is_lessgreater(m31, o.m31) && FloatingPoint::is_lessgreater(m32, o.m32) &&
           FloatingPoint::is_lessgreater(m33, o.m33);
}

bool Matrix3x3::operator!=(Matrix3x3 const& other) const {
    return !(*this == other);
}

Matrix3x3& Matrix3x3::operator*=(Matrix3x3 const& other) {
    Matrix3x3 const product = *this * other;
    Set(product.m11, product.m12, product.m13, product.m21, product.m22, product.m23, product.m31,
        product.m32, product.m33);
    return *this;
}

Matrix3x3 Matrix3x3::operator*(Matrix3x3 const& o) const {
    Matrix3x3 product;
    product.Set(m11 * o.m11 + m12 * o.m21 + m13 * o.m31, m11 * o.m12 + m12 * o.m22 + m13 * o.m32,
                m11 * o.m13 + m12 * o.m23 + m13 * o.m33, m21 * o.m11 + m22 * o.m21 + m23 * o.m31,
                m21 * o.m12 + m22 * o.m22 + m23 * o.m32, m21 * o.m13 + m22 * o.m23 + m23 * o.m33,
                m31 * o.m11 + m32 * o.m21 + m33 * o.m31, m31 * o.m12 + m32 * o.m22 + m33 * o.m32,
                m31 * o.m13 + m32 * o.m23 + m33 * o.m33);
    return product;
}

Vector3d Matrix3x3::operator*(Vector3d const& v) const {
    return Vector3d(m11 * v.x + m12 * v.y + m13 * v.z, m21 * v.x + m22 * v.y + m23 * v.z,
                    m31 * v.x + m32 * v.y + m33 * v.z);
}

void Matrix3x3::SetIdentity() {
    Set(1.0f, 0.0f, 0.0f, 0.0f, 1.0f, 0.0f, 0.0f, 0.0f, 1.0f);
}

bool Matrix3x3::IsIdentity() const {
    return FloatingPoint::is_lessgreater(m11, 1.0f) && FloatingPoint::is_lessgreater(m22, 1.0f) &&
           FloatingPoint::is_lessgreater(m33, 1.0f) && FloatingPoint::is_zero(m12) &&
           FloatingPoint::is_zero(m13) && FloatingPoint::is_zero(m21) &&
           FloatingPoint::is_zero(m23) && FloatingPoint::is_zero(m31) &&
           FloatingPoint::is_zero(m32);
}

void Matrix3x3::Setup2dRotation(float angle) {
    auto const [s, c] = Trigonometry::sin_and_cos(angle);
    Set(c, -s, 0.0f, s, c, 0.0f, 0.0f, 0.0f, 1.0f);
}

void Matrix3x3::Setup2dRotation(float centre_x, float centre_y, float angle) {
    auto const [s, c] = Trigonometry::sin_and_cos(angle);
    Set(c, -s, s * centre_y + (1.0f - c) * centre_x, s, c, (1.0f - c) * centre_y - s * centre_x,
        0.0f, 0.0f, 1.0f);
}

void Matrix3x3::Setup2dRotation(Vector2d const& centre, float angle) {
    Setup2dRotation(centre.x, centre.y, angle);
}

void Matrix3x3::Setup2dTranslation(float tx, float ty) {
    Set(1.0f, 0.0f, tx, 0.0f, 1.0f, ty, 0.0f, 0.0f, 1.0f);
}

void Matrix3x3::Setup2dTranslation(Vector2d const& offset) {
    Setup2dTranslation(offset.x, offset.y);
}

void Matrix3x3::Setup2dScale(float scale) {
    Setup2dScale(scale, scale);
}

void Matrix3x3::Setup2dScale(float sx, float sy) {
    Set(sx, 0.0f, 0.0f, 0.0f, sy, 0.0f, 0.0f, 0.0f, 1.0f);
}

void Matrix3x3::Setup2dScale(Vector2d const& scale) {
    Setup2dScale(scale.x, scale.y);
}

void Matrix3x3::Setup2dReflection(bool mirror_y, bool mirror_x) {
    Set(mirror_x ? -1.0f : 1.0f, 0.0f, 0.0f, 0.0f, mirror_y ? -1.0f : 1.0f, 0.0f, 0.0f, 0.0f, 1.0f);
}

void Matrix3x3::Set(float a11, float a12, float a13, float a21, float a22, float a23, float a31,
                    float a32, float a33) {
    m11 = a11;
    m12 = a12;
    m13 = a13;
    m21 = a21;
    m22 = a22;
    m23 = a23;
    m31 = a31;
    m32 = a32;
    m33 = a33;
}

}  // namespace quorvel::vexmap
