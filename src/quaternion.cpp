#include "vexmap/quaternion.h"

#include "vexmap/euler_angles.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float NEARLY_ONE = 0.9999f;

// Sines and cosines of the half angles of an orientation.
struct HalfAngles {
    explicit HalfAngles(EulerAngles const& orientation) {
        auto const pan_terms = Trigonometry::sin_and_cos(orientation.pan * 0.5f);
        auto const tilt_terms = Trigonometry::sin_and_cos(orientation.tilt * 0.5f);
        auto const roll_terms = Trigonometry::sin_and_cos(orientation.roll * 0.5f);
        sh = pan_terms.first;
        ch = pan_terms.second;
        sp = tilt_terms.first;
        cp = tilt_terms.second;
        sb = roll_terms.first;
        cb = roll_terms.second;
    }
    float sh;
    float ch;
    float sp;
    float cp;
    float sb;
    float cb;
};

}  // namespace

Quaternion const Quaternion::Identity(1.0f, 0.0f, 0.0f, 0.0f);
Quaternion const Quaternion::Invalid(FloatingPoint::Nan, FloatingPoint::Nan, FloatingPoint::Nan,
                                     FloatingPoint::Nan);

Quaternion::Quaternion() : w(1.0f), x(0.0f), y(0.0f), z(0.0f) {}

Quaternion::Quaternion(Quaternion const& other) = default;

Quaternion::Quaternion(float w_value, float x_value, float y_value, float z_value)
    : w(w_value), x(x_value), y(y_value), z(z_value) {}

Quaternion& Quaternion::operator=(Quaternion const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Quaternion");
        return *this;
    }
    w = other.w;
    x = other.x;
    y = other.y;
    z = other.z;
    return *this;
}

Quaternion::~Quaternion() = default;

Quaternion Quaternion::operator-() const {
    return Quaternion(-w, -x, -y, -z);
}

Quaternion Quaternion::operator*(Quaternion const& b) const {
    return Quaternion(w * b.w - x * b.x - y * b.y - z * b.z, w * b.x + x * b.w + z * b.y - y * b.z,
                      w * b.y + y * b.w + x * b.z - z * b.x, w * b.z + z * b.w + y * b.x - x * b.y);
}

Quaternion& Quaternion::operator*=(Quaternion const& other) {
    Quaternion const product = *this * other;
    w = product.w;
    x = product.x;
    y = product.y;
    z = product.z;
    return *this;
}

void Quaternion::SetIdentity() {
    w = 1.0f;
    x = 0.0f;
    y = 0.0f;
    z = 0.0f;
}

void Quaternion::SetToRotateAboutX(float angle) {
    auto const half = Trigonometry::sin_and_cos(angle * 0.5f);
    w = half.second;
    x = half.first;
    y = 0.0f;
    z = 0.0f;
}

void Quaternion::SetToRotateAboutY(float angle) {
    auto const half = Trigonometry::sin_and_cos(angle * 0.5f);
    w = half.second;
    x = 0.0f;
    y = half.first;
    z = 0.0f;
}

void Quaternion::SetToRotateAboutZ(float angle) {
    auto const half = Trigonometry::sin_and_cos(angle * 0.5f);
    w = half.second;
    x = 0.0f;
    y = 0.0f;
    z = half.first;
}

void Quaternion::SetToRotateAboutAxis(Vector3d const& axis, float angle) {
    auto const half = Trigonometry::sin_and_cos(angle * 0.5f);
    w = half.second;
    x = axis.x * half.first;
    y = axis.y * half.first;
    z = axis.z * half.first;
}

void Quaternion::SetToRotateObjectToInertial(EulerAngles const& orientation) {
    HalfAngles const h(orientation);
    w = h.ch * h.cp * h.cb + h.sh * h.sp * h.sb;
    x = h.ch * h.sp * h.cb + h.sh * h.cp * h.sb;
    y = h.sh * h.cp * h.cb - h.ch * h.sp * h.sb;
    z = h.ch * h.cp * h.sb - h.sh * h.sp * h.cb;
}

void Quaternion::SetToRotateInertialToObject(EulerAngles const& orientation) {
    HalfAngles const h(orientation);
    w = h.ch * h.cp * h.cb + h.sh * h.sp * h.sb;
    x = -h.ch * h.sp * h.cb - h.sh * h.cp * h.sb;
    y = h.ch * h.sp * h.sb - h.sh * h.cp * h.cb;
    z = h.sh * h.sp * h.cb - h.ch * h.cp * h.sb;
}

void Quaternion::Normalise() {
    float const magnitude = FloatingPoint::sqrt(w * w + x * x + y * y + z * z);
    if (magnitude > 0.0f) {
        float const scale = 1.0f / magnitude;
        w *= scale;
        x *= scale;
        y *= scale;
        z *= scale;
    } else {
        SetIdentity();
    }
}

float Quaternion::GetRotationAngle() const {
    return 2.0f * Trigonometry::acos(w);
}

Vector3d Quaternion::GetRotationAxis() const {
    float const s = 1.0f - w * w;
    if (s > 0.0f) {
        float const scale = 1.0f / FloatingPoint::sqrt(s);
        return Vector3d(x * scale, y * scale, z * scale);
    }
    return Vector3d(1.0f, 0.0f, 0.0f);
}

float DotProduct(Quaternion const& a, Quaternion const& b) {
    return a.w * b.w + a.x * b.x + a.y * b.y + a.z * b.z;
}

Quaternion Slerp(Quaternion const& a, Quaternion const& b, float t) {
    if (t <= 0.0f) {
        return a;
    }
    if (t >= 1.0f) {
        return b;
    }
    float d = DotProduct(a, b);
    Quaternion other = b;
    if (d < 0.0f) {
        other = -b;
        d = -d;
    }
    float k0 = 1.0f - t;
    float k1 = t;
    if (!(d > NEARLY_ONE)) {
        float const s = FloatingPoint::sqrt(1.0f - d * d);
        float const angle = Trigonometry::atan(s, d);
        float const one_over_s = 1.0f / s;
        k0 = Trigonometry::sin((1.0f - t) * angle) * one_over_s;
        k1 = Trigonometry::sin(t * angle) * one_over_s;
    }
    return Quaternion(k0 * a.w + k1 * other.w, k0 * a.x + k1 * other.x, k0 * a.y + k1 * other.y,
                      k0 * a.z + k1 * other.z);
}

Quaternion Conjugate(Quaternion const& q) {
    return Quaternion(q.w, -q.x, -q.y, -q.z);
}

Quaternion Power(Quaternion const& q, float exponent) {
    if (FloatingPoint::fabs(q.w) > NEARLY_ONE) {
        return q;
    }
    float const alpha = Trigonometry::acos(q.w);
    float const scaled = exponent * alpha;
    float const k = Trigonometry::sin(scaled) / Trigonometry::sin(alpha);
    return Quaternion(Trigonometry::cos(scaled), q.x * k, q.y * k, q.z * k);
}

}  // namespace quorvel::vexmap
