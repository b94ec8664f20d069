#pragma once

#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// A size in whole pixels held in floats: x is the width, y the height. Whatever makes a new
/// object floors; the compound operators work in place and do not, so a Resolution can come to
/// hold a fraction. Equality is that of Vector2d. A value; any thread.
class Resolution : public Vector2d {
public:
    /// (0, 0): not NaN, and not Valid() either.
    static Resolution const InvalidResolution;

    Resolution();  // (0, 0)
    Resolution(Resolution const& other);
    /// Floors each component. Implicit: the results of Vector2d arithmetic convert through it.
    Resolution(Vector2d const& vector);
    Resolution(float width, float height);  // floored
    Resolution(int width, int height);
    Resolution(unsigned int width, unsigned int height);
    Resolution& operator=(Resolution const& other);
    /// Floors each component; no test for self-assignment.
    Resolution& operator=(Vector2d const& other);
    ~Resolution() override;

    // A new object, floored. A Resolution operand binds to Vector2d const& as well.
    Resolution operator-() const;
    Resolution operator+(Vector2d const& other) const;
    Resolution operator-(Vector2d const& other) const;
    Resolution operator*(float factor) const;
    Resolution operator/(float divisor) const;

    // In place and not floored, by intent.
    Resolution& operator+=(Vector2d const& other);
    Resolution& operator-=(Vector2d const& other);
    Resolution& operator*=(float factor);
    Resolution& operator/=(float divisor);

    float AspectRatio() const;  // x / y
    /// The largest size of the given width-to-height ratio inside this one, not floored.
    Resolution BestFit(float aspect) const;
    /// The uniform scale that fits other inside this resolution.
    float BestScale(Resolution const& other) const;
    /// Rounds each component, then limits it to 0..size: the upper limit is the width or height
    /// itself, not one less, by intent.
    Vector2d NearestNeighbour(Vector2d const& point) const;
    /// Finite, and both sides above zero.
    bool Valid() const override;

    // Absolute points have their origin at the south-west corner, y up; offsets are from the
    // centre.
    Vector2d Centre() const;
    Vector2d North() const;
    Vector2d South() const;
    Vector2d East() const;
    Vector2d West() const;
    Vector2d NorthEast() const;
    Vector2d SouthEast() const;
    Vector2d NorthWest() const;
    Vector2d SouthWest() const;
    Vector2d NorthOffset() const;
    Vector2d SouthOffset() const;
    Vector2d EastOffset() const;
    Vector2d WestOffset() const;
    Vector2d NorthEastOffset() const;
    Vector2d SouthEastOffset() const;
    Vector2d NorthWestOffset() const;
    Vector2d SouthWestOffset() const;
};

}  // namespace quorvel::vexmap
