#pragma once

#include <cstddef>
#include <cstdint>

#include <boost/shared_ptr.hpp>

#include "vexmap/dewarp_types.h"
#include "vexmap/resolution.h"

namespace quorvel::vexmap {

struct BatchLanes;

/// The look-up table that turns a warped frame into a dewarped one: per output pixel two 16-bit
/// words, source x then source y, rows one after the other; (65535, 65535) marks an entry that
/// no builder wrote. Copies share the table; SetMapSize gives this object a fresh one. Remap
/// changes nothing, so any number of threads may run it on one map at once.
class SimpleImageMap {
public:
    static constexpr unsigned short MAX_MAP_VALUE = 65535;

    SimpleImageMap();  // no table
    SimpleImageMap(SimpleImageMap const& other);
    SimpleImageMap(int width, int height);
    explicit SimpleImageMap(Resolution const& size);  // sizes truncated
    SimpleImageMap& operator=(SimpleImageMap const& other);
    virtual ~SimpleImageMap();

    bool Empty() const;
    /// A new table with every entry unmapped; other holders keep the old one. A failed
    /// allocation throws and leaves this object as it was.
    void SetMapSize(int width, int height);
    void SetMapSize(Resolution const& size);
    /// As SetMapSize, but the entries are left as the allocator gave them: for a builder that
    /// writes or fills every entry itself, and saves the fill of a whole table.
    void ReserveMapSize(int width, int height);
    Resolution GetMapSize() const;
    int GetMapWidth() const;
    int GetMapHeight() const;
    /// Every entry back to unmapped; nothing without a table.
    void FillMap();
    /// The table itself, for builders that write whole entries: 2 * width * height words.
    unsigned short* GetMap() const { return map.get(); }

    /// The destination's size drives the walk; its format is not read. Source and destination
    /// are taken to be of the same format.
    virtual void Remap(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapRgb32Packed(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapYuv422aPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapYuv422bPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapYuv422Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapYuv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapYuv411Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    void RemapNv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const;
    /// Output rows first_row to first_row + row_count - 1 only, each as Remap writes it, so that
    /// threads may share a frame out in bands. A band starts on a block of the layout and ends on
    /// one or at the last row (BlockRows); false, with nothing written, for one that does not, that
    /// runs past the destination, or for an unknown format. No rows is a band too.
    bool RemapRows(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination, uint64_t first_row,
                   uint64_t row_count) const;
    /// Remap through the vector kernels of the given lanes (4:2:0 and NV12; the other layouts have
    /// the plain path only), the plain loop finishing each row,
    /// where Remap takes the widest lanes of the processor: the narrowest table runs the plain
    /// path alone, so that tests can hold each width to it.
    void RemapWithLanes(BatchLanes const& lanes, _DEWARP_IMAGE const& source,
                        _DEWARP_IMAGE& destination) const;
    /// The rows of a layout's block: 1 for RGB32, 4 for 4:1:1, 2 for the others, 0 if unknown.
    static uint32_t BlockRows(_DEWARP_IMAGE_FORMAT format);

    /// The words SetMapSize asks for: the signed 32-bit product width * height * 2, widened.
    static int64_t WordCount(int width, int height);

    Resolution image_size;  // the source the map was built for; carried, not read by Remap
    Resolution map_size;
    boost::shared_ptr<unsigned short> map;  // null while empty

private:
    /// Output rows from `first` up to but not including `end`, block-aligned.
    struct Rows {
        uint32_t first;
        uint32_t end;
    };
    static constexpr Rows ALL_ROWS = {0, 0xFFFFFFFFu};
    void RemapRows(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination, Rows rows) const;
    void RemapRgb32Packed(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination, Rows rows) const;
    void RemapYuv422aPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                            Rows rows) const;
    void RemapYuv422bPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                            Rows rows) const;
    void RemapYuv422Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                           Rows rows) const;
    void RemapYuv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination, Rows rows,
                           BatchLanes const& lanes) const;
    void RemapYuv411Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                           Rows rows) const;
    void RemapNv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination, Rows rows,
                          BatchLanes const& lanes) const;
    size_t TableBytes() const;  // what SetMapSize allocated for the present sizes
};

}  // namespace quorvel::vexmap
