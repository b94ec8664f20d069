#pragma once

#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// The starting values of every setting of the engine. Constants only; read-only after load.
class Defaults {
public:
    static constexpr _DEWARP_LOG_LEVEL LogLevel = DEWARP_LOG_LEVEL_ERROR;
    static constexpr _DEWARP_LOG_FUNCTION LogFunction = nullptr;
    static constexpr _DEWARP_LOG_SETTINGS LogSettings{LogFunction, LogLevel};
    static constexpr _DEWARP_INTERPOLATION Interpolation = DEWARP_INTERPOLATION_1;
    static constexpr _DEWARP_PROJECTION Projection = DEWARP_PROJECTION_CYLINDRICAL;
    static constexpr _DEWARP_VIEW View = DEWARP_VIEW_SINGLE_PANORAMIC;
    static constexpr _DEWARP_ASPECT_RATIO AspectRatio = DEWARP_ASPECT_RATIO_STRETCH;
    static constexpr _DEWARP_INTERNAL_CAMERA_MOUNT CameraMount = DEWARP_INTERNAL_CAMERA_MOUNT_WALL;
    static constexpr _DEWARP_INTERNAL_CAMERA_TYPE CameraType =
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE;

    Defaults();
    Defaults(Defaults const& other);
    Defaults& operator=(Defaults const& other);  // copies nothing: there is nothing to copy
    virtual ~Defaults();
};

}  // namespace quorvel::vexmap
