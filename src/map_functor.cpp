#include "vexmap/map_functor.h"

namespace quorvel::vexmap {

MapFunctor::MapFunctor() = default;

MapFunctor::MapFunctor(MapFunctor const&) = default;

MapFunctor& MapFunctor::operator=(MapFunctor const&) = default;

MapFunctor::~MapFunctor() = default;

}  // namespace quorvel::vexmap
