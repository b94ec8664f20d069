#pragma once

#include <vector>

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
    enum StepKind {
        AFFINE,
        SPHERICAL_TURN,
        RECTILINEAR_TO_FISHEYE,
        CYLINDRICAL_TO_FISHEYE,
        EQUIRECTANGULAR_TO_FISHEYE,
        MERCATOR_TO_EQUIRECTANGULAR,
        LAMBERT_TO_EQUIRECTANGULAR,
        MILLER_TO_EQUIRECTANGULAR,
        ARCHITECTURAL_TO_EQUIRECTANGULAR,
        PANNINI_TO_EQUIRECTANGULAR,
        EQUIRECTANGULAR_PANNINI_TO_EQUIRECTANGULAR,
        CONVERSION,  // any other conversion of the grid, point by point
        POINTWISE,   // any other link, point by point
    };
    struct Step {
        StepKind kind;
        float m[9];  // the affine or rotation matrix, rows first
        float f;     // focal length
        ConversionFunction conversion;
        MapFunctor* link;
    };

    void AppendConversion(ConversionFunction conversion, float f);
    void AppendStep(StepKind kind, float f);
    void RunStep(Step const& step, float* x, float* y, int count);
    float* Work(int index, int count) {
        return work.data() + std::size_t(index) * std::size_t(count);
    }

    std::vector<Step> steps;
    std::vector<float> work;  // scratch arrays of one row, kept from row to row
};

}  // namespace quorvel::vexmap
