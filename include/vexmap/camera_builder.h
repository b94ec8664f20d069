#pragma once

#include "vexmap/camera.h"

namespace quorvel::vexmap {

/// Makes the camera class of a model's lens type. Holds nothing; any thread.
class CameraBuilder {
public:
    CameraBuilder();
    CameraBuilder(CameraBuilder const& other);
    CameraBuilder& operator=(CameraBuilder const& other);  // copies nothing
    virtual ~CameraBuilder();

    /// A new fisheye or rectilinear camera that the caller owns, or null for another type.
    static Camera* MakeCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                              _DEWARP_INTERNAL_CAMERA_MOUNT mount);
};

}  // namespace quorvel::vexmap
