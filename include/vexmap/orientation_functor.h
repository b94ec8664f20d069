#pragma once

#include "vexmap/euler_angles.h"
#include "vexmap/map_functor.h"
#include "vexmap/ptz_position.h"
#include "vexmap/rotation_matrix_3d.h"

namespace quorvel::vexmap {

/// A link that turns points by an orientation at a focal length; how a point becomes a direction
/// is the derived class's. One thread.
class OrientationFunctor : public MapFunctor {
public:
    OrientationFunctor();  // identity rotation, NaN focal length
    OrientationFunctor(OrientationFunctor const& other);
    OrientationFunctor(EulerAngles const& orientation, float f);
    /// The position's zoom plays no part.
    OrientationFunctor(PtzPosition const& position, float f);
    OrientationFunctor& operator=(OrientationFunctor const& other);
    ~OrientationFunctor() override;

    void Set(EulerAngles const& orientation, float f);
    void Set(PtzPosition const& position, float f);

    RotationMatrix3d rotation;
    float focal_length;
};

}  // namespace quorvel::vexmap
