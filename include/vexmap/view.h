#pragma once

#include <cstdint>
#include <vector>

#include <boost/shared_ptr.hpp>

#include "vexmap/abstract_view.h"
#include "vexmap/map_functor.h"
#include "vexmap/simple_image_map.h"
#include "vexmap/transform_2d_functor.h"

namespace quorvel::vexmap {

/// A view that turns its state into a coordinate map and applies it to frames. The map is built
/// by the first frame after a change and reused until the next change drops it; once stored it
/// is never changed. DewarpImage runs under the channel's read lock, every change under its
/// write lock.
class View : public AbstractView {
public:
    View();
    View(View const& other);  // shares the map
    explicit View(boost::shared_ptr<ViewTraits const> const& traits_value);
    View(boost::shared_ptr<ViewTraits const> const& traits_value,
         boost::shared_ptr<Camera> const& camera_value);
    View(boost::shared_ptr<ViewTraits const> const& traits_value,
         boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value);
    View(boost::shared_ptr<ViewTraits const> const& traits_value,
         boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         _DEWARP_ASPECT_RATIO aspect_ratio_value);
    View(boost::shared_ptr<ViewTraits const> const& traits_value,
         boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         Resolution const& resolution);
    View(boost::shared_ptr<ViewTraits const> const& traits_value,
         boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value);
    explicit View(boost::shared_ptr<Camera> const& camera_value);
    View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value);
    View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         _DEWARP_ASPECT_RATIO aspect_ratio_value);
    View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         Resolution const& resolution);
    View(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
         Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value);
    View& operator=(View const& other);
    ~View() override;

    // Each stores through the base and drops the map; the next frame builds a new one.
    void OnAspectRatioChange(_DEWARP_ASPECT_RATIO old_ratio,
                             _DEWARP_ASPECT_RATIO new_ratio) override;
    void OnSizeChange(Resolution const& old_size, Resolution const& new_size) override;
    void OnOutputChange(Resolution const& old_size, _DEWARP_ASPECT_RATIO old_ratio,
                        Resolution const& new_size, _DEWARP_ASPECT_RATIO new_ratio) override;
    void OnZoomChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override;
    void OnOrientationChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override;
    void OnPtzChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override;
    /// The output record's size decides the map's; builds the map if there is none, then remaps.
    void DewarpImage(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped) override;

    // Links of the chain, each new and owned by the caller: output pixel from the crop's centre
    // to projection pixel, projection to camera image, then the view's turn in the camera.
    virtual MapFunctor* GetScaleFunctor(Vector2d const& crop) const;
    virtual MapFunctor* GetProjectionFunctor();
    virtual MapFunctor* GetPtzFunctor();
    virtual void BuildMap();

    // One chain call per row and per step of 1, 2, 4 or 8 columns; the columns between are
    // halved. BuildMap uses the eighth; the other three are kept for comparison.
    void BuildWholeMap();
    void BuildHalfMap();
    void BuildQuarterMap();
    void BuildEighthMap();
    void CheckMap(Resolution const& size);
    /// Rows first_row to first_row + row_count - 1 of a frame through the map that stands,
    /// building and changing nothing, so that threads may share a frame out in bands once
    /// CheckMap has built the map for its size. Throws EINVAL when there is no map of the
    /// destination's size, or for a band that SimpleImageMap::RemapRows refuses.
    void DewarpRows(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped, uint64_t first_row,
                    uint64_t row_count) const;

    boost::shared_ptr<SimpleImageMap> const& GetImageMap() const { return image_map; }

    /// A point of the camera's image into an entry: rounded, 65535 above the largest word, else
    /// the low 16 bits of its 32-bit value, so that a negative point wraps to a word beyond any
    /// picture. NaN and values below the 32-bit range store 0.
    static unsigned short MapWord(float coordinate);

protected:
    /// The transform of a view's output pixels into its projection's, by aspect ratio, on an
    /// output of the given size.
    Transform2dFunctor::_TRANSFORM_2D GetScaleTransform(Resolution const& output) const;
    /// Where the chain's input of a row lies against the output's: the row's y, and the left and
    /// bottom edges of the centred area.
    typedef Vector2d (*RowShift)(int y, int left, int bottom);
    /// The family of builders: step columns through the chain, the rest halved.
    void BuildStepMap(int step);
    /// The walk that every builder but the quad one shares: a new map of the output's size, the
    /// chain of the given scale, the projection and the turn, and the rows of the crop inside the
    /// output, each row's input moved by the shift. Replaces image_map.
    void BuildShiftedMap(Vector2d const& scale_crop, Vector2d const& area_size, int step,
                         RowShift shift);
    /// Stores a point plus the image centre into the entry at the cursor, and steps it on.
    static void StorePoint(unsigned short*& cursor, Vector2d const& point, Vector2d const& centre);
    /// Stores the step - 1 points halved between p and q, then q, each plus the image centre.
    /// The step is 1, 2, 4 or 8.
    static void StoreSpan(unsigned short*& cursor, Vector2d const& p, Vector2d const& q,
                          Vector2d const& centre, int step);
    /// Stores the first of count points as StorePoint does, then StoreSpans of all of them.
    static void StoreRow(unsigned short*& cursor, float const* x, float const* y, int count,
                         Vector2d const& centre, int step);
    /// Stores the span from each point to the next as StoreSpan does: count - 1 spans.
    static void StoreSpans(unsigned short*& cursor, float const* x, float const* y, int count,
                           Vector2d const& centre, int step);
    /// Where a builder walks: a blank map of the output's size for the camera's image, the
    /// image's centre (added to every point), the output's centre, and the edges of the area it
    /// covers, centred on the origin and truncated toward zero.
    struct MapWalk {
        boost::shared_ptr<SimpleImageMap> map;
        Vector2d centre;
        Vector2d origin;
        int left;
        int right;
        int bottom;
        int top;
        std::vector<unsigned char> started;  // per row of the map: filled by StartRow
    };
    MapWalk StartMapWalk(Vector2d const& area_size) const;
    /// The map's table is not filled when it is made: a builder fills each row with unmapped
    /// entries just before it writes the row, while the row is in the cache, and FinishRows fills
    /// the rows that it never started.
    static void StartRow(MapWalk& walk, int row);
    /// As StartRow, for a builder that then writes the entries from `first` up to `end` itself.
    static void StartRow(MapWalk& walk, int row, int first, int end);
    static void FinishRows(MapWalk& walk);
    /// A map of the output's size whose entries are yet to be filled; an output too large for a
    /// table throws ENOMEM.
    boost::shared_ptr<SimpleImageMap> NewImageMap() const;
    static bool HasEntries(SimpleImageMap const& map);
    /// The entry of the table at a column and row, in 32-bit arithmetic.
    static unsigned short* EntryAt(SimpleImageMap const& map, int column, int row);

    boost::shared_ptr<SimpleImageMap> image_map;  // null when none is valid

private:
    /// Drops image_map for a change, keeping its table for the next build.
    void DropMap();

    // The last dropped map, or null; taken by the next build (NewImageMap), hence mutable.
    mutable boost::shared_ptr<SimpleImageMap> spare_map;
};

}  // namespace quorvel::vexmap
