#pragma once

#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// The angular extent of a picture, in radians. The diagonal is a field of its own: made from two
/// angles it is their hypotenuse, but arithmetic treats it as a third component and never
/// recomputes it. A value; any thread.
class FieldOfView {
public:
    static FieldOfView const ZeroFieldOfView;
    static FieldOfView const InvalidFieldOfView;  // three NaN
    static FieldOfView const CeilingFieldOfView;  // a full turn across, a quarter turn up
    static FieldOfView const FloorFieldOfView;    // the same as the ceiling's
    static FieldOfView const PtzFieldOfView;      // a quarter turn each way

    FieldOfView();  // all 0
    FieldOfView(FieldOfView const& other);
    FieldOfView(float horizontal_angle, float vertical_angle, float diagonal_angle);
    /// The diagonal is hypot(horizontal, vertical).
    FieldOfView(float horizontal_angle, float vertical_angle);
    /// x across, y up; the diagonal is their hypotenuse.
    explicit FieldOfView(Vector2d const& angles);
    FieldOfView& operator=(FieldOfView const& other);
    virtual ~FieldOfView();

    /// The diagonal is hypot(horizontal, vertical).
    void Set(float horizontal_angle, float vertical_angle);

    /// Lenient: no field differs by is_lessgreater, so a NaN field compares equal.
    bool operator==(FieldOfView const& other) const;
    /// Strict: plain float inequality, so a NaN field compares unequal. With ==, both can hold.
    bool operator!=(FieldOfView const& other) const;

    FieldOfView operator-() const;
    // Sums and differences take another FieldOfView, products and quotients a float.
    FieldOfView& operator+=(FieldOfView const& other);
    FieldOfView& operator-=(FieldOfView const& other);
    FieldOfView& operator*=(float factor);
    FieldOfView& operator/=(float divisor);
    FieldOfView operator+(FieldOfView const& other) const;
    FieldOfView operator-(FieldOfView const& other) const;
    FieldOfView operator*(float factor) const;
    FieldOfView operator/(float divisor) const;

    void SetZero();
    /// All three fields finite.
    bool Valid() const;

    float horizontal;
    float vertical;
    float diagonal;
};

FieldOfView operator*(float factor, FieldOfView const& angles);
/// The float over each field.
FieldOfView operator/(float numerator, FieldOfView const& angles);

}  // namespace quorvel::vexmap
