#pragma once

#include "vexmap/single_ptz_view.h"

namespace quorvel::vexmap {

/// Four PTZ pictures in a 2 x 2 grid, a quarter turn apart in pan, for a camera on a ceiling or
/// floor; on a wall it is a single PTZ view. One position, that of the top left pane; the others
/// follow it. Guarded as a View.
class QuadPtzView : public SinglePtzView {
public:
    QuadPtzView();
    QuadPtzView(QuadPtzView const& other);
    QuadPtzView(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value);
    QuadPtzView& operator=(QuadPtzView const& other);
    ~QuadPtzView() override;

    void BuildMap() override;
    // The turns of the panes right of, below and diagonal to the first; new, owned by the caller.
    MapFunctor* GetPtzPane2();
    MapFunctor* GetPtzPane3();
    MapFunctor* GetPtzPane4();
    void BuildQuadMap();

private:
    MapFunctor* GetPtzPane(float pan_offset);
};

}  // namespace quorvel::vexmap
