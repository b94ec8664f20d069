#include <algorithm>
#include <cstdint>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <spawn.h>
#include <string>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>

#include "image_file.h"
#include "rgb_image.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

constexpr int RUNTIME_FAILURE = 1;
constexpr int USAGE_ERROR = 2;

struct Outcome {
    bool exited = false;  // false when a signal ended the tool
    int status = -1;
    std::string out;
    std::string err;
};

std::string ReadText(std::filesystem::path const& path) {
    std::ifstream file(path, std::ios::binary);
    return std::string((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
}

// A bright disc filling the circle of a 256 x 256 picture, dark around it.
RgbImage DiscPicture() {
    int const size = 256;
    RgbImage image;
    image.width = size;
    image.height = size;
    image.pixels.assign(std::size_t(size) * std::size_t(size) * 3, 10);
    for (int row = 0; row < size; ++row) {
        for (int column = 0; column < size; ++column) {
            int const x = 2 * column + 1 - size;
            int const y = 2 * row + 1 - size;
            if (x * x + y * y <= size * size) {
                uint8_t* pixel =
                    &image.pixels[(std::size_t(row) * std::size_t(size) + std::size_t(column)) * 3];
                pixel[0] = 250;
                pixel[1] = uint8_t(column);
                pixel[2] = uint8_t(row);
            }
        }
    }
    return image;
}

class VexmapTest : public ::testing::Test {
protected:
    void SetUp() override {
        directory = std::filesystem::path(::testing::TempDir()) /
                    ("vexmap-tool-" +
                     std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()) +
                     "-" + std::to_string(getpid()));
        std::filesystem::remove_all(directory);
        std::filesystem::create_directories(directory);
    }
    void TearDown() override { std::filesystem::remove_all(directory); }

    std::string PathOf(std::string const& name) const { return (directory / name).string(); }

    // Runs the built tool with standard output and error captured in files of the test.
    Outcome Run(std::vector<std::string> arguments) const {
        std::filesystem::path const out_path = directory / "stdout.txt";
        std::filesystem::path const err_path = directory / "stderr.txt";
        arguments.insert(arguments.begin(), VEXMAP_TOOL_PATH);
        std::vector<char*> argv;
        for (std::string& argument : arguments) {
            argv.push_back(argument.data());
        }
        argv.push_back(nullptr);
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, out_path.c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0644);
        posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, err_path.c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0644);
        pid_t child = 0;
        int const spawned =
            posix_spawn(&child, VEXMAP_TOOL_PATH, &actions, nullptr, argv.data(), environ);
        posix_spawn_file_actions_destroy(&actions);
        Outcome outcome;
        if (spawned != 0) {
            ADD_FAILURE() << "cannot start " << VEXMAP_TOOL_PATH;
            return outcome;
        }
        int wait_status = 0;
        waitpid(child, &wait_status, 0);
        outcome.exited = WIFEXITED(wait_status);
        outcome.status = outcome.exited ? WEXITSTATUS(wait_status) : -1;
        outcome.out = ReadText(out_path);
        outcome.err = ReadText(err_path);
        return outcome;
    }

    std::filesystem::path directory;
};

// A refusal is an ordinary exit with one line of reason on standard error, none on standard output.
void ExpectOneLineFailure(Outcome const& outcome, std::string const& reason) {
    EXPECT_TRUE(outcome.exited) << "the tool was ended by a signal";
    EXPECT_NE(0, outcome.status);
    EXPECT_THAT(outcome.err, StartsWith("vexmap: "));
    EXPECT_THAT(outcome.err, HasSubstr(reason));
    EXPECT_EQ(1, std::count(outcome.err.begin(), outcome.err.end(), '\n')) << outcome.err;
    EXPECT_EQ('\n', outcome.err.empty() ? '\0' : outcome.err.back());
    EXPECT_EQ("", outcome.out);
}

TEST_F(VexmapTest, WritesBothViewsOfTheSampleIntoTheOutputDirectory) {
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--output", output});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);

    RgbImage const ptz = ReadImage(output + "/sentry360-ptz.png");
    EXPECT_EQ(960, ptz.width);
    EXPECT_EQ(540, ptz.height);
    RgbImage const panorama = ReadImage(output + "/sentry360-panorama.png");
    EXPECT_EQ(512, panorama.width);
    EXPECT_EQ(512, panorama.height);
}

TEST_F(VexmapTest, PrintsOneLinePerFileWritten) {
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, StartsWith("Sentry360 dewarper (mode 2), chosen by default\n"));
    EXPECT_EQ(3, std::count(outcome.out.begin(), outcome.out.end(), '\n')) << outcome.out;
    EXPECT_THAT(outcome.out, HasSubstr(output + "/sentry360-ptz.png\n"));
    EXPECT_THAT(outcome.out, HasSubstr(output + "/sentry360-panorama.png\n"));
}

TEST_F(VexmapTest, WritesTheOneAskedViewToTheNamedFile) {
    std::filesystem::create_directories(directory / "views");
    std::string const file = PathOf("views/mine.png");
    Outcome const outcome = Run({"--submode", "1", "--output", file});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    RgbImage const view = ReadImage(file);
    EXPECT_EQ(960, view.width);
    EXPECT_EQ(540, view.height);
    auto const entries = std::distance(std::filesystem::directory_iterator(directory / "views"),
                                       std::filesystem::directory_iterator());
    EXPECT_EQ(1, entries);
}

TEST_F(VexmapTest, NamesEachViewAfterTheFileWhenThereAreSeveral) {
    Outcome const outcome = Run({"--output", PathOf("mine.png")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(960, ReadImage(PathOf("mine-ptz.png")).width);
    EXPECT_EQ(512, ReadImage(PathOf("mine-panorama.png")).width);
    EXPECT_FALSE(std::filesystem::exists(directory / "mine.png"));
}

TEST_F(VexmapTest, DewarpsAPngGivenAsInput) {
    std::string const input = PathOf("disc.png");
    WritePng(input, DiscPicture());
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--input", input, "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    RgbImage const ptz = ReadImage(output + "/sentry360-ptz.png");
    EXPECT_EQ(960, ptz.width);
    EXPECT_EQ(540, ptz.height);
    RgbImage const panorama = ReadImage(output + "/sentry360-panorama.png");
    EXPECT_EQ(128, panorama.width);
    EXPECT_EQ(128, panorama.height);
}

TEST_F(VexmapTest, DewarperRoundsTheWishedSize) {
    std::string const input = PathOf("disc.png");
    WritePng(input, DiscPicture());
    std::string const file = PathOf("ptz.png");
    Outcome const outcome =
        Run({"--input", input, "--submode", "1", "--size", "641x361", "--output", file});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    RgbImage const view = ReadImage(file);
    EXPECT_EQ(648, view.width);
    EXPECT_EQ(362, view.height);
    EXPECT_THAT(outcome.out, HasSubstr("648x362"));
}

TEST_F(VexmapTest, ModeTwoChoosesSentry360) {
    std::string const input = PathOf("disc.png");
    WritePng(input, DiscPicture());
    std::string const output = PathOf("views");
    Outcome const outcome =
        Run({"--input", input, "--mode", "2", "--submode", "2", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(128, ReadImage(output + "/sentry360-panorama.png").width);
}

TEST_F(VexmapTest, SaysWhetherTheKindWasChosenByNameOrByMode) {
    Outcome const by_name = Run({"--kind", "Sentry360", "--output", PathOf("by-name")});
    ASSERT_EQ(0, by_name.status) << by_name.err;
    EXPECT_THAT(by_name.out, StartsWith("Sentry360 dewarper (mode 2), chosen by name\n"));
    Outcome const by_mode = Run({"--mode", "2", "--output", PathOf("by-mode")});
    ASSERT_EQ(0, by_mode.status) << by_mode.err;
    EXPECT_THAT(by_mode.out, StartsWith("Sentry360 dewarper (mode 2), chosen by mode\n"));
}

TEST_F(VexmapTest, RtspStreamWhoseUrlEndsInH264ChoosesSentry360) {
    std::string const output = PathOf("views");
    Outcome const outcome = Run(
        {"--make", "RTSP", "--model", "x", "--url", "rtsp://192.168.0.9/h264", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_THAT(outcome.out, StartsWith("Sentry360 dewarper (mode 2), chosen by camera RTSP / x / "
                                        "rtsp://192.168.0.9/h264\n"));
    EXPECT_EQ(960, ReadImage(output + "/sentry360-ptz.png").width);
    EXPECT_EQ(512, ReadImage(output + "/sentry360-panorama.png").width);
}

TEST_F(VexmapTest, Sentry360MakeWithAnFsModelChoosesSentry360) {
    std::string const output = PathOf("views");
    Outcome const outcome =
        Run({"--make", "Sentry360", "--model", "FS-IP5000", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, StartsWith("Sentry360 dewarper (mode 2), chosen by camera Sentry360 / "
                                        "FS-IP5000\n"));
    EXPECT_EQ(960, ReadImage(output + "/sentry360-ptz.png").width);
}

TEST_F(VexmapTest, CameraThatNoKindSuitsIsARuntimeFailure) {
    Outcome const outcome =
        Run({"--make", "Acme", "--model", "Fisheye 360", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "no dewarper kind suits the camera Acme / Fisheye 360");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, ModelAloneIsACameraWithAnEmptyMake) {
    Outcome const outcome = Run({"--model", "FS-IP5000", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "no dewarper kind suits the camera \"\" / FS-IP5000");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_F(VexmapTest, CameraOfAKindThatIsNotRegisteredIsARuntimeFailure) {
    Outcome const outcome =
        Run({"--make", "AXIS", "--model", "M3007", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "no dewarper kind has mode 10");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, MakeAndModeTogetherAreAUsageError) {
    Outcome const outcome =
        Run({"--make", "Sentry360", "--mode", "2", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "--make");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, UrlAndKindTogetherAreAUsageError) {
    Outcome const outcome = Run({"--url", "rtsp://192.168.0.9/h264", "--kind", "Sentry360"});
    ExpectOneLineFailure(outcome, "--url");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
}

TEST_F(VexmapTest, HelpExitsCleanly) {
    Outcome const outcome = Run({"--help"});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status);
    EXPECT_THAT(outcome.out, HasSubstr("--input"));
    EXPECT_THAT(outcome.out, HasSubstr("--submode"));
    EXPECT_EQ("", outcome.err);
}

TEST_F(VexmapTest, MissingInputFileIsRefusedNamingIt) {
    std::string const input = PathOf("absent.png");
    Outcome const outcome = Run({"--input", input, "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, input);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, InputThatIsNoImageIsARuntimeFailure) {
    std::string const input = PathOf("notes.png");
    std::ofstream(input) << "not a picture\n";
    Outcome const outcome = Run({"--input", input, "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, input + " is neither a PNG nor a JPEG file");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, UnknownKindIsARuntimeFailure) {
    Outcome const outcome = Run({"--kind", "Nosuch", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "unknown dewarper kind \"Nosuch\"");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, ModeOfNoKindIsARuntimeFailure) {
    Outcome const outcome = Run({"--mode", "10", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "no dewarper kind has mode 10");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_F(VexmapTest, UnregisteredModeOneIsARuntimeFailure) {
    Outcome const outcome = Run({"--mode", "1", "--output", PathOf("views")});
    EXPECT_EQ("vexmap: no dewarper kind has mode 1\n", outcome.err);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, KindAndModeTogetherAreAUsageError) {
    Outcome const outcome = Run({"--kind", "Sentry360", "--mode", "2"});
    ExpectOneLineFailure(outcome, "--kind");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
}

TEST_F(VexmapTest, EmptySizeIsAUsageError) {
    Outcome const outcome = Run({"--size", "0x0", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "--size");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, CircleOutsideThePictureIsARuntimeFailure) {
    Outcome const outcome = Run({"--circle", "5000,5000,10", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "the circle 5000,5000,10 lies outside the 1024x1024 picture");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, SubModeTheKindLacksIsARuntimeFailure) {
    Outcome const outcome = Run({"--submode", "3", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "the Sentry360 dewarper has no sub-mode 3");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, UnknownOptionIsAUsageError) {
    Outcome const outcome = Run({"--bogus", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "--bogus");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, MissingPluginIsARuntimeFailure) {
    std::string const plugin = PathOf("libabsent.so");
    Outcome const outcome = Run({"--plugin", plugin, "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "cannot load the plug-in " + plugin);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

}  // namespace
}  // namespace vexmap_host
