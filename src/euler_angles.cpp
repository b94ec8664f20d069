#include "vexmap/euler_angles.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/quaternion.h"
#include "vexmap/rotation_matrix_3d.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float GIMBAL_LOCK = __builtin_bit_cast(float, 0x3F7FF972u);  // 0.9999
// Larger than any sine, so the gimbal branch of FromRotationMatrix never runs; kept so.
constexpr float MATRIX_GIMBAL_LOCK = __builtin_bit_cast(float, 0x411FFFF6u);  // 9.99999

}  // namespace

EulerAngles const EulerAngles::Identity(0.0f, 0.0f, 0.0f);
EulerAngles const EulerAngles::Invalid(FloatingPoint::Nan, FloatingPoint::Nan, FloatingPoint::Nan);

EulerAngles::EulerAngles() : pan(0.0f), tilt(0.0f), roll(0.0f) {}

EulerAngles::EulerAngles(EulerAngles const& other) = default;

EulerAngles::EulerAngles(float pan_value, float tilt_value, float roll_value)
    : pan(pan_value), tilt(tilt_value), roll(roll_value) {}

EulerAngles& EulerAngles::operator=(EulerAngles const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "EulerAngles");
        return *this;
    }
    pan = other.pan;
    tilt = other.tilt;
    roll = other.roll;
    return *this;
}

EulerAngles::~EulerAngles() = default;

bool EulerAngles::operator==(EulerAngles const& other) const {
    return !(*this != other);
}

bool EulerAngles::operator!=(EulerAngles const& other) const {
    return FloatingPoint::is_lessgreater(pan, other.pan) ||
           FloatingPoint::is_lessgreater(tilt, other.tilt) ||
           FloatingPoint::is_lessgreater(roll, other.roll);
}

EulerAngles EulerAngles::operator-() const {
    return EulerAngles(-pan, -tilt, -roll);
}

EulerAngles& EulerAngles::operator+=(EulerAngles const& other) {
    pan += other.pan;
    tilt += other.tilt;
    roll += other.roll;
    return *this;
}

EulerAngles& EulerAngles::operator-=(EulerAngles const& other) {
    pan -= other.pan;
    tilt -= other.tilt;
    roll -= other.roll;
    return *this;
}

EulerAngles& EulerAngles::operator*=(float factor) {
    pan *= factor;
    tilt *= factor;
    roll *= factor;
    return *this;
}

EulerAngles& EulerAngles::operator/=(float divisor) {
    pan /= divisor;
    tilt /= divisor;
    roll /= divisor;
    return *this;
}

EulerAngles EulerAngles::operator+(EulerAngles const& other) const {
    return EulerAngles(pan + other.pan, tilt + other.tilt, roll + other.roll);
}

EulerAngles EulerAngles::operator-(EulerAngles const& other) const {
    return EulerAngles(pan - other.pan, tilt - other.tilt, roll - other.roll);
}

EulerAngles EulerAngles::operator*(float factor) const {
    return EulerAngles(pan * factor, tilt * factor, roll * factor);
}

EulerAngles EulerAngles::operator/(float divisor) const {
    return EulerAngles(pan / divisor, tilt * divisor, roll * divisor);
}

void EulerAngles::SetIdentity() {
    pan = 0.0f;
    tilt = 0.0f;
    roll = 0.0f;
}

void EulerAngles::Normalise() {
    tilt = Trigonometry::normalise_angle(tilt);
    if (tilt < -Trigonometry::HALF_PI) {
        pan += Trigonometry::PI;
        tilt = -Trigonometry::PI - tilt;
        roll += Trigonometry::PI;
    } else if (tilt > Trigonometry::HALF_PI) {
        pan += Trigonometry::PI;
        tilt = Trigonometry::PI - tilt;
        roll += Trigonometry::PI;
    }
    if (FloatingPoint::fabs(tilt) > Trigonometry::HALF_PI - 0.0001f) {
        pan += roll;
        roll = 0.0f;
    } else {
        roll = Trigonometry::normalise_angle(roll);
    }
    pan = Trigonometry::normalise_angle(pan);
}

void EulerAngles::FromObjectToInertialQuaternion(Quaternion const& q) {
    float const sp = -2.0f * (q.y * q.z - q.w * q.x);
    if (FloatingPoint::fabs(sp) > GIMBAL_LOCK) {
        pan = Trigonometry::atan(q.w * q.y - q.x * q.z, 0.5f - q.y * q.y - q.z * q.z);
        tilt = sp * Trigonometry::HALF_PI;
        roll = 0.0f;
    } else {
        pan = Trigonometry::atan(q.x * q.z + q.w * q.y, 0.5f - q.x * q.x - q.y * q.y);
        tilt = Trigonometry::asin(sp);
        roll = Trigonometry::atan(q.x * q.y + q.w * q.z, 0.5f - q.x * q.x - q.z * q.z);
    }
}

void EulerAngles::FromInertialToObjectQuaternion(Quaternion const& q) {
    float const sp = -2.0f * (q.y * q.z + q.w * q.x);
    if (FloatingPoint::fabs(sp) > GIMBAL_LOCK) {
        pan = Trigonometry::atan(-q.x * q.z - q.w * q.y, 0.5f - q.y * q.y - q.z * q.z);
        tilt = sp * Trigonometry::HALF_PI;
        roll = 0.0f;
    } else {
        pan = Trigonometry::atan(q.x * q.z - q.w * q.y, 0.5f - q.x * q.x - q.y * q.y);
        tilt = Trigonometry::asin(sp);
        roll = Trigonometry::atan(q.x * q.y - q.w * q.z, 0.5f - q.x * q.x - q.z * q.z);
    }
}

void EulerAngles::FromRotationMatrix(RotationMatrix3d const& m) {
    float const sp = -m.m23;
    if (FloatingPoint::fabs(sp) > MATRIX_GIMBAL_LOCK) {
        pan = Trigonometry::atan(-m.m31, m.m11);
        tilt = sp * Trigonometry::HALF_PI;
        roll = 0.0f;
    } else {
        pan = Trigonometry::atan(m.m13, m.m33);
        tilt = Trigonometry::asin(sp);
        roll = Trigonometry::atan(m.m21, m.m22);
    }
}

void EulerAngles::Concatenate(EulerAngles const& other) {
    Quaternion first;
    first.SetToRotateInertialToObject(*this);
    Quaternion second;
    second.SetToRotateInertialToObject(other);
    FromInertialToObjectQuaternion(first * second);
}

EulerAngles operator*(float factor, EulerAngles const& angles) {
    return EulerAngles(factor * angles.pan, factor * angles.tilt, factor * angles.roll);
}

EulerAngles operator/(float numerator, EulerAngles const& angles) {
    return EulerAngles(numerator / angles.pan, numerator / angles.tilt, numerator / angles.roll);
}

}  // namespace quorvel::vexmap
