#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "GeoFisheyeAdapter.h"
#include "GeoFisheyeDLL.h"
#include "GeoFisheyeLibrary.h"
#include "geofisheye_standin.h"

namespace {

namespace standin = geofisheye_standin;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class GeoFisheyeDllTest : public ::testing::Test {
protected:
    void SetUp() override {
        standin::Reset();
        gFisheyeContext = nullptr;
        ASSERT_TRUE(GeoFisheyeLibraryInstance.Acquire());
    }

    void TearDown() override {
        GeoFisheyeLibraryInstance.Release();
        standin::Reset();
        gFisheyeContext = nullptr;
    }
};

TEST_F(GeoFisheyeDllTest, CreateMakesAnAdapterWithItsContextWhileTheLibraryIsOpen) {
    IFishEye* const made = IFishEye_Create();
    ASSERT_NE(nullptr, made);
    EXPECT_NE(nullptr, dynamic_cast<GeoFisheyeAdapter*>(made));
    EXPECT_THAT(standin::CallNames(), ElementsAre("init"));
    EXPECT_TRUE(IFishEye_Release(made));
}

TEST_F(GeoFisheyeDllTest, CreateGivesNullWithTheLibraryClosedAndCallsNothing) {
    GeoFisheyeLibraryInstance.Release();
    EXPECT_EQ(nullptr, IFishEye_Create());
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeDllTest, ReleaseAcceptsNullAndAnswersTrue) {
    EXPECT_TRUE(IFishEye_Release(nullptr));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeDllTest, ReleaseDeletesTheAdapterWithItsObjectsAndTheContext) {
    IFishEye* const made = IFishEye_Create();
    ASSERT_NE(nullptr, made);
    ASSERT_EQ(0, made->GvFE_Initialize(0, 4, 2, 8, 4, FE_FORMAT_RGB24));
    standin::ForgetCalls();
    EXPECT_TRUE(IFishEye_Release(made));
    EXPECT_THAT(standin::CallNames(), ElementsAre("release_object", "shutdown"));
    EXPECT_EQ(0, standin::LiveObjects());
    EXPECT_EQ(0, standin::LiveContexts());
}

}  // namespace
