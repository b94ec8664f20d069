#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "dewarp_session.h"
#include "picture_limits.h"

namespace vexmap_host {

/// An image circle in the input, in pixels.
struct Circle {
    int x = 0;
    int y = 0;
    int radius = 0;
};

/// What the command line asks for. An option left out is empty where the tool's answer depends
/// on the kind or the input, so that the tool can tell a default from a choice.
struct ToolOptions {
    std::string input;  // empty: the built-in sample
    std::optional<int> mode;
    std::optional<std::string> kind;
    // A camera as a client knows it; given at all, it picks the kind through the registry.
    std::optional<std::string> make;
    std::optional<std::string> model;
    std::optional<std::string> url;
    std::optional<int> sub_mode;
    std::optional<int> lens;
    std::optional<int> position;
    std::optional<Circle> circle;
    RequestedPosition ptz;
    std::optional<FrameSize> size;
    uint64_t max_pixels = PictureLimits::DEFAULT_MAX_PIXELS;
    std::string output = "out";
    std::string plugin;
    std::optional<int> frames;
    bool list = false;
    bool list_cameras = false;
    bool quiet = false;
    bool strict = false;
};

/// Exit statuses of the tool, the same for every command.
enum ExitStatus { EXIT_DONE = 0, EXIT_FAILED = 1, EXIT_USAGE = 2 };

/// Reads the command line into `options`. Returns an exit status when the tool is to stop at
/// once (help, version, or a usage error already reported on standard error as one line).
std::optional<int> ParseCommandLine(int argc, char** argv, ToolOptions& options);

}  // namespace vexmap_host
