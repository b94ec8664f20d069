#include "output_file.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <unistd.h>
#include <vector>

#include <sys/stat.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

// mkstemp makes its file for the owner alone; a finished output gets what any new file would.
mode_t NewFileMode() {
    mode_t const mask = umask(0);
    umask(mask);
    return 0666 & ~mask;
}

}  // namespace

OutputFile::OutputFile(std::string const& target) : path(target), writing(target), pending(false) {
    if (IsDevice(path)) {
        return;
    }
    struct stat status = {};
    if (stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode)) {
        throw ToolError("cannot write " + path + ": it is a directory");
    }
    std::filesystem::path const file(path);
    std::filesystem::path const folder = file.has_parent_path() ? file.parent_path() : ".";
    std::string pattern = (folder / ("." + file.filename().string() + ".XXXXXX")).string();
    std::vector<char> name(pattern.begin(), pattern.end());
    name.push_back('\0');
    int const descriptor = mkstemp(name.data());
    if (descriptor < 0) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    fchmod(descriptor, NewFileMode());
    close(descriptor);
    writing = name.data();
    pending = true;
}

OutputFile::OutputFile(OutputFile&& other) noexcept
    : path(std::move(other.path)), writing(std::move(other.writing)), pending(other.pending) {
    other.pending = false;
}

OutputFile::~OutputFile() {
    if (pending) {
        unlink(writing.c_str());
    }
}

void OutputFile::Commit() {
    if (!pending) {
        return;
    }
    if (rename(writing.c_str(), path.c_str()) != 0) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    pending = false;
}

bool OutputFile::IsDevice(std::string const& path) {
    struct stat status = {};
    return stat(path.c_str(), &status) == 0 &&
           (S_ISCHR(status.st_mode) || S_ISFIFO(status.st_mode));
}

bool OutputFile::SameFile(std::string const& first, std::string const& second) {
    struct stat one = {};
    struct stat other = {};
    return stat(first.c_str(), &one) == 0 && stat(second.c_str(), &other) == 0 &&
           one.st_dev == other.st_dev && one.st_ino == other.st_ino;
}

}  // namespace vexmap_host
