#include "vexmap/rectilinear_camera.h"

#include "vexmap/log.h"

namespace quorvel::vexmap {

RectilinearCamera::RectilinearCamera() = default;

RectilinearCamera::RectilinearCamera(RectilinearCamera const& other) = default;

RectilinearCamera::RectilinearCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                                     _DEWARP_INTERNAL_CAMERA_MOUNT mount)
    : Camera(model, mount) {}

// Copies nothing, not even the camera part, unlike Camera's own assignment: kept so.
RectilinearCamera& RectilinearCamera::operator=(RectilinearCamera const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "RectilinearCamera");
    }
    return *this;
}

RectilinearCamera::~RectilinearCamera() = default;

PtzPosition RectilinearCamera::GetHomePosition() const {
    return PtzPosition::Identity;
}

Vector2d RectilinearCamera::MapHitPoint(Vector2d const&) const {
    return Vector2d::InvalidVector;
}

}  // namespace quorvel::vexmap
