#pragma once

#include "vexmap/camera.h"
#include "vexmap/ptz_functor.h"

namespace quorvel::vexmap {

/// Applies a PTZ position to a rectilinear picture: the shifted ray is turned, projected back onto
/// the plane and divided by the zoom. A point behind the camera projects through to the front.
/// One thread.
class RectilinearPtzFunctor : public PtzFunctor {
public:
    RectilinearPtzFunctor();
    RectilinearPtzFunctor(RectilinearPtzFunctor const& other);
    RectilinearPtzFunctor(PtzPosition const& position, float f, Vector2d const& shift_value);
    RectilinearPtzFunctor(Camera const& camera, PtzPosition const& position,
                          Vector2d const& shift_value);
    RectilinearPtzFunctor& operator=(RectilinearPtzFunctor const& other);
    ~RectilinearPtzFunctor() override;

    /// The position at the camera's focal length; logs that it does so.
    void Setup(Camera const& camera, PtzPosition const& position);
    static Vector2d RectilinearPerspective(Vector2d const& p, float f, RotationMatrix3d const& m,
                                           Vector2d const& shift_value, float zoom_value);
    Vector2d Call(Vector2d const& point) override;

    Vector2d shift;
};

}  // namespace quorvel::vexmap
