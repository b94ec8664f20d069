#include "vexmap/view.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <vector>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include "vexmap/batch_chain.h"
#include "vexmap/batch_lanes.h"
#include "vexmap/code_location.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/map_functors.h"
#include "vexmap/performance_timer.h"
#include "vexmap/projection.h"
#include "vexmap/projection_functor.h"
#include "vexmap/rectangle_2d.h"
#include "vexmap/spherical_orientation_functor.h"

namespace quorvel::vexmap {

namespace {

constexpr float NEAR_LIMIT = BatchLanes::NEAR_LIMIT;
constexpr float ROUNDER = BatchLanes::ROUNDER;

// Both tests always run, so that a run of them needs no branch.
bool IsNear(float coordinate) {
    return (coordinate > -NEAR_LIMIT) & (coordinate < NEAR_LIMIT);
}

unsigned short NearMapWord(float coordinate) {
    int32_t const whole = int32_t((coordinate + ROUNDER) - ROUNDER);
    int32_t const clamped = whole > int32_t(SimpleImageMap::MAX_MAP_VALUE)
                                ? int32_t(SimpleImageMap::MAX_MAP_VALUE)
                                : whole;
    return static_cast<unsigned short>(uint32_t(clamped) & 0xFFFFu);
}

// Far outside any picture, or not a number: rare, so kept out of the builders' loops.
[[gnu::noinline]] unsigned short OutlyingMapWord(float coordinate) {
    float const rounded = FloatingPoint::nearbyint(coordinate);
    if (rounded > float(SimpleImageMap::MAX_MAP_VALUE)) {
        return SimpleImageMap::MAX_MAP_VALUE;
    }
    if (!(rounded >= -2147483648.0f)) {
        return 0;
    }
    return static_cast<unsigned short>(uint32_t(int32_t(rounded)) & 0xFFFFu);
}

// A point of a span in plain floats, kept in registers while a span is halved.
struct SpanPoint {
    float x;
    float y;
};

SpanPoint Half(SpanPoint const& a, SpanPoint const& b) {
    return SpanPoint{(a.x + b.x) * 0.5f, (a.y + b.y) * 0.5f};
}

// The words of a run of coordinates, in the table's order: x, y, x, y. When every coordinate is
// near, which is the rule, the loop is plain enough to run several words at a time.
template <int COUNT>
void StoreWords(unsigned short*& cursor, float const (&coordinates)[COUNT]) {
    int all_near = 1;
    for (float const coordinate : coordinates) {
        all_near &= int(coordinate > -NEAR_LIMIT) & int(coordinate < NEAR_LIMIT);
    }
    if (all_near != 0) {
        int32_t wholes[COUNT];
        for (int i = 0; i < COUNT; ++i) {
            wholes[i] = int32_t((coordinates[i] + ROUNDER) - ROUNDER);
        }
        for (int i = 0; i < COUNT; ++i) {
            int32_t const clamped = wholes[i] > int32_t(SimpleImageMap::MAX_MAP_VALUE)
                                        ? int32_t(SimpleImageMap::MAX_MAP_VALUE)
                                        : wholes[i];
            cursor[i] = static_cast<unsigned short>(uint32_t(clamped) & 0xFFFFu);
        }
    } else {
        for (int i = 0; i < COUNT; ++i) {
            cursor[i] = View::MapWord(coordinates[i]);
        }
    }
    cursor += COUNT;
}

#if defined(__SSE2__)
// The eight entries of a span of 8, four lanes at a time, two points a register. The same
// single-precision operations in the same order as the plain path, so the same words; false,
// with nothing stored, when a coordinate is far or not a number, and the plain path stores it.
bool StoreEighthSpanWide(unsigned short* cursor, SpanPoint const& first, SpanPoint const& last,
                         float cx, float cy) {
    __m128 const half = _mm_set1_ps(0.5f);
    __m128 const p_q = _mm_setr_ps(first.x, first.y, last.x, last.y);
    __m128 const q_p = _mm_shuffle_ps(p_q, p_q, _MM_SHUFFLE(1, 0, 3, 2));
    __m128 const m4_m4 = _mm_mul_ps(_mm_add_ps(p_q, q_p), half);
    __m128 const p_m4 = _mm_movelh_ps(p_q, m4_m4);
    __m128 const m4_q = _mm_shuffle_ps(m4_m4, p_q, _MM_SHUFFLE(3, 2, 1, 0));
    __m128 const m2_m6 = _mm_mul_ps(_mm_add_ps(p_m4, m4_q), half);
    __m128 const p_m2 = _mm_movelh_ps(p_q, m2_m6);
    __m128 const m2_m4 = _mm_movelh_ps(m2_m6, m4_m4);
    __m128 const m4_m6 = _mm_shuffle_ps(m4_m4, m2_m6, _MM_SHUFFLE(3, 2, 1, 0));
    __m128 const m6_q = _mm_shuffle_ps(m2_m6, p_q, _MM_SHUFFLE(3, 2, 3, 2));
    __m128 const m1_m3 = _mm_mul_ps(_mm_add_ps(p_m2, m2_m4), half);
    __m128 const m5_m7 = _mm_mul_ps(_mm_add_ps(m4_m6, m6_q), half);
    __m128 const centre = _mm_setr_ps(cx, cy, cx, cy);
    __m128 const points[4] = {
        _mm_add_ps(_mm_movelh_ps(m1_m3, m2_m6), centre),
        _mm_add_ps(_mm_shuffle_ps(m1_m3, m4_m4, _MM_SHUFFLE(1, 0, 3, 2)), centre),
        _mm_add_ps(_mm_shuffle_ps(m5_m7, m2_m6, _MM_SHUFFLE(3, 2, 1, 0)), centre),
        _mm_add_ps(_mm_shuffle_ps(m5_m7, p_q, _MM_SHUFFLE(3, 2, 3, 2)), centre)};
    __m128 const low = _mm_set1_ps(-NEAR_LIMIT);
    __m128 const high = _mm_set1_ps(NEAR_LIMIT);
    __m128 near = _mm_castsi128_ps(_mm_set1_epi32(-1));
    for (__m128 const& point : points) {
        near = _mm_and_ps(near, _mm_and_ps(_mm_cmpgt_ps(point, low), _mm_cmplt_ps(point, high)));
    }
    if (_mm_movemask_ps(near) != 0xF) {
        return false;
    }
    __m128 const rounder = _mm_set1_ps(ROUNDER);
    __m128i const largest = _mm_set1_epi32(SimpleImageMap::MAX_MAP_VALUE);
    __m128i words[4];
    for (int i = 0; i < 4; ++i) {
        __m128i const whole = _mm_cvttps_epi32(_mm_sub_ps(_mm_add_ps(points[i], rounder), rounder));
        __m128i const above = _mm_cmpgt_epi32(whole, largest);
        __m128i const clamped =
            _mm_or_si128(_mm_andnot_si128(above, whole), _mm_and_si128(above, largest));
        // The low 16 bits, sign-extended, so that the saturating pack below keeps them as they
        // are.
        words[i] = _mm_srai_epi32(_mm_slli_epi32(clamped, 16), 16);
    }
    _mm_storeu_si128(reinterpret_cast<__m128i*>(cursor), _mm_packs_epi32(words[0], words[1]));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(cursor + 8), _mm_packs_epi32(words[2], words[3]));
    return true;
}
#endif

void StoreHalvedSpan(unsigned short*& cursor, SpanPoint const& first, SpanPoint const& last,
                     float cx, float cy, int step) {
    if (step == 1) {
        float const words[2] = {last.x + cx, last.y + cy};
        StoreWords(cursor, words);
    } else if (step == 2) {
        SpanPoint const m = Half(first, last);
        float const words[4] = {m.x + cx, m.y + cy, last.x + cx, last.y + cy};
        StoreWords(cursor, words);
    } else if (step == 4) {
        SpanPoint const m2 = Half(first, last);
        SpanPoint const m1 = Half(first, m2);
        SpanPoint const m3 = Half(m2, last);
        float const words[8] = {m1.x + cx, m1.y + cy, m2.x + cx,   m2.y + cy,
                                m3.x + cx, m3.y + cy, last.x + cx, last.y + cy};
        StoreWords(cursor, words);
    } else {
#if defined(__SSE2__)
        if (StoreEighthSpanWide(cursor, first, last, cx, cy)) {
            cursor += 16;
            return;
        }
#endif
        SpanPoint const m4 = Half(first, last);
        SpanPoint const m2 = Half(first, m4);
        SpanPoint const m6 = Half(m4, last);
        SpanPoint const m1 = Half(first, m2);
        SpanPoint const m3 = Half(m2, m4);
        SpanPoint const m5 = Half(m4, m6);
        SpanPoint const m7 = Half(m6, last);
        float const words[16] = {m1.x + cx, m1.y + cy, m2.x + cx,   m2.y + cy,
                                 m3.x + cx, m3.y + cy, m4.x + cx,   m4.y + cy,
                                 m5.x + cx, m5.y + cy, m6.x + cx,   m6.y + cy,
                                 m7.x + cx, m7.y + cy, last.x + cx, last.y + cy};
        StoreWords(cursor, words);
    }
}

}  // namespace

View::View() = default;

View::View(View const& other) = default;

View::View(boost::shared_ptr<ViewTraits const> const& traits_value) : AbstractView(traits_value) {}

View::View(boost::shared_ptr<ViewTraits const> const& traits_value,
           boost::shared_ptr<Camera> const& camera_value)
    : AbstractView(traits_value, camera_value) {}

View::View(boost::shared_ptr<ViewTraits const> const& traits_value,
           boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value)
    : AbstractView(traits_value, camera_value, projection_value) {}

View::View(boost::shared_ptr<ViewTraits const> const& traits_value,
           boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(traits_value, camera_value, projection_value, aspect_ratio_value) {}

View::View(boost::shared_ptr<ViewTraits const> const& traits_value,
           boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           Resolution const& resolution)
    : AbstractView(traits_value, camera_value, projection_value, resolution) {}

View::View(boost::shared_ptr<ViewTraits const> const& traits_value,
           boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(traits_value, camera_value, projection_value, resolution, aspect_ratio_value) {}

View::View(boost::shared_ptr<Camera> const& camera_value) : AbstractView(camera_value) {}

View::View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value)
    : AbstractView(camera_value, projection_value) {}

View::View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(camera_value, projection_value, aspect_ratio_value) {}

View::View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           Resolution const& resolution)
    : AbstractView(camera_value, projection_value, resolution) {}

View::View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
           Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(camera_value, projection_value, resolution, aspect_ratio_value) {}

View& View::operator=(View const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "View");
        return *this;
    }
    AbstractView::operator=(other);
    image_map = other.image_map;
    return *this;
}

View::~View() = default;

void View::OnAspectRatioChange(_DEWARP_ASPECT_RATIO old_ratio, _DEWARP_ASPECT_RATIO new_ratio) {
    AbstractView::OnAspectRatioChange(old_ratio, new_ratio);
    DropMap();
}

void View::OnSizeChange(Resolution const& old_size, Resolution const& new_size) {
    AbstractView::OnSizeChange(old_size, new_size);
    DropMap();
}

void View::OnOutputChange(Resolution const& old_size, _DEWARP_ASPECT_RATIO old_ratio,
                          Resolution const& new_size, _DEWARP_ASPECT_RATIO new_ratio) {
    AbstractView::OnOutputChange(old_size, old_ratio, new_size, new_ratio);
    DropMap();
}

void View::OnZoomChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) {
    AbstractView::OnZoomChange(old_ptz, new_ptz);
    DropMap();
}

void View::OnOrientationChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) {
    AbstractView::OnOrientationChange(old_ptz, new_ptz);
    DropMap();
}

void View::OnPtzChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) {
    AbstractView::OnPtzChange(old_ptz, new_ptz);
    DropMap();
}

// The dropped table is kept for the next build of the same size, which fills it in place rather
// than allocate another beside it: a move then costs no allocation, and the frame that follows
// finds more of its source picture still in the cache.
void View::DropMap() {
    if (image_map) {
        spare_map = image_map;
        image_map.reset();
    }
}

// The map is used through the view's own pointer, not a copy: the channel's write lock is what
// keeps a change from dropping it under a running remap.
void View::DewarpImage(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped) {
    PerformanceTimer timer("image dewarp");
    timer.Start();
    CheckMap(Resolution(uint32_t(dewarped.info.width), uint32_t(dewarped.info.height)));
    if (!image_map) {
        Error::SetLastError(EINVAL);
        throw Error(CodeLocation("src/view", "View", "DewarpImage", __LINE__), EINVAL,
                    "Invalid image map");
    }
    image_map->Remap(warped, dewarped);
    timer.Finish();
}

void View::CheckMap(Resolution const& size) {
    SetDewarpedSize(size);
    if (!image_map) {
        BuildMap();
    }
}

void View::DewarpRows(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped, uint64_t first_row,
                      uint64_t row_count) const {
    Resolution const size(uint32_t(dewarped.info.width), uint32_t(dewarped.info.height));
    if (!image_map || image_map->GetMapSize() != size) {
        Log::err(__LINE__, __FILE__, "DewarpRows", "The map was not prepared for this size\n");
        Error::SetLastError(EINVAL);
        throw Error(CodeLocation("src/view", "View", "DewarpRows", __LINE__), EINVAL,
                    "Image map not prepared");
    }
    if (!image_map->RemapRows(warped, dewarped, first_row, row_count)) {
        Log::err(__LINE__, __FILE__, "DewarpRows", "Invalid band of %lu rows from row %lu\n",
                 static_cast<unsigned long>(row_count), static_cast<unsigned long>(first_row));
        Error::SetLastError(EINVAL);
        throw Error(CodeLocation("src/view", "View", "DewarpRows", __LINE__), EINVAL,
                    "Invalid row band");
    }
}

Transform2dFunctor::_TRANSFORM_2D View::GetScaleTransform(Resolution const& output) const {
    Transform2dFunctor::_TRANSFORM_2D transform = {};
    float const z = ptz.zoom;
    Resolution const& p = projection_size;
    float const fit = p.BestScale(output.BestFit(p.AspectRatio()));
    float const fill = p.BestScale(output);
    float uniform = 0.0f;
    switch (aspect_ratio) {
        case DEWARP_ASPECT_RATIO_FIT:
            uniform = fit;
            break;
        case DEWARP_ASPECT_RATIO_FILL:
            uniform = fill;
            break;
        case DEWARP_ASPECT_RATIO_FIT_WIDTH:
            uniform = FloatingPoint::is_less(output.AspectRatio(), p.AspectRatio()) ? fit : fill;
            break;
        default:  // stretch: each axis by itself
            transform.scale_x = 1.0f / (p.x / output.x / z);
            transform.scale_y = 1.0f / (p.y / output.y / z);
            return transform;
    }
    transform.scale_x = 1.0f / (uniform / z);
    transform.scale_y = transform.scale_x;
    return transform;
}

// A picture looking up or down shows half the sphere's height, so it is stretched twice and
// moved half the crop towards the horizon, scaled with the zoom.
MapFunctor* View::GetScaleFunctor(Vector2d const& crop) const {
    Transform2dFunctor::_TRANSFORM_2D transform = GetScaleTransform(dewarped_size);
    float const z = ptz.zoom;
    switch (GetCamera().GetMount()) {
        case DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR:
            transform.offset_y = crop.y * 0.5f * z;
            transform.scale_y = transform.scale_y * 2.0f;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_CEILING:
            transform.offset_y = crop.y * -0.5f * z;
            transform.scale_y = transform.scale_y * 2.0f;
            break;
        default:
            break;
    }
    return new Transform2dFunctor(transform);
}

MapFunctor* View::GetProjectionFunctor() {
    Camera const& lens = GetCamera();
    return new ProjectionFunctor(projection, lens.GetType(), lens.GetFocalLength(),
                                 Projection::IdentityScale);
}

MapFunctor* View::GetPtzFunctor() {
    Camera const& lens = GetCamera();
    PtzPosition home = lens.GetHomePosition();
    home.Concatenate(ptz);
    return new SphericalOrientationFunctor(home, lens.GetFocalLength());
}

void View::BuildMap() {
    BuildEighthMap();
}

void View::BuildWholeMap() {
    BuildStepMap(1);
}

void View::BuildHalfMap() {
    BuildStepMap(2);
}

void View::BuildQuarterMap() {
    BuildStepMap(4);
}

void View::BuildEighthMap() {
    BuildStepMap(8);
}

// Only whole spans are stored: the loop stops while the span's end is below the right edge, so
// the last step - 1 columns of a row whose width is a multiple of the step stay unmapped. That is
// accepted; the bound is not to be widened nor the tail extrapolated.
void View::BuildStepMap(int step) {
    Vector2d const crop = GetCropSize();
    BuildShiftedMap(crop, crop, step, [](int, int, int) { return Vector2d(); });
}

// The points of a row go through the chain together, every step-th column from the left edge,
// and are then stored with the columns between halved.
void View::BuildShiftedMap(Vector2d const& scale_crop, Vector2d const& area_size, int step,
                           RowShift shift) {
    PerformanceTimer timer("One stage map build");
    timer.Start();
    MapFunctors chain;
    chain.PushBack(GetScaleFunctor(scale_crop));
    chain.PushBack(GetProjectionFunctor());
    chain.PushBack(GetPtzFunctor());
    BatchChain batch(chain);
    MapWalk walk = StartMapWalk(area_size);
    int const column = static_cast<int>(float(walk.left) + walk.origin.x);
    // The first point and one a whole span: the span loop runs while its end is below the right.
    int const spans = walk.right > walk.left + step ? (walk.right - walk.left - 1) / step : 0;
    int const points = 1 + spans;
    std::vector<float> xs(static_cast<std::size_t>(points));
    std::vector<float> ys(static_cast<std::size_t>(points));
    for (int y = walk.bottom; y < walk.top && HasEntries(*walk.map); ++y) {
        Vector2d const row_shift = shift(y, walk.left, walk.bottom);
        float const y_in = float(y) + row_shift.y;
        for (int k = 0; k < points; ++k) {
            xs[std::size_t(k)] = float(walk.left + k * step) + row_shift.x;
            ys[std::size_t(k)] = y_in;
        }
        batch.Run(xs.data(), ys.data(), points);
        int const row = static_cast<int>(float(y) + walk.origin.y);
        StartRow(walk, row, column, column + 1 + spans * step);
        unsigned short* cursor = EntryAt(*walk.map, column, row);
        StoreRow(cursor, xs.data(), ys.data(), points, walk.centre, step);
    }
    FinishRows(walk);
    image_map = walk.map;
    timer.Finish();
}

// The area is cut to the output, as a crop cannot exceed it, and centred on the origin, so that
// bottom is negative and top positive; its edges are truncated toward zero.
View::MapWalk View::StartMapWalk(Vector2d const& area_size) const {
    MapWalk walk;
    walk.map = NewImageMap();
    walk.map->image_size = GetCamera().GetResolution();
    walk.centre = GetCamera().GetResolution().Centre();
    walk.origin = dewarped_size.Centre();
    Rectangle2d area(area_size);
    area.Intersection(Rectangle2d(dewarped_size));
    area.OffsetToCentre();
    walk.left = static_cast<int>(area.left);
    walk.right = static_cast<int>(area.right);
    walk.bottom = static_cast<int>(area.bottom);
    walk.top = static_cast<int>(area.top);
    walk.started.assign(std::size_t(std::max(walk.map->GetMapHeight(), 0)), 0);
    return walk;
}

void View::StartRow(MapWalk& walk, int row) {
    StartRow(walk, row, 0, 0);
}

// Only the entries outside [first, end) are filled: the builder writes those inside.
void View::StartRow(MapWalk& walk, int row, int first, int end) {
    int const width = walk.map->GetMapWidth();
    if (row < 0 || std::size_t(row) >= walk.started.size() || walk.started[std::size_t(row)] != 0 ||
        width <= 0) {
        return;
    }
    walk.started[std::size_t(row)] = 1;
    int const kept_first = std::max(0, std::min(first, width));
    int const kept_end = std::max(kept_first, std::min(end, width));
    unsigned short* const entries = EntryAt(*walk.map, 0, row);
    std::memset(entries, 0xFF, 2 * std::size_t(kept_first) * sizeof(unsigned short));
    std::memset(entries + 2 * std::size_t(kept_end), 0xFF,
                2 * std::size_t(width - kept_end) * sizeof(unsigned short));
}

void View::FinishRows(MapWalk& walk) {
    for (std::size_t row = 0; row < walk.started.size(); ++row) {
        StartRow(walk, int(row));
    }
}

// The table's word count is a signed 32-bit product: an output whose count does not fit would
// leave a table that wrapped to a smaller one, which the builders and the remap would run past.
boost::shared_ptr<SimpleImageMap> View::NewImageMap() const {
    float const width = dewarped_size.x;
    float const height = dewarped_size.y;
    constexpr float WORD_LIMIT = 2147483648.0f;
    if (!(width >= 0.0f && height >= 0.0f && width < WORD_LIMIT && height < WORD_LIMIT &&
          width * height * 2.0f < WORD_LIMIT)) {
        Log::err(__LINE__, __FILE__, "NewImageMap", "Image map of %f x %f is too large\n",
                 double(width), double(height));
        Error::SetLastError(ENOMEM);
        throw Error(CodeLocation("src/view", "View", "NewImageMap", __LINE__), ENOMEM,
                    "Invalid image map size");
    }
    boost::shared_ptr<SimpleImageMap> map;
    // Only a table that no one else holds any more may be written again.
    if (spare_map && spare_map.use_count() == 1 &&
        spare_map->GetMapWidth() == static_cast<int>(width) &&
        spare_map->GetMapHeight() == static_cast<int>(height)) {
        map.swap(spare_map);
        return map;
    }
    spare_map.reset();
    map.reset(new SimpleImageMap());
    map->ReserveMapSize(static_cast<int>(width), static_cast<int>(height));
    return map;
}

// An output without columns or rows has a table without entries: nothing may be written.
bool View::HasEntries(SimpleImageMap const& map) {
    return map.GetMapWidth() > 0 && map.GetMapHeight() > 0;
}

unsigned short* View::EntryAt(SimpleImageMap const& map, int column, int row) {
    uint32_t const index = uint32_t(map.GetMapWidth()) * uint32_t(row) + uint32_t(column);
    return map.GetMap() + 2 * std::size_t(index);
}

// Rounded; above the largest word it is that word; else the low 16 bits of the 32-bit integer,
// so a negative point wraps to a word beyond any picture and reads as outside. A NaN, like a
// value below the 32-bit range, gives the integer minimum and so the word 0: spelled out here
// because the conversion itself would be undefined.
unsigned short View::MapWord(float coordinate) {
    return IsNear(coordinate) ? NearMapWord(coordinate) : OutlyingMapWord(coordinate);
}

void View::StorePoint(unsigned short*& cursor, Vector2d const& point, Vector2d const& centre) {
    cursor[0] = MapWord(point.x + centre.x);
    cursor[1] = MapWord(point.y + centre.y);
    cursor += 2;
}

// The points between p and q by repeated halving, each midpoint from the two points that enclose
// it, in single precision: for a step of 8, m4 from p and q, m2 and m6 from those, then m1, m3,
// m5 and m7. The centre is added after the halving, never before. This runs for seven of every
// eight entries of a map.
void View::StoreSpan(unsigned short*& cursor, Vector2d const& p, Vector2d const& q,
                     Vector2d const& centre, int step) {
    StoreHalvedSpan(cursor, SpanPoint{p.x, p.y}, SpanPoint{q.x, q.y}, centre.x, centre.y, step);
}

void View::StoreRow(unsigned short*& cursor, float const* x, float const* y, int count,
                    Vector2d const& centre, int step) {
    if (count <= 0) {
        return;
    }
    float const first[2] = {x[0] + centre.x, y[0] + centre.y};
    StoreWords(cursor, first);
    StoreSpans(cursor, x, y, count, centre, step);
}

// Spans of 8 go to the widest lanes first; a span they stop at, with a far coordinate, is stored
// here, and they go on from the next.
void View::StoreSpans(unsigned short*& cursor, float const* x, float const* y, int count,
                      Vector2d const& centre, int step) {
    int k = 1;
    if (step == 8) {
        BatchLanes const& lanes = BatchLanes::Widest();
        while (k < count) {
            int const done = lanes.store_eighth_spans(cursor, x + k - 1, y + k - 1, count - k + 1,
                                                      centre.x, centre.y);
            cursor += 16 * done;
            k += done;
            if (k < count) {
                StoreHalvedSpan(cursor, SpanPoint{x[k - 1], y[k - 1]}, SpanPoint{x[k], y[k]},
                                centre.x, centre.y, step);
                ++k;
            }
        }
        return;
    }
    for (; k < count; ++k) {
        StoreHalvedSpan(cursor, SpanPoint{x[k - 1], y[k - 1]}, SpanPoint{x[k], y[k]}, centre.x,
                        centre.y, step);
    }
}

}  // namespace quorvel::vexmap
