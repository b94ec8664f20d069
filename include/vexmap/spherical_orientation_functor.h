#pragma once

#include "vexmap/orientation_functor.h"

namespace quorvel::vexmap {

/// Turns a fisheye point (radius f times the angle off the axis): it becomes a direction, turns
/// from the object's frame into the world's, and becomes a fisheye point again. One thread.
class SphericalOrientationFunctor : public OrientationFunctor {
public:
    SphericalOrientationFunctor();
    SphericalOrientationFunctor(SphericalOrientationFunctor const& other);
    SphericalOrientationFunctor(EulerAngles const& orientation, float f);
    SphericalOrientationFunctor(PtzPosition const& position, float f);
    SphericalOrientationFunctor& operator=(SphericalOrientationFunctor const& other);
    ~SphericalOrientationFunctor() override;

    Vector2d Call(Vector2d const& point) override;
};

}  // namespace quorvel::vexmap
