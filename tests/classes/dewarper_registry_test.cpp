#include <memory>

#include <gtest/gtest.h>

#include "DewarperRegistry.h"

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

}  // namespace
