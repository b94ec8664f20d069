#include "vexmap/channel.h"

#include <cerrno>
#include <cstddef>
#include <limits>
#include <memory>

#include <boost/make_shared.hpp>

#include "vexmap/camera_builder.h"
#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/log.h"
#include "vexmap/ptz_position.h"
#include "vexmap/ptz_range.h"
#include "vexmap/resolution.h"
#include "vexmap/view.h"
#include "vexmap/view_builder.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* SOURCE = "src/channel";

[[noreturn]] void Fail(int line, char const* function, int code, char const* message) {
    Error::SetLastError(code);
    throw Error(CodeLocation(SOURCE, "Channel", function, line), code, "%s", message);
}

// Truncated to whole pixels. A size that no 64-bit count holds, from a lens of absurd angles,
// is held at the ends of the count instead of being converted undefined: NaN and below zero
// give 0, beyond the largest count the largest.
std::size_t WholePixels(float size) {
    constexpr float COUNT_LIMIT = 18446744073709551616.0f;  // 2^64
    if (!(size > 0.0f)) {
        return 0;
    }
    return size < COUNT_LIMIT ? std::size_t(size) : std::numeric_limits<std::size_t>::max();
}

}  // namespace

Channel::Channel()
    : m_pMutex(boost::make_shared<ReadWriteMutex>()),
      m_eView(Defaults::View),
      m_eInterpolation(Defaults::Interpolation),
      m_eAspectRatio(Defaults::AspectRatio),
      m_eProjection(Defaults::Projection) {}

// The projection is not copied but starts at the default, by intent. The lock, camera and views
// are shared, and the cache is a second map over the same views. No lock is taken: a channel is
// copied before threads share it.
Channel::Channel(Channel const& other)
    : m_pMutex(other.m_pMutex),
      m_pCamera(other.m_pCamera),
      m_pView(other.m_pView),
      m_eView(other.m_eView),
      m_eInterpolation(other.m_eInterpolation),
      m_eAspectRatio(other.m_eAspectRatio),
      m_eProjection(Defaults::Projection),
      m_Cache(other.m_Cache) {}

Channel::Channel(_DEWARP_CHANNEL_SETTINGS const& settings)
    : m_pMutex(boost::make_shared<ReadWriteMutex>()),
      m_eView(settings.view),
      m_eInterpolation(settings.interpolation),
      m_eAspectRatio(settings.aspect_ratio),
      m_eProjection(settings.projection) {}

// A model of an unknown type leaves no camera and so no camera defaults: the global ones stand.
Channel::Channel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount)
    : Channel() {
    BuildCamera(model, mount);
    if (m_pCamera) {
        m_eAspectRatio = m_pCamera->GetDefaultAspectRatio();
        m_eProjection = m_pCamera->GetDefaultProjection();
    }
}

Channel::Channel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount,
                 _DEWARP_CHANNEL_SETTINGS const& settings)
    : Channel(settings) {
    BuildCamera(model, mount);
}

// The view kind is not taken over, by intent. Both locks are held for writing, the own first;
// a source that already shares the own mutex is covered by that hold, as a second would fail.
Channel& Channel::operator=(Channel const& other) {
    boost::shared_ptr<ReadWriteMutex> const own_mutex = m_pMutex;  // the member changes below
    WriteLock const own_lock(*own_mutex);
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "Channel");
        return *this;
    }
    auto const take_over = [this, &other]() {
        m_pMutex = other.m_pMutex;
        m_pCamera = other.m_pCamera;
        m_pView = other.m_pView;
        m_eInterpolation = other.m_eInterpolation;
        m_eAspectRatio = other.m_eAspectRatio;
        m_eProjection = other.m_eProjection;
        m_Cache = other.m_Cache;
    };
    if (other.m_pMutex == own_mutex) {
        take_over();
    } else {
        WriteLock const other_lock(*other.m_pMutex);
        take_over();
    }
    return *this;
}

// Members go in reverse order of declaration: the cache, the view, the camera, the mutex.
Channel::~Channel() = default;

bool Channel::SetModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model) {
    WriteLock const lock(*m_pMutex);
    return ReplaceCamera(model, Defaults::CameraMount);
}

bool Channel::SetModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                       _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    WriteLock const lock(*m_pMutex);
    return ReplaceCamera(model, mount);
}

// Takes no lock, by design: it must not meet a SetModel on another thread.
_DEWARP_INTERNAL_CAMERA_MODEL Channel::GetModel() const {
    if (!m_pCamera) {
        Log::err(__LINE__, __FILE__, "GetModel", "The camera object was invalid\n");
        Fail(__LINE__, "GetModel", EFAULT, "Invalid camera");
    }
    return m_pCamera->GetModel();
}

bool Channel::SetView(_DEWARP_VIEW view) {
    WriteLock const lock(*m_pMutex);
    m_pView = GetViewObject(view, m_eProjection);
    if (m_pView) {
        m_eView = view;
        m_pView->SetAspectRatio(m_eAspectRatio);
    }
    return bool(m_pView);
}

_DEWARP_VIEW Channel::GetView() const {
    ReadLock const lock(*m_pMutex);
    return m_eView;
}

bool Channel::SetProjection(_DEWARP_VIEW view, _DEWARP_PROJECTION projection) {
    WriteLock const lock(*m_pMutex);
    m_pView = GetViewObject(view, projection);
    if (m_pView) {
        m_eView = view;
        m_eProjection = projection;
        m_pView->SetAspectRatio(m_eAspectRatio);
    }
    return bool(m_pView);
}

_DEWARP_PROJECTION Channel::GetProjection() const {
    ReadLock const lock(*m_pMutex);
    return m_eProjection;
}

bool Channel::SetInterpolation(_DEWARP_INTERPOLATION interpolation) {
    WriteLock const lock(*m_pMutex);
    m_eInterpolation = interpolation;
    return true;
}

_DEWARP_INTERPOLATION Channel::GetInterpolation() const {
    ReadLock const lock(*m_pMutex);
    return m_eInterpolation;
}

bool Channel::SetAspectRatio(_DEWARP_ASPECT_RATIO aspect_ratio) {
    WriteLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "SetAspectRatio", "The view was invalid\n");
        return false;
    }
    view_object->SetAspectRatio(aspect_ratio);
    m_eAspectRatio = aspect_ratio;
    return true;
}

_DEWARP_ASPECT_RATIO Channel::GetAspectRatio() const {
    ReadLock const lock(*m_pMutex);
    return m_eAspectRatio;
}

bool Channel::GetSettings(_DEWARP_CHANNEL_SETTINGS& settings) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "GetSettings", "The view was invalid\n");
        return false;
    }
    settings.view = m_eView;
    settings.projection = m_eProjection;
    settings.aspect_ratio = m_eAspectRatio;
    settings.interpolation = m_eInterpolation;
    return true;
}

bool Channel::GetNativeResolution(_DEWARP_RESOLUTION& resolution) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "GetNativeResolution", "The view was invalid\n");
        return false;
    }
    Resolution const size = view_object->GetProjectionSize();
    resolution.width = WholePixels(size.x);
    resolution.height = WholePixels(size.y);
    return true;
}

// The cache keeps the views of the old mount: a return to it finds them again.
bool Channel::SetMount(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    WriteLock const lock(*m_pMutex);
    if (!m_pCamera) {
        Log::err(__LINE__, __FILE__, "SetMount", "The camera was invalid\n");
        return false;
    }
    m_pCamera->SetCameraMount(mount);
    m_pView.reset();
    GetViewObject();
    return true;
}

_DEWARP_INTERNAL_CAMERA_MOUNT Channel::GetMount() const {
    ReadLock const lock(*m_pMutex);
    return m_pCamera ? m_pCamera->GetMount() : Defaults::CameraMount;
}

bool Channel::SetPtz(_DEWARP_PTZ_POSITION& position) {
    WriteLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "SetPtz", "The view was invalid\n");
        return true;
    }
    view_object->SetPtz(PtzPosition(position)).Get(position);
    return true;
}

bool Channel::ResetPtz() {
    WriteLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "ResetPtz", "The view was invalid\n");
        return true;
    }
    view_object->ResetPtz();
    return true;
}

bool Channel::GetPtz(_DEWARP_PTZ_POSITION& position) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "GetPtz", "The view was invalid\n");
        return true;
    }
    view_object->GetPtz().Get(position);
    return true;
}

bool Channel::GetPtzRange(_DEWARP_PTZ_RANGE& range) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        Log::err(__LINE__, __FILE__, "GetPtzRange", "The view was invalid\n");
        return true;
    }
    range = view_object->GetPtzRange().Get();
    return true;
}

bool Channel::CalcPtzPosition(Vector2d const& point, float zoom,
                              _DEWARP_PTZ_POSITION& position) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        return false;
    }
    view_object->CalcPtzPosition(point, zoom).Get(position);
    return true;
}

// The frame path: a read lock, a pointer copy and the view's own frame, so that frames on one
// channel may run at once and a position change waits for them.
bool Channel::DewarpImage(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped) const {
    ReadLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    if (!view_object) {
        return false;
    }
    view_object->DewarpImage(warped, dewarped);
    return true;
}

bool Channel::PrepareImage(_DEWARP_IMAGE_INFO const& dewarped) {
    WriteLock const lock(*m_pMutex);
    boost::shared_ptr<AbstractView> const view_object = GetViewObject();
    View* const view = dynamic_cast<View*>(view_object.get());
    if (view == nullptr) {
        Log::err(__LINE__, __FILE__, "PrepareImage", "The view was invalid\n");
        return false;
    }
    view->CheckMap(Resolution(uint32_t(dewarped.width), uint32_t(dewarped.height)));
    if (!view->GetImageMap()) {
        Fail(__LINE__, "PrepareImage", EINVAL, "Invalid image map");
    }
    return true;
}

// The current view as it stands: a band must not build one under the read lock that other bands
// share.
bool Channel::DewarpImageRows(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped,
                              uint64_t first_row, uint64_t row_count) const {
    ReadLock const lock(*m_pMutex);
    View const* const view = dynamic_cast<View const*>(m_pView.get());
    if (view == nullptr) {
        Log::err(__LINE__, __FILE__, "DewarpImageRows", "The view was not prepared\n");
        Fail(__LINE__, "DewarpImageRows", EINVAL, "Image map not prepared");
    }
    view->DewarpRows(warped, dewarped, first_row, row_count);
    return true;
}

// A hit comes back as it is, with the aspect ratio that it last had. A miss builds and caches;
// it may run under the read lock, which is why the cache and current view are mutable.
boost::shared_ptr<AbstractView> Channel::GetViewObject(_DEWARP_VIEW view,
                                                       _DEWARP_PROJECTION projection) const {
    if (!m_pCamera) {
        Log::err(__LINE__, __FILE__, "GetViewObject", "The camera object was invalid\n");
        Fail(__LINE__, "GetViewObject", EFAULT, "Invalid camera");
    }
    ViewCache::Key const key = ViewCache::MakeKey(m_pCamera->GetMount(), projection, view);
    boost::shared_ptr<AbstractView> found = m_Cache.Get(key);
    if (found) {
        return found;
    }
    boost::shared_ptr<AbstractView> built(BuildView(view, projection));
    if (!built) {
        Log::err(__LINE__, __FILE__, "GetViewObject", "Could not build view\n");
        Fail(__LINE__, "GetViewObject", ENOMEM, "Invalid view");
    }
    m_Cache.Set(key, built);
    return built;
}

// Never null, as a failed build throws; the null branches of the callers stay as a defence, and
// those of the position calls still answer true, as they always have.
boost::shared_ptr<AbstractView> Channel::GetViewObject() const {
    if (!m_pView) {
        m_pView = GetViewObject(m_eView, m_eProjection);
    }
    return m_pView;
}

AbstractView* Channel::BuildView(_DEWARP_VIEW view, _DEWARP_PROJECTION projection) const {
    if (!m_pCamera) {
        return nullptr;
    }
    std::unique_ptr<AbstractView> view_object(ViewBuilder::BuildView(view, m_pCamera, projection));
    if (view_object) {
        view_object->SetAspectRatio(m_eAspectRatio);
    }
    return view_object.release();
}

// Views made for the old camera keep it alive for as long as they live.
void Channel::BuildCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                          _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    m_pCamera = boost::shared_ptr<Camera>(CameraBuilder::MakeCamera(model, mount));
    if (m_pCamera) {
        m_pCamera->LogCameraInfo();
    }
}

// Every view goes with the old camera, and the first for the new one is built before returning.
bool Channel::ReplaceCamera(_DEWARP_INTERNAL_CAMERA_MODEL const& model,
                            _DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    BuildCamera(model, mount);
    m_pView.reset();
    m_Cache.Clear();
    GetViewObject();
    return bool(m_pCamera);
}

}  // namespace quorvel::vexmap
