#pragma once

#include <string>

namespace vexmap_host {

/// Where the tool's views go, told from the --output value before any work is done: a picture
/// file, a folder of one picture per view, or a stream of one view into a file, a device or
/// standard output. A value; any thread.
class OutputTarget {
public:
    enum Kind { PICTURE_FILE, FOLDER, STREAM_FILE, DEVICE, STANDARD_OUTPUT };

    /// Throws UsageError for a file of a kind the tool cannot write, naming the value.
    explicit OutputTarget(std::string const& value);
    OutputTarget(OutputTarget const&) = default;
    OutputTarget& operator=(OutputTarget const&) = default;
    virtual ~OutputTarget() = default;

    Kind GetKind() const { return kind; }
    std::string const& Value() const { return value; }
    bool IsStream() const {
        return kind == STREAM_FILE || kind == DEVICE || kind == STANDARD_OUTPUT;
    }
    /// The file of one view: the named picture, with the view inserted before its extension when
    /// there are several views, or `<kind>-<view>.png` in the folder.
    std::string PicturePath(std::string const& kind_name, std::string const& view,
                            bool several_views) const;
    /// "standard output" or the path, for messages.
    std::string StreamName() const;

private:
    std::string value;
    Kind kind;
};

}  // namespace vexmap_host
