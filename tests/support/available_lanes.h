#pragma once

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "vexmap/batch_lanes.h"

namespace quorvel::vexmap {

/// Every lane width that this processor runs, the plain SSE2 one first: the tests of the vector
/// kernels run each against the plain path.
inline std::vector<BatchLanes const*> AvailableLanes() {
    std::vector<BatchLanes const*> lanes = {&BatchLanes::Sse2()};
    for (BatchLanes const* wide : {&BatchLanes::Avx2(), &BatchLanes::Avx512()}) {
        if (wide->Supported()) {
            lanes.push_back(wide);
        }
    }
    return lanes;
}

/// Names a test of a lane width after the width ("sse2", "avx2", "avx512").
inline std::string LanesName(testing::TestParamInfo<BatchLanes const*> const& lanes) {
    return lanes.param->name;
}

}  // namespace quorvel::vexmap
