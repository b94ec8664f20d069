#include "vexmap/batch_chain.h"

#include <algorithm>
#include <typeinfo>

#include <boost/shared_ptr.hpp>

#include "vexmap/log.h"
#include "vexmap/map_functors.h"
#include "vexmap/projection_functor.h"
#include "vexmap/spherical_orientation_functor.h"
#include "vexmap/transform_2d_functor.h"

namespace quorvel::vexmap {

BatchChain::BatchChain() = default;

BatchChain::BatchChain(MapFunctor& chain) {
    Append(chain);
}

BatchChain::BatchChain(BatchChain const& other) = default;

BatchChain& BatchChain::operator=(BatchChain const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "BatchChain");
        return *this;
    }
    steps = other.steps;
    return *this;
}

BatchChain::~BatchChain() = default;

// The exact class decides: a class derived from a known link may have a Call of its own.
void BatchChain::Append(MapFunctor& link) {
    std::type_info const& type = typeid(link);
    if (type == typeid(MapFunctors)) {
        for (boost::shared_ptr<MapFunctor> const& each :
             static_cast<MapFunctors&>(link).GetLinks()) {
            Append(*each);
        }
    } else if (type == typeid(Transform2dFunctor)) {
        Matrix3x3 const& m = static_cast<Transform2dFunctor&>(link).matrix;
        float const rows[6] = {m.m11, m.m12, m.m13, m.m21, m.m22, m.m23};
        Step& step = AppendStep(BatchLanes::AFFINE, 0.0f);
        std::copy(rows, rows + 6, step.parameters);
    } else if (type == typeid(SphericalOrientationFunctor)) {
        auto const& turn = static_cast<SphericalOrientationFunctor&>(link);
        RotationMatrix3d const& m = turn.rotation;
        float const rows[9] = {m.m11, m.m12, m.m13, m.m21, m.m22, m.m23, m.m31, m.m32, m.m33};
        Step& step = AppendStep(BatchLanes::SPHERICAL_TURN, turn.focal_length);
        std::copy(rows, rows + 9, step.parameters);
    } else if (type == typeid(ProjectionFunctor)) {
        auto const& projection = static_cast<ProjectionFunctor&>(link);
        AppendConversion(projection.conversion, projection.focal_length);
    } else {
        AppendStep(POINTWISE, 0.0f).link = &link;
    }
}

// The conversions into Fisheye that the views use: three direct ones, and the others through
// Equirectangular, as the grid composes them.
void BatchChain::AppendConversion(ConversionFunction conversion, float f) {
    struct Known {
        ConversionFunction conversion;
        BatchLanes::ChainKind first;
        bool via_equirectangular;
    };
    static Known const KNOWN[] = {
        {&Projection::RectilinearToFisheye, BatchLanes::RECTILINEAR_TO_FISHEYE, false},
        {&Projection::CylindricalToFisheye, BatchLanes::CYLINDRICAL_TO_FISHEYE, false},
        {&Projection::EquirectangularToFisheye, BatchLanes::EQUIRECTANGULAR_TO_FISHEYE, false},
        {&Projection::MercatorToFisheye, BatchLanes::MERCATOR_TO_EQUIRECTANGULAR, true},
        {&Projection::LambertCylindricalToFisheye, BatchLanes::LAMBERT_TO_EQUIRECTANGULAR, true},
        {&Projection::MillerCylindricalToFisheye, BatchLanes::MILLER_TO_EQUIRECTANGULAR, true},
        {&Projection::ArchitecturalToFisheye, BatchLanes::ARCHITECTURAL_TO_EQUIRECTANGULAR, true},
        {&Projection::PanniniToFisheye, BatchLanes::PANNINI_TO_EQUIRECTANGULAR, true},
        {&Projection::EquirectangularPanniniToFisheye,
         BatchLanes::EQUIRECTANGULAR_PANNINI_TO_EQUIRECTANGULAR, true},
    };
    for (Known const& known : KNOWN) {
        if (known.conversion == conversion) {
            AppendStep(known.first, f);
            if (known.via_equirectangular) {
                AppendStep(BatchLanes::EQUIRECTANGULAR_TO_FISHEYE, f);
            }
            return;
        }
    }
    AppendStep(CONVERSION, f).conversion = conversion;
}

BatchChain::Step& BatchChain::AppendStep(int kind, float f) {
    Step step = {};
    step.kind = kind;
    step.parameters[9] = f;
    steps.push_back(step);
    return steps.back();
}

void BatchChain::Run(float* x, float* y, int count) {
    if (count <= 0) {
        return;
    }
    std::size_t const needed = 4 * std::size_t(count);
    if (work.size() < needed) {
        work.resize(needed);
    }
    BatchLanes const& lanes = BatchLanes::Widest();
    for (Step const& step : steps) {
        if (step.kind < BatchLanes::CHAIN_KIND_COUNT) {
            lanes.chain[step.kind](step.parameters, x, y, count, work.data());
        } else if (step.kind == CONVERSION) {
            for (int i = 0; i < count; ++i) {
                Vector2d const point = step.conversion(Vector2d(x[i], y[i]), step.parameters[9]);
                x[i] = point.x;
                y[i] = point.y;
            }
        } else {
            for (int i = 0; i < count; ++i) {
                Vector2d const point = step.link->Call(Vector2d(x[i], y[i]));
                x[i] = point.x;
                y[i] = point.y;
            }
        }
    }
}

}  // namespace quorvel::vexmap
