#pragma once

#include "vexmap/ptz_functor.h"

namespace quorvel::vexmap {

/// Applies a PTZ position to a fisheye picture: zoom about the centre, then turn the point on the
/// sphere. One thread.
class SphericalPtzFunctor : public PtzFunctor {
public:
    SphericalPtzFunctor();
    SphericalPtzFunctor(SphericalPtzFunctor const& other);
    SphericalPtzFunctor(PtzPosition const& position, float f);
    SphericalPtzFunctor& operator=(SphericalPtzFunctor const& other);
    ~SphericalPtzFunctor() override;

    /// A fisheye point turned from the object's frame into the world's.
    static Vector2d SphericalPerspective(Vector2d const& p, float f, RotationMatrix3d const& m);
    /// The other way round; Call does not use it.
    static Vector2d InvSphericalPerspective(Vector2d const& p, float f, RotationMatrix3d const& m);
    Vector2d Call(Vector2d const& point) override;
};

}  // namespace quorvel::vexmap
