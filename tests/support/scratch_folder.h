#pragma once

#include <algorithm>
#include <filesystem>
#include <string>
#include <unistd.h>

#include <gtest/gtest.h>

/// A folder of the running test's own, named after it and the process, made empty when the test
/// starts and removed with everything in it when the test ends. Make one per test, on its thread.
class ScratchFolder {
public:
    explicit ScratchFolder(std::string const& prefix)
        : folder(std::filesystem::path(::testing::TempDir()) /
                 (prefix + TestName() + "-" + std::to_string(getpid()))) {
        std::filesystem::remove_all(folder);
        std::filesystem::create_directories(folder);
    }
    ScratchFolder(ScratchFolder const&) = delete;
    ScratchFolder& operator=(ScratchFolder const&) = delete;
    virtual ~ScratchFolder() {
        std::error_code error;
        std::filesystem::remove_all(folder, error);
    }

    std::filesystem::path const& Path() const { return folder; }
    std::string PathOf(std::string const& name) const { return (folder / name).string(); }

private:
    // A test of a grid is named "Test/3": one folder, not a folder inside another left behind.
    static std::string TestName() {
        std::string name = ::testing::UnitTest::GetInstance()->current_test_info()->name();
        std::replace(name.begin(), name.end(), '/', '-');
        return name;
    }

    std::filesystem::path folder;
};
