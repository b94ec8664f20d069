#pragma once

#include <boost/shared_ptr.hpp>

#include "vexmap/camera.h"
#include "vexmap/camera_builder.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap::bench {

constexpr int SOURCE_SIZE = 2880;
constexpr float FISHEYE_DEGREES = 183.0f;
constexpr float OFF_AXIS_DEGREES = 30.0f;

/// The lens of the benchmarks: a 183-degree circular fisheye on a square sensor, 2880 x 2880
/// unless another side is given.
inline _DEWARP_INTERNAL_CAMERA_MODEL BenchModel(int side = SOURCE_SIZE) {
    return {DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE,
            FISHEYE_DEGREES,
            FISHEYE_DEGREES,
            FISHEYE_DEGREES,
            size_t(side),
            size_t(side)};
}

/// The camera of the benchmarks, on the given mount: on a wall a pan turns the view off the lens
/// axis.
inline boost::shared_ptr<Camera> MakeBenchCamera(_DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                                 int side = SOURCE_SIZE) {
    return boost::shared_ptr<Camera>(CameraBuilder::MakeCamera(BenchModel(side), mount));
}

/// A 90-degree rectilinear PTZ view looking 30 degrees off the lens axis, filling the output.
inline SinglePtzView MakeBenchPtzView(int width, int height, int side = SOURCE_SIZE) {
    SinglePtzView view(MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, side),
                       DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FILL);
    view.SetPtz(PtzPosition(
        EulerAngles(Trigonometry::degrees_to_radians(OFF_AXIS_DEGREES), 0.0f, 0.0f), 1.0f));
    view.SetDewarpedSize(Resolution(width, height));
    return view;
}

enum ViewKind { PTZ, PANORAMA, DUAL_PANORAMA, QUAD };

/// The PTZ view above; the panoramas and the quad view of the same lens on a ceiling, cylindrical
/// and rectilinear.
inline boost::shared_ptr<View> MakeView(ViewKind kind, int width, int height,
                                        int side = SOURCE_SIZE) {
    boost::shared_ptr<View> view;
    auto const ceiling = [side] {
        return MakeBenchCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, side);
    };
    switch (kind) {
        case PTZ:
            view.reset(new SinglePtzView(MakeBenchPtzView(width, height, side)));
            return view;
        case PANORAMA:
            view.reset(new SinglePanoramicView(ceiling(), DEWARP_PROJECTION_CYLINDRICAL));
            break;
        case DUAL_PANORAMA:
            view.reset(new DualPanoramicView(ceiling(), DEWARP_PROJECTION_CYLINDRICAL));
            break;
        case QUAD:
            view.reset(new QuadPtzView(ceiling(), DEWARP_PROJECTION_RECTILINEAR));
            break;
    }
    view->SetDewarpedSize(Resolution(float(width), float(height)));
    return view;
}

}  // namespace quorvel::vexmap::bench
