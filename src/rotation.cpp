#include "vexmap/rotation.h"

#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

Vector2d Project(Vector3d const& v, float f) {
    return Vector2d(v.x * f / v.z, v.y * f / v.z);
}

Vector2d ProjectShifted(Vector3d const& v, float f, Vector2d const& shift, float scale) {
    return Vector2d(v.x * f / v.z / scale - shift.x, v.y * f / v.z / scale - shift.y);
}

// The two halves of a spherical rotation, in the same file as their callers so that a map
// build's chain runs them without a call or a vector passed through memory.
Vector3d ToDirection(Vector2d const& p, float f) {
    float const r = Trigonometry::hypot(p.x, p.y);
    float const k = FloatingPoint::is_zero(r) ? 0.0f : Trigonometry::sin(r / f) / r;
    return Vector3d(p.x * k, p.y * k, Trigonometry::cos(r / f));
}

Vector2d FromDirection(Vector3d const& v, float f) {
    float const h = Trigonometry::hypot(v.x, v.y);
    float const k = FloatingPoint::is_zero(h) ? 0.0f : Trigonometry::atan(h, v.z) * f / h;
    return Vector2d(v.x * k, v.y * k);
}

}  // namespace

Rotation::Rotation() = default;

Rotation::Rotation(Rotation const&) = default;

Rotation& Rotation::operator=(Rotation const&) {
    return *this;
}

Rotation::~Rotation() = default;

Vector3d Rotation::SphericalToVector3d(Vector2d const& p, float f) {
    return ToDirection(p, f);
}

Vector2d Rotation::Vector3dToSpherical(Vector3d const& v, float f) {
    return FromDirection(v, f);
}

Vector2d Rotation::SphericalRotation(Vector2d const& p, float f, RotationMatrix3d const& m) {
    return FromDirection(m.ObjectToInertial(ToDirection(p, f)), f);
}

Vector2d Rotation::InverseSphericalRotation(Vector2d const& p, float f, RotationMatrix3d const& m) {
    return FromDirection(m.InertialToObject(ToDirection(p, f)), f);
}

Vector2d Rotation::RectilinearRotation(Vector2d const& p, float f, RotationMatrix3d const& m) {
    return Project(m.ObjectToInertial(Vector3d(p.x, p.y, f)), f);
}

Vector2d Rotation::InverseRectilinearRotation(Vector2d const& p, float f,
                                              RotationMatrix3d const& m) {
    return Project(m.InertialToObject(Vector3d(p.x, p.y, f)), f);
}

Vector2d Rotation::RectilinearRotation(Vector2d const& p, float f, RotationMatrix3d const& m,
                                       Vector2d const& shift, float scale) {
    return ProjectShifted(m.ObjectToInertial(Vector3d(p.x + shift.x, p.y + shift.y, f)), f, shift,
                          scale);
}

Vector2d Rotation::InverseRectilinearRotation(Vector2d const& p, float f, RotationMatrix3d const& m,
                                              Vector2d const& shift, float scale) {
    return ProjectShifted(m.InertialToObject(Vector3d(p.x + shift.x, p.y + shift.y, f)), f, shift,
                          scale);
}

Vector3d Rotation::EquirectangularToVector3d(Vector2d const& p, float f) {
    float const longitude = p.x / f;
    float const colatitude = Trigonometry::HALF_PI - p.y / f;
    float const sin_colatitude = Trigonometry::sin(colatitude);
    return Vector3d(Trigonometry::sin(longitude) * sin_colatitude, Trigonometry::cos(colatitude),
                    -(sin_colatitude * Trigonometry::cos(longitude)));
}

Vector2d Rotation::Vector3dToEquirectangular(Vector3d const& v, float f) {
    return Vector2d(Trigonometry::atan(v.x, -v.z) * f, Trigonometry::asin(v.y / v.Length()) * f);
}

}  // namespace quorvel::vexmap
