#pragma once

#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {

class EulerAngles;

/// A rotation as (w, x, y, z). The product keeps the order of composition of this engine: its cross
/// terms have the opposite sign to Hamilton's, so a * b here is Hamilton's b * a. A value; any
/// thread.
class Quaternion {
public:
    static Quaternion const Identity;  // (1, 0, 0, 0)
    static Quaternion const Invalid;   // four NaN

    Quaternion();  // (1, 0, 0, 0)
    Quaternion(Quaternion const& other);
    Quaternion(float w_value, float x_value, float y_value, float z_value);
    Quaternion& operator=(Quaternion const& other);
    virtual ~Quaternion();

    Quaternion operator-() const;  // all four negated
    Quaternion operator*(Quaternion const& other) const;
    Quaternion& operator*=(Quaternion const& other);

    void SetIdentity();
    void SetToRotateAboutX(float angle);
    void SetToRotateAboutY(float angle);
    void SetToRotateAboutZ(float angle);
    /// The axis is taken as it is, not normalised.
    void SetToRotateAboutAxis(Vector3d const& axis, float angle);
    void SetToRotateObjectToInertial(EulerAngles const& orientation);
    void SetToRotateInertialToObject(EulerAngles const& orientation);
    /// To unit length; a zero quaternion becomes the identity.
    void Normalise();
    float GetRotationAngle() const;
    Vector3d GetRotationAxis() const;  // (1, 0, 0) when there is no rotation

    float w;
    float x;
    float y;
    float z;
};

float DotProduct(Quaternion const& a, Quaternion const& b);
/// Spherical interpolation, the shorter way round; the result is not normalised.
Quaternion Slerp(Quaternion const& a, Quaternion const& b, float t);
Quaternion Conjugate(Quaternion const& q);
Quaternion Power(Quaternion const& q, float exponent);

}  // namespace quorvel::vexmap
