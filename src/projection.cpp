#include "vexmap/projection.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/rotation.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

// Miller's projection as the engine holds it: y = f·ln(tan(QUARTER_PI + 0.4·φ)) / 0.8.
constexpr float MILLER_LATITUDE_FACTOR = 0.4f;
constexpr float MILLER_SCALE = 0.8f;
constexpr float MILLER_INVERSE_SCALE = 1.25f;

// A composition of the grid: each stage converts the previous stage's point at the same focal
// length, so every stage keeps its own float rounding and no shortcut formula creeps in.
template <ConversionFunction First, ConversionFunction... Rest>
Vector2d Via(Vector2d const& p, float f) {
    if constexpr (sizeof...(Rest) == 0) {
        return First(p, f);
    } else {
        return Via<Rest...>(First(p, f), f);
    }
}

// Wrap step of the conversions that leave Equirectangular through the colatitude: (longitude,
// colatitude) in radians, with a point that lies over a pole carried to the far side of the sphere.
Vector2d WrappedLongitudeAndColatitude(Vector2d const& p, float f) {
    float longitude = p.x / f;
    float colatitude = Trigonometry::HALF_PI - p.y / f;
    if (0.0f > colatitude) {
        colatitude = -colatitude;
        longitude += Trigonometry::PI;
    }
    if (colatitude > Trigonometry::PI) {
        longitude += Trigonometry::PI;
        colatitude = Trigonometry::PI - (colatitude - Trigonometry::PI);
    }
    return Vector2d(longitude, colatitude);
}

// The direction d radians off the axis of view and c round it, at length f, in a frame whose x
// is the axis of view: the radial picture's centre becomes the equator's.
Vector3d OffAxis(float d, float c, float f) {
    float const sin_d = Trigonometry::sin(d);
    return Vector3d(f * Trigonometry::cos(d), f * sin_d * Trigonometry::cos(c),
                    f * sin_d * Trigonometry::sin(c));
}

// The radial family keeps a point's direction from the centre and changes only its radius.
Vector2d AtRadius(Vector2d const& p, float radius) {
    float const c = Trigonometry::atan(p.y, p.x);
    return Vector2d(Trigonometry::cos(c) * radius, Trigonometry::sin(c) * radius);
}

}  // namespace

Vector2d const Projection::ZeroShift(0.0f, 0.0f);
// Written as a copy of Vector2d::IdentityVector, which is built later at load, so the value in
// force is (0, 0); defined so here to depend on no order of initialisation.
Vector2d const Projection::IdentityScale(0.0f, 0.0f);

Projection::Projection() = default;

Projection::Projection(Projection const&) = default;

Projection& Projection::operator=(Projection const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Projection");
    }
    return *this;
}

Projection::~Projection() = default;

std::string Projection::GetName(_DEWARP_PROJECTION projection) {
    // "cylindical" and "miller cyclindrical" are the names hosts already see: kept as spelled.
    switch (projection) {
        case DEWARP_PROJECTION_RECTILINEAR:
            return "rectilinear";
        case DEWARP_PROJECTION_CYLINDRICAL:
            return "cylindical";
        case DEWARP_PROJECTION_EQUIRECTANGULAR:
            return "equirectangular";
        case DEWARP_PROJECTION_MERCATOR:
            return "mercator";
        case DEWARP_PROJECTION_LAMBERT_CYLINDRICAL:
            return "lambert cylindrical";
        case DEWARP_PROJECTION_MILLER_CYLINDRICAL:
            return "miller cyclindrical";
        case DEWARP_PROJECTION_PANNINI:
            return "pannini";
        case DEWARP_PROJECTION_ARCHITECTURAL:
            return "architectural";
        case DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI:
            return "equirectangular pannini";
    }
    Log::warn(__LINE__, __FILE__, "GetName", "Unable to get the name of an unknown projection\n");
    return "<unknown>";
}

// The three families take no guard: a zero divisor gives infinity, asin saturates and tan near
// HALF_PI is huge, just as float arithmetic has it.

// At a = HALF_PI this is a tiny negative number, the float HALF_PI lying just past pi/2: intended.
float Projection::RectilinearFocalLength(float r, float a) {
    return r / Trigonometry::tan(a);
}

float Projection::StereographicFocalLength(float r, float a) {
    return 0.5f * r / Trigonometry::tan(a / 2.0f);
}

float Projection::OrthographicFocalLength(float r, float a) {
    return r / Trigonometry::sin(a);
}

float Projection::EquisolidFocalLength(float r, float a) {
    return 0.5f * r / Trigonometry::sin(a / 2.0f);
}

float Projection::FisheyeFocalLength(float r, float a) {
    return r / a;
}

float Projection::EquirectangularFocalLength(float r, float a) {
    return r / a;
}

float Projection::CylindricalFocalLength(float r, float a) {
    return r / a;
}

float Projection::MercatorFocalLength(float r, float a) {
    return r / a;
}

float Projection::LambertCylindricalFocalLength(float r, float a) {
    return r / a;
}

float Projection::MillerCylindricalFocalLength(float r, float a) {
    return r / a;
}

float Projection::ArchitecturalFocalLength(float r, float a) {
    return r / a;
}

// Both Pannini projections map across as for a distance of 1, which is Stereographic's formula.
float Projection::PanniniFocalLength(float r, float a) {
    return 0.5f * r / Trigonometry::tan(a / 2.0f);
}

float Projection::EquirectangularPanniniFocalLength(float r, float a) {
    return 0.5f * r / Trigonometry::tan(a / 2.0f);
}

// Each horizontal value comes from the width alone and each vertical one from the height alone,
// except for the two Pannini projections, whose vertical field depends on the width as well.

Vector2d Projection::RectilinearFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(2.0f * Trigonometry::atan(resolution.x / 2.0f, f),
                    2.0f * Trigonometry::atan(resolution.y / 2.0f, f));
}

// 4·atan2(rx, f), where the inverse of StereographicResolution would take rx / 4: intended.
Vector2d Projection::StereographicFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(4.0f * Trigonometry::atan(resolution.x, f),
                    4.0f * Trigonometry::atan(resolution.y, f));
}

// A width beyond 2f saturates the arcsine, so the field is a whole 2·PI, not NaN.
Vector2d Projection::OrthographicFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(2.0f * Trigonometry::asin(resolution.x / 2.0f / f),
                    2.0f * Trigonometry::asin(resolution.y / 2.0f / f));
}

// 4·asin(rx / f), where the inverse of EquisolidResolution would take rx / (4f): intended.
Vector2d Projection::EquisolidFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(4.0f * Trigonometry::asin(resolution.x / f),
                    4.0f * Trigonometry::asin(resolution.y / f));
}

Vector2d Projection::FisheyeFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(resolution.x / f, resolution.y / f);
}

Vector2d Projection::EquirectangularFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(resolution.x / f, resolution.y / f);
}

Vector2d Projection::CylindricalFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(2.0f * (resolution.x / 2.0f / f),
                    2.0f * Trigonometry::atan(resolution.y / 2.0f, f));
}

Vector2d Projection::MercatorFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(2.0f * (resolution.x / 2.0f / f),
                    2.0f * Trigonometry::atan(Trigonometry::sinh(resolution.y / 2.0f / f)));
}

// The arcsine here and the sine in LambertCylindricalResolution are the reverse of the
// conversions' pair: intended.
Vector2d Projection::LambertCylindricalFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(2.0f * (resolution.x / 2.0f / f),
                    2.0f * Trigonometry::asin(resolution.y / 2.0f / f));
}

Vector2d Projection::MillerCylindricalFieldOfView(Vector2d const& resolution, float f) {
    return Vector2d(
        2.0f * (resolution.x / 2.0f / f),
        2.0f * MILLER_INVERSE_SCALE *
            Trigonometry::atan(Trigonometry::sinh(MILLER_SCALE * (resolution.y / 2.0f) / f)));
}

// Miller below the horizon and Lambert above it, so the field is taken as their mean.
Vector2d Projection::ArchitecturalFieldOfView(Vector2d const& resolution, float f) {
    return (MillerCylindricalFieldOfView(resolution, f) +
            LambertCylindricalFieldOfView(resolution, f)) /
           2.0f;
}

// The arctangent is taken twice, undoing Pannini's doubled tangent: intended.
Vector2d Projection::PanniniFieldOfView(Vector2d const& resolution, float f) {
    float const t = Trigonometry::atan(resolution.x / 2.0f, 2.0f * f);
    float const cos_t = Trigonometry::cos(t);
    return Vector2d(4.0f * t, 2.0f * Trigonometry::atan(Trigonometry::atan(resolution.y / 2.0f,
                                                                           f * (cos_t * cos_t))));
}

Vector2d Projection::EquirectangularPanniniFieldOfView(Vector2d const& resolution, float f) {
    float const t = Trigonometry::atan(resolution.x / 2.0f, 2.0f * f);
    float const cos_t = Trigonometry::cos(t);
    return Vector2d(4.0f * t, 2.0f * Trigonometry::atan(resolution.y / 2.0f, f * (cos_t * cos_t)));
}

// The half angles are taken first; each result is a whole width or height.

Vector2d Projection::RectilinearResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(2.0f * f * Trigonometry::tan(a), 2.0f * f * Trigonometry::tan(b));
}

Vector2d Projection::StereographicResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(4.0f * f * Trigonometry::tan(a / 2.0f), 4.0f * f * Trigonometry::tan(b / 2.0f));
}

Vector2d Projection::OrthographicResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(2.0f * f * Trigonometry::sin(a), 2.0f * f * Trigonometry::sin(b));
}

Vector2d Projection::EquisolidResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(4.0f * f * Trigonometry::sin(a / 2.0f), 4.0f * f * Trigonometry::sin(b / 2.0f));
}

Vector2d Projection::FisheyeResolution(Vector2d const& fov, float f) {
    return Vector2d(fov.x * f, fov.y * f);
}

Vector2d Projection::EquirectangularResolution(Vector2d const& fov, float f) {
    return Vector2d(fov.x * f, fov.y * f);
}

Vector2d Projection::CylindricalResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(2.0f * f * a, 2.0f * f * Trigonometry::tan(b));
}

Vector2d Projection::MercatorResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(
        2.0f * f * a,
        2.0f * f * FloatingPoint::log(Trigonometry::tan(b) + 1.0f / Trigonometry::cos(b)));
}

Vector2d Projection::LambertCylindricalResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(2.0f * f * a, 2.0f * f * Trigonometry::sin(b));
}

Vector2d Projection::MillerCylindricalResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    return Vector2d(2.0f * f * a, 2.0f * MILLER_INVERSE_SCALE * f *
                                      Trigonometry::asinh(Trigonometry::tan(MILLER_SCALE * b)));
}

Vector2d Projection::ArchitecturalResolution(Vector2d const& fov, float f) {
    return (MillerCylindricalResolution(fov, f) + LambertCylindricalResolution(fov, f)) / 2.0f;
}

// The tangent is taken twice, unlike the common form of Pannini's projection: intended.
Vector2d Projection::PanniniResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    float const cos_half_a = Trigonometry::cos(a / 2.0f);
    return Vector2d(4.0f * f * Trigonometry::tan(a / 2.0f),
                    2.0f * f * Trigonometry::tan(Trigonometry::tan(b)) / (cos_half_a * cos_half_a));
}

Vector2d Projection::EquirectangularPanniniResolution(Vector2d const& fov, float f) {
    float const a = fov.x / 2.0f;
    float const b = fov.y / 2.0f;
    float const cos_half_a = Trigonometry::cos(a / 2.0f);
    return Vector2d(4.0f * f * Trigonometry::tan(a / 2.0f),
                    2.0f * f * Trigonometry::tan(b) / (cos_half_a * cos_half_a));
}

// Direct conversions out of Equirectangular. x / f is the longitude and y / f the latitude.

// The back hemisphere is not rejected: a point behind the viewer lands, wrapped, in front.
Vector2d Projection::EquirectangularToRectilinear(Vector2d const& p, float f) {
    Vector2d const wrapped = WrappedLongitudeAndColatitude(p, f);
    float const l = wrapped.x;
    float const a = wrapped.y;
    return Vector2d(f * Trigonometry::tan(l), f / (Trigonometry::tan(a) * Trigonometry::cos(l)));
}

// No guard for h = 0: the cosine of a float angle is never exactly 0, so the centre comes out
// within float noise of (0, 0), not NaN.
Vector2d Projection::EquirectangularToFisheye(Vector2d const& p, float f) {
    Vector2d const wrapped = WrappedLongitudeAndColatitude(p, f);
    float const l = wrapped.x;
    float const a = wrapped.y;
    float const sin_a = Trigonometry::sin(a);
    float const vx = Trigonometry::sin(l) * sin_a;
    float const vy = Trigonometry::cos(a);
    float const vz = sin_a * Trigonometry::cos(l);
    float const h = Trigonometry::hypot(vy, vx);
    float const s = Trigonometry::atan(h, vz) * f;
    return Vector2d(vx * s / h, vy * s / h);
}

// No wrap step here, unlike the other two that leave through the sphere: intended.
Vector2d Projection::EquirectangularToStereographic(Vector2d const& p, float f) {
    float const l = p.x / f;
    float const b = p.y / f;
    float const cos_b = Trigonometry::cos(b);
    float const k = 2.0f * f / (Trigonometry::cos(l) * cos_b + 1.0f);
    return Vector2d(k * cos_b * Trigonometry::sin(l), k * Trigonometry::sin(b));
}

Vector2d Projection::EquirectangularToCylindrical(Vector2d const& p, float f) {
    return Vector2d(p.x, f * Trigonometry::tan(p.y / f));
}

Vector2d Projection::EquirectangularToMercator(Vector2d const& p, float f) {
    float const b = p.y / f;
    return Vector2d(p.x,
                    f * FloatingPoint::log(Trigonometry::tan(b) + 1.0f / Trigonometry::cos(b)));
}

// The arcsine towards the picture, the reverse of LambertCylindricalResolution's sine: intended.
// It agrees with its reverse only for |y / f| up to 1 and saturates beyond.
Vector2d Projection::EquirectangularToLambertCylindrical(Vector2d const& p, float f) {
    return Vector2d(p.x, f * Trigonometry::asin(p.y / f));
}

Vector2d Projection::EquirectangularToMillerCylindrical(Vector2d const& p, float f) {
    return Vector2d(p.x, f *
                             FloatingPoint::log(Trigonometry::tan(MILLER_LATITUDE_FACTOR * p.y / f +
                                                                  Trigonometry::QUARTER_PI)) /
                             MILLER_SCALE);
}

// Miller below the horizon, Lambert from the horizon up; NaN goes the Lambert way.
Vector2d Projection::EquirectangularToArchitectural(Vector2d const& p, float f) {
    if (0.0f > p.y / f) {
        return EquirectangularToMillerCylindrical(p, f);
    }
    return EquirectangularToLambertCylindrical(p, f);
}

// The tangent is taken twice, as in PanniniResolution: intended.
Vector2d Projection::EquirectangularToPannini(Vector2d const& p, float f) {
    float const u = p.x / (2.0f * f);
    float const cos_u = Trigonometry::cos(u);
    return Vector2d(2.0f * f * Trigonometry::tan(u),
                    f * Trigonometry::tan(Trigonometry::tan(p.y / f)) / (cos_u * cos_u));
}

Vector2d Projection::EquirectangularToEquirectangularPannini(Vector2d const& p, float f) {
    float const u = p.x / (2.0f * f);
    float const cos_u = Trigonometry::cos(u);
    return Vector2d(2.0f * f * Trigonometry::tan(u),
                    f * Trigonometry::tan(p.y / f) / (cos_u * cos_u));
}

// Direct conversions into Equirectangular.

// Only the front hemisphere comes out: the reverse of EquirectangularToRectilinear's wrap is not
// attempted. The direction is built with the axis of view along x, so that its longitude and
// latitude are those of the point.
Vector2d Projection::RectilinearToEquirectangular(Vector2d const& p, float f) {
    auto const [r, c] = Trigonometry::hypot_and_atan(p.y, p.x);
    float const d = Trigonometry::atan(r, f);
    Vector3d const v = OffAxis(d, c, f);
    return Vector2d(
        Trigonometry::atan(v.y, v.x) * f,
        (Trigonometry::HALF_PI - Trigonometry::atan(Trigonometry::hypot(v.x, v.y), v.z)) * f);
}

// sin d / r tends to 1 / f at the centre, where it cannot be evaluated.
Vector2d Projection::FisheyeToEquirectangular(Vector2d const& p, float f) {
    float const r = Trigonometry::hypot(p.x, p.y);
    float const d = r / f;
    float const k = FloatingPoint::is_zero(d) ? 1.0f / f : Trigonometry::sin(d) / r;
    float const m = Trigonometry::cos(d);
    float const n = p.x * k;
    return Vector2d(Trigonometry::atan(n, m) * f,
                    Trigonometry::atan(p.y * k, Trigonometry::hypot(m, n)) * f);
}

// The centre has no image: both components stay NaN there. The y that comes out is a latitude in
// radians, not multiplied by f, unlike every other conversion's: intended, and inherited by every
// composition that starts here.
Vector2d Projection::StereographicToEquirectangular(Vector2d const& p, float f) {
    Vector2d result = Vector2d::InvalidVector;
    float const x = p.x / f;
    float const y = p.y / f;
    float const q = Trigonometry::hypot(x, y);
    float const c = 2.0f * Trigonometry::atan(q, 2.0f);
    auto const [sin_c, cos_c] = Trigonometry::sin_and_cos(c);
    if (!FloatingPoint::is_greater(FloatingPoint::fabs(q), Trigonometry::EPSILON)) {
        return result;
    }
    result.y = Trigonometry::asin(y * sin_c / q);
    if (FloatingPoint::fabs(cos_c) >= Trigonometry::EPSILON ||
        FloatingPoint::fabs(x) >= Trigonometry::EPSILON) {
        result.x = Trigonometry::atan(x * sin_c, cos_c * q) * f;
    }
    return result;
}

Vector2d Projection::CylindricalToEquirectangular(Vector2d const& p, float f) {
    return Vector2d(p.x, f * Trigonometry::atan(p.y, f));
}

Vector2d Projection::MercatorToEquirectangular(Vector2d const& p, float f) {
    return Vector2d(p.x, f * Trigonometry::atan(Trigonometry::sinh(p.y / f)));
}

// The sine, reverse of EquirectangularToLambertCylindrical's arcsine: intended.
Vector2d Projection::LambertCylindricalToEquirectangular(Vector2d const& p, float f) {
    return Vector2d(p.x, f * Trigonometry::sin(p.y / f));
}

Vector2d Projection::MillerCylindricalToEquirectangular(Vector2d const& p, float f) {
    return Vector2d(p.x, MILLER_INVERSE_SCALE * f *
                             Trigonometry::atan(Trigonometry::sinh(MILLER_SCALE * p.y / f)));
}

// Miller strictly below the horizon; NaN goes the Lambert way.
Vector2d Projection::ArchitecturalToEquirectangular(Vector2d const& p, float f) {
    if (FloatingPoint::is_less(p.y / f, 0.0f)) {
        return MillerCylindricalToEquirectangular(p, f);
    }
    return LambertCylindricalToEquirectangular(p, f);
}

// The arctangent is taken twice, undoing EquirectangularToPannini: intended.
Vector2d Projection::PanniniToEquirectangular(Vector2d const& p, float f) {
    float const t = Trigonometry::atan(p.x / f, 2.0f);
    float const cos_t = Trigonometry::cos(t);
    return Vector2d(2.0f * f * t,
                    f * Trigonometry::atan(Trigonometry::atan(p.y / f * (cos_t * cos_t))));
}

Vector2d Projection::EquirectangularPanniniToEquirectangular(Vector2d const& p, float f) {
    float const t = Trigonometry::atan(p.x / f, 2.0f);
    float const cos_t = Trigonometry::cos(t);
    return Vector2d(2.0f * f * t, f * Trigonometry::atan(p.y / f * (cos_t * cos_t)));
}

// Within the radial family a point keeps its direction from the centre; r / f is its angle off
// the axis of view in Fisheye. The arcsines saturate, so a point outside the disc of
// Orthographic, Equisolid or Mirror lands on the disc's edge instead of becoming NaN.

// The sine folds: a point beyond a quarter turn gets the radius of its mirror image.
Vector2d Projection::FisheyeToOrthographic(Vector2d const& p, float f) {
    float const d = Trigonometry::hypot(p.x, p.y) / f;
    return AtRadius(p, f * Trigonometry::sin(d));
}

Vector2d Projection::FisheyeToEquisolid(Vector2d const& p, float f) {
    float const d = Trigonometry::hypot(p.x, p.y) / f;
    return AtRadius(p, 2.0f * f * Trigonometry::sin(d / 2.0f));
}

Vector2d Projection::FisheyeToMirror(Vector2d const& p, float f) {
    return AtRadius(p, f * Trigonometry::sin(Trigonometry::hypot(p.x / f, p.y / f) / 2.0f));
}

// Beyond a quarter turn the angle is held at the float HALF_PI, whose tangent is huge and
// negative: such a point lands far out on the opposite side. Intended.
Vector2d Projection::FisheyeToRectilinear(Vector2d const& p, float f) {
    float d = Trigonometry::hypot(p.x, p.y) / f;
    if (d > Trigonometry::HALF_PI) {
        d = Trigonometry::HALF_PI;
    }
    return AtRadius(p, f * Trigonometry::tan(d));
}

Vector2d Projection::OrthographicToFisheye(Vector2d const& p, float f) {
    return AtRadius(p, f * Trigonometry::asin(Trigonometry::hypot(p.x, p.y) / f));
}

Vector2d Projection::EquisolidToFisheye(Vector2d const& p, float f) {
    return AtRadius(p, f * 2.0f * Trigonometry::asin(Trigonometry::hypot(p.x, p.y) / (2.0f * f)));
}

Vector2d Projection::MirrorToFisheye(Vector2d const& p, float f) {
    return AtRadius(p, f * 2.0f * Trigonometry::asin(Trigonometry::hypot(p.x / f, p.y / f)));
}

// atan(q) / q tends to 1 at the centre, where it cannot be evaluated.
Vector2d Projection::RectilinearToFisheye(Vector2d const& p, float f) {
    float const q = Trigonometry::hypot(p.x, p.y) / f;
    float const k = FloatingPoint::is_zero(q) ? 1.0f : Trigonometry::atan(q) / q;
    return Vector2d(p.x * k, p.y * k);
}

// Conversions with Cylindrical.

Vector2d Projection::CylindricalToRectilinear(Vector2d const& p, float f) {
    float const l = p.x / f;
    return Vector2d(f * Trigonometry::tan(l), p.y / Trigonometry::cos(l));
}

// Divides by the arccosine of x / f, not the cosine of the longitude, so it is not the reverse
// of CylindricalToRectilinear and x = f gives an infinite y: intended.
Vector2d Projection::RectilinearToCylindrical(Vector2d const& p, float f) {
    return Vector2d(f * Trigonometry::atan(p.x, f), p.y / Trigonometry::acos(p.x / f));
}

// No guard: the centre gives 0 / 0, NaN, and has no image. Intended.
Vector2d Projection::CylindricalToFisheye(Vector2d const& p, float f) {
    float const l = p.x / f;
    float const a = f * Trigonometry::sin(l);
    float const h = Trigonometry::hypot(a, p.y);
    float const k = Trigonometry::atan(h, f * Trigonometry::cos(l)) * f / h;
    return Vector2d(a * k, p.y * k);
}

Vector2d Projection::FisheyeToCylindrical(Vector2d const& p, float f) {
    float const d = Trigonometry::hypot(p.x, p.y) / f;
    Vector3d const v = OffAxis(d, Trigonometry::atan(p.y, p.x), f);
    return Vector2d(Trigonometry::atan(v.y, v.x) * f,
                    Trigonometry::tan(Trigonometry::HALF_PI -
                                      Trigonometry::atan(Trigonometry::hypot(v.x, v.y), v.z)) *
                        f);
}

// A polar picture of the Cylindrical one: the axis of view goes to the circle of radius
// HALF_PI·f, up goes outward, and x / f of longitude turns through -x / (HALF_PI·f) radians,
// two radians for each half circle. Intended.
Vector2d Projection::CylindricalToSpherical(Vector2d const& p, float f) {
    float const w = Trigonometry::HALF_PI * f;
    float const t = -p.x / w;
    float const g = (Trigonometry::HALF_PI + Trigonometry::atan(p.y, w)) * f;
    return Vector2d(Trigonometry::cos(t) * g, Trigonometry::sin(t) * g);
}

// Links to space, as Rotation holds them.

Vector3d Projection::EquirectangularToVector3d(Vector2d const& p, float f) {
    return Rotation::EquirectangularToVector3d(p, f);
}

Vector2d Projection::Vector3dToEquirectangular(Vector3d const& v, float f) {
    return Rotation::Vector3dToEquirectangular(v, f);
}

// The grid: every member not defined above, source by source, each target in the order of the
// header. A line names the stages of a composition in order; "return p" is the same projection.

// Equirectangular: direct to Rectilinear, Stereographic, Fisheye, Cylindrical and the six
// cylinder-like projections; to the radial family through Fisheye, to Spherical through
// Cylindrical.

Vector2d Projection::EquirectangularToEquirectangular(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::EquirectangularToOrthographic(Vector2d const& p, float f) {
    return Via<EquirectangularToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::EquirectangularToEquisolid(Vector2d const& p, float f) {
    return Via<EquirectangularToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::EquirectangularToMirror(Vector2d const& p, float f) {
    return Via<EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::EquirectangularToSpherical(Vector2d const& p, float f) {
    return Via<EquirectangularToCylindrical, CylindricalToSpherical>(p, f);
}

// Rectilinear: direct to Equirectangular, Fisheye and Cylindrical; to the radial family through
// Fisheye, to Spherical through Cylindrical, to the rest through Equirectangular.

Vector2d Projection::RectilinearToRectilinear(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::RectilinearToStereographic(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::RectilinearToOrthographic(Vector2d const& p, float f) {
    return Via<RectilinearToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::RectilinearToEquisolid(Vector2d const& p, float f) {
    return Via<RectilinearToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::RectilinearToMercator(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::RectilinearToLambertCylindrical(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::RectilinearToMillerCylindrical(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::RectilinearToPannini(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::RectilinearToArchitectural(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::RectilinearToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<RectilinearToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::RectilinearToMirror(Vector2d const& p, float f) {
    return Via<RectilinearToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::RectilinearToSpherical(Vector2d const& p, float f) {
    return Via<RectilinearToCylindrical, CylindricalToSpherical>(p, f);
}

// Stereographic: direct to Equirectangular only; everything else through it, so its y in
// radians goes on into every target.

Vector2d Projection::StereographicToRectilinear(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::StereographicToStereographic(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::StereographicToOrthographic(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToFisheye, FisheyeToOrthographic>(p,
                                                                                                f);
}

Vector2d Projection::StereographicToEquisolid(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::StereographicToCylindrical(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::StereographicToFisheye(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::StereographicToMercator(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::StereographicToLambertCylindrical(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::StereographicToMillerCylindrical(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::StereographicToPannini(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::StereographicToArchitectural(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::StereographicToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::StereographicToMirror(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::StereographicToSpherical(Vector2d const& p, float f) {
    return Via<StereographicToEquirectangular, EquirectangularToCylindrical,
               CylindricalToSpherical>(p, f);
}

// Orthographic: direct to Fisheye only; everything else through it.

Vector2d Projection::OrthographicToEquirectangular(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular>(p, f);
}

Vector2d Projection::OrthographicToRectilinear(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToRectilinear>(p, f);
}

Vector2d Projection::OrthographicToStereographic(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular, EquirectangularToStereographic>(p,
                                                                                                f);
}

Vector2d Projection::OrthographicToOrthographic(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::OrthographicToEquisolid(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::OrthographicToCylindrical(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToCylindrical>(p, f);
}

Vector2d Projection::OrthographicToMercator(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::OrthographicToLambertCylindrical(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular,
               EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::OrthographicToMillerCylindrical(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular, EquirectangularToMillerCylindrical>(
        p, f);
}

Vector2d Projection::OrthographicToPannini(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::OrthographicToArchitectural(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular, EquirectangularToArchitectural>(p,
                                                                                                f);
}

Vector2d Projection::OrthographicToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToEquirectangular,
               EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::OrthographicToMirror(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::OrthographicToSpherical(Vector2d const& p, float f) {
    return Via<OrthographicToFisheye, FisheyeToCylindrical, CylindricalToSpherical>(p, f);
}

// Equisolid: direct to Fisheye only; everything else through it.

Vector2d Projection::EquisolidToEquirectangular(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular>(p, f);
}

Vector2d Projection::EquisolidToRectilinear(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToRectilinear>(p, f);
}

Vector2d Projection::EquisolidToStereographic(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::EquisolidToOrthographic(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::EquisolidToEquisolid(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::EquisolidToCylindrical(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToCylindrical>(p, f);
}

Vector2d Projection::EquisolidToMercator(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::EquisolidToLambertCylindrical(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToLambertCylindrical>(
        p, f);
}

Vector2d Projection::EquisolidToMillerCylindrical(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToMillerCylindrical>(p,
                                                                                                 f);
}

Vector2d Projection::EquisolidToPannini(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::EquisolidToArchitectural(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::EquisolidToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToEquirectangular,
               EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::EquisolidToMirror(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::EquisolidToSpherical(Vector2d const& p, float f) {
    return Via<EquisolidToFisheye, FisheyeToCylindrical, CylindricalToSpherical>(p, f);
}

// Cylindrical: direct to Equirectangular, Rectilinear, Fisheye and Spherical; to the radial family
// through Fisheye, to the rest through Equirectangular.

Vector2d Projection::CylindricalToStereographic(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::CylindricalToOrthographic(Vector2d const& p, float f) {
    return Via<CylindricalToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::CylindricalToEquisolid(Vector2d const& p, float f) {
    return Via<CylindricalToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::CylindricalToCylindrical(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::CylindricalToMercator(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::CylindricalToLambertCylindrical(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::CylindricalToMillerCylindrical(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::CylindricalToPannini(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::CylindricalToArchitectural(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::CylindricalToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<CylindricalToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::CylindricalToMirror(Vector2d const& p, float f) {
    return Via<CylindricalToFisheye, FisheyeToMirror>(p, f);
}

// Fisheye: direct to Equirectangular, Rectilinear, Cylindrical and the radial family; to Spherical
// through Cylindrical, to the rest through Equirectangular.

Vector2d Projection::FisheyeToStereographic(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::FisheyeToFisheye(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::FisheyeToMercator(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::FisheyeToLambertCylindrical(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::FisheyeToMillerCylindrical(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::FisheyeToPannini(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::FisheyeToArchitectural(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::FisheyeToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<FisheyeToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::FisheyeToSpherical(Vector2d const& p, float f) {
    return Via<FisheyeToCylindrical, CylindricalToSpherical>(p, f);
}

// Mercator: direct to Equirectangular only; everything else through it.

Vector2d Projection::MercatorToRectilinear(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::MercatorToStereographic(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::MercatorToOrthographic(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::MercatorToEquisolid(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::MercatorToCylindrical(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::MercatorToFisheye(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::MercatorToMercator(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::MercatorToLambertCylindrical(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::MercatorToMillerCylindrical(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::MercatorToPannini(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::MercatorToArchitectural(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::MercatorToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::MercatorToMirror(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::MercatorToSpherical(Vector2d const& p, float f) {
    return Via<MercatorToEquirectangular, EquirectangularToCylindrical, CylindricalToSpherical>(p,
                                                                                                f);
}

// LambertCylindrical: direct to Equirectangular only; everything else through it.

Vector2d Projection::LambertCylindricalToRectilinear(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::LambertCylindricalToStereographic(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::LambertCylindricalToOrthographic(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToFisheye,
               FisheyeToOrthographic>(p, f);
}

Vector2d Projection::LambertCylindricalToEquisolid(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(
        p, f);
}

Vector2d Projection::LambertCylindricalToCylindrical(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::LambertCylindricalToFisheye(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::LambertCylindricalToMercator(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::LambertCylindricalToLambertCylindrical(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::LambertCylindricalToMillerCylindrical(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::LambertCylindricalToPannini(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::LambertCylindricalToArchitectural(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::LambertCylindricalToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::LambertCylindricalToMirror(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p,
                                                                                               f);
}

Vector2d Projection::LambertCylindricalToSpherical(Vector2d const& p, float f) {
    return Via<LambertCylindricalToEquirectangular, EquirectangularToCylindrical,
               CylindricalToSpherical>(p, f);
}

// MillerCylindrical: direct to Equirectangular only; everything else through it.

Vector2d Projection::MillerCylindricalToRectilinear(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::MillerCylindricalToStereographic(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::MillerCylindricalToOrthographic(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToFisheye, FisheyeToOrthographic>(
        p, f);
}

Vector2d Projection::MillerCylindricalToEquisolid(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(p,
                                                                                                 f);
}

Vector2d Projection::MillerCylindricalToCylindrical(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::MillerCylindricalToFisheye(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::MillerCylindricalToMercator(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::MillerCylindricalToLambertCylindrical(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::MillerCylindricalToMillerCylindrical(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::MillerCylindricalToPannini(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::MillerCylindricalToArchitectural(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::MillerCylindricalToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::MillerCylindricalToMirror(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::MillerCylindricalToSpherical(Vector2d const& p, float f) {
    return Via<MillerCylindricalToEquirectangular, EquirectangularToCylindrical,
               CylindricalToSpherical>(p, f);
}

// Pannini: direct to Equirectangular only; everything else through it.

Vector2d Projection::PanniniToRectilinear(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::PanniniToStereographic(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::PanniniToOrthographic(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::PanniniToEquisolid(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::PanniniToCylindrical(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::PanniniToFisheye(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::PanniniToMercator(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::PanniniToLambertCylindrical(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::PanniniToMillerCylindrical(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::PanniniToPannini(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::PanniniToArchitectural(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::PanniniToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::PanniniToMirror(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::PanniniToSpherical(Vector2d const& p, float f) {
    return Via<PanniniToEquirectangular, EquirectangularToCylindrical, CylindricalToSpherical>(p,
                                                                                               f);
}

// Architectural: direct to Equirectangular only; everything else through it.

Vector2d Projection::ArchitecturalToRectilinear(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::ArchitecturalToStereographic(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::ArchitecturalToOrthographic(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToFisheye, FisheyeToOrthographic>(p,
                                                                                                f);
}

Vector2d Projection::ArchitecturalToEquisolid(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::ArchitecturalToCylindrical(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::ArchitecturalToFisheye(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::ArchitecturalToMercator(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::ArchitecturalToLambertCylindrical(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::ArchitecturalToMillerCylindrical(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::ArchitecturalToPannini(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::ArchitecturalToArchitectural(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::ArchitecturalToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToEquirectangularPannini>(p, f);
}

Vector2d Projection::ArchitecturalToMirror(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(p, f);
}

Vector2d Projection::ArchitecturalToSpherical(Vector2d const& p, float f) {
    return Via<ArchitecturalToEquirectangular, EquirectangularToCylindrical,
               CylindricalToSpherical>(p, f);
}

// EquirectangularPannini: direct to Equirectangular only; everything else through it.

Vector2d Projection::EquirectangularPanniniToRectilinear(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToRectilinear>(p, f);
}

Vector2d Projection::EquirectangularPanniniToStereographic(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::EquirectangularPanniniToOrthographic(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToFisheye,
               FisheyeToOrthographic>(p, f);
}

Vector2d Projection::EquirectangularPanniniToEquisolid(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToFisheye,
               FisheyeToEquisolid>(p, f);
}

Vector2d Projection::EquirectangularPanniniToCylindrical(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToCylindrical>(p, f);
}

Vector2d Projection::EquirectangularPanniniToFisheye(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToFisheye>(p, f);
}

Vector2d Projection::EquirectangularPanniniToMercator(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::EquirectangularPanniniToLambertCylindrical(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToLambertCylindrical>(p, f);
}

Vector2d Projection::EquirectangularPanniniToMillerCylindrical(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::EquirectangularPanniniToPannini(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::EquirectangularPanniniToArchitectural(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::EquirectangularPanniniToEquirectangularPannini(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::EquirectangularPanniniToMirror(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToFisheye, FisheyeToMirror>(
        p, f);
}

Vector2d Projection::EquirectangularPanniniToSpherical(Vector2d const& p, float f) {
    return Via<EquirectangularPanniniToEquirectangular, EquirectangularToCylindrical,
               CylindricalToSpherical>(p, f);
}

// Mirror: direct to Fisheye only; everything else through it.

Vector2d Projection::MirrorToEquirectangular(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular>(p, f);
}

Vector2d Projection::MirrorToRectilinear(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToRectilinear>(p, f);
}

Vector2d Projection::MirrorToStereographic(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToStereographic>(p, f);
}

Vector2d Projection::MirrorToOrthographic(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToOrthographic>(p, f);
}

Vector2d Projection::MirrorToEquisolid(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquisolid>(p, f);
}

Vector2d Projection::MirrorToCylindrical(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToCylindrical>(p, f);
}

Vector2d Projection::MirrorToMercator(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToMercator>(p, f);
}

Vector2d Projection::MirrorToLambertCylindrical(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToLambertCylindrical>(p,
                                                                                               f);
}

Vector2d Projection::MirrorToMillerCylindrical(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToMillerCylindrical>(p, f);
}

Vector2d Projection::MirrorToPannini(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToPannini>(p, f);
}

Vector2d Projection::MirrorToArchitectural(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToArchitectural>(p, f);
}

Vector2d Projection::MirrorToEquirectangularPannini(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToEquirectangular, EquirectangularToEquirectangularPannini>(
        p, f);
}

Vector2d Projection::MirrorToMirror(Vector2d const& p, float) {
    return p;
}

Vector2d Projection::MirrorToSpherical(Vector2d const& p, float f) {
    return Via<MirrorToFisheye, FisheyeToCylindrical, CylindricalToSpherical>(p, f);
}

// Spherical is a sink: nothing converts out of it but to itself.

Vector2d Projection::SphericalToSpherical(Vector2d const& p, float) {
    return p;
}

}  // namespace quorvel::vexmap
