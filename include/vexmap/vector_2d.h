#pragma once

namespace quorvel::vexmap {

/// A point or a pair of the engine: x right, y up, 32-bit floats. Equality is lenient: a NaN
/// component compares equal to anything, so only a real difference makes two vectors unequal. A
/// value; any thread.
class Vector2d {
public:
    static Vector2d const InvalidVector;   // two NaN
    static Vector2d const InfiniteVector;  // two infinities
    static Vector2d const ZeroVector;
    static Vector2d const IdentityVector;  // (1, 1)

    // Inline: vectors are made and copied in every step of a map build.
    Vector2d() : x(0.0f), y(0.0f) {}  // (0, 0)
    Vector2d(Vector2d const& other) = default;
    Vector2d(float x_value, float y_value) : x(x_value), y(y_value) {}
    Vector2d& operator=(Vector2d const& other) = default;
    virtual ~Vector2d() = default;

    bool operator==(Vector2d const& other) const;  // no component differs
    bool operator!=(Vector2d const& other) const;  // some component differs
    Vector2d operator+(Vector2d const& other) const { return Vector2d(x + other.x, y + other.y); }
    Vector2d operator-(Vector2d const& other) const { return Vector2d(x - other.x, y - other.y); }
    Vector2d operator-() const;
    Vector2d operator*(float factor) const { return Vector2d(x * factor, y * factor); }
    Vector2d operator/(float divisor) const;

    void SetZero();
    float Length() const;
    /// Multiplies component by component, in place.
    Vector2d& Scale(Vector2d const& factors);
    /// atan2(x, y): measured from +y towards +x.
    float Angle() const;
    /// Both components finite.
    virtual bool Valid() const;

    float x;
    float y;
};

Vector2d operator*(float factor, Vector2d const& vector);
/// (f / x, f / y): the vector's components are the denominators.
Vector2d operator/(float numerator, Vector2d const& vector);
float Distance(Vector2d const& a, Vector2d const& b);

}  // namespace quorvel::vexmap
