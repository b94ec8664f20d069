#include "vexmap/ptz_functor.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

PtzFunctor::PtzFunctor() : zoom(1.0f), focal_length(FloatingPoint::Nan), reserved(0) {}

PtzFunctor::PtzFunctor(PtzFunctor const& other) = default;

PtzFunctor::PtzFunctor(PtzPosition const& position, float f) : PtzFunctor() {
    Set(position, f);
}

PtzFunctor& PtzFunctor::operator=(PtzFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "PtzFunctor");
        return *this;
    }
    rotation = other.rotation;
    zoom = other.zoom;
    focal_length = other.focal_length;
    reserved = other.reserved;
    reserved_a = other.reserved_a;
    reserved_b = other.reserved_b;
    reserved_c = other.reserved_c;
    zoom_centre = other.zoom_centre;
    return *this;
}

PtzFunctor::~PtzFunctor() = default;

void PtzFunctor::Set(PtzPosition const& position, float f) {
    rotation.Setup(position.orientation);
    zoom = position.zoom;
    focal_length = f;
    reserved_a = Vector2d::ZeroVector;
    reserved_b = Vector2d::ZeroVector;
    reserved_c = Vector2d::ZeroVector;
    zoom_centre = Vector2d::ZeroVector;
}

Vector2d PtzFunctor::Zoom(Vector2d const& point, float z) const {
    return (point - zoom_centre) / z + zoom_centre;
}

}  // namespace quorvel::vexmap
