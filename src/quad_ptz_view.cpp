#include "vexmap/quad_ptz_view.h"

#include <vector>

#include <boost/shared_ptr.hpp>

#include "vexmap/batch_chain.h"
#include "vexmap/log.h"
#include "vexmap/map_functors.h"
#include "vexmap/performance_timer.h"
#include "vexmap/spherical_orientation_functor.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr int SPAN = 8;

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
// columns of the right panes, which stop at the last x below 0. So the first points are stored
// in pane order, then the right panes' spans, then the left panes', which win where they meet.
void QuadPtzView::BuildQuadMap() {
    PerformanceTimer timer("One stage map build");
    timer.Start();
    MapFunctors chain;
    boost::shared_ptr<MapFunctor> const turns[4] = {boost::shared_ptr<MapFunctor>(GetPtzFunctor()),
                                                    boost::shared_ptr<MapFunctor>(GetPtzPane2()),
                                                    boost::shared_ptr<MapFunctor>(GetPtzPane3()),
                                                    boost::shared_ptr<MapFunctor>(GetPtzPane4())};
    Vector2d const crop = GetCropSize();
    chain.PushBack(GetScaleFunctor(crop));
    chain.PushBack(GetProjectionFunctor());
    BatchChain shared(chain);
    BatchChain panes[4] = {BatchChain(*turns[0]), BatchChain(*turns[1]), BatchChain(*turns[2]),
                           BatchChain(*turns[3])};
    MapWalk walk = StartMapWalk(crop);
    boost::shared_ptr<SimpleImageMap> const& map = walk.map;
    int const left = walk.left;
    int const left_column = static_cast<int>(float(left) + walk.origin.x);
    int const right_column = static_cast<int>(walk.origin.x);
    // The left panes' last spans reach 8 columns past the middle; on an output too narrow to
    // hold them they would run past the row, so there they stop at the row's end.
    int const last_left_span = map->GetMapWidth() - 1 - left_column + left;
    // Spans end at x = left + 8k: up to 8 for all, up to the row's end for the left panes, and
    // below 0 for the right ones.
    int const all_spans = (SPAN - left) / SPAN;
    int const left_limit = last_left_span < SPAN ? last_left_span : SPAN;
    int const left_spans = left_limit < left + SPAN ? 0 : (left_limit - left) / SPAN;
    int const right_spans = left <= -1 ? (-1 - left) / SPAN : 0;
    int const spans[4] = {left_spans, right_spans, left_spans, right_spans};
    int const samples = 1 + all_spans;
    std::vector<float> sample_x(static_cast<std::size_t>(samples));
    std::vector<float> sample_y(static_cast<std::size_t>(samples));
    std::vector<float> pane_x(4 * std::size_t(samples));
    std::vector<float> pane_y(4 * std::size_t(samples));
    for (int y = walk.bottom; y < 0 && HasEntries(*map); ++y) {
        int const x_in = walk.right + 2 * left;
        int const y_in = walk.top + 2 * y;
        for (int k = 0; k < samples; ++k) {
            sample_x[std::size_t(k)] = float(x_in + 2 * SPAN * k);
            sample_y[std::size_t(k)] = float(y_in);
        }
        shared.Run(sample_x.data(), sample_y.data(), samples);
        int const row = static_cast<int>(walk.origin.y) + y;
        StartRow(walk, row);
        StartRow(walk, row + walk.top);
        unsigned short* cursors[4] = {EntryAt(*map, left_column, row),
                                      EntryAt(*map, right_column, row),
                                      EntryAt(*map, left_column, row + walk.top),
                                      EntryAt(*map, right_column, row + walk.top)};
        float* xs[4];
        float* ys[4];
        for (int pane = 0; pane < 4; ++pane) {
            xs[pane] = pane_x.data() + std::size_t(pane) * std::size_t(samples);
            ys[pane] = pane_y.data() + std::size_t(pane) * std::size_t(samples);
            int const points = 1 + spans[pane];
            for (int k = 0; k < points; ++k) {
                xs[pane][k] = sample_x[std::size_t(k)];
                ys[pane][k] = sample_y[std::size_t(k)];
            }
            panes[pane].Run(xs[pane], ys[pane], points);
            StoreRow(cursors[pane], xs[pane], ys[pane], 1, walk.centre, SPAN);
        }
        for (int const pane : {1, 3, 0, 2}) {
            StoreSpans(cursors[pane], xs[pane], ys[pane], 1 + spans[pane], walk.centre, SPAN);
        }
    }
    FinishRows(walk);
    image_map = map;
    timer.Finish();
}

}  // namespace quorvel::vexmap
