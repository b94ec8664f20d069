#include "vexmap/view_builder.h"

#include <cerrno>

#include "vexmap/dual_panoramic_view.h"
#include "vexmap/error.h"
#include "vexmap/log.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"

namespace quorvel::vexmap {

ViewBuilder::ViewBuilder() = default;

ViewBuilder::ViewBuilder(ViewBuilder const&) = default;

ViewBuilder& ViewBuilder::operator=(ViewBuilder const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "ViewBuilder");
    }
    return *this;
}

ViewBuilder::~ViewBuilder() = default;

// The view kind is an int from the host, so a value outside the four is possible and checked.
AbstractView* ViewBuilder::BuildView(_DEWARP_VIEW view, boost::shared_ptr<Camera> const& camera,
                                     _DEWARP_PROJECTION projection) {
    switch (view) {
        case DEWARP_VIEW_SINGLE_PANORAMIC:
            return new SinglePanoramicView(camera, projection);
        case DEWARP_VIEW_DUAL_PANORAMIC:
            return new DualPanoramicView(camera, projection);
        case DEWARP_VIEW_SINGLE_PTZ:
            return new SinglePtzView(camera, projection);
        case DEWARP_VIEW_QUAD_PTZ:
            return new QuadPtzView(camera, projection);
    }
    Log::err(__LINE__, __FILE__, "BuildView", "Invalid view\n");
    Error::SetLastError(EINVAL);
    throw Error(CodeLocation("src/view_builder", "ViewBuilder", "BuildView", __LINE__), EINVAL,
                "%s", "Invalid view");
}

}  // namespace quorvel::vexmap
