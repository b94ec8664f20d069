#pragma once

namespace quorvel::vexmap {

/// A pair of whole numbers, x right and y up. Nothing in the engine calls its operations; they
/// are kept as the rest of the value classes have them. A value; any thread.
class Point2d {
public:
    static Point2d const Origin;  // (0, 0)

    Point2d();  // (0, 0); there is no constructor from two values: x and y are set directly
    Point2d(Point2d const& other);
    Point2d& operator=(Point2d const& other);
    virtual ~Point2d();

    bool operator==(Point2d const& other) const;
    bool operator!=(Point2d const& other) const;

    void SetZero();
    /// Multiplies component by component, in place.
    Point2d& Scale(Point2d const& factors);

    int x;
    int y;
};

Point2d operator*(int factor, Point2d const& point);
/// (n / x, n / y) in integer division. A zero component is left unguarded on purpose: it faults.
Point2d operator/(int numerator, Point2d const& point);

}  // namespace quorvel::vexmap
