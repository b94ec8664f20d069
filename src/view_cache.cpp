#include "vexmap/view_cache.h"

#include "vexmap/log.h"

namespace quorvel::vexmap {

ViewCache::ViewCache() = default;

ViewCache::ViewCache(ViewCache const&) = default;

ViewCache& ViewCache::operator=(ViewCache const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "ViewCache");
        return *this;
    }
    views = other.views;
    return *this;
}

ViewCache::~ViewCache() = default;

ViewCache::Key ViewCache::MakeKey(_DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                  _DEWARP_PROJECTION projection, _DEWARP_VIEW view) {
    return Key(mount, std::make_pair(projection, view));
}

boost::shared_ptr<AbstractView> ViewCache::Get(Key const& key) const {
    auto const found = views.find(key);
    return found == views.end() ? boost::shared_ptr<AbstractView>() : found->second;
}

boost::shared_ptr<AbstractView> ViewCache::Get(_DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                               _DEWARP_PROJECTION projection,
                                               _DEWARP_VIEW view) const {
    return Get(MakeKey(mount, projection, view));
}

// A channel looks before it sets, so an overwrite tells of a caller that did not.
void ViewCache::Set(Key const& key, boost::shared_ptr<AbstractView>& view_object) {
    auto const found = views.find(key);
    if (found != views.end()) {
        Log::info(__LINE__, __FILE__, "Set", "Projection map cache item was overwritten\n");
        found->second = view_object;
        return;
    }
    views.emplace(key, view_object);
}

void ViewCache::Set(_DEWARP_INTERNAL_CAMERA_MOUNT mount, _DEWARP_PROJECTION projection,
                    _DEWARP_VIEW view, boost::shared_ptr<AbstractView>& view_object) {
    Set(MakeKey(mount, projection, view), view_object);
}

void ViewCache::Clear() {
    views.clear();
}

}  // namespace quorvel::vexmap
