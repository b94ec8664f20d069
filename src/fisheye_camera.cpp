#include "vexmap/fisheye_camera.h"

#include <cerrno>

#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/projection.h"
#include "vexmap/projection_functor.h"
#include "vexmap/rotation.h"
#include "vexmap/rotation_matrix_3d.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* SOURCE = "src/fisheye_camera";
constexpr float FAR_FROM_CENTRE = 1.9f;  // a hit beyond width / 1.9 is pulled in
constexpr float PULLED_IN = 0.95f;       // to 95 percent of half the width

bool OnCeilingOrFloor(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ||
           mount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
}

bool OnAWall(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return mount == DEWARP_INTERNAL_CAMERA_MOUNT_WALL ||
           mount == DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL;
}

void LogPoint(int line, char const* format, float x, float y) {
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
#pragma GCC diagnostic ignored "-Wformat-security"
    Log::err(line, __FILE__, "MapHitPoint", format, double(x), double(y));
#pragma GCC diagnostic pop
}

}  // namespace

PtzPosition const FisheyeCamera::CeilingOrientation(EulerAngles(0.0f, Trigonometry::HALF_PI, 0.0f),
                                                    PtzPosition::DefaultZoom);
PtzPosition const FisheyeCamera::FloorOrientation(EulerAngles(0.0f, Trigonometry::HALF_PI,
                                                              Trigonometry::PI),
                                                  PtzPosition::DefaultZoom);
PtzPosition const FisheyeCamera::WallOrientation(EulerAngles(0.0f, 0.0f, 0.0f),
                                                 PtzPosition::DefaultZoom);
PtzPosition const FisheyeCamera::InvertedWallOrientation(EulerAngles(0.0f, 0.0f, Trigonometry::PI),
                                                         PtzPosition::DefaultZoom);

FisheyeCamera::FisheyeCamera() = default;

FisheyeCamera::FisheyeCamera(FisheyeCamera const& other) = default;

FisheyeCamera::FisheyeCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                             _DEWARP_INTERNAL_CAMERA_MOUNT mount)
    : Camera(model, mount) {}

// Copies nothing, not even the camera part, unlike Camera's own assignment: kept so.
FisheyeCamera& FisheyeCamera::operator=(FisheyeCamera const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "FisheyeCamera");
    }
    return *this;
}

FisheyeCamera::~FisheyeCamera() = default;

PtzPosition FisheyeCamera::GetHomePosition() const {
    PtzPosition home(PtzPosition::Identity);
    switch (m_eMount) {
        case DEWARP_INTERNAL_CAMERA_MOUNT_CEILING:
            home = CeilingOrientation;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR:
            home = FloorOrientation;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_WALL:
            home = WallOrientation;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL:
            home = InvertedWallOrientation;
            break;
        default:
            Error::SetLastError(EINVAL);
            throw Error(CodeLocation(SOURCE, "FisheyeCamera", "GetHomePosition", __LINE__), EINVAL,
                        "Invalid camera mount");
    }
    return home;
}

Vector2d FisheyeCamera::RotateHitPoint(Vector2d const& point, float f) const {
    RotationMatrix3d const rotation(GetHomePosition().orientation);
    return Rotation::InverseSphericalRotation(point, f, rotation);
}

Vector2d FisheyeCamera::MapHitPoint(Vector2d const& point, float f) const {
    ProjectionFunctor functor(m_eType, DEWARP_PROJECTION_EQUIRECTANGULAR, f,
                              Projection::IdentityScale);
    return functor.Call(point);
}

Vector2d FisheyeCamera::MapHitPoint(Vector2d const& point) const {
    float const f = GetFocalLength();
    Vector2d const scale = GetScale();
    Vector2d hit(point);
    LogPoint(__LINE__, "Input hit point is (%f,%f)\n", hit.x, hit.y);
    if (OnCeilingOrFloor(m_eMount)) {
        hit.y = m_Resolution.y - hit.y;
    }
    hit = hit - m_Resolution.Centre();
    LogPoint(__LINE__, "Normalised hit point is (%f,%f)\n", hit.x, hit.y);
    if (OnCeilingOrFloor(m_eMount)) {
        // The scale in force is (0, 0): the division gives infinities, or NaN at zero, on purpose.
        hit.x /= scale.x;
        hit.y /= scale.y;
    }
    if (OnAWall(m_eMount)) {
        float const r = Trigonometry::hypot(hit.x, hit.y);
        if (FloatingPoint::is_greater(r, m_Resolution.x / FAR_FROM_CENTRE)) {
            float const pull = m_Resolution.x * 0.5f / r * PULLED_IN;
            hit.x *= pull;
            hit.y *= pull;
        }
    }
    LogPoint(__LINE__, "Scaled hit point is (%f,%f)\n", hit.x, hit.y);
    hit = RotateHitPoint(hit, f);
    LogPoint(__LINE__, "Rotated hit point is (%f,%f)\n", hit.x, hit.y);
    hit = MapHitPoint(hit, f);
    hit.x /= f;
    hit.y /= f;
    if (OnAWall(m_eMount)) {
        float const shifted = hit.x + Trigonometry::HALF_PI;
        hit.x = shifted -
                Trigonometry::PI * FloatingPoint::floor(shifted * Trigonometry::ONE_OVER_PI) -
                Trigonometry::HALF_PI;
    }
    if (OnCeilingOrFloor(m_eMount)) {
        hit.y = -hit.y;
    }
    LogPoint(__LINE__, "Mapped hit point is (%f,%f) degrees\n",
             Trigonometry::radians_to_degrees(hit.x), Trigonometry::radians_to_degrees(hit.y));
    return hit;
}

}  // namespace quorvel::vexmap
