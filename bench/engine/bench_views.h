#pragma once

#include <boost/shared_ptr.hpp>

#include "vexmap/camera.h"
#include "vexmap/camera_builder.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap::bench {

constexpr int SOURCE_SIZE = 2880;
constexpr float FISHEYE_DEGREES = 183.0f;
constexpr float OFF_AXIS_DEGREES = 30.0f;

/// The lens of the benchmarks: a 183-degree circular fisheye on a 2880 x 2880 sensor.
inline _DEWARP_INTERNAL_CAMERA_MODEL BenchModel() {
    return {DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE,
            FISHEYE_DEGREES,
            FISHEYE_DEGREES,
            FISHEYE_DEGREES,
            SOURCE_SIZE,
            SOURCE_SIZE};
}

/// The camera of the benchmarks, on the given mount: on a wall a pan turns the view off the lens
/// axis.
inline boost::shared_ptr<Camera> MakeBenchCamera(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return boost::shared_ptr<Camera>(CameraBuilder::MakeCamera(BenchModel(), mount));
}

/// A 90-degree rectilinear PTZ view looking 30 degrees off the lens axis, filling the output.
inline SinglePtzView MakeBenchPtzView(int width, int height) {
    SinglePtzView view(MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FILL);
    view.SetPtz(PtzPosition(
        EulerAngles(Trigonometry::degrees_to_radians(OFF_AXIS_DEGREES), 0.0f, 0.0f), 1.0f));
    view.SetDewarpedSize(Resolution(width, height));
    return view;
}

}  // namespace quorvel::vexmap::bench
