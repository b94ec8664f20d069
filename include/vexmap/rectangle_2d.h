#pragma once

#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// An axis-parallel rectangle with y up: once normalised, left <= right and bottom <= top, so
/// top holds the larger y. Constructors and assignments normalise; the changes in place do not
/// unless they say so. A value; any thread.
class Rectangle2d {
public:
    Rectangle2d();  // all four 0
    Rectangle2d(Rectangle2d const& other);
    Rectangle2d(float left_edge, float top_edge, float right_edge, float bottom_edge);
    /// Four floats: left, top, right, bottom.
    explicit Rectangle2d(float const* edges);
    /// left = a.x, top = a.y, right = b.x, bottom = b.y.
    Rectangle2d(Vector2d const& a, Vector2d const& b);
    /// As from two vectors, a = corners[0] and b = corners[1].
    explicit Rectangle2d(Vector2d const* corners);
    /// (0, size.y, size.x, 0).
    explicit Rectangle2d(Vector2d const& size);
    /// Self-assignment does nothing and, unlike most of the engine, logs nothing: intended.
    Rectangle2d& operator=(Rectangle2d const& other);
    Rectangle2d& operator=(float const* edges);
    Rectangle2d& operator=(Vector2d const* corners);
    virtual ~Rectangle2d();

    void Normalise();

    float Width() const;   // right - left
    float Height() const;  // top - bottom
    /// (right - left) * (bottom - top): zero or negative once normalised, by intent.
    float Area() const;
    /// (right - left) / (bottom - top), of the sign of Area(), by intent.
    float AspectRatio() const;
    /// (Height(), Width()): the vertical value first, by intent, as in the corners below.
    Vector2d GetSize() const;
    Vector2d TopLeft() const;      // (top, left)
    Vector2d TopRight() const;     // (top, right)
    Vector2d BottomLeft() const;   // (bottom, left)
    Vector2d BottomRight() const;  // (bottom, right)
    Vector2d Centre() const;       // x first
    /// Zero height or zero width.
    bool IsEmpty() const;
    /// All four edges zero.
    bool IsNull() const;
    /// Compares x with left on both sides, by intent: only points on the left edge are inside.
    bool PtInRect(Vector2d const& point) const;

    Rectangle2d& operator+=(Vector2d const& offset);
    Rectangle2d& operator-=(Vector2d const& offset);
    void Offset(Vector2d const& offset);
    void Offset(float dx, float dy);
    /// Halves right and top, then takes them from left and bottom: (0, h, w, 0) becomes
    /// (-w/2, h/2, w/2, -h/2), the frame centred on the origin.
    void OffsetToCentre();
    void Scale(float factor);
    /// Divides all four by divisor, only when it is a normal float; otherwise nothing.
    void InvScale(float divisor);
    void SetNull();

    // Deflate moves each edge inwards by its amount, Inflate outwards.
    void Deflate(Rectangle2d const& amounts);
    void Deflate(float l, float t, float r, float b);
    void Deflate(Vector2d const& amounts);
    void Deflate(float dx, float dy);
    void Inflate(Rectangle2d const& amounts);
    void Inflate(float l, float t, float r, float b);
    void Inflate(Vector2d const& amounts);
    void Inflate(float dx, float dy);

    /// The overlap of a and b, in this object; rectangles that do not meet leave an empty one on
    /// an edge. On a tie or a NaN the edge of b is taken. Normalises.
    void Intersection(Rectangle2d const& a, Rectangle2d const& b);
    void Intersection(Rectangle2d const& other);
    /// The bounds of a and b, in this object, with the tie rule of Intersection. Does not
    /// normalise.
    void Union(Rectangle2d const& a, Rectangle2d const& b);
    void Union(Rectangle2d const& other);

    float left;
    float top;
    float right;
    float bottom;
};

}  // namespace quorvel::vexmap
