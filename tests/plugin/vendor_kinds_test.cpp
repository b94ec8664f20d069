// The vendor kinds through the plug-in's binary boundary, with the test stand-ins of the vendors'
// libraries on the loader's search path (this binary's ctest points it there).

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

TEST_F(VendorKindsTest, ImmerVisionGivesAFrameOfTheInputsSizeInFormat23) {
    CameraRecord record{};
    record.position = 1;
    Dewarper* dewarper = createDewarper(1, record);
    ASSERT_NE(nullptr, dewarper);
    Frame const frame = RunFrame(*dewarper, 48, 32);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(23, frame.inputFormat);
    EXPECT_EQ(23, frame.outputFormat);
    EXPECT_EQ(64, frame.width);
    EXPECT_EQ(64, frame.height);
    EXPECT_EQ(64u * 64u * 3u / 2u, frame.size);
    EXPECT_EQ(180, frame.middle);
    deleteDewarper(dewarper);
}

TEST_F(VendorKindsTest, VivotekGivesAFrameOfTheAskedSizeInFormatZero) {
    CameraRecord record{};
    record.position = 1;
    Dewarper* dewarper = createDewarper(3, record);
    ASSERT_NE(nullptr, dewarper);
    Frame const frame = RunFrame(*dewarper, 48, 32);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(0, frame.inputFormat);
    EXPECT_EQ(0, frame.outputFormat);
    EXPECT_EQ(48, frame.width);
    EXPECT_EQ(32, frame.height);
    EXPECT_EQ(48u * 32u * 3u / 2u, frame.size);
    EXPECT_EQ(180, frame.middle);
    deleteDewarper(dewarper);
}

TEST_F(VendorKindsTest, GeovisionTakesFormatThreeAndGivesFormatSix) {
    CameraRecord record{};
    record.position = 1;
    Dewarper* dewarper = createDewarper(9, record);
    ASSERT_NE(nullptr, dewarper);
    Frame const frame = RunFrame(*dewarper, 48, 34);
    EXPECT_TRUE(frame.done);
    EXPECT_EQ(3, frame.inputFormat);
    EXPECT_EQ(6, frame.outputFormat);
    EXPECT_EQ(48, frame.width);
    EXPECT_EQ(32, frame.height);
    EXPECT_EQ(48u * 32u * 4u, frame.size);
    EXPECT_EQ(180, frame.middle);
    deleteDewarper(dewarper);
}

}  // namespace
