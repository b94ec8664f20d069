#pragma once

#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// One coordinate transform of a map chain: a point in, a point out, in pixels with the origin at
/// the centre. Built for one map build and called by one thread.
class MapFunctor {
public:
    MapFunctor();
    MapFunctor(MapFunctor const& other);
    MapFunctor& operator=(MapFunctor const& other);
    virtual ~MapFunctor();

    virtual Vector2d Call(Vector2d const& point) = 0;
};

}  // namespace quorvel::vexmap
