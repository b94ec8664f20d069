#include "vexmap/size_2d.h"

namespace quorvel::vexmap {

Point2d const Point2d::Origin;

Point2d::Point2d() : x(0), y(0) {}

Point2d::Point2d(Point2d const& other) = default;

Point2d& Point2d::operator=(Point2d const& other) = default;

Point2d::~Point2d() = default;

bool Point2d::operator==(Point2d const& other) const {
    return x == other.x && y == other.y;
}

bool Point2d::operator!=(Point2d const& other) const {
    return x != other.x || y != other.y;
}

void Point2d::SetZero() {
    x = 0;
    y = 0;
}

Point2d& Point2d::Scale(Point2d const& factors) {
    x *= factors.x;
    y *= factors.y;
    return *this;
}

Point2d operator*(int factor, Point2d const& point) {
    Point2d product;
    product.x = factor * point.x;
    product.y = factor * point.y;
    return product;
}

Point2d operator/(int numerator, Point2d const& point) {
    Point2d quotient;
    quotient.x = numerator / point.x;  // unguarded by intent: a zero component faults
    quotient.y = numerator / point.y;
    return quotient;
}

}  // namespace quorvel::vexmap
