#include "vexmap/spherical_orientation_functor.h"

#include "vexmap/log.h"
#include "vexmap/rotation.h"

namespace quorvel::vexmap {

SphericalOrientationFunctor::SphericalOrientationFunctor() = default;

SphericalOrientationFunctor::SphericalOrientationFunctor(SphericalOrientationFunctor const& other) =
    default;

SphericalOrientationFunctor::SphericalOrientationFunctor(EulerAngles const& orientation, float f)
    : OrientationFunctor(orientation, f) {}

SphericalOrientationFunctor::SphericalOrientationFunctor(PtzPosition const& position, float f)
    : OrientationFunctor(position, f) {}

SphericalOrientationFunctor& SphericalOrientationFunctor::operator=(
    SphericalOrientationFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "SphericalOrientationFunctor");
        return *this;
    }
    OrientationFunctor::operator=(other);
    return *this;
}

SphericalOrientationFunctor::~SphericalOrientationFunctor() = default;

Vector2d SphericalOrientationFunctor::Call(Vector2d const& point) {
    return Rotation::SphericalRotation(point, focal_length, rotation);
}

}  // namespace quorvel::vexmap
