#pragma once

#include "vexmap/camera.h"

namespace quorvel::vexmap {

/// An ordinary rectilinear lens. It looks straight ahead and a hit point means nothing on it.
/// Assignment copies nothing, not even the camera part. Guarded by its channel's lock.
class RectilinearCamera : public Camera {
public:
    RectilinearCamera();
    RectilinearCamera(RectilinearCamera const& other);
    RectilinearCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                      _DEWARP_INTERNAL_CAMERA_MOUNT mount);
    RectilinearCamera& operator=(RectilinearCamera const& other);
    ~RectilinearCamera() override;

    PtzPosition GetHomePosition() const override;                // the identity
    Vector2d MapHitPoint(Vector2d const& point) const override;  // always invalid
};

}  // namespace quorvel::vexmap
