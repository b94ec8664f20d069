#include <cmath>
#include <memory>
#include <vector>

#include <gtest/gtest.h>

#include "BrenviaDewarper.h"
#include "DewarperRegistry.h"
#include "vexmap/dewarp.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace {

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

/// The dewarper with its protected parts in reach, made for mode 8 as the registry makes it.
class Probe : public BrenviaDewarper {
public:
    explicit Probe(int position) : BrenviaDewarper(Params(position)) {
        SetDewarperType(DewarperType::DewarperBrenvia);
    }
    static DewarpParams_t Params(int position) {
        DewarpParams_t params;
        params.position = position;
        return params;
    }
    using BrenviaDewarper::camera;
    using BrenviaDewarper::channel;
    using BrenviaDewarper::GetFormatAndSize;
    using BrenviaDewarper::GetTiltRange;
    using BrenviaDewarper::GetZoomScaleModifier;
    using BrenviaDewarper::LimitTiltRange;
    using BrenviaDewarper::LimitZoomRange;
    float PanValue() const { return pan; }
    float InnerTilt() const { return tilt; }
    float ZoomValue() const { return zoom; }
};

// A grey frame with a bright disc, as a fisheye stream gives it, in YUV 4:2:0.
void Feed(IDewarper& dewarper, int width, int height) {
    unsigned char* input = nullptr;
    unsigned int size = 0;
    int format = -1;
    ASSERT_TRUE(dewarper.GetImageInputBuffer(width, height, &input, &size, &format));
    ASSERT_EQ(0, format);
    ASSERT_EQ(unsigned(width * height * 3 / 2), size);
    for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
            int const dx = x - width / 2;
            int const dy = y - height / 2;
            input[y * width + x] = dx * dx + dy * dy < width * width / 4 ? 200 : 40;
        }
    }
    std::fill(input + width * height, input + size, 128);
}

bool Frame(IDewarper& dewarper, int width, int height, std::vector<unsigned char>* out = nullptr) {
    unsigned char* output = nullptr;
    unsigned int size = 0;
    int format = -1;
    int w = width;
    int h = height;
    bool const done = dewarper.GetImageOutputBuffer(&w, &h, &output, &size, &format);
    if (done && out != nullptr) {
        out->assign(output, output + size);
    }
    return done;
}

TEST(BrenviaDewarper, RegistryCreatesItForModeEightOnly) {
    DewarpParams_t const params = Probe::Params(CEILING);
    IDewarper* const dewarper = CreateDewarper(DewarperType::DewarperBrenvia, params);
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(8, dewarper->Mode());
    EXPECT_TRUE(DewarperLoaded(8));
    EXPECT_STREQ("Brenvia", GetRegister()->GetName(8));
    EXPECT_EQ(8, GetRegister()->GetModeByName("Brenvia"));
    bool lenses = true;
    bool circle = true;
    bool position = false;
    GetRegister()->GetSupportedFeatures(8, lenses, circle, position);
    EXPECT_FALSE(lenses);
    EXPECT_FALSE(circle);
    EXPECT_TRUE(position);
    EXPECT_TRUE(GetRegister()->IsCameraSpecific(8));
    DeleteDewarper(dewarper);
}

TEST(BrenviaDewarper, WithoutAFrameTheTiltRangeIsTheBasesAndATiltPassesUnlimited) {
    Probe dewarper(CEILING);
    float min = 0;
    float max = 0;
    float step = 0;
    bool wrap = true;
    dewarper.GetTiltRange(min, max, step, wrap);
    EXPECT_FLOAT_EQ(0.0f, min);
    EXPECT_FLOAT_EQ(90.0f, max);
    EXPECT_FALSE(wrap);
    EXPECT_EQ(nullptr, dewarper.channel);
    EXPECT_FLOAT_EQ(1000.0f, dewarper.LimitTiltRange(1000.0f));
}

TEST(BrenviaDewarper, SetPositionOfAllZeroEndsAtZoomHalfInSubModeOne) {
    Probe dewarper(WALL);
    dewarper.SetSubMode(2);
    dewarper.SetPosition(0.0f, 0.0f, 0.0f);
    EXPECT_EQ(1, dewarper.SubMode());
    EXPECT_FLOAT_EQ(0.5f, dewarper.ZoomValue());
}

TEST(BrenviaDewarper, InASubModeOfPanoramaAPanMovesThePanButSendsNothingToTheEngine) {
    Probe dewarper(CEILING);
    dewarper.SetSubMode(2);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 320, 80));
    ASSERT_NE(nullptr, dewarper.channel);
    _DEWARP_PTZ_POSITION before{};
    ASSERT_EQ(0, dewarp_get_ptz(dewarper.channel, &before));
    float const pan = dewarper.PanValue();
    dewarper.Pan(1, 3);
    EXPECT_NE(pan, dewarper.PanValue());
    _DEWARP_PTZ_POSITION after{};
    ASSERT_EQ(0, dewarp_get_ptz(dewarper.channel, &after));
    EXPECT_EQ(before.pan, after.pan);
    EXPECT_EQ(before.zoom, after.zoom);
}

TEST(BrenviaDewarper, SetPositionWorksWithAnInnerTiltTenRootsOfTheZoomBelowTheHosts) {
    Probe dewarper(WALL);
    dewarper.SetPosition(10.0f, 20.0f, 4.0f);
    EXPECT_FLOAT_EQ(0.0f, dewarper.InnerTilt());
    float pan = 0;
    float tilt = 0;
    float zoom = 0;
    dewarper.GetPosition(pan, tilt, zoom);
    EXPECT_FLOAT_EQ(20.0f, tilt);
    EXPECT_FLOAT_EQ(4.0f, zoom);
}

TEST(BrenviaDewarper, InnerTiltIsWorkedOutInDoubleFromTheSinglePrecisionRoot) {
    Probe dewarper(WALL);
    dewarper.SetPosition(5.0f, 3.0f, 2.0f);
    float const expected = float(3.0 - 10.0 * double(std::sqrt(2.0f)));
    EXPECT_EQ(expected, dewarper.InnerTilt());
}

TEST(BrenviaDewarper, ANewOutputSizeOnTheSameStreamKeepsTheChannel) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    void* const first = dewarper.channel;
    ASSERT_NE(nullptr, first);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 240, 180));
    EXPECT_EQ(first, dewarper.channel);
}

TEST(BrenviaDewarper, ANewInputSizeClosesAndOpensTheChannelOnce) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    Feed(dewarper, 400, 400);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    void* const reopened = dewarper.channel;
    EXPECT_EQ(400u, dewarper.camera.width);
    EXPECT_EQ(400u, dewarper.camera.height);
    Feed(dewarper, 400, 400);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    EXPECT_EQ(reopened, dewarper.channel);
}

TEST(BrenviaDewarper, TheCameraIsTheBuiltInModelAtTheStreamsSize) {
    Probe dewarper(FLOOR);
    _DEWARP_INTERNAL_CAMERA_MODEL const builtin = quorvel::vexmap::GetTarvexBrenvia418Camera();
    EXPECT_EQ(builtin.width, dewarper.camera.width);
    EXPECT_EQ(builtin.horizontal_fov, dewarper.camera.horizontal_fov);
    Feed(dewarper, 320, 240);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    _DEWARP_INTERNAL_CAMERA_MODEL model{};
    ASSERT_EQ(0, dewarp_internal_get_model(dewarper.channel, &model));
    EXPECT_EQ(320u, model.width);
    EXPECT_EQ(240u, model.height);
    EXPECT_EQ(builtin.diagonal_fov, model.diagonal_fov);
}

TEST(BrenviaDewarper, ModeTenWidensTheLensAnglesAlthoughNothingCreatesIt) {
    Probe dewarper(WALL);
    dewarper.SetDewarperType(DewarperType::DewarperAxis);
    EXPECT_EQ(284.0f, dewarper.camera.diagonal_fov);
    EXPECT_EQ(225.0f, dewarper.camera.horizontal_fov);
    EXPECT_EQ(174.0f, dewarper.camera.vertical_fov);
    EXPECT_EQ(nullptr, CreateDewarper(10, Probe::Params(WALL)));
}

struct MountCase {
    int position;
    _DEWARP_INTERNAL_CAMERA_MOUNT mount;
};

class BrenviaDewarperMountTest : public ::testing::TestWithParam<MountCase> {};

TEST_P(BrenviaDewarperMountTest, ThePositionBecomesTheEnginesMount) {
    Probe dewarper(GetParam().position);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    EXPECT_EQ(int(GetParam().mount), dewarp_internal_get_mount(dewarper.channel));
}

INSTANTIATE_TEST_SUITE_P(EveryPosition, BrenviaDewarperMountTest,
                         ::testing::Values(MountCase{1, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING},
                                           MountCase{2, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR},
                                           MountCase{0, DEWARP_INTERNAL_CAMERA_MOUNT_WALL},
                                           MountCase{3, DEWARP_INTERNAL_CAMERA_MOUNT_WALL},
                                           MountCase{-1, DEWARP_INTERNAL_CAMERA_MOUNT_WALL}));

struct SubModeCase {
    int sub_mode;
    _DEWARP_VIEW view;
    _DEWARP_PROJECTION projection;
};

class BrenviaDewarperSubModeTest : public ::testing::TestWithParam<SubModeCase> {};

TEST_P(BrenviaDewarperSubModeTest, TheSubModeBecomesTheChannelsSettings) {
    Probe dewarper(CEILING);
    dewarper.SetSubMode(GetParam().sub_mode);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    _DEWARP_CHANNEL_SETTINGS settings{};
    ASSERT_EQ(0, dewarp_get_settings(dewarper.channel, &settings));
    EXPECT_EQ(GetParam().view, settings.view);
    EXPECT_EQ(GetParam().projection, settings.projection);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, settings.aspect_ratio);
    EXPECT_EQ(DEWARP_INTERPOLATION_0, settings.interpolation);
}

INSTANTIATE_TEST_SUITE_P(
    EverySubMode, BrenviaDewarperSubModeTest,
    ::testing::Values(SubModeCase{1, DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR},
                      SubModeCase{0, DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR},
                      SubModeCase{2, DEWARP_VIEW_SINGLE_PANORAMIC, DEWARP_PROJECTION_CYLINDRICAL},
                      SubModeCase{3, DEWARP_VIEW_DUAL_PANORAMIC, DEWARP_PROJECTION_CYLINDRICAL},
                      SubModeCase{7, DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR}));

TEST(BrenviaDewarper, AFrameIsDewarpedIntoTheOutputBuffer) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    std::vector<unsigned char> out;
    ASSERT_TRUE(Frame(dewarper, 157, 99, &out));
    ASSERT_EQ(160u * 100u * 3u / 2u, out.size());
    int bright = 0;
    for (std::size_t i = 0; i < 160u * 100u; ++i) {
        bright += out[i] == 200;
    }
    EXPECT_GT(bright, 1000);
}

TEST(BrenviaDewarper, AfterAFrameTheTiltRangeAndItsLimitComeFromTheEngine) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    _DEWARP_PTZ_RANGE range{};
    ASSERT_EQ(0, dewarp_get_ptz_range(dewarper.channel, &range));
    float min = 0;
    float max = 0;
    float step = 0;
    bool wrap = true;
    dewarper.GetTiltRange(min, max, step, wrap);
    EXPECT_EQ(range.tilt_min, min);
    EXPECT_EQ(range.tilt_max, max);
    EXPECT_FALSE(wrap);
    EXPECT_EQ(max, dewarper.LimitTiltRange(1000.0f));
}

TEST(BrenviaDewarper, TheEngineLimitsThePositionAndOnAWallThePanComesBackToo) {
    Probe dewarper(WALL);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    dewarper.SetPosition(170.0f, 5.0f, 0.5f);
    _DEWARP_PTZ_POSITION engine{};
    ASSERT_EQ(0, dewarp_get_ptz(dewarper.channel, &engine));
    EXPECT_FLOAT_EQ(engine.pan, dewarper.PanValue());
    EXPECT_FLOAT_EQ(engine.tilt, dewarper.InnerTilt());
}

TEST(BrenviaDewarper, OnACeilingTheHostKeepsItsOwnPan) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    dewarper.SetPosition(300.0f, 45.0f, 1.0f);
    EXPECT_FLOAT_EQ(300.0f, dewarper.PanValue());
}

TEST(BrenviaDewarper, ValuesOfTheKind) {
    Probe dewarper(WALL);
    dewarper.Clear();
    EXPECT_EQ(0.0f, dewarper.PanValue());
    EXPECT_EQ(0.0f, dewarper.InnerTilt());
    EXPECT_EQ(0.5f, dewarper.ZoomValue());
    EXPECT_EQ(0.0475f, dewarper.GetZoomScaleModifier());
    EXPECT_EQ(0.5f, dewarper.LimitZoomRange(0.1f));
    EXPECT_EQ(10.0f, dewarper.LimitZoomRange(12.0f));
    EXPECT_EQ(3.0f, dewarper.LimitZoomRange(3.0f));
    EXPECT_TRUE(dewarper.Check());
    for (int candidate : {1, 2, 3}) {
        EXPECT_TRUE(dewarper.IsSubModeSupported(candidate));
    }
    EXPECT_FALSE(dewarper.IsSubModeSupported(4));
    EXPECT_FALSE(dewarper.IsNormalPTZSupported(1));
    EXPECT_TRUE(dewarper.IsNormalPTZSupported(2));
    EXPECT_TRUE(dewarper.IsNormalPTZSupported(3));
    unsigned int size = 0;
    int format = -1;
    dewarper.GetFormatAndSize(640, 480, &size, &format);
    EXPECT_EQ(0, format);
    EXPECT_EQ(640u * 480u * 3u / 2u, size);
}

struct AspectCase {
    int sub_mode;
    int position;
    float ratio;
};

class BrenviaDewarperAspectTest : public ::testing::TestWithParam<AspectCase> {};

TEST_P(BrenviaDewarperAspectTest, AspectRatioIsFixedBySubModeAndMount) {
    Probe dewarper(GetParam().position);
    dewarper.SetSubMode(GetParam().sub_mode);
    EXPECT_EQ(GetParam().ratio, dewarper.AdjustAspectRatio(123.0f, 45.0f));
}

INSTANTIATE_TEST_SUITE_P(
    EveryRow, BrenviaDewarperAspectTest,
    ::testing::Values(AspectCase{1, 0, 4.0f / 3.0f}, AspectCase{1, 1, 4.0f / 3.0f},
                      AspectCase{2, 0, 16.0f / 9.0f}, AspectCase{2, 2, 64.0f / 9.0f},
                      AspectCase{3, 0, 4.0f / 9.0f}, AspectCase{3, 1, 16.0f / 9.0f}));

TEST(BrenviaDewarper, ANewSubModeClosesTheChannelAndClearsThePosition) {
    Probe dewarper(CEILING);
    Feed(dewarper, 320, 320);
    ASSERT_TRUE(Frame(dewarper, 160, 120));
    dewarper.SetPosition(30.0f, 40.0f, 2.0f);
    dewarper.SetSubMode(3);
    EXPECT_EQ(nullptr, dewarper.channel);
    EXPECT_EQ(0.5f, dewarper.ZoomValue());
    EXPECT_EQ(3, dewarper.SubMode());
    dewarper.SetSubMode(3);
    EXPECT_EQ(3, dewarper.SubMode());
}

}  // namespace
