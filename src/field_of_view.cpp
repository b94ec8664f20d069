#include "vexmap/field_of_view.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {

FieldOfView const FieldOfView::ZeroFieldOfView(0.0f, 0.0f, 0.0f);
FieldOfView const FieldOfView::InvalidFieldOfView(FloatingPoint::Nan, FloatingPoint::Nan,
                                                  FloatingPoint::Nan);
FieldOfView const FieldOfView::CeilingFieldOfView(Trigonometry::TWO_PI, Trigonometry::HALF_PI);
FieldOfView const FieldOfView::FloorFieldOfView(Trigonometry::TWO_PI, Trigonometry::HALF_PI);
FieldOfView const FieldOfView::PtzFieldOfView(Trigonometry::HALF_PI, Trigonometry::HALF_PI);

FieldOfView::FieldOfView() : horizontal(0.0f), vertical(0.0f), diagonal(0.0f) {}

FieldOfView::FieldOfView(FieldOfView const& other) = default;

FieldOfView::FieldOfView(float horizontal_angle, float vertical_angle, float diagonal_angle)
    : horizontal(horizontal_angle), vertical(vertical_angle), diagonal(diagonal_angle) {}

// The hypotenuse of the two angles, a plane measure: it stands in for the true diagonal angle.
FieldOfView::FieldOfView(float horizontal_angle, float vertical_angle)
    : horizontal(horizontal_angle),
      vertical(vertical_angle),
      diagonal(Trigonometry::hypot(horizontal_angle, vertical_angle)) {}

FieldOfView::FieldOfView(Vector2d const& angles) : FieldOfView(angles.x, angles.y) {}

FieldOfView& FieldOfView::operator=(FieldOfView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "FieldOfView");
        return *this;
    }
    horizontal = other.horizontal;
    vertical = other.vertical;
    diagonal = other.diagonal;
    return *this;
}

FieldOfView::~FieldOfView() = default;

void FieldOfView::Set(float horizontal_angle, float vertical_angle) {
    horizontal = horizontal_angle;
    vertical = vertical_angle;
    diagonal = Trigonometry::hypot(horizontal_angle, vertical_angle);
}

bool FieldOfView::operator==(FieldOfView const& other) const {
    return !(FloatingPoint::is_lessgreater(horizontal, other.horizontal) ||
             FloatingPoint::is_lessgreater(vertical, other.vertical) ||
             FloatingPoint::is_lessgreater(diagonal, other.diagonal));
}

// Not the complement of ==, by intent: a NaN pair is both equal and unequal.
bool FieldOfView::operator!=(FieldOfView const& other) const {
    return horizontal != other.horizontal || vertical != other.vertical ||
           diagonal != other.diagonal;
}

FieldOfView FieldOfView::operator-() const {
    return FieldOfView(-horizontal, -vertical, -diagonal);
}

FieldOfView& FieldOfView::operator+=(FieldOfView const& other) {
    horizontal += other.horizontal;
    vertical += other.vertical;
    diagonal += other.diagonal;
    return *this;
}

FieldOfView& FieldOfView::operator-=(FieldOfView const& other) {
    horizontal -= other.horizontal;
    vertical -= other.vertical;
    diagonal -= other.diagonal;
    return *this;
}

FieldOfView& FieldOfView::operator*=(float factor) {
    horizontal *= factor;
    vertical *= factor;
    diagonal *= factor;
    return *this;
}

FieldOfView& FieldOfView::operator/=(float divisor) {
    horizontal /= divisor;
    vertical /= divisor;
    diagonal /= divisor;
    return *this;
}

FieldOfView FieldOfView::operator+(FieldOfView const& other) const {
    return FieldOfView(horizontal + other.horizontal, vertical + other.vertical,
                       diagonal + other.diagonal);
}

FieldOfView FieldOfView::operator-(FieldOfView const& other) const {
    return FieldOfView(horizontal - other.horizontal, vertical - other.vertical,
                       diagonal - other.diagonal);
}

FieldOfView FieldOfView::operator*(float factor) const {
    return FieldOfView(horizontal * factor, vertical * factor, diagonal * factor);
}

FieldOfView FieldOfView::operator/(float divisor) const {
    return FieldOfView(horizontal / divisor, vertical / divisor, diagonal / divisor);
}

void FieldOfView::SetZero() {
    horizontal = 0.0f;
    vertical = 0.0f;
    diagonal = 0.0f;
}

bool FieldOfView::Valid() const {
    return FloatingPoint::is_finite(horizontal) && FloatingPoint::is_finite(vertical) &&
           FloatingPoint::is_finite(diagonal);
}

FieldOfView operator*(float factor, FieldOfView const& angles) {
    return FieldOfView(factor * angles.horizontal, factor * angles.vertical,
                       factor * angles.diagonal);
}

FieldOfView operator/(float numerator, FieldOfView const& angles) {
    return FieldOfView(numerator / angles.horizontal, numerator / angles.vertical,
                       numerator / angles.diagonal);
}

}  // namespace quorvel::vexmap
