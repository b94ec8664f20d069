#pragma once

#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {

class EulerAngles;
class Quaternion;

/// An orientation as a matrix M = Ry(pan) * Rx(tilt) * Rz(roll), row by row: M turns an object's
/// vector into the world, its transpose back. A value; any thread.
class RotationMatrix3d {
public:
    static RotationMatrix3d const Identity;

    RotationMatrix3d();  // identity
    RotationMatrix3d(RotationMatrix3d const& other);
    explicit RotationMatrix3d(EulerAngles const& orientation);
    RotationMatrix3d(float pan, float tilt, float roll);
    RotationMatrix3d& operator=(RotationMatrix3d const& other);
    virtual ~RotationMatrix3d();

    void SetIdentity();
    void Setup(EulerAngles const& orientation);
    void FromInertialToObjectQuaternion(Quaternion const& q);
    void FromObjectToInertialQuaternion(Quaternion const& q);
    // Inline: a map build's chain turns a direction at every eighth column.
    Vector3d InertialToObject(Vector3d const& v) const {  // transpose of M times v
        return Vector3d(m11 * v.x + m21 * v.y + m31 * v.z, m12 * v.x + m22 * v.y + m32 * v.z,
                        m13 * v.x + m23 * v.y + m33 * v.z);
    }
    Vector3d ObjectToInertial(Vector3d const& v) const {  // M times v
        return Vector3d(m11 * v.x + m12 * v.y + m13 * v.z, m21 * v.x + m22 * v.y + m23 * v.z,
                        m31 * v.x + m32 * v.y + m33 * v.z);
    }

    float m11;
    float m12;
    float m13;
    float m21;
    float m22;
    float m23;
    float m31;
    float m32;
    float m33;

private:
    /// The quaternion's matrix; `w_sign` is +1 for object to inertial and -1 the other way.
    void FromQuaternion(Quaternion const& q, float w_sign);
};

}  // namespace quorvel::vexmap
