#include "vexmap/tarvex_brenvia_418.h"

namespace quorvel::vexmap {

_DEWARP_INTERNAL_CAMERA_MODEL const TarvexBrenvia418{
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 183.0f, 183.0f, 183.0f, 1936, 1936};

_DEWARP_INTERNAL_CAMERA_MODEL GetTarvexBrenvia418Camera() {
    return TarvexBrenvia418;
}

}  // namespace quorvel::vexmap
