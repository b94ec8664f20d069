#include "vexmap/ptz_range.h"

#include <cstdio>
#include <string>

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

float NormalisedRadians(float degrees) {
    return Trigonometry::normalise_angle(Trigonometry::degrees_to_radians(degrees));
}

// Half an angle each way, normalised; the upper bound first.
Vector2d SymmetricInterval(float angle) {
    float const half = Trigonometry::normalise_angle(angle * 0.5f);
    return Vector2d(half, -half);
}

float Limited(float value, Vector2d const& interval) {
    if (FloatingPoint::is_less(value, interval.y)) {
        value = interval.y;
    }
    if (FloatingPoint::is_greater(value, interval.x)) {
        value = interval.x;
    }
    return value;
}

// Written straight to the standard error stream, not to the log.
void Announce(char const* message) {
    fwrite(message, 1, std::char_traits<char>::length(message), stderr);
}

}  // namespace

// Every constant is written with its value, so none depends on the order in which the translation
// units are initialised. The empty zoom range is (0, 0), not (1, 1): that is the value in force.
Vector2d const PtzRange::EmptyZoomRange(0.0f, 0.0f);
Vector2d const PtzRange::InfiniteZoomRange(FloatingPoint::Infinity, 0.5f);
Vector2d const PtzRange::FullMotion(Trigonometry::PI, -Trigonometry::PI);
Vector2d const PtzRange::NoMotion(0.0f, 0.0f);

PtzRange const PtzRange::EmptyPtzRange(Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f),
                                       Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f), ZeroFlags);
PtzRange const PtzRange::CeilingPanoramicRange(Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                               Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f),
                                               Vector2d(0.0f, 0.0f), ZeroFlags);
PtzRange const PtzRange::FloorPanoramicRange(Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                             Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f),
                                             Vector2d(0.0f, 0.0f), ZeroFlags);
PtzRange const PtzRange::WallPanoramicRange(Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f),
                                            Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                            Vector2d(0.0f, 0.0f), ZeroFlags);
PtzRange const PtzRange::InvertedWallPanoramicRange(Vector2d(0.0f, 0.0f), Vector2d(0.0f, 0.0f),
                                                    Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                                    Vector2d(0.0f, 0.0f), ZeroFlags);
PtzRange const PtzRange::CeilingPtzRange(Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                         Vector2d(Trigonometry::QUARTER_PI * 0.5f,
                                                  -Trigonometry::THREE_QUARTERS_PI),
                                         Vector2d(0.0f, 0.0f),
                                         Vector2d(FloatingPoint::Infinity, 0.5f), ZeroFlags);
PtzRange const PtzRange::FloorPtzRange(Vector2d(Trigonometry::PI, -Trigonometry::PI),
                                       Vector2d(Trigonometry::THREE_QUARTERS_PI,
                                                Trigonometry::QUARTER_PI * -0.5f),
                                       Vector2d(0.0f, 0.0f),
                                       Vector2d(FloatingPoint::Infinity, 0.5f), ZeroFlags);

PtzRange::PtzRange() : flags(ZeroFlags) {}

PtzRange::PtzRange(PtzRange const& other) = default;

PtzRange::PtzRange(Vector2d const& pan_range, Vector2d const& tilt_range,
                   Vector2d const& roll_range, Vector2d const& zoom_range, uint32_t flag_bits)
    : pan(pan_range), tilt(tilt_range), roll(roll_range), zoom(zoom_range), flags(flag_bits) {}

PtzRange::PtzRange(_DEWARP_PTZ_RANGE const& record) : PtzRange() {
    Set(record);
}

PtzRange::PtzRange(FieldOfView const& field_of_view, Vector2d const& zoom_range, uint32_t flag_bits)
    : flags(flag_bits) {
    Set(field_of_view, zoom_range);
}

PtzRange::PtzRange(EulerAngles const& extent, Vector2d const& zoom_range, uint32_t flag_bits)
    : flags(flag_bits) {
    Set(extent, zoom_range);
}

PtzRange& PtzRange::operator=(PtzRange const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "PtzRange");
        return *this;
    }
    pan = other.pan;
    tilt = other.tilt;
    roll = other.roll;
    zoom = other.zoom;
    flags = other.flags;
    return *this;
}

PtzRange& PtzRange::operator=(_DEWARP_PTZ_RANGE const& record) {
    Set(record);
    return *this;
}

PtzRange::~PtzRange() = default;

void PtzRange::Set(_DEWARP_PTZ_RANGE const& record) {
    pan = Vector2d(NormalisedRadians(record.pan_max), NormalisedRadians(record.pan_min));
    tilt = Vector2d(NormalisedRadians(record.tilt_max), NormalisedRadians(record.tilt_min));
    roll = Vector2d(NormalisedRadians(record.roll_max), NormalisedRadians(record.roll_min));
    zoom = Vector2d(record.zoom_max, record.zoom_min);
}

void PtzRange::Set(FieldOfView const& field_of_view, Vector2d const& zoom_range) {
    pan = SymmetricInterval(field_of_view.horizontal);
    tilt = SymmetricInterval(field_of_view.vertical);
    roll = FullMotion;
    zoom = zoom_range;
}

void PtzRange::Set(EulerAngles const& extent, Vector2d const& zoom_range) {
    pan = SymmetricInterval(extent.pan);
    tilt = SymmetricInterval(extent.tilt);
    roll = SymmetricInterval(extent.roll);
    zoom = zoom_range;
}

_DEWARP_PTZ_RANGE PtzRange::Get() const {
    return _DEWARP_PTZ_RANGE{Trigonometry::radians_to_degrees(pan.y),
                             Trigonometry::radians_to_degrees(pan.x),
                             Trigonometry::radians_to_degrees(tilt.y),
                             Trigonometry::radians_to_degrees(tilt.x),
                             Trigonometry::radians_to_degrees(roll.y),
                             Trigonometry::radians_to_degrees(roll.x),
                             zoom.y,
                             zoom.x};
}

void PtzRange::Deflate(FieldOfView const& field_of_view) {
    float const h = Trigonometry::normalise_angle(field_of_view.horizontal * 0.5f);
    float const v = Trigonometry::normalise_angle(field_of_view.vertical * 0.5f);
    if (pan != FullMotion) {
        if (pan.x - pan.y > h + h) {
            pan.x -= h;
            pan.y += h;
        } else {
            float const middle = (pan.x + pan.y) * 0.5f;
            pan = Vector2d(middle, middle);
        }
    }
    if (tilt != FullMotion) {
        Vector2d narrowed = tilt;
        if ((flags & NoDeflateHighTilt) != 0) {
            Announce("NoDeflateHighTilt flag active\n");
        } else {
            narrowed.x = tilt.x - v;
        }
        if ((flags & NoDeflateLowTilt) != 0) {
            Announce("NoDeflateLowTilt flag active\n");
        } else {
            narrowed.y = tilt.y + v;
        }
        if (FloatingPoint::is_less(narrowed.x, narrowed.y)) {
            float const middle = (tilt.x + tilt.y) * 0.5f;
            tilt = Vector2d(middle, middle);
        } else {
            tilt = narrowed;
        }
    }
}

void PtzRange::Inflate(FieldOfView const& field_of_view) {
    float const h = Trigonometry::normalise_angle(field_of_view.horizontal * 0.5f);
    float const v = Trigonometry::normalise_angle(field_of_view.vertical * 0.5f);
    if (pan != FullMotion) {
        pan.x += h;
        pan.y -= h;
    }
    if (tilt != FullMotion) {
        tilt.x += v;
        tilt.y -= v;
    }
}

float PtzRange::LimitPan(float value) const {
    return Limited(value, pan);
}

float PtzRange::LimitTilt(float value) const {
    return Limited(value, tilt);
}

float PtzRange::LimitRoll(float value) const {
    return Limited(value, roll);
}

float PtzRange::LimitZoom(float value) const {
    return Limited(value, zoom);
}

PtzPosition PtzRange::Limit(PtzPosition const& position) const {
    return PtzPosition(
        EulerAngles(LimitPan(position.orientation.pan), LimitTilt(position.orientation.tilt),
                    LimitRoll(position.orientation.roll)),
        LimitZoom(position.zoom));
}

}  // namespace quorvel::vexmap
