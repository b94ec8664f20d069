#include "output_file.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "scratch_folder.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;
using ::testing::ThrowsMessage;

class OutputFileTest : public ::testing::Test {
protected:
    std::string PathOf(std::string const& name) const { return scratch.PathOf(name); }

    std::vector<std::string> Names() const {
        std::vector<std::string> names;
        for (auto const& entry : std::filesystem::directory_iterator(directory)) {
            names.push_back(entry.path().filename().string());
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    static mode_t ModeOf(std::string const& path) {
        struct stat status = {};
        return stat(path.c_str(), &status) == 0 ? status.st_mode & 07777 : mode_t(-1);
    }

    static std::string Text(std::string const& path) {
        std::ifstream file(path, std::ios::binary);
        return std::string((std::istreambuf_iterator<char>(file)),
                           std::istreambuf_iterator<char>());
    }

    ScratchFolder const scratch{"vexmap-output-file-"};
    std::filesystem::path const directory = scratch.Path();
};

TEST_F(OutputFileTest, AppearsAtItsPathOnlyOnCommit) {
    std::string const path = PathOf("view.png");
    OutputFile file(path);
    EXPECT_NE(path, file.Path());
    // Hidden beside the path, so that the rename stays within one filesystem.
    EXPECT_EQ(directory, std::filesystem::path(file.Path()).parent_path());
    EXPECT_THAT(std::filesystem::path(file.Path()).filename().string(), StartsWith(".view.png."));
    std::ofstream(file.Path()) << "picture";
    EXPECT_FALSE(std::filesystem::exists(path));
    file.Commit();
    EXPECT_EQ("picture", Text(path));
    EXPECT_EQ(std::vector<std::string>{"view.png"}, Names());
}

TEST_F(OutputFileTest, WithoutCommitLeavesNothingBehind) {
    {
        OutputFile file(PathOf("view.png"));
        std::ofstream(file.Path()) << "half a picture";
        EXPECT_EQ(1u, Names().size());  // the hidden file being written
    }
    EXPECT_EQ(std::vector<std::string>{}, Names());
}

TEST_F(OutputFileTest, OlderFileStaysUntilTheNewOneIsWhole) {
    std::string const path = PathOf("view.png");
    std::ofstream(path) << "old";
    {
        OutputFile file(path);
        std::ofstream(file.Path()) << "new";
        EXPECT_EQ("old", Text(path));
    }
    EXPECT_EQ("old", Text(path));
    OutputFile file(path);
    std::ofstream(file.Path()) << "new";
    file.Commit();
    EXPECT_EQ("new", Text(path));
}

TEST_F(OutputFileTest, UnwritablePlaceFailsAtOnceNamingThePath) {
    std::ofstream(PathOf("plain.txt")) << "a file";
    std::string const below_a_file = PathOf("plain.txt/view.png");
    EXPECT_THAT([&] { OutputFile file(below_a_file); },
                ThrowsMessage<ToolError>("cannot write " + below_a_file + ": Not a directory"));
    std::string const in_missing = PathOf("missing/view.png");
    EXPECT_THAT(
        [&] { OutputFile file(in_missing); },
        ThrowsMessage<ToolError>("cannot write " + in_missing + ": No such file or directory"));
    EXPECT_EQ(std::vector<std::string>{"plain.txt"}, Names());
}

TEST_F(OutputFileTest, ExistingFolderAtThePathIsRefused) {
    std::filesystem::create_directories(directory / "view.png");
    EXPECT_THAT([&] { OutputFile file(PathOf("view.png")); },
                ThrowsMessage<ToolError>(HasSubstr("view.png: it is a directory")));
}

TEST_F(OutputFileTest, NewFileGetsThePermissionsOfAnyNewFile) {
    for (mode_t const mask : {mode_t(022), mode_t(027), mode_t(0)}) {
        std::string const path = PathOf("view-" + std::to_string(mask) + ".png");
        mode_t const previous = umask(mask);
        OutputFile file(path);
        file.Commit();
        umask(previous);
        EXPECT_EQ(mode_t(0666) & ~mask, ModeOf(path)) << "umask " << mask;
    }
}

TEST_F(OutputFileTest, ReplacedFileKeepsItsPermissions) {
    std::string const path = PathOf("private.png");
    std::ofstream(path) << "old";
    ASSERT_EQ(0, chmod(path.c_str(), 0600));
    mode_t const previous = umask(022);
    OutputFile file(path);
    std::ofstream(file.Path()) << "new";
    file.Commit();
    umask(previous);
    EXPECT_EQ("new", Text(path));
    EXPECT_EQ(mode_t(0600), ModeOf(path));
}

TEST_F(OutputFileTest, LinkToAFileReplacesThatFileAndStaysALink) {
    std::filesystem::create_directories(directory / "kept");
    std::string const real = PathOf("kept/view.png");
    std::ofstream(real) << "old";
    std::string const link = PathOf("view.png");
    std::filesystem::create_symlink(real, link);
    OutputFile file(link);
    std::ofstream(file.Path()) << "new";
    file.Commit();
    EXPECT_TRUE(std::filesystem::is_symlink(link));
    EXPECT_EQ("new", Text(real));
    EXPECT_EQ((std::vector<std::string>{"kept", "view.png"}), Names());
}

TEST_F(OutputFileTest, FailedCommitNamesThePathAndLeavesNoTemporaryFile) {
    std::string const path = PathOf("view.png");
    {
        OutputFile file(path);
        std::ofstream(file.Path()) << "new";
        // A folder with something in it appears at the path while the file is written.
        std::filesystem::create_directories(directory / "view.png" / "inside");
        EXPECT_THAT([&] { file.Commit(); },
                    ThrowsMessage<ToolError>(StartsWith("cannot write " + path + ": ")));
    }
    EXPECT_EQ(std::vector<std::string>{"view.png"}, Names());
    EXPECT_TRUE(std::filesystem::is_directory(path));
}

TEST_F(OutputFileTest, MovedFileIsCommittedOnceAndNotRemovedByItsOldSelf) {
    std::vector<OutputFile> files;
    for (int index = 0; index < 5; ++index) {
        files.emplace_back(PathOf("view-" + std::to_string(index) + ".png"));  // moves as it grows
    }
    for (OutputFile& file : files) {
        EXPECT_TRUE(std::filesystem::exists(file.Path())) << file.FinalPath();
        std::ofstream(file.Path()) << file.FinalPath();
        file.Commit();
    }
    files.clear();
    for (int index = 0; index < 5; ++index) {
        std::string const path = PathOf("view-" + std::to_string(index) + ".png");
        EXPECT_EQ(path, Text(path));
    }
    EXPECT_EQ(5u, Names().size());
}

TEST_F(OutputFileTest, DeviceIsWrittenInPlace) {
    OutputFile file("/dev/null");
    EXPECT_EQ("/dev/null", file.Path());
    file.Commit();
    EXPECT_TRUE(OutputFile::IsDevice("/dev/null"));
    EXPECT_TRUE(std::filesystem::is_character_file("/dev/null"));
    EXPECT_FALSE(OutputFile::IsDevice(PathOf("absent")));
}

TEST_F(OutputFileTest, FifoIsWrittenInPlace) {
    std::string const path = PathOf("pipe");
    ASSERT_EQ(0, mkfifo(path.c_str(), 0600));
    EXPECT_TRUE(OutputFile::IsDevice(path));
    {
        OutputFile file(path);
        EXPECT_EQ(path, file.Path());
        EXPECT_EQ(std::vector<std::string>{"pipe"}, Names());
        file.Commit();
    }
    EXPECT_TRUE(std::filesystem::is_fifo(path));
    std::ofstream(PathOf("plain")) << "x";
    EXPECT_FALSE(OutputFile::IsDevice(PathOf("plain")));
}

TEST_F(OutputFileTest, SameFileSeesThroughLinksAndDots) {
    std::filesystem::create_directories(directory / "a");
    std::string const path = PathOf("a/x.png");
    std::ofstream(path) << "x";
    std::filesystem::create_symlink(path, directory / "link.png");
    EXPECT_TRUE(OutputFile::SameFile(path, PathOf("a/../a/x.png")));
    EXPECT_TRUE(OutputFile::SameFile(path, PathOf("link.png")));
    std::ofstream(PathOf("a/y.png")) << "x";
    EXPECT_FALSE(OutputFile::SameFile(path, PathOf("a/y.png")));
    EXPECT_FALSE(OutputFile::SameFile(path, PathOf("absent.png")));
}

}  // namespace
}  // namespace vexmap_host
