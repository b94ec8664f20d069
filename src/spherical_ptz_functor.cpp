#include "vexmap/spherical_ptz_functor.h"

#include "vexmap/log.h"
#include "vexmap/rotation.h"

namespace quorvel::vexmap {

SphericalPtzFunctor::SphericalPtzFunctor() = default;

SphericalPtzFunctor::SphericalPtzFunctor(SphericalPtzFunctor const& other) = default;

SphericalPtzFunctor::SphericalPtzFunctor(PtzPosition const& position, float f)
    : PtzFunctor(position, f) {}

SphericalPtzFunctor& SphericalPtzFunctor::operator=(SphericalPtzFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "SphericalPtzFunctor");
        return *this;
    }
    PtzFunctor::operator=(other);
    return *this;
}

SphericalPtzFunctor::~SphericalPtzFunctor() = default;

Vector2d SphericalPtzFunctor::SphericalPerspective(Vector2d const& p, float f,
                                                   RotationMatrix3d const& m) {
    return Rotation::SphericalRotation(p, f, m);
}

Vector2d SphericalPtzFunctor::InvSphericalPerspective(Vector2d const& p, float f,
                                                      RotationMatrix3d const& m) {
    return Rotation::InverseSphericalRotation(p, f, m);
}

Vector2d SphericalPtzFunctor::Call(Vector2d const& point) {
    return SphericalPerspective(Zoom(point + zoom_centre, zoom), focal_length, rotation);
}

}  // namespace quorvel::vexmap
