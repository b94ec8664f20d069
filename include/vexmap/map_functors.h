#pragma once

#include <list>

#include <boost/shared_ptr.hpp>

#include "vexmap/map_functor.h"

namespace quorvel::vexmap {

/// A chain of transforms, itself a transform: a point passes through the links front to back.
/// Shares its links. A chain lives for one map build and is not meant to be copied, so its copies
/// start empty and assignment leaves it as it is. One thread.
class MapFunctors : public MapFunctor {
public:
    MapFunctors();                                     // empty
    MapFunctors(MapFunctors const& other);             // empty: nothing is copied
    MapFunctors& operator=(MapFunctors const& other);  // does nothing
    ~MapFunctors() override;

    /// The point through every link, front first; an empty chain returns it.
    Vector2d Call(Vector2d const& point) override;
    void Clear();
    void PushBack(boost::shared_ptr<MapFunctor> const& link);
    void PushBack(MapFunctor* link);  // takes ownership
    void PushFront(boost::shared_ptr<MapFunctor> const& link);
    void PushFront(MapFunctor* link);  // takes ownership
    /// The links in the order of application, for a builder that runs them on many points.
    std::list<boost::shared_ptr<MapFunctor>> const& GetLinks() const { return chain; }

private:
    std::list<boost::shared_ptr<MapFunctor>> chain;
};

}  // namespace quorvel::vexmap
