#include "vexmap/rotation_matrix_3d.h"

#include "vexmap/euler_angles.h"
#include "vexmap/log.h"
#include "vexmap/quaternion.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {

RotationMatrix3d const RotationMatrix3d::Identity;

RotationMatrix3d::RotationMatrix3d() {
    SetIdentity();
}

RotationMatrix3d::RotationMatrix3d(RotationMatrix3d const& other) = default;

RotationMatrix3d::RotationMatrix3d(EulerAngles const& orientation) {
    Setup(orientation);
}

RotationMatrix3d::RotationMatrix3d(float pan, float tilt, float roll) {
    Setup(EulerAngles(pan, tilt, roll));
}

RotationMatrix3d& RotationMatrix3d::operator=(RotationMatrix3d const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "RotationMatrix3d");
        return *this;
    }
    m11 = other.m11;
    m12 = other.m12;
    m13 = other.m13;
    m21 = other.m21;
    m22 = other.m22;
    m23 = other.m23;
    m31 = other.m31;
    m32 = other.m32;
    m33 = other.m33;
    return *this;
}

RotationMatrix3d::~RotationMatrix3d() = default;

void RotationMatrix3d::SetIdentity() {
    m11 = 1.0f;
    m12 = 0.0f;
    m13 = 0.0f;
    m21 = 0.0f;
    m22 = 1.0f;
    m23 = 0.0f;
    m31 = 0.0f;
    m32 = 0.0f;
    m33 = 1.0f;
}

void RotationMatrix3d::Setup(EulerAngles const& orientation) {
    auto const [sh, ch] = Trigonometry::sin_and_cos(orientation.pan);
    auto const [sp, cp] = Trigonometry::sin_and_cos(orientation.tilt);
    auto const [sb, cb] = Trigonometry::sin_and_cos(orientation.roll);
    m11 = sh * sp * sb + ch * cb;
    m12 = sh * sp * cb - ch * sb;
    m13 = sh * cp;
    m21 = cp * sb;
    m22 = cp * cb;
    m23 = -sp;
    m31 = ch * sp * sb - sh * cb;
    m32 = ch * sp * cb + sh * sb;
    m33 = ch * cp;
}

void RotationMatrix3d::FromInertialToObjectQuaternion(Quaternion const& q) {
    FromQuaternion(q, -1.0f);
}

void RotationMatrix3d::FromObjectToInertialQuaternion(Quaternion const& q) {
    FromQuaternion(q, 1.0f);
}

void RotationMatrix3d::FromQuaternion(Quaternion const& q, float w_sign) {
    float const w = w_sign * q.w;
    m11 = 1.0f - 2.0f * (q.y * q.y + q.z * q.z);
    m12 = 2.0f * (q.x * q.y - w * q.z);
    m13 = 2.0f * (q.x * q.z + w * q.y);
    m21 = 2.0f * (q.x * q.y + w * q.z);
    m22 = 1.0f - 2.0f * (q.x * q.x + q.z * q.z);
    m23 = 2.0f * (q.y * q.z - w * q.x);
    m31 = 2.0f * (q.x * q.z - w * q.y);
    m32 = 2.0f * (q.y * q.z + w * q.x);
    m33 = 1.0f - 2.0f * (q.x * q.x + q.y * q.y);
}

}  // namespace quorvel::vexmap
