#include <cstring>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "ImmervisionDewarper.h"
#include "ImmervisionLibrary.h"
#include "dewarper_abilities.h"
#include "imv1_standin.h"

namespace {

using imv1_standin::Call;
using Names = std::vector<std::string>;

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

// Indices in the stand-in's default lens list: "A8TRT", null, "B5SST", "C7SST", "C8WWT", "D2SST".
constexpr int LENS_WITHOUT_RPL = 1;
constexpr int LENS_B5SST = 2;
constexpr int LENS_COUNT = 6;

DewarpParams_t Camera(int position, int lens = -1, int panoramaOffset = 0) {
    DewarpParams_t params;
    params.position = position;
    params.lens = lens;
    params.panoramaOffset = panoramaOffset;
    return params;
}

/// The dewarper with its protected parts in reach.
class Probe : public ImmervisionDewarper {
public:
    explicit Probe(DewarpParams_t const& creationParams) : ImmervisionDewarper(creationParams) {}
    using ImmervisionDewarper::camera;
    using ImmervisionDewarper::errorCount;
    using ImmervisionDewarper::GetFormatAndSize;
    using ImmervisionDewarper::GetZoomScaleModifier;
    using ImmervisionDewarper::inputImage;
    using ImmervisionDewarper::LimitZoomRange;
    using ImmervisionDewarper::outputImage;
};

struct Position {
    float pan;
    float tilt;
    float zoom;
};

Position Where(IDewarper& dewarper) {
    Position position{};
    dewarper.GetPosition(position.pan, position.tilt, position.zoom);
    return position;
}

std::vector<Call> CallsOf(std::string const& function) {
    std::vector<Call> found;
    for (Call const& call : imv1_standin::Calls()) {
        if (call.function == function) {
            found.push_back(call);
        }
    }
    return found;
}

// The one call of `function` since the calls were last cleared.
Call OnlyCallOf(std::string const& function) {
    std::vector<Call> const found = CallsOf(function);
    EXPECT_EQ(1u, found.size()) << function;
    return found.empty() ? Call() : found.front();
}

// Every test holds a reference to the stand-in library, as the registry does for a loaded kind,
// and drops its dewarper before letting the reference go.
class ImmervisionDewarperTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(ImmervisionLibraryInstance.Acquire());
        imv1_standin::Reset();
    }

    void TearDown() override {
        dewarper.reset();
        ImmervisionLibraryInstance.Release();
        imv1_standin::Reset();
    }

    Probe& Create(DewarpParams_t const& params) {
        dewarper = std::make_unique<Probe>(params);
        return *dewarper;
    }

    // Every byte of the input tells its place.
    void Feed(int width, int height) {
        unsigned int size = 0;
        int format = -1;
        ASSERT_TRUE(dewarper->GetImageInputBuffer(width, height, &input, &size, &format));
        ASSERT_EQ(23, format);
        inputSize = size;
        for (unsigned int index = 0; index < size; ++index) {
            input[index] = static_cast<unsigned char>(index * 7 + 3);
        }
    }

    bool Frame(int width = 320, int height = 200) {
        outputWidth = width;
        outputHeight = height;
        return dewarper->GetImageOutputBuffer(&outputWidth, &outputHeight, &output, &outputSize,
                                              &outputFormat);
    }

    // A first frame of 64 by 48, after which only the calls of later steps are kept.
    void FirstFrame() {
        Feed(64, 48);
        ASSERT_TRUE(Frame());
        imv1_standin::ClearCalls();
    }

    std::unique_ptr<Probe> dewarper;
    unsigned char* input = nullptr;
    unsigned int inputSize = 0;
    unsigned char* output = nullptr;
    int outputWidth = 0;
    int outputHeight = 0;
    unsigned int outputSize = 0;
    int outputFormat = -1;
};

TEST(ImmervisionDewarper, WithoutTheLibraryCheckIsFalseAndNoCallReachesIt) {
    ASSERT_FALSE(ImmervisionLibraryInstance.IsOpen());
    imv1_standin::Reset();
    {
        Probe dewarper(Camera(CEILING, LENS_B5SST));
        EXPECT_FALSE(dewarper.Check());
        unsigned char* buffer = nullptr;
        unsigned int size = 0;
        int format = -1;
        EXPECT_FALSE(dewarper.GetImageInputBuffer(64, 48, &buffer, &size, &format));
        int width = 64;
        int height = 48;
        EXPECT_FALSE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
        dewarper.Pan(1, 3);
        dewarper.SetPosition(10.0f, 20.0f, 90.0f);
        dewarper.SetSubMode(2);
        char text[8] = "unset";
        EXPECT_EQ(0, dewarper.GetLens(LENS_B5SST, text, sizeof text));
        EXPECT_STREQ("unset", text);
        EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(7, "Samsung", "SNF-7010"));
        EXPECT_EQ(nullptr, dewarper.camera);
    }
    EXPECT_TRUE(imv1_standin::Calls().empty());
}

TEST_F(ImmervisionDewarperTest, IsModeOneEvenWhenMadeForSamsung) {
    Create(Camera(CEILING));
    dewarper->SetDewarperType(DewarperType::DewarperSamsung);
    EXPECT_EQ(1, dewarper->Mode());
}

TEST_F(ImmervisionDewarperTest, StartsAtTheWidestViewInSubModeOneWithNoCamera) {
    Create(Camera(CEILING));
    Position const start = Where(*dewarper);
    EXPECT_EQ(0.0f, start.pan);
    EXPECT_EQ(0.0f, start.tilt);
    EXPECT_EQ(180.0f, start.zoom);
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_EQ(0, dewarper->errorCount);
    EXPECT_EQ(nullptr, dewarper->camera);
    EXPECT_TRUE(imv1_standin::Calls().empty());
}

TEST_F(ImmervisionDewarperTest, CheckMakesOneCameraAndTwoZeroedRecordsOnce) {
    Create(Camera(CEILING));
    int const live = imv1_standin::LiveObjects();
    EXPECT_TRUE(dewarper->Check());
    EXPECT_TRUE(dewarper->Check());
    EXPECT_EQ((Names{"IMV_CameraInterface"}), imv1_standin::CallNames());
    EXPECT_EQ(dewarper->camera, imv1_standin::Calls()[0].object);
    EXPECT_EQ(live + 1, imv1_standin::LiveObjects());
    ASSERT_NE(nullptr, dewarper->inputImage);
    ASSERT_NE(nullptr, dewarper->outputImage);
    IMV_Buffer const zero{};
    EXPECT_EQ(0, std::memcmp(&zero, dewarper->inputImage, sizeof zero));
    EXPECT_EQ(0, std::memcmp(&zero, dewarper->outputImage, sizeof zero));
}

TEST_F(ImmervisionDewarperTest, FirstFrameSelectsTheLensSetsVideoLimitsAndPositionThenUpdates) {
    Create(Camera(CEILING, LENS_B5SST));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(
        (Names{"IMV_CameraInterface", "StaticGetLensDescriptionCount", "StaticGetLensDescription",
               "SetLens", "SetVideoParams", "SetZoomLimits", "SetPosition", "Update"}),
        imv1_standin::CallNames());
    for (Call const& call : imv1_standin::Calls()) {
        if (call.function.rfind("Static", 0) != 0) {
            EXPECT_EQ(dewarper->camera, call.object) << call.function;
        }
    }
}

TEST_F(ImmervisionDewarperTest, LaterFramesOnlyUpdate) {
    Create(Camera(CEILING, LENS_B5SST));
    FirstFrame();
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ((Names{"Update", "Update"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, VideoParamsDescribeBothBuffersAtTheInputSizeInColourFormatEleven) {
    Create(Camera(FLOOR));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("SetVideoParams");
    EXPECT_EQ(dewarper->inputImage, call.inputAddress);
    EXPECT_EQ(dewarper->outputImage, call.outputAddress);
    for (IMV_Buffer const& image : {call.input, call.output}) {
        EXPECT_EQ(64u, image.width);
        EXPECT_EQ(48u, image.height);
        EXPECT_EQ(0u, image.frameX);
        EXPECT_EQ(0u, image.frameY);
        EXPECT_EQ(64u, image.frameWidth);
        EXPECT_EQ(48u, image.frameHeight);
    }
    EXPECT_EQ(input, call.input.data);
    EXPECT_EQ(output, call.output.data);
    EXPECT_EQ(11u, call.colorFormat);
    EXPECT_EQ(2u, call.position);
}

TEST_F(ImmervisionDewarperTest, OutputIsAlwaysTheInputSizeWhateverTheHostAsks) {
    Create(Camera(CEILING));
    Feed(64, 48);
    ASSERT_TRUE(Frame(320, 200));
    EXPECT_EQ(64, outputWidth);
    EXPECT_EQ(48, outputHeight);
    EXPECT_EQ(23, outputFormat);
    EXPECT_EQ(64u * 48u * 3u / 2u, outputSize);
}

TEST_F(ImmervisionDewarperTest, AnInputOfUnevenSizeGivesARoundedBufferButRecordsOfTheInputSize) {
    Create(Camera(CEILING));
    Feed(100, 51);
    ASSERT_TRUE(Frame(320, 200));
    EXPECT_EQ(104, outputWidth);
    EXPECT_EQ(52, outputHeight);
    Call const call = OnlyCallOf("SetVideoParams");
    EXPECT_EQ(100u, call.output.width);
    EXPECT_EQ(51u, call.output.frameHeight);
}

TEST_F(ImmervisionDewarperTest, UpdateCopiesTheInputIntoTheOutputSoTheHostSeesAPicture) {
    Create(Camera(CEILING));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    ASSERT_EQ(inputSize, outputSize);
    EXPECT_EQ(0, std::memcmp(input, output, inputSize));
    Call const update = OnlyCallOf("Update");
    EXPECT_EQ(input, update.input.data);
    EXPECT_EQ(output, update.output.data);
}

struct ViewCase {
    int subMode;
    int position;
    unsigned long viewType;
};

void PrintTo(ViewCase const& view, std::ostream* out) {
    *out << "sub-mode " << view.subMode << " at position " << view.position;
}

class ImmervisionViewTypeTest : public ImmervisionDewarperTest,
                                public ::testing::WithParamInterface<ViewCase> {};

TEST_P(ImmervisionViewTypeTest, ViewTypeFollowsSubModeAndMount) {
    ViewCase const expected = GetParam();
    Create(Camera(expected.position));
    dewarper->SetSubMode(expected.subMode);
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("SetVideoParams");
    EXPECT_EQ(expected.viewType, call.viewType);
    EXPECT_EQ(static_cast<unsigned long>(expected.position), call.position);
    EXPECT_EQ(11u, call.colorFormat);
}

INSTANTIATE_TEST_SUITE_P(SubModesAndMounts, ImmervisionViewTypeTest,
                         ::testing::Values(ViewCase{1, WALL, 0}, ViewCase{1, CEILING, 0},
                                           ViewCase{1, FLOOR, 0}, ViewCase{2, WALL, 2},
                                           ViewCase{2, CEILING, 4}, ViewCase{2, FLOOR, 4},
                                           ViewCase{3, WALL, 2}, ViewCase{3, CEILING, 2},
                                           ViewCase{3, FLOOR, 2}));

TEST_F(ImmervisionDewarperTest, ASubModeBeyondThreeIsSetUpAsTheSingleView) {
    Create(Camera(CEILING));
    dewarper->SetSubMode(4);
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(0u, OnlyCallOf("SetVideoParams").viewType);
}

TEST_F(ImmervisionDewarperTest, TheLensIndexSelectsThatEntrysRplNumber) {
    Create(Camera(CEILING, LENS_B5SST));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("SetLens");
    ASSERT_NE(nullptr, call.rpl);
    EXPECT_STREQ("B5SST", call.rpl);
}

TEST_F(ImmervisionDewarperTest, LensMinusOneLeavesTheLibraryWithoutALensAndGoesOn) {
    Create(Camera(CEILING, -1));
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_TRUE(CallsOf("SetLens").empty());
    EXPECT_EQ(1u, CallsOf("SetVideoParams").size());
    EXPECT_EQ(1u, CallsOf("Update").size());
}

TEST_F(ImmervisionDewarperTest, ALensAtTheCountOfTheListSelectsNothingAndIsNoError) {
    Create(Camera(CEILING, LENS_COUNT));
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_TRUE(CallsOf("SetLens").empty());
    EXPECT_EQ(1u, CallsOf("Update").size());
}

TEST_F(ImmervisionDewarperTest, AFailedSetLensStopsTheSetupAndPassesItsCodeToGetErrorString) {
    Create(Camera(CEILING, LENS_B5SST));
    imv1_standin::SetResult("SetLens", 17);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ((Names{"IMV_CameraInterface", "StaticGetLensDescriptionCount",
                     "StaticGetLensDescription", "SetLens", "GetErrorString"}),
              imv1_standin::CallNames());
    EXPECT_EQ(17, OnlyCallOf("GetErrorString").code);
    EXPECT_EQ(1, dewarper->errorCount);
}

TEST_F(ImmervisionDewarperTest, AFailedSetVideoParamsStopsTheSetupAndPassesItsCode) {
    Create(Camera(CEILING, -1));
    imv1_standin::SetResult("SetVideoParams", -4);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ((Names{"IMV_CameraInterface", "StaticGetLensDescriptionCount",
                     "StaticGetLensDescription", "SetVideoParams", "GetErrorString"}),
              imv1_standin::CallNames());
    EXPECT_EQ(-4, OnlyCallOf("GetErrorString").code);
}

TEST_F(ImmervisionDewarperTest, AFailedSetZoomLimitsSendsNoPositionAndPassesItsCode) {
    Create(Camera(CEILING, -1));
    imv1_standin::SetResult("SetZoomLimits", 3);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ(
        (Names{"IMV_CameraInterface", "StaticGetLensDescriptionCount", "StaticGetLensDescription",
               "SetVideoParams", "SetZoomLimits", "GetErrorString"}),
        imv1_standin::CallNames());
    EXPECT_EQ(3, OnlyCallOf("GetErrorString").code);
}

TEST_F(ImmervisionDewarperTest, ZoomIsLimitedTo23To180InTheLibraryToo) {
    Create(Camera(CEILING));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("SetZoomLimits");
    EXPECT_EQ(23.0f, call.min);
    EXPECT_EQ(180.0f, call.max);
}

TEST_F(ImmervisionDewarperTest, ThePositionSetBeforeTheFirstFrameReachesTheLibraryWithItsSetup) {
    Create(Camera(CEILING));
    ASSERT_TRUE(dewarper->Check());
    dewarper->SetPosition(20.0f, 30.0f, 100.0f);
    EXPECT_TRUE(CallsOf("SetPosition").empty());
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("SetPosition");
    EXPECT_EQ(20.0f, call.pan);
    EXPECT_EQ(30.0f, call.tilt);
    EXPECT_EQ(100.0f, call.zoom);
}

TEST_F(ImmervisionDewarperTest, APanBeforeTheFirstFrameChangesPanButDoesNotReachTheLibrary) {
    Create(Camera(CEILING));
    Feed(64, 48);
    dewarper->Pan(1, 4);
    EXPECT_FLOAT_EQ(1.0f, Where(*dewarper).pan);
    EXPECT_EQ((Names{"IMV_CameraInterface"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, APositionAfterSetupGoesByPointerWithZeroAndOne) {
    Create(Camera(CEILING));
    FirstFrame();
    dewarper->SetPosition(30.0f, 40.0f, 90.0f);
    EXPECT_EQ((Names{"SetPosition"}), imv1_standin::CallNames());
    Call const call = OnlyCallOf("SetPosition");
    EXPECT_EQ(dewarper->camera, call.object);
    EXPECT_EQ(30.0f, call.pan);
    EXPECT_EQ(40.0f, call.tilt);
    EXPECT_EQ(90.0f, call.zoom);
    EXPECT_EQ(0u, call.fourth);
    EXPECT_EQ(1u, call.fifth);
}

TEST_F(ImmervisionDewarperTest, TheLibraryMayWriteThePositionBack) {
    Create(Camera(CEILING));
    FirstFrame();
    imv1_standin::WriteBackPosition(12.5f, 34.0f, 56.0f);
    dewarper->Pan(1, 0);
    EXPECT_FLOAT_EQ(0.2f, OnlyCallOf("SetPosition").pan);
    Position const now = Where(*dewarper);
    EXPECT_EQ(12.5f, now.pan);
    EXPECT_EQ(34.0f, now.tilt);
    EXPECT_EQ(56.0f, now.zoom);
}

TEST_F(ImmervisionDewarperTest, AFailedSetPositionPassesItsCodeButTheSetupStands) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetPosition", 21);
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ(21, OnlyCallOf("GetErrorString").code);
    EXPECT_EQ(0, dewarper->errorCount);
    imv1_standin::ClearCalls();
    dewarper->Tilt(-1, 0);
    EXPECT_EQ((Names{"SetPosition", "GetErrorString"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, AFailedUpdatePassesItsCodeAndFailsThatFrameOnly) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("Update", 9);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ(9, OnlyCallOf("GetErrorString").code);
    EXPECT_EQ(0, dewarper->errorCount);
    imv1_standin::SetResult("Update", 0);
    imv1_standin::ClearCalls();
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ((Names{"Update"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, AFailedSetupIsRetriedOncePerFrame) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetZoomLimits", 5);
    Feed(64, 48);
    ASSERT_FALSE(Frame());
    EXPECT_EQ(1, dewarper->errorCount);
    for (int failures = 2; failures <= 5; ++failures) {
        imv1_standin::ClearCalls();
        Feed(64, 48);
        EXPECT_FALSE(Frame());
        EXPECT_EQ(failures, dewarper->errorCount);
        EXPECT_EQ((Names{"StaticGetLensDescriptionCount", "StaticGetLensDescription",
                         "SetVideoParams", "SetZoomLimits", "GetErrorString"}),
                  imv1_standin::CallNames())
            << failures;
        EXPECT_EQ(5, OnlyCallOf("GetErrorString").code);
    }
}

TEST_F(ImmervisionDewarperTest, AfterFiveFailuresTheFrameIsFalseAtOnceWithNoCallToTheLibrary) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetZoomLimits", 5);
    Feed(64, 48);
    for (int attempt = 0; attempt < 5; ++attempt) {
        ASSERT_FALSE(Frame());
    }
    ASSERT_EQ(5, dewarper->errorCount);
    imv1_standin::SetResult("SetZoomLimits", 0);
    imv1_standin::ClearCalls();
    for (int frame = 0; frame < 3; ++frame) {
        Feed(64, 48);
        EXPECT_FALSE(Frame());
    }
    EXPECT_TRUE(imv1_standin::Calls().empty());
    EXPECT_EQ(5, dewarper->errorCount);
}

TEST_F(ImmervisionDewarperTest, AfterFiveFailuresTheHostIsToldItCannotPanTiltOrZoom) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetVideoParams", 1);
    Feed(64, 48);
    for (int attempt = 0; attempt < 4; ++attempt) {
        ASSERT_FALSE(Frame());
    }
    EXPECT_TRUE(dewarper->CanPan(1));
    EXPECT_TRUE(dewarper->CanTilt(1));
    EXPECT_TRUE(dewarper->CanZoom(1));
    ASSERT_FALSE(Frame());
    EXPECT_FALSE(dewarper->CanPan(1));
    EXPECT_FALSE(dewarper->CanTilt(1));
    EXPECT_FALSE(dewarper->CanZoom(1));
}

TEST_F(ImmervisionDewarperTest, ARetryThatSucceedsZeroesTheCountAndDrawsTheFrame) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetZoomLimits", 5);
    Feed(64, 48);
    ASSERT_FALSE(Frame());
    ASSERT_FALSE(Frame());
    ASSERT_EQ(2, dewarper->errorCount);
    imv1_standin::SetResult("SetZoomLimits", 0);
    imv1_standin::ClearCalls();
    EXPECT_TRUE(Frame());
    EXPECT_EQ(0, dewarper->errorCount);
    EXPECT_EQ((Names{"StaticGetLensDescriptionCount", "StaticGetLensDescription", "SetVideoParams",
                     "SetZoomLimits", "SetPosition", "Update"}),
              imv1_standin::CallNames());
    imv1_standin::ClearCalls();
    EXPECT_TRUE(Frame());
    EXPECT_EQ((Names{"Update"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, ANewInputSizeAfterGivingUpStartsCountingAfresh) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetZoomLimits", 5);
    Feed(64, 48);
    for (int attempt = 0; attempt < 5; ++attempt) {
        ASSERT_FALSE(Frame());
    }
    imv1_standin::SetResult("SetZoomLimits", 0);
    Feed(80, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ(0, dewarper->errorCount);
    EXPECT_EQ(80, outputWidth);
}

TEST_F(ImmervisionDewarperTest, ANewSubModeAfterGivingUpStartsCountingAfresh) {
    Create(Camera(CEILING));
    imv1_standin::SetResult("SetZoomLimits", 5);
    Feed(64, 48);
    for (int attempt = 0; attempt < 5; ++attempt) {
        ASSERT_FALSE(Frame());
    }
    imv1_standin::SetResult("SetZoomLimits", 0);
    dewarper->SetSubMode(2);
    EXPECT_TRUE(Frame());
    EXPECT_EQ(0, dewarper->errorCount);
}

TEST_F(ImmervisionDewarperTest, SubModesOneAndTwoEverywhereThreeOnlyOffTheWall) {
    Create(Camera(WALL));
    EXPECT_FALSE(dewarper->IsSubModeSupported(0));
    EXPECT_TRUE(dewarper->IsSubModeSupported(1));
    EXPECT_TRUE(dewarper->IsSubModeSupported(2));
    EXPECT_FALSE(dewarper->IsSubModeSupported(3));
    EXPECT_FALSE(dewarper->IsSubModeSupported(4));
    for (int position : {CEILING, FLOOR}) {
        Create(Camera(position));
        EXPECT_TRUE(dewarper->IsSubModeSupported(1)) << position;
        EXPECT_TRUE(dewarper->IsSubModeSupported(2)) << position;
        EXPECT_TRUE(dewarper->IsSubModeSupported(3)) << position;
        EXPECT_FALSE(dewarper->IsSubModeSupported(4)) << position;
    }
}

TEST_F(ImmervisionDewarperTest, NormalPtzIsSupportedForTheTwoPanoramasOnly) {
    for (int position : {WALL, CEILING}) {
        Create(Camera(position));
        EXPECT_FALSE(dewarper->IsNormalPTZSupported(0));
        EXPECT_FALSE(dewarper->IsNormalPTZSupported(1));
        EXPECT_TRUE(dewarper->IsNormalPTZSupported(2));
        EXPECT_TRUE(dewarper->IsNormalPTZSupported(3));
        EXPECT_FALSE(dewarper->IsNormalPTZSupported(4));
    }
}

class ImmervisionAbilityTest : public ImmervisionDewarperTest,
                               public ::testing::WithParamInterface<AbilityCase> {};

TEST_P(ImmervisionAbilityTest, PanOffTheWallInEverySubModeTiltAndZoomInTheSingleViewOnly) {
    AbilityCase const expected = GetParam();
    Create(Camera(expected.position));
    dewarper->SetSubMode(expected.subMode);
    ExpectAbilities(*dewarper, expected);
}

INSTANTIATE_TEST_SUITE_P(SubModesAndMounts, ImmervisionAbilityTest, PanoramasTurnOffTheWall());

TEST_F(ImmervisionDewarperTest, APanoramaOffTheWallIsFourTimesAsWideAsItIsHigh) {
    Create(Camera(CEILING));
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(2);
    EXPECT_EQ(1920.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(3);
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    Create(Camera(WALL));
    dewarper->SetSubMode(2);
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
}

TEST_F(ImmervisionDewarperTest, ClearGoesBackToTheWidestView) {
    Create(Camera(CEILING));
    dewarper->SetPosition(40.0f, 30.0f, 60.0f);
    dewarper->Clear();
    Position const cleared = Where(*dewarper);
    EXPECT_EQ(0.0f, cleared.pan);
    EXPECT_EQ(0.0f, cleared.tilt);
    EXPECT_EQ(180.0f, cleared.zoom);
}

TEST_F(ImmervisionDewarperTest, ZoomingInNarrowsTheFieldOfViewBy0785AStep) {
    Create(Camera(CEILING));
    EXPECT_FLOAT_EQ(-0.785f, dewarper->GetZoomScaleModifier());
    dewarper->Zoom(1, 0);
    EXPECT_FLOAT_EQ(179.215f, Where(*dewarper).zoom);
    dewarper->Zoom(-1, 3);
    EXPECT_EQ(180.0f, Where(*dewarper).zoom);
}

TEST_F(ImmervisionDewarperTest, ZoomIsHeldBetween23And180) {
    Create(Camera(CEILING));
    EXPECT_EQ(23.0f, dewarper->LimitZoomRange(10.0f));
    EXPECT_EQ(180.0f, dewarper->LimitZoomRange(200.0f));
    EXPECT_EQ(90.0f, dewarper->LimitZoomRange(90.0f));
    dewarper->SetPosition(10.0f, 10.0f, 5.0f);
    EXPECT_EQ(23.0f, Where(*dewarper).zoom);
}

TEST_F(ImmervisionDewarperTest, PanAndTiltUseTheBaseRanges) {
    Create(Camera(WALL));
    dewarper->SetPosition(120.0f, -100.0f, 90.0f);
    EXPECT_EQ(90.0f, Where(*dewarper).pan);
    EXPECT_EQ(-90.0f, Where(*dewarper).tilt);
    Create(Camera(CEILING));
    dewarper->SetPosition(370.0f, 95.0f, 90.0f);
    EXPECT_FLOAT_EQ(10.0f, Where(*dewarper).pan);
    EXPECT_EQ(90.0f, Where(*dewarper).tilt);
}

TEST_F(ImmervisionDewarperTest, InputAndOutputAreFormat23OfTwelveBitsAPixelTruncated) {
    Create(Camera(CEILING));
    unsigned int size = 0;
    int format = -1;
    dewarper->GetFormatAndSize(5, 3, &size, &format);
    EXPECT_EQ(23, format);
    EXPECT_EQ(22u, size);
    Feed(64, 48);
    EXPECT_EQ(64u * 48u * 3u / 2u, inputSize);
}

TEST_F(ImmervisionDewarperTest, SubModeZeroMeansOneAndTheSameSubModeChangesNothing) {
    Create(Camera(CEILING));
    FirstFrame();
    dewarper->SetPosition(40.0f, 30.0f, 60.0f);
    dewarper->SetSubMode(0);
    dewarper->SetSubMode(1);
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_EQ(40.0f, Where(*dewarper).pan);
    imv1_standin::ClearCalls();
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ((Names{"Update"}), imv1_standin::CallNames());
}

TEST_F(ImmervisionDewarperTest, SetSubModeTwoWithAPanoramaOffsetOf45ClearsAndGivesPan45) {
    Create(Camera(CEILING, -1, 45));
    dewarper->SetPosition(10.0f, 30.0f, 60.0f);
    dewarper->SetSubMode(2);
    EXPECT_EQ(2, dewarper->SubMode());
    Position const now = Where(*dewarper);
    EXPECT_EQ(45.0f, now.pan);
    EXPECT_EQ(0.0f, now.tilt);
    EXPECT_EQ(180.0f, now.zoom);
}

TEST_F(ImmervisionDewarperTest, ANewSubModeSetsTheCameraUpAgainAtTheNextFrame) {
    Create(Camera(CEILING, -1, 30));
    FirstFrame();
    dewarper->SetSubMode(3);
    EXPECT_TRUE(imv1_standin::Calls().empty());
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(2u, OnlyCallOf("SetVideoParams").viewType);
    EXPECT_EQ(30.0f, OnlyCallOf("SetPosition").pan);
}

TEST_F(ImmervisionDewarperTest, BackToTheSingleViewKeepsThePosition) {
    Create(Camera(CEILING, -1, 30));
    dewarper->SetSubMode(2);
    dewarper->SetPosition(50.0f, 20.0f, 70.0f);
    dewarper->SetSubMode(1);
    Position const now = Where(*dewarper);
    EXPECT_EQ(50.0f, now.pan);
    EXPECT_EQ(20.0f, now.tilt);
    EXPECT_EQ(70.0f, now.zoom);
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(0u, OnlyCallOf("SetVideoParams").viewType);
}

TEST_F(ImmervisionDewarperTest, GoingHomeReturnsToTheSingleWidestView) {
    Create(Camera(CEILING, -1, 30));
    dewarper->SetSubMode(2);
    dewarper->SetPosition(0.0f, 0.0f, 0.0f);
    EXPECT_EQ(1, dewarper->SubMode());
    Position const home = Where(*dewarper);
    EXPECT_EQ(0.0f, home.pan);
    EXPECT_EQ(180.0f, home.zoom);
}

TEST_F(ImmervisionDewarperTest, GetLensListsRplNumberAndItsEntry) {
    Create(Camera(CEILING));
    char text[64] = {};
    EXPECT_EQ(16, dewarper->GetLens(LENS_B5SST, text, sizeof text));
    EXPECT_STREQ("RPL Number B5SST", text);
    EXPECT_EQ(16, dewarper->GetLens(5, text, sizeof text));
    EXPECT_STREQ("RPL Number D2SST", text);
}

TEST_F(ImmervisionDewarperTest, GetLensIntoFourBytesWritesThreeCharactersAndReturnsTheFullLength) {
    Create(Camera(CEILING));
    char text[8] = {'x', 'x', 'x', 'x', 'x', 'x', 'x', 'x'};
    EXPECT_EQ(16, dewarper->GetLens(0, text, 4));
    EXPECT_STREQ("RPL", text);
    EXPECT_EQ('x', text[4]);
}

TEST_F(ImmervisionDewarperTest, GetLensOutsideTheListReturnsZeroAndWritesNothing) {
    Create(Camera(CEILING));
    char text[8] = "unset";
    EXPECT_EQ(0, dewarper->GetLens(LENS_COUNT, text, sizeof text));
    EXPECT_EQ(0, dewarper->GetLens(-1, text, sizeof text));
    EXPECT_STREQ("unset", text);
}

TEST_F(ImmervisionDewarperTest, GetLensOfAnEntryWithoutRplNumberListsItEmpty) {
    Create(Camera(CEILING));
    char text[32] = {};
    EXPECT_EQ(11, dewarper->GetLens(LENS_WITHOUT_RPL, text, sizeof text));
    EXPECT_STREQ("RPL Number ", text);
}

TEST_F(ImmervisionDewarperTest, GetLensReadsTheListWithoutMakingACamera) {
    Create(Camera(CEILING));
    char text[32] = {};
    dewarper->GetLens(LENS_B5SST, text, sizeof text);
    EXPECT_EQ((Names{"StaticGetLensDescriptionCount", "StaticGetLensDescription"}),
              imv1_standin::CallNames());
    EXPECT_EQ(nullptr, dewarper->camera);
}

struct DefaultLensCase {
    char const* model;
    int lens;
};

void PrintTo(DefaultLensCase const& lens, std::ostream* out) {
    *out << '"' << lens.model << '"';
}

class ImmervisionDefaultLensTest : public ImmervisionDewarperTest,
                                   public ::testing::WithParamInterface<DefaultLensCase> {};

TEST_P(ImmervisionDefaultLensTest, SamsungModelsComeWithTheirLens) {
    DefaultLensCase const expected = GetParam();
    EXPECT_EQ(expected.lens, ImmervisionDewarper::GetDefaultLens(7, "Samsung", expected.model));
}

INSTANTIATE_TEST_SUITE_P(
    Models, ImmervisionDefaultLensTest,
    ::testing::Values(DefaultLensCase{"SNF-7010", 2}, DefaultLensCase{"SNF-7010V", 2},
                      DefaultLensCase{"SNF-8010VM", 3}, DefaultLensCase{"PNF-9010R", 4},
                      DefaultLensCase{"SNF-6010", 0}, DefaultLensCase{"snf-7010", 0},
                      DefaultLensCase{"SNF-701", 0}, DefaultLensCase{"", 0}));

TEST_F(ImmervisionDewarperTest, DefaultLensOfModeOneIsZeroWithoutReadingTheList) {
    EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(1, "Samsung", "SNF-7010"));
    EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(3, "Samsung", "PNF-9010"));
    EXPECT_TRUE(imv1_standin::Calls().empty());
}

TEST_F(ImmervisionDewarperTest, DefaultLensOfAnUnknownOrMissingModelIsZero) {
    EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(7, "Samsung", "XNF-8010"));
    EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(7, "Samsung", nullptr));
    EXPECT_TRUE(imv1_standin::Calls().empty());
}

TEST_F(ImmervisionDewarperTest, DefaultLensSkipsANullRplNumberBeforeTheMatch) {
    imv1_standin::SetLenses({nullptr, "C7SST", nullptr, "B5SST"});
    EXPECT_EQ(3, ImmervisionDewarper::GetDefaultLens(7, "Samsung", "SNF-7010"));
}

TEST_F(ImmervisionDewarperTest, DefaultLensIsTheFirstOfTwoEqualEntries) {
    imv1_standin::SetLenses({"A8TRT", "C8WWT", "C8WWT"});
    EXPECT_EQ(1, ImmervisionDewarper::GetDefaultLens(7, "Samsung", "PNF-9010"));
}

TEST_F(ImmervisionDewarperTest, DefaultLensMissingFromTheListIsZero) {
    imv1_standin::SetLenses({"A8TRT", nullptr, "C7SST"});
    EXPECT_EQ(0, ImmervisionDewarper::GetDefaultLens(7, "Samsung", "SNF-7010"));
}

TEST_F(ImmervisionDewarperTest, TheLensCountOfTheLibraryBoundsTheIndex) {
    imv1_standin::SetLenses({"A8TRT", "B5SST"});
    Create(Camera(CEILING, 2));
    char text[32] = "unset";
    EXPECT_EQ(0, dewarper->GetLens(2, text, sizeof text));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_TRUE(CallsOf("SetLens").empty());
}

TEST_F(ImmervisionDewarperTest, DestructorDestroysTheCameraItMadeAndNothingElse) {
    int const live = imv1_standin::LiveObjects();
    Create(Camera(CEILING));
    FirstFrame();
    void const* const camera = dewarper->camera;
    EXPECT_EQ(live + 1, imv1_standin::LiveObjects());
    dewarper.reset();
    EXPECT_EQ((Names{"~IMV_CameraInterface"}), imv1_standin::CallNames());
    EXPECT_EQ(camera, imv1_standin::Calls()[0].object);
    EXPECT_EQ(live, imv1_standin::LiveObjects());
}

TEST_F(ImmervisionDewarperTest, DestructorWithoutACameraCallsNothing) {
    Create(Camera(CEILING));
    dewarper->Pan(1, 0);
    dewarper.reset();
    EXPECT_TRUE(imv1_standin::Calls().empty());
}

TEST_F(ImmervisionDewarperTest, TwoDewarpersDriveTwoCameras) {
    Create(Camera(CEILING));
    Probe other(Camera(WALL));
    FirstFrame();
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = -1;
    ASSERT_TRUE(other.GetImageInputBuffer(32, 16, &buffer, &size, &format));
    int width = 32;
    int height = 16;
    ASSERT_TRUE(other.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    ASSERT_NE(nullptr, other.camera);
    EXPECT_NE(dewarper->camera, other.camera);
    for (Call const& call : imv1_standin::Calls()) {
        if (call.function.rfind("Static", 0) != 0) {
            EXPECT_EQ(other.camera, call.object) << call.function;
        }
    }
    EXPECT_EQ(32u, OnlyCallOf("SetVideoParams").input.width);
}

}  // namespace
