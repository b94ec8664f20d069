#pragma once

#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// The one built-in camera model: a circular fisheye of 183 degrees on a 1936 x 1936 sensor.
extern _DEWARP_INTERNAL_CAMERA_MODEL const TarvexBrenvia418;

_DEWARP_INTERNAL_CAMERA_MODEL GetTarvexBrenvia418Camera();

}  // namespace quorvel::vexmap
