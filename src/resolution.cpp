#include "vexmap/resolution.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {
// A Resolution that keeps a fraction, for the results that are not floored.
Resolution Unfloored(float width, float height) {
    Resolution size;
    size.x = width;
    size.y = height;
    return size;
}
}  // namespace

// Written from Vector2d::InvalidVector, which is built later at load, so what is in force is
// floor(0) twice; defined as (0, 0) here to depend on no order of initialisation.
Resolution const Resolution::InvalidResolution(0.0f, 0.0f);

Resolution::Resolution() = default;

Resolution::Resolution(Resolution const& other) = default;

Resolution::Resolution(Vector2d const& vector)
    : Vector2d(FloatingPoint::floor(vector.x), FloatingPoint::floor(vector.y)) {}

Resolution::Resolution(float width, float height)
    : Vector2d(FloatingPoint::floor(width), FloatingPoint::floor(height)) {}

Resolution::Resolution(int width, int height) : Vector2d(float(width), float(height)) {}

Resolution::Resolution(unsigned int width, unsigned int height)
    : Vector2d(float(width), float(height)) {}

Resolution& Resolution::operator=(Resolution const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Resolution");
        return *this;
    }
    Vector2d::operator=(other);
    return *this;
}

Resolution& Resolution::operator=(Vector2d const& other) {
    x = FloatingPoint::floor(other.x);
    y = FloatingPoint::floor(other.y);
    return *this;
}

Resolution::~Resolution() = default;

Resolution Resolution::operator-() const {
    return Resolution(Vector2d::operator-());
}

Resolution Resolution::operator+(Vector2d const& other) const {
    return Resolution(Vector2d::operator+(other));
}

Resolution Resolution::operator-(Vector2d const& other) const {
    return Resolution(Vector2d::operator-(other));
}

Resolution Resolution::operator*(float factor) const {
    return Resolution(Vector2d::operator*(factor));
}

Resolution Resolution::operator/(float divisor) const {
    return Resolution(Vector2d::operator/(divisor));
}

Resolution& Resolution::operator+=(Vector2d const& other) {
    x += other.x;
    y += other.y;
    return *this;
}

Resolution& Resolution::operator-=(Vector2d const& other) {
    x -= other.x;
    y -= other.y;
    return *this;
}

Resolution& Resolution::operator*=(float factor) {
    x *= factor;
    y *= factor;
    return *this;
}

Resolution& Resolution::operator/=(float divisor) {
    x /= divisor;
    y /= divisor;
    return *this;
}

float Resolution::AspectRatio() const {
    return x / y;
}

Resolution Resolution::BestFit(float aspect) const {
    if (x / y <= aspect) {
        return Unfloored(x, x / aspect);  // narrower than the aspect: the width decides
    }
    return Unfloored(aspect * y, y);
}

float Resolution::BestScale(Resolution const& other) const {
    if (x / y <= other.x / other.y) {
        return x / other.x;
    }
    return y / other.y;
}

Vector2d Resolution::NearestNeighbour(Vector2d const& point) const {
    Vector2d nearest(FloatingPoint::nearbyint(point.x), FloatingPoint::nearbyint(point.y));
    // The lower limit is tested first, so a negative size wins over it.
    if (nearest.x < 0.0f) {
        nearest.x = 0.0f;
    }
    if (nearest.x > x) {
        nearest.x = x;  // the width itself, one past the last column, by intent
    }
    if (nearest.y < 0.0f) {
        nearest.y = 0.0f;
    }
    if (nearest.y > y) {
        nearest.y = y;
    }
    return nearest;
}

bool Resolution::Valid() const {
    return Vector2d::Valid() && x > 0.0f && y > 0.0f;
}

Vector2d Resolution::Centre() const {
    return Vector2d(x / 2.0f, y / 2.0f);
}

Vector2d Resolution::North() const {
    return Vector2d(x / 2.0f, y);
}

Vector2d Resolution::South() const {
    return Vector2d(x / 2.0f, 0.0f);
}

Vector2d Resolution::East() const {
    return Vector2d(x, y / 2.0f);
}

Vector2d Resolution::West() const {
    return Vector2d(0.0f, y / 2.0f);
}

Vector2d Resolution::NorthEast() const {
    return Vector2d(x, y);
}

Vector2d Resolution::SouthEast() const {
    return Vector2d(x, 0.0f);
}

Vector2d Resolution::NorthWest() const {
    return Vector2d(0.0f, y);
}

Vector2d Resolution::SouthWest() const {
    return Vector2d(0.0f, 0.0f);
}

Vector2d Resolution::NorthOffset() const {
    return Vector2d(0.0f, y / 2.0f);
}

Vector2d Resolution::SouthOffset() const {
    return Vector2d(0.0f, -y / 2.0f);
}

Vector2d Resolution::EastOffset() const {
    return Vector2d(x / 2.0f, 0.0f);
}

Vector2d Resolution::WestOffset() const {
    return Vector2d(-x / 2.0f, 0.0f);
}

Vector2d Resolution::NorthEastOffset() const {
    return Vector2d(x / 2.0f, y / 2.0f);
}

Vector2d Resolution::SouthEastOffset() const {
    return Vector2d(x / 2.0f, -y / 2.0f);
}

Vector2d Resolution::NorthWestOffset() const {
    return Vector2d(-x / 2.0f, y / 2.0f);
}

Vector2d Resolution::SouthWestOffset() const {
    return Vector2d(-x / 2.0f, -y / 2.0f);
}

}  // namespace quorvel::vexmap
