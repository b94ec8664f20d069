#include "vexmap/camera.h"

#include <cerrno>

#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/projection.h"
#include "vexmap/projection_functor.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* SOURCE = "src/camera";

using FieldOfViewFormula = Vector2d (*)(Vector2d const&, float);
using ResolutionFormula = Vector2d (*)(Vector2d const&, float);

struct ProjectionFormulas {
    FieldOfViewFormula field_of_view;
    ResolutionFormula resolution;
};

// The formulas of the nine public projections, by their value.
constexpr ProjectionFormulas FORMULAS[] = {
    {&Projection::RectilinearFieldOfView, &Projection::RectilinearResolution},
    {&Projection::CylindricalFieldOfView, &Projection::CylindricalResolution},
    {&Projection::EquirectangularFieldOfView, &Projection::EquirectangularResolution},
    {&Projection::MercatorFieldOfView, &Projection::MercatorResolution},
    {&Projection::LambertCylindricalFieldOfView, &Projection::LambertCylindricalResolution},
    {&Projection::MillerCylindricalFieldOfView, &Projection::MillerCylindricalResolution},
    {&Projection::PanniniFieldOfView, &Projection::PanniniResolution},
    {&Projection::ArchitecturalFieldOfView, &Projection::ArchitecturalResolution},
    {&Projection::EquirectangularPanniniFieldOfView, &Projection::EquirectangularPanniniResolution},
};

ProjectionFormulas const& FormulasOf(_DEWARP_PROJECTION projection, char const* function,
                                     int line) {
    if (uint32_t(projection) >= sizeof FORMULAS / sizeof FORMULAS[0]) {
        Error::SetLastError(EINVAL);
        throw Error(CodeLocation(SOURCE, "Camera", function, line), EINVAL, "Invalid projection");
    }
    return FORMULAS[projection];
}

_DEWARP_INTERNAL_CAMERA_MODEL const ZERO_MODEL{
    DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, 0.0f, 0.0f, 0.0f, 0, 0};

}  // namespace

float const Camera::MaxRectilinearFov = Trigonometry::DEGREES_TO_RADIANS * 140.0f;

Camera::Camera()
    : m_eType(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR),
      m_Model(ZERO_MODEL),
      m_eMount(DEWARP_INTERNAL_CAMERA_MOUNT_WALL) {}

Camera::Camera(Camera const& other) = default;

Camera::Camera(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount)
    : Camera() {
    SetCameraModel(model);
    m_eMount = mount;
}

Camera& Camera::operator=(Camera const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Camera");
        return *this;
    }
    m_eType = other.m_eType;
    m_FieldOfView = other.m_FieldOfView;
    m_Resolution = other.m_Resolution;
    m_Model = other.m_Model;
    m_eMount = other.m_eMount;
    return *this;
}

Camera::~Camera() = default;

_DEWARP_PROJECTION Camera::GetDefaultProjection() const {
    return Defaults::Projection;
}

_DEWARP_ASPECT_RATIO Camera::GetDefaultAspectRatio() const {
    return Defaults::AspectRatio;
}

Vector2d Camera::GetShift(_DEWARP_PROJECTION, Vector2d const& size) const {
    Vector2d shift(Projection::ZeroShift);
    if (m_eMount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING) {
        shift = Vector2d(0.0f, size.y * 0.5f);
    } else if (m_eMount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR) {
        shift = Vector2d(0.0f, -(size.y * 0.5f));
    }
    return shift;
}

Vector2d Camera::GetScale() const {
    return Projection::IdentityScale;
}

// The functor runs from the projection's plane to the camera's, and the camera's own edge offsets
// go through it all the same: that is how the size is defined.
Resolution Camera::GetProjectionMapSize(_DEWARP_PROJECTION projection) const {
    ProjectionFunctor functor(projection, m_eType, GetFocalLength(), Projection::IdentityScale);
    Vector2d const north = functor.Call(m_Resolution.NorthOffset());
    Vector2d const south = functor.Call(m_Resolution.SouthOffset());
    Vector2d const east = functor.Call(m_Resolution.EastOffset());
    Vector2d const west = functor.Call(m_Resolution.WestOffset());
    return Resolution(FloatingPoint::floor(east.x - west.x),
                      FloatingPoint::floor(north.y - south.y));
}

FieldOfView Camera::GetProjectionFieldOfView(Resolution const& resolution,
                                             _DEWARP_PROJECTION projection) const {
    FieldOfViewFormula const formula =
        FormulasOf(projection, "GetProjectionFieldOfView", __LINE__).field_of_view;
    return FieldOfView(formula(resolution, GetFocalLength()));
}

Resolution Camera::GetProjectionResolution(FieldOfView const& field_of_view,
                                           _DEWARP_PROJECTION projection) const {
    ResolutionFormula const formula =
        FormulasOf(projection, "GetProjectionResolution", __LINE__).resolution;
    Resolution resolution;
    resolution =
        formula(Vector2d(field_of_view.horizontal, field_of_view.vertical), GetFocalLength());
    return resolution;
}

float Camera::GetFocalLength() const {
    float const half_width = m_Resolution.x / 2.0f;
    float const half_field = m_FieldOfView.horizontal / 2.0f;
    switch (m_eType) {
        case DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE:
            return Projection::FisheyeFocalLength(half_width, half_field);
        case DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR:
            return Projection::RectilinearFocalLength(half_width, half_field);
    }
    return FloatingPoint::Nan;
}

void Camera::SetCameraModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model) {
    m_eType = model.type;
    m_FieldOfView = FieldOfView(Trigonometry::degrees_to_radians(model.horizontal_fov),
                                Trigonometry::degrees_to_radians(model.vertical_fov),
                                Trigonometry::degrees_to_radians(model.diagonal_fov));
    m_Resolution = Resolution(unsigned(model.width), unsigned(model.height));
    m_Model = model;
}

void Camera::SetCameraMount(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    m_eMount = mount;
}

std::string Camera::GetCameraTypeName(_DEWARP_INTERNAL_CAMERA_TYPE type) {
    switch (type) {
        case DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR:
            return "rectilinear";
        case DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE:
            return "circular fish eye";
    }
    return "<unknown>";
}

// The field-of-view line names the diagonal and the vertical field, in that order, as it always
// has.
void Camera::LogCameraInfo() const {
    Log::info(__LINE__, __FILE__, "LogCameraInfo", "Camera type is %s\n",
              GetCameraTypeName(m_eType).c_str());
    Log::info(__LINE__, __FILE__, "LogCameraInfo", "Camera resolution is (%d, %d)\n",
              int(m_Model.width), int(m_Model.height));
    Log::info(__LINE__, __FILE__, "LogCameraInfo", "Camera FOV is (%f, %f)\n",
              double(m_Model.diagonal_fov), double(m_Model.vertical_fov));
}

Vector2d Camera::GetPtzOffset(Vector2d const& point) const {
    switch (m_eType) {
        case DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE:
            return Projection::FisheyeResolution(point, GetFocalLength());
        case DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR:
            return Projection::RectilinearResolution(point, GetFocalLength());
    }
    return Vector2d::InvalidVector;
}

}  // namespace quorvel::vexmap
