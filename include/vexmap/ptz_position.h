#pragma once

#include "vexmap/dewarp_types.h"
#include "vexmap/euler_angles.h"

namespace quorvel::vexmap {

/// Where a virtual PTZ view looks: an orientation in radians and a zoom factor, 1 being the natural
/// size. The engine's form of `_DEWARP_PTZ_POSITION`, which holds degrees. Comparisons are lenient
/// about NaN, as those of `EulerAngles`. A value; any thread.
class PtzPosition {
public:
    static constexpr float DefaultZoom = 1.0f;
    static EulerAngles const DefaultOrientation;  // (0, 0, 0)
    static PtzPosition const Identity;

    PtzPosition();  // the default orientation at zoom 1
    PtzPosition(PtzPosition const& other);
    PtzPosition(EulerAngles const& orientation_value, float zoom_value);
    explicit PtzPosition(_DEWARP_PTZ_POSITION const& record);
    PtzPosition& operator=(PtzPosition const& other);
    PtzPosition& operator=(_DEWARP_PTZ_POSITION const& record);
    virtual ~PtzPosition();

    /// Degrees to radians, each angle normalised into [-PI, PI); the zoom as it stands. So a pan
    /// of 180 degrees reads back as -180.
    void Set(_DEWARP_PTZ_POSITION const& record);
    /// Radians to degrees, not normalised.
    void Get(_DEWARP_PTZ_POSITION& record) const;
    _DEWARP_PTZ_POSITION Get() const;

    bool operator==(PtzPosition const& other) const;
    bool operator!=(PtzPosition const& other) const;
    /// False for every position: a NaN-lenient != against the invalid orientation never holds.
    /// Nothing relies on it; kept as it is.
    bool IsValid() const;
    /// The identity orientation; the zoom stays.
    void SetIdentity();
    /// NaN orientation and zoom.
    void Clear();
    /// This orientation composed with the other's through quaternions, and the zooms multiplied.
    void Concatenate(PtzPosition const& other);
    void Concatenate(EulerAngles const& other);  // the zoom untouched
    static PtzPosition Concatenate(PtzPosition const& a, PtzPosition const& b);

    EulerAngles orientation;
    float zoom;
};

}  // namespace quorvel::vexmap
