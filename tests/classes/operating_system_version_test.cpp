#include <gtest/gtest.h>

#include "OperatingSystemVersion.h"

namespace {

TEST(OperatingSystemVersion, ParseReadsTheMajorAndMinorOfAKernelRelease) {
    OperatingSystemVersion const version = OperatingSystemVersion::Parse("6.1.0-18-amd64");
    EXPECT_EQ(6, version.major);
    EXPECT_EQ(1, version.minor);
}

TEST(OperatingSystemVersion, ParseReadsAReleaseOfTwoNumbersOnly) {
    OperatingSystemVersion const version = OperatingSystemVersion::Parse("3.2");
    EXPECT_EQ(3, version.major);
    EXPECT_EQ(2, version.minor);
}

TEST(OperatingSystemVersion, ParseReadsSeveralDigitsInEachNumber) {
    OperatingSystemVersion const version = OperatingSystemVersion::Parse("10.15.7");
    EXPECT_EQ(10, version.major);
    EXPECT_EQ(15, version.minor);
}

class UnreadableReleaseTest : public ::testing::TestWithParam<char const*> {};

TEST_P(UnreadableReleaseTest, ReadsAsVersionZero) {
    OperatingSystemVersion const version = OperatingSystemVersion::Parse(GetParam());
    EXPECT_EQ(0, version.major);
    EXPECT_EQ(0, version.minor);
}

INSTANTIATE_TEST_SUITE_P(Texts, UnreadableReleaseTest,
                         ::testing::Values(nullptr, "", "6", "6.", ".1", "v6.1", "6-1",
                                           "99999999999.1", "6.99999999999", " 6.1"));

TEST(OperatingSystemVersion, TheRunningKernelIsReadable) {
    OperatingSystemVersion const version = OperatingSystemVersion::Running();
    EXPECT_GE(version.major, 3);
    EXPECT_GE(version.minor, 0);
}

TEST(OperatingSystemVersion, AtLeastComparesTheMajorFirstAndThenTheMinor) {
    OperatingSystemVersion const version = {3, 2};
    EXPECT_TRUE(version.AtLeast(3, 2));
    EXPECT_TRUE(version.AtLeast(3, 1));
    EXPECT_TRUE(version.AtLeast(2, 9));
    EXPECT_FALSE(version.AtLeast(3, 3));
    EXPECT_FALSE(version.AtLeast(4, 0));
    EXPECT_TRUE((OperatingSystemVersion{4, 0}).AtLeast(3, 9));
    EXPECT_FALSE((OperatingSystemVersion{0, 0}).AtLeast(3, 2));
}

}  // namespace
