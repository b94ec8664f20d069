#pragma once

#include <cstdint>

#include "vexmap/map_functor.h"
#include "vexmap/ptz_position.h"
#include "vexmap/rotation_matrix_3d.h"
#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// A link that applies a whole PTZ position in one step; how depends on the kind of picture, which
/// the derived classes give. No view builds one at present. One thread.
class PtzFunctor : public MapFunctor {
public:
    PtzFunctor();  // identity rotation, zoom 1, NaN focal length
    PtzFunctor(PtzFunctor const& other);
    PtzFunctor(PtzPosition const& position, float f);
    PtzFunctor& operator=(PtzFunctor const& other);
    ~PtzFunctor() override;

    /// The position's orientation and zoom at the focal length; the vectors back to zero.
    void Set(PtzPosition const& position, float f);
    /// Towards the zoom centre by the factor z.
    Vector2d Zoom(Vector2d const& point, float z) const;

    RotationMatrix3d rotation;
    float zoom;
    float focal_length;
    uint64_t reserved;  // copied, never otherwise used
    Vector2d reserved_a;
    Vector2d reserved_b;
    Vector2d reserved_c;
    Vector2d zoom_centre;  // nothing sets it to anything but zero
};

}  // namespace quorvel::vexmap
