#include "vexmap/map_functors.h"

namespace quorvel::vexmap {

MapFunctors::MapFunctors() = default;

// A chain belongs to one build; a copy starts a new, empty one.
MapFunctors::MapFunctors(MapFunctors const&) : MapFunctor() {}

MapFunctors& MapFunctors::operator=(MapFunctors const&) {
    return *this;
}

MapFunctors::~MapFunctors() = default;

Vector2d MapFunctors::Call(Vector2d const& point) {
    Vector2d result(point);
    for (boost::shared_ptr<MapFunctor> const& link : chain) {
        result = link->Call(result);
    }
    return result;
}

void MapFunctors::Clear() {
    chain.clear();
}

void MapFunctors::PushBack(boost::shared_ptr<MapFunctor> const& link) {
    chain.push_back(link);
}

void MapFunctors::PushBack(MapFunctor* link) {
    boost::shared_ptr<MapFunctor> const owned(link);
    chain.push_back(owned);
}

void MapFunctors::PushFront(boost::shared_ptr<MapFunctor> const& link) {
    chain.push_front(link);
}

void MapFunctors::PushFront(MapFunctor* link) {
    boost::shared_ptr<MapFunctor> const owned(link);
    chain.push_front(owned);
}

}  // namespace quorvel::vexmap
