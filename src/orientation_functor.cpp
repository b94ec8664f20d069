#include "vexmap/orientation_functor.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

OrientationFunctor::OrientationFunctor() : focal_length(FloatingPoint::Nan) {}

OrientationFunctor::OrientationFunctor(OrientationFunctor const& other) = default;

OrientationFunctor::OrientationFunctor(EulerAngles const& orientation, float f)
    : focal_length(FloatingPoint::Nan) {
    Set(orientation, f);
}

OrientationFunctor::OrientationFunctor(PtzPosition const& position, float f)
    : focal_length(FloatingPoint::Nan) {
    Set(position, f);
}

OrientationFunctor& OrientationFunctor::operator=(OrientationFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "OrientationFunctor");
        return *this;
    }
    rotation = other.rotation;
    focal_length = other.focal_length;
    return *this;
}

OrientationFunctor::~OrientationFunctor() = default;

void OrientationFunctor::Set(EulerAngles const& orientation, float f) {
    rotation.Setup(orientation);
    focal_length = f;
}

void OrientationFunctor::Set(PtzPosition const& position, float f) {
    Set(position.orientation, f);
}

}  // namespace quorvel::vexmap
