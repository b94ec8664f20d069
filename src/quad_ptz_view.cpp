#include "vexmap/quad_ptz_view.h"

#include <boost/shared_ptr.hpp>

#include "vexmap/log.h"
#include "vexmap/map_functors.h"
#include "vexmap/performance_timer.h"
#include "vexmap/spherical_orientation_functor.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr int SPAN = 8;

// One cursor a pane, with the last point stored through the pane's own turn.
struct Pane {
    boost::shared_ptr<MapFunctor> turn;
    unsigned short* cursor;
    Vector2d last;
};

}  // namespace

QuadPtzView::QuadPtzView() = default;

QuadPtzView::QuadPtzView(QuadPtzView const& other) = default;

QuadPtzView::QuadPtzView(boost::shared_ptr<Camera> const& camera_value,
                         _DEWARP_PROJECTION projection_value)
    : SinglePtzView(camera_value, projection_value) {}

QuadPtzView& QuadPtzView::operator=(QuadPtzView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "QuadPtzView");
        return *this;
    }
    SinglePtzView::operator=(other);
    return *this;
}

QuadPtzView::~QuadPtzView() = default;

// Four looks round the compass need a camera looking up or down; on a wall it is one picture.
void QuadPtzView::BuildMap() {
    _DEWARP_INTERNAL_CAMERA_MOUNT const mount = GetCamera().GetMount();
    if (mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ||
        mount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR) {
        BuildQuadMap();
    } else {
        View::BuildMap();
    }
}

MapFunctor* QuadPtzView::GetPtzPane2() {
    return GetPtzPane(Trigonometry::HALF_PI);
}

MapFunctor* QuadPtzView::GetPtzPane3() {
    return GetPtzPane(Trigonometry::PI);
}

MapFunctor* QuadPtzView::GetPtzPane4() {
    return GetPtzPane(Trigonometry::HALF_PI * 3.0f);
}

MapFunctor* QuadPtzView::GetPtzPane(float pan_offset) {
    Camera const& lens = GetCamera();
    EulerAngles home = lens.GetHomePosition().orientation;
    EulerAngles turn = ptz.orientation;
    turn.pan = turn.pan + pan_offset;
    turn.Normalise();
    home.Concatenate(turn);
    return new SphericalOrientationFunctor(home, lens.GetFocalLength());
}

// The scale and projection run once for the four panes; each pane's turn follows. A pane walks
// a quarter of the output and samples the whole crop at half size, two crop pixels an output
// pixel. The span ends differ on purpose: the left panes run on to x = 8 and overwrite the first
// columns of the right panes, which stop at the last x below 0.
void QuadPtzView::BuildQuadMap() {
    PerformanceTimer timer("One stage map build");
    timer.Start();
    MapFunctors chain;
    Pane panes[4] = {{boost::shared_ptr<MapFunctor>(GetPtzFunctor()), nullptr, Vector2d()},
                     {boost::shared_ptr<MapFunctor>(GetPtzPane2()), nullptr, Vector2d()},
                     {boost::shared_ptr<MapFunctor>(GetPtzPane3()), nullptr, Vector2d()},
                     {boost::shared_ptr<MapFunctor>(GetPtzPane4()), nullptr, Vector2d()}};
    Vector2d const crop = GetCropSize();
    chain.PushBack(GetScaleFunctor(crop));
    chain.PushBack(GetProjectionFunctor());
    MapWalk const walk = StartMapWalk(crop);
    boost::shared_ptr<SimpleImageMap> const& map = walk.map;
    Vector2d const& centre = walk.centre;
    int const left = walk.left;
    int const right = walk.right;
    int const top = walk.top;
    int const left_column = static_cast<int>(float(left) + walk.origin.x);
    int const right_column = static_cast<int>(walk.origin.x);
    // The left panes' last spans reach 8 columns past the middle; on an output too narrow to
    // hold them they would run past the row, so there they stop at the row's end.
    int const last_left_span = map->GetMapWidth() - 1 - left_column + left;
    for (int y = walk.bottom; y < 0 && HasEntries(*map); ++y) {
        int x_in = right + 2 * left;
        int const y_in = top + 2 * y;
        int const row = static_cast<int>(walk.origin.y) + y;
        panes[0].cursor = EntryAt(*map, left_column, row);
        panes[1].cursor = EntryAt(*map, right_column, row);
        panes[2].cursor = EntryAt(*map, left_column, row + top);
        panes[3].cursor = EntryAt(*map, right_column, row + top);
        Vector2d const first = chain.Call(Vector2d(float(x_in), float(y_in)));
        for (Pane& pane : panes) {
            pane.last = pane.turn->Call(first);
            StorePoint(pane.cursor, pane.last, centre);
        }
        auto advance = [&](Pane& pane, Vector2d const& sample) {
            Vector2d const next = pane.turn->Call(sample);
            StoreSpan(pane.cursor, pane.last, next, centre, SPAN);
            pane.last = next;
        };
        for (int x = left + SPAN; x <= SPAN; x += SPAN) {
            x_in += 2 * SPAN;
            Vector2d const sample = chain.Call(Vector2d(float(x_in), float(y_in)));
            if (x <= last_left_span) {
                advance(panes[0], sample);
                advance(panes[2], sample);
            }
            if (x < 0) {
                advance(panes[1], sample);
                advance(panes[3], sample);
            }
        }
    }
    image_map = map;
    timer.Finish();
}

}  // namespace quorvel::vexmap
