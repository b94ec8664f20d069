#include <algorithm>
#include <vector>

#include <gtest/gtest.h>

#include "Sentry360Dewarper.h"

namespace {

constexpr int WALL = 0;
constexpr int CEILING = 1;
constexpr int FLOOR = 2;

DewarpParams_t Camera(int position, int circle_x, int circle_y, int radius) {
    DewarpParams_t params;
    params.position = position;
    params.circleX = circle_x;
    params.circleY = circle_y;
    params.circleRadius = radius;
    return params;
}

struct Frame {
    int width = 0;
    int height = 0;
    std::vector<unsigned char> pixels;
};

// Drives one frame as a host does: the input buffer, the picture written into it, then the
// output, copied out.
class Sentry360DewarperTest : public ::testing::Test {
protected:
    void Create(int position, int input_width, int input_height, int radius) {
        dewarper = std::make_unique<Sentry360Dewarper>(
            Camera(position, input_width / 2, input_height / 2, radius));
        inputWidth = input_width;
        inputHeight = input_height;
    }

    // Every input pixel tells its place: red and green count columns and rows.
    void FeedNumbered() {
        unsigned char* input = nullptr;
        unsigned int size = 0;
        int format = 0;
        ASSERT_TRUE(dewarper->GetImageInputBuffer(inputWidth, inputHeight, &input, &size, &format));
        ASSERT_EQ(3, format);
        ASSERT_EQ(unsigned(inputWidth * inputHeight * 3), size);
        for (int y = 0; y < inputHeight; ++y) {
            for (int x = 0; x < inputWidth; ++x) {
                unsigned char* pixel = input + (y * inputWidth + x) * 3;
                pixel[0] = static_cast<unsigned char>(x);
                pixel[1] = static_cast<unsigned char>(y);
                pixel[2] = 200;
            }
        }
    }

    Frame Output(int width, int height) {
        Frame frame;
        frame.width = width;
        frame.height = height;
        unsigned char* buffer = nullptr;
        unsigned int size = 0;
        int format = 0;
        EXPECT_TRUE(
            dewarper->GetImageOutputBuffer(&frame.width, &frame.height, &buffer, &size, &format));
        EXPECT_EQ(3, format);
        EXPECT_EQ(unsigned(frame.width * frame.height * 3), size);
        frame.pixels.assign(buffer, buffer + size);
        return frame;
    }

    Frame RunFrame(int width, int height) {
        FeedNumbered();
        return Output(width, height);
    }

    struct Position {
        float pan;
        float tilt;
        float zoom;
    };

    Position Where() const {
        Position position{};
        dewarper->GetPosition(position.pan, position.tilt, position.zoom);
        return position;
    }

    float Pan() const { return Where().pan; }
    float Tilt() const { return Where().tilt; }
    float Zoom() const { return Where().zoom; }

    std::unique_ptr<Sentry360Dewarper> dewarper;
    int inputWidth = 0;
    int inputHeight = 0;
};

bool AllBlack(Frame const& frame) {
    return std::all_of(frame.pixels.begin(), frame.pixels.end(),
                       [](unsigned char sample) { return sample == 0; });
}

TEST_F(Sentry360DewarperTest, IsModeTwoAndStartsAtTheKindsDefaults) {
    Create(CEILING, 64, 64, 32);
    EXPECT_EQ(2, dewarper->Mode());
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_EQ(0.0f, Pan());
    EXPECT_EQ(0.0f, Tilt());
    EXPECT_EQ(0.7f, Zoom());
}

TEST_F(Sentry360DewarperTest, PanoramaOfA1920By1920InputIs960By960WhateverTheHostAsks) {
    Create(CEILING, 1920, 1920, 960);
    dewarper->SetSubMode(2);
    Frame const frame = RunFrame(320, 200);
    EXPECT_EQ(960, frame.width);
    EXPECT_EQ(960, frame.height);
    EXPECT_FALSE(AllBlack(frame));
}

TEST_F(Sentry360DewarperTest, PanoramaWithoutANewInputBufferIsAPictureOfNoSize) {
    Create(CEILING, 64, 64, 32);
    RunFrame(64, 64);
    dewarper->SetSubMode(2);
    Frame const frame = Output(64, 64);
    EXPECT_EQ(0, frame.width);
    EXPECT_EQ(0, frame.height);
    EXPECT_TRUE(frame.pixels.empty());
}

TEST_F(Sentry360DewarperTest, PtzViewKeepsTheHostsSizeRoundedUp) {
    Create(WALL, 128, 128, 64);
    Frame const frame = RunFrame(100, 51);
    EXPECT_EQ(104, frame.width);
    EXPECT_EQ(52, frame.height);
}

TEST_F(Sentry360DewarperTest, GoingHomeEndsAtZoomSevenTenthsInSubModeOne) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetSubMode(2);
    dewarper->SetPosition(30.0f, 20.0f, 3.0f);
    dewarper->SetPosition(0.0f, 0.0f, 0.0f);
    EXPECT_EQ(1, dewarper->SubMode());
    EXPECT_EQ(0.0f, Pan());
    EXPECT_EQ(0.0f, Tilt());
    EXPECT_FLOAT_EQ(0.7f, Zoom());
}

TEST_F(Sentry360DewarperTest, CeilingPanPastHalfATurnWrapsToTheOtherSide) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(179.9f, 10.0f, 1.0f);
    dewarper->Pan(1, 0);
    EXPECT_NEAR(-179.9f, Pan(), 1e-3f);
    dewarper->SetPosition(180.0f, 10.0f, 1.0f);
    EXPECT_EQ(-180.0f, Pan());
}

TEST_F(Sentry360DewarperTest, WallRangesStopAtPlusAndMinusNinety) {
    Create(WALL, 64, 64, 32);
    dewarper->SetPosition(120.0f, -100.0f, 1.0f);
    EXPECT_EQ(90.0f, Pan());
    EXPECT_EQ(-90.0f, Tilt());
}

TEST_F(Sentry360DewarperTest, CeilingTiltRunsFromZeroToNinety) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(10.0f, -5.0f, 1.0f);
    EXPECT_EQ(0.0f, Tilt());
    dewarper->SetPosition(10.0f, 95.0f, 1.0f);
    EXPECT_EQ(90.0f, Tilt());
}

TEST_F(Sentry360DewarperTest, FloorMountInvertsPanAndTiltCommands) {
    Create(FLOOR, 64, 64, 32);
    dewarper->SetPosition(10.0f, 10.0f, 1.0f);
    dewarper->Pan(1, 0);
    EXPECT_FLOAT_EQ(9.8f, Pan());
    dewarper->Tilt(1, 0);
    EXPECT_FLOAT_EQ(10.2f, Tilt());
}

TEST_F(Sentry360DewarperTest, CeilingMountDoesNotInvertCommands) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(10.0f, 10.0f, 1.0f);
    dewarper->Pan(1, 0);
    EXPECT_FLOAT_EQ(10.2f, Pan());
    dewarper->Tilt(1, 0);
    EXPECT_FLOAT_EQ(9.8f, Tilt());
}

TEST_F(Sentry360DewarperTest, FloorMountFlipsRowsAndColumnsOfTheView) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(20.0f, 30.0f, 0.9f);
    Frame const straight = RunFrame(64, 48);
    Create(FLOOR, 64, 64, 32);
    dewarper->SetPosition(20.0f, 30.0f, 0.9f);
    Frame const flipped = RunFrame(64, 48);
    for (int row = 0; row < 48; ++row) {
        for (int column = 0; column < 64; ++column) {
            std::size_t const mirrored = std::size_t(((47 - row) * 64 + 63 - column) * 3);
            std::size_t const own = std::size_t((row * 64 + column) * 3);
            ASSERT_EQ(straight.pixels[mirrored], flipped.pixels[own]) << row << "," << column;
        }
    }
}

TEST_F(Sentry360DewarperTest, ZoomStepsByOneTwentiethWithNoUpperLimit) {
    Create(CEILING, 64, 64, 32);
    dewarper->Zoom(1, 0);
    EXPECT_FLOAT_EQ(0.75f, Zoom());
    dewarper->Zoom(-1, 10);
    EXPECT_FLOAT_EQ(0.7f, Zoom());
    dewarper->SetPosition(1.0f, 1.0f, 5000.0f);
    EXPECT_EQ(5000.0f, Zoom());
}

TEST_F(Sentry360DewarperTest, RadiusOfZeroGivesBlackPicturesNotAFailure) {
    Create(CEILING, 64, 64, 0);
    for (int frame = 0; frame < 2; ++frame) {
        EXPECT_TRUE(AllBlack(RunFrame(64, 64))) << frame;
    }
    dewarper->SetSubMode(2);
    for (int frame = 0; frame < 2; ++frame) {
        EXPECT_TRUE(AllBlack(RunFrame(64, 64))) << frame;
    }
}

TEST_F(Sentry360DewarperTest, PtzViewLooksAtTheMiddleOfTheCircle) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(0.0f, 0.0f, 1.0f);
    Frame const frame = RunFrame(64, 64);
    std::size_t const middle = std::size_t((32 * 64 + 32) * 3);
    EXPECT_EQ(32, frame.pixels[middle]);
    EXPECT_EQ(32, frame.pixels[middle + 1]);
    EXPECT_EQ(200, frame.pixels[middle + 2]);
}

TEST_F(Sentry360DewarperTest, TheSecondFrameOfAPositionIsBlended) {
    Create(CEILING, 64, 64, 32);
    Frame const first = RunFrame(64, 64);
    Frame const second = RunFrame(64, 64);
    EXPECT_NE(first.pixels, second.pixels);
    Frame const third = RunFrame(64, 64);
    EXPECT_EQ(second.pixels, third.pixels);
}

TEST_F(Sentry360DewarperTest, AMoveBeforeTheNextFrameReachesTheView) {
    Create(CEILING, 64, 64, 32);
    Frame const before = RunFrame(64, 64);
    dewarper->Pan(1, 50);
    Frame const after = RunFrame(64, 64);
    EXPECT_NE(before.pixels, after.pixels);
}

TEST_F(Sentry360DewarperTest, ChangingTheSubModeResetsThePositionAndForgetsTheInputSize) {
    Create(CEILING, 64, 64, 32);
    RunFrame(64, 64);
    dewarper->SetPosition(40.0f, 20.0f, 2.0f);
    dewarper->SetSubMode(2);
    EXPECT_EQ(0.0f, Pan());
    EXPECT_FLOAT_EQ(0.7f, Zoom());
    Frame const panorama = RunFrame(64, 64);
    EXPECT_EQ(32, panorama.width);
}

TEST_F(Sentry360DewarperTest, SettingTheSameSubModeChangesNothing) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetPosition(40.0f, 20.0f, 2.0f);
    dewarper->SetSubMode(1);
    dewarper->SetSubMode(0);
    EXPECT_EQ(40.0f, Pan());
    EXPECT_EQ(1, dewarper->SubMode());
}

TEST_F(Sentry360DewarperTest, SupportsSingleViewAndPanoramaOnly) {
    Create(CEILING, 64, 64, 32);
    EXPECT_TRUE(dewarper->IsSubModeSupported(1));
    EXPECT_TRUE(dewarper->IsSubModeSupported(2));
    EXPECT_FALSE(dewarper->IsSubModeSupported(3));
    EXPECT_FALSE(dewarper->IsSubModeSupported(0));
    EXPECT_FALSE(dewarper->IsNormalPTZSupported(1));
    EXPECT_TRUE(dewarper->IsNormalPTZSupported(2));
    EXPECT_TRUE(dewarper->IsNormalPTZSupported(3));
}

TEST_F(Sentry360DewarperTest, PanoramaIsSixteenByNine) {
    Create(CEILING, 64, 64, 32);
    EXPECT_EQ(480.0f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
    dewarper->SetSubMode(2);
    EXPECT_FLOAT_EQ(1.7777778f, dewarper->AdjustAspectRatio(640.0f, 480.0f));
}

TEST_F(Sentry360DewarperTest, AnUnsupportedSubModeDrawsTheSingleView) {
    Create(CEILING, 64, 64, 32);
    dewarper->SetSubMode(3);
    EXPECT_EQ(3, dewarper->SubMode());
    Frame const frame = RunFrame(64, 64);
    EXPECT_EQ(64, frame.width);
    EXPECT_FALSE(AllBlack(frame));
}

TEST_F(Sentry360DewarperTest, AnOutputOfNoPixelsInTheSingleViewIsNoFailure) {
    Create(CEILING, 64, 64, 32);
    Frame const frame = RunFrame(0, 0);
    EXPECT_EQ(0, frame.width);
}

TEST_F(Sentry360DewarperTest, OutputBeforeAnyInputIsBlack) {
    Create(CEILING, 64, 64, 32);
    EXPECT_TRUE(AllBlack(Output(32, 32)));
}

}  // namespace
