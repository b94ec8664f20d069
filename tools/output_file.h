#pragma once

#include <string>

namespace vexmap_host {

/// A file that appears at its path whole or not at all. It is written as a hidden temporary file
/// in the same folder, made at construction so that an unwritable place fails before any work,
/// and renamed over the path on Commit(); without Commit() the temporary file is removed, so a
/// failed run leaves nothing behind and an older file at the path stays as it was. A new file
/// gets the permissions any new file gets (0666 less the umask), a replaced one keeps its own; a
/// link to a file replaces that file and stays a link. A character device or a FIFO (/dev/null,
/// a pipe) is written in place. Owns the temporary file; one thread at a time.
class OutputFile {
public:
    /// Throws ToolError naming the path when the place cannot take a file.
    explicit OutputFile(std::string const& path);
    OutputFile(OutputFile&& other) noexcept;
    OutputFile(OutputFile const&) = delete;
    OutputFile& operator=(OutputFile const&) = delete;
    virtual ~OutputFile();

    /// Where to write, the temporary file or a device itself; the writer closes it before Commit().
    std::string const& Path() const { return writing; }
    /// The path as given, which names the file in messages and by its extension.
    std::string const& FinalPath() const { return path; }
    /// Puts the written file, synced to the disc, at its path; throws ToolError naming it when
    /// that fails, and the temporary file then goes with the object. Nothing for a device or a
    /// second call.
    void Commit();

    /// Whether `path` is a character device or a FIFO, which is written in place.
    static bool IsDevice(std::string const& path);
    /// Whether two paths name one existing file, whatever links or dots lead to it.
    static bool SameFile(std::string const& first, std::string const& second);

private:
    std::string path;
    std::string destination;  // the file a link at `path` names, else `path`
    std::string writing;
    bool pending;  // a temporary file exists and is not yet renamed
};

}  // namespace vexmap_host
