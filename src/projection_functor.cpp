#include "vexmap/projection_functor.h"

#include <cerrno>

#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* SOURCE = "src/projection_functor";
constexpr int PROJECTION_COUNT = 16;

[[noreturn]] void Fail(int line, char const* function, char const* message) {
    Error::SetLastError(EINVAL);
    throw Error(CodeLocation(SOURCE, "ProjectionFunctor", function, line), EINVAL, "%s", message);
}

// One row of the table: a source's conversions to every target, in the order of _PROJECTION.
// Reserved is never a target, and the token pasting keeps every entry the member of its own
// source and target name.
#define VEXMAP_CONVERSIONS_FROM(source)                                                          \
    {                                                                                            \
        &Projection::source##ToRectilinear, &Projection::source##ToCylindrical,                  \
            &Projection::source##ToEquirectangular, &Projection::source##ToMercator,             \
            &Projection::source##ToLambertCylindrical, &Projection::source##ToMillerCylindrical, \
            &Projection::source##ToPannini, &Projection::source##ToArchitectural,                \
            &Projection::source##ToEquirectangularPannini, &Projection::source##ToStereographic, \
            &Projection::source##ToOrthographic, &Projection::source##ToEquisolid, nullptr,      \
            &Projection::source##ToFisheye, &Projection::source##ToSpherical,                    \
            &Projection::source##ToMirror                                                        \
    }
#define VEXMAP_NO_CONVERSIONS                                                                     \
    {                                                                                             \
        nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, \
            nullptr, nullptr, nullptr, nullptr, nullptr, nullptr                                  \
    }

// Rows are sources, columns targets. Nothing converts out of Reserved or Spherical.
constexpr ConversionFunction CONVERSIONS[PROJECTION_COUNT][PROJECTION_COUNT] = {
    VEXMAP_CONVERSIONS_FROM(Rectilinear),
    VEXMAP_CONVERSIONS_FROM(Cylindrical),
    VEXMAP_CONVERSIONS_FROM(Equirectangular),
    VEXMAP_CONVERSIONS_FROM(Mercator),
    VEXMAP_CONVERSIONS_FROM(LambertCylindrical),
    VEXMAP_CONVERSIONS_FROM(MillerCylindrical),
    VEXMAP_CONVERSIONS_FROM(Pannini),
    VEXMAP_CONVERSIONS_FROM(Architectural),
    VEXMAP_CONVERSIONS_FROM(EquirectangularPannini),
    VEXMAP_CONVERSIONS_FROM(Stereographic),
    VEXMAP_CONVERSIONS_FROM(Orthographic),
    VEXMAP_CONVERSIONS_FROM(Equisolid),
    VEXMAP_NO_CONVERSIONS,  // reserved
    VEXMAP_CONVERSIONS_FROM(Fisheye),
    VEXMAP_NO_CONVERSIONS,  // spherical
    VEXMAP_CONVERSIONS_FROM(Mirror),
};

#undef VEXMAP_CONVERSIONS_FROM
#undef VEXMAP_NO_CONVERSIONS

ProjectionFunctor::_PROJECTION AsProjection(_DEWARP_PROJECTION projection) {
    return static_cast<ProjectionFunctor::_PROJECTION>(projection);
}

}  // namespace

ProjectionFunctor::ProjectionFunctor()
    : conversion(&Projection::EquirectangularToEquirectangular),
      focal_length(FloatingPoint::Nan),
      scale(Projection::IdentityScale) {}

ProjectionFunctor::ProjectionFunctor(ProjectionFunctor const& other) = default;

ProjectionFunctor::ProjectionFunctor(ConversionFunction function, float f,
                                     Vector2d const& scale_value)
    : ProjectionFunctor() {
    Set(function, f, scale_value);
}

ProjectionFunctor::ProjectionFunctor(_DEWARP_PROJECTION a, _DEWARP_PROJECTION b, float f,
                                     Vector2d const& scale_value)
    : ProjectionFunctor() {
    Set(a, b, f, scale_value);
}

ProjectionFunctor::ProjectionFunctor(_DEWARP_INTERNAL_CAMERA_TYPE camera,
                                     _DEWARP_PROJECTION projection, float f,
                                     Vector2d const& scale_value)
    : ProjectionFunctor() {
    Set(camera, projection, f, scale_value);
}

ProjectionFunctor::ProjectionFunctor(_DEWARP_PROJECTION projection,
                                     _DEWARP_INTERNAL_CAMERA_TYPE camera, float f,
                                     Vector2d const& scale_value)
    : ProjectionFunctor() {
    Set(projection, camera, f, scale_value);
}

ProjectionFunctor& ProjectionFunctor::operator=(ProjectionFunctor const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "ProjectionFunctor");
        return *this;
    }
    Store(other.conversion, other.focal_length, other.scale);
    return *this;
}

ProjectionFunctor::~ProjectionFunctor() = default;

void ProjectionFunctor::Set(ConversionFunction function, float f, Vector2d const& scale_value) {
    if (function == nullptr) {
        Fail(__LINE__, "Set", "Invalid projection");
    }
    Store(function, f, scale_value);
}

// With two projections the second is the source: the argument order of this form differs from the
// mixed ones, and is kept.
void ProjectionFunctor::Set(_DEWARP_PROJECTION a, _DEWARP_PROJECTION b, float f,
                            Vector2d const& scale_value) {
    Store(GetProjection(AsProjection(b), AsProjection(a)), f, scale_value);
}

void ProjectionFunctor::Set(_DEWARP_INTERNAL_CAMERA_TYPE camera, _DEWARP_PROJECTION projection,
                            float f, Vector2d const& scale_value) {
    Store(GetProjection(camera, projection), f, scale_value);
}

void ProjectionFunctor::Set(_DEWARP_PROJECTION projection, _DEWARP_INTERNAL_CAMERA_TYPE camera,
                            float f, Vector2d const& scale_value) {
    Store(GetProjection(projection, camera), f, scale_value);
}

Vector2d ProjectionFunctor::Call(Vector2d const& point) {
    return conversion(point, focal_length);
}

void ProjectionFunctor::Reset() {
    Store(&Projection::EquirectangularToEquirectangular, FloatingPoint::Nan,
          Projection::IdentityScale);
}

ProjectionFunctor::_PROJECTION ProjectionFunctor::ConvertCamera(
    _DEWARP_INTERNAL_CAMERA_TYPE camera) {
    switch (camera) {
        case DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR:
            return PROJECTION_RECTILINEAR;
        case DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE:
            return PROJECTION_FISHEYE;
    }
    Fail(__LINE__, "ConvertCamera", "Invalid camera type");
}

ConversionFunction ProjectionFunctor::GetProjection(_PROJECTION from, _PROJECTION to) {
    uint32_t const row = uint32_t(from);
    uint32_t const column = uint32_t(to);
    ConversionFunction const function =
        row < PROJECTION_COUNT && column < PROJECTION_COUNT ? CONVERSIONS[row][column] : nullptr;
    if (function == nullptr) {
        Fail(__LINE__, "GetProjection", "Invalid projection");
    }
    return function;
}

ConversionFunction ProjectionFunctor::GetProjection(_DEWARP_INTERNAL_CAMERA_TYPE camera,
                                                    _DEWARP_PROJECTION projection) {
    return GetProjection(ConvertCamera(camera), AsProjection(projection));
}

ConversionFunction ProjectionFunctor::GetProjection(_DEWARP_PROJECTION projection,
                                                    _DEWARP_INTERNAL_CAMERA_TYPE camera) {
    return GetProjection(AsProjection(projection), ConvertCamera(camera));
}

void ProjectionFunctor::Store(ConversionFunction function, float f, Vector2d const& scale_value) {
    conversion = function;
    focal_length = f;
    scale = scale_value;
}

}  // namespace quorvel::vexmap
