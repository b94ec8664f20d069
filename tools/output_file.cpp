#include "output_file.h"

#include <cerrno>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>

#include <sys/random.h>
#include <sys/stat.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

constexpr int NAME_ATTEMPTS = 100;
constexpr int SUFFIX_LETTERS = 6;

// Letters for a temporary name that nobody can guess ahead; a name taken meanwhile only costs
// another try, so the clock stands in when the kernel has no randomness to give.
std::string RandomSuffix(int attempt) {
    static char const LETTERS[] = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789";
    uint64_t bits = 0;
    if (getrandom(&bits, sizeof bits, GRND_NONBLOCK) != ssize_t(sizeof bits)) {
        bits = uint64_t(std::chrono::steady_clock::now().time_since_epoch().count()) ^
               (uint64_t(getpid()) << 32) ^ (uint64_t(attempt) * 0x9E3779B97F4A7C15u);
    }
    std::string suffix;
    for (int index = 0; index < SUFFIX_LETTERS; ++index) {
        suffix += LETTERS[bits % (sizeof LETTERS - 1)];
        bits /= sizeof LETTERS - 1;
    }
    return suffix;
}

// A link to an existing file stands for that file: it is the file replaced, and the link stays.
// A dangling link is replaced by the new file.
std::string Destination(std::string const& path) {
    struct stat status = {};
    if (lstat(path.c_str(), &status) != 0 || !S_ISLNK(status.st_mode)) {
        return path;
    }
    char* const resolved = realpath(path.c_str(), nullptr);
    if (resolved == nullptr) {
        return path;
    }
    std::string const target = resolved;
    free(resolved);
    return target;
}

}  // namespace

OutputFile::OutputFile(std::string const& target)
    : path(target), destination(Destination(target)), writing(target), pending(false) {
    if (path.empty()) {
        throw ToolError("cannot write a file without a name");
    }
    if (IsDevice(path)) {
        return;
    }
    struct stat existing = {};
    bool const exists = stat(destination.c_str(), &existing) == 0;
    if (exists && S_ISDIR(existing.st_mode)) {
        throw ToolError("cannot write " + path + ": it is a directory");
    }
    // In the same folder, so that the rename of Commit() stays on one filesystem and is atomic.
    std::size_t const slash = destination.rfind('/');
    std::string const folder = slash == std::string::npos ? "" : destination.substr(0, slash + 1);
    std::string const name = destination.substr(slash == std::string::npos ? 0 : slash + 1);
    int descriptor = -1;
    for (int attempt = 0; attempt < NAME_ATTEMPTS && descriptor < 0; ++attempt) {
        writing = folder + "." + name + "." + RandomSuffix(attempt);
        // 0666 as for any new file: the umask, and a folder's default ACL, take off their part.
        descriptor = open(writing.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
        if (descriptor < 0 && errno != EEXIST) {
            break;
        }
    }
    if (descriptor < 0) {
        int const reason = errno;
        writing = path;
        throw ToolError("cannot write " + path + ": " + strerror(reason));
    }
    pending = true;
    // A file replaced keeps its permissions, as one written into would: a private file stays so.
    if (exists && S_ISREG(existing.st_mode)) {
        fchmod(descriptor, existing.st_mode & 0777);
    }
    close(descriptor);
}

OutputFile::OutputFile(OutputFile&& other) noexcept
    : path(std::move(other.path)),
      destination(std::move(other.destination)),
      writing(std::move(other.writing)),
      pending(other.pending) {
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
    // On the disc before the rename, so that after a crash the path holds the older file or the
    // new one whole, never an empty one. A filesystem that cannot sync (EINVAL) is taken as it is.
    int const descriptor = open(writing.c_str(), O_RDONLY | O_CLOEXEC);
    if (descriptor < 0) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    int const synced = fsync(descriptor);
    int const reason = errno;
    close(descriptor);
    if (synced != 0 && reason != EINVAL) {
        throw ToolError("cannot write " + path + ": " + strerror(reason));
    }
    if (rename(writing.c_str(), destination.c_str()) != 0) {
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
