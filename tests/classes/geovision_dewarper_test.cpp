#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "GeoFisheyeAdapter.h"
#include "GeoFisheyeLibrary.h"
#include "GeovisionDewarper.h"
#include "geofisheye_standin.h"

namespace {

namespace standin = geofisheye_standin;
using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

/// The dewarper with its protected parts in reach.
class Probe : public GeovisionDewarper {
public:
    explicit Probe(int position) : GeovisionDewarper(Params(position)) {}
    static DewarpParams_t Params(int position) {
        DewarpParams_t params;
        params.position = position;
        return params;
    }
    using GeovisionDewarper::firstFrame;
    using GeovisionDewarper::fishEye;
    using GeovisionDewarper::fishEyeChannel;
    using GeovisionDewarper::GetInputFormatAndSize;
    using GeovisionDewarper::GetOutputFormatAndSize;
    using GeovisionDewarper::GetPanRange;
    using GeovisionDewarper::GetTiltRange;
    using GeovisionDewarper::GetZoomScaleModifier;
    using GeovisionDewarper::InvertPan;
    using GeovisionDewarper::InvertTilt;
    using GeovisionDewarper::LimitZoomRange;
};

struct Frame {
    bool done = false;
    int width = 0;
    int height = 0;
    unsigned int size = 0;
    int format = -1;
    std::vector<unsigned char> pixels;
};

struct Range {
    float min;
    float max;
    float step;
    bool wrap;
};

// The calls of one frame fed to the adapter.
std::vector<std::string> const FEED = {"update_object_image", "create_render_result",
                                       "release_render_result"};

std::vector<std::string> Joined(std::vector<std::vector<std::string>> const& parts) {
    std::vector<std::string> joined;
    for (auto const& part : parts) {
        joined.insert(joined.end(), part.begin(), part.end());
    }
    return joined;
}

class GeovisionDewarperTest : public ::testing::Test {
protected:
    void SetUp() override {
        standin::Reset();
        gFisheyeContext = nullptr;
        ASSERT_TRUE(GeoFisheyeLibraryInstance.Acquire());
    }

    void TearDown() override {
        dewarper.reset();
        GeoFisheyeLibraryInstance.Release();
        standin::Reset();
        gFisheyeContext = nullptr;
    }

    void Create(int position) { dewarper = std::make_unique<Probe>(position); }

    // Every input pixel tells its place: red counts columns, green rows, blue is fixed.
    void Feed(int width, int height) {
        unsigned char* input = nullptr;
        unsigned int size = 0;
        int format = -1;
        ASSERT_TRUE(dewarper->GetImageInputBuffer(width, height, &input, &size, &format));
        ASSERT_EQ(3, format);
        ASSERT_EQ(unsigned(width * height * 3), size);
        for (int y = 0; y < height; ++y) {
            for (int x = 0; x < width; ++x) {
                unsigned char* const pixel = input + (y * width + x) * 3;
                pixel[0] = static_cast<unsigned char>(x);
                pixel[1] = static_cast<unsigned char>(y);
                pixel[2] = 99;
            }
        }
    }

    Frame Output(int width, int height) {
        Frame frame;
        frame.width = width;
        frame.height = height;
        unsigned char* buffer = nullptr;
        frame.done = dewarper->GetImageOutputBuffer(&frame.width, &frame.height, &buffer,
                                                    &frame.size, &frame.format);
        if (frame.done) {
            frame.pixels.assign(buffer, buffer + frame.size);
        }
        return frame;
    }

    Frame RunFrame(int input_width, int input_height, int width, int height) {
        Feed(input_width, input_height);
        return Output(width, height);
    }

    // The controller record that the last setup wrote.
    std::vector<double> WrittenRecord() {
        std::vector<standin::Call> const writes = standin::CallsOf("set_object_controller_info");
        EXPECT_FALSE(writes.empty());
        return writes.empty() ? std::vector<double>() : writes.back().numbers;
    }

    float Pan() const { return Where()[0]; }
    float Tilt() const { return Where()[1]; }
    float Zoom() const { return Where()[2]; }

    std::vector<float> Where() const {
        float pan = 0.0f;
        float tilt = 0.0f;
        float zoom = 0.0f;
        dewarper->GetPosition(pan, tilt, zoom);
        return {pan, tilt, zoom};
    }

    Range PanRange() const {
        Range range{};
        dewarper->GetPanRange(range.min, range.max, range.step, range.wrap);
        return range;
    }

    Range TiltRange() const {
        Range range{};
        dewarper->GetTiltRange(range.min, range.max, range.step, range.wrap);
        return range;
    }

    std::unique_ptr<Probe> dewarper;
};

TEST_F(GeovisionDewarperTest, IsModeNineAndStartsAtZoomTwentyInSubModeOne) {
    Create(CEILING);
    EXPECT_EQ(9, dewarper->Mode());
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_THAT(Where(), ElementsAre(0.0f, 0.0f, 20.0f));
    EXPECT_EQ(nullptr, dewarper->fishEye);
    EXPECT_EQ(-1, dewarper->fishEyeChannel);
    EXPECT_TRUE(dewarper->firstFrame);
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeovisionDewarperTest, CheckMakesTheAdapterOnce) {
    Create(CEILING);
    EXPECT_TRUE(dewarper->Check());
    IFishEye* const made = dewarper->fishEye;
    EXPECT_NE(nullptr, made);
    EXPECT_TRUE(dewarper->Check());
    EXPECT_EQ(made, dewarper->fishEye);
    EXPECT_THAT(standin::CallNames(), ElementsAre("init"));
}

TEST_F(GeovisionDewarperTest, WithoutTheLibraryCheckIsFalseAndNothingIsCalled) {
    GeoFisheyeLibraryInstance.Release();
    Create(CEILING);
    EXPECT_FALSE(dewarper->Check());
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = -1;
    EXPECT_FALSE(dewarper->GetImageInputBuffer(64, 48, &buffer, &size, &format));
    EXPECT_FALSE(Output(32, 24).done);
    dewarper->SetPosition(10.0f, 10.0f, 10.0f);
    dewarper.reset();
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeovisionDewarperTest, FirstFrameSetsTheAdapterUpWithTheStreamsSizes) {
    Create(CEILING);
    Feed(64, 48);
    EXPECT_THAT(standin::CallNames(), ElementsAre("init"));
    standin::ForgetCalls();
    EXPECT_TRUE(Output(32, 24).done);
    std::vector<std::string> const setup = {"create_object",
                                            "init_object",
                                            "update_object_bounds",
                                            "get_object_controller_info",
                                            "set_object_controller_info",
                                            "set_object_pan_tilt",
                                            "set_object_zoom"};
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(Joined({setup, FEED, FEED})));
    EXPECT_THAT(standin::CallsOf("init_object")[0].numbers, ElementsAre(64.0, 48.0, 1.0, 1.0));
    EXPECT_THAT(standin::CallsOf("update_object_bounds")[0].numbers,
                ElementsAre(0.0, 0.0, 32.0, 24.0));
    EXPECT_THAT(standin::CallsOf("create_render_result")[0].numbers, ElementsAre(32.0, 24.0));
    EXPECT_EQ(0, dewarper->fishEyeChannel);
    EXPECT_FALSE(dewarper->firstFrame);
}

TEST_F(GeovisionDewarperTest, FirstFrameAfterASetupFeedsTheAdapterTwiceAndLaterFramesOnce) {
    Create(CEILING);
    RunFrame(64, 48, 32, 24);
    EXPECT_EQ(2u, standin::CallsOf("update_object_image").size());
    standin::ForgetCalls();
    EXPECT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(FEED));
    standin::ForgetCalls();
    EXPECT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(FEED));
}

TEST_F(GeovisionDewarperTest, TheStreamsPictureReachesTheOutputWithAnOpaqueAlpha) {
    Create(CEILING);
    Frame const frame = RunFrame(16, 8, 16, 8);
    ASSERT_TRUE(frame.done);
    ASSERT_EQ(16u * 8u * 4u, frame.pixels.size());
    for (int y = 0; y < 8; ++y) {
        for (int x = 0; x < 16; ++x) {
            unsigned char const* const pixel = &frame.pixels[size_t((y * 16 + x) * 4)];
            EXPECT_EQ(x, pixel[0]);
            EXPECT_EQ(y, pixel[1]);
            EXPECT_EQ(99, pixel[2]);
            EXPECT_EQ(255, pixel[3]);
        }
    }
}

TEST_F(GeovisionDewarperTest, SetupTellsTheViewModeAndMountByPositionAndSubMode) {
    struct Case {
        int position;
        int subMode;
        double internalView;
        double mount;
    };
    Case const cases[] = {{WALL, 1, 3, 1},    {CEILING, 1, 3, 0}, {FLOOR, 1, 3, 2},
                          {CEILING, 3, 2, 0}, {FLOOR, 3, 2, 2},   {5, 1, 3, 0}};
    for (Case const& given : cases) {
        Create(given.position);
        dewarper->SetSubMode(given.subMode);
        ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
        std::vector<double> const record = WrittenRecord();
        ASSERT_EQ(31u, record.size());
        EXPECT_EQ(given.internalView, record[GEO_FISHEYE_VIEW_MODE]) << given.position;
        EXPECT_EQ(given.mount, record[GEO_FISHEYE_MOUNT_TYPE]) << given.position;
    }
}

TEST_F(GeovisionDewarperTest, SetupTakesTheCircleAsCentredAndFillingTheFrame) {
    Create(CEILING);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    std::vector<double> record = WrittenRecord();
    EXPECT_EQ(32.0, record[GEO_FISHEYE_SOURCE_CENTER_X]);
    EXPECT_EQ(24.0, record[GEO_FISHEYE_SOURCE_CENTER_Y]);
    EXPECT_EQ(24.0, record[GEO_FISHEYE_SOURCE_RADIUS]);
    ASSERT_TRUE(RunFrame(31, 50, 24, 40).done);
    record = WrittenRecord();
    EXPECT_EQ(15.0, record[GEO_FISHEYE_SOURCE_CENTER_X]);
    EXPECT_EQ(25.0, record[GEO_FISHEYE_SOURCE_CENTER_Y]);
    EXPECT_EQ(15.0, record[GEO_FISHEYE_SOURCE_RADIUS]);
}

TEST_F(GeovisionDewarperTest, SetupSendsTheFirstFrameAtZero) {
    Create(CEILING);
    dewarper->SetPosition(300.0f, 450.0f, 400.0f);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    std::vector<double> const record = WrittenRecord();
    EXPECT_EQ(0.0, record[GEO_FISHEYE_VIEW3_PAN]);
    EXPECT_EQ(0.0, record[GEO_FISHEYE_VIEW3_TILT]);
    EXPECT_EQ(100.0, record[GEO_FISHEYE_VIEW3_ZOOM]);
}

TEST_F(GeovisionDewarperTest, EverySetupRebuildsTheAdapter) {
    Create(CEILING);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    geo_fisheye* const object = standin::Objects().at(0);
    Feed(64, 48);
    standin::ForgetCalls();
    ASSERT_TRUE(Output(40, 24).done);
    std::vector<std::string> const rebuild = {"release_object",
                                              "shutdown",
                                              "init",
                                              "create_object",
                                              "init_object",
                                              "update_object_bounds",
                                              "get_object_controller_info",
                                              "set_object_controller_info",
                                              "set_object_pan_tilt",
                                              "set_object_zoom"};
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(Joined({rebuild, FEED, FEED})));
    EXPECT_EQ(object, standin::CallsOf("release_object")[0].object);
    EXPECT_EQ(1, standin::LiveObjects());
    EXPECT_EQ(1, standin::LiveContexts());
}

TEST_F(GeovisionDewarperTest, UpdatePositionSendsTheFirstFrameTruncatedToSixteenBits) {
    Create(WALL);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    standin::ForgetCalls();
    dewarper->SetPosition(123.9f, -45.7f, 50.6f);
    EXPECT_THAT(standin::CallNames(), ElementsAre("set_object_pan_tilt", "set_object_zoom"));
    std::vector<double> const pan_tilt = standin::CallsOf("set_object_pan_tilt")[0].numbers;
    ASSERT_EQ(3u, pan_tilt.size());
    EXPECT_EQ(0.0, pan_tilt[0]);
    EXPECT_EQ(GeoFisheyeAdapter::calculatePanToInternalAbsolutePtz(123, 1), float(pan_tilt[1]));
    EXPECT_EQ(GeoFisheyeAdapter::calculateTiltToInternalAbsolutePtz(-45, 1), float(pan_tilt[2]));
    std::vector<double> const zoom = standin::CallsOf("set_object_zoom")[0].numbers;
    EXPECT_EQ(0.0, zoom[0]);
    EXPECT_EQ(GeoFisheyeAdapter::calculateZoomToInternalAbsolutePtz(50, 1), float(zoom[1]));
}

TEST_F(GeovisionDewarperTest, UpdatePositionSendsNothingOutsideSubModeOne) {
    Create(CEILING);
    dewarper->SetSubMode(3);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallsOf("set_object_pan_tilt"), IsEmpty());
    standin::ForgetCalls();
    dewarper->SetPosition(100.0f, 100.0f, 100.0f);
    dewarper->Pan(1, 3);
    dewarper->Zoom(1, 3);
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeovisionDewarperTest, BeforeTheFirstFrameAMoveChangesOnlyTheFields) {
    Create(CEILING);
    Feed(64, 48);
    standin::ForgetCalls();
    dewarper->Pan(1, 4);
    EXPECT_EQ(10.0f, Pan());
    EXPECT_THAT(standin::CallNames(), IsEmpty());
}

TEST_F(GeovisionDewarperTest, AFailingSecondFeedFailsTheFrameAndKeepsItTheFirst) {
    Create(CEILING);
    standin::Fail("update_object_image", 1);
    EXPECT_FALSE(RunFrame(64, 48, 32, 24).done);
    EXPECT_EQ(2u, standin::CallsOf("update_object_image").size());
    EXPECT_TRUE(dewarper->firstFrame);
    standin::Succeed("update_object_image");
    standin::ForgetCalls();
    EXPECT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(Joined({FEED, FEED})));
    EXPECT_FALSE(dewarper->firstFrame);
}

TEST_F(GeovisionDewarperTest, AFailingFirstFeedFailsTheFrameAtOnce) {
    Create(CEILING);
    standin::Fail("update_object_image");
    EXPECT_FALSE(RunFrame(64, 48, 32, 24).done);
    EXPECT_EQ(1u, standin::CallsOf("update_object_image").size());
    EXPECT_THAT(standin::CallsOf("create_render_result"), IsEmpty());
    EXPECT_TRUE(dewarper->firstFrame);
}

TEST_F(GeovisionDewarperTest, AFailedSetupGivesNoFrameUntilTheNextChange) {
    Create(CEILING);
    standin::Fail("init_object");
    EXPECT_FALSE(RunFrame(64, 48, 32, 24).done);
    EXPECT_EQ(-1, dewarper->fishEyeChannel);
    standin::Succeed("init_object");
    standin::ForgetCalls();
    EXPECT_FALSE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallNames(), IsEmpty());
    EXPECT_TRUE(RunFrame(64, 48, 40, 24).done);
    EXPECT_EQ(0, dewarper->fishEyeChannel);
}

TEST_F(GeovisionDewarperTest, AWideRequestOnASquareInputBecomesTheInputsWidth) {
    Create(CEILING);
    Frame const frame = RunFrame(2000, 2000, 4000, 2000);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(2000, frame.width);
    EXPECT_EQ(1000, frame.height);
    EXPECT_EQ(2000u * 1000u * 4u, frame.size);
}

TEST_F(GeovisionDewarperTest, ATallRequestTakesTheInputsHeightAndTheWidthIsRoundedUpAfter) {
    Create(CEILING);
    Frame const frame = RunFrame(200, 200, 100, 300);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(72, frame.width);  // 100 * 200 / 300 = 66, then a multiple of 8
    EXPECT_EQ(200, frame.height);
}

TEST_F(GeovisionDewarperTest, AHeightOf482BecomesAMultipleOfFour) {
    Create(CEILING);
    Frame const frame = RunFrame(1280, 960, 640, 482);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(640, frame.width);
    EXPECT_EQ(480, frame.height);
}

TEST_F(GeovisionDewarperTest, ARequestInsideTheInputKeepsItsSize) {
    Create(CEILING);
    Frame const frame = RunFrame(640, 480, 320, 240);
    EXPECT_EQ(320, frame.width);
    EXPECT_EQ(240, frame.height);
}

TEST_F(GeovisionDewarperTest, InputIs24BitsAPixelAndOutput32) {
    Create(CEILING);
    Frame const frame = RunFrame(64, 48, 32, 24);
    EXPECT_EQ(6, frame.format);
    EXPECT_EQ(32u * 24u * 4u, frame.size);
    unsigned int size = 0;
    int format = -1;
    dewarper->GetInputFormatAndSize(10, 6, &size, &format);
    EXPECT_EQ(3, format);
    EXPECT_EQ(180u, size);
    dewarper->GetOutputFormatAndSize(10, 6, &size, &format);
    EXPECT_EQ(6, format);
    EXPECT_EQ(240u, size);
}

TEST_F(GeovisionDewarperTest, GoingHomeEndsAtZoomTwentyInSubModeOne) {
    Create(CEILING);
    dewarper->SetSubMode(3);
    dewarper->SetPosition(100.0f, 200.0f, 300.0f);
    dewarper->SetPosition(0.0f, 0.0f, 0.0f);
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_THAT(Where(), ElementsAre(0.0f, 0.0f, 20.0f));
}

TEST_F(GeovisionDewarperTest, WallTiltRunsFromMinusNineHundredToNineHundred) {
    Create(WALL);
    dewarper->SetPosition(10.0f, -2000.0f, 100.0f);
    EXPECT_EQ(-900.0f, Tilt());
    dewarper->SetPosition(10.0f, 2000.0f, 100.0f);
    EXPECT_EQ(900.0f, Tilt());
    dewarper->SetPosition(-1000.0f, 0.0f, 100.0f);
    EXPECT_EQ(-900.0f, Pan());
}

TEST_F(GeovisionDewarperTest, RangesAreTheBaseRangesInTenthsWithTheStepStillInDegrees) {
    struct Case {
        int position;
        Range pan;
        Range tilt;
    };
    Case const cases[] = {{WALL, {-900, 900, 180, false}, {-900, 900, 180, false}},
                          {CEILING, {0, 3600, 360, true}, {0, 900, 90, false}},
                          {FLOOR, {0, 3600, 360, true}, {-900, 0, 90, false}},
                          {7, {0, 3600, 360, true}, {0, 900, 90, false}}};
    for (Case const& given : cases) {
        Create(given.position);
        Range const pan = PanRange();
        Range const tilt = TiltRange();
        EXPECT_EQ(given.pan.min, pan.min) << given.position;
        EXPECT_EQ(given.pan.max, pan.max) << given.position;
        EXPECT_EQ(given.pan.step, pan.step) << given.position;
        EXPECT_EQ(given.pan.wrap, pan.wrap) << given.position;
        EXPECT_EQ(given.tilt.min, tilt.min) << given.position;
        EXPECT_EQ(given.tilt.max, tilt.max) << given.position;
        EXPECT_EQ(given.tilt.step, tilt.step) << given.position;
        EXPECT_EQ(given.tilt.wrap, tilt.wrap) << given.position;
    }
}

TEST_F(GeovisionDewarperTest, OneStepOfPanMovesTwoTenthsOfADegree) {
    Create(CEILING);
    dewarper->SetPosition(100.0f, 100.0f, 100.0f);
    dewarper->Pan(1, 0);
    EXPECT_EQ(102.0f, Pan());
    dewarper->Pan(-1, 2);
    EXPECT_EQ(96.0f, Pan());
}

TEST_F(GeovisionDewarperTest, FloorInvertsPanAndWallInvertsTilt) {
    Create(FLOOR);
    EXPECT_TRUE(dewarper->InvertPan());
    EXPECT_FALSE(dewarper->InvertTilt());
    dewarper->SetPosition(100.0f, -100.0f, 100.0f);
    dewarper->Pan(1, 0);
    EXPECT_EQ(98.0f, Pan());
    Create(WALL);
    EXPECT_FALSE(dewarper->InvertPan());
    EXPECT_TRUE(dewarper->InvertTilt());
    dewarper->SetPosition(100.0f, 100.0f, 100.0f);
    dewarper->Tilt(1, 0);
    EXPECT_EQ(102.0f, Tilt());
    Create(CEILING);
    EXPECT_FALSE(dewarper->InvertPan());
    EXPECT_FALSE(dewarper->InvertTilt());
}

TEST_F(GeovisionDewarperTest, ZoomStepsByFourFromZeroToEightHundred) {
    Create(CEILING);
    EXPECT_EQ(4.0f, dewarper->GetZoomScaleModifier());
    dewarper->Zoom(1, 0);
    EXPECT_EQ(24.0f, Zoom());
    dewarper->Zoom(-1, 100);
    EXPECT_EQ(0.0f, Zoom());
    dewarper->SetPosition(1.0f, 1.0f, 900.0f);
    EXPECT_EQ(800.0f, Zoom());
    EXPECT_EQ(0.0f, dewarper->LimitZoomRange(-3.0f));
}

TEST_F(GeovisionDewarperTest, SubModeThreeOnlyOffTheWallAndNoPanorama) {
    Create(WALL);
    EXPECT_TRUE(dewarper->IsSubModeSupported(1));
    EXPECT_FALSE(dewarper->IsSubModeSupported(2));
    EXPECT_FALSE(dewarper->IsSubModeSupported(3));
    EXPECT_FALSE(dewarper->IsSubModeSupported(0));
    Create(CEILING);
    EXPECT_TRUE(dewarper->IsSubModeSupported(3));
    EXPECT_FALSE(dewarper->IsSubModeSupported(2));
    Create(FLOOR);
    EXPECT_TRUE(dewarper->IsSubModeSupported(3));
}

TEST_F(GeovisionDewarperTest, NormalPtzIsClaimedForSubModesTwoAndThree) {
    Create(WALL);
    EXPECT_FALSE(dewarper->IsNormalPTZSupported(1));
    EXPECT_TRUE(dewarper->IsNormalPTZSupported(2));
    EXPECT_TRUE(dewarper->IsNormalPTZSupported(3));
    EXPECT_FALSE(dewarper->IsNormalPTZSupported(4));
}

TEST_F(GeovisionDewarperTest, AspectRatioIsTheHeightInSubModeOneAndSixteenByNineOtherwise) {
    Create(CEILING);
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(3);
    EXPECT_FLOAT_EQ(1.7777778f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
}

TEST_F(GeovisionDewarperTest, ANewSubModeClearsThePositionAndSetsUpAgain) {
    Create(CEILING);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    dewarper->SetPosition(100.0f, 200.0f, 300.0f);
    dewarper->SetSubMode(3);
    EXPECT_EQ(3, dewarper->SubMode());
    EXPECT_THAT(Where(), ElementsAre(0.0f, 0.0f, 20.0f));
    standin::ForgetCalls();
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_EQ(2.0, WrittenRecord()[GEO_FISHEYE_VIEW_MODE]);
    EXPECT_EQ(2u, standin::CallsOf("update_object_image").size());
}

TEST_F(GeovisionDewarperTest, TheSameSubModeOrZeroForOneChangesNothing) {
    Create(CEILING);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    dewarper->SetPosition(100.0f, 200.0f, 300.0f);
    dewarper->SetSubMode(0);
    dewarper->SetSubMode(1);
    EXPECT_THAT(Where(), ElementsAre(100.0f, 200.0f, 300.0f));
    standin::ForgetCalls();
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    EXPECT_THAT(standin::CallNames(), ElementsAreArray(FEED));
}

TEST_F(GeovisionDewarperTest, DestructorClosesTheChannelAndReleasesTheAdapter) {
    Create(CEILING);
    ASSERT_TRUE(RunFrame(64, 48, 32, 24).done);
    standin::ForgetCalls();
    dewarper.reset();
    EXPECT_THAT(standin::CallNames(), ElementsAre("release_object", "shutdown"));
    EXPECT_EQ(0, standin::LiveObjects());
    EXPECT_EQ(0, standin::LiveContexts());
    EXPECT_EQ(0, standin::LiveResults());
}

TEST_F(GeovisionDewarperTest, DestructorWithoutAChannelOnlyReleasesTheAdapter) {
    Create(CEILING);
    ASSERT_TRUE(dewarper->Check());
    standin::ForgetCalls();
    dewarper.reset();
    EXPECT_THAT(standin::CallNames(), ElementsAre("shutdown"));
}

}  // namespace
