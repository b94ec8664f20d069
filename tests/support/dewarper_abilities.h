#pragma once

#include <ostream>

#include <gtest/gtest.h>

#include "DewarpWrapper.h"

// What a dewarper says it can move in a sub-mode on a mount, for the kinds whose panoramas turn
// off the wall and whose single view alone tilts and zooms.
struct AbilityCase {
    int subMode;
    int position;  // 0 wall, 1 ceiling, 2 floor
    bool pan;
    bool tiltAndZoom;
};

inline void PrintTo(AbilityCase const& ability, std::ostream* out) {
    *out << "sub-mode " << ability.subMode << " at position " << ability.position;
}

// The answers do not depend on the sub-mode asked about, only on the one the dewarper is in.
inline void ExpectAbilities(IDewarper& dewarper, AbilityCase const& expected) {
    for (int asked : {1, 2, 3}) {
        EXPECT_EQ(expected.pan, dewarper.CanPan(asked)) << asked;
        EXPECT_EQ(expected.tiltAndZoom, dewarper.CanTilt(asked)) << asked;
        EXPECT_EQ(expected.tiltAndZoom, dewarper.CanZoom(asked)) << asked;
    }
}

inline auto PanoramasTurnOffTheWall() {
    return ::testing::Values(AbilityCase{1, 0, true, true}, AbilityCase{1, 1, true, true},
                             AbilityCase{1, 2, true, true}, AbilityCase{2, 0, false, false},
                             AbilityCase{2, 1, true, false}, AbilityCase{2, 2, true, false},
                             AbilityCase{3, 0, false, false}, AbilityCase{3, 1, true, false});
}
