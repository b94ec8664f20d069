#include "plugin_host.h"

#include <dlfcn.h>
#include <filesystem>
#include <fstream>
#include <string>
#include <turbojpeg.h>
#include <unistd.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "scratch_folder.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr int SENTRY360 = 2;
constexpr int MODE_COUNT = 17;

class PluginHostTest : public ::testing::Test {
protected:
    ScratchFolder const scratch{"vexmap-plugin-host-"};
    std::filesystem::path const directory = scratch.Path();
};

TEST(PluginHost, RegistryCountsSeventeenModes) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    EXPECT_EQ(MODE_COUNT, host.Register().GetModeCount());
}

TEST(PluginHost, RegistryNamesSentry360AsModeTwo) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    EXPECT_STREQ("Sentry360", host.Register().GetName(SENTRY360));
    EXPECT_EQ(SENTRY360, host.Register().GetModeByName("Sentry360"));
}

TEST(PluginHost, UnregisteredModesHaveNoName) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    for (int const mode : {0, 4, 5, 6, 10, 16, 17, -1}) {
        EXPECT_STREQ("", host.Register().GetName(mode)) << "mode " << mode;
    }
    EXPECT_EQ(0, host.Register().GetModeByName("Nosuch"));
}

// The suite runs with no vendor library on the loader's search path.
TEST(PluginHost, TheInHouseKindsAreLoadedAndTheVendorKindsNot) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    EXPECT_TRUE(host.DewarperLoaded(SENTRY360));
    EXPECT_TRUE(host.DewarperLoaded(8));
    for (int const mode : {0, 1, 3, 7, 9, 10}) {
        EXPECT_FALSE(host.DewarperLoaded(mode)) << "mode " << mode;
    }
}

TEST(PluginHost, CreatesAndDeletesADewarperOfTheRegisteredMode) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    DewarpParams params{};
    params.position = 1;
    params.circleX = 128;
    params.circleY = 128;
    params.circleRadius = 128;
    Dewarper* const dewarper = host.CreateDewarper(SENTRY360, params);
    ASSERT_NE(nullptr, dewarper);
    EXPECT_EQ(SENTRY360, dewarper->Mode());
    host.DeleteDewarper(dewarper);
}

TEST(PluginHost, CreatesNothingForAnUnregisteredMode) {
    PluginHost const host(VEXMAP_PLUGIN_PATH);
    EXPECT_EQ(nullptr, host.CreateDewarper(10, DewarpParams{}));
}

TEST_F(PluginHostTest, MissingLibraryNamesThePath) {
    std::string const path = (directory / "libabsent.so").string();
    EXPECT_THAT([&] { PluginHost const host(path); },
                ThrowsMessage<ToolError>(HasSubstr("cannot load the plug-in " + path + ": ")));
}

TEST_F(PluginHostTest, RefusesAFileThatIsNoLibrary) {
    std::string const path = (directory / "libtext.so").string();
    std::ofstream(path) << "not a shared object\n";
    EXPECT_THAT([&] { PluginHost const host(path); },
                ThrowsMessage<ToolError>(HasSubstr("cannot load the plug-in " + path + ": ")));
}

// Any shared library the test already has open serves as one that lacks the entry points.
TEST(PluginHost, RefusesALibraryWithoutTheEntryPoints) {
    Dl_info info{};
    ASSERT_NE(0, dladdr(reinterpret_cast<void*>(&tjInitDecompress), &info));
    std::string const path = info.dli_fname;
    EXPECT_THAT([&] { PluginHost const host(path); },
                ThrowsMessage<ToolError>(HasSubstr("the plug-in does not export GetRegister")));
}

}  // namespace
}  // namespace vexmap_host
