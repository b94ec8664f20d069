#include <cmath>
#include <cstring>
#include <ostream>
#include <vector>

#include <gtest/gtest.h>

#include "IDewarperBase.h"

namespace {

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

// A backend-less dewarper on the base's defaults that counts what the base asks of it.
class RecordingDewarper : public IDewarperBaseT<DewarperType::DewarperOncam> {
public:
    explicit RecordingDewarper(int position, float default_zoom = 1.0f)
        : IDewarperBaseT(Position(position)), defaultZoom(default_zoom) {
        Clear();
    }

    bool Check() override {
        ++checks;
        return backendReady;
    }
    void SetSubMode(int newSubMode) override { subMode = newSubMode == 0 ? 1 : newSubMode; }
    void Clear() override {
        ++clears;
        pan = 0.0f;
        tilt = 0.0f;
        zoom = defaultZoom;
    }

    float Pan() const { return pan; }
    float Tilt() const { return tilt; }
    float Zoom() const { return zoom; }
    bool Dirty() const { return optionsDirty; }
    DewarperType::DewarperTypes Type() const { return type; }
    void PlaceAt(float newPan, float newTilt, float newZoom) {
        pan = newPan;
        tilt = newTilt;
        zoom = newZoom;
    }
    void ResetToHome() { ResetPosition(); }

    using IDewarper::Pan;
    using IDewarper::Tilt;
    using IDewarper::Zoom;

    bool backendReady = true;
    bool setupSucceeds = true;
    int checks = 0;
    int clears = 0;
    int setups = 0;
    int updates = 0;
    std::vector<float> updatedPans;

protected:
    bool InitOptions() override {
        ++setups;
        if (!setupSucceeds) {
            return false;
        }
        UpdatePosition();
        return true;
    }
    void UpdatePosition() override {
        ++updates;
        updatedPans.push_back(pan);
    }

private:
    static DewarpParams_t Position(int position) {
        DewarpParams_t params;
        params.position = position;
        return params;
    }

    float defaultZoom;
};

// Runs the first output frame, after which positions reach the backend.
void StartFrames(RecordingDewarper& dewarper) {
    int width = 64;
    int height = 32;
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = 0;
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
}

TEST(IDewarperBase, PanWithAZeroDirectionStaysButStillLimitsAndUpdates) {
    RecordingDewarper dewarper(WALL);
    StartFrames(dewarper);
    dewarper.PlaceAt(10.0f, 0.0f, 500.0f);
    int const updates = dewarper.updates;
    dewarper.Pan(0, 5);
    EXPECT_EQ(10.0f, dewarper.Pan());
    EXPECT_EQ(200.0f, dewarper.Zoom());
    EXPECT_EQ(updates + 1, dewarper.updates);
}

TEST(IDewarperBase, OnePanStepIsAFifthOfAUnitAndSpeedAddsSteps) {
    RecordingDewarper dewarper(WALL);
    dewarper.Pan(1, 0);
    EXPECT_FLOAT_EQ(0.2f, dewarper.Pan());
    dewarper.Pan(-3, 4);
    EXPECT_FLOAT_EQ(-0.8f, dewarper.Pan());
}

TEST(IDewarperBase, PanStepsOnTheCeilingRangeAreAFifthOfAUnitToo) {
    RecordingDewarper dewarper(CEILING);
    dewarper.PlaceAt(10.0f, 10.0f, 1.0f);
    dewarper.Pan(7, 2);
    EXPECT_FLOAT_EQ(10.6f, dewarper.Pan());
}

TEST(IDewarperBase, PositiveTiltDirectionLowersTilt) {
    RecordingDewarper dewarper(WALL);
    dewarper.Tilt(1, 0);
    EXPECT_FLOAT_EQ(-0.2f, dewarper.Tilt());
    dewarper.Tilt(-2, 1);
    EXPECT_FLOAT_EQ(0.2f, dewarper.Tilt());
}

TEST(IDewarperBase, ZoomStepsByTheModifierWithoutARange) {
    RecordingDewarper dewarper(WALL);
    dewarper.Zoom(1, 2);
    EXPECT_FLOAT_EQ(4.0f, dewarper.Zoom());
    dewarper.Zoom(-1, 9);
    EXPECT_FLOAT_EQ(0.0f, dewarper.Zoom());
}

TEST(IDewarperBase, ZoomIsClampedToZeroToTwoHundred) {
    RecordingDewarper dewarper(WALL);
    dewarper.SetPosition(1.0f, 1.0f, 250.0f);
    EXPECT_EQ(200.0f, dewarper.Zoom());
    dewarper.SetPosition(1.0f, 1.0f, -3.0f);
    EXPECT_EQ(0.0f, dewarper.Zoom());
}

TEST(IDewarperBase, WallPanStopsAtPlusAndMinusNinety) {
    RecordingDewarper dewarper(WALL);
    dewarper.PlaceAt(89.9f, 0.0f, 1.0f);
    dewarper.Pan(1, 0);
    EXPECT_EQ(90.0f, dewarper.Pan());
    dewarper.PlaceAt(-89.9f, 0.0f, 1.0f);
    dewarper.Pan(-1, 0);
    EXPECT_EQ(-90.0f, dewarper.Pan());
}

TEST(IDewarperBase, CeilingPanWrapsAroundTheCircle) {
    RecordingDewarper dewarper(CEILING);
    dewarper.PlaceAt(359.9f, 0.0f, 1.0f);
    dewarper.Pan(1, 0);
    EXPECT_NEAR(0.1f, dewarper.Pan(), 1e-4f);
    dewarper.PlaceAt(0.0f, 0.0f, 1.0f);
    dewarper.Pan(-1, 0);
    EXPECT_NEAR(359.8f, dewarper.Pan(), 1e-4f);
}

TEST(IDewarperBase, WrappedPanOfAFullTurnBecomesZero) {
    RecordingDewarper dewarper(CEILING);
    dewarper.SetPosition(360.0f, 10.0f, 1.0f);
    EXPECT_EQ(0.0f, dewarper.Pan());
    dewarper.SetPosition(-1000.0f, 10.0f, 1.0f);
    EXPECT_NEAR(80.0f, dewarper.Pan(), 1e-3f);
    dewarper.SetPosition(1000.0f, 10.0f, 1.0f);
    EXPECT_NEAR(280.0f, dewarper.Pan(), 1e-3f);
}

TEST(IDewarperBase, NotANumberEndsAtTheLowerLimit) {
    RecordingDewarper dewarper(CEILING);
    dewarper.SetPosition(std::nanf(""), std::nanf(""), std::nanf(""));
    EXPECT_EQ(0.0f, dewarper.Pan());
    EXPECT_EQ(0.0f, dewarper.Tilt());
    EXPECT_EQ(0.0f, dewarper.Zoom());
    dewarper.SetPosition(INFINITY, -INFINITY, INFINITY);
    EXPECT_EQ(0.0f, dewarper.Pan());
    EXPECT_EQ(0.0f, dewarper.Tilt());
    EXPECT_EQ(200.0f, dewarper.Zoom());
}

TEST(IDewarperBase, TiltRangesFollowTheMount) {
    RecordingDewarper wall(WALL);
    wall.SetPosition(1.0f, -120.0f, 1.0f);
    EXPECT_EQ(-90.0f, wall.Tilt());
    RecordingDewarper ceiling(CEILING);
    ceiling.SetPosition(1.0f, -10.0f, 1.0f);
    EXPECT_EQ(0.0f, ceiling.Tilt());
    ceiling.SetPosition(1.0f, 100.0f, 1.0f);
    EXPECT_EQ(90.0f, ceiling.Tilt());
    RecordingDewarper floor(FLOOR);
    floor.SetPosition(1.0f, 10.0f, 1.0f);
    EXPECT_EQ(0.0f, floor.Tilt());
    floor.SetPosition(1.0f, -100.0f, 1.0f);
    EXPECT_EQ(-90.0f, floor.Tilt());
    RecordingDewarper other(7);
    other.SetPosition(400.0f, 100.0f, 1.0f);
    EXPECT_EQ(90.0f, other.Tilt());
    EXPECT_NEAR(40.0f, other.Pan(), 1e-4f);
}

TEST(IDewarperBase, SetPositionOfAllZeroesGoesHomeInSubModeOne) {
    RecordingDewarper dewarper(CEILING, 3.0f);
    dewarper.SetSubMode(2);
    dewarper.PlaceAt(50.0f, 20.0f, 9.0f);
    dewarper.SetPosition(0.0f, 0.0f, 0.0f);
    EXPECT_EQ(1, dewarper.SubMode());
    EXPECT_EQ(0.0f, dewarper.Pan());
    EXPECT_EQ(0.0f, dewarper.Tilt());
    EXPECT_EQ(3.0f, dewarper.Zoom());
}

TEST(IDewarperBase, SetPositionWithAnyValueNotZeroDoesNotGoHome) {
    RecordingDewarper dewarper(CEILING, 3.0f);
    dewarper.SetSubMode(2);
    int const clears = dewarper.clears;
    dewarper.SetPosition(0.0f, 0.0f, 1.0f);
    EXPECT_EQ(2, dewarper.SubMode());
    EXPECT_EQ(1.0f, dewarper.Zoom());
    EXPECT_EQ(clears, dewarper.clears);
}

TEST(IDewarperBase, ResetWithAllZeroDefaultsLimitsAndUpdatesOnceWithoutRecursion) {
    RecordingDewarper dewarper(CEILING, 0.0f);
    StartFrames(dewarper);
    int const updates = dewarper.updates;
    int const clears = dewarper.clears;
    dewarper.ResetToHome();
    EXPECT_EQ(clears + 1, dewarper.clears);
    EXPECT_EQ(updates + 1, dewarper.updates);
}

TEST(IDewarperBase, OutputSizeIsRoundedUpAndWrittenBack) {
    RecordingDewarper dewarper(WALL);
    int width = 641;
    int height = 361;
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = -1;
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_EQ(648, width);
    EXPECT_EQ(362, height);
    EXPECT_EQ(3, format);
    EXPECT_EQ(648u * 362u * 3u, size);
    EXPECT_NE(nullptr, buffer);
}

TEST(IDewarperBase, TheSameOutputSizeReusesTheBufferWithoutANewSetup) {
    RecordingDewarper dewarper(WALL);
    int width = 64;
    int height = 32;
    unsigned char* first = nullptr;
    unsigned char* second = nullptr;
    unsigned int size = 0;
    int format = 0;
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &first, &size, &format));
    EXPECT_EQ(1, dewarper.setups);
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &second, &size, &format));
    EXPECT_EQ(first, second);
    EXPECT_EQ(1, dewarper.setups);
    EXPECT_FALSE(dewarper.Dirty());
}

TEST(IDewarperBase, ANewOutputSizeSetsTheBackendUpAgain) {
    RecordingDewarper dewarper(WALL);
    StartFrames(dewarper);
    int width = 128;
    int height = 64;
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = 0;
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_EQ(2, dewarper.setups);
}

TEST(IDewarperBase, NewBuffersStartBlack) {
    RecordingDewarper dewarper(WALL);
    unsigned char* input = nullptr;
    unsigned int size = 0;
    int format = 0;
    ASSERT_TRUE(dewarper.GetImageInputBuffer(10, 6, &input, &size, &format));
    EXPECT_EQ(std::vector<unsigned char>(size, 0), std::vector<unsigned char>(input, input + size));
    int width = 16;
    int height = 8;
    unsigned char* output = nullptr;
    ASSERT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &output, &size, &format));
    EXPECT_EQ(std::vector<unsigned char>(size, 0),
              std::vector<unsigned char>(output, output + size));
}

TEST(IDewarperBase, InputBufferIsKeptForTheSameSizeAndReplacedForANewOne) {
    RecordingDewarper dewarper(WALL);
    StartFrames(dewarper);
    unsigned char* first = nullptr;
    unsigned char* again = nullptr;
    unsigned int size = 0;
    int format = 0;
    ASSERT_TRUE(dewarper.GetImageInputBuffer(20, 10, &first, &size, &format));
    EXPECT_EQ(600u, size);
    EXPECT_EQ(3, format);
    EXPECT_TRUE(dewarper.Dirty());
    StartFrames(dewarper);
    ASSERT_TRUE(dewarper.GetImageInputBuffer(20, 10, &again, &size, &format));
    EXPECT_EQ(first, again);
    EXPECT_FALSE(dewarper.Dirty());
    ASSERT_TRUE(dewarper.GetImageInputBuffer(21, 10, &again, &size, &format));
    EXPECT_EQ(630u, size);
    EXPECT_TRUE(dewarper.Dirty());
}

TEST(IDewarperBase, WithoutABackendNeitherBufferIsGivenAndTheOutputsStayAsTheyWere) {
    RecordingDewarper dewarper(WALL);
    dewarper.backendReady = false;
    unsigned char sentinel = 0;
    unsigned char* buffer = &sentinel;
    unsigned int size = 77;
    int format = 77;
    EXPECT_FALSE(dewarper.GetImageInputBuffer(8, 8, &buffer, &size, &format));
    int width = 9;
    int height = 9;
    EXPECT_FALSE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_EQ(&sentinel, buffer);
    EXPECT_EQ(77u, size);
    EXPECT_EQ(9, width);
}

TEST(IDewarperBase, AFailedSetupFailsTheFrameAndLeavesTheFlagClear) {
    RecordingDewarper dewarper(WALL);
    dewarper.setupSucceeds = false;
    int width = 64;
    int height = 32;
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = 0;
    EXPECT_FALSE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_FALSE(dewarper.Dirty());
    EXPECT_TRUE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_EQ(1, dewarper.setups);
}

TEST(IDewarperBase, NegativeOrOversizedFramesAreRefused) {
    RecordingDewarper dewarper(WALL);
    unsigned char* buffer = nullptr;
    unsigned int size = 0;
    int format = 0;
    EXPECT_FALSE(dewarper.GetImageInputBuffer(-1, 10, &buffer, &size, &format));
    EXPECT_FALSE(dewarper.GetImageInputBuffer(65536, 65536, &buffer, &size, &format));
    int width = -8;
    int height = 8;
    EXPECT_FALSE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    width = 2147483647;
    height = 2147483647;
    EXPECT_FALSE(dewarper.GetImageOutputBuffer(&width, &height, &buffer, &size, &format));
    EXPECT_EQ(nullptr, buffer);
}

TEST(IDewarperBase, MissingResultPointersAreRefused) {
    RecordingDewarper dewarper(WALL);
    unsigned int size = 0;
    int format = 0;
    EXPECT_FALSE(dewarper.GetImageInputBuffer(8, 8, nullptr, &size, &format));
    int height = 8;
    unsigned char* buffer = nullptr;
    EXPECT_FALSE(dewarper.GetImageOutputBuffer(nullptr, &height, &buffer, &size, &format));
}

TEST(IDewarperBase, EmptyFramesAreGiven) {
    RecordingDewarper dewarper(WALL);
    unsigned char* buffer = nullptr;
    unsigned int size = 9;
    int format = 0;
    EXPECT_TRUE(dewarper.GetImageInputBuffer(0, 0, &buffer, &size, &format));
    EXPECT_EQ(0u, size);
    EXPECT_NE(nullptr, buffer);
}

TEST(IDewarperBase, BeforeTheFirstOutputFrameAPanChangesThePositionButNotTheBackend) {
    RecordingDewarper dewarper(WALL);
    dewarper.Pan(1, 0);
    EXPECT_FLOAT_EQ(0.2f, dewarper.Pan());
    EXPECT_EQ(0, dewarper.updates);
    StartFrames(dewarper);
    ASSERT_EQ(1, dewarper.updates);
    EXPECT_FLOAT_EQ(0.2f, dewarper.updatedPans.back());
    dewarper.Pan(1, 0);
    EXPECT_EQ(2, dewarper.updates);
}

TEST(IDewarperBase, PanTiltAndZoomAreAllowedOnlyInSubModeOneWhateverTheArgument) {
    RecordingDewarper dewarper(WALL);
    EXPECT_TRUE(dewarper.CanPan(2));
    EXPECT_TRUE(dewarper.CanTilt(3));
    EXPECT_TRUE(dewarper.CanZoom(0));
    dewarper.SetSubMode(2);
    EXPECT_FALSE(dewarper.CanPan(1));
    EXPECT_FALSE(dewarper.CanTilt(1));
    EXPECT_FALSE(dewarper.CanZoom(1));
}

TEST(IDewarperBase, ModeIsTheClassNumberWhateverTypeItIsTold) {
    RecordingDewarper dewarper(WALL);
    dewarper.SetDewarperType(DewarperType::DewarperSamsung);
    EXPECT_EQ(4, dewarper.Mode());
    EXPECT_EQ(DewarperType::DewarperSamsung, dewarper.Type());
}

TEST(IDewarperBase, CommonAnswers) {
    RecordingDewarper dewarper(FLOOR);
    EXPECT_FALSE(dewarper.GetNeedsRotation());
    EXPECT_FALSE(dewarper.GetFlipVertical());
    EXPECT_FALSE(dewarper.GetFlipHorizontal());
    EXPECT_EQ(9.0f, dewarper.AdjustAspectRatio(16.0f, 9.0f));
    EXPECT_EQ(2, dewarper.Parameters()->position);
    char buffer[4] = "abc";
    EXPECT_EQ(0, dewarper.GetLens(0, buffer, sizeof buffer));
    EXPECT_STREQ("abc", buffer);
    float pan = 1;
    float tilt = 1;
    float zoom = 0;
    dewarper.GetPosition(pan, tilt, zoom);
    EXPECT_EQ(0.0f, pan);
    EXPECT_EQ(0.0f, tilt);
    EXPECT_EQ(1.0f, zoom);
}

// The field table of every registered kind, read on dewarpers that the registry made. The
// fields are the base's: a class that derives from it may form pointers to them, and those reach
// the same fields of any dewarper.
struct BaseFields : IDewarperBase {
    using Field = float IDewarperBase::*;
    static DewarpParams_t IDewarperBase::*Params() { return &BaseFields::params; }
    static DewarperType::DewarperTypes IDewarperBase::*Type() { return &BaseFields::type; }
    static int IDewarperBase::*InputWidth() { return &BaseFields::inputWidth; }
    static int IDewarperBase::*InputHeight() { return &BaseFields::inputHeight; }
    static int IDewarperBase::*OutputWidth() { return &BaseFields::outputWidth; }
    static int IDewarperBase::*OutputHeight() { return &BaseFields::outputHeight; }
    static int IDewarperBase::*SubModeField() { return &BaseFields::subMode; }
    static bool IDewarperBase::*OptionsDirty() { return &BaseFields::optionsDirty; }
    static Field PanField() { return &BaseFields::pan; }
    static Field TiltField() { return &BaseFields::tilt; }
    static Field ZoomField() { return &BaseFields::zoom; }
    static unsigned char* IDewarperBase::*InputBuffer() { return &BaseFields::inputBuffer; }
    static unsigned char* IDewarperBase::*OutputBuffer() { return &BaseFields::outputBuffer; }
};

struct KindDefaults {
    int mode;
    float zoom;  // what Clear() gives; pan and tilt are 0 for every kind
};

std::ostream& operator<<(std::ostream& out, KindDefaults const& kind) {
    return out << "mode " << kind.mode;
}

class FieldTableTest : public ::testing::TestWithParam<KindDefaults> {
protected:
    static DewarpParams_t CameraParams() {
        DewarpParams_t params;
        params.lens = 1;
        params.position = CEILING;
        params.panoramaOffset = 15;
        params.circleX = 320;
        params.circleY = 240;
        params.circleRadius = 230;
        params.extra = strdup("camera 7");
        return params;
    }

    void SetUp() override {
        dewarper = static_cast<IDewarperBase*>(CreateDewarper(GetParam().mode, given));
        ASSERT_NE(nullptr, dewarper);
    }
    void TearDown() override { DeleteDewarper(dewarper); }

    DewarpParams_t const given = CameraParams();
    IDewarperBase* dewarper = nullptr;
};

TEST_P(FieldTableTest, ANewDewarperHoldsADeepCopyOfItsParameters) {
    DewarpParams_t const& held = dewarper->*BaseFields::Params();
    EXPECT_EQ(&held, dewarper->Parameters());
    EXPECT_EQ(1, held.lens);
    EXPECT_EQ(CEILING, held.position);
    EXPECT_EQ(15, held.panoramaOffset);
    EXPECT_EQ(320, held.circleX);
    EXPECT_EQ(240, held.circleY);
    EXPECT_EQ(230, held.circleRadius);
    ASSERT_NE(nullptr, held.extra);
    EXPECT_NE(given.extra, held.extra);
    EXPECT_STREQ("camera 7", held.extra);
}

TEST_P(FieldTableTest, ANewDewarperHasNoBuffersAndItsBackendStillToSetUp) {
    EXPECT_EQ(0, dewarper->*BaseFields::InputWidth());
    EXPECT_EQ(0, dewarper->*BaseFields::InputHeight());
    EXPECT_EQ(0, dewarper->*BaseFields::OutputWidth());
    EXPECT_EQ(0, dewarper->*BaseFields::OutputHeight());
    EXPECT_EQ(nullptr, dewarper->*BaseFields::InputBuffer());
    EXPECT_EQ(nullptr, dewarper->*BaseFields::OutputBuffer());
    EXPECT_TRUE(dewarper->*BaseFields::OptionsDirty());
    EXPECT_EQ(1, dewarper->*BaseFields::SubModeField());
    EXPECT_EQ(1, dewarper->SubMode());
}

// The registry tells each dewarper the mode it was made for; the constructor leaves 0.
TEST_P(FieldTableTest, ANewDewarperKnowsTheModeItWasMadeFor) {
    EXPECT_EQ(GetParam().mode, int(dewarper->*BaseFields::Type()));
}

TEST_P(FieldTableTest, ANewDewarperStartsAtTheDefaultsOfItsKind) {
    EXPECT_EQ(0.0f, dewarper->*BaseFields::PanField());
    EXPECT_EQ(0.0f, dewarper->*BaseFields::TiltField());
    EXPECT_EQ(GetParam().zoom, dewarper->*BaseFields::ZoomField());
}

TEST_P(FieldTableTest, ANewDewarperIsWhereClearPutsIt) {
    float const pan = dewarper->*BaseFields::PanField();
    float const tilt = dewarper->*BaseFields::TiltField();
    float const zoom = dewarper->*BaseFields::ZoomField();
    dewarper->*BaseFields::ZoomField() = 3.0f;
    dewarper->Clear();
    EXPECT_EQ(pan, dewarper->*BaseFields::PanField());
    EXPECT_EQ(tilt, dewarper->*BaseFields::TiltField());
    EXPECT_EQ(zoom, dewarper->*BaseFields::ZoomField());
}

INSTANTIATE_TEST_SUITE_P(EveryRegisteredKind, FieldTableTest,
                         ::testing::Values(KindDefaults{DewarperType::DewarperImmervision, 180.0f},
                                           KindDefaults{DewarperType::DewarperSentry360, 0.7f},
                                           KindDefaults{DewarperType::DewarperVivotek, 70.0f},
                                           KindDefaults{DewarperType::DewarperSamsung, 180.0f},
                                           KindDefaults{DewarperType::DewarperBrenvia, 0.5f},
                                           KindDefaults{DewarperType::DewarperGeovision, 20.0f}));

}  // namespace
