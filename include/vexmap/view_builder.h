#pragma once

#include <boost/shared_ptr.hpp>

#include "vexmap/abstract_view.h"
#include "vexmap/camera.h"
#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// Makes a view object from a view kind. Stateless; any thread.
class ViewBuilder {
public:
    ViewBuilder();
    ViewBuilder(ViewBuilder const& other);
    ViewBuilder& operator=(ViewBuilder const& other);  // nothing to copy
    virtual ~ViewBuilder();

    /// A new view of the kind, owned by the caller; an unknown kind throws EINVAL.
    static AbstractView* BuildView(_DEWARP_VIEW view, boost::shared_ptr<Camera> const& camera,
                                   _DEWARP_PROJECTION projection);
};

}  // namespace quorvel::vexmap
