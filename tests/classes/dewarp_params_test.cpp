#include <cstddef>
#include <cstring>

#include <gtest/gtest.h>

#include "DewarpWrapper.h"

namespace {

DewarpParams_t Described(char const* text) {
    DewarpParams_t params;
    params.lens = 1;
    params.position = 2;
    params.panoramaOffset = 30;
    params.circleX = 400;
    params.circleY = 300;
    params.circleRadius = 250;
    params.extra = strdup(text);
    return params;
}

TEST(DewarpParams, StartsAllZero) {
    DewarpParams_t const params;
    EXPECT_EQ(0, params.lens);
    EXPECT_EQ(0, params.position);
    EXPECT_EQ(0, params.panoramaOffset);
    EXPECT_EQ(0, params.circleX);
    EXPECT_EQ(0, params.circleY);
    EXPECT_EQ(0, params.circleRadius);
    EXPECT_EQ(nullptr, params.extra);
}

TEST(DewarpParams, KeepsTheLayoutTheHostSees) {
    EXPECT_EQ(32u, sizeof(DewarpParams_t));
    EXPECT_EQ(20u, offsetof(DewarpParams_t, circleRadius));
    EXPECT_EQ(24u, offsetof(DewarpParams_t, extra));
}

TEST(DewarpParams, CopyDuplicatesTheExtraText) {
    DewarpParams_t const original = Described("lobby");
    DewarpParams_t const copy(original);
    EXPECT_EQ(250, copy.circleRadius);
    EXPECT_EQ(30, copy.panoramaOffset);
    ASSERT_NE(nullptr, copy.extra);
    EXPECT_NE(original.extra, copy.extra);
    EXPECT_STREQ("lobby", copy.extra);
}

TEST(DewarpParams, CopyOfNoExtraTextHasNone) {
    DewarpParams_t const original;
    DewarpParams_t const copy(original);
    EXPECT_EQ(nullptr, copy.extra);
}

TEST(DewarpParams, AssignmentReplacesTheExtraText) {
    DewarpParams_t target = Described("old");
    DewarpParams_t const source = Described("new");
    target = source;
    EXPECT_STREQ("new", target.extra);
    EXPECT_NE(source.extra, target.extra);
}

TEST(DewarpParams, AssignmentToItselfChangesNothing) {
    DewarpParams_t params = Described("self");
    char* const before = params.extra;
    DewarpParams_t& same = params;
    params = same;
    EXPECT_EQ(before, params.extra);
    EXPECT_STREQ("self", params.extra);
}

}  // namespace
