#pragma once

#include <cstdint>
#include <vector>

#include <boost/shared_ptr.hpp>

#include "vexmap/dual_panoramic_view.h"
#include "vexmap/map_functors.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/rectangle_2d.h"
#include "vexmap/view.h"

// The map builders' arithmetic as it was before they ran rows of points in lanes, kept as the
// plain reference: every chain point through MapFunctors::Call, one at a time, through the view's
// own links, and the points between halved and stored one coordinate at a time by View::MapWord.
namespace quorvel::vexmap::reference {

struct Map {
    int width = 0;
    int height = 0;
    std::vector<uint16_t> words;  // x then y per entry, rows first; 65535 where nothing is written
};

struct Point {
    float x;
    float y;
};

inline Point Half(Point a, Point b) {
    return Point{(a.x + b.x) * 0.5f, (a.y + b.y) * 0.5f};
}

class Walk {
public:
    Walk(AbstractView& view, Vector2d const& area_size) {
        Resolution const& output = view.GetDewarpedSize();
        map.width = static_cast<int>(output.x);
        map.height = static_cast<int>(output.y);
        map.words.assign(2 * std::size_t(map.width) * std::size_t(map.height), 0xFFFF);
        centre = view.GetCamera().GetResolution().Centre();
        origin = output.Centre();
        Rectangle2d area(area_size);
        area.Intersection(Rectangle2d(output));
        area.OffsetToCentre();
        left = static_cast<int>(area.left);
        right = static_cast<int>(area.right);
        bottom = static_cast<int>(area.bottom);
        top = static_cast<int>(area.top);
    }
    bool HasEntries() const { return map.width > 0 && map.height > 0; }
    std::size_t Entry(int column, int row) const {
        return std::size_t(uint32_t(map.width) * uint32_t(row) + uint32_t(column));
    }
    void Store(std::size_t& entry, Point p) {
        map.words[2 * entry] = View::MapWord(p.x + centre.x);
        map.words[2 * entry + 1] = View::MapWord(p.y + centre.y);
        ++entry;
    }
    // m4, then m2 and m6, then m1, m3, m5, m7: each from the two points that enclose it.
    void StoreEighthSpan(std::size_t& entry, Point p, Point q) {
        Point const m4 = Half(p, q);
        Point const m2 = Half(p, m4);
        Point const m6 = Half(m4, q);
        for (Point const point :
             {Half(p, m2), m2, Half(m2, m4), m4, Half(m4, m6), m6, Half(m6, q), q}) {
            Store(entry, point);
        }
    }

    Map map;
    Vector2d centre;
    Vector2d origin;
    int left;
    int right;
    int bottom;
    int top;
};

inline Point Through(MapFunctor& link, Point p) {
    Vector2d const result = link.Call(Vector2d(p.x, p.y));
    return Point{result.x, result.y};
}

typedef Point (*RowShift)(int y, int left, int bottom);

inline Point NoShift(int, int, int) {
    return Point{0.0f, 0.0f};
}

inline Point StackedShift(int y, int left, int bottom) {
    return y < 0 ? Point{float(left), float(-bottom / 2)} : Point{float(-left), float(bottom / 2)};
}

inline Map EighthMap(View& view, Vector2d const& scale_crop, Vector2d const& area, RowShift shift) {
    MapFunctors chain;
    chain.PushBack(view.GetScaleFunctor(scale_crop));
    chain.PushBack(view.GetProjectionFunctor());
    chain.PushBack(view.GetPtzFunctor());
    Walk walk(view, area);
    int const column = static_cast<int>(float(walk.left) + walk.origin.x);
    for (int y = walk.bottom; y < walk.top && walk.HasEntries(); ++y) {
        Point const s = shift(y, walk.left, walk.bottom);
        float const y_in = float(y) + s.y;
        std::size_t entry = walk.Entry(column, static_cast<int>(float(y) + walk.origin.y));
        Point p = Through(chain, Point{float(walk.left) + s.x, y_in});
        walk.Store(entry, p);
        for (int x = walk.left + 8; x < walk.right; x += 8) {
            Point const q = Through(chain, Point{float(x) + s.x, y_in});
            walk.StoreEighthSpan(entry, p, q);
            p = q;
        }
    }
    return walk.map;
}

inline Map SingleMap(View& view) {
    Vector2d const crop = view.GetCropSize();
    return EighthMap(view, crop, crop, NoShift);
}

inline Map DualMap(DualPanoramicView& view) {
    Vector2d const dual_crop = view.GetDualCropSize();
    Resolution const& output = view.GetDewarpedSize();
    Vector2d covered = output;
    if (dual_crop != output) {
        covered = output.BestFit(view.GetProjectionSize().AspectRatio());
    }
    return EighthMap(view, dual_crop, covered, StackedShift);
}

// The four panes walked together, in the order of the loop as it was: each span of the left panes
// after the right panes' of the same x, so that the left ones win where they meet.
inline Map QuadMap(QuadPtzView& view) {
    _DEWARP_INTERNAL_CAMERA_MOUNT const mount = view.GetCamera().GetMount();
    if (mount != DEWARP_INTERNAL_CAMERA_MOUNT_CEILING &&
        mount != DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR) {
        return SingleMap(view);
    }
    boost::shared_ptr<MapFunctor> const turns[4] = {
        boost::shared_ptr<MapFunctor>(view.GetPtzFunctor()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane2()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane3()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane4())};
    Vector2d const crop = view.GetCropSize();
    MapFunctors chain;
    chain.PushBack(view.GetScaleFunctor(crop));
    chain.PushBack(view.GetProjectionFunctor());
    Walk walk(view, crop);
    int const left_column = static_cast<int>(float(walk.left) + walk.origin.x);
    int const right_column = static_cast<int>(walk.origin.x);
    int const last_left_span = walk.map.width - 1 - left_column + walk.left;
    for (int y = walk.bottom; y < 0 && walk.HasEntries(); ++y) {
        int x_in = walk.right + 2 * walk.left;
        int const y_in = walk.top + 2 * y;
        int const row = static_cast<int>(walk.origin.y) + y;
        std::size_t entries[4] = {walk.Entry(left_column, row), walk.Entry(right_column, row),
                                  walk.Entry(left_column, row + walk.top),
                                  walk.Entry(right_column, row + walk.top)};
        Point last[4];
        Point const first = Through(chain, Point{float(x_in), float(y_in)});
        for (int pane = 0; pane < 4; ++pane) {
            last[pane] = Through(*turns[pane], first);
            walk.Store(entries[pane], last[pane]);
        }
        for (int x = walk.left + 8; x <= 8; x += 8) {
            x_in += 16;
            Point const sample = Through(chain, Point{float(x_in), float(y_in)});
            for (int const pane : {0, 2, 1, 3}) {
                bool const left_pane = pane == 0 || pane == 2;
                if (left_pane ? x <= last_left_span : x < 0) {
                    Point const next = Through(*turns[pane], sample);
                    walk.StoreEighthSpan(entries[pane], last[pane], next);
                    last[pane] = next;
                }
            }
        }
    }
    return walk.map;
}

/// The map that the view's BuildMap made before, by the view's kind.
inline Map MapOf(View& view) {
    if (auto* const dual = dynamic_cast<DualPanoramicView*>(&view)) {
        return DualMap(*dual);
    }
    if (auto* const quad = dynamic_cast<QuadPtzView*>(&view)) {
        return QuadMap(*quad);
    }
    return SingleMap(view);
}

}  // namespace quorvel::vexmap::reference
