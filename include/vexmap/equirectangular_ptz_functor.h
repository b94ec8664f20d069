#pragma once

#include "vexmap/camera.h"
#include "vexmap/ptz_functor.h"

namespace quorvel::vexmap {

/// Applies a PTZ position to an equirectangular picture by shifting it by pan and tilt in pixels
/// and wrapping both axes at half a turn. Built at a focal length of 0 it would wrap forever, so
/// no caller may do that. One thread.
class EquirectangularPtzFunctor : public PtzFunctor {
public:
    EquirectangularPtzFunctor();  // no offset, NaN limit
    EquirectangularPtzFunctor(EquirectangularPtzFunctor const& other);
    EquirectangularPtzFunctor(Camera const& camera, PtzPosition const& position);
    EquirectangularPtzFunctor& operator=(EquirectangularPtzFunctor const& other);
    ~EquirectangularPtzFunctor() override;

    /// Only the limit and the offset: the rotation and zoom stay as they were set.
    void Setup(Camera const& camera, PtzPosition const& position);
    /// The point shifted by the offset, each axis wrapped into [-limit, limit] by whole turns.
    /// The vertical axis wraps like the horizontal one, which is not a spherical wrap; the zoom
    /// is not used.
    static Vector2d EquirectangularPerspective(Vector2d const& p, float zoom_value,
                                               float limit_value, Vector2d const& offset_value);
    Vector2d Call(Vector2d const& point) override;

    Vector2d offset;
    float limit;
};

}  // namespace quorvel::vexmap
