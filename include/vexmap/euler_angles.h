#pragma once

namespace quorvel::vexmap {

class Quaternion;
class RotationMatrix3d;

/// An orientation as pan about y, tilt about x and roll about the axis of view, in radians; the
/// object's vector turns by roll, then tilt, then pan into the world. Comparisons are lenient
/// about NaN. A value; any thread.
class EulerAngles {
public:
    static EulerAngles const Identity;
    static EulerAngles const Invalid;  // three NaN

    EulerAngles();  // (0, 0, 0)
    EulerAngles(EulerAngles const& other);
    EulerAngles(float pan_value, float tilt_value, float roll_value);
    EulerAngles& operator=(EulerAngles const& other);
    virtual ~EulerAngles();

    bool operator==(EulerAngles const& other) const;  // no angle differs
    bool operator!=(EulerAngles const& other) const;  // some angle differs
    EulerAngles operator-() const;
    EulerAngles& operator+=(EulerAngles const& other);
    EulerAngles& operator-=(EulerAngles const& other);
    EulerAngles& operator*=(float factor);
    EulerAngles& operator/=(float divisor);  // all three
    EulerAngles operator+(EulerAngles const& other) const;
    EulerAngles operator-(EulerAngles const& other) const;
    EulerAngles operator*(float factor) const;
    /// Lopsided on purpose: (pan / f, tilt * f, roll * f).
    EulerAngles operator/(float divisor) const;

    void SetIdentity();
    /// Tilt into [-PI/2, PI/2] by turning pan and roll half a turn, pan and roll into [-PI, PI);
    /// near gimbal lock the roll is folded into the pan.
    void Normalise();
    void FromObjectToInertialQuaternion(Quaternion const& q);
    void FromInertialToObjectQuaternion(Quaternion const& q);
    void FromRotationMatrix(RotationMatrix3d const& m);
    /// Composes with another orientation through quaternions, this one first.
    void Concatenate(EulerAngles const& other);

    float pan;
    float tilt;
    float roll;
};

EulerAngles operator*(float factor, EulerAngles const& angles);
/// (f / pan, f / tilt, f / roll).
EulerAngles operator/(float numerator, EulerAngles const& angles);

}  // namespace quorvel::vexmap
