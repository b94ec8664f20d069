#pragma once

#include <cstdint>

#include "vexmap/dewarp_types.h"
#include "vexmap/euler_angles.h"
#include "vexmap/field_of_view.h"
#include "vexmap/ptz_position.h"
#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// What a view may reach: an interval per axis, each held upper bound first (`x` upper, `y`
/// lower; radians for the angles, factors for the zoom), and a word of flags. The engine's form of
/// `_DEWARP_PTZ_RANGE`, which holds degrees lower bound first. A value; any thread.
class PtzRange {
public:
    static constexpr uint32_t ZeroFlags = 0;
    static constexpr uint32_t NoDeflateHighTilt = 1;  // Deflate leaves the upper tilt bound
    static constexpr uint32_t NoDeflateLowTilt = 2;   // Deflate leaves the lower tilt bound

    static Vector2d const EmptyZoomRange;     // (0, 0)
    static Vector2d const InfiniteZoomRange;  // up to infinity, down to 0.5
    static Vector2d const FullMotion;         // (PI, -PI)
    static Vector2d const NoMotion;           // (0, 0)

    static PtzRange const EmptyPtzRange;
    static PtzRange const CeilingPanoramicRange;
    static PtzRange const FloorPanoramicRange;
    static PtzRange const WallPanoramicRange;
    static PtzRange const InvertedWallPanoramicRange;
    static PtzRange const CeilingPtzRange;  // tilt from -135 to 22.5 degrees
    static PtzRange const FloorPtzRange;    // tilt from -22.5 to 135 degrees

    PtzRange();  // all zero
    PtzRange(PtzRange const& other);
    PtzRange(Vector2d const& pan_range, Vector2d const& tilt_range, Vector2d const& roll_range,
             Vector2d const& zoom_range, uint32_t flag_bits);
    explicit PtzRange(_DEWARP_PTZ_RANGE const& record);
    PtzRange(FieldOfView const& field_of_view, Vector2d const& zoom_range, uint32_t flag_bits);
    PtzRange(EulerAngles const& extent, Vector2d const& zoom_range, uint32_t flag_bits);
    PtzRange& operator=(PtzRange const& other);
    PtzRange& operator=(_DEWARP_PTZ_RANGE const& record);
    virtual ~PtzRange();

    /// Degrees to radians, each bound normalised into [-PI, PI), the pairs turned round; the
    /// zoom as it stands; the flags untouched.
    void Set(_DEWARP_PTZ_RANGE const& record);
    /// Half the field each way round the centre; roll is free.
    void Set(FieldOfView const& field_of_view, Vector2d const& zoom_range);
    /// Half of each angle each way round the centre.
    void Set(EulerAngles const& extent, Vector2d const& zoom_range);
    /// Degrees, lower bound before upper; no flags.
    _DEWARP_PTZ_RANGE Get() const;

    /// Narrows pan and tilt by half the view's own field, so that the picture's edge and not its
    /// centre stops at the limit. A range narrower than the field becomes its midpoint.
    void Deflate(FieldOfView const& field_of_view);
    /// Widens pan and tilt by half the field; the flags play no part.
    void Inflate(FieldOfView const& field_of_view);

    // Raised to the lower bound, then lowered to the upper one; NaN passes. No angle wraps.
    float LimitPan(float value) const;
    float LimitTilt(float value) const;
    float LimitRoll(float value) const;
    float LimitZoom(float value) const;
    PtzPosition Limit(PtzPosition const& position) const;

    Vector2d pan;
    Vector2d tilt;
    Vector2d roll;
    Vector2d zoom;
    uint32_t flags;
};

}  // namespace quorvel::vexmap
