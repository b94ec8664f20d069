#pragma once

#include <cstdint>

#include <boost/shared_ptr.hpp>

#include "vexmap/abstract_view.h"
#include "vexmap/camera.h"
#include "vexmap/dewarp_types.h"
#include "vexmap/read_write_mutex.h"
#include "vexmap/vector_2d.h"
#include "vexmap/view_cache.h"

namespace quorvel::vexmap {

/// One open dewarping stream: the camera, the four settings, the current view and every view
/// built so far. Setters take the write lock, getters and frames the read lock, so several
/// frames may be remapped at once; one frame thread at a time is expected, as a first view or
/// map is built under the read lock. Copies share the lock, camera and views.
class Channel {
public:
    Channel();
    Channel(Channel const& other);
    explicit Channel(_DEWARP_CHANNEL_SETTINGS const& settings);
    Channel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
    Channel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount,
            _DEWARP_CHANNEL_SETTINGS const& settings);
    Channel& operator=(Channel const& other);
    virtual ~Channel();

    bool SetModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model);
    bool SetModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
    _DEWARP_INTERNAL_CAMERA_MODEL GetModel() const;
    bool SetView(_DEWARP_VIEW view);
    _DEWARP_VIEW GetView() const;
    bool SetProjection(_DEWARP_VIEW view, _DEWARP_PROJECTION projection);
    _DEWARP_PROJECTION GetProjection() const;
    bool SetInterpolation(_DEWARP_INTERPOLATION interpolation);
    _DEWARP_INTERPOLATION GetInterpolation() const;
    bool SetAspectRatio(_DEWARP_ASPECT_RATIO aspect_ratio);
    _DEWARP_ASPECT_RATIO GetAspectRatio() const;
    bool GetSettings(_DEWARP_CHANNEL_SETTINGS& settings) const;
    bool GetNativeResolution(_DEWARP_RESOLUTION& resolution) const;
    bool SetMount(_DEWARP_INTERNAL_CAMERA_MOUNT mount);
    _DEWARP_INTERNAL_CAMERA_MOUNT GetMount() const;
    /// The position the view took, which may differ from the one asked, goes back to the record.
    bool SetPtz(_DEWARP_PTZ_POSITION& position);
    bool ResetPtz();
    bool GetPtz(_DEWARP_PTZ_POSITION& position) const;
    bool GetPtzRange(_DEWARP_PTZ_RANGE& range) const;
    bool CalcPtzPosition(Vector2d const& point, float zoom, _DEWARP_PTZ_POSITION& position) const;
    bool DewarpImage(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped) const;
    /// Builds the current view's map for frames of the size, under the write lock, so that
    /// DewarpImageRows can then run on several threads at once.
    bool PrepareImage(_DEWARP_IMAGE_INFO const& dewarped);
    /// One band of rows of a frame through the current view's map, under the read lock; builds
    /// nothing and throws EINVAL when the channel was not prepared for the frame's size.
    bool DewarpImageRows(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped, uint64_t first_row,
                         uint64_t row_count) const;

    /// The view of the kind and projection for the camera's mount, from the cache or built and
    /// cached. Const, yet it fills the cache: the frame path may build under the read lock.
    boost::shared_ptr<AbstractView> GetViewObject(_DEWARP_VIEW view,
                                                  _DEWARP_PROJECTION projection) const;
    /// The current view, found or built first if there is none.
    boost::shared_ptr<AbstractView> GetViewObject() const;

protected:
    AbstractView* BuildView(_DEWARP_VIEW view, _DEWARP_PROJECTION projection) const;
    void BuildCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                     _DEWARP_INTERNAL_CAMERA_MOUNT mount);

    boost::shared_ptr<ReadWriteMutex> m_pMutex;  // always set; shared with copies
    boost::shared_ptr<Camera> m_pCamera;         // null until a model is known
    mutable boost::shared_ptr<AbstractView> m_pView;
    _DEWARP_VIEW m_eView;
    _DEWARP_INTERPOLATION m_eInterpolation;  // stored and reported only
    _DEWARP_ASPECT_RATIO m_eAspectRatio;
    _DEWARP_PROJECTION m_eProjection;
    mutable ViewCache m_Cache;

private:
    /// The work of both SetModel forms, under the write lock that the caller holds.
    bool ReplaceCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                       _DEWARP_INTERNAL_CAMERA_MOUNT mount);
};

}  // namespace quorvel::vexmap
