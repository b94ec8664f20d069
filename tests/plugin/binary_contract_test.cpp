#include <cmath>
#include <cstring>
#include <dlfcn.h>
#include <memory>

#include <gtest/gtest.h>

#include "host_side_interfaces.h"
#include "plugin_library.h"

namespace {

using host_side::CameraRecord;
using host_side::Dewarper;
using host_side::Registry;

constexpr int SENTRY360 = 2;

class BinaryContractTest : public PluginLibraryTest {
protected:
    Dewarper* CreateSentry360() {
        CameraRecord record{};
        record.position = 1;
        record.circleX = 32;
        record.circleY = 32;
        record.circleRadius = 32;
        return createDewarper(SENTRY360, record);
    }
};

TEST_F(BinaryContractTest, ExportsAreFoundByTheirPlainNames) {
    EXPECT_EQ(nullptr, dlsym(library, "_Z11GetRegisterv"));
    EXPECT_EQ(nullptr, dlsym(library, "DewarperRegistryInstance"));
}

TEST_F(BinaryContractTest, RegistrySlotsAnswerInTheirOrder) {
    Registry* registry = getRegister();
    ASSERT_NE(nullptr, registry);
    EXPECT_EQ(registry, getRegister());
    EXPECT_TRUE(registry->IsCameraSpecific(SENTRY360));
    EXPECT_FALSE(registry->IsCameraSpecific(5));
    bool lenses = true;
    bool circle = false;
    bool position = false;
    registry->GetSupportedFeatures(SENTRY360, lenses, circle, position);
    EXPECT_FALSE(lenses);
    EXPECT_TRUE(circle);
    EXPECT_TRUE(position);
    EXPECT_TRUE(registry->IsLoaded(SENTRY360));
    EXPECT_FALSE(registry->IsLoaded(4));
    EXPECT_STREQ("Sentry360", registry->GetName(SENTRY360));
    EXPECT_STREQ("", registry->GetName(4));
    char buffer[16] = "untouched";
    EXPECT_EQ(0, registry->GetLens(SENTRY360, 0, buffer, sizeof buffer));
    EXPECT_STREQ("untouched", buffer);
    EXPECT_EQ(17, registry->GetModeCount());
    EXPECT_EQ(SENTRY360, registry->GetModeByName("Sentry360"));
    EXPECT_EQ(0, registry->GetModeByCamera("", "", ""));
    EXPECT_EQ(SENTRY360, registry->GetModeByCamera("RTSP", "", "rtsp://camera/h264"));
    EXPECT_EQ(0, registry->GetDefaultLens(SENTRY360, "", ""));
    CameraRecord const record{};
    Dewarper* dewarper = registry->Create(SENTRY360, record);
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(SENTRY360, dewarper->Mode());
    deleteDewarper(dewarper);
    EXPECT_EQ(nullptr, registry->Create(10, record));
}

TEST_F(BinaryContractTest, ExportedFunctionsFollowTheRegistry) {
    EXPECT_TRUE(dewarperLoaded(SENTRY360));
    EXPECT_FALSE(dewarperLoaded(10));
    CameraRecord const record{};
    EXPECT_EQ(nullptr, createDewarper(10, record));
    deleteDewarper(nullptr);
}

TEST_F(BinaryContractTest, DewarperQuerySlotsAnswerInTheirOrder) {
    Dewarper* dewarper = CreateSentry360();
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(SENTRY360, dewarper->Mode());
    EXPECT_TRUE(dewarper->Check());
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_TRUE(dewarper->IsSubModeSupported(2));
    EXPECT_FALSE(dewarper->IsSubModeSupported(3));
    EXPECT_FALSE(dewarper->IsNormalPTZSupported(1));
    EXPECT_TRUE(dewarper->IsNormalPTZSupported(3));
    EXPECT_TRUE(dewarper->CanPan(2));
    EXPECT_TRUE(dewarper->CanTilt(2));
    EXPECT_TRUE(dewarper->CanZoom(2));
    EXPECT_FALSE(dewarper->GetNeedsRotation());
    EXPECT_FALSE(dewarper->GetFlipVertical());
    EXPECT_FALSE(dewarper->GetFlipHorizontal());
    EXPECT_EQ(3.0f, dewarper->AdjustAspectRatio(4.0f, 3.0f));
    EXPECT_EQ(32, dewarper->Parameters()->circleRadius);
    EXPECT_EQ(1, dewarper->Parameters()->position);
    char buffer[4] = "abc";
    EXPECT_EQ(0, dewarper->GetLens(0, buffer, sizeof buffer));
    dewarper->SetDewarperType(7);
    EXPECT_EQ(SENTRY360, dewarper->Mode());
    dewarper->SetSubMode(2);
    EXPECT_EQ(2, dewarper->SubMode());
    EXPECT_FALSE(dewarper->CanPan(1));
    EXPECT_FLOAT_EQ(16.0f / 9.0f, dewarper->AdjustAspectRatio(4.0f, 3.0f));
    deleteDewarper(dewarper);
}

TEST_F(BinaryContractTest, DewarperPositionSlotsMoveThePositionInTheirOrder) {
    Dewarper* dewarper = CreateSentry360();
    ASSERT_NE(nullptr, dewarper);
    float pan = -1;
    float tilt = -1;
    float zoom = -1;
    dewarper->SetPosition(10.0f, 20.0f, 2.0f);
    dewarper->Pan(1, 0);
    dewarper->Tilt(1, 4);
    dewarper->Zoom(1, 1);
    dewarper->GetPosition(pan, tilt, zoom);
    EXPECT_FLOAT_EQ(10.2f, pan);
    EXPECT_FLOAT_EQ(19.0f, tilt);
    EXPECT_FLOAT_EQ(2.1f, zoom);
    dewarper->Clear();
    dewarper->GetPosition(pan, tilt, zoom);
    EXPECT_EQ(0.0f, pan);
    EXPECT_FLOAT_EQ(0.7f, zoom);
    deleteDewarper(dewarper);
}

// A host shows a new dewarper's position before the first frame. Brenvia hands out its tilt
// ten roots of the zoom above the inner one.
TEST_F(BinaryContractTest, ANewDewarperOfAnInHouseKindAnswersItsKindsDefaultPosition) {
    struct Expected {
        int mode;
        float tilt;
        float zoom;
    };
    for (Expected const expected :
         {Expected{SENTRY360, 0.0f, 0.7f}, Expected{8, float(10.0 * double(sqrtf(0.5f))), 0.5f}}) {
        NewPosition const position = PositionOfANewDewarper(expected.mode);
        ASSERT_TRUE(position.made) << expected.mode;
        EXPECT_EQ(0.0f, position.pan) << expected.mode;
        EXPECT_EQ(expected.tilt, position.tilt) << expected.mode;
        EXPECT_EQ(expected.zoom, position.zoom) << expected.mode;
    }
}

TEST_F(BinaryContractTest, AFrameGoesInAndComesOutDewarped) {
    Dewarper* dewarper = CreateSentry360();
    ASSERT_NE(nullptr, dewarper);
    unsigned char* input = nullptr;
    unsigned int size = 0;
    int format = -1;
    ASSERT_TRUE(dewarper->GetImageInputBuffer(64, 64, &input, &size, &format));
    EXPECT_EQ(3, format);
    ASSERT_EQ(64u * 64u * 3u, size);
    memset(input, 180, size);
    int width = 41;
    int height = 21;
    unsigned char* output = nullptr;
    ASSERT_TRUE(dewarper->GetImageOutputBuffer(&width, &height, &output, &size, &format));
    EXPECT_EQ(48, width);
    EXPECT_EQ(22, height);
    EXPECT_EQ(48u * 22u * 3u, size);
    EXPECT_EQ(180, output[(11 * 48 + 24) * 3]);
    deleteDewarper(dewarper);
}

// This binary's ctest runs with no vendor library on the loader's search path.
TEST_F(BinaryContractTest, WithoutTheirLibrariesTheVendorKindsAreListedButNotLoaded) {
    Registry* registry = getRegister();
    CameraRecord const record{};
    for (int mode : {1, 3, 7, 9}) {
        EXPECT_STRNE("", registry->GetName(mode)) << mode;
        EXPECT_FALSE(dewarperLoaded(mode)) << mode;
        EXPECT_FALSE(registry->IsLoaded(mode)) << mode;
        EXPECT_EQ(nullptr, createDewarper(mode, record)) << mode;
    }
    EXPECT_EQ(7, registry->GetModeByName("Samsung"));
    EXPECT_TRUE(dewarperLoaded(SENTRY360));
    EXPECT_TRUE(dewarperLoaded(8));
    Dewarper* dewarper = CreateSentry360();
    ASSERT_NE(nullptr, dewarper);
    EXPECT_TRUE(dewarper->Check());
    deleteDewarper(dewarper);
}

TEST_F(BinaryContractTest, WithoutItsLibraryAVendorDewarperMadeBySlotCreateNeverReachesIt) {
    CameraRecord const record{};
    for (int mode : {1, 3, 7, 9}) {
        Dewarper* dewarper = getRegister()->Create(mode, record);
        ASSERT_NE(nullptr, dewarper) << mode;
        EXPECT_FALSE(dewarper->Check()) << mode;
        unsigned char* buffer = nullptr;
        unsigned int size = 0;
        int format = -1;
        EXPECT_FALSE(dewarper->GetImageInputBuffer(64, 64, &buffer, &size, &format)) << mode;
        int width = 64;
        int height = 64;
        EXPECT_FALSE(dewarper->GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
        EXPECT_EQ(nullptr, buffer) << mode;
        dewarper->SetPosition(10, 10, 10);
        dewarper->SetSubMode(2);
        deleteDewarper(dewarper);
    }
}

TEST_F(BinaryContractTest, WithoutTheirLibrariesTheLensKindsListNoLensAndTryAgainNextTime) {
    Registry* registry = getRegister();
    char buffer[8] = "intact";
    for (int mode : {1, 3, 7}) {
        EXPECT_EQ(0, registry->GetLens(mode, 0, buffer, sizeof buffer)) << mode;
        EXPECT_EQ(0, registry->GetLens(mode, 0, buffer, sizeof buffer)) << mode;
    }
    EXPECT_STREQ("intact", buffer);
    EXPECT_EQ(0, registry->GetDefaultLens(7, "Samsung", "SNF-7010"));
}

}  // namespace
