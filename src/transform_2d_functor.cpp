#include "vexmap/transform_2d_functor.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

Transform2dFunctor::Transform2dFunctor() = default;

Transform2dFunctor::Transform2dFunctor(Transform2dFunctor const& other) = default;

Transform2dFunctor::Transform2dFunctor(_TRANSFORM_2D const& transform) {
    Setup(transform);
}

Transform2dFunctor& Transform2dFunctor::operator=(Transform2dFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "Transform2dFunctor");
        return *this;
    }
    matrix = other.matrix;
    return *this;
}

Transform2dFunctor::~Transform2dFunctor() = default;

// Each step multiplies on the right, so the last one set up acts first on a point. One normal
// scale is enough for the scale step; a zero beside it then gives an infinite factor.
void Transform2dFunctor::Setup(_TRANSFORM_2D const& t) {
    matrix.SetIdentity();
    Matrix3x3 step;
    if (FloatingPoint::is_normal(t.scale_x) || FloatingPoint::is_normal(t.scale_y)) {
        step.Setup2dScale(1.0f / t.scale_x, 1.0f / t.scale_y);
        matrix *= step;
    }
    if (FloatingPoint::is_normal(t.angle)) {
        step.Setup2dRotation(t.centre_x, t.centre_y, t.angle);
        matrix *= step;
    }
    if (FloatingPoint::is_normal(t.offset_x) || FloatingPoint::is_normal(t.offset_y)) {
        step.Setup2dTranslation(t.offset_x, -t.offset_y);
        matrix *= step;
    }
    if (t.mirror_y || t.mirror_x) {
        step.Setup2dReflection(t.mirror_y, t.mirror_x);
        matrix *= step;
    }
}

Vector2d Transform2dFunctor::Call(Vector2d const& point) {
    return matrix * point;
}

}  // namespace quorvel::vexmap
