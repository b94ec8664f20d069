#include <gtest/gtest.h>

#include "VivotekLibrary.h"
#include "fisheyesw_standin.h"

namespace {

TEST(VivotekFunctions, BindsTheFiveFunctionsOfTheLibraryByName) {
    ASSERT_FALSE(VivotekLibraryInstance.IsOpen());
    ASSERT_TRUE(VivotekLibraryInstance.Acquire());
    VivotekFunctions const& api = VivotekLibraryInstance.Api();
    EXPECT_EQ(&::Fisheye_Initial, api.Fisheye_Initial);
    EXPECT_EQ(&::Fisheye_Release, api.Fisheye_Release);
    EXPECT_EQ(&::Fisheye_SetModelName, api.Fisheye_SetModelName);
    EXPECT_EQ(&::Fisheye_SetOption, api.Fisheye_SetOption);
    EXPECT_EQ(&::Fisheye_OneFrame, api.Fisheye_OneFrame);
    VivotekLibraryInstance.Release();
    EXPECT_FALSE(VivotekLibraryInstance.IsOpen());
    EXPECT_EQ(nullptr, VivotekLibraryInstance.Api().Fisheye_OneFrame);
}

TEST(VivotekFunctions, TheLibraryIsFoundByItsSoname) {
    EXPECT_STREQ("libfisheyesw.so.3", VivotekFunctions::FILE_NAME);
    EXPECT_FALSE(VivotekLibraryInstance.Acquire("libfisheyesw.so.2"));
    EXPECT_FALSE(VivotekLibraryInstance.IsOpen());
}

TEST(VivotekFunctions, ReferencesAreCountedAndTheLastReleaseCloses) {
    ASSERT_TRUE(VivotekLibraryInstance.Acquire());
    ASSERT_TRUE(VivotekLibraryInstance.Acquire());
    VivotekLibraryInstance.Release();
    EXPECT_TRUE(VivotekLibraryInstance.IsOpen());
    EXPECT_NE(nullptr, VivotekLibraryInstance.Api().Fisheye_Initial);
    VivotekLibraryInstance.Release();
    EXPECT_FALSE(VivotekLibraryInstance.IsOpen());
}

TEST(VivotekFunctions, ALibraryLackingOneOfTheFunctionsIsNotLoaded) {
    VendorLibrary<VivotekFunctions> incomplete;
    EXPECT_FALSE(incomplete.Acquire(VEXMAP_INCOMPLETE_FISHEYESW));
    EXPECT_FALSE(incomplete.IsOpen());
    EXPECT_EQ(nullptr, incomplete.Api().Fisheye_Initial);
}

}  // namespace
