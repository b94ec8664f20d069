#include <algorithm>
#include <array>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <spawn.h>
#include <sstream>
#include <string>
#include <thread>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>

#include "image_file.h"
#include "pixel_format.h"
#include "rgb_image.h"
#include "sample_scene.h"
#include "y4m_reader.h"
#include "y4m_writer.h"
#include "yuv_image.h"

namespace vexmap_host {
namespace {

using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::Not;
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

YuvImage UniformYuv(int width, int height, uint8_t y, uint8_t u, uint8_t v) {
    YuvImage image;
    image.width = width;
    image.height = height;
    std::size_t const luma = std::size_t(width) * std::size_t(height);
    std::size_t const chroma =
        YuvImage::ChromaWidth(std::size_t(width)) * YuvImage::ChromaHeight(std::size_t(height));
    image.bytes.assign(luma, y);
    image.bytes.insert(image.bytes.end(), chroma, u);
    image.bytes.insert(image.bytes.end(), chroma, v);
    return image;
}

// The built-in sample, as a stream would carry it.
YuvImage SampleFrame(int size) {
    return PixelFormat::ToYuv(MakeSampleFisheye(size).image);
}

std::string StreamOf(std::vector<YuvImage> const& frames, int rate_numerator = 30000,
                     int rate_denominator = 1001) {
    std::ostringstream stream;
    Y4mWriter writer(stream, "the test's stream", rate_numerator, rate_denominator);
    for (YuvImage const& frame : frames) {
        writer.WriteFrame(frame);
    }
    return stream.str();
}

struct Stream {
    Y4mHeader header;
    std::vector<YuvImage> frames;
};

Stream ReadStream(std::string const& bytes) {
    std::istringstream input(bytes);
    Y4mReader reader(input, "the tool's stream");
    Stream stream;
    stream.header = reader.Header();
    YuvImage frame;
    while (reader.ReadFrame(frame)) {
        stream.frames.push_back(frame);
    }
    return stream;
}

void WriteText(std::string const& path, std::string const& bytes) {
    std::ofstream(path, std::ios::binary) << bytes;
}

// Luma, U and V of the pixel at the middle of a frame.
std::array<uint8_t, 3> MiddleOf(YuvImage const& image) {
    std::size_t const width = std::size_t(image.width);
    std::size_t const height = std::size_t(image.height);
    std::size_t const chroma_width = YuvImage::ChromaWidth(width);
    std::size_t const chroma_size = chroma_width * YuvImage::ChromaHeight(height);
    std::size_t const chroma = height / 4 * chroma_width + width / 4;
    return {image.bytes[height / 2 * width + width / 2], image.bytes[width * height + chroma],
            image.bytes[width * height + chroma_size + chroma]};
}

// Starts the built tool with its standard streams as the actions say, in the test's environment
// with `added_environment` ("NAME=value" entries) in front; -1 if it cannot start.
pid_t Start(std::vector<std::string> arguments, posix_spawn_file_actions_t const& actions,
            posix_spawnattr_t const* attributes = nullptr,
            std::vector<std::string> added_environment = {}) {
    arguments.insert(arguments.begin(), VEXMAP_TOOL_PATH);
    std::vector<char*> argv;
    for (std::string& argument : arguments) {
        argv.push_back(argument.data());
    }
    argv.push_back(nullptr);
    std::vector<char*> envp;
    for (std::string& entry : added_environment) {
        envp.push_back(entry.data());
    }
    for (char** entry = environ; *entry != nullptr; ++entry) {
        envp.push_back(*entry);
    }
    envp.push_back(nullptr);
    pid_t child = 0;
    if (posix_spawn(&child, VEXMAP_TOOL_PATH, &actions, attributes, argv.data(), envp.data()) !=
        0) {
        ADD_FAILURE() << "cannot start " << VEXMAP_TOOL_PATH;
        return -1;
    }
    return child;
}

Outcome Wait(pid_t child) {
    Outcome outcome;
    if (child < 0) {
        return outcome;
    }
    int wait_status = 0;
    waitpid(child, &wait_status, 0);
    outcome.exited = WIFEXITED(wait_status);
    outcome.status = outcome.exited ? WEXITSTATUS(wait_status) : -1;
    return outcome;
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

    // Runs the built tool with standard output and error captured in files of the test, and
    // standard input read from a file (nothing by default), in the test's working directory
    // unless another is given.
    Outcome Run(std::vector<std::string> arguments, std::string const& input = "/dev/null",
                std::filesystem::path const& working_directory = {}) const {
        std::filesystem::path const out_path = directory / "stdout.txt";
        std::filesystem::path const err_path = directory / "stderr.txt";
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        if (!working_directory.empty()) {
            posix_spawn_file_actions_addchdir_np(&actions, working_directory.c_str());
        }
        posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, input.c_str(), O_RDONLY, 0);
        posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, out_path.c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0644);
        posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, err_path.c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0644);
        Outcome outcome = Wait(Start(std::move(arguments), actions, nullptr, added_environment));
        posix_spawn_file_actions_destroy(&actions);
        outcome.out = ReadText(out_path);
        outcome.err = ReadText(err_path);
        return outcome;
    }

    // Runs the built tool between two pipes: `input` is written into its standard input while
    // its standard output is read, as a shell pipeline would. Standard error goes to a file.
    Outcome RunPiped(std::vector<std::string> arguments, std::string const& input) const {
        std::filesystem::path const err_path = directory / "stderr.txt";
        int in_pipe[2] = {-1, -1};
        int out_pipe[2] = {-1, -1};
        if (pipe2(in_pipe, O_CLOEXEC) != 0 || pipe2(out_pipe, O_CLOEXEC) != 0) {
            ADD_FAILURE() << "cannot make the pipes";
            return Outcome();
        }
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_adddup2(&actions, in_pipe[0], STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out_pipe[1], STDOUT_FILENO);
        posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, err_path.c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0644);
        // The feeder may write into a pipe that the tool has stopped reading: the test takes
        // that as an error of write, not as a signal.
        struct sigaction ignore = {};
        ignore.sa_handler = SIG_IGN;
        struct sigaction previous = {};
        sigaction(SIGPIPE, &ignore, &previous);
        posix_spawnattr_t attributes;
        posix_spawnattr_init(&attributes);
        sigset_t default_signals;
        sigemptyset(&default_signals);
        sigaddset(&default_signals, SIGPIPE);
        posix_spawnattr_setsigdefault(&attributes, &default_signals);
        posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF);
        pid_t const child = Start(std::move(arguments), actions, &attributes);
        posix_spawnattr_destroy(&attributes);
        posix_spawn_file_actions_destroy(&actions);
        close(in_pipe[0]);
        close(out_pipe[1]);
        std::string out;
        std::thread feeder([&input, fd = in_pipe[1]] {
            std::size_t written = 0;
            while (written < input.size()) {
                ssize_t const done = write(fd, input.data() + written, input.size() - written);
                if (done <= 0) {
                    break;
                }
                written += std::size_t(done);
            }
            close(fd);
        });
        char chunk[65536];
        for (ssize_t got = read(out_pipe[0], chunk, sizeof chunk); got > 0;
             got = read(out_pipe[0], chunk, sizeof chunk)) {
            out.append(chunk, std::size_t(got));
        }
        close(out_pipe[0]);
        feeder.join();
        Outcome outcome = Wait(child);
        sigaction(SIGPIPE, &previous, nullptr);
        outcome.out = std::move(out);
        outcome.err = ReadText(err_path);
        return outcome;
    }

    std::filesystem::path directory;
    std::vector<std::string> added_environment;  // for the tool started by Run
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

TEST_F(VexmapTest, WithoutArgumentsWritesThePtzViewAndBothPanoramasOfTheSampleIntoOut) {
    Outcome const outcome = Run({}, "/dev/null", directory);
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(
        "Brenvia dewarper (mode 8), chosen by default\n"
        "Brenvia ptz view, 960x540: out/brenvia-ptz.png\n"
        "Brenvia panorama view, 960x540: out/brenvia-panorama.png\n"
        "Brenvia dual-panorama view, 960x540: out/brenvia-dual-panorama.png\n",
        outcome.out);
    for (char const* view : {"ptz", "panorama", "dual-panorama"}) {
        RgbImage const picture = ReadImage(PathOf(std::string("out/brenvia-") + view + ".png"));
        EXPECT_EQ(960, picture.width) << view;
        EXPECT_EQ(540, picture.height) << view;
    }
}

TEST_F(VexmapTest, WritesBothViewsOfSentry360IntoTheOutputDirectory) {
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--kind", "Sentry360", "--output", output});
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
    EXPECT_THAT(outcome.out, StartsWith("Brenvia dewarper (mode 8), chosen by default\n"));
    EXPECT_EQ(4, std::count(outcome.out.begin(), outcome.out.end(), '\n')) << outcome.out;
    EXPECT_THAT(outcome.out, HasSubstr(output + "/brenvia-ptz.png\n"));
    EXPECT_THAT(outcome.out, HasSubstr(output + "/brenvia-panorama.png\n"));
    EXPECT_THAT(outcome.out, HasSubstr(output + "/brenvia-dual-panorama.png\n"));
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
    EXPECT_EQ(960, ReadImage(PathOf("mine-panorama.png")).width);
    EXPECT_EQ(960, ReadImage(PathOf("mine-dual-panorama.png")).width);
    EXPECT_FALSE(std::filesystem::exists(directory / "mine.png"));
}

TEST_F(VexmapTest, DewarpsAPngGivenAsInput) {
    std::string const input = PathOf("disc.png");
    WritePng(input, DiscPicture());
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--input", input, "--kind", "Sentry360", "--output", output});
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
    EXPECT_THAT(outcome.out, HasSubstr("--quiet"));
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

TEST_F(VexmapTest, UnregisteredModeFourIsARuntimeFailure) {
    Outcome const outcome = Run({"--mode", "4", "--output", PathOf("views")});
    EXPECT_EQ("vexmap: no dewarper kind has mode 4\n", outcome.err);
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
    Outcome const outcome =
        Run({"--kind", "Sentry360", "--submode", "3", "--output", PathOf("views")});
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

TEST_F(VexmapTest, QuietWritesThePicturesAndSaysNothing) {
    Outcome const outcome = Run({"--quiet", "--output", PathOf("views")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(960, ReadImage(PathOf("views/brenvia-ptz.png")).width);
}

TEST_F(VexmapTest, PositionPicksTheMount) {
    std::vector<RgbImage> views;
    for (char const* position : {"ceiling", "floor", "wall"}) {
        std::string const file = PathOf(std::string(position) + ".png");
        Outcome const outcome =
            Run({"--position", position, "--submode", "2", "--size", "320x180", "--output", file});
        ASSERT_EQ(0, outcome.status) << outcome.err;
        views.push_back(ReadImage(file));
    }
    EXPECT_NE(views[0].pixels, views[1].pixels);
    EXPECT_NE(views[0].pixels, views[2].pixels);
    EXPECT_NE(views[1].pixels, views[2].pixels);
}

TEST_F(VexmapTest, InHouseKindRefusesAPictureOfOddSize) {
    RgbImage picture = DiscPicture();
    picture.width = 255;
    picture.height = 256;
    picture.pixels.resize(std::size_t(255) * 256 * 3);
    std::string const input = PathOf("odd.png");
    WritePng(input, picture);
    // The kind is told before the first frame, which is where the size is refused.
    Outcome const outcome = Run({"--input", input, "--output", PathOf("views")});
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_EQ("Brenvia dewarper (mode 8), chosen by default\n", outcome.out);
    EXPECT_EQ("vexmap: 4:2:0 frames of the plug-in need an even width and height, not 255x256\n",
              outcome.err);
}

TEST_F(VexmapTest, DewarpsAStreamFileFrameByFrameIntoAStreamFile) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)}));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--input", input, "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(
        "Brenvia dewarper (mode 8), chosen by default\n"
        "Brenvia ptz view, 960x540, 3 frames: " +
            output + "\n",
        outcome.out);
    std::string const written = ReadText(output);
    EXPECT_THAT(written, StartsWith("YUV4MPEG2 W960 H540 F30000:1001 Ip A1:1 C420jpeg\nFRAME\n"));
    Stream const stream = ReadStream(written);
    ASSERT_EQ(3u, stream.frames.size());
    EXPECT_EQ(stream.frames[0].bytes, stream.frames[1].bytes);
    EXPECT_EQ(stream.frames[0].bytes, stream.frames[2].bytes);
}

// A 4:2:0 frame meets the in-house kind without a colour conversion, so a uniform frame comes
// out with its very bytes in the middle of the view.
TEST_F(VexmapTest, DewarpsEachFrameOfAStreamForItself) {
    std::string const input = PathOf("in.y4m");
    WriteText(input,
              StreamOf({SampleFrame(512), UniformYuv(512, 512, 100, 90, 200), SampleFrame(512)}));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--input", input, "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    Stream const stream = ReadStream(ReadText(output));
    ASSERT_EQ(3u, stream.frames.size());
    EXPECT_NE(stream.frames[0].bytes, stream.frames[1].bytes);
    EXPECT_EQ(stream.frames[0].bytes, stream.frames[2].bytes);
    EXPECT_EQ((std::array<uint8_t, 3>{100, 90, 200}), MiddleOf(stream.frames[1]));
}

TEST_F(VexmapTest, StreamCarriesTheAskedViewAtTheAskedSizeAsTheDewarperRoundsIt) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512), SampleFrame(512)}, 25, 1));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome =
        Run({"--input", input, "--submode", "3", "--size", "641x361", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia dual-panorama view, 648x362, 2 frames: "));
    Stream const stream = ReadStream(ReadText(output));
    EXPECT_EQ(648, stream.header.width);
    EXPECT_EQ(362, stream.header.height);
    EXPECT_EQ(25, stream.header.rate_numerator);
    EXPECT_EQ(1, stream.header.rate_denominator);
    EXPECT_EQ(2u, stream.frames.size());
}

TEST_F(VexmapTest, PipesAStreamFromStandardInputToStandardOutput) {
    std::string const input = StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)});
    Outcome const outcome = RunPiped({"--input", "-", "--output", "-"}, input);
    ASSERT_TRUE(outcome.exited);
    ASSERT_EQ(0, outcome.status) << outcome.err;
    Stream const stream = ReadStream(outcome.out);
    EXPECT_EQ(960, stream.header.width);
    EXPECT_EQ(540, stream.header.height);
    EXPECT_EQ(30000, stream.header.rate_numerator);
    EXPECT_EQ(1001, stream.header.rate_denominator);
    EXPECT_EQ(3u, stream.frames.size());
    // What the tool has to say goes to standard error, and is no error.
    EXPECT_EQ(
        "Brenvia dewarper (mode 8), chosen by default\n"
        "Brenvia ptz view, 960x540, 3 frames: standard output\n",
        outcome.err);
}

TEST_F(VexmapTest, QuietPipeWritesTheStreamAndNothingElse) {
    std::string const input = StreamOf({SampleFrame(512), SampleFrame(512)});
    Outcome const outcome = RunPiped({"--quiet", "--input", "-", "--output", "-"}, input);
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ(2u, ReadStream(outcome.out).frames.size());
}

TEST_F(VexmapTest, ReadsAStreamFromStandardInputIntoAFile) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512)}));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--input", "-", "--output", output}, input);
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia ptz view, 960x540, 1 frame: " + output + "\n"));
    EXPECT_EQ(1u, ReadStream(ReadText(output)).frames.size());
}

TEST_F(VexmapTest, StillWrittenAsAStreamIsOneFrameAtTwentyFiveFramesASecond) {
    std::string const output = PathOf("still.y4m");
    Outcome const outcome = Run({"--submode", "2", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia panorama view, 960x540, 1 frame: " + output));
    Stream const stream = ReadStream(ReadText(output));
    EXPECT_EQ(960, stream.header.width);
    EXPECT_EQ(540, stream.header.height);
    EXPECT_EQ(25, stream.header.rate_numerator);
    EXPECT_EQ(1, stream.header.rate_denominator);
    EXPECT_EQ(1u, stream.frames.size());
}

// Mid grey, 126 in limited range, is 128 in RGB and back, so the picture shows it exactly.
TEST_F(VexmapTest, StreamWrittenAsPicturesGivesTheViewsOfItsFirstFrame) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({UniformYuv(512, 512, 126, 128, 128), SampleFrame(512)}));
    Outcome const outcome = Run({"--input", input, "--output", PathOf("views")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    RgbImage const ptz = ReadImage(PathOf("views/brenvia-ptz.png"));
    ASSERT_EQ(960, ptz.width);
    ASSERT_EQ(540, ptz.height);
    uint8_t const* middle = &ptz.pixels[(std::size_t(270) * 960 + 480) * 3];
    EXPECT_EQ((std::vector<uint8_t>{128, 128, 128}), std::vector<uint8_t>(middle, middle + 3));
    EXPECT_EQ(960, ReadImage(PathOf("views/brenvia-dual-panorama.png")).width);
}

TEST_F(VexmapTest, KindThatTakesRgbDewarpsAStreamToo) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(511), SampleFrame(511)}));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--kind", "Sentry360", "--input", input, "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    Stream const stream = ReadStream(ReadText(output));
    EXPECT_EQ(960, stream.header.width);
    EXPECT_EQ(540, stream.header.height);
    EXPECT_EQ(2u, stream.frames.size());
}

TEST_F(VexmapTest, InHouseKindRefusesAStreamOfOddSize) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(511)}));
    Outcome const outcome = Run({"--input", input, "--output", PathOf("out.y4m")});
    ExpectOneLineFailure(outcome,
                         "4:2:0 frames of the plug-in need an even width and height, "
                         "not 511x511");
}

TEST_F(VexmapTest, StreamOfNoFrameIsARuntimeFailure) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, "YUV4MPEG2 W512 H512 F25:1\n");
    Outcome const outcome = Run({"--input", input, "--output", PathOf("out.y4m")});
    ExpectOneLineFailure(outcome, input + " holds no frame");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_F(VexmapTest, StreamCutShortKeepsTheFramesBeforeAndFailsInOneLine) {
    std::string input = StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)});
    input.resize(input.size() - 1000);
    Outcome const outcome = RunPiped({"--input", "-", "--output", "-"}, input);
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_EQ("vexmap: standard input ends inside frame 3, after 392216 of its 393216 bytes\n",
              outcome.err);
    EXPECT_EQ(2u, ReadStream(outcome.out).frames.size());
}

struct BadStream {
    char const* name;
    std::string bytes;
    char const* reason;  // follows the name of the source
};

class VexmapBadStreamTest : public VexmapTest, public ::testing::WithParamInterface<BadStream> {};

TEST_P(VexmapBadStreamTest, FileFailsInOneLine) {
    std::string const input = PathOf("bad.y4m");
    WriteText(input, GetParam().bytes);
    Outcome const outcome = Run({"--input", input, "--output", PathOf("out.y4m")});
    ExpectOneLineFailure(outcome, input + " " + GetParam().reason);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_P(VexmapBadStreamTest, PipeFailsInOneLine) {
    Outcome const outcome = RunPiped({"--input", "-", "--output", "-"}, GetParam().bytes);
    ExpectOneLineFailure(outcome, std::string("standard input ") + GetParam().reason);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_P(VexmapBadStreamTest, FileReadAsPicturesFailsInOneLine) {
    std::string const input = PathOf("bad.y4m");
    WriteText(input, GetParam().bytes);
    Outcome const outcome = Run({"--input", input, "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, input + " " + GetParam().reason);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

std::string const HEADER_512 = "YUV4MPEG2 W512 H512 F25:1 Ip A1:1 C420jpeg\n";

std::string CaseName(::testing::TestParamInfo<BadStream> const& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(
    Refusals, VexmapBadStreamTest,
    ::testing::Values(
        BadStream{"Empty", "", "is not a YUV4MPEG2 stream"},
        BadStream{"NoMagic", "P6\n512 512\n255\n", "is not a YUV4MPEG2 stream"},
        BadStream{"HeaderTooLong", "YUV4MPEG2 W512 H512 X" + std::string(8192, 'x') + "\n",
                  "has a stream header longer than 4096 bytes"},
        BadStream{"MissingWidth", "YUV4MPEG2 H512 F25:1\n", "has no frame width (W)"},
        BadStream{"MissingHeight", "YUV4MPEG2 W512 F25:1\n", "has no frame height (H)"},
        BadStream{"ColourSpace444", "YUV4MPEG2 W512 H512 C444\n",
                  "has the colour space C444; vexmap reads 8-bit 4:2:0 only"},
        BadStream{"ColourSpaceMono", "YUV4MPEG2 W512 H512 Cmono\n", "has the colour space Cmono"},
        BadStream{"HugeWidth", "YUV4MPEG2 W100000 H512\n",
                  "has a frame width that is not a whole number from 1 to 16384"},
        BadStream{"OverflowingHeight", "YUV4MPEG2 W512 H18446744073709551617\n",
                  "has a frame height that is not a whole number from 1 to 16384"},
        BadStream{"TruncatedFrame", HEADER_512 + "FRAME\n" + std::string(1000, '\x80'),
                  "ends inside frame 1, after 1000 of its 393216 bytes"},
        BadStream{"HugeFrameCutShort",
                  "YUV4MPEG2 W16384 H16384\nFRAME\n" + std::string(1000, '\x80'),
                  "ends inside frame 1, after 1000 of its 402653184 bytes"},
        BadStream{"BadFrameLine", HEADER_512 + "FRAMX\n" + std::string(393216, '\x80'),
                  "has a bad FRAME line of frame 1: it does not start with FRAME"},
        BadStream{"FrameLineTooLong", HEADER_512 + "FRAME " + std::string(5000, 'x'),
                  "has a FRAME line of frame 1 longer than 4096 bytes"}),
    CaseName);

// The ffmpeg on the search path, or "" when there is none.
std::string FindFfmpeg() {
    char const* const path = getenv("PATH");
    std::istringstream directories(path != nullptr ? path : "");
    std::string entry;
    while (std::getline(directories, entry, ':')) {
        std::filesystem::path const candidate = std::filesystem::path(entry) / "ffmpeg";
        if (!entry.empty() && access(candidate.c_str(), X_OK) == 0) {
            return candidate.string();
        }
    }
    return "";
}

// ffmpeg reads the stream the test wrote and pipes it to the tool, whose stream another ffmpeg
// encodes; the file it made is decoded once more and read back.
class VexmapVendorKindTest : public VexmapTest,
                             public ::testing::WithParamInterface<char const*> {};

TEST_P(VexmapVendorKindTest, WithoutItsLibraryTheKindIsNotAvailable) {
    std::string const kind = GetParam();
    Outcome const outcome = Run({"--kind", kind, "--output", PathOf("views")});
    EXPECT_EQ(
        "vexmap: the " + kind + " dewarper is not available: its vendor library is not installed\n",
        outcome.err);
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

// The test stand-ins of the vendors' libraries, under their names, where the loader is told to
// look: the tool then finds them as it would find the real ones.
class VexmapWithVendorLibrariesTest : public VexmapTest,
                                      public ::testing::WithParamInterface<char const*> {
protected:
    void SetUp() override {
        VexmapTest::SetUp();
        added_environment = {std::string("LD_LIBRARY_PATH=") + VEXMAP_STANDIN_DIR};
    }
};

TEST_P(VexmapWithVendorLibrariesTest, TheKindWritesEachOfItsViews) {
    std::string const kind = GetParam();
    std::string const output = PathOf("views");
    Outcome const outcome = Run({"--kind", kind, "--output", output});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_THAT(outcome.out, StartsWith(kind + " dewarper (mode "));
    EXPECT_THAT(outcome.out, HasSubstr(kind + " ptz view, "));
    std::vector<std::filesystem::path> written;
    for (auto const& entry : std::filesystem::directory_iterator(output)) {
        written.push_back(entry.path());
    }
    EXPECT_GE(written.size(), 2u);
    for (auto const& path : written) {
        RgbImage const picture = ReadImage(path.string());
        EXPECT_GT(picture.width, 0) << path;
        // The stand-ins carry the picture over, so the sample's bright walls show.
        EXPECT_GT(*std::max_element(picture.pixels.begin(), picture.pixels.end()), 100) << path;
    }
}

INSTANTIATE_TEST_SUITE_P(Kinds, VexmapVendorKindTest,
                         ::testing::Values("ImmerVision", "Samsung", "Vivotek", "Geovision"));
INSTANTIATE_TEST_SUITE_P(Kinds, VexmapWithVendorLibrariesTest,
                         ::testing::Values("ImmerVision", "Samsung", "Vivotek", "Geovision"));

TEST_F(VexmapTest, ListShowsEveryKindAndWhetherItIsAvailable) {
    Outcome const outcome = Run({"--list"});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(
        " 1 ImmerVision  not available (vendor library not installed)\n"
        " 2 Sentry360    available\n"
        " 3 Vivotek      not available (vendor library not installed)\n"
        " 7 Samsung      not available (vendor library not installed)\n"
        " 8 Brenvia      available\n"
        " 9 Geovision    not available (vendor library not installed)\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
}

TEST_F(VexmapWithVendorLibrariesTest, ListShowsTheLensesOfTheAvailableLensKinds) {
    Outcome const outcome = Run({"--list"});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr(" 1 ImmerVision  available\n     lens 0: RPL Number "));
    EXPECT_THAT(outcome.out, HasSubstr(" 3 Vivotek      available\n     lens 0: Default\n"
                                       "     lens 1: FE8171\n"));
    EXPECT_THAT(outcome.out, HasSubstr("     lens 7: FE8181\n 7 Samsung      available\n"));
    EXPECT_THAT(outcome.out, HasSubstr(" 9 Geovision    available\n"));
}

TEST_F(VexmapWithVendorLibrariesTest, TheLensOfAKindWithLensesIsNamed) {
    Outcome const outcome = Run(
        {"--kind", "Vivotek", "--lens", "3", "--submode", "1", "--output", PathOf("vivotek.png")});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Vivotek lens 3: FE8173\n"));
}

TEST_F(VexmapWithVendorLibrariesTest, SamsungStartsFromTheCamerasDefaultLens) {
    Outcome const outcome = Run({"--make", "Samsung", "--model", "SNF-8010", "--submode", "1",
                                 "--output", PathOf("samsung.png")});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Samsung lens "));
    EXPECT_THAT(outcome.out, HasSubstr(": RPL Number C7SST\n"));
}

TEST_F(VexmapTest, PipesThroughFfmpegBothWays) {
    std::string const ffmpeg = FindFfmpeg();
    if (ffmpeg.empty()) {
        GTEST_SKIP() << "ffmpeg is not installed";
    }
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)}, 25, 1));
    std::string const encoded = PathOf("out.mkv");
    std::string const decoded = PathOf("back.y4m");
    std::string const quiet = " -nostdin -hide_banner -loglevel error -y";
    std::string const command =
        ffmpeg + quiet + " -i '" + input + "' -f yuv4mpegpipe - | '" + VEXMAP_TOOL_PATH +
        "' --quiet --input - --output - | " + ffmpeg + quiet + " -f yuv4mpegpipe -i - -c:v ffv1 '" +
        encoded + "' && " + ffmpeg + quiet + " -i '" + encoded +
        "' -pix_fmt yuv420p -f yuv4mpegpipe '" + decoded + "' 2>'" + PathOf("ffmpeg.txt") + "'";
    // The shell reports the last command only: a tool that failed midway shows in the frames.
    ASSERT_EQ(0, std::system(command.c_str())) << command << "\n" << ReadText(PathOf("ffmpeg.txt"));
    Stream const stream = ReadStream(ReadText(decoded));
    EXPECT_EQ(960, stream.header.width);
    EXPECT_EQ(540, stream.header.height);
    ASSERT_EQ(3u, stream.frames.size());
    // ffv1 is lossless: what comes back is what the tool wrote.
    std::string const direct = PathOf("direct.y4m");
    ASSERT_EQ(0, Run({"--input", input, "--output", direct}).status);
    Stream const expected = ReadStream(ReadText(direct));
    ASSERT_EQ(3u, expected.frames.size());
    EXPECT_EQ(expected.frames[0].bytes, stream.frames[0].bytes);
}

}  // namespace
}  // namespace vexmap_host
