#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "GeoFisheyeAdapter.h"
#include "GeoFisheyeLibrary.h"
#include "geofisheye_standin.h"

namespace {

namespace standin = geofisheye_standin;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr int CHANNEL = 5;
constexpr int SOURCE_WIDTH = 4;
constexpr int SOURCE_HEIGHT = 2;
constexpr int OUTPUT_WIDTH = 8;
constexpr int OUTPUT_HEIGHT = 4;
// The wall's pan goes through a division by 1800 and a product by 180 in single precision.
constexpr float WALL_PAN_TOLERANCE = 1e-4f;

// Every source pixel tells its place: red counts columns, green rows, blue is fixed.
std::vector<unsigned char> NumberedPicture(int width, int height) {
    std::vector<unsigned char> picture(size_t(width) * size_t(height) * 3u);
    for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
            unsigned char* const pixel = &picture[size_t((y * width + x) * 3)];
            pixel[0] = static_cast<unsigned char>(10 * x + 1);
            pixel[1] = static_cast<unsigned char>(10 * y + 2);
            pixel[2] = 77;
        }
    }
    return picture;
}

FE_CurPosParams Position(unsigned short view_mode, unsigned short mount_type) {
    FE_CurPosParams params{};
    params.viewMode = view_mode;
    params.mountType = mount_type;
    params.centerX = 320;
    params.centerY = 240;
    params.radius = 230;
    params.radius2 = 231;
    for (int frame = 0; frame < 4; ++frame) {
        params.frame[frame].pan = short(100 * (frame + 1));
        params.frame[frame].tilt = short(-50 * (frame + 1));
        params.frame[frame].zoom = short(160 * (frame + 1));
        params.frame[frame].reserved = 9;
    }
    return params;
}

standin::ObjectState StateOf(geo_fisheye const* object) {
    standin::ObjectState state{};
    EXPECT_TRUE(standin::StateOf(object, state));
    return state;
}

float Word(geo_fisheye const* object, int index) {
    return StateOf(object).controller.words[index].value;
}

int IntegerWord(geo_fisheye const* object, int index) {
    return StateOf(object).controller.words[index].integer;
}

class GeoFisheyeAdapterTest : public ::testing::Test {
protected:
    void SetUp() override {
        standin::Reset();
        gFisheyeContext = nullptr;
        ASSERT_TRUE(GeoFisheyeLibraryInstance.Acquire());
    }

    void TearDown() override {
        adapter.reset();
        GeoFisheyeLibraryInstance.Release();
        standin::Reset();
        gFisheyeContext = nullptr;
    }

    GeoFisheyeAdapter& Adapter() {
        if (!adapter) {
            adapter = std::make_unique<GeoFisheyeAdapter>();
        }
        return *adapter;
    }

    // A channel with a 4 x 2 source and an 8 x 4 output, the calls forgotten.
    geo_fisheye* Initialised(int channel = CHANNEL) {
        EXPECT_EQ(channel, Adapter().GvFE_Initialize(channel, SOURCE_WIDTH, SOURCE_HEIGHT,
                                                     OUTPUT_WIDTH, OUTPUT_HEIGHT, FE_FORMAT_RGB24));
        standin::ForgetCalls();
        return Adapter().find_fisheye_object(channel);
    }

    // A channel whose object shows the given SDK view on the given mount.
    geo_fisheye* Showing(unsigned short view_mode, unsigned short mount_type) {
        geo_fisheye* const object = Initialised();
        FE_CurPosParams params = Position(view_mode, mount_type);
        EXPECT_EQ(CHANNEL, Adapter().GvFESetPosition(CHANNEL, &params));
        standin::ForgetCalls();
        return object;
    }

    std::unique_ptr<GeoFisheyeAdapter> adapter;
};

TEST_F(GeoFisheyeAdapterTest, FirstAdapterMakesTheContextWhileTheGlobalIsNull) {
    Adapter();
    EXPECT_THAT(standin::CallNames(), ElementsAre("init"));
    ASSERT_NE(nullptr, gFisheyeContext);
    EXPECT_EQ(gFisheyeContext, standin::CallsOf("init")[0].pointer);
    EXPECT_EQ(1, standin::LiveContexts());
}

TEST_F(GeoFisheyeAdapterTest, ASecondAdapterSharesTheContextWithoutAnotherInit) {
    Adapter();
    geo_fisheye_context* const first = gFisheyeContext;
    GeoFisheyeAdapter const second;
    EXPECT_EQ(1u, standin::CallsOf("init").size());
    EXPECT_EQ(first, gFisheyeContext);
}

TEST_F(GeoFisheyeAdapterTest, AFailedContextIsReportedOnStandardOutputAndTheAdapterGoesOn) {
    standin::Fail("init");
    ::testing::internal::CaptureStdout();
    Adapter();
    EXPECT_EQ("failed to init fisheye context\n", ::testing::internal::GetCapturedStdout());
    EXPECT_EQ(nullptr, gFisheyeContext);
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(0, 4, 2, 8, 4, FE_FORMAT_RGB24));
    EXPECT_THAT(standin::CallNames(), ElementsAre("init", "create_object", "init_object"));
}

TEST_F(GeoFisheyeAdapterTest, DestructorReleasesEveryObjectAndShutsTheContextDown) {
    Adapter().GvFE_Initialize(1, 4, 2, 8, 4, FE_FORMAT_RGB24);
    Adapter().GvFE_Initialize(2, 4, 2, 8, 4, FE_FORMAT_RGB24);
    std::vector<geo_fisheye*> const objects = standin::Objects();
    ASSERT_EQ(2u, objects.size());
    standin::ForgetCalls();
    adapter.reset();
    EXPECT_THAT(standin::CallNames(), ElementsAre("release_object", "release_object", "shutdown"));
    EXPECT_EQ(objects[0], standin::CallsOf("release_object")[0].object);
    EXPECT_EQ(objects[1], standin::CallsOf("release_object")[1].object);
    EXPECT_EQ(0, standin::LiveObjects());
    EXPECT_EQ(0, standin::LiveContexts());
    EXPECT_EQ(nullptr, gFisheyeContext);
}

TEST_F(GeoFisheyeAdapterTest, ShutdownRunsInEveryDestructorEvenWithoutAContext) {
    standin::Fail("init");
    ::testing::internal::CaptureStdout();
    Adapter();
    ::testing::internal::GetCapturedStdout();
    adapter.reset();
    EXPECT_THAT(standin::CallNames(), ElementsAre("init", "shutdown"));
    EXPECT_EQ(nullptr, standin::CallsOf("shutdown")[0].pointer);
}

TEST_F(GeoFisheyeAdapterTest, DestroyingOneAdapterShutsTheContextDownForAll) {
    auto first = std::make_unique<GeoFisheyeAdapter>();
    geo_fisheye* const object = Initialised();
    ASSERT_NE(nullptr, object);
    first.reset();
    EXPECT_EQ(nullptr, gFisheyeContext);
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4);
    EXPECT_EQ(-1, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), SOURCE_WIDTH,
                                            SOURCE_HEIGHT, FE_FORMAT_RGB24, false));
    standin::ForgetCalls();
    GeoFisheyeAdapter const third;
    EXPECT_THAT(standin::CallNames(), ElementsAre("init"));
    EXPECT_NE(nullptr, gFisheyeContext);
}

TEST_F(GeoFisheyeAdapterTest, ANewAdapterMakesNoContextWhileTheLibraryLeavesTheGlobalSet) {
    Adapter();
    standin::Fail("shutdown");
    adapter.reset();
    ASSERT_NE(nullptr, gFisheyeContext);
    standin::ForgetCalls();
    Adapter();
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, ReleaseFreesTheObjectsAndKeepsTheContext) {
    geo_fisheye* const object = Initialised();
    Adapter().release();
    EXPECT_THAT(standin::CallNames(), ElementsAre("release_object"));
    EXPECT_EQ(object, standin::CallsOf("release_object")[0].object);
    EXPECT_EQ(nullptr, Adapter().find_fisheye_object(CHANNEL));
    EXPECT_EQ(0, standin::LiveObjects());
    EXPECT_EQ(1, standin::LiveContexts());
    EXPECT_NE(nullptr, gFisheyeContext);
}

TEST_F(GeoFisheyeAdapterTest, WithTheLibraryClosedNothingIsCalled) {
    GeoFisheyeLibraryInstance.Release();
    ASSERT_FALSE(GeoFisheyeLibraryInstance.IsOpen());
    Adapter();
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(0, 4, 2, 8, 4, FE_FORMAT_RGB24));
    EXPECT_EQ(-1, Adapter().SetAbsolutePTZ(0, 1, 2, 3, 1));
    EXPECT_EQ(-1, Adapter().GvFE_Close(0));
    adapter.reset();
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, ClosingTheLibraryUnderAnAdapterForgetsItsChannelsWithoutCalls) {
    Initialised();
    GeoFisheyeLibraryInstance.Release();
    EXPECT_EQ(nullptr, Adapter().find_fisheye_object(CHANNEL));
    EXPECT_EQ(CHANNEL, Adapter().GvFE_Close(CHANNEL));
    EXPECT_EQ(-1, Adapter().GvFE_Close(CHANNEL));
    adapter.reset();
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, InitializeRefusesEveryFormatButOneBeforeTouchingTheLibrary) {
    Adapter();
    standin::ForgetCalls();
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(0, 4, 2, 8, 4, static_cast<FORMAT>(2)));
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(0, 4, 2, 8, 4, static_cast<FORMAT>(0)));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, InitializeMakesTheObjectGivesItTheSourceAndBoundsTheOutput) {
    Adapter();
    standin::ForgetCalls();
    EXPECT_EQ(CHANNEL, Adapter().GvFE_Initialize(CHANNEL, 640, 480, 320, 240, FE_FORMAT_RGB24));
    EXPECT_THAT(standin::CallNames(),
                ElementsAre("create_object", "init_object", "update_object_bounds"));
    geo_fisheye* const object = Adapter().find_fisheye_object(CHANNEL);
    ASSERT_NE(nullptr, object);
    standin::Call const init = standin::CallsOf("init_object")[0];
    EXPECT_EQ(object, init.object);
    EXPECT_EQ(gFisheyeContext, init.pointer);
    EXPECT_THAT(init.numbers, ElementsAre(640.0, 480.0, 1.0, 1.0));
    standin::Call const bounds = standin::CallsOf("update_object_bounds")[0];
    EXPECT_EQ(object, bounds.object);
    EXPECT_THAT(bounds.numbers, ElementsAre(0.0, 0.0, 320.0, 240.0));
    EXPECT_EQ(320.0f, object->output_width);
    EXPECT_EQ(240.0f, object->output_height);
}

TEST_F(GeoFisheyeAdapterTest, InitializeOnAKnownChannelReusesItsObject) {
    geo_fisheye* const object = Initialised();
    EXPECT_EQ(CHANNEL, Adapter().GvFE_Initialize(CHANNEL, 64, 32, 16, 8, FE_FORMAT_RGB24));
    EXPECT_THAT(standin::CallNames(), ElementsAre("init_object", "update_object_bounds"));
    EXPECT_EQ(object, Adapter().find_fisheye_object(CHANNEL));
    EXPECT_EQ(1, standin::LiveObjects());
    EXPECT_EQ(64, StateOf(object).source.width);
}

TEST_F(GeoFisheyeAdapterTest, InitializeFailsWhenNoObjectCanBeMade) {
    Adapter();
    standin::Fail("create_object");
    standin::ForgetCalls();
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(CHANNEL, 4, 2, 8, 4, FE_FORMAT_RGB24));
    EXPECT_THAT(standin::CallNames(), ElementsAre("create_object"));
    EXPECT_EQ(nullptr, Adapter().find_fisheye_object(CHANNEL));
}

TEST_F(GeoFisheyeAdapterTest, InitializeFailsWhenTheObjectRefusesItsSourceAndKeepsTheObject) {
    Adapter();
    standin::Fail("init_object");
    standin::ForgetCalls();
    EXPECT_EQ(-1, Adapter().GvFE_Initialize(CHANNEL, 4, 2, 8, 4, FE_FORMAT_RGB24));
    EXPECT_THAT(standin::CallNames(), ElementsAre("create_object", "init_object"));
    EXPECT_NE(nullptr, Adapter().find_fisheye_object(CHANNEL));
}

TEST_F(GeoFisheyeAdapterTest, PrepareMakesTheObjectOfAChannelOnceAndThenFindsIt) {
    Adapter();
    standin::ForgetCalls();
    EXPECT_EQ(nullptr, Adapter().find_fisheye_object(3));
    geo_fisheye* const made = Adapter().prepare_fisheye_object(3);
    ASSERT_NE(nullptr, made);
    EXPECT_EQ(made, Adapter().prepare_fisheye_object(3));
    EXPECT_EQ(made, Adapter().find_fisheye_object(3));
    EXPECT_THAT(standin::CallNames(), ElementsAre("create_object"));
}

TEST_F(GeoFisheyeAdapterTest, VideoInputFeedsThePictureAndRendersAtTheObjectsSize) {
    geo_fisheye* const object = Initialised();
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4, 0xEE);
    EXPECT_EQ(CHANNEL,
              Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), SOURCE_WIDTH,
                                        SOURCE_HEIGHT, FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallNames(), ElementsAre("update_object_image", "create_render_result",
                                                  "release_render_result"));
    EXPECT_EQ(picture.data(), standin::CallsOf("update_object_image")[0].pointer);
    standin::Call const render = standin::CallsOf("create_render_result")[0];
    EXPECT_EQ(object, render.object);
    EXPECT_EQ(gFisheyeContext, render.pointer);
    EXPECT_THAT(render.numbers, ElementsAre(8.0, 4.0));
    for (int y = 0; y < OUTPUT_HEIGHT; ++y) {
        for (int x = 0; x < OUTPUT_WIDTH; ++x) {
            unsigned char const* const pixel = &output[size_t((y * OUTPUT_WIDTH + x) * 4)];
            EXPECT_EQ(10 * (x / 2) + 1, pixel[0]) << x << "," << y;
            EXPECT_EQ(10 * (y / 2) + 2, pixel[1]) << x << "," << y;
            EXPECT_EQ(77, pixel[2]);
            EXPECT_EQ(255, pixel[3]);
        }
    }
    EXPECT_EQ(0, standin::LiveResults());
}

TEST_F(GeoFisheyeAdapterTest, VideoInputCopiesTheRenderedSizeWhateverSizeItIsGiven) {
    Initialised();
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4, 0);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), 1, 1,
                                                 FE_FORMAT_RGB24, false));
    EXPECT_EQ(255, output.back());
    EXPECT_EQ(10 * 3 + 1, output[output.size() - 4]);
}

TEST_F(GeoFisheyeAdapterTest, VideoInputRendersTheBoundsTruncatedToWholePixels) {
    geo_fisheye* const object = Initialised();
    GeoFisheyeLibraryInstance.Api().geo_fisheye_update_object_bounds(object, 0.0f, 0.0f, 8.9f,
                                                                     3.99f);
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(8 * 3 * 4);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), 4, 2,
                                                 FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallsOf("create_render_result")[0].numbers, ElementsAre(8.0, 3.0));
}

TEST_F(GeoFisheyeAdapterTest, VideoInputWithANullOutputOnlyFeedsThePicture) {
    geo_fisheye* const object = Initialised();
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), nullptr, SOURCE_WIDTH,
                                                 SOURCE_HEIGHT, FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallNames(), ElementsAre("update_object_image"));
    EXPECT_EQ(picture, StateOf(object).image);
}

TEST_F(GeoFisheyeAdapterTest, VideoInputOnAnUnknownChannelFailsWithoutACall) {
    Initialised();
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4);
    EXPECT_EQ(-1, Adapter().GvFE_VideoInput(CHANNEL + 1, picture.data(), output.data(), 4, 2,
                                            FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, VideoInputFailsWhenThePictureIsRefused) {
    Initialised();
    standin::Fail("update_object_image");
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4);
    EXPECT_EQ(-1, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), 4, 2,
                                            FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallNames(), ElementsAre("update_object_image"));
}

TEST_F(GeoFisheyeAdapterTest, VideoInputFailsWhenNothingIsRenderedAndLeavesTheOutput) {
    Initialised();
    standin::Fail("create_render_result");
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    std::vector<unsigned char> output(OUTPUT_WIDTH * OUTPUT_HEIGHT * 4, 0xEE);
    EXPECT_EQ(-1, Adapter().GvFE_VideoInput(CHANNEL, picture.data(), output.data(), 4, 2,
                                            FE_FORMAT_RGB24, false));
    EXPECT_THAT(standin::CallNames(), ElementsAre("update_object_image", "create_render_result"));
    EXPECT_EQ(std::vector<unsigned char>(output.size(), 0xEE), output);
}

TEST_F(GeoFisheyeAdapterTest, CloseReleasesTheObjectAndForgetsTheChannel) {
    geo_fisheye* const object = Initialised();
    EXPECT_EQ(CHANNEL, Adapter().GvFE_Close(CHANNEL));
    EXPECT_THAT(standin::CallNames(), ElementsAre("release_object"));
    EXPECT_EQ(object, standin::CallsOf("release_object")[0].object);
    EXPECT_EQ(nullptr, Adapter().find_fisheye_object(CHANNEL));
    EXPECT_EQ(0, standin::LiveObjects());
    standin::ForgetCalls();
    EXPECT_EQ(-1, Adapter().GvFE_Close(CHANNEL));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, SetPositionWritesTheViewTheMountAndTheCircle) {
    geo_fisheye* const object = Initialised();
    FE_CurPosParams params = Position(8, 1);
    EXPECT_EQ(CHANNEL, Adapter().GvFESetPosition(CHANNEL, &params));
    EXPECT_THAT(standin::CallNames(),
                ElementsAre("get_object_controller_info", "set_object_controller_info"));
    std::vector<double> const written = standin::CallsOf("set_object_controller_info")[0].numbers;
    ASSERT_EQ(31u, written.size());
    EXPECT_EQ(320.0, written[GEO_FISHEYE_SOURCE_CENTER_X]);
    EXPECT_EQ(240.0, written[GEO_FISHEYE_SOURCE_CENTER_Y]);
    EXPECT_EQ(230.0, written[GEO_FISHEYE_SOURCE_RADIUS]);
    EXPECT_EQ(3.0, written[GEO_FISHEYE_VIEW_MODE]);
    EXPECT_EQ(1.0, written[GEO_FISHEYE_MOUNT_TYPE]);
    EXPECT_EQ(3, object->view_mode);
    EXPECT_EQ(1, object->mount_type);
}

TEST_F(GeoFisheyeAdapterTest, SetPositionTakesEachViewModeToItsInternalView) {
    geo_fisheye* const object = Initialised();
    int const expected[][2] = {{1, 0}, {2, 1}, {4, 2}, {8, 3}};
    for (auto const& pair : expected) {
        FE_CurPosParams params = Position(static_cast<unsigned short>(pair[0]), 2);
        EXPECT_EQ(CHANNEL, Adapter().GvFESetPosition(CHANNEL, &params));
        EXPECT_EQ(pair[1], IntegerWord(object, GEO_FISHEYE_VIEW_MODE)) << pair[0];
        EXPECT_EQ(2, IntegerWord(object, GEO_FISHEYE_MOUNT_TYPE));
    }
}

TEST_F(GeoFisheyeAdapterTest, SetPositionRefusesViewModeThreeAndMountThreeWithoutACall) {
    Initialised();
    FE_CurPosParams view_three = Position(3, 0);
    FE_CurPosParams mount_three = Position(8, 3);
    FE_CurPosParams valid = Position(8, 0);
    EXPECT_EQ(-1, Adapter().GvFESetPosition(CHANNEL, &view_three));
    EXPECT_EQ(-1, Adapter().GvFESetPosition(CHANNEL, &mount_three));
    EXPECT_EQ(-1, Adapter().GvFESetPosition(CHANNEL, nullptr));
    EXPECT_EQ(-1, Adapter().GvFESetPosition(CHANNEL + 1, &valid));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, SetPositionWritesFourFramesIntoTheWordsOfInternalViewZero) {
    geo_fisheye* const object = Initialised();
    FE_CurPosParams params = Position(1, 0);
    params.frame[0] = {900, 300, 0, 0};
    Adapter().GvFESetPosition(CHANNEL, &params);
    EXPECT_FLOAT_EQ(-90.0f, Word(object, 0));
    EXPECT_FLOAT_EQ(30.0f, Word(object, 4));
    EXPECT_FLOAT_EQ(100.0f, Word(object, 8));
    for (int frame = 1; frame < 4; ++frame) {
        FE_FramePosition const& given = params.frame[frame];
        EXPECT_EQ(GeoFisheyeAdapter::calculatePanToInternal(given.pan, 0), Word(object, frame));
        EXPECT_EQ(GeoFisheyeAdapter::calculateTiltToInternal(given.tilt, 0),
                  Word(object, 4 + frame));
        EXPECT_EQ(GeoFisheyeAdapter::calculateZoomToInternal(given.zoom, 0),
                  Word(object, 8 + frame));
    }
    EXPECT_FLOAT_EQ(-40.0f, Word(object, 3));
    EXPECT_FLOAT_EQ(-20.0f, Word(object, 7));
    EXPECT_FLOAT_EQ(36.0f, Word(object, 11));
}

TEST_F(GeoFisheyeAdapterTest, SetPositionWritesThreeFramesIntoTheWordsOfInternalViewOne) {
    geo_fisheye* const object = Initialised();
    standin::ObjectState const before = StateOf(object);
    FE_CurPosParams params = Position(2, 1);
    Adapter().GvFESetPosition(CHANNEL, &params);
    for (int frame = 0; frame < 3; ++frame) {
        FE_FramePosition const& given = params.frame[frame];
        EXPECT_EQ(GeoFisheyeAdapter::calculatePanToInternal(given.pan, 1),
                  Word(object, 12 + frame));
        EXPECT_EQ(GeoFisheyeAdapter::calculateTiltToInternal(given.tilt, 1),
                  Word(object, 15 + frame));
        EXPECT_EQ(GeoFisheyeAdapter::calculateZoomToInternal(given.zoom, 1),
                  Word(object, 18 + frame));
    }
    // (100 + 900) / 1800 * 180 - 90 on a wall, in single precision
    EXPECT_NEAR(10.0f, Word(object, 12), WALL_PAN_TOLERANCE);
    EXPECT_FLOAT_EQ(5.0f, Word(object, 15));
    for (int word = 0; word < 12; ++word) {
        EXPECT_EQ(before.controller.words[word].value, Word(object, word)) << word;
    }
    EXPECT_EQ(before.controller.words[21].value, Word(object, 21));
    EXPECT_EQ(before.controller.words[22].value, Word(object, 22));
}

TEST_F(GeoFisheyeAdapterTest, SetPositionWritesTheFirstFrameIntoTheWordsOfInternalViewThree) {
    geo_fisheye* const object = Initialised();
    standin::ObjectState const before = StateOf(object);
    FE_CurPosParams params = Position(8, 2);
    Adapter().GvFESetPosition(CHANNEL, &params);
    EXPECT_FLOAT_EQ(-10.0f, Word(object, 22));
    EXPECT_FLOAT_EQ(-5.0f, Word(object, 23));
    EXPECT_FLOAT_EQ(84.0f, Word(object, 24));
    for (int word = 0; word < 21; ++word) {
        EXPECT_EQ(before.controller.words[word].value, Word(object, word)) << word;
    }
}

TEST_F(GeoFisheyeAdapterTest, SetPositionWritesNoFrameForInternalViewTwoAndKeepsOtherWords) {
    geo_fisheye* const object = Initialised();
    geo_fisheye_controller_info marked{};
    for (int word = 0; word < 29; ++word) {
        marked.words[word].value = float(word) + 0.5f;
    }
    marked.words[GEO_FISHEYE_VIEW_MODE].integer = 3;
    GeoFisheyeLibraryInstance.Api().geo_fisheye_set_object_controller_info(&marked, object);
    FE_CurPosParams params = Position(4, 0);
    Adapter().GvFESetPosition(CHANNEL, &params);
    for (int word = 0; word < 25; ++word) {
        EXPECT_EQ(float(word) + 0.5f, Word(object, word)) << word;
    }
    EXPECT_EQ(28.5f, Word(object, GEO_FISHEYE_RESERVED_28));
    EXPECT_EQ(2, IntegerWord(object, GEO_FISHEYE_VIEW_MODE));
}

TEST_F(GeoFisheyeAdapterTest, GetPositionReadsBackWhatSetPositionWroteUpToTruncation) {
    Initialised();
    unsigned short const modes[] = {1, 2, 4, 8};
    int const frames_of_mode[] = {4, 3, 0, 1};
    for (int mode_index = 0; mode_index < 4; ++mode_index) {
        for (unsigned short mount = 0; mount <= 2; ++mount) {
            FE_CurPosParams given = Position(modes[mode_index], mount);
            ASSERT_EQ(CHANNEL, Adapter().GvFESetPosition(CHANNEL, &given));
            FE_CurPosParams read{};
            ASSERT_EQ(CHANNEL, Adapter().GvFEGetPosition(CHANNEL, &read));
            EXPECT_EQ(given.viewMode, read.viewMode);
            EXPECT_EQ(mount, read.mountType);
            EXPECT_EQ(320, read.centerX);
            EXPECT_EQ(240, read.centerY);
            EXPECT_EQ(230, read.radius);
            EXPECT_EQ(230, read.radius2);
            for (int frame = 0; frame < 4; ++frame) {
                bool const present = frame < frames_of_mode[mode_index];
                FE_FramePosition const& back = read.frame[frame];
                FE_FramePosition const& sent = given.frame[frame];
                EXPECT_LE(std::abs(back.pan - (present ? sent.pan : 0)), 1) << frame;
                EXPECT_LE(std::abs(back.tilt - (present ? sent.tilt : 0)), 1) << frame;
                EXPECT_LE(std::abs(back.zoom - (present ? sent.zoom : 0)), 1) << frame;
                EXPECT_EQ(0, back.reserved);
            }
        }
    }
}

TEST_F(GeoFisheyeAdapterTest, GetPositionReadsEachLayoutThroughItsOwnRecordRead) {
    Showing(8, 0);
    FE_CurPosParams read{};
    EXPECT_EQ(CHANNEL, Adapter().GvFEGetPosition(CHANNEL, &read));
    EXPECT_THAT(standin::CallNames(),
                ElementsAre("get_object_controller_info", "get_object_controller_info",
                            "get_object_controller_info", "get_object_controller_info",
                            "get_object_controller_info"));
    EXPECT_EQ(100, read.frame[0].pan);
    EXPECT_EQ(-50, read.frame[0].tilt);
}

TEST_F(GeoFisheyeAdapterTest, GetPositionFailsForAViewOrMountTheSdkDoesNotKnow) {
    geo_fisheye* const object = Initialised();
    geo_fisheye_controller_info info{};
    info.words[GEO_FISHEYE_VIEW_MODE].integer = 7;
    GeoFisheyeLibraryInstance.Api().geo_fisheye_set_object_controller_info(&info, object);
    FE_CurPosParams read = Position(1, 1);
    EXPECT_EQ(-1, Adapter().GvFEGetPosition(CHANNEL, &read));
    EXPECT_EQ(1, read.viewMode);
    info.words[GEO_FISHEYE_VIEW_MODE].integer = 3;
    info.words[GEO_FISHEYE_MOUNT_TYPE].integer = 3;
    GeoFisheyeLibraryInstance.Api().geo_fisheye_set_object_controller_info(&info, object);
    EXPECT_EQ(-1, Adapter().GvFEGetPosition(CHANNEL, &read));
    EXPECT_EQ(1, read.mountType);
}

TEST_F(GeoFisheyeAdapterTest, GetPositionOfNoRecordOrAnUnknownChannelFails) {
    Initialised();
    FE_CurPosParams read{};
    EXPECT_EQ(-1, Adapter().GvFEGetPosition(CHANNEL, nullptr));
    EXPECT_EQ(-1, Adapter().GvFEGetPosition(CHANNEL + 1, &read));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, GetPtzValueFailsForALayoutThatTheViewDoesNotHave) {
    float pan = 0.0f;
    float tilt = 0.0f;
    float zoom = 0.0f;
    geo_fisheye* const object = Showing(1, 0);
    EXPECT_TRUE(GeoFisheyeAdapter::getPtzValue(3, object, pan, tilt, zoom));
    EXPECT_FLOAT_EQ(-40.0f, pan);
    EXPECT_FLOAT_EQ(-20.0f, tilt);
    EXPECT_FLOAT_EQ(36.0f, zoom);
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(4, object, pan, tilt, zoom));
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(-1, object, pan, tilt, zoom));
    Showing(2, 0);
    EXPECT_TRUE(GeoFisheyeAdapter::getPtzValue(2, object, pan, tilt, zoom));
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(3, object, pan, tilt, zoom));
    Showing(4, 0);
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(0, object, pan, tilt, zoom));
    Showing(8, 0);
    EXPECT_TRUE(GeoFisheyeAdapter::getPtzValue(0, object, pan, tilt, zoom));
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(1, object, pan, tilt, zoom));
    EXPECT_FALSE(GeoFisheyeAdapter::getPtzValue(0, nullptr, pan, tilt, zoom));
}

TEST_F(GeoFisheyeAdapterTest, SetAbsolutePtzMovesTheLayoutOfTheFrameByTheObjectsMount) {
    geo_fisheye* const object = Showing(1, 2);
    EXPECT_EQ(CHANNEL, Adapter().SetAbsolutePTZ(CHANNEL, 300, 450, 400, 3));
    EXPECT_THAT(standin::CallNames(), ElementsAre("set_object_pan_tilt", "set_object_zoom"));
    std::vector<double> const pan_tilt = standin::CallsOf("set_object_pan_tilt")[0].numbers;
    ASSERT_EQ(3u, pan_tilt.size());
    EXPECT_EQ(2.0, pan_tilt[0]);
    EXPECT_FLOAT_EQ(-30.0f, float(pan_tilt[1]));
    EXPECT_FLOAT_EQ(45.0f, float(pan_tilt[2]));
    std::vector<double> const zoom = standin::CallsOf("set_object_zoom")[0].numbers;
    ASSERT_EQ(2u, zoom.size());
    EXPECT_EQ(2.0, zoom[0]);
    EXPECT_FLOAT_EQ(60.0f, float(zoom[1]));
    EXPECT_EQ(object, standin::CallsOf("set_object_zoom")[0].object);
}

TEST_F(GeoFisheyeAdapterTest, SetAbsolutePtzOnAWallSpansNinetyDegreesEachWay) {
    Showing(8, 1);
    EXPECT_EQ(CHANNEL, Adapter().SetAbsolutePTZ(CHANNEL, 450, 300, 800, 1));
    std::vector<double> const pan_tilt = standin::CallsOf("set_object_pan_tilt")[0].numbers;
    EXPECT_EQ(0.0, pan_tilt[0]);
    EXPECT_FLOAT_EQ(45.0f, float(pan_tilt[1]));
    EXPECT_FLOAT_EQ(-30.0f, float(pan_tilt[2]));
    EXPECT_FLOAT_EQ(20.0f, float(standin::CallsOf("set_object_zoom")[0].numbers[1]));
}

TEST_F(GeoFisheyeAdapterTest, SetAbsolutePtzOnInternalViewTwoFailsForEveryFrame) {
    Showing(4, 0);
    for (unsigned short frame = 0; frame <= 8; ++frame) {
        EXPECT_EQ(-1, Adapter().SetAbsolutePTZ(CHANNEL, 10, 10, 10, frame)) << frame;
    }
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, SetAbsolutePtzFailsForAFrameOutsideTheTable) {
    Showing(1, 0);
    EXPECT_EQ(-1, Adapter().SetAbsolutePTZ(CHANNEL, 10, 10, 10, 2));
    Showing(2, 0);
    EXPECT_EQ(-1, Adapter().SetAbsolutePTZ(CHANNEL, 10, 10, 10, 3));
    EXPECT_EQ(CHANNEL, Adapter().SetAbsolutePTZ(CHANNEL, 10, 10, 10, 2));
    EXPECT_EQ(-1, Adapter().SetAbsolutePTZ(CHANNEL + 1, 10, 10, 10, 1));
}

TEST_F(GeoFisheyeAdapterTest, SetAbsolutePtzReachesTheObjectsPosition) {
    geo_fisheye* const object = Showing(8, 0);
    Adapter().SetAbsolutePTZ(CHANNEL, -250, 600, 200, 1);
    EXPECT_FLOAT_EQ(25.0f, Word(object, GEO_FISHEYE_VIEW3_PAN));
    EXPECT_FLOAT_EQ(60.0f, Word(object, GEO_FISHEYE_VIEW3_TILT));
    EXPECT_FLOAT_EQ(80.0f, Word(object, GEO_FISHEYE_VIEW3_ZOOM));
}

TEST_F(GeoFisheyeAdapterTest, PointDirectionIsConvertedByTheObjectsMount) {
    geo_fisheye* const object = Showing(8, 0);
    standin::AnswerPanTilt(-30.56f, 45.27f);
    short pan = 0;
    short tilt = 0;
    EXPECT_EQ(CHANNEL,
              Adapter().GetAbsolutePositionFromInputVideoPoint(CHANNEL, 17, 23, pan, tilt));
    EXPECT_EQ(305, pan);
    EXPECT_EQ(452, tilt);
    standin::Call const call = standin::CallsOf("calculate_object_pan_tilt")[0];
    EXPECT_EQ(object, call.object);
    EXPECT_THAT(call.numbers, ElementsAre(17.0, 23.0));
}

TEST_F(GeoFisheyeAdapterTest, PointDirectionOnAWallComesBackInTheSdksWallRange) {
    Showing(8, 1);
    standin::AnswerPanTilt(45.0f, 30.0f);
    short pan = 0;
    short tilt = 0;
    EXPECT_EQ(CHANNEL, Adapter().GetAbsolutePositionFromInputVideoPoint(CHANNEL, 1, 1, pan, tilt));
    EXPECT_EQ(450, pan);
    EXPECT_EQ(-300, tilt);
}

TEST_F(GeoFisheyeAdapterTest, PointDirectionOfAnUnknownChannelFailsAndWritesNothing) {
    Initialised();
    short pan = 7;
    short tilt = 8;
    EXPECT_EQ(-1, Adapter().GetAbsolutePositionFromInputVideoPoint(CHANNEL + 1, 1, 1, pan, tilt));
    EXPECT_EQ(7, pan);
    EXPECT_EQ(8, tilt);
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

FE_ViewParams View(unsigned short view_mode, unsigned short mount_type, unsigned short frame) {
    FE_ViewParams view{};
    view.viewMode = view_mode;
    view.mountType = mount_type;
    view.frame = frame;
    view.x = 10;
    view.y = 20;
    view.width = 300;
    view.height = 200;
    view.filter[0] = 0.25f;
    view.filter[1] = 0.75f;
    view.filter[2] = 1.5f;
    return view;
}

TEST_F(GeoFisheyeAdapterTest, ParamsUpdatedAppliesTheEventToTheLayoutUnderThePoint) {
    geo_fisheye* const object = Initialised();
    standin::AnswerLayoutId(2);
    FE_EventParams event{40, 50, 12, -7, 32767};
    FE_ViewParams view = View(1, 2, 1);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &view));
    EXPECT_THAT(
        standin::CallNames(),
        ElementsAre("update_object_bounds", "get_object_layout_id", "change_object_view_mode",
                    "change_object_mount_type", "pan_tilt_object", "zoom_object",
                    "change_object_source_filter", "change_object_source_filter"));
    EXPECT_THAT(standin::CallsOf("update_object_bounds")[0].numbers,
                ElementsAre(10.0, 20.0, 300.0, 200.0));
    EXPECT_THAT(standin::CallsOf("get_object_layout_id")[0].numbers, ElementsAre(40.0, 50.0));
    EXPECT_THAT(standin::CallsOf("change_object_view_mode")[0].numbers, ElementsAre(0.0));
    EXPECT_THAT(standin::CallsOf("change_object_mount_type")[0].numbers, ElementsAre(2.0));
    EXPECT_THAT(standin::CallsOf("pan_tilt_object")[0].numbers, ElementsAre(2.0, 12.0, -7.0));
    EXPECT_THAT(standin::CallsOf("zoom_object")[0].numbers, ElementsAre(2.0, 2.0));
    std::vector<standin::Call> const filters = standin::CallsOf("change_object_source_filter");
    EXPECT_THAT(filters[0].numbers, ElementsAre(0.0, 0.25, 0.75, 1.5));
    EXPECT_THAT(filters[1].numbers, ElementsAre(1.0, 0.5, 0.5, 0.5));
    EXPECT_EQ(0, object->view_mode);
    EXPECT_EQ(2, object->mount_type);
}

TEST_F(GeoFisheyeAdapterTest, ParamsUpdatedTurnsThePansSignOnMountZeroOnly) {
    Initialised();
    standin::AnswerLayoutId(0);
    FE_EventParams event{1, 1, 12, 5, 0};
    FE_ViewParams ceiling = View(8, 0, 1);
    Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &ceiling);
    FE_ViewParams wall = View(8, 1, 1);
    Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &wall);
    std::vector<standin::Call> const moves = standin::CallsOf("pan_tilt_object");
    ASSERT_EQ(2u, moves.size());
    EXPECT_THAT(moves[0].numbers, ElementsAre(0.0, -12.0, 5.0));
    EXPECT_THAT(moves[1].numbers, ElementsAre(0.0, 12.0, 5.0));
    EXPECT_THAT(standin::CallsOf("zoom_object")[0].numbers, ElementsAre(0.0, 1.0));
}

TEST_F(GeoFisheyeAdapterTest, ParamsUpdatedFallsBackOnTheFramesLayoutWhenNoneIsUnderThePoint) {
    Initialised();
    FE_EventParams event{1, 1, 3, 4, 0};
    FE_ViewParams view = View(1, 1, 4);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &view));
    EXPECT_EQ(3.0, standin::CallsOf("pan_tilt_object")[0].numbers[0]);
    EXPECT_EQ(3.0, standin::CallsOf("zoom_object")[0].numbers[0]);
}

TEST_F(GeoFisheyeAdapterTest, ParamsUpdatedWithNoLayoutAtAllChangesOnlyTheSettings) {
    Initialised();
    FE_EventParams event{1, 1, 3, 4, 0};
    FE_ViewParams view = View(4, 1, 1);
    EXPECT_EQ(CHANNEL, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &view));
    EXPECT_THAT(standin::CallNames(),
                ElementsAre("update_object_bounds", "get_object_layout_id",
                            "change_object_view_mode", "change_object_mount_type",
                            "change_object_source_filter", "change_object_source_filter"));
}

TEST_F(GeoFisheyeAdapterTest, ParamsUpdatedRefusesMissingRecordsAndUnknownViews) {
    Initialised();
    FE_EventParams event{1, 1, 3, 4, 0};
    FE_ViewParams view = View(8, 0, 1);
    FE_ViewParams view_three = View(3, 0, 1);
    FE_ViewParams mount_three = View(8, 3, 1);
    EXPECT_EQ(-1, Adapter().GvFE_ParamsUpdated(CHANNEL, nullptr, &view));
    EXPECT_EQ(-1, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, nullptr));
    EXPECT_EQ(-1, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &view_three));
    EXPECT_EQ(-1, Adapter().GvFE_ParamsUpdated(CHANNEL, &event, &mount_three));
    EXPECT_EQ(-1, Adapter().GvFE_ParamsUpdated(CHANNEL + 1, &event, &view));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeoFisheyeAdapterTest, SnapshotWithoutABufferGivesZeroAndRendersNothing) {
    Initialised();
    Fisheye_SnapShot snapshot{nullptr, -1, -1};
    EXPECT_EQ(0, Adapter().GvFEGPUSnapShotRawData(CHANNEL, snapshot));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
    EXPECT_EQ(-1, snapshot.width);
}

TEST_F(GeoFisheyeAdapterTest, SnapshotKeepsRedGreenAndBlueOfEachPixelAndTheSize) {
    Initialised();
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    Adapter().GvFE_VideoInput(CHANNEL, picture.data(), nullptr, 4, 2, FE_FORMAT_RGB24, false);
    standin::ForgetCalls();
    std::vector<unsigned char> buffer(OUTPUT_WIDTH * OUTPUT_HEIGHT * 3, 0xEE);
    Fisheye_SnapShot snapshot{buffer.data(), 0, 0};
    EXPECT_EQ(1, Adapter().GvFEGPUSnapShotRawData(CHANNEL, snapshot));
    EXPECT_THAT(standin::CallNames(), ElementsAre("create_render_result", "release_render_result"));
    EXPECT_EQ(OUTPUT_WIDTH, snapshot.width);
    EXPECT_EQ(OUTPUT_HEIGHT, snapshot.height);
    for (int y = 0; y < OUTPUT_HEIGHT; ++y) {
        for (int x = 0; x < OUTPUT_WIDTH; ++x) {
            unsigned char const* const pixel = &buffer[size_t((y * OUTPUT_WIDTH + x) * 3)];
            EXPECT_EQ(10 * (x / 2) + 1, pixel[0]);
            EXPECT_EQ(10 * (y / 2) + 2, pixel[1]);
            EXPECT_EQ(77, pixel[2]);
        }
    }
    EXPECT_EQ(0, standin::LiveResults());
}

TEST_F(GeoFisheyeAdapterTest, SnapshotFailsWhenNothingIsRenderedOrTheChannelIsUnknown) {
    Initialised();
    std::vector<unsigned char> buffer(OUTPUT_WIDTH * OUTPUT_HEIGHT * 3);
    Fisheye_SnapShot snapshot{buffer.data(), 0, 0};
    EXPECT_EQ(-1, Adapter().GvFEGPUSnapShotRawData(CHANNEL + 1, snapshot));
    standin::Fail("create_render_result");
    EXPECT_EQ(-1, Adapter().GvFEGPUSnapShotRawData(CHANNEL, snapshot));
    EXPECT_EQ(0, snapshot.width);
    EXPECT_THAT(standin::CallNames(), ElementsAre("create_render_result"));
}

TEST_F(GeoFisheyeAdapterTest, OperationsWithoutAnEffectGiveTheirFixedResults) {
    Initialised();
    CFishEyeCallBack callback;
    std::vector<unsigned char> picture = NumberedPicture(SOURCE_WIDTH, SOURCE_HEIGHT);
    FE_ViewParams view = View(8, 0, 1);
    EXPECT_EQ(0, Adapter().RegCallback(&callback));
    EXPECT_EQ(-1,
              Adapter().GvFEalignmentTool(CHANNEL, picture.data(), 4, 2, FE_FORMAT_RGB24, &view));
    EXPECT_EQ(CHANNEL, Adapter().SetInfo(CHANNEL, 1, 2, nullptr));
    EXPECT_EQ(9, Adapter().SetInfo(9, 1, 2, nullptr));
    EXPECT_TRUE(Adapter().GvFEGPUCreate(CHANNEL, nullptr));
    EXPECT_EQ(CHANNEL, Adapter().GvFEGPUDeviceReset(CHANNEL));
    EXPECT_EQ(9, Adapter().GvFEGPUDeviceReset(9));
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST(GeoFisheyeAdapter, ViewModesOneTwoFourEightAreInternalViewsZeroToThree) {
    int const pairs[][2] = {{1, 0}, {2, 1}, {4, 2}, {8, 3}};
    for (auto const& pair : pairs) {
        EXPECT_EQ(pair[1], GeoFisheyeAdapter::convertViewModeToInternal(pair[0]));
        EXPECT_EQ(pair[0], GeoFisheyeAdapter::convertViewModeFromInternal(pair[1]));
    }
    for (int invalid : {-1, 0, 3, 5, 6, 7, 9, 16}) {
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertViewModeToInternal(invalid)) << invalid;
    }
    for (int invalid : {-1, 4, 8}) {
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertViewModeFromInternal(invalid)) << invalid;
    }
}

TEST(GeoFisheyeAdapter, MountsZeroToTwoAreTheSameNumbersInside) {
    for (int mount = 0; mount <= 2; ++mount) {
        EXPECT_EQ(mount, GeoFisheyeAdapter::convertMountTypeToInternal(mount));
        EXPECT_EQ(mount, GeoFisheyeAdapter::convertMountTypeFromInternal(mount));
    }
    for (int invalid : {-1, 3, 100}) {
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertMountTypeToInternal(invalid));
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertMountTypeFromInternal(invalid));
    }
}

TEST(GeoFisheyeAdapter, FormatOneIsTheOnlyFormatBothWays) {
    EXPECT_EQ(1, GeoFisheyeAdapter::convertFormatToInternal(1));
    EXPECT_EQ(1, GeoFisheyeAdapter::convertFormatFromInternal(1));
    for (int invalid : {-1, 0, 2, 3}) {
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertFormatToInternal(invalid));
        EXPECT_EQ(-1, GeoFisheyeAdapter::convertFormatFromInternal(invalid));
    }
}

TEST(GeoFisheyeAdapter, FramesHaveLayoutsOnlyWhereTheTableSaysBothWays) {
    // {internal view, frame, layout}; every other pair fails.
    int const table[][3] = {{0, 1, 0}, {0, 3, 2}, {0, 4, 3}, {1, 1, 0}, {1, 2, 1}, {3, 1, 0}};
    for (int view = -1; view <= 4; ++view) {
        for (int frame = -1; frame <= 6; ++frame) {
            int expected = -1;
            for (auto const& row : table) {
                if (row[0] == view && row[1] == frame) {
                    expected = row[2];
                }
            }
            EXPECT_EQ(expected, GeoFisheyeAdapter::convertInternalLayoutIdFromSetFrame(view, frame))
                << view << "," << frame;
        }
        for (int layout = -1; layout <= 5; ++layout) {
            int expected = -1;
            for (auto const& row : table) {
                if (row[0] == view && row[2] == layout) {
                    expected = row[1];
                }
            }
            EXPECT_EQ(expected, GeoFisheyeAdapter::convertInternalLayoutIdToSetFrame(view, layout))
                << view << "," << layout;
        }
    }
}

TEST(GeoFisheyeAdapter, ZoomZeroIsAHundredDegreesAndEightHundredIsTwenty) {
    EXPECT_EQ(100.0f, GeoFisheyeAdapter::calculateZoomToInternal(0, 0));
    EXPECT_EQ(20.0f, GeoFisheyeAdapter::calculateZoomToInternal(800, 2));
    EXPECT_EQ(20.0f, GeoFisheyeAdapter::calculateZoomToInternal(800, 1));
    EXPECT_FLOAT_EQ(60.0f, GeoFisheyeAdapter::calculateZoomToInternal(400, 0));
    EXPECT_EQ(0, GeoFisheyeAdapter::calculateZoomFromInternal(100.0f, 1));
    EXPECT_EQ(800, GeoFisheyeAdapter::calculateZoomFromInternal(20.0f, 0));
}

TEST(GeoFisheyeAdapter, WallPanOfNineHundredIsNinetyDegreesAndCeilingTurnsItsSign) {
    EXPECT_EQ(90.0f, GeoFisheyeAdapter::calculatePanToInternal(900, 1));
    EXPECT_EQ(-90.0f, GeoFisheyeAdapter::calculatePanToInternal(-900, 1));
    EXPECT_EQ(0.0f, GeoFisheyeAdapter::calculatePanToInternal(0, 1));
    EXPECT_EQ(-90.0f, GeoFisheyeAdapter::calculatePanToInternal(900, 0));
    EXPECT_EQ(-90.0f, GeoFisheyeAdapter::calculatePanToInternal(900, 2));
    EXPECT_FLOAT_EQ(12.5f, GeoFisheyeAdapter::calculatePanToInternal(-125, 0));
}

TEST(GeoFisheyeAdapter, TiltIsTenthsOfADegreeUpOnCeilingAndFloorAndDownOnAWall) {
    EXPECT_FLOAT_EQ(45.0f, GeoFisheyeAdapter::calculateTiltToInternal(450, 0));
    EXPECT_FLOAT_EQ(45.0f, GeoFisheyeAdapter::calculateTiltToInternal(450, 2));
    EXPECT_FLOAT_EQ(-45.0f, GeoFisheyeAdapter::calculateTiltToInternal(450, 1));
    EXPECT_EQ(450, GeoFisheyeAdapter::calculateTiltFromInternal(45.0f, 0));
    EXPECT_EQ(-450, GeoFisheyeAdapter::calculateTiltFromInternal(45.0f, 1));
    EXPECT_EQ(-450, GeoFisheyeAdapter::calculatePanFromInternal(45.0f, 2));
    EXPECT_EQ(450, GeoFisheyeAdapter::calculatePanFromInternal(45.0f, 1));
    EXPECT_EQ(-900, GeoFisheyeAdapter::calculatePanFromInternal(-90.0f, 1));
}

TEST(GeoFisheyeAdapter, AMountBeyondTwoPassesValuesThroughUnscaled) {
    EXPECT_EQ(123.0f, GeoFisheyeAdapter::calculatePanToInternal(123, 3));
    EXPECT_EQ(-45.0f, GeoFisheyeAdapter::calculateTiltToInternal(-45, 7));
    EXPECT_EQ(640.0f, GeoFisheyeAdapter::calculateZoomToInternal(640, -1));
    EXPECT_EQ(45, GeoFisheyeAdapter::calculatePanFromInternal(45.7f, 3));
    EXPECT_EQ(-45, GeoFisheyeAdapter::calculateTiltFromInternal(-45.7f, 3));
    EXPECT_EQ(99, GeoFisheyeAdapter::calculateZoomFromInternal(99.9f, 3));
}

TEST(GeoFisheyeAdapter, FromConversionsTruncateTowardsZero) {
    EXPECT_EQ(305, GeoFisheyeAdapter::calculatePanFromInternal(-30.56f, 0));
    EXPECT_EQ(-305, GeoFisheyeAdapter::calculatePanFromInternal(30.56f, 0));
    EXPECT_EQ(123, GeoFisheyeAdapter::calculateTiltFromInternal(12.39f, 2));
    EXPECT_EQ(-123, GeoFisheyeAdapter::calculateTiltFromInternal(-12.39f, 2));
    EXPECT_EQ(1, GeoFisheyeAdapter::calculateZoomFromInternal(99.85f, 0));
}

TEST(GeoFisheyeAdapter, FromConversionsSaturateBeyondSixteenBitsAndTakeNaNAsZero) {
    EXPECT_EQ(std::numeric_limits<short>::max(),
              GeoFisheyeAdapter::calculatePanFromInternal(-5000.0f, 0));
    EXPECT_EQ(std::numeric_limits<short>::min(),
              GeoFisheyeAdapter::calculateTiltFromInternal(-1.0e9f, 0));
    EXPECT_EQ(0, GeoFisheyeAdapter::calculateZoomFromInternal(std::nanf(""), 0));
}

TEST(GeoFisheyeAdapter, PanTiltAndZoomComeBackFromInsideUpToTruncation) {
    for (int mount = 0; mount <= 3; ++mount) {
        for (int value = -1800; value <= 1800; ++value) {
            short const given = short(value);
            EXPECT_LE(std::abs(GeoFisheyeAdapter::calculatePanFromInternal(
                                   GeoFisheyeAdapter::calculatePanToInternal(given, mount), mount) -
                               value),
                      1)
                << mount << "," << value;
            EXPECT_LE(
                std::abs(GeoFisheyeAdapter::calculateTiltFromInternal(
                             GeoFisheyeAdapter::calculateTiltToInternal(given, mount), mount) -
                         value),
                1)
                << mount << "," << value;
            EXPECT_LE(
                std::abs(GeoFisheyeAdapter::calculateZoomFromInternal(
                             GeoFisheyeAdapter::calculateZoomToInternal(given, mount), mount) -
                         value),
                1)
                << mount << "," << value;
        }
    }
}

TEST(GeoFisheyeAdapter, AbsolutePtzConversionsComputeTheSameAsThePlainOnes) {
    for (int mount = -1; mount <= 3; ++mount) {
        for (int value = -900; value <= 900; value += 7) {
            short const given = short(value);
            float const inside = float(value) / 9.0f;
            EXPECT_EQ(GeoFisheyeAdapter::calculatePanToInternal(given, mount),
                      GeoFisheyeAdapter::calculatePanToInternalAbsolutePtz(given, mount));
            EXPECT_EQ(GeoFisheyeAdapter::calculateTiltToInternal(given, mount),
                      GeoFisheyeAdapter::calculateTiltToInternalAbsolutePtz(given, mount));
            EXPECT_EQ(GeoFisheyeAdapter::calculateZoomToInternal(given, mount),
                      GeoFisheyeAdapter::calculateZoomToInternalAbsolutePtz(given, mount));
            EXPECT_EQ(GeoFisheyeAdapter::calculatePanFromInternal(inside, mount),
                      GeoFisheyeAdapter::calculatePanFromInternalAbsolutePtz(inside, mount));
            EXPECT_EQ(GeoFisheyeAdapter::calculateTiltFromInternal(inside, mount),
                      GeoFisheyeAdapter::calculateTiltFromInternalAbsolutePtz(inside, mount));
            EXPECT_EQ(GeoFisheyeAdapter::calculateZoomFromInternal(inside, mount),
                      GeoFisheyeAdapter::calculateZoomFromInternalAbsolutePtz(inside, mount));
        }
    }
}

}  // namespace
