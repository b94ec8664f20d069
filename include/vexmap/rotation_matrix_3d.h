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
    Vector3d InertialToObject(Vector3d const& v) const;  // transpose of M times v
    Vector3d ObjectToInertial(Vector3d const& v) const;  // M times v

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
