// The vendor kinds through the plug-in's binary boundary: with the test stand-ins of the vendors'
// libraries on the loader's search path (a ctest of its own points it there), and with one that
// gets loaded only after the plug-in asked for it.

#include <cstring>
#include <string>

#include <gtest/gtest.h>

#include "host_side_interfaces.h"
#include "plugin_library.h"

namespace {

using host_side::CameraRecord;
using host_side::Dewarper;
using host_side::Registry;

class VendorKindsTest : public PluginLibraryTest {
protected:
    // One frame of a uniform picture through a dewarper; the output's size and format.
    struct Frame {
        bool done = false;
        int inputFormat = -1;
        int outputFormat = -1;
        int width = 0;
        int height = 0;
        unsigned int size = 0;
        unsigned char middle = 0;
    };

    static Frame RunFrame(Dewarper& dewarper, int width, int height) {
        Frame frame;
        unsigned char* input = nullptr;
        unsigned int size = 0;
        if (!dewarper.GetImageInputBuffer(64, 64, &input, &size, &frame.inputFormat)) {
            return frame;
        }
        memset(input, 180, size);
        unsigned char* output = nullptr;
        frame.width = width;
        frame.height = height;
        frame.done = dewarper.GetImageOutputBuffer(&frame.width, &frame.height, &output,
                                                   &frame.size, &frame.outputFormat);
        if (frame.done && frame.size > 0) {
            frame.middle = output[frame.size / 2 / 4 * 4];
        }
        return frame;
    }
};

TEST_F(VendorKindsTest, EveryVendorKindIsLoadedWhenItsLibraryIsThere) {
    Registry* registry = getRegister();
    for (int mode : {1, 3, 7, 9}) {
        EXPECT_TRUE(dewarperLoaded(mode)) << mode;
        EXPECT_TRUE(registry->IsLoaded(mode)) << mode;
    }
}

TEST_F(VendorKindsTest, SamsungIsServedByTheImmerVisionClass) {
    CameraRecord const record{};
    Dewarper* dewarper = createDewarper(7, record);
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(1, dewarper->Mode());
    deleteDewarper(dewarper);
}

TEST_F(VendorKindsTest, ImmerVisionListsItsLensesByRplNumberUntilZero) {
    Registry* registry = getRegister();
    char name[64] = {};
    int count = 0;
    while (registry->GetLens(1, count, name, sizeof name) > 0) {
        EXPECT_EQ(0, strncmp("RPL Number ", name, 11)) << name;
        ++count;
    }
    EXPECT_GE(count, 3);
    EXPECT_EQ(0, registry->GetLens(1, -1, name, sizeof name));
}

TEST_F(VendorKindsTest, VivotekListsItsEightLensNames) {
    Registry* registry = getRegister();
    char name[16] = {};
    EXPECT_EQ(7, registry->GetLens(3, 0, name, sizeof name));
    EXPECT_STREQ("Default", name);
    EXPECT_EQ(6, registry->GetLens(3, 7, name, sizeof name));
    EXPECT_STREQ("FE8181", name);
    EXPECT_EQ(0, registry->GetLens(3, 8, name, sizeof name));
}

TEST_F(VendorKindsTest, SamsungModelsHaveTheirDefaultLensAndImmerVisionNone) {
    Registry* registry = getRegister();
    char name[64] = {};
    int const lens = registry->GetDefaultLens(7, "Samsung", "SNF-7010VM");
    ASSERT_GT(registry->GetLens(7, lens, name, sizeof name), 0);
    EXPECT_STREQ("RPL Number B5SST", name);
    EXPECT_EQ(0, registry->GetDefaultLens(1, "Samsung", "SNF-7010VM"));
    EXPECT_EQ(0, registry->GetDefaultLens(9, "Geovision", "GV-FER"));
}

// Before its first frame a vendor dewarper answers the defaults of its kind: ImmerVision's zoom
// is its widest field of view.
TEST_F(VendorKindsTest, ANewVendorDewarperAnswersItsKindsDefaultPosition) {
    struct Expected {
        int mode;
        float zoom;
    };
    for (Expected const expected :
         {Expected{1, 180.0f}, Expected{3, 70.0f}, Expected{7, 180.0f}, Expected{9, 20.0f}}) {
        NewPosition const position = PositionOfANewDewarper(expected.mode);
        ASSERT_TRUE(position.made) << expected.mode;
        EXPECT_EQ(0.0f, position.pan) << expected.mode;
        EXPECT_EQ(0.0f, position.tilt) << expected.mode;
        EXPECT_EQ(expected.zoom, position.zoom) << expected.mode;
    }
}

// What a vendor kind gives for one frame of a 64 x 64 input.
struct FrameRow {
    int mode;
    int askedWidth;
    int askedHeight;
    int inputFormat;
    int outputFormat;
    int width;
    int height;
    unsigned int size;
};

class VendorFrameTest : public VendorKindsTest, public ::testing::WithParamInterface<FrameRow> {};

TEST_P(VendorFrameTest, AFrameComesOutInTheKindsFormatAndSize) {
    FrameRow const row = GetParam();
    CameraRecord record{};
    record.position = 1;
    Dewarper* dewarper = createDewarper(row.mode, record);
    ASSERT_NE(nullptr, dewarper);
    Frame const frame = RunFrame(*dewarper, row.askedWidth, row.askedHeight);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(row.inputFormat, frame.inputFormat);
    EXPECT_EQ(row.outputFormat, frame.outputFormat);
    EXPECT_EQ(row.width, frame.width);
    EXPECT_EQ(row.height, frame.height);
    EXPECT_EQ(row.size, frame.size);
    EXPECT_EQ(180, frame.middle);  // the stand-ins carry the picture over
    deleteDewarper(dewarper);
}

// ImmerVision keeps the input's size; Vivotek gives the size asked; Geovision rounds the height
// down to a multiple of 4 and gives four bytes a pixel.
INSTANTIATE_TEST_SUITE_P(Kinds, VendorFrameTest,
                         ::testing::Values(FrameRow{1, 48, 32, 23, 23, 64, 64, 64 * 64 * 3 / 2},
                                           FrameRow{7, 48, 32, 23, 23, 64, 64, 64 * 64 * 3 / 2},
                                           FrameRow{3, 48, 32, 0, 0, 48, 32, 48 * 32 * 3 / 2},
                                           FrameRow{9, 48, 34, 3, 6, 48, 32, 48 * 32 * 4}));

// Run alone, without the libraries on the search path: a library that a host process gets loaded
// after the plug-in asked for it is found at the next request, since a failed load is not kept.
using LibraryInstalledLaterTest = PluginLibraryTest;

TEST_F(LibraryInstalledLaterTest, AFailedLensListIsTriedAgainAndThenFound) {
    Registry* registry = getRegister();
    char name[16] = "intact";
    EXPECT_EQ(0, registry->GetLens(3, 0, name, sizeof name));
    EXPECT_STREQ("intact", name);
    EXPECT_FALSE(dewarperLoaded(3));
    // Loaded by its path, the library answers to its soname from then on, as if installed.
    void* const vendor = dlopen(VEXMAP_STANDIN_DIR "/libfisheyesw.so.3", RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(nullptr, vendor) << dlerror();
    EXPECT_EQ(7, registry->GetLens(3, 0, name, sizeof name));
    EXPECT_STREQ("Default", name);
    EXPECT_EQ(6, registry->GetLens(3, 1, name, sizeof name));
    EXPECT_STREQ("FE8171", name);
    EXPECT_TRUE(dewarperLoaded(3));
    dlclose(vendor);
}

}  // namespace
