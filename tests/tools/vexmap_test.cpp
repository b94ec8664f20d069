#include <algorithm>
#include <array>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <spawn.h>
#include <sstream>
#include <string>
#include <thread>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>

#include "crafted_pictures.h"
#include "image_file.h"
#include "pixel_format.h"
#include "rgb_image.h"
#include "sample_scene.h"
#include "scratch_folder.h"
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
            std::vector<std::string> added_environment = {},
            std::string const& program = VEXMAP_TOOL_PATH) {
    arguments.insert(arguments.begin(), program);
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
    if (posix_spawn(&child, program.c_str(), &actions, attributes, argv.data(), envp.data()) != 0) {
        ADD_FAILURE() << "cannot start " << program;
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
    std::string PathOf(std::string const& name) const { return scratch.PathOf(name); }

    // Runs the built tool with standard output and error captured in files of the test, and
    // standard input read from a file (nothing by default), in the test's working directory
    // unless another is given.
    Outcome Run(std::vector<std::string> arguments, std::string const& input = "/dev/null",
                std::filesystem::path const& working_directory = {}) const {
        return RunProgram(VEXMAP_TOOL_PATH, std::move(arguments), input, working_directory);
    }

    Outcome RunProgram(std::string const& program, std::vector<std::string> arguments,
                       std::string const& input = "/dev/null",
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
        Outcome outcome =
            Wait(Start(std::move(arguments), actions, nullptr, added_environment, program));
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

    ScratchFolder const scratch{"vexmap-tool-"};
    std::filesystem::path const directory = scratch.Path();
    std::vector<std::string> added_environment;  // for the tool started by Run
};

// The kind's own tilt in force, whose last digits are the engine's float arithmetic, as "T".
std::string WithTiltHidden(std::string const& text) {
    return std::regex_replace(text, std::regex("tilt -?[0-9.e+-]+"), "tilt T");
}

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
        "Brenvia ptz view, 960x540, pan 0, tilt T, zoom 0.5: out/brenvia-ptz.png\n"
        "Brenvia panorama view, 1920x270, pan 0, tilt T, zoom 0.5: out/brenvia-panorama.png\n"
        "Brenvia dual-panorama view, 960x540, pan 0, tilt T, zoom 0.5: "
        "out/brenvia-dual-panorama.png\n",
        WithTiltHidden(outcome.out));
    // A panorama gets the shape its kind gives it, at about the pixels of the PTZ view.
    for (auto [view, width, height] :
         {std::tuple{"ptz", 960, 540}, std::tuple{"panorama", 1920, 270},
          std::tuple{"dual-panorama", 960, 540}}) {
        RgbImage const picture = ReadImage(PathOf(std::string("out/brenvia-") + view + ".png"));
        EXPECT_EQ(width, picture.width) << view;
        EXPECT_EQ(height, picture.height) << view;
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
    EXPECT_EQ(1920, ReadImage(PathOf("mine-panorama.png")).width);
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
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia ptz view, 648x362 (asked 641x361), "));
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
    EXPECT_THAT(outcome.out,
                StartsWith("Sentry360 dewarper (mode 2), chosen by camera RTSP / x / "
                           "rtsp://192.168.0.9/h264 (row 2 of --list-cameras: make equals "
                           "\"RTSP\", URL ends with \"/h264\" or \"/image.mpg\")\n"));
    EXPECT_EQ(960, ReadImage(output + "/sentry360-ptz.png").width);
    EXPECT_EQ(512, ReadImage(output + "/sentry360-panorama.png").width);
}

TEST_F(VexmapTest, Sentry360MakeWithAnFsModelChoosesSentry360) {
    std::string const output = PathOf("views");
    Outcome const outcome =
        Run({"--make", "Sentry360", "--model", "FS-IP5000", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, StartsWith("Sentry360 dewarper (mode 2), chosen by camera Sentry360 / "
                                        "FS-IP5000 (row 3 of --list-cameras: "));
    EXPECT_EQ(960, ReadImage(output + "/sentry360-ptz.png").width);
}

TEST_F(VexmapTest, CameraThatNoKindSuitsIsARuntimeFailure) {
    Outcome const outcome =
        Run({"--make", "Acme", "--model", "Fisheye 360", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome,
                         "no dewarper kind suits the camera Acme / Fisheye 360: no row "
                         "of --list-cameras takes the make \"Acme\"");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, ModelAloneIsACameraWithAnEmptyMake) {
    Outcome const outcome = Run({"--model", "FS-IP5000", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "no dewarper kind suits the camera \"\" / FS-IP5000");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_F(VexmapTest, CameraWhoseModelFailsTheRowOfItsMakeNamesThatRow) {
    Outcome const outcome = Run({"--make", "Vivotek", "--model", "IP8000"});
    ExpectOneLineFailure(outcome,
                         "no dewarper kind suits the camera Vivotek / IP8000: row 1 of "
                         "--list-cameras: make equals \"Vivotek\", model starts with "
                         "\"FE\" or \"VC\", takes the make but not the model");
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
}

TEST_F(VexmapTest, CameraOfAKindThatIsNotRegisteredIsARuntimeFailure) {
    Outcome const outcome =
        Run({"--make", "AXIS", "--model", "M3007", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome,
                         "the camera AXIS / M3007 is of mode 10, which no dewarper "
                         "kind of the plug-in serves");
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

TEST_F(VexmapTest, UnknownKindIsAUsageErrorThatListsTheKnownOnes) {
    Outcome const outcome = Run({"--kind", "Nosuch", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome,
                         "--kind Nosuch: no dewarper kind has this name; the kinds are "
                         "ImmerVision, Sentry360, Vivotek, Samsung, Brenvia, Geovision");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, KindNamesMatchInAnyCase) {
    Outcome const outcome = Run({"--kind", "sENTRY360", "--output", PathOf("views")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, StartsWith("Sentry360 dewarper (mode 2), chosen by name\n"));
}

TEST_F(VexmapTest, ModeOfNoKindIsAUsageError) {
    Outcome const outcome = Run({"--mode", "10", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome, "--mode 10: no dewarper kind has this mode (see --list)");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
}

TEST_F(VexmapTest, UnregisteredModeFourIsAUsageError) {
    Outcome const outcome = Run({"--mode", "4", "--output", PathOf("views")});
    EXPECT_EQ("vexmap: --mode 4: no dewarper kind has this mode (see --list)\n", outcome.err);
    EXPECT_EQ(USAGE_ERROR, outcome.status);
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

TEST_F(VexmapTest, CircleOutsideThePictureIsAUsageError) {
    Outcome const outcome =
        Run({"--kind", "Sentry360", "--circle", "5000,5000,10", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome,
                         "--circle 5000,5000,10: the centre lies outside the 1024x1024 picture");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_F(VexmapTest, CircleOfNoRadiusIsABadRadius) {
    Outcome const outcome = Run({"--kind", "Sentry360", "--circle", "512,512,0"});
    ExpectOneLineFailure(outcome, "--circle: the radius must be above 0, not 0 in 512,512,0");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
}

TEST_F(VexmapTest, SubModeTheKindLacksIsAUsageErrorThatNamesItsViews) {
    Outcome const outcome =
        Run({"--kind", "Sentry360", "--submode", "3", "--output", PathOf("views")});
    ExpectOneLineFailure(outcome,
                         "--submode 3: the Sentry360 dewarper has no dual-panorama view "
                         "here; its views are 1 (ptz), 2 (panorama)");
    EXPECT_EQ(USAGE_ERROR, outcome.status);
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

TEST_F(VexmapTest, InHouseKindTakesAPictureOfOddSizePaddedAndSaysSo) {
    RgbImage picture = DiscPicture();
    picture.width = 255;
    picture.height = 256;
    picture.pixels.resize(std::size_t(255) * 256 * 3);
    std::string const input = PathOf("odd.png");
    WritePng(input, picture);
    Outcome const outcome = Run({"--input", input, "--submode", "1", "--output", PathOf("v.png")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_THAT(outcome.out, HasSubstr("note: the 255x256 input is padded to 256x256: the Brenvia "
                                       "dewarper takes even sizes only\n"));
    EXPECT_EQ(960, ReadImage(PathOf("v.png")).width);
}

TEST_F(VexmapTest, RgbKindTakesAPictureOfOddSizeAsItIs) {
    RgbImage picture = DiscPicture();
    picture.width = 255;
    picture.pixels.resize(std::size_t(255) * 256 * 3);
    std::string const input = PathOf("odd.png");
    WritePng(input, picture);
    Outcome const outcome = Run({"--input", input, "--kind", "Sentry360", "--output", PathOf("v")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, Not(HasSubstr("padded")));
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
        "Brenvia ptz view, 960x540, pan 0, tilt T, zoom 0.5, 3 frames: " +
            output + "\n",
        WithTiltHidden(outcome.out));
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
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia dual-panorama view, 648x362 (asked 641x361), "));
    EXPECT_THAT(outcome.out, HasSubstr(", 2 frames: "));
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
        "Brenvia ptz view, 960x540, pan 0, tilt T, zoom 0.5, 3 frames: standard output\n",
        WithTiltHidden(outcome.err));
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
    EXPECT_THAT(outcome.out, HasSubstr(", 1 frame: " + output + "\n"));
    EXPECT_EQ(1u, ReadStream(ReadText(output)).frames.size());
}

TEST_F(VexmapTest, StillWrittenAsAStreamIsOneFrameAtTwentyFiveFramesASecond) {
    std::string const output = PathOf("still.y4m");
    Outcome const outcome = Run({"--submode", "2", "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia panorama view, 1920x270, "));
    EXPECT_THAT(outcome.out, HasSubstr(", 1 frame: " + output));
    Stream const stream = ReadStream(ReadText(output));
    EXPECT_EQ(1920, stream.header.width);
    EXPECT_EQ(270, stream.header.height);
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

TEST_F(VexmapTest, InHouseKindTakesAStreamOfOddSizePadded) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(511), SampleFrame(511)}));
    Outcome const outcome = Run({"--input", input, "--output", PathOf("out.y4m")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("note: the 511x511 input is padded to 512x512"));
    EXPECT_EQ(2u, ReadStream(ReadText(PathOf("out.y4m"))).frames.size());
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
    EXPECT_EQ(
        "vexmap: standard input ends inside frame 3, after 392216 of its 393216 bytes; 2 "
        "frames written to standard output\n",
        outcome.err);
    EXPECT_EQ(2u, ReadStream(outcome.out).frames.size());
}

TEST_F(VexmapTest, StreamFileCutShortKeepsTheFramesWrittenIntoTheOutputFile) {
    std::string const input = PathOf("in.y4m");
    std::string bytes = StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)});
    bytes.resize(bytes.size() - 1000);
    WriteText(input, bytes);
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--input", input, "--output", output});
    ExpectOneLineFailure(outcome, "; 2 frames written to " + output);
    EXPECT_EQ(RUNTIME_FAILURE, outcome.status);
    EXPECT_EQ(2u, ReadStream(ReadText(output)).frames.size());
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
        BadStream{"TenBits", "YUV4MPEG2 W512 H512 C420p10\n", "has the colour space C420p10"},
        BadStream{"SixteenBitMono", "YUV4MPEG2 W512 H512 Cmono16\n",
                  "has the colour space Cmono16"},
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

// Status, one line naming the value, and none of the C++ library's own words.
void ExpectCleanRefusal(Outcome const& outcome, int status, std::string const& reason) {
    ExpectOneLineFailure(outcome, reason);
    EXPECT_EQ(status, outcome.status) << outcome.err;
    for (char const* raw : {"basic_", "std::", "filesystem error", "what()", "terminate",
                            "exception", "Could not convert"}) {
        EXPECT_THAT(outcome.err, Not(HasSubstr(raw)));
    }
}

struct Refusal {
    char const* name;
    std::vector<std::string> arguments;
    int status;
    std::string reason;
};

class VexmapRefusalTest : public VexmapTest, public ::testing::WithParamInterface<Refusal> {};

// Every refusal leaves the output place as it was.
TEST_P(VexmapRefusalTest, RefusesInOneLineWithItsStatusAndWritesNothing) {
    std::vector<std::string> arguments = GetParam().arguments;
    for (std::string& argument : arguments) {
        if (argument.rfind("@", 0) == 0) {
            argument = PathOf(argument.substr(1));
        }
    }
    std::ofstream(PathOf("plain.txt")) << "a file, not a folder\n";
    std::filesystem::create_directories(directory / "folder.y4m");
    WritePng(PathOf("disc.png"), DiscPicture());
    auto const before = std::distance(std::filesystem::directory_iterator(directory),
                                      std::filesystem::directory_iterator());
    Outcome const outcome = Run(arguments);
    std::string reason = GetParam().reason;
    std::size_t const at = reason.find('@');
    if (at != std::string::npos) {
        std::size_t const end = reason.find_first_of(" :;", at);
        reason = reason.substr(0, at) + PathOf(reason.substr(at + 1, end - at - 1)) +
                 (end == std::string::npos ? "" : reason.substr(end));
    }
    ExpectCleanRefusal(outcome, GetParam().status, reason);
    auto const after = std::distance(std::filesystem::directory_iterator(directory),
                                     std::filesystem::directory_iterator());
    EXPECT_EQ(before + 2, after);  // the tool's two captured streams, nothing else
}

std::string RefusalName(::testing::TestParamInfo<Refusal> const& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(
    EveryError, VexmapRefusalTest,
    ::testing::Values(
        Refusal{"NanPan", {"--pan", "nan"}, USAGE_ERROR, "--pan: must be a finite number, not nan"},
        Refusal{"InfiniteTilt",
                {"--tilt", "-inf"},
                USAGE_ERROR,
                "--tilt: must be a finite number, not -inf"},
        Refusal{"ZeroZoom", {"--zoom", "0"}, USAGE_ERROR, "--zoom: must be above 0, not 0"},
        Refusal{
            "NegativeZoom", {"--zoom", "-2.5"}, USAGE_ERROR, "--zoom: must be above 0, not -2.5"},
        Refusal{"WordForPan", {"--pan", "left"}, USAGE_ERROR, "--pan: left is not a number"},
        Refusal{"HugeSize",
                {"--size", "20000x100"},
                USAGE_ERROR,
                "--size is 20000x100, beyond the limit of 16384 pixels a side"},
        Refusal{"SizeBeyondMaxPixels",
                {"--size", "2000x2000", "--max-pixels", "1000000"},
                USAGE_ERROR,
                "--size is 2000x2000, 4000000 pixels, beyond the limit of 1000000"},
        Refusal{"BadSize",
                {"--size", "12by9"},
                USAGE_ERROR,
                "--size: expected a positive WIDTHxHEIGHT, not 12by9"},
        Refusal{"NoMaxPixels", {"--max-pixels", "0"}, USAGE_ERROR, "--max-pixels"},
        Refusal{"InputBeyondMaxPixels",
                {"--input", "@disc.png", "--max-pixels", "1000"},
                RUNTIME_FAILURE,
                "@disc.png is 256x256, 65536 pixels, beyond the limit of 1000"},
        Refusal{"ZeroFrames", {"--frames", "0"}, USAGE_ERROR, "--frames"},
        Refusal{"BadCircle",
                {"--kind", "Sentry360", "--circle", "1,2"},
                USAGE_ERROR,
                "--circle: expected X,Y,R in pixels, not 1,2"},
        Refusal{"UnknownPosition", {"--position", "roof"}, USAGE_ERROR, "roof"},
        Refusal{"SubModeFour", {"--submode", "4"}, USAGE_ERROR, "--submode"},
        Refusal{"BmpOutput",
                {"--output", "@view.bmp"},
                USAGE_ERROR,
                "--output @view.bmp: vexmap writes .png, .jpg and .jpeg pictures, .y4m streams, a "
                "device, - (standard output) or a folder, not .bmp files"},
        Refusal{"EmptyOutput", {"--output", ""}, USAGE_ERROR, "--output is empty"},
        Refusal{"OutputOverTheInput",
                {"--input", "@disc.png", "--submode", "1", "--output", "@disc.png"},
                USAGE_ERROR,
                "--output @disc.png is the input"},
        Refusal{"OutputBelowAFile",
                {"--output", "@plain.txt/view.png"},
                RUNTIME_FAILURE,
                "cannot write @plain.txt/view-ptz.png: Not a directory"},
        Refusal{"FolderBelowAFile",
                {"--output", "@plain.txt/views"},
                RUNTIME_FAILURE,
                "@plain.txt/views"},
        Refusal{"InputIsAFolder",
                {"--input", "@folder.y4m", "--output", "@v.y4m"},
                RUNTIME_FAILURE,
                "cannot read @folder.y4m: it is a directory"},
        Refusal{"PictureInputIsAFolder",
                {"--input", "@folder.y4m/", "--output", "@v"},
                RUNTIME_FAILURE,
                "it is a directory"},
        Refusal{"MissingInput", {"--input", "@absent.jpg"}, RUNTIME_FAILURE, "@absent.jpg"},
        Refusal{"MissingStream",
                {"--input", "@absent.y4m", "--output", "@v.y4m"},
                RUNTIME_FAILURE,
                "cannot read @absent.y4m: No such file or directory"},
        Refusal{"Strict",
                {"--strict", "--circle", "5,5,5"},
                USAGE_ERROR,
                "--circle does nothing for the Brenvia dewarper, which takes no image circle "
                "(--strict)"},
        Refusal{"MissingPlugin",
                {"--plugin", "@libabsent.so"},
                RUNTIME_FAILURE,
                "cannot load the plug-in @libabsent.so"},
        Refusal{"PluginThatIsNoLibrary",
                {"--plugin", "@plain.txt"},
                RUNTIME_FAILURE,
                "cannot load the plug-in @plain.txt"}),
    RefusalName);

TEST_F(VexmapTest, ClampedPositionIsReportedBesideWhatWasAsked) {
    Outcome const outcome =
        Run({"--submode", "1", "--pan", "400", "--zoom", "50", "--output", PathOf("view.png")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Brenvia ptz view, 960x540, pan 40 (asked 400), tilt "));
    EXPECT_THAT(outcome.out, HasSubstr(", zoom 10 (asked 50): "));
}

TEST_F(VexmapTest, OptionsThatDoNothingForTheKindAreWarnedOf) {
    Outcome const outcome = Run(
        {"--circle", "10,10,5", "--lens", "2", "--submode", "1", "--output", PathOf("view.png")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(
        "vexmap: warning: --lens does nothing for the Brenvia dewarper, which has no lenses\n"
        "vexmap: warning: --circle does nothing for the Brenvia dewarper, which takes no image "
        "circle\n",
        outcome.err);
    EXPECT_TRUE(std::filesystem::exists(PathOf("view.png")));
}

TEST_F(VexmapTest, PtzOptionsOnAPanoramaViewAreWarnedOf) {
    Outcome const outcome =
        Run({"--submode", "2", "--pan", "30", "--tilt", "10", "--output", PathOf("view.png")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(
        "vexmap: warning: --pan does nothing for the panorama view\n"
        "vexmap: warning: --tilt does nothing for the panorama view\n",
        outcome.err);
}

TEST_F(VexmapTest, PtzOptionsWithAPtzViewAmongOthersAreNoWarning) {
    Outcome const outcome = Run({"--pan", "30", "--output", PathOf("views")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
}

TEST_F(VexmapTest, FramesOnAStreamAreWarnedOf) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512)}));
    Outcome const outcome = Run({"--input", input, "--frames", "5", "--output", PathOf("out.y4m")});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ(
        "vexmap: warning: --frames does nothing for a stream, whose every frame is dewarped "
        "once\n",
        outcome.err);
}

TEST_F(VexmapTest, WritesAJpegWhenTheOutputSaysSo) {
    std::string const file = PathOf("view.jpg");
    Outcome const outcome = Run({"--submode", "1", "--output", file});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    std::string const bytes = ReadText(file);
    ASSERT_GE(bytes.size(), 3u);
    EXPECT_EQ("\xFF\xD8\xFF", bytes.substr(0, 3));
    EXPECT_EQ(960, ReadImage(file).width);
}

TEST_F(VexmapTest, AFailedStreamLeavesNoFileBehind) {
    std::string const input = PathOf("in.y4m");
    std::string bytes = StreamOf({SampleFrame(512)});
    bytes.resize(bytes.size() - 1000);
    WriteText(input, bytes);
    Outcome const outcome = Run({"--input", input, "--output", PathOf("out.y4m")});
    ExpectCleanRefusal(outcome, RUNTIME_FAILURE, "ends inside frame 1");
    std::vector<std::string> names;
    for (auto const& entry : std::filesystem::directory_iterator(directory)) {
        names.push_back(entry.path().filename().string());
    }
    std::sort(names.begin(), names.end());
    EXPECT_EQ((std::vector<std::string>{"in.y4m", "stderr.txt", "stdout.txt"}), names);
}

TEST_F(VexmapTest, ReplacesAnExistingOutputOnlyWhenTheRunSucceeds) {
    std::string const output = PathOf("out.y4m");
    WriteText(output, "old");
    std::string const input = PathOf("in.y4m");
    WriteText(input, "YUV4MPEG2 W512 H512 F25:1\nFRAME\nshort");
    EXPECT_EQ(RUNTIME_FAILURE, Run({"--input", input, "--output", output}).status);
    EXPECT_EQ("old", ReadText(output));
    WriteText(input, StreamOf({SampleFrame(512)}));
    EXPECT_EQ(0, Run({"--input", input, "--output", output}).status);
    EXPECT_EQ(1u, ReadStream(ReadText(output)).frames.size());
}

TEST_F(VexmapTest, CharacterDeviceIsAStreamOutput) {
    Outcome const outcome = Run({"--output", "/dev/null"});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr(", 1 frame: /dev/null\n"));
}

TEST_F(VexmapTest, HelpTellsTheExitStatuses) {
    Outcome const outcome = Run({"--help"});
    ASSERT_EQ(0, outcome.status);
    EXPECT_THAT(outcome.out, HasSubstr("Exit status: 0 done, 1 the work failed"));
    EXPECT_THAT(outcome.out, HasSubstr("2 usage error"));
    EXPECT_THAT(outcome.out, HasSubstr("--strict"));
    EXPECT_THAT(outcome.out, HasSubstr("--max-pixels"));
    EXPECT_THAT(outcome.out, HasSubstr("--list-cameras"));
}

TEST_F(VexmapTest, VersionNamesTheTool) {
    Outcome const outcome = Run({"--version"});
    ASSERT_EQ(0, outcome.status);
    EXPECT_EQ(std::string("vexmap ") + VEXMAP_VERSION + "\n", outcome.out);
}

TEST_F(VexmapTest, ListCamerasPrintsEveryRowOfTheTableInOrder) {
    Outcome const outcome = Run({"--list-cameras"});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr(" 1  make equals \"Vivotek\"\n"
                                       "    model starts with \"FE\" or \"VC\"\n"
                                       "    mode 3: Vivotek\n"));
    EXPECT_THAT(outcome.out, HasSubstr("11  make starts with \"AXIS\"\n"));
    EXPECT_THAT(outcome.out, HasSubstr("    mode 10: no kind of the plug-in serves it\n"));
    EXPECT_THAT(outcome.out, HasSubstr("16  make starts with \"HikVision\" or \"HIKVISION\"\n"));
    EXPECT_EQ(1 + 16 * 3, std::count(outcome.out.begin(), outcome.out.end(), '\n'));
}

// A 4:2:2 stream in the layout ffmpeg writes: luma, then U and V at half width, full height.
std::string Stream422(int width, int height, uint8_t y, uint8_t u_top, uint8_t u_bottom,
                      char const* extra_tags = "") {
    std::size_t const luma = std::size_t(width) * std::size_t(height);
    std::string frame(luma, char(y));
    for (int plane = 0; plane < 2; ++plane) {
        for (int row = 0; row < height; ++row) {
            frame.append(std::size_t(width / 2), char(row % 2 == 0 ? u_top : u_bottom));
        }
    }
    return "YUV4MPEG2 W" + std::to_string(width) + " H" + std::to_string(height) +
           " F25:1 Ip A1:1 C422" + extra_tags + "\nFRAME\n" + frame;
}

TEST_F(VexmapTest, ReadsAFourTwoTwoStreamAveragingItsChromaRows) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, Stream422(512, 512, 100, 80, 100));
    std::string const output = PathOf("out.y4m");
    Outcome const outcome = Run({"--input", input, "--output", output});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    std::string const written = ReadText(output);
    EXPECT_THAT(written, StartsWith("YUV4MPEG2 W960 H540 F25:1 Ip A1:1 C420jpeg"));
    Stream const stream = ReadStream(written);
    ASSERT_EQ(1u, stream.frames.size());
    EXPECT_EQ((std::array<uint8_t, 3>{100, 90, 90}), MiddleOf(stream.frames[0]));
}

TEST_F(VexmapTest, ReadsMonochromeAndFourFourFourStreams) {
    std::string const mono = PathOf("mono.y4m");
    WriteText(mono, "YUV4MPEG2 W64 H64 Cmono\nFRAME\n" + std::string(64 * 64, char(90)));
    Outcome const from_mono = Run({"--input", mono, "--output", PathOf("mono-out.y4m")});
    ASSERT_EQ(0, from_mono.status) << from_mono.err;
    EXPECT_EQ((std::array<uint8_t, 3>{90, 128, 128}),
              MiddleOf(ReadStream(ReadText(PathOf("mono-out.y4m"))).frames.at(0)));
    std::string const full = PathOf("full.y4m");
    WriteText(full, "YUV4MPEG2 W64 H64 C444\nFRAME\n" + std::string(64 * 64, char(90)) +
                        std::string(64 * 64, char(70)) + std::string(64 * 64, char(150)));
    Outcome const from_full = Run({"--input", full, "--output", PathOf("full-out.y4m")});
    ASSERT_EQ(0, from_full.status) << from_full.err;
    EXPECT_EQ((std::array<uint8_t, 3>{90, 70, 150}),
              MiddleOf(ReadStream(ReadText(PathOf("full-out.y4m"))).frames.at(0)));
}

TEST_F(VexmapTest, KeepsTheColourRangeFromInputToOutput) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, Stream422(512, 512, 100, 128, 128, " XCOLORRANGE=FULL"));
    std::string const output = PathOf("out.y4m");
    ASSERT_EQ(0, Run({"--input", input, "--output", output}).status);
    std::string const written = ReadText(output);
    EXPECT_THAT(written.substr(0, written.find('\n')), HasSubstr(" XCOLORRANGE=FULL"));
}

// Luma 128 is mid grey in full range, and (128 - 16) * 255 / 219 = 130 in limited range.
TEST_F(VexmapTest, FullRangeStreamWrittenAsPicturesKeepsItsGreys) {
    for (auto [tags, grey] : {std::tuple{" XCOLORRANGE=FULL", 128}, std::tuple{"", 130}}) {
        std::string const input = PathOf("in.y4m");
        WriteText(input, Stream422(512, 512, 128, 128, 128, tags));
        std::string const output = PathOf("view.png");
        Outcome const outcome = Run({"--input", input, "--submode", "1", "--output", output});
        ASSERT_EQ(0, outcome.status) << outcome.err;
        RgbImage const view = ReadImage(output);
        uint8_t const* middle = &view.pixels[(std::size_t(270) * 960 + 480) * 3];
        EXPECT_EQ(grey, middle[0]) << tags;
        EXPECT_EQ(grey, middle[2]) << tags;
    }
}

TEST_F(VexmapTest, ListGivesTheLoadersOwnReasonForALibraryThatDoesNotLoad) {
    std::filesystem::create_directories(directory / "libs");
    for (char const* library : {"libIMV1.so.2", "libgeofisheye.so.1"}) {
        WriteText(PathOf(std::string("libs/") + library), "not a library");
    }
    added_environment = {"LD_LIBRARY_PATH=" + PathOf("libs")};
    Outcome const outcome = Run({"--list"});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    for (std::string const library : {"libIMV1.so.2", "libgeofisheye.so.1"}) {
        EXPECT_THAT(outcome.out, HasSubstr("not available: its library " + library +
                                           " does not load: " + PathOf("libs/" + library) +
                                           ": file too short\n"));
    }
    Outcome const chosen = Run({"--kind", "Geovision"});
    ExpectCleanRefusal(chosen, RUNTIME_FAILURE,
                       "the Geovision dewarper is not available: its library libgeofisheye.so.1 "
                       "does not load: ");
}

TEST_F(VexmapTest, ListSaysWhenALibraryLoadsButLacksWhatThePluginCalls) {
    added_environment = {std::string("LD_LIBRARY_PATH=") + VEXMAP_INCOMPLETE_STANDIN_DIR};
    Outcome const outcome = Run({"--list"});
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("   3 Vivotek      no     yes    yes       not available: "
                                       "its library libfisheyesw.so.3 loads but lacks what the "
                                       "plug-in calls\n"));
}

#if defined(__SANITIZE_ADDRESS__)
constexpr bool ADDRESS_SANITIZED = true;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
constexpr bool ADDRESS_SANITIZED = true;
#else
constexpr bool ADDRESS_SANITIZED = false;
#endif
#else
constexpr bool ADDRESS_SANITIZED = false;
#endif

class VexmapCraftedHeaderTest : public VexmapTest,
                                public ::testing::WithParamInterface<char const*> {
protected:
    // The tool with at most 1 GiB of address space. AddressSanitizer reserves terabytes of it for
    // itself, so there the bound is its own largest allocation instead.
    Outcome RunBounded(std::vector<std::string> arguments) {
        if (ADDRESS_SANITIZED) {
            added_environment = {
                "ASAN_OPTIONS=max_allocation_size_mb=1024:"
                "allocator_may_return_null=0"};
            return Run(std::move(arguments));
        }
        arguments.insert(arguments.begin(),
                         {"-c", "ulimit -v 1048576 && exec \"$0\" \"$@\"", VEXMAP_TOOL_PATH});
        return RunProgram("/bin/sh", std::move(arguments));
    }
};

TEST_P(VexmapCraftedHeaderTest, PictureClaimingGigabytesIsRefusedAtItsHeader) {
    std::string const name = GetParam();
    std::string const input = PathOf("crafted." + name);
    std::vector<unsigned char> const bytes =
        name == "jpg" ? CraftedPictures::Jpeg(PathOf("scratch.jpg"), 60000, 60000)
                      : CraftedPictures::Png(PathOf("scratch.png"), 100000, 100000);
    CraftedPictures::Write(input, bytes);
    EXPECT_LT(bytes.size(), 1000u);
    Outcome const outcome = RunBounded({"--input", input, "--output", PathOf("views")});
    std::string const size = name == "jpg" ? "60000x60000" : "100000x100000";
    ExpectCleanRefusal(outcome, RUNTIME_FAILURE,
                       input + " is " + size + ", beyond the limit of 16384 pixels a side");
    EXPECT_FALSE(std::filesystem::exists(directory / "views"));
}

TEST_P(VexmapCraftedHeaderTest, PictureWithinTheSideButBeyondThePixelsIsRefused) {
    std::string const name = GetParam();
    std::string const input = PathOf("crafted." + name);
    CraftedPictures::Write(input, name == "jpg"
                                      ? CraftedPictures::Jpeg(PathOf("scratch.jpg"), 16000, 16000)
                                      : CraftedPictures::Png(PathOf("scratch.png"), 16000, 16000));
    Outcome const outcome =
        RunBounded({"--input", input, "--max-pixels", "100000000", "--output", PathOf("views")});
    ExpectCleanRefusal(outcome, RUNTIME_FAILURE,
                       input +
                           " is 16000x16000, 256000000 pixels, beyond the limit of 100000000 "
                           "pixels (--max-pixels)");
}

INSTANTIATE_TEST_SUITE_P(Formats, VexmapCraftedHeaderTest, ::testing::Values("jpg", "png"));

// The tool with its standard error on a terminal, as a user at a shell sees it.
Outcome RunOnTerminal(std::vector<std::string> arguments, std::string const& out_path) {
    int const terminal = posix_openpt(O_RDWR | O_NOCTTY);
    if (terminal < 0 || grantpt(terminal) != 0 || unlockpt(terminal) != 0) {
        ADD_FAILURE() << "no pseudo-terminal: " << strerror(errno);
        return Outcome();
    }
    std::string const side = ptsname(terminal);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, out_path.c_str(),
                                     O_WRONLY | O_CREAT | O_TRUNC, 0644);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, side.c_str(), O_RDWR | O_NOCTTY, 0);
    pid_t const child = Start(std::move(arguments), actions);
    posix_spawn_file_actions_destroy(&actions);
    std::string shown;
    char chunk[4096];
    // The terminal holds a few kilobytes: read while the tool runs, until its side is closed.
    for (ssize_t got = read(terminal, chunk, sizeof chunk); got > 0;
         got = read(terminal, chunk, sizeof chunk)) {
        shown.append(chunk, std::size_t(got));
    }
    close(terminal);
    Outcome outcome = Wait(child);
    outcome.err = shown;
    return outcome;
}

TEST_F(VexmapTest, FramesOfAStillShowProgressOnATerminal) {
    Outcome const outcome = RunOnTerminal(
        {"--frames", "30", "--submode", "1", "--output", PathOf("view.png")}, PathOf("stdout.txt"));
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.err, HasSubstr("\rframe 30, "));
    EXPECT_THAT(outcome.err, HasSubstr(" fps, 100%, 0:00 left"));
}

TEST_F(VexmapTest, StreamFileShowsItsShareAndTimeLeftOnATerminal) {
    std::string const input = PathOf("in.y4m");
    WriteText(input, StreamOf({SampleFrame(512), SampleFrame(512), SampleFrame(512)}));
    Outcome const outcome =
        RunOnTerminal({"--input", input, "--output", PathOf("out.y4m")}, PathOf("stdout.txt"));
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.err, HasSubstr("\rframe 3, "));
    EXPECT_THAT(outcome.err, HasSubstr("100%, 0:00 left"));
}

TEST_F(VexmapTest, QuietShowsNoProgressEvenOnATerminal) {
    Outcome const outcome = RunOnTerminal(
        {"--quiet", "--frames", "5", "--submode", "1", "--output", PathOf("view.png")},
        PathOf("stdout.txt"));
    ASSERT_EQ(0, outcome.status) << outcome.err;
    EXPECT_EQ("", outcome.err);
}

TEST_F(VexmapTest, ViewGalleryHelpIsHelpNotAFolder) {
    Outcome const help = RunProgram(VEXMAP_VIEW_GALLERY_PATH, {"--help"});
    EXPECT_EQ(0, help.status);
    EXPECT_THAT(help.out, HasSubstr("Usage"));
    EXPECT_FALSE(std::filesystem::exists(directory / "--help"));
    Outcome const odd = RunProgram(VEXMAP_VIEW_GALLERY_PATH, {PathOf("gallery"), "255"});
    EXPECT_EQ(USAGE_ERROR, odd.status);
    EXPECT_THAT(odd.err, HasSubstr("the size must be even, not 255"));
    EXPECT_EQ(1, std::count(odd.err.begin(), odd.err.end(), '\n'));
    EXPECT_FALSE(std::filesystem::exists(directory / "gallery"));
}

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
    EXPECT_THAT(outcome.err, StartsWith("vexmap: the " + kind +
                                        " dewarper is not available: its "
                                        "library lib"));
    EXPECT_THAT(outcome.err, EndsWith(" is not installed\n"));
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
        "mode kind         circle lenses position  use\n"
        "   1 ImmerVision  no     yes    yes       not available: its library libIMV1.so.2 is not "
        "installed\n"
        "   2 Sentry360    yes    no     yes       available\n"
        "   3 Vivotek      no     yes    yes       not available: its library libfisheyesw.so.3 is "
        "not installed\n"
        "   7 Samsung      no     yes    yes       not available: its library libIMV1.so.2 is not "
        "installed\n"
        "   8 Brenvia      no     no     yes       available\n"
        "   9 Geovision    no     no     yes       not available: its library libgeofisheye.so.1 "
        "is not installed\n",
        outcome.out);
    EXPECT_EQ("", outcome.err);
}

TEST_F(VexmapWithVendorLibrariesTest, ListShowsTheLensesOfTheAvailableLensKinds) {
    Outcome const outcome = Run({"--list"});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("   1 ImmerVision  no     yes    yes       available\n"
                                       "       lens 0: RPL Number "));
    EXPECT_THAT(outcome.out, HasSubstr("   3 Vivotek      no     yes    yes       available\n"
                                       "       lens 0: Default\n"
                                       "       lens 1: FE8171\n"));
    EXPECT_THAT(outcome.out, HasSubstr("       lens 7: FE8181\n   7 Samsung      "));
    EXPECT_THAT(outcome.out, HasSubstr("   9 Geovision    no     no     yes       available\n"));
}

TEST_F(VexmapWithVendorLibrariesTest, TheLensOfAKindWithLensesIsNamed) {
    Outcome const outcome = Run(
        {"--kind", "Vivotek", "--lens", "3", "--submode", "1", "--output", PathOf("vivotek.png")});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Vivotek lens 3: FE8173\n"));
}

TEST_F(VexmapWithVendorLibrariesTest, LensOutsideTheKindsListNamesTheValidNumbers) {
    for (std::string const lens : {"-1", "8"}) {
        Outcome const outcome = Run({"--kind", "Vivotek", "--lens", lens, "--output", PathOf("v")});
        ExpectCleanRefusal(outcome, USAGE_ERROR,
                           "--lens " + lens +
                               ": the Vivotek dewarper's lenses are 0 to 7 (see "
                               "--list)");
    }
}

TEST_F(VexmapWithVendorLibrariesTest, SamsungStartsFromTheCamerasDefaultLens) {
    Outcome const outcome = Run({"--make", "Samsung", "--model", "SNF-8010", "--submode", "1",
                                 "--output", PathOf("samsung.png")});
    ASSERT_TRUE(outcome.exited);
    EXPECT_EQ(0, outcome.status) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr("Samsung lens "));
    EXPECT_THAT(outcome.out, HasSubstr(": RPL Number C7SST\n"));
}

TEST_F(VexmapTest, FfmpegsFullRangeMarkIsKeptThroughTheTool) {
    std::string const ffmpeg = FindFfmpeg();
    if (ffmpeg.empty()) {
        GTEST_SKIP() << "ffmpeg is not installed";
    }
    std::string const source = PathOf("source.png");
    WritePng(source, MakeSampleFisheye(256).image);
    std::string const input = PathOf("full.y4m");
    std::string const command = ffmpeg + " -nostdin -hide_banner -loglevel error -y -i '" + source +
                                "' -pix_fmt yuv420p -color_range pc -f yuv4mpegpipe '" + input +
                                "'";
    ASSERT_EQ(0, std::system(command.c_str()));
    Stream const in = ReadStream(ReadText(input));
    EXPECT_EQ(ColourRange::FULL, in.header.range);
    std::string const output = PathOf("out.y4m");
    ASSERT_EQ(0, Run({"--input", input, "--output", output}).status);
    EXPECT_EQ(ColourRange::FULL, ReadStream(ReadText(output)).header.range);
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
