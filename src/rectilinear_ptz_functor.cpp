#include "vexmap/rectilinear_ptz_functor.h"

#include "vexmap/log.h"
#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {

RectilinearPtzFunctor::RectilinearPtzFunctor() = default;

RectilinearPtzFunctor::RectilinearPtzFunctor(RectilinearPtzFunctor const& other) = default;

RectilinearPtzFunctor::RectilinearPtzFunctor(PtzPosition const& position, float f,
                                             Vector2d const& shift_value)
    : PtzFunctor(position, f), shift(shift_value) {}

// The base is set from the position here and once more by Setup, which logs the line once.
RectilinearPtzFunctor::RectilinearPtzFunctor(Camera const& camera, PtzPosition const& position,
                                             Vector2d const& shift_value)
    : PtzFunctor(position, camera.GetFocalLength()), shift(shift_value) {
    Setup(camera, position);
}

RectilinearPtzFunctor& RectilinearPtzFunctor::operator=(RectilinearPtzFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "RectilinearPtzFunctor");
        return *this;
    }
    PtzFunctor::operator=(other);
    shift = other.shift;
    return *this;
}

RectilinearPtzFunctor::~RectilinearPtzFunctor() = default;

void RectilinearPtzFunctor::Setup(Camera const& camera, PtzPosition const& position) {
    Log::info(__LINE__, __FILE__, "Setup", "Setting up rectilinear functor\n");
    Set(position, camera.GetFocalLength());
}

// Zooming is the division after the turn; PtzFunctor::Zoom takes no part.
Vector2d RectilinearPtzFunctor::RectilinearPerspective(Vector2d const& p, float f,
                                                       RotationMatrix3d const& m,
                                                       Vector2d const& shift_value,
                                                       float zoom_value) {
    Vector3d const turned =
        m.ObjectToInertial(Vector3d(p.x + shift_value.x, p.y + shift_value.y, f));
    Vector2d const projected(turned.x * f / turned.z, turned.y * f / turned.z);
    return projected / zoom_value - shift_value;
}

Vector2d RectilinearPtzFunctor::Call(Vector2d const& point) {
    return RectilinearPerspective(point, focal_length, rotation, shift, zoom);
}

}  // namespace quorvel::vexmap
