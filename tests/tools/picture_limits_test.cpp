#include "picture_limits.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

TEST(PictureLimits, DefaultTakesAPictureOfTheLargestSideSquared) {
    PictureLimits const limits;
    EXPECT_EQ(16384u * 16384u, limits.MaxPixels());
    EXPECT_NO_THROW(limits.Check("big.png", 16384, 16384));
}

TEST(PictureLimits, SideBeyondTheLimitIsRefusedNamingTheFileTheSizeAndTheLimit) {
    EXPECT_THAT([] { PictureLimits().Check("crafted.jpg", 60000, 60000); },
                ThrowsMessage<ToolError>(
                    "crafted.jpg is 60000x60000, beyond the limit of 16384 pixels a side"));
}

TEST(PictureLimits, OneLongSideIsEnoughToRefuse) {
    EXPECT_THROW(PictureLimits().Check("strip.png", 16385, 1), ToolError);
    EXPECT_THROW(PictureLimits().Check("strip.png", 1, 16385), ToolError);
}

TEST(PictureLimits, PixelsBeyondTheChosenLimitAreRefusedNamingTheOption) {
    PictureLimits const limits(1000 * 1000);
    EXPECT_NO_THROW(limits.Check("a.png", 1000, 1000));
    EXPECT_THAT([&limits] { limits.Check("--size", 1001, 1000); },
                ThrowsMessage<ToolError>("--size is 1001x1000, 1001000 pixels, beyond the "
                                         "limit of 1000000 pixels (--max-pixels)"));
}

TEST(PictureLimits, EmptySideIsRefused) {
    EXPECT_THAT([] { PictureLimits().Check("empty.png", 0, 10); },
                ThrowsMessage<ToolError>(HasSubstr("has an empty size of 0x10")));
}

TEST(PictureLimits, HugeClaimsDoNotOverflowIntoASmallCount) {
    // 2^32 x 2^32 wraps to 0 in 64 bits: the side test must catch it first.
    EXPECT_THROW(PictureLimits().Check("wrap.png", uint64_t(1) << 32, uint64_t(1) << 32),
                 ToolError);
}

}  // namespace
}  // namespace vexmap_host
