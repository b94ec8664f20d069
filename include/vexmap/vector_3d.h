#pragma once

namespace quorvel::vexmap {

/// A direction or point in space: x right, y up, z along the view; 32-bit floats. `==` is plain
/// float equality while `!=` is lenient about NaN, so a NaN pair is neither equal nor unequal. A
/// value; any thread.
class Vector3d {
public:
    static Vector3d const ZeroVector;
    static Vector3d const InvalidVector;  // three NaN

    // Inline: vectors are made and copied in every step of a map build.
    Vector3d() : x(0.0f), y(0.0f), z(0.0f) {}  // (0, 0, 0)
    Vector3d(Vector3d const& other) = default;
    Vector3d(float x_value, float y_value, float z_value) : x(x_value), y(y_value), z(z_value) {}
    Vector3d& operator=(Vector3d const& other);
    virtual ~Vector3d() = default;

    bool operator==(Vector3d const& other) const;
    bool operator!=(Vector3d const& other) const;
    Vector3d operator-() const;
    Vector3d& operator+=(Vector3d const& other);
    Vector3d& operator-=(Vector3d const& other);
    Vector3d& operator*=(float factor);
    Vector3d& operator/=(float divisor);
    Vector3d operator+(Vector3d const& other) const;
    Vector3d operator-(Vector3d const& other) const;
    Vector3d operator*(float factor) const;
    Vector3d operator/(float divisor) const;
    /// The dot product.
    float operator*(Vector3d const& other) const;

    void SetZero();
    /// To unit length; a vector of zero length stays as it is.
    void Normalise();
    float Length() const;
    bool Valid() const;  // all three finite

    float x;
    float y;
    float z;
};

Vector3d operator*(float factor, Vector3d const& vector);
/// (f / x, f / y, f / z): the vector's components are the denominators.
Vector3d operator/(float numerator, Vector3d const& vector);
Vector3d CrossProduct(Vector3d const& a, Vector3d const& b);
float Distance(Vector3d const& a, Vector3d const& b);

}  // namespace quorvel::vexmap
