#pragma once

#include <vector>

#include "vexmap/batch_lanes.h"
#include "vexmap/map_functor.h"
#include "vexmap/projection.h"

namespace quorvel::vexmap {

/// A map chain read once for a build and then run on arrays of points, a row at a time. A link
/// of a kind it knows (Transform2dFunctor, SphericalOrientationFunctor, and ProjectionFunctor with
/// a conversion into Fisheye) is worked out for all points at once, with the arithmetic of the
/// link's own Call in the same order and its trigonometry through BatchTrigonometry; any other
/// link, or a class derived from one of those, is called point by point. Refers to the links
/// without owning them: the chain must outlive it. One thread.
class BatchChain {
public:
    BatchChain();  // no links: Run leaves the points as they are
    /// The links of the chain, or the link itself if it is no chain.
    explicit BatchChain(MapFunctor& chain);
    BatchChain(BatchChain const& other);
    BatchChain& operator=(BatchChain const& other);
    virtual ~BatchChain();

    void Append(MapFunctor& link);
    /// Every point (x[i], y[i]) through the links, in place.
    void Run(float* x, float* y, int count);

private:
    /// A kernel of BatchLanes by its kind, or a link called point by point.
    enum StepKind {
        CONVERSION = BatchLanes::CHAIN_KIND_COUNT,  // any other conversion of the grid
        POINTWISE,                                  // any other link
    };
    struct Step {
        int kind;              // a BatchLanes::ChainKind or a StepKind
        float parameters[10];  // matrix by rows, then the focal length
        ConversionFunction conversion;
        MapFunctor* link;
    };

    void AppendConversion(ConversionFunction conversion, float f);
    Step& AppendStep(int kind, float f);

    std::vector<Step> steps;
    std::vector<float> work;  // scratch arrays of one row, kept from row to row
};

}  // namespace quorvel::vexmap
