#pragma once

#include "vexmap/map_functor.h"
#include "vexmap/matrix_3x3.h"

namespace quorvel::vexmap {

/// The planar link of a chain: scale, rotate, shift and mirror in one affine matrix. A point is
/// mirrored first, then shifted, rotated and scaled. One thread.
class Transform2dFunctor : public MapFunctor {
public:
    /// A transform by its parts. A part whose values are 0 (or not normal numbers) is skipped.
    struct _TRANSFORM_2D {
        float centre_x;  // rotation centre
        float centre_y;
        float angle;  // radians
        float offset_x;
        float offset_y;  // positive upward: negated when applied
        float scale_x;   // divisor of x
        float scale_y;   // divisor of y
        bool mirror_y;
        bool mirror_x;
    };

    Transform2dFunctor();  // identity
    Transform2dFunctor(Transform2dFunctor const& other);
    explicit Transform2dFunctor(_TRANSFORM_2D const& transform);
    Transform2dFunctor& operator=(Transform2dFunctor const& other);
    ~Transform2dFunctor() override;

    void Setup(_TRANSFORM_2D const& transform);
    /// The matrix times (x, y, 1), without its third row.
    Vector2d Call(Vector2d const& point) override;

    Matrix3x3 matrix;
};

}  // namespace quorvel::vexmap
