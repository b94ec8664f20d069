#include "vexmap/camera_builder.h"

#include "vexmap/fisheye_camera.h"
#include "vexmap/log.h"
#include "vexmap/rectilinear_camera.h"

namespace quorvel::vexmap {

CameraBuilder::CameraBuilder() = default;

CameraBuilder::CameraBuilder(CameraBuilder const&) = default;

CameraBuilder& CameraBuilder::operator=(CameraBuilder const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "CameraBuilder");
    }
    return *this;
}

CameraBuilder::~CameraBuilder() = default;

Camera* CameraBuilder::MakeCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                                  _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    switch (model.type) {
        case DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE:
            return new FisheyeCamera(model, mount);
        case DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR:
            return new RectilinearCamera(model, mount);
    }
    return nullptr;
}

}  // namespace quorvel::vexmap
