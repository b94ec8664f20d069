#pragma once

#include "vexmap/camera.h"

namespace quorvel::vexmap {

/// A circular fisheye lens (equidistant: radius f times the angle off the axis). Its home
/// orientation follows the mount. Assignment copies nothing, not even the camera part. Guarded by
/// its channel's lock.
class FisheyeCamera : public Camera {
public:
    static PtzPosition const CeilingOrientation;       // tilt a quarter turn
    static PtzPosition const FloorOrientation;         // tilt a quarter turn, roll half a turn
    static PtzPosition const WallOrientation;          // straight ahead
    static PtzPosition const InvertedWallOrientation;  // roll half a turn

    FisheyeCamera();
    FisheyeCamera(FisheyeCamera const& other);
    FisheyeCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
    FisheyeCamera& operator=(FisheyeCamera const& other);
    ~FisheyeCamera() override;

    /// The orientation of the mount; throws for a mount outside the four.
    PtzPosition GetHomePosition() const override;
    /// Pan and tilt, in radians, of a point hit in the warped image, with every step logged. On a
    /// ceiling or floor the scale of (0, 0) makes the result not finite, as it always has.
    Vector2d MapHitPoint(Vector2d const& point) const override;
    /// The point turned back from the home orientation, at the focal length f.
    Vector2d RotateHitPoint(Vector2d const& point, float f) const;
    /// The point from the camera's image to the equirectangular picture at the focal length f.
    Vector2d MapHitPoint(Vector2d const& point, float f) const;
};

}  // namespace quorvel::vexmap
