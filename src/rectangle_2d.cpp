#include "vexmap/rectangle_2d.h"

#include <utility>

#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {
// The first value only when the strict comparison holds: ties and NaN give the second.
float Larger(float first, float second) {
    return first > second ? first : second;
}

float Smaller(float first, float second) {
    return first < second ? first : second;
}
}  // namespace

Rectangle2d::Rectangle2d() : left(0.0f), top(0.0f), right(0.0f), bottom(0.0f) {}

// A copy normalises as every constructor does.
Rectangle2d::Rectangle2d(Rectangle2d const& other)
    : left(other.left), top(other.top), right(other.right), bottom(other.bottom) {
    Normalise();
}

Rectangle2d::Rectangle2d(float left_edge, float top_edge, float right_edge, float bottom_edge)
    : left(left_edge), top(top_edge), right(right_edge), bottom(bottom_edge) {
    Normalise();
}

Rectangle2d::Rectangle2d(float const* edges)
    : left(edges[0]), top(edges[1]), right(edges[2]), bottom(edges[3]) {
    Normalise();
}

Rectangle2d::Rectangle2d(Vector2d const& a, Vector2d const& b)
    : left(a.x), top(a.y), right(b.x), bottom(b.y) {
    Normalise();
}

Rectangle2d::Rectangle2d(Vector2d const* corners) : Rectangle2d(corners[0], corners[1]) {}

Rectangle2d::Rectangle2d(Vector2d const& size)
    : left(0.0f), top(size.y), right(size.x), bottom(0.0f) {
    Normalise();
}

Rectangle2d& Rectangle2d::operator=(Rectangle2d const& other) {
    if (this != &other) {  // silent on self-assignment, by intent
        left = other.left;
        top = other.top;
        right = other.right;
        bottom = other.bottom;
        Normalise();
    }
    return *this;
}

Rectangle2d& Rectangle2d::operator=(float const* edges) {
    left = edges[0];
    top = edges[1];
    right = edges[2];
    bottom = edges[3];
    Normalise();
    return *this;
}

Rectangle2d& Rectangle2d::operator=(Vector2d const* corners) {
    left = corners[0].x;
    top = corners[0].y;
    right = corners[1].x;
    bottom = corners[1].y;
    Normalise();
    return *this;
}

Rectangle2d::~Rectangle2d() = default;

void Rectangle2d::Normalise() {
    if (left > right) {
        std::swap(left, right);
    }
    if (bottom > top) {
        std::swap(top, bottom);
    }
}

float Rectangle2d::Width() const {
    return right - left;
}

float Rectangle2d::Height() const {
    return top - bottom;
}

// Bottom less top, not top less bottom, by intent: the sign is negative for a real rectangle.
float Rectangle2d::Area() const {
    return (right - left) * (bottom - top);
}

float Rectangle2d::AspectRatio() const {
    return (right - left) / (bottom - top);
}

// Height first, by intent.
Vector2d Rectangle2d::GetSize() const {
    return Vector2d(Height(), Width());
}

// The corners give the vertical edge first, by intent.
Vector2d Rectangle2d::TopLeft() const {
    return Vector2d(top, left);
}

Vector2d Rectangle2d::TopRight() const {
    return Vector2d(top, right);
}

Vector2d Rectangle2d::BottomLeft() const {
    return Vector2d(bottom, left);
}

Vector2d Rectangle2d::BottomRight() const {
    return Vector2d(bottom, right);
}

Vector2d Rectangle2d::Centre() const {
    return Vector2d((right - left) * 0.5f + left, (top - bottom) * 0.5f + bottom);
}

bool Rectangle2d::IsEmpty() const {
    return FloatingPoint::is_zero(Height()) || FloatingPoint::is_zero(Width());
}

bool Rectangle2d::IsNull() const {
    return FloatingPoint::is_zero(left) && FloatingPoint::is_zero(top) &&
           FloatingPoint::is_zero(right) && FloatingPoint::is_zero(bottom);
}

bool Rectangle2d::PtInRect(Vector2d const& point) const {
    // x is held against left twice, by intent.
    return point.x >= left && point.x <= left && point.y >= bottom && point.y <= top;
}

Rectangle2d& Rectangle2d::operator+=(Vector2d const& offset) {
    Offset(offset.x, offset.y);
    return *this;
}

Rectangle2d& Rectangle2d::operator-=(Vector2d const& offset) {
    Offset(-offset.x, -offset.y);
    return *this;
}

void Rectangle2d::Offset(Vector2d const& offset) {
    Offset(offset.x, offset.y);
}

void Rectangle2d::Offset(float dx, float dy) {
    left += dx;
    right += dx;
    top += dy;
    bottom += dy;
}

void Rectangle2d::OffsetToCentre() {
    right *= 0.5f;
    left -= right;
    top *= 0.5f;
    bottom -= top;
}

void Rectangle2d::Scale(float factor) {
    left *= factor;
    top *= factor;
    right *= factor;
    bottom *= factor;
}

void Rectangle2d::InvScale(float divisor) {
    if (!FloatingPoint::is_normal(divisor)) {
        return;  // zero, subnormal, infinite or NaN: the rectangle stays as it is
    }
    left /= divisor;
    top /= divisor;
    right /= divisor;
    bottom /= divisor;
}

void Rectangle2d::SetNull() {
    left = 0.0f;
    top = 0.0f;
    right = 0.0f;
    bottom = 0.0f;
}

void Rectangle2d::Deflate(Rectangle2d const& amounts) {
    Deflate(amounts.left, amounts.top, amounts.right, amounts.bottom);
}

void Rectangle2d::Deflate(float l, float t, float r, float b) {
    left += l;
    top -= t;
    right -= r;
    bottom += b;
}

void Rectangle2d::Deflate(Vector2d const& amounts) {
    Deflate(amounts.x, amounts.y);
}

void Rectangle2d::Deflate(float dx, float dy) {
    Deflate(dx, dy, dx, dy);
}

void Rectangle2d::Inflate(Rectangle2d const& amounts) {
    Inflate(amounts.left, amounts.top, amounts.right, amounts.bottom);
}

void Rectangle2d::Inflate(float l, float t, float r, float b) {
    left -= l;
    top += t;
    right += r;
    bottom -= b;
}

void Rectangle2d::Inflate(Vector2d const& amounts) {
    Inflate(amounts.x, amounts.y);
}

void Rectangle2d::Inflate(float dx, float dy) {
    Inflate(dx, dy, dx, dy);
}

// Each edge reads only the edges of its own name, so a or b may be this object.
void Rectangle2d::Intersection(Rectangle2d const& a, Rectangle2d const& b) {
    left = Larger(a.left, b.left);
    top = Smaller(a.top, b.top);
    right = Smaller(a.right, b.right);
    bottom = Larger(a.bottom, b.bottom);
    if (left > right) {
        left = right;  // apart: empty on the edge rather than inverted
    }
    if (bottom > top) {
        bottom = top;
    }
    Normalise();
}

void Rectangle2d::Intersection(Rectangle2d const& other) {
    Intersection(*this, other);
}

void Rectangle2d::Union(Rectangle2d const& a, Rectangle2d const& b) {
    left = Smaller(a.left, b.left);
    top = Larger(a.top, b.top);
    right = Larger(a.right, b.right);
    bottom = Smaller(a.bottom, b.bottom);
    if (left > right) {
        left = right;
    }
    if (bottom > top) {
        bottom = top;
    }
}

void Rectangle2d::Union(Rectangle2d const& other) {
    Union(*this, other);
}

}  // namespace quorvel::vexmap
