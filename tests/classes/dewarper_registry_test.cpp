#include <algorithm>
#include <memory>
#include <vector>

#include <gtest/gtest.h>

#include "DewarperRegistry.h"
#include "GeoFisheyeLibrary.h"
#include "ImmervisionLibrary.h"
#include "VivotekLibrary.h"
#include "imv1_standin.h"

namespace {

struct DeleteThroughTheExport {
    void operator()(IDewarper* dewarper) const { DeleteDewarper(dewarper); }
};
using DewarperPointer = std::unique_ptr<IDewarper, DeleteThroughTheExport>;

TEST(DewarperRegistry, GetRegisterGivesTheOneStaticRegistry) {
    EXPECT_EQ(&DewarperRegistryInstance, GetRegister());
    EXPECT_EQ(GetRegister(), GetRegister());
}

TEST(DewarperRegistry, UnregisteredModesHaveAnEmptyNameAndTheModeCountStaysSeventeen) {
    DewarperRegistry registry;
    EXPECT_STREQ("", registry.GetName(0));
    EXPECT_STREQ("", registry.GetName(4));
    EXPECT_STREQ("", registry.GetName(16));
    EXPECT_STREQ("", registry.GetName(-1));
    EXPECT_STREQ("", registry.GetName(99));
    EXPECT_EQ(17, registry.GetModeCount());
}

TEST(DewarperRegistry, Sentry360IsRegisteredAsModeTwo) {
    DewarperRegistry registry;
    EXPECT_STREQ("Sentry360", registry.GetName(2));
    EXPECT_EQ(2, registry.GetModeByName("Sentry360"));
}

TEST(DewarperRegistry, GetModeByNameOfAnEmptyOrUnknownNameIsTheModeOfNoDewarper) {
    DewarperRegistry registry;
    EXPECT_EQ(0, registry.GetModeByName(""));
    EXPECT_EQ(0, registry.GetModeByName("Fisheye"));
    EXPECT_EQ(0, registry.GetModeByName(nullptr));
}

TEST(DewarperRegistry, GetModeByNameComparesCaseSensitively) {
    DewarperRegistry registry;
    EXPECT_EQ(0, registry.GetModeByName("sentry360"));
    EXPECT_EQ(0, registry.GetModeByName("Sentry360 "));
}

TEST(DewarperRegistry, Sentry360UsesPositionAndCircleButNoLenses) {
    DewarperRegistry registry;
    bool has_lenses = true;
    bool has_circle = false;
    bool has_position = false;
    registry.GetSupportedFeatures(2, has_lenses, has_circle, has_position);
    EXPECT_FALSE(has_lenses);
    EXPECT_TRUE(has_circle);
    EXPECT_TRUE(has_position);
    EXPECT_TRUE(registry.IsCameraSpecific(2));
}

TEST(DewarperRegistry, GetSupportedFeaturesOfAnUnregisteredModeClearsAllThreeFlags) {
    DewarperRegistry registry;
    bool has_lenses = true;
    bool has_circle = true;
    bool has_position = true;
    registry.GetSupportedFeatures(99, has_lenses, has_circle, has_position);
    EXPECT_FALSE(has_lenses);
    EXPECT_FALSE(has_circle);
    EXPECT_FALSE(has_position);
    EXPECT_FALSE(registry.IsCameraSpecific(99));
}

TEST(DewarperRegistry, RegisteredKindsAreLoadedAndOthersAreNot) {
    DewarperRegistry registry;
    EXPECT_TRUE(registry.IsLoaded(2));
    EXPECT_TRUE(registry.IsLoaded(2));
    EXPECT_FALSE(registry.IsLoaded(0));
    EXPECT_FALSE(registry.IsLoaded(10));
    EXPECT_TRUE(DewarperLoaded(2));
    EXPECT_FALSE(DewarperLoaded(-5));
}

TEST(DewarperRegistry, GetLensOfAKindWithoutLensesGivesZeroAndWritesNothing) {
    DewarperRegistry registry;
    char buffer[8] = "intact";
    EXPECT_EQ(0, registry.GetLens(2, 0, buffer, sizeof buffer));
    EXPECT_EQ(0, registry.GetLens(99, 0, buffer, sizeof buffer));
    EXPECT_STREQ("intact", buffer);
}

TEST(DewarperRegistry, GetModeByCameraAnswersFromTheCameraTable) {
    DewarperRegistry registry;
    EXPECT_EQ(2, registry.GetModeByCamera("Sentry360", "FS-IP5000", ""));
    EXPECT_EQ(10, registry.GetModeByCamera("AXIS", "M3007-P", ""));
    EXPECT_EQ(0, registry.GetModeByCamera("Acme", "Fisheye", ""));
    EXPECT_EQ(0, registry.GetModeByCamera(nullptr, nullptr, nullptr));
}

TEST(DewarperRegistry, GetDefaultLensIsZeroForEveryKindWithoutLenses) {
    DewarperRegistry registry;
    EXPECT_EQ(0, registry.GetDefaultLens(2, "make", "model"));
    EXPECT_EQ(0, registry.GetDefaultLens(42, "make", "model"));
}

TEST(DewarperRegistry, CreateDewarperOfARegisteredModeGivesItsClass) {
    DewarpParams_t params;
    params.circleRadius = 10;
    DewarperPointer const dewarper(CreateDewarper(2, params));
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(2, dewarper->Mode());
    EXPECT_EQ(10, dewarper->Parameters()->circleRadius);
}

TEST(DewarperRegistry, CreateDewarperOfAModeThatGetModeByCameraCanNameButNoKindServesIsNull) {
    DewarpParams_t const params;
    EXPECT_EQ(nullptr, CreateDewarper(10, params));
    EXPECT_EQ(nullptr, CreateDewarper(0, params));
    EXPECT_EQ(nullptr, CreateDewarper(1000, params));
}

TEST(DewarperRegistry, CreateMemberBuildsWithoutTheDelayedLoad) {
    DewarperRegistry registry;
    DewarpParams_t const params;
    DewarperPointer const dewarper(registry.Create(DewarperType::DewarperSentry360, params));
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(2, dewarper->Mode());
    EXPECT_EQ(nullptr, registry.Create(DewarperType::DewarperAxis, params));
}

TEST(DewarperRegistry, DeleteDewarperOfNullDoesNothing) {
    DeleteDewarper(nullptr);
}

// The kernel versions a test registry is told, one a read.
std::vector<OperatingSystemVersion> toldVersions;
int versionReads = 0;

OperatingSystemVersion ToldVersion() {
    OperatingSystemVersion const version = toldVersions.at(std::size_t(versionReads));
    ++versionReads;
    return version;
}

std::unique_ptr<DewarperRegistry> RegistryOnVersions(
    std::vector<OperatingSystemVersion> const& versions) {
    toldVersions = versions;
    versionReads = 0;
    return std::make_unique<DewarperRegistry>(ToldVersion);
}

std::vector<int> RegisteredModes(DewarperRegistry& registry) {
    std::vector<int> modes;
    for (int mode = 0; mode < registry.GetModeCount(); ++mode) {
        if (*registry.GetName(mode) != '\0') {
            modes.push_back(mode);
        }
    }
    return modes;
}

TEST(DewarperRegistry, ARecentKernelRegistersAllSixKinds) {
    auto const registry = RegistryOnVersions({{3, 2}, {3, 2}});
    EXPECT_EQ((std::vector<int>{1, 2, 3, 7, 8, 9}), RegisteredModes(*registry));
    EXPECT_EQ(2, versionReads);
}

TEST(DewarperRegistry, TheRunningKernelRegistersAllSixKinds) {
    DewarperRegistry registry;
    EXPECT_EQ((std::vector<int>{1, 2, 3, 7, 8, 9}), RegisteredModes(registry));
}

TEST(DewarperRegistry, AKernelBelowTheGateRegistersNeitherImmerVisionNorSamsungNorVivotek) {
    auto const registry = RegistryOnVersions({{3, 1}, {3, 1}});
    EXPECT_EQ((std::vector<int>{2, 8, 9}), RegisteredModes(*registry));
}

TEST(DewarperRegistry, AnUnreadableVersionPassesNoGate) {
    auto const registry = RegistryOnVersions({{0, 0}, {0, 0}});
    EXPECT_EQ((std::vector<int>{2, 8, 9}), RegisteredModes(*registry));
    EXPECT_EQ(0, registry->GetModeByName("Vivotek"));
    EXPECT_EQ(9, registry->GetModeByName("Geovision"));
}

TEST(DewarperRegistry, EachGateReadsTheVersionAgain) {
    auto const immervision_only = RegistryOnVersions({{3, 2}, {2, 6}});
    EXPECT_EQ((std::vector<int>{1, 2, 7, 8, 9}), RegisteredModes(*immervision_only));
    auto const vivotek_only = RegistryOnVersions({{2, 6}, {4, 0}});
    EXPECT_EQ((std::vector<int>{2, 3, 8, 9}), RegisteredModes(*vivotek_only));
}

struct KindRow {
    int mode;
    char const* name;
    bool hasLenses;
    bool hasCircle;
    bool hasPosition;
    bool cameraSpecific;
};

class RegisteredKindTest : public ::testing::TestWithParam<KindRow> {};

TEST_P(RegisteredKindTest, HasItsNameAndFlags) {
    KindRow const row = GetParam();
    DewarperRegistry registry;
    EXPECT_STREQ(row.name, registry.GetName(row.mode));
    EXPECT_EQ(row.mode, registry.GetModeByName(row.name));
    bool has_lenses = !row.hasLenses;
    bool has_circle = !row.hasCircle;
    bool has_position = !row.hasPosition;
    registry.GetSupportedFeatures(row.mode, has_lenses, has_circle, has_position);
    EXPECT_EQ(row.hasLenses, has_lenses);
    EXPECT_EQ(row.hasCircle, has_circle);
    EXPECT_EQ(row.hasPosition, has_position);
    EXPECT_EQ(row.cameraSpecific, registry.IsCameraSpecific(row.mode));
}

INSTANTIATE_TEST_SUITE_P(Kinds, RegisteredKindTest,
                         ::testing::Values(KindRow{2, "Sentry360", false, true, true, true},
                                           KindRow{1, "ImmerVision", true, false, true, false},
                                           KindRow{7, "Samsung", true, false, true, true},
                                           KindRow{3, "Vivotek", true, false, true, true},
                                           KindRow{9, "Geovision", false, false, true, true},
                                           KindRow{8, "Brenvia", false, false, true, true}));

TEST(DewarperRegistry, GetModeByNameOfSamsungIsSevenAndOfItsLowerCaseZero) {
    DewarperRegistry registry;
    EXPECT_EQ(7, registry.GetModeByName("Samsung"));
    EXPECT_EQ(0, registry.GetModeByName("samsung"));
    EXPECT_EQ(0, registry.GetModeByName("immervision"));
}

TEST(DewarperRegistry, GetLensOfGeovisionGivesZeroAtOnce) {
    DewarperRegistry registry;
    char buffer[8] = "intact";
    EXPECT_EQ(0, registry.GetLens(9, 0, buffer, sizeof buffer));
    EXPECT_STREQ("intact", buffer);
}

TEST(DewarperRegistry, TheInHouseKindsDewarpAFrameThroughTheExports) {
    DewarpParams_t params;
    params.circleX = 32;
    params.circleY = 32;
    params.circleRadius = 32;
    for (int mode : {2, 8}) {
        EXPECT_TRUE(DewarperLoaded(mode));
        DewarperPointer const dewarper(CreateDewarper(mode, params));
        ASSERT_NE(nullptr, dewarper);
        unsigned char* input = nullptr;
        unsigned int size = 0;
        int format = 0;
        ASSERT_TRUE(dewarper->GetImageInputBuffer(64, 64, &input, &size, &format));
        std::fill_n(input, size, 128);
        int width = 64;
        int height = 48;
        unsigned char* output = nullptr;
        EXPECT_TRUE(dewarper->GetImageOutputBuffer(&width, &height, &output, &size, &format))
            << "mode " << mode;
        EXPECT_NE(nullptr, output);
    }
}

// The vendors' libraries are the stand-ins this binary links. The lens lists go through the
// plug-in's own registry (`CreateDewarper`), which would keep the libraries open for good and so
// spoil the tests that need them closed; they are tested through the plug-in instead.
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
