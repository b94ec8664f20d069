#include "vexmap/equirectangular_ptz_functor.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/projection.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

// Strict comparisons: a value at the limit stays, and NaN leaves at once.
float Wrapped(float value, float limit) {
    while (FloatingPoint::is_less(value, -limit)) {
        value += 2.0f * limit;
    }
    while (FloatingPoint::is_greater(value, limit)) {
        value -= 2.0f * limit;
    }
    return value;
}

}  // namespace

EquirectangularPtzFunctor::EquirectangularPtzFunctor() : limit(FloatingPoint::Nan) {}

EquirectangularPtzFunctor::EquirectangularPtzFunctor(EquirectangularPtzFunctor const& other) =
    default;

EquirectangularPtzFunctor::EquirectangularPtzFunctor(Camera const& camera,
                                                     PtzPosition const& position)
    : PtzFunctor(position, camera.GetFocalLength()), limit(FloatingPoint::Nan) {
    Setup(camera, position);
}

EquirectangularPtzFunctor& EquirectangularPtzFunctor::operator=(
    EquirectangularPtzFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "EquirectangularPtzFunctor");
        return *this;
    }
    PtzFunctor::operator=(other);
    offset = other.offset;
    limit = other.limit;
    return *this;
}

EquirectangularPtzFunctor::~EquirectangularPtzFunctor() = default;

void EquirectangularPtzFunctor::Setup(Camera const& camera, PtzPosition const& position) {
    float const f = camera.GetFocalLength();
    limit =
        Projection::EquirectangularResolution(Vector2d(Trigonometry::PI, Trigonometry::PI), f).x;
    offset = Projection::EquirectangularResolution(
        Vector2d(position.orientation.pan, position.orientation.tilt), f);
}

Vector2d EquirectangularPtzFunctor::EquirectangularPerspective(Vector2d const& p, float,
                                                               float limit_value,
                                                               Vector2d const& offset_value) {
    Vector2d const shifted = p + offset_value;
    return Vector2d(Wrapped(shifted.x, limit_value), Wrapped(shifted.y, limit_value));
}

Vector2d EquirectangularPtzFunctor::Call(Vector2d const& point) {
    return EquirectangularPerspective(Zoom(point, zoom), zoom, limit, offset);
}

}  // namespace quorvel::vexmap
