#pragma once

#include <map>
#include <utility>

#include <boost/shared_ptr.hpp>

#include "vexmap/abstract_view.h"
#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// Every view a channel has been asked for, by mount, projection and view kind, each with its own
/// map and position. Copies share the views. No lock: the channel's lock guards every call.
class ViewCache {
public:
    typedef std::pair<_DEWARP_INTERNAL_CAMERA_MOUNT, std::pair<_DEWARP_PROJECTION, _DEWARP_VIEW>>
        Key;

    ViewCache();
    ViewCache(ViewCache const& other);
    ViewCache& operator=(ViewCache const& other);
    virtual ~ViewCache();

    static Key MakeKey(_DEWARP_INTERNAL_CAMERA_MOUNT mount, _DEWARP_PROJECTION projection,
                       _DEWARP_VIEW view);
    /// Null when absent; a miss is no error.
    boost::shared_ptr<AbstractView> Get(Key const& key) const;
    boost::shared_ptr<AbstractView> Get(_DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                        _DEWARP_PROJECTION projection, _DEWARP_VIEW view) const;
    void Set(Key const& key, boost::shared_ptr<AbstractView>& view_object);
    void Set(_DEWARP_INTERNAL_CAMERA_MOUNT mount, _DEWARP_PROJECTION projection, _DEWARP_VIEW view,
             boost::shared_ptr<AbstractView>& view_object);
    void Clear();
    std::size_t Size() const { return views.size(); }

private:
    std::map<Key, boost::shared_ptr<AbstractView>> views;
};

}  // namespace quorvel::vexmap
