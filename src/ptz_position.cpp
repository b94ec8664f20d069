#include "vexmap/ptz_position.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {
float NormalisedRadians(float degrees) {
    return Trigonometry::normalise_angle(Trigonometry::degrees_to_radians(degrees));
}
}  // namespace

EulerAngles const PtzPosition::DefaultOrientation(0.0f, 0.0f, 0.0f);
PtzPosition const PtzPosition::Identity(EulerAngles(0.0f, 0.0f, 0.0f), 1.0f);

PtzPosition::PtzPosition() : orientation(0.0f, 0.0f, 0.0f), zoom(DefaultZoom) {}

PtzPosition::PtzPosition(PtzPosition const& other) = default;

PtzPosition::PtzPosition(EulerAngles const& orientation_value, float zoom_value)
    : orientation(orientation_value), zoom(zoom_value) {}

PtzPosition::PtzPosition(_DEWARP_PTZ_POSITION const& record) : PtzPosition() {
    Set(record);
}

PtzPosition& PtzPosition::operator=(PtzPosition const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "PtzPosition");
        return *this;
    }
    orientation = other.orientation;
    zoom = other.zoom;
    return *this;
}

PtzPosition& PtzPosition::operator=(_DEWARP_PTZ_POSITION const& record) {
    Set(record);
    return *this;
}

PtzPosition::~PtzPosition() = default;

void PtzPosition::Set(_DEWARP_PTZ_POSITION const& record) {
    orientation.pan = NormalisedRadians(record.pan);
    orientation.tilt = NormalisedRadians(record.tilt);
    orientation.roll = NormalisedRadians(record.roll);
    zoom = record.zoom;
}

void PtzPosition::Get(_DEWARP_PTZ_POSITION& record) const {
    record.pan = Trigonometry::radians_to_degrees(orientation.pan);
    record.tilt = Trigonometry::radians_to_degrees(orientation.tilt);
    record.roll = Trigonometry::radians_to_degrees(orientation.roll);
    record.zoom = zoom;
}

_DEWARP_PTZ_POSITION PtzPosition::Get() const {
    _DEWARP_PTZ_POSITION record{};
    Get(record);
    return record;
}

bool PtzPosition::operator==(PtzPosition const& other) const {
    return orientation == other.orientation && !FloatingPoint::is_lessgreater(zoom, other.zoom);
}

bool PtzPosition::operator!=(PtzPosition const& other) const {
    return orientation != other.orientation || FloatingPoint::is_lessgreater(zoom, other.zoom);
}

bool PtzPosition::IsValid() const {
    return orientation != EulerAngles::Invalid && FloatingPoint::is_normal(zoom);
}

void PtzPosition::SetIdentity() {
    orientation = EulerAngles::Identity;
}

void PtzPosition::Clear() {
    orientation = EulerAngles::Invalid;
    zoom = FloatingPoint::Nan;
}

void PtzPosition::Concatenate(PtzPosition const& other) {
    orientation.Concatenate(other.orientation);
    zoom *= other.zoom;
}

void PtzPosition::Concatenate(EulerAngles const& other) {
    orientation.Concatenate(other);
}

PtzPosition PtzPosition::Concatenate(PtzPosition const& a, PtzPosition const& b) {
    PtzPosition result(a);
    result.Concatenate(b);
    return result;
}

}  // namespace quorvel::vexmap
