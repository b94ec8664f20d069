// The registry with the vendors' libraries present: this binary links the three stand-ins. The
// lens lists go through the library's own registry (`CreateDewarper`), which would keep the
// libraries open for good, so they are tested through the plug-in instead.

#include <memory>

#include <gtest/gtest.h>

#include "DewarperRegistry.h"
#include "GeoFisheyeLibrary.h"
#include "ImmervisionLibrary.h"
#include "VivotekLibrary.h"
#include "imv1_standin.h"

namespace {

bool AnyVendorLibraryOpen() {
    return ImmervisionLibraryInstance.IsOpen() || VivotekLibraryInstance.IsOpen() ||
           GeoFisheyeLibraryInstance.IsOpen();
}

class DewarperRegistryWithLibrariesTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_FALSE(AnyVendorLibraryOpen());
        imv1_standin::Reset();
    }
};

TEST_F(DewarperRegistryWithLibrariesTest, EveryVendorKindIsLoadedAndHoldsItsLibrary) {
    DewarperRegistry registry;
    for (int mode : {1, 3, 7, 9}) {
        EXPECT_TRUE(registry.IsLoaded(mode)) << mode;
    }
    EXPECT_TRUE(ImmervisionLibraryInstance.IsOpen());
    EXPECT_TRUE(VivotekLibraryInstance.IsOpen());
    EXPECT_TRUE(GeoFisheyeLibraryInstance.IsOpen());
}

TEST_F(DewarperRegistryWithLibrariesTest, NothingIsOpenedBeforeAKindIsAskedFor) {
    DewarperRegistry registry;
    EXPECT_STREQ("Vivotek", registry.GetName(3));
    EXPECT_FALSE(AnyVendorLibraryOpen());
    EXPECT_TRUE(registry.IsLoaded(3));
    EXPECT_TRUE(VivotekLibraryInstance.IsOpen());
    EXPECT_FALSE(ImmervisionLibraryInstance.IsOpen());
    EXPECT_FALSE(GeoFisheyeLibraryInstance.IsOpen());
}

TEST_F(DewarperRegistryWithLibrariesTest, DestroyingTheRegistryClosesWhatItOpened) {
    auto registry = std::make_unique<DewarperRegistry>();
    for (int mode : {1, 3, 7, 9}) {
        ASSERT_TRUE(registry->IsLoaded(mode));
    }
    registry.reset();
    EXPECT_FALSE(AnyVendorLibraryOpen());
}

TEST_F(DewarperRegistryWithLibrariesTest, ImmerVisionAndSamsungShareOneLibraryUntilBothLetGo) {
    DewarperRegistry first;
    auto second = std::make_unique<DewarperRegistry>();
    ASSERT_TRUE(first.IsLoaded(1));
    ASSERT_TRUE(second->IsLoaded(7));
    second.reset();
    EXPECT_TRUE(ImmervisionLibraryInstance.IsOpen());
}

TEST_F(DewarperRegistryWithLibrariesTest, SamsungIsServedByTheImmerVisionClass) {
    DewarperRegistry registry;
    DewarpParams_t const params;
    IDewarper* const dewarper = registry.LoadAndCreate(7, params);
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(1, dewarper->Mode());
    EXPECT_TRUE(dewarper->Check());
    EXPECT_EQ(1, imv1_standin::LiveObjects());
    delete dewarper;
    EXPECT_EQ(0, imv1_standin::LiveObjects());
}

TEST_F(DewarperRegistryWithLibrariesTest, SamsungsDefaultLensIsFoundEvenBeforeTheKindIsAskedFor) {
    DewarperRegistry registry;
    // The stand-in lists "A8TRT", a lens without a number, "B5SST", "C7SST", ...
    EXPECT_EQ(3, registry.GetDefaultLens(7, "Samsung", "SNF-8010VM"));
    EXPECT_TRUE(ImmervisionLibraryInstance.IsOpen());
    EXPECT_EQ(0, registry.GetDefaultLens(1, "Samsung", "SNF-8010VM"));
}

}  // namespace
