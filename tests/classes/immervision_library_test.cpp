#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "ImmervisionLibrary.h"
#include "imv1_standin.h"

namespace {

using Names = std::vector<std::string>;

TEST(ImmervisionFunctions, BindsEveryEntryPointOfTheLibraryByItsMangledName) {
    ASSERT_FALSE(ImmervisionLibraryInstance.IsOpen());
    ASSERT_TRUE(ImmervisionLibraryInstance.Acquire());
    ImmervisionFunctions const& api = ImmervisionLibraryInstance.Api();
    EXPECT_NE(nullptr, api.Construct);
    EXPECT_NE(nullptr, api.Destroy);
    EXPECT_NE(nullptr, api.StaticGetLensDescription);
    EXPECT_NE(nullptr, api.StaticGetLensDescriptionCount);
    EXPECT_NE(nullptr, api.SetLens);
    EXPECT_NE(nullptr, api.SetVideoParams);
    EXPECT_NE(nullptr, api.SetZoomLimits);
    EXPECT_NE(nullptr, api.SetPosition);
    EXPECT_NE(nullptr, api.Update);
    EXPECT_NE(nullptr, api.GetErrorString);
    ImmervisionLibraryInstance.Release();
    EXPECT_FALSE(ImmervisionLibraryInstance.IsOpen());
    EXPECT_EQ(nullptr, ImmervisionLibraryInstance.Api().SetLens);
}

TEST(ImmervisionFunctions, TheLibraryIsFoundByItsSoname) {
    EXPECT_STREQ("libIMV1.so.2", ImmervisionFunctions::FILE_NAME);
    EXPECT_FALSE(ImmervisionLibraryInstance.Acquire("libIMV1.so.1"));
    EXPECT_FALSE(ImmervisionLibraryInstance.IsOpen());
}

TEST(ImmervisionFunctions, MembersCalledWithTheObjectFirstActOnThatObject) {
    ASSERT_TRUE(ImmervisionLibraryInstance.Acquire());
    imv1_standin::Reset();
    ImmervisionFunctions const& api = ImmervisionLibraryInstance.Api();
    void* const storage = ::operator new(sizeof(IMV_CameraInterface));
    auto* const camera = static_cast<IMV_CameraInterface*>(storage);
    int const live = imv1_standin::LiveObjects();
    api.Construct(camera);
    EXPECT_EQ(live + 1, imv1_standin::LiveObjects());
    EXPECT_EQ(0, api.SetZoomLimits(camera, 30.0f, 120.0f));
    float pan = 1.0f;
    float tilt = 2.0f;
    float zoom = 3.0f;
    imv1_standin::WriteBackPosition(4.0f, 5.0f, 6.0f);
    EXPECT_EQ(0, api.SetPosition(camera, &pan, &tilt, &zoom, 7, 8));
    EXPECT_STREQ("stand-in error 12", api.GetErrorString(camera, 12));
    api.Destroy(camera);
    EXPECT_EQ(live, imv1_standin::LiveObjects());
    ASSERT_EQ((Names{"IMV_CameraInterface", "SetZoomLimits", "SetPosition", "GetErrorString",
                     "~IMV_CameraInterface"}),
              imv1_standin::CallNames());
    for (imv1_standin::Call const& call : imv1_standin::Calls()) {
        EXPECT_EQ(camera, call.object) << call.function;
    }
    imv1_standin::Call const& limits = imv1_standin::Calls()[1];
    EXPECT_EQ(30.0f, limits.min);
    EXPECT_EQ(120.0f, limits.max);
    imv1_standin::Call const& position = imv1_standin::Calls()[2];
    EXPECT_EQ(1.0f, position.pan);
    EXPECT_EQ(2.0f, position.tilt);
    EXPECT_EQ(3.0f, position.zoom);
    EXPECT_EQ(7u, position.fourth);
    EXPECT_EQ(8u, position.fifth);
    EXPECT_EQ(4.0f, pan);
    EXPECT_EQ(5.0f, tilt);
    EXPECT_EQ(6.0f, zoom);
    ::operator delete(storage);
    imv1_standin::Reset();
    ImmervisionLibraryInstance.Release();
}

TEST(ImmervisionFunctions, StaticListFunctionsTakeNoObject) {
    ASSERT_TRUE(ImmervisionLibraryInstance.Acquire());
    imv1_standin::Reset();
    ImmervisionFunctions const& api = ImmervisionLibraryInstance.Api();
    EXPECT_EQ(6, api.StaticGetLensDescriptionCount());
    IMV_LensDescription const* const list = api.StaticGetLensDescription();
    ASSERT_NE(nullptr, list);
    EXPECT_STREQ("B5SST", list[2].RPLNumber);
    EXPECT_EQ(nullptr, list[1].RPLNumber);
    ImmervisionLibraryInstance.Release();
}

}  // namespace
