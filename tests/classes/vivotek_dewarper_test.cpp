#include <cstring>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "VivotekDewarper.h"
#include "VivotekLibrary.h"
#include "dewarper_abilities.h"
#include "fisheyesw_standin.h"

namespace {

using fisheyesw_standin::Call;
using Names = std::vector<std::string>;

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

DewarpParams_t Camera(int position, int lens = 0, int panoramaOffset = 0) {
    DewarpParams_t params;
    params.position = position;
    params.lens = lens;
    params.panoramaOffset = panoramaOffset;
    return params;
}

/// The dewarper with its protected parts in reach.
class Probe : public VivotekDewarper {
public:
    explicit Probe(DewarpParams_t const& creationParams) : VivotekDewarper(creationParams) {}
    using VivotekDewarper::GetFormatAndSize;
    using VivotekDewarper::GetZoomScaleModifier;
    using VivotekDewarper::handle;
    using VivotekDewarper::LimitZoomRange;
    int InputWidth() const { return inputWidth; }
    int InputHeight() const { return inputHeight; }
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

// A record naming one field, as the position updates send it; the caller sets the field.
Fisheye_Option Only(uint32_t flag) {
    Fisheye_Option option{};
    option.flags = flag;
    return option;
}

bool SameRecord(Fisheye_Option const& expected, Fisheye_Option const& actual) {
    return std::memcmp(&expected, &actual, sizeof expected) == 0;
}

std::vector<uint32_t> FlagsOf(std::vector<Fisheye_Option> const& options) {
    std::vector<uint32_t> flags;
    for (Fisheye_Option const& option : options) {
        flags.push_back(option.flags);
    }
    return flags;
}

std::vector<Call> CallsOf(std::string const& function) {
    std::vector<Call> found;
    for (Call const& call : fisheyesw_standin::Calls()) {
        if (call.function == function) {
            found.push_back(call);
        }
    }
    return found;
}

Call OnlyCallOf(std::string const& function) {
    std::vector<Call> const found = CallsOf(function);
    EXPECT_EQ(1u, found.size()) << function;
    return found.empty() ? Call() : found.front();
}

// Luma and the two chroma planes each tell the place of every sample, in different ranges.
unsigned char LumaAt(int x, int y) {
    return static_cast<unsigned char>((x + 3 * y) & 0x7F);
}

unsigned char ChromaAt(int plane, int x, int y) {
    return static_cast<unsigned char>(128 + plane * 60 + ((x + 5 * y) % 50));
}

// Every test holds a reference to the stand-in library, as the registry does for a loaded kind,
// and drops its dewarper before letting the reference go.
class VivotekDewarperTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(VivotekLibraryInstance.Acquire());
        fisheyesw_standin::Reset();
    }

    void TearDown() override {
        dewarper.reset();
        VivotekLibraryInstance.Release();
        fisheyesw_standin::Reset();
    }

    Probe& Create(DewarpParams_t const& params) {
        dewarper = std::make_unique<Probe>(params);
        return *dewarper;
    }

    void Feed(int width, int height) {
        unsigned int size = 0;
        int format = -1;
        ASSERT_TRUE(dewarper->GetImageInputBuffer(width, height, &input, &size, &format));
        ASSERT_EQ(0, format);
        ASSERT_EQ(unsigned(width * height * 3 / 2), size);
        inputWidth = width;
        inputHeight = height;
        for (int y = 0; y < height; ++y) {
            for (int x = 0; x < width; ++x) {
                input[y * width + x] = LumaAt(x, y);
            }
        }
        unsigned char* chroma = input + width * height;
        for (int plane = 0; plane < 2; ++plane) {
            for (int y = 0; y < height / 2; ++y) {
                for (int x = 0; x < width / 2; ++x) {
                    *chroma++ = ChromaAt(plane, x, y);
                }
            }
        }
    }

    bool Frame(int width = 80, int height = 60) {
        outputWidth = width;
        outputHeight = height;
        return dewarper->GetImageOutputBuffer(&outputWidth, &outputHeight, &output, &outputSize,
                                              &outputFormat);
    }

    // A first frame of 64 by 48 into 80 by 60, after which only the calls of later steps are kept.
    void FirstFrame() {
        Feed(64, 48);
        ASSERT_TRUE(Frame());
        fisheyesw_standin::ClearCalls();
    }

    std::unique_ptr<Probe> dewarper;
    unsigned char* input = nullptr;
    int inputWidth = 0;
    int inputHeight = 0;
    unsigned char* output = nullptr;
    int outputWidth = 0;
    int outputHeight = 0;
    unsigned int outputSize = 0;
    int outputFormat = -1;
};

TEST(VivotekDewarper, WithoutTheLibraryCheckIsFalseAndNoCallReachesIt) {
    ASSERT_FALSE(VivotekLibraryInstance.IsOpen());
    fisheyesw_standin::Reset();
    {
        Probe dewarper(Camera(CEILING, 3));
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
        EXPECT_EQ(nullptr, dewarper.handle);
    }
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST(VivotekDewarper, TheLensListNeedsNoLibrary) {
    ASSERT_FALSE(VivotekLibraryInstance.IsOpen());
    Probe dewarper(Camera(CEILING));
    char name[16] = {};
    EXPECT_EQ(6, dewarper.GetLens(5, name, sizeof name));
    EXPECT_STREQ("VC8201", name);
}

TEST_F(VivotekDewarperTest, IsModeThreeAndStartsAtZoomSeventyInSubModeOne) {
    Create(Camera(CEILING));
    EXPECT_EQ(3, dewarper->Mode());
    EXPECT_EQ(1, dewarper->SubMode());
    Position const start = Where(*dewarper);
    EXPECT_EQ(0.0f, start.pan);
    EXPECT_EQ(0.0f, start.tilt);
    EXPECT_EQ(70.0f, start.zoom);
    EXPECT_EQ(nullptr, dewarper->handle);
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST_F(VivotekDewarperTest, CheckMakesTheObjectOnceWithVersion0x30303133) {
    Create(Camera(CEILING));
    int const live = fisheyesw_standin::LiveObjects();
    EXPECT_TRUE(dewarper->Check());
    EXPECT_TRUE(dewarper->Check());
    Call const initial = OnlyCallOf("Fisheye_Initial");
    EXPECT_EQ(0x30303133u, initial.version);
    EXPECT_EQ(&dewarper->handle, initial.handleAddress);
    EXPECT_NE(nullptr, dewarper->handle);
    EXPECT_EQ(initial.handle, dewarper->handle);
    EXPECT_EQ(live + 1, fisheyesw_standin::LiveObjects());
}

TEST_F(VivotekDewarperTest, AFailedInitialIsFalseAndAskedAgainAtTheNextCheck) {
    Create(Camera(CEILING));
    fisheyesw_standin::SetResult("Fisheye_Initial", 4);
    EXPECT_FALSE(dewarper->Check());
    EXPECT_EQ(nullptr, dewarper->handle);
    fisheyesw_standin::SetResult("Fisheye_Initial", 0);
    EXPECT_TRUE(dewarper->Check());
    EXPECT_EQ((Names{"Fisheye_Initial", "Fisheye_Initial"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, FirstFrameNamesTheLensSetsUpSendsThePositionAndDewarps) {
    Create(Camera(WALL));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(
        (Names{"Fisheye_Initial", "Fisheye_SetModelName", "Fisheye_SetOption", "Fisheye_SetOption",
               "Fisheye_SetOption", "Fisheye_SetOption", "Fisheye_OneFrame"}),
        fisheyesw_standin::CallNames());
    EXPECT_EQ((std::vector<uint32_t>{0x20FF, 0x0800, 0x0200, 0x0100}),
              FlagsOf(fisheyesw_standin::Options()));
    for (Call const& call : fisheyesw_standin::Calls()) {
        EXPECT_EQ(dewarper->handle, call.handle) << call.function;
    }
}

TEST_F(VivotekDewarperTest, LaterFramesOnlyDewarp) {
    Create(Camera(CEILING));
    FirstFrame();
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ((Names{"Fisheye_OneFrame", "Fisheye_OneFrame"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, SetupRecordDescribesBothBuffersAFullFrameCircleAndTheView) {
    Create(Camera(FLOOR, 4, 30));
    dewarper->SetSubMode(2);
    Feed(64, 48);
    ASSERT_TRUE(Frame(80, 60));
    Fisheye_Option expected = Only(0x20FF);
    expected.inputWidth = 64;
    expected.inputHeight = 48;
    expected.inputStride = 64;
    expected.inputFormat = 0;
    expected.input = input;
    expected.outputWidth = 80;
    expected.outputHeight = 60;
    expected.outputStride = 80;
    expected.outputFormat = 0;
    expected.output = output;
    expected.centerX = 32;
    expected.centerY = 24;
    expected.radius = 24;
    expected.mount = 2;
    expected.dewarpType = 1;
    expected.left = 0;
    expected.top = 0;
    expected.width = 80;
    expected.height = 60;
    Fisheye_Option const setup = fisheyesw_standin::Options().at(0);
    EXPECT_EQ(0x20FFu, setup.flags);
    EXPECT_EQ(0u, setup.reserved);
    EXPECT_EQ(64, setup.inputWidth);
    EXPECT_EQ(48, setup.inputHeight);
    EXPECT_EQ(64, setup.inputStride);
    EXPECT_EQ(0, setup.inputFormat);
    EXPECT_EQ(input, setup.input);
    EXPECT_EQ(80, setup.outputWidth);
    EXPECT_EQ(60, setup.outputHeight);
    EXPECT_EQ(80, setup.outputStride);
    EXPECT_EQ(0, setup.outputFormat);
    EXPECT_EQ(output, setup.output);
    EXPECT_EQ(32, setup.centerX);
    EXPECT_EQ(24, setup.centerY);
    EXPECT_EQ(24, setup.radius);
    EXPECT_EQ(2, setup.mount);
    EXPECT_EQ(1, setup.dewarpType);
    EXPECT_EQ(0, setup.left);
    EXPECT_EQ(0, setup.top);
    EXPECT_EQ(80, setup.width);
    EXPECT_EQ(60, setup.height);
    EXPECT_TRUE(SameRecord(expected, setup));
}

TEST_F(VivotekDewarperTest, TheCircleIsHalfTheInputHeightWhateverTheParametersSay) {
    DewarpParams_t params = Camera(CEILING);
    params.circleX = 5;
    params.circleY = 6;
    params.circleRadius = 7;
    Create(params);
    Feed(96, 50);
    ASSERT_TRUE(Frame());
    Fisheye_Option const setup = fisheyesw_standin::Options().at(0);
    EXPECT_EQ(48, setup.centerX);
    EXPECT_EQ(25, setup.centerY);
    EXPECT_EQ(25, setup.radius);
}

TEST_F(VivotekDewarperTest, OutputKeepsTheHostsSizeRoundedUp) {
    Create(Camera(CEILING));
    Feed(64, 48);
    ASSERT_TRUE(Frame(100, 51));
    EXPECT_EQ(104, outputWidth);
    EXPECT_EQ(52, outputHeight);
    EXPECT_EQ(0, outputFormat);
    EXPECT_EQ(104u * 52u * 3u / 2u, outputSize);
    EXPECT_EQ(104, fisheyesw_standin::Options().at(0).width);
}

struct DewarpTypeCase {
    int subMode;
    int32_t dewarpType;
};

void PrintTo(DewarpTypeCase const& type, std::ostream* out) {
    *out << "sub-mode " << type.subMode;
}

class VivotekDewarpTypeTest : public VivotekDewarperTest,
                              public ::testing::WithParamInterface<DewarpTypeCase> {};

TEST_P(VivotekDewarpTypeTest, DewarpTypeFollowsTheSubMode) {
    DewarpTypeCase const expected = GetParam();
    Create(Camera(CEILING));
    dewarper->SetSubMode(expected.subMode);
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(expected.dewarpType, fisheyesw_standin::Options().at(0).dewarpType);
}

INSTANTIATE_TEST_SUITE_P(SubModes, VivotekDewarpTypeTest,
                         ::testing::Values(DewarpTypeCase{1, 0}, DewarpTypeCase{2, 1},
                                           DewarpTypeCase{3, 2}, DewarpTypeCase{4, 0}));

struct LensCase {
    int lens;
    char const* name;
};

void PrintTo(LensCase const& lens, std::ostream* out) {
    *out << "lens " << lens.lens;
}

class VivotekLensNameTest : public VivotekDewarperTest,
                            public ::testing::WithParamInterface<LensCase> {};

TEST_P(VivotekLensNameTest, TheLensIndexNamesTheModel) {
    LensCase const expected = GetParam();
    Create(Camera(CEILING, expected.lens));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    Call const call = OnlyCallOf("Fisheye_SetModelName");
    EXPECT_EQ(expected.name, call.name);
}

INSTANTIATE_TEST_SUITE_P(Lenses, VivotekLensNameTest,
                         ::testing::Values(LensCase{0, "FE8172"}, LensCase{1, "FE8171"},
                                           LensCase{2, "FE8172"}, LensCase{3, "FE8173"},
                                           LensCase{4, "FE8174"}, LensCase{5, "VC8201"},
                                           LensCase{6, "FE8180"}, LensCase{7, "FE8181"},
                                           LensCase{8, "FE8172"}, LensCase{-1, "FE8172"}));

TEST_F(VivotekDewarperTest, LensZeroAsksTheLibraryForFE8172ButListsDefault) {
    Create(Camera(CEILING, 0));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ("FE8172", OnlyCallOf("Fisheye_SetModelName").name);
    char name[16] = {};
    EXPECT_EQ(7, dewarper->GetLens(0, name, sizeof name));
    EXPECT_STREQ("Default", name);
}

TEST_F(VivotekDewarperTest, LensEightAlsoAsksForFE8172AndEndsTheList) {
    Create(Camera(CEILING, 8));
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ("FE8172", OnlyCallOf("Fisheye_SetModelName").name);
    char name[16] = "unset";
    EXPECT_EQ(0, dewarper->GetLens(8, name, sizeof name));
    EXPECT_STREQ("unset", name);
}

TEST_F(VivotekDewarperTest, GetLensIntoThreeBytesWritesFEAndAZeroAndReturnsSix) {
    Create(Camera(CEILING));
    char name[8] = {'x', 'x', 'x', 'x', 'x', 'x', 'x', 'x'};
    EXPECT_EQ(6, dewarper->GetLens(1, name, 3));
    EXPECT_STREQ("FE", name);
    EXPECT_EQ('x', name[3]);
}

TEST_F(VivotekDewarperTest, GetLensListsTheEightNamesInOrder) {
    Create(Camera(CEILING));
    std::vector<std::string> listed;
    char name[16] = {};
    for (int lens = 0; dewarper->GetLens(lens, name, sizeof name) != 0; ++lens) {
        listed.push_back(name);
    }
    EXPECT_EQ((std::vector<std::string>{"Default", "FE8171", "FE8172", "FE8173", "FE8174", "VC8201",
                                        "FE8180", "FE8181"}),
              listed);
}

TEST_F(VivotekDewarperTest, GetLensBelowZeroIsZeroAndWritesNothing) {
    Create(Camera(CEILING));
    char name[16] = "unset";
    EXPECT_EQ(0, dewarper->GetLens(-1, name, sizeof name));
    EXPECT_STREQ("unset", name);
}

TEST_F(VivotekDewarperTest, GetLensIntoNoBytesWritesNothingAndStillTellsTheLength) {
    Create(Camera(CEILING));
    char name[4] = "abc";
    EXPECT_EQ(6, dewarper->GetLens(3, name, 0));
    EXPECT_STREQ("abc", name);
}

TEST_F(VivotekDewarperTest, AWallCameraSendsZoomTiltAndWallPanOneFieldACall) {
    Create(Camera(WALL, 0, 45));
    FirstFrame();
    dewarper->SetPosition(12.5f, -20.0f, 123.9f);
    std::vector<Fisheye_Option> const options = fisheyesw_standin::Options();
    ASSERT_EQ(3u, options.size());
    Fisheye_Option zoom = Only(0x0800);
    zoom.zoom = 123;
    Fisheye_Option tilt = Only(0x0200);
    tilt.tilt = -20.0f;
    Fisheye_Option wallPan = Only(0x0100);
    wallPan.wallPan = 12.5f;
    EXPECT_TRUE(SameRecord(zoom, options[0]));
    EXPECT_TRUE(SameRecord(tilt, options[1]));
    EXPECT_TRUE(SameRecord(wallPan, options[2]));
}

TEST_F(VivotekDewarperTest, ACeilingCameraSendsZoomTiltPanAndRotationOneFieldACall) {
    Create(Camera(CEILING, 0, 45));
    FirstFrame();
    dewarper->SetPosition(200.0f, 30.0f, 71.5f);
    std::vector<Fisheye_Option> const options = fisheyesw_standin::Options();
    ASSERT_EQ(4u, options.size());
    Fisheye_Option zoom = Only(0x0800);
    zoom.zoom = 71;
    Fisheye_Option tilt = Only(0x0200);
    tilt.tilt = 30.0f;
    Fisheye_Option pan = Only(0x0400);
    pan.pan = 200.0f;
    Fisheye_Option rotation = Only(0x1000);
    rotation.rotation = 45.0f;
    EXPECT_TRUE(SameRecord(zoom, options[0]));
    EXPECT_TRUE(SameRecord(tilt, options[1]));
    EXPECT_TRUE(SameRecord(pan, options[2]));
    EXPECT_TRUE(SameRecord(rotation, options[3]));
}

TEST_F(VivotekDewarperTest, AFloorCameraSendsPanAndRotationLikeACeiling) {
    Create(Camera(FLOOR, 0, -90));
    FirstFrame();
    dewarper->Pan(1, 0);
    EXPECT_EQ((std::vector<uint32_t>{0x0800, 0x0200, 0x0400, 0x1000}),
              FlagsOf(fisheyesw_standin::Options()));
    EXPECT_FLOAT_EQ(0.2f, fisheyesw_standin::Options()[2].pan);
    EXPECT_EQ(-90.0f, fisheyesw_standin::Options()[3].rotation);
}

TEST_F(VivotekDewarperTest, TheSetupEndsWithThePositionSetBeforeTheFirstFrame) {
    Create(Camera(CEILING, 0, 10));
    ASSERT_TRUE(dewarper->Check());
    dewarper->SetPosition(40.0f, 50.0f, 300.0f);
    EXPECT_TRUE(fisheyesw_standin::Options().empty());
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    std::vector<Fisheye_Option> const options = fisheyesw_standin::Options();
    ASSERT_EQ(5u, options.size());
    EXPECT_EQ(300, options[1].zoom);
    EXPECT_EQ(50.0f, options[2].tilt);
    EXPECT_EQ(40.0f, options[3].pan);
    EXPECT_EQ(10.0f, options[4].rotation);
}

TEST_F(VivotekDewarperTest, APanBeforeTheFirstFrameChangesPanButDoesNotReachTheLibrary) {
    Create(Camera(CEILING));
    Feed(64, 48);
    dewarper->Pan(1, 4);
    EXPECT_FLOAT_EQ(1.0f, Where(*dewarper).pan);
    EXPECT_EQ((Names{"Fisheye_Initial"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, FailedPositionUpdatesAreIgnored) {
    Create(Camera(CEILING));
    FirstFrame();
    fisheyesw_standin::SetResult("Fisheye_SetOption", 8);
    dewarper->Tilt(-1, 0);
    EXPECT_EQ((std::vector<uint32_t>{0x0800, 0x0200, 0x0400, 0x1000}),
              FlagsOf(fisheyesw_standin::Options()));
    EXPECT_FLOAT_EQ(0.2f, Where(*dewarper).tilt);
    fisheyesw_standin::ClearCalls();
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ((Names{"Fisheye_OneFrame"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, AFailedModelNameStillSendsTheSetupButFailsAndForgetsTheInputSize) {
    Create(Camera(CEILING));
    fisheyesw_standin::SetResult("Fisheye_SetModelName", 2);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ((Names{"Fisheye_Initial", "Fisheye_SetModelName", "Fisheye_SetOption"}),
              fisheyesw_standin::CallNames());
    EXPECT_EQ(0, dewarper->InputWidth());
    EXPECT_EQ(0, dewarper->InputHeight());
}

TEST_F(VivotekDewarperTest, AFailedSetupSendsNoPositionAndNoFrame) {
    Create(Camera(CEILING));
    fisheyesw_standin::SetResult("Fisheye_SetOption", 6);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    EXPECT_EQ((Names{"Fisheye_Initial", "Fisheye_SetModelName", "Fisheye_SetOption"}),
              fisheyesw_standin::CallNames());
    EXPECT_EQ(0, dewarper->InputWidth());
}

TEST_F(VivotekDewarperTest, AfterAFailedSetupTheNextInputRequestStartsOver) {
    Create(Camera(CEILING));
    fisheyesw_standin::SetResult("Fisheye_SetOption", 6);
    Feed(64, 48);
    ASSERT_FALSE(Frame());
    fisheyesw_standin::SetResult("Fisheye_SetOption", 0);
    fisheyesw_standin::ClearCalls();
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ(
        (Names{"Fisheye_SetModelName", "Fisheye_SetOption", "Fisheye_SetOption",
               "Fisheye_SetOption", "Fisheye_SetOption", "Fisheye_SetOption", "Fisheye_OneFrame"}),
        fisheyesw_standin::CallNames());
    EXPECT_EQ(input, fisheyesw_standin::Options().at(0).input);
}

TEST_F(VivotekDewarperTest, WithoutANewInputRequestAFailedSetupIsNotTriedAgain) {
    Create(Camera(CEILING));
    fisheyesw_standin::SetResult("Fisheye_SetOption", 6);
    Feed(64, 48);
    ASSERT_FALSE(Frame());
    fisheyesw_standin::SetResult("Fisheye_SetOption", 0);
    fisheyesw_standin::ClearCalls();
    EXPECT_TRUE(Frame());
    EXPECT_EQ((Names{"Fisheye_OneFrame"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, AFailedOneFrameFailsThatFrameOnly) {
    Create(Camera(CEILING));
    FirstFrame();
    fisheyesw_standin::SetResult("Fisheye_OneFrame", 3);
    Feed(64, 48);
    EXPECT_FALSE(Frame());
    fisheyesw_standin::SetResult("Fisheye_OneFrame", 0);
    Feed(64, 48);
    EXPECT_TRUE(Frame());
    EXPECT_EQ((Names{"Fisheye_OneFrame", "Fisheye_OneFrame"}), fisheyesw_standin::CallNames());
}

TEST_F(VivotekDewarperTest, OneFrameScalesTheInputIntoTheOutputSoTheHostSeesAPicture) {
    Create(Camera(CEILING));
    Feed(64, 48);
    ASSERT_TRUE(Frame(32, 24));
    for (int y = 0; y < 24; ++y) {
        for (int x = 0; x < 32; ++x) {
            ASSERT_EQ(LumaAt(2 * x, 2 * y), output[y * 32 + x]) << x << "," << y;
        }
    }
    unsigned char const* chroma = output + 32 * 24;
    for (int plane = 0; plane < 2; ++plane) {
        for (int y = 0; y < 12; ++y) {
            for (int x = 0; x < 16; ++x) {
                ASSERT_EQ(ChromaAt(plane, 2 * x, 2 * y), *chroma++) << plane;
            }
        }
    }
}

TEST_F(VivotekDewarperTest, ClearGoesBackToZoomSeventy) {
    Create(Camera(CEILING));
    dewarper->SetPosition(40.0f, 30.0f, 600.0f);
    dewarper->Clear();
    Position const cleared = Where(*dewarper);
    EXPECT_EQ(0.0f, cleared.pan);
    EXPECT_EQ(0.0f, cleared.tilt);
    EXPECT_EQ(70.0f, cleared.zoom);
}

TEST_F(VivotekDewarperTest, ZoomStepsBy565AndIsHeldBetween70And1200) {
    Create(Camera(CEILING));
    EXPECT_FLOAT_EQ(5.65f, dewarper->GetZoomScaleModifier());
    dewarper->Zoom(1, 0);
    EXPECT_FLOAT_EQ(75.65f, Where(*dewarper).zoom);
    dewarper->Zoom(-1, 3);
    EXPECT_EQ(70.0f, Where(*dewarper).zoom);
    EXPECT_EQ(70.0f, dewarper->LimitZoomRange(10.0f));
    EXPECT_EQ(1200.0f, dewarper->LimitZoomRange(5000.0f));
    EXPECT_EQ(300.0f, dewarper->LimitZoomRange(300.0f));
}

TEST_F(VivotekDewarperTest, PanAndTiltUseTheBaseRanges) {
    Create(Camera(WALL));
    dewarper->SetPosition(120.0f, -100.0f, 90.0f);
    EXPECT_EQ(90.0f, Where(*dewarper).pan);
    EXPECT_EQ(-90.0f, Where(*dewarper).tilt);
    Create(Camera(FLOOR));
    dewarper->SetPosition(-10.0f, 5.0f, 90.0f);
    EXPECT_FLOAT_EQ(350.0f, Where(*dewarper).pan);
    EXPECT_EQ(0.0f, Where(*dewarper).tilt);
}

TEST_F(VivotekDewarperTest, InputAndOutputAreFormatZeroOfTwelveBitsAPixelTruncated) {
    Create(Camera(CEILING));
    unsigned int size = 0;
    int format = -1;
    dewarper->GetFormatAndSize(5, 3, &size, &format);
    EXPECT_EQ(0, format);
    EXPECT_EQ(22u, size);
}

TEST_F(VivotekDewarperTest, SubModesOneAndTwoEverywhereThreeOnlyOffTheWall) {
    Create(Camera(WALL));
    EXPECT_FALSE(dewarper->IsSubModeSupported(0));
    EXPECT_TRUE(dewarper->IsSubModeSupported(1));
    EXPECT_TRUE(dewarper->IsSubModeSupported(2));
    EXPECT_FALSE(dewarper->IsSubModeSupported(3));
    for (int position : {CEILING, FLOOR}) {
        Create(Camera(position));
        EXPECT_TRUE(dewarper->IsSubModeSupported(1)) << position;
        EXPECT_TRUE(dewarper->IsSubModeSupported(2)) << position;
        EXPECT_TRUE(dewarper->IsSubModeSupported(3)) << position;
        EXPECT_FALSE(dewarper->IsSubModeSupported(4)) << position;
    }
}

TEST_F(VivotekDewarperTest, NormalPtzIsSupportedForTheTwoPanoramasOnly) {
    for (int position : {WALL, CEILING}) {
        Create(Camera(position));
        EXPECT_FALSE(dewarper->IsNormalPTZSupported(0));
        EXPECT_FALSE(dewarper->IsNormalPTZSupported(1));
        EXPECT_TRUE(dewarper->IsNormalPTZSupported(2));
        EXPECT_TRUE(dewarper->IsNormalPTZSupported(3));
    }
}

class VivotekAbilityTest : public VivotekDewarperTest,
                           public ::testing::WithParamInterface<AbilityCase> {};

TEST_P(VivotekAbilityTest, PanOffTheWallInEverySubModeTiltAndZoomInTheSingleViewOnly) {
    AbilityCase const expected = GetParam();
    Create(Camera(expected.position));
    dewarper->SetSubMode(expected.subMode);
    ExpectAbilities(*dewarper, expected);
}

INSTANTIATE_TEST_SUITE_P(SubModesAndMounts, VivotekAbilityTest, PanoramasTurnOffTheWall());

TEST_F(VivotekDewarperTest, AspectRatioIsTheHeightSixteenByNineOrTwoByThreeBySubMode) {
    Create(Camera(CEILING));
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(2);
    EXPECT_FLOAT_EQ(1.7777778f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(3);
    EXPECT_FLOAT_EQ(0.6666667f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    Create(Camera(WALL));
    dewarper->SetSubMode(2);
    EXPECT_FLOAT_EQ(1.7777778f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
}

TEST_F(VivotekDewarperTest, SetSubModeInADewarperWithNoFrameYetReleasesNothing) {
    Create(Camera(CEILING));
    dewarper->SetSubMode(2);
    EXPECT_EQ(2, dewarper->SubMode());
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST_F(VivotekDewarperTest, SubModeZeroMeansOneAndTheSameSubModeChangesNothing) {
    Create(Camera(CEILING));
    FirstFrame();
    void* const handle = dewarper->handle;
    dewarper->SetSubMode(0);
    dewarper->SetSubMode(1);
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_EQ(handle, dewarper->handle);
    EXPECT_EQ(64, dewarper->InputWidth());
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST_F(VivotekDewarperTest, ANewSubModeReleasesTheObjectAndForgetsTheInputSize) {
    Create(Camera(CEILING));
    FirstFrame();
    void* const handle = dewarper->handle;
    int const live = fisheyesw_standin::LiveObjects();
    dewarper->SetSubMode(3);
    EXPECT_EQ((Names{"Fisheye_Release"}), fisheyesw_standin::CallNames());
    Call const release = OnlyCallOf("Fisheye_Release");
    EXPECT_EQ(handle, release.handle);
    EXPECT_EQ(&dewarper->handle, release.handleAddress);
    EXPECT_EQ(nullptr, dewarper->handle);
    EXPECT_EQ(live - 1, fisheyesw_standin::LiveObjects());
    EXPECT_EQ(0, dewarper->InputWidth());
    EXPECT_EQ(0, dewarper->InputHeight());
}

TEST_F(VivotekDewarperTest, ANewSubModeBuildsANewObjectAtTheNextFrameAndKeepsThePosition) {
    Create(Camera(CEILING, 0, 15));
    FirstFrame();
    dewarper->SetPosition(100.0f, 40.0f, 200.0f);
    dewarper->SetSubMode(2);
    Position const kept = Where(*dewarper);
    EXPECT_EQ(100.0f, kept.pan);
    EXPECT_EQ(200.0f, kept.zoom);
    fisheyesw_standin::ClearCalls();
    Feed(64, 48);
    ASSERT_TRUE(Frame());
    EXPECT_EQ(
        (Names{"Fisheye_Initial", "Fisheye_SetModelName", "Fisheye_SetOption", "Fisheye_SetOption",
               "Fisheye_SetOption", "Fisheye_SetOption", "Fisheye_SetOption", "Fisheye_OneFrame"}),
        fisheyesw_standin::CallNames());
    std::vector<Fisheye_Option> const options = fisheyesw_standin::Options();
    EXPECT_EQ(1, options[0].dewarpType);
    EXPECT_EQ(200, options[1].zoom);
    EXPECT_EQ(100.0f, options[3].pan);
}

TEST_F(VivotekDewarperTest, APanAfterANewSubModeReachesNoReleasedObject) {
    Create(Camera(CEILING));
    FirstFrame();
    dewarper->SetSubMode(2);
    fisheyesw_standin::ClearCalls();
    dewarper->Pan(1, 2);
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST_F(VivotekDewarperTest, DestructorReleasesTheObjectItMade) {
    int const live = fisheyesw_standin::LiveObjects();
    Create(Camera(CEILING));
    FirstFrame();
    void* const handle = dewarper->handle;
    EXPECT_EQ(live + 1, fisheyesw_standin::LiveObjects());
    dewarper.reset();
    EXPECT_EQ((Names{"Fisheye_Release"}), fisheyesw_standin::CallNames());
    EXPECT_EQ(handle, fisheyesw_standin::Calls()[0].handle);
    EXPECT_EQ(live, fisheyesw_standin::LiveObjects());
}

TEST_F(VivotekDewarperTest, DestructorWithoutAnObjectCallsNothing) {
    Create(Camera(CEILING));
    dewarper->Pan(1, 0);
    dewarper.reset();
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

TEST_F(VivotekDewarperTest, DestructorAfterANewSubModeReleasesNothingMore) {
    Create(Camera(CEILING));
    FirstFrame();
    dewarper->SetSubMode(2);
    fisheyesw_standin::ClearCalls();
    dewarper.reset();
    EXPECT_TRUE(fisheyesw_standin::Calls().empty());
}

}  // namespace
